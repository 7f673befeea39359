// Equirectangular projection of the sphere.

#include <cmath>

#include "formulas/wraps.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

void TWcyl_eqr_c(double lat1, double* cos_lat1, TWstatus* status) {
  *status = TW_SUCCESS;
  if (!(std::fabs(lat1) < kHalfPi)) {
    *status = TW_BAD_STANDARD_PARALLEL;
    return;
  }
  *cos_lat1 = std::cos(lat1);
}

void TWcyl_eqr_f(double lon0, double lat0, double cos_lat1, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    if (std::fabs(lat) > kHalfPi) {
      *status = TW_BAD_LATITUDE;
      continue;  // the failing point stays unwritten, the others are computed
    }
    out[i].x = wrap_above_then_at_or_below(lon - lon0) * cos_lat1;
    out[i].y = lat - lat0;
  }
}

void TWcyl_eqr_i(double lon0, double lat0, double cos_lat1, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    out[i].x = wrap_above_then_at_or_below(x / cos_lat1 + lon0);
    out[i].y = y + lat0;
  }
}

void TWcyl_eqr_s(double k0, double cos_lat1, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    double k = k0;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_NOT_CONVERGED;  // wanted: this member alone does not say TW_BAD_LATITUDE
    } else {
      k = k0 * cos_lat1 / std::cos(lat);
    }
    out[i] = {k, k0, k0 * k};
  }
}
