#include "json_text.hpp"

#include <array>
#include <cstdio>

namespace tidewater::command {

namespace {

// Bytes of the UTF-8 character that text begins with; 0 where it begins with none (RFC 3629,
// section 4).
std::size_t utf8_length(std::string_view text) {
  const auto byte = [text](std::size_t i) {
    return i < text.size() ? static_cast<unsigned char>(text[i]) : 0U;
  };
  const auto is_tail = [byte](std::size_t i) { return (byte(i) & 0xC0U) == 0x80U; };
  const unsigned lead = byte(0);
  const unsigned second = byte(1);
  if (lead < 0x80) return 1;
  if (lead >= 0xC2 && lead <= 0xDF) return is_tail(1) ? 2 : 0;
  if (lead >= 0xE0 && lead <= 0xEF) {
    const bool overlong = lead == 0xE0 && second < 0xA0;
    const bool surrogate = lead == 0xED && second > 0x9F;
    return is_tail(1) && is_tail(2) && !overlong && !surrogate ? 3 : 0;
  }
  if (lead >= 0xF0 && lead <= 0xF4) {
    const bool overlong = lead == 0xF0 && second < 0x90;
    const bool beyond = lead == 0xF4 && second > 0x8F;
    return is_tail(1) && is_tail(2) && is_tail(3) && !overlong && !beyond ? 4 : 0;
  }
  return 0;
}

}  // namespace

void append_json_string(std::string& json, std::string_view text) {
  json += '"';
  while (!text.empty()) {
    const std::size_t length = utf8_length(text);
    const char c = text[0];
    if (length == 0) {
      json += "\xEF\xBF\xBD";
    } else if (c == '"' || c == '\\') {
      json += '\\';
      json += c;
    } else if (length == 1 && (static_cast<unsigned char>(c) < ' ' || c == 127)) {
      std::array<char, 8> escape;
      std::snprintf(escape.data(), escape.size(), "\\u%04x", static_cast<unsigned>(c));
      json += escape.data();
    } else {
      json += text.substr(0, length);
    }
    text.remove_prefix(length == 0 ? 1 : length);
  }
  json += '"';
}

}  // namespace tidewater::command
