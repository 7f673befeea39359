// Formulas of the Hotine oblique Mercator projection of the unit ellipsoid.
// M. Hotine, The orthomorphic projection of the spheroid, Empire Survey Review 8-9 (1946-47); J. P.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 66-75, eq.
// 9-11 to 9-48.
#pragma once

#include "formulas/isometric_latitude.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Nearer than this to a pole, the forward formulas are those of the pole.
inline constexpr double kHotinePole = 1e-10;
// Nearer than this to 1, |U| has no logarithm of use.
inline constexpr double kHotineUnit = 1e-10;

// To skew coordinates, u along the central line and v across it.
struct HotineForward {
  double e, lon0, E, B, A;
  double sin_g, cos_g;            // of gamma0
  double v_north, v_south;        // at the poles
  const CoordinateTriple* first;  // of the output

  template <class V>
  struct Skew {
    V u, v;
    Mask<V> plain;
  };
  template <Number V>
  TW_INLINE Skew<V> skew(V dl, V lat, const SinCos<V>& p) const {
    // By contract: a not-a-number takes the pole's formulas.
    const auto pole = !(abs(abs(lat) - kHalfPi) >= kHotinePole);
    // Q = E / t^B
    const V Q = E * exp(B * isometric_latitude(e, p));
    const V inverse = 1.0 / Q;
    const V S = (Q - inverse) * 0.5;
    const V T = (inverse + Q) * 0.5;
    const auto at = sincos(B * dl);
    const V across = sin_g * S - cos_g * at.sin;
    const V U = across / T;
    const auto fails = abs(abs(U) - 1.0) < kHotineUnit;
    const Mask<V> plain = pole | !fails;
    const V v = log_ratio(T - across, T + across) * (A / 2 / B);
    // By contract: the second form multiplies by B.
    const V u = select(abs(at.cos) >= 1e-10, atan2(cos_g * S + sin_g * at.sin, at.cos) * (A / B),
                       dl * (A * B));
    return {select(pole, lat * (A / B), u),
            select(pole, select(lat >= 0.0, V(v_north), V(v_south)), v), plain};
  }

  template <Number V>
  TW_INLINE V scale(V u, V lon, const SinCos<V>& p) const {
    return sincos(u * (B / A)).cos * sqrt(1.0 - e * e * square(p.sin)) * A /
           (sincos(B * (lon - lon0)).cos * p.cos);
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto s = skew(wrap_above_then_below(lon - lon0), lat, sincos(lat));
    return {s.u, s.v, s.plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// The same with the scale.
struct HotineScale {
  HotineForward forward;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const auto p = sincos(lat);
    const auto s = forward.skew(wrap_above_then_below(lon - forward.lon0), lat, p);
    return {s.u, s.v, forward.scale(s.u, lon, p), s.plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// From the skew axes to the map's.
struct HotineTurn {
  double sin, cos;  // of alpha

  template <Number V>
  TW_INLINE Answer<V> operator()(V u, V v) const {
    return {v * cos + u * sin, u * cos - v * sin};
  }
};

struct HotineInverse {
  double sin_a, cos_a, sin_g, cos_g, lon0, log_E, B, A;
  ConformalInverse inverse;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V v = cos_a * x - sin_a * y;
    const V u = cos_a * y + sin_a * x;
    const V Q = exp(-(v * (B / A)));
    const V over_Q = 1.0 / Q;
    const V S = (Q - over_Q) * 0.5;
    const V T = (over_Q + Q) * 0.5;
    const auto at = sincos(u * (B / A));
    const V across = sin_g * S + cos_g * at.sin;
    const V U = across / T;
    const auto pole = abs(abs(U) - 1.0) < kHotineUnit;
    // t^B = E / sqrt((1 + U) / (1 - U))
    const V psi = (0.5 * log_ratio(T + across, T - across) - log_E) * (1 / B);
    const V lat = inverse.of_isometric(psi);
    const V lon = lon0 - atan2(cos_g * S - sin_g * at.sin, at.cos) * (1 / B);
    return {select(pole, lon0, lon), select(pole, select(U < 0.0, -kHalfPi, V(kHalfPi)), lat)};
  }
};

struct HotineTriple {
  double k0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V, V, V z) const {
    const V k = z * k0;
    return {k, k, k * k};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::HotineForward)
TIDEWATER_INSTANCE(tidewater::detail::HotineScale)
TIDEWATER_INSTANCE(tidewater::detail::HotineTurn)
TIDEWATER_INSTANCE(tidewater::detail::HotineInverse)
TIDEWATER_INSTANCE(tidewater::detail::HotineTriple)
