// Formulas of the Miller cylindrical projection of the sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 86-89.
#pragma once

#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// ln(tan(0.4 p + pi/4)) / 0.8, in which the tangent is (1 + sin) / cos of 0.8 p.
template <Number V>
TW_INLINE V miller_ordinate(V lat) {
  const auto at = sincos(0.8 * lat);
  return copysign(log_ratio(1.0 + abs(at.sin), at.cos), at.sin) * 1.25;
}

struct MillerForward {
  double lon0, y0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    return {wrap_above_then_at_or_below(lon - lon0), miller_ordinate(lat) - y0};
  }
};

struct MillerInverse {
  double lon0, y0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V v = 0.8 * (y + y0);
    const auto plain = !(abs(v) > 700.0);
    // atan(sinh v) = 2 atan(tanh(v / 2))
    const V m = expm1(abs(select(plain, v, 0.0)));
    return {x + lon0, copysign(2.5 * octant_angle(m, m + 2.0), v), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct MillerScale {
  double k0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V /*lon*/, V lat) const {
    const V k = k0 / sincos(lat).cos;
    const V h = k0 / sincos(0.8 * lat).cos;
    return {k, h, h * k};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::MillerForward)
TIDEWATER_INSTANCE(tidewater::detail::MillerInverse)
TIDEWATER_INSTANCE(tidewater::detail::MillerScale)
