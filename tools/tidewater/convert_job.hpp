// What is asked of a conversion.
#pragma once

#include <string>
#include <vector>

#include "chain.hpp"
#include "position_line.hpp"

namespace tidewater::command {

struct ConvertOptions {
  std::vector<std::string> files;
  ChainRequest chain;
  AngleStyle in;
  AngleStyle out;
  std::string from;
  std::string zone;
  std::string shift;
  std::string ellipsoid, from_ellipsoid;
  std::string x, y, z, separator;  // columns of a table
  bool no_shift = false;
  bool heights = false;
  bool csv = false;
  bool in_place = false;
  bool geojson = false;
  bool describe = false;
  int precision = -1;
};

}  // namespace tidewater::command
