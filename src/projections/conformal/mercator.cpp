// Mercator projection of the ellipsoid onto a plane of unit semi-major axis.

#include <cmath>

#include "foundation/numeric.hpp"
#include "projections/isometric_latitude.hpp"
#include "projections/pole_hold.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

// The forward formula loses the ordinate this close to a pole.
constexpr double kForwardLatLimit = kHalfPi - 1e-14;

}  // namespace

void TWmerc_c(double e, double lat0, double* y0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (std::fabs(lat0) > kHalfPi) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  *y0 = isometric_latitude(e, lat0);
}

void TWmerc_f(double e, double lon0, double y0, int32_t count, const CoordinateTriple* in,
              CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    if (std::fabs(lat) > kForwardLatLimit) {
      *status = TW_BAD_LATITUDE;
      continue;  // the failing point stays unwritten, the others are computed
    }
    out[i].x = wrap_above_then_below(lon - lon0);
    out[i].y = isometric_latitude(e, lat) - y0;
  }
}

void TWmerc_i(double e, double lon0, double y0, int32_t count, const CoordinateTriple* in,
              CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    out[i].x = wrap_at_or_below_then_above(x + lon0);
    out[i].y = latitude_at_rest(e, std::exp(-(y + y0)));
  }
}

void TWmerc_s(double e, double k0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
              TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  for (int32_t i = 0; i < count; ++i) {
    double lat = in[i].y;
    double k = k0;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_BAD_LATITUDE;  // the point is filled with the caller's scale
    } else {
      lat = hold_off_poles(lat, 1e-10);
      k = std::sqrt(1 - e2 * square(std::sin(lat))) * k0 / std::cos(lat);
    }
    out[i] = {k, k, k * k};
  }
}
