// The plain arc tangent of a quotient.
#pragma once

#include "points/elementary.hpp"

namespace tidewater::points {

// atan(y / x), from -pi/2 to pi/2, also where x is zero.
template <Number V>
TW_INLINE V atan_of_quotient(V y, V x) {
  return atan2(select(x < 0.0, -y, y), abs(x));
}

}  // namespace tidewater::points
