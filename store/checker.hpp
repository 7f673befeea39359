// Holds a store against the tables that the library reads.
#pragma once

#include <string>
#include <vector>

#include "table_store.hpp"

namespace tabdll {

// What is wrong with a store that opens, one line each: a table that is missing or packed
// otherwise, a row that names a table that is not there, values that the library refuses or its
// users stumble over.  Empty where all is well.
std::vector<std::string> faults_of(const TableStore& store);

}  // namespace tabdll
