#include "text/wide.hpp"

#include <algorithm>
#include <climits>
#include <cstdlib>
#include <cwchar>

namespace tidewater::detail {

namespace {

// Characters whose byte is their code in every locale's encoding; the C library need not be asked.
// Backslash and tilde have given way to national characters in some.
constexpr bool is_invariant(char32_t c) {
  return (c >= U' ' && c < U'~' && c != U'\\') || c == U'\n';
}

}  // namespace

std::u16string widen(std::string_view narrow, std::size_t limit) {
  std::u16string wide;
  wide.reserve(std::min(narrow.size(), limit) + 1);
  std::mbstate_t state = {};
  while (!narrow.empty() && wide.size() < limit) {
    if (is_invariant(static_cast<unsigned char>(narrow.front()))) {
      wide += static_cast<char16_t>(narrow.front());
      narrow.remove_prefix(1);
      continue;
    }
    wchar_t character = 0;
    std::size_t bytes = std::mbrtowc(&character, narrow.data(), narrow.size(), &state);
    auto code = static_cast<char32_t>(character);
    // An error or an incomplete character: the next byte may begin a good one.
    if (bytes > narrow.size()) {
      code = kReplacement;
      bytes = 1;
      state = {};
    }
    wide += code <= 0xFFFF ? static_cast<char16_t>(code) : kReplacement;
    narrow.remove_prefix(std::max<std::size_t>(bytes, 1));
  }
  return wide;
}

std::u16string widen_or(std::string_view narrow, std::u16string_view otherwise) {
  std::u16string wide = widen(narrow, narrow.size());
  const bool whole = wide.find(kReplacement) == std::u16string::npos;
  return whole && !wide.empty() ? wide : std::u16string(otherwise);
}

std::string narrow(std::u16string_view wide) {
  std::string narrow;
  std::mbstate_t state = {};
  char bytes[MB_LEN_MAX];
  for (const char16_t unit : wide) {
    if (is_invariant(unit)) {
      narrow += static_cast<char>(unit);
      continue;
    }
    const std::size_t count = std::wcrtomb(bytes, unit, &state);
    if (count <= sizeof bytes) {
      narrow.append(bytes, count);
    } else {
      narrow += '?';
      state = {};
    }
  }
  return narrow;
}

void copy_cut(std::string_view text, std::size_t capacity, char* out) {
  std::size_t fitting = text.size();
  if (fitting >= capacity) {
    fitting = 0;
    std::mbstate_t state = {};
    for (;;) {
      std::size_t bytes = std::mbrlen(text.data() + fitting, text.size() - fitting, &state);
      if (bytes > text.size()) {
        bytes = 1;
        state = {};
      }
      if (fitting + bytes >= capacity) break;
      fitting += bytes;
    }
  }
  copy_whole(text.substr(0, fitting), out);
}

void copy_whole(std::string_view text, char* out) {
  *std::copy(text.begin(), text.end(), out) = '\0';
}

void copy_whole(std::u16string_view text, char16_t* out) {
  *std::copy(text.begin(), text.end(), out) = u'\0';
}

std::string decimal_text(double value, int precision) {
  return formatted("%.*f", precision, value);
}

const char* scan_number(const char* text, double* number) {
  char* end = nullptr;
  const double value = std::strtod(text, &end);
  if (end == text) return nullptr;
  *number = value;
  return end;
}

void scan_number(std::u16string_view text, double* number) {
  scan_number(narrow(text).c_str(), number);
}

}  // namespace tidewater::detail
