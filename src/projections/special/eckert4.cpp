// Eckert IV projection of the sphere.

#include <algorithm>
#include <cmath>

#include "formulas/constants.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

constexpr double kTwoPlusHalfPi = 3.5707963267948966;
constexpr double kYSquare = 0.43990084648844263;   // pi / (4 + pi)
constexpr double kXSquare = 22.43597501544853;     // pi (4 + pi)
constexpr double kFourPlusPi = 7.141592653589793;  // 4 + pi

// Newton's step towards the root t of t + sin t cos t + 2 sin t = (2 + pi/2) sin p.
double newton_step(double t, double target) {
  const double s = std::sin(t);
  const double c = std::cos(t);
  return -(c * s + 2 * s + t - target) / (2 * (c + 1) * c);
}

}  // namespace

void TWeckertIV_c(double lat0, double* y0, TWstatus* status) {
  *status = TW_SUCCESS;
  const double target = kTwoPlusHalfPi * std::sin(lat0);
  double t = lat0 / 2;
  double step = 0;
  do {
    step = newton_step(t, target);
    t += step;
  } while (step > 1e-12);  // By contract: a negative step of any size ends the loop
  *y0 = std::sin(t) * std::sqrt(kYSquare) * 2;
}

void TWeckertIV_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr int kMostPasses = 50;
  const double x_factor = 2 / std::sqrt(kXSquare);
  const double y_factor = std::sqrt(kYSquare) * 2;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double target = kTwoPlusHalfPi * std::sin(in[i].y);
    double t = in[i].y / 2;
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
      return;
    }
    out[i].x = (std::cos(t) + 1) * (lon - lon0) * x_factor;
    out[i].y = std::sin(t) * y_factor - y0;
  }
}

void TWeckertIV_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double x_root = std::sqrt(kXSquare);
  const double to_sine = std::sqrt(kFourPlusPi);
  const double two_root_pi = std::sqrt(kPi) * 2;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double q = std::clamp((in[i].y + y0) * to_sine / two_root_pi, -1.0, 1.0);
    const double t = std::asin(q);
    const double cos_t = std::cos(t);
    out[i].x = x_root * x / ((cos_t + 1) * 2) + lon0;
    out[i].y = std::asin((q * cos_t + 2 * q + t) / kTwoPlusHalfPi);
  }
}
