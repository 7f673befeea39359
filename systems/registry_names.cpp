#include "registry_names.hpp"

#include <algorithm>
#include <array>

namespace tidewater::detail {

namespace {

// The plain letters of U+00C0 to U+017F; a blank where the character is no letter.
constexpr std::array<const char*, 192> kPlainLetters = {
    "a", "a", "a",  "a",  "a", "a", "ae", "c", "e", "e", "e", "e", "i", "i", "i",  "i",   // 00C0
    "d", "n", "o",  "o",  "o", "o", "o",  " ", "o", "u", "u", "u", "u", "y", "th", "ss",  // 00D0
    "a", "a", "a",  "a",  "a", "a", "ae", "c", "e", "e", "e", "e", "i", "i", "i",  "i",   // 00E0
    "d", "n", "o",  "o",  "o", "o", "o",  " ", "o", "u", "u", "u", "u", "y", "th", "y",   // 00F0
    "a", "a", "a",  "a",  "a", "a", "c",  "c", "c", "c", "c", "c", "c", "c", "d",  "d",   // 0100
    "d", "d", "e",  "e",  "e", "e", "e",  "e", "e", "e", "e", "e", "g", "g", "g",  "g",   // 0110
    "g", "g", "g",  "g",  "h", "h", "h",  "h", "i", "i", "i", "i", "i", "i", "i",  "i",   // 0120
    "i", "i", "ij", "ij", "j", "j", "k",  "k", "k", "l", "l", "l", "l", "l", "l",  "l",   // 0130
    "l", "l", "l",  "n",  "n", "n", "n",  "n", "n", "n", "n", "n", "o", "o", "o",  "o",   // 0140
    "o", "o", "oe", "oe", "r", "r", "r",  "r", "r", "r", "s", "s", "s", "s", "s",  "s",   // 0150
    "s", "s", "t",  "t",  "t", "t", "t",  "t", "u", "u", "u", "u", "u", "u", "u",  "u",   // 0160
    "u", "u", "u",  "u",  "w", "w", "y",  "y", "y", "z", "z", "z", "z", "z", "z",  "s"};  // 0170

bool is_word_start(std::string_view name, std::size_t at) { return at == 0 || name[at - 1] == ' '; }

// The best place of one word in a name.
Match place_of(std::string_view name, std::string_view word) {
  Match best = Match::none;
  for (std::size_t at = name.find(word); at != std::string_view::npos;
       at = name.find(word, at + 1)) {
    const std::size_t end = at + word.size();
    if (!is_word_start(name, at)) {
      best = std::min(best, Match::anywhere);
    } else if (end == name.size() || name[end] == ' ') {
      return Match::whole_words;
    } else {
      best = std::min(best, Match::beginnings);
    }
  }
  return best;
}

}  // namespace

std::string folded(std::string_view text) {
  std::string out;
  out.reserve(text.size());
  bool apart = false;
  const auto put = [&](std::string_view letters) {
    if (apart && !out.empty()) out += ' ';
    apart = false;
    out += letters;
  };
  for (std::size_t i = 0; i < text.size(); ++i) {
    const auto c = static_cast<unsigned char>(text[i]);
    const unsigned next = i + 1 < text.size() ? static_cast<unsigned char>(text[i + 1]) : 0U;
    if (c >= 'A' && c <= 'Z') {
      const char small = static_cast<char>(c - 'A' + 'a');
      put({&small, 1});
    } else if (c == '\'') {
      // "Clarke's" is one word.
    } else if (c >= 0xC3 && c <= 0xC5 && next >= 0x80 && next <= 0xBF) {
      const std::string_view plain = kPlainLetters[(c - 0xC3U) * 64 + (next - 0x80U)];
      if (plain == " ") {
        apart = true;
      } else {
        put(plain);
      }
      ++i;
    } else if ((c == 0xCC && next >= 0x80) || (c == 0xCD && next >= 0x80 && next <= 0xAF)) {
      ++i;  // an accent that stands behind its letter
    } else if (c == 0xC2 && next >= 0x80) {
      apart = true;  // degree signs and the like
      ++i;
    } else if (c == 0xE2 && next == 0x80) {
      const char third = i + 2 < text.size() ? text[i + 2] : '\0';
      if (third != '\x99') apart = true;  // dashes and quotes, but for an apostrophe
      i += 2;
    } else if ((c >= 'a' && c <= 'z') || (c >= '0' && c <= '9') || c >= 0xC6) {
      put(text.substr(i, 1));  // other scripts stand as they are
    } else if (c >= 0x80) {
      out += text[i];
    } else {
      apart = true;
    }
  }
  return out;
}

std::string name_key(std::string_view text) {
  std::string out = folded(text);
  std::erase(out, ' ');
  return out;
}

std::vector<std::string_view> split_words(std::string_view folded_text) {
  std::vector<std::string_view> out;
  while (!folded_text.empty()) {
    const std::size_t end = std::min(folded_text.find(' '), folded_text.size());
    if (end > 0) out.push_back(folded_text.substr(0, end));
    folded_text.remove_prefix(std::min(end + 1, folded_text.size()));
  }
  return out;
}

Match match_of(std::string_view name, const std::vector<std::string_view>& words,
               std::string_view query) {
  if (name == query) return Match::whole_name;
  Match worst = Match::whole_words;
  for (const std::string_view word : words) {
    worst = std::max(worst, place_of(name, word));
    if (worst == Match::none) break;
  }
  return worst;
}

std::size_t letters_apart(std::string_view a, std::string_view b, std::size_t limit) {
  if (a.size() > b.size()) std::swap(a, b);
  if (b.size() - a.size() > limit || b.size() > 127) return limit + 1;
  // Three rows of the table of distances between beginnings.
  std::array<std::array<std::size_t, 128>, 3> rows{};
  for (std::size_t j = 0; j <= a.size(); ++j) rows[0][j] = j;
  for (std::size_t i = 1; i <= b.size(); ++i) {
    auto& row = rows[i % 3];
    const auto& above = rows[(i - 1) % 3];
    const auto& before = rows[(i + 1) % 3];
    row[0] = i;
    std::size_t least = i;
    for (std::size_t j = 1; j <= a.size(); ++j) {
      row[j] = std::min({above[j] + 1, row[j - 1] + 1, above[j - 1] + (a[j - 1] != b[i - 1])});
      if (i > 1 && j > 1 && a[j - 1] == b[i - 2] && a[j - 2] == b[i - 1]) {
        row[j] = std::min(row[j], before[j - 2] + 1);
      }
      least = std::min(least, row[j]);
    }
    if (least > limit) return limit + 1;
  }
  return std::min(rows[b.size() % 3][a.size()], limit + 1);
}

}  // namespace tidewater::detail
