// Miller cylindrical projection of the sphere.

#include <cmath>

#include "formulas/wraps.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

double ordinate(double lat) { return std::log(std::tan(0.4 * lat + kQuarterPi)) / 0.8; }

}  // namespace

void TWmiller_cyl_c(double lat0, double* y0, TWstatus* status) {
  *status = TW_SUCCESS;
  *y0 = ordinate(lat0);
}

void TWmiller_cyl_f(const CoordinateTriple* in, int32_t count, double lon0, double y0,
                    CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    out[i].x = wrap_above_then_at_or_below(lon - lon0);
    out[i].y = ordinate(lat) - y0;
  }
}

void TWmiller_cyl_i(const CoordinateTriple* in, int32_t count, double lon0, double y0,
                    CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double v = 0.8 * (in[i].y + y0);
    out[i].x = x + lon0;  // wanted: written before the ordinate is looked at
    if (std::fabs(v) > 700.0) {
      *status = TW_RANGE_ERROR;
      return;  // this latitude and all later points stay unwritten
    }
    out[i].y = std::atan(std::sinh(v)) / 0.8;
  }
}

void TWmiller_cyl_s(const CoordinateTriple* in, int32_t count, double k0, CoordinateTriple* out,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double k = k0 / std::cos(lat);
    const double h = k0 / std::cos(0.8 * lat);
    out[i] = {k, h, h * k};
  }
}
