// Gnomonic projection of the sphere.

#include <cmath>

#include "formulas/constants.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

// Nearer than this to a pole or to the equator, an origin takes the formula of that aspect.
constexpr double kAspectMargin = 5e-10;

bool is_north(double lat0) { return std::fabs(kHalfPi - lat0) < kAspectMargin; }
bool is_south(double lat0) { return std::fabs(lat0 + kHalfPi) < kAspectMargin; }

}  // namespace

void TWgnomon_c(double lat0, double* cos_lat0, double* sin_lat0, TWstatus* status) {
  *status = TW_SUCCESS;
  *cos_lat0 = std::cos(lat0);
  *sin_lat0 = std::sin(lat0);
}

void TWgnomon_param(double* value1, double* value2, double* value3, TWstatus* status) {
  *status = TW_SUCCESS;
  *value1 = 0.0;
  *value2 = 0.0;
  *value3 = 0.0;
}

void TWgnomon_f(double lon0, double lat0, double cos_lat0, double sin_lat0, int32_t count,
                CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status) {
  *status = TW_SUCCESS;
  const bool north = is_north(lat0);
  const bool south = is_south(lat0);
  const bool equatorial = std::fabs(lat0) < kAspectMargin;
  for (int32_t i = 0; i < count; ++i) {
    const double d = in[i].x - lon0;
    const double lat = in[i].y;
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    const double sin_d = std::sin(d);
    const double cos_d = std::cos(d);
    const double cc = cos_d * cos_lat * cos_lat0 + sin_lat * sin_lat0;
    if (cc <= 1e-13) {  // on or behind the horizon
      *status = TW_NOT_CONVERGED;
      return;
    }
    if (north) {
      const double tan_lat = std::tan(lat);
      out[i].x = sin_d / tan_lat;
      out[i].y = -(cos_d / tan_lat);
    } else if (south) {
      const double tan_lat = std::tan(lat);
      out[i].x = -(sin_d / tan_lat);
      out[i].y = -(cos_d / tan_lat);
    } else if (equatorial) {
      out[i].x = std::tan(d);
      out[i].y = std::tan(lat) / cos_d;
    } else {
      out[i].x = sin_d * cos_lat / cc;
      out[i].y = (sin_lat * cos_lat0 - cos_d * cos_lat * sin_lat0) / cc;
    }
  }
}

void TWgnomon_i(double lon0, double lat0, double cos_lat0, double sin_lat0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const bool north = is_north(lat0);
  const bool south = is_south(lat0);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double rho = std::sqrt(x * x + y * y);
    double lon = lon0;
    double lat = lat0;
    if (rho != 0) {
      const double c = std::atan(rho);
      const double sin_c = std::sin(c);
      const double cos_c = std::cos(c);
      if (north) {
        lon = lon0 + std::atan2(x, -y);
      } else if (south) {
        lon = lon0 + std::atan2(x, y);
      } else {
        lon = lon0 + std::atan2(sin_c * x, cos_c * rho * cos_lat0 - sin_c * y * sin_lat0);
      }
      lat = std::asin(sin_c * y * cos_lat0 / rho + cos_c * sin_lat0);
    }
    // By contract: one of the two corrections only, both strict.
    if (lon > kPi) {
      lon -= kTwoPi;
    } else if (lon < -kPi) {
      lon += kTwoPi;
    }
    out[i].x = lon;
    out[i].y = lat;
  }
}

void TWgnomon_s(double lon0, double /*lat0*/, double k0, double cos_lat0, double sin_lat0,
                int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double d = in[i].x - lon0;
    const double lat = in[i].y;
    const double cc = std::cos(d) * std::cos(lat) * cos_lat0 + std::sin(lat) * sin_lat0;
    double k = k0;
    double h = k0;
    if (cc > 0) {
      k = k0 / cc;
      h = k / cc;
    } else {
      *status = TW_I_LATITUDE_LIMITED;  // behind the horizon
    }
    out[i] = {k, h, k * h};
  }
}
