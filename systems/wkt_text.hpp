// The syntax of well-known text, whatever it describes.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace tidewater::detail {

// KEYWORD["text",12.5,word,OTHER[...]]: what stands between the brackets, in order.
struct WktNode {
  enum class Kind { object, text, number, word };
  Kind kind = Kind::object;
  std::string value;  // keyword in upper case, text without its quotation marks, or word
  double number = 0;
  std::size_t at = 0;  // place of its first character, from 1
  std::vector<WktNode> children;

  bool is(std::string_view keyword) const { return kind == Kind::object && value == keyword; }
  // The first object with one of these keywords; null when there is none.
  const WktNode* find(std::string_view keyword, std::string_view or_keyword = {},
                      std::string_view or_third = {}, std::string_view or_fourth = {}) const;
  // The child in this place if it is a text, a number; else empty or `otherwise`.
  std::string text(std::size_t place) const;
  double figure(std::size_t place, double otherwise) const;
};

// One object, and behind it perhaps others after commas (the vertical system of .prj files).
// Throws an Error that names what is wrong and where.  Texts above a megabyte and brackets deeper
// than 24 are refused.
std::vector<WktNode> parse_wkt(std::string_view text);

}  // namespace tidewater::detail
