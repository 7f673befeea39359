#include "position_line.hpp"

#include <array>
#include <cmath>
#include <stdexcept>

namespace tidewater::command {

namespace {

bool is_blank(char c) { return c == ' ' || c == '\t'; }
bool is_digit(char c) { return c >= '0' && c <= '9'; }

// What ends a field of plain numbers.
bool ends_field(const char* at, const char* end) {
  return at == end || is_blank(*at) || *at == ',' || *at == ';' || *at == '\r';
}

const char* skip_blanks(const char* at, const char* end) {
  while (at != end && is_blank(*at)) ++at;
  return at;
}

const char* skip_separator(const char* at, const char* end) {
  at = skip_blanks(at, end);
  if (at != end && (*at == ',' || *at == ';')) at = skip_blanks(at + 1, end);
  return at;
}

// A number without an exponent that ends where a field ends; null where there is none.
const char* plain_number(const char* at, const char* end, double& value,
                         std::chars_format format = std::chars_format::fixed) {
  if (at == end) return nullptr;
  const bool plus = *at == '+';
  if (plus) ++at;
  const char* const digits = at != end && *at == '-' && !plus ? at + 1 : at;
  if (digits == end || (!is_digit(*digits) && *digits != '.')) return nullptr;
  const auto [stop, error] = std::from_chars(at, end, value, format);
  if (error != std::errc() || !ends_field(stop, end)) return nullptr;
  return stop;
}

// Digits, a comma, digits, and the same again: a comma that could be a decimal mark.
bool has_decimal_commas(std::string_view line) {
  std::size_t at = 0;
  for (int i = 0; i < 2; ++i) {
    while (at < line.size() && (is_blank(line[at]) || line[at] == ';' || line[at] == ',')) ++at;
    if (at < line.size() && (line[at] == '-' || line[at] == '+')) ++at;
    const std::size_t whole = at;
    while (at < line.size() && is_digit(line[at])) ++at;
    if (at == whole || at + 1 >= line.size() || line[at] != ',' || !is_digit(line[at + 1])) {
      return false;
    }
    ++at;
    while (at < line.size() && is_digit(line[at])) ++at;
    if (at < line.size() && line[at] == '.') return false;
  }
  return true;
}

// Whether what follows the first two numbers is more numbers and then a hemisphere's letter: they
// are degrees and minutes.
bool letter_follows(const char* at, const char* end) {
  for (int i = 0; i < 5; ++i) {
    at = skip_blanks(at, end);
    if (at == end) return false;
    if (std::strchr("NSEWnsew", *at) && *at != 0) {
      return ends_field(at + 1, end) || (is_digit(at[1]) && i == 0);
    }
    double value;
    at = plain_number(at, end, value);
    if (!at) return false;
  }
  return false;
}

constexpr const char* kCommaHint =
    "a comma between digits could be a decimal mark; --decimal comma takes it as one";

struct Field {
  std::size_t begin, end;
  bool apart;  // a comma or semicolon stands before it
};

constexpr std::size_t kMostFields = 8;  // of one position: four parts an angle

std::size_t fields_of(std::string_view line, bool decimal_comma,
                      std::array<Field, kMostFields>& fields) {
  std::size_t count = 0;
  std::size_t at = 0;
  bool apart = false;
  const auto separates = [&](std::size_t i) {
    if (line[i] == ';') return true;
    if (line[i] != ',') return false;
    const bool inside =
        i > 0 && i + 1 < line.size() && is_digit(line[i - 1]) && is_digit(line[i + 1]);
    return !(decimal_comma && inside);
  };
  while (count < kMostFields) {
    while (at < line.size() && (is_blank(line[at]) || line[at] == '\r' || separates(at))) {
      apart |= separates(at);
      ++at;
    }
    if (at == line.size()) break;
    const std::size_t begin = at;
    while (at < line.size() && !is_blank(line[at]) && line[at] != '\r' && !separates(at)) ++at;
    fields[count++] = {begin, at, apart};
    apart = false;
  }
  return count;
}

// A field of more than digits, full stop and sign.
bool has_mark(std::string_view text) {
  for (const char c : text) {
    if (!is_digit(c) && !is_blank(c) && c != '.' && c != '-' && c != '+') return true;
  }
  return false;
}

// DD.MMSS: minutes and seconds behind the full stop.
bool packed_angle(std::string_view text, double& degrees) {
  double sign = 1;
  if (!text.empty() && (text[0] == '-' || text[0] == '+')) {
    if (text[0] == '-') sign = -1;
    text.remove_prefix(1);
  }
  std::string digits;
  const std::size_t point = text.find('.');
  for (const char c : text) {
    if (is_digit(c)) {
      digits += c;
    } else if (c != '.') {
      return false;
    }
  }
  if (digits.empty() || (point != text.npos && text.find('.', point + 1) != text.npos))
    return false;
  std::string behind = point == text.npos ? "" : std::string(text.substr(point + 1));
  while (behind.size() < 4) behind += '0';
  double whole = 0;
  if (point != 0) {
    std::from_chars(text.data(), text.data() + std::min(point, text.size()), whole);
  }
  const double minutes = (behind[0] - '0') * 10 + (behind[1] - '0');
  double seconds = 0;
  const std::string part = behind.substr(2, 2) + "." + behind.substr(4) + "0";
  std::from_chars(part.data(), part.data() + part.size(), seconds);
  if (minutes >= 60 || seconds >= 60) return false;
  degrees = sign * (whole + minutes / 60 + seconds / 3600);
  return true;
}

std::string quoted(std::string_view text) { return "\"" + std::string(text.substr(0, 40)) + "\""; }

}  // namespace

int AngleStyle::decimals() const {
  if (precision >= 0) return precision;
  return form == "dms" || form == "packed" ? 5 : form == "dm" ? 7 : 9;
}

void AngleStyle::check() const {
  if (hemisphere != "sign" && reverse != "none") {
    throw std::invalid_argument("hemisphere letters and reversed axes exclude each other");
  }
}

bool PositionReader::take_angle(std::string_view text, Axis axis, double& degrees, Axis& found,
                                std::string& reason) const {
  found = Axis::unknown;
  const auto lettered = [&](auto read) {
    std::string_view magnitude = text;
    char letter = 0;
    const auto is_letter = [](char c) { return std::strchr("NEWSnews", c) != nullptr && c != 0; };
    if (!magnitude.empty() && is_letter(magnitude.front())) {
      letter = magnitude.front();
      magnitude.remove_prefix(1);
    } else if (!magnitude.empty() && is_letter(magnitude.back())) {
      letter = magnitude.back();
      magnitude.remove_suffix(1);
    }
    letter = static_cast<char>(letter & ~0x20);
    if (letter != 0 && (magnitude.empty() || magnitude[0] == '-' || magnitude[0] == '+')) {
      return false;
    }
    if (!read(magnitude)) return false;
    if (letter != 0) found = letter == 'N' || letter == 'S' ? Axis::latitude : Axis::longitude;
    if (letter == 'S' || letter == 'W') degrees = -degrees;
    return true;
  };
  const auto number = [&](std::string_view field) {
    const char* const end = field.data() + field.size();
    return plain_number(field.data(), end, degrees) == end;
  };
  bool ok;
  if (style_.form == "grads") {
    ok = lettered(number);
    degrees *= 0.9;
  } else if (style_.form == "packed") {
    ok = lettered([&](std::string_view field) { return packed_angle(field, degrees); });
  } else {
    const ParsedAngle angle = parse_angle(text, Axis::unknown, style_.decimal_comma);
    degrees = angle.degrees;
    found = angle.axis;
    ok = static_cast<bool>(angle);
    if (!ok) reason = angle.reason;
    if (ok && style_.form == "degrees") ok = text.find_first_of(":'dm\"") == text.npos;
  }
  if (ok && style_.hemisphere != "sign" && found == Axis::unknown) {
    reason = quoted(text) + " has no letter of its hemisphere";
    return false;
  }
  if (ok && axis != Axis::unknown && found != Axis::unknown && axis != found) {
    reason = quoted(text) + (axis == Axis::latitude ? " is no latitude" : " is no longitude");
    return false;
  }
  if (!ok && reason.empty()) reason = quoted(text) + " is no angle in the form " + style_.form;
  return ok;
}

void PositionReader::take(std::string_view line, TakenPosition& position) const {
  position.has_z = false;
  position.z = 0;
  position.zone = 0;
  position.status = TW_SUCCESS;
  position.rest = line.size();
  if (kind_ == Kind::military) return take_military(line, position);
  if (is_plain_ && take_plain(line, position)) return;
  if (kind_ == Kind::angles) return take_angles(line, position);
  position.status = TW_BAD_TEXT;
  position.reason = has_decimal_commas(line) ? kCommaHint
                    : kind_ == Kind::space
                        ? "it does not begin with three numbers, X, Y and Z"
                        : "it does not begin with two numbers, easting and northing";
  std::array<Field, kMostFields> fields;
  const std::size_t count = fields_of(line, false, fields);
  const std::size_t skipped = std::min<std::size_t>(count, kind_ == Kind::space ? 3 : 2);
  position.rest = skipped == 0 ? line.size() : fields[skipped - 1].end;
}

// Two decimal numbers, the most usual line by far.
bool PositionReader::take_plain(std::string_view line, TakenPosition& position) const {
  if (style_.decimal_comma) {
    if (kind_ == Kind::angles) return false;
    // Plane coordinates: the comma becomes a full stop, which changes no place in the line.
    std::string other(line.substr(0, 200));
    for (char& c : other) {
      if (c == ',') c = '.';
    }
    PositionReader points = *this;
    points.style_.decimal_comma = false;
    return points.take_plain(other, position);
  }
  const char* const begin = line.data();
  const char* const end = begin + line.size();
  const auto format = kind_ == Kind::angles ? std::chars_format::fixed : std::chars_format::general;
  double first, second;
  const char* at = plain_number(skip_blanks(begin, end), end, first, format);
  if (!at) return false;
  if (at != end && *at == ',' && has_decimal_commas(line)) {
    if (kind_ == Kind::angles) {
      position.status = TW_BAD_TEXT;
      position.reason = kCommaHint;
      std::array<Field, kMostFields> fields;
      const std::size_t count = fields_of(line, true, fields);
      position.rest = fields[std::min<std::size_t>(count, 2) - 1].end;
      return true;
    }
    return false;
  }
  at = plain_number(skip_separator(at, end), end, second, format);
  if (!at) return false;
  if (kind_ == Kind::angles) {
    if (style_.hemisphere != "sign" || letter_follows(at, end)) return false;
    const bool lat_first = style_.lat_first();
    position.x = lat_first ? second : first;
    position.y = lat_first ? first : second;
    finish_angles(position);
  } else {
    position.x = first;
    position.y = second;
  }
  position.rest = static_cast<std::size_t>(at - begin);
  if (kind_ == Kind::space) {
    at = plain_number(skip_separator(at, end), end, position.z, format);
    if (!at) return false;
    position.has_z = true;
    position.rest = static_cast<std::size_t>(at - begin);
    return true;
  }
  if (kind_ == Kind::grid) {
    const char* const zone = skip_separator(at, end);
    const auto [stop, error] = std::from_chars(zone, end, position.zone);
    if (error != std::errc() || stop == end || !ends_field(stop + 1, end) || position.zone < 1 ||
        position.zone > 60 || !std::strchr("NnSs", *stop)) {
      position.status = TW_BAD_ZONE;
      position.reason = "no zone such as 30N stands behind easting and northing; --zone names one";
      return true;
    }
    if (*stop == 'S' || *stop == 's') position.zone = -position.zone;
    position.rest = static_cast<std::size_t>(stop + 1 - begin);
  }
  take_height(line, position);
  return true;
}

void PositionReader::take_height(std::string_view line, TakenPosition& position) const {
  if (heights_ == Heights::never) return;
  const char* const begin = line.data();
  const char* const end = begin + line.size();
  double z;
  if (const char* at = plain_number(skip_separator(begin + position.rest, end), end, z)) {
    position.z = z;
    position.has_z = true;
    position.rest = static_cast<std::size_t>(at - begin);
  }
}

void PositionReader::finish_angles(TakenPosition& position) const {
  if (std::fabs(position.x) > 360) {
    position.status = TW_BAD_LONGITUDE;
    position.reason.clear();
  }
  if (style_.reverse == "none") return;
  if (style_.reverse != "lat") position.x = -position.x;
  if (style_.reverse != "lon") position.y = -position.y;
}

void PositionReader::take_angles(std::string_view line, TakenPosition& position) const {
  std::array<Field, kMostFields> fields;
  const std::size_t count = fields_of(line, style_.decimal_comma, fields);
  const auto joined = [&](std::size_t from, std::size_t size, std::string_view& text) {
    if (from + size > count) return false;
    for (std::size_t i = 1; i < size; ++i) {
      if (fields[from + i].apart) return false;
    }
    text = line.substr(fields[from].begin, fields[from + size - 1].end - fields[from].begin);
    return true;
  };
  const bool lat_first = style_.lat_first();
  // Angles of up to four fields each: with letters first, then with other marks, then plain ones;
  // two of equal length before others.
  enum Pass { letters, marks, plain };
  for (const Pass pass : {letters, marks, plain}) {
    for (int round = 0; round < 2; ++round) {
      for (std::size_t total = kMostFields; total >= 2; --total) {
        for (std::size_t one = std::min<std::size_t>(4, total - 1); one >= 1; --one) {
          const std::size_t other = total - one;
          if (other > 4 || (one == other) != (round == 0)) continue;
          std::string_view a, b;
          if (!joined(0, one, a) || !joined(one, other, b)) continue;
          if (pass == plain && style_.form != "dms" && total > 2) continue;
          if (pass == marks && ((one > 1 && !has_mark(a)) || (other > 1 && !has_mark(b)))) continue;
          double first, second;
          Axis axis_a, axis_b;
          std::string reason;
          if (!take_angle(a, Axis::unknown, first, axis_a, reason)) continue;
          if (!take_angle(b, Axis::unknown, second, axis_b, reason)) continue;
          const bool both = axis_a != Axis::unknown && axis_b != Axis::unknown;
          if (pass == letters && !both) continue;
          if (axis_a != Axis::unknown && axis_a == axis_b) continue;
          // A letter tells the order.
          bool latitude_first = lat_first;
          if (axis_a != Axis::unknown) latitude_first = axis_a == Axis::latitude;
          if (axis_b != Axis::unknown) latitude_first = axis_b == Axis::longitude;
          position.x = latitude_first ? second : first;
          position.y = latitude_first ? first : second;
          finish_angles(position);
          position.rest = fields[one + other - 1].end;
          take_height(line, position);
          return;
        }
      }
    }
  }
  position.rest = count == 0 ? line.size() : fields[std::min<std::size_t>(count, 2) - 1].end;
  // A position in one field, such as ISO 6709 has it.
  if (count > 0 && style_.form == "auto") {
    const ParsedPosition whole =
        parse_position(line.substr(fields[0].begin, fields[0].end - fields[0].begin),
                       lat_first ? Order::latitude_first : Order::longitude_first);
    if (whole) {
      position.x = whole.longitude;
      position.y = whole.latitude;
      position.has_z = std::isfinite(whole.height) && heights_ != Heights::never;
      position.z = position.has_z ? whole.height : 0;
      position.rest = fields[0].end;
      return;
    }
  }
  position.status = TW_BAD_TEXT;
  if (has_decimal_commas(line)) {
    position.reason = kCommaHint;
    return;
  }
  for (std::size_t i = 0; i < 2; ++i) {
    const bool is_latitude = (i == 0) == lat_first;
    const std::string name = is_latitude ? "the latitude" : "the longitude";
    if (i >= count) {
      position.reason = name + " is missing";
      return;
    }
    double value;
    Axis found;
    std::string reason;
    if (!take_angle(line.substr(fields[i].begin, fields[i].end - fields[i].begin), Axis::unknown,
                    value, found, reason)) {
      position.reason = name + ": " + reason;
      return;
    }
  }
  position.reason = "not a position; --format and --order tell how angles are written";
}

void PositionReader::take_military(std::string_view line, TakenPosition& position) const {
  std::array<Field, kMostFields> fields;
  const std::size_t count = fields_of(line, false, fields);
  std::string first_reason = "a grid reference is missing";
  for (std::size_t size = std::min<std::size_t>(4, count); size >= 1; --size) {
    const GridPosition grid =
        parse_mgrs(line.substr(fields[0].begin, fields[size - 1].end - fields[0].begin));
    const ParsedPosition found = grid ? position_of(grid) : ParsedPosition{};
    if (grid && found) {
      position.x = found.longitude;
      position.y = found.latitude;
      position.rest = fields[size - 1].end;
      return;
    }
    first_reason = grid ? found.reason : grid.reason;
  }
  position.rest = count == 0 ? line.size() : fields[0].end;
  position.status = TW_BAD_TEXT;
  position.reason = first_reason;
}

bool PositionReader::take_field(std::string_view field, bool is_latitude, double& value,
                                std::string& reason) const {
  while (!field.empty() && is_blank(field.front())) field.remove_prefix(1);
  while (!field.empty() && is_blank(field.back())) field.remove_suffix(1);
  const char* const end = field.data() + field.size();
  if (is_plain_ && style_.hemisphere == "sign" &&
      plain_number(field.data(), end, value,
                   kind_ == Kind::angles ? std::chars_format::fixed : std::chars_format::general) ==
          end) {
    if (kind_ == Kind::angles && style_.reverse != "none" &&
        style_.reverse != (is_latitude ? "lon" : "lat")) {
      value = -value;
    }
    return true;
  }
  if (field.find(',') != field.npos) {
    if (!style_.decimal_comma) {
      reason = quoted(field) + " has a comma; --decimal comma takes it as a decimal mark";
      return false;
    }
    std::string other(field);
    for (char& c : other) {
      if (c == ',') c = '.';
    }
    PositionReader points = *this;
    points.style_.decimal_comma = false;
    return points.take_field(other, is_latitude, value, reason);
  }
  if (kind_ != Kind::angles) {
    reason = field.empty() ? "a coordinate is missing" : quoted(field) + " is no number";
    return false;
  }
  Axis found;
  if (field.empty()) {
    reason = is_latitude ? "the latitude is missing" : "the longitude is missing";
    return false;
  }
  return take_angle(field, is_latitude ? Axis::latitude : Axis::longitude, value, found, reason);
}

bool PositionReader::all_have_heights(std::string_view lines) const {
  if (kind_ == Kind::military || kind_ == Kind::space) return false;
  PositionReader two = *this;
  two.set_heights(Heights::never);
  bool any = false;
  int seen = 0;
  while (!lines.empty() && seen < 1000) {
    const std::size_t newline = std::min(lines.find('\n'), lines.size());
    std::string_view line = lines.substr(0, newline);
    lines.remove_prefix(std::min(newline + 1, lines.size()));
    if (!is_data(line)) continue;
    if (line.back() == '\r') line.remove_suffix(1);
    TakenPosition position;
    two.take(line, position);
    if (position.status != TW_SUCCESS) continue;
    ++seen;
    const char* const begin = line.data() + position.rest;
    const char* const end = line.data() + line.size();
    const char* const from = skip_separator(begin, end);
    double z;
    const char* const stop = plain_number(from, end, z);
    if (!stop) return false;
    const std::string_view field(from, static_cast<std::size_t>(stop - from));
    if (skip_separator(stop, end) != end && field.find('.') == field.npos) return false;
    any = true;
  }
  return any;
}

bool take_number(std::string_view& text, double& value) {
  const char* const end = text.data() + text.size();
  const char* const stop = plain_number(skip_separator(text.data(), end), end, value);
  if (!stop) return false;
  text.remove_prefix(static_cast<std::size_t>(stop - text.data()));
  return true;
}

void append_angle(Buffer& out, double degrees, Axis axis, const AngleStyle& style) {
  const bool letters = style.hemisphere != "sign" && axis != Axis::unknown;
  if (style.reverse == "both" || (style.reverse == "lat" && axis == Axis::latitude) ||
      (style.reverse == "lon" && axis == Axis::longitude)) {
    degrees = -degrees;
  }
  const bool plain = style.form == "auto" || style.form == "degrees" || style.form == "grads";
  const int decimals = style.decimals();
  char text[kAngleTextSize + kNumberRoom];
  char* end = text;
  double value = letters ? std::fabs(degrees) : degrees;
  if (plain) {
    if (style.form == "grads") value /= 0.9;
    if (!letters) return out.add_fixed(value, decimals);
    end = format_fixed(text, value, decimals);
  } else {
    AngleFormat format;
    format.form = style.form == "dm" ? AngleForm::minutes : AngleForm::seconds;
    format.marks = AngleMarks::colons;
    format.precision = std::min(decimals, 9);
    end = text + format_angle(value, format, text);
    // Rounded to zero, an angle has no sign.
    std::string_view written(text, static_cast<std::size_t>(end - text));
    if (written[0] == '-' && written.find_first_of("123456789") == written.npos) {
      std::memmove(text, text + 1, written.size() - 1);
      --end;
    }
    // Degrees are written without leading zeros; 48:30:00 keeps those of its minutes.
    char* start = text + (text[0] == '-' ? 1 : 0);
    while (end - start > 1 && start[0] == '0' && is_digit(start[1])) {
      std::memmove(start, start + 1, static_cast<std::size_t>(end - start - 1));
      --end;
    }
    if (style.form == "packed") {
      // 48:23:25.1 as 48.23251
      char* to = text;
      int colons = 0;
      for (const char* from = text; from != end; ++from) {
        if (*from == ':') {
          if (++colons == 1) *to++ = '.';
        } else if (*from != '.') {
          *to++ = *from;
        }
      }
      end = to;
    }
  }
  const bool negative =
      degrees < 0 &&
      std::string_view(text, static_cast<std::size_t>(end - text)).find_first_of("123456789") !=
          std::string_view::npos;
  const char letter = axis == Axis::latitude ? (negative ? 'S' : 'N') : (negative ? 'W' : 'E');
  if (letters && style.hemisphere == "front") out.add(letter);
  out.add(std::string_view(text, static_cast<std::size_t>(end - text)));
  if (letters && style.hemisphere == "behind") out.add(letter);
}

void append_azimuth(Buffer& out, double degrees, const AngleStyle& style) {
  if (style.hemisphere == "sign" && style.reverse == "none") {
    return append_angle(out, degrees, Axis::unknown, style);
  }
  AngleStyle plain = style;
  plain.hemisphere = "sign";
  plain.reverse = "none";
  append_angle(out, degrees, Axis::unknown, plain);
}

void append_position(Buffer& out, double lon, double lat, const AngleStyle& style) {
  const bool lat_first = style.lat_first();
  append_angle(out, lat_first ? lat : lon, lat_first ? Axis::latitude : Axis::longitude, style);
  out.add(' ');
  append_angle(out, lat_first ? lon : lat, lat_first ? Axis::longitude : Axis::latitude, style);
}

}  // namespace tidewater::command
