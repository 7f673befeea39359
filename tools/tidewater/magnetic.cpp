#include "magnetic.hpp"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <charconv>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <limits>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "tidewater/tidewater.h"

namespace tidewater::tools {

namespace {

constexpr double kDegreesPerRadian = 57.29577951308232;
constexpr double kRadiansPerSecond = 1 / kDegreesPerRadian / 3600;
// WGS 84, the ellipsoid of the positions.
constexpr double kSemiMajor = 6378137;
constexpr double kFlattening = 1 / 298.257223563;
// A position that differs by less than this many metres keeps the sums of the one before it.
constexpr double kSameParallel = 1e-6;
// A value that no position and no date comes near.
constexpr double kNowhere = 1e30;
// Names in the store, each with room for its terminator.
constexpr std::size_t kModelName = 41;
constexpr std::size_t kTableName = 33;
constexpr std::size_t kTextField = 64;

void require(TWstatus status, const std::string& what) {
  if (TW_OK(status)) return;
  std::string word;
  for (int shift = 28; shift >= 0; shift -= 4) word += "0123456789ABCDEF"[(status >> shift) & 15];
  throw std::runtime_error(what + " (status 0x" + word + ")");
}

class Triangle {
 public:
  explicit Triangle(int32_t degree) {
    const auto rows = static_cast<std::size_t>(degree) + 1;
    block_.resize(rows * (rows + 1) / 2);
    for (std::size_t n = 0; n < rows; ++n) rows_.push_back(block_.data() + n * (n + 1) / 2);
  }
  // A move takes the block along, and the rows keep pointing into it.
  Triangle(Triangle&&) = default;
  Triangle& operator=(Triangle&&) = default;

  double** rows() { return rows_.data(); }

 private:
  std::vector<double> block_;
  std::vector<double*> rows_;
};

// The work arrays and remembered values of one series.
struct Cache {
  explicit Cache(int32_t degree) {
    for (auto* sum : {&dC, &dS, &lC, &lS, &rC, &rS, &C, &S}) {
      sum->resize(static_cast<std::size_t>(degree) + 1);
    }
  }
  std::vector<double> dC, dS, lC, lS, rC, rS, C, S;
  double last_colat = kNowhere, last_radius = kNowhere;
  double tcos = 0, tsin = 0, scale_theta = 0, scale_lambda = 0, scale_r = 0;
};

// The row of a model.
struct ModelInfo {
  ModelInfo(const std::string& store, const std::string& model_name) : name(model_name) {
    TWstatus status = TW_SUCCESS;
    std::string key = name;
    key.resize(kTextField);
    int16_t number = 0;
    char text[kTextField] = {}, table[kTextField] = {};
    TWmagmdl_info(store.c_str(), key.data(), &number, 1, table, &radius, &normalisation, text,
                  &first_date, &last_date, &interval, &epoch_count, &status);
    if (status == TW_NO_SUCH_MODEL) throw std::runtime_error("no model " + name + " in " + store);
    require(status, "the store " + store + " gives no model " + name);
    if (epoch_count < 2) return;
    const auto count = static_cast<std::size_t>(epoch_count);
    degrees.resize(count);
    epochs.resize(count);
    table_names.resize(count * kTableName);
    TWepoch_info(store.c_str(), table, degrees.data(), epochs.data(), table_names.data(), &status);
    require(status, "the epochs of the model " + name + " cannot be read");
  }

  // A set of coefficients and a set of rates are the least that makes a model.
  bool usable() const { return epoch_count >= 2; }
  // The epoch of the newest coefficients; the last set holds their rates.
  double newest_epoch() const { return *(epochs.end() - 2); }

  std::string name;
  double radius = 0;
  int16_t normalisation = 0;
  double first_date = 0, last_date = 0;  // what the model is published for
  double interval = 0;                   // years between two epochs
  int32_t epoch_count = 0;
  std::vector<int32_t> degrees;
  std::vector<double> epochs;
  std::vector<char> table_names;
};

ModelInfo newest_model(const std::string& store) {
  TWstatus status = TW_SUCCESS;
  int32_t count = 0;
  TWmag_mdl_cnt(store.c_str(), &count, &status);
  if (status == TW_PF_OPEN_ERROR) throw std::runtime_error("cannot open the store " + store);
  require(status, "the store " + store + " has no magnetic models");
  std::vector<char> names(static_cast<std::size_t>(std::max(count, 0)) * kModelName + kTextField);
  TWmagmdl_names(store.c_str(), names.data(), &status);
  require(status, "the magnetic models of the store " + store + " cannot be listed");
  std::optional<ModelInfo> newest;
  for (int32_t i = 0; i < count; ++i) {
    ModelInfo info(store, names.data() + static_cast<std::size_t>(i) * kModelName);
    if (info.usable() && (!newest || info.newest_epoch() > newest->newest_epoch())) newest = info;
  }
  if (!newest) throw std::runtime_error("no magnetic model in " + store);
  return *newest;
}

// Field, elements and their yearly change at a position.
struct Answer {
  CoordinateTriple position;
  MagneticElements elements;
  CoordinateTriple field;
  MagneticElements rates;
  CoordinateTriple field_rates;
};

// A model with its coefficients at a date.
class Model {
 public:
  Model(const std::string& store, const ModelInfo& info, double date)
      : radius_(info.radius),
        degree_(*std::max_element(info.degrees.begin(), info.degrees.end())),
        C_(degree_),
        S_(degree_),
        Ct_(degree_),
        St_(degree_),
        rec_a_(degree_),
        rec_b_(degree_),
        main_(degree_),
        secular_(degree_) {
    if (info.epoch_count > 2 && info.interval <= 0) {
      throw std::runtime_error("the model " + info.name + " has no interval between its epochs");
    }
    std::vector<Triangle> sets;
    for (const int32_t degree : info.degrees) {
      sets.emplace_back(degree);
      sets.emplace_back(degree);
    }
    std::vector<double**> c_sets, s_sets;
    for (std::size_t i = 0; i < sets.size(); i += 2) {
      c_sets.push_back(sets[i].rows());
      s_sets.push_back(sets[i + 1].rows());
    }
    TWstatus status = TW_SUCCESS;
    TWmm_coef_info(store.c_str(), info.epoch_count, info.degrees.data(), info.table_names.data(),
                   c_sets.data(), s_sets.data(), &status);
    require(status, "the coefficients of the model " + info.name + " cannot be read");
    if (info.normalisation == 1 || info.normalisation == 2) {
      for (std::size_t i = 0; i < c_sets.size(); ++i) {
        TWhar_normaliz(info.normalisation, info.degrees[i], c_sets[i], s_sets[i], &status);
      }
    }
    double last_date = kNowhere;
    TWhar_set_date(date, &last_date, 0, info.epoch_count, info.degrees.data(), info.epochs.data(),
                   info.interval, c_sets.data(), s_sets.data(), &n_main_, &n_sec_, C_.rows(),
                   S_.rows(), Ct_.rows(), St_.rows(), &status);
    if (status == TW_BAD_DATE) {
      throw std::runtime_error("the model " + info.name + " does not reach that date");
    }
    require(status, "no coefficients of the model " + info.name + " at that date");
    if (n_sec_ < 2) throw std::runtime_error("the model " + info.name + " has too low a degree");
    TWhar_recur_c(degree_, rec_a_.rows(), rec_b_.rows(), &status);
  }

  std::vector<Answer> at(const std::vector<CoordinateTriple>& points) {
    const double e = std::sqrt(kFlattening * (2 - kFlattening));
    std::vector<CoordinateTriple> field(points.size()), field_rates(points.size());
    std::vector<MagneticElements> elements(points.size()), rates(points.size());
    TWstatus status = TW_SUCCESS;
    TWhar_mag_var(
        n_main_, radius_, C_.rows(), S_.rows(), rec_a_.rows(), rec_b_.rows(), main_.dC.data(),
        main_.dS.data(), main_.lC.data(), main_.lS.data(), main_.rC.data(), main_.rS.data(),
        main_.C.data(), main_.S.data(), &main_.last_colat, &main_.last_radius, &last_lon_,
        kSameParallel, &main_.tcos, &main_.tsin, &main_.scale_theta, &main_.scale_lambda,
        &main_.scale_r, n_sec_, Ct_.rows(), St_.rows(), secular_.dC.data(), secular_.dS.data(),
        secular_.lC.data(), secular_.lS.data(), secular_.rC.data(), secular_.rS.data(),
        secular_.C.data(), secular_.S.data(), &secular_.last_colat, &secular_.last_radius,
        &secular_.tcos, &secular_.tsin, &secular_.scale_theta, &secular_.scale_lambda,
        &secular_.scale_r, kSemiMajor, e, static_cast<int32_t>(points.size()), points.data(),
        field.data(), elements.data(), field_rates.data(), rates.data(), &status);
    require(status, "the field cannot be computed");
    std::vector<Answer> answers;
    for (std::size_t i = 0; i < points.size(); ++i) {
      answers.push_back({points[i], elements[i], field[i], rates[i], field_rates[i]});
    }
    return answers;
  }

 private:
  double radius_;
  int32_t degree_;
  int32_t n_main_ = 0, n_sec_ = 0;
  Triangle C_, S_, Ct_, St_, rec_a_, rec_b_;
  Cache main_, secular_;
  double last_lon_ = kNowhere;
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

// A whole number of exactly so many digits.
std::optional<int> read_digits(std::string_view text, std::size_t digits) {
  int value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (text.size() != digits || error != std::errc() || end != text.data() + digits || value < 0) {
    return std::nullopt;
  }
  return value;
}

// A decimal year or a day as YYYY-MM-DD; an empty text is today.
double read_date(const std::string& text) {
  using namespace std::chrono;
  if (text.empty()) return decimal_year(floor<days>(system_clock::now()));
  if (text.size() == 10 && text[4] == '-' && text[7] == '-') {
    const std::string_view all = text;
    const auto y = read_digits(all.substr(0, 4), 4);
    const auto m = read_digits(all.substr(5, 2), 2);
    const auto d = read_digits(all.substr(8, 2), 2);
    if (y && m && d) {
      const auto date = year(*y) / *m / *d;
      if (date.ok()) return decimal_year(date);
    }
  } else if (text.find_first_not_of("0123456789.") == std::string::npos) {
    double value = 0;
    const char* last = text.data() + text.size();
    const auto [end, error] = std::from_chars(text.data(), last, value);
    if (error == std::errc() && end == last) return value;
  }
  throw std::runtime_error("not a date: " + text + " (a decimal year or YYYY-MM-DD)");
}

constexpr std::string_view kDigits = "0123456789";
constexpr std::string_view kBetween = " \t\r,;";

std::vector<std::string> parts_of(const std::string& line) {
  std::vector<std::string> parts;
  for (std::size_t end = 0;;) {
    const std::size_t start = line.find_first_not_of(kBetween, end);
    if (start == std::string::npos) return parts;
    end = std::min(line.find_first_of(kBetween, start), line.size());
    parts.push_back(line.substr(start, end - start));
  }
}

// Digits with one decimal point at most.
bool is_number(std::string_view text) {
  return text.find_first_of(kDigits) != std::string_view::npos &&
         text.find_first_not_of("0123456789.") == std::string_view::npos &&
         text.find('.') == text.rfind('.');
}

std::string_view without_sign(std::string_view text) {
  if (!text.empty() && (text[0] == '-' || text[0] == '+')) text.remove_prefix(1);
  return text;
}

// Degrees, degrees:minutes or degrees:minutes:seconds, without a sign.
bool is_angle(std::string_view text) {
  for (int part = 0; part < 3; ++part) {
    const std::size_t colon = text.find(':');
    if (!is_number(text.substr(0, colon))) return false;
    if (colon == std::string_view::npos) return true;
    text.remove_prefix(colon + 1);
  }
  return false;
}

bool is_hemisphere(char c) {
  return std::string_view("NSEWnsew").find(c) != std::string_view::npos;
}

// The library's hemisphere mode of an angle: 0 for a sign or none, 4 for a letter in front, 5 for
// one behind; nothing where the text is no angle.
std::optional<int16_t> hemisphere_mode(std::string_view text) {
  if (is_angle(without_sign(text))) return int16_t{0};
  if (text.size() < 2) return std::nullopt;
  if (is_hemisphere(text.front()) && is_angle(text.substr(1))) return int16_t{4};
  if (is_hemisphere(text.back()) && is_angle(text.substr(0, text.size() - 1))) return int16_t{5};
  return std::nullopt;
}

// A position of two angles and an optional height, parted by blanks or commas.  The angles are
// decimal degrees or degrees:minutes:seconds, signed or with a hemisphere letter.
std::optional<CoordinateTriple> read_position(const std::string& line, bool lon_first) {
  constexpr std::size_t kLongest = 100;  // the library's reader cuts at 150 characters
  const std::vector<std::string> parts = parts_of(line);
  if (parts.size() < 2 || parts.size() > 3 || line.size() > kLongest) return std::nullopt;
  // That reader takes what it cannot scan for zero, so the form is checked here.
  const auto mode = hemisphere_mode(parts[0]);
  if (!mode || hemisphere_mode(parts[1]) != mode) return std::nullopt;
  if (parts.size() == 3 && !is_number(without_sign(parts[2]))) return std::nullopt;
  AngleUnit unit = {};
  // Decimal degrees are the colon form without minutes.
  std::string_view("d:m:s").copy(unit.format, sizeof unit.format - 1);
  unit.hemisphere_mode = *mode;
  unit.factor = kRadiansPerSecond;
  std::string text = parts[0] + ", " + parts[1];
  if (parts.size() == 3) text += ", " + parts[2];
  CoordinateTriple point = {};
  TWstatus status = TW_SUCCESS;
  TWascii_to_llh(text.c_str(), unit, lon_first ? 0 : 1, 1, &point, &status);
  if (status != TW_SUCCESS) return std::nullopt;
  return point;
}

std::vector<std::string> lines_of(std::istream& in) {
  std::vector<std::string> lines;
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

// A column of the output.
struct Column {
  const char* symbol;
  const char* name;
  const char* unit;
  int decimals;
  double (*value)(const Answer&);
};

constexpr double in_degrees(double radians) { return radians * kDegreesPerRadian; }

const Column kColumns[] = {
    {"lat", "latitude", "deg", 6, [](const Answer& p) { return in_degrees(p.position.y); }},
    {"lon", "longitude", "deg", 6, [](const Answer& p) { return in_degrees(p.position.x); }},
    {"height", "height", "m", 1, [](const Answer& p) { return p.position.z; }},
    {"D", "declination", "deg", 3,
     [](const Answer& p) { return in_degrees(p.elements.declination); }},
    {"I", "inclination", "deg", 3,
     [](const Answer& p) { return in_degrees(p.elements.inclination); }},
    {"H", "horizontal", "nT", 1, [](const Answer& p) { return p.elements.horizontal; }},
    {"F", "total", "nT", 1, [](const Answer& p) { return p.elements.total; }},
    {"X", "north", "nT", 1, [](const Answer& p) { return p.field.x; }},
    {"Y", "east", "nT", 1, [](const Answer& p) { return p.field.y; }},
    {"Z", "down", "nT", 1, [](const Answer& p) { return p.field.z; }},
    {"dD", "declination_rate", "deg/yr", 3,
     [](const Answer& p) { return in_degrees(p.rates.declination); }},
    {"dI", "inclination_rate", "deg/yr", 3,
     [](const Answer& p) { return in_degrees(p.rates.inclination); }},
    {"dH", "horizontal_rate", "nT/yr", 1, [](const Answer& p) { return p.rates.horizontal; }},
    {"dF", "total_rate", "nT/yr", 1, [](const Answer& p) { return p.rates.total; }},
    {"dX", "north_rate", "nT/yr", 1, [](const Answer& p) { return p.field_rates.x; }},
    {"dY", "east_rate", "nT/yr", 1, [](const Answer& p) { return p.field_rates.y; }},
    {"dZ", "down_rate", "nT/yr", 1, [](const Answer& p) { return p.field_rates.z; }},
};

// Written without the locale, so that a comma always parts and a point always marks decimals.
std::string fixed(double value, int decimals) {
  char text[400];
  const auto [end, error] =
      std::to_chars(text, text + sizeof text, value, std::chars_format::fixed, decimals);
  return error == std::errc() ? std::string(text, end) : "?";
}

void print_csv(const std::vector<Answer>& answers) {
  const char* separator = "";
  for (const Column& column : kColumns) {
    std::cout << separator << column.name;
    separator = ",";
  }
  std::cout << '\n';
  for (const Answer& answer : answers) {
    separator = "";
    for (const Column& column : kColumns) {
      std::cout << separator << fixed(column.value(answer), column.decimals);
      separator = ",";
    }
    std::cout << '\n';
  }
}

void print_table(const std::vector<Answer>& answers) {
  std::vector<std::vector<std::string>> rows(answers.size() + 2);
  for (const Column& column : kColumns) {
    rows[0].push_back(column.symbol);
    rows[1].push_back(column.unit);
    for (std::size_t i = 0; i < answers.size(); ++i) {
      rows[i + 2].push_back(fixed(column.value(answers[i]), column.decimals));
    }
  }
  std::vector<std::size_t> widths;
  for (std::size_t j = 0; j < std::size(kColumns); ++j) {
    std::size_t width = 0;
    for (const auto& row : rows) width = std::max(width, row[j].size());
    widths.push_back(width);
  }
  for (const auto& row : rows) {
    for (std::size_t j = 0; j < row.size(); ++j) {
      std::cout << std::string(widths[j] - row[j].size() + (j > 0 ? 2 : 0), ' ') << row[j];
    }
    std::cout << '\n';
  }
}

struct Options {
  std::string model;
  std::string date;
  std::string store;
  std::string file;
  std::vector<std::string> positions;
  bool lon_first = false;
  bool csv = false;
};

// The store that is installed beside the command.
std::string installed_store() {
  std::error_code error;
  const auto command = std::filesystem::read_symlink("/proc/self/exe", error);
  return (command.parent_path() / ".." / "share" / "tidewater" / "tidewater.store")
      .lexically_normal()
      .string();
}

std::vector<std::string> position_lines(const Options& options) {
  if (!options.positions.empty()) {
    // One position may come as two or three arguments, several come as one each.
    const bool single = std::none_of(
        options.positions.begin(), options.positions.end(),
        [](const std::string& p) { return p.find_first_of(" \t,;") != std::string::npos; });
    if (!single) return options.positions;
    std::string line;
    for (const std::string& part : options.positions) line += part + ' ';
    return {line};
  }
  if (options.file.empty() || options.file == "-") return lines_of(std::cin);
  std::ifstream file(options.file);
  if (!file) throw std::runtime_error("cannot open " + options.file);
  return lines_of(file);
}

// True when every line was a position.
bool run(const Options& options) {
#ifndef _WIN32
  // The library's reader takes the user's locale; positions have decimal points in any.
  setenv("LC_ALL", "C", 1);
#endif
  const double date = read_date(options.date);
  const ModelInfo info =
      options.model.empty() ? newest_model(options.store) : ModelInfo(options.store, options.model);
  if (!info.usable()) throw std::runtime_error("the model " + info.name + " has no rates");
  Model model(options.store, info, date);
  if (date < info.first_date || date > info.last_date) {
    std::cerr << "tidewater magnetic: the model " << info.name << " is made for the years "
              << fixed(info.first_date, 1) << " to " << fixed(info.last_date, 1)
              << "; the field of " << fixed(date, 1) << " is extrapolated\n";
  }

  bool all_read = true;
  std::vector<CoordinateTriple> points;
  const std::vector<std::string> lines = position_lines(options);
  for (std::size_t i = 0; i < lines.size(); ++i) {
    const std::size_t start = lines[i].find_first_not_of(" \t\r");
    if (start == std::string::npos || lines[i][start] == '#') continue;
    if (const auto point = read_position(lines[i], options.lon_first)) {
      points.push_back(*point);
    } else {
      std::cerr << "tidewater magnetic: line " << i + 1 << ": not a position: " << lines[i] << '\n';
      all_read = false;
    }
  }
  if (points.size() > static_cast<std::size_t>(std::numeric_limits<int32_t>::max())) {
    throw std::runtime_error("too many positions");
  }
  const std::vector<Answer> answers = model.at(points);
  if (options.csv) {
    print_csv(answers);
  } else if (!answers.empty()) {
    std::cout << info.name << ", " << fixed(date, 3) << '\n';
    print_table(answers);
  }
  return all_read;
}

}  // namespace

void add_magnetic(CLI::App& app, int& exit_status) {
  const auto options = std::make_shared<Options>();
  options->store = installed_store();
  CLI::App* command = app.add_subcommand(
      "magnetic", "Field of a geomagnetic model at geodetic positions, and its yearly change");
  command->add_option("positions", options->positions,
                      "LAT LON [HEIGHT] in degrees, or d:m:s, and metres on WGS 84; one position "
                      "as it is, several in quotes each");
  command->add_option("--file", options->file,
                      "File of positions, one on a line; without one, standard input");
  command->add_option("--model", options->model, "Model of the store (default: the newest)");
  command->add_option("--date", options->date, "Decimal year or YYYY-MM-DD (default: today)");
  command->add_option("--store", options->store, "Parameter store")
      ->envname("TIDEWATER_STORE")
      ->capture_default_str();
  command->add_flag("--lon-first", options->lon_first, "Positions are LON LAT [HEIGHT]");
  command->add_flag("--csv", options->csv, "Comma-separated values with a line of names");
  command->footer(
      "D declination, I inclination, H horizontal and F total intensity; X north, Y east, Z down;\n"
      "dD to dZ their change in a year.  A line that is no position is reported, and the exit\n"
      "status is 1.");
  command->callback([options, &exit_status] {
    try {
      if (!run(*options)) exit_status = 1;
    } catch (const std::exception& error) {
      std::cerr << "tidewater magnetic: " << error.what() << '\n';
      exit_status = 1;
    }
  });
}

}  // namespace tidewater::tools
