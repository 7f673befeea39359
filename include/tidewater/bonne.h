/**
 * @file bonne.h
 * Bonne projection of the ellipsoid.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Bonne, lon within 60, lat -60 to 85: forward 140 nm (128 nm), inverse 158 nm (133 nm), scale
 *   5.9e-04 (4.5e-04).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 138-140.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_BONNE_H
#define TIDEWATER_BONNE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants.
 * @param e       first eccentricity; a sphere below 1.6e-8
 * @param lat1    in: standard parallel, radians; out: the same, kept 1.6e-8 away from the equator
 * @param e2      square of e, 0 for a sphere
 * @param c1      radius of the standard parallel on the cone
 * @param r0      c1 and the meridian arc of lat1
 * @param status  #TW_BAD_ECCENTRICITY for e of 1 or more or below 0, nothing written; the status of
 *                TWmerid_dist_f(), r0 unwritten on failure
 */
TW_API void TWbonne_c(double e, double* lat1, double* e2, double* c1, double* r0, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 19-1 to 19-3, 19-5 to 19-7).  Differences up to 1e-12 count as none.
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 *                stays
 * @param lat1    standard parallel, as TWbonne_c() gave it back
 * @param e       first eccentricity
 * @param e2      constant of TWbonne_c()
 * @param c1      constant of TWbonne_c()
 * @param r0      constant of TWbonne_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  the status of TWmerid_dist_f(): stop on failure
 */
TW_API void TWbonne_f(double lon0, double lat1, double e, double e2, double c1, double r0,
                      int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 19-8 to 19-12).  Within 1e-12 of a pole the longitude is lon0.
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 *                stays
 * @param lat1    standard parallel, as TWbonne_c() gave it back
 * @param e       first eccentricity
 * @param e2      constant of TWbonne_c()
 * @param c1      constant of TWbonne_c()
 * @param r0      constant of TWbonne_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  the status of TWmerid_dist_i(): stop on failure
 */
TW_API void TWbonne_i(double lon0, double lat1, double e, double e2, double c1, double r0,
                      int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Scale, by the formula of the sphere on the ellipsoid too (Snyder 1987, eq. 19-4).
 * @param k0      central scale
 * @param lat1    standard parallel
 * @param lon0    central meridian
 * @param e2      constant of TWbonne_c()
 * @param r0      constant of TWbonne_c(); read for a sphere only
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k0, h, k0 k0)
 * @param status  #TW_BAD_LATITUDE more than 1e-12 beyond a pole, off the central meridian and the
 *                standard parallel: stop
 */
TW_API void TWbonne_s(double k0, double lat1, double lon0, double e2, double r0, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
