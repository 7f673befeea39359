#include "table_store.hpp"

#include <array>
#include <cstring>
#include <limits>
#include <set>

#include "tidewater/store.h"

namespace tabdll {

namespace {

std::string message(sqlite3* database, const char* otherwise) {
  return database ? sqlite3_errmsg(database) : otherwise;
}

template <class Number>
void put(char* at, Number value) {
  std::memcpy(at, &value, sizeof value);
}

template <class Number>
void put_integer(const Statement& s, int column, char* at) {
  const int64_t value = s.integer(column);
  if (s.type(column) != SQLITE_INTEGER || value < std::numeric_limits<Number>::min() ||
      value > std::numeric_limits<Number>::max()) {
    throw StoreError("a cell is no integer of the field's range");
  }
  put(at, static_cast<Number>(value));
}

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
      return put_integer<int16_t>(s, column, at);
    case FieldType::kInt32:
      return put_integer<int32_t>(s, column, at);
    case FieldType::kFloat64:
      if (s.type(column) != SQLITE_FLOAT && s.type(column) != SQLITE_INTEGER) {
        throw StoreError("a cell is no number");
      }
      return put(at, s.real(column));
    case FieldType::kPad:
      return;
  }
}

// Packs the statement's row; the buffer is written only when every cell fits.
void pack(const Statement& s, const Layout& layout, void* row) {
  std::array<char, TW_STORE_ROW_LIMIT> packed = {};
  int column = 0;
  for (const Field& f : layout.fields) {
    if (f.type == FieldType::kPad) continue;
    put_field(s, column++, f, packed.data() + f.offset);
  }
  std::memcpy(row, packed.data(), layout.row_size());
}

// The columns of a layout in its order, as pack() expects them.
std::string select_from(std::string_view table, const Layout& layout) {
  std::string columns;
  for (const Field& f : layout.fields) {
    if (f.type == FieldType::kPad) continue;
    columns += (columns.empty() ? "" : ", ") + identifier(f.column);
  }
  return "SELECT " + columns + " FROM " + identifier(table);
}

template <class Number>
Number number_at(const void* key) {
  Number value;
  std::memcpy(&value, key, sizeof value);
  return value;
}

void bind_key(Statement& s, FieldType type, const void* key) {
  switch (type) {
    case FieldType::kText:
      return s.bind(1, static_cast<const char*>(key));
    case FieldType::kInt16:
      return s.bind(1, int64_t{number_at<int16_t>(key)});
    case FieldType::kInt32:
      return s.bind(1, int64_t{number_at<int32_t>(key)});
    case FieldType::kFloat64:
      return s.bind(1, number_at<double>(key));
    case FieldType::kPad:
      return;  // no key: a pad has no column
  }
}

const Field& field_of(const Layout& layout, std::string_view table, std::string_view column) {
  const Field* field = layout.find(column);
  if (!field) {
    throw StoreError("table \"" + std::string(table) + "\" has no column \"" + std::string(column) +
                     "\"");
  }
  return *field;
}

}  // namespace

std::string identifier(std::string_view name) {
  std::string out = "\"";
  for (const char c : name) {
    if (c == '"') out += '"';
    out += c;
  }
  return out + '"';
}

Statement::Statement(sqlite3* database, const std::string& sql) : database_(database) {
  sqlite3_stmt* statement = nullptr;
  const int code = sqlite3_prepare_v2(database, sql.c_str(), -1, &statement, nullptr);
  statement_.reset(statement);
  require(code);
}

void Statement::require(int code) const {
  if (code != SQLITE_OK) throw StoreError(message(database_, "out of memory"));
}

bool Statement::step() {
  const int code = sqlite3_step(statement_.get());
  if (code == SQLITE_ROW) return true;
  if (code != SQLITE_DONE) throw StoreError(message(database_, "out of memory"));
  return false;
}

void Statement::reset() { require(sqlite3_reset(statement_.get())); }

void Statement::bind(int parameter, std::string_view text) {
  require(sqlite3_bind_text64(statement_.get(), parameter, text.data(), text.size(), SQLITE_STATIC,
                              SQLITE_UTF8));
}

void Statement::bind(int parameter, int64_t number) {
  require(sqlite3_bind_int64(statement_.get(), parameter, number));
}

void Statement::bind(int parameter, double number) {
  require(sqlite3_bind_double(statement_.get(), parameter, number));
}

std::string_view Statement::text(int column) const {
  const auto* bytes = reinterpret_cast<const char*>(sqlite3_column_text(statement_.get(), column));
  if (!bytes) return {};
  return {bytes, static_cast<std::size_t>(sqlite3_column_bytes(statement_.get(), column))};
}

bool Walk::next(void* row) {
  if (ended_) return false;
  ended_ = true;  // also when the step throws: a broken file must not be walked for ever
  if (!statement_.step()) return false;
  ended_ = false;
  pack(statement_, *layout_, row);
  return true;
}

TableStore::TableStore(const char* path) {
  sqlite3* opened = nullptr;
  const int code =
      sqlite3_open_v2(path, &opened, SQLITE_OPEN_READONLY | SQLITE_OPEN_NOMUTEX, nullptr);
  database_.reset(opened);
  if (code != SQLITE_OK) throw StoreError(message(opened, "out of memory"));
  // The file may come from anywhere: nothing of it is executed, and a column that is not there is
  // not read as a text.
  sqlite3_db_config(opened, SQLITE_DBCONFIG_DEFENSIVE, 1, nullptr);
  sqlite3_db_config(opened, SQLITE_DBCONFIG_TRUSTED_SCHEMA, 0, nullptr);
  sqlite3_db_config(opened, SQLITE_DBCONFIG_DQS_DML, 0, nullptr);
  read_layouts();
}

void TableStore::read_layouts() {
  // Views and virtual tables have no root page; a walk of one need not end.
  std::set<std::string, std::less<>> ordinary;
  Statement schema(database_.get(),
                   "SELECT name FROM sqlite_master WHERE type = 'table' AND rootpage > 0");
  while (schema.step()) ordinary.emplace(schema.text(0));
  if (!ordinary.contains(kLayoutTable)) throw StoreError("the file has no table of layouts");

  Statement rows(database_.get(),
                 "SELECT \"table\", \"column\", \"type\", \"offset\", \"size\" FROM " +
                     identifier(kLayoutTable) + " ORDER BY rowid");
  while (rows.step()) {
    const std::string table(rows.text(0));
    const auto type = field_type(rows.text(2));
    if (!type || rows.type(3) != SQLITE_INTEGER || rows.type(4) != SQLITE_INTEGER) {
      throw StoreError("table \"" + table + "\": a field of the layout has no known type or place");
    }
    tables_[table].fields.push_back(
        {std::string(rows.text(1)), *type, rows.integer(3), rows.integer(4)});
  }
  for (const auto& [table, layout] : tables_) {
    const std::string fault = fault_of(layout);
    if (fault.empty()) continue;
    std::string words = "layout of table \"";
    words.append(table).append("\": ").append(fault);
    throw StoreError(words);
  }
  std::erase_if(tables_, [&](const auto& entry) { return !ordinary.contains(entry.first); });
}

const Layout& TableStore::layout(std::string_view table) const {
  const auto found = tables_.find(table);
  if (found == tables_.end()) throw StoreError("no table \"" + std::string(table) + "\"");
  return found->second;
}

int64_t TableStore::count_rows(std::string_view table) const {
  layout(table);
  Statement s(database_.get(), "SELECT count(*) FROM " + identifier(table));
  s.step();
  return s.integer(0);
}

Walk TableStore::walk(std::string_view table, const char* column) const {
  const Layout& l = layout(table);
  std::string sql = select_from(table, l) + " ORDER BY ";
  if (column) sql += identifier(field_of(l, table, column).column) + " COLLATE BINARY, ";
  return {Statement(database_.get(), sql + "rowid"), l};
}

bool TableStore::find(std::string_view table, std::string_view column, const void* key,
                      void* row) const {
  const Layout& l = layout(table);
  const Field& field = field_of(l, table, column);
  Statement s(database_.get(), select_from(table, l) + " WHERE " + identifier(column) +
                                   " = ?1 COLLATE BINARY ORDER BY rowid LIMIT 1");
  bind_key(s, field.type, key);
  if (!s.step()) return false;
  pack(s, l, row);
  return true;
}

}  // namespace tabdll
