// Radii, equal spheres, meridian arc, conformal latitude and normal gravity of an ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 15-25;
// W. A. Heiskanen and H. Moritz, Physical Geodesy (1967), on normal gravity.

#include <cmath>

#include "formulas/constants.hpp"
#include "foundation/meridian_arc.hpp"
#include "points/portable.hpp"
#include "tidewater/ellipsoid.h"

namespace tidewater::detail {
namespace {

// How far beyond a pole the meridian functions hold a latitude instead of refusing it.
constexpr double kPoleMargin = 1e-12;
// Below this eccentricity the meridian functions take the sphere.
constexpr double kSphereLimit = 1e-12;

// Third flattening up to which the inverse takes its series; ellipsoids of the earth have 0.0017.
constexpr double kSeriesLimit = 0.003;

}  // namespace

MeridianArc::MeridianArc(double a, double e) : a_(a), sphere_(e < kSphereLimit) {
  if (e >= 1 || e < 0) {
    bad_ = TW_BAD_ECCENTRICITY;
  } else if (a <= 0) {
    bad_ = TW_BAD_SEMI_MAJOR;
  }
  const double b = a * std::sqrt(1 - e * e);
  const double n = (a - b) / (a + b);
  const double n2 = n * n;
  const double n3 = n2 * n;
  const double n4 = n2 * n2;
  const double c2 = -1.5 * (n - n3 / 8);
  const double c4 = 0.9375 * (n2 - n4 / 4);
  const double c6 = -0.7291666666666666 * n3;
  const double c8 = 0.615234375 * n4;
  n_ = n;
  g_ = 0.5 * (a + b);  // a / (1 + n)
  mean_ = 1 + n2 / 4 + n4 / 64;
  t0_ = c2 - c6;
  t1_ = 2 * c4 - 4 * c8;
  t2_ = 4 * c6;
  t3_ = 8 * c8;
  per_radian_ = sphere_ ? a_ : g_ * mean_;
  if (sphere_) g_ = 0;
}

MeridianFoot::MeridianFoot(const MeridianArc& arc)
    : serves_(arc.good() && (arc.sphere_ || arc.n_ < kSeriesLimit)),
      quarter_(arc.per_radian_ * kHalfPi),
      over_per_radian_(1 / arc.per_radian_),
      series_() {
  if (arc.sphere_) return;
  const double n = arc.n_;
  const double n2 = n * n;
  const double n3 = n2 * n;
  const double n4 = n2 * n2;
  const double n5 = n4 * n;
  const double n6 = n5 * n;
  // The terms in n^5 of the arc that its series leaves out are added to those of the inverse.
  series_ = SineSeries<6>::of({1.5 * n - 27.0 / 32 * n3 + (269.0 / 512 + 3.0 / 128) * n5,
                               21.0 / 16 * n2 - 55.0 / 32 * n4 + 6759.0 / 4096 * n6,
                               151.0 / 96 * n3 + (175.0 / 768 - 417.0 / 128) * n5,
                               1097.0 / 512 * n4 - 15543.0 / 2560 * n6,
                               (8011.0 / 2560 - 693.0 / 1280) * n5, 293393.0 / 61440 * n6});
}

double MeridianArc::tail(double lat) const {
  const auto [s, c] = points::sincos(2 * lat);
  return (((t3_ * c + t2_) * c + t1_) * c + t0_) * s;
}

TWstatus MeridianArc::forward(double lat, double* distance) const {
  if (bad_ != TW_SUCCESS) return bad_;
  TWstatus status = TW_SUCCESS;
  if (std::fabs(lat) > kHalfPi + kPoleMargin) return TW_BAD_LATITUDE;
  if (std::fabs(lat) > kHalfPi) {
    status = TW_I_LATITUDE_LIMITED;
    lat = hold_at_pole(lat);
  }
  *distance = sphere_ ? a_ * lat : arc(lat, sincos(lat));
  return status;
}

TWstatus MeridianArc::inverse(double distance, double* lat) const {
  if (bad_ != TW_SUCCESS) return bad_;
  // The limits are those of the mean term of the arc, not of the arc computed at the pole.
  const double size = std::fabs(distance);
  if (per_radian_ * (kHalfPi + kPoleMargin) < size) return TW_BAD_LATITUDE;
  if (per_radian_ * kHalfPi < size) {
    *lat = hold_at_pole(distance);
    return TW_I_LATITUDE_LIMITED;
  }
  if (sphere_) {
    *lat = distance / a_;
    return TW_SUCCESS;
  }
  double p = 0;
  if (n_ < kSeriesLimit) {
    // Where the rounds below come to rest within a few, the series is there at once.
    p = MeridianFoot(*this).latitude(distance);
  } else {
    const double start = distance * (1 + n_) / (mean_ * a_);
    p = start;
    constexpr int kMostRounds = 50;
    double previous = 0;
    int rounds = 0;
    do {
      previous = p;
      p = start - tail(previous) / mean_;
      ++rounds;
    } while (!(std::fabs(p - previous) <= 1e-12) && rounds < kMostRounds);
    // By contract: the count alone decides, also when the last round did converge.
    if (rounds == kMostRounds) return TW_BAD_PARAMETER;
  }
  // Also for a not-a-number, with which the rounds would run into their limit.
  if (!(std::fabs(p) <= kHalfPi)) return TW_BAD_PARAMETER;
  *lat = p;
  return TW_SUCCESS;
}

}  // namespace tidewater::detail

using namespace tidewater::detail;

void TWRparal(double a, double e, double lat, double* radius, TWstatus* status) {
  *status = TW_SUCCESS;
  if (std::fabs(lat) > kHalfPi) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  const double w = 1 - square(e) * square(portable::sin(lat));
  *radius = a * portable::cos(lat) / std::sqrt(w);
}

void TWRmerid(double a, double e, double lat, double* radius, TWstatus* status) {
  *status = TW_SUCCESS;
  if (std::fabs(lat) > kHalfPi) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  const double w = 1 - square(e) * square(portable::sin(lat));
  *radius = a * (1 - square(e)) / std::sqrt(cube(w));
}

void TWgaussian_R(double a, double e, double lat, double* radius, TWstatus* status) {
  *status = TW_SUCCESS;
  if (square(e) >= 1) {
    *status = TW_BAD_ECCENTRICITY;
    return;
  }
  const double w = 1 - square(e) * square(portable::sin(lat));
  *radius = a * std::sqrt(1 - square(e)) / w;
}

void TWeq_surf_R(double a, double e, double* radius, TWstatus* status) {
  *status = TW_SUCCESS;
  const double q = square(e);
  if (q >= 1) {
    *status = TW_BAD_ECCENTRICITY;
    return;
  }
  *radius =
      a * (1 - ((0.022156084656084655 * q + 0.04722222222222222) * q + 0.16666666666666666) * q);
}

void TWeq_vol_R(double a, double e, double* radius, TWstatus* status) {
  *status = TW_SUCCESS;
  if (square(e) >= 1) {
    *status = TW_BAD_ECCENTRICITY;
    return;
  }
  *radius = a * portable::pow(1 - square(e), 0.16666666666666666);
}

void TWmerid_dist_f(double a, double e, double lat, double* distance, TWstatus* status) {
  *status = MeridianArc(a, e).forward(lat, distance);
}

void TWmerid_dist_i(double a, double e, double distance, double* lat, TWstatus* status) {
  *status = MeridianArc(a, e).inverse(distance, lat);
}

void TWdM_dphi(double a, double e2, double lat, double* derivative, TWstatus* status) {
  *status = TW_SUCCESS;
  // By contract: a negative square is let through, unlike a negative eccentricity in the arc
  // functions.
  if (e2 >= 1) {
    *status = TW_BAD_ECCENTRICITY;
    return;
  }
  if (a <= 0) {
    *status = TW_BAD_SEMI_MAJOR;
    return;
  }
  if (std::fabs(lat) > kHalfPi + kPoleMargin) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  if (std::fabs(lat) > kHalfPi) {
    *status = TW_I_LATITUDE_LIMITED;
    lat = hold_at_pole(lat);
  }
  if (e2 < kSphereLimit) {
    *derivative = a;
    return;
  }
  const double b = a * std::sqrt(1 - e2);
  const double n = (a - b) / (a + b);
  const double n2 = n * n;
  const double n3 = n2 * n;
  const double n4 = n2 * n2;
  const double mean = 1 + n2 / 4 + n4 / 64;
  const double d2 = 1.5 * (n - n3 / 8);
  const double d4 = 0.9375 * (n2 - n4 / 4);
  const double d6 = 0.7291666666666666 * n3;
  const double d8 = 0.615234375 * n4;
  *derivative = a / (1 + n) *
                (mean - 2 * d2 * portable::cos(2 * lat) + 4 * d4 * portable::cos(4 * lat) -
                 6 * d6 * portable::cos(6 * lat) + 8 * d8 * portable::cos(8 * lat));
}

void TWgeod_conflat(double e, double lat, double* conformal_lat, TWstatus* status) {
  *status = TW_SUCCESS;
  if (std::fabs(lat) > kHalfPi) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  const double es = e * portable::sin(lat);
  *conformal_lat = 2 * portable::atan(portable::pow((1 - es) / (1 + es), e / 2) *
                                      portable::tan(lat / 2 + kQuarterPi)) -
                   kHalfPi;
}

void TWconflat_geod(double e, double conformal_lat, double* lat, TWstatus* status) {
  *status = TW_SUCCESS;
  if (conformal_lat < -kHalfPi || conformal_lat > kHalfPi) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  constexpr int kMostRounds = 10;
  const double t = portable::tan(conformal_lat / 2 + kQuarterPi);
  double p = conformal_lat;
  double previous = 0;
  int rounds = 0;
  do {
    previous = p;
    const double es = e * portable::sin(previous);
    p = 2 * portable::atan(portable::pow((1 + es) / (1 - es), e / 2) * t) - kHalfPi;
    ++rounds;
  } while (!(std::fabs(p - previous) <= 1e-12) && rounds < kMostRounds);
  // By contract: the count alone decides, and the word is that of a bad latitude.
  if (rounds == kMostRounds) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  *lat = p;
}

int32_t TWnormal_grav(double a, double e, double gamma_equator, double gamma_pole, double lat,
                      double height, double* gravity, TWstatus* status) {
  *status = TW_SUCCESS;
  const double b = a * std::sqrt(1 - square(e));
  const double k = (b * gamma_pole) / (a * gamma_equator) - 1;
  const double s2 = square(portable::sin(lat));
  *gravity = gamma_equator * (1 + k * s2) / std::sqrt(1 - square(e) * s2) - height * 3.086e-6;
  return 1;
}
