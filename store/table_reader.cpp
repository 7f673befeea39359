// Reads a store file's tables through SQLite.

#include <algorithm>
#include <array>
#include <cmath>
#include <cstring>
#include <limits>
#include <utility>

#include "database.hpp"
#include "harmonic_degrees.hpp"
#include "store_file.hpp"
#include "table_store.hpp"
#include "tidewater/store.h"

namespace tabdll {

namespace {

using Layouts = std::map<std::string, Layout, std::less<>>;

// The longest text that is read from a file, a table's definition included: one of as many columns
// as a row has bytes fits with names of a hundred letters each.
constexpr int kLongestText = 60'000;

// The same for the cells of a table: no field takes a longer one, in whatever encoding it stands.
constexpr int kLongestCell = 4 * TW_STORE_ROW_LIMIT;

// Packed rows in memory.  A sound file of the longest allowed length stays far below; one with
// layouts much longer than its cells need not.
constexpr std::size_t kMostPackedBytes = std::size_t{512} << 20;

// Steps of SQLite's machine that reading a file may take, a thousand to the tick.  Ours takes one
// for five of its bytes, and a wide table of the shortest cells four for each; a file whose pages
// are shared or lie in a circle would go on for ever.  Steps through the schema are the dearest, as
// each row may hold a definition of the longest length, and there are few.
constexpr int kStepsPerTick = 1000;
constexpr std::int64_t kSchemaTicks = 1000;
std::int64_t ticks_for(std::size_t file_size) {
  return 200 + static_cast<std::int64_t>(file_size) * 10 / kStepsPerTick;
}

template <class Number>
void put(char* at, Number value) {
  std::memcpy(at, &value, sizeof value);
}

template <class Number>
void put_integer(const Statement& s, int column, char* at) {
  const std::int64_t value = s.integer(column);
  if (s.type(column) != SQLITE_INTEGER || value < std::numeric_limits<Number>::min() ||
      value > std::numeric_limits<Number>::max()) {
    throw StoreError("a cell is no integer of the field's range");
  }
  put(at, static_cast<Number>(value));
}

// The cell of a row at its place in a field of zeros.
void put_field(const Statement& s, int column, const Field& field, char* at) {
  switch (field.type) {
    case FieldType::kText: {
      if (s.type(column) != SQLITE_TEXT) throw StoreError("a cell is no text");
      const std::string_view text = s.text(column);
      if (text.size() >= static_cast<std::size_t>(field.size) ||
          text.find('\0') != std::string_view::npos) {
        throw StoreError("a text does not fit its field");
      }
      std::memcpy(at, text.data(), text.size());
      return;
    }
    case FieldType::kInt16:
      return put_integer<std::int16_t>(s, column, at);
    case FieldType::kInt32:
      return put_integer<std::int32_t>(s, column, at);
    case FieldType::kFloat64: {
      const int type = s.type(column);
      const double value = s.real(column);
      if ((type != SQLITE_FLOAT && type != SQLITE_INTEGER) || !std::isfinite(value)) {
        throw StoreError("a cell is no finite number");
      }
      return put(at, value);
    }
    case FieldType::kPad:
      return;
  }
}

// Whether a definition is CREATE TABLE NAME (COLUMNS) and no more: no constraint, default or
// generated column with an expression, nothing behind the columns.  Comments are not plain either,
// as a quote in one would hide what follows it.
bool is_plain(std::string_view sql) {
  constexpr std::string_view kBegin = "CREATE TABLE";
  if (sqlite3_strnicmp(std::string(sql).c_str(), kBegin.data(), static_cast<int>(kBegin.size())) !=
      0) {
    return false;
  }
  int parentheses = 0;  // two at the end: one opened, one closed
  bool quoted = false;
  for (const char c : sql.substr(kBegin.size())) {
    if (c == '"') {
      quoted = !quoted;  // a doubled quote closes and opens again
    } else if (!quoted) {
      const auto byte = static_cast<unsigned char>(c);
      const bool word = (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') ||
                        (c >= 'a' && c <= 'z') || c == '_' || byte >= 0x80;
      const bool space = c == ' ' || c == '\t' || c == '\n' || c == '\r';
      if (parentheses == 2 && !space) return false;
      if ((c == '(' && parentheses == 0) || (c == ')' && parentheses == 1)) {
        ++parentheses;
      } else if (!word && !space && c != ',') {
        return false;
      }
    }
  }
  return parentheses == 2 && !quoted;
}

// What is wrong with one table, told with its name.
[[noreturn]] void refuse(std::string_view table, const std::string& what) {
  std::string words = "table \"";
  words.append(table).append("\": ").append(what);
  throw StoreError(words);
}

// Reads a file's tables once, and checks what SQLite itself does not need to know.
class Loader {
 public:
  explicit Loader(std::vector<unsigned char>& file)
      : database_(open_in_memory()), size_(file.size()) {
    harden();
    const auto size = static_cast<sqlite3_int64>(file.size());
    if (sqlite3_deserialize(database_.get(), "main", file.data(), size, size,
                            SQLITE_DESERIALIZE_READONLY) != SQLITE_OK) {
      throw StoreError(sqlite3_errmsg(database_.get()));
    }
  }

  Tables load() {
    try {
      return load_tables();
    } catch (const StoreError&) {
      if (ticks_ < 0) {
        throw StoreError("reading it does not end: its pages are shared or lie in a circle");
      }
      throw;
    }
  }

 private:
  // Nothing of the file is executed, and nothing of it grows beyond its bytes.
  void harden() {
    sqlite3* const d = database_.get();
    for (const auto& [option, value] : {std::pair(SQLITE_DBCONFIG_DEFENSIVE, 1),
                                        {SQLITE_DBCONFIG_TRUSTED_SCHEMA, 0},
                                        {SQLITE_DBCONFIG_ENABLE_TRIGGER, 0},
                                        {SQLITE_DBCONFIG_ENABLE_VIEW, 0},
                                        {SQLITE_DBCONFIG_ENABLE_LOAD_EXTENSION, 0},
                                        {SQLITE_DBCONFIG_DQS_DML, 0},
                                        {SQLITE_DBCONFIG_DQS_DDL, 0}}) {
      if (sqlite3_db_config(d, option, value, nullptr) != SQLITE_OK) {
        throw StoreError("SQLite cannot be made safe");
      }
    }
    for (const auto& [limit, value] : {std::pair(SQLITE_LIMIT_LENGTH, kLongestText),
                                       {SQLITE_LIMIT_SQL_LENGTH, kLongestText},
                                       {SQLITE_LIMIT_COLUMN, TW_STORE_ROW_LIMIT},
                                       {SQLITE_LIMIT_EXPR_DEPTH, 10},
                                       {SQLITE_LIMIT_COMPOUND_SELECT, 2},
                                       {SQLITE_LIMIT_VDBE_OP, 100'000},
                                       {SQLITE_LIMIT_FUNCTION_ARG, 8},
                                       {SQLITE_LIMIT_ATTACHED, 0},
                                       {SQLITE_LIMIT_LIKE_PATTERN_LENGTH, 50},
                                       {SQLITE_LIMIT_VARIABLE_NUMBER, 1},
                                       {SQLITE_LIMIT_TRIGGER_DEPTH, 1},
                                       {SQLITE_LIMIT_WORKER_THREADS, 0}}) {
      sqlite3_limit(d, limit, value);
    }
    sqlite3_progress_handler(
        d, kStepsPerTick,
        [](void* ticks) { return --*static_cast<std::int64_t*>(ticks) < 0 ? 1 : 0; }, &ticks_);
  }

  Tables load_tables() {
    ticks_ = std::min(ticks_for(size_), kSchemaTicks);
    const std::vector<std::string> names = read_names();
    ticks_ = ticks_for(size_);
    sqlite3_limit(database_.get(), SQLITE_LIMIT_LENGTH, kLongestCell);
    Layouts layouts = read_layouts();
    Tables tables;
    for (const std::string& name : names) {
      if (name == kLayoutTable) continue;
      const auto layout = layouts.find(name);
      if (layout == layouts.end()) refuse(name, "no layout");
      tables.emplace(name, read_table(name, layout->second));
      layouts.erase(layout);
    }
    if (!layouts.empty()) refuse(layouts.begin()->first, "a layout and no table");
    // Behind the reading, which follows no chain of pages deeper than a sound tree has; the check
    // itself would.
    check_integrity();
    return tables;
  }

  std::vector<std::string> read_names() {
    std::vector<std::string> names;
    Statement schema(database_.get(), "SELECT type, name, rootpage, sql FROM sqlite_master");
    while (schema.step()) {
      const std::string name(schema.text(1));
      // Virtual tables have no root page.
      if (schema.text(0) != "table" || schema.integer(2) < 1 || !is_plain(schema.text(3))) {
        throw StoreError("\"" + name + "\" is no plain table");
      }
      names.push_back(name);
    }
    if (std::find(names.begin(), names.end(), kLayoutTable) == names.end()) {
      throw StoreError("the file has no table of layouts");
    }
    return names;
  }

  Layouts read_layouts() {
    Layouts layouts;
    // Without an order of its own a plain table comes in that of insertion.
    Statement rows(database_.get(),
                   "SELECT \"table\", \"column\", \"type\", \"offset\", \"size\" FROM " +
                       identifier(kLayoutTable));
    while (rows.step()) {
      const std::string table(rows.text(0));
      const auto type = field_type(rows.text(2));
      if (!type || rows.type(3) != SQLITE_INTEGER || rows.type(4) != SQLITE_INTEGER) {
        refuse(table, "a field of the layout has no known type or place");
      }
      Layout& layout = layouts[table];
      if (layout.fields.size() == TW_STORE_ROW_LIMIT) refuse(table, "more fields than bytes");
      layout.fields.push_back({std::string(rows.text(1)), *type, rows.integer(3), rows.integer(4)});
    }
    for (const auto& [table, layout] : layouts) {
      const std::string fault = fault_of(layout);
      if (!fault.empty()) refuse(table, "layout: " + fault);
    }
    return layouts;
  }

  Table read_table(const std::string& name, const Layout& layout) {
    Statement s(database_.get(), "SELECT * FROM " + identifier(name));
    const std::vector<std::pair<const Field*, int>> places = match(name, layout, s);
    const std::size_t size = layout.row_size();
    std::vector<char> rows;
    for (std::size_t number = 1; s.step(); ++number) {
      packed_ += size;
      if (packed_ > kMostPackedBytes) refuse(name, "more rows than a store may have");
      rows.resize(rows.size() + size);
      char* row = rows.data() + rows.size() - size;
      try {
        for (const auto& [field, column] : places)
          put_field(s, column, *field, row + field->offset);
      } catch (const StoreError& e) {
        refuse(name, "row " + std::to_string(number) + ": " + e.what());
      }
    }
    rows.shrink_to_fit();
    return {layout, std::move(rows)};
  }

  // The column of every field; a table has these columns and no others.
  static std::vector<std::pair<const Field*, int>> match(const std::string& name,
                                                         const Layout& layout, const Statement& s) {
    std::map<std::string_view, int> columns;
    for (int i = 0; i < s.columns(); ++i) columns.emplace(s.name(i), i);
    std::vector<std::pair<const Field*, int>> places;
    for (const Field& f : layout.fields) {
      if (f.type == FieldType::kPad) continue;
      const auto column = columns.find(f.column);
      if (column == columns.end()) refuse(name, "no column \"" + f.column + "\"");
      places.emplace_back(&f, column->second);
    }
    if (places.size() != static_cast<std::size_t>(s.columns())) {
      refuse(name, "columns that the layout does not have");
    }
    return places;
  }

  void check_integrity() {
    Statement check(database_.get(), "PRAGMA integrity_check(1)");
    if (!check.step()) throw StoreError("its integrity cannot be checked");
    const std::string words(check.text(0));
    if (words != "ok") throw StoreError("damaged: " + words);
  }

  Database database_;
  std::size_t size_;        // of the file
  std::int64_t ticks_ = 0;  // left; below 0 once the reading was broken off
  std::size_t packed_ = 0;
};

}  // namespace

TableStore::TableStore(const char* path) : TableStore(read_file(path).bytes) {}

TableStore::TableStore(std::vector<unsigned char> file) : TableStore(Loader(file).load()) {
  const std::string fault = fault_of_harmonic_degrees(*this);
  if (!fault.empty()) throw StoreError(fault);
}

}  // namespace tabdll
