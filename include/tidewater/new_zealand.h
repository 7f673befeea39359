/**
 * @file new_zealand.h
 * New Zealand map grid.
 *
 * A complex polynomial of the sixth degree over the Mercator plane of the International ellipsoid.
 * The third double of TWn_zeal_f(), TWn_zeal_i() and TWn_zeal_s() is part of the call but not read.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - New Zealand map grid, 166 to 179 E, 34 to 48 S: forward 1.4 nm (< 1 nm), inverse 1.4 nm
 *   (1.4 nm), scale 3.9e-16 (2.6e-16);
 * - New Zealand's polynomial, arguments to 0.12: forward 6.6e-17 (5.7e-17), inverse 2.0e-17
 *   (1.6e-17).
 *
 * Source: Reilly, A Conformal Mapping Projection with Minimum Scale Error, Survey Review 22 (1973),
 * pp. 57-71.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_NEW_ZEALAND_H
#define TIDEWATER_NEW_ZEALAND_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * The fixed parameters of the grid.
 * @param lon_c           longitude of origin, 173 degrees, in radians
 * @param lat_c           latitude of origin, -41 degrees, in radians
 * @param false_easting   2510000 m
 * @param false_northing  6023150 m
 * @param k0              1
 * @param status          always #TW_SUCCESS
 */
TW_API void TWn_zeal_param(double* lon_c, double* lat_c, double* false_easting,
                           double* false_northing, double* k0, TWstatus* status);

/**
 * Mercator ordinate of the latitude of origin.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians; the poles themselves pass
 * @param y0      isometric latitude of lat0
 * @param status  #TW_BAD_LATITUDE beyond a pole; y0 unwritten
 */
TW_API void TWn_zeal_c(double e, double lat0, double* y0, TWstatus* status);

/**
 * Forward.
 * @param e       first eccentricity
 * @param lon0    longitude of origin
 * @param unused  not read
 * @param y0      constant of TWn_zeal_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y; may be in
 * @param status  #TW_BAD_LATITUDE at a pole, as TWmerc_f(): the output of such a point is READ ALL
 *                THE SAME, and replaced by the polynomial of what it held
 */
TW_API void TWn_zeal_f(double e, double lon0, double unused, double y0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse.  An iteration that does not converge leaves the status as it was.
 * @param e       first eccentricity
 * @param lon0    longitude of origin
 * @param unused  not read
 * @param y0      constant of TWn_zeal_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWn_zeal_i(double e, double lon0, double unused, double y0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale, the size of the polynomial's derivative times the Mercator scale.  Latitudes within 1e-10
 * of a pole are clamped as in TWmerc_s(), the south pole just past the NORTH pole, which gives a
 * negative k and #TW_BAD_LATITUDE.
 * @param e       first eccentricity
 * @param lon0    longitude of origin; the difference is not wrapped
 * @param unused  not read
 * @param y0      constant of TWn_zeal_c()
 * @param k0      the fill of a failing point; it has NO OTHER PART in the scale
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k); may be in
 * @param status  #TW_BAD_LATITUDE beyond a pole: fill
 */
TW_API void TWn_zeal_s(double e, double lon0, double unused, double y0, double k0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Value of the grid's polynomial at a complex number.  This call has no status.
 * @param re,im   isometric latitude and longitude, both from the origin
 * @param result  two doubles: real part (y) and imaginary part (x)
 */
TW_API void TWn_zeal_fpoly(double re, double im, double* result);

/**
 * Derivative of the grid's polynomial.  This call has no status.
 * @param re,im   isometric latitude and longitude, both from the origin
 * @param result  two doubles: real and imaginary part
 */
TW_API void TWn_zeal_grad(double re, double im, double* result);

/**
 * The complex number at which the grid's polynomial has a value, by Newton's rule to 1e-14.
 * @param re,im   the value: y, x
 * @param result  two doubles: isometric latitude and longitude, both from the origin
 * @param status  #TW_NOT_CONVERGED when 50 passes were used; the result is written all the same
 */
TW_API void TWn_zeal_ipoly(double re, double im, double* result, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
