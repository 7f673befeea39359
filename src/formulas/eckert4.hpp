// Eckert's fourth projection, of the sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 253-258: t + sin t cos t + 2 sin t = (2 + pi/2) sin phi.  Solved for s = pi/2 - t, which keeps
// the digits that the latitude has at a pole: s - sin s cos s + 2 (1 - cos s) = (4 + pi)
// sin^2(colatitude / 2).
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

struct Eckert4 {
  static constexpr double kFourPlusPi = 7.141592653589793;
  static constexpr double kX = 0.42223820031577125;  // 2 / sqrt(pi (4 + pi))
  static constexpr double kY = 1.3265004281770023;   // 2 sqrt(pi / (4 + pi))

  template <Number V>
  struct Planar {
    V x, y;
    Mask<V> plain;
  };

  // s - sin s cos s + 2 (1 - cos s), of s and the sine and cosine of s / 2.
  template <Number V>
  TW_INLINE static V area(V s, SinCos<V> half) {
    const V q = 4.0 * s * s;  // of 2 s
    const V series =
        s * q * (1.0 / 6) *
        (1.0 -
         q * (1.0 / 20) *
             (1.0 - q * (1.0 / 42) *
                        (1.0 - q * (1.0 / 72) *
                                   (1.0 - q * (1.0 / 110) *
                                              (1.0 - q * (1.0 / 156) * (1.0 - q * (1.0 / 210)))))));
    const V sine = 2.0 * half.sin * half.cos;
    const V cosine = (half.cos - half.sin) * (half.cos + half.sin);
    return select(s < 0.5, series, s - sine * cosine) + 4.0 * (half.sin * half.sin);
  }

  // On the unit sphere; longitudes within half a turn of the central meridian.
  template <Number V>
  TW_INLINE Planar<V> forward(V lon, V lat) const {
    const Mask<V> plain = (abs(lat) <= kHalfPi) & (abs(lon) <= kPi * (1 + 1e-15));
    const V colatitude = select(plain, kHalfPi - abs(lat), 1.0);
    const V half = sincos(0.5 * colatitude).sin;
    const V w = kFourPlusPi * (half * half);
    const V v = sqrt(w);
    // Within 7e-4 of the root, from which Newton's method doubles the digits.
    V s =
        v * (0.9989888522912543 +
             v * (-0.31424078832964214 +
                  v * (0.2244699881316656 + v * (-0.09085425414470982 + v * 0.01866115580488002))));
    const auto away = v > 0.0;
    for (int i = 0; i < 3; ++i) {
      const auto at = sincos(0.5 * s);
      const V sine = 2.0 * at.sin * at.cos;
      const V slope = 2.0 * sine * (1.0 + sine);
      s = s - select(away, (area(s, at) - w) / select(away, slope, 1.0), 0.0);
    }
    const auto at = sincos(s);
    return {kX * lon * (1.0 + at.sin), copysign(kY * at.cos, lat), plain};
  }

  template <Number V>
  TW_INLINE Planar<V> inverse(V x, V y) const {
    const V t = abs(y) * (1 / kY);
    const Mask<V> inner = t <= 1 + 1e-15;
    const V sine = sqrt(greater((1.0 - t) * (1.0 + t), V(0.0)));
    const V s = atan2(sine, t);
    const V w = area(s, sincos(0.5 * s));
    const V colatitude =
        2.0 * asin(lesser(sqrt(select(inner, w, 0.0) * (1 / kFourPlusPi)), V(1.0)));
    const V lon = x * (1 / kX) / (1.0 + sine);
    const Mask<V> plain = inner & (abs(lon) <= kPi * (1 + 1e-9));
    return {lesser(greater(lon, V(-kPi)), V(kPi)), copysign(kHalfPi - colatitude, y), plain};
  }
};

}  // namespace tidewater::detail
