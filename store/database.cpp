#include "database.hpp"

#include <new>

namespace tabdll {

std::string identifier(std::string_view name) {
  std::string out = "\"";
  for (const char c : name) {
    if (c == '"') out += '"';
    out += c;
  }
  return out + '"';
}

Database open_in_memory() {
  sqlite3* opened = nullptr;
  const int code =
      sqlite3_open_v2(":memory:", &opened,
                      SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_NOMUTEX, nullptr);
  Database database(opened);
  if (code != SQLITE_OK) throw std::bad_alloc();
  return database;
}

Statement::Statement(sqlite3* database, const std::string& sql) : database_(database) {
  sqlite3_stmt* statement = nullptr;
  const int code = sqlite3_prepare_v2(database, sql.c_str(), -1, &statement, nullptr);
  statement_.reset(statement);
  require(code);
}

void Statement::require(int code) const {
  if (code != SQLITE_OK) throw StoreError(sqlite3_errmsg(database_));
}

bool Statement::step() {
  const int code = sqlite3_step(statement_.get());
  if (code == SQLITE_ROW) return true;
  if (code != SQLITE_DONE) throw StoreError(sqlite3_errmsg(database_));
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

std::string_view Statement::name(int column) const {
  const char* name = sqlite3_column_name(statement_.get(), column);
  if (!name) throw std::bad_alloc();
  return name;
}

std::string_view Statement::text(int column) const {
  const auto* bytes = reinterpret_cast<const char*>(sqlite3_column_text(statement_.get(), column));
  if (!bytes) return {};
  return {bytes, static_cast<std::size_t>(sqlite3_column_bytes(statement_.get(), column))};
}

void run(sqlite3* database, const std::string& sql) { Statement(database, sql).step(); }

}  // namespace tabdll
