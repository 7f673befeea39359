// One step from a block of points to another.
#pragma once

#include <memory>
#include <utility>

#include "tidewater/foundation.h"

namespace tidewater::detail {

// How a formula's plane, in units of its own about its own origin, becomes easting and northing in
// metres: X = x0 + sx x.  Longitudes reach the formula from lon0 on, within half a turn of it.
struct Plane {
  double lon0 = 0;  // radians
  double sx = 1, sy = 1, x0 = 0, y0 = 0;
};

// A projection's formula between longitude from lon0, latitude and its plane.  The axis z is
// neither read nor written.  The answer is the word of the array functions: anything but TW_SUCCESS
// has the block asked again point by point.
class Formula {
 public:
  explicit Formula(const Plane& where) : plane(where) {}
  virtual ~Formula() = default;
  virtual TWstatus forward(int count, const CoordinateTriple* in, CoordinateTriple* out) const = 0;
  virtual TWstatus inverse(int count, const CoordinateTriple* in, CoordinateTriple* out) const = 0;

  const Plane plane;
};

// A formula from two functions of (count, in, out, status).
template <class F, class I>
std::unique_ptr<const Formula> formula(const Plane& plane, F forward, I inverse) {
  class Both final : public Formula {
   public:
    Both(const Plane& where, F f, I i) : Formula(where), f_(std::move(f)), i_(std::move(i)) {}
    TWstatus forward(int count, const CoordinateTriple* in, CoordinateTriple* out) const override {
      TWstatus status = TW_SUCCESS;
      f_(count, in, out, &status);
      return status;
    }
    TWstatus inverse(int count, const CoordinateTriple* in, CoordinateTriple* out) const override {
      TWstatus status = TW_SUCCESS;
      i_(count, in, out, &status);
      return status;
    }

   private:
    F f_;
    I i_;
  };
  return std::make_unique<const Both>(plane, std::move(forward), std::move(inverse));
}

// A value of the plane or a position; `plain` is false where the formula has none.
struct PointAnswer {
  double x, y;
  bool plain = true;
};

// A formula from two functions of one point, (longitude from lon0, latitude) and (x, y).
template <class F, class I>
std::unique_ptr<const Formula> pointwise(const Plane& plane, F forward, I inverse) {
  const auto loop = [](const auto& map) {
    return [map](int count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
      for (int i = 0; i < count; ++i) {
        const PointAnswer answer = map(in[i].x, in[i].y);
        if (answer.plain) {
          out[i].x = answer.x;
          out[i].y = answer.y;
        } else {
          *status = TW_RANGE_ERROR;
        }
      }
    };
  };
  return formula(plane, loop(forward), loop(inverse));
}

}  // namespace tidewater::detail
