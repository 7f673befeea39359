// SQLite as the builder and the reader of store files use it.
#pragma once

#include <sqlite3.h>

#include <memory>
#include <string>
#include <string_view>

#include "store_error.hpp"

namespace tabdll {

// A name as it stands in a statement, whatever characters it has.
std::string identifier(std::string_view name);

struct CloseDatabase {
  void operator()(sqlite3* database) const { sqlite3_close_v2(database); }
};
using Database = std::unique_ptr<sqlite3, CloseDatabase>;

// An empty database in memory.  No path is ever given to SQLite: it looks for journals beside a
// file, and rolls back or deletes what it finds there.
Database open_in_memory();

// A prepared statement.  Columns count from 0, parameters from 1.
class Statement {
 public:
  Statement(sqlite3* database, const std::string& sql);

  bool step();  // true while there is a row
  void reset();

  void bind(int parameter, std::string_view text);  // the text stays the caller's
  void bind(int parameter, int64_t number);
  void bind(int parameter, double number);

  int columns() const { return sqlite3_column_count(statement_.get()); }
  std::string_view name(int column) const;
  int type(int column) const { return sqlite3_column_type(statement_.get(), column); }
  int64_t integer(int column) const { return sqlite3_column_int64(statement_.get(), column); }
  double real(int column) const { return sqlite3_column_double(statement_.get(), column); }
  std::string_view text(int column) const;

 private:
  struct Finalize {
    void operator()(sqlite3_stmt* statement) const { sqlite3_finalize(statement); }
  };
  void require(int code) const;

  sqlite3* database_;
  std::unique_ptr<sqlite3_stmt, Finalize> statement_;
};

// Runs a statement that gives no rows.
void run(sqlite3* database, const std::string& sql);

}  // namespace tabdll
