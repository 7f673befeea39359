// Gauss's conformal mapping of the ellipsoid onto a sphere, by way of two Mercator planes.
// IOGP Publication 373-7-2, Geomatics Guidance Note 7, part 2 (2022), method 9809;
// formulas/gauss_sphere.hpp has the direct form.
#pragma once

#include "formulas/gauss_sphere.hpp"
#include "formulas/pole_hold.hpp"
#include "formulas/radii.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

struct GaussForward {
  GaussSphere sphere;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto mapped = !(abs(lat) > kGaussForwardLatLimit);
    const V chi = sphere.forward_latitude(sincos(select(mapped, lat, 0.0)));
    return {select(mapped, sphere.forward_longitude(lon), lon - sphere.lon0),
            select(mapped, chi, lat)};
  }
};

struct GaussInverse {
  GaussSphere sphere;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V chi) const {
    const auto mapped = !(abs(chi) > kGaussInverseLatLimit);
    const V lat = sphere.inverse_latitude(sincos(select(mapped, chi, 0.0)));
    return {select(mapped, sphere.inverse_longitude(lon), lon + sphere.lon0),
            select(mapped, lat, chi)};
  }
};

// Both ways where the ellipsoid is a sphere.
struct GaussShift {
  double shift;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    return {lon + shift, lat};
  }
};

// Scale at the point chi of the sphere, with the latitude beside it.
struct GaussScale {
  double e2, k0, factor;  // factor = k0 R c

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V chi, V lat) const {
    const auto plain = !((lat > kHalfPi) | (lat < -kHalfPi));
    const auto at = sincos(hold_off_poles(select(plain, lat, 0.0), 1e-14));
    const V cos_chi = sincos(chi).cos;
    return {lon, chi, cos_chi * factor / parallel_radius(e2, at.sin, at.cos), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// The step between the two planes.
struct GaussPlaneForward {
  double c, t;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    return {c * x, (y + t) * c};
  }
};

struct GaussPlaneInverse {
  double c, t;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    return {x / c, y / c - t};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::GaussForward)
TIDEWATER_INSTANCE(tidewater::detail::GaussInverse)
TIDEWATER_INSTANCE(tidewater::detail::GaussShift)
TIDEWATER_INSTANCE(tidewater::detail::GaussScale)
TIDEWATER_INSTANCE(tidewater::detail::GaussPlaneForward)
TIDEWATER_INSTANCE(tidewater::detail::GaussPlaneInverse)
