/**
 * @file indian_polyhedric.h
 * Indian polyhedric projection of the ellipsoid.
 *
 * A power series of the second order about a latitude of origin, for sheets of some degrees.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Indian polyhedric, within 2 degrees of the origin: forward 128 m (86 m), inverse 439 um
 *   (302 um).
 *
 * Source: Survey of India, Auxiliary Tables, fifth edition (1907), polyhedric projection.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_INDIAN_POLYHEDRIC_H
#define TIDEWATER_INDIAN_POLYHEDRIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Coefficients of the series.
 * @param e                  first eccentricity
 * @param lat0               latitude of origin, radians; not tested
 * @param c1,c2,c3,c4,c5,c6  coefficients
 * @param status             always #TW_SUCCESS
 */
TW_API void TWind_phed_c(double e, double lat0, double* c1, double* c2, double* c3, double* c4,
                         double* c5, double* c6, TWstatus* status);

/**
 * Forward.  The eccentricity is in the coefficients.
 * @param lon0               central meridian; a difference of exactly -pi becomes pi
 * @param lat0               latitude of origin
 * @param c1,c2,c3,c4,c5,c6  constants of TWind_phed_c()
 * @param count              number of points
 * @param in                 longitude, latitude
 * @param out                x, y in units of the semi-major axis; may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWind_phed_f(double lon0, double lat0, double c1, double c2, double c3, double c4,
                         double c5, double c6, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Inverse, by steps of the residual until it is 1e-9 or less.
 * @param a                  semi-major axis in METRES: it scales the steps, not the coordinates
 * @param lon0               central meridian; the longitude is not wrapped
 * @param lat0               latitude of origin
 * @param c1,c2,c3,c4,c5,c6  constants of TWind_phed_c()
 * @param count              number of points
 * @param in                 x, y in units of the semi-major axis
 * @param out                longitude, latitude; may be in
 * @param status             #TW_NOT_CONVERGED after 31 passes, or when the residual has risen three
 *                           times in a row; the point is written with what is at hand, and the loop
 *                           goes on
 */
TW_API void TWind_phed_i(double a, double lon0, double lat0, double c1, double c2, double c3,
                         double c4, double c5, double c6, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
