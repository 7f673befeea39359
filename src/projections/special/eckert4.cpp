// Eckert IV projection: what the contract says of the points that the formulas do not cover, and
// the exported functions.

#include "projections/special/eckert4_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/eckert4.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

// Newton's step towards the root t of t + sin t cos t + 2 sin t = (2 + pi/2) sin p.
double newton_step(double t, double target) {
  const double s = portable::sin(t);
  const double c = portable::cos(t);
  return -(c * s + 2 * s + t - target) / (2 * (c + 1) * c);
}

}  // namespace

// Close to a pole and beyond it the stated iteration itself sets the word.
Next EckertForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                          TWstatus* status) const {
  constexpr int kMostPasses = 50;
  const double target = kEckertTarget * portable::sin(in.y);
  double t = in.y / 2;
  double step = 0;
  int passes = 0;
  do {
    step = newton_step(t, target);
    t += step;
    ++passes;
  } while (!(std::fabs(step) <= 1e-12) && passes < kMostPasses);
  // By contract: also where the last step was small enough; and for a latitude that is not a
  // number.
  if (passes == kMostPasses) {
    *status = TW_NOT_CONVERGED;
    return Next::none;
  }
  const auto answer = place(in.x, portable::sin(t), portable::cos(t));
  out->x = answer.x;
  out->y = answer.y;
  return Next::point;
}

}  // namespace tidewater::detail

void TWeckertIV_c(double lat0, double* y0, TWstatus* status) {
  *status = TW_SUCCESS;
  const double target = kEckertTarget * portable::sin(lat0);
  double t = lat0 / 2;
  double step = 0;
  do {
    step = newton_step(t, target);
    t += step;
  } while (step > 1e-12);  // By contract: a negative step of any size ends the loop
  *y0 = portable::sin(t) * std::sqrt(kEckertYSquare) * 2;
}

void TWeckertIV_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = over_points(
      EckertForward{lon0, y0, 2 / std::sqrt(kEckertXSquare), std::sqrt(kEckertYSquare) * 2}, count,
      in, out);
}

void TWeckertIV_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = over_points(EckertInverse{lon0, y0, std::sqrt(kFourPlusPi) / (std::sqrt(kPi) * 2),
                                      std::sqrt(kEckertXSquare) / 2},
                        count, in, out);
}
