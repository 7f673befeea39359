// What the standard library of older WebAssembly compilers lacks: std::bit_cast, and numbers with a
// fraction in std::from_chars and std::to_chars.  The compiler reads this before every source.
#pragma once

#ifdef __cplusplus
#include <bit>
#include <charconv>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <string>

namespace std {

#ifndef __cpp_lib_bit_cast
template <class To, class From>
constexpr To bit_cast(const From& from) noexcept {
  return __builtin_bit_cast(To, from);
}
#endif

// By strtod(), which reads every text to the nearest number here and knows the "C" locale alone.
inline from_chars_result from_chars(const char* first, const char* last, double& value,
                                    chars_format format = chars_format::general) {
  const char* p = first;
  const auto digits = [&] {
    const char* begin = p;
    while (p != last && *p >= '0' && *p <= '9') ++p;
    return p - begin;
  };
  if (p != last && *p == '-') ++p;
  auto count = digits();
  if (p != last && *p == '.') {
    ++p;
    count += digits();
  }
  if (count == 0) return {first, errc::invalid_argument};
  if (format != chars_format::fixed && p != last && (*p == 'e' || *p == 'E')) {
    const char* mantissa_end = p++;
    if (p != last && (*p == '-' || *p == '+')) ++p;
    if (digits() == 0) p = mantissa_end;
  }
  const double read = strtod(string(first, p).c_str(), nullptr);
  if (__builtin_isinf(read)) return {p, errc::result_out_of_range};
  value = read;
  return {p, errc()};
}

inline to_chars_result put_chars(char* first, char* last, const char* text, int length) {
  if (length < 0 || length > last - first) return {last, errc::value_too_large};
  memcpy(first, text, static_cast<size_t>(length));
  return {first + length, errc()};
}

inline to_chars_result to_chars(char* first, char* last, double value, chars_format format,
                                int precision) {
  char text[512];
  const int length = snprintf(text, sizeof text, format == chars_format::fixed ? "%.*f" : "%.*g",
                              precision, value);
  if (length >= static_cast<int>(sizeof text)) return {last, errc::value_too_large};
  return put_chars(first, last, text, length);
}

// The fewest digits that lead back to the number.
inline to_chars_result to_chars(char* first, char* last, double value) {
  char text[32];
  int length = 0;
  for (int digits = 1; digits <= numeric_limits<double>::max_digits10; ++digits) {
    length = snprintf(text, sizeof text, "%.*g", digits, value);
    if (strtod(text, nullptr) == value) break;
  }
  return put_chars(first, last, text, length);
}

}  // namespace std
#endif
