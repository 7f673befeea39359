// A local rectangular frame on a point of the ellipsoid: geodetic coordinates to and from it.
// IOGP Publication 373-7-2, Geomatics Guidance Note 7, part 2 (2022), method 9837.
#pragma once

#include "foundation/geocentric_points.hpp"

namespace tidewater::detail {

// The frame in units of the semi-major axis; the rows of the matrix, nine doubles, are its axes.
struct LocalFrame {
  double x0, y0, z0;
  const double* m;
};

struct GeodeticToLocal {
  double e2, over_a;
  LocalFrame frame;
  double unit;  // of the result

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat, V height) const {
    const auto at = geocentric_position(1.0, e2, lon, lat, height * over_a);
    const V dx = at.x - frame.x0;
    const V dy = at.y - frame.y0;
    const V dz = at.z - frame.z0;
    const double* m = frame.m;
    return {(m[0] * dx + m[1] * dy + m[2] * dz) * unit, (m[3] * dx + m[4] * dy + m[5] * dz) * unit,
            (m[6] * dx + m[7] * dy + m[8] * dz) * unit};
  }
};

// By the transposed matrix, and on through the geocentric frame.
struct LocalToGeodetic {
  double a;
  LocalFrame frame;
  GeocentricToGeodetic geocentric;

  template <Number V>
  TW_INLINE Position<V> position(V x, V y, V z) const {
    const double* m = frame.m;
    return {a * (frame.x0 + m[0] * x + m[3] * y + m[6] * z),
            a * (frame.y0 + m[1] * x + m[4] * y + m[7] * z),
            a * (frame.z0 + m[2] * x + m[5] * y + m[8] * z)};
  }

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V z) const {
    const auto at = position(x, y, z);
    return geocentric(at.x, at.y, at.z);
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::GeodeticToLocal)
TIDEWATER_INSTANCE(tidewater::detail::LocalToGeodetic)
