/**
 * @file molodensky.h
 * Molodensky's datum shift.
 *
 * Points are longitude, latitude (radians) and ellipsoidal height.  A latitude beyond 89 degrees
 * (1.5533430342749535, itself excluded) goes by geocentric coordinates.  Nothing is wrapped or
 * refused.
 *
 * The formula is of the first order: against the shift of geocentric coordinates itself its error
 * grows with the square of the shift and with the tangent of the latitude.  Where the shift carries
 * a point over 89 degrees, the two ways take different formulas and the round trip is as far off as
 * the formula itself.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Molodensky, 238 m, Clarke 1866 to WGS 84, lat -89 to 89: forward 106 mm (27 mm), inverse
 *   106 mm (27 mm);
 * - Molodensky, 776 m, Bessel to WGS 84, lat -89 to 89: forward 1.7 m (314 mm), inverse 1.7 m
 *   (314 mm).
 *
 * Source: Defense Mapping Agency Technical Report 8350.2, Department of Defense World Geodetic
 * System 1984 (1991), section 7; IOGP Publication 373-7-2 (Guidance Note 7-2), method 9604.
 */
#ifndef TIDEWATER_MOLODENSKY_H
#define TIDEWATER_MOLODENSKY_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Source datum to target datum.
 * @param a,e       source ellipsoid
 * @param da        target less source semi-major axis
 * @param df        target less source flattening
 * @param dx,dy,dz  shift of the origin, in the unit of a
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param out       longitude, latitude, height; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWmol_std_f(double a, double e, double da, double df, double dx, double dy, double dz,
                        int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

/**
 * Target datum to source datum, with the parameters of TWmol_std_f(): two passes of the same shift,
 * so that a round trip is close, not exact.
 * @param a,e       source ellipsoid
 * @param da        target less source semi-major axis
 * @param df        target less source flattening
 * @param dx,dy,dz  shift of the origin, in the unit of a
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param out       longitude, latitude, height; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWmol_std_i(double a, double e, double da, double df, double dx, double dy, double dz,
                        int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
