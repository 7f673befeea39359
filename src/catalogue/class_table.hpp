// What the tables of coordinate systems and of datum models have in common: rows with a class text,
// a name, a number, a form identifier and a mask of classes.
#pragma once

#include "catalogue/session.hpp"

namespace tidewater::detail {

// One such table: its name, its key columns, and the word for a row that it does not hold.
struct ClassTable {
  const char* table;
  const char* class_column;
  const char* name_column;
  const char* number_column;
  TWstatus missing;

  // The 16-bit mask is widened with its sign: -1 takes every row with any bit set, 0 takes none.
  static bool passes(const Row& row, int16_t mask) {
    return (row.number<int32_t>(class_row::kMask) & static_cast<int32_t>(mask)) != 0;
  }

  void count(const char* store, int16_t mask, int32_t* out, TWstatus* status) const {
    in_store(store, Close::kIgnored, status, [&] {
      const TWstatus begun = begin_walk(table, name_column);
      if (!TW_OK(begun)) return begun;
      *out = 0;
      walk(table, [&](const Row& row) { *out += passes(row, mask) ? 1 : 0; });
      return TW_SUCCESS;
    });
  }

  void names(const char* store, int16_t mask, char* out, TWstatus* status) const {
    in_store(store, Close::kIgnored, status, [&] {
      const TWstatus begun = begin_walk(table, name_column);
      if (!TW_OK(begun)) return begun;
      std::size_t index = 0;
      walk(table, [&](const Row& row) {
        if (passes(row, mask)) row.list_name(class_row::kName, out, index++);
      });
      return TW_SUCCESS;
    });
  }

  void text(const char* store, const char* column, const void* key, const TextField& field,
            Close close, char* out, TWstatus* status) const {
    in_store(store, close, status, [&] {
      return look_up(table, column, key, missing, [&](const Row& row) { row.text(field, out); });
    });
  }

  void number(const char* store, const char* column, const void* key, std::size_t offset,
              Close close, int16_t* out, TWstatus* status) const {
    in_store(store, close, status, [&] {
      return look_up(table, column, key, missing,
                     [&](const Row& row) { *out = row.number<int16_t>(offset); });
    });
  }
};

}  // namespace tidewater::detail
