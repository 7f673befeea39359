/**
 * @file position_text.hpp
 * Angles, positions and grid references as people write them.
 *
 * Nothing here depends on the locale, keeps a state or throws (but std::bad_alloc for the sentence
 * of a refusal).  Texts are UTF-8.  Everything may be called from any thread.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Angles as text, degrees, minutes, seconds to 5 decimals: 2.6e-14 degrees (1.5e-14 degrees);
 * - Positions as text, decimal degrees to 12 decimals: 0 degrees (0 degrees);
 * - Military grid references, lat -79 to 83, squares of 1 um: inverse 678 nm (607 nm).
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
  std::string reason = {};   /**< a sentence; empty when the angle was read */

  /** There is no reason why not. */
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
  double height = std::numeric_limits<double>::quiet_NaN();    /**< metres; NaN without one */
  std::string reason = {}; /**< a sentence; empty when the position was read */

  /** There is no reason why not. */
  explicit operator bool() const { return reason.empty(); }
};

/**
 * Reads a position: two angles as parse_angle() takes them, and perhaps a height in metres.
 *
 * The angles are separated by a comma, a semicolon, a tab or a slash, by their letters, signs,
 * degree signs or colons, or by blanks where that leaves no doubt:
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
  AngleForm form = AngleForm::degrees; /**< how it is divided */
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
 * @param format   how it is written
 * @param out      kAngleTextSize bytes; no terminator is written
 * @return the number of bytes written
 */
TW_SYSTEMS_API std::size_t format_angle(double degrees, const AngleFormat& format, char* out);
/** The same as a string. */
TW_SYSTEMS_API std::string format_angle(double degrees, const AngleFormat& format = {});

/**
 * Coordinates on the universal grids of WGS 84: transverse Mercator in zones, polar stereographic
 * at the poles.
 */
struct GridPosition {
  int zone = -1;     /**< 1 to 60; 0: polar stereographic */
  bool north = true; /**< false: false northings of the southern hemisphere, or the south pole */
  double easting = std::numeric_limits<double>::quiet_NaN();  /**< metres */
  double northing = std::numeric_limits<double>::quiet_NaN(); /**< metres */
  /** Side of the square that a reference names, in metres, of which easting and northing are the
   * south-western corner; 0 for a point. */
  double square = 0;
  std::string reason = {}; /**< a sentence; empty when there is a position */

  /** There is no reason why not. */
  explicit operator bool() const { return reason.empty(); }
};

/**
 * The universal zone of a point: 1 to 60 with the wider zones of Norway and Svalbard, 0 (polar)
 * from 84 degrees north and south of 80 degrees south.
 * @param longitude,latitude  degrees
 * @return -1 where the latitude is beyond a pole or a figure is not finite
 */
TW_SYSTEMS_API int utm_zone(double longitude, double latitude);

/**
 * Universal grid coordinates of a point.
 * @param longitude,latitude  degrees on WGS 84
 * @param zone  -1: that of utm_zone(); else the zone to use, 0 polar
 */
TW_SYSTEMS_API GridPosition grid_position(double longitude, double latitude, int zone = -1);

/**
 * The point of grid coordinates: the centre where they name a square.
 * @return longitude and latitude in degrees on WGS 84, no height; or the reason why there is none
 */
TW_SYSTEMS_API ParsedPosition position_of(const GridPosition& grid);

/**
 * Reads a reference of the military grid (MGRS, USNG): 31UDQ4825111932, 31U DQ 48251 11932, and at
 * the poles YUB1798816324.
 *
 * None to eleven digits each of easting and northing tell the square: 100 km to a micrometre.
 * Letters in either case, blanks between the groups.  Source: The Universal Grids and the
 * Transverse Mercator and Polar Stereographic Map Projections, NGA.SIG.0012_2.0.0_UTMUPS (2014),
 * chapter 11 and appendices A and B.
 *
 * Refused, with the reason: letters I and O; a band that does not exist; a column or row that does
 * not occur in the zone; a square that lies outside its band (27XAA), or more than 50 km outside
 * its zone; an odd number of digits or groups of unequal length.
 */
TW_SYSTEMS_API GridPosition parse_mgrs(std::string_view text);

/**
 * The reference of the square that holds a point; nothing is rounded.
 * @param grid    zone, hemisphere, easting and northing; a square's corner is its point
 * @param digits  0 to 11, digits each of easting and northing
 * @param blanks  "31U DQ 48251 11932" instead of "31UDQ4825111932"
 * @return the text; empty if the point has none
 */
TW_SYSTEMS_API std::string format_mgrs(const GridPosition& grid, int digits = 5,
                                       bool blanks = false);
/**
 * The same for a point of longitude and latitude in degrees on WGS 84.
 */
TW_SYSTEMS_API std::string format_mgrs(double longitude, double latitude, int digits = 5,
                                       bool blanks = false);

}  // namespace tidewater

#endif
