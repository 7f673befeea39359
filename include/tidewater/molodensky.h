/**
 * @file molodensky.h
 * Molodensky's datum shift.
 *
 * Points are longitude, latitude (radians) and ellipsoidal height.  A latitude beyond 89 degrees
 * (1.5533430342749535, itself excluded) goes by geocentric coordinates.  Nothing is wrapped or
 * refused.
 *
 * The formula is of the first order.  Against the shift of geocentric coordinates itself, measured
 * over all longitudes with a shift of 105 m between Clarke 1866 and WGS 84 (of 865 m between Bessel
 * and WGS 84): 0.03 m (0.08 m) at 30 degrees of latitude, 0.03 m (0.14 m) at 75, 0.14 m (1.5 m)
 * just short of 89 degrees.  It grows with the square of the shift and with the tangent of the
 * latitude: with 730 m between Bessel and WGS 84 in other directions 0.4 m at 85 degrees and 1.9 m
 * just short of 89.  A round trip is within 0.03 mm up to 60 degrees and 15 mm at 88.9; where the
 * shift carries a point over 89 degrees, the two ways take different formulas and the round trip is
 * as far off as the formula itself.
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
