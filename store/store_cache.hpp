// The stores that the process has read, kept for the next opening.
#pragma once

#include <memory>

#include "table_store.hpp"

namespace tabdll {

// The store in a file.  While the file's identity stays what it was, an opening costs one look at
// it; from any number of threads.
std::shared_ptr<const TableStore> open_store(const char* path);

}  // namespace tabdll
