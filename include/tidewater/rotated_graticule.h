/**
 * @file rotated_graticule.h
 * Rotated graticule of the sphere.
 *
 * Longitude and latitude on the sphere as seen from another pole.  TWrotgrat_f() and TWrotgrat_i()
 * have lat0 in their calls but do not read it.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Rotated graticule, lat -85 to 85: forward 2.9 nm (2.4 nm), inverse 3.1 nm (2.3 nm).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 29-32.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_ROTATED_GRATICULE_H
#define TIDEWATER_ROTATED_GRATICULE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * The longitude that the new graticule is turned by, so that the origin keeps its meridian.
 * @param lon0,lat0          origin, radians
 * @param pole_lon,pole_lat  the new pole
 * @param offset             radians; 0 where origin and pole are one
 * @param status             always #TW_SUCCESS
 */
TW_API void TWrotgrat_c(double lon0, double lat0, double pole_lon, double pole_lat, double* offset,
                        TWstatus* status);

/**
 * To the rotated graticule (Snyder 1987, eq. 5-7, 5-8b).  A pole within 1e-12 of the north pole
 * copies the points unchanged, WITHOUT the offset.
 * @param lon0               longitude of the origin
 * @param lat0               not read
 * @param pole_lon,pole_lat  the new pole
 * @param offset             constant of TWrotgrat_c()
 * @param count              number of points
 * @param in                 longitude, latitude
 * @param out                longitude in (-pi, pi], latitude; may be in.  The pole itself and its
 *                           antipode take the longitude lon0 + offset
 * @param status             always #TW_SUCCESS
 */
TW_API void TWrotgrat_f(double lon0, double lat0, double pole_lon, double pole_lat, double offset,
                        int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

/**
 * Back from the rotated graticule (Snyder 1987, eq. 5-9, 5-10b).  A north pole is no special case
 * here.
 * @param lon0               longitude of the origin; the longitude of a point that comes out at a
 *                           pole
 * @param lat0               not read
 * @param pole_lon,pole_lat  the new pole
 * @param offset             constant of TWrotgrat_c()
 * @param count              number of points
 * @param in                 longitude, latitude
 * @param out                longitude in (-pi, pi], latitude; may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWrotgrat_i(double lon0, double lat0, double pole_lon, double pole_lat, double offset,
                        int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
