// Formulas of the Mollweide projection of the unit sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 249-252, eq. 31-1 to 31-8.
#pragma once

#include <numbers>

#include "formulas/constants.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

inline constexpr double kMollweideX = std::numbers::sqrt2 * 2 / kPi;

// The cube root of a number from 1e-280 on, within 1e-9 of it: a start from the exponent's third
// part within a tenth, two steps that need no division.
template <Number V>
TW_INLINE V rough_cube_root(V a) {
  const V high = number(shift_right(bits(a), 32) + Bits<V>(int64_t{0x4338000000000000})) - 0x1.8p52;
  const V third = nearest_whole(1430185907.5584 - high * (1.0 / 3));
  const V start = number(shift_left(bits(third + 0x1.8p52), 32));  // of 1 / cube root
  const V h = 1.0 - a * cube(start);
  const V near = start + start * h * (1.0 / 3 + h * (2.0 / 9 + h * (14.0 / 81)));
  const V nearer = near + near * (1.0 - a * cube(near)) * (1.0 / 3);
  return a * square(nearer);
}

// Sine and cosine of half the root t of t + sin t = pi sin p, which is all that is needed of it.
//
// From the pole, s = pi - t is the root of s - sin s = m with m = pi (1 - sin |p|): a series in the
// cube root of 6 m, here a polynomial within 6e-7 of it, is put right by one step of Halley's
// method.  The difference that the step works off is formed so that no digits cancel: from the pole
// by the sine's series, from the equator as it is printed.  The stated iteration, Newton's from t =
// p, ends within rounding of the same root; towards the poles its derivative goes to zero, and what
// rounding leaves it is up to 1e-5.
template <Number V>
TW_INLINE SinCos<V> mollweide_half_angle(V lat) {
  const auto at = sincos(lat);
  const V size = abs(at.sin);
  const V m = select(abs(lat) == kHalfPi, 0.0, kPi * square(at.cos) / (1.0 + size));
  const V w = rough_cube_root(greater(6.0 * m, V(1e-280)));
  const V z = w * w;
  const V z2 = z * z;
  const V low = (0.9999997627218405 + z * 0.016670935391474948) +
                z2 * (0.000701915369331451 + z * 5.305030781413615e-05);
  const V high = (-4.401295858023565e-06 + z * 2.0158921742190404e-06) +
                 z2 * (-2.4082034282837385e-07 + z * 1.5506470223983944e-08);
  const V s = w * (low + (z2 * z2) * high);
  const V t = kPi - s;
  const auto half = sincos(0.5 * t);
  const V sin_t = 2.0 * half.sin * half.cos;
  const V slope = 2.0 * square(half.cos);  // 1 + cos t
  // s - sin s for s up to 0.9
  const V q = s * s;
  const V odd =
      (1.0 / 6 - q * (1.0 / 120)) +
      (q * q) *
          ((1.0 / 5040 - q * (1.0 / 362880)) +
           (q * q) * ((1.0 / 39916800 - q * (1.0 / 6227020800)) + (q * q) * (1.0 / 1307674368000)));
  const V excess = select(s < 0.9, m - s * q * odd, t + sin_t - kPi * size);
  const V newton = excess / greater(slope, V(1e-300));
  const V step = newton / (1.0 + 0.5 * newton * sin_t / greater(slope, V(1e-300)));
  const V half_step = select(m == 0.0, 0.0, -0.5 * step);
  const V sine = half.sin + half_step * (half.cos - 0.5 * half_step * half.sin);
  const V cosine = half.cos - half_step * (half.sin + 0.5 * half_step * half.cos);
  return {copysign(sine, at.sin), cosine};
}

struct MollweideForward {
  double lon0, y0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto theta = mollweide_half_angle(lat);
    return {theta.cos * kMollweideX * (lon - lon0), theta.sin * std::numbers::sqrt2 - y0};
  }
};

struct MollweideInverse {
  double lon0, y0;

  template <class V>
  struct Position {
    V q, lon, r;
  };
  template <Number V>
  TW_INLINE Position<V> position(V x, V y) const {
    const V q = (y + y0) * (1 / std::numbers::sqrt2);
    const V theta = asin(q);
    // At a pole it is that of the double nearest to it.
    const V cosine = greater(sqrt((1.0 - q) * (1.0 + q)), V(0x1.1a62633145c07p-54));
    const V lon = x * (kPi / (std::numbers::sqrt2 * 2)) / cosine + lon0;
    return {q, lon, (2.0 * q * cosine + 2.0 * theta) * (1 / kPi)};
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto at = position(x, y);
    return {at.lon, asin(at.r), !((abs(at.q) > 1.0) | (abs(at.r) > 1.0))};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::MollweideForward)
TIDEWATER_INSTANCE(tidewater::detail::MollweideInverse)
