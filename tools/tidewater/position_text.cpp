#include "position_text.hpp"

#include <array>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <cstring>

#include "tidewater/foundation.h"
#include "tidewater/text.h"

namespace tidewater::command {

namespace {

bool is_blank(char c) { return c == ' ' || c == '\t'; }
bool is_separator(char c) { return is_blank(c) || c == ',' || c == ';'; }
bool is_digit(char c) { return c >= '0' && c <= '9'; }

// Takes the next field off the front of text, and the blanks and one comma before it.
std::string_view take_field(std::string_view& text) {
  std::size_t i = 0;
  while (i < text.size() && is_blank(text[i])) ++i;
  if (i < text.size() && (text[i] == ',' || text[i] == ';')) ++i;
  while (i < text.size() && is_blank(text[i])) ++i;
  std::size_t end = i;
  while (end < text.size() && !is_separator(text[end])) ++end;
  const std::string_view field = text.substr(i, end - i);
  text.remove_prefix(end);
  return field;
}

std::size_t digits_at(std::string_view text, std::size_t i) {
  std::size_t n = 0;
  while (i + n < text.size() && is_digit(text[i + n])) ++n;
  return n;
}

// Digits with at most one full stop among or beside them.
bool is_plain_number(std::string_view text) {
  const std::size_t whole = digits_at(text, 0);
  if (whole == text.size()) return whole > 0;
  const std::size_t part = digits_at(text, whole + 1);
  return text[whole] == '.' && whole + 1 + part == text.size() && whole + part > 0;
}

bool below_sixty(std::string_view two_digits) { return two_digits.empty() || two_digits[0] < '6'; }

// D, D:M, D:M:S or D:M:S.SS
bool is_sexagesimal(std::string_view text) {
  const std::size_t degrees = digits_at(text, 0);
  if (degrees == 0) return false;
  text.remove_prefix(degrees);
  for (int piece = 0; piece < 2 && !text.empty(); ++piece) {
    if (text[0] != ':') return false;
    text.remove_prefix(1);
    const std::size_t n = digits_at(text, 0);
    if (n == 0 || n > 2 || (n == 2 && !below_sixty(text))) return false;
    text.remove_prefix(n);
    if (piece == 1 && !text.empty() && text[0] == '.') text.remove_prefix(1 + digits_at(text, 1));
  }
  return text.empty();
}

// D, D.MM, D.MMSS or D.MMSSssss; a single digit of minutes or seconds stands for its tens.
bool is_packed(std::string_view text) {
  if (!is_plain_number(text) || text[0] == '.') return false;
  const std::size_t stop = text.find('.');
  if (stop == std::string_view::npos) return true;
  const std::string_view behind = text.substr(stop + 1);
  return below_sixty(behind.substr(0, 2)) &&
         (behind.size() < 3 || below_sixty(behind.substr(2, 2)));
}

bool is_magnitude(std::string_view text, const std::string& form) {
  if (form == "dms") return is_sexagesimal(text);
  if (form == "packed") return is_packed(text);
  return is_plain_number(text);
}

bool is_hemisphere_letter(char c) { return std::strchr("NEWSnews", c) != nullptr && c != '\0'; }

TWstatus read_angle(std::string_view field, const AngleFormat& format, const AngleUnit& unit,
                    int16_t axis, double& value) {
  constexpr std::size_t kLongestField = 60;
  if (field.empty() || field.size() > kLongestField) return TW_BAD_TEXT;
  std::string_view magnitude = field;
  bool negative = false;
  if (format.hemisphere == "front") {
    if (!is_hemisphere_letter(field.front())) return TW_BAD_TEXT;
    magnitude.remove_prefix(1);
  } else if (format.hemisphere == "behind") {
    if (!is_hemisphere_letter(field.back())) return TW_BAD_TEXT;
    magnitude.remove_suffix(1);
  } else if (field[0] == '-' || field[0] == '+') {
    // The sign is taken off here: the packed form of the library reads "-0.30" as positive.
    negative = field[0] == '-';
    magnitude.remove_prefix(1);
    field = magnitude;
  }
  if (!is_magnitude(magnitude, format.form)) return TW_BAD_TEXT;
  TWstatus status = TW_SUCCESS;
  TWascii_to_rad(std::string(field).c_str(), unit, axis, &value, &status);
  if (negative) value = -value;
  return status;
}

void append_angle(std::string& text, double value, const AngleUnit& unit, int16_t axis) {
  std::array<char, 64> field;
  TWstatus status = TW_SUCCESS;
  TWrad_to_ascii(value, unit, axis, field.data(), &status);
  if (!text.empty()) text += ' ';
  text += field.data();
}

}  // namespace

TWstatus take_position(std::string_view& text, const AngleFormat& format, const AngleUnit& unit,
                       CoordinateTriple& point) {
  const std::string_view first = take_field(text);
  const std::string_view second = take_field(text);
  const bool lat_first = format.order == "lat-lon";
  double lon = 0;
  double lat = 0;
  TWstatus status = read_angle(lat_first ? second : first, format, unit, 0, lon);
  if (status == TW_SUCCESS) status = read_angle(lat_first ? first : second, format, unit, 1, lat);
  if (status == TW_SUCCESS) TWverify_lon(lon, &point.x, &status);
  if (status == TW_SUCCESS) TWverify_lat(lat, &point.y, &status);
  return status;
}

TWstatus take_azimuth(std::string_view& text, const AngleFormat& format, double& azimuth) {
  constexpr double kTurn = 6.283185307179587 + 1e-12;  // 360 degrees as any format reads them
  const AngleFormat plain = format.without_hemisphere();
  const TWstatus status = read_angle(take_field(text), plain, plain.unit(), 0, azimuth);
  if (status != TW_SUCCESS) return status;
  return std::fabs(azimuth) <= kTurn ? TW_SUCCESS : TW_RANGE_ERROR;
}

bool take_number(std::string_view& text, double& value) {
  std::string_view rest = text;
  std::string_view field = take_field(rest);
  if (!field.empty() && field[0] == '+') field.remove_prefix(1);
  std::string_view magnitude = field;
  if (!magnitude.empty() && magnitude[0] == '-') magnitude.remove_prefix(1);
  if (!is_plain_number(magnitude)) return false;
  if (std::from_chars(field.data(), field.data() + field.size(), value).ec != std::errc()) {
    return false;
  }
  text = rest;
  return true;
}

TWstatus read_position(std::string_view line, const AngleFormat& format, const AngleUnit& unit,
                       PositionText& position) {
  position = {};
  const TWstatus status = take_position(line, format, unit, position.point);
  position.has_height = take_number(line, position.point.z);
  position.rest = line;
  return status;
}

void append_position(std::string& text, const CoordinateTriple& point, const AngleFormat& format,
                     const AngleUnit& unit) {
  const bool lat_first = format.order == "lat-lon";
  append_angle(text, lat_first ? point.y : point.x, unit, lat_first ? 1 : 0);
  append_angle(text, lat_first ? point.x : point.y, unit, lat_first ? 0 : 1);
}

void append_azimuth(std::string& text, double azimuth, const AngleFormat& format) {
  append_angle(text, azimuth, format.without_hemisphere().unit(), 0);
}

void append_metres(std::string& text, double value, int decimals) {
  std::array<char, 400> field;  // holds the largest double
  TWstatus status = TW_SUCCESS;
  TWmet_to_ascii(value, static_cast<int16_t>(decimals), 1, field.data(), &status);
  if (!text.empty()) text += ' ';
  text += field.data();
}

void append_number(std::string& text, double value, int decimals, int width) {
  std::array<char, 400> field;  // holds the largest double
  std::snprintf(field.data(), field.size(), "%*.*f", width, decimals, value);
  text += field.data();
}

}  // namespace tidewater::command
