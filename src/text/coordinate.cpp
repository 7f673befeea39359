// Whole coordinates as text: geodetic, grid and geocentric triples in comma-separated fields.

#include <algorithm>
#include <string>
#include <string_view>

#include "text/angle.hpp"
#include "text/measure.hpp"
#include "text/wide.hpp"
#include "tidewater/angle_text.h"
#include "tidewater/coordinate_text.h"
#include "tidewater/measure_text.h"

using namespace tidewater::detail;

namespace {

// Beyond it a text is not read.
constexpr std::size_t kReadLimit = 150;

// Bytes of a written field, with its end.
constexpr std::size_t kFieldSize = 52;
constexpr std::size_t kGridFieldSize = 60;

// A length as a field of its own; empty where the unit is refused.
template <std::size_t Size>
std::string length_field(double value, int16_t precision, double unit, TWstatus* status) {
  char field[Size];
  copy_cut(length_text(value, precision, unit, status), Size, field);
  return field;
}

template <std::size_t Size>
std::string height_field(double height, int16_t precision, double unit) {
  char field[Size];
  copy_cut(decimal_text(height / unit, precision), Size, field);
  return field;
}

// The two fields in the caller's order; an order of zero has the x first.
std::string ordered(int16_t order, const std::string& x, const std::string& y) {
  return order == 0 ? x + ", " + y : y + ", " + x;
}

// Takes the field up to the next comma off the text, and the comma; what is missing is empty.
std::u16string_view take_field(std::u16string_view& text) {
  const std::size_t comma = text.find(u',');
  const std::u16string_view field = text.substr(0, comma);
  text = comma == text.npos ? std::u16string_view() : text.substr(comma + 1);
  return field;
}

void read_angle(std::u16string_view field, const AngleUnit& unit, int16_t axis, double* value,
                TWstatus* status) {
  field.remove_prefix(std::min(field.find_first_not_of(u" \n"), field.size()));
  std::u16string text(field);
  text += u'\0';  // room for the sign
  TWascii_to_rad_wide(text.data(), unit, axis, value, status);
}

void read_length(std::u16string_view field, double unit, double* value, TWstatus* status) {
  TWascii_to_met_wide(std::u16string(field).c_str(), unit, value, status);
}

// The unit's format is wide.
void parse_llh_wide(std::u16string_view text, const AngleUnit& unit, int16_t order,
                    double height_unit, CoordinateTriple* point, TWstatus* status) {
  CoordinateTriple read = {0, 0, 0};
  *status = TW_SUCCESS;
  if (text.find_first_not_of(u"0123456789NEWSnews,.+- :\n") != text.npos) {
    *status = TW_BAD_TEXT;
    return;
  }
  std::u16string_view lon = take_field(text);
  std::u16string_view lat = take_field(text);
  if (order != 0) std::swap(lon, lat);
  read_angle(lon, unit, 0, &read.x, status);
  if (*status != TW_SUCCESS) return;
  TWverify_lon(read.x, &read.x, status);
  if (*status != TW_SUCCESS) return;
  read_angle(lat, unit, 1, &read.y, status);
  if (*status != TW_SUCCESS) return;
  TWverify_lat(read.y, &read.y, status);
  if (*status != TW_SUCCESS) return;
  scan_number(text, &read.z);
  *point = {read.x, read.y, height_unit * read.z};
}

void parse_enh_wide(std::u16string_view text, int16_t order, double unit, double height_unit,
                    CoordinateTriple* point, TWstatus* status) {
  CoordinateTriple read = {0, 0, 0};
  *status = TW_SUCCESS;
  if (text.find_first_not_of(u"0123456789,.-+eE \n") != text.npos) {
    *status = TW_BAD_TEXT;
    return;
  }
  std::u16string_view easting = take_field(text);
  std::u16string_view northing = take_field(text);
  if (order != 0) std::swap(easting, northing);
  read_length(easting, unit, &read.x, status);
  if (*status != TW_SUCCESS) return;
  read_length(northing, unit, &read.y, status);
  if (*status != TW_SUCCESS) return;
  scan_number(text, &read.z);
  *point = {read.x, read.y, height_unit * read.z};
}

void parse_xyz_wide(std::u16string_view text, double unit, CoordinateTriple* point,
                    TWstatus* status) {
  CoordinateTriple read = {0, 0, 0};
  *status = TW_SUCCESS;
  // By contract: neither a plus sign nor an exponent.
  if (text.find_first_not_of(u"0123456789,.- \n") != text.npos) {
    *status = TW_BAD_TEXT;
    return;
  }
  for (double* element : {&read.x, &read.y, &read.z}) {
    read_length(take_field(text), unit, element, status);
    if (*status != TW_SUCCESS) return;
  }
  *point = read;
}

}  // namespace

void TWllh_to_ascii(const CoordinateTriple* point, AngleUnit unit, int16_t order,
                    int16_t with_height, int16_t height_precision, double height_unit, char* text,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    char lon[kFieldSize];
    char lat[kFieldSize];
    TWrad_to_ascii(point->x, unit, 0, lon, status);
    if (*status == TW_SUCCESS) TWrad_to_ascii(point->y, unit, 1, lat, status);
    if (*status != TW_SUCCESS) return;
    std::string line = ordered(order, lon, lat);
    if (with_height != 0) {
      line += ", " + height_field<kFieldSize>(point->z, height_precision, height_unit);
    }
    copy_whole(line, text);
  });
}

void TWenh_to_ascii(const CoordinateTriple* point, int16_t order, int16_t precision, double unit,
                    int16_t with_height, int16_t height_precision, double height_unit, char* text,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    std::string northing;
    const std::string easting = length_field<kGridFieldSize>(point->x, precision, unit, status);
    if (*status == TW_SUCCESS) {
      northing = length_field<kGridFieldSize>(point->y, precision, unit, status);
    }
    if (*status != TW_SUCCESS) return;
    std::string line = ordered(order, easting, northing);
    if (with_height != 0) {
      line += ", " + height_field<kGridFieldSize>(point->z, height_precision, height_unit);
    }
    copy_whole(line, text);
  });
}

void TWxyz_to_ascii(const CoordinateTriple* point, int16_t precision, double unit, char* text,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    std::string line;
    for (const double element : {point->x, point->y, point->z}) {
      if (!line.empty()) line += ", ";
      line += length_field<kFieldSize>(element, precision, unit, status);
      if (*status != TW_SUCCESS) return;
    }
    copy_whole(line, text);
  });
}

void TWascii_to_llh(const char* text, AngleUnit unit, int16_t order, double height_unit,
                    CoordinateTriple* point, TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    parse_llh_wide(widen(text, kReadLimit), with_wide_format(unit), order, height_unit, point,
                   status);
  });
}

void TWascii_to_enh(const char* text, int16_t order, double unit, double height_unit,
                    CoordinateTriple* point, TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    parse_enh_wide(widen(text, kReadLimit), order, unit, height_unit, point, status);
  });
}

void TWascii_to_xyz(const char* text, double unit, CoordinateTriple* point, TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] { parse_xyz_wide(widen(text, kReadLimit), unit, point, status); });
}
