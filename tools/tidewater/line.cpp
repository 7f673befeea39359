// tidewater line: geodesic and rhumb lines between positions, and runs of points along them.

#include <cmath>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "angle_format.hpp"
#include "commands.hpp"
#include "ellipsoid.hpp"
#include "json_text.hpp"
#include "line_job.hpp"
#include "line_solver.hpp"
#include "position_text.hpp"

namespace tidewater::command {

namespace {

constexpr double kDegree = 0.017453292519943295;
constexpr int kMetreDecimals = 3;

struct Options {
  std::vector<std::string> files;
  AngleFormat in;
  AngleFormat out;
  std::string ellipsoid = "GRS 80";
  bool rhumb = false;
  bool direct = false;
  int32_t points = 0;  // of each line; 0: by spacing, or none
  double spacing = 0;  // metres; 0: by points, or none
  std::string as = "text";
  int precision = -1;

  bool wants_points() const { return points > 0 || spacing > 0; }
};

class LineSolving : public LineJob {
 public:
  explicit LineSolving(const Options& options)
      : options_(options),
        in_unit_(options.in.unit()),
        out_unit_(options.out.unit()),
        degree_decimals_(options.precision >= 0 ? options.precision : 9),
        solver_(find_ellipsoid(options.ellipsoid), options.rhumb) {
    if (options.as == "csv") write("line,point,lon,lat\n");
    if (options.as == "geojson") write("{\"type\":\"FeatureCollection\",\"features\":[");
  }

 private:
  void take(Line line) override {
    if (!line.is_data) {
      if (options_.as == "text") write(line.text + '\n');
      return;
    }
    ++number_;
    SolvedLine solved;
    std::string_view rest = line.text;
    const TWstatus status = read(rest, solved);
    if (line.status == TW_SUCCESS) line.status = status;
    line.rest = line.text.size() - rest.size();
    if (line.status == TW_SUCCESS) {
      const Refusal refusal = options_.direct ? solver_.direct(solved) : solver_.inverse(solved);
      if (refusal) line.refuse(refusal.status, refusal.reason);
    }
    const int32_t count = line.status == TW_SUCCESS ? points_of(solved, line) : 0;
    if (line.status == TW_SUCCESS) {
      write_solved(solved, count, rest);
      count_done();
      return;
    }
    complain(line);
    if (options_.as != "text") return;
    out_ = options_.wants_points() ? "* *" : "* * *";
    out_ += rest;
    write_block();
  }

  // Takes the fields of a problem off the front of text: all of them, though one be bad.
  TWstatus read(std::string_view& text, SolvedLine& line) const {
    const TWstatus start = take_position(text, options_.in, in_unit_, line.start);
    TWstatus other = TW_SUCCESS;
    if (options_.direct) {
      other = take_azimuth(text, options_.in, line.azimuth);
      if (!take_number(text, line.distance) && other == TW_SUCCESS) other = TW_BAD_TEXT;
    } else {
      other = take_position(text, options_.in, in_unit_, line.end);
    }
    return start != TW_SUCCESS ? start : other;
  }

  int32_t points_of(const SolvedLine& solved, Line& line) const {
    if (options_.spacing == 0) return options_.points;
    const int32_t count = solver_.count(solved, options_.spacing);
    if (count == 0) line.refuse(TW_BAD_PARAMETER, "more points than can be counted");
    return count;
  }

  void write_solved(const SolvedLine& solved, int32_t count, std::string_view rest) {
    if (options_.as == "csv") {
      write_csv(solved, count);
    } else if (options_.as == "geojson") {
      write_feature(solved, count, rest);
    } else if (options_.wants_points()) {
      write_run(solved, count, rest);
    } else {
      out_.clear();
      if (options_.direct) {
        append_position(out_, solved.end, options_.out, out_unit_);
      } else {
        append_azimuth(out_, solved.azimuth, options_.out);
      }
      append_azimuth(out_, solved.back_azimuth, options_.out);
      if (!options_.direct) append_metres(out_, solved.distance, kMetreDecimals);
      out_ += rest;
      write_block();
    }
  }

  // The line's points one by one, the last one always its end: nothing is held, however many.
  template <class Use>
  void each_point(const SolvedLine& solved, int32_t count, Use use) const {
    const double step = options_.spacing > 0 ? options_.spacing : solved.distance / (count - 1);
    use(solved.start);
    for (int32_t i = 1; i < count - 1; ++i) use(solver_.point(solved, i * step));
    use(solved.end);
  }

  void write_run(const SolvedLine& solved, int32_t count, std::string_view rest) {
    if (blank_before_) write("\n");
    blank_before_ = true;
    each_point(solved, count, [&](const CoordinateTriple& p) {
      out_.clear();
      append_position(out_, p, options_.out, out_unit_);
      out_ += rest;
      out_ += '\n';
      write(out_);
    });
  }

  // What stands for one line of input; a blank line keeps runs of points apart.
  void write_block() {
    if (options_.wants_points()) {
      if (blank_before_) write("\n");
      blank_before_ = true;
    }
    out_ += '\n';
    write(out_);
  }

  void write_csv(const SolvedLine& solved, int32_t count) {
    int32_t point = 0;
    each_point(solved, count, [&](const CoordinateTriple& p) {
      out_ = std::to_string(number_) + ',' + std::to_string(++point) + ',';
      append_number(out_, p.x / kDegree, degree_decimals_);
      out_ += ',';
      append_number(out_, p.y / kDegree, degree_decimals_);
      out_ += '\n';
      write(out_);
    });
  }

  void write_feature(const SolvedLine& solved, int32_t count, std::string_view rest) {
    out_ = features_++ > 0 ? ",\n" : "\n";
    out_ += R"({"type":"Feature","properties":{"azimuth":)";
    append_number(out_, solved.azimuth / kDegree, degree_decimals_);
    out_ += ",\"distance\":";
    append_number(out_, solved.distance, kMetreDecimals);
    out_ += ",\"text\":";
    const std::size_t first = rest.find_first_not_of(" \t,;");
    append_json_string(out_, first == std::string_view::npos ? "" : rest.substr(first));
    out_ += R"(},"geometry":{"type":"LineString","coordinates":[)";
    bool is_first = true;
    double before = 0;
    each_point(solved, count, [&](const CoordinateTriple& p) {
      // A line over the 180th meridian goes on beyond 180 degrees: it is not drawn across the map.
      const double lon =
          is_first ? p.x / kDegree : before + std::remainder(p.x / kDegree - before, 360);
      out_ += is_first ? "[" : ",[";
      append_number(out_, lon, degree_decimals_);
      out_ += ',';
      append_number(out_, p.y / kDegree, degree_decimals_);
      out_ += ']';
      write(out_);
      out_.clear();
      is_first = false;
      before = lon;
    });
    write("]}}");
  }

  void end() override {
    if (options_.as == "geojson") write("\n]}\n");
  }

  std::string summary(const Counts& counts) const override {
    return std::to_string(counts.done) + " solved, " + std::to_string(counts.refused) + " refused";
  }

  const Options& options_;
  AngleUnit in_unit_;
  AngleUnit out_unit_;
  int degree_decimals_;  // in CSV and GeoJSON
  LineSolver solver_;
  std::string out_;
  int64_t number_ = 0;  // of the line among those that are data
  int64_t features_ = 0;
  bool blank_before_ = false;
};

int solve_lines(Options& options) {
  if (options.as != "text" && !options.wants_points()) {
    throw std::invalid_argument("--as " + options.as + " needs --points or --spacing");
  }
  if (std::isnan(options.spacing)) throw std::invalid_argument("--spacing is not a number");
  if (options.precision >= 0) options.out.precision = options.precision;
  return LineSolving(options).run(options.files);
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
      ->add_flag("--direct", options->direct,
                 "from a position, an azimuth and a distance in metres")
      ->group("Line");
  command
      ->add_flag("--rhumb", options->rhumb,
                 "rhumb lines, of constant azimuth, the short way round; else geodesics, the "
                 "shortest lines")
      ->group("Line");
  command
      ->add_option("-e,--ellipsoid", options->ellipsoid,
                   "ellipsoid: " + ellipsoid_names() + "; or A,RF")
      ->capture_default_str()
      ->group("Line");
  CLI::Option* points =
      command
          ->add_option("--points", options->points,
                       "write so many points of each line, evenly spaced, both ends included")
          ->check(CLI::Range(2, 1000000000))
          ->group("Points");
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
      ->add_option("-p,--precision", options->precision,
                   "decimals of degrees or grads (9), or of seconds (5)")
      ->check(CLI::Range(0, 15))
      ->group("Output");
  add_angle_options(*command, options->out, "out-", "Output");
  command->footer(kExamples);
  command->callback([options, &exit_status] { exit_status = solve_lines(*options); });
}

}  // namespace tidewater::command
