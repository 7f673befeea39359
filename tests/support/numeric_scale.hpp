// Scale factors of a projection by central differences of its forward function.
#pragma once

#include <cmath>

#include "support/points.hpp"

namespace tidewater::test {

// forward(point) gives plane coordinates for a unit ellipsoid of eccentricity e.  The result is
// (along the parallel, along the meridian, areal).  Differences of the fourth order over steps of
// 1e-3 radians: within some 1e-11 where the derivatives are of the order of one.
template <class Forward>
CoordinateTriple numeric_scale(Forward forward, double lon, double lat, double e) {
  const auto slope = [&](double dlon, double dlat) {
    const double step = 1e-3;
    const auto at = [&](int n) -> CoordinateTriple {
      return forward(CoordinateTriple{lon + n * step * dlon, lat + n * step * dlat, 0});
    };
    const CoordinateTriple a = at(-2), b = at(-1), c = at(1), d = at(2);
    return CoordinateTriple{(8 * (c.x - b.x) - (d.x - a.x)) / (12 * step),
                            (8 * (c.y - b.y) - (d.y - a.y)) / (12 * step), 0};
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
