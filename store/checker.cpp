#include "checker.hpp"

#include <algorithm>
#include <cstring>

#include "harmonic_degrees.hpp"

namespace tabdll {

namespace {

// A field that the library reads.  Fields without a column are read by their place alone and may
// have any name.
struct Expected {
  const char* column;
  FieldType type;
  int64_t offset;
  int64_t size;
  const char* names = nullptr;  // the kind of table that the text names
};

struct ExpectedTable {
  const char* name;
  std::size_t row_size;  // 0: any that holds the fields
  std::vector<Expected> fields;
  std::size_t name_only_flag = 0;  // where not 0, a 16-bit zero there makes a row a name alone
  // What is wrong with the values of a row, or of all rows together; empty where all is well.
  std::string (*fault_of_row)(const TableStore& store, const char* row) = nullptr;
  std::string (*fault_of_table)(const Table& table) = nullptr;
};

template <class Number>
Number number_at(const char* at) {
  Number value;
  std::memcpy(&value, at, sizeof value);
  return value;
}

// Powers of a regression term are places in tables of ten powers.
std::string fault_of_term(const TableStore&, const char* row) {
  for (const int offset : {8, 10}) {
    const auto power = number_at<int16_t>(row + offset);
    if (power < 0 || power > 9) return "a power of " + std::to_string(power) + ", none of 0 to 9";
  }
  return {};
}

// The limits that TWmagmdl_info() holds a model to, and the epochs that TWhar_set_date() needs.
std::string fault_of_model(const TableStore& store, const char* row) {
  const auto lower = number_at<double>(row + 112);
  const auto upper = number_at<double>(row + 120);
  if (!(number_at<double>(row + 72) > 0)) return "a radius that is not above 0";
  const auto normalisation = number_at<int16_t>(row + 80);
  if (normalisation < 0 || normalisation > 3) return "a normalisation that is none of 0 to 3";
  if (!(lower >= 0 && lower <= upper && upper > 0))
    return "bounds that do not rise from 0 or above";
  if (!(number_at<double>(row + 128) >= 0)) return "an interval below 0";
  const auto epochs = store.tables().find(std::string_view(row + 44));
  if (epochs != store.tables().end() && epochs->second.size() < 2) return "fewer than two epochs";
  return {};
}

// The synthesis writes the rows of degrees 1 and 2 whatever the degree.
std::string fault_of_epoch(const TableStore& store, const char* row) {
  const auto degree = number_at<int16_t>(row + 8);
  if (degree < 2) return "a degree of " + std::to_string(degree) + ", 2 at least are needed";
  const auto coefficients = store.tables().find(std::string_view(row + 10));
  const std::size_t needed = rows_of_degree(static_cast<std::size_t>(degree));
  if (coefficients == store.tables().end() || coefficients->second.size() == needed) return {};
  return "degree " + std::to_string(degree) + " has " + std::to_string(needed) +
         " coefficients, table \"" + coefficients->first + "\" " +
         std::to_string(coefficients->second.size());
}

std::string fault_of_dates(const Table& epochs) {
  Walk walk(epochs, "Epoch date");
  const char* last = walk.next();
  while (const char* row = walk.next()) {
    if (number_at<double>(row) == number_at<double>(last)) return "two epochs of one date";
    last = row;
  }
  return {};
}

constexpr FieldType kText = FieldType::kText;
constexpr FieldType kInt16 = FieldType::kInt16;
constexpr FieldType kInt32 = FieldType::kInt32;
constexpr FieldType kFloat64 = FieldType::kFloat64;

const std::vector<ExpectedTable>& library_tables() {
  static const std::vector<ExpectedTable> tables = {
      {"system",
       68,
       {{"cs_class", kText, 0, 16},
        {"cs_name", kText, 16, 41},
        {"cs_num", kInt16, 58, 2},
        {nullptr, kInt16, 60, 2},
        {nullptr, kInt32, 64, 4}}},
      {"dt_models",
       68,
       {{"dt_class", kText, 0, 16},
        {"dt_name", kText, 16, 41},
        {"dt_num", kInt16, 58, 2},
        {nullptr, kInt16, 60, 2},
        {nullptr, kInt32, 64, 4}}},
      {"vert_datum", 48, {{"vert_datum_num", kInt32, 0, 4}, {"vert_datum_name", kText, 4, 44}}},
      {"undul",
       76,
       {{"undul_class", kText, 0, 16},
        {"undul_name", kText, 16, 41},
        {nullptr, kText, 57, 17},
        {"number", kInt16, 74, 2}}},
      {"spcs27_tbl", 44, {{"zone_number", kInt16, 0, 2}, {"zone_name", kText, 2, 42}}},
      {"spcs83_tbl", 44, {{"zone_number", kInt16, 0, 2}, {"zone_name", kText, 2, 42}}},
      {"Satellites",
       120,
       {{"sat_name", kText, 0, 32},
        {nullptr, kFloat64, 32, 8},
        {nullptr, kFloat64, 40, 8},
        {nullptr, kFloat64, 48, 8},
        {nullptr, kFloat64, 56, 8},
        {nullptr, kFloat64, 64, 8},
        {nullptr, kFloat64, 72, 8},
        {nullptr, kFloat64, 80, 8},
        {nullptr, kFloat64, 88, 8},
        {nullptr, kInt32, 96, 4},
        {nullptr, kInt16, 100, 2},
        {nullptr, kInt16, 102, 2},
        {nullptr, kInt16, 104, 2},
        {"id", kInt16, 106, 2}}},
      {"mre models",
       144,
       {{"model name", kText, 0, 44},
        {"num", kInt32, 44, 4},
        {nullptr, kText, 74, 21, "regression terms"},
        {nullptr, kText, 95, 21, "regression terms"},
        {nullptr, kText, 116, 21, "regression terms"}}},
      {"Complex Models",
       112,
       {{"Model Name", kText, 0, 44},
        {"Number", kInt32, 44, 4},
        {nullptr, kText, 88, 24, "coefficients"}}},
      {"magnetic models",
       136,
       {{"model name", kText, 0, 42},
        {"model number", kInt16, 42, 2},
        {nullptr, kText, 44, 28, "epochs"},
        {nullptr, kFloat64, 72, 8},
        {nullptr, kInt16, 80, 2},
        {nullptr, kText, 82, 30},
        {nullptr, kFloat64, 112, 8},
        {nullptr, kFloat64, 120, 8},
        {nullptr, kFloat64, 128, 8}},
       42,
       fault_of_model}};
  return tables;
}

// The kinds of tables that rows name.
const std::vector<ExpectedTable>& named_tables() {
  static const std::vector<ExpectedTable> tables = {
      {"regression terms",
       16,
       {{nullptr, kFloat64, 0, 8}, {nullptr, kInt16, 8, 2}, {nullptr, kInt16, 10, 2}},
       0,
       fault_of_term},
      {"coefficients", 24, {{nullptr, kFloat64, 8, 8}, {nullptr, kFloat64, 16, 8}}},
      {"epochs",
       0,
       {{"Epoch date", kFloat64, 0, 8},
        {nullptr, kInt16, 8, 2},
        {nullptr, kText, 10, 33, "coefficients"}},
       0,
       fault_of_epoch,
       fault_of_dates}};
  return tables;
}

class Checker {
 public:
  explicit Checker(const TableStore& store) : store_(store) {}

  std::vector<std::string> run() {
    for (const ExpectedTable& table : library_tables()) check(table.name, table);
    return std::move(faults_);
  }

 private:
  void fault(const std::string& table, const std::string& what) {
    faults_.push_back("table \"" + table + "\": " + what);
  }

  void check(const std::string& name, const ExpectedTable& expected) {
    if (std::find(checked_.begin(), checked_.end(), name) != checked_.end()) return;
    checked_.push_back(name);
    const auto found = store_.tables().find(name);
    if (found == store_.tables().end()) return fault(name, "missing");
    const Layout& layout = found->second.layout();
    if (expected.row_size != 0 && layout.row_size() != expected.row_size) {
      fault(name, "rows of " + std::to_string(layout.row_size()) + " bytes, expected " +
                      std::to_string(expected.row_size));
    }
    bool fits = true;
    for (const Expected& e : expected.fields) fits = check_field(name, layout, e) && fits;
    if (fits) check_rows(name, found->second, expected);
  }

  bool check_field(const std::string& name, const Layout& layout, const Expected& e) {
    const auto field = std::find_if(layout.fields.begin(), layout.fields.end(),
                                    [&](const Field& f) { return f.offset == e.offset; });
    const bool there = field != layout.fields.end() && field->type == e.type &&
                       field->size == e.size && (!e.column || field->column == e.column);
    if (!there) {
      fault(name,
            "no " + std::string(type_name(e.type)) + " of " + std::to_string(e.size) +
                " bytes at byte " + std::to_string(e.offset) +
                (e.column ? " with the column \"" + std::string(e.column) + "\"" : std::string()));
    }
    return there;
  }

  void check_rows(const std::string& name, const Table& table, const ExpectedTable& expected) {
    for (std::size_t i = 0; i < table.size(); ++i) {
      const char* row = table.row(i);
      if (is_name_only(expected, row)) continue;
      const auto row_fault = [&](const std::string& what) {
        fault(name, "row " + std::to_string(i + 1) + ": " + what);
      };
      for (const Expected& e : expected.fields) {
        if (e.names) check_named(row + e.offset, e.names, row_fault);
      }
      if (expected.fault_of_row) {
        const std::string words = expected.fault_of_row(store_, row);
        if (!words.empty()) row_fault(words);
      }
    }
    if (expected.fault_of_table) {
      const std::string words = expected.fault_of_table(table);
      if (!words.empty()) fault(name, words);
    }
  }

  static bool is_name_only(const ExpectedTable& expected, const char* row) {
    return expected.name_only_flag != 0 && number_at<int16_t>(row + expected.name_only_flag) == 0;
  }

  template <class RowFault>
  void check_named(const std::string& named, std::string_view kind, RowFault row_fault) {
    if (!store_.tables().contains(named)) return row_fault("no table \"" + named + "\"");
    const auto expected = std::find_if(named_tables().begin(), named_tables().end(),
                                       [kind](const ExpectedTable& t) { return t.name == kind; });
    check(named, *expected);
  }

  const TableStore& store_;
  std::vector<std::string> checked_;
  std::vector<std::string> faults_;
};

}  // namespace

std::vector<std::string> faults_of(const TableStore& store) { return Checker(store).run(); }

}  // namespace tabdll
