// Radius of a parallel of the ellipsoid of unit semi-major axis.
#pragma once

#include <cmath>

#include "foundation/numeric.hpp"

namespace tidewater::detail {

// m(p) = cos p / sqrt(1 - e^2 sin^2 p) (Snyder 1987, eq. 14-15).
inline double parallel_radius(double e2, double sin_lat, double cos_lat) {
  return cos_lat / std::sqrt(1 - e2 * square(sin_lat));
}

}  // namespace tidewater::detail
