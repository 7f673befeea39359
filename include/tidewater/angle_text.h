/**
 * @file angle_text.h
 * Angles as text.
 *
 * The axis is 0 for a longitude, with the letters E and W, and 1 for a latitude, with N and S; no
 * letter fits any other value.
 *
 * Accuracy: no figure; texts, names and nodes as they stand in files, exact digit by digit in
 * tests/unit (docs/accuracy.md).
 *
 * What all functions of text have in common is told in text.h.
 */
#ifndef TIDEWATER_ANGLE_TEXT_H
#define TIDEWATER_ANGLE_TEXT_H

#include "tidewater/frame.h"

/** Puts a member on a multiple of 8 bytes on every machine, 32-bit ones included. */
#ifdef __cplusplus
#define TW_ALIGNED_8 alignas(8)
#else
#define TW_ALIGNED_8 _Alignas(8)
#endif

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
  /** Radians per unit; in the colon and the packed form radians per second of arc. */
  TW_ALIGNED_8 double factor;
} AngleUnit;

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
 * An angle that is infinite or NaN is written as in a decimal unit.
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

#ifdef __cplusplus
}
#endif

#endif
