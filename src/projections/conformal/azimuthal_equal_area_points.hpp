// Formulas of the Lambert azimuthal equal-area projection of the unit sphere and ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 182-190, eq. 24-2 to 24-32.
#pragma once

#include "formulas/authalic_latitude.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// A point this close to the antipode of the origin is moved off it by as much.
inline constexpr double kAntipodeStep = 1e-7;
// Where 1 and the cosine of the distance from the origin sum to less than this, nearly all their
// digits cancel.
inline constexpr double kNearAntipode = 1e-6;
// So close to a pole, the last digit of q decides what the contract says of a point.
inline constexpr double kAuthalicPole = kHalfPi - 1e-6;

// The oblique and equatorial aspects.  Sphere and ellipsoid differ in what the members hold: on the
// sphere the authalic latitude is the latitude, Rq and D are 1.
struct EqualAreaForward {
  bool sphere;
  double e, e2, lon0, lat0, over_qp;
  double sin1, cos1;        // of the authalic latitude of the origin
  double x_scale, y_scale;  // Rq D and Rq / D

  // The sum 1 + cosine of the distance, and the place, of a point on the authalic sphere.
  template <Number V>
  TW_INLINE V sum(V cos_d, V s, V c) const {
    return c * cos1 * cos_d + s * sin1 + 1.0;
  }
  template <Number V>
  TW_INLINE Answer<V> place(const SinCos<V>& d, V s, V c) const {
    const V b = sqrt(2.0 / sum(d.cos, s, c));
    return {x_scale * (b * c * d.sin), y_scale * (b * (s * cos1 - c * d.cos * sin1))};
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const V d = lon - lon0;
    const auto at_d = sincos(d);
    const auto p = sincos(lat);
    Mask<V> plain = !((abs(lat + lat0) < kAntipodeStep) & (abs(abs(d) - kPi) < kAntipodeStep));
    V s = p.sin;
    V c = p.cos;
    if (!sphere) {
      s = authalic_q(e, p.sin) * over_qp;
      c = sqrt((1.0 - s) * (1.0 + s));
      plain = plain & !(abs(lat) > kAuthalicPole) & !(abs(s) > 1.0) &
              !(sum(at_d.cos, s, c) < kNearAntipode);
    }
    auto answer = place(at_d, s, c);
    answer.plain = plain;
    return answer;
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct EqualAreaPolarForward {
  bool sphere;
  double e, e2, lon0, lat0, qp;
  double side;  // 1 in the north, -1 in the south

  template <Number V>
  TW_INLINE Answer<V> place(V lon, V r) const {
    const auto d = sincos(lon - lon0);
    return {r * d.sin, -side * r * d.cos};
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    Mask<V> plain = !(abs(lat + lat0) < kAntipodeStep);
    V r;
    if (sphere) {
      const auto w = sincos(kQuarterPi - 0.5 * lat);
      r = 2.0 * (side > 0 ? w.sin : w.cos);
    } else {
      plain = plain & !(abs(lat) > kAuthalicPole);
      r = sqrt(qp - side * authalic_q(e, sincos(lat).sin));
    }
    auto answer = place(lon, r);
    answer.plain = plain;
    return answer;
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// What the inverse functions of both aspects share.
struct EqualAreaOrigin {
  double e, e2, lon0, lat0, qp, rq, sin_b1, cos_b1, sin_lat0, cos_lat0, D;
  bool polar;
};

// With u = sin(ce / 2), sin ce / rho and cos ce follow without the angle.
struct EqualAreaInverse {
  EqualAreaOrigin origin;
  bool series;  // the authalic series serves e and the qp given
  double D, over_rq, sin1, cos1;
  AuthalicInverse inverse;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V along_x = x * (1.0 / D);
    const V along_y = y * D;
    const V u2 = (along_x * along_x + along_y * along_y) * (0.25 * over_rq * over_rq);
    const V k = sqrt(1.0 - u2) * over_rq;
    const V cosine = 1.0 - 2.0 * u2;
    const V s = k * along_y * cos1 + cosine * sin1;
    const V a = k * along_x;
    const V b = cosine * cos1 - k * along_y * sin1;
    const V c = sqrt(a * a + b * b);
    const V lat = inverse.of_authalic(atan2(s, c), s, c);
    const V lon = wrap_above_then_at_or_below(atan2(a, b) + origin.lon0);
    // By contract: on the sphere the plane's origin is lat0 as it stands.
    const auto centre = everywhere<V>(origin.e == 0) & (u2 == 0.0);
    const Mask<V> plain = everywhere<V>(series) & (u2 <= 1.0) & (abs(lat) <= kHalfPi) & !centre;
    return {lon, lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct EqualAreaPolarInverse {
  EqualAreaOrigin origin;
  bool sphere, series;
  double over_qp, side;
  AuthalicInverse inverse;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V w = (x * x + y * y) * over_qp;
    V s = 1.0 - w;
    // By contract: on the ellipsoid without its sign, so that a point past the equator comes out
    // mirrored in it.
    if (!sphere) s = abs(s);
    const V c = sqrt(w * (2.0 - w));
    const V lat = side * inverse.of_authalic(atan2(s, c), s, c);
    const V lon = wrap_above_then_at_or_below(atan2(x, -side * y) + origin.lon0);
    const Mask<V> plain =
        everywhere<V>(series) & (w <= 2.0) & !(everywhere<V>(sphere) & (w == 0.0));
    return {lon, lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// By contract: in the form of the sphere, also on the ellipsoid, but for a polar origin of it.
struct EqualAreaScale {
  bool sphere, polar;
  double e, e2, lon0, qp, k0;
  double sin_lat0, cos_lat0;
  double side;

  template <Number V>
  TW_INLINE Answer3<V> triple(V k) const {
    const V h = 1.0 / k;
    return {k * k0, h * k0, h * k * (k0 * k0)};
  }

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    if (!polar) {
      const auto p = sincos(lat);
      const V cosine = cos_lat0 * sincos(lon - lon0).cos * p.cos + sin_lat0 * p.sin;
      return triple(sqrt(2.0 / (cosine + 1.0)));
    }
    if (sphere) {
      const auto w = sincos(kQuarterPi - 0.5 * lat);
      return triple(1.0 / (side > 0 ? w.cos : w.sin));
    }
    const auto p = sincos(lat);
    const V r = sqrt(qp - side * authalic_q(e, p.sin));
    auto answer = triple(r / parallel_radius(e2, p.sin, p.cos));
    answer.plain = !(abs(lat) > kAuthalicPole);
    return answer;
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::EqualAreaForward)
TIDEWATER_INSTANCE(tidewater::detail::EqualAreaPolarForward)
TIDEWATER_INSTANCE(tidewater::detail::EqualAreaInverse)
TIDEWATER_INSTANCE(tidewater::detail::EqualAreaPolarInverse)
TIDEWATER_INSTANCE(tidewater::detail::EqualAreaScale)
