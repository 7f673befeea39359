// Formulas of the sinusoidal projection of the unit ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 243-248, eq. 30-1 to 30-10.
#pragma once

#include "formulas/wraps.hpp"
#include "foundation/meridian_arc.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Differences up to this are none.
inline constexpr double kSinusoidalNothing = 1e-12;
// Nearer to a pole every longitude is the central one.
inline constexpr double kSinusoidalPole = kHalfPi - 1e-12;

struct SinusoidalForward {
  double lon0, lat0, e2, m0;
  MeridianArc arc;

  template <Number V>
  TW_INLINE V abscissa(V lon, const SinCos<V>& at) const {
    const V d = wrap_turns_below_then_above(lon - lon0);
    V x = at.cos * d;
    if (e2 != 0) x = x / sqrt(1.0 - e2 * square(at.sin));
    return select(abs(d) > kSinusoidalNothing, x, 0.0);
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const Mask<V> plain = everywhere<V>(arc.good()) & !(abs(lat) > kHalfPi);
    const auto at = sincos(lat);
    const V y = select(abs(lat - lat0) <= kSinusoidalNothing, 0.0, arc.arc(lat, at) - m0);
    return {abscissa(lon, at), y, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct SinusoidalInverse {
  double lon0, lat0, e2, m0;
  MeridianArc arc;
  MeridianFoot foot;

  template <Number V>
  TW_INLINE V longitude(V x, V lat) const {
    const auto at = sincos(lat);
    V d = x;
    if (e2 != 0) d = d * sqrt(1.0 - e2 * square(at.sin));
    const auto moves = (abs(x) > kSinusoidalNothing) & (abs(lat) <= kSinusoidalPole);
    return turns_about(lon0, select(moves, d / at.cos + lon0, lon0));
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V m = y + m0;
    const auto nothing = abs(y) <= kSinusoidalNothing;
    const V found = foot.latitude(m);
    const V lat = select(nothing, lat0, found);
    const Mask<V> plain = nothing | (everywhere<V>(foot.serves()) & (abs(m) <= foot.quarter()) &
                                     (abs(found) <= kHalfPi));
    return {longitude(x, lat), lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct SinusoidalScale {
  double k0, lon0, e2;
  bool sphere;
  // Of the arc's derivative by the latitude, in cosines of the multiples of twice the latitude.
  double d0, d2, d4, d6, d8;

  template <Number V>
  TW_INLINE Answer3<V> scales(V d, V sin_lat, V slope) const {
    if (sphere) {
      const V h = sqrt(square(d * sin_lat) + 1.0);
      return {V(k0), k0 * h, V(k0 * k0)};
    }
    const V w2 = 1.0 - e2 * square(sin_lat);
    const V w = w2 * sqrt(w2);
    const V g = sin_lat * d * (e2 - 1.0) / w;
    const V factor = w * (1.0 / (1.0 - e2));
    // By contract: the scale along the parallel is k0 everywhere.
    return {V(k0), k0 * (sqrt(slope * slope + g * g) * factor), k0 * k0 * (slope * factor)};
  }

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const V d = wrap_turns_below_then_above(lon - lon0);
    const auto at = sincos(lat);
    const V c = (at.cos - at.sin) * (at.cos + at.sin);
    const V c4 = 2.0 * c * c - 1.0;
    const V slope =
        d0 + d2 * c + d4 * c4 + d6 * (c * (4.0 * c * c - 3.0)) + d8 * (2.0 * c4 * c4 - 1.0);
    auto answer = scales(d, at.sin, slope);
    answer.plain = sphere ? !(abs(lat) - kHalfPi > kSinusoidalNothing)
                          : everywhere<V>(e2 < 1) & !(abs(lat) > kHalfPi);
    return answer;
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::SinusoidalForward)
TIDEWATER_INSTANCE(tidewater::detail::SinusoidalInverse)
TIDEWATER_INSTANCE(tidewater::detail::SinusoidalScale)
