// Positions as people write them.

#include <cmath>
#include <span>
#include <string>

#include "angle_text.hpp"

namespace tidewater {

namespace detail {

namespace {

ParsedPosition refused(std::string reason) {
  ParsedPosition position;
  position.reason = std::move(reason);
  return position;
}

bool is(const Token& token, TokenKind kind) { return token.kind == kind; }

// The pieces of a position: two angles, perhaps a height.
struct Fields {
  std::span<const Token> parts[3];
  int count = 0;
  bool iso = false;  // ISO 6709: signs alone part the numbers
  std::string reason;

  void add(std::span<const Token> part) { parts[count++] = part; }
};

// At the separators.
Fields separated(std::span<const Token> tokens, std::string_view text) {
  Fields fields;
  std::size_t begin = 0;
  for (std::size_t i = 0; i <= tokens.size(); ++i) {
    if (i < tokens.size() && !is(tokens[i], TokenKind::field)) continue;
    // Several tabs in a row are one.
    const bool tab = i < tokens.size() && tokens[i].symbol == '\t';
    if (i > begin || !tab) {
      if (fields.count == 3) {
        fields.reason = quoted(text) + " has more than two angles and a height.";
        return fields;
      }
      fields.add(tokens.subspan(begin, i - begin));
    }
    begin = i + 1;
  }
  return fields;
}

// +48.8577+002.2950/, +485128+0022104+35/: numbers with signs and nothing else.
bool is_iso(std::span<const Token> tokens) {
  if (tokens.size() != 4 && tokens.size() != 6) return false;
  for (std::size_t i = 0; i < tokens.size(); i += 2) {
    if (!is(tokens[i], TokenKind::sign) || !is(tokens[i + 1], TokenKind::number)) return false;
    if (tokens[i + 1].blank_before || (i > 0 && tokens[i].blank_before)) return false;
  }
  return true;
}

// At every piece that begins an angle.
Fields cut_at(std::span<const Token> tokens, const std::size_t* cuts, int count) {
  Fields fields;
  std::size_t begin = 0;
  for (int i = 0; i <= count; ++i) {
    const std::size_t end = i < count ? cuts[i] : tokens.size();
    if (end > begin) fields.add(tokens.subspan(begin, end - begin));
    begin = end;
  }
  return fields;
}

// Without a separator: by letters, signs, degree signs or colons, else by the count of numbers.
Fields by_form(std::span<const Token> tokens, std::string_view text) {
  std::size_t letters[3], signs[3], degrees[3], numbers[8], loose[3];
  int letter_count = 0, sign_count = 0, degree_count = 0, number_count = 0, loose_count = 0;
  bool colons = false;
  for (std::size_t i = 0; i < tokens.size(); ++i) {
    const auto note = [i](std::size_t* list, int& count, int room) {
      if (count < room) list[count] = i;
      ++count;
    };
    if (is(tokens[i], TokenKind::letter)) note(letters, letter_count, 3);
    if (is(tokens[i], TokenKind::colon)) colons = true;
    if (is(tokens[i], TokenKind::degree)) note(degrees, degree_count, 3);
    // A hyphen between figures parts degrees and minutes, not angles.
    if (is(tokens[i], TokenKind::sign) && (tokens[i].blank_before || is_iso(tokens))) {
      note(signs, sign_count, 3);
    }
    if (is(tokens[i], TokenKind::number)) {
      note(numbers, number_count, 8);
      const bool joined = i > 0 && is(tokens[i - 1], TokenKind::colon);
      if (!joined) note(loose, loose_count, 3);
    }
  }

  Fields fields;
  if (is_iso(tokens)) {
    const std::size_t cuts[] = {2, 4};
    fields = cut_at(tokens, cuts, tokens.size() == 6 ? 2 : 1);
    fields.iso = true;
    return fields;
  }
  if (letter_count == 2) {
    // In front of the angles, or behind them; then a height may follow.
    if (letters[0] == 0) return cut_at(tokens, &letters[1], 1);
    const std::size_t cuts[] = {letters[0] + 1, letters[1] + 1};
    return cut_at(tokens, cuts, 2);
  }
  if (letter_count > 2) {
    fields.reason = quoted(text) + " has more than two hemisphere letters.";
    return fields;
  }
  const bool letter_amid = letter_count == 1 && letters[0] != 0 && letters[0] != tokens.size() - 1;
  if (degree_count == 2 && degrees[1] >= 2 && !letter_amid) {
    std::size_t begin = degrees[1] - 1;
    const Token& before = tokens[begin - 1];
    if (is(before, TokenKind::sign)) --begin;
    return cut_at(tokens, &begin, 1);
  }
  if (colons && (loose_count == 2 || loose_count == 3)) {
    for (int i = 1; i < loose_count; ++i) {
      if (is(tokens[loose[i] - 1], TokenKind::sign)) --loose[i];
    }
    return cut_at(tokens, loose + 1, loose_count - 1);
  }
  if (sign_count > 0 && sign_count <= 2) {
    // The second sign, or the only one if it is not the first piece.
    const std::size_t cut = signs[0] != 0 ? signs[0] : sign_count == 2 ? signs[1] : 0;
    if (cut != 0) return cut_at(tokens, &cut, 1);
  }
  // Plain numbers: halves, or a fraction that ends each of the first two.
  const bool plain =
      number_count + sign_count == static_cast<int>(tokens.size()) && sign_count <= 1;
  if (plain && (number_count == 2 || number_count == 4 || number_count == 6)) {
    return cut_at(tokens, &numbers[number_count / 2], 1);
  }
  if (plain && number_count == 3 && tokens[numbers[0]].fraction && tokens[numbers[1]].fraction) {
    return cut_at(tokens, &numbers[1], 2);
  }
  fields.reason = "It cannot be told where the second angle of " + quoted(text) +
                  " begins; put a comma between the two.";
  return fields;
}

// A height in metres, with its unit or without.
std::string read_height(std::span<const Token> tokens, std::string_view text, double* height) {
  bool negative = false;
  if (!tokens.empty() && is(tokens.front(), TokenKind::sign)) {
    negative = tokens.front().symbol == '-';
    tokens = tokens.subspan(1);
  }
  if (tokens.size() == 2 && is(tokens[1], TokenKind::minute)) tokens = tokens.first(1);  // m
  if (tokens.size() != 1 || !is(tokens[0], TokenKind::number)) {
    return "What follows the two angles of " + quoted(text) + " is no height in metres.";
  }
  *height = negative ? -tokens[0].value : tokens[0].value;
  return {};
}

ParsedPosition position_of(const Fields& fields, Order order, std::string_view text) {
  if (fields.count < 2) return refused(quoted(text) + " has one angle; a position has two.");
  // The letters come first: only what they leave open is a matter of order.
  ParsedAngle angles[2];
  Axis axes[2] = {Axis::unknown, Axis::unknown};
  for (int i = 0; i < 2; ++i) {
    for (const Token& token : fields.parts[i]) {
      if (!is(token, TokenKind::letter)) continue;
      axes[i] = token.symbol == 'N' || token.symbol == 'S' ? Axis::latitude : Axis::longitude;
    }
  }
  if (axes[0] == Axis::unknown && axes[1] == Axis::unknown && order != Order::unknown) {
    axes[0] = order == Order::longitude_first ? Axis::longitude : Axis::latitude;
  }
  const auto other = [](Axis axis) {
    return axis == Axis::latitude ? Axis::longitude : Axis::latitude;
  };
  if (axes[0] == Axis::unknown && axes[1] != Axis::unknown) axes[0] = other(axes[1]);
  if (axes[1] == Axis::unknown && axes[0] != Axis::unknown) axes[1] = other(axes[0]);
  if (axes[0] != Axis::unknown && axes[0] == axes[1]) {
    return refused(quoted(text) + " has two " +
                   (axes[0] == Axis::latitude ? "latitudes." : "longitudes."));
  }
  for (int i = 0; i < 2; ++i) {
    angles[i] = angle_of(fields.parts[i], axes[i], fields.iso && axes[i] != Axis::unknown, text);
    if (!angles[i]) return refused(std::move(angles[i].reason));
  }
  if (axes[0] == Axis::unknown) {
    const bool first_large = std::fabs(angles[0].degrees) > 90;
    const bool second_large = std::fabs(angles[1].degrees) > 90;
    if (first_large == second_large) {
      return refused("It cannot be told which angle of " + quoted(text) +
                     (first_large ? " is the latitude; both are beyond 90 degrees."
                                  : " is the latitude; add hemisphere letters or name the order."));
    }
    axes[0] = first_large ? Axis::longitude : Axis::latitude;
  }
  ParsedPosition position;
  const int longitude = axes[0] == Axis::longitude ? 0 : 1;
  if (fields.count == 3) {
    position.reason = read_height(fields.parts[2], text, &position.height);
    if (!position.reason.empty()) return position;
  }
  position.longitude = angles[longitude].degrees;
  position.latitude = angles[1 - longitude].degrees;
  return position;
}

// Two plain numbers, perhaps a height, with a comma, a semicolon, a tab or blanks between.  False
// where the text is anything else.
bool read_plain_position(std::string_view text, Order order, ParsedPosition& position) {
  const char* p = text.data();
  const char* const end = p + text.size();
  double values[3];
  int count = 0;
  bool blanks = false;
  while (count < 3) {
    p = read_plain(p, end, &values[count]);
    if (p == nullptr) return false;
    ++count;
    if (p == end) break;
    const bool apart = p[-1] == ' ';
    if (*p == ',' || *p == ';' || *p == '\t') {
      ++p;
    } else if (apart) {
      blanks = true;
    } else {
      return false;
    }
  }
  if (p != end || count < 2 || (count == 3 && blanks)) return false;
  const bool first = order == Order::longitude_first;
  const double longitude = values[first ? 0 : 1];
  const double latitude = values[first ? 1 : 0];
  if (!(std::fabs(longitude) <= 360 && std::fabs(latitude) <= 90)) return false;
  position.longitude = longitude;
  position.latitude = latitude;
  if (count == 3) position.height = values[2];
  return true;
}

}  // namespace

}  // namespace detail

using namespace detail;

ParsedPosition parse_position(std::string_view text, Order order, bool decimal_comma) {
  // Most texts are plain numbers.
  if (order != Order::unknown && !decimal_comma) {
    ParsedPosition position;
    if (read_plain_position(text, order, position)) return position;
  }
  Tokens read;
  tokenize(text, decimal_comma, read);
  if (!read.reason.empty()) return refused(std::move(read.reason));
  std::span<const Token> tokens = read.all();
  // The solidus of ISO 6709 ends the text; latitude stands first then.
  if (!tokens.empty() && is(tokens.back(), TokenKind::field) && tokens.back().symbol == '/' &&
      is_iso(tokens.first(tokens.size() - 1))) {
    tokens = tokens.first(tokens.size() - 1);
    order = Order::latitude_first;
  }
  if (tokens.empty()) return refused("There is no position in " + quoted(text) + ".");
  bool has_separator = false;
  for (const Token& token : tokens) has_separator = has_separator || is(token, TokenKind::field);
  const Fields fields = has_separator ? separated(tokens, text) : by_form(tokens, text);
  if (!fields.reason.empty()) return refused(fields.reason);
  return position_of(fields, order, text);
}

}  // namespace tidewater
