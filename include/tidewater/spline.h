/**
 * @file spline.h
 * Clamped cubic splines, as the Robinson projection takes them.
 *
 * A spline of n knots is an array of knots and n rows (a, b, c, d): between knots i and i + 1 its
 * value is ((d t + c) t + b) t + a with t = x - knots[i].
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Robinson, sphere, lat -89 to 89: forward 3.3 nm (1.6 nm), inverse 2.8 nm (2.4 nm), scale
 *   4.0e-15 (3.3e-15).
 *
 * Source: de Boor, A Practical Guide to Splines (1978), chapter IV.
 */
#ifndef TIDEWATER_SPLINE_H
#define TIDEWATER_SPLINE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Clamped cubic spline: works out b, c, d from the values a and the two end slopes (de Boor, A
 * Practical Guide to Splines, 1978, chapter IV).
 * @param knots   n knots, strictly rising
 * @param coef    n rows of four; in: a of every row, b of the first and last rows; out: b, c, d of
 *                the others, c and d of the first; c and d of the last row are unwritten
 * @param n       number of knots; below 2 nothing is done
 * @param status  #TW_NO_MEMORY without memory for the work; coef unwritten
 */
TW_API void TWrobin_csform(const double* knots, double* coef, int32_t n, TWstatus* status);

/**
 * Value of a spline.
 * @param x      argument
 * @param knots  n knots, strictly rising
 * @param coef   n rows of four coefficients, from TWrobin_csform()
 * @param n      number of knots, at least 2
 * @param flag   1 inside the range of the knots; 2 outside, by the outermost cubic
 * @return the value; NaN for fewer than 2 knots
 */
TW_API double TWrobin_cseval(double x, const double* knots, const double* coef, int32_t n,
                             uint32_t* flag);

/**
 * First derivative of a spline; at the last knot the given end slope.
 * @param x      argument
 * @param knots  n knots, strictly rising
 * @param coef   n rows of four coefficients, from TWrobin_csform()
 * @param n      number of knots, at least 2
 * @param flag   1 inside the range of the knots; 2 outside, by the outermost cubic
 * @return the derivative; NaN for fewer than 2 knots
 */
TW_API double TWrobin_csderv(double x, const double* knots, const double* coef, int32_t n,
                             uint32_t* flag);

/**
 * Argument at which a rising spline takes a value: Newton on the cubic of the interval that holds
 * the value, to a step of 1e-8 or for 11 passes.
 * @param y      value
 * @param knots  n knots, strictly rising
 * @param coef   n rows of four coefficients, from TWrobin_csform()
 * @param n      number of knots, at least 2
 * @param flag   1 inside the range of the values; 2 outside, by the outermost cubic
 * @return the argument; NaN for fewer than 2 knots
 */
TW_API double TWrobin_csinv(double y, const double* knots, const double* coef, int32_t n,
                            uint32_t* flag);

#ifdef __cplusplus
}
#endif

#endif
