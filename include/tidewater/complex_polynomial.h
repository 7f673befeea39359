/**
 * @file complex_polynomial.h
 * Complex polynomials: conformal maps from plane to plane.
 *
 * The variable is z = (y - y0) / sy + i (x - x0) / sx: northing is the real part.  Coefficients are
 * order + 1 pairs of doubles, real part first.  Element z of a point is neither read nor written.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Complex polynomial, the unit square: forward 4.1e-16 (1.4e-16), inverse 6.1e-16 (2.2e-16);
 * - Derivative of a complex polynomial, the unit square: 1.1e-16 (1.0e-16);
 * - Conformal polynomial, the unit square: forward 2.1e-16 (1.6e-16), inverse 3.3e-16 (2.2e-16).
 *
 * Source: IOGP Publication 373-7-2 (Guidance Note 7-2), complex polynomial, methods 9652 and 9653;
 * Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), eq. 26-1.
 */
#ifndef TIDEWATER_COMPLEX_POLYNOMIAL_H
#define TIDEWATER_COMPLEX_POLYNOMIAL_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Forward: y' + i x' = c_0 + c_1 z + ... + c_order z^order (IOGP Guidance Note 7-2, methods 9652
 * and 9653; Snyder 1987, eq. 26-1).
 * @param order        order, 0 or more
 * @param y0,x0,sy,sx  normalising origin and scales, northing FIRST
 * @param coefs        order + 1 pairs
 * @param count        number of points
 * @param in           x, y
 * @param out          x', y'; may be in
 * @param status       always #TW_SUCCESS
 */
TW_API void TWcomplexpol_f(int32_t order, double y0, double x0, double sy, double sx,
                           const double* coefs, int32_t count, const CoordinateTriple* in,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Derivative of the polynomial.
 * @param order      order
 * @param coefs      order + 1 pairs
 * @param z_re,z_im  the (normalised) variable
 * @param result     two doubles: real and imaginary part
 * @param status     always #TW_SUCCESS
 */
TW_API void TWcomplexpol_g(int32_t order, const double* coefs, double z_re, double z_im,
                           double* result, TWstatus* status);

/**
 * Inverse by Newton's method, until the squared modulus of a step is below 1e-14, at most 50
 * passes.  It starts from the real part alone of the linear terms' solution.
 * @param order        order, 1 or more
 * @param y0,x0,sy,sx  normalising origin and scales, northing FIRST
 * @param coefs        order + 1 pairs
 * @param count        number of points
 * @param in           x', y'
 * @param out          x, y; may be in
 * @param status       #TW_I_LATITUDE_LIMITED if the LAST point ran out of passes; its last estimate
 *                     is written.  Those before it are not reported
 */
TW_API void TWcomplexpol_i(int32_t order, double y0, double x0, double sy, double sx,
                           const double* coefs, int32_t count, const CoordinateTriple* in,
                           CoordinateTriple* out, TWstatus* status);

/**
 * Conformal mapping of second degree: with X = (x - x0) / sx and Y = (y - y0) / sy, x' = a0 + a1 X
 * - b1 Y + a2 (X^2 - Y^2) - 2 b2 X Y and y' = b0 + b1 X + a1 Y + b2 (X^2 - Y^2) + 2 a2 X Y. The
 *   second-degree terms are dropped where hypot(a2, b2) is below 1e-12.
 * @param x0,y0,sx,sy  normalising origin and scales
 * @param a0,a1,a2     coefficients
 * @param b0,b1,b2     coefficients
 * @param count        number of points
 * @param in           x, y
 * @param out          x', y'; may be in
 * @param status       always #TW_SUCCESS
 */
TW_API void TWconform2_f(double x0, double y0, double sx, double sy, double a0, double a1,
                         double a2, double b0, double b1, double b2, int32_t count,
                         const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse of TWconform2_f(), by TWcomplexpol_i().
 * @param x0,y0,sx,sy  normalising origin and scales
 * @param a0,a1,a2     coefficients
 * @param b0,b1,b2     coefficients
 * @param count        number of points
 * @param in           x', y'
 * @param out          x, y; may be in
 * @param status       as TWcomplexpol_i()
 */
TW_API void TWconform2_i(double x0, double y0, double sx, double sy, double a0, double a1,
                         double a2, double b0, double b1, double b2, int32_t count,
                         const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
