/**
 * @file gnomonic.h
 * Gnomonic projection of the sphere.
 *
 * An origin within 5e-10 of a pole or of the equator takes the formula of that aspect.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Gnomonic, sphere, within 80 degrees of 50 N: forward 3.1 nm (1.4 nm), inverse 1.4 nm (< 1 nm),
 *   scale 5.4e-16 (3.5e-16).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 164-168.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_GNOMONIC_H
#define TIDEWATER_GNOMONIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Cosine and sine of the latitude of origin.
 * @param lat0      latitude of origin, radians; not tested
 * @param cos_lat0  its cosine
 * @param sin_lat0  its sine
 * @param status    always #TW_SUCCESS
 */
TW_API void TWgnomon_c(double lat0, double* cos_lat0, double* sin_lat0, TWstatus* status);

/**
 * The fixed parameters of the projection: three zeros.
 * @param value1,value2,value3  0
 * @param status                always #TW_SUCCESS
 */
TW_API void TWgnomon_param(double* value1, double* value2, double* value3, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 22-4 to 22-11).  The OUTPUT ARRAY COMES BEFORE THE INPUT ARRAY.
 * @param lon0,lat0          origin; the difference of longitude is not wrapped
 * @param cos_lat0,sin_lat0  constants of TWgnomon_c()
 * @param count              number of points
 * @param out                x, y; may be in
 * @param in                 longitude, latitude
 * @param status             #TW_NOT_CONVERGED on or behind the horizon (the cosine of the distance
 *                           from the origin is 1e-13 or less): stop
 */
TW_API void TWgnomon_f(double lon0, double lat0, double cos_lat0, double sin_lat0, int32_t count,
                       CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 20-14 to 20-17, 22-12).  Longitudes of exactly -pi and pi both stay.
 * @param lon0,lat0          origin
 * @param cos_lat0,sin_lat0  constants of TWgnomon_c()
 * @param count              number of points
 * @param in                 x, y
 * @param out                longitude, latitude; may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWgnomon_i(double lon0, double lat0, double cos_lat0, double sin_lat0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 22-2, 22-3): k = k0 / cos c across the ray from the origin and h = k /
 * cos c along it.
 * @param lon0               longitude of origin
 * @param lat0               not read
 * @param k0                 central scale
 * @param cos_lat0,sin_lat0  constants of TWgnomon_c()
 * @param count              number of points
 * @param in                 longitude, latitude
 * @param out                (k, h, k h); may be in
 * @param status             #TW_I_LATITUDE_LIMITED on or behind the horizon: fill
 */
TW_API void TWgnomon_s(double lon0, double lat0, double k0, double cos_lat0, double sin_lat0,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
