// Complex numbers, one or several, for polynomials in the plane: without the infinities and
// branches of std::complex.
#pragma once

#include "formulas/constants.hpp"

namespace tidewater::detail {

template <Number V>
struct ComplexOf {
  V re, im;

  TW_INLINE friend ComplexOf operator+(ComplexOf p, ComplexOf q) {
    return {p.re + q.re, p.im + q.im};
  }
  TW_INLINE friend ComplexOf operator-(ComplexOf p, ComplexOf q) {
    return {p.re - q.re, p.im - q.im};
  }
  TW_INLINE friend ComplexOf operator*(ComplexOf p, ComplexOf q) {
    return {p.re * q.re - p.im * q.im, p.re * q.im + p.im * q.re};
  }
  TW_INLINE friend ComplexOf operator*(double s, ComplexOf p) { return {s * p.re, s * p.im}; }

  // Divided by the larger part of the divisor first, so that its square cannot overflow.
  // R. L. Smith, Algorithm 116: Complex division, Communications of the ACM 5 (1962), p. 435.
  TW_INLINE friend ComplexOf operator/(ComplexOf p, ComplexOf q) {
    const auto real = abs(q.re) >= abs(q.im);
    const V large = select(real, q.re, q.im);
    const V r = select(real, q.im, q.re) / large;
    const V e = r * select(real, q.im, q.re) + large;
    const V a = select(real, p.re, p.im);
    const V b = select(real, p.im, p.re);
    const V turned = b - a * r;
    return {(b * r + a) / e, select(real, turned, -turned) / e};
  }
};

template <Number V>
TW_INLINE V squared_modulus(ComplexOf<V> p) {
  return square(p.re) + square(p.im);
}

}  // namespace tidewater::detail
