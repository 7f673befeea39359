/**
 * @file lambert_conformal.h
 * Lambert conformal conic projection of the ellipsoid.
 *
 * TWlam_i() takes its OUTPUT array before its input array.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Lambert conformal conic, cone of 44 and 49 N, lat -60 to 89: forward 129 nm (70 nm), inverse
 *   36 nm (30 nm), scale 5.3e-15 (3.3e-15).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 104-110.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_LAMBERT_CONFORMAL_H
#define TIDEWATER_LAMBERT_CONFORMAL_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants of a cone with one or two standard parallels (Snyder 1987, eq. 14-15, 15-8 to 15-10).
 * @param e          first eccentricity
 * @param lon0       not read
 * @param lat0       latitude of origin, radians
 * @param lat1,lat2  standard parallels; equal for a single one, which may be a pole
 * @param C          the cone's F: rho = C t^n
 * @param n          cone constant, negative for an apex in the south
 * @param rho0       rho at lat0; 0 at the apex pole
 * @param status     #TW_BAD_LATITUDE for lat0 beyond a pole, nothing written, or at the pole away
 *                   from the apex, n and C written; #TW_BAD_PARAMETER for a single parallel on the
 *                   equator or parallels that cannot be told apart, nothing written, and for
 *                   parallels symmetric about the equator, n written
 */
TW_API void TWlam_c(double e, double lon0, double lat0, double lat1, double lat2, double* C,
                    double* n, double* rho0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 14-1 to 14-4, 15-7).  A point within 1e-14 of the apex pole gives x = 0
 * and y = rho0.
 * @param e       first eccentricity
 * @param lon0    central meridian; a difference of exactly -pi becomes pi
 * @param C       constant of TWlam_c()
 * @param n       constant of TWlam_c()
 * @param rho0    constant of TWlam_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_BAD_LATITUDE beyond a pole, or at the pole away from the apex: stop
 */
TW_API void TWlam_f(double e, double lon0, double C, double n, double rho0, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 14-9 to 14-11, 15-11, 7-9).  Mind the order of the arrays: OUT comes
 * before in.  A point within 1e-13 of a pole gets lon0 as it was given.
 * @param e       first eccentricity
 * @param lon0    central meridian; a longitude of exactly -pi comes out as pi
 * @param C       constant of TWlam_c()
 * @param n       constant of TWlam_c()
 * @param rho0    constant of TWlam_c()
 * @param count   number of points
 * @param out     longitude, latitude
 * @param in      x, y
 * @param status  #TW_I_LATITUDE_LIMITED when a latitude took all 15 passes; it is written
 */
TW_API void TWlam_i(double e, double lon0, double C, double n, double rho0, int32_t count,
                    CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 15-7, 14-16).  A latitude within 1e-10 of the north pole is clamped to
 * it; one within 1e-10 of the south pole is clamped to just past the NORTH pole, where the formula
 * gives a NaN unless n is a whole number.
 * @param e       first eccentricity
 * @param k0      central scale
 * @param C       constant of TWlam_c()
 * @param n       constant of TWlam_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k)
 * @param status  #TW_BAD_LATITUDE beyond a pole, or where the parallel's radius is below 1e-10:
 *                fill
 */
TW_API void TWlam_s(double e, double k0, double C, double n, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
