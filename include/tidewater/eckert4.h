/**
 * @file eckert4.h
 * Eckert IV projection of the sphere.
 *
 * No longitude is wrapped.  Arrays of more than 32767 points work in all functions.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Eckert IV, sphere, lat -89.9 to 89.9: forward 4.9 nm (2.3 nm), inverse 310 nm (5.1 nm).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 253-258.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_ECKERT4_H
#define TIDEWATER_ECKERT4_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Ordinate of the latitude of origin.  The iteration ends at the first step that is not above
 * 1e-12, a negative one included, so that the ordinate may be that of the first estimate and
 * TWeckertIV_f() of the origin need not be 0.
 * @param lat0    latitude of origin, radians; not tested
 * @param y0      ordinate of the origin
 * @param status  always #TW_SUCCESS
 */
TW_API void TWeckertIV_c(double lat0, double* y0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 32-1 to 32-5); within 5e-4 radians of a pole by iteration to 1e-12
 * radians.
 * @param lon0    central meridian
 * @param y0      constant of TWeckertIV_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_NOT_CONVERGED if the iteration reaches 50 passes, as it does for a latitude
 *                that is not finite: stop
 */
TW_API void TWeckertIV_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 32-9 to 32-11).  An ordinate beyond the map is taken at its edge.  The
 * call has no bound of 32767 points.
 * @param lon0    central meridian
 * @param y0      constant of TWeckertIV_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  always #TW_SUCCESS
 */
TW_API void TWeckertIV_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
