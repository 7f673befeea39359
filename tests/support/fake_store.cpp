#include "support/fake_store.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>

namespace tidewater::test {

namespace {

template <class T>
T read(const std::vector<char>& row, std::size_t offset) {
  T value;
  std::memcpy(&value, row.data() + offset, sizeof value);
  return value;
}

bool less(const FakeStore::Column& c, const std::vector<char>& a, const std::vector<char>& b) {
  switch (c.type) {
    case FakeStore::Type::kText:
      return std::strcmp(a.data() + c.offset, b.data() + c.offset) < 0;
    case FakeStore::Type::kInt16:
      return read<int16_t>(a, c.offset) < read<int16_t>(b, c.offset);
    case FakeStore::Type::kInt32:
      return read<int32_t>(a, c.offset) < read<int32_t>(b, c.offset);
    case FakeStore::Type::kDouble:
      return read<double>(a, c.offset) < read<double>(b, c.offset);
  }
  return false;
}

bool equals(const FakeStore::Column& c, const std::vector<char>& row, const void* key) {
  switch (c.type) {
    case FakeStore::Type::kText:
      return std::strcmp(row.data() + c.offset, static_cast<const char*>(key)) == 0;
    case FakeStore::Type::kInt16:
      return std::memcmp(row.data() + c.offset, key, sizeof(int16_t)) == 0;
    case FakeStore::Type::kInt32:
      return std::memcmp(row.data() + c.offset, key, sizeof(int32_t)) == 0;
    case FakeStore::Type::kDouble:
      return std::memcmp(row.data() + c.offset, key, sizeof(double)) == 0;
  }
  return false;
}

template <class Columns>
auto find_column(const Columns& columns, const char* name) {
  return std::find_if(columns.begin(), columns.end(),
                      [name](const FakeStore::Column& c) { return c.name == name; });
}

}  // namespace

PackedRow& PackedRow::text(std::size_t offset, const std::string& value) {
  std::memcpy(bytes_.data() + offset, value.c_str(), value.size() + 1);
  return *this;
}

PackedRow& PackedRow::i16(std::size_t offset, int16_t value) {
  std::memcpy(bytes_.data() + offset, &value, sizeof value);
  return *this;
}

PackedRow& PackedRow::i32(std::size_t offset, int32_t value) {
  std::memcpy(bytes_.data() + offset, &value, sizeof value);
  return *this;
}

PackedRow& PackedRow::f64(std::size_t offset, double value) {
  std::memcpy(bytes_.data() + offset, &value, sizeof value);
  return *this;
}

FakeStore& FakeStore::current() {
  static FakeStore store;
  return store;
}

void FakeStore::clear() { *this = FakeStore(); }

void FakeStore::add_table(const std::string& table, std::vector<Column> columns) {
  tables_[table].columns = std::move(columns);
}

void FakeStore::add_row(const std::string& table, const PackedRow& row) {
  tables_[table].rows.push_back(row.bytes());
}

void FakeStore::fail(StoreCall call, uint32_t word, int nth) {
  failures_.emplace(call, Failure{counts_[call] + nth, word});
}

void FakeStore::fail_always(StoreCall call, uint32_t word) {
  failures_.emplace(call, Failure{0, word});
}

int FakeStore::calls(StoreCall call) const {
  const auto found = counts_.find(call);
  return found == counts_.end() ? 0 : found->second;
}

bool FakeStore::fails(StoreCall call, const std::string& text, uint32_t& word) {
  const int now = ++counts_[call];
  log_.push_back(text);
  const auto [first, last] = failures_.equal_range(call);
  for (auto it = first; it != last; ++it) {
    if (it->second.at == 0 || it->second.at == now) {
      word = it->second.word;
      return true;
    }
  }
  return false;
}

FakeStore::Table* FakeStore::find(const char* table) {
  const auto found = tables_.find(table);
  return found == tables_.end() ? nullptr : &found->second;
}

uint32_t FakeStore::open(const char* path) {
  uint32_t word = 0;
  return fails(StoreCall::kOpen, std::string("open ") + path, word) ? word : TW_STORE_SUCCESS;
}

uint32_t FakeStore::reset_table(const char* table) {
  uint32_t word = 0;
  if (fails(StoreCall::kReset, std::string("reset ") + table, word)) return word;
  Table* t = find(table);
  if (!t) return kSomeFailure;
  t->walk.resize(t->rows.size());
  for (std::size_t i = 0; i < t->walk.size(); ++i) t->walk[i] = i;
  t->next = 0;
  return TW_STORE_SUCCESS;
}

uint32_t FakeStore::define_table_search(const char* table, const char* column) {
  uint32_t word = 0;
  const std::string text = std::string("search ") + table + " " + (column ? column : "-");
  if (fails(StoreCall::kSearch, text, word)) return word;
  Table* t = find(table);
  if (!t) return kSomeFailure;
  if (!column) return TW_STORE_SUCCESS;
  const auto c = find_column(t->columns, column);
  if (c == t->columns.end()) return kSomeFailure;
  std::stable_sort(t->walk.begin(), t->walk.end(),
                   [&](std::size_t a, std::size_t b) { return less(*c, t->rows[a], t->rows[b]); });
  return TW_STORE_SUCCESS;
}

uint32_t FakeStore::get_next_row(const char* table, void* row) {
  uint32_t word = 0;
  if (fails(StoreCall::kNext, std::string("next ") + table, word)) return word;
  Table* t = find(table);
  if (!t) return kSomeFailure;
  if (t->next >= t->walk.size()) return TW_STORE_END_OF_TABLE;
  const std::vector<char>& bytes = t->rows[t->walk[t->next++]];
  std::memcpy(row, bytes.data(), bytes.size());
  return TW_STORE_SUCCESS;
}

uint32_t FakeStore::get_row_by_value(const char* table, const char* column, const void* key,
                                     void* row) {
  uint32_t word = 0;
  const std::string text = std::string("by-value ") + table + " " + column;
  if (fails(StoreCall::kByValue, text, word)) return word;
  Table* t = find(table);
  if (!t) return kSomeFailure;
  const auto c = find_column(t->columns, column);
  if (c == t->columns.end()) return kSomeFailure;
  for (const std::vector<char>& bytes : t->rows) {
    if (equals(*c, bytes, key)) {
      std::memcpy(row, bytes.data(), bytes.size());
      return TW_STORE_SUCCESS;
    }
  }
  return kSomeFailure;
}

uint32_t FakeStore::inq_num_rows(const char* table, int32_t* count) {
  uint32_t word = 0;
  if (fails(StoreCall::kRows, std::string("rows ") + table, word)) return word;
  const Table* t = find(table);
  if (!t) return kSomeFailure;
  *count = static_cast<int32_t>(t->rows.size());
  return TW_STORE_SUCCESS;
}

uint32_t FakeStore::close() {
  uint32_t word = 0;
  return fails(StoreCall::kClose, "close", word) ? word : TW_STORE_SUCCESS;
}

}  // namespace tidewater::test

using tidewater::test::FakeStore;

// These stand in for the library on disk.  They live beside the class, so that whatever uses it
// links them into its own program.
TWstoreword OLB7R3_PF_open(const char* path) { return FakeStore::current().open(path); }

TWstoreword OLB7R3_PF_reset_table(const char* table) {
  return FakeStore::current().reset_table(table);
}

TWstoreword OLB7R3_PF_define_table_search(const char* table, const char* column) {
  return FakeStore::current().define_table_search(table, column);
}

TWstoreword OLB7R3_PF_get_next_row(const char* table, void* row) {
  return FakeStore::current().get_next_row(table, row);
}

TWstoreword OLB7R3_PF_get_row_by_value(const char* table, int32_t mode, const char* column,
                                       const void* key, void* row) {
  EXPECT_EQ(mode, 0);
  return FakeStore::current().get_row_by_value(table, column, key, row);
}

TWstoreword OLB7R3_PF_inq_num_rows(const char* table, int32_t* count) {
  return FakeStore::current().inq_num_rows(table, count);
}

TWstoreword OLB7R3_PF_close(int32_t mode) {
  EXPECT_EQ(mode, 0);
  return FakeStore::current().close();
}
