// Formulas of the New Zealand map grid: a complex polynomial over the Mercator plane.
// W. I. Reilly, A conformal mapping projection with minimum scale error, Survey Review 22 (1973),
// pp. 57-71.
#pragma once

#include "formulas/complex.hpp"
#include "projections/conformal/mercator_points.hpp"

namespace tidewater::detail {

// Coefficients of z to z^6, for z = isometric latitude + i longitude.
inline constexpr ComplexOf<double> kGridCoefficients[6] = {
    {0.7557853228, 0.0},       {0.249204646, 0.003371507}, {-0.001541739, 0.04105856},
    {-0.10162907, 0.01727609}, {-0.26623489, -0.36249218}, {-0.6870983, -1.1651967},
};

template <Number V>
TW_INLINE ComplexOf<V> grid_coefficient(int k, double factor = 1) {
  return {V(factor * kGridCoefficients[k].re), V(factor * kGridCoefficients[k].im)};
}

template <Number V>
TW_INLINE ComplexOf<V> grid_polynomial(ComplexOf<V> z) {
  ComplexOf<V> p = grid_coefficient<V>(5) * z;
  for (int k = 4; k >= 0; --k) p = (p + grid_coefficient<V>(k)) * z;
  return p;
}

template <Number V>
TW_INLINE ComplexOf<V> grid_gradient(ComplexOf<V> z) {
  ComplexOf<V> p = grid_coefficient<V>(5, 6);
  for (int k = 4; k >= 0; --k) p = p * z + grid_coefficient<V>(k, k + 1);
  return p;
}

template <class V>
struct GridRoot {
  ComplexOf<V> z;
  Mask<V> moving;  // the passes were used up, also where the last of them did converge
};

// The z whose polynomial is w, by Newton's rule.
template <Number V>
TW_INLINE GridRoot<V> grid_root(ComplexOf<V> w) {
  constexpr int kMostPasses = 50;
  ComplexOf<V> z = w / grid_coefficient<V>(0);
  Mask<V> moving = everywhere<V>(true);
  for (int passes = 1; any(moving); ++passes) {
    const ComplexOf<V> d = (w - grid_polynomial(z)) / grid_gradient(z);
    z = {select(moving, z.re + d.re, z.re), select(moving, z.im + d.im, z.im)};
    if (passes == kMostPasses) break;
    moving = moving & !(sqrt(squared_modulus(d)) < 1e-14);
  }
  return {z, moving};
}

struct GridPolynomial {
  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const ComplexOf<V> w = grid_polynomial<V>({y, x});
    return {w.im, w.re};
  }
};

struct GridRoots {
  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const ComplexOf<V> z = grid_root<V>({y, x}).z;
    return {z.im, z.re};
  }
};

struct GridScale {
  double e, e2, lon0, y0, k0;

  template <Number V>
  TW_INLINE Answer3<V> scale(V d, V y, const SinCos<V>& p) const {
    const V g = sqrt(squared_modulus(grid_gradient<V>({y, d})));
    // By contract: k0 does not enter here.
    const V k = sqrt(1.0 - e2 * square(p.sin)) * g / p.cos;
    return {k, k, k * k};
  }

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const V held = hold_off_poles(lat, 1e-10);
    const auto p = sincos(held);
    auto answer = scale(lon - lon0, isometric_latitude(e, p) - y0, p);
    answer.plain = !((abs(lat) > kHalfPi) | (abs(held) > kMercatorLatLimit));
    return answer;
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::GridPolynomial)
TIDEWATER_INSTANCE(tidewater::detail::GridRoots)
TIDEWATER_INSTANCE(tidewater::detail::GridScale)
