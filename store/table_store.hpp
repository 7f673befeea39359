// A store file's tables in memory: packed rows under the layouts that came with them.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "layout.hpp"
#include "store_error.hpp"

namespace tabdll {

// The table of layouts in every store file.
inline constexpr std::string_view kLayoutTable = "tidewater_layout";

// The rows of one table.  Counting, walking and searching are views of the same rows, and safe from
// any number of threads.
class Table {
 public:
  // The rows stand one behind the other, layout.row_size() bytes each.
  Table(Layout layout, std::vector<char> rows);

  const Layout& layout() const { return layout_; }
  std::size_t size() const { return size_; }
  const char* row(std::size_t number) const { return rows_.data() + number * layout_.row_size(); }

  // The numbers of the rows in the order of a column (byte order for text), equal ones in the order
  // of insertion.  Made when it is first asked for.
  const std::vector<std::uint32_t>& order(std::string_view column) const;

  // The first row whose column equals the key (see OLB7R3_PF_get_row_by_value); null where there is
  // none.
  const char* find(std::string_view column, const void* key) const;

 private:
  struct Order {
    std::once_flag made;
    std::vector<std::uint32_t> rows;
  };

  const Field& field(std::string_view column) const;

  Layout layout_;
  std::vector<char> rows_;
  std::size_t size_;
  std::unique_ptr<Order[]> orders_;  // one for each field
};

// One pass over the rows of a table.
class Walk {
 public:
  // In the order of a column, of insertion for a null column.
  Walk(const Table& table, const char* column)
      : table_(&table), order_(column ? &table.order(column) : nullptr) {}

  const Table& table() const { return *table_; }

  // The next row; null at the end, for ever after.
  const char* next() {
    if (next_ == table_->size()) return nullptr;
    const std::size_t place = next_++;
    return table_->row(order_ ? (*order_)[place] : place);
  }

 private:
  const Table* table_;
  const std::vector<std::uint32_t>* order_;
  std::size_t next_ = 0;
};

using Tables = std::map<std::string, Table, std::less<>>;

// A store file comes from anywhere.  It opens whole or not at all: an SQLite database whose pages
// are sound, that holds nothing but plain tables, each with a layout that all its cells fit.
class TableStore {
 public:
  explicit TableStore(const char* path);
  // From the bytes of a file.
  explicit TableStore(std::vector<unsigned char> file);
  explicit TableStore(Tables tables) : tables_(std::move(tables)) {}

  const Tables& tables() const { return tables_; }
  const Table& table(std::string_view name) const;

 private:
  Tables tables_;
};

}  // namespace tabdll
