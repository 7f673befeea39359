/**
 * @file gauss_sphere.h
 * Gauss conformal sphere.
 *
 * The ellipsoid is mapped conformally onto a sphere that touches it at the latitude of origin.  The
 * results are longitude and latitude on that sphere, in radians, not plane coordinates: it is the
 * first stage of other projections.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Gauss conformal sphere, lat -89 to 89, sphere at 45 N: forward 3.0 nm (2.1 nm), inverse 3.3 nm
 *   (2.5 nm);
 * - Gauss conformal sphere, scale, lat -85 to 85, sphere at 45 N: scale 1.3e-15 (6.4e-16);
 * - Mercator planes of ellipsoid and sphere, the Mercator plane: forward 3.6 nm (2.8 nm), inverse
 *   3.2 nm (2.9 nm);
 * - Gauss-Schreiber, lon within 6, lat 20 to 70: forward 12 um (6.2 um), scale 6.4e-11 (3.2e-11).
 *
 * Source: IOGP Publication 373-7-2 (Guidance Note 7-2), oblique stereographic.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_GAUSS_SPHERE_H
#define TIDEWATER_GAUSS_SPHERE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * The sphere that fits a latitude.  An e below 1e-12 gives c = -1, which tells the other functions
 * to change nothing but the longitude's origin; an origin within 2e-6 of a pole gives c = 1, with t
 * and R taken at 2e-6 from the pole.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians; beyond a pole t is a NaN
 * @param chi0    latitude of origin on the sphere
 * @param c       ratio of longitudes, sphere over ellipsoid
 * @param t       shift of the isometric latitude between ellipsoid and sphere
 * @param R       radius of the sphere, in units of the semi-major axis
 * @param status  #TW_BAD_ECCENTRICITY for e^2 of one or more: R unwritten, the others written
 */
TW_API void TWgaussII_c(double e, double lat0, double* chi0, double* c, double* t, double* R,
                        TWstatus* status);

/**
 * Ellipsoid to sphere.  A latitude above pi/2 - 1e-12 in size passes as it is, with lon - lon0.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c,t     constants of TWgaussII_c()
 * @param count   number of points
 * @param in      longitude, latitude on the ellipsoid
 * @param out     longitude from lon0 and latitude, on the sphere
 * @param status  always #TW_SUCCESS
 */
TW_API void TWgaussII_f(double e, double lon0, double c, double t, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Sphere to ellipsoid.  A latitude above pi/2 - 1e-13 in size (not the bound of TWgaussII_f())
 * passes as it is, with its longitude plus lon0.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c,t     constants of TWgaussII_c()
 * @param count   number of points
 * @param in      longitude from lon0 and latitude, on the sphere
 * @param out     longitude, latitude on the ellipsoid
 * @param status  always #TW_SUCCESS
 */
TW_API void TWgaussII_i(double e, double lon0, double c, double t, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Ellipsoid to sphere with the scale of the mapping.  It works IN PLACE only: in and out must be
 * the same array, and z is overwritten.  (With two arrays z of in is lost to the latitude, and the
 * scale is formed with whatever latitude z of out held.)
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c,t,R   constants of TWgaussII_c()
 * @param k0      factor of the scale
 * @param count   number of points
 * @param in      longitude, latitude; z CHANGED by the call
 * @param out     longitude and latitude on the sphere as from TWgaussII_f(), z the scale
 * @param status  #TW_BAD_LATITUDE for a latitude beyond a pole: its scale is k0, the loop goes on
 */
TW_API void TWgaussII_s(double e, double lon0, double c, double t, double R, double k0,
                        int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

/**
 * Gauss-Schreiber projection with point scale: the conformal sphere by TWgaussII_s(), then the
 * transverse Mercator projection of that sphere by TWt_merc_xyk() with e = 0.  It works IN PLACE
 * only, as TWgaussII_s() does.
 * @param e               first eccentricity
 * @param lon0            central meridian
 * @param c,t,R           constants of TWgaussII_c()
 * @param A0,A2,A4,A6,A8  constants of TWt_merc_c() for the sphere, e = 0
 * @param M0              constant of TWt_merc_c() at the latitude of origin on the sphere
 * @param k0              central scale
 * @param count           number of points
 * @param in              longitude, latitude; z CHANGED by the call
 * @param out             x, y in units of the sphere's radius, z the scale of both stages
 * @param status          #TW_BAD_LATITUDE for a latitude beyond a pole: the array holds the first
 *                        stage only
 */
TW_API void TWg_schreiber(double e, double lon0, double c, double t, double R, double A0, double A2,
                          double A4, double A6, double A8, double M0, double k0, int32_t count,
                          CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * The step between the two Mercator planes: c x and c (y + t).
 * @param c,t     constants of TWgaussII_c()
 * @param count   number of points
 * @param in      x, y in the Mercator plane of the ellipsoid
 * @param out     x, y in the Mercator plane of the sphere
 * @param status  always #TW_SUCCESS
 */
TW_API void TWgauII_f(double c, double t, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * The inverse of TWgauII_f(): x / c and y / c - t.
 * @param c,t     constants of TWgaussII_c()
 * @param count   number of points
 * @param in      x, y in the Mercator plane of the sphere
 * @param out     x, y in the Mercator plane of the ellipsoid
 * @param status  always #TW_SUCCESS
 */
TW_API void TWgauII_i(double c, double t, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
