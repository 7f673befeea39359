/**
 * @file plane_polynomial.h
 * Polynomials in two variables from plane to plane.
 *
 * Coefficients of a degree d are two blocks of (d + 1)(d + 2)/2 doubles, for the first and the
 * second output.  In a block terms go by total degree, and within it by falling power of x: 1; x,
 * y; x^2, x y, y^2; and so on.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Polynomial of degree two, the unit square: forward 3.2e-16 (1.8e-16), inverse 3.3e-16
 *   (1.7e-16);
 * - Polynomial of any degree, the unit square: forward 3.2e-16 (1.8e-16), inverse 3.3e-16
 *   (1.7e-16).
 *
 * Source: IOGP Publication 373-7-2 (Guidance Note 7-2), general polynomial, methods 9645 to 9648.
 */
#ifndef TIDEWATER_PLANE_POLYNOMIAL_H
#define TIDEWATER_PLANE_POLYNOMIAL_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Forward (the general polynomial of IOGP Guidance Note 7-2, methods 9645 to 9648).
 * @param coefs   two blocks of coefficients
 * @param d       degree, 0 or more
 * @param count   number of points
 * @param in      x, y, height
 * @param out     the two polynomials' values, and the height; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWnpoly2d_f(const double* coefs, int32_t d, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Inverse by Newton's method from the linear terms' solution: until both steps are below 1e-12, at
 * most 20 passes; running out of them, or a singular matrix, is not reported.
 * @param coefs   two blocks of coefficients
 * @param d       degree, 0 or more
 * @param count   number of points
 * @param in      values of the two polynomials, height
 * @param out     x, y, height; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWnpoly2d_i(const double* coefs, int32_t d, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Forward, of second degree: x' = a0 + a1 x + a2 y + a3 x^2 + a4 x y + a5 y^2, and y' with b.  The
 * second-degree terms are dropped where all six are below 1e-12 in size.
 *
 * The normalisation, x := (x - x0) / sx and y := (y - y0) / sy, takes effect ONLY IF in and out are
 * the same array; with two arrays the polynomials read the raw input.
 * @param x0,y0,sx,sy        normalising origin and scales
 * @param a0,a1,a2,a3,a4,a5  coefficients of x'
 * @param b0,b1,b2,b3,b4,b5  coefficients of y'
 * @param count              number of points
 * @param in                 x, y, height
 * @param out                x', y', height
 * @param status             always #TW_SUCCESS
 */
TW_API void TWpoly2deg_f(double x0, double y0, double sx, double sy, double a0, double a1,
                         double a2, double a3, double a4, double a5, double b0, double b1,
                         double b2, double b3, double b4, double b5, int32_t count,
                         const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse of TWpoly2deg_f() as it works in place; the normalisation always applies.
 * @param x0,y0,sx,sy        normalising origin and scales
 * @param a0,a1,a2,a3,a4,a5  coefficients of x'
 * @param b0,b1,b2,b3,b4,b5  coefficients of y'
 * @param count              number of points
 * @param in                 x', y', height
 * @param out                x, y, height; may be in
 * @param status             always #TW_SUCCESS
 */
TW_API void TWpoly2deg_i(double x0, double y0, double sx, double sy, double a0, double a1,
                         double a2, double a3, double a4, double a5, double b0, double b1,
                         double b2, double b3, double b4, double b5, int32_t count,
                         const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
