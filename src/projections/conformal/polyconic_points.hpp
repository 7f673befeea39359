// Formulas of the American polyconic projection of the ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 124-131.
#pragma once

#include "formulas/pole_hold.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Sines and cosines of the even multiples of a latitude, from its own.
template <class V>
struct EvenMultiples {
  V sin2, cos2, sin4, cos4, sin6, cos6;

  TW_INLINE explicit EvenMultiples(const SinCos<V>& at)
      : sin2(2.0 * at.sin * at.cos),
        cos2(square(at.cos) - square(at.sin)),
        sin4(2.0 * sin2 * cos2),
        cos4(square(cos2) - square(sin2)),
        sin6(sin4 * cos2 + cos4 * sin2),
        cos6(cos4 * cos2 - sin4 * sin2) {}
};

// The meridian arc to e^6 (Snyder 1987, eq. 3-21), a shorter series than that of the other
// projections, and its derivative by latitude.
class ShortArc {
 public:
  explicit ShortArc(double e2)
      : f0_(1 - ((e2 * 5 / 16 + 0.75) * e2 / 4 + 1) * e2 / 4),
        f2_(((1.40625 * e2 + 3) * e2 / 4 + 3) * e2 / 8),
        f4_((11.25 * e2 + 15) * square(e2) / 256),
        f6_(cube(e2) * 0.011393229166666666),
        g6_(cube(e2) * 0.068359375) {}

  template <Number V>
  TW_INLINE V arc(V lat, const EvenMultiples<V>& at) const {
    return f0_ * lat - f2_ * at.sin2 + f4_ * at.sin4 - f6_ * at.sin6;
  }

  template <Number V>
  TW_INLINE V derivative(const EvenMultiples<V>& at) const {
    return f0_ - (2 * f2_) * at.cos2 + (4 * f4_) * at.cos4 - g6_ * at.cos6;
  }

 private:
  double f0_, f2_, f4_, f6_, g6_;
};

struct PolyconicForward {
  double e2, lon0, m0;
  ShortArc meridian;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const V d = wrap_below_then_above(lon - lon0);
    const auto on_equator = abs(lat) < 1e-7;
    const auto at = sincos(lat);
    const V radius = at.cos * normal_radius(e2, at.sin) / at.sin;  // nu / tan lat
    // sin E and 1 - cos E of E = d sin lat by the half of it, without cancellation
    const auto half = sincos(0.5 * (at.sin * d));
    const V sine = half.sin * radius;
    return {select(on_equator, d, 2.0 * half.cos * sine),
            select(on_equator, -m0,
                   2.0 * half.sin * sine + (meridian.arc(lat, EvenMultiples<V>(at)) - m0))};
  }
};

class PolyconicInverse {
 public:
  PolyconicInverse(double e, double lon0, double m0)
      : e2_(e * e), lon0_(lon0), m0_(m0), meridian_(e * e) {}

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V A = y + m0_;
    const auto on_equator = abs(A) < 1e-6;
    const V start = select(on_equator, 1.0, A);
    const V B = square(x) + square(start);
    V before = start;  // the latitude before the last step
    V lat = start;
    V sin_lat = start;
    V C = start;
    Mask<V> moving = !on_equator;
    Mask<V> at_rest = on_equator;
    for (int pass = 0; pass < kFewPasses && any(moving); ++pass) {
      const Step<V> step = newton(lat, start, B);
      before = select(moving, lat, before);
      sin_lat = select(moving, step.sin_lat, sin_lat);
      C = select(moving, step.C, C);
      lat = select(moving, step.next, lat);
      const V change = abs(step.next - before);
      at_rest = at_rest | (moving & (change < kConverged));
      moving = moving & (change >= kConverged);  // ends on a not-a-number
      if (pass > kPassesBeforeCheck) moving = moving & (change <= kDiverged);
    }
    const V away = asin(x * C) / sin_lat;
    // By contract: the longitude belongs to the latitude before the last step.
    const V lon = select(at_pole(before), lon0_, away + lon0_);  // not wrapped
    return {select(on_equator, x + lon0_, lon), select(on_equator, 0.0, lat), at_rest};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

 private:
  static constexpr double kConverged = 1e-9;
  static constexpr double kDiverged = 5.0;
  static constexpr int kPassesBeforeCheck = 3;
  static constexpr int kMostPasses = 25;
  // Points that take longer go one by one.
  static constexpr int kFewPasses = 12;

  template <class V>
  struct Step {
    V next, sin_lat, C;
  };

  // Snyder 1987, eq. 18-18 to 18-21.
  template <Number V>
  TW_INLINE Step<V> newton(V lat, V A, V B) const {
    const auto sines = sincos(lat);
    const EvenMultiples<V> at(sines);
    // C = tan p sqrt(1 - e^2 sin^2 p)
    const V root = sqrt(1.0 - square(sines.sin) * e2_);
    const V C = sines.sin / sines.cos * root;
    const V Ma = meridian_.arc(lat, at);
    const V Mp = meridian_.derivative(at);
    const V V2 = square(Ma) + B;
    const V numerator = (C * Ma + 1.0) * A - Ma - V2 * C * 0.5;
    const V denominator =
        (V2 - 2.0 * Ma * A) * at.sin2 * e2_ / (4.0 * C) + (C * Mp - 2.0 / at.sin2) * (A - Ma) - Mp;
    return {lat - numerator / denominator, sines.sin, C};
  }

  template <Number V>
  TW_INLINE static Mask<V> at_pole(V lat) {
    return abs(abs(lat) - kHalfPi) < 1e-9;
  }

  double e2_, lon0_, m0_;
  ShortArc meridian_;
};

struct PolyconicScale {
  double e2, lon0, k0;
  ShortArc meridian;
  const CoordinateTriple* first;  // of the output

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V given) const {
    const auto plain = !((given > kHalfPi) | (given < -kHalfPi));
    const V lat = hold_off_poles(select(plain, given, 0.0), 1e-14);
    const V d = lon - lon0;
    const auto at = sincos(lat);
    const auto off_equator = abs(lat) >= 1e-14;
    const V s2 = square(at.sin);
    const V c2 = square(at.cos);
    const V v = s2 * e2;
    const V E = d * at.sin;
    const auto half = sincos(0.5 * E);
    const V versine = 2.0 * square(half.sin);  // 1 - cos E
    // Of the angle D only the cosine is needed.  Its tangent's terms stand as they are printed: by
    // contract it is 0 / 0 hard by the equator of a sphere.
    const V tangent =
        (E - 2.0 * half.sin * half.cos) / (1.0 / c2 - (1.0 - versine) - v / (1.0 - v));
    const V top = (1.0 - v) * versine * c2 / s2 + (1 - e2);
    const V off = top * sqrt(1.0 + square(tangent));
    const V on = meridian.derivative(EvenMultiples<V>(at)) + square(d) * 0.5;
    const V h = select(off_equator, off, on) * (1 / (1 - e2)) * k0;
    return {V(k0), h, h * k0, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::PolyconicForward)
TIDEWATER_INSTANCE(tidewater::detail::PolyconicInverse)
TIDEWATER_INSTANCE(tidewater::detail::PolyconicScale)
