// Meridian arc of the ellipsoid of unit semi-major axis, and the latitude at an arc, by series.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), eq. 3-21,
// 3-26.
// By contract: the arc's terms in e^8 are not those of the full expansion.  On the earth's
// ellipsoids that makes up to 1.5e-10, a millimetre.
#pragma once

#include "formulas/constants.hpp"
#include "formulas/sine_series.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

// a0 p - a2 sin 2p + a4 sin 4p - a6 sin 6p + a8 sin 8p.
struct ArcCoefficients {
  double a0, a2, a4, a6, a8;

  static ArcCoefficients of(double e2) {
    const double e4 = e2 * e2;
    const double e6 = e2 * e4;
    const double e8 = e4 * e4;
    return {1 - e2 / 4 - 3 * e4 / 64 - 5 * e6 / 256 - 175 * e8 / 16384,
            0.375 * (e2 + e4 / 4 + 15 * e6 / 128 - 455 * e8 / 4096),
            0.05859375 * (e4 + 3 * e6 / 4 - 77 * e8 / 128),
            0.011393229166666666 * (e6 - 41 * e8 / 32), -315 * e8 / 131072};
  }
};

// The arc from the equator: c0 p + the sines.
struct ArcSeries {
  double c0;
  SineSeries<4> sines;

  static ArcSeries of(const ArcCoefficients& a) {
    return {a.a0, SineSeries<4>::of({-a.a2, a.a4, -a.a6, a.a8})};
  }
  static ArcSeries of(double e2) { return of(ArcCoefficients::of(e2)); }

  template <Number V>
  TW_INLINE V arc(V lat, const SinCos<V>& at) const {
    return c0 * lat + sines.sum(2.0 * at.cos * at.sin, square(at.cos) - square(at.sin));
  }

  template <Number V>
  TW_INLINE V arc(V lat) const {
    const auto twice = sincos(2.0 * lat);
    return c0 * lat + sines.sum(twice.sin, twice.cos);
  }
};

// Latitude at the rectifying latitude u: u + b2 sin 2u + b4 sin 4u + b6 sin 6u + b8 sin 8u.
struct FootCoefficients {
  double b2, b4, b6, b8;

  static FootCoefficients of(double e2) {
    const double root = sqrt(1 - e2);
    const double e1 = (1 - root) / (1 + root);
    const double e1_2 = e1 * e1;
    const double e1_3 = e1_2 * e1;
    const double e1_4 = e1_2 * e1_2;
    return {3 * e1 / 2 - 27 * e1_3 / 32, 21 * e1_2 / 16 - 55 * e1_4 / 32, 151 * e1_3 / 96,
            1097 * e1_4 / 512};
  }

  SineSeries<4> series() const { return SineSeries<4>::of({b2, b4, b6, b8}); }
};

// The same with the sine and cosine of the latitude.
template <class V>
struct FootLatitude {
  V lat;
  SinCos<V> at;
};

class FootSeries {
 public:
  explicit FootSeries(const SineSeries<4>& sines) : sines_(sines), small_(reach() < kSmall) {}

  template <Number V>
  TW_INLINE V latitude(V u) const {
    const auto at = sincos(u);
    return u + correction(at);
  }

  // The foot lies so near the rectifying latitude that sine and cosine are turned by the
  // difference, by its series.
  template <Number V>
  TW_INLINE FootLatitude<V> latitude_and_sines(V u) const {
    const auto at = sincos(u);
    const V d = correction(at);
    if (!small_) return {u + d, sincos(u + d)};
    const V q = d * d;
    const V sine = d * (1.0 - q * (1.0 / 6) * (1.0 - q * (1.0 / 20)));
    const V versine = q * (0.5 - q * (1.0 / 24) * (1.0 - q * (1.0 / 30)));
    return {
        u + d,
        {at.sin + (at.cos * sine - at.sin * versine), at.cos - (at.sin * sine + at.cos * versine)}};
  }

 private:
  static constexpr double kSmall = 0.01;  // to its seventh power beyond the last digit

  template <Number V>
  TW_INLINE V correction(const SinCos<V>& at) const {
    return sines_.sum(2.0 * at.sin * at.cos, (at.cos - at.sin) * (at.cos + at.sin));
  }

  // What the correction cannot exceed.
  double reach() const {
    const double* p = sines_.p;
    return abs(p[0]) + abs(p[1]) + abs(p[2]) + abs(p[3]);
  }

  SineSeries<4> sines_;
  bool small_;
};

}  // namespace tidewater::detail
