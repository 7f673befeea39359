#include "table_store.hpp"

#include <algorithm>
#include <cstring>
#include <numeric>
#include <utility>

namespace tabdll {

namespace {

template <class Number>
Number number_at(const void* at) {
  Number value;
  std::memcpy(&value, at, sizeof value);
  return value;
}

template <class Number>
int compare_numbers(const void* a, const void* b) {
  const auto first = number_at<Number>(a);
  const auto second = number_at<Number>(b);
  return first < second ? -1 : first == second ? 0 : 1;
}

// Both in the packed form of the type, which for a text ends with its terminator.
int compare(FieldType type, const void* a, const void* b) {
  switch (type) {
    case FieldType::kText:
      return std::strcmp(static_cast<const char*>(a), static_cast<const char*>(b));
    case FieldType::kInt16:
      return compare_numbers<std::int16_t>(a, b);
    case FieldType::kInt32:
      return compare_numbers<std::int32_t>(a, b);
    case FieldType::kFloat64:
      return compare_numbers<double>(a, b);
    case FieldType::kPad:
      break;
  }
  return 0;
}

}  // namespace

Table::Table(Layout layout, std::vector<char> rows)
    : layout_(std::move(layout)),
      rows_(std::move(rows)),
      size_(rows_.size() / layout_.row_size()),
      orders_(std::make_unique<Order[]>(layout_.fields.size())) {}

const Field& Table::field(std::string_view column) const {
  const Field* found = layout_.find(column);
  if (!found) throw StoreError("no column \"" + std::string(column) + "\"");
  return *found;
}

const std::vector<std::uint32_t>& Table::order(std::string_view column) const {
  const Field& f = field(column);
  Order& order = orders_[static_cast<std::size_t>(&f - layout_.fields.data())];
  std::call_once(order.made, [&] {
    std::vector<std::uint32_t> numbers(size_);
    std::iota(numbers.begin(), numbers.end(), 0u);
    std::stable_sort(numbers.begin(), numbers.end(), [&](std::uint32_t a, std::uint32_t b) {
      return compare(f.type, row(a) + f.offset, row(b) + f.offset) < 0;
    });
    order.rows = std::move(numbers);
  });
  return order.rows;
}

const char* Table::find(std::string_view column, const void* key) const {
  const Field& f = field(column);
  const std::vector<std::uint32_t>& rows = order(column);
  const auto found =
      std::lower_bound(rows.begin(), rows.end(), key, [&](std::uint32_t number, const void* value) {
        return compare(f.type, row(number) + f.offset, value) < 0;
      });
  if (found == rows.end() || compare(f.type, row(*found) + f.offset, key) != 0) return nullptr;
  return row(*found);
}

const Table& TableStore::table(std::string_view name) const {
  const auto found = tables_.find(name);
  if (found == tables_.end()) throw StoreError("no table \"" + std::string(name) + "\"");
  return found->second;
}

}  // namespace tabdll
