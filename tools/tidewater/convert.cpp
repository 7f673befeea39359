// tidewater convert: lines of positions to grid, geodetic or geocentric coordinates.

#include <array>
#include <cmath>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "angle_format.hpp"
#include "commands.hpp"
#include "datum_shift.hpp"
#include "ellipsoid.hpp"
#include "geoid.hpp"
#include "line_job.hpp"
#include "position_text.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"
#include "tidewater/text.h"

namespace tidewater::command {

namespace {

constexpr double kPi = 3.141592653589793;
constexpr double kDegree = 0.017453292519943295;

// UTM's scale on the central meridian and its false easting.
constexpr double kUtmScale = 0.9996;
constexpr double kUtmFalseEasting = 500000;
// UTM's reach in latitude, and how far from a central meridian the series is trusted.
constexpr double kUtmNorth = 84 * kDegree;
constexpr double kUtmSouth = -80 * kDegree;
constexpr double kSeriesReach = 50 * kDegree;

struct Options {
  std::vector<std::string> files;
  AngleFormat in;
  AngleFormat out;
  std::string to = "utm";
  std::string zone = "auto";
  std::string ellipsoid = "GRS 80";
  ShiftRequest shift;
  std::string from_ellipsoid;
  std::string geoid;
  bool geoid_to_ellipsoid = false;
  int precision = -1;
};

// A position among the lines of a batch.
struct Position {
  std::size_t line = 0;
  CoordinateTriple point = {};
  bool has_height = false;
  int16_t zone = 0;  // UTM zone, negative in the south
};

// The zone of the grid's definition, with the exceptions for Norway and Svalbard.
// DMA Technical Manual 8358.1 (1990), section 2-3.
int16_t utm_zone(const CoordinateTriple& point) {
  const double lon = point.x / kDegree;
  const double lat = point.y / kDegree;
  if (lat >= 56 && lat < 64 && lon >= 3 && lon < 12) return 32;
  if (lat >= 72 && lon >= 0 && lon < 42) {
    return lon < 9 ? 31 : lon < 21 ? 33 : lon < 33 ? 35 : 37;
  }
  const int zone = static_cast<int>(std::floor((lon + 180) / 6)) + 1;
  return static_cast<int16_t>(zone > 60 ? 1 : zone);  // 180 degrees is the west of zone 1
}

// "30N" or "30S"; negative in the south.
int16_t parse_zone(const std::string& text) {
  std::size_t end = 0;
  int zone = 0;
  try {
    zone = std::stoi(text, &end);
  } catch (const std::logic_error&) {
    end = 0;
  }
  double lon0 = 0;
  TWstatus status = TW_BAD_ZONE;
  if (end > 0 && end + 1 == text.size() && zone >= 0 && zone <= 99) {
    TWrslv_utmzone(static_cast<int16_t>(zone), &lon0, &status);
  }
  const char letter = text.empty() ? '\0' : text.back();
  const bool north = letter == 'N' || letter == 'n';
  const bool south = letter == 'S' || letter == 's';
  if (status != TW_SUCCESS || (!north && !south)) {
    throw std::invalid_argument("no such zone: " + text + " (auto, or 1N to 60N, 1S to 60S)");
  }
  return static_cast<int16_t>(south ? -zone : zone);
}

class Converter : public LineJob {
 public:
  explicit Converter(const Options& options)
      : options_(options), in_unit_(options.in.unit()), out_unit_(options.out.unit()) {
    const Ellipsoid ellipsoid = find_ellipsoid(options.ellipsoid);
    a_ = ellipsoid.a;
    e_ = ellipsoid.e();
    if (options.zone != "auto") zone_ = parse_zone(options.zone);
    if (!options.shift.text.empty()) shift_ = make_datum_shift(options.shift);
    if (!options.geoid.empty()) geoid_ = std::make_unique<Geoid>(options.geoid);
    TWstatus status = TW_SUCCESS;
    double b2 = 0, b4 = 0, b6 = 0;
    TWt_merc_c(e_, 0, 0, &arc_[0], &arc_[1], &arc_[2], &arc_[3], &arc_[4], &m0_, &b2, &b4, &b6,
               &status);
    lines_.reserve(kBatch);
  }

 private:
  void take(Line line) override {
    if (line.is_data) {
      PositionText text;
      const TWstatus status = read_position(line.text, options_.in, in_unit_, text);
      if (line.status == TW_SUCCESS) line.status = status;
      line.rest = line.text.size() - text.rest.size();
      Position position;
      position.line = lines_.size();
      position.point = text.point;
      position.has_height = text.has_height;
      positions_.push_back(position);
    }
    lines_.push_back(std::move(line));
  }

  // The line of a position.
  Line& line_of(const Position& position) { return lines_[position.line]; }

  std::vector<Position*> good_positions() {
    std::vector<Position*> good;
    for (Position& position : positions_) {
      if (line_of(position).status == TW_SUCCESS) good.push_back(&position);
    }
    return good;
  }

  // Runs an array call over the positions that are good so far.  An answer other than success is
  // told apart point by point.
  template <class Call>
  void apply(const std::vector<Position*>& good, Call call) {
    std::vector<CoordinateTriple> work(good.size());
    for (std::size_t i = 0; i < good.size(); ++i) work[i] = good[i]->point;
    if (call(static_cast<int32_t>(work.size()), work.data()) == TW_SUCCESS) {
      for (std::size_t i = 0; i < good.size(); ++i) good[i]->point = work[i];
      return;
    }
    for (Position* position : good) {
      CoordinateTriple point = position->point;
      const TWstatus status = call(1, &point);
      if (status == TW_SUCCESS) {
        position->point = point;
      } else {
        line_of(*position).status = status;
      }
    }
  }

  // Marks the positions for which there is a reason.
  template <class Reason>
  void refuse(TWstatus status, Reason reason) {
    for (Position* position : good_positions()) {
      if (const char* why = reason(position->point)) line_of(*position).refuse(status, why);
    }
  }

  void end_batch() override {
    // A geoid belongs to the datum of the heights above the ellipsoid: it is put on before the
    // shift, and taken off behind it.
    if (geoid_ && options_.geoid_to_ellipsoid) apply_geoid();
    if (shift_) {
      refuse(TW_I_OUTSIDE_CNT, [this](const CoordinateTriple& p) { return shift_->refusal(p); });
      apply(good_positions(),
            [this](int32_t count, CoordinateTriple* p) { return shift_->run(count, p); });
    }
    if (geoid_ && !options_.geoid_to_ellipsoid) apply_geoid();
    if (options_.to == "utm") {
      to_utm();
    } else if (options_.to == "geocentric") {
      apply(good_positions(), [this](int32_t count, CoordinateTriple* p) {
        TWstatus status = TW_SUCCESS;
        TWllh_to_xyz(a_, e_, count, p, p, &status);
        return status;
      });
    }
    write_batch();
    lines_.clear();
    positions_.clear();
  }

  // Only lines that have a height need the geoid.
  void apply_geoid() {
    std::vector<Position*> with_height;
    for (Position* position : good_positions()) {
      if (position->has_height) with_height.push_back(position);
    }
    apply(with_height, [this](int32_t count, CoordinateTriple* p) {
      return options_.geoid_to_ellipsoid ? geoid_->to_ellipsoid(count, p)
                                         : geoid_->from_ellipsoid(count, p);
    });
  }

  void to_utm() {
    refuse(TW_BAD_LATITUDE, [](const CoordinateTriple& p) -> const char* {
      const bool inside = p.y >= kUtmSouth && p.y <= kUtmNorth;
      return inside ? nullptr : "outside UTM's latitudes, 80 S to 84 N";
    });
    if (zone_) {
      const double lon0 = central_meridian(zone_);
      refuse(TW_RANGE_ERROR, [lon0](const CoordinateTriple& p) -> const char* {
        const double away = std::fabs(std::remainder(p.x - lon0, 2 * kPi));
        return away > kSeriesReach ? "over 50 degrees from the zone's central meridian" : nullptr;
      });
    }
    const std::vector<Position*> good = good_positions();
    for (Position* p : good) {
      const int16_t zone = utm_zone(p->point);
      p->zone = zone_ ? zone_ : static_cast<int16_t>(p->point.y < 0 ? -zone : zone);
    }
    // Points of one zone that follow one another go through one call.
    for (std::size_t from = 0; from < good.size();) {
      const int16_t zone = good[from]->zone;
      std::size_t to = from + 1;
      while (to < good.size() && good[to]->zone == zone) ++to;
      const auto begin = good.begin();
      apply({begin + static_cast<std::ptrdiff_t>(from), begin + static_cast<std::ptrdiff_t>(to)},
            [this, zone](int32_t count, CoordinateTriple* p) {
              TWstatus status = TW_SUCCESS;
              double false_northing = 0;
              TWrslv_utmhemi(zone < 0 ? 1 : 0, &false_northing, &status);
              TWt_merc_f(e_, central_meridian(zone), arc_[0], arc_[1], arc_[2], arc_[3], arc_[4],
                         m0_, count, p, p, &status);
              if (status != TW_SUCCESS) return status;
              TWab_to_en(a_, kUtmScale, kUtmFalseEasting, false_northing, count, p, p, &status);
              return status;
            });
      from = to;
    }
  }

  static double central_meridian(int16_t zone) {
    double lon0 = 0;
    TWstatus status = TW_SUCCESS;
    TWrslv_utmzone(static_cast<int16_t>(std::abs(zone)), &lon0, &status);
    return lon0;
  }

  void write_batch() {
    std::size_t next = 0;
    for (const Line& line : lines_) {
      if (!line.is_data) {
        out_ = line.text;
      } else {
        const Position& position = positions_[next++];
        if (line.status == TW_SUCCESS) {
          out_.clear();
          append(position);
          count_done();
        } else {
          out_ = options_.to == "geocentric" ? "* * *" : "* *";
          complain(line);
        }
        out_.append(line.text, line.rest);
      }
      out_ += '\n';
      write(out_);
    }
  }

  void append(const Position& position) {
    const CoordinateTriple& p = position.point;
    const int metres = options_.precision >= 0 ? options_.precision : 3;
    if (options_.to == "geodetic") {
      append_position(out_, p, options_.out, out_unit_);
    } else {
      append_metres(out_, p.x, metres);
      append_metres(out_, p.y, metres);
    }
    if (options_.to == "geocentric" || position.has_height) append_metres(out_, p.z, metres);
    if (options_.to == "utm" && !zone_) {
      out_ += ' ' + std::to_string(std::abs(position.zone)) + (position.zone < 0 ? 'S' : 'N');
    }
  }

  std::string summary(const Counts& counts) const override {
    return std::to_string(counts.done) + " converted, " + std::to_string(counts.outside) +
           " outside the grids, " + std::to_string(counts.refused) + " refused";
  }

  const Options& options_;
  AngleUnit in_unit_;
  AngleUnit out_unit_;
  double a_ = 0;
  double e_ = 0;
  int16_t zone_ = 0;  // 0: found from each position
  std::unique_ptr<DatumShift> shift_;
  std::unique_ptr<Geoid> geoid_;
  std::array<double, 5> arc_ = {};
  double m0_ = 0;
  std::vector<Line> lines_;
  std::vector<Position> positions_;  // of the lines that are data, in their order
  std::string out_;
};

int convert(Options& options) {
  if (options.precision >= 0 && options.to == "geodetic") options.out.precision = options.precision;
  if (!options.geoid.empty() && !options.geoid_to_ellipsoid && options.to == "geocentric") {
    throw std::invalid_argument("geocentric coordinates have no height above the geoid");
  }
  if (!options.from_ellipsoid.empty()) {
    options.shift.from = find_ellipsoid(options.from_ellipsoid);
    options.shift.to = find_ellipsoid(options.ellipsoid);
  }
  return Converter(options).run(options.files);
}

const char* const kExamples = R"(Examples:
  # decimal degrees, latitude first, to UTM; the zone is found
  echo "48.3903 -4.4863 Brest" | tidewater convert
  # degrees, minutes and seconds with letters, to geocentric X, Y, Z
  echo "48:23:25.1N 4:29:10.7W 34.2 Brest" | tidewater convert --format dms --hemisphere behind --to geocentric
  # one zone for all, on another ellipsoid, longitude first
  echo "-4.4863 48.3903" | tidewater convert --order lon-lat --zone 30N --ellipsoid "International 1924"
  # to packed degrees, minutes and seconds with a letter in front
  echo "48.3903 -4.4863" | tidewater convert --to geodetic --out-format packed --out-hemisphere front
  # from Bessel's ellipsoid to WGS 84 by seven parameters
  echo "50.9413 6.9583 53.2 Cologne" | tidewater convert --to geodetic --shift helmert:598.1,73.7,418.2,0.202,0.045,-2.455,6.7 --from-ellipsoid "Bessel 1841" -e "WGS 84"
)";

}  // namespace

void add_convert(CLI::App& app, int& exit_status) {
  auto options = std::make_shared<Options>();
  CLI::App* command = app.add_subcommand(
      "convert",
      "Converts lines of positions.\n"
      "A line begins with two angles and, where a plain number follows, a height in metres; the "
      "rest "
      "of it is passed through, as are blank lines and lines that begin with #.  A line that "
      "cannot "
      "be converted is written with * in place of its coordinates and told on standard error.");
  command->add_option("files", options->files, "files to read; - or none: standard input");
  add_angle_options(*command, options->in, "", "Input");
  command
      ->add_option("--shift", options->shift.text,
                   "datum shift.  By grids: nadcon:DIR or ntv2:DIR, where DIR holds area.par and "
                   "the grids that it names.  By formulas, with --from-ellipsoid: "
                   "molodensky:DX,DY,DZ in metres, or helmert:DX,DY,DZ,RX,RY,RZ,PPM in metres, "
                   "arc-seconds and parts per million, with the rotations of position vectors "
                   "(EPSG method 1033; those of a coordinate frame have the other sign)")
      ->group("Datum");
  command
      ->add_flag("--inverse", options->shift.inverse,
                 "the shift turned round: the input is on its target datum, the output on its "
                 "source datum")
      ->needs("--shift")
      ->group("Datum");
  command
      ->add_option("--from-ellipsoid", options->from_ellipsoid,
                   "ellipsoid of the input, for a shift by formulas: a name, or A,RF")
      ->needs("--shift")
      ->group("Datum");
  command
      ->add_option("-e,--ellipsoid", options->ellipsoid,
                   "ellipsoid of the output: " + ellipsoid_names() + "; or A,RF")
      ->capture_default_str()
      ->group("Datum");
  command
      ->add_option("--geoid", options->geoid,
                   "heights above the ellipsoid become heights above the geoid, behind the shift; "
                   "DIR holds area.par and the geoid grids that it names")
      ->type_name("DIR")
      ->group("Datum");
  command
      ->add_flag("--geoid-to-ellipsoid", options->geoid_to_ellipsoid,
                 "the other way round, before the shift: the input's heights are above the geoid")
      ->needs("--geoid")
      ->group("Datum");
  command
      ->add_option("--to", options->to,
                   "utm: easting, northing; geodetic: angles; geocentric: X, Y, Z")
      ->check(CLI::IsMember({"utm", "geodetic", "geocentric"}))
      ->capture_default_str()
      ->group("Output");
  command
      ->add_option(
          "--zone", options->zone,
          "UTM zone with its hemisphere, such as 30N; auto finds that of each position and "
          "writes it behind the coordinates")
      ->capture_default_str()
      ->group("Output");
  command
      ->add_option("-p,--precision", options->precision,
                   "decimals of metres (3), of degrees or grads (9), or of seconds (5)")
      ->check(CLI::Range(0, 15))
      ->group("Output");
  add_angle_options(*command, options->out, "out-", "Output");
  command->footer(kExamples);
  command->callback([options, &exit_status] { exit_status = convert(*options); });
}

}  // namespace tidewater::command
