// Standard Molodensky shift of geodetic coordinates between two ellipsoids.

#include <cmath>

#include "formulas/constants.hpp"
#include "tidewater/datum.h"
#include "tidewater/foundation.h"

using namespace tidewater::detail;

namespace {

// Beyond 89 degrees the formula is ill-conditioned, and a point goes by geocentric coordinates.
constexpr double kGeocentricLimit = 1.5533430342749535;

class Molodensky {
 public:
  Molodensky(double a, double e, double da, double df, double dx, double dy, double dz)
      : a_(a),
        e_(e),
        e2_(e * e),
        r_(std::sqrt(1 - e2_)),
        da_(da),
        df_(df),
        dx_(dx),
        dy_(dy),
        dz_(dz),
        target_a_(a + da) {
    const double f = 1 - r_ + df;
    target_e_ = std::sqrt(2 * f - f * f);
  }

  // Shift of longitude, latitude and height at a point.
  CoordinateTriple shift(const CoordinateTriple& p) const {
    const double sin_lon = std::sin(p.x);
    const double cos_lon = std::cos(p.x);
    const double sin_lat = std::sin(p.y);
    const double cos_lat = std::cos(p.y);
    const double w2 = 1 - e2_ * square(sin_lat);
    const double nu = a_ / std::sqrt(w2);
    const double rho = (1 - e2_) * nu / w2;
    const double dlat =
        ((rho / r_ + r_ * nu) * cos_lat * sin_lat * df_ - dx_ * cos_lon * sin_lat -
         dy_ * sin_lon * sin_lat + e2_ * cos_lat * sin_lat * nu * da_ / a_ + dz_ * cos_lat) /
        (rho + p.z);
    const double dlon = (-dx_ * sin_lon + dy_ * cos_lon) / ((nu + p.z) * cos_lat);
    const double dh = dx_ * cos_lon * cos_lat + dy_ * sin_lon * cos_lat + dz_ * sin_lat -
                      a_ / nu * da_ + square(sin_lat) * r_ * nu * df_;
    return {dlon, dlat, dh};
  }

  CoordinateTriple forward_geocentric(CoordinateTriple p, TWstatus* status) const {
    TWllh_to_xyz(a_, e_, 1, &p, &p, status);
    p = {p.x + dx_, p.y + dy_, p.z + dz_};
    TWxyz_to_llh(target_a_, target_e_, 1, &p, &p, status);
    return p;
  }

  CoordinateTriple inverse_geocentric(CoordinateTriple p, TWstatus* status) const {
    TWllh_to_xyz(target_a_, target_e_, 1, &p, &p, status);
    p = {p.x - dx_, p.y - dy_, p.z - dz_};
    TWxyz_to_llh(a_, e_, 1, &p, &p, status);
    return p;
  }

 private:
  double a_, e_, e2_, r_;
  double da_, df_, dx_, dy_, dz_;
  double target_a_, target_e_;
};

}  // namespace

void TWmol_std_f(double a, double e, double da, double df, double dx, double dy, double dz,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  const Molodensky datum(a, e, da, df, dx, dy, dz);
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple p = in[i];
    if (std::fabs(p.y) > kGeocentricLimit) {
      out[i] = datum.forward_geocentric(p, status);
      continue;
    }
    const auto d = datum.shift(p);
    out[i] = {p.x + d.x, p.y + d.y, p.z + d.z};
  }
}

void TWmol_std_i(double a, double e, double da, double df, double dx, double dy, double dz,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  const Molodensky datum(a, e, da, df, dx, dy, dz);
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple p = in[i];
    if (std::fabs(p.y) > kGeocentricLimit) {
      out[i] = datum.inverse_geocentric(p, status);
      continue;
    }
    // By contract: two passes, no test of convergence.
    CoordinateTriple estimate = p;
    for (int pass = 0; pass < 2; ++pass) {
      const auto d = datum.shift(estimate);
      estimate = {p.x - d.x, p.y - d.y, p.z - d.z};
    }
    out[i] = estimate;
  }
}
