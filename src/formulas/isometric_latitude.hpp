// Isometric and conformal latitude of the ellipsoid, both ways.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 15-16;
// the series back to the geodetic latitude in the third flattening: C. F. F. Karney, Transverse
// Mercator with an accuracy of a few nanometers, Journal of Geodesy 85 (2011), 475-485, and
// L. Krueger, Konforme Abbildung des Erdellipsoids in der Ebene (1912).
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

// e atanh(e sin p): how the ellipsoid's isometric latitude falls short of the sphere's.
template <Number V>
TW_INLINE V eccentric_term(double e, V sin_lat) {
  const V x = e * sin_lat;
  if (abs(e) <= kSeriesEccentricity) {
    const V q = x * x;
    const V q2 = q * q;
    const V high = (1.0 / 9 + q * (1.0 / 11)) + q2 * (1.0 / 13 + q * (1.0 / 15));
    return e * x * ((1.0 + q * (1.0 / 3)) + q2 * ((1.0 / 5 + q * (1.0 / 7)) + q2 * high));
  }
  return e * atanh(x);
}

// exp(-d) for d = eccentric_term(e, ...).
template <Number V>
TW_INLINE V eccentric_decay(double e, V d) {
  if (abs(e) <= kSeriesEccentricity) {  // then d is at most 0.0101
    const V d2 = d * d;
    return (1.0 - d) + d2 * ((1.0 / 2 - d * (1.0 / 6)) +
                             d2 * ((1.0 / 24 - d * (1.0 / 120)) + d2 * (1.0 / 720)));
  }
  return exp(-d);
}

// ((1 - e sin p) / (1 + e sin p))^(e/2) = exp(-e atanh(e sin p)).
template <Number V>
TW_INLINE V eccentric_factor(double e, V sin_lat) {
  return eccentric_decay(e, eccentric_term(e, sin_lat));
}

// ln(tan(p/2 + pi/4) ((1 - e sin p) / (1 + e sin p))^(e/2)), the Mercator ordinate of latitude p.
template <Number V>
TW_INLINE V isometric_latitude(double e, const SinCos<V>& lat) {
  const V sphere = log_ratio(1.0 + abs(lat.sin), lat.cos);
  return copysign(sphere, lat.sin) - eccentric_term(e, lat.sin);
}

// t(p) = tan(pi/4 - p/2) / ((1 - e sin p) / (1 + e sin p))^(e/2) = exp(-isometric latitude), as the
// quotient of two sides: half the conformal colatitude is the angle between them.
template <class V>
struct ColatitudeSides {
  V opposite, adjacent;
};
template <Number V>
TW_INLINE ColatitudeSides<V> colatitude_sides(double e, const SinCos<V>& lat) {
  const auto south = lat.sin < 0.0;
  return {select(south, 1.0 - lat.sin, lat.cos),
          select(south, lat.cos, 1.0 + lat.sin) * eccentric_factor(e, lat.sin)};
}
template <Number V>
TW_INLINE V colatitude_tangent(double e, const SinCos<V>& lat) {
  const auto sides = colatitude_sides(e, lat);
  return sides.opposite / sides.adjacent;
}

// From isometric latitude, or t = exp(-isometric latitude), back to the geodetic latitude.
//
// Up to e = 0.1 the series of the conformal latitude's sine multiples, six terms in the third
// flattening, within 4.4e-16 radians of where the fixed point rests; beyond, Newton's method.
class ConformalInverse {
 public:
  explicit ConformalInverse(double e) : e_(e), series_(abs(e) <= kSeriesEccentricity) {
    const double root = sqrt(1 - e * e);
    const double n = (1 - root) / (1 + root);
    const double n2 = n * n;
    const double n3 = n2 * n;
    c_[0] =
        n *
        (2 + n * (-2.0 / 3 + n * (-2 + n * (116.0 / 45 + n * (26.0 / 45 + n * (-2854.0 / 675))))));
    c_[1] = n2 * (7.0 / 3 +
                  n * (-8.0 / 5 + n * (-227.0 / 45 + n * (2704.0 / 315 + n * (2323.0 / 945)))));
    c_[2] = n3 * (56.0 / 15 + n * (-136.0 / 35 + n * (-1262.0 / 105 + n * (73814.0 / 2835))));
    c_[3] = n2 * n2 * (4279.0 / 630 + n * (-332.0 / 35 + n * (-399572.0 / 14175)));
    c_[4] = n2 * n3 * (4174.0 / 315 + n * (-144838.0 / 6237));
    c_[5] = n3 * n3 * (601676.0 / 22275);
  }

  // Latitude whose t(p) is t.
  template <Number V>
  TW_INLINE V of_tangent(V t) const {
    // The south mirrors the north, so that t is at most 1 and never overflows.
    const auto south = t > 1.0;
    const V tangent = select(south, 1.0 / t, t);
    const V lat = northern(tangent);
    return select(south, -lat, lat);
  }

  // Latitude whose isometric latitude is psi.
  template <Number V>
  TW_INLINE V of_isometric(V psi) const {
    const V lat = northern(exp(-abs(psi)));
    return copysign(lat, psi);
  }

  // Geodetic latitude of a conformal latitude chi, given with its sine and cosine.
  template <Number V>
  TW_INLINE V of_conformal(V chi, V sin_chi, V cos_chi) const {
    const V sin2 = 2.0 * sin_chi * cos_chi;
    const V cos2 = (cos_chi - sin_chi) * (cos_chi + sin_chi);
    return chi + clenshaw(sin2, cos2);
  }

 private:
  // For t(p) from 0 to 1.
  template <Number V>
  TW_INLINE V northern(V t) const {
    if (series_) {
      const V q = t * t;
      const V inverse = 1.0 / (1.0 + q);
      return of_conformal(kHalfPi - 2.0 * octant_angle(t, V(1.0)), (1.0 - q) * inverse,
                          2.0 * t * inverse);
    }
    return by_newton(t);
  }

  // sum of c_k sin 2 k chi.
  template <Number V>
  TW_INLINE V clenshaw(V sin2, V cos2) const {
    const V u = 2.0 * cos2;
    const V b6 = c_[5];
    const V b5 = c_[4] + u * b6;
    const V b4 = (c_[3] + u * b5) - b6;
    const V b3 = (c_[2] + u * b4) - b5;
    const V b2 = (c_[1] + u * b3) - b4;
    const V b1 = (c_[0] + u * b2) - b3;
    return sin2 * b1;
  }

  // With T = tan(pi/4 - p/2) = exp(-v), the fixed point of the latitude is v = y + e atanh(e tanh
  // v).  Newton's method on d = v - y needs neither logarithm nor sine.
  template <Number V>
  TW_INLINE V by_newton(V t) const {
    const double e2 = e_ * e_;
    V tangent = t;
    V d = 0.0;
    auto moving = everywhere<V>(true);
    // What a step leaves is of the order of its square.  Eleven passes serve up to e = 0.999999;
    // from 1 - 1e-10 on rounding alone may keep the steps up.
    for (int passes = 0; passes < 100 && any(moving); ++passes) {
      const V q = tangent * tangent;
      const V sin_lat = (1.0 - q) / (1.0 + q);
      const V cos2 = 4.0 * q / square(1.0 + q);
      const V step =
          (d - eccentric_term(e_, sin_lat)) / (1.0 - e2 * cos2 / (1.0 - e2 * square(sin_lat)));
      d = select(moving, d - step, d);
      tangent = select(moving, t * eccentric_decay(e_, d), tangent);
      moving = moving & (abs(step) > 1e-9);
    }
    return kHalfPi - 2.0 * atan(tangent);
  }

  double e_;
  bool series_;
  double c_[6];
};

}  // namespace tidewater::detail
