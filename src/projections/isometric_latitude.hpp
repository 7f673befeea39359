// Isometric latitude of the ellipsoid, as the conformal families use it.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 15-16, 44.
#pragma once

#include <cmath>

#include "formulas/isometric_latitude.hpp"

namespace tidewater::detail {

// ln(tan(p/2 + pi/4) ((1 - e sin p) / (1 + e sin p))^(e/2)), the Mercator ordinate of latitude p.
inline double isometric_latitude(double e, double lat) {
  return std::log(std::tan(lat / 2 + kQuarterPi)) - eccentric_term(e, std::sin(lat));
}

// t(p) = tan(pi/4 - p/2) / ((1 - e sin p) / (1 + e sin p))^(e/2) = exp(-isometric latitude).
inline double isometric_colatitude_tangent(double e, double lat) {
  return std::tan(kQuarterPi - lat / 2) / eccentric_factor(e, std::sin(lat));
}

// One pass of the fixed point that takes t(p) back to the latitude p.
inline double next_latitude(double e, double t, double lat) {
  return kHalfPi - 2 * std::atan(t * eccentric_factor(e, std::sin(lat)));
}

// The latitude p with t(p) = t: where the passes of next_latitude come to rest.
//
// With T = tan(pi/4 - p/2) = exp(-v), the fixed point is v = y + e atanh(e tanh v).  Newton's
// method on d = v - y needs neither logarithm nor sine, and for earth's ellipsoids is done after
// two steps.
inline double latitude_at_rest(double e, double t) {
  if (t > 1) return -latitude_at_rest(e, 1 / t);  // the south mirrors the north; also for infinity
  const double e2 = e * e;
  double tangent = t;
  double d = 0;
  double step = 0;
  int passes = 0;
  do {
    const double q = tangent * tangent;
    const double sin_lat = (1 - q) / (1 + q);
    const double cos2 = 4 * q / square(1 + q);
    step = (d - eccentric_term(e, sin_lat)) / (1 - e2 * cos2 / (1 - e2 * square(sin_lat)));
    d -= step;
    tangent = t * eccentric_decay(e, d);
    // What a step leaves is of the order of its square.  Eleven passes serve up to e = 0.999999;
    // from 1 - 1e-10 on rounding alone may keep the steps up.
  } while (std::fabs(step) > 1e-9 && ++passes < 100);
  return kHalfPi - 2 * std::atan(tangent);
}

}  // namespace tidewater::detail
