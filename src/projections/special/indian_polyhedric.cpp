// Polyhedric projection of the Indian quarter-inch sheets: what the contract says of the points
// that the formulas do not cover, and the exported functions.

#include "projections/special/indian_polyhedric_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/indian_polyhedric.h"

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
  const double s = portable::sin(lat0);
  const double w = 1 / std::sqrt(1 - e2 * s * s);
  *c1 = portable::cos(lat0) * w;
  *c2 = w * w * w * (1 - e2);
  *c3 = *c2 * s;
  *c4 = portable::sin(2 * lat0) * w * 0.25;
  *c5 = (1 - e2) * e2 * 3;
  *c6 = (e2 + 1 - 2 * e2 * e2) / 6;
}

namespace tidewater::detail {

Next PolyhedricInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                              TWstatus* status) const {
  double d = (in.x - lon0) * w;
  double p = (in.y - lat0) * w;
  double r = 1e10;
  int passes = 0;
  ResidualWatch watch;
  while (r > kPolyhedricTolerance && passes <= kPolyhedricPasses) {
    ++passes;
    const double ey = in.y - series.y(d, p);
    const double ex = in.x - series.x(d, p);
    d += w * ex;
    p += w * ey;
    r = std::sqrt(ex * ex + ey * ey);
    // The residual of the first pass is that of the odd start, and is not watched.
    if (passes > 1 && watch.diverges(r)) passes = kPolyhedricPasses + 1;
  }
  if (passes > kPolyhedricPasses) *status = TW_NOT_CONVERGED;  // the point is written all the same
  out->x = d + lon0;
  out->y = p + lat0;
  return Next::point;
}

}  // namespace tidewater::detail

void TWind_phed_f(double lon0, double lat0, double c1, double c2, double c3, double c4, double c5,
                  double c6, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status) {
  *status = over_points(PolyhedricForward{lon0, lat0, {c1, c2, c3, c4, c5, c6}}, count, in, out);
}

void TWind_phed_i(double a, double lon0, double lat0, double c1, double c2, double c3, double c4,
                  double c5, double c6, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = over_points(PolyhedricInverse{lon0, lat0, a * kStepPerLength, {c1, c2, c3, c4, c5, c6}},
                        count, in, out);
}
