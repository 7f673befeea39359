/**
 * @file cassini.h
 * Cassini projection of the ellipsoid.
 *
 * Series about the central meridian, for a few degrees on either side.  TWcassini_c() has NO status
 * argument, and TWcassini_s() works IN PLACE only.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Cassini, 2 degrees, lon within 2, lat -80 to 80: forward 1.8 mm (1.7 mm), inverse 2.7 mm
 *   (1.4 mm);
 * - Cassini, 6 degrees, lon within 6, lat -80 to 80: forward 87 mm (31 mm), inverse 328 mm
 *   (177 mm);
 * - Cassini, scale, lon within 5, lat -80 to 80: scale 1.1e-05 (5.7e-06).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 92-95.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_CASSINI_H
#define TIDEWATER_CASSINI_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Coefficients of the meridian arc and of its inverse, as of TWconic_c(), and the arc of the
 * latitude of origin.
 * @param e            first eccentricity
 * @param lon0         not read
 * @param lat0         latitude of origin, radians
 * @param c0           coefficient of the arc
 * @param c2,c4,c6,c8  coefficients of the arc
 * @param m0           arc of lat0; exactly 0 for a latitude of 0
 * @param d2,d4,d6,d8  coefficients of the latitude
 */
TW_API void TWcassini_c(double e, double lon0, double lat0, double* c0, double* c2, double* c4,
                        double* c6, double* c8, double* m0, double* d2, double* d4, double* d6,
                        double* d8);

/**
 * Forward (Snyder 1987, p. 95).  No latitude is tested.
 * @param e            first eccentricity
 * @param lon0         central meridian; whole turns are taken off a difference, -pi and pi stay
 * @param c0           constant of TWcassini_c()
 * @param c2,c4,c6,c8  constants of TWcassini_c()
 * @param m0           constant of TWcassini_c()
 * @param count        number of points
 * @param in           longitude, latitude
 * @param out          x, y
 * @param status       always #TW_SUCCESS
 */
TW_API void TWcassini_f(double e, double lon0, double c0, double c2, double c4, double c6,
                        double c8, double m0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, p. 95).  The longitude is not wrapped; a footpoint within 1e-12 of a pole
 * gives lon0 and the pole, the south pole for a negative y.
 * @param e            first eccentricity
 * @param lon0         central meridian
 * @param c0,m0        constants of TWcassini_c()
 * @param d2,d4,d6,d8  constants of TWcassini_c()
 * @param count        number of points
 * @param in           x, y
 * @param out          longitude, latitude
 * @param status       always #TW_SUCCESS
 */
TW_API void TWcassini_i(double e, double lon0, double c0, double m0, double d2, double d4,
                        double d6, double d8, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, p. 95): 1 + x^2 / 2 R^2 with R^2 the product of the radii of curvature, along
 * the central meridian's direction; true across it.  It works IN PLACE only: in and out must be the
 * same array, which then holds scales.  (With two arrays z of in is lost to the latitude, and h is
 * formed with whatever latitude z of out held.)  A latitude within 1e-10 of a pole is clamped to
 * it; one near the south pole is clamped to just past the NORTH pole.
 * @param e            first eccentricity
 * @param lon0         central meridian
 * @param k0           central scale
 * @param c0           constant of TWcassini_c()
 * @param c2,c4,c6,c8  constants of TWcassini_c()
 * @param m0           constant of TWcassini_c()
 * @param count        number of points
 * @param in           longitude, latitude; z CHANGED by the call
 * @param out          (k0, h, k0 h)
 * @param status       #TW_BAD_LATITUDE beyond a pole: fill
 */
TW_API void TWcassini_s(double e, double lon0, double k0, double c0, double c2, double c4,
                        double c6, double c8, double m0, int32_t count, CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
