/**
 * @file generic_inverse.h
 * Inverse of any forward projection.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Inverse of any map, Mercator, lat -69 to 69: inverse 52 nm (41 nm).
 *
 * Source: this library's own iteration, a secant method on the sphere: each step turns and
 * stretches the plane's error as the step before was turned and stretched.
 */
#ifndef TIDEWATER_GENERIC_INVERSE_H
#define TIDEWATER_GENERIC_INVERSE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Inverts a caller's map of geodetic points to a plane, by walking on the sphere: to 1e-14, at most
 * 100 passes a point, which is not reported if they run out.  Each point starts where the one
 * before ended, so the points should follow a path.
 * @param forward              the map; called with one point at a time, of which only longitude and
 *                             latitude mean anything
 * @param context              handed through to forward
 * @param start_lon,start_lat  where the walk to the first point starts, radians
 * @param unused               not read
 * @param count                number of points
 * @param in                   x, y
 * @param out                  longitude, latitude; may be in
 * @param status               #TW_NOT_CONVERGED for a start latitude beyond a pole, and where
 *                             forward fails: stop.  An information status of forward is handed on
 */
TW_API void TWgeneric_i(TWtransform forward, TWcontext context, double start_lon, double start_lat,
                        double unused, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
