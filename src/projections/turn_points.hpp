// Turn of plane points about their origin.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

struct Turn {
  double sin, cos;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    return {x * cos - y * sin, y * cos + x * sin};
  }
};

// Anticlockwise by an angle; z stays.
inline void turn_points(double angle, int32_t count, CoordinateTriple* points) {
  const auto at = sincos(angle);
  over_points(Turn{at.sin, at.cos}, count, points, points);
}

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::Turn)
