/**
 * @file robinson.h
 * Robinson projection of the sphere.
 *
 * The projection is a table of 19 parallels.  Two clamped cubic splines (spline.h) go through it,
 * so that the figures differ from those of other interpolations between the 5-degree parallels.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Robinson, sphere, lat -89 to 89: forward 3.3 nm (1.6 nm), inverse 2.8 nm (2.4 nm), scale
 *   4.0e-15 (3.3e-15).
 *
 * Source: Robinson, A New Map Projection: Its Development and Characteristics, International
 * Yearbook of Cartography 14 (1974), pp. 145-155.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_ROBINSON_H
#define TIDEWATER_ROBINSON_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Splines and ordinate of the latitude of origin.
 * @param knots   19 latitudes, radians
 * @param y_coef  19 rows of four: distance of the parallel from the equator; c and d of the last
 *                row are unwritten
 * @param x_coef  19 rows of four: length of the parallel; c and d of the last row are unwritten
 * @param y0      ordinate of lat0
 * @param lat0    latitude of origin, radians
 * @param status  #TW_NO_MEMORY without memory for the work, y0 unwritten; #TW_BAD_LATITUDE for lat0
 *                beyond a pole, y0 written from the extended cubic
 */
TW_API void TWrobin_c(double* knots, double* y_coef, double* x_coef, double* y0, double lat0,
                      TWstatus* status);

/**
 * Forward.  The output array comes BEFORE the input array.
 * @param knots   19 knots of TWrobin_c()
 * @param y_coef  coefficients of TWrobin_c()
 * @param x_coef  coefficients of TWrobin_c()
 * @param lon0    central meridian; any number of turns is taken off, a difference of pi or -pi
 *                stays
 * @param y0      constant of TWrobin_c()
 * @param count   number of points
 * @param out     x, y
 * @param in      longitude, latitude
 * @param status  #TW_I_LATITUDE_LIMITED for a latitude less than 0.0001 beyond a pole, clamped to
 *                it; #TW_BAD_LATITUDE farther out: stop
 */
TW_API void TWrobin_f(const double* knots, const double* y_coef, const double* x_coef, double lon0,
                      double y0, int32_t count, CoordinateTriple* out, const CoordinateTriple* in,
                      TWstatus* status);

/**
 * Inverse.  The longitude is not wrapped.
 * @param knots   19 knots of TWrobin_c()
 * @param y_coef  coefficients of TWrobin_c()
 * @param x_coef  coefficients of TWrobin_c()
 * @param lon0    central meridian
 * @param y0      constant of TWrobin_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_I_LATITUDE_LIMITED for an ordinate that leads less than 0.0001 beyond a pole,
 *                clamped to it; #TW_BAD_LATITUDE for any other beyond the table's end: stop
 */
TW_API void TWrobin_i(const double* knots, const double* y_coef, const double* x_coef, double lon0,
                      double y0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                      TWstatus* status);

/**
 * Scale on the ellipsoid.  The areal scale is without k0.
 * @param knots   19 knots of TWrobin_c()
 * @param y_coef  coefficients of TWrobin_c()
 * @param x_coef  coefficients of TWrobin_c()
 * @param lon0    central meridian
 * @param radius  radius that scales the map, in the unit of a
 * @param a       semi-major axis
 * @param e       first eccentricity
 * @param k0      central scale
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     (k, h, areal scale)
 * @param status  #TW_BAD_LATITUDE beyond a pole: fill; a status of TWRparal() or TWRmerid(): stop
 */
TW_API void TWrobin_s(const double* knots, const double* y_coef, const double* x_coef, double lon0,
                      double radius, double a, double e, double k0, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
