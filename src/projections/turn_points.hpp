// Turn of plane points about their origin.
#pragma once

#include <cmath>

#include "tidewater/frame.h"

namespace tidewater::detail {

// Anticlockwise by an angle; z stays.
inline void turn_points(double angle, int32_t count, CoordinateTriple* points) {
  const double s = std::sin(angle);
  const double c = std::cos(angle);
  for (int32_t i = 0; i < count; ++i) {
    const double x = points[i].x;
    const double y = points[i].y;
    points[i].x = x * c - y * s;
    points[i].y = y * c + x * s;
  }
}

}  // namespace tidewater::detail
