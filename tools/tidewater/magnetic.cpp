// tidewater magnetic: the field of a geomagnetic model at positions, and its yearly change.

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "commands.hpp"
#include "csv.hpp"
#include "options.hpp"
#include "stream.hpp"
#include "tidewater/magnetic_model.hpp"

namespace tidewater::command {

namespace {

struct Options {
  std::vector<std::string> position;
  std::vector<std::string> files;
  AngleStyle in;
  std::string model;
  std::string date;
  std::string store;
  std::string x, y, z, when, separator;  // columns of a table
  bool csv = false;
};

// A figure of the output.
struct Column {
  const char* symbol;
  const char* name;  // in CSV
  int decimals;
  int width;
  double (*value)(const MagneticValue&);
};

constexpr Column kColumns[] = {
    {"D", "declination", 3, 8, [](const auto& f) { return f.field.declination; }},
    {"I", "inclination", 3, 7, [](const auto& f) { return f.field.inclination; }},
    {"H", "horizontal", 1, 7, [](const auto& f) { return f.field.horizontal; }},
    {"F", "total", 1, 7, [](const auto& f) { return f.field.total; }},
    {"X", "north", 1, 8, [](const auto& f) { return f.field.north; }},
    {"Y", "east", 1, 8, [](const auto& f) { return f.field.east; }},
    {"Z", "down", 1, 8, [](const auto& f) { return f.field.down; }},
    {"dD", "declination_rate", 3, 6, [](const auto& f) { return f.yearly.declination; }},
    {"dI", "inclination_rate", 3, 6, [](const auto& f) { return f.yearly.inclination; }},
    {"dH", "horizontal_rate", 1, 6, [](const auto& f) { return f.yearly.horizontal; }},
    {"dF", "total_rate", 1, 6, [](const auto& f) { return f.yearly.total; }},
    {"dX", "north_rate", 1, 6, [](const auto& f) { return f.yearly.north; }},
    {"dY", "east_rate", 1, 6, [](const auto& f) { return f.yearly.east; }},
    {"dZ", "down_rate", 1, 6, [](const auto& f) { return f.yearly.down; }},
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

void append_number(Buffer& out, double value, int decimals, int width) {
  char text[kNumberRoom];
  const char* const end = format_fixed(text, value, decimals);
  for (auto size = end - text; size < width; ++size) out.add(' ');
  out.add(std::string_view(text, static_cast<std::size_t>(end - text)));
}

class MagneticFields : public Job {
 public:
  explicit MagneticFields(const Options& options)
      : options_(options), reader_(Kind::angles, options.in, Heights::where_there) {
    if (options.when.empty()) {
      date_ = read_date(options.date);
      const MagneticModel model(options.model, date_);
      name_ = model.name();
      if (date_ < model.first_year() || date_ > model.last_year()) {
        std::fprintf(stderr, "tidewater: %s is made for %.1f to %.1f; %.3f is extrapolated\n",
                     name_.c_str(), model.first_year(), model.last_year(), date_);
      }
    }
  }

  std::string prepare(const std::string& source, std::string_view first) override;
  std::unique_ptr<Worker> worker() const override;

  // The line of symbols stands there though no line comes in.
  std::string ending() const override { return options_.csv || started_ ? "" : head(); }

  std::string summary(const Counts& counts) const override {
    std::string text;
    if (name_.empty()) {
      text = options_.model.empty() ? "the newest model" : options_.model;
      text += " at the dates of the table";
    } else {
      char date[kNumberRoom];
      text = name_ + " at " + std::string(date, format_fixed(date, date_, 3));
    }
    return text + ": " + std::to_string(counts.done) + " computed, " +
           std::to_string(counts.refused) + " refused";
  }

 private:
  friend class FieldWorker;

  static std::string head() {
    std::string text;
    for (const Column& column : kColumns) {
      text += text.empty() ? '#' : ' ';
      const std::string_view symbol = column.symbol;
      text.append(static_cast<std::size_t>(column.width) - symbol.size(), ' ');
      text += symbol;
    }
    return text + '\n';
  }

  const Options& options_;
  PositionReader reader_;
  double date_ = 0;
  std::string name_;  // of the model; empty where each row has its date
  bool started_ = false;
  std::unique_ptr<Table> table_;
  int x_ = -1, y_ = -1, z_ = -1, when_ = -1;
};

std::string MagneticFields::prepare(const std::string& source, std::string_view first) {
  const bool again = std::exchange(started_, true);
  if (!options_.csv) return again ? "" : head();
  auto table = std::make_unique<Table>(first, separator_of(options_.separator));
  if (again) {
    if (table->names != table_->names) {
      throw std::runtime_error(source + ": the columns are not those of the first table");
    }
    return {};
  }
  table_ = std::move(table);
  const auto find = [&](const std::string& given, const std::vector<std::string_view>& usual) {
    return given.empty() ? table_->guess(usual) : static_cast<int>(table_->column(given));
  };
  x_ = find(options_.x, {"longitude", "lon", "lng", "long", "x"});
  y_ = find(options_.y, {"latitude", "lat", "y"});
  z_ = find(options_.z, {"height", "h", "z", "altitude", "elevation"});
  if (!options_.when.empty()) when_ = find(options_.when, {});
  if (x_ < 0 || y_ < 0) {
    throw std::invalid_argument("--x and --y must name columns; the table has " +
                                table_->all_names());
  }
  Record record;
  record.take(first, table_->separator);
  std::string text(record.whole());
  for (const Column& column : kColumns) text += table_->separator + table_->new_name(column.name);
  return text + '\n';
}

class FieldWorker : public Worker {
 public:
  explicit FieldWorker(const MagneticFields& job) : job_(job), options_(job.options_) {}

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
      entry.date = job_.date_;
      if (options_.csv) {
        Record record;
        record.take(text, job_.table_->separator);
        number += record.lines();
        entry.text = record.whole();
        entry.is_data = !entry.text.empty();
        if (entry.is_data) read_record(record, entry);
      } else {
        const std::size_t newline = std::min(text.find('\n'), text.size());
        entry.text = text.substr(0, newline);
        const bool cut = chunk.cut && newline == text.size();
        text.remove_prefix(std::min(newline + 1, text.size()));
        if (!entry.text.empty() && entry.text.back() == '\r') entry.text.remove_suffix(1);
        entry.is_data = is_data(entry.text);
        if (entry.is_data) read(entry);
        if (cut) entry.refuse(TW_BAD_TEXT, "the line is longer than any line may be");
        ++number;
      }
      entries_.push_back(std::move(entry));
      if (entries_.size() == kBatch) flush(result);
    }
    flush(result);
    result.lines(number);
  }

 private:
  static constexpr std::size_t kBatch = 1024;

  struct Entry {
    std::string_view text;
    std::size_t rest = 0;
    std::int64_t number = 0;
    bool is_data = false;
    double lon = 0, lat = 0, height = 0;
    double date = 0;
    TWstatus status = TW_SUCCESS;
    std::string reason;

    void refuse(TWstatus why, std::string words) {
      if (status != TW_SUCCESS) return;
      status = why;
      reason = std::move(words);
    }
  };

  void read(Entry& entry) {
    job_.reader_.take(entry.text, position_);
    entry.rest = position_.rest;
    if (position_.status != TW_SUCCESS) return entry.refuse(position_.status, position_.reason);
    place(entry, position_.x, position_.y, position_.z);
  }

  static void place(Entry& entry, double lon, double lat, double height) {
    if (!(std::fabs(lat) <= 90)) return entry.refuse(TW_BAD_LATITUDE, "");
    if (!(std::fabs(lon) <= 360)) return entry.refuse(TW_BAD_LONGITUDE, "");
    entry.lon = lon;
    entry.lat = lat;
    entry.height = height;
  }

  void read_record(const Record& record, Entry& entry) {
    const auto size = static_cast<int>(record.size());
    if (job_.x_ >= size || job_.y_ >= size || job_.z_ >= size || job_.when_ >= size) {
      return entry.refuse(TW_BAD_TEXT, "the row has too few fields");
    }
    double lon = 0, lat = 0, height = 0;
    std::string reason;
    if (!job_.reader_.take_field(record.value(static_cast<std::size_t>(job_.x_)), false, lon,
                                 reason) ||
        !job_.reader_.take_field(record.value(static_cast<std::size_t>(job_.y_)), true, lat,
                                 reason)) {
      return entry.refuse(TW_BAD_TEXT, reason);
    }
    if (job_.z_ >= 0) {
      const std::string text = record.value(static_cast<std::size_t>(job_.z_));
      std::string_view rest = text;
      if (!text.empty() && !(take_number(rest, height) && rest.empty())) {
        return entry.refuse(TW_BAD_TEXT, "\"" + text + "\" is no height");
      }
    }
    if (job_.when_ >= 0) {
      const std::string text = record.value(static_cast<std::size_t>(job_.when_));
      try {
        if (text.empty()) throw std::invalid_argument("the date is missing");
        entry.date = read_date(text);
      } catch (const std::invalid_argument& error) {
        return entry.refuse(TW_BAD_DATE, error.what());
      }
    }
    place(entry, lon, lat, height);
  }

  static bool is_good(const Entry& entry) { return entry.is_data && entry.status == TW_SUCCESS; }

  // The model at a date; those last used are kept.
  const MagneticModel& model_at(double date) {
    for (const MagneticModel& known : models_) {
      if (known.year() == date) return known;
    }
    if (models_.size() == 16) models_.erase(models_.begin());
    return models_.emplace_back(options_.model, date);
  }

  void flush(Result& result) {
    // Rows of one date that follow one another go through one call.
    std::vector<MagneticValue> fields(entries_.size());
    for (std::size_t from = 0; from < entries_.size();) {
      std::size_t to = from + 1;
      while (to < entries_.size() && (entries_[to].date == entries_[from].date)) ++to;
      compute(from, to, fields);
      from = to;
    }
    for (std::size_t i = 0; i < entries_.size(); ++i) {
      const Entry& entry = entries_[i];
      if (!entry.is_data) {
        result.out.add(entry.text);
        result.out.add('\n');
      } else if (is_good(entry)) {
        write_field(result, entry, fields[i]);
      } else {
        write_refused(result, entry);
      }
    }
    entries_.clear();
  }

  void compute(std::size_t from, std::size_t to, std::vector<MagneticValue>& fields) {
    const bool any = std::any_of(entries_.begin() + static_cast<std::ptrdiff_t>(from),
                                 entries_.begin() + static_cast<std::ptrdiff_t>(to), is_good);
    if (!any) return;
    x_.clear();
    y_.clear();
    z_.clear();
    for (std::size_t i = from; i < to; ++i) {
      x_.push_back(entries_[i].lon);
      y_.push_back(entries_[i].lat);
      z_.push_back(entries_[i].height);
    }
    try {
      model_at(entries_[from].date)
          .field(to - from, Coordinates<const double>{x_.data(), y_.data(), z_.data()},
                 &fields[from]);
    } catch (const Error& error) {
      if (options_.when.empty()) throw;
      for (std::size_t i = from; i < to; ++i) entries_[i].refuse(TW_BAD_DATE, error.what());
      return;
    }
    for (std::size_t i = from; i < to; ++i) {
      if (!is_good(entries_[i])) continue;
      const bool finite =
          std::all_of(std::begin(kColumns), std::end(kColumns),
                      [&](const Column& c) { return std::isfinite(c.value(fields[i])); });
      if (!finite) entries_[i].refuse(TW_RANGE_ERROR, "");  // at the centre of the earth
    }
  }

  void write_field(Result& result, const Entry& entry, const MagneticValue& field) const {
    if (options_.csv) {
      result.out.add(entry.text);
    }
    bool first = true;
    for (const Column& column : kColumns) {
      if (options_.csv) {
        result.out.add(job_.table_->separator);
      } else if (!first) {
        result.out.add(' ');
      }
      append_number(result.out, column.value(field), column.decimals,
                    options_.csv ? 0 : column.width + (first ? 1 : 0));
      first = false;
    }
    if (!options_.csv) result.out.add(entry.text.substr(entry.rest));
    result.out.add('\n');
    result.done();
  }

  void write_refused(Result& result, const Entry& entry) const {
    result.complain(entry.number, entry.text, entry.reason, entry.status);
    if (options_.csv) result.out.add(entry.text);
    for (std::size_t i = 0; i < std::size(kColumns); ++i) {
      if (options_.csv) {
        result.out.add(job_.table_->separator);
      } else if (i > 0) {
        result.out.add(' ');
      }
      result.out.add('*');
    }
    if (!options_.csv) result.out.add(entry.text.substr(entry.rest));
    result.out.add('\n');
  }

  const MagneticFields& job_;
  const Options& options_;
  TakenPosition position_;
  std::vector<Entry> entries_;
  std::vector<MagneticModel> models_;
  std::vector<double> x_, y_, z_;
};

std::unique_ptr<Worker> MagneticFields::worker() const {
  return std::make_unique<FieldWorker>(*this);
}

int compute_fields(const Options& options) {
  options.in.check();
  // The systems layer asks the environment.
  if (!options.store.empty()) setenv("TIDEWATER_STORE", options.store.c_str(), 1);
  if (!options.when.empty() && !options.csv) {
    throw std::invalid_argument("--date-column goes with --csv");
  }
  MagneticFields job(options);
  StreamOptions stream;
  stream.records = options.csv;
  if (options.position.empty()) return run_stream(job, options.files, stream);
  std::string line;
  for (const std::string& argument : options.position) line += (line.empty() ? "" : " ") + argument;
  return run_line(job, line);
}

const char* const kExamples = R"(Figures:
  D declination and I inclination, degrees; H horizontal and F total intensity, X north, Y east and
  Z down, nT; dD, dI, dH, dF, dX, dY, dZ: their change in a year.
Examples:
  # the field at Brest, 2026.5, by the newest model of the store
  tidewater magnetic --date 2026.5 48.39 -4.49
  # lines of positions with heights, in degrees, minutes and seconds with letters
  echo "48:23:25.1N 4:29:10.7W 34.2 Brest" | tidewater magnetic --date 2026-07-01 --format dms --hemisphere behind
  # the declination of the past
  echo "48.39 -4.49" | tidewater magnetic --model IGRF --date 1950
)";

}  // namespace

void add_magnetic(CLI::App& app, int& exit_status) {
  auto options = std::make_shared<Options>();
  CLI::App* command = app.add_subcommand(
      "magnetic",
      "Computes the field of a geomagnetic model and its yearly change.\n"
      "A line begins with two angles and, where a plain number follows, a height in metres, on WGS "
      "84; written are the figures named below.  The rest of it is passed through, as are blank "
      "lines and lines that begin with #.  A line that is not a position is written with * in "
      "place "
      "of the figures and told on standard error.");
  CLI::Option* position = command->add_option("position", options->position,
                                              "a single position; without one, files are read");
  command
      ->add_option("-f,--file", options->files,
                   "file to read, may be given again; - or none: standard input")
      ->allow_extra_args(false)
      ->excludes(position);
  add_angle_options(*command, options->in, "", "Input");
  command
      ->add_option(
          "--model", options->model,
          "model of the store, or a series (IGRF) for its newest; the newest of all if not given")
      ->group("Model");
  command->add_option("--date", options->date, "decimal year, or YYYY-MM-DD; today if not given")
      ->group("Model");
  command
      ->add_option("--store", options->store,
                   "parameter store, instead of that of the library or of TIDEWATER_STORE")
      ->group("Model");
  command
      ->add_flag("--csv", options->csv,
                 "a table with a line of names; all its columns are kept, and the figures added")
      ->group("Table");
  command->add_option("--x", options->x, "column of longitudes")->group("Table");
  command->add_option("--y", options->y, "column of latitudes")->group("Table");
  command->add_option("--z", options->z, "column of heights")->group("Table");
  command
      ->add_option("--date-column", options->when, "column of dates, one a row, as --date has them")
      ->group("Table");
  command
      ->add_option("--separator", options->separator, "of the table's fields: a character, or tab")
      ->group("Table");
  command->footer(kExamples);
  command->callback([options, &exit_status] { exit_status = compute_fields(*options); });
}

}  // namespace tidewater::command
