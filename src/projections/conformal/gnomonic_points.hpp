// Formulas of the gnomonic projection of the unit sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 165-167, eq. 22-3 to 22-9.
#pragma once

#include "formulas/wraps.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Nearer than this to a pole or to the equator, an origin takes the formula of that aspect.
inline constexpr double kGnomonicMargin = 5e-10;
// On or behind the horizon, the cosine of the distance is no more than this.
inline constexpr double kGnomonicHorizon = 1e-13;

enum class GnomonicAspect { north, south, equatorial, oblique };

struct GnomonicForward {
  GnomonicAspect aspect;
  double lon0, cos_lat0, sin_lat0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto d = sincos(lon - lon0);
    const auto p = sincos(lat);
    const V cosine = d.cos * p.cos * cos_lat0 + p.sin * sin_lat0;
    const Mask<V> plain = !(cosine <= kGnomonicHorizon);
    switch (aspect) {
      case GnomonicAspect::north:
      case GnomonicAspect::south: {
        const V cotangent = p.cos / p.sin;
        const double side = aspect == GnomonicAspect::north ? 1 : -1;
        return {side * d.sin * cotangent, -(d.cos * cotangent), plain};
      }
      case GnomonicAspect::equatorial:
        return {d.sin / d.cos, p.sin / (p.cos * d.cos), plain};
      default:
        const V inverse = 1.0 / cosine;
        return {d.sin * p.cos * inverse, (p.sin * cos_lat0 - d.cos * p.cos * sin_lat0) * inverse,
                plain};
    }
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct GnomonicInverse {
  GnomonicAspect aspect;
  double lon0, lat0, cos_lat0, sin_lat0;

  // With c = atan rho, sin c = rho cos c, and cos c drops out of both arc tangents.
  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V r2 = x * x + y * y;
    const V sine = y * cos_lat0 + sin_lat0;
    const V along = cos_lat0 - y * sin_lat0;
    V adjacent = along;
    if (aspect == GnomonicAspect::north) adjacent = -y;
    if (aspect == GnomonicAspect::south) adjacent = y;
    const auto centre = r2 == 0.0;
    const V lat = select(centre, lat0, atan2(sine, sqrt(x * x + along * along)));
    const V lon = select(centre, lon0, lon0 + atan2(x, adjacent));
    return {wrap_above_then_below(lon), lat};
  }
};

struct GnomonicScale {
  double lon0, k0, cos_lat0, sin_lat0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const auto p = sincos(lat);
    const V cosine = sincos(lon - lon0).cos * p.cos * cos_lat0 + p.sin * sin_lat0;
    const Mask<V> plain = cosine > 0.0;
    const V inverse = 1.0 / select(plain, cosine, 1.0);
    const V k = k0 * inverse;
    const V h = k * inverse;
    return {k, h, k * h, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::GnomonicForward)
TIDEWATER_INSTANCE(tidewater::detail::GnomonicInverse)
TIDEWATER_INSTANCE(tidewater::detail::GnomonicScale)
