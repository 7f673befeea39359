#include "registry_reader.hpp"

#include <cmath>

#include "tidewater/error.hpp"

namespace tidewater::detail {

namespace {

constexpr int32_t kMostRows = 1000000;

}  // namespace

StoreReader::StoreReader(const std::string& path) : path_(path) {
  if (OLB7R3_PF_open(path.c_str()) != TW_STORE_SUCCESS) {
    throw Error("\"" + path + "\" is not a parameter store, or cannot be read.");
  }
}

StoreReader::~StoreReader() { OLB7R3_PF_close(0); }

void StoreReader::fail(const std::string& what) const {
  throw Error("The registry in \"" + path_ + "\" cannot be used: table \"" + table_ + "\", row " +
              std::to_string(row_number_) + ": " + what + ".");
}

void StoreReader::begin(const char* table) {
  table_ = table;
  row_number_ = 0;
  int32_t rows = 0;
  if (OLB7R3_PF_inq_num_rows(table, &rows) != TW_STORE_SUCCESS || rows < 0 ||
      OLB7R3_PF_reset_table(table) != TW_STORE_SUCCESS) {
    throw Error("The parameter store \"" + path_ + "\" has no registry: its table \"" + table +
                "\" is missing or cannot be read.");
  }
  // No registry has as many rows; a store that lies must not keep us for hours.
  if (rows > kMostRows) {
    throw Error("The registry in \"" + path_ + "\" cannot be used: table \"" + table + "\" has " +
                std::to_string(rows) + " rows.");
  }
  rows_ = static_cast<std::size_t>(rows);
}

bool StoreReader::next() {
  ++row_number_;
  at_ = 0;
  const TWstoreword word = OLB7R3_PF_get_next_row(table_, row_.data());
  if (word == TW_STORE_END_OF_TABLE) {
    if (row_number_ != rows_ + 1) fail("the table ends too early");
    return false;
  }
  require(word == TW_STORE_SUCCESS, "it cannot be read");
  // A store that never ends a walk has to be left.
  require(row_number_ <= rows_, "the table does not end");
  return true;
}

const char* StoreReader::take(std::size_t size) {
  const char* field = row_.data() + at_;
  at_ += size;
  return field;
}

int StoreReader::integer() {
  int32_t value = 0;
  std::memcpy(&value, take(sizeof value), sizeof value);
  return value;
}

double StoreReader::real() {
  double value = 0;
  std::memcpy(&value, take(sizeof value), sizeof value);
  require(std::isfinite(value), "a number is not finite");
  return value;
}

std::string_view StoreReader::text(std::size_t field_size) {
  const char* field = take(field_size);
  const auto* end = static_cast<const char*>(std::memchr(field, 0, field_size));
  require(end != nullptr, "a text does not end");
  return {field, static_cast<std::size_t>(end - field)};
}

}  // namespace tidewater::detail
