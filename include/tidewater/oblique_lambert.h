/**
 * @file oblique_lambert.h
 * Oblique Lambert conformal conic and Krovak projections of the ellipsoid.
 *
 * The ellipsoid goes to a conformal sphere, the sphere's graticule is turned about the cone's pole,
 * and a Lambert conic maps the turned sphere.  Plane coordinates are in units of that sphere's
 * radius, TWgaussian_R() at the latitude lat0 + (d1 + d2) / 2.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Krovak, 12 to 23 E, 47 to 51 N: forward 1.5 um (1.5 um), inverse 1.5 um (1.5 um);
 * - Oblique Lambert, lon within 12, lat 35 to 55: forward 3.1 nm (1.7 nm), inverse 2.8 nm
 *   (2.1 nm), scale 6.3e-05 (6.0e-05).
 *
 * Source: IOGP Publication 373-7-2 (Guidance Note 7-2), Krovak, method 9819; the stages are those
 * of gauss_sphere.h, rotated_graticule.h and lambert_conformal.h.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_OBLIQUE_LAMBERT_H
#define TIDEWATER_OBLIQUE_LAMBERT_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants of the oblique Lambert.
 * @param e                  first eccentricity; exactly 0 is the sphere, with g_c and g_t unwritten
 * @param lon0,lat0          origin, radians
 * @param d1,d2              distances of the standard parallels from the origin, along the cone's
 *                           axis, radians
 * @param azimuth            from the origin to the cone's pole; read where use_azimuth is not 0
 * @param use_azimuth        0: pole_lon and pole_lat are read; else they are written, with a pole
 *                           as far from the origin as the nearer geographic pole
 * @param pole_lon,pole_lat  the cone's pole on the ellipsoid
 * @param lat_r              latitude of the origin on the turned sphere
 * @param s_lon,s_lat        the cone's pole on the sphere
 * @param offset             of TWrotgrat_c()
 * @param C,n_cone,rho0      of TWlam_c()
 * @param g_c,g_t            of TWgaussII_c()
 * @param status             the status of the inner call that failed, which ends the call
 */
TW_API void TWo_lam_c(double e, double lon0, double lat0, double d1, double d2, double azimuth,
                      uint32_t use_azimuth, double* pole_lon, double* pole_lat, double* lat_r,
                      double* s_lon, double* s_lat, double* offset, double* C, double* n_cone,
                      double* rho0, double* g_c, double* g_t, TWstatus* status);

/**
 * Constants of the Krovak projection (EPSG Guidance Note 7-2, method 9819), for TWo_lam_f(),
 * TWo_lam_i() and TWo_lam_s(): as TWo_lam_c(), but with the cone's pole on the sphere at 59.71186
 * degrees (not for e = 0), the standard parallel at 78.5 degrees, a rho0 of 0 and C times 0.9999.
 * @param e                  first eccentricity
 * @param lon0,lat0          origin, radians
 * @param d1,d2              they choose the conformal sphere's latitude, lat0 + (d1 + d2) / 2
 * @param azimuth            as in TWo_lam_c()
 * @param use_azimuth        as in TWo_lam_c()
 * @param pole_lon,pole_lat  as in TWo_lam_c()
 * @param lat_r              latitude of the origin on the turned sphere
 * @param s_lon,s_lat        the cone's pole on the sphere
 * @param offset             of TWrotgrat_c()
 * @param C,n_cone,rho0      of TWlam_c(), changed as above
 * @param g_c,g_t            of TWgaussII_c()
 * @param status             the status of the inner call that failed, which ends the call
 */
TW_API void TWkrovak_c(double e, double lon0, double lat0, double d1, double d2, double azimuth,
                       uint32_t use_azimuth, double* pole_lon, double* pole_lat, double* lat_r,
                       double* s_lon, double* s_lat, double* offset, double* C, double* n_cone,
                       double* rho0, double* g_c, double* g_t, TWstatus* status);

/**
 * Forward.
 * @param e              first eccentricity
 * @param lon0           longitude of the origin
 * @param lat_r          constants of TWo_lam_c(), as the others of which nothing is said here
 * @param C,n_cone,rho0  of the cone
 * @param s_lon,s_lat    the cone's pole; nothing is turned where it is the pole above lon0 to 1e-13
 * @param turn           the plane is turned by minus this angle about its origin, radians
 * @param offset         of the turned graticule
 * @param g_c,g_t        of the conformal sphere
 * @param count          number of points
 * @param in             longitude, latitude
 * @param out            x, y
 * @param status         the status of the inner call that failed, which ends the call with out as
 *                       it stands between two steps
 */
TW_API void TWo_lam_f(double e, double lon0, double lat_r, double C, double n_cone, double rho0,
                      double s_lon, double s_lat, double turn, double offset, double g_c,
                      double g_t, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Inverse, with the arguments of TWo_lam_f().
 * @param e,lon0,lat_r   as there
 * @param C,n_cone,rho0  as there
 * @param s_lon,s_lat    as there
 * @param turn,offset    as there
 * @param g_c,g_t        as there
 * @param count          number of points
 * @param in             x, y; CHANGED by the call: turned in place
 * @param out            longitude, latitude
 * @param status         the status of the inner call that failed, which ends the call
 */
TW_API void TWo_lam_i(double e, double lon0, double lat_r, double C, double n_cone, double rho0,
                      double s_lon, double s_lat, double turn, double offset, double g_c,
                      double g_t, int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Scale of the cone.  On the ellipsoid the sphere's longitudes are here taken relative to lon0, not
 * from Greenwich as in TWo_lam_f(): turned about an oblique pole they agree for a lon0 of 0 alone.
 * @param e            first eccentricity
 * @param k0           central scale
 * @param lon0,lat_r   as in TWo_lam_f()
 * @param C,n_cone     as there
 * @param s_lon,s_lat  as there
 * @param offset       as there
 * @param g_c,g_t      as there
 * @param count        number of points
 * @param in           longitude, latitude
 * @param out          (k, k, k k) of TWlam_s()
 * @param status       the status of an inner call
 */
TW_API void TWo_lam_s(double e, double k0, double lon0, double lat_r, double C, double n_cone,
                      double s_lon, double s_lat, double offset, double g_c, double g_t,
                      int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
