// Van der Grinten projection: what the contract says of the points that the formulas do not cover,
// and the exported functions.

#include "projections/special/van_der_grinten_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "projections/special/cycle_watch.hpp"
#include "tidewater/van_der_grinten.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

// Latitude of (X, Y) in units of pi, by Newton; Y is the size of the ordinate.
double latitude_of(double X, double Y, TWstatus* status) {
  double p = 2 * portable::atan(Y);
  double previous = p + 1;
  CycleWatch watch;
  while (std::fabs(p - previous) > 1e-12) {
    previous = p;
    const double s = 2 * p / kPi;  // the sine of theta
    if (std::fabs(s) > 1) {
      *status = TW_I_LATITUDE_LIMITED;
      break;
    }
    const double c = cosine_of_sine(s);
    const double t = s / (1 + c);  // tan(theta / 2)
    const double G = c / (c + s - 1);
    const double B = Y / s - 1 / (c + 1);
    const double f = 2 - s;
    const double F = (X * X + Y * Y - 2 * f * G * B - t * t) * c * kQuarterPi;
    const double D = ((2 * c * c + 1) / c + (c - s) * f / (c + s - 1)) * G * B +
                     (c * Y / (1 - c) + t) * f * G / (c + 1) - (t * t - 1) * t;
    p -= F / D;
    if (watch.seen(p)) break;
  }
  return previous;  // By contract: the last step is not applied
}

}  // namespace

// Close to a pole or beyond the outer circle.
Next GrintenInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                           TWstatus* status) const {
  const double yy = in.y + y0;
  const double lat = latitude_of(in.x / kPi, std::fabs(yy / kPi), status);
  out->x = longitude(in.x, yy);
  out->y = yy < 0 ? -lat : lat;
  return Next::point;
}

Next GrintenScale::other(const CoordinateTriple&, CoordinateTriple* out, TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  *out = {k0, k0, k0 * k0};
  return Next::point;
}

}  // namespace tidewater::detail

void TWvdg_c(double lat0, double* y0) { *y0 = grinten_axis_ordinate(lat0); }

void TWvdg_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = over_points(GrintenForward{lon0, y0}, count, in, out);
}

void TWvdg_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = over_points(GrintenInverse{lon0, y0}, count, in, out);
}

void TWvdg_s(double k0, double lon0, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = over_points(GrintenScale{k0, lon0}, count, in, out);
}
