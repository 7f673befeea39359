// tidewater line: geodesic and rhumb lines between positions, points along them, and areas.

#include <cmath>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "chain.hpp"
#include "commands.hpp"
#include "csv.hpp"
#include "json_text.hpp"
#include "options.hpp"
#include "stream.hpp"
#include "tidewater/lines.hpp"

namespace tidewater::command {

namespace {

constexpr std::size_t kBatch = 512;
constexpr int kMetreDecimals = 3;

struct Options {
  std::vector<std::string> files;
  AngleStyle in;
  AngleStyle out;
  std::string ellipsoid = "GRS 1980";
  std::string separator;
  bool rhumb = false;
  bool direct = false;
  bool area = false;
  bool csv = false;
  std::int64_t points = 0;  // of each line; 0: by spacing, or none
  double spacing = 0;       // metres; 0: by points, or none
  std::string as = "text";
  int precision = -1;

  bool wants_points() const { return points > 0 || spacing > 0; }
};

// Geodesics or rhumb lines.
class Lines {
 public:
  explicit Lines(const Options& options) {
    const Ellipsoid ellipsoid = find_ellipsoid(options.ellipsoid);
    if (options.rhumb) {
      rhumb_.emplace(ellipsoid);
    } else {
      geodesic_.emplace(ellipsoid);
    }
  }
  template <class Use>
  auto with(Use use) const {
    return rhumb_ ? use(*rhumb_) : use(*geodesic_);
  }

 private:
  std::optional<Geodesic> geodesic_;
  std::optional<Rhumb> rhumb_;
};

// Into 0 to 360, with what is a rounding below a whole turn as 0.
double wrapped(double azimuth) {
  double turned = std::fmod(azimuth, 360);
  if (turned < 0) turned += 360;
  return 360 - turned < 1e-10 ? 0 : turned;
}

// Lines in work.
struct Solved {
  explicit Solved(std::size_t size)
      : lon1(size), lat1(size), lon2(size), lat2(size), azimuth(size), ahead(size), length(size) {}
  std::vector<double> lon1, lat1, lon2, lat2, azimuth, ahead, length;

  // Towards the start: a line of negative length ends looking away from it.
  double back(std::size_t i) const { return wrapped(length[i] < 0 ? ahead[i] : ahead[i] + 180); }
};

class LineSolving : public Job {
 public:
  explicit LineSolving(const Options& options)
      : options_(options), lines_(options), reader_(Kind::angles, options.in, Heights::never) {}

  std::string prepare(const std::string&, std::string_view first) override;
  std::unique_ptr<Worker> worker() const override;
  std::string ending() const override {
    if (options_.as != "geojson") return {};
    return started_ ? "\n]}\n" : "{\"type\":\"FeatureCollection\",\"features\":[\n]}\n";
  }
  std::string summary(const Counts& counts) const override {
    return std::to_string(counts.done) + " solved, " + std::to_string(counts.refused) + " refused";
  }

  const Options& options_;
  Lines lines_;
  PositionReader reader_;
  std::unique_ptr<Table> table_;
  int columns_[4] = {};  // lat1, lon1, lat2 or azimuth, lon2 or distance
  bool started_ = false;
};

class LineWorker : public Worker {
 public:
  explicit LineWorker(const LineSolving& job)
      : job_(job),
        options_(job.options_),
        work_(kBatch),
        degree_decimals_(options_.precision >= 0 ? options_.precision : 9) {}

  void process(const Chunk& chunk, Result& result) override {
    std::string_view text = chunk.text;
    std::int64_t number = 0;
    if (options_.csv && chunk.first) {
      Record head;
      if (head.take(text, job_.table_->separator)) number += head.lines();
    }
    while (!text.empty()) {
      Entry entry;
      entry.number = number;
      if (options_.csv) {
        entry.record.take(text, job_.table_->separator);
        number += entry.record.lines();
        entry.text = entry.record.whole();
        entry.is_data = !entry.text.empty();
      } else {
        const std::size_t newline = std::min(text.find('\n'), text.size());
        entry.text = text.substr(0, newline);
        const bool cut = chunk.cut && newline == text.size();
        text.remove_prefix(std::min(newline + 1, text.size()));
        if (!entry.text.empty() && entry.text.back() == '\r') entry.text.remove_suffix(1);
        entry.is_data = is_data(entry.text);
        if (cut) entry.reason = "the line is longer than any line may be";
        ++number;
      }
      take(std::move(entry));
      if (entries_.size() == kBatch) flush(result);
    }
    flush(result);
    result.lines(number);
  }

 private:
  struct Entry {
    std::string_view text;
    std::size_t rest = 0;
    std::int64_t number = 0;
    bool is_data = false;
    TWstatus status = TW_SUCCESS;
    std::string reason;
    Record record;
  };

  void take(Entry entry) {
    const std::size_t i = entries_.size();
    work_.lon1[i] = work_.lat1[i] = work_.lon2[i] = work_.lat2[i] = 0;
    work_.azimuth[i] = work_.length[i] = 0;
    if (entry.is_data) {
      if (options_.csv) {
        read_record(entry, i);
      } else {
        read(entry, i);
      }
      if (!entry.reason.empty() && entry.status == TW_SUCCESS) entry.status = TW_BAD_TEXT;
    }
    entries_.push_back(std::move(entry));
  }

  // Takes the fields of a problem off the front of a line: all of them, though one be bad.
  void read(Entry& entry, std::size_t i) {
    job_.reader_.take(entry.text, position_);
    entry.rest = position_.rest;
    note(entry, i, true);
    std::string_view rest = entry.text.substr(entry.rest);
    if (options_.direct) {
      TWstatus status = TW_SUCCESS;
      if (!take_number(rest, work_.azimuth[i])) status = take_azimuth(rest, work_.azimuth[i]);
      const bool plain = job_.reader_.style().form == "grads";
      if (plain) work_.azimuth[i] *= 0.9;
      if (status == TW_SUCCESS && !(std::fabs(work_.azimuth[i]) <= 360)) {
        refuse(entry, TW_RANGE_ERROR, "an azimuth beyond 360 degrees");
      } else if (status != TW_SUCCESS) {
        refuse(entry, status, "the azimuth is no angle");
      }
      if (!take_number(rest, work_.length[i])) {
        skip_field(rest);
        refuse(entry, TW_BAD_TEXT, "the distance is no number");
      }
      entry.rest = entry.text.size() - rest.size();
    } else {
      const TWstatus before = entry.status;
      job_.reader_.take(rest, position_);
      entry.rest += position_.rest;
      if (before == TW_SUCCESS) note(entry, i, false);
      if (before == TW_SUCCESS && position_.status != TW_SUCCESS) {
        entry.reason = "the second position: " + position_.reason;
      }
    }
  }

  static void skip_field(std::string_view& text) {
    const std::size_t start = text.find_first_not_of(" \t,;");
    if (start == text.npos) {
      text = {};
    } else {
      text.remove_prefix(std::min(text.find_first_of(" \t,;", start), text.size()));
    }
  }

  TWstatus take_azimuth(std::string_view& text, double& azimuth) const {
    const std::string_view before = text;
    skip_field(text);
    std::string_view field = before.substr(0, before.size() - text.size());
    field.remove_prefix(std::min(field.find_first_not_of(" \t,;"), field.size()));
    const ParsedAngle angle = parse_angle(field, Axis::longitude);
    azimuth = angle.degrees;
    return angle ? TW_SUCCESS : TW_BAD_TEXT;
  }

  void note(Entry& entry, std::size_t i, bool first) {
    (first ? work_.lon1 : work_.lon2)[i] = position_.x;
    (first ? work_.lat1 : work_.lat2)[i] = position_.y;
    if (position_.status != TW_SUCCESS) return refuse(entry, position_.status, position_.reason);
    check(entry, position_.x, position_.y);
  }

  void check(Entry& entry, double lon, double lat) const {
    if (!(std::fabs(lat) <= 90)) {
      const bool swapped = std::fabs(lon) <= 90;
      refuse(entry, TW_BAD_LATITUDE,
             std::string("latitude out of range") +
                 (swapped ? "; if the longitude stands first, say --order " : "") +
                 (swapped ? (options_.in.lat_first() ? "lon-lat" : "lat-lon") : ""));
    } else if (!(std::fabs(lon) <= 360)) {
      refuse(entry, TW_BAD_LONGITUDE, "longitude beyond 360 degrees");
    }
  }

  static void refuse(Entry& entry, TWstatus status, std::string reason) {
    if (entry.status != TW_SUCCESS) return;
    entry.status = status;
    entry.reason = std::move(reason);
  }

  void read_record(Entry& entry, std::size_t i) {
    double* const values[] = {&work_.lat1[i], &work_.lon1[i],
                              options_.direct ? &work_.azimuth[i] : &work_.lat2[i],
                              options_.direct ? &work_.length[i] : &work_.lon2[i]};
    for (int k = 0; k < 4; ++k) {
      const auto column = static_cast<std::size_t>(job_.columns_[k]);
      if (column >= entry.record.size()) {
        return refuse(entry, TW_BAD_TEXT, "the row has too few fields");
      }
      std::string reason;
      const std::string value = entry.record.value(column);
      bool ok;
      if (options_.direct && k >= 2) {
        std::string_view rest = value;
        ok = take_number(rest, *values[k]) && rest.empty();
        reason = "\"" + value + "\" is no number";
      } else {
        ok = job_.reader_.take_field(value, k % 2 == 0, *values[k], reason);
      }
      if (!ok) {
        return refuse(entry, TW_BAD_TEXT, "column " + job_.table_->names[column] + ": " + reason);
      }
    }
    check(entry, work_.lon1[i], work_.lat1[i]);
    if (!options_.direct) check(entry, work_.lon2[i], work_.lat2[i]);
  }

  void solve() {
    const std::size_t count = entries_.size();
    job_.lines_.with([&](const auto& lines) {
      if (options_.direct) {
        lines.direct(
            count,
            {work_.lon1.data(), work_.lat1.data(), work_.azimuth.data(), work_.length.data()},
            {work_.lon2.data(), work_.lat2.data(), work_.ahead.data(), nullptr});
      } else {
        lines.inverse(count,
                      {work_.lon1.data(), work_.lat1.data(), work_.lon2.data(), work_.lat2.data()},
                      {work_.length.data(), work_.azimuth.data(), work_.ahead.data(), nullptr});
      }
    });
  }

  void flush(Result& result) {
    solve();
    for (std::size_t i = 0; i < entries_.size(); ++i) {
      Entry& entry = entries_[i];
      if (!entry.is_data) {
        if (options_.csv || options_.as == "text") {
          result.out.add(entry.text);
          result.out.add('\n');
        }
        continue;
      }
      ++number_;
      const bool finite = std::isfinite(work_.ahead[i]) && std::isfinite(work_.length[i]) &&
                          std::isfinite(work_.lon2[i]);
      if (entry.status == TW_SUCCESS && !finite) {
        refuse(entry, TW_RANGE_ERROR,
               options_.rhumb ? "the rhumb line reaches a pole" : "the line has no end");
      }
      const std::int64_t count = entry.status == TW_SUCCESS ? points_of(entry, i) : 0;
      if (entry.status == TW_SUCCESS) {
        write(result, entry, i, count);
        result.done();
        continue;
      }
      result.complain(entry.number, entry.text, entry.reason, entry.status);
      if (options_.csv) {
        result.out.add(entry.text);
        for (int k = 0; k < 3; ++k) {
          result.out.add(job_.table_->separator);
          result.out.add('*');
        }
        result.out.add('\n');
      } else if (options_.as == "text") {
        separate(result.out);
        result.out.add(options_.wants_points() ? "* *" : "* * *");
        result.out.add(entry.text.substr(entry.rest));
        result.out.add('\n');
      }
    }
    entries_.clear();
  }

  std::int64_t points_of(Entry& entry, std::size_t i) const {
    if (options_.spacing == 0) return options_.points;
    const double whole = std::fabs(work_.length[i]) / options_.spacing;
    if (whole > 1e9) {
      refuse(entry, TW_BAD_PARAMETER, "more points than can be counted");
      return 0;
    }
    return std::max<std::int64_t>(2, static_cast<std::int64_t>(std::ceil(whole - 1e-9)) + 1);
  }

  void write(Result& result, const Entry& entry, std::size_t i, std::int64_t count) {
    Buffer& out = result.out;
    const std::string_view rest = entry.text.substr(std::min(entry.rest, entry.text.size()));
    if (options_.csv) {
      const char separator = job_.table_->separator;
      out.add(entry.text);
      out.add(separator);
      if (options_.direct) {
        append_angle(out, work_.lat2[i], Axis::latitude, options_.out);
        out.add(separator);
        append_angle(out, work_.lon2[i], Axis::longitude, options_.out);
      } else {
        append_azimuth(out, wrapped(work_.azimuth[i]), options_.out);
      }
      out.add(separator);
      append_azimuth(out, work_.back(i), options_.out);
      if (!options_.direct) {
        out.add(separator);
        out.add_fixed(work_.length[i], kMetreDecimals);
      }
      out.add('\n');
    } else if (options_.wants_points()) {
      if (options_.as == "csv") {
        write_table(out, i, count);
      } else if (options_.as == "geojson") {
        write_feature(out, i, count, rest);
      } else {
        separate(out);
        each_point(i, count, out, [&](double lon, double lat) {
          append_position(out, lon, lat, options_.out);
          out.add(rest);
          out.add('\n');
        });
      }
    } else {
      if (options_.direct) {
        append_position(out, work_.lon2[i], work_.lat2[i], options_.out);
      } else {
        append_azimuth(out, wrapped(work_.azimuth[i]), options_.out);
      }
      out.add(' ');
      append_azimuth(out, work_.back(i), options_.out);
      if (!options_.direct) {
        out.add(' ');
        out.add_fixed(work_.length[i], kMetreDecimals);
      }
      out.add(rest);
      out.add('\n');
    }
  }

  // The line's points, the last one always its end.  Where there are many, what is ready is written
  // at once: one thread alone is at work then.
  template <class Use>
  void each_point(std::size_t i, std::int64_t count, Buffer& out, Use use) {
    constexpr std::int64_t kPart = 1024;
    const double length = work_.length[i];
    const double step = options_.spacing > 0 ? std::copysign(options_.spacing, length)
                                             : length / static_cast<double>(count - 1);
    use(work_.lon1[i], work_.lat1[i]);
    lengths_.resize(kPart);
    lon_.resize(kPart);
    lat_.resize(kPart);
    for (std::int64_t from = 1; from < count - 1; from += kPart) {
      const auto size = static_cast<std::size_t>(std::min(kPart, count - 1 - from));
      for (std::size_t k = 0; k < size; ++k) {
        lengths_[k] = step * static_cast<double>(from + static_cast<std::int64_t>(k));
      }
      job_.lines_.with([&](const auto& lines) {
        lines.along(work_.lon1[i], work_.lat1[i], work_.azimuth[i], size, lengths_.data(),
                    {lon_.data(), lat_.data(), nullptr, nullptr});
      });
      for (std::size_t k = 0; k < size; ++k) use(lon_[k], lat_[k]);
      if (out.size() > (1 << 20)) {
        write_out(out.text());
        out.clear();
      }
    }
    use(work_.lon2[i], work_.lat2[i]);
  }

  // A blank line keeps runs of points apart.
  void separate(Buffer& out) {
    if (options_.wants_points()) {
      if (blank_before_) out.add('\n');
      blank_before_ = true;
    }
  }

  void write_table(Buffer& out, std::size_t i, std::int64_t count) {
    std::int64_t point = 0;
    each_point(i, count, out, [&](double lon, double lat) {
      out.add(std::to_string(number_));
      out.add(',');
      out.add(std::to_string(++point));
      out.add(',');
      out.add_fixed(lon, degree_decimals_);
      out.add(',');
      out.add_fixed(lat, degree_decimals_);
      out.add('\n');
    });
  }

  void write_feature(Buffer& out, std::size_t i, std::int64_t count, std::string_view rest) {
    out.add(features_++ > 0 ? ",\n" : "\n");
    out.add(R"({"type":"Feature","properties":{"azimuth":)");
    out.add_fixed(wrapped(work_.azimuth[i]), degree_decimals_);
    out.add(",\"distance\":");
    out.add_fixed(work_.length[i], kMetreDecimals);
    out.add(",\"text\":");
    const std::size_t first = rest.find_first_not_of(" \t,;");
    std::string text;
    append_json_string(text, first == std::string_view::npos ? "" : rest.substr(first));
    out.add(text);
    out.add(R"(},"geometry":{"type":"LineString","coordinates":[)");
    bool is_first = true;
    double before = 0;
    each_point(i, count, out, [&](double lon, double lat) {
      // A line over the 180th meridian goes on beyond 180 degrees: it is not drawn across the map.
      const double shown = is_first ? lon : before + std::remainder(lon - before, 360);
      out.add(is_first ? "[" : ",[");
      out.add_fixed(shown, degree_decimals_);
      out.add(',');
      out.add_fixed(lat, degree_decimals_);
      out.add(']');
      is_first = false;
      before = shown;
    });
    out.add("]}}");
  }

  const LineSolving& job_;
  const Options& options_;
  Solved work_;
  int degree_decimals_;  // in CSV and GeoJSON
  TakenPosition position_;
  std::vector<Entry> entries_;
  std::vector<double> lengths_, lon_, lat_;
  std::int64_t number_ = 0;  // of the line among those that are data
  std::int64_t features_ = 0;
  bool blank_before_ = false;
};

std::string LineSolving::prepare(const std::string& source, std::string_view first) {
  const bool again = std::exchange(started_, true);
  if (!options_.csv) {
    if (again) return {};
    if (options_.as == "csv") return "line,point,lon,lat\n";
    if (options_.as == "geojson") return "{\"type\":\"FeatureCollection\",\"features\":[";
    return {};
  }
  auto table = std::make_unique<Table>(first, separator_of(options_.separator));
  if (again && table->names != table_->names) {
    throw std::runtime_error(source + ": the columns are not those of the first table");
  }
  if (again) return {};
  table_ = std::move(table);
  const std::vector<std::vector<std::string_view>> inverse = {
      {"lat1", "latitude1", "from_lat", "start_lat"},
      {"lon1", "longitude1", "from_lon", "start_lon"},
      {"lat2", "latitude2", "to_lat", "end_lat"},
      {"lon2", "longitude2", "to_lon", "end_lon"}};
  const std::vector<std::vector<std::string_view>> direct = {{"lat1", "latitude", "lat"},
                                                             {"lon1", "longitude", "lon"},
                                                             {"azimuth", "bearing"},
                                                             {"distance", "length"}};
  const auto& wanted = options_.direct ? direct : inverse;
  for (std::size_t k = 0; k < 4; ++k) {
    columns_[k] = table_->guess(wanted[k]);
    if (columns_[k] < 0) {
      throw std::invalid_argument("the table has no column \"" + std::string(wanted[k][0]) +
                                  "\"; it has " + table_->all_names());
    }
  }
  Record record;
  record.take(first, table_->separator);
  std::string head(record.whole());
  const std::vector<std::string> names =
      options_.direct ? std::vector<std::string>{"latitude", "longitude", "back_azimuth"}
                      : std::vector<std::string>{"azimuth", "back_azimuth", "distance"};
  for (const std::string& name : names) head += table_->separator + table_->new_name(name);
  return head + "\n";
}

std::unique_ptr<Worker> LineSolving::worker() const { return std::make_unique<LineWorker>(*this); }

// Rings of positions, one a line; a blank line or the end closes one.
class Areas : public Job {
 public:
  explicit Areas(const Options& options)
      : lines_(options), reader_(Kind::angles, options.in, Heights::never) {}

  std::unique_ptr<Worker> worker() const override;
  std::string ending() const override {
    Buffer out;
    close(out);
    return std::string(out.text());
  }
  std::string summary(const Counts& counts) const override {
    return std::to_string(counts.done) + (counts.done == 1 ? " position, " : " positions, ") +
           std::to_string(rings_) + (rings_ == 1 ? " area, " : " areas, ") +
           std::to_string(counts.refused) + " refused";
  }

 private:
  friend class AreaWorker;
  void close(Buffer& out) const {
    if (lon_.empty()) return;
    ++rings_;
    const PolygonMeasure measure = lines_.with(
        [&](const auto& lines) { return lines.polygon(lon_.size(), lon_.data(), lat_.data()); });
    out.add(std::to_string(lon_.size()));
    out.add(' ');
    out.add_fixed(measure.perimeter, kMetreDecimals);
    out.add(' ');
    out.add_fixed(measure.area, 1);
    out.add('\n');
    lon_.clear();
    lat_.clear();
  }

  Lines lines_;
  PositionReader reader_;
  // One thread alone is at work.
  mutable std::vector<double> lon_, lat_;
  mutable std::int64_t rings_ = 0;
};

class AreaWorker : public Worker {
 public:
  explicit AreaWorker(const Areas& job) : job_(job) {}

  void process(const Chunk& chunk, Result& result) override {
    std::string_view text = chunk.text;
    std::int64_t number = 0;
    while (!text.empty()) {
      const std::size_t newline = std::min(text.find('\n'), text.size());
      std::string_view line = text.substr(0, newline);
      text.remove_prefix(std::min(newline + 1, text.size()));
      if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
      if (is_data(line)) {
        job_.reader_.take(line, position_);
        TWstatus status = position_.status;
        if (status == TW_SUCCESS && !(std::fabs(position_.y) <= 90)) status = TW_BAD_LATITUDE;
        if (status == TW_SUCCESS && !(std::fabs(position_.x) <= 360)) status = TW_BAD_LONGITUDE;
        if (status == TW_SUCCESS) {
          job_.lon_.push_back(position_.x);
          job_.lat_.push_back(position_.y);
          result.done();
        } else {
          result.complain(number, line, position_.status == status ? position_.reason : "", status);
        }
      } else if (line.find_first_not_of(" \t") == line.npos) {
        job_.close(result.out);
      }
      ++number;
    }
    result.lines(number);
  }

 private:
  const Areas& job_;
  TakenPosition position_;
};

std::unique_ptr<Worker> Areas::worker() const { return std::make_unique<AreaWorker>(*this); }

int solve_lines(Options& options) {
  options.in.check();
  options.out.check();
  if (options.as != "text" && !options.wants_points()) {
    throw std::invalid_argument("--as " + options.as + " needs --points or --spacing");
  }
  if (options.csv && options.wants_points()) {
    throw std::invalid_argument("--csv reads a table of lines; points are written by --as csv");
  }
  if (std::isnan(options.spacing)) throw std::invalid_argument("--spacing is not a number");
  if (options.precision >= 0) options.out.precision = options.precision;
  StreamOptions stream;
  stream.records = options.csv;
  if (options.wants_points() || options.area) stream.threads = 1;
  if (options.area) {
    Areas job(options);
    return run_stream(job, options.files, stream);
  }
  LineSolving job(options);
  return run_stream(job, options.files, stream);
}

const char* const kExamples = R"(Examples:
  # azimuth there, azimuth back and distance from Brest to Quebec
  echo "48.3903 -4.4863 46.8139 -71.2082 Brest-Quebec" | tidewater line
  # the same on a constant course, azimuths in degrees, minutes and seconds
  echo "48.3903 -4.4863 46.8139 -71.2082 Brest-Quebec" | tidewater line --rhumb --out-format dms -p 1
  # where 100 km on azimuth 285 lead
  echo "48.3903 -4.4863 285 100000" | tidewater line --direct
  # a point every 500 km, for a map
  echo "48.3903 -4.4863 46.8139 -71.2082 Brest-Quebec" | tidewater line --spacing 500000 --as geojson
)";

}  // namespace

void add_line(CLI::App& app, int& exit_status) {
  auto options = std::make_shared<Options>();
  CLI::App* command = app.add_subcommand(
      "line",
      "Solves geodesic and rhumb lines.\n"
      "A line of input begins with the positions of start and end; written are the azimuth at the "
      "start, the azimuth back at the end, clockwise from north, and the distance in metres.  With "
      "--direct it begins with a position, an azimuth and a distance in metres; written are the "
      "end and the azimuth back.  The rest of it is passed through, as are blank lines and lines "
      "that begin with #.  A line that cannot be solved is written with * in place of the figures "
      "and told on standard error.");
  command->add_option("files", options->files, "files to read; - or none: standard input");
  add_angle_options(*command, options->in, "", "Input");
  command
      ->add_flag("--csv", options->csv,
                 "a table with columns lat1, lon1, lat2, lon2 (with --direct lat, lon, azimuth, "
                 "distance); all are kept, and the results added")
      ->group("Input");
  command
      ->add_option("--separator", options->separator, "of the table's fields: a character, or tab")
      ->group("Input");
  CLI::Option* direct = command
                            ->add_flag("--direct", options->direct,
                                       "from a position, an azimuth and a distance in metres")
                            ->group("Line");
  command
      ->add_flag("--rhumb", options->rhumb,
                 "rhumb lines, of constant azimuth, the short way round; else geodesics, the "
                 "shortest lines")
      ->group("Line");
  command->add_option("-e,--ellipsoid", options->ellipsoid, "ellipsoid: a name, or A,RF")
      ->capture_default_str()
      ->group("Line");
  CLI::Option* points =
      command
          ->add_option("--points", options->points,
                       "write so many points of each line, evenly spaced, both ends included")
          ->check(CLI::Range(2, 1000000000))
          ->group("Points");
  CLI::Option* spacing =
      command
          ->add_option("--spacing", options->spacing,
                       "write a point of each line every so many metres, and its end")
          ->check(CLI::Range(1e-3, 1e9))
          ->excludes(points)
          ->group("Points");
  command
      ->add_option("--as", options->as,
                   "points as text: positions, with the rest of the line behind each, and a blank "
                   "line between lines; csv: number of the line, number of the point, lon, lat; or "
                   "geojson: line strings with azimuth, distance and the rest of the line (text).  "
                   "The latter two in degrees; geojson goes on beyond 180 degrees over that "
                   "meridian")
      ->check(CLI::IsMember({"text", "csv", "geojson"}))
      ->capture_default_str()
      ->group("Points");
  command
      ->add_flag("--area", options->area,
                 "positions, one a line, are corners of polygons that a blank line ends; written "
                 "are their number, the perimeter in metres and the area in square metres, "
                 "positive counterclockwise")
      ->excludes(direct)
      ->excludes(points)
      ->excludes(spacing)
      ->group("Line");
  add_precision(*command, options->precision,
                "decimals of degrees or grads (9), or of seconds (5)");
  add_angle_options(*command, options->out, "out-", "Output");
  command->footer(kExamples);
  command->callback([options, &exit_status] { exit_status = solve_lines(*options); });
}

}  // namespace tidewater::command
