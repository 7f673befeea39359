#include "words.hpp"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace tidewater::detail {

std::string_view trimmed(std::string_view text) {
  constexpr std::string_view kBlanks = " \t\r\n";
  const auto first = text.find_first_not_of(kBlanks);
  if (first == std::string_view::npos) return {};
  return text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

std::optional<int> registry_code(std::string_view text) {
  text = trimmed(text);
  const auto starts = [&](std::string_view head) {
    return text.size() >= head.size() &&
           std::equal(head.begin(), head.end(), text.begin(), [](char a, char b) {
             return a == (b >= 'a' && b <= 'z' ? static_cast<char>(b - 'a' + 'A') : b);
           });
  };
  for (const std::string_view head : {"URN:OGC:DEF:CRS:EPSG::", "EPSG::", "EPSG:"}) {
    if (!starts(head)) continue;
    text.remove_prefix(head.size());
    break;
  }
  int code = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), code);
  if (error != std::errc() || end != text.data() + text.size() || code <= 0) return std::nullopt;
  return code;
}

std::optional<double> number(std::string_view text) {
  if (text.starts_with('+')) text.remove_prefix(1);
  double value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (error != std::errc() || end != text.data() + text.size() || !std::isfinite(value)) {
    return std::nullopt;
  }
  return value;
}

bool horizontal_axes(std::string_view axes) {
  if (axes.size() < 2 || axes.size() > 3) return false;
  const auto along = [&](std::string_view letters) {
    return letters.find(axes[0]) != letters.npos || letters.find(axes[1]) != letters.npos;
  };
  return along("EW") && along("NS") && (axes.size() == 2 || axes[2] == 'U');
}

std::vector<std::string> words_of(std::string_view text) {
  std::vector<std::string> words;
  std::string word;
  bool quoted = false;
  for (const char c : text) {
    if (c == '"') {
      quoted = !quoted;
    } else if (!quoted && (c == ' ' || c == '\t' || c == '\r' || c == '\n')) {
      if (!word.empty()) words.push_back(std::move(word));
      word.clear();
    } else {
      word += c;
    }
  }
  if (!word.empty()) words.push_back(std::move(word));
  return words;
}

}  // namespace tidewater::detail
