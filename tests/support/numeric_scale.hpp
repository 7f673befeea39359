// Scale factors of a projection by central differences of its forward function.
#pragma once

#include <cmath>

#include "support/points.hpp"

namespace tidewater::test {

// forward(point) gives plane coordinates for a unit ellipsoid of eccentricity e.  The result is
// (along the parallel, along the meridian, areal), good to about 1e-9.
template <class Forward>
CoordinateTriple numeric_scale(Forward forward, double lon, double lat, double e) {
  const auto slope = [&](double dlon, double dlat) {
    // fourth order: the third-order terms of the two differences cancel
    const auto half_width = [&](double h) {
      const CoordinateTriple a = forward({lon - h * dlon, lat - h * dlat, 0});
      const CoordinateTriple b = forward({lon + h * dlon, lat + h * dlat, 0});
      return CoordinateTriple{(b.x - a.x) / (2 * h), (b.y - a.y) / (2 * h), 0};
    };
    const double h = 2e-4;
    const CoordinateTriple near = half_width(h);
    const CoordinateTriple far = half_width(2 * h);
    return CoordinateTriple{(4 * near.x - far.x) / 3, (4 * near.y - far.y) / 3, 0};
  };
  const double w = 1 - e * e * std::sin(lat) * std::sin(lat);
  const double parallel = std::cos(lat) / std::sqrt(w);
  const double meridian = (1 - e * e) / std::pow(w, 1.5);
  const CoordinateTriple east = slope(1, 0);
  const CoordinateTriple north = slope(0, 1);
  return {std::hypot(east.x, east.y) / parallel, std::hypot(north.x, north.y) / meridian,
          std::fabs(east.x * north.y - east.y * north.x) / (parallel * meridian)};
}

}  // namespace tidewater::test
