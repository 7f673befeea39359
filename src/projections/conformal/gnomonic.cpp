// Gnomonic projection: what the contract says of the points that the formulas do not cover, and the
// exported functions.

#include "projections/conformal/gnomonic_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/gnomonic.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

GnomonicAspect aspect_of(double lat0) {
  if (std::fabs(kHalfPi - lat0) < kGnomonicMargin) return GnomonicAspect::north;
  if (std::fabs(lat0 + kHalfPi) < kGnomonicMargin) return GnomonicAspect::south;
  if (std::fabs(lat0) < kGnomonicMargin) return GnomonicAspect::equatorial;
  return GnomonicAspect::oblique;
}

}  // namespace

Next GnomonicForward::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_NOT_CONVERGED;
  return Next::none;  // the rest of the array stays as it is
}

Next GnomonicScale::other(const CoordinateTriple&, CoordinateTriple* out, TWstatus* status) const {
  *status = TW_I_LATITUDE_LIMITED;  // behind the horizon
  *out = {k0, k0, k0 * k0};
  return Next::point;
}

}  // namespace tidewater::detail

void TWgnomon_c(double lat0, double* cos_lat0, double* sin_lat0, TWstatus* status) {
  *status = TW_SUCCESS;
  *cos_lat0 = portable::cos(lat0);
  *sin_lat0 = portable::sin(lat0);
}

void TWgnomon_param(double* value1, double* value2, double* value3, TWstatus* status) {
  *status = TW_SUCCESS;
  *value1 = 0.0;
  *value2 = 0.0;
  *value3 = 0.0;
}

void TWgnomon_f(double lon0, double lat0, double cos_lat0, double sin_lat0, int32_t count,
                CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status) {
  *status = over_points(GnomonicForward{aspect_of(lat0), lon0, cos_lat0, sin_lat0}, count, in, out);
}

void TWgnomon_i(double lon0, double lat0, double cos_lat0, double sin_lat0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status =
      over_points(GnomonicInverse{aspect_of(lat0), lon0, lat0, cos_lat0, sin_lat0}, count, in, out);
}

void TWgnomon_s(double lon0, double /*lat0*/, double k0, double cos_lat0, double sin_lat0,
                int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = over_points(GnomonicScale{lon0, k0, cos_lat0, sin_lat0}, count, in, out);
}
