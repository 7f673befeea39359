// One step from a block of points to another.
#pragma once

#include "tidewater/foundation.h"

namespace tidewater::detail {

// A projection's formula between longitude and latitude, in radians from the definition's own prime
// meridian, and easting and northing in metres with false origin and scale applied.  The axis z is
// neither read nor written.  The answer is the word of the array functions: anything but TW_SUCCESS
// has the block asked again point by point.
class Formula {
 public:
  virtual ~Formula() = default;
  virtual TWstatus forward(int count, const CoordinateTriple* in, CoordinateTriple* out) const = 0;
  virtual TWstatus inverse(int count, const CoordinateTriple* in, CoordinateTriple* out) const = 0;
};

}  // namespace tidewater::detail
