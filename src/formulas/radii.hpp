// Radii of the ellipsoid of unit semi-major axis.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), eq. 4-18 to
// 4-22, 14-15.
#pragma once

#include "formulas/constants.hpp"

namespace tidewater::detail {

// Radius of curvature across the meridian, N = 1 / sqrt(1 - e^2 sin^2 p).
template <Number V>
TW_INLINE V normal_radius(double e2, V sin_lat) {
  const V x = e2 * square(sin_lat);
  if (e2 <= kSeriesEccentricity * kSeriesEccentricity) {
    // The binomial series, up to a quarter of the last digit: quicker than root and quotient.
    const V x2 = x * x;
    const V high = (35.0 / 128 + x * (63.0 / 256)) + x2 * (231.0 / 1024 + x * (429.0 / 2048));
    return (1.0 + x * 0.5) + x2 * ((3.0 / 8 + x * (5.0 / 16)) + x2 * high);
  }
  return 1.0 / sqrt(1.0 - x);
}

// Radius of the parallel, m(p) = cos p / sqrt(1 - e^2 sin^2 p).
template <Number V>
TW_INLINE V parallel_radius(double e2, V sin_lat, V cos_lat) {
  return cos_lat * normal_radius(e2, sin_lat);
}

// Radius of curvature in the meridian, M = (1 - e^2) / (1 - e^2 sin^2 p)^(3/2).
template <Number V>
TW_INLINE V meridian_radius(double e2, V sin_lat) {
  return (1 - e2) * cube(normal_radius(e2, sin_lat));
}

}  // namespace tidewater::detail
