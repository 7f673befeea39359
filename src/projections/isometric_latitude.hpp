// Isometric latitude of the ellipsoid, as the conformal families use it.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 15-16, 44.
#pragma once

#include <cmath>

#include "foundation/numeric.hpp"

namespace tidewater {

// ((1 - e sin p) / (1 + e sin p))^(e/2): how the ellipsoid departs from the sphere.
inline double eccentric_factor(double e, double sin_lat) {
  const double es = e * sin_lat;
  return std::pow((1 - es) / (1 + es), e / 2);
}

// ln(tan(p/2 + pi/4) ((1 - e sin p) / (1 + e sin p))^(e/2)), the Mercator ordinate of latitude p.
inline double isometric_latitude(double e, double lat) {
  return std::log(std::tan(lat / 2 + kQuarterPi) * eccentric_factor(e, std::sin(lat)));
}

// t(p) = tan(pi/4 - p/2) / ((1 - e sin p) / (1 + e sin p))^(e/2) = exp(-isometric latitude).
inline double isometric_colatitude_tangent(double e, double lat) {
  return std::tan(kQuarterPi - lat / 2) / eccentric_factor(e, std::sin(lat));
}

// One pass of the fixed point that takes t(p) back to the latitude p.
inline double next_latitude(double e, double t, double lat) {
  return kHalfPi - 2 * std::atan(t * eccentric_factor(e, std::sin(lat)));
}

}  // namespace tidewater
