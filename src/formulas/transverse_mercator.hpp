// Transverse Mercator of the ellipsoid by Krueger's series to n^8.
// L. Krueger, Konforme Abbildung des Erdellipsoids in der Ebene, Veroeffentlichung des Koeniglich
// Preussischen Geodaetischen Instituts 52 (1912); arranged after C. F. F. Karney, Transverse
// Mercator with an accuracy of a few nanometers, Journal of Geodesy 85 (2011), pp. 475-485, eqs
// 7-28; coefficients by scripts/series/latitudes.py (the conformal and the rectifying latitude into
// each other, at complex arguments).
#pragma once

#include "formulas/latitudes.hpp"

namespace tidewater::detail {

struct TransverseMercator {
  // As far from the central meridian as the series keep their digits, in rectifying radii: 3,900 km
  // on the earth.
  static constexpr double kLargestEasting = 0.6125;
  // The same on the conformal sphere, whose easting differs by some thousandths.
  static constexpr double kLargestSinh = 0.66;
  // The earth's ellipsoids are below 1 / 290; the series keep their digits up to here.
  static constexpr double kLargestFlattening = 1.0 / 150;

  double radius;        // the rectifying radius times the scale on the central meridian
  double scale_factor;  // radius by the equator's
  double e2;
  double eccentric[9];  // e artanh(e s) = s sum of eccentric[j] s^(2 j)
  LatitudeSeries alpha, beta, to_geodetic;

  TransverseMercator(double a, double f, double k0)
      : radius(k0 * rectifying_radius(a, f)),
        scale_factor(k0 * rectifying_radius(1, f)),
        e2(f * (2 - f)),
        alpha(kRectifyingFromConformal, third_flattening(f)),
        beta(kConformalFromRectifying, third_flattening(f)),
        to_geodetic(kGeodeticFromConformal, third_flattening(f)) {
    double power = 1;
    for (int j = 0; j < 9; ++j) {
      power *= e2;
      eccentric[j] = power / (2 * j + 1);
    }
  }

  template <Number V>
  struct Forward {
    V x, y;
    Mask<V> plain;         // within the series' reach
    V scale, convergence;  // of the plane; only where they are asked for
  };

  // The longitude counts from the central meridian, y from the equator.  The convergence is the
  // bearing of the grid's north, clockwise from true north.
  template <bool Distortion = false, Number V>
  TW_INLINE Forward<V> forward(V lon, V lat) const {
    const auto phi = sincos(lat);
    const auto lambda = sincos(lon);
    // tan of the conformal latitude is p / cos phi.  Nothing is divided by cos phi, so that the
    // poles are points like others.
    const V small = phi.sin * polynomial(eccentric, phi.sin * phi.sin);
    const V small2 = small * small;
    const V sigma = small * (1.0 + small2 * (1.0 / 6) * (1.0 + small2 * (1.0 / 20)));
    const V p = phi.sin * sqrt(1.0 + sigma * sigma) - sigma;
    const V q = phi.cos * lambda.cos;
    const V r = phi.cos * lambda.sin;
    // xi' = atan2(p, q), sinh eta' = r / h
    const V h2 = p * p + q * q;
    const V whole = sqrt(h2 + r * r);
    const auto near = r * r <= kLargestSinh * kLargestSinh * h2;
    const V by = 1.0 / select(near, h2, 1.0);
    const V h = sqrt(h2);
    const V xi = atan2(p, q);
    const V eta = asinh(select(near, r * h * by, 0.0));
    const V sin2 = 2.0 * (p * q) * by;
    const V cos2 = (q - p) * (q + p) * by;
    const V sinh2 = 2.0 * (r * whole) * by;
    const V cosh2 = 1.0 + 2.0 * (r * r) * by;
    const auto sums =
        complex_sine_series<Distortion>(alpha.c, ComplexOf<V>{sin2 * cosh2, cos2 * sinh2},
                                        ComplexOf<V>{cos2 * cosh2, -(sin2 * sinh2)});
    Forward<V> out;
    const V easting = eta + sums.sine.im;
    out.x = radius * easting;
    out.y = radius * (xi + sums.sine.re);
    out.plain = near & (abs(easting) <= kLargestEasting);
    if constexpr (Distortion) {
      const V re = 1.0 + 2.0 * sums.slope.re;
      const V im = 2.0 * sums.slope.im;
      const V across = p * lambda.sin;
      const V along = lambda.cos * whole;
      out.convergence = atan2(across * re - along * im, along * re + across * im);
      out.scale = scale_factor * sqrt((re * re + im * im) * (1.0 - e2 * (phi.sin * phi.sin)) * by);
    }
    return out;
  }

  template <Number V>
  struct Inverse {
    V lon, lat;
    Mask<V> plain;
  };

  // y within the meridian's length: up to a quarter of it beyond a pole.
  template <Number V>
  TW_INLINE Inverse<V> inverse(V x, V y) const {
    const V eta = x * (1 / radius);
    const V xi = y * (1 / radius);
    Inverse<V> out;
    out.plain = (abs(eta) <= kLargestEasting) & (abs(xi) <= kPi);
    const V u = select(out.plain, eta, 0.0);
    const auto at = sincos(select(out.plain, xi, 0.0));
    // sinh and cosh to rounding below 0.66, the former relatively.
    static constexpr double kSinh[] = {
        1.,          1. / 6,        1. / 120,         1. / 5040,
        1. / 362880, 1. / 39916800, 1. / 6227020800., 1. / 1307674368000.};
    static constexpr double kCosh[] = {1.,
                                       1. / 2,
                                       1. / 24,
                                       1. / 720,
                                       1. / 40320,
                                       1. / 3628800,
                                       1. / 479001600.,
                                       1. / 87178291200.,
                                       1. / 20922789888000.};
    const V u2 = u * u;
    const V sinh = u * polynomial(kSinh, u2);
    const V cosh = polynomial(kCosh, u2);
    const auto two = twice(at);
    const V sinh2 = 2.0 * (sinh * cosh);
    const V cosh2 = 1.0 + 2.0 * (sinh * sinh);
    const auto move =
        complex_sine_series<false>(beta.c, ComplexOf<V>{two.sin * cosh2, two.cos * sinh2},
                                   ComplexOf<V>{two.cos * cosh2, -(two.sin * sinh2)})
            .sine;
    const auto moved = turned(at, move.re);
    const V d2 = move.im * move.im;
    const V small_sinh = move.im * (1.0 + d2 * (1.0 / 6) * (1.0 + d2 * (1.0 / 20)));
    const V small_cosh = d2 * 0.5 * (1.0 + d2 * (1.0 / 12) * (1.0 + d2 * (1.0 / 30)));  // less one
    const V moved_sinh = sinh + (sinh * small_cosh + cosh * small_sinh);
    const V moved_cosh = cosh + (cosh * small_cosh + sinh * small_sinh);
    const V across = sqrt(moved_sinh * moved_sinh + moved.cos * moved.cos);
    const V by = 1.0 / moved_cosh;
    out.lon = atan2(moved_sinh, moved.cos);
    out.lat =
        atan2(moved.sin, across) + to_geodetic.correction(SinCos<V>{moved.sin * by, across * by});
    return out;
  }
};

}  // namespace tidewater::detail
