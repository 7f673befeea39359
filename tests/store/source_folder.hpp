// A store made for one test from a few lines of text, and the buffers that it is read into.
#pragma once

#include <sqlite3.h>

#include <cstring>
#include <string>
#include <vector>

#include "builder.hpp"
#include "support/data.hpp"
#include "tidewater/store.h"

namespace tidewater::test {

inline constexpr TWstoreword kFailed = 0x09608012;
inline constexpr TWstoreword kNoRow = 0x09608022;

// A folder of sources with one table "t" and what a test adds.
class SourceFolder {
 public:
  SourceFolder() {
    folder_.write("layouts.csv", layouts_);
    folder_.write("tables.csv", tables_);
  }

  // A table with a layout of its own: lines of column,type,offset,size.
  void add(const std::string& table, const std::vector<std::string>& fields,
           const std::string& rows) {
    const std::string file = "rows" + std::to_string(++files_) + ".csv";
    for (const std::string& field : fields) layouts_ += file + "," + field + "\n";
    tables_ += table + "," + file + "," + file + "\n";
    folder_.write("layouts.csv", layouts_);
    folder_.write("tables.csv", tables_);
    folder_.write(file, rows);
  }

  void write(const std::string& name, const std::string& text) const { folder_.write(name, text); }
  std::filesystem::path path() const { return folder_.path(); }
  std::string store() const { return (folder_.path() / "built.store").string(); }

  // Builds the store; its path.
  std::string build() const {
    tabdll::build_store(store(), path());
    return store();
  }

 private:
  ScratchFolder folder_;
  std::string layouts_ = "layout,column,type,offset,size\n";
  std::string tables_ = "table,layout,file\n";
  int files_ = 0;
};

// Runs statements on an SQLite file, to make what the builder refuses.
inline void alter(const std::string& path, const std::string& sql) {
  sqlite3* database = nullptr;
  ASSERT_EQ(sqlite3_open(path.c_str(), &database), SQLITE_OK);
  char* error = nullptr;
  EXPECT_EQ(sqlite3_exec(database, sql.c_str(), nullptr, nullptr, &error), SQLITE_OK) << error;
  sqlite3_close(database);
}

// A row buffer whose bytes behind the row are seen to stay.
struct RowBuffer {
  RowBuffer() { std::memset(bytes, '#', sizeof bytes); }
  bool untouched_from(std::size_t begin) const {
    for (std::size_t i = begin; i < sizeof bytes; ++i) {
      if (bytes[i] != '#') return false;
    }
    return true;
  }
  template <class T>
  T at(std::size_t offset) const {
    T value;
    std::memcpy(&value, bytes + offset, sizeof value);
    return value;
  }
  std::string text(std::size_t offset) const { return bytes + offset; }

  char bytes[TW_STORE_ROW_LIMIT + 8];
};

// An open store that is closed with the test.
class OpenStore {
 public:
  explicit OpenStore(const std::string& path) : word(OLB7R3_PF_open(path.c_str())) {}
  ~OpenStore() { OLB7R3_PF_close(0); }
  OpenStore(const OpenStore&) = delete;
  OpenStore& operator=(const OpenStore&) = delete;

  const TWstoreword word;
};

}  // namespace tidewater::test
