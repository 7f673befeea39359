// Formulas of the Mercator projection of the ellipsoid onto a plane of unit semi-major axis.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 44-47.
#pragma once

#include "formulas/isometric_latitude.hpp"
#include "formulas/pole_hold.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// The forward formula loses the ordinate this close to a pole.
inline constexpr double kMercatorLatLimit = kHalfPi - 1e-14;

struct MercatorForward {
  double e, lon0, y0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto plain = !(abs(lat) > kMercatorLatLimit);
    const auto at = sincos(select(plain, lat, 0.0));
    return {wrap_above_then_below(lon - lon0), isometric_latitude(e, at) - y0, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct MercatorInverse {
  double lon0, y0;
  ConformalInverse inverse;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    return {wrap_at_or_below_then_above(x + lon0), inverse.of_isometric(y + y0)};
  }
};

struct MercatorScale {
  double e2, k0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V /*lon*/, V lat) const {
    const auto plain = !((lat > kHalfPi) | (lat < -kHalfPi));
    const auto at = sincos(hold_off_poles(select(plain, lat, 0.0), 1e-10));
    const V k = sqrt(1.0 - e2 * square(at.sin)) * k0 / at.cos;
    return {k, k, k * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::MercatorForward)
TIDEWATER_INSTANCE(tidewater::detail::MercatorInverse)
TIDEWATER_INSTANCE(tidewater::detail::MercatorScale)
