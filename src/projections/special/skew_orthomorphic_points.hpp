// Formulas of the rectified skew orthomorphic projection of the unit ellipsoid.
// M. Hotine, The orthomorphic projection of the spheroid, Empire Survey Review 8-9 (1946-47),
// paras. 17-25.
#pragma once

#include "formulas/arc_tangent.hpp"
#include "formulas/isometric_latitude.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Largest argument of a hyperbolic function: beyond it the result would overflow.
inline constexpr double kHyperbolicLimit = 700;

template <Number V>
TW_INLINE V half_log_ratio(V g) {
  return log_ratio(g + 1.0, 1.0 - g) * 0.5;
}

struct SkewForward {
  double lon0, sin_g, cos_g, A, B, C, e;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto d = sincos((lon0 - lon) * B);
    const V W = isometric_latitude(e, sincos(lat)) * B + C;
    const Mask<V> plain = !(abs(W) > kHyperbolicLimit);
    const auto h = sinhcosh(select(plain, W, 0.0));
    const V u = atan_of_quotient(cos_g * h.sinh - d.sin * sin_g, d.cos) * (A / B);
    const V v = half_log_ratio((-(cos_g * d.sin) - h.sinh * sin_g) / h.cosh) * (A / B);
    return {v * cos_g + u * sin_g, cos_g * u - sin_g * v, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct SkewInverse {
  double lon0, sin_g, cos_g, A, B, C;
  ConformalInverse inverse;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto u = sincos((cos_g * y + sin_g * x) * (B / A));
    const V v = (cos_g * x - sin_g * y) * (B / A);
    const Mask<V> plain = !(abs(v) > kHyperbolicLimit);
    const auto h = sinhcosh(select(plain, v, 0.0));
    const V lon = lon0 - atan_of_quotient(-(cos_g * h.sinh) - u.sin * sin_g, u.cos) * (1 / B);
    const V W = half_log_ratio((cos_g * u.sin - h.sinh * sin_g) / h.cosh);
    return {lon, inverse.of_isometric((W - C) * (1 / B)), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct SkewScale {
  double e, k0, lon0, sin_g, cos_g, A, B, C;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const auto d = sincos((lon0 - lon) * B);
    const auto p = sincos(lat);
    const V W = isometric_latitude(e, p) * B + C;
    // At the pole itself the arc tangent is a quarter turn, whose cosine is that of the latitude.
    const Mask<V> plain = !((abs(W) > kHyperbolicLimit) | (d.cos == 0.0) | (abs(lat) == kHalfPi));
    const auto h = sinhcosh(select(plain, W, 0.0));
    // cos(atan q) / cos d with q = n / cos d
    const V n = h.sinh * cos_g - d.sin * sin_g;
    const V size = copysign(sqrt(d.cos * d.cos + n * n), d.cos);
    const V k = sqrt(1.0 - e * e * square(p.sin)) * (A * k0) / (p.cos * size);
    return {k, k, k * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::SkewForward)
TIDEWATER_INSTANCE(tidewater::detail::SkewInverse)
TIDEWATER_INSTANCE(tidewater::detail::SkewScale)
