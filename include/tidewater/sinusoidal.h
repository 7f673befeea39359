/**
 * @file sinusoidal.h
 * Sinusoidal projection of the ellipsoid.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Sinusoidal, lat -89.9 to 89.9: forward 65 nm (60 nm), inverse 153 nm (116 nm), scale 8.7e-14
 *   (6.5e-14).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 243-248.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_SINUSOIDAL_H
#define TIDEWATER_SINUSOIDAL_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants.
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians
 * @param e2      square of e
 * @param m0      meridian arc of lat0
 * @param status  that of TWmerid_dist_f(); m0 unwritten on failure
 */
TW_API void TWsinusoidal_c(double e, double lat0, double* e2, double* m0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 30-8, 30-9).  Differences up to 1e-12 count as none.
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 *                stays
 * @param lat0    latitude of origin
 * @param e       first eccentricity
 * @param e2      constant of TWsinusoidal_c()
 * @param m0      constant of TWsinusoidal_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  the status of TWmerid_dist_f(): stop on failure
 */
TW_API void TWsinusoidal_f(double lon0, double lat0, double e, double e2, double m0, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 30-10, 30-11).  Within 1e-12 of a pole the longitude is lon0.
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 *                stays
 * @param lat0    latitude of origin
 * @param e       first eccentricity
 * @param e2      constant of TWsinusoidal_c()
 * @param m0      constant of TWsinusoidal_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  the status of TWmerid_dist_i(): stop on failure
 */
TW_API void TWsinusoidal_i(double lon0, double lat0, double e, double e2, double m0, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, p. 243).  The scale along the parallel is k0 everywhere.
 * @param k0      central scale
 * @param lon0    central meridian
 * @param e2      constant of TWsinusoidal_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k0, h, areal scale)
 * @param status  #TW_BAD_LATITUDE more than 1e-12 beyond a pole, or the status of TWdM_dphi(): stop
 */
TW_API void TWsinusoidal_s(double k0, double lon0, double e2, int32_t count,
                           const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
