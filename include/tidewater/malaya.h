/**
 * @file malaya.h
 * The grid of Malaya by polynomials.
 *
 * The polynomials of degree five stand for the rectified skew orthomorphic grid of TWrso_param().
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Malaya grid, 100 to 104 E, 1.3 to 6.5 N: forward 5.1 mm (3.8 mm), inverse 3.8 mm (2.4 mm).
 *
 * Source: the coefficients are the grid's own, and stand for the projection of skew_orthomorphic.h:
 * Hotine, The Orthomorphic Projection of the Spheroid, Empire Survey Review 8 and 9 (1946-47).
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_MALAYA_H
#define TIDEWATER_MALAYA_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Parameters of the grid: those of TWrso_param() in another order.
 * @param lon_c           longitude of the centre, radians
 * @param lat_c           latitude of the centre, radians
 * @param false_easting   metres
 * @param false_northing  metres
 * @param k0              central scale
 * @param skew            arc sine of -0.6, radians
 * @param status          always #TW_SUCCESS
 */
TW_API void TWmalaya_param(double* lon_c, double* lat_c, double* false_easting,
                           double* false_northing, double* k0, double* skew, TWstatus* status);

/**
 * Coefficients.
 * @param table   84 doubles: four rows of 21, two forward and two inverse
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmalaya_c(double* table, TWstatus* status);

/**
 * Forward.
 * @param table   coefficients of TWmalaya_c()
 * @param lon0    longitude of the origin
 * @param lat0    latitude of the origin
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y in units of the semi-major axis of Everest 1830 Modified, 6377304.063 m
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmalaya_f(const double* table, double lon0, double lat0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse.  The input is in METRES, unlike the output of TWmalaya_f().
 * @param table   coefficients of TWmalaya_c()
 * @param lon0    longitude of the origin
 * @param lat0    latitude of the origin
 * @param count   number of points
 * @param in      x, y in metres
 * @param out     longitude, latitude
 * @param status  always #TW_SUCCESS
 */
TW_API void TWmalaya_i(const double* table, double lon0, double lat0, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
