// Angles as people write them.

#include "angle_text.hpp"

#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>

#include "number_text.hpp"

namespace tidewater {

namespace detail {

namespace {

constexpr bool is_blank(char c) { return c == ' ' || c == '\n' || c == '\r'; }

constexpr char upper(char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c; }
constexpr bool is_letter(char c) { return upper(c) >= 'A' && upper(c) <= 'Z'; }

struct Mark {
  std::string_view text;
  TokenKind kind;
  char symbol = 0;
};

// The longer one first where one begins another.
constexpr Mark kMarks[] = {
    {"\u00B0", TokenKind::degree},        // degree sign
    {"\u00BA", TokenKind::degree},        // masculine ordinal
    {"\u02DA", TokenKind::degree},        // ring above
    {"\xB0", TokenKind::degree},          // the degree sign of Latin 1
    {"''", TokenKind::second},            //
    {"\"", TokenKind::second},            //
    {"'", TokenKind::minute},             //
    {"\u2033", TokenKind::second},        // double prime
    {"\u201D", TokenKind::second},        // quotation marks
    {"\u201C", TokenKind::second},        //
    {"\u02BA", TokenKind::second},        // modifier letter double prime
    {"\u2032\u2032", TokenKind::second},  // two primes
    {"\u2019\u2019", TokenKind::second},  // two apostrophes
    {"\u2032", TokenKind::minute},        // prime
    {"\u2019", TokenKind::minute},        // quotation marks
    {"\u2018", TokenKind::minute},        //
    {"\u02B9", TokenKind::minute},        // modifier letter prime
    {"\u00B4", TokenKind::minute},        // acute accent
    {"`", TokenKind::minute},             //
    {"+", TokenKind::sign, '+'},          //
    {"-", TokenKind::sign, '-'},          //
    {"\u2212", TokenKind::sign, '-'},     // minus sign
    {"\u2013", TokenKind::sign, '-'},     // en dash
    {":", TokenKind::colon},              //
    {",", TokenKind::field, ','},         //
    {";", TokenKind::field, ';'},         //
    {"\t", TokenKind::field, '\t'},       //
    {"/", TokenKind::field, '/'},         //
};

// In upper case.  A lone S is south unless a word has stood for the minutes.
constexpr Mark kWords[] = {
    {"N", TokenKind::letter, 'N'},     {"S", TokenKind::letter, 'S'},
    {"E", TokenKind::letter, 'E'},     {"W", TokenKind::letter, 'W'},
    {"NORTH", TokenKind::letter, 'N'}, {"SOUTH", TokenKind::letter, 'S'},
    {"EAST", TokenKind::letter, 'E'},  {"WEST", TokenKind::letter, 'W'},
    {"D", TokenKind::degree},          {"DEG", TokenKind::degree},
    {"DEGREE", TokenKind::degree},     {"DEGREES", TokenKind::degree},
    {"M", TokenKind::minute},          {"MIN", TokenKind::minute},
    {"MINUTE", TokenKind::minute},     {"MINUTES", TokenKind::minute},
    {"SEC", TokenKind::second},        {"SECOND", TokenKind::second},
    {"SECONDS", TokenKind::second},
};

const Mark* find_word(std::string_view word) {
  for (const Mark& candidate : kWords) {
    if (candidate.text.size() != word.size()) continue;
    bool same = true;
    for (std::size_t i = 0; same && i < word.size(); ++i) {
      same = upper(word[i]) == candidate.text[i];
    }
    if (same) return &candidate;
  }
  return nullptr;
}

bool find_letter(std::string_view word) {
  const Mark* found = find_word(word);
  return found != nullptr && found->kind == TokenKind::letter;
}

// The end of an exponent that stands here, or null.  It needs a sign: a bare E is a hemisphere.
const char* exponent_end(const char* p, const char* end) {
  if (end - p < 3 || upper(*p) != 'E' || (p[1] != '-' && p[1] != '+') || !is_digit(p[2])) {
    return nullptr;
  }
  p += 2;
  while (p != end && is_digit(*p)) ++p;
  return p == end || (*p != '.' && !is_letter(*p)) ? p : nullptr;
}

Axis axis_of(char letter) {
  return letter == 'N' || letter == 'S' ? Axis::latitude : Axis::longitude;
}

std::string_view name_of(Axis axis) { return axis == Axis::latitude ? "latitude" : "longitude"; }

ParsedAngle refused(std::string reason) {
  ParsedAngle angle;
  angle.reason = std::move(reason);
  return angle;
}

// Degrees, minutes and seconds from digits that stand together: DD, DDMM or DDMMSS with the
// fraction behind the last; a longitude has three digits of degrees.
void unpack(const Token& number, int degree_digits, double parts[3]) {
  double rest = number.value;
  if (number.whole - degree_digits == 4) {
    parts[0] = std::floor(rest / 10000);
    rest -= parts[0] * 10000;
    parts[1] = std::floor(rest / 100);
    parts[2] = rest - parts[1] * 100;
  } else {
    parts[0] = std::floor(rest / 100);
    parts[1] = rest - parts[0] * 100;
  }
}

}  // namespace

std::string quoted(std::string_view text) {
  constexpr std::size_t kLongest = 60;
  while (!text.empty() && is_blank(text.front())) text.remove_prefix(1);
  while (!text.empty() && is_blank(text.back())) text.remove_suffix(1);
  if (text.size() <= kLongest) return "\"" + std::string(text) + "\"";
  std::size_t fitting = kLongest;
  while (fitting > 0 && (text[fitting] & 0xC0) == 0x80) --fitting;  // whole characters
  return "\"" + std::string(text.substr(0, fitting)) + "...\"";
}

void tokenize(std::string_view text, bool decimal_comma, Tokens& out) {
  const char* p = text.data();
  const char* const end = p + text.size();
  bool blank = true;
  bool minute_word = false;
  const auto add = [&](const Token& token) {
    if (out.count == kMostTokens) return false;
    out.tokens[out.count] = token;
    out.tokens[out.count++].blank_before = blank;
    blank = false;
    return true;
  };
  while (p != end) {
    if (is_blank(*p)) {
      blank = true;
      ++p;
      continue;
    }
    Token token{};
    if (const Digits digits = read_digits(p, end, decimal_comma ? ',' : '.'); digits.end != p) {
      // Without a blank there is a piece before.
      const bool glued = !blank && (out.tokens[out.count - 1].kind == TokenKind::number ||
                                    (decimal_comma && p[-1] == ',' && out.count > 1 &&
                                     out.tokens[out.count - 2].kind == TokenKind::number));
      if (glued) {
        out.reason = quoted(text) + " has a number with two decimal marks.";
        return;
      }
      token = {TokenKind::number, 0, false, digits.value, digits.whole, digits.fraction >= 0};
      if (const char* behind = exponent_end(digits.end, end)) {
        const auto result = std::from_chars(p, behind, token.value);
        if (result.ptr != behind || result.ec != std::errc()) token.value = HUGE_VAL;
        token.fraction = true;
        p = behind;
      } else {
        p = digits.end;
      }
    } else if (is_letter(*p)) {
      const char* word_end = p;
      while (word_end != end && is_letter(*word_end)) ++word_end;
      const auto length = static_cast<std::size_t>(word_end - p);
      const bool after_number =
          out.count > 0 && out.tokens[out.count - 1].kind == TokenKind::number;
      const bool with_hemisphere = length > 1 && find_letter({p + 1, length - 1});
      if (after_number && minute_word && upper(*p) == 'S' && (length == 1 || with_hemisphere)) {
        token.kind = TokenKind::second;
        minute_word = false;
        p += 1;
      } else if (after_number && with_hemisphere && (upper(*p) == 'D' || upper(*p) == 'M')) {
        token.kind = upper(*p) == 'D' ? TokenKind::degree : TokenKind::minute;
        p += 1;
      } else if (const Mark* word = find_word({p, length})) {
        token = {word->kind, word->symbol};
        minute_word = minute_word || word->kind == TokenKind::minute;
        p = word_end;
      } else if (upper(*p) == 'O' && length == 1) {
        out.reason = quoted(text) +
                     " has the letter O, which is west in French and Spanish and east in German; "
                     "write W or E.";
        return;
      } else {
        out.reason = quoted(text) + " has " + quoted({p, length}) +
                     " in it, which is no part of "
                     "an angle.";
        return;
      }
    } else {
      const Mark* found = nullptr;
      for (const Mark& mark : kMarks) {
        if (std::string_view(p, static_cast<std::size_t>(end - p)).starts_with(mark.text)) {
          found = &mark;
          break;
        }
      }
      if (found == nullptr) {
        std::size_t length = 1;
        while (p + length != end && (p[length] & 0xC0) == 0x80) ++length;
        out.reason =
            quoted(text) + " has " + quoted({p, length}) + " in it, which is no part of an angle.";
        return;
      }
      token = {found->kind, found->symbol};
      p += found->text.size();
    }
    if (!add(token)) {
      out.reason = quoted(text) + " has more parts than an angle or a position.";
      return;
    }
  }
}

std::string range_reason(double degrees, Axis axis, std::string_view text) {
  const double limit = axis == Axis::latitude ? 90 : 360;
  if (std::fabs(degrees) <= limit) return {};
  std::string reason = quoted(text) + " is beyond " + (axis == Axis::latitude ? "90" : "360");
  reason += " degrees";
  if (axis == Axis::latitude) reason += " of latitude";
  return reason + ".";
}

ParsedAngle angle_of(std::span<const Token> tokens, Axis axis, bool signed_packed,
                     std::string_view text) {
  if (tokens.empty()) return refused("There is no angle in " + quoted(text) + ".");

  char letter = 0;
  char sign = 0;
  if (tokens.front().kind == TokenKind::letter) {
    letter = tokens.front().symbol;
    tokens = tokens.subspan(1);
  }
  if (!tokens.empty() && tokens.front().kind == TokenKind::sign) {
    sign = tokens.front().symbol;
    tokens = tokens.subspan(1);
  }
  if (!tokens.empty() && tokens.back().kind == TokenKind::letter) {
    if (letter != 0) return refused(quoted(text) + " has two hemisphere letters.");
    letter = tokens.back().symbol;
    tokens = tokens.first(tokens.size() - 1);
  }
  if (letter != 0 && sign != 0) {
    return refused(quoted(text) + " has both a sign and a hemisphere letter; write one of them.");
  }
  if (letter != 0) {
    if (axis != Axis::unknown && axis_of(letter) != axis) {
      return refused(quoted(text) + " has the letter " + letter + ", which is none of a " +
                     std::string(name_of(axis)) + ".");
    }
    axis = axis_of(letter);
  }

  constexpr const char* kParts[] = {"degrees", "minutes", "seconds"};
  double parts[3] = {0, 0, 0};
  int numbers = 0;
  int last = -1;  // the part that was read last
  const Token* first_number = nullptr;
  bool marked = false;
  bool fraction = false;
  for (std::size_t i = 0; i < tokens.size(); ++i) {
    const Token& token = tokens[i];
    if (token.kind == TokenKind::number) {
      if (fraction) {
        return refused(quoted(text) + " has a fraction of " + kParts[last] +
                       " and something behind it; only the last part may have one.");
      }
      int part = last + 1;
      if (i + 1 < tokens.size() && tokens[i + 1].kind >= TokenKind::degree &&
          tokens[i + 1].kind <= TokenKind::second) {
        ++i;
        marked = true;
        part = static_cast<int>(tokens[i].kind) - static_cast<int>(TokenKind::degree);
        if (part <= last) {
          return refused(quoted(text) + " has " + kParts[part] + " behind " + kParts[last] + ".");
        }
      }
      if (part > 2) {
        return refused(quoted(text) + " has more parts than degrees, minutes and seconds.");
      }
      parts[part] = token.value;
      last = part;
      fraction = token.fraction;
      if (numbers++ == 0) first_number = &token;
      continue;
    }
    // A colon, or a hyphen, between two numbers.
    const bool joins =
        token.kind == TokenKind::colon ||
        (token.kind == TokenKind::sign && token.symbol == '-' && sign == 0 && !token.blank_before);
    const bool between =
        numbers > 0 && i + 1 < tokens.size() && tokens[i + 1].kind == TokenKind::number;
    if (joins && between && (token.kind == TokenKind::colon || !tokens[i + 1].blank_before)) {
      continue;
    }
    switch (token.kind) {
      case TokenKind::letter:
        return refused(quoted(text) + " has a hemisphere letter amid the figures.");
      case TokenKind::sign:
        return refused(quoted(text) + " has a sign amid the figures.");
      case TokenKind::colon:
        return refused(quoted(text) + " has a colon that joins no two numbers.");
      case TokenKind::field:
        if (token.symbol == ',') {
          return refused(quoted(text) +
                         " has a comma; where it is a decimal mark that must be told.");
        }
        return refused(quoted(text) + " has more in it than one angle.");
      default:
        return refused(quoted(text) + " has a mark of " +
                       kParts[static_cast<int>(token.kind) - static_cast<int>(TokenKind::degree)] +
                       " without a number.");
    }
  }
  if (numbers == 0) return refused("There is no number in " + quoted(text) + ".");

  // Digits that stand together.
  if (numbers == 1 && !marked && first_number->whole > 2 && (letter != 0 || signed_packed)) {
    const int degree_digits = axis == Axis::latitude ? 2 : 3;
    const int pairs = (first_number->whole - degree_digits) / 2;
    const bool whole_pairs = (first_number->whole - degree_digits) % 2 == 0;
    if (whole_pairs && (pairs == 1 || pairs == 2)) {
      unpack(*first_number, degree_digits, parts);
      last = pairs;
    } else if (first_number->whole > 3) {
      return refused(quoted(text) + " has " + std::to_string(first_number->whole) +
                     " digits together; a " +
                     (axis == Axis::latitude ? "latitude is packed as DD, DDMM or DDMMSS."
                                             : "longitude is packed as DDD, DDDMM or DDDMMSS."));
    }
  }
  if (numbers == 1 && !marked && letter == 0 && first_number->whole > 3 && !signed_packed) {
    return refused(quoted(text) +
                   " is too large for degrees; digits of degrees, minutes and seconds that stand "
                   "together need a hemisphere letter.");
  }

  for (int part = 1; part < 3; ++part) {
    if (!(parts[part] < 60)) {
      return refused(quoted(text) + " has " + kParts[part] + " of 60 or more.");
    }
  }
  ParsedAngle angle;
  angle.axis = axis;
  // One rounding of the sum, one of the quotient.
  double degrees = parts[0];
  if (last == 1) degrees = (parts[0] * 60 + parts[1]) / 60;
  if (last == 2) degrees = (parts[0] * 3600 + parts[1] * 60 + parts[2]) / 3600;
  angle.reason = range_reason(degrees, axis, text);
  if (!angle.reason.empty()) return angle;
  angle.degrees = sign == '-' || letter == 'S' || letter == 'W' ? -degrees : degrees;
  return angle;
}

const char* read_plain(const char* p, const char* end, double* value) {
  while (p != end && is_blank(*p)) ++p;
  const bool negative = p != end && *p == '-';
  if (p != end && (*p == '-' || *p == '+')) ++p;
  const Digits digits = read_digits(p, end);
  if (digits.end == p || digits.whole > 3) return nullptr;
  *value = negative ? -digits.value : digits.value;
  p = digits.end;
  while (p != end && is_blank(*p)) ++p;
  return p;
}

}  // namespace detail

using namespace detail;

ParsedAngle parse_angle(std::string_view text, Axis axis, bool decimal_comma) {
  // Most texts are a plain number.
  double value = 0;
  const char* const end = text.data() + text.size();
  if (read_plain(text.data(), end, &value) == end &&
      std::fabs(value) <= (axis == Axis::latitude ? 90 : 360)) {
    return {value, axis, {}};
  }
  Tokens tokens;
  tokenize(text, decimal_comma, tokens);
  if (!tokens.reason.empty()) return refused(std::move(tokens.reason));
  return angle_of(tokens.all(), axis, false, text);
}

std::size_t format_angle(double degrees, const AngleFormat& format, char* out) {
  char* p = out;
  if (!(std::fabs(degrees) <= 1e6)) {
    constexpr std::string_view kNone = "nan";
    return kNone.copy(out, kNone.size());
  }
  const bool parted = format.form == AngleForm::minutes || format.form == AngleForm::seconds;
  const AngleMarks marks =
      parted && format.marks == AngleMarks::none ? AngleMarks::colons : format.marks;
  const int precision = std::clamp(format.precision, 0, format.form == AngleForm::degrees ? 15 : 9);
  const auto put = [&p](std::string_view text) { p = std::copy(text.begin(), text.end(), p); };
  const auto put_mark = [&](int part) {
    constexpr std::string_view kSymbols[] = {"\u00B0", "\u2032", "\u2033"};
    constexpr std::string_view kPlain[] = {"d", "'", "\""};
    if (marks == AngleMarks::symbols) put(kSymbols[part]);
    if (marks == AngleMarks::plain) put(kPlain[part]);
  };

  // The sign of what is written, so that -0.00 does not appear.
  char* const sign = p;
  if (format.axis == Axis::unknown) ++p;
  bool zero = true;
  const auto put_fixed = [&](double value, int decimals) {
    p = std::to_chars(p, out + kAngleTextSize, value, std::chars_format::fixed, decimals).ptr;
  };
  const auto put_digits = [&](std::uint64_t value, int digits) {
    for (int i = digits - 1; i >= 0; --i) {
      p[i] = static_cast<char>('0' + value % 10);
      value /= 10;
    }
    p += digits;
  };
  const double magnitude = std::fabs(degrees);
  if (format.form == AngleForm::degrees) {
    char* const begin = p;
    put_fixed(magnitude, precision);
    zero = std::all_of(begin, p, [](char c) { return c == '0' || c == '.'; });
    put_mark(0);
  } else {
    // Whole units of the last decimal: what is rounded up carries of itself.
    const bool seconds = format.form != AngleForm::minutes;
    const double unit = kPowersOfTen[precision];
    const auto scale = static_cast<std::uint64_t>(unit);
    const auto units =
        static_cast<std::uint64_t>(std::nearbyint(magnitude * (seconds ? 3600.0 : 60.0) * unit));
    zero = units == 0;
    std::uint64_t rest = units / scale;  // whole seconds, or minutes
    const std::uint64_t last = rest % 60;
    rest /= 60;
    const std::uint64_t minutes = seconds ? rest % 60 : last;
    const std::uint64_t whole = seconds ? rest / 60 : rest;
    const bool packed = format.form == AngleForm::packed;
    if (packed) {
      // What no angle has is written so that none is read from it.
      const int digits = format.axis == Axis::latitude ? 2 : 3;
      put_digits(whole, whole < (digits == 2 ? 100u : 1000u) ? digits : 7);
    } else {
      p = std::to_chars(p, out + kAngleTextSize, whole).ptr;
    }
    const auto part = [&](std::uint64_t value, int before, bool is_last) {
      if (!packed && marks == AngleMarks::colons) put(":");
      if (!packed && marks == AngleMarks::blanks) put(" ");
      if (!packed) put_mark(before);
      put_digits(value, 2);
      if (is_last && precision > 0) {
        put(".");
        put_digits(units % scale, precision);
      }
      if (is_last && !packed) put_mark(before + 1);
    };
    part(minutes, 0, !seconds);
    if (seconds) part(last, 1, true);
  }

  const bool negative = degrees < 0 && !zero;
  switch (format.axis) {
    case Axis::longitude:
      *p++ = negative ? 'W' : 'E';
      break;
    case Axis::latitude:
      *p++ = negative ? 'S' : 'N';
      break;
    case Axis::unknown:
      if (negative) {
        *sign = '-';
      } else {
        std::memmove(sign, sign + 1, static_cast<std::size_t>(p - sign - 1));
        --p;
      }
      break;
  }
  return static_cast<std::size_t>(p - out);
}

std::string format_angle(double degrees, const AngleFormat& format) {
  char text[kAngleTextSize];
  return {text, format_angle(degrees, format, text)};
}

}  // namespace tidewater
