// Formulas for longitude and latitude seen from another pole.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 29-32,
// eq. 5-7 to 5-10b.
#pragma once

#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Closer than this to a pole a direction has no meaning, and a longitude is a matter of convention.
inline constexpr double kRotationPoleMargin = 1e-12;

// By contract: with a pole that stands at pi/2 nothing moves.
struct SameGraticule {
  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    return {lon, lat};
  }
};

struct RotatedForward {
  double lon0, pole_lon, pole_lat, sin_pole, cos_pole, offset;

  // The new latitude by the arc tangent, which keeps its digits near the new pole.
  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto d = sincos(lon - pole_lon);
    const auto p = sincos(lat);
    const V sine = d.cos * p.cos * cos_pole + p.sin * sin_pole;
    const V a = d.sin * p.cos;
    const V b = d.cos * p.cos * sin_pole - p.sin * cos_pole;
    const V cosine = sqrt(a * a + b * b);
    const V new_lat =
        select(sine >= 1.0, kHalfPi, select(sine <= -1.0, -kHalfPi, atan2(sine, cosine)));
    const auto pole = (cosine < kRotationPoleMargin) | ((lon == pole_lon) & (lat == pole_lat));
    const V new_lon = select(pole, lon0, atan2(a, b) + lon0);
    return {wrap_turns_above_then_at_or_below(new_lon + offset), new_lat};
  }
};

// By contract: no shortcut for a pole that stands at pi/2, unlike the forward function.
struct RotatedInverse {
  double lon0, pole_lon, sin_pole, cos_pole, offset;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto d = sincos((lon - offset) - lon0);
    const auto p = sincos(lat);
    const V sine = p.sin * sin_pole - d.cos * p.cos * cos_pole;
    const V a = d.sin * p.cos;
    const V b = d.cos * p.cos * sin_pole + p.sin * cos_pole;
    const V new_lat = atan2(sine, sqrt(a * a + b * b));
    const V new_lon = wrap_turns_above_then_at_or_below(atan2(a, b) + pole_lon);
    return {select(abs(abs(new_lat) - kHalfPi) < kRotationPoleMargin, lon0, new_lon), new_lat};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::SameGraticule)
TIDEWATER_INSTANCE(tidewater::detail::RotatedForward)
TIDEWATER_INSTANCE(tidewater::detail::RotatedInverse)
