/**
 * @file mollweide.h
 * Mollweide projection of the sphere.
 *
 * No longitude is wrapped.  Next to a pole the ordinate keeps few of the latitude's digits.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Mollweide, sphere, lat -89.5 to 89.5: forward 8.0 nm (3.6 nm), inverse 47 nm (4.4 nm);
 * - Mollweide, next to the poles, sphere, lat 89.5 to 89.999: forward 3.0 nm (2.4 nm), inverse
 *   19 um (760 nm).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 249-252.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_MOLLWEIDE_H
#define TIDEWATER_MOLLWEIDE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Ordinate of the latitude of origin.
 * @param lat0    latitude of origin, radians; not tested
 * @param y0      ordinate of lat0
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmollweide_c(double lat0, double* y0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 31-1 to 31-4).  No latitude is tested.
 * @param lon0    central meridian
 * @param y0      constant of TWmollweide_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmollweide_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                          CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 31-6 to 31-8).
 * @param lon0    central meridian
 * @param y0      constant of TWmollweide_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_RANGE_ERROR for an ordinate beyond the map: stop, and for a sine beyond 1:
 *                stop, with the failing point's longitude already written
 */
TW_API void TWmollweide_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                          CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
