// tidewater magnetic: the field of a geomagnetic model at positions, and its yearly change.

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "angle_format.hpp"
#include "commands.hpp"
#include "line_job.hpp"
#include "magnetic_model.hpp"
#include "position_text.hpp"

namespace tidewater::command {

namespace {

constexpr double kDegree = 0.017453292519943295;
// Of a position in CSV.
constexpr int kDegreeDecimals = 9;
constexpr int kMetreDecimals = 3;

struct Options {
  std::vector<std::string> position;
  std::vector<std::string> files;
  AngleFormat in;
  std::string model;
  std::string date;
  std::string store;
  bool csv = false;
};

// A figure of the output.
struct Column {
  const char* symbol;
  const char* name;  // in CSV
  int decimals;
  int width;
  double (*value)(const MagneticField&);
};

constexpr Column kColumns[] = {
    {"D", "declination", 3, 8, [](const auto& f) { return f.elements.declination / kDegree; }},
    {"I", "inclination", 3, 7, [](const auto& f) { return f.elements.inclination / kDegree; }},
    {"H", "horizontal", 1, 7, [](const auto& f) { return f.elements.horizontal; }},
    {"F", "total", 1, 7, [](const auto& f) { return f.elements.total; }},
    {"X", "north", 1, 8, [](const auto& f) { return f.vector.x; }},
    {"Y", "east", 1, 8, [](const auto& f) { return f.vector.y; }},
    {"Z", "down", 1, 8, [](const auto& f) { return f.vector.z; }},
    {"dD", "declination_rate", 3, 6, [](const auto& f) { return f.rates.declination / kDegree; }},
    {"dI", "inclination_rate", 3, 6, [](const auto& f) { return f.rates.inclination / kDegree; }},
    {"dH", "horizontal_rate", 1, 6, [](const auto& f) { return f.rates.horizontal; }},
    {"dF", "total_rate", 1, 6, [](const auto& f) { return f.rates.total; }},
    {"dX", "north_rate", 1, 6, [](const auto& f) { return f.vector_rates.x; }},
    {"dY", "east_rate", 1, 6, [](const auto& f) { return f.vector_rates.y; }},
    {"dZ", "down_rate", 1, 6, [](const auto& f) { return f.vector_rates.z; }},
};

double decimal_year(std::chrono::year_month_day day) {
  using namespace std::chrono;
  const auto start = [](year y) { return sys_days(y / January / 1); };
  const year y = day.year();
  const auto passed = sys_days(day) - start(y);
  const auto whole = start(y + years(1)) - start(y);
  return static_cast<int>(y) +
         static_cast<double>(passed.count()) / static_cast<double>(whole.count());
}

// YYYY-MM-DD, though no such day may be.
bool looks_like_a_day(std::string_view text) {
  constexpr std::string_view kPattern = "0000-00-00";
  return std::equal(text.begin(), text.end(), kPattern.begin(), kPattern.end(),
                    [](char c, char p) { return p == '-' ? c == '-' : c >= '0' && c <= '9'; });
}

// A decimal year or a day; an empty text is today.
double read_date(const std::string& text) {
  using namespace std::chrono;
  if (text.empty()) return decimal_year(floor<days>(system_clock::now()));
  if (looks_like_a_day(text)) {
    const auto number = [&text](std::size_t from, std::size_t count) {
      return std::stoi(text.substr(from, count));
    };
    const auto date = year(number(0, 4)) / number(5, 2) / number(8, 2);
    if (date.ok()) return decimal_year(date);
  } else {
    double value = 0;
    std::string_view rest = text;
    if (take_number(rest, value) && rest.empty()) return value;
  }
  throw std::invalid_argument("not a date: " + text + " (a decimal year, or YYYY-MM-DD)");
}

class MagneticFields : public LineJob {
 public:
  explicit MagneticFields(const Options& options)
      : options_(options),
        in_unit_(options.in.unit()),
        date_(read_date(options.date)),
        model_(options.store, options.model, date_) {
    if (date_ < model_.first_date() || date_ > model_.last_date()) {
      std::fprintf(stderr, "tidewater: %s is made for %.1f to %.1f; %.3f is extrapolated\n",
                   model_.name().c_str(), model_.first_date(), model_.last_date(), date_);
    }
    lines_.reserve(kBatch);
    write_head();
  }

 private:
  // A line of a batch.
  struct Entry {
    Line line;
    CoordinateTriple point = {};
  };

  void take(Line line) override {
    Entry entry;
    if (line.is_data) {
      PositionText text;
      const TWstatus status = read_position(line.text, options_.in, in_unit_, text);
      if (line.status == TW_SUCCESS) line.status = status;
      line.rest = line.text.size() - text.rest.size();
      entry.point = text.point;
    }
    entry.line = std::move(line);
    lines_.push_back(std::move(entry));
  }

  void end_batch() override {
    std::vector<CoordinateTriple> points;
    for (const Entry& entry : lines_) {
      if (is_good(entry)) points.push_back(entry.point);
    }
    const std::vector<MagneticField> fields = model_.at(points);
    auto field = fields.begin();
    for (Entry& entry : lines_) {
      if (!entry.line.is_data) {
        if (!options_.csv) write(entry.line.text + '\n');
      } else if (is_good(entry)) {
        write_field(entry, *field++);
      } else {
        write_refused(entry.line);
      }
    }
    lines_.clear();
  }

  static bool is_good(const Entry& entry) {
    return entry.line.is_data && entry.line.status == TW_SUCCESS;
  }

  void write_head() {
    out_ = options_.csv ? "latitude,longitude,height" : "";
    for (const Column& column : kColumns) {
      if (options_.csv) {
        out_ += ',';
        out_ += column.name;
      } else {
        out_ += out_.empty() ? '#' : ' ';
        const std::string_view symbol = column.symbol;
        out_.append(static_cast<std::size_t>(column.width) - symbol.size(), ' ');
        out_ += symbol;
      }
    }
    out_ += '\n';
    write(out_);
  }

  void write_field(Entry& entry, const MagneticField& field) {
    const bool finite = std::all_of(std::begin(kColumns), std::end(kColumns),
                                    [&](const Column& c) { return std::isfinite(c.value(field)); });
    if (!finite) {  // at the centre of the earth
      entry.line.status = TW_RANGE_ERROR;
      write_refused(entry.line);
      return;
    }
    out_.clear();
    if (options_.csv) {
      append_number(out_, entry.point.y / kDegree, kDegreeDecimals);
      out_ += ',';
      append_number(out_, entry.point.x / kDegree, kDegreeDecimals);
      out_ += ',';
      append_number(out_, entry.point.z, kMetreDecimals);
    }
    for (const Column& column : kColumns) {
      out_ += options_.csv ? ',' : ' ';
      append_number(out_, column.value(field), column.decimals, options_.csv ? 0 : column.width);
    }
    if (!options_.csv) out_.append(entry.line.text, entry.line.rest);
    out_ += '\n';
    write(out_);
    count_done();
  }

  void write_refused(const Line& line) {
    complain(line);
    if (options_.csv) return;
    out_ = "*";
    for (std::size_t i = 1; i < std::size(kColumns); ++i) out_ += " *";
    out_.append(line.text, line.rest);
    out_ += '\n';
    write(out_);
  }

  std::string summary(const Counts& counts) const override {
    std::string text = model_.name() + " at ";
    append_number(text, date_, 3);
    return text + ": " + std::to_string(counts.done) + " computed, " +
           std::to_string(counts.refused) + " refused";
  }

  const Options& options_;
  AngleUnit in_unit_;
  double date_;
  MagneticModel model_;
  std::vector<Entry> lines_;
  std::string out_;
};

int compute_fields(const Options& options) {
  MagneticFields job(options);
  return options.position.empty() ? job.run(options.files) : job.run_arguments(options.position);
}

// The store that is installed beside the command.
std::string installed_store() {
  std::error_code error;
  const auto command = std::filesystem::read_symlink("/proc/self/exe", error);
  return (command.parent_path() / ".." / "share" / "tidewater" / "tidewater.store")
      .lexically_normal()
      .string();
}

const char* const kExamples = R"(Figures:
  D declination and I inclination, degrees; H horizontal and F total intensity, X north, Y east and
  Z down, nT; dD, dI, dH, dF, dX, dY, dZ: their change in a year.
Examples:
  # the field at Brest, 2026.5, by the newest model of the store
  tidewater magnetic --date 2026.5 48.39 -4.49
  # lines of positions with heights, in degrees, minutes and seconds with letters
  echo "48:23:25.1N 4:29:10.7W 34.2 Brest" | tidewater magnetic --date 2026-07-01 --format dms --hemisphere behind
  # the declination of the past, as CSV
  echo "48.39 -4.49" | tidewater magnetic --model IGRF-13 --date 1950 --csv
)";

}  // namespace

void add_magnetic(CLI::App& app, int& exit_status) {
  auto options = std::make_shared<Options>();
  options->store = installed_store();
  CLI::App* command = app.add_subcommand(
      "magnetic",
      "Computes the field of a geomagnetic model and its yearly change.\n"
      "A line begins with two angles and, where a plain number follows, a height in metres, on WGS "
      "84; written are the figures named below.  The rest of it is passed through, as are blank "
      "lines and lines that begin with #.  A line that is no position is written with * in place "
      "of the figures and told on standard error.");
  CLI::Option* position = command->add_option("position", options->position,
                                              "a single position; without one, files are read");
  command
      ->add_option("-f,--file", options->files,
                   "file to read, may be given again; - or none: standard input")
      ->allow_extra_args(false)
      ->excludes(position);
  add_angle_options(*command, options->in, "", "Input");
  command->add_option("--model", options->model, "model of the store; the newest if not given")
      ->group("Model");
  command->add_option("--date", options->date, "decimal year, or YYYY-MM-DD; today if not given")
      ->group("Model");
  command->add_option("--store", options->store, "parameter store")
      ->envname("TIDEWATER_STORE")
      ->capture_default_str()
      ->group("Model");
  command
      ->add_flag("--csv", options->csv,
                 "comma-separated values with a line of names: latitude, longitude in degrees, "
                 "height, and the figures")
      ->group("Output");
  command->footer(kExamples);
  command->callback([options, &exit_status] { exit_status = compute_fields(*options); });
}

}  // namespace tidewater::command
