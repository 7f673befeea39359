// Formulas of the Eckert IV projection of the unit sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 253-258, eq. 32-1 to 32-10.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

inline constexpr double kEckertTarget = 3.5707963267948966;    // 2 + pi/2
inline constexpr double kEckertYSquare = 0.43990084648844263;  // pi / (4 + pi)
inline constexpr double kEckertXSquare = 22.43597501544853;    // pi (4 + pi)
inline constexpr double kFourPlusPi = 7.141592653589793;
// Nearer to a pole rounding alone may use up the passes of the stated iteration.
inline constexpr double kEckertCloseToPole = 5e-4;

// Sine and cosine of the root t of t + sin t cos t + 2 sin t = (2 + pi/2) sin p.
//
// From the pole, s = pi/2 - t is the root of s - sin s cos s + 2 (1 - cos s) = v^2 with v^2 = (2 +
// pi/2) (1 - sin |p|): a series in v, here a polynomial within 5e-6 of it, is put right by one step
// of Halley's method.
template <Number V>
TW_INLINE SinCos<V> eckert_angle(const SinCos<V>& lat) {
  const V size = abs(lat.sin);
  const V v2 = kEckertTarget * square(lat.cos) / (1.0 + size);
  const V v = sqrt(v2);
  const V low = (0.9999958272630971 - v * 0.3329701621093007) +
                v2 * (0.31392119966294785 - v * 0.2783279831892125);
  const V high =
      (0.23180121770638304 - v * 0.14627337709492466) +
      v2 * ((0.06282167441143338 - v * 0.015860471498529413) + v2 * 0.0017874766964461792);
  const V s = v * (low + (v2 * v2) * high);
  const auto at = sincos(s);  // its sine is the cosine of t
  const V one_less = square(at.sin) / (1.0 + at.cos);
  const V pole_side = v2 - (s - at.sin * at.cos + 2.0 * one_less);
  const V t = (kHalfPi - s) + 0x1.1a62633145c07p-54;
  const V equator_side = t + at.cos * (at.sin + 2.0) - kEckertTarget * size;
  const V excess = select(s < 0.8, pole_side, equator_side);
  const V slope = 2.0 * at.sin * (1.0 + at.sin);
  const V newton = excess / slope;
  const V step = newton * (1.0 - newton * at.cos * (1.0 + 2.0 * at.sin) / slope);
  const V sine = at.cos - step * (at.sin + 0.5 * step * at.cos);
  const V cosine = at.sin + step * (at.cos - 0.5 * step * at.sin);
  return {copysign(sine, lat.sin), cosine};
}

struct EckertForward {
  double lon0, y0;
  double x_factor, y_factor;

  template <Number V>
  TW_INLINE Answer<V> place(V lon, V sine, V cosine) const {
    return {(cosine + 1.0) * (lon - lon0) * x_factor, sine * y_factor - y0};
  }
  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto t = eckert_angle(sincos(lat));
    auto answer = place(lon, t.sin, t.cos);
    answer.plain = abs(lat) <= kHalfPi - kEckertCloseToPole;
    return answer;
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct EckertInverse {
  double lon0, y0;
  double to_sine;  // sqrt(4 + pi) / (2 sqrt(pi))
  double x_factor;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V given = (y + y0) * to_sine;
    const V q = select(given < -1.0, -1.0, select(given > 1.0, 1.0, given));
    const V cosine = sqrt((1.0 - q) * (1.0 + q));
    const V sine = (q * cosine + 2.0 * q + asin(q)) * (1.0 / kEckertTarget);
    return {x_factor * x / (cosine + 1.0) + lon0, asin(sine)};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::EckertForward)
TIDEWATER_INSTANCE(tidewater::detail::EckertInverse)
