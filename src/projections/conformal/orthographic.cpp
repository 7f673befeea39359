// Orthographic projection of the ellipsoid by way of geocentric space.

#include <cmath>

#include "formulas/constants.hpp"
#include "formulas/pole_hold.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"

using namespace tidewater::detail;

namespace {

// A point of the surface as seen from the origin: geocentric differences for the unit ellipsoid.
struct Offset {
  double x, y, z;

  // Along row n of the rotation: 0 east, 1 north, 2 up.
  double along(const double* r, int n) const {
    return r[3 * n] * x + r[3 * n + 1] * y + r[3 * n + 2] * z;
  }
};

struct Origin {
  double e2, x0, y0, z0;

  Offset offset(double lon, double sin_lat, double cos_lat) const {
    const double nu = 1 / std::sqrt(1 - sin_lat * sin_lat * e2);
    return {nu * std::cos(lon) * cos_lat - x0, nu * std::sin(lon) * cos_lat - y0,
            (1 - e2) * nu * sin_lat - z0};
  }
};

}  // namespace

void TWortho_c(double e, double lon0, double lat0, double* x0, double* y0, double* z0, double* r,
               TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_lon = std::sin(lon0);
  const double cos_lon = std::cos(lon0);
  const double sin_lat = std::sin(lat0);
  const double cos_lat = std::cos(lat0);
  r[0] = -sin_lon;
  r[1] = cos_lon;
  r[2] = 0.0;
  r[3] = -sin_lat * cos_lon;
  r[4] = -sin_lat * sin_lon;
  r[5] = cos_lat;
  r[6] = cos_lat * cos_lon;
  r[7] = cos_lat * sin_lon;
  r[8] = sin_lat;
  const double e2 = e * e;
  const double nu = 1 / std::sqrt(1 - sin_lat * sin_lat * e2);
  *x0 = nu * cos_lat * cos_lon;
  *y0 = nu * cos_lat * sin_lon;
  *z0 = (1 - e2) * nu * sin_lat;
}

void TWortho_f(double /*a*/, double e, double lon0, double lat0, double x0, double y0, double z0,
               const double* r, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = TW_SUCCESS;
  const Origin origin = {e * e, x0, y0, z0};
  const double sin_lat0 = std::sin(lat0);
  const double cos_lat0 = std::cos(lat0);
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    if (std::fabs(lon - lon0) < 1e-12 && std::fabs(lat - lat0) < 1e-12) {
      out[i].x = 0;
      out[i].y = 0;
      continue;
    }
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    // The arc cosine decides, but below zero alone it can be more than a quarter turn.
    const double cc = cos_lat * std::cos(lon - lon0) * cos_lat0 + sin_lat * sin_lat0;
    if (cc <= 0 && std::acos(cc) > kHalfPi) {  // beyond the horizon
      *status = TW_I_LATITUDE_LIMITED;
      return;
    }
    const Offset d = origin.offset(lon, sin_lat, cos_lat);
    out[i].x = d.along(r, 0);
    out[i].y = d.along(r, 1);
  }
}

void TWortho_i(double /*a*/, double e, double lon0, double lat0, double x0, double y0, double z0,
               const double* r, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr int kMostPasses = 50;
  constexpr double kTolerance = 1e-9;
  const Origin origin = {e * e, x0, y0, z0};
  const double f = 1 - std::sqrt(1 - e * e);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double r2 = x * x + y * y;
    if (std::sqrt(r2) < 1e-9) {
      out[i].x = lon0;
      out[i].y = lat0;
      continue;
    }
    if (std::sqrt(r2) >= 1 - f) {  // outside the disc
      *status = TW_I_LATITUDE_LIMITED;
      return;
    }
    // z is sought along the local vertical until the point stands on the surface.
    double z = -r2 / 2;
    double held_lon = lon0;
    double held_lat = lat0;
    CoordinateTriple llh = {};
    for (int pass = 0;; ++pass) {
      const CoordinateTriple geocentric = {x0 + r[0] * x + r[3] * y + r[6] * z,
                                           y0 + r[1] * x + r[4] * y + r[7] * z,
                                           z0 + r[2] * x + r[5] * y + r[8] * z};
      // By contract: the caller's word, so that one left by an earlier point does not survive.
      TWxyz_to_llh(1.0, e, 1, &geocentric, &llh, status);
      const Offset d = origin.offset(llh.x, std::sin(llh.y), std::cos(llh.y));
      const double dz = d.along(r, 2) - z;
      const double g2 = llh.z * llh.z;
      if (pass > 0) {
        const bool still =
            std::fabs(llh.y - held_lat) <= kTolerance && std::fabs(llh.x - held_lon) <= kTolerance;
        if (still || std::fabs(dz / g2) <= kTolerance) break;
      }
      held_lon = llh.x;
      held_lat = llh.y;
      // A point that stands on the surface to the last bit stays: nothing over nothing is no step.
      if (dz != 0) z = g2 / dz + z;
      if (pass > kMostPasses) {
        *status = TW_I_LATITUDE_LIMITED;  // the values at hand are written
        break;
      }
    }
    out[i].x = llh.x;
    out[i].y = llh.y;
  }
}

void TWortho_s(double lon0, double lat0, double /*k0*/, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_lat0 = std::sin(lat0);
  const double cos_lat0 = std::cos(lat0);
  double h = 0;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    double lat = in[i].y;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status =
          TW_BAD_LATITUDE;  // By contract: h stays that of the previous point, 0 at the first.
    } else {
      lat = hold_off_poles(lat, 1e-10);
      h = std::cos(lon - lon0) * std::cos(lat) * cos_lat0 + std::sin(lat) * sin_lat0;
    }
    // By contract: k0 has no part in it.
    out[i] = {1.0, h, h};
  }
}
