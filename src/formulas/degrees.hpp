// Angles in degrees, without the loss that a conversion to radians first would bring: whole quarter
// turns are taken off exactly.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

// Sine and cosine of degrees up to 1e15, exact at multiples of 90.
template <Number V>
TW_INLINE SinCos<V> sincos_degrees(V x) {
  const V quarters = nearest_whole(x * (1.0 / 90));
  const auto at = sincos((x - 90.0 * quarters) * kRadiansPerDegree);
  const V q = quarters - 4.0 * nearest_whole(quarters * 0.25);  // from -2 to 2
  const auto odd = abs(q) == 1.0;
  const V s = select(odd, at.cos, at.sin);
  const V c = select(odd, at.sin, at.cos);
  const auto sin_changes = (q < 0.0) | (abs(q) == 2.0);
  const auto cos_changes = (q == 1.0) | (abs(q) == 2.0);
  // A sum with zero, so that no cosine is a negative zero.
  return {select(sin_changes, -s, s), 0.0 + select(cos_changes, -c, c)};
}

// The angle of a direction in degrees, from -180 to 180.
template <Number V>
TW_INLINE V atan2_degrees(V y, V x) {
  return atan2(y, x) * kDegreesPerRadian;
}

// A value and what was lost in rounding it.
template <Number V>
struct Exact {
  V value, rest;
};

// b - a in degrees, brought within half a turn.
template <Number V>
TW_INLINE Exact<V> degrees_between(V a, V b) {
  const V near_a = a - 360.0 * nearest_whole(a * (1.0 / 360));
  const V near_b = b - 360.0 * nearest_whole(b * (1.0 / 360));
  const V d = near_b - near_a;
  const V part = d - near_b;
  const V rest = (near_b - (d - part)) - (near_a + part);
  // Within 360 the whole turn comes off exactly.
  const V turn = select(d > 180.0, 360.0, select(d < -180.0, V(-360.0), V(0.0)));
  return {d - turn, rest};
}

// A longitude within half a turn.
template <Number V>
TW_INLINE V wrap_degrees(V lon) {
  return lon - 360.0 * nearest_whole(lon * (1.0 / 360));
}

}  // namespace tidewater::detail
