// Albers equal-area conic projection: constants, what the contract says of the points that the
// formulas do not cover, and the exported functions.

#include "projections/conformal/albers_points.hpp"

#include <algorithm>
#include <cmath>

#include "points/portable.hpp"
#include "tidewater/albers.h"

using namespace tidewater::detail;

namespace {

constexpr double kConverged = 1e-13;
constexpr double kLatLimit = kHalfPi + 1e-12;  // a latitude up to here is held at the pole
constexpr double kSineLimit = 1.0000000000001;
constexpr int kNewtonSteps = 12;
constexpr int kMostSteps = 30;

// Newton's step towards the latitude whose authalic function is Q.  At a pole, and on all but a
// sphere, the course of the steps hangs on the last digit: the terms stand as they are printed.
double newton_step(double e, double Q, double lat) {
  const double e2 = square(e);
  const double s = portable::sin(lat);
  const double W = 1 - e2 * square(s);
  const double logarithm = 0.5 / e * portable::log((1 - e * s) / (1 + e * s));
  const double T = Q / (1 - e2) - s / W + logarithm;
  return T * square(W) / (2 * portable::cos(lat));
}

// Latitude whose authalic function is Q, by Newton steps from the authalic latitude.  At a pole the
// derivative vanishes and the steps shrink only by half: there they are watched and extrapolated.
class WatchedInverse {
 public:
  WatchedInverse(double e, double Q, double lat) : e_(e), Q_(Q), lat_(lat) {}

  double lat() const { return lat_; }
  // A latitude was pushed past a pole, or all steps were used.
  bool limited() const { return limited_; }

  void solve() {
    while (steps_ < kNewtonSteps) {
      step();
      if (std::fabs(delta_) < kConverged) return;
    }
    watched();
    if (steps_ == kMostSteps) limited_ = true;
  }

 private:
  void step() {
    delta_ = newton_step(e_, Q_, lat_);
    lat_ += delta_;
    if (lat_ > kHalfPi) hold(kHalfPi);
    if (lat_ < -kHalfPi) hold(-kHalfPi);
    ++steps_;
  }

  void hold(double pole) {
    lat_ = pole;
    limited_ = true;
    done_ = true;
  }

  void watched() {
    done_ = false;  // what the first steps ran into does not count here
    int stalls = 0;
    int since_extrapolation = 0;
    double last_ratio = 0.1;
    double last_ratio_change = 1.0;
    double last_delta = delta_;
    double lat_b = lat_;
    double lat_c = lat_;
    while (steps_ < kMostSteps) {
      step();
      ++since_extrapolation;
      if (std::fabs(delta_) < kConverged) done_ = true;
      const double ratio = delta_ / last_delta;
      const double ratio_change = ratio - last_ratio;
      const double lat_a = lat_b;
      lat_b = lat_c;
      lat_c = lat_;
      const double sum = std::fabs(ratio_change) + std::fabs(last_ratio_change);
      if (std::fabs(ratio) > 0.4 && sum < 0.001 && since_extrapolation >= 3) {
        since_extrapolation = 0;
        lat_ = (lat_c * lat_a - square(lat_b)) / (lat_c - 2 * lat_b + lat_a);
        delta_ = sum * delta_ * 1000.0;
        done_ = true;
      }
      const bool regular = std::fabs(ratio) <= 0.9 && ratio >= 0 && std::fabs(ratio_change) <= 1.0;
      if (!regular || done_) {
        since_extrapolation = 0;
        if (std::fabs(delta_ / last_delta) < 1e-17) delta_ = last_delta;
        if (ratio < 0) done_ = true;
        if (held_near_pole()) return;
        if (++stalls == 3 || done_) return;
      }
      last_ratio = ratio;
      last_delta = delta_;
      last_ratio_change = ratio_change;
    }
  }

  // By contract: after a step without bound, as the vanishing cosine of either pole makes it, the
  // north pole is within the tolerance and is looked at first.
  bool held_near_pole() {
    const double tolerance = std::max(1.5 * std::fabs(delta_), 4e-05);
    if (std::fabs(lat_ - kHalfPi) < tolerance) {
      lat_ = kHalfPi;
      return true;
    }
    if (std::fabs(lat_ + kHalfPi) < tolerance) {
      lat_ = -kHalfPi;
      return true;
    }
    return false;
  }

  double e_, Q_, lat_;
  double delta_ = 0;
  int steps_ = 0;
  bool done_ = false;
  bool limited_ = false;
};

}  // namespace

void TWalbers_c(double e, double /*lon0*/, double lat0, double lat1, double lat2, double* n,
                double* C, double* rho0) {
  const auto at1 = sincos(lat1);
  const double m1 = square(parallel_radius(e * e, at1.sin, at1.cos));
  const double q1 = authalic_q(e, at1.sin);
  double cone = at1.sin;
  if (std::fabs(lat1 - lat2) >= 1e-13) {
    const auto at2 = sincos(lat2);
    const double m2 = square(parallel_radius(e * e, at2.sin, at2.cos));
    cone = (m1 - m2) / (authalic_q(e, at2.sin) - q1);
  }
  *n = cone;
  *C = m1 + cone * q1;
  *rho0 = albers_rho(e, *C, cone, sincos(lat0).sin);
}

Next AlbersForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                          TWstatus* status) const {
  if (std::fabs(in.y) > kLatLimit) {
    *status = TW_BAD_LATITUDE;
    return Next::none;
  }
  *status = TW_I_LATITUDE_LIMITED;
  const auto held = (*this)(in.x, in.y > 0 ? kHalfPi : -kHalfPi);
  out->x = held.x;
  out->y = held.y;
  return Next::point;
}

void TWalbers_f(double e, double lon0, double n, double C, double rho0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(AlbersForward{e, lon0, n, C, rho0}, count, in, out);
}

// The contract's own road, step by step.
Next AlbersInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                          TWstatus* status) const {
  const double sign = n_ < 0 ? -1 : 1;
  const double from_apex = rho0_ - in.y;
  const double rho = portable::hypot(in.x, from_apex) * sign;
  const double theta = std::fabs(rho) > 0 ? portable::atan2(sign * in.x, sign * from_apex) : 0;
  const double d = theta / n_;
  if (d < -kPi || d > kPi) {
    *status = TW_NOT_CONVERGED;  // outside the cone's fan
    return Next::none;
  }
  const double Q = (C_ - square(rho * n_)) / n_;
  double B = Q / 2;
  if (std::fabs(B) > kSineLimit) {
    *status = TW_NOT_CONVERGED;
    return Next::none;
  }
  if (std::fabs(B) > 1.0) {
    B = std::copysign(1.0, B);
    *status = TW_I_LATITUDE_LIMITED;
  }
  double lat = portable::asin(B);
  if (sphere_) {
    lat = hold_at_poles_of_sphere(lat);
  } else {
    WatchedInverse inverse(e_, Q, lat);
    inverse.solve();
    if (inverse.limited()) *status = TW_I_LATITUDE_LIMITED;
    lat = inverse.lat();
  }
  out->x = d + lon0_;
  out->y = lat;
  return Next::point;
}

void TWalbers_i(double e, double lon0, double n, double C, double rho0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(AlbersInverse(e, lon0, n, C, rho0), count, in, out);
}

Next AlbersScale::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_NOT_CONVERGED;
  return Next::none;
}

void TWalbers_s(double e, double k0, double C, double n, int32_t count, const CoordinateTriple* in,
                CoordinateTriple* out, TWstatus* status) {
  *status = over_points(AlbersScale{e, k0, C, n}, count, in, out);
}
