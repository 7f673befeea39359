/**
 * @file transverse_mercator.h
 * Transverse Mercator projection of the ellipsoid.
 *
 * Series about the central meridian, and a series for the meridian arc: for some degrees on either
 * side, though some use remains to 50.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Transverse Mercator, 3 degrees, lon within 3, lat -84 to 84: forward 1.8 mm (1.7 mm), inverse
 *   343 um (191 um), scale 8.1e-11 (3.8e-11);
 * - Transverse Mercator, 10 degrees, lon within 10, lat -84 to 84: forward 15 mm (3.2 mm), inverse
 *   1.6 m (751 mm), scale 9.9e-08 (2.2e-08);
 * - Transverse Mercator, 35 degrees, lon within 35, lat -84 to 84: forward 343 m (86 m), inverse
 *   19 km (13 km), scale 6.6e-04 (1.2e-04);
 * - Transverse Mercator, next to the poles, lon within 3, lat 84 to 89.9: forward 793 um (757 um),
 *   inverse 17 km (17 km);
 * - Transverse Mercator with scale, lon within 3, lat -84 to 84: forward 1.8 mm (1.7 mm), scale
 *   8.1e-11 (3.6e-11).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 48-65.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_TRANSVERSE_MERCATOR_H
#define TIDEWATER_TRANSVERSE_MERCATOR_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Coefficients of the meridian arc, m(p) = A0 p - A2 sin 2p + A4 sin 4p - A6 sin 6p + A8 sin 8p,
 * and of the footpoint latitude, p = u + B2 sin 2u + B4 sin 4u + B6 sin 6u (Snyder 1987, eq. 3-21,
 * 3-26).
 * @param e               first eccentricity
 * @param lon0            not read
 * @param lat0            latitude of origin, radians
 * @param A0,A2,A4,A6,A8  coefficients of the arc
 * @param M0              m(lat0); exactly 0 for a latitude of 0
 * @param B2,B4,B6        coefficients of the footpoint latitude
 * @param status          always #TW_SUCCESS
 */
TW_API void TWt_merc_c(double e, double lon0, double lat0, double* A0, double* A2, double* A4,
                       double* A6, double* A8, double* M0, double* B2, double* B4, double* B6,
                       TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 8-9, 8-10, carried one term further as in Defense Mapping Agency
 * Technical Manual 8358.2, The Universal Grids, 1989, chapter 2).  A longitude (not its difference
 * from lon0) or a latitude below 1e-12 in size is taken for 0; within 1e-10 of a pole x is 0 and y
 * the meridian arc.  No latitude is refused.
 * @param e               first eccentricity
 * @param lon0            central meridian; a difference of exactly -pi becomes pi
 * @param A0,A2,A4,A6,A8  constants of TWt_merc_c()
 * @param M0              constant of TWt_merc_c()
 * @param count           number of points
 * @param in              longitude, latitude
 * @param out             x, y
 * @param status          always #TW_SUCCESS
 */
TW_API void TWt_merc_f(double e, double lon0, double A0, double A2, double A4, double A6, double A8,
                       double M0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Inverse: the closed form on the sphere for e below 1e-12 (Snyder 1987, eq. 8-6, 8-7), otherwise
 * the series from the footpoint (eq. 8-17, 8-18).  By contract, where the series depart by more
 * than 0.005 radians from a sphere that fits midway, as they do far from the central meridian and
 * near the poles, the sphere's position is given instead, kilometres off, and the status stays
 * #TW_SUCCESS.  The longitude is not wrapped; a footpoint within 1e-12 of a pole gives lon0 and the
 * pole.
 * @param e         first eccentricity
 * @param lon0      central meridian
 * @param lat0      latitude of origin, for the sphere
 * @param A0,M0     constants of TWt_merc_c(), for the ellipsoid
 * @param B2,B4,B6  constants of TWt_merc_c(), for the ellipsoid
 * @param count     number of points
 * @param in        x, y
 * @param out       longitude, latitude
 * @param status    #TW_RANGE_ERROR for |x|, or |x| in units of the fitted sphere's radius, above
 *                  700: stop
 */
TW_API void TWt_merc_i(double e, double lon0, double lat0, double A0, double M0, double B2,
                       double B4, double B6, int32_t count, const CoordinateTriple* in,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 8-11), on the difference of longitude as it stands, without a wrap; k0
 * within 1e-10 of a pole.
 * @param e       first eccentricity
 * @param k0      central scale
 * @param lon0    central meridian
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, k, k k)
 * @param status  #TW_I_LATITUDE_LIMITED for a point more than 50 degrees from the central meridian,
 *                whose value is written all the same
 */
TW_API void TWt_merc_s(double e, double k0, double lon0, int32_t count, const CoordinateTriple* in,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Forward with point scale: x and y as TWt_merc_f() gives them, but with no snap of small values to
 * 0, and z of the OUTPUT multiplied by the scale at the point: put 1.0 there (or the scale of an
 * earlier stage) before the call.  The scale is that of TWt_merc_s(), on the difference of
 * longitude without a wrap, and k0 at the poles.
 * @param e               first eccentricity
 * @param lon0            central meridian; a difference of exactly -pi becomes pi for x and y
 * @param A0,A2,A4,A6,A8  constants of TWt_merc_c()
 * @param M0              constant of TWt_merc_c()
 * @param k0              central scale
 * @param count           number of points
 * @param in              longitude, latitude
 * @param out             x, y, and z read and multiplied
 * @param status          always #TW_SUCCESS
 */
TW_API void TWt_merc_xyk(double e, double lon0, double A0, double A2, double A4, double A6,
                         double A8, double M0, double k0, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
