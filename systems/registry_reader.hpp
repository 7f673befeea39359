// Reads the tables of a parameter store row by row.
#pragma once

#include <array>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

#include "tidewater/store.h"

namespace tidewater::detail {

// A store that is open for as long as the object lives.  Throws an Error that names the store, and
// the table where one is at fault.
class StoreReader {
 public:
  explicit StoreReader(const std::string& path);
  ~StoreReader();
  StoreReader(const StoreReader&) = delete;
  StoreReader& operator=(const StoreReader&) = delete;

  // Walks a table from its first row; next() is false behind the last.
  void begin(const char* table);
  bool next();

  // The fields of the row, one behind the other.
  int integer();
  double real();  // finite
  std::string_view text(std::size_t field_size);

  // The number of rows of the table that was begun.
  std::size_t rows() const { return rows_; }

  // Throws an Error about the row that is being read.
  [[noreturn]] void fail(const std::string& what) const;
  void require(bool condition, const char* what) const {
    if (!condition) fail(what);
  }

 private:
  const char* take(std::size_t size);

  std::string path_;
  const char* table_ = "";
  std::size_t rows_ = 0;
  std::size_t row_number_ = 0;
  std::size_t at_ = 0;
  std::array<char, TW_STORE_ROW_LIMIT> row_{};
};

}  // namespace tidewater::detail
