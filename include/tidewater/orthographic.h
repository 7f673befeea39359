/**
 * @file orthographic.h
 * Orthographic projection of the ellipsoid.
 *
 * The surface point as seen from straight above the origin, by way of geocentric space.  Heights
 * are taken for 0.  The semi-major axis is part of the calls but drops out.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Orthographic, scale, lat 10 to 80: scale 1.7e-16 (1.3e-16);
 * - Orthographic, within 75 degrees of 50 N: forward 1.5 nm (< 1 nm), inverse 2.6 nm (1.4 nm).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 145-153.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_ORTHOGRAPHIC_H
#define TIDEWATER_ORTHOGRAPHIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Geocentric position of the origin, and the rotation to its local axes.
 * @param e          first eccentricity
 * @param lon0,lat0  origin, radians
 * @param x0,y0,z0   geocentric position, in units of the semi-major axis
 * @param r          nine doubles, row by row: east, north, up
 * @param status     always #TW_SUCCESS
 */
TW_API void TWortho_c(double e, double lon0, double lat0, double* x0, double* y0, double* z0,
                      double* r, TWstatus* status);

/**
 * Forward.
 * @param a          not read
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param x0,y0,z0   constants of TWortho_c()
 * @param r          constant of TWortho_c()
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        x, y; may be in
 * @param status     #TW_I_LATITUDE_LIMITED for a point more than 90 degrees from the origin: STOP,
 *                   although that status counts as success
 */
TW_API void TWortho_f(double a, double e, double lon0, double lat0, double x0, double y0, double z0,
                      const double* r, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Inverse: the local vertical met with the ellipsoid, a quadratic equation; within three degrees of
 * the rim, and above e = 0.1, by iteration along the vertical to 1e-9 radians.  An inner call sets
 * the status anew, so that of an earlier point does not outlast a later point that is computed.
 * @param a          not read
 * @param e          first eccentricity
 * @param lon0,lat0  origin
 * @param x0,y0,z0   constants of TWortho_c()
 * @param r          constant of TWortho_c()
 * @param count      number of points
 * @param in         x, y
 * @param out        longitude, latitude; may be in
 * @param status     #TW_I_LATITUDE_LIMITED for a point at or beyond sqrt(1 - e^2) from the origin:
 *                   STOP, although that status counts as success; and when the passes were used up:
 *                   the last values are written, the loop goes on
 */
TW_API void TWortho_i(double a, double e, double lon0, double lat0, double x0, double y0, double z0,
                      const double* r, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Scale on the SPHERE (Snyder 1987, eq. 20-5): the cosine of the distance from the origin.
 * Latitudes within 1e-10 of a pole are clamped as in TWmerc_s(), the south pole just past the NORTH
 * pole.
 * @param lon0,lat0  origin
 * @param k0         not read
 * @param count      number of points
 * @param in         longitude, latitude
 * @param out        (1, h, h); may be in
 * @param status     #TW_BAD_LATITUDE beyond a pole: written with h of the PREVIOUS point (0 at the
 *                   first)
 */
TW_API void TWortho_s(double lon0, double lat0, double k0, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
