// Inverse of any map of geodetic points to a plane, by walking on the sphere: each step turns and
// stretches the plane's error as the step before was turned and stretched.

#include <cmath>

#include "formulas/wraps.hpp"
#include "points/portable.hpp"
#include "tidewater/generic_inverse.h"

using namespace tidewater::detail;

namespace {

constexpr double kTolerance = 1e-14;
constexpr double kStartOffset = 5e-6;
constexpr int kMostPasses = 100;

struct LonLat {
  double lon;
  double lat;
};

// Brings a latitude that walked over a pole back, half way round.
void fold_over_poles(LonLat& p) {
  while (p.lat < -kHalfPi || p.lat > kHalfPi) {
    p.lat = (p.lat < 0 ? -kPi : kPi) - p.lat;
    p.lon += p.lon >= 0 ? -kPi : kPi;
  }
}

// Brings the estimate's longitude into a half-turn and moves the previous one along.
void wrap_together(LonLat& estimate, LonLat& previous) {
  const double lon = wrap_turns_below_then_above(estimate.lon);
  if (lon == estimate.lon) return;
  previous.lon += lon - estimate.lon;
  estimate.lon = lon;
}

class Walk {
 public:
  Walk(TWtransform forward, TWcontext context, LonLat start)
      : forward_(forward), context_(context), estimate_(start) {}

  const LonLat& estimate() const { return estimate_; }

  // Walks to the point whose image is (x, y), from where the last walk ended.  The word is that of
  // the last forward call.
  TWstatus to(double x, double y) {
    LonLat previous = estimate_;
    previous.lat += estimate_.lat >= kHalfPi - 5e-6 ? -kStartOffset : kStartOffset;
    CoordinateTriple p = {};
    TWstatus word = image(previous, p);
    double scale = 0.1;
    for (int pass = 0; TW_OK(word) && pass < kMostPasses; ++pass) {
      CoordinateTriple f = {};
      word = image(estimate_, f);
      if (!TW_OK(word)) break;
      const double dx = x - f.x;
      const double dy = y - f.y;
      if (std::fabs(dx) < kTolerance && std::fabs(dy) < kTolerance) break;
      double d = std::sqrt(dy * dy + dx * dx);
      double angle = portable::atan2(dy, dx);
      const double u = portable::cos(estimate_.lat) * (estimate_.lon - previous.lon);
      const double v = estimate_.lat - previous.lat;
      if (std::fabs(u) < kTolerance && std::fabs(v) < kTolerance) break;
      angle += portable::atan2(v, u);
      const double ex = f.x - p.x;
      const double ey = f.y - p.y;
      if (!(ex == 0 && ey == 0)) {
        angle -= portable::atan2(ey, ex);
        scale = std::sqrt(u * u + v * v) / std::sqrt(ex * ex + ey * ey);
      }
      previous = estimate_;
      p = f;
      d *= scale;
      if (d > kPi) d = kPi;
      const double du = portable::cos(angle) * d;
      const double cos_lat = portable::cos(estimate_.lat);
      if (std::fabs(du) < kPi * cos_lat) estimate_.lon += du / cos_lat;
      estimate_.lat += portable::sin(angle) * d;
      fold_over_poles(estimate_);
      wrap_together(estimate_, previous);
    }
    return word;
  }

 private:
  TWstatus image(const LonLat& p, CoordinateTriple& plane) const {
    const CoordinateTriple point = {p.lon, p.lat, 0};
    TWstatus word = TW_SUCCESS;
    forward_(context_, 1, &point, &plane, &word);
    return word;
  }

  TWtransform forward_;
  TWcontext context_;
  LonLat estimate_;
};

}  // namespace

void TWgeneric_i(TWtransform forward, TWcontext context, double start_lon, double start_lat, double,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  if (start_lat < -kHalfPi || start_lat > kHalfPi) {
    *status = TW_NOT_CONVERGED;
    return;
  }
  Walk walk(forward, context, {start_lon, start_lat});
  for (int32_t i = 0; i < count; ++i) {
    const TWstatus word = walk.to(in[i].x, in[i].y);
    if (!TW_OK(word)) {
      *status = TW_NOT_CONVERGED;
      return;
    }
    if (word != TW_SUCCESS) *status = word;
    out[i].x = walk.estimate().lon;
    out[i].y = walk.estimate().lat;
  }
}
