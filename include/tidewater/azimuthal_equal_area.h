/**
 * @file azimuthal_equal_area.h
 * Lambert azimuthal equal-area projection of the ellipsoid.
 *
 * Sphere for e exactly 0.  The input array and the count come FIRST in TWlam_az_eq_f(),
 * TWlam_az_eq_i() and TWlam_az_eq_s().
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Lambert azimuthal equal-area, lon within 90, lat -30 to 89: forward 63 nm (11 nm), inverse
 *   15 nm (11 nm), scale 2.0e-03 (1.9e-03);
 * - Lambert azimuthal equal-area, polar, lat 1 to 89.9: forward 895 nm (9.3 nm), inverse 1.7 nm
 *   (1.4 nm), scale 6.3e-11 (1.4e-14).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 182-190.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_AZIMUTHAL_EQUAL_AREA_H
#define TIDEWATER_AZIMUTHAL_EQUAL_AREA_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants (Snyder 1987, eq. 3-11 to 3-13, 14-15, 24-20).
 * @param e                  first eccentricity
 * @param lon0               not read
 * @param lat0               latitude of origin, radians
 * @param e2,q1,qp,rq        e squared, q at the origin and at the pole, authalic radius; unwritten
 *                           for a sphere
 * @param m1,sin_b1,cos_b1   radius of the parallel and authalic latitude of the origin; unwritten
 *                           for a sphere and for an origin within 1e-12 of a pole
 * @param sin_lat0,cos_lat0  always written
 * @param D                  unwritten as m1
 * @param status             always #TW_SUCCESS
 */
TW_API void TWlam_az_eq_c(double e, double lon0, double lat0, double* e2, double* q1, double* qp,
                          double* rq, double* m1, double* sin_b1, double* cos_b1, double* sin_lat0,
                          double* cos_lat0, double* D, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 24-2, 24-17 to 24-27).  The difference of longitude is not wrapped; a
 * point within 1e-7 of the antipode of the origin is moved 1e-7 off it.
 * @param in                 longitude, latitude
 * @param count              number of points
 * @param e                  first eccentricity
 * @param lon0,lat0          origin
 * @param e2,q1,qp,rq,m1     constants of TWlam_az_eq_c(); q1 and m1 are not read
 * @param sin_b1,cos_b1      constants of TWlam_az_eq_c()
 * @param sin_lat0,cos_lat0  constants of TWlam_az_eq_c()
 * @param D                  constant of TWlam_az_eq_c()
 * @param out                x, y; may be in
 * @param status             #TW_NOT_CONVERGED for |q / qp| beyond 1 and 1e-12: stop;
 *                           #TW_I_LATITUDE_LIMITED for a lesser excess, clamped to 1
 */
TW_API void TWlam_az_eq_f(const CoordinateTriple* in, int32_t count, double e, double lon0,
                          double lat0, double e2, double q1, double qp, double rq, double m1,
                          double sin_b1, double cos_b1, double sin_lat0, double cos_lat0, double D,
                          CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 20-14, 24-28 to 24-31, 3-16).  A longitude of exactly -pi becomes pi.
 * From a polar origin of the ellipsoid a point past the equator comes out MIRRORED in the equator.
 * @param in                 x, y
 * @param count              number of points
 * @param e                  first eccentricity
 * @param lon0,lat0          origin
 * @param e2,qp,rq           constants of TWlam_az_eq_c(); q1 and m1 are not in the list.  A qp that
 *                           is not that of e gives the latitude whose q the geometry finds with it
 * @param sin_b1,cos_b1      constants of TWlam_az_eq_c()
 * @param sin_lat0,cos_lat0  constants of TWlam_az_eq_c()
 * @param D                  constant of TWlam_az_eq_c()
 * @param out                longitude, latitude; may be in
 * @param status             #TW_NOT_CONVERGED outside the disc by more than 1e-12 (sphere) or
 *                           0.0005 (ellipsoid) of its radius, when 50 passes were used, or for a
 *                           latitude beyond a pole: stop.  #TW_I_LATITUDE_LIMITED for a lesser
 *                           excess, clamped to 1
 */
TW_API void TWlam_az_eq_i(const CoordinateTriple* in, int32_t count, double e, double lon0,
                          double lat0, double e2, double qp, double rq, double sin_b1,
                          double cos_b1, double sin_lat0, double cos_lat0, double D,
                          CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 24-2; polar 24-23a, 24-32).  At an origin off the poles it is that of the
 * SPHERE, on the ellipsoid too.
 * @param in                 longitude, latitude
 * @param count              number of points
 * @param lon0,lat0          origin
 * @param e,e2,qp            first eccentricity, and constants of TWlam_az_eq_c()
 * @param k0                 central scale
 * @param sin_lat0,cos_lat0  constants of TWlam_az_eq_c()
 * @param out                (k k0, k0 / k, k0 k0); may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWlam_az_eq_s(const CoordinateTriple* in, int32_t count, double lon0, double lat0,
                          double e, double e2, double qp, double k0, double sin_lat0,
                          double cos_lat0, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
