// Sums of trigonometric series and polynomials.
// C. W. Clenshaw, A note on the summation of Chebyshev series, Mathematics of Computation 9 (1955),
// pp. 118-120.
#pragma once

#include "formulas/complex.hpp"
#include "formulas/constants.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

// c[0] + c[1] x + ... + c[N - 1] x^(N - 1)
template <int N, Number V>
TW_INLINE V polynomial(const double (&c)[N], V x) {
  V sum = c[N - 1];
  for (int k = N - 2; k >= 0; --k) sum = sum * x + c[k];
  return sum;
}

// Sine and cosine of twice an angle.
template <Number V>
TW_INLINE SinCos<V> twice(SinCos<V> at) {
  return {2.0 * at.sin * at.cos, (at.cos - at.sin) * (at.cos + at.sin)};
}

// The sum of c[k - 1] sin(k x) for k from 1 to N, c numbers or several points' numbers.
template <int N, class C, Number V>
TW_INLINE V sine_series(const C (&c)[N], SinCos<V> x) {
  const V step = 2.0 * x.cos;
  V next = 0.0;
  V sum = c[N - 1];
  for (int k = N - 2; k >= 0; --k) {
    const V before = step * sum - next + c[k];
    next = sum;
    sum = before;
  }
  return sum * x.sin;
}

template <Number V>
struct ComplexSums {
  ComplexOf<V> sine, slope;
};

// At a complex angle z, given the sine and cosine of it: the sum of c[k - 1] sin(k z), and with
// `Slope` that of k c[k - 1] cos(k z) as well, k from 1 to N.
template <bool Slope, int N, Number V>
TW_INLINE ComplexSums<V> complex_sine_series(const double (&c)[N], ComplexOf<V> sin,
                                             ComplexOf<V> cos) {
  const ComplexOf<V> step = {2.0 * cos.re, 2.0 * cos.im};
  const V zero = 0.0;
  ComplexOf<V> next = {zero, zero};
  ComplexOf<V> sum = {V(c[N - 1]), zero};
  ComplexOf<V> slope_next = {zero, zero};
  ComplexOf<V> slope_sum = {V(N * c[N - 1]), zero};
  for (int k = N - 2; k >= 0; --k) {
    const ComplexOf<V> before = {step.re * sum.re - step.im * sum.im - next.re + c[k],
                                 step.re * sum.im + step.im * sum.re - next.im};
    next = sum;
    sum = before;
    if constexpr (Slope) {
      const ComplexOf<V> slope_before = {
          step.re * slope_sum.re - step.im * slope_sum.im - slope_next.re + (k + 1) * c[k],
          step.re * slope_sum.im + step.im * slope_sum.re - slope_next.im};
      slope_next = slope_sum;
      slope_sum = slope_before;
    }
  }
  ComplexSums<V> sums;
  sums.sine = {sum.re * sin.re - sum.im * sin.im, sum.re * sin.im + sum.im * sin.re};
  sums.slope = {slope_sum.re * cos.re - slope_sum.im * cos.im - slope_next.re,
                slope_sum.re * cos.im + slope_sum.im * cos.re - slope_next.im};
  return sums;
}

// Sine and cosine of an angle that a small one moves: |small| below 0.07, to rounding.
template <Number V>
TW_INLINE SinCos<V> turned(SinCos<V> at, V small) {
  const V q = small * small;
  const V sine = small * (1.0 - q * (1.0 / 6) * (1.0 - q * (1.0 / 20) * (1.0 - q * (1.0 / 42))));
  const V versine =
      q * 0.5 * (1.0 - q * (1.0 / 12) * (1.0 - q * (1.0 / 30) * (1.0 - q * (1.0 / 56))));
  return {at.sin + (at.cos * sine - at.sin * versine), at.cos - (at.sin * sine + at.cos * versine)};
}

}  // namespace tidewater::detail
