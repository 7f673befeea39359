/**
 * @file equidistant_conic.h
 * Equidistant conic projection of the ellipsoid.
 *
 * Meridian series in powers of cos 2p: M(p) = C0 p + (((C8 cos 2p + C6) cos 2p + C4) cos 2p + C2)
 * sin 2p, and the latitude of a rectifying latitude u with D2 to D8 likewise.  Nothing is tested in
 * these functions.  Arrays may have any number of points that the count can tell.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Equidistant conic, cone of 44 and 49 N, lat -60 to 89: forward 19 mm (13 mm), inverse 9.3 mm
 *   (8.2 mm), scale 2.1e-09 (5.9e-10).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 111-115.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_EQUIDISTANT_CONIC_H
#define TIDEWATER_EQUIDISTANT_CONIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants of a cone with one or two standard parallels (Snyder 1987, p. 114, eq. 3-21, 3-26).
 * @param e            first eccentricity
 * @param lat0         latitude of origin, radians
 * @param lat1,lat2    standard parallels; exactly equal for a single one
 * @param n            cone constant
 * @param G            radius of the equator on the cone
 * @param rho0         radius of the parallel of lat0
 * @param C0           coefficient of the arc
 * @param C2,C4,C6,C8  coefficients of the arc
 * @param D2,D4,D6,D8  coefficients of the latitude
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconic_c(double e, double lat0, double lat1, double lat2, double* n, double* G,
                      double* rho0, double* C0, double* C2, double* C4, double* C6, double* C8,
                      double* D2, double* D4, double* D6, double* D8, TWstatus* status);

/**
 * Forward (Snyder 1987, p. 114).
 * @param lon0         central meridian; whole turns are taken off a difference, -pi and pi stay
 * @param n,G,rho0     constants of TWconic_c()
 * @param C0           constant of TWconic_c()
 * @param C2,C4,C6,C8  constants of TWconic_c()
 * @param count        number of points
 * @param in           longitude, latitude
 * @param out          x, y
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconic_f(double lon0, double n, double G, double rho0, double C0, double C2, double C4,
                      double C6, double C8, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, p. 115).  The longitude is not wrapped.
 * @param lon0         central meridian
 * @param n,G,rho0     constants of TWconic_c()
 * @param C0           constant of TWconic_c()
 * @param D2,D4,D6,D8  constants of TWconic_c()
 * @param count        number of points
 * @param in           x, y
 * @param out          longitude, latitude
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconic_i(double lon0, double n, double G, double rho0, double C0, double D2, double D4,
                      double D6, double D8, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, p. 114).  The third element carries k0 once, not twice.
 * @param e            first eccentricity
 * @param k0           central scale
 * @param n,G          constants of TWconic_c()
 * @param C0           constant of TWconic_c()
 * @param C2,C4,C6,C8  constants of TWconic_c()
 * @param count        number of points
 * @param in           longitude, latitude; a pole is not caught
 * @param out          (k k0, k0, k k0)
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconic_s(double e, double k0, double n, double G, double C0, double C2, double C4,
                      double C6, double C8, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
