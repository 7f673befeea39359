// Formulas of this layer's own methods as kernels, compiled once for each level.
#pragma once

#include "formulas/transverse_mercator.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// In metres, with the scale on the central meridian; y from the latitude of origin.
struct TransverseMercatorForward {
  TransverseMercator map;
  double y0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto to = map.forward(lon, lat);
    return {to.x, to.y - y0, to.plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct TransverseMercatorInverse {
  TransverseMercator map;
  double y0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto to = map.inverse(x, y + y0);
    return {to.lon, to.lat, to.plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::TransverseMercatorForward)
TIDEWATER_INSTANCE(tidewater::detail::TransverseMercatorInverse)
