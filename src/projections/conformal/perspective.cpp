// Vertical and tilted perspective projections: what the contract says of the points that the
// formulas do not cover, and the exported functions.

#include "projections/conformal/perspective_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "projections/turn_points.hpp"
#include "tidewater/perspective.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

// The image is turned by rot less half a turn: by nothing for half a turn either way.
bool turns(double rot) { return std::fabs(std::fabs(rot) - kPi) > 1e-12; }

PerspectiveForward forward_of(double a, double e, double lon0, double lat0, double h, double p,
                              double phi_g) {
  const bool sphere = e == 0;
  const auto at = sincos(lat0);
  // On the sphere the geocentric latitude is the geodetic one.
  const double off = sphere ? 0 : lat0 - phi_g;
  return {sphere,
          a,
          e * e,
          lon0,
          at.sin,
          at.cos,
          h / a,
          1 / p,
          portable::cos(off) * p,
          portable::sin(off) * p};
}

PerspectiveInverse inverse_of(double a, double e, double lon0, double lat0, double h, double p,
                              double phi_g) {
  const double e2 = e * e;
  const auto at = sincos(lat0);
  const double off = e == 0 ? 0 : lat0 - phi_g;
  return {a,
          e2,
          lon0,
          h,
          at.sin,
          at.cos,
          portable::cos(off) * p,
          portable::sin(off) * p,
          1 - at.cos * at.cos * e2,
          1 - at.sin * at.sin * e2,
          2 * at.cos * at.sin * e2,
          1 - e2,
          (1 - square(portable::cos(phi_g)) * e2) * p * p};
}

}  // namespace

Next PerspectiveForward::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_NOT_CONVERGED;  // beyond the horizon; by contract on the sphere alone
  return Next::none;
}

Next PerspectiveInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                               TWstatus* status) const {
  const auto at = meet(in.x, in.y, in.z);
  *out = {at.lon, at.lat, in.z};
  *status = TW_I_LATITUDE_LIMITED;  // the passes were used up
  return Next::point;
}

}  // namespace tidewater::detail

void TWpersp_c(double a, double e, double lat0, double h, double h0, double* p, double* phi_g,
               TWstatus* status) {
  *status = TW_SUCCESS;
  const double height = h + h0;
  if (e == 0) {
    *phi_g = lat0;
    *p = height / a + 1;
    return;
  }
  const double e2 = e * e;
  const double sin0 = portable::sin(lat0);
  const double cos0 = portable::cos(lat0);
  const double n1 = a / std::sqrt(1 - sin0 * sin0 * e2);
  double latitude = lat0;
  double distance = 0;
  double latitude_step = 0;
  double distance_step = 0;
  for (int pass = 0; pass < kPerspectivePasses; ++pass) {
    const double previous_latitude = latitude;
    const double previous_distance = distance;
    distance = cos0 / portable::cos(latitude) * (height + n1) / a;
    latitude = lat0 - portable::asin(sin0 * n1 * e2 * cos0 / (distance * a));
    latitude_step = std::fabs(latitude - previous_latitude);
    distance_step = std::fabs(distance - previous_distance);
    if (latitude_step < 1e-15 && distance_step < 1e-15) break;
  }
  if (latitude_step > 1e-12 || distance_step > 1e-12) *status = TW_BAD_PARAMETER;
  *p = distance;
  *phi_g = latitude;
}

void TWpersp_vert_f(double a, double e, double lon0, double lat0, double /*h0*/, double h, double p,
                    double phi_g, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
  *status = over_points(forward_of(a, e, lon0, lat0, h, p, phi_g), count, in, out);
}

void TWpersp_vert_i(double a, double e, double lon0, double lat0, double /*h0*/, double h, double p,
                    double phi_g, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
  *status = over_points(inverse_of(a, e, lon0, lat0, h, p, phi_g), count, in, out);
}

void TWpersp_f(double a, double e, double lon0, double lat0, double h0, double h, double p,
               double phi_g, double tilt_a, double tilt_b, double rot, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  TWpersp_vert_f(a, e, lon0, lat0, h0, h, p, phi_g, count, in, out, status);
  if (!TW_OK(*status)) return;
  if (tilt_a != 0 || tilt_b != 0) {
    const auto at_a = sincos(tilt_a);
    const auto at_b = sincos(tilt_b);
    over_points(PerspectiveTilt{at_a.sin, at_a.cos, at_b.cos, a * at_b.sin / h}, count, out, out);
  }
  if (turns(rot)) turn_points(kPi - rot, count, out);
}

void TWpersp_i(double a, double e, double lon0, double lat0, double h0, double h, double p,
               double phi_g, double tilt_a, double tilt_b, double rot, int32_t count,
               CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  // By contract: the rotation is undone in the caller's input array.
  if (turns(rot)) turn_points(rot - kPi, count, in);
  const CoordinateTriple* upright = in;
  if (tilt_a != 0 || tilt_b != 0) {
    const auto at_a = sincos(tilt_a);
    const auto at_b = sincos(tilt_b);
    over_points(PerspectiveUntilt{at_a.sin, at_a.cos, at_b.cos, a * at_b.sin / h}, count, in, out);
    upright = out;
  }
  TWpersp_vert_i(a, e, lon0, lat0, h0, h, p, phi_g, count, upright, out, status);
}
