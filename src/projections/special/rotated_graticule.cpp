// Longitude and latitude seen from another pole.

#include <cmath>

#include "formulas/wraps.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// Closer than this to a pole a direction has no meaning, and a longitude is a matter of convention.
constexpr double kPoleMargin = 1e-12;

}  // namespace

void TWrotgrat_c(double lon0, double lat0, double pole_lon, double pole_lat, double* offset,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  const double a = std::sin(pole_lon - lon0) * std::cos(lat0);
  const double b = std::cos(pole_lat) * std::sin(lat0) -
                   std::cos(pole_lon - lon0) * std::sin(pole_lat) * std::cos(lat0);
  *offset = std::hypot(a, b) <= kPoleMargin ? 0 : kPi - std::atan2(a, b);
}

void TWrotgrat_f(double lon0, double /*lat0*/, double pole_lon, double pole_lat, double offset,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  if (std::fabs(pole_lat - kHalfPi) < kPoleMargin) {
    // By contract: nothing moves, and the offset is not applied either.
    for (int32_t i = 0; i < count; ++i) {
      const double lon = in[i].x;
      const double lat = in[i].y;
      out[i].x = lon;
      out[i].y = lat;
    }
    return;
  }
  const double sin_pole = std::sin(pole_lat);
  const double cos_pole = std::cos(pole_lat);
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    const double cos_d = std::cos(lon - pole_lon);

    const double v = cos_d * cos_lat * cos_pole + sin_lat * sin_pole;
    double new_lat = 0;
    if (v >= 1) {
      new_lat = kHalfPi;
    } else if (v <= -1) {
      new_lat = -kHalfPi;
    } else {
      new_lat = std::asin(v);
    }

    double new_lon = lon0;
    if (lon != pole_lon || lat != pole_lat) {
      const double a = std::sin(lon - pole_lon) * cos_lat;
      const double b = cos_d * cos_lat * sin_pole - sin_lat * cos_pole;
      if (!(std::sqrt(a * a + b * b) < kPoleMargin)) new_lon = std::atan2(a, b) + lon0;
    }
    out[i].x = wrap_turns_above_then_at_or_below(new_lon + offset);
    out[i].y = new_lat;
  }
}

// By contract: no shortcut for a pole that stands at pi/2, unlike the forward function.
void TWrotgrat_i(double lon0, double /*lat0*/, double pole_lon, double pole_lat, double offset,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_pole = std::sin(pole_lat);
  const double cos_pole = std::cos(pole_lat);
  for (int32_t i = 0; i < count; ++i) {
    const double u = in[i].x - offset;
    const double lat = in[i].y;
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    const double cos_d = std::cos(u - lon0);

    const double new_lat = std::asin(sin_lat * sin_pole - cos_d * cos_lat * cos_pole);
    double new_lon =
        std::atan2(std::sin(u - lon0) * cos_lat, cos_d * cos_lat * sin_pole + sin_lat * cos_pole) +
        pole_lon;
    new_lon = wrap_turns_above_then_at_or_below(new_lon);
    if (std::fabs(std::fabs(new_lat) - kHalfPi) < kPoleMargin) new_lon = lon0;
    out[i].x = new_lon;
    out[i].y = new_lat;
  }
}
