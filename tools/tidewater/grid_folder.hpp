// Folders of grids, as the library wants them named.
#pragma once

#include <stdexcept>
#include <string>

namespace tidewater::command {

// The folder with its separator behind it.
inline std::string grid_directory(std::string folder) {
  constexpr std::size_t kLongest = 259;
  if (folder.empty() || folder.back() != '/') folder += '/';
  if (folder.size() > kLongest) {
    throw std::runtime_error(folder + ": a folder of grids has at most 259 characters");
  }
  return folder;
}

}  // namespace tidewater::command
