// Formulas of the Albers equal-area conic projection of the ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 98-103.
#pragma once

#include "formulas/authalic_latitude.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// rho = sqrt(C - n q) / n, the distance from the cone's apex.
template <Number V>
TW_INLINE V albers_rho(double e, double C, double n, V sin_lat) {
  return sqrt(C - authalic_q(e, sin_lat) * n) * (1 / n);
}

struct AlbersForward {
  double e, lon0, n, C, rho0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto plain = !(abs(lat) > kHalfPi);
    const auto theta = sincos(wrap_turns_below_then_above(lon - lon0) * n);
    const V rho = albers_rho(e, C, n, sincos(select(plain, lat, 0.0)).sin);
    return {theta.sin * rho, rho0 - theta.cos * rho, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// Of small eccentricity and away from the poles the contract's Newton steps converge within six,
// without coming near a pole, and end below 1e-13 without a word: the authalic latitude's series
// gives the same latitude.
class AlbersInverse {
 public:
  AlbersInverse(double e, double lon0, double n, double C, double rho0)
      : e_(e),
        lon0_(lon0),
        n_(n),
        C_(C),
        rho0_(rho0),
        sphere_(e <= kSphereEccentricity),
        series_(kLogarithmEccentricity <= e && e <= kSeriesEccentricity),
        latitude_(e) {}

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const double sign = n_ < 0 ? -1.0 : 1.0;
    const V from_apex = rho0_ - y;
    const V rho2 = square(x) + square(from_apex);
    const V d = atan2(sign * x, sign * from_apex) / n_;
    const V q = (C_ - rho2 * (n_ * n_)) * (1 / n_);
    const auto in_fan = abs(d) <= kPi;
    Mask<V> plain = (rho2 > 1e-290) & in_fan;
    V lat;
    if (sphere_) {
      const auto in_range = abs(q) <= 2.0;
      plain = plain & in_range;
      lat = hold_at_poles_of_sphere(asin(select(plain, q, 0.0) * 0.5));
    } else {
      const auto away = abs(q) < kAwayFromPole * latitude_.q_of_pole();
      const auto served = everywhere<V>(series_);
      plain = plain & served & away;
      lat = latitude_.of_q(select(plain, q, 0.0));
    }
    return {d + lon0_, lat, plain};  // not wrapped
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

  static constexpr double kSphereEccentricity = 1e-13;

  template <Number V>
  TW_INLINE static V hold_at_poles_of_sphere(V lat) {
    constexpr double kTolerance = 4.0000000000000003e-07;
    lat = select(abs(lat - kHalfPi) < kTolerance, V(kHalfPi), lat);
    return select(abs(lat + kHalfPi) < kTolerance, V(-kHalfPi), lat);
  }

 private:
  // Up to 2.5 degrees from a pole: the rounding of a Newton step is 1e-14 there.
  static constexpr double kAwayFromPole = 0.999;

  double e_, lon0_, n_, C_, rho0_;
  bool sphere_, series_;
  AuthalicInverse latitude_;
};

struct AlbersScale {
  double e, k0, C, n;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V /*lon*/, V lat) const {
    const auto plain = !((lat > kHalfPi) | (lat < -kHalfPi));
    const auto at = sincos(select(plain, lat, 0.0));
    const V rho_n = sqrt(C - authalic_q(e, at.sin) * n);
    const V m = parallel_radius(e * e, at.sin, at.cos);
    const auto polar = everywhere<V>(abs(n) > 0.9999999999999);
    const auto close = abs(rho_n / n) < 1e-5;
    const auto at_apex = polar & close;
    // By contract: -1 marks a pole without a scale.
    const V away = select(abs(m) >= 1e-13, rho_n / m, -1.0);
    const V k = select(at_apex, 1.0, away);
    const V h = select(k < 0.0, 0.0, 1.0 / k);
    return {k * k0, h * k0, h * k * (k0 * k0), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::AlbersForward)
TIDEWATER_INSTANCE(tidewater::detail::AlbersInverse)
TIDEWATER_INSTANCE(tidewater::detail::AlbersScale)
