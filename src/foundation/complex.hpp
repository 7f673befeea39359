// Complex numbers for polynomials in the plane: without the infinities and branches of
// std::complex.
#pragma once

#include <cmath>

namespace tidewater::detail {

struct Complex {
  double re, im;
};

constexpr Complex operator+(Complex p, Complex q) { return {p.re + q.re, p.im + q.im}; }
constexpr Complex operator-(Complex p, Complex q) { return {p.re - q.re, p.im - q.im}; }
constexpr Complex operator*(Complex p, Complex q) {
  return {p.re * q.re - p.im * q.im, p.re * q.im + p.im * q.re};
}
constexpr Complex operator*(double s, Complex p) { return {s * p.re, s * p.im}; }

// Divided by the larger part of the divisor first, so that its square cannot overflow.
// R. L. Smith, Algorithm 116: Complex division, Communications of the ACM 5 (1962), p. 435.
inline Complex operator/(Complex p, Complex q) {
  if (std::fabs(q.re) >= std::fabs(q.im)) {
    const double r = q.im / q.re;
    const double e = r * q.im + q.re;
    return {(p.im * r + p.re) / e, (p.im - p.re * r) / e};
  }
  const double r = q.re / q.im;
  const double e = r * q.re + q.im;
  return {(p.re * r + p.im) / e, (p.im * r - p.re) / e};
}

}  // namespace tidewater::detail
