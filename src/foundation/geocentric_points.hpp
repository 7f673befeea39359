// Geodetic coordinates to and from the earth-centred rectangular frame; formulas/geocentric.hpp
// names the sources.
#pragma once

#include "formulas/geocentric.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Nearer than this to it a point is on the axis.
inline constexpr double kOnAxis = 1e-9;

struct GeodeticToGeocentric {
  double a, e2;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat, V height) const {
    const auto at = geocentric_position(a, e2, lon, lat, height);
    return {at.x, at.y, at.z};
  }
};

struct GeocentricToGeodetic {
  GeodeticPosition geodetic;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V z) const {
    const V p2 = square(x) + square(y);
    const V p = sqrt(p2);
    const V r = sqrt(p2 + square(z));
    // Squares of squares beyond 1e70 would overflow.
    const auto plain = !((p < kOnAxis) | (r > 1e70));
    const auto at = geodetic(x, y, z, p, r);
    return {at.x, at.y, at.z, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::GeodeticToGeocentric)
TIDEWATER_INSTANCE(tidewater::detail::GeocentricToGeodetic)
