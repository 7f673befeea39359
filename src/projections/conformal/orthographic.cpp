// Orthographic projection: what the contract says of the points that the formulas do not cover, and
// the exported functions.

#include "projections/conformal/orthographic_points.hpp"

#include <algorithm>
#include <cmath>

#include "points/portable.hpp"
#include "tidewater/geocentric.h"
#include "tidewater/orthographic.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

// What stands in x of a scale that has still to take over the one before it.
constexpr double kToBeHeld = 0.0;

OrthographicFrame frame_of(double e, double x0, double y0, double z0, const double* r) {
  return {e * e, {x0, y0, z0}, {r[0], r[1], r[2]}, {r[3], r[4], r[5]}, {r[6], r[7], r[8]}};
}

double dot(const Vector3& a, const Vector3& b) { return a.x * b.x + a.y * b.y + a.z * b.z; }

}  // namespace

Next OrthographicForward::other(const CoordinateTriple&, CoordinateTriple*,
                                TWstatus* status) const {
  *status = TW_I_LATITUDE_LIMITED;  // beyond the horizon
  return Next::none;
}

// Outside the disc, or where the line of sight grazes the surface: z is sought along the local
// vertical until the point stands on the surface.
Next OrthographicInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                                TWstatus* status) const {
  constexpr int kMostPasses = 50;
  constexpr double kTolerance = 1e-9;
  const double x = in.x;
  const double y = in.y;
  const double r2 = x * x + y * y;
  if (std::sqrt(r2) >= limit) {
    *status = TW_I_LATITUDE_LIMITED;
    *stopped = true;  // outside the disc
    return Next::none;
  }
  const auto& [e2, origin, east, north, up] = frame;
  double z = -r2 / 2;
  double held_lon = lon0;
  double held_lat = lat0;
  CoordinateTriple llh = {};
  for (int pass = 0;; ++pass) {
    const CoordinateTriple geocentric = {origin.x + east.x * x + north.x * y + up.x * z,
                                         origin.y + east.y * x + north.y * y + up.y * z,
                                         origin.z + east.z * x + north.z * y + up.z * z};
    TWxyz_to_llh(1.0, e, 1, &geocentric, &llh, status);
    const double sin_lat = portable::sin(llh.y);
    const double cos_lat = portable::cos(llh.y);
    const double nu = 1 / std::sqrt(1 - e2 * (sin_lat * sin_lat));
    const Vector3 offset = {nu * portable::cos(llh.x) * cos_lat - origin.x,
                            nu * portable::sin(llh.x) * cos_lat - origin.y,
                            (1 - e2) * nu * sin_lat - origin.z};
    const double dz = dot(up, offset) - z;
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
  out->x = llh.x;
  out->y = llh.y;
  return Next::point;
}

Next OrthographicScale::other(const CoordinateTriple&, CoordinateTriple* out,
                              TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  out->x = kToBeHeld;
  return Next::point;
}

}  // namespace tidewater::detail

void TWortho_c(double e, double lon0, double lat0, double* x0, double* y0, double* z0, double* r,
               TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_lon = portable::sin(lon0);
  const double cos_lon = portable::cos(lon0);
  const double sin_lat = portable::sin(lat0);
  const double cos_lat = portable::cos(lat0);
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
  *status = over_points(
      OrthographicForward{frame_of(e, x0, y0, z0, r), lon0, lat0, sincos(lon0), sincos(lat0)},
      count, in, out);
}

void TWortho_i(double /*a*/, double e, double lon0, double lat0, double x0, double y0, double z0,
               const double* r, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  bool stopped = false;
  const OrthographicInverse kernel = {frame_of(e, x0, y0, z0, r),
                                      e,
                                      lon0,
                                      lat0,
                                      std::sqrt(1 - e * e),
                                      r[6] * r[6] + r[7] * r[7] + r[8] * r[8] / (1 - e * e),
                                      &stopped};
  // Read before anything is written: in and out may be the same array.
  CoordinateTriple last = {0, 0, 0};
  for (int32_t i = std::max(count, int32_t{0}) - 1; i >= 0; --i) {
    last = in[i];
    if (!(std::sqrt(last.x * last.x + last.y * last.y) < kOrthographicCentre)) break;
  }
  *status = over_points(kernel, count, in, out);
  if (*status == TW_SUCCESS || stopped) return;
  // By contract: each point that is computed sets the word anew, so that the last one's stands.
  CoordinateTriple ignored = {};
  *status = TW_SUCCESS;
  one_point(kernel, last, &ignored, status);
}

void TWortho_s(double lon0, double lat0, double /*k0*/, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out, TWstatus* status) {
  const auto at = sincos(lat0);
  *status = over_points(OrthographicScale{lon0, at.sin, at.cos}, count, in, out);
  if (*status == TW_SUCCESS) return;
  // By contract: at a bad latitude h stays that of the previous point, 0 at the first.
  double h = 0;
  for (int32_t i = 0; i < count; ++i) {
    if (out[i].x == kToBeHeld) out[i] = {1.0, h, h};
    h = out[i].y;
  }
}
