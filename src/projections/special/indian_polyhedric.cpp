// Polyhedric projection of the Indian quarter-inch sheets: a short power series about an origin.

#include <cmath>

#include "formulas/wraps.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// One over 6387402.25505384 m, the radius that turns a residual into a step of the inverse.
constexpr double kStepPerLength = 1.5655816873108e-07;

// The last four residuals of an iteration, by which one that runs away is known.
class ResidualWatch {
 public:
  // True once three rises in a row have been seen.
  bool diverges(double residual) {
    r0_ = r1_;
    r1_ = r2_;
    r2_ = r3_;
    r3_ = residual;
    if (held_ < 4) ++held_;
    return held_ == 4 && r3_ > r2_ && r1_ < r2_ && r1_ > r0_;
  }

 private:
  double r0_ = 0, r1_ = 0, r2_ = 0, r3_ = 0;  // oldest first
  int held_ = 0;
};

}  // namespace

void TWind_phed_c(double e, double lat0, double* c1, double* c2, double* c3, double* c4, double* c5,
                  double* c6, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const double s = std::sin(lat0);
  const double w = 1 / std::sqrt(1 - e2 * s * s);
  *c1 = std::cos(lat0) * w;
  *c2 = w * w * w * (1 - e2);
  *c3 = *c2 * s;
  *c4 = std::sin(2 * lat0) * w * 0.25;
  *c5 = (1 - e2) * e2 * 3;
  *c6 = (e2 + 1 - 2 * e2 * e2) / 6;
}

void TWind_phed_f(double lon0, double lat0, double c1, double c2, double c3, double c4, double c5,
                  double c6, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double d = wrap_above_then_at_or_below(in[i].x - lon0);
    const double p = in[i].y - lat0;
    out[i].x = (c1 - p * c3) * d;
    out[i].y = (p * c5 * c4 + p * p * c6 + c2) * p + d * d * c4;
  }
}

void TWind_phed_i(double a, double lon0, double lat0, double c1, double c2, double c3, double c4,
                  double c5, double c6, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr int kMostPasses = 30;
  const double w = a * kStepPerLength;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    // By contract: the origin's angles are taken off plane values for the start.
    double d = (x - lon0) * w;
    double p = (y - lat0) * w;
    double r = 1e10;
    int passes = 0;
    ResidualWatch watch;
    while (r > 1e-09 && passes <= kMostPasses) {
      ++passes;
      const double ey = y - ((p * p * c6 + p * c5 * c4 + c2) * p + d * d * c4);
      const double ex = x - (c1 - p * c3) * d;
      d += w * ex;
      p += w * ey;
      r = std::sqrt(ex * ex + ey * ey);
      // The residual of the first pass is that of the odd start, and is not watched.
      if (passes > 1 && watch.diverges(r)) passes = kMostPasses + 1;
    }
    if (passes > kMostPasses) *status = TW_NOT_CONVERGED;  // the point is written all the same
    out[i].x = d + lon0;
    out[i].y = p + lat0;
  }
}
