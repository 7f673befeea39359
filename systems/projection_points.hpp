// Formulas of this layer's own methods as kernels, compiled once for each level.
#pragma once

#include "formulas/eckert4.hpp"
#include "formulas/equidistant.hpp"
#include "formulas/geodesic.hpp"
#include "formulas/mollweide.hpp"
#include "formulas/oblique_stereographic.hpp"
#include "formulas/transverse_mercator.hpp"
#include "formulas/van_der_grinten.hpp"
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

// A map with forward() and inverse() of its own, in metres or units of the plane from its origin.
template <class Map>
struct MapForward {
  Map map;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto to = map.forward(lon, lat);
    return {to.x, to.y, to.plain};
  }
  Next other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const;
};

template <class Map>
struct MapInverse {
  Map map;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto to = map.inverse(x, y);
    return {to.x, to.y, to.plain};
  }
  Next other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const;
};

// Azimuthal equidistant about any point: azimuth and length of the geodesic from there.
struct GeodesicEquidistantForward {
  Geodesics lines;
  double lat0;  // degrees

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const Mask<V> fit = (abs(lat) <= kHalfPi) & (abs(lon) < 1e6);
    const auto arc =
        lines.many_lines<false>(V(lat0), V(0.0), select(fit, lat, 0.0) * kDegreesPerRadian,
                                select(fit, lon, 0.0) * kDegreesPerRadian);
    const Mask<V> plain = fit & arc.plain;
    return {arc.length * arc.azimuth1.sin, arc.length * arc.azimuth1.cos, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct GeodesicEquidistantInverse {
  Geodesics lines;
  double lat0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V length = plain_hypot(x, y);
    const auto away = length > 0.0;
    const V by = 1.0 / select(away, length, 1.0);
    const auto start =
        lines.line(sincos_degrees(V(lat0)), SinCos<V>{x * by, select(away, y * by, 1.0)});
    const auto end = lines.position(start, length);
    // Beyond half a circumference the lines come back.
    return {end.lon, atan2(end.lat_sin, end.lat_cos), length <= kPi * lines.a};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

#define TIDEWATER_MAP(Map)                                                  \
  TIDEWATER_INSTANCE(tidewater::detail::MapForward<tidewater::detail::Map>) \
  TIDEWATER_INSTANCE(tidewater::detail::MapInverse<tidewater::detail::Map>)
TIDEWATER_MAP(Cassini)
TIDEWATER_MAP(Polyconic)
TIDEWATER_MAP(EquidistantConic)
TIDEWATER_MAP(PolarEquidistant)
TIDEWATER_MAP(VanDerGrinten)
TIDEWATER_MAP(Mollweide)
TIDEWATER_MAP(Eckert4)
TIDEWATER_MAP(StereographicAboutPoint)
#undef TIDEWATER_MAP
TIDEWATER_INSTANCE(tidewater::detail::GeodesicEquidistantForward)
TIDEWATER_INSTANCE(tidewater::detail::GeodesicEquidistantInverse)
TIDEWATER_INSTANCE(tidewater::detail::TransverseMercatorForward)
TIDEWATER_INSTANCE(tidewater::detail::TransverseMercatorInverse)
