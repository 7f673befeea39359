// Albers equal-area conic projection of the ellipsoid.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 98-103.

#include <algorithm>
#include <cmath>

#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "projections/authalic.hpp"
#include "projections/conformal/meridian_series.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

constexpr double kConverged = 1e-13;
constexpr double kLatLimit = 1.5707963267958966;  // a latitude up to here is held at the pole
constexpr double kSineLimit = 1.0000000000001;
constexpr int kNewtonSteps = 12;
constexpr int kMostSteps = 30;

// Newton's step towards the latitude whose authalic function is Q.  At a pole, and on all but a
// sphere, the course of the steps hangs on the last digit: the terms stand as they are printed.
double newton_step(double e, double Q, double lat) {
  const double e2 = square(e);
  const double s = std::sin(lat);
  const double W = 1 - e2 * square(s);
  const double T = Q / (1 - e2) - s / W + authalic_logarithm(e, s);
  return T * square(W) / (2 * std::cos(lat));
}

// The same by the faster function, for where nothing hangs on the last digit.
double fast_newton_step(double e, double Q, double lat) {
  const double s = std::sin(lat);
  const double W = 1 - square(e * s);
  return (Q - authalic_q(e, s)) * square(W) / (2 * (1 - square(e)) * std::cos(lat));
}

// Latitude whose authalic function is Q, by Newton steps from the authalic latitude.  At a pole the
// derivative vanishes and the steps shrink only by half: there they are watched and extrapolated.
class AuthalicInverse {
 public:
  AuthalicInverse(double e, double Q, double lat) : e_(e), Q_(Q), lat_(lat) {}

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

// Latitude whose authalic function is Q, on ellipsoids of small eccentricity and away from the
// poles.
//
// From the authalic latitude Newton's steps converge there within six, without coming near a pole,
// and end below 1e-13 without a word.  The series of Snyder 1987, eq. 3-18, starts within 1e-7 of
// the same latitude, so that one step is left.
class NearbyAuthalicInverse {
 public:
  explicit NearbyAuthalicInverse(double e)
      : e_(e), pole_(authalic_q(e, 1)), usable_(kLogarithmEccentricity <= e && e <= 0.1) {
    const double e2 = square(e);
    const double e4 = square(e2);
    const double e6 = e4 * e2;
    series_ = CosinePowerSeries::of(e2 / 3 + 31 * e4 / 180 + 517 * e6 / 5040,
                                    23 * e4 / 360 + 251 * e6 / 3780, 761 * e6 / 45360, 0);
  }

  bool covers(double Q) const { return usable_ && std::fabs(Q) < 0.99 * pole_; }

  double latitude(double Q) const {
    const double sin_beta = Q / pole_;
    const double cos2_beta = 1 - square(sin_beta);
    const double lat = std::asin(sin_beta) + series_.sum(2 * sin_beta * std::sqrt(cos2_beta),
                                                         cos2_beta - square(sin_beta));
    return lat + fast_newton_step(e_, Q, lat);
  }

 private:
  double e_, pole_;
  bool usable_;
  CosinePowerSeries series_;
};

double held_near_pole_of_sphere(double lat) {
  constexpr double kTolerance = 4.0000000000000003e-07;
  if (std::fabs(lat - kHalfPi) < kTolerance) return kHalfPi;
  if (std::fabs(lat + kHalfPi) < kTolerance) return -kHalfPi;
  return lat;
}

double radius_of_parallel(double e, double lat) {
  return parallel_radius(square(e), std::sin(lat), std::cos(lat));
}

double rho_of(double e, double C, double n, double sin_lat) {
  return std::sqrt(C - authalic_q(e, sin_lat) * n) / n;
}

}  // namespace

void TWalbers_c(double e, double /*lon0*/, double lat0, double lat1, double lat2, double* n,
                double* C, double* rho0) {
  const double m1 = square(radius_of_parallel(e, lat1));
  const double q1 = authalic_q(e, std::sin(lat1));
  double cone = std::sin(lat1);
  if (std::fabs(lat1 - lat2) >= 1e-13) {
    const double m2 = square(radius_of_parallel(e, lat2));
    cone = (m1 - m2) / (authalic_q(e, std::sin(lat2)) - q1);
  }
  const double constant = m1 + cone * q1;
  *n = cone;
  *C = constant;
  *rho0 = rho_of(e, constant, cone, std::sin(lat0));
}

void TWalbers_f(double e, double lon0, double n, double C, double rho0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    double lat = in[i].y;
    const double theta = wrap_turns_below_then_above(in[i].x - lon0) * n;
    if (std::fabs(lat) > kLatLimit) {
      *status = TW_BAD_LATITUDE;
      return;
    }
    if (std::fabs(lat) > kHalfPi) {
      *status = TW_I_LATITUDE_LIMITED;
      lat = lat > 0 ? kHalfPi : -kHalfPi;
    }
    const double rho = rho_of(e, C, n, std::sin(lat));
    out[i].x = std::sin(theta) * rho;
    out[i].y = rho0 - std::cos(theta) * rho;
  }
}

void TWalbers_i(double e, double lon0, double n, double C, double rho0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double sign = n < 0 ? -1 : 1;
  const NearbyAuthalicInverse nearby(e);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double from_apex = rho0 - in[i].y;
    const double rho = std::hypot(x, from_apex) * sign;
    const double theta = std::fabs(rho) > 0 ? std::atan2(sign * x, sign * from_apex) : 0;
    const double d = theta / n;
    if (d < -kPi || d > kPi) {
      *status = TW_NOT_CONVERGED;  // outside the cone's fan
      return;
    }
    const double Q = (C - square(rho * n)) / n;
    double B = Q / 2;
    if (std::fabs(B) > kSineLimit) {
      *status = TW_NOT_CONVERGED;
      return;
    }
    if (std::fabs(B) > 1.0) {
      B = std::copysign(1.0, B);
      *status = TW_I_LATITUDE_LIMITED;
    }
    double lat = 0;
    if (e <= 1e-13) {
      lat = held_near_pole_of_sphere(std::asin(B));
    } else if (nearby.covers(Q)) {
      lat = nearby.latitude(Q);
    } else {
      AuthalicInverse inverse(e, Q, std::asin(B));
      inverse.solve();
      if (inverse.limited()) *status = TW_I_LATITUDE_LIMITED;
      lat = inverse.lat();
    }
    out[i].x = d + lon0;  // not wrapped
    out[i].y = lat;
  }
}

void TWalbers_s(double e, double k0, double C, double n, int32_t count, const CoordinateTriple* in,
                CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const bool polar = std::fabs(n) > 0.9999999999999;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_NOT_CONVERGED;
      return;
    }
    const double s = std::sin(lat);
    const double rho = rho_of(e, C, n, s);
    double k = 1.0;
    if (!(polar && std::fabs(rho) < 1e-5)) {
      const double m = parallel_radius(e2, s, std::cos(lat));
      k = std::fabs(m) >= 1e-13 ? rho * n / m
                                : -1.0;  // By contract: -1 marks a pole without a scale
    }
    const double h = k < 0 ? 0.0 : 1 / k;
    out[i] = {k * k0, h * k0, h * k * k0 * k0};
  }
}
