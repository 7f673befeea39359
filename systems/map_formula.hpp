// A formula from a map that computes several points at once.
#pragma once

#include "makers.hpp"
#include "projection_points.hpp"

namespace tidewater::detail {

template <class Map>
Made map_formula(const Plane& plane, const Map& map) {
  const MapForward<Map> forward{map};
  const MapInverse<Map> inverse{map};
  return formula(
      plane,
      [=](int count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
        *status = over_points(forward, count, in, out);
      },
      [=](int count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
        *status = over_points(inverse, count, in, out);
      });
}

// The plane of a map in metres.
inline Plane metric_plane(const MethodArguments& given) {
  return {given(kLon0), 1, 1, given(kX0), given(kY0)};
}

}  // namespace tidewater::detail
