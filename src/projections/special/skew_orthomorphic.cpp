// Rectified skew orthomorphic projection: its constants, what the contract says of the points that
// the formulas do not cover, and the exported functions.

#include "projections/special/skew_orthomorphic_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/skew_orthomorphic.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

Next refuse_range(TWstatus* status) {
  *status = TW_RANGE_ERROR;
  return Next::none;
}

}  // namespace

Next SkewForward::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  return refuse_range(status);
}

Next SkewInverse::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  return refuse_range(status);
}

Next SkewScale::other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const {
  const auto d = sincos((lon0 - in.x) * B);
  const auto p = sincos(in.y);
  const double W = isometric_latitude(e, p) * B + C;
  if (std::fabs(W) > kHyperbolicLimit) return refuse_range(status);
  const auto h = sinhcosh(W);
  double k = std::sqrt(1 - e * e * square(p.sin)) * A * k0;
  if (p.cos != 0) k /= p.cos;
  if (d.cos == 0) {
    const double v = half_log_ratio((-(cos_g * d.sin) - h.sinh * sin_g) / h.cosh);
    if (std::fabs(v) > kHyperbolicLimit) return refuse_range(status);
    k = k * portable::cosh(v) / h.cosh;
  } else {
    k = k * portable::cos(portable::atan((h.sinh * cos_g - d.sin * sin_g) / d.cos)) / d.cos;
  }
  *out = {k, k, k * k};
  return Next::point;
}

}  // namespace tidewater::detail

void TWrso_c(double e, double lon_c, double lat_c, double skew, double* A, double* B, double* C,
             double* lon0, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const double s = portable::sin(lat_c);
  const double c = portable::cos(lat_c);
  const double w = std::sqrt(1 - e2 * s * s);
  const double rho = (1 - e2) / cube(w);
  const double nu = 1 / w;
  *B = std::sqrt(e2 / (1 - e2) * square(square(c)) + 1);
  *A = std::sqrt(nu * rho) * *B;
  const double psi = isometric_latitude(e, sincos(lat_c));
  const double r = *A / nu / c;
  // By contract: r below 1, near the equator, is not tested for.
  *C = portable::log(std::sqrt(r * r - 1) + r) - *B * psi;
  const double W = *B * psi + *C;
  if (std::fabs(W) > kHyperbolicLimit) {
    *status = TW_RANGE_ERROR;
    return;
  }
  const double q = portable::sinh(W) * portable::tan(skew);
  if (std::fabs(q) > 1) {
    *status = TW_BAD_PARAMETER;
    return;
  }
  *lon0 = lon_c - portable::asin(q) / *B;
}

void TWrso_f(double lon0, double skew, double A, double B, double C, double e, int32_t count,
             const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const auto g = sincos(skew);
  *status = over_points(SkewForward{lon0, g.sin, g.cos, A, B, C, e}, count, in, out);
}

void TWrso_i(double lon0, double skew, double A, double B, double C, double e, int32_t count,
             const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const auto g = sincos(skew);
  *status =
      over_points(SkewInverse{lon0, g.sin, g.cos, A, B, C, ConformalInverse(e)}, count, in, out);
}

void TWrso_s(double e, double k0, double /*unused1*/, double /*unused2*/, double skew, double lon0,
             double A, double B, double C, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  const auto g = sincos(skew);
  *status = over_points(SkewScale{e, k0, lon0, g.sin, g.cos, A, B, C}, count, in, out);
}

void TWrso_param(double* lon_c, double* lat_c, double* skew, double* false_easting,
                 double* false_northing, double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  *lon_c = 102.25 * kRadiansPerDegree;
  *lat_c = 4 * kRadiansPerDegree;
  *skew = portable::asin(-0.6);
  *false_easting = 804671.2998;
  *false_northing = 0;
  *k0 = 0.99984;
}
