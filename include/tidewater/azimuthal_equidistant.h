/**
 * @file azimuthal_equidistant.h
 * Azimuthal equidistant projection of the ellipsoid.
 *
 * By a series in the distance along the normal section: within millimetres 600 km from the origin,
 * with an azimuth that is off that of the geodesic by up to 6e-6 radians there.  Past a quarter
 * turn on the meridian of the origin the distance is the meridian arc.
 *
 * Forward and inverse are two series, and do not return exactly.  Round trip on WGS 84, measured
 * over origins at 0, 45, 60 and 90 degrees: 1e-6 m at 100 km from the origin, 0.3 mm at 300 km, 11
 * mm at 600 km, 0.13 m at 1000 km, 4 m at 2000 km, hundreds of metres at 5000 km, kilometres beyond
 * 10,000 km.  Across a pole from an origin at 60 degrees of latitude it is 30 m at 89 degrees and
 * 120 m at 80.
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
