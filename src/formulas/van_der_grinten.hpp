// Van der Grinten's first projection, of the sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 239-242; with u = tan(theta / 2), p = pi^2 - lambda^2 and q = 2 pi lambda for Snyder's A = p / q,
// all of whose differences then fall away, so that the equator, the central meridian and the poles
// are points like others.  The inverse solves the circle of the parallel by Newton's method.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

struct VanDerGrinten {
  template <Number V>
  struct Planar {
    V x, y;
    Mask<V> plain;
  };

  // On the unit sphere; longitudes within half a turn of the central meridian.
  template <Number V>
  TW_INLINE Planar<V> forward(V lon, V lat) const {
    const Mask<V> plain = (abs(lat) <= kHalfPi) & (abs(lon) <= kPi * (1 + 1e-15));
    // sin theta, and what it lacks of one
    const V sine = abs(lat) * (2 / kPi);
    const V rest = greater((kHalfPi - abs(lat)) * (2 / kPi), V(0.0));
    const V u = sine / (1.0 + sqrt(rest * (1.0 + sine)));
    const V l = abs(lon);
    const V p = greater((kPi - l) * (kPi + l), V(0.0));
    const V q = 2 * kPi * l;
    const V u2 = u * u;
    const V u3 = u2 * u;
    const V root1 = (1.0 - u) * (1.0 + u);
    const V w = root1 * root1 * (1.0 + u2);
    const V cube = 1.0 + u3;
    const V k = root1 * (1.0 + u2 - u2 * u2);
    const V inner = p * p * (k * k) + (q * q * (cube * cube) + 4.0 * (u2 * u2) * (p * p)) * w;
    const V x = q * w / (sqrt(inner) + p * k);
    const V root = sqrt(p * p * ((1.0 - u3) * (1.0 - u3)) + q * q * w);
    const V y = u * (4.0 * (p * p) * u + q * q * ((1.0 + u) * (1.0 + u))) /
                (cube * (2.0 * u * (p * p) + q * q * (1.0 + u)) + 2.0 * u * p * root);
    // Where the origin or the pole makes a quotient of zeros.
    const auto pole = u == 1.0;
    return {copysign(select(pole, 0.0, kPi * x), lon),
            copysign(kPi * select(pole, 1.0, select(u == 0.0, 0.0, y)), lat), plain};
  }

  // The parallel through the point is a circle about (0, (1 + u^3) / (2 u^2)) through (0, u), in
  // units of pi: Y u^3 - s u^2 - u + Y = 0 with s = X^2 + Y^2, falling from u = 0 to 1 and with its
  // root no higher than Y.
  template <Number V>
  TW_INLINE Planar<V> inverse(V x, V y) const {
    const V X = x * (1 / kPi);
    const V Y = abs(y) * (1 / kPi);
    const V s = X * X + Y * Y;
    const Mask<V> plain = s <= 1 + 1e-14;
    V u = lesser(select(plain, Y, 0.0), V(1.0));
    Mask<V> moving = u > 0.0;
    // Towards a pole the root becomes a double one, and every step halves what is left.
    for (int i = 0; i < 60; ++i) {
      const V value = ((Y * u - s) * u - 1.0) * u + Y;
      const V slope = (3.0 * Y * u - 2.0 * s) * u - 1.0;
      const auto falls = slope < 0.0;
      const V step = select(falls, value / select(falls, slope, 1.0), 0.0);
      const V next = lesser(greater(u - step, V(0.0)), V(1.0));
      moving = moving & (next != u);
      u = select(moving, next, u);
      moving = moving & (abs(step) > 1e-17);
      if (!any(moving)) break;
    }
    const V rest = (1.0 - u) * (1.0 - u) / (1.0 + u * u);  // 1 - sin theta
    const V sine = 2.0 * u / (1.0 + u * u);
    const V lat = select(u < 0.5, kHalfPi * sine, kHalfPi - kHalfPi * rest);
    const V X2 = X * X;
    const V down = 1.0 - Y;
    const V up = 1.0 + Y;
    const V width = sqrt((X2 + down * down) * (X2 + up * up)) + (1.0 - s);
    const auto open = width > 0.0;
    const V lon = select(open, 2 * kPi * X / select(open, width, 1.0), 0.0);
    return {lesser(greater(lon, V(-kPi)), V(kPi)), copysign(lat, y), plain};
  }
};

}  // namespace tidewater::detail
