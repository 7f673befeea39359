// Longitude and latitude seen from another pole: the exported functions.

#include "projections/special/rotated_graticule_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/rotated_graticule.h"

using namespace tidewater::detail;

void TWrotgrat_c(double lon0, double lat0, double pole_lon, double pole_lat, double* offset,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  const double a = portable::sin(pole_lon - lon0) * portable::cos(lat0);
  const double b = portable::cos(pole_lat) * portable::sin(lat0) -
                   portable::cos(pole_lon - lon0) * portable::sin(pole_lat) * portable::cos(lat0);
  *offset = portable::hypot(a, b) <= kRotationPoleMargin ? 0 : kPi - portable::atan2(a, b);
}

void TWrotgrat_f(double lon0, double /*lat0*/, double pole_lon, double pole_lat, double offset,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  if (std::fabs(pole_lat - kHalfPi) < kRotationPoleMargin) {
    // By contract: the offset is not applied either.
    *status = over_points(SameGraticule{}, count, in, out);
    return;
  }
  const auto pole = sincos(pole_lat);
  *status = over_points(RotatedForward{lon0, pole_lon, pole_lat, pole.sin, pole.cos, offset}, count,
                        in, out);
}

void TWrotgrat_i(double lon0, double /*lat0*/, double pole_lon, double pole_lat, double offset,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  const auto pole = sincos(pole_lat);
  *status = over_points(RotatedInverse{lon0, pole_lon, pole.sin, pole.cos, offset}, count, in, out);
}
