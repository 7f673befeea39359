// Transverse Mercator of the ellipsoid by Krueger's series to n^8.
// L. Krueger, Konforme Abbildung des Erdellipsoids in der Ebene, Veroeffentlichung des Koeniglich
// Preussischen Geodaetischen Instituts 52 (1912); arranged after C. F. F. Karney, Transverse
// Mercator with an accuracy of a few nanometers, Journal of Geodesy 85 (2011), pp. 475-485, eqs
// 7-28; coefficients by scripts/series/latitudes.py (the conformal and the rectifying latitude into
// each other, at complex arguments).
#pragma once

#include <cmath>

#include "formulas/latitudes.hpp"

namespace tidewater::points {

template <class V>
struct PlanePoint {
  V x, y;
};

// Scale relative to that on the central meridian and convergence: the bearing of grid north,
// clockwise from true north, in radians.
template <class V>
struct ScaleAndConvergence {
  V scale, convergence;
};

struct TransverseMercator {
  // Farther from the central meridian than this, on the transverse sphere in radians, the series
  // lose their digits: 3,900 km are 0.6113.
  static constexpr double kLargestEasting = 0.6125;
  static constexpr double kLargestFlattening = 0.01;

  double radius;         // of the rectifying sphere times the scale on the central meridian
  double central_scale;  // k0 radius of the sphere through the equator's curvature
  double e2;
  double sinh_limit;
  double eccentric[9];  // e artanh(e s) = s sum of eccentric[j] s^(2 j)
  double alpha[8], beta[8];
  LatitudeSeries to_geodetic;
  double a_k0;

  TransverseMercator(double a, double f, double k0)
      : radius(k0 * rectifying_radius(a, f)),
        central_scale(k0),
        e2(f * (2 - f)),
        sinh_limit(std::sinh(kLargestEasting)),
        to_geodetic(kGeodeticFromConformal, third_flattening(f)),
        a_k0(a * k0) {
    const LatitudeSeries forward(kRectifyingFromConformal, third_flattening(f));
    const LatitudeSeries inverse(kConformalFromRectifying, third_flattening(f));
    double power = 1;
    for (int j = 0; j < 9; ++j) {
      power *= e2;
      eccentric[j] = power / (2 * j + 1);
    }
    for (int j = 0; j < 8; ++j) {
      alpha[j] = forward.c[j];
      beta[j] = inverse.c[j];
    }
  }

  template <class V>
  struct Forward {
    PlanePoint<V> point;
    ScaleAndConvergence<V> distortion;  // left at zero unless asked for
    decltype(V() < V()) plain;          // within the series' reach
  };

  // lon from the central meridian.  y counts from the equator.
  template <bool Distortion, class V>
  TW_INLINE Forward<V> forward(V lon, V lat) const {
    const auto phi = sincos(lat);
    const auto lambda = sincos(lon);
    // The conformal latitude's sine and cosine times one factor: its sine is p, its cosine cos phi,
    // before both are divided by their hypotenuse.
    const V small = phi.sin * polynomial(eccentric, phi.sin * phi.sin);
    const V small2 = small * small;
    const V sigma = small * (1.0 + small2 * (1.0 / 6) * (1.0 + small2 * (1.0 / 20)));
    const V root = sqrt(1.0 + sigma * sigma);
    const V p = phi.sin * root - sigma;
    const V q = phi.cos * lambda.cos;
    const V r = phi.cos * lambda.sin;
    // xi' = atan2(p, q), eta' = arsinh(r / h)
    const V h2 = p * p + q * q;
    const V whole2 = h2 + r * r;
    const auto plain = abs(r) <= sinh_limit * sqrt(h2);
    const V safe2 = select(plain, h2, whole2 * 0.0 + 1.0);
    const V h = sqrt(safe2);
    const V whole = sqrt(whole2);
    const V by = 1.0 / safe2;
    const V xi = atan2(p, q);
    const V sinh = select(plain, r, r * 0.0) / h;
    const V eta = asinh(sinh);
    const V sin2 = 2.0 * (p * q) * by;
    const V cos2 = (q - p) * (q + p) * by;
    const V sinh2 = 2.0 * (r * whole) * by;
    const V cosh2 = 1.0 + 2.0 * (r * r) * by;
    const ComplexOf<V> sine = {sin2 * cosh2, cos2 * sinh2};
    const ComplexOf<V> cosine = {cos2 * cosh2, -sin2 * sinh2};
    const auto sums = complex_sine_series<Distortion>(alpha, sine, cosine);
    Forward<V> out = {};
    out.point = {radius * (eta + sums.sine.im), radius * (xi + sums.sine.re)};
    out.plain = plain;
    if constexpr (Distortion) {
      const V re = 1.0 + 2.0 * sums.slope.re;
      const V im = 2.0 * sums.slope.im;
      // The conformal sphere's own: tan gamma' = tan lambda sin chi, and on the ellipsoid's sphere
      // k' = 1 / cosh eta' cos chi.
      const V cos_chi_by = whole / (phi.cos * phi.cos + p * p);
      out.distortion = distortion(p * lambda.sin, lambda.cos * whole, re, im, phi, whole, h);
      (void)cos_chi_by;
    }
    return out;
  }

  template <class V>
  TW_INLINE ScaleAndConvergence<V> distortion(V, V, V, V, SinCos<V>, V, V) const;
};

}  // namespace tidewater::points
