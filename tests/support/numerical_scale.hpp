// Scale factors by numerical differentiation of a forward function.
#pragma once

#include <cmath>

#include "support/points.hpp"

namespace tidewater::test {

struct Scales {
  double k, h;  // along the parallel, along the meridian
};

// forward takes a longitude and latitude to the plane of unit semi-major axis.  Central differences
// of the fourth order over steps of 1e-3 radians: within some 1e-11 where the derivatives are of
// the order of one.
template <class Forward>
Scales numerical_scale(double e, double lon, double lat, Forward forward) {
  const double step = 1e-3;
  const auto length = [&](double dlon, double dlat) {
    const auto at = [&](int n) -> CoordinateTriple {
      return forward(CoordinateTriple{lon + n * step * dlon, lat + n * step * dlat, 0});
    };
    const CoordinateTriple a = at(-2), b = at(-1), c = at(1), d = at(2);
    return std::hypot(8 * (c.x - b.x) - (d.x - a.x), 8 * (c.y - b.y) - (d.y - a.y)) / (12 * step);
  };
  const double w = 1 - e * e * std::sin(lat) * std::sin(lat);
  const double parallel = std::cos(lat) / std::sqrt(w);
  const double meridian = (1 - e * e) / std::pow(w, 1.5);
  return {length(1, 0) / parallel, length(0, 1) / meridian};
}

}  // namespace tidewater::test
