// Formulas of the equidistant conic projection of the ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 111-115.
#pragma once

#include "formulas/meridian_series.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

struct EquidistantConicForward {
  double lon0, n, G, rho0;
  ArcSeries meridian;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto theta = sincos(wrap_turns_below_then_above(lon - lon0) * n);
    const V r = G - meridian.arc(lat);
    return {theta.sin * r, rho0 - theta.cos * r};
  }
};

struct EquidistantConicInverse {
  double lon0, over_n, sign, G, rho0, over_c0;
  FootSeries foot;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V from_apex = rho0 - y;
    const V theta = atan2(sign * x, sign * rho0 - sign * y);
    const V r = plain_hypot(x, from_apex) * sign;
    return {theta * over_n + lon0,  // not wrapped
            foot.latitude((G - r) * over_c0)};
  }
};

struct EquidistantConicScale {
  double e2, k0, n, G;
  ArcSeries meridian;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V /*lon*/, V lat) const {
    const auto at = sincos(lat);
    const V k = (G - meridian.arc(lat, at)) * n / parallel_radius(e2, at.sin, at.cos);
    // By contract: h is 1 and the product carries k0 once.
    return {k * k0, V(k0), k * k0};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::EquidistantConicForward)
TIDEWATER_INSTANCE(tidewater::detail::EquidistantConicInverse)
TIDEWATER_INSTANCE(tidewater::detail::EquidistantConicScale)
