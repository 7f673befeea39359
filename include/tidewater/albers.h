/**
 * @file albers.h
 * Albers equal-area conic projection of the ellipsoid.
 *
 * TWalbers_c() has NO status argument, and TWalbers_s() takes C before n, the reverse of the
 * others.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Albers equal-area conic, cone of 44 and 49 N, lat -60 to 89: forward 16 nm (11 nm), inverse
 *   207 nm (16 nm), scale 3.1e-15 (1.3e-15).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 98-103.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_ALBERS_H
#define TIDEWATER_ALBERS_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants of a cone with one or two standard parallels (Snyder 1987, eq. 14-12 to 14-15).  It
 * cannot fail: parallels symmetric about the equator give a cone constant of zero and a rho0 that
 * is NaN.
 * @param e          first eccentricity; exactly 0 for the sphere
 * @param lon0       not read
 * @param lat0       latitude of origin, radians
 * @param lat1,lat2  standard parallels; less than 1e-13 apart they count as one
 * @param n          cone constant
 * @param C          constant of rho = sqrt(C - n q) / n
 * @param rho0       rho at lat0
 */
TW_API void TWalbers_c(double e, double lon0, double lat0, double lat1, double lat2, double* n,
                       double* C, double* rho0);

/**
 * Forward (Snyder 1987, eq. 14-1 to 14-4, 14-12).
 * @param e       first eccentricity; exactly 0 for the sphere
 * @param lon0    central meridian; whole turns are taken off a difference, -pi and pi stay
 * @param n       constant of TWalbers_c()
 * @param C       constant of TWalbers_c()
 * @param rho0    constant of TWalbers_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_BAD_LATITUDE beyond pi/2 + 1e-12: stop; #TW_I_LATITUDE_LIMITED for a latitude
 *                beyond pi/2 clamped to the pole
 */
TW_API void TWalbers_f(double e, double lon0, double n, double C, double rho0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 14-8 to 14-11, 14-19, 3-16).  Newton's steps shrink only by half
 * towards a pole; there they are extrapolated, and a latitude that comes within 4e-5 radians may be
 * clamped to the pole.  On the sphere (e of 1e-13 or less) one within 4e-7 of a pole is the pole.
 * The longitude is not wrapped.  For an eccentricity above 1e-13 and below about 0.01, as no
 * ellipsoid of the earth has, the logarithm of the formula loses digits in all four functions: pass
 * 0 for a sphere.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param n       constant of TWalbers_c()
 * @param C       constant of TWalbers_c()
 * @param rho0    constant of TWalbers_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_NOT_CONVERGED for a point outside the cone's fan or beyond its poles: stop;
 *                #TW_I_LATITUDE_LIMITED for a latitude clamped to a pole, or one that took all 30
 *                steps, both written; on the ellipsoid a point just beyond the SOUTH pole comes out
 *                at the north pole with this status
 */
TW_API void TWalbers_i(double e, double lon0, double n, double C, double rho0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 14-16, 14-18).  The areal scale is k0 squared.  At the apex of a polar
 * cone k is k0; at any other pole it is -k0, a marker, with h = 0.
 * @param e       first eccentricity; exactly 0 for the sphere
 * @param k0      central scale
 * @param C       constant of TWalbers_c(); here BEFORE n
 * @param n       constant of TWalbers_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k k0, k0 / k, k0 k0)
 * @param status  #TW_NOT_CONVERGED beyond a pole: stop
 */
TW_API void TWalbers_s(double e, double k0, double C, double n, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
