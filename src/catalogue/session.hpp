// The frame of every catalogue function: open the store, work, close it.  The work is a function
// within the frame, so that no way out of it can miss the close.
#pragma once

#include "catalogue/rows.hpp"
#include "tidewater/frame.h"
#include "tidewater/store.h"

namespace tidewater::detail {

// Whether the store's answer to the close enters the status.
enum class Close { kIgnored, kTested };

// How an answer of the store is judged: by its low bit, or by equality with the success word.
enum class Judge { kLowBit, kExact };

inline bool worked(TWstoreword word, Judge judge) {
  return judge == Judge::kExact ? word == TW_STORE_SUCCESS : TW_OK(word);
}

// Opens the store, sets the status to what work() returns, closes the store.  A tested close that
// fails takes the place of any other word.
template <class Work>
void in_store(const char* store, Close close, TWstatus* status, Work work,
              Judge open = Judge::kLowBit) {
  *status = TW_SUCCESS;
  if (!worked(OLB7R3_PF_open(store), open)) {
    *status = TW_PF_OPEN_ERROR;
    return;
  }
  *status = work();
  const TWstoreword closed = OLB7R3_PF_close(0);
  if (close == Close::kTested && !TW_OK(closed)) *status = TW_PF_TABLE_ERROR;
}

// Finds one row by a key and hands it to take(); missing is the word where there is none.
template <class Take>
TWstatus look_up(const char* table, const char* column, const void* key, TWstatus missing,
                 Take take, Judge reset = Judge::kLowBit) {
  if (!worked(OLB7R3_PF_reset_table(table), reset)) return TW_PF_TABLE_ERROR;
  Row row;
  if (OLB7R3_PF_get_row_by_value(table, 0, column, key, row.data()) != TW_STORE_SUCCESS) {
    return missing;
  }
  take(row);
  return TW_SUCCESS;
}

// Sets a walk of the table by the column (null: natural order) up.
inline TWstatus begin_walk(const char* table, const char* column,
                           TWstatus search_failed = TW_PF_TABLE_ERROR) {
  if (!TW_OK(OLB7R3_PF_reset_table(table))) return TW_PF_TABLE_ERROR;
  if (!TW_OK(OLB7R3_PF_define_table_search(table, column))) return search_failed;
  return TW_SUCCESS;
}

// Hands each row of a walk to visit().  By contract: only the end-of-table word ends it, a row that
// the store could not read counts with what the last one left.
template <class Visit>
void walk(const char* table, Visit visit) {
  Row row;
  while (OLB7R3_PF_get_next_row(table, row.data()) != TW_STORE_END_OF_TABLE) visit(row);
}

// The names of all rows, in the order of the column.
inline TWstatus list_names(const char* table, const char* column, const TextField& field,
                           char* names, TWstatus search_failed = TW_PF_TABLE_ERROR) {
  const TWstatus begun = begin_walk(table, column, search_failed);
  if (!TW_OK(begun)) return begun;
  std::size_t index = 0;
  walk(table, [&](const Row& row) { row.list_name(field, names, index++); });
  return TW_SUCCESS;
}

// The number of rows of a table; failed is the word where the store does not tell it.
inline TWstatus count_rows(const char* table, Judge judge, TWstatus failed, int32_t* count) {
  int32_t rows = 0;
  if (!worked(OLB7R3_PF_inq_num_rows(table, &rows), judge)) return failed;
  *count = rows;
  return TW_SUCCESS;
}

}  // namespace tidewater::detail
