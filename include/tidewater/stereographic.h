/**
 * @file stereographic.h
 * Stereographic projection of the ellipsoid.
 *
 * Oblique through the conformal latitude where C is exactly 0, polar otherwise.  A point within
 * 1e-12 of the origin in longitude and in latitude is the origin.  Differences of longitude are not
 * wrapped.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Stereographic, oblique, within 90 degrees of 50 N: forward 2.8 nm (1.7 nm), inverse 1.9 nm
 *   (1.4 nm), scale 5.5e-16 (3.2e-16);
 * - Stereographic, polar, lat 0 to 89.9: forward 3.6 nm (2.0 nm), inverse 1.4 nm (< 1 nm), scale
 *   4.0e-16 (2.3e-16).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 154-163.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_STEREOGRAPHIC_H
#define TIDEWATER_STEREOGRAPHIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants (Snyder 1987, eq. 14-15, 3-1, 21-33).  An origin within 1e-14 of a pole is polar.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians
 * @param C       0 for an oblique origin; else the polar factor, negative at the south pole
 * @param m0      radius of the parallel of origin; unwritten at a pole
 * @param chi0    conformal latitude of origin; unwritten at a pole
 * @param status  #TW_BAD_LATITUDE beyond a pole; C and m0 are written, chi0 is not
 */
TW_API void TWstereo_c(double e, double lat0, double* C, double* m0, double* chi0,
                       TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 21-24, 21-25, 21-27; polar 21-30, 21-33).
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        x, y; may be in
 * @param status     #TW_BAD_LATITUDE beyond a pole: skip
 */
TW_API void TWstereo_f(double e, double lon0, double lat0, double C, double m0, double chi0,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 20-14, 21-36 to 21-38; polar 7-9, 20-16).
 *
 * In the oblique aspect the longitude is a plain arctangent, so it NEVER LIES MORE THAN 90 DEGREES
 * from lon0.  In the south polar aspect lon0 is negated at each point that is not the origin, so
 * with a lon0 other than 0 the longitudes of points in an array ALTERNATE between right and shifted
 * by twice lon0.  At the end every output within 2e-12 of a pole, skipped or not, gets lon0 as it
 * then stands.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param count      number of points
 * @param in         x, y
 * @param out        longitude, latitude; may be in
 * @param status     #TW_BAD_LATITUDE when no latitude was found (oblique), #TW_NOT_CONVERGED when
 *                   ten passes were used (polar): skip
 */
TW_API void TWstereo_i(double e, double lon0, double lat0, double C, double m0, double chi0,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 21-26; polar 21-32).
 * @param e          first eccentricity
 * @param k0         scale at the origin
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        (k, k, k k); may be in
 * @param status     #TW_BAD_LATITUDE beyond a pole: skip
 * @return k of the last point worked on; k0 where that point failed, and for no points
 */
TW_API double TWstereo_s(double e, double k0, double lon0, double lat0, double C, double m0,
                         double chi0, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Scale at the origin that makes the scale true at a latitude.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param lat_ts     latitude of true scale; for C = 0 the angular distance from lat0, not negative,
 *                   laid off southwards in the northern hemisphere and northwards in the southern
 * @param k0         the scale
 * @param status     #TW_BAD_DATA for lat_ts beyond pi/2, or negative with C = 0; k0 unwritten.
 *                   #TW_BAD_LATITUDE where the distance runs over a pole; k0 is then 1
 */
TW_API void TWstereo_latTs(double e, double lon0, double lat0, double C, double m0, double chi0,
                           double lat_ts, double* k0, TWstatus* status);

/**
 * Latitude of true scale for a scale at the origin, by the secant method to 1e-9 radians.
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param C,m0,chi0  constants of TWstereo_c()
 * @param k0         the scale, above 0 and at most 1
 * @param lat_ts     latitude of true scale; for C = 0 the angular distance from lat0
 * @param status     #TW_BAD_SCALE_LATITUDE for a k0 out of range; lat_ts unwritten.
 *                   #TW_RANGE_ERROR when no latitude was found, otherwise the status of the last
 *                   scale evaluated; lat_ts is written in both cases
 */
TW_API void TWstereo_sTlat(double e, double lon0, double lat0, double C, double m0, double chi0,
                           double k0, double* lat_ts, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
