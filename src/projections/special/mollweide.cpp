// Mollweide projection of the sphere.

#include <cmath>
#include <numbers>

#include "formulas/constants.hpp"
#include "projections/special/cycle_watch.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

constexpr double kSqrt2 = std::numbers::sqrt2;
constexpr double kXFactor = kSqrt2 * 2 / kPi;

// The root t of t + sin t = pi sin p, by Newton from t = p.  Towards the poles the derivative goes
// to zero and the step, made of rounding, may stay above the tolerance for good: the iteration
// also ends when it comes back to a value it has had.
double auxiliary_angle(double lat) {
  const double target = kPi * std::sin(lat);
  double t = lat;
  double step = 0;
  CycleWatch watch;
  do {
    step = -(std::sin(t) + t - target) / (std::cos(t) + 1);
    t += step;
  } while (std::fabs(step) > 1e-12 && !watch.seen(t));
  return t;
}

}  // namespace

void TWmollweide_c(double lat0, double* y0, TWstatus* status) {
  *status = TW_SUCCESS;
  *y0 = std::sin(auxiliary_angle(lat0) / 2) * kSqrt2;
}

void TWmollweide_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double theta = auxiliary_angle(in[i].y) / 2;
    out[i].x = std::cos(theta) * kXFactor * (in[i].x - lon0);
    out[i].y = std::sin(theta) * kSqrt2 - y0;
  }
}

void TWmollweide_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double q = (in[i].y + y0) / kSqrt2;
    if (std::fabs(q) > 1) {
      *status = TW_RANGE_ERROR;
      return;
    }
    const double theta = std::asin(q);
    out[i].x = x * kPi / (std::cos(theta) * kSqrt2 * 2) + lon0;
    const double r = (std::sin(2 * theta) + 2 * theta) / kPi;
    if (std::fabs(r) > 1) {
      *status = TW_RANGE_ERROR;  // the longitude of this point stands
      return;
    }
    out[i].y = std::asin(r);
  }
}
