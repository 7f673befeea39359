// A store file: named tables with typed columns in an SQLite file, and the layouts by which their
// rows are packed.  Opened for reading only.
#pragma once

#include <sqlite3.h>

#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>

#include "layout.hpp"

namespace tabdll {

// The table of layouts in every store file.
inline constexpr std::string_view kLayoutTable = "tidewater_layout";

// A file that is no store, a table or a column that is not there, a cell that does not pack.
class StoreError : public std::runtime_error {
  using std::runtime_error::runtime_error;
};

// A name as it stands in a statement, whatever characters it has.
std::string identifier(std::string_view name);

struct CloseDatabase {
  void operator()(sqlite3* database) const { sqlite3_close_v2(database); }
};
using Database = std::unique_ptr<sqlite3, CloseDatabase>;

// A prepared statement.  Columns count from 0, parameters from 1.
class Statement {
 public:
  Statement(sqlite3* database, const std::string& sql);

  bool step();  // true while there is a row
  void reset();

  void bind(int parameter, std::string_view text);  // the text stays the caller's
  void bind(int parameter, int64_t number);
  void bind(int parameter, double number);

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

// One pass over the rows of a table.
class Walk {
 public:
  Walk(Statement statement, const Layout& layout)
      : statement_(std::move(statement)), layout_(&layout) {}

  // Packs the next row into a buffer of layout.row_size() bytes; false at the end.  A row that does
  // not pack throws, leaves the buffer alone, and is passed over by the next call.  When the file
  // itself cannot be read, the call throws and the walk is at its end.
  bool next(void* row);

 private:
  Statement statement_;
  const Layout* layout_;
  bool ended_ = false;
};

class TableStore {
 public:
  explicit TableStore(const char* path);

  // The tables that have a layout.
  const std::map<std::string, Layout, std::less<>>& tables() const { return tables_; }
  const Layout& layout(std::string_view table) const;

  int64_t count_rows(std::string_view table) const;
  // In the order of a column (byte order for text), of insertion for a null column.
  Walk walk(std::string_view table, const char* column) const;
  // The first row whose column equals the key (see OLB7R3_PF_get_row_by_value); false where there
  // is none.
  bool find(std::string_view table, std::string_view column, const void* key, void* row) const;

 private:
  void read_layouts();

  Database database_;
  std::map<std::string, Layout, std::less<>> tables_;
};

}  // namespace tabdll
