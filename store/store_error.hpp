// What is wrong with a store.
#pragma once

#include <stdexcept>

namespace tabdll {

// A file that is no store, a table or a column that is not there, a cell that does not pack.
class StoreError : public std::runtime_error {
  using std::runtime_error::runtime_error;
};

}  // namespace tabdll
