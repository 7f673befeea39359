// The function q of the equal-area projections.
#pragma once

#include <cmath>

#include "foundation/numeric.hpp"

namespace tidewater {

// q(p) = (1 - e^2) (sin p / (1 - e^2 sin^2 p) - ln((1 - e sin p) / (1 + e sin p)) / 2e), and its
// limit 2 sin p on the sphere (Snyder 1987, eq. 3-12).  The logarithm is -2 atanh(e sin p), which
// keeps its digits where e is small.
inline double authalic_q(double e, double sin_lat) {
  if (e == 0) return 2 * sin_lat;
  const double es = e * sin_lat;
  return (sin_lat / (1 - square(es)) + std::atanh(es) / e) * (1 - square(e));
}

}  // namespace tidewater
