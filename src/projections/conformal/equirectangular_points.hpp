// Formulas of the equirectangular projection of the sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 90-91.
#pragma once

#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

struct EquirectangularForward {
  double lon0, lat0, cos_lat1;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    return {wrap_above_then_at_or_below(lon - lon0) * cos_lat1, lat - lat0, !(abs(lat) > kHalfPi)};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct EquirectangularInverse {
  double lon0, lat0, cos_lat1;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    return {wrap_above_then_at_or_below(x / cos_lat1 + lon0), y + lat0};
  }
};

struct EquirectangularScale {
  double k0, cos_lat1;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V /*lon*/, V lat) const {
    const auto plain = !((lat > kHalfPi) | (lat < -kHalfPi));
    const V k = (k0 * cos_lat1) / sincos(lat).cos;
    return {k, V(k0), k0 * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::EquirectangularForward)
TIDEWATER_INSTANCE(tidewater::detail::EquirectangularInverse)
TIDEWATER_INSTANCE(tidewater::detail::EquirectangularScale)
