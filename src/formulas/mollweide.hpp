// Mollweide's projection, of the sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), p. 251:
// with 2 theta + sin 2 theta = pi sin phi.  Solved for z = pi - 2 theta, which keeps the digits
// that the latitude has at a pole: z - sin z = 2 pi sin^2(colatitude / 2).
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

struct Mollweide {
  static constexpr double kRoot2 = 1.4142135623730951;

  template <Number V>
  struct Planar {
    V x, y;
    Mask<V> plain;
  };

  // z - sin z for z from 0 to pi, of the sine and without its loss where z is small.
  template <Number V>
  TW_INLINE static V segment(V z, V sin_z) {
    const V q = z * z;
    const V series =
        z * q * (1.0 / 6) *
        (1.0 -
         q * (1.0 / 20) *
             (1.0 - q * (1.0 / 42) *
                        (1.0 - q * (1.0 / 72) *
                                   (1.0 - q * (1.0 / 110) *
                                              (1.0 - q * (1.0 / 156) *
                                                         (1.0 - q * (1.0 / 210) *
                                                                    (1.0 - q * (1.0 / 272))))))));
    return select(z < 1.0, series, z - sin_z);
  }

  // On the unit sphere; longitudes within half a turn of the central meridian.
  template <Number V>
  TW_INLINE Planar<V> forward(V lon, V lat) const {
    const Mask<V> plain = (abs(lat) <= kHalfPi) & (abs(lon) <= kPi * (1 + 1e-15));
    const V colatitude = select(plain, kHalfPi - abs(lat), 1.0);
    const V half = sincos(0.5 * colatitude).sin;
    const V w = 2 * kPi * (half * half);
    const auto away = w > 1e-300;
    // The cube root and its series, z = r + r^3 / 60 + r^5 / 1400 + ...
    const V r = select(away, exp(log(6.0 * select(away, w, 1.0)) * (1.0 / 3)), 0.0);
    const V r2 = r * r;
    V z = r * (1.0 + r2 * (1.0 / 60) * (1.0 + r2 * (3.0 / 70) * (1.0 + r2 * (1.0 / 18))));
    for (int i = 0; i < 4; ++i) {
      const auto at = sincos(z);
      const V sine = sincos(0.5 * z).sin;
      const V slope = 2.0 * (sine * sine);
      z = z - select(away, (segment(z, at.sin) - w) / select(away, slope, 1.0), 0.0);
    }
    const auto theta = sincos(0.5 * z);
    return {(2 * kRoot2 / kPi) * (lon * theta.sin), copysign(kRoot2 * theta.cos, lat), plain};
  }

  template <Number V>
  TW_INLINE Planar<V> inverse(V x, V y) const {
    const V t = abs(y) * (1 / kRoot2);
    const Mask<V> inner = t <= 1 + 1e-15;
    const V sine = sqrt(greater((1.0 - t) * (1.0 + t), V(0.0)));
    const V z = 2.0 * atan2(sine, t);
    const V w = segment(z, 2.0 * (sine * t));
    const V colatitude = 2.0 * asin(lesser(sqrt(select(inner, w, 0.0) * (0.5 / kPi)), V(1.0)));
    const auto open = sine > 0.0;
    const V lon = select(open, (kPi / (2 * kRoot2)) * x / select(open, sine, 1.0), 0.0);
    const Mask<V> plain = inner & (abs(lon) <= kPi * (1 + 1e-9)) & (open | (abs(x) < 1e-9));
    return {lesser(greater(lon, V(-kPi)), V(kPi)), copysign(kHalfPi - colatitude, y), plain};
  }
};

}  // namespace tidewater::detail
