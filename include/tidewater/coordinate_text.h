/**
 * @file coordinate_text.h
 * Coordinates as text.
 *
 * A coordinate is a line of fields, separated by a comma, in writing by a comma and a blank.  An
 * order of zero puts longitude or easting first, any other value latitude or northing.  The first
 * 150 characters of a text are read; missing fields count as 0.
 *
 * Accuracy: no figure; texts, names and nodes as they stand in files, exact digit by digit in
 * tests/unit (docs/accuracy.md).
 *
 * What all functions of text have in common is told in text.h.
 */
#ifndef TIDEWATER_COORDINATE_TEXT_H
#define TIDEWATER_COORDINATE_TEXT_H

#include "tidewater/angle_text.h"
#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

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
 * Reads X, Y and Z. Admitted are digits, comma, full stop, "-", blank and line feed: neither a plus
 * sign nor an exponent.
 * @param text    the text
 * @param unit    metres per unit
 * @param point   X, Y, Z, metres
 * @param status  #TW_BAD_TEXT for any other character; point unwritten
 */
TW_API void TWascii_to_xyz(const char* text, double unit, CoordinateTriple* point,
                           TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
