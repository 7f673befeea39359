/**
 * @file azimuthal_equidistant.h
 * Azimuthal equidistant projection of the ellipsoid.
 *
 * By a series in the distance along the normal section, whose azimuth is not quite that of the
 * geodesic.  Past a quarter turn on the meridian of the origin the distance is the meridian arc.
 * Forward and inverse are two series, and do not return exactly; both grow wrong with the distance
 * from the origin.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Azimuthal equidistant, scale, lat 5 to 89: scale 3.2e-15 (6.5e-16);
 * - Azimuthal equidistant, 100 km, about 100 km round 50 N: forward 8.7 mm (5.2 mm), inverse
 *   8.6 mm (5.2 mm);
 * - Azimuthal equidistant, 600 km, about 600 km round 50 N: forward 2.2 m (1.2 m), inverse 2.2 m
 *   (1.2 m);
 * - Azimuthal equidistant, 2,000 km, about 2,000 km round 50 N: forward 121 m (59 m), inverse
 *   117 m (57 m);
 * - Azimuthal equidistant, 5,000 km, about 5,000 km round 50 N: forward 2.5 km (1.1 km), inverse
 *   2.1 km (989 m).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 191-202.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_AZIMUTHAL_EQUIDISTANT_H
#define TIDEWATER_AZIMUTHAL_EQUIDISTANT_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants.  This call has NO STATUS and never fails.
 * @param e     first eccentricity
 * @param lat0  latitude of origin, radians
 * @param n1    radius of curvature in the prime vertical at the origin
 * @param g     e sin(lat0) / sqrt(1 - e^2)
 */
TW_API void TWaz_eq_c(double e, double lat0, double* n1, double* g);

/**
 * Forward (Snyder 1987, eq. 25-19 to 25-25).  The difference of longitude is not wrapped.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param n1,g       constants of TWaz_eq_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        x, y; may be in
 * @param status     #TW_SUCCESS, or the status of the last meridian arc that was computed
 */
TW_API void TWaz_eq_f(double e, double lon0, double lat0, double n1, double g, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 25-26 to 25-36).  The longitude is not wrapped.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param n1         constant of TWaz_eq_c(); g is not needed
 * @param count      number of points
 * @param in         x, y
 * @param out        longitude, latitude; may be in
 * @param status     always #TW_SUCCESS
 */
TW_API void TWaz_eq_i(double e, double lon0, double lat0, double n1, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale on the SPHERE (Snyder 1987, eq. 25-2); at an origin off the poles it is not a number.
 * @param lon0,lat0  origin
 * @param k0         central scale
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        (k, k0, k k0); may be in
 * @param status     #TW_BAD_LATITUDE beyond a pole: fill
 */
TW_API void TWaz_eq_s(double lon0, double lat0, double k0, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
