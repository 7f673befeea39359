/**
 * @file double_stereographic.h
 * Double stereographic projection of the ellipsoid.
 *
 * The ellipsoid onto the Gauss sphere, the graticule of that turned to the origin as its pole, and
 * the polar stereographic of the sphere.  The status of each call is that of the last stage that
 * ran.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Double stereographic, within 60 degrees of 50 N: forward 4.0 nm (2.4 nm), inverse 3.0 nm
 *   (2.0 nm).
 *
 * Source: IOGP Publication 373-7-2 (Guidance Note 7-2), oblique stereographic, method 9809; the
 * stages are those of gauss_sphere.h, rotated_graticule.h and stereographic.h.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_DOUBLE_STEREOGRAPHIC_H
#define TIDEWATER_DOUBLE_STEREOGRAPHIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants.
 * @param e          first eccentricity
 * @param lat0       latitude of origin, radians
 * @param chi_g,c,t  constants of TWgaussII_c()
 * @param C          constant of TWstereo_c() for the pole of a sphere: 2
 * @param m0,chi0    left unwritten, as by TWstereo_c() at a pole
 * @param status     the status of the last stage; a failing TWgaussII_c() leaves C unwritten
 */
TW_API void TWstereo3_c(double e, double lat0, double* chi_g, double* c, double* t, double* C,
                        double* m0, double* chi0, TWstatus* status);

/**
 * Forward.
 * @param e          first eccentricity
 * @param lon0       longitude of origin
 * @param chi_g,c,t  constants of TWstereo3_c()
 * @param C,m0,chi0  constants of TWstereo3_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        x, y; may be in
 * @param status     the status of the last stage; where one fails, out holds what that stage left
 */
TW_API void TWstereo3_f(double e, double lon0, double chi_g, double c, double t, double C,
                        double m0, double chi0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Inverse.
 * @param e          first eccentricity
 * @param lon0       longitude of origin
 * @param chi_g,c,t  constants of TWstereo3_c()
 * @param C,m0,chi0  constants of TWstereo3_c()
 * @param count      number of points
 * @param in         x, y
 * @param out        longitude, latitude; may be in
 * @param status     the status of the last stage; where one fails, out holds what that stage left
 */
TW_API void TWstereo3_i(double e, double lon0, double chi_g, double c, double t, double C,
                        double m0, double chi0, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
