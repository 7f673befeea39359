// Rectified skew orthomorphic projection of the ellipsoid.

#include <cmath>

#include "formulas/constants.hpp"
#include "projections/isometric_latitude.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// Largest argument of a hyperbolic function: beyond it the result would overflow.
constexpr double kHyperbolicLimit = 700;

double half_log_ratio(double g) { return std::log((g + 1) / (1 - g)) / 2; }

}  // namespace

void TWrso_c(double e, double lon_c, double lat_c, double skew, double* A, double* B, double* C,
             double* lon0, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const double s = std::sin(lat_c);
  const double c = std::cos(lat_c);
  const double w = std::sqrt(1 - e2 * s * s);
  const double rho = (1 - e2) / cube(w);
  const double nu = 1 / w;
  *B = std::sqrt(e2 / (1 - e2) * square(square(c)) + 1);
  *A = std::sqrt(nu * rho) * *B;
  const double psi = isometric_latitude(e, lat_c);
  const double r = *A / nu / c;
  // By contract: r below 1, near the equator, is not tested for.
  *C = std::log(std::sqrt(r * r - 1) + r) - *B * psi;
  const double W = *B * psi + *C;
  if (std::fabs(W) > kHyperbolicLimit) {
    *status = TW_RANGE_ERROR;
    return;
  }
  const double q = std::sinh(W) * std::tan(skew);
  if (std::fabs(q) > 1) {
    *status = TW_BAD_PARAMETER;
    return;
  }
  *lon0 = lon_c - std::asin(q) / *B;
}

void TWrso_f(double lon0, double skew, double A, double B, double C, double e, int32_t count,
             const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_g = std::sin(skew);
  const double cos_g = std::cos(skew);
  for (int32_t i = 0; i < count; ++i) {
    const double d = (lon0 - in[i].x) * B;
    const double W = isometric_latitude(e, in[i].y) * B + C;
    if (std::fabs(W) > kHyperbolicLimit) {
      *status = TW_RANGE_ERROR;
      return;
    }
    const double S = std::sinh(W);
    const double sin_d = std::sin(d);
    const double u = std::atan((cos_g * S - sin_d * sin_g) / std::cos(d)) * A / B;
    const double g = (-(cos_g * sin_d) - S * sin_g) / std::cosh(W);
    const double v = A / B * half_log_ratio(g);
    out[i].x = v * cos_g + u * sin_g;
    out[i].y = -sin_g * v + cos_g * u;
  }
}

void TWrso_i(double lon0, double skew, double A, double B, double C, double e, int32_t count,
             const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_g = std::sin(skew);
  const double cos_g = std::cos(skew);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double u = (cos_g * y + sin_g * x) * B / A;
    const double v = (cos_g * x - sin_g * y) * B / A;
    if (std::fabs(v) > kHyperbolicLimit) {
      *status = TW_RANGE_ERROR;
      return;
    }
    const double S = std::sinh(v);
    const double sin_u = std::sin(u);
    out[i].x = lon0 - std::atan((-(cos_g * S) - sin_u * sin_g) / std::cos(u)) / B;
    const double W = half_log_ratio((cos_g * sin_u - S * sin_g) / std::cosh(v));
    out[i].y = latitude_at_rest(e, std::exp(-((W - C) / B)));
  }
}

void TWrso_s(double e, double k0, double /*unused1*/, double /*unused2*/, double skew, double lon0,
             double A, double B, double C, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const double sin_g = std::sin(skew);
  const double cos_g = std::cos(skew);
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = (lon0 - in[i].x) * B;
    const double W = isometric_latitude(e, lat) * B + C;
    if (std::fabs(W) > kHyperbolicLimit) {
      *status = TW_RANGE_ERROR;
      return;
    }
    double k = std::sqrt(1 - e2 * square(std::sin(lat))) * A * k0;
    const double cos_lat = std::cos(lat);
    if (cos_lat != 0) k /= cos_lat;
    const double sin_d = std::sin(d);
    const double cos_d = std::cos(d);
    const double S = std::sinh(W);
    if (cos_d == 0) {
      const double cosh_w = std::cosh(W);
      const double v = half_log_ratio((-(cos_g * sin_d) - S * sin_g) / cosh_w);
      if (std::fabs(v) > kHyperbolicLimit) {
        *status = TW_RANGE_ERROR;
        return;
      }
      k = k * std::cosh(v) / cosh_w;
    } else {
      k = k * std::cos(std::atan((S * cos_g - sin_d * sin_g) / cos_d)) / cos_d;
    }
    out[i] = {k, k, k * k};
  }
}

void TWrso_param(double* lon_c, double* lat_c, double* skew, double* false_easting,
                 double* false_northing, double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  *lon_c = 102.25 * kRadiansPerDegree;
  *lat_c = 4 * kRadiansPerDegree;
  *skew = std::asin(-0.6);
  *false_easting = 804671.2998;
  *false_northing = 0;
  *k0 = 0.99984;
}
