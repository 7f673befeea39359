/**
 * @file mercator.h
 * Mercator projection of the ellipsoid.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Mercator, lat -89 to 89: forward 4.6 nm (2.0 nm), inverse 2.8 nm (1.4 nm), scale 2.1e-16
 *   (1.4e-16).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 38-47.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_MERCATOR_H
#define TIDEWATER_MERCATOR_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Ordinate of the latitude of origin.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians; the poles themselves pass
 * @param y0      isometric latitude of lat0
 * @param status  #TW_BAD_LATITUDE beyond a pole; y0 unwritten
 */
TW_API void TWmerc_c(double e, double lat0, double* y0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 7-6, 7-7).
 * @param e       first eccentricity
 * @param lon0    central meridian, radians; a difference of exactly -pi stays -pi
 * @param y0      constant of TWmerc_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_BAD_LATITUDE beyond pi/2 - 1e-14: skip
 */
TW_API void TWmerc_f(double e, double lon0, double y0, int32_t count, const CoordinateTriple* in,
                     CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 7-9 to 7-12).
 * @param e       first eccentricity
 * @param lon0    central meridian, radians; a longitude of exactly -pi comes out as pi
 * @param y0      constant of TWmerc_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmerc_i(double e, double lon0, double y0, int32_t count, const CoordinateTriple* in,
                     CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 7-8).  A latitude within 1e-10 of the north pole is clamped to it; one
 * within 1e-10 of the south pole is clamped to just past the NORTH pole and gives a negative k.
 * @param e       first eccentricity
 * @param k0      central scale
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k)
 * @param status  #TW_BAD_LATITUDE beyond a pole: fill
 */
TW_API void TWmerc_s(double e, double k0, int32_t count, const CoordinateTriple* in,
                     CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
