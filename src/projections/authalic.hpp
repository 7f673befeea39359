// The function q of the equal-area projections.
#pragma once

#include <cmath>

#include "formulas/constants.hpp"
#include "projections/isometric_latitude.hpp"

namespace tidewater::detail {

// The logarithm of q loses digits below this eccentricity, which is far below that of any ellipsoid
// of the earth.
inline constexpr double kLogarithmEccentricity = 0.01;

// ln((1 - e sin p) / (1 + e sin p)) / 2e, as it is printed.
inline double authalic_logarithm(double e, double sin_lat) {
  const double es = e * sin_lat;
  return 0.5 / e * std::log((1 - es) / (1 + es));
}

// q(p) = (1 - e^2) (sin p / (1 - e^2 sin^2 p) - ln((1 - e sin p) / (1 + e sin p)) / 2e), and its
// limit 2 sin p on the sphere (Snyder 1987, eq. 3-12).
inline double authalic_q(double e, double sin_lat) {
  if (e == 0) return 2 * sin_lat;
  const double e2 = square(e);
  // By contract: the printed logarithm where it differs from -2 atanh(e sin p) by more than the
  // last digits, so that the figures stay those of the formula.
  const double logarithm = std::fabs(e) < kLogarithmEccentricity ? authalic_logarithm(e, sin_lat)
                                                                 : -eccentric_term(e, sin_lat) / e2;
  return (sin_lat / (1 - e2 * square(sin_lat)) - logarithm) * (1 - e2);
}

}  // namespace tidewater::detail
