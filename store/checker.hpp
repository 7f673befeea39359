// Holds a store against the tables that the library reads.
#pragma once

#include <string>
#include <vector>

#include "table_store.hpp"

namespace tabdll {

// What is wrong with a store, one line each: a table that is missing or packed otherwise, a row
// that does not pack, a row that names a table that is not there.  Empty where all is well.
std::vector<std::string> faults_of(const TableStore& store);

}  // namespace tabdll
