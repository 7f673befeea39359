/**
 * @file position_text.hpp
 * Angles, positions and grid references as people write them.
 *
 * Nothing here depends on the locale, keeps a state or throws (but std::bad_alloc for the sentence
 * of a refusal).  Texts are UTF-8.  Everything may be called from any thread.
 */
#ifndef TIDEWATER_POSITION_TEXT_HPP
#define TIDEWATER_POSITION_TEXT_HPP

#include <cstddef>
#include <limits>
#include <string>
#include <string_view>

#include "tidewater/error.hpp"

namespace tidewater {

/** What an angle is; a hemisphere letter decides. */
enum class Axis {
  unknown,
  longitude, /**< E, W; up to 360 degrees either way */
  latitude,  /**< N, S; up to 90 degrees */
};

/** An angle that was read, or the reason why not. */
struct ParsedAngle {
  double degrees = std::numeric_limits<double>::quiet_NaN(); /**< east and north positive */
  Axis axis = Axis::unknown; /**< by its letter, else as it was asked for */
  std::string reason;        /**< a sentence; empty when the angle was read */

  explicit operator bool() const { return reason.empty(); }
};

/**
 * Reads an angle.
 *
 * Takes decimal degrees, degrees and minutes, degrees, minutes and seconds; a sign, or a letter or
 * word of the hemisphere before or behind:
 *
 *     -48.5   48°51'24"N   N 48° 51.4′   48 51 24 N   48d51m24s   48:51:24.5S   48-51-24N
 *
 * and the packed forms DDMM, DDMMSS of a latitude, DDDMM, DDDMMSS of a longitude, which need their
 * letter: 485124N, 0022107.5E.  Any of the usual degree signs, primes and quotation marks serves.
 *
 * Refused, with the reason: a sign and a letter together; two letters; minutes or seconds of 60 and
 * more; a fraction of anything but the last part; packed digits whose degrees cannot be told
 * (1230E); O, which is west in French and Spanish and east in German; a decimal comma that was not
 * asked for; anything left over; a value beyond the axis's range.
 *
 * @param text           blanks around it are skipped
 * @param axis           what is expected; a letter of the other axis is refused
 * @param decimal_comma  the comma is a decimal mark, the full stop still is one
 * @return degrees to within one unit in the last place of what is written; a plain decimal number
 *         is the nearest double
 */
TW_SYSTEMS_API ParsedAngle parse_angle(std::string_view text, Axis axis = Axis::unknown,
                                       bool decimal_comma = false);

/** Which angle of a position stands first where no letter tells. */
enum class Order {
  unknown, /**< a position that does not tell is refused */
  longitude_first,
  latitude_first,
};

/** A position that was read, or the reason why not. */
struct ParsedPosition {
  double longitude = std::numeric_limits<double>::quiet_NaN(); /**< degrees, east positive */
  double latitude = std::numeric_limits<double>::quiet_NaN();  /**< degrees, north positive */
  double height = std::numeric_limits<double>::quiet_NaN(); /**< metres; not-a-number without one */
  std::string reason; /**< a sentence; empty when the position was read */

  explicit operator bool() const { return reason.empty(); }
};

/**
 * Reads a position: two angles as parse_angle() takes them, and perhaps a height in metres.
 *
 * The angles are parted by a comma, a semicolon, a tab or a slash, by their letters, signs, degree
 * signs or colons, or by blanks where that leaves no doubt:
 *
 *     48°51'24"N 2°21'03"E   N48 51.4, E2 21.05, 35 m   2.35 48.85   +48.8577+002.2950/
 *
 * The last is the form of ISO 6709, with its solidus: latitude first, also packed.
 *
 * @param text           one position
 * @param order          which angle stands first; letters overrule it, and an angle beyond 90
 *                       degrees is a longitude where the order is unknown
 * @param decimal_comma  a comma between two digits is a decimal mark
 */
TW_SYSTEMS_API ParsedPosition parse_position(std::string_view text, Order order = Order::unknown,
                                             bool decimal_comma = false);

/** How an angle is divided. */
enum class AngleForm {
  degrees, /**< 48.856667 */
  minutes, /**< 48°51.4 */
  seconds, /**< 48°51'24 */
  packed,  /**< 485124; three digits of degrees in a longitude */
};

/** What stands between the parts. */
enum class AngleMarks {
  none,    /**< nothing between, and nothing behind: for decimal degrees and packed forms */
  symbols, /**< 48°51′24″ */
  plain,   /**< 48d51'24" */
  colons,  /**< 48:51:24 */
  blanks,  /**< 48 51 24 */
};

/** How an angle is written. */
struct AngleFormat {
  AngleForm form = AngleForm::degrees;
  AngleMarks marks = AngleMarks::none; /**< colons where the form has parts and none is asked */
  int precision = 8; /**< decimals of the last part, 0 to 15; in minutes and seconds at most 9 */
  Axis axis = Axis::unknown; /**< letter N, S, E, W behind; unknown: a sign in front */
};

/** Bytes that format_angle() writes at most. */
inline constexpr std::size_t kAngleTextSize = 64;

/**
 * Writes an angle, rounded to the last decimal asked for; 60 minutes or seconds never appear.
 *
 * @param degrees  east and north positive; "nan" is written for what is not finite or beyond a
 *                 million degrees
 * @param out      kAngleTextSize bytes; no terminator is written
 * @return the number of bytes written
 */
TW_SYSTEMS_API std::size_t format_angle(double degrees, const AngleFormat& format, char* out);
/** The same as a string. */
TW_SYSTEMS_API std::string format_angle(double degrees, const AngleFormat& format = {});

}  // namespace tidewater

#endif
