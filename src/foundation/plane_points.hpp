// Scale and origin of a grid.
#pragma once

#include "formulas/constants.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

struct UnitsToGrid {
  double s1, s2, false_easting, false_northing;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    return {x * s2 * s1 + false_easting, y * s2 * s1 + false_northing};
  }
};

struct GridToUnits {
  double s1, s2, false_easting, false_northing;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    return {(x - false_easting) / s1 / s2, (y - false_northing) / s1 / s2};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::UnitsToGrid)
TIDEWATER_INSTANCE(tidewater::detail::GridToUnits)
