// Positions at the start of a line of text, and positions written.
#pragma once

#include <charconv>
#include <string>
#include <string_view>

#include "buffer.hpp"
#include "tidewater/frame.h"
#include "tidewater/position_text.hpp"

namespace tidewater::command {

// How angles are written; the names are those of the options.
struct AngleStyle {
  std::string form = "auto";        // auto (input only), degrees, grads, dm, dms, packed
  std::string hemisphere = "sign";  // sign, front, behind
  std::string reverse = "none";     // none, both, lat, lon
  std::string order = "lat-lon";    // lat-lon, lon-lat
  int precision = -1;               // decimals of the last part; -1: by the form
  bool decimal_comma = false;       // of the input

  bool lat_first() const { return order == "lat-lon"; }
  int decimals() const;
  // Throws std::invalid_argument where two of them exclude each other.
  void check() const;
};

// What the numbers of a line are.
enum class Kind {
  angles,   // longitude and latitude
  plane,    // easting and northing
  space,    // X, Y, Z
  grid,     // easting, northing and a zone such as 30N
  military  // a reference of the military grid
};

// Whether a third number is a height.
enum class Heights { never, where_there };

struct TakenPosition {
  double x = 0, y = 0, z = 0;  // longitude or easting first; degrees
  bool has_z = false;
  int zone = 0;          // of a grid; negative in the south
  std::size_t rest = 0;  // where what follows the position begins, with its separator
  TWstatus status = TW_SUCCESS;
  std::string reason;  // beside the status
};

class PositionReader {
 public:
  PositionReader(Kind kind, AngleStyle style, Heights heights)
      : kind_(kind), style_(std::move(style)), heights_(heights) {
    is_plain_ = kind_ != Kind::angles || style_.form == "auto" || style_.form == "degrees";
  }

  Kind kind() const { return kind_; }
  const AngleStyle& style() const { return style_; }
  // Whether every line has a third number that must be a height: it ends the line or has a decimal
  // point.
  bool all_have_heights(std::string_view lines) const;
  void set_heights(Heights heights) { heights_ = heights; }

  // Reads the position that a line begins with; a line of anything else gets a status and a reason.
  void take(std::string_view line, TakenPosition& position) const;
  // One field that is an angle or a number and nothing else: a column of a table.
  bool take_field(std::string_view field, bool is_latitude, double& value,
                  std::string& reason) const;

 private:
  bool take_plain(std::string_view line, TakenPosition& position) const;
  void take_angles(std::string_view line, TakenPosition& position) const;
  void take_military(std::string_view line, TakenPosition& position) const;
  void take_height(std::string_view line, TakenPosition& position) const;
  bool take_angle(std::string_view text, Axis axis, double& degrees, Axis& found,
                  std::string& reason) const;
  void finish_angles(TakenPosition& position) const;

  Kind kind_;
  AngleStyle style_;
  Heights heights_;
  bool is_plain_;
};

// Blank or comment.
inline bool is_data(std::string_view line) {
  for (const char c : line) {
    if (c != ' ' && c != '\t' && c != '\r') return c != '#';
  }
  return false;
}

// Takes a plain number off the front of text, and the blanks and one comma or semicolon before it.
// False where the next field is none; text is then as before.
bool take_number(std::string_view& text, double& value);

// A longitude and a latitude with a blank between, in the order of the style.
void append_position(Buffer& out, double lon, double lat, const AngleStyle& style);
// One angle of any kind.
void append_angle(Buffer& out, double degrees, Axis axis, const AngleStyle& style);
// The angle with a sign, though positions have letters.
void append_azimuth(Buffer& out, double degrees, const AngleStyle& style);

}  // namespace tidewater::command
