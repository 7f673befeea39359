// Bytes as the texts of the C functions, narrow and wide, and any numbers written as text: what is
// written stays within the room that the headers name, what is read is a figure or a word.

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <string>
#include <vector>

#include "bytes.hpp"
#include "tidewater/tidewater.h"

namespace {

void require(bool holds) {
  if (!holds) std::abort();
}

double number(Bytes& bytes) {
  const std::uint8_t kind = bytes.byte();
  if (kind < 100) return (kind - 50) * 0.0625;
  if (kind < 180) return static_cast<std::int32_t>(bytes.bits(4)) * 1e-9;
  return bytes.any_double();
}

// Room of exactly so many characters, so that the sanitizers see what is written behind it.
template <class Char>
class Room {
 public:
  explicit Room(std::size_t size) : characters_(size, Char{'#'}) { characters_.shrink_to_fit(); }
  Char* data() { return characters_.data(); }
  bool ended() const {
    return std::find(characters_.begin(), characters_.end(), Char{0}) != characters_.end();
  }

 private:
  std::vector<Char> characters_;
};

constexpr const char* kFormats[] = {"dd:mm:ss", "dd.mmss", "dd", "dd:mm", ":", ""};
// A number of 309 digits with its sign, separator, letter and 32767 decimals.
constexpr std::size_t kWhole = 33200;

template <class Call>
void writes(std::size_t room, bool may_refuse, const Call& call) {
  Room<char> text(room);
  TWstatus status = 0;
  call(text.data(), &status);
  require((may_refuse && !TW_OK(status)) || text.ended());
}

template <class Call>
void writes_wide(std::size_t room, bool may_refuse, const Call& call) {
  Room<TWchar16> text(room);
  TWstatus status = 0;
  call(text.data(), &status);
  require((may_refuse && !TW_OK(status)) || text.ended());
}

// Reads by a function; what it gives is a figure, or the place is as it was.
template <class Call>
void reads(const Call& call) {
  constexpr double kSentinel = -7.25e77;
  double value = kSentinel;
  TWstatus status = 0;
  call(&value, &status);
  require(!TW_OK(status) || value != kSentinel);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  Bytes bytes(data, size);
  AngleUnit unit = {}, wide_unit = {};
  const char* format = kFormats[bytes.byte() % std::size(kFormats)];
  std::strcpy(unit.format, format);
  std::copy(format, format + std::strlen(format), wide_unit.wide_format);
  unit.precision = wide_unit.precision = bytes.byte() < 200
                                             ? static_cast<int16_t>(bytes.byte() % 20)
                                             : static_cast<int16_t>(bytes.bits(2));
  unit.hemisphere_mode = wide_unit.hemisphere_mode = static_cast<int16_t>(bytes.byte() % 7);
  unit.factor = wide_unit.factor = bytes.byte() % 2 == 0 ? 4.84813681109536e-06 : number(bytes);
  const auto axis = static_cast<int16_t>(bytes.byte() % 3);
  const auto order = static_cast<int16_t>(bytes.byte() % 2);
  const auto heights = static_cast<int16_t>(bytes.byte() % 2);
  const int16_t precision = unit.precision;
  const CoordinateTriple point = {number(bytes), number(bytes), number(bytes)};
  const double metres = number(bytes), v = point.x;

  writes(50, false, [&](char* t, TWstatus* s) { TWrad_to_ascii(v, unit, axis, t, s); });
  writes_wide(kWhole, false,
              [&](TWchar16* t, TWstatus* s) { TWrad_to_ascii_wide(v, wide_unit, axis, t, s); });
  writes(kWhole, true, [&](char* t, TWstatus* s) { TWmet_to_ascii(v, precision, metres, t, s); });
  writes(kWhole, true,
         [&](char* t, TWstatus* s) { TWsq_met_to_ascii(v, precision, metres, t, s); });
  writes(kWhole, true,
         [&](char* t, TWstatus* s) { TWcub_met_to_ascii(v, precision, metres, t, s); });
  writes_wide(kWhole, true,
              [&](TWchar16* t, TWstatus* s) { TWmet_to_ascii_wide(v, precision, metres, t, s); });
  writes_wide(kWhole, true, [&](TWchar16* t, TWstatus* s) {
    TWsq_met_to_ascii_wide(v, precision, metres, t, s);
  });
  writes_wide(kWhole, true, [&](TWchar16* t, TWstatus* s) {
    TWcub_met_to_ascii_wide(v, precision, metres, t, s);
  });
  writes(50, true, [&](char* t, TWstatus* s) { TWscalr_to_asc(v, precision, t, s); });
  writes(156, false, [&](char* t, TWstatus* s) {
    TWllh_to_ascii(&point, unit, order, heights, precision, metres, t, s);
  });
  writes(182, true, [&](char* t, TWstatus* s) {
    TWenh_to_ascii(&point, order, precision, metres, heights, precision, metres, t, s);
  });
  writes(158, true, [&](char* t, TWstatus* s) { TWxyz_to_ascii(&point, precision, metres, t, s); });

  std::string rest = bytes.rest();
  rest = rest.substr(0, rest.find('\0'));
  // Of exactly the length of the text, and of the wide one room for the character that may come.
  std::vector<char> narrow(rest.c_str(), rest.c_str() + rest.size() + 1);
  std::vector<TWchar16> wide;
  for (std::size_t i = 0; i < rest.size(); ++i) {
    // Two bytes of the text that are no plain character make one unit.
    const auto b = static_cast<unsigned char>(rest[i]);
    const bool pair = b >= 0x80 && i + 1 < rest.size();
    wide.push_back(
        static_cast<TWchar16>(pair ? b << 8 | static_cast<unsigned char>(rest[++i]) : b));
  }
  wide.insert(wide.end(), 2, TWchar16{0});
  const char* text = narrow.data();
  reads([&](double* value, TWstatus* s) { TWascii_to_rad(text, unit, axis, value, s); });
  reads([&](double* value, TWstatus* s) { TWascii_to_met(text, metres, value, s); });
  reads([&](double* value, TWstatus* s) { TWascii_to_sq_met(text, metres, value, s); });
  reads([&](double* value, TWstatus* s) { TWascii_to_cub_met(text, metres, value, s); });
  reads([&](double* value, TWstatus* s) { TWascii_to_met_wide(wide.data(), metres, value, s); });
  reads([&](double* value, TWstatus* s) { TWascii_to_sq_met_wide(wide.data(), metres, value, s); });
  reads(
      [&](double* value, TWstatus* s) { TWascii_to_cub_met_wide(wide.data(), metres, value, s); });
  CoordinateTriple read = {};
  TWstatus status = 0;
  TWascii_to_llh(text, unit, order, metres, &read, &status);
  require(!TW_OK(status) || (std::fabs(read.x) <= 3.1415926535897936 && std::fabs(read.y) < 1.571));
  TWascii_to_enh(text, order, metres, metres, &read, &status);
  TWascii_to_xyz(text, metres, &read, &status);
  int16_t type = 0;
  double zone[10] = {};
  for (const auto& find : {TWspcs27, TWspcs83}) {
    find(text, &type, &zone[0], &zone[1], &zone[2], &zone[3], &zone[4], &zone[5], &zone[6],
         &zone[7], &zone[8], &zone[9], &status);
    require(!TW_OK(status) || (type >= -1 && type <= 1));
  }
  reads([&](double* value, TWstatus* s) {
    TWascii_to_rad_wide(wide.data(), wide_unit, axis, value, s);  // changes the text: last
  });
  return 0;
}
