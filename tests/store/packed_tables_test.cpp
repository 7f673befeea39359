// All tables as one compact run of bytes, and back.

#include "packed_tables.hpp"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <random>
#include <string>

using namespace tabdll;

namespace {

void expect_same(const TableStore& a, const TableStore& b) {
  ASSERT_EQ(a.tables().size(), b.tables().size());
  for (const auto& [name, table] : a.tables()) {
    const Table& other = b.table(name);
    EXPECT_EQ(table.layout().fields, other.layout().fields) << name;
    ASSERT_EQ(table.size(), other.size()) << name;
    for (std::size_t i = 0; i < table.size(); ++i) {
      ASSERT_EQ(std::memcmp(table.row(i), other.row(i), table.layout().row_size()), 0)
          << name << ", row " << i;
    }
  }
}

template <class Value>
void put(std::vector<char>& rows, std::size_t at, Value value) {
  std::memcpy(rows.data() + at, &value, sizeof value);
}

// Every type, with its extremes, and a pad between them.
TableStore extremes() {
  Layout layout;
  layout.fields = {{"name", FieldType::kText, 0, 8},
                   {"short", FieldType::kInt16, 8, 2},
                   {"", FieldType::kPad, 10, 2},
                   {"long", FieldType::kInt32, 12, 4},
                   {"number", FieldType::kFloat64, 16, 8}};
  const std::size_t size = layout.row_size();
  std::vector<char> rows(5 * size);
  const char* names[] = {"", "a", "seven77", "\xc3\xa9", " "};
  const std::int16_t shorts[] = {0, INT16_MIN, INT16_MAX, -1, 1};
  const std::int32_t longs[] = {INT32_MAX, INT32_MIN, 0, INT32_MIN, INT32_MAX};
  const double numbers[] = {-0.0, std::numeric_limits<double>::max(), 5e-324, 0.1, -1.0 / 3};
  for (std::size_t i = 0; i < 5; ++i) {
    std::strcpy(rows.data() + i * size, names[i]);
    put(rows, i * size + 8, shorts[i]);
    put(rows, i * size + 12, longs[i]);
    put(rows, i * size + 16, numbers[i]);
  }
  Tables tables;
  tables.emplace("extremes", Table(layout, rows));
  tables.emplace("empty", Table(layout, {}));
  return TableStore(std::move(tables));
}

TEST(PackedTables, TheStoreComesBackToTheLastBit) {
  const TableStore store(TIDEWATER_STORE);
  const std::vector<unsigned char> bytes = pack_tables(store);
  EXPECT_GT(bytes.size(), 100000u);
  expect_same(store, unpack_tables(bytes));
}

TEST(PackedTables, ExtremesComeBack) {
  const TableStore store = extremes();
  const TableStore back = unpack_tables(pack_tables(store));
  expect_same(store, back);
  double zero = 1;
  std::memcpy(&zero, back.table("extremes").row(0) + 16, sizeof zero);
  EXPECT_TRUE(std::signbit(zero));
}

TEST(PackedTables, EveryShorterImageIsRefused) {
  const std::vector<unsigned char> bytes = pack_tables(extremes());
  for (std::size_t size = 0; size < bytes.size(); ++size) {
    EXPECT_THROW(unpack_tables(std::span(bytes).first(size)), StoreError) << size;
  }
  std::vector<unsigned char> longer = bytes;
  longer.push_back(0);
  EXPECT_THROW(unpack_tables(longer), StoreError);
}

TEST(PackedTables, DamagedImagesAreRefusedOrRead) {
  const std::vector<unsigned char> bytes = pack_tables(extremes());
  std::mt19937 random(7);
  int refused = 0;
  for (int i = 0; i < 20000; ++i) {
    std::vector<unsigned char> damaged = bytes;
    damaged[random() % damaged.size()] = static_cast<unsigned char>(random());
    if (i % 2 == 0) damaged[random() % damaged.size()] = static_cast<unsigned char>(random());
    try {
      unpack_tables(damaged);
    } catch (const StoreError&) {
      ++refused;
    }
  }
  EXPECT_GT(refused, 5000);
}

TEST(PackedTables, RowsThatCannotBeThereAreRefusedBeforeTheyTakeMemory) {
  // One table of one pad-free field of a byte's text, and a number of rows beyond the bytes.
  std::vector<unsigned char> bytes;
  for (const char c : std::string("TWTABLES")) bytes.push_back(static_cast<unsigned char>(c));
  for (const int b : {1, 116, 0, 1, 99, 0, 0, 0, 1, 0xff, 0xff, 0x7f}) {
    bytes.push_back(static_cast<unsigned char>(b));
  }
  EXPECT_THROW(unpack_tables(bytes), StoreError);
}

}  // namespace
