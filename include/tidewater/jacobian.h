/**
 * @file jacobian.h
 * Local distortion of any transformation by finite differences.
 *
 * A Jacobian record is nine doubles: the derivatives of the output's elements x, y, z by the
 * input's x, then by its y, then by its z.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Local distortion, Mercator, steps of 1e-5: scale 2.3e-10 (2.0e-10);
 * - Meridian convergence, Mercator, steps of 1e-5: 0 rad (0 rad).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), chapter
 * 4, for the scale factors; central and one-sided differences for the derivatives.
 */
#ifndef TIDEWATER_JACOBIAN_H
#define TIDEWATER_JACOBIAN_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Jacobian records.  The transformation is called with six neighbours of a point at once; where
 * that fails, with the point and its neighbours one by one, and a neighbour that fails gives a
 * one-sided difference.
 * @param transform  the transformation, called from the same thread
 * @param context    handed through to it
 * @param step0      step along x, in its unit
 * @param step1      step along y
 * @param step2      step along z
 * @param count      number of points
 * @param in         points
 * @param jacobians  nine doubles for each point, written whole or not at all
 * @param status     the status of the transformation's last call that was not held back for a
 *                   neighbour; on failure of the point itself, or of both neighbours along an axis,
 *                   the call ends
 */
TW_API void TWget_jacobian(TWtransform_ptr transform, void* context, double step0, double step1,
                           double step2, int32_t count, const CoordinateTriple* in,
                           double* jacobians, TWstatus* status);

/**
 * Scale factors from the Jacobian records of a projection.
 * @param a          semi-major axis, in the unit of the output
 * @param e          first eccentricity
 * @param count      number of points
 * @param in         longitude, latitude of the points
 * @param jacobians  their records, steps taken in radians
 * @param out        (scale along the parallel, along the meridian, areal scale)
 * @param status     #TW_BAD_LATITUDE beyond a pole: (1, 1, 1), the loop goes on
 */
TW_API void TWJ_to_scales(double a, double e, int32_t count, const CoordinateTriple* in,
                          const double* jacobians, CoordinateTriple* out, TWstatus* status);

/**
 * Slopes of the axes.  The first is the arc tangent of element 3 by element 0, NOT of element 1 by
 * element 0; the meridian convergence does not depend on it.
 * @param count      number of points
 * @param jacobians  records
 * @param out        (t1, t2, t2 - t1) with t2 the slope of the north-going axis, radians
 * @param status     always #TW_SUCCESS
 */
TW_API void TWJ_to_slopes(int32_t count, const double* jacobians, CoordinateTriple* out,
                          TWstatus* status);

/**
 * Meridian convergence: slope of the north-going axis less pi/2, in (-pi, pi].
 * @param count      number of points
 * @param jacobians  records
 * @param out        one double for each point, radians
 * @param status     always #TW_SUCCESS
 */
TW_API void TWJ_to_merconv(int32_t count, const double* jacobians, double* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
