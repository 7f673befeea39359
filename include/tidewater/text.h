/**
 * @file text.h
 * Umbrella: angles, coordinates and measures as text.
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

#include "tidewater/angle_text.h"
#include "tidewater/coordinate_text.h"
#include "tidewater/measure_text.h"

#endif
