// Where the parameter store is.
#pragma once

#include <string>

namespace tidewater::detail {

// What the environment variable TIDEWATER_STORE names, else the store that was installed or built
// beside the library (or beside the program that has it in it).  Throws an Error that names the
// places where none was found.
std::string store_path();

}  // namespace tidewater::detail
