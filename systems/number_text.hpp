// Decimal numbers in text, whatever the locale.
#pragma once

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <limits>
#include <system_error>

namespace tidewater::detail {

inline constexpr double kPowersOfTen[] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                          1e8,  1e9,  1e10, 1e11, 1e12, 1e13, 1e14, 1e15,
                                          1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22};

inline bool is_digit(char c) { return c >= '0' && c <= '9'; }

// What was read: digits, with a fraction or without, no sign and no exponent.
struct Digits {
  const char* end;  // the first character that is no part of it; the beginning where there is none
  double value = 0;
  int whole = 0;      // digits before the decimal mark
  int fraction = -1;  // digits behind it; -1 without a mark
};

// Reads 12, 12.5, 12. or .5 to the nearest double.  The mark may also be `other_mark` between two
// digits.
inline Digits read_digits(const char* begin, const char* end, char other_mark = '.') {
  Digits read{begin};
  std::uint64_t mantissa = 0;
  const char* p = begin;
  for (; p != end && is_digit(*p); ++p) {
    mantissa = mantissa * 10 + static_cast<std::uint64_t>(*p - '0');
  }
  read.whole = static_cast<int>(p - begin);
  const char* mark = end;
  const bool at_mark =
      p != end &&
      (*p == '.' || (*p == other_mark && read.whole > 0 && p + 1 != end && is_digit(p[1])));
  if (at_mark && (read.whole > 0 || (p + 1 != end && is_digit(p[1])))) {
    mark = p++;
    const char* first = p;
    for (; p != end && is_digit(*p); ++p) {
      mantissa = mantissa * 10 + static_cast<std::uint64_t>(*p - '0');
    }
    read.fraction = static_cast<int>(p - first);
  }
  if (read.whole == 0 && read.fraction <= 0) return read;
  read.end = p;
  const int decimals = read.fraction > 0 ? read.fraction : 0;
  // Both operands are exact, so that the quotient is the nearest double.
  if (read.whole + decimals <= 19 && mantissa <= std::uint64_t{1} << 53) {
    read.value = static_cast<double>(mantissa) / kPowersOfTen[decimals];
    return read;
  }
  char copy[400];  // what stands behind is less than a double tells
  const auto length = std::min<std::ptrdiff_t>(p - begin, std::size(copy));
  std::copy_n(begin, length, copy);
  if (mark != end && mark - begin < length) copy[mark - begin] = '.';
  const auto result = std::from_chars(copy, copy + length, read.value, std::chars_format::fixed);
  // Too large or too small for a double: the value is left alone.
  if (result.ec == std::errc::result_out_of_range && read.whole > 300) {
    read.value = std::numeric_limits<double>::infinity();
  }
  return read;
}

}  // namespace tidewater::detail
