// Gauss's conformal mapping of the ellipsoid onto a sphere, by isometric latitudes.
// C. F. Gauss, Untersuchungen ueber Gegenstaende der hoehern Geodaesie (1844); the latitude of the
// sphere from its isometric latitude: J. P. Snyder, Map Projections: A Working Manual, USGS
// Professional Paper 1395 (1987), eq. 7-4.
#pragma once

#include "formulas/isometric_latitude.hpp"
#include "formulas/wraps.hpp"

namespace tidewater::detail {

// The value of c that says that ellipsoid and sphere are one.
inline constexpr double kGaussSphereMark = -1.0;

// Beyond these the pole maps onto itself.  By contract: forward and inverse draw the line
// differently.
inline constexpr double kGaussForwardLatLimit = kHalfPi - 1e-12;
inline constexpr double kGaussInverseLatLimit = kHalfPi - 1e-13;

// The latitude of the sphere whose isometric latitude is psi = atanh(sin chi).
template <Number V>
TW_INLINE V sphere_latitude(V psi) {
  return copysign(kHalfPi - 2.0 * octant_angle(exp(-abs(psi)), V(1.0)), psi);
}

// psi = atanh(sin chi) of a latitude of the sphere.
template <Number V>
TW_INLINE V sphere_isometric(const SinCos<V>& chi) {
  return copysign(log_ratio(1.0 + abs(chi.sin), chi.cos), chi.sin);
}

// The mapping on an ellipsoid of eccentricity e, for c above 0: psi of the sphere is c (psi of the
// ellipsoid + t), longitudes from lon0 are multiplied by c.
struct GaussSphere {
  double e, lon0, c, t, over_c;
  ConformalInverse inverse;

  GaussSphere(double eccentricity, double origin, double ratio, double shift)
      : e(eccentricity),
        lon0(origin),
        c(ratio),
        t(shift),
        over_c(1 / ratio),
        inverse(eccentricity) {}

  // Latitudes up to kGaussForwardLatLimit.
  template <Number V>
  TW_INLINE V forward_latitude(const SinCos<V>& lat) const {
    return sphere_latitude((isometric_latitude(e, lat) + t) * c);
  }
  // By contract: wrapped as TWmerc_f does it, then, after the change of ratio, as TWmerc_i does.
  template <Number V>
  TW_INLINE V forward_longitude(V lon) const {
    return wrap_at_or_below_then_above(c * wrap_above_then_below(lon - lon0));
  }

  // Latitudes of the sphere up to kGaussInverseLatLimit.
  template <Number V>
  TW_INLINE V inverse_latitude(const SinCos<V>& chi) const {
    return inverse.of_isometric(sphere_isometric(chi) * over_c - t);
  }
  template <Number V>
  TW_INLINE V inverse_longitude(V lon) const {
    return wrap_at_or_below_then_above(wrap_above_then_below(lon) * over_c + lon0);
  }
};

}  // namespace tidewater::detail
