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

// Fields end at blanks, commas or semicolons.  Stricter than the library's reader, which takes what
// it can scan: a field must be an angle of the format from end to end, with minutes and seconds
// below 60.  Each function takes its fields off the front of text, also where they are refused.

// Two angles.  Gives TW_BAD_TEXT, TW_BAD_LATITUDE or TW_BAD_LONGITUDE.
TWstatus take_position(std::string_view& text, const AngleFormat& format, const AngleUnit& unit,
                       CoordinateTriple& point);

// An azimuth, radians: an angle with a sign, whatever letters the format puts to other angles.
// Gives TW_BAD_TEXT, or TW_RANGE_ERROR beyond a turn.
TWstatus take_azimuth(std::string_view& text, const AngleFormat& format, double& azimuth);

// A plain number.  False where the next field is none; text is then as before.
bool take_number(std::string_view& text, double& value);

// Two angles and, where a plain number follows them, a height in metres; words as take_position().
TWstatus read_position(std::string_view line, const AngleFormat& format, const AngleUnit& unit,
                       PositionText& position);

// Each writes its fields behind text, with a blank in between.
void append_position(std::string& text, const CoordinateTriple& point, const AngleFormat& format,
                     const AngleUnit& unit);
void append_azimuth(std::string& text, double azimuth, const AngleFormat& format);
void append_metres(std::string& text, double value, int decimals);

// Writes a number right behind text, at the right of a field of that width.
void append_number(std::string& text, double value, int decimals, int width = 0);

}  // namespace tidewater::command
