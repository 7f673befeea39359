// tidewater convert: lines of positions to grid, geodetic or geocentric coordinates.

#include <array>
#include <cmath>
#include <cstdio>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "angle_format.hpp"
#include "commands.hpp"
#include "datum_shift.hpp"
#include "ellipsoid.hpp"
#include "line_reader.hpp"
#include "position_text.hpp"
#include "progress.hpp"
#include "status_name.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"
#include "tidewater/text.h"

namespace tidewater::command {

namespace {

constexpr double kPi = 3.141592653589793;
constexpr double kDegree = 0.017453292519943295;
constexpr std::size_t kBatch = 4096;

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
  std::string shift;
  bool inverse = false;
  int precision = -1;
};

// One line of input and what becomes of it.
struct Line {
  std::string text;
  std::size_t rest = 0;  // where what follows the position begins
  bool is_position = false;
  bool has_height = false;
  int64_t number = 0;
  TWstatus status = TW_SUCCESS;
  const char* reason = nullptr;  // beside the status, where it says more
  int16_t zone = 0;              // UTM zone, negative in the south
};

struct Counts {
  int64_t converted = 0;
  int64_t outside = 0;
  int64_t refused = 0;
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

class Converter {
 public:
  explicit Converter(const Options& options)
      : options_(options), in_unit_(options.in.unit()), out_unit_(options.out.unit()) {
    const Ellipsoid ellipsoid = find_ellipsoid(options.ellipsoid);
    a_ = ellipsoid.a;
    e_ = ellipsoid.e();
    if (options.zone != "auto") zone_ = parse_zone(options.zone);
    if (!options.shift.empty()) shift_ = make_datum_shift(options.shift, options.inverse);
    TWstatus status = TW_SUCCESS;
    double b2 = 0, b4 = 0, b6 = 0;
    TWt_merc_c(e_, 0, 0, &arc_[0], &arc_[1], &arc_[2], &arc_[3], &arc_[4], &m0_, &b2, &b4, &b6,
               &status);
    lines_.reserve(kBatch);
  }

  void read(LineReader& reader, Progress& progress) {
    std::string text;
    while (reader.next(text)) {
      lines_.push_back(parse(reader, text));
      if (lines_.size() == kBatch) {
        flush(reader.name(), progress);
        progress.show(reader.bytes_read());
      }
    }
    flush(reader.name(), progress);
  }

  const Counts& counts() const { return counts_; }

 private:
  Line parse(const LineReader& reader, const std::string& text) const {
    Line line;
    line.text = text;
    line.number = reader.number();
    const std::size_t first = text.find_first_not_of(" \t");
    if (first == std::string::npos || text[first] == '#') return line;
    line.is_position = true;
    PositionText position;
    line.status =
        reader.too_long() ? TW_BAD_TEXT : read_position(text, options_.in, in_unit_, position);
    line.rest = text.size() - position.rest.size();
    line.has_height = position.has_height;
    points_.push_back(position.point);
    return line;
  }

  // Runs an array call over the good points of the batch.  An answer other than success is told
  // apart point by point.
  template <class Call>
  void run(std::vector<std::size_t>& good, std::vector<CoordinateTriple>& work, Call call) {
    const std::vector<CoordinateTriple> before = work;
    if (call(static_cast<int32_t>(work.size()), work.data()) == TW_SUCCESS) return;
    std::vector<std::size_t> still_good;
    std::vector<CoordinateTriple> kept;
    for (std::size_t i = 0; i < good.size(); ++i) {
      CoordinateTriple point = before[i];
      const TWstatus status = call(1, &point);
      if (status == TW_SUCCESS) {
        still_good.push_back(good[i]);
        kept.push_back(point);
      } else {
        positions_[good[i]]->status = status;
      }
    }
    good = std::move(still_good);
    work = std::move(kept);
  }

  // Takes the points that reason refuses out of the batch.
  template <class Reason>
  void refuse(std::vector<std::size_t>& good, std::vector<CoordinateTriple>& work, TWstatus status,
              Reason reason) {
    std::size_t kept = 0;
    for (std::size_t i = 0; i < good.size(); ++i) {
      if (const char* why = reason(work[i])) {
        positions_[good[i]]->status = status;
        positions_[good[i]]->reason = why;
        continue;
      }
      good[kept] = good[i];
      work[kept++] = work[i];
    }
    good.resize(kept);
    work.resize(kept);
  }

  void flush(const std::string& name, Progress& progress) {
    positions_.clear();
    for (Line& line : lines_) {
      if (line.is_position) positions_.push_back(&line);
    }
    std::vector<std::size_t> good;
    std::vector<CoordinateTriple> work;
    for (std::size_t i = 0; i < positions_.size(); ++i) {
      if (positions_[i]->status == TW_SUCCESS) {
        good.push_back(i);
        work.push_back(points_[i]);
      }
    }
    if (shift_) {
      refuse(good, work, TW_I_OUTSIDE_CNT,
             [this](const CoordinateTriple& p) { return shift_->refusal(p); });
      run(good, work, [this](int32_t count, CoordinateTriple* p) { return shift_->run(count, p); });
    }
    if (options_.to == "utm") {
      to_utm(good, work);
    } else if (options_.to == "geocentric") {
      run(good, work, [this](int32_t count, CoordinateTriple* p) {
        TWstatus status = TW_SUCCESS;
        TWllh_to_xyz(a_, e_, count, p, p, &status);
        return status;
      });
    }
    for (std::size_t i = 0; i < good.size(); ++i) points_[good[i]] = work[i];
    write(name, progress);
    lines_.clear();
    points_.clear();
  }

  void to_utm(std::vector<std::size_t>& good, std::vector<CoordinateTriple>& work) {
    refuse(good, work, TW_BAD_LATITUDE, [](const CoordinateTriple& p) -> const char* {
      const bool inside = p.y >= kUtmSouth && p.y <= kUtmNorth;
      return inside ? nullptr : "outside UTM's latitudes, 80 S to 84 N";
    });
    for (std::size_t i = 0; i < good.size(); ++i) {
      const int16_t zone = utm_zone(work[i]);
      positions_[good[i]]->zone =
          zone_ ? zone_ : static_cast<int16_t>(work[i].y < 0 ? -zone : zone);
    }
    if (zone_) {
      const double lon0 = central_meridian(zone_);
      refuse(good, work, TW_RANGE_ERROR, [lon0](const CoordinateTriple& p) -> const char* {
        const double away = std::fabs(std::remainder(p.x - lon0, 2 * kPi));
        return away > kSeriesReach ? "over 50 degrees from the zone's central meridian" : nullptr;
      });
    }
    // Points of one zone that follow one another go through one call.
    for (std::size_t from = 0; from < good.size();) {
      const int16_t zone = positions_[good[from]]->zone;
      std::size_t to = from + 1;
      while (to < good.size() && positions_[good[to]]->zone == zone) ++to;
      const auto count = static_cast<int32_t>(to - from);
      CoordinateTriple* points = &work[from];
      TWstatus status = TW_SUCCESS;
      double false_northing = 0;
      TWrslv_utmhemi(zone < 0 ? 1 : 0, &false_northing, &status);
      TWt_merc_f(e_, central_meridian(zone), arc_[0], arc_[1], arc_[2], arc_[3], arc_[4], m0_,
                 count, points, points, &status);
      TWab_to_en(a_, kUtmScale, kUtmFalseEasting, false_northing, count, points, points, &status);
      from = to;
    }
  }

  static double central_meridian(int16_t zone) {
    double lon0 = 0;
    TWstatus status = TW_SUCCESS;
    TWrslv_utmzone(static_cast<int16_t>(std::abs(zone)), &lon0, &status);
    return lon0;
  }

  void write(const std::string& name, Progress& progress) {
    std::size_t next = 0;
    for (const Line& line : lines_) {
      if (!line.is_position) {
        out_ = line.text;
      } else if (line.status == TW_SUCCESS) {
        out_.clear();
        append_position(line, points_[next]);
        out_.append(line.text, line.rest);
        ++counts_.converted;
      } else {
        out_ = options_.to == "geocentric" ? "* * *" : "* *";
        out_.append(line.text, line.rest);
        progress.clear();
        complain(name, line);
      }
      if (line.is_position) ++next;
      out_ += '\n';
      if (std::fwrite(out_.data(), 1, out_.size(), stdout) != out_.size()) {
        throw std::runtime_error("standard output cannot be written");
      }
    }
  }

  void complain(const std::string& name, const Line& line) {
    constexpr std::size_t kShown = 120;
    std::string shown = line.text.substr(0, kShown);
    for (char& c : shown) {
      if (static_cast<unsigned char>(c) < ' ' || c == 127) c = '?';
    }
    std::fprintf(stderr, "%s:%lld: \"%s%s\": %s (%s)\n", name.c_str(),
                 static_cast<long long>(line.number), shown.c_str(),
                 line.text.size() > kShown ? "..." : "",
                 line.reason ? line.reason : status_meaning(line.status), status_name(line.status));
    ++(line.status == TW_I_OUTSIDE_NADCON || (line.status == TW_I_OUTSIDE_CNT && !line.reason)
           ? counts_.outside
           : counts_.refused);
  }

  void append_metres(double value) {
    std::array<char, 400> field;  // holds the largest double
    TWstatus status = TW_SUCCESS;
    TWmet_to_ascii(value, static_cast<int16_t>(options_.precision >= 0 ? options_.precision : 3), 1,
                   field.data(), &status);
    if (!out_.empty()) out_ += ' ';
    out_ += field.data();
  }

  void append_angle(double value, int16_t axis) {
    std::array<char, 64> field;
    TWstatus status = TW_SUCCESS;
    TWrad_to_ascii(value, out_unit_, axis, field.data(), &status);
    if (!out_.empty()) out_ += ' ';
    out_ += field.data();
  }

  void append_position(const Line& line, const CoordinateTriple& p) {
    if (options_.to == "geocentric") {
      append_metres(p.x);
      append_metres(p.y);
      append_metres(p.z);
      return;
    }
    if (options_.to == "utm") {
      append_metres(p.x);
      append_metres(p.y);
    } else if (options_.out.order == "lat-lon") {
      append_angle(p.y, 1);
      append_angle(p.x, 0);
    } else {
      append_angle(p.x, 0);
      append_angle(p.y, 1);
    }
    if (line.has_height) append_metres(p.z);
    if (options_.to == "utm" && !zone_) {
      out_ += ' ' + std::to_string(std::abs(line.zone)) + (line.zone < 0 ? 'S' : 'N');
    }
  }

  const Options& options_;
  AngleUnit in_unit_;
  AngleUnit out_unit_;
  double a_ = 0;
  double e_ = 0;
  int16_t zone_ = 0;  // 0: found from each position
  std::unique_ptr<DatumShift> shift_;
  std::array<double, 5> arc_ = {};
  double m0_ = 0;
  std::vector<Line> lines_;
  std::vector<Line*> positions_;
  mutable std::vector<CoordinateTriple> points_;
  std::string out_;
  Counts counts_;
};

int convert(Options& options) {
  if (options.files.empty()) options.files.push_back("-");
  if (options.precision >= 0 && options.to == "geodetic") options.out.precision = options.precision;
  Converter converter(options);
  for (const std::string& file : options.files) {
    LineReader reader(file);
    Progress progress(reader.size());
    converter.read(reader, progress);
  }
  if (std::fflush(stdout) != 0) throw std::runtime_error("standard output cannot be written");
  const Counts& counts = converter.counts();
  std::fprintf(stderr, "%lld converted, %lld outside the grids, %lld refused\n",
               static_cast<long long>(counts.converted), static_cast<long long>(counts.outside),
               static_cast<long long>(counts.refused));
  return counts.outside + counts.refused > 0 ? kSomeRefused : 0;
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
      ->add_option("--shift", options->shift,
                   "datum shift by grids: nadcon:DIR or ntv2:DIR, where DIR holds area.par and the "
                   "grids that it names")
      ->group("Datum");
  command
      ->add_flag("--inverse", options->inverse, "shift from the grids' target datum to the source")
      ->needs("--shift")
      ->group("Datum");
  command
      ->add_option("-e,--ellipsoid", options->ellipsoid,
                   "ellipsoid of the output: " + ellipsoid_names() + "; or A,RF")
      ->capture_default_str()
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
