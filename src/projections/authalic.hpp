// The function q of the equal-area projections.
#pragma once

#include "foundation/numeric.hpp"
#include "projections/isometric_latitude.hpp"

namespace tidewater {

// q(p) = (1 - e^2) (sin p / (1 - e^2 sin^2 p) - ln((1 - e sin p) / (1 + e sin p)) / 2e), and its
// limit 2 sin p on the sphere (Snyder 1987, eq. 3-12).  The logarithm is -2 atanh(e sin p), which
// keeps its digits where e is small.
inline double authalic_q(double e, double sin_lat) {
  const double e2 = square(e);
  if (e2 == 0) return 2 * sin_lat;
  return (sin_lat / (1 - e2 * square(sin_lat)) + eccentric_term(e, sin_lat) / e2) * (1 - e2);
}

}  // namespace tidewater
