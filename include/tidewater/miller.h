/**
 * @file miller.h
 * Miller cylindrical projection of the sphere.
 *
 * The input array and the count come FIRST in these calls.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Miller cylindrical, sphere, lat -89.9 to 89.9: forward 6.0 nm (2.4 nm), inverse 2.8 nm
 *   (1.4 nm), scale 6.6e-16 (2.2e-16).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 86-89.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_MILLER_H
#define TIDEWATER_MILLER_H

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
TW_API void TWmiller_cyl_c(double lat0, double* y0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 11-1, 11-2).  No latitude is tested.
 * @param in      longitude, latitude
 * @param count   number of points
 * @param lon0    central meridian; a difference of exactly -pi becomes pi
 * @param y0      constant of TWmiller_cyl_c()
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmiller_cyl_f(const CoordinateTriple* in, int32_t count, double lon0, double y0,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 11-6, 11-7).  The longitude is not wrapped.
 * @param in      x, y
 * @param count   number of points
 * @param lon0    central meridian
 * @param y0      constant of TWmiller_cyl_c()
 * @param out     longitude, latitude
 * @param status  #TW_RANGE_ERROR for |0.8 (y + y0)| above 700: stop, with the failing point's
 *                longitude already written
 */
TW_API void TWmiller_cyl_i(const CoordinateTriple* in, int32_t count, double lon0, double y0,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 11-3, 11-4).  No latitude is tested.
 * @param in      longitude, latitude
 * @param count   number of points
 * @param k0      central scale
 * @param out     (k, h, h k)
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmiller_cyl_s(const CoordinateTriple* in, int32_t count, double k0,
                           CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
