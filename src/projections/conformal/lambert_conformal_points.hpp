// Formulas of the Lambert conformal conic projection of the ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 104-110. With t(p) = exp(-psi), psi the isometric latitude, rho = C t^n is C exp(-n psi).
#pragma once

#include "formulas/isometric_latitude.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

struct LambertForward {
  double e, lon0, C, n, rho0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto north = at_north_pole(lat);
    const auto south = at_south_pole(lat);
    const auto plain = !((lat > kHalfPi) | (lat < -kHalfPi) | north | south);
    const V psi = isometric_latitude(e, sincos(select(plain, lat, 0.0)));
    const V rho = exp(-n * psi) * C;
    const auto theta = sincos(wrap_above_then_at_or_below(lon - lon0) * n);
    return {rho * theta.sin, rho0 - rho * theta.cos, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

  template <Number V>
  TW_INLINE static Mask<V> at_north_pole(V lat) {
    return abs(lat - kHalfPi) < 1e-14;
  }
  template <Number V>
  TW_INLINE static Mask<V> at_south_pole(V lat) {
    return abs(lat + kHalfPi) < 1e-14;
  }
};

class LambertInverse {
 public:
  LambertInverse(double e, double lon0, double C, double n, double rho0)
      : e_(e),
        lon0_(lon0),
        C_(C),
        n_(n),
        rho0_(rho0),
        over_n_(1 / n),
        over_C2_(1 / (C * C)),
        // A pass of the contract's fixed point brings a latitude nearer by the factor e^2 / (1 -
        // e^2) at least, so that up to this eccentricity they come to rest within nine of the
        // fifteen: the series gives the same latitude, with the same word.
        covered_(abs(e) <= kSeriesEccentricity && (n < 0 ? C < 0 : C > 0)),
        latitude_(e) {}

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const double sign = n_ > 0 ? 1.0 : -1.0;
    const V from_apex = rho0_ - y;
    const V rho2 = square(x) + square(from_apex);
    const V w2 = rho2 * over_C2_;
    const Mask<V> plain =
        everywhere<V>(covered_) & (rho2 > kNearApex) & (w2 > 1e-290) & (w2 < 1e290);
    // (rho / C)^(1/n) = exp(-psi)
    const V psi = (-0.5 * over_n_) * log(select(plain, w2, 1.0));
    const V lat = latitude_.of_isometric(psi);
    const V lon = wrap_at_or_below_then_above(atan2(sign * x, sign * from_apex) * over_n_ + lon0_);
    return {select(at_pole(lat), lon0_, lon), lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

  // There the longitude is the central meridian as given, not wrapped.
  template <Number V>
  TW_INLINE static Mask<V> at_pole(V lat) {
    return abs(abs(lat) - kHalfPi) < 1e-13;
  }

 private:
  static constexpr double kNearApex = 1e-25;  // the contract has its limits at 1e-13 of rho

  double e_, lon0_, C_, n_, rho0_, over_n_, over_C2_;
  bool covered_;
  ConformalInverse latitude_;
};

struct LambertScale {
  double e, k0, C, n;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V /*lon*/, V given) const {
    const auto south = abs(given + kHalfPi) < kPoleMargin;
    Mask<V> plain = !((given > kHalfPi) | (given < -kHalfPi) | south);
    const V lat = select(abs(given - kHalfPi) < kPoleMargin, V(kHalfPi - kPoleMargin), given);
    const auto at = sincos(select(plain, lat, 0.0));
    const V m = parallel_radius(e * e, at.sin, at.cos);
    plain = plain & (abs(m) >= 1e-10);
    const V k = exp(-n * isometric_latitude(e, at)) * (n * k0 * C) / m;
    return {k, k, k * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

  static constexpr double kPoleMargin = 1e-10;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::LambertForward)
TIDEWATER_INSTANCE(tidewater::detail::LambertInverse)
TIDEWATER_INSTANCE(tidewater::detail::LambertScale)
