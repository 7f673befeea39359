// Positions at the start of a line of text.
#pragma once

#include <string>
#include <string_view>

#include "angle_format.hpp"
#include "tidewater/frame.h"

namespace tidewater::command {

struct PositionText {
  CoordinateTriple point = {};
  bool has_height = false;
  std::string_view rest;  // what follows the position, with the separator in front of it
};

// Reads two angles and, where a plain number follows them, a height in metres.  Fields end at
// blanks, commas or semicolons.  Stricter than the library's reader, which takes what it can scan:
// a field must be an angle of the format from end to end, with minutes and seconds below 60.  Gives
// TW_BAD_TEXT, TW_BAD_LATITUDE or TW_BAD_LONGITUDE; rest is set as far as the fields could be told
// apart.
TWstatus read_position(std::string_view line, const AngleFormat& format, const AngleUnit& unit,
                       PositionText& position);

}  // namespace tidewater::command
