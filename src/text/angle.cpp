// Angles as text: decimal units, degrees:minutes:seconds, and the packed form dd.mmss.

#include "text/angle.hpp"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <string>
#include <string_view>

#include "points/portable.hpp"
#include "text/locale.hpp"
#include "text/wide.hpp"

using namespace tidewater::detail;

namespace {

// Beyond it a narrow text is not read.
constexpr std::size_t kReadLimit = 150;
// Bytes that a narrow text takes at most, with its end.
constexpr std::size_t kWriteLimit = 50;

constexpr int16_t kLetterInFront = 4;
constexpr int16_t kLetterBehind = 5;

constexpr int16_t kLongitude = 0;
constexpr int16_t kLatitude = 1;

enum class Form { decimal, colon, packed };

// A format without a terminator ends with its field.
Form form_of(const AngleUnit& unit) {
  const auto* end = std::find(std::begin(unit.wide_format), std::end(unit.wide_format), u'\0');
  const std::u16string_view format(unit.wide_format,
                                   static_cast<std::size_t>(end - unit.wide_format));
  if (format.find(u':') != format.npos) return Form::colon;
  return format == u"dd.mmss" ? Form::packed : Form::decimal;
}

// Modes 1 to 3 negate an angle, in reading as in writing.
double with_axis_sense(double value, const AngleUnit& unit, int16_t axis) {
  const bool reversed = unit.hemisphere_mode == 1 ||
                        (unit.hemisphere_mode == 2 && axis == kLatitude) ||
                        (unit.hemisphere_mode == 3 && axis == kLongitude);
  return reversed ? -value : value;
}

// Puts a blank for a letter of the positive hemisphere, the sign in front for one of the negative.
// The letter stands first or last.  A letter of the other axis changes nothing and gives false.
bool replace_letter(char16_t* text, std::size_t length, std::size_t letter, int16_t axis,
                    std::u16string_view negative) {
  constexpr char16_t kLowerCase = 0x20;
  const int upper = text[letter] & ~kLowerCase;
  const bool positive = upper == u'E' || upper == u'N';
  if (axis != (upper == u'E' || upper == u'W' ? kLongitude : kLatitude)) return false;
  if (positive) {
    text[letter] = u' ';
    return true;
  }
  // The caller's text has room for one character more than it holds.
  negative = negative.substr(0, 2);
  const char16_t* rest = letter == 0 ? text + 1 : text;
  char16_t* number = text + negative.size();
  std::u16string_view::traits_type::move(number, rest, length - 1);
  number[length - 1] = u'\0';
  std::copy(negative.begin(), negative.end(), text);
  return true;
}

struct Sexagesimal {
  double deg = 0;
  double min = 0;
  double sec = 0;
  bool negative = false;

  double total() const {
    return (min * 60 + std::fabs(deg) * 3600 + sec) * (negative ? -1.0 : 1.0);
  }
};

// A lone digit counts tens: .5 is fifty minutes.
std::u16string filled_to_two(std::u16string piece) {
  if (piece.size() == 1) piece += u'0';
  return piece;
}

Sexagesimal read_packed(std::u16string_view text) {
  Sexagesimal angle;
  const std::size_t stop = text.find(u'.');
  scan_number(text.substr(0, stop), &angle.deg);
  // By contract: -0.3000 is positive, the number is tested and not its text.
  angle.negative = angle.deg < 0;
  if (stop == text.npos) return angle;

  const std::u16string digits(text.substr(stop + 1));
  scan_number(filled_to_two(digits.substr(0, 2)), &angle.min);
  if (digits.size() > 2) {
    std::u16string seconds = filled_to_two(digits.substr(2, 2));
    // By contract: a full stop also where the locale has another decimal point.
    if (digits.size() > 4) seconds += u"." + digits.substr(4);
    scan_number(seconds, &angle.sec);
  }
  return angle;
}

Sexagesimal read_colon(std::u16string_view text, std::u16string_view negative) {
  Sexagesimal angle;
  const std::string narrowed = narrow(text);
  const char* rest = narrowed.c_str();
  for (double* part : {&angle.deg, &angle.min, &angle.sec}) {
    rest = scan_number(rest, part);
    if (rest == nullptr || *rest++ != ':') break;
  }
  // By contract: -0:30 is negative, and a blank in front of the sign hides it.
  angle.negative = !text.empty() && negative.find(text.front()) != negative.npos;
  return angle;
}

// Truncated, and held to what the type can hold; zero for a not-a-number.
int32_t truncated(double v) {
  using Limits = std::numeric_limits<int32_t>;
  if (std::isnan(v)) return 0;
  if (v >= Limits::max()) return Limits::max();
  if (v <= Limits::min()) return Limits::min();
  return static_cast<int32_t>(v);
}

// v, in seconds, without its sign.
std::string sexagesimal_text(double v, int precision, Form form) {
  const int32_t t = truncated(v);
  const double f = v - t;
  const int32_t whole_deg = t / 3600;
  const int32_t whole_min = t / 60 - whole_deg * 60;
  double deg = whole_deg;
  double min = whole_min;
  double sec = t - (deg * 3600 + min * 60) + f;

  // Seconds that would be rounded to 60 go to the next minute.  The bound is included, with an
  // allowance for its own rounding; it does not grow with the value, the double alone decides.
  constexpr double kBoundRounding = 4 * std::numeric_limits<double>::epsilon() * 60;
  const double half_unit = portable::pow(10.0, -precision) * 0.5;
  if (std::fabs(60 - sec) <= half_unit + kBoundRounding) {
    sec = 0;
    min += 1;
    if (60 - min < 1e-12) {
      min = 0;
      deg += 1;
    }
  }

  const bool packed = form == Form::packed;
  if (precision == 0) {
    const char* format = packed ? "%d.%.2d%.2d" : "%d:%.2d:%.2d";
    return formatted(format, truncated(deg), truncated(min), truncated(sec + 0.5));
  }
  const char* format = packed ? "%d.%02d%0*.*f" : "%d:%02d:%0*.*f";
  std::string text =
      formatted(format, truncated(deg), truncated(min), precision + 3, precision, sec);
  if (packed) {
    // Only the first full stop stays, that of the degrees.
    const auto behind_first = text.begin() + static_cast<std::ptrdiff_t>(text.find('.')) + 1;
    text.erase(std::remove(behind_first, text.end(), '.'), text.end());
  }
  std::replace(text.begin(), text.end(), ' ', '0');
  return text;
}

// The unit's format is wide.
std::string angle_text(double value, const AngleUnit& unit, int16_t axis) {
  value = with_axis_sense(value, unit, axis);
  const bool negative = value < 0;
  const Form form = form_of(unit);
  const double v = std::fabs(value) / unit.factor;

  std::string text;
  // An infinite value has no degrees and minutes.
  if (form == Form::decimal || !std::isfinite(v)) {
    text = decimal_text(value / unit.factor, unit.precision);
  } else {
    text = (negative ? "-" : "") + sexagesimal_text(v, unit.precision, form);
  }

  const bool with_letter =
      unit.hemisphere_mode == kLetterInFront || unit.hemisphere_mode == kLetterBehind;
  if (with_letter && (axis == kLongitude || axis == kLatitude)) {
    const char letter = axis == kLongitude ? (negative ? 'W' : 'E') : (negative ? 'S' : 'N');
    if (negative) text.erase(0, 1);
    text.insert(unit.hemisphere_mode == kLetterInFront ? 0 : text.size(), 1, letter);
  }
  return text;
}

// The text has room for one character more than it holds; the unit's format is wide.
void read_angle(char16_t* text, const AngleUnit& unit, int16_t axis, const LocaleSigns& signs,
                double* value, TWstatus* status) {
  *status = TW_SUCCESS;
  const std::u16string_view given = text;
  const auto allowed = [&](char16_t c) {
    if (c >= u'0' && c <= u'9') return true;
    constexpr std::u16string_view kAllowed = u"NEWSnews-+ :\n";
    return kAllowed.find(c) != kAllowed.npos ||
           signs.decimal_separator.find(c) != std::u16string::npos ||
           signs.positive.find(c) != std::u16string::npos ||
           signs.negative.find(c) != std::u16string::npos;
  };
  if (!std::all_of(given.begin(), given.end(), allowed)) {
    *status = TW_BAD_TEXT;
    return;
  }
  const bool in_front = unit.hemisphere_mode == kLetterInFront;
  const bool behind = unit.hemisphere_mode == kLetterBehind;
  if (in_front || behind) {
    const std::size_t letter = given.find_first_of(u"NEWSnews");
    if (letter == given.npos || letter != (in_front ? 0 : given.size() - 1)) {
      *status = TW_BAD_TEXT;
      return;
    }
    // By contract: with a letter of the other axis the value is still read and written.
    if (!replace_letter(text, given.size(), letter, axis, signs.negative)) *status = TW_BAD_TEXT;
  }

  const std::u16string_view number = text;
  double result = 0;
  switch (form_of(unit)) {
    case Form::decimal:
      if (number.find(u':') != number.npos) {
        *status = TW_BAD_TEXT;
        return;
      }
      scan_number(number, &result);
      break;
    case Form::packed:
      result = read_packed(number).total();
      break;
    case Form::colon:
      result = read_colon(number, signs.negative).total();
      break;
  }
  *value = with_axis_sense(result * unit.factor, unit, axis);
}

}  // namespace

AngleUnit tidewater::detail::with_wide_format(const AngleUnit& unit) {
  const auto* end = std::find(std::begin(unit.format), std::end(unit.format), '\0');
  const std::string_view narrow(unit.format, static_cast<std::size_t>(end - unit.format));
  const std::u16string format = widen(narrow, std::size(unit.wide_format) - 1);
  AngleUnit wide = unit;
  copy_whole(format, wide.wide_format);
  return wide;
}

void TWascii_to_rad(const char* text, AngleUnit unit, int16_t axis, double* value,
                    TWstatus* status) {
  without_exceptions(status, [&] {
    const LocaleSigns signs = adopt_user_locale_signs();
    std::u16string wide = widen(text, kReadLimit);
    wide += u'\0';  // room for the sign
    read_angle(wide.data(), with_wide_format(unit), axis, signs, value, status);
  });
}

void TWascii_to_rad_wide(TWchar16* text, AngleUnit unit, int16_t axis, double* value,
                         TWstatus* status) {
  without_exceptions(
      status, [&] { read_angle(text, unit, axis, adopt_user_locale_signs(), value, status); });
}

void TWrad_to_ascii(double value, AngleUnit unit, int16_t axis, char* text, TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    adopt_user_locale();
    copy_cut(angle_text(value, with_wide_format(unit), axis), kWriteLimit, text);
  });
}

void TWrad_to_ascii_wide(double value, AngleUnit unit, int16_t axis, TWchar16* text,
                         TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    adopt_user_locale();
    const std::string narrowed = angle_text(value, unit, axis);
    copy_whole(widen(narrowed, narrowed.size()), text);
  });
}
