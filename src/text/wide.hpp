// 16-bit text: to and from the narrow text of the locale in force, and numbers as text.
#pragma once

#include <cstddef>
#include <cstdio>
#include <new>
#include <string>
#include <string_view>

#include "tidewater/frame.h"

namespace tidewater::detail {

// Takes the place of a narrow character that has no 16-bit form; no reader admits it.
inline constexpr char16_t kReplacement = u'\uFFFD';

// At most limit characters of the text in 16 bits.
std::u16string widen(std::string_view narrow, std::size_t limit);

// The text in 16 bits, or the other one where it is empty or cannot be widened whole.
std::u16string widen_or(std::string_view narrow, std::u16string_view otherwise);

// A character that the locale does not have becomes a question mark.
std::string narrow(std::u16string_view wide);

// Writes what fits, in whole characters, and the terminator: capacity bytes at most.
void copy_cut(std::string_view text, std::size_t capacity, char* out);

// Writes the whole text and the terminator.
void copy_whole(std::string_view text, char* out);
void copy_whole(std::u16string_view text, char16_t* out);

// The C library's formatted output, however long; empty where it cannot be formatted.
template <class... Arguments>
std::string formatted(const char* format, Arguments... arguments) {
  char usual[64];
  const int length = std::snprintf(usual, sizeof usual, format, arguments...);
  if (length <= 0) return {};
  const auto size = static_cast<std::size_t>(length);
  if (size < sizeof usual) return {usual, size};
  std::string text(size, '\0');
  std::snprintf(text.data(), size + 1, format, arguments...);
  return text;
}

// The number with "%.*f".
std::string decimal_text(double value, int precision);

// Reads a number as "%lf" does: blanks before it are skipped, the decimal point is that of the
// locale.  The end of the number, or null where there is none; the number is then as it was.
const char* scan_number(const char* text, double* number);
void scan_number(std::u16string_view text, double* number);

// Runs what may allocate behind the C interface.
template <class Work>
void without_exceptions(TWstatus* status, Work work) {
  try {
    work();
  } catch (const std::bad_alloc&) {
    *status = TW_NO_MEMORY;
  }
}

}  // namespace tidewater::detail
