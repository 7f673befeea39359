// Radii of the ellipsoid of unit semi-major axis.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), eq. 4-18 to
// 4-22, 14-15.
#pragma once

#include "formulas/constants.hpp"

namespace tidewater::detail {

// Radius of the parallel, m(p) = cos p / sqrt(1 - e^2 sin^2 p).
template <Number V>
TW_INLINE V parallel_radius(double e2, V sin_lat, V cos_lat) {
  return cos_lat / sqrt(1.0 - e2 * square(sin_lat));
}

// Radius of curvature across the meridian, N = 1 / sqrt(1 - e^2 sin^2 p).
template <Number V>
TW_INLINE V normal_radius(double e2, V sin_lat) {
  return 1.0 / sqrt(1.0 - e2 * square(sin_lat));
}

// Radius of curvature in the meridian, M = (1 - e^2) / (1 - e^2 sin^2 p)^(3/2).
template <Number V>
TW_INLINE V meridian_radius(double e2, V sin_lat) {
  const V w2 = 1.0 - e2 * square(sin_lat);
  return (1 - e2) / (w2 * sqrt(w2));
}

}  // namespace tidewater::detail
