// All tables of a store in one compact run of bytes, which packs well: columns one behind the
// other, integers as differences from row to row, numbers as the shortest decimals that lead back
// to them. For places that have no SQLite.
//
//   "TWTABLES" and the number of tables; for each its name, its fields (column, type, offset,
//   size), its number of rows, and the fields' values one field behind the other
//
// Whole numbers have seven bits a byte, the lowest first, the high bit where more follow; signed
// ones count 0, -1, 1, -2, 2.  Texts and decimals end with a zero byte; zero is the empty decimal.
#pragma once

#include <cstddef>
#include <span>
#include <vector>

#include "table_store.hpp"

namespace tabdll {

std::vector<unsigned char> pack_tables(const TableStore& store);

// Throws a StoreError for bytes that pack_tables() would not have written.
TableStore unpack_tables(std::span<const unsigned char> bytes);

}  // namespace tabdll
