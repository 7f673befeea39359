/**
 * @file text.h
 * Angles, coordinates and measures as text.
 *
 * Reading first holds the whole text against the characters that the function admits and gives
 * #TW_BAD_TEXT for any other; then it scans numbers as "%lf" does.  A number that does not scan is
 * no failure: it stays 0.  Writing formats numbers with "%.*f": rounded, never with an exponent; a
 * negative precision counts as 6.
 *
 * Numbers follow the user's locale.  Each call sets the locale of the whole process to it,
 * setlocale(LC_ALL, ""), and leaves it so: do not call these functions while another thread uses or
 * changes the locale.  Where the decimal point is a comma, numbers are written with it and read up
 * to it; the comma still separates the fields of a coordinate, and the measure and coordinate
 * readers admit no other decimal separator than the full stop.
 *
 * Narrow text is in the encoding of the locale, wide text is 16-bit on every platform.  Both end
 * with a null.  A failed allocation gives #TW_NO_MEMORY.
 */
#ifndef TIDEWATER_TEXT_H
#define TIDEWATER_TEXT_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * The unit in which an angle is written.
 *
 * The format picks the form: "dd.mmss" is the packed form, a text with a colon is
 * degrees:minutes:seconds, any other text is a decimal unit.  Minutes and seconds are read as they
 * stand, also above 59.
 *
 * The hemisphere mode tells sign or letter:
 * - 0: the sign of the angle.
 * - 1: both axes reversed.
 * - 2: latitudes reversed, south is positive.
 * - 3: longitudes reversed, west is positive.
 * - 4: a letter N, S, E or W in front.
 * - 5: a letter N, S, E or W behind.
 */
typedef struct AngleUnit {
  union {
    char format[32];          /**< For the narrow functions; 15 characters count. */
    TWchar16 wide_format[16]; /**< For the functions that end in _wide. */
  };
  int16_t precision;       /**< Decimals: of the unit, in the other forms of the seconds. */
  int16_t hemisphere_mode; /**< 0 to 5, see above. */
  double factor; /**< Radians per unit; in the colon and the packed form radians per second of arc.
                  */
} AngleUnit;

/** @name Angles
 *
 * The axis is 0 for a longitude, with the letters E and W, and 1 for a latitude, with N and S; no
 * letter fits any other value.
 *  @{ */

/**
 * Reads an angle.
 *
 * Admitted are digits, N E W S in either case, blank, colon, line feed, "+", "-", and the decimal
 * separator and signs of the user's locale.  In modes 0 to 3 a letter ends the number.  The packed
 * form knows the full stop only: "12.300525" is 12 degrees 30 minutes 5.25 seconds, "12.5" is 12
 * degrees 50 minutes, and "-0.3000" is positive.  In the colon form "-0:30:00" is negative, and a
 * blank in front of the sign hides it.
 * @param text    the text; its first 150 characters are read
 * @param unit    unit with a narrow format
 * @param axis    0 longitude, 1 latitude
 * @param value   angle, radians, positive east and north
 * @param status  #TW_BAD_TEXT for a character that is not admitted, for a missing letter in modes 4
 *                and 5, for a colon in a decimal unit: value unwritten; #TW_BAD_TEXT also for a
 *                letter of the other axis: the value is written all the same
 */
TW_API void TWascii_to_rad(const char* text, AngleUnit unit, int16_t axis, double* value,
                           TWstatus* status);

/**
 * As TWascii_to_rad(), with wide text of any length.  In modes 4 and 5 the text is changed: a
 * letter N or E becomes a blank; for S or W the letter goes and the negative sign stands in front.
 * @param text    the text, changed in place, with room for one character more than it holds
 * @param unit    unit with a wide format
 * @param axis    0 longitude, 1 latitude
 * @param value   angle, radians, positive east and north
 * @param status  as for TWascii_to_rad()
 */
TW_API void TWascii_to_rad_wide(TWchar16* text, AngleUnit unit, int16_t axis, double* value,
                                TWstatus* status);

/**
 * Writes an angle.
 *
 * Seconds that would round to 60 go to the next minute, minutes that reach 60 to the next degree.
 * An angle that is infinite or not a number is written as in a decimal unit.
 * @param value   angle, radians, positive east and north
 * @param unit    unit with a narrow format
 * @param axis    0 longitude, 1 latitude; with another value no letter is written
 * @param text    room for 50 bytes; a longer text is cut there
 * @param status  always #TW_SUCCESS
 */
TW_API void TWrad_to_ascii(double value, AngleUnit unit, int16_t axis, char* text,
                           TWstatus* status);

/**
 * As TWrad_to_ascii(), with wide text that is never cut.
 * @param value   angle, radians, positive east and north
 * @param unit    unit with a wide format
 * @param axis    0 longitude, 1 latitude; with another value no letter is written
 * @param text    room for the whole text: about 30 characters at an ordinary precision
 * @param status  always #TW_SUCCESS
 */
TW_API void TWrad_to_ascii_wide(double value, AngleUnit unit, int16_t axis, TWchar16* text,
                                TWstatus* status);

/** @} */

/** @name Measures and numbers
 *
 * The unit is the number of metres in one unit of the text; for an area or a volume already squared
 * or cubed.  The narrow readers read the first 50 characters.
 *  @{ */

/**
 * Writes a length.
 * @param value      length, metres
 * @param precision  decimals
 * @param unit       metres per unit; a negative one changes the sign
 * @param text       room for the whole text, which is never cut
 * @param status     #TW_RANGE_ERROR for a unit of exactly zero; text unwritten
 */
TW_API void TWmet_to_ascii(double value, int16_t precision, double unit, char* text,
                           TWstatus* status);

/** As TWmet_to_ascii(), with wide text. */
TW_API void TWmet_to_ascii_wide(double value, int16_t precision, double unit, TWchar16* text,
                                TWstatus* status);

/**
 * Writes an area.
 * @param value      area, square metres
 * @param precision  decimals
 * @param unit       square metres per unit
 * @param text       room for the whole text, which is never cut
 * @param status     #TW_RANGE_ERROR for a unit of zero or below; text unwritten
 */
TW_API void TWsq_met_to_ascii(double value, int16_t precision, double unit, char* text,
                              TWstatus* status);

/** As TWsq_met_to_ascii(), with wide text. */
TW_API void TWsq_met_to_ascii_wide(double value, int16_t precision, double unit, TWchar16* text,
                                   TWstatus* status);

/**
 * Writes a volume.
 * @param value      volume, cubic metres
 * @param precision  decimals
 * @param unit       cubic metres per unit
 * @param text       room for the whole text, which is never cut
 * @param status     #TW_RANGE_ERROR for a unit of zero or below; text unwritten
 */
TW_API void TWcub_met_to_ascii(double value, int16_t precision, double unit, char* text,
                               TWstatus* status);

/** As TWcub_met_to_ascii(), with wide text. */
TW_API void TWcub_met_to_ascii_wide(double value, int16_t precision, double unit, TWchar16* text,
                                    TWstatus* status);

/**
 * Reads a length.  Admitted are digits, full stop, "+", "-", "e", "E", blank and line feed.
 * @param text    the text; its first 50 characters are read
 * @param unit    metres per unit
 * @param value   length, metres
 * @param status  #TW_BAD_TEXT for any other character, the comma included; value unwritten
 */
TW_API void TWascii_to_met(const char* text, double unit, double* value, TWstatus* status);

/** As TWascii_to_met(), with wide text of any length. */
TW_API void TWascii_to_met_wide(const TWchar16* text, double unit, double* value, TWstatus* status);

/**
 * Reads an area, with the characters of TWascii_to_met().
 * @param text    the text; its first 50 characters are read
 * @param unit    square metres per unit
 * @param value   area, square metres
 * @param status  #TW_BAD_TEXT for any other character; value unwritten
 */
TW_API void TWascii_to_sq_met(const char* text, double unit, double* value, TWstatus* status);

/** As TWascii_to_sq_met(), with wide text of any length. */
TW_API void TWascii_to_sq_met_wide(const TWchar16* text, double unit, double* value,
                                   TWstatus* status);

/**
 * Reads a volume, with the characters of TWascii_to_met().
 * @param text    the text; its first 50 characters are read
 * @param unit    cubic metres per unit
 * @param value   volume, cubic metres
 * @param status  #TW_BAD_TEXT for any other character; value unwritten
 */
TW_API void TWascii_to_cub_met(const char* text, double unit, double* value, TWstatus* status);

/** As TWascii_to_cub_met(), with wide text of any length. */
TW_API void TWascii_to_cub_met_wide(const TWchar16* text, double unit, double* value,
                                    TWstatus* status);

/**
 * Writes a number without its trailing zeros and without a separator that then stands last.  The
 * zeros of a whole number go too: 100 at precision 0 becomes "1".  Pass a precision of at least 1.
 * @param value      the number
 * @param precision  decimals before the zeros are cut
 * @param text       room for 50 bytes; a longer text is cut there
 * @param status     #TW_FAILURE where the number cannot be formatted; text unwritten
 */
TW_API void TWscalr_to_asc(double value, int16_t precision, char* text, TWstatus* status);

/** @} */

/** @name Coordinates
 *
 * A coordinate is a line of fields, separated by a comma, in writing by a comma and a blank.  An
 * order of zero puts longitude or easting first, any other value latitude or northing.  The first
 * 150 characters of a text are read; missing fields count as 0.
 *  @{ */

/**
 * Writes longitude and latitude, and the height where it is asked for.
 * @param point             longitude and latitude, radians; height, metres
 * @param unit              unit of the angles, with a narrow format
 * @param order             0 longitude first, otherwise latitude first
 * @param with_height       other than 0: the height follows
 * @param height_precision  decimals of the height
 * @param height_unit       metres per unit of the height
 * @param text              room for 156 bytes: the angles are cut as in TWrad_to_ascii(), the
 *                          height at 51 bytes
 * @param status            always #TW_SUCCESS
 */
TW_API void TWllh_to_ascii(const CoordinateTriple* point, AngleUnit unit, int16_t order,
                           int16_t with_height, int16_t height_precision, double height_unit,
                           char* text, TWstatus* status);

/**
 * Writes easting and northing, and the height where it is asked for.
 * @param point             easting, northing, height, metres
 * @param order             0 easting first, otherwise northing first
 * @param precision         decimals of easting and northing
 * @param unit              metres per unit of easting and northing
 * @param with_height       other than 0: the height follows
 * @param height_precision  decimals of the height
 * @param height_unit       metres per unit of the height
 * @param text              room for 182 bytes: each field is cut at 59 bytes
 * @param status            #TW_RANGE_ERROR for a unit of exactly zero; text unwritten
 */
TW_API void TWenh_to_ascii(const CoordinateTriple* point, int16_t order, int16_t precision,
                           double unit, int16_t with_height, int16_t height_precision,
                           double height_unit, char* text, TWstatus* status);

/**
 * Writes X, Y and Z.
 * @param point      X, Y, Z, metres
 * @param precision  decimals
 * @param unit       metres per unit
 * @param text       room for 158 bytes: each field is cut at 51 bytes
 * @param status     #TW_RANGE_ERROR for a unit of exactly zero; text unwritten
 */
TW_API void TWxyz_to_ascii(const CoordinateTriple* point, int16_t precision, double unit,
                           char* text, TWstatus* status);

/**
 * Reads longitude and latitude, and the height where there is a third field.  Admitted are digits,
 * N E W S in either case, comma, full stop, "+", "-", colon, blank and line feed; blanks in front
 * of a field are skipped, blanks behind it are not.
 * @param text         the text
 * @param unit         unit of the angles, with a narrow format
 * @param order        0 longitude first, otherwise latitude first
 * @param height_unit  metres per unit of the height
 * @param point        longitude in [-pi, pi] and latitude, radians; height, metres
 * @param status       #TW_BAD_TEXT as for TWascii_to_rad(), here always with nothing written;
 *                     #TW_BAD_LONGITUDE and #TW_BAD_LATITUDE as for TWverify_lon() and
 *                     TWverify_lat(); point unwritten
 */
TW_API void TWascii_to_llh(const char* text, AngleUnit unit, int16_t order, double height_unit,
                           CoordinateTriple* point, TWstatus* status);

/**
 * Reads easting and northing, and the height where there is a third field.  Admitted are the comma
 * and the characters of TWascii_to_met().
 * @param text         the text
 * @param order        0 easting first, otherwise northing first
 * @param unit         metres per unit of easting and northing
 * @param height_unit  metres per unit of the height
 * @param point        easting, northing, height, metres
 * @param status       #TW_BAD_TEXT for any other character; point unwritten
 */
TW_API void TWascii_to_enh(const char* text, int16_t order, double unit, double height_unit,
                           CoordinateTriple* point, TWstatus* status);

/**
 * Reads X, Y and Z.  Admitted are digits, comma, full stop, "-", blank and line feed: neither a
 * plus sign nor an exponent.
 * @param text    the text
 * @param unit    metres per unit
 * @param point   X, Y, Z, metres
 * @param status  #TW_BAD_TEXT for any other character; point unwritten
 */
TW_API void TWascii_to_xyz(const char* text, double unit, CoordinateTriple* point,
                           TWstatus* status);

/** @} */

#ifdef __cplusplus
}
#endif

#endif
