/**
 * @file equirectangular.h
 * Equirectangular projection of the sphere.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Equirectangular, sphere, all latitudes: forward 2.2 nm (1.4 nm), inverse 2.8 nm (2.5 nm),
 *   scale 2.2e-16 (1.7e-16).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 90-91.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_EQUIRECTANGULAR_H
#define TIDEWATER_EQUIRECTANGULAR_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Cosine of the standard parallel.
 * @param lat1      standard parallel, radians, short of the poles
 * @param cos_lat1  its cosine
 * @param status    #TW_BAD_STANDARD_PARALLEL at or beyond a pole; result unwritten
 */
TW_API void TWcyl_eqr_c(double lat1, double* cos_lat1, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 12-1, 12-2).
 * @param lon0      central meridian; a difference of exactly -pi becomes pi
 * @param lat0      latitude of origin
 * @param cos_lat1  constant of TWcyl_eqr_c()
 * @param count     number of points
 * @param in        longitude, latitude
 * @param out       x, y
 * @param status    #TW_BAD_LATITUDE beyond a pole: skip
 */
TW_API void TWcyl_eqr_f(double lon0, double lat0, double cos_lat1, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse (Snyder 1987, eq. 12-5, 12-6).  A latitude beyond a pole is not refused.
 * @param lon0      central meridian; a longitude of exactly -pi becomes pi
 * @param lat0      latitude of origin
 * @param cos_lat1  constant of TWcyl_eqr_c()
 * @param count     number of points
 * @param in        x, y
 * @param out       longitude, latitude
 * @param status    always #TW_SUCCESS
 */
TW_API void TWcyl_eqr_i(double lon0, double lat0, double cos_lat1, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale (Snyder 1987, eq. 12-3, 12-4); h is k0.
 * @param k0        central scale
 * @param cos_lat1  constant of TWcyl_eqr_c()
 * @param count     number of points
 * @param in        longitude, latitude
 * @param out       (k, k0, k0 k)
 * @param status    #TW_NOT_CONVERGED (this projection alone) beyond a pole: fill
 */
TW_API void TWcyl_eqr_s(double k0, double cos_lat1, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
