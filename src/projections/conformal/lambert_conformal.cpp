// Lambert conformal conic projection: constants, what the contract says of the points that the
// formulas do not cover, and the exported functions.

#include "projections/conformal/lambert_conformal_points.hpp"

#include <cmath>

#include "formulas/pole_hold.hpp"
#include "points/portable.hpp"
#include "tidewater/lambert_conformal.h"

using namespace tidewater::detail;

namespace {

constexpr double kPolarParallel = kHalfPi - 1e-12;

double radius_of_parallel(double e, double lat) {
  const auto at = sincos(lat);
  return parallel_radius(e * e, at.sin, at.cos);
}

// t(p) as it is printed: at a pole exactly 0, just past it negative, as the constants and the
// scale's held latitude need it.
double printed_tangent(double e, double lat) {
  return portable::tan(kQuarterPi - lat / 2) / eccentric_factor(e, portable::sin(lat));
}

// The latitude whose t(p) is w, by passes of the fixed point, fifteen at most.
double latitude_of(double e, double w, TWstatus* status) {
  if (std::fabs(e) <= kSeriesEccentricity) return ConformalInverse(e).of_tangent(w);
  constexpr int kMostPasses = 15;
  double lat = kHalfPi - 2 * portable::atan(w);
  double old = 0;
  int passes = 0;
  do {
    old = lat;
    lat = kHalfPi - 2 * portable::atan(w * eccentric_factor(e, portable::sin(old)));
    if (++passes == kMostPasses) {
      // By contract: a point that comes to rest in this very pass is told so too.
      *status = TW_I_LATITUDE_LIMITED;
      break;
    }
  } while (std::fabs(old - lat) > 1e-14);
  return lat;
}

}  // namespace

void TWlam_c(double e, double /*lon0*/, double lat0, double lat1, double lat2, double* C, double* n,
             double* rho0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (lat0 > kHalfPi || lat0 < -kHalfPi) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  const bool one_parallel = std::fabs(lat1 - lat2) < 1e-12;
  if (one_parallel && std::fabs(lat1) < 1e-12) {
    *status = TW_BAD_PARAMETER;
    return;
  }
  const double t1 = printed_tangent(e, lat1);
  const double m1 = radius_of_parallel(e, lat1);
  if (std::fabs(lat2 - lat1) > 1e-12) {
    const double t2 = printed_tangent(e, lat2);
    const double m2 = radius_of_parallel(e, lat2);
    const double apart = portable::log(t1) - portable::log(t2);
    if (std::fabs(apart) < 1e-12) {
      *status = TW_BAD_PARAMETER;
      return;
    }
    *n = (portable::log(m1) - portable::log(m2)) / apart;
  } else {
    *n = portable::sin(lat1);
  }

  if (one_parallel && std::fabs(lat1) > kPolarParallel) {
    // The cone has opened into the plane of the polar stereographic.
    const double value = 2 * eccentric_factor(e, 1.0) / std::sqrt(1 - square(e));
    *C = *n < 0 ? -value : value;
  } else {
    const double w = portable::pow(t1, *n);
    if (std::fabs(w * *n) < 1e-12) {
      *status = TW_BAD_PARAMETER;  // n stays written: parallels symmetric about the equator
      return;
    }
    *C = m1 / (*n * w);
  }

  const bool north = LambertForward::at_north_pole(lat0);
  if (north || LambertForward::at_south_pole(lat0)) {
    if (north ? *n > 0 : *n < 0) {
      *rho0 = 0;
    } else {
      *status = TW_BAD_LATITUDE;  // n and C stay written
    }
  } else {
    *rho0 = portable::pow(printed_tangent(e, lat0), *n) * *C;
  }
}

Next LambertForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                           TWstatus* status) const {
  const bool at_apex = n > 0 ? at_north_pole(in.y) : n < 0 && at_south_pole(in.y);
  if (in.y > kHalfPi || in.y < -kHalfPi || !at_apex) {
    *status = TW_BAD_LATITUDE;
    return Next::none;  // unlike Mercator's, the pole away from the apex ends the array
  }
  out->x = 0;
  out->y = rho0;
  return Next::point;
}

void TWlam_f(double e, double lon0, double C, double n, double rho0, int32_t count,
             const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(LambertForward{e, lon0, C, n, rho0}, count, in, out);
}

// About the apex, and beyond the series: the contract's own road.
Next LambertInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                           TWstatus* status) const {
  double lon = lon0_;
  double lat = 0;
  if (rho0_ == 0 && portable::hypot(in.x, in.y) < 1e-13) {
    lat = n_ < 0 ? -kHalfPi : kHalfPi;
  } else {
    const double from_apex = rho0_ - in.y;
    const double rho = portable::hypot(in.x, from_apex) * (n_ < 0 ? -1 : 1);
    double theta = 0;
    if (std::fabs(rho) > 1e-13) {
      theta = n_ > 0 ? portable::atan2(in.x, from_apex) : portable::atan2(-in.x, -from_apex);
    }
    lon = theta * over_n_ + lon0_;
    lat = latitude_of(e_, portable::pow(rho / C_, over_n_), status);
  }
  out->x = at_pole(lat) ? lon0_ : wrap_at_or_below_then_above(lon);
  out->y = lat;
  return Next::point;
}

void TWlam_i(double e, double lon0, double C, double n, double rho0, int32_t count,
             CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status) {
  *status = over_points(LambertInverse(e, lon0, C, n, rho0), count, in, out);
}

Next LambertScale::other(const CoordinateTriple& in, CoordinateTriple* out,
                         TWstatus* status) const {
  double k = k0;
  if (in.y > kHalfPi || in.y < -kHalfPi) {
    *status = TW_BAD_LATITUDE;
  } else {
    const double lat = hold_off_poles(in.y, kPoleMargin);
    const double m = radius_of_parallel(e, lat);
    if (std::fabs(m) >= 1e-10) {
      // Held just past the pole, t is negative: its power stands for integer n alone.
      k = n * k0 * (portable::pow(printed_tangent(e, lat), n) * C) / m;
    } else {
      *status = TW_BAD_LATITUDE;
    }
  }
  *out = {k, k, k * k};
  return Next::point;
}

void TWlam_s(double e, double k0, double C, double n, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = over_points(LambertScale{e, k0, C, n}, count, in, out);
}
