/**
 * @file perspective.h
 * Vertical and tilted perspective projections of the ellipsoid.
 *
 * Sphere for e exactly 0.  Heights are READ from element z of the input and COPIED to the output;
 * h, h0 and the heights are in the unit of a, x and y in units of a.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Vertical perspective, from 5,000 km above 50 N, within 45 degrees: forward 2.4 nm (1.8 nm),
 *   inverse 11 nm (4.8 nm);
 * - Tilted perspective, sphere, tilt of 20 degrees: forward 1.7 nm (< 1 nm), inverse 2.8 nm
 *   (2.1 nm).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 169-181.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_PERSPECTIVE_H
#define TIDEWATER_PERSPECTIVE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants (Snyder 1987, eq. 23-17, 23-18).
 * @param a       semi-major axis
 * @param e       first eccentricity
 * @param lat0    latitude of origin, radians
 * @param h       height of the point of perspective above the reference surface
 * @param h0      height of the reference surface
 * @param p       distance of the point of perspective from the centre, in units of a
 * @param phi_g   geocentric latitude of the point of perspective
 * @param status  #TW_BAD_PARAMETER when ten passes did not settle to 1e-12; the values are written
 */
TW_API void TWpersp_c(double a, double e, double lat0, double h, double h0, double* p,
                      double* phi_g, TWstatus* status);

/**
 * Vertical perspective, forward (Snyder 1987, eq. 23-13 to 23-16; sphere 22-4, 22-5, 23-3).
 * @param a          semi-major axis
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param h0         not read
 * @param h          height of the point of perspective
 * @param p,phi_g    constants of TWpersp_c()
 * @param count      number of points
 * @param in         longitude, latitude, height
 * @param out        x, y, height; may be in
 * @param status     #TW_NOT_CONVERGED beyond the horizon of a SPHERE: stop.  On the ellipsoid
 *                   nothing fails, and what lies behind the horizon is projected as it comes
 */
TW_API void TWpersp_vert_f(double a, double e, double lon0, double lat0, double h0, double h,
                           double p, double phi_g, int32_t count, const CoordinateTriple* in,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Vertical perspective, inverse (Snyder 1987, eq. 23-19 to 23-30).
 * @param a          semi-major axis
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param h0         not read
 * @param h          height of the point of perspective
 * @param p,phi_g    constants of TWpersp_c()
 * @param count      number of points
 * @param in         x, y, and the height to which the point belongs
 * @param out        longitude, latitude, height; may be in
 * @param status     #TW_I_LATITUDE_LIMITED when ten passes were used: written with the last values
 */
TW_API void TWpersp_vert_i(double a, double e, double lon0, double lat0, double h0, double h,
                           double p, double phi_g, int32_t count, const CoordinateTriple* in,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Tilted perspective, forward (Snyder 1987, eq. 23-7 to 23-12): the vertical one, tilted, then
 * turned.
 * @param a          semi-major axis
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param h0         not read
 * @param h          height of the point of perspective
 * @param p,phi_g    constants of TWpersp_c()
 * @param tilt_a     turns the image in its plane before the tilt
 * @param tilt_b     the tilt itself, which foreshortens
 * @param rot        turns the image by rot LESS PI: half a turn at 0, nothing at pi and at -pi
 * @param count      number of points
 * @param in         longitude, latitude, height
 * @param out        x, y, height; may be in
 * @param status     as TWpersp_vert_f(), with the rest of the output then neither tilted nor turned
 */
TW_API void TWpersp_f(double a, double e, double lon0, double lat0, double h0, double h, double p,
                      double phi_g, double tilt_a, double tilt_b, double rot, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Tilted perspective, inverse.  The rotation is undone IN THE INPUT ARRAY, which this call CHANGES
 * unless rot is pi or -pi.
 * @param a          semi-major axis
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param h0         not read
 * @param h          height of the point of perspective
 * @param p,phi_g    constants of TWpersp_c()
 * @param tilt_a     as in TWpersp_f()
 * @param tilt_b     as in TWpersp_f()
 * @param rot        as in TWpersp_f()
 * @param count      number of points
 * @param in         x, y, and the height to which the point belongs; CHANGED by the call
 * @param out        longitude, latitude, height; may be in
 * @param status     as TWpersp_vert_i()
 */
TW_API void TWpersp_i(double a, double e, double lon0, double lat0, double h0, double h, double p,
                      double phi_g, double tilt_a, double tilt_b, double rot, int32_t count,
                      CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
