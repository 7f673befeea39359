/**
 * @file van_der_grinten.h
 * Van der Grinten projection of the sphere.
 *
 * Within 0.0003 of an axis (of the equator or the central meridian, or of the lines x = 0 and y =
 * 0) the formulas are those of the axis, by design.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Van der Grinten, sphere, lat -89 to 89, off the axes: forward 5.8 um (300 nm), inverse 668 nm
 *   (37 nm), scale 1.8e-08 (4.4e-12).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 239-242.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_VAN_DER_GRINTEN_H
#define TIDEWATER_VAN_DER_GRINTEN_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Ordinate of the latitude of origin.  It has no status word.
 * @param lat0  latitude of origin, radians; NaN beyond a pole
 * @param y0    ordinate of lat0
 */
TW_API void TWvdg_c(double lat0, double* y0);

/**
 * Forward (Snyder 1987, eq. 29-1 to 29-6).
 * @param lon0    central meridian; one turn at most is taken off, a difference of pi or -pi stays
 * @param y0      constant of TWvdg_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWvdg_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, in closed form (Rubincam, The American Cartographer 8, 1981); within 0.01 radians of a
 * pole and at the outer circle by iteration to 1e-12 radians.  The longitude is not wrapped.
 * @param lon0    central meridian
 * @param y0      constant of TWvdg_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_I_LATITUDE_LIMITED where the estimate of the latitude passes a pole: the point
 *                is written with it, the loop goes on
 */
TW_API void TWvdg_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status);

/**
 * Scale, from the derivatives of the forward formulas.
 * @param k0      central scale
 * @param lon0    central meridian; a difference of exactly -pi becomes pi
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, h, areal scale)
 * @param status  #TW_BAD_LATITUDE within 1e-14 of a pole or beyond: fill
 */
TW_API void TWvdg_s(double k0, double lon0, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
