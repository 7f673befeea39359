/**
 * @file polyconic.h
 * Polyconic projection of the ellipsoid.
 *
 * TWpolycon_c() has NO status argument.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Polyconic, lon within 30, lat -80 to 80: forward 956 um (947 um), inverse 2.5 mm (1.3 mm),
 *   scale 3.9e-16 (2.5e-16).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 124-131.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_POLYCONIC_H
#define TIDEWATER_POLYCONIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Meridian arc of the latitude of origin (Snyder 1987, eq. 3-21).
 * @param e     first eccentricity
 * @param lat0  latitude of origin, radians
 * @param m0    its arc from the equator
 */
TW_API void TWpolycon_c(double e, double lat0, double* m0);

/**
 * Forward (Snyder 1987, p. 129).  Below a latitude of 1e-7 in size the point is taken on the
 * equator: x is the difference of longitude and y is -m0.
 * @param e       first eccentricity
 * @param lon0    central meridian; one turn at most is taken off a difference, -pi and pi stay
 * @param m0      constant of TWpolycon_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWpolycon_f(double e, double lon0, double m0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Inverse by Newton's iteration, to 1e-9 radians (Snyder 1987, pp. 130-131).  Below 1e-6 in size y
 * + m0 gives latitude 0 and longitude x + lon0.  The longitude is not wrapped.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param m0      constant of TWpolycon_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_DIVERGED when a step after the fourth pass exceeds 5 radians: stop;
 *                #TW_I_LATITUDE_LIMITED when the passes ran out, with the last value written
 */
TW_API void TWpolycon_i(double e, double lon0, double m0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, p. 130).  The scale along the parallel is true.
 * @param e       first eccentricity
 * @param lon0    central meridian; a difference is not wrapped
 * @param k0      central scale
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k0, h, h k0)
 * @param status  #TW_BAD_LATITUDE beyond a pole: k0 with the h and product of the last good point
 *                before it, zeros where there is none; the loop goes on
 */
TW_API void TWpolycon_s(double e, double lon0, double k0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
