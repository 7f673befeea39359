// A parameter store in memory that counts the seven operations and fails on request.  The test
// program that links it uses it in place of the library on disk.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "tidewater/store.h"

namespace tidewater::test {

enum class StoreCall { kOpen, kReset, kSearch, kNext, kByValue, kRows, kClose };

// A packed row, filled field by field; what is not set is zero.
class PackedRow {
 public:
  explicit PackedRow(std::size_t size) : bytes_(size) {}
  PackedRow& text(std::size_t offset, const std::string& value);  // with its terminator
  PackedRow& i16(std::size_t offset, int16_t value);
  PackedRow& i32(std::size_t offset, int32_t value);
  PackedRow& f64(std::size_t offset, double value);
  const std::vector<char>& bytes() const { return bytes_; }

 private:
  std::vector<char> bytes_;
};

class FakeStore {
 public:
  enum class Type { kText, kInt16, kInt32, kDouble };
  struct Column {
    std::string name;
    std::size_t offset;
    Type type;
  };

  // The store that the seven operations of this program act on.
  static FakeStore& current();

  // Empties the store, the counts and the planned failures.
  void clear();

  void add_table(const std::string& table, std::vector<Column> columns);
  void add_row(const std::string& table, const PackedRow& row);

  // The nth call of an operation from now on (1 is the next) answers with word and does nothing.
  void fail(StoreCall call, uint32_t word = kSomeFailure, int nth = 1);
  // Every call of the operation answers with word.
  void fail_always(StoreCall call, uint32_t word = kSomeFailure);

  int calls(StoreCall call) const;
  int opens() const { return calls(StoreCall::kOpen); }
  int closes() const { return calls(StoreCall::kClose); }
  // What was asked, in order: "open PATH", "reset TABLE", "search TABLE COLUMN" (a null column is
  // written -), "next TABLE", "by-value TABLE COLUMN", "rows TABLE", "close".
  const std::vector<std::string>& log() const { return log_; }

  // A failure word with its low bit clear, and two good words that are not exact success.
  static constexpr uint32_t kSomeFailure = 0x09608012;
  static constexpr uint32_t kOtherSuccess = 0x09608011;

  // The seven operations.
  uint32_t open(const char* path);
  uint32_t reset_table(const char* table);
  uint32_t define_table_search(const char* table, const char* column);
  uint32_t get_next_row(const char* table, void* row);
  uint32_t get_row_by_value(const char* table, const char* column, const void* key, void* row);
  uint32_t inq_num_rows(const char* table, int32_t* count);
  uint32_t close();

 private:
  struct Table {
    std::vector<Column> columns;
    std::vector<std::vector<char>> rows;
    std::vector<std::size_t> walk;  // row numbers in the order of the walk
    std::size_t next = 0;
  };
  struct Failure {
    int at = 0;  // 0: at every call
    uint32_t word = 0;
  };

  // Counts and logs a call; true with the word when it is to fail.
  bool fails(StoreCall call, const std::string& text, uint32_t& word);
  Table* find(const char* table);

  std::map<std::string, Table> tables_;
  std::map<StoreCall, int> counts_;
  std::multimap<StoreCall, Failure> failures_;
  std::vector<std::string> log_;
};

}  // namespace tidewater::test
