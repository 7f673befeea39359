/**
 * @file tolerance_count.h
 * How many points a line needs.
 *
 * Accuracy: no figure; a count of points, which the tolerance decides (docs/accuracy.md).
 *
 * Source: this library's own: doubling, then the secant method.
 */
#ifndef TIDEWATER_TOLERANCE_COUNT_H
#define TIDEWATER_TOLERANCE_COUNT_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * How many evenly spaced points a line must have so that the straight pieces between their images
 * stay within a tolerance of the line's image: by doubling, then by a secant search of at most 100
 * passes.
 *
 * By contract a tolerance that no count meets (a negative one, one below the rounding of the
 * transform's output, or a transform that jumps) keeps the doubling going until the count or the
 * memory is at its end: at a count of 2^30 + 1 the arrays take 48 GB.  A caller that takes the
 * tolerance from a user should hold it above what the transform can give.
 * @param transform  a caller's map of points; it may set the status, which then stands for that
 *                   trial
 * @param context    handed through to transform
 * @param start,end  the ends of the line, radians
 * @param a,e        ellipsoid
 * @param tolerance  largest deviation, in the unit of transform's output
 * @param line_kind  0 geodesic, 1 rhumb line
 * @param count      number of points; 2 where the image is straight
 * @param status     #TW_BAD_TOLERANCE for a tolerance of exactly 0, then #TW_BAD_INPUT for another
 *                   line_kind, both with count unwritten; #TW_NO_MEMORY where an allocation failed,
 *                   or a doubling would pass 32 bits; otherwise the status of the last trial, and
 *                   if that is not #TW_SUCCESS at the end of the doubling, count is left at 3
 */
TW_API void TWtoler_to_cnt(TWtransform transform, TWcontext context, CoordinateTriple start,
                           CoordinateTriple end, double a, double e, double tolerance,
                           int16_t line_kind, int32_t* count, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
