/**
 * @file measure_text.h
 * Measures and numbers as text.
 *
 * The unit is the number of metres in one unit of the text; for an area or a volume already squared
 * or cubed.  The narrow readers read the first 50 characters.
 *
 * Accuracy: no figure; texts, names and nodes as they stand in files, exact digit by digit in
 * tests/unit (docs/accuracy.md).
 *
 * What all functions of text have in common is told in text.h.
 */
#ifndef TIDEWATER_MEASURE_TEXT_H
#define TIDEWATER_MEASURE_TEXT_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

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

/**
 * As TWmet_to_ascii(), with wide text.
 * @param value      length, metres
 * @param precision  decimals
 * @param unit       metres per unit; a negative one changes the sign
 * @param text       room for the whole text, which is never cut
 * @param status     #TW_RANGE_ERROR for a unit of exactly zero; text unwritten
 */
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

/**
 * As TWsq_met_to_ascii(), with wide text.
 * @param value      area, square metres
 * @param precision  decimals
 * @param unit       square metres per unit
 * @param text       room for the whole text, which is never cut
 * @param status     #TW_RANGE_ERROR for a unit of zero or below; text unwritten
 */
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

/**
 * As TWcub_met_to_ascii(), with wide text.
 * @param value      volume, cubic metres
 * @param precision  decimals
 * @param unit       cubic metres per unit
 * @param text       room for the whole text, which is never cut
 * @param status     #TW_RANGE_ERROR for a unit of zero or below; text unwritten
 */
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

/**
 * As TWascii_to_met(), with wide text of any length.
 * @param text    the text, all of which is read
 * @param unit    metres per unit
 * @param value   length, metres
 * @param status  #TW_BAD_TEXT for a character that is not admitted; value unwritten
 */
TW_API void TWascii_to_met_wide(const TWchar16* text, double unit, double* value, TWstatus* status);

/**
 * Reads an area, with the characters of TWascii_to_met().
 * @param text    the text; its first 50 characters are read
 * @param unit    square metres per unit
 * @param value   area, square metres
 * @param status  #TW_BAD_TEXT for any other character; value unwritten
 */
TW_API void TWascii_to_sq_met(const char* text, double unit, double* value, TWstatus* status);

/**
 * As TWascii_to_sq_met(), with wide text of any length.
 * @param text    the text, all of which is read
 * @param unit    square metres per unit
 * @param value   area, square metres
 * @param status  #TW_BAD_TEXT for a character that is not admitted; value unwritten
 */
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

/**
 * As TWascii_to_cub_met(), with wide text of any length.
 * @param text    the text, all of which is read
 * @param unit    cubic metres per unit
 * @param value   volume, cubic metres
 * @param status  #TW_BAD_TEXT for a character that is not admitted; value unwritten
 */
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

#ifdef __cplusplus
}
#endif

#endif
