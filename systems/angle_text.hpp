// The pieces of which texts of angles and positions are made, and an angle of some of them.
#pragma once

#include <array>
#include <cstddef>
#include <span>
#include <string>
#include <string_view>

#include "tidewater/position_text.hpp"

namespace tidewater::detail {

enum class TokenKind : unsigned char {
  number,
  degree,  // the marks behind a number, in the order of the parts
  minute,
  second,
  letter,  // N S E W
  sign,    // + -
  colon,
  field,  // , ; tab /
};

struct Token {
  TokenKind kind;
  char symbol = 0;            // letter in upper case, sign, field separator
  bool blank_before = false;  // also at the beginning of the text
  double value = 0;
  int whole = 0;          // digits before the decimal mark
  bool fraction = false;  // has a decimal mark
};

// More pieces than any angle or position has.
inline constexpr std::size_t kMostTokens = 40;

struct Tokens {
  std::array<Token, kMostTokens> tokens;
  std::size_t count = 0;
  std::string reason;  // a sentence if the text has something else in it

  std::span<const Token> all() const { return {tokens.data(), count}; }
};

void tokenize(std::string_view text, bool decimal_comma, Tokens& out);

// The text in quotation marks, cut where it is long.
std::string quoted(std::string_view text);

// An angle of all these pieces; signed_packed takes the packed forms of ISO 6709, which have a
// sign.
ParsedAngle angle_of(std::span<const Token> tokens, Axis axis, bool signed_packed,
                     std::string_view text);

// Whether the value can be an angle of this axis; else the reason, in a sentence.
std::string range_reason(double degrees, Axis axis, std::string_view text);

// Reads a plain decimal number of at most three digits of degrees, with a sign or without, and the
// blanks around it.  What stands behind them, or null where there is no such number.
const char* read_plain(const char* begin, const char* end, double* value);

}  // namespace tidewater::detail
