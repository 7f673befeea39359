// Equal Earth: B. Savric, T. Patterson and B. Jenny, The Equal Earth map projection, International
// Journal of Geographical Information Science 33 (2019), 454-465; on the ellipsoid by the authalic
// latitude, IOGP Publication 373-7-2, method 1078.
#pragma once

#include <cmath>

#include "formulas/constants.hpp"
#include "points/portable.hpp"

namespace tidewater::detail {

// Between the authalic sphere of radius 1 and the plane.
struct EqualEarth {
  static constexpr double kA1 = 1.340264, kA2 = -0.081106, kA3 = 0.000893, kA4 = 0.003796;
  static constexpr double kHalfRoot3 = 0.866025403784438646763;

  static double ordinate(double t) {
    const double t2 = t * t;
    const double t6 = t2 * t2 * t2;
    return t * (kA1 + kA2 * t2 + t6 * (kA3 + kA4 * t2));
  }
  static double slope(double t) {
    const double t2 = t * t;
    const double t6 = t2 * t2 * t2;
    return kA1 + 3 * kA2 * t2 + t6 * (7 * kA3 + 9 * kA4 * t2);
  }

  static void forward(double lon, double beta, double* x, double* y) {
    const double t = portable::asin(kHalfRoot3 * portable::sin(beta));
    *x = lon * portable::cos(t) / (kHalfRoot3 * slope(t));
    *y = ordinate(t);
  }

  // False beyond the map.
  static bool inverse(double x, double y, double* lon, double* beta) {
    double t = y / kA1;
    for (int i = 0; i < 20; ++i) {
      const double step = (ordinate(t) - y) / slope(t);
      t -= step;
      if (std::fabs(step) < 1e-16) break;
    }
    const double s = portable::sin(t) / kHalfRoot3;
    if (!(std::fabs(s) <= 1 + 1e-12)) return false;
    *beta = portable::asin(s > 1 ? 1 : s < -1 ? -1 : s);
    *lon = x * kHalfRoot3 * slope(t) / portable::cos(t);
    return std::fabs(*lon) <= kPi + 1e-9;
  }
};

}  // namespace tidewater::detail
