// Gauss's conformal mapping of the ellipsoid onto a sphere, by way of two Mercator planes.

#include <cmath>

#include "formulas/pole_hold.hpp"
#include "formulas/wraps.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"

using namespace tidewater::detail;

namespace {

// Beyond these the pole maps onto itself.  By contract: forward and inverse draw the line
// differently.
constexpr double kForwardLatLimit = 1.5707963267938965;
constexpr double kInverseLatLimit = 1.5707963267947966;

// Origins this close to a pole are replaced by one at this distance from it.
constexpr double kPolarMargin = 2e-06;
constexpr double kPolarOrigin = 1.5707943267948965;

// The value of c that says that ellipsoid and sphere are one.
constexpr double kSphereMark = -1.0;

bool is_sphere(double c) { return c < 0; }

// The Mercator projection with e = 0 and its inverse, which needs no passes: the plane's longitudes
// are wrapped as TWmerc_f and TWmerc_i do it.
CoordinateTriple plane_of_sphere(double lon, double lat) {
  return {wrap_above_then_below(lon), std::log(std::tan(lat / 2 + kQuarterPi)), 0};
}

CoordinateTriple sphere_of_plane(double x, double y) {
  return {wrap_at_or_below_then_above(x), kHalfPi - 2 * std::atan(std::exp(-y)), 0};
}

}  // namespace

void TWgaussII_c(double e, double lat0, double* chi0, double* c, double* t, double* R,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  double y0 = std::nan("");  // what the shift is made of where Mercator refuses the origin
  if (e < 1e-12) {
    *chi0 = lat0;
    *c = kSphereMark;
    *t = 0.0;
  } else if (std::fabs(std::fabs(lat0) - kHalfPi) < kPolarMargin) {
    *chi0 = lat0;
    *c = 1.0;
    lat0 = lat0 > 0 ? kPolarOrigin : -kPolarOrigin;
    TWmerc_c(e, lat0, &y0, status);
    const double s = std::sin(lat0);
    *t = std::log((s + 1) / (1 - s)) / 2 - y0;
  } else {
    TWmerc_c(e, lat0, &y0, status);
    const double s = std::sin(lat0);
    const double e2 = square(e);
    const double ratio = std::sqrt(e2 * square(square(std::cos(lat0))) / (1 - e2) + 1);
    const double sin_chi = s / ratio;
    *c = ratio;
    *t = std::log((sin_chi + 1) / (1 - sin_chi)) / 2 / ratio - y0;
    *chi0 = std::asin(sin_chi);
  }
  TWgaussian_R(1.0, e, lat0, R, status);
}

void TWgauII_f(double c, double t, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    out[i].x = c * x;
    out[i].y = (y + t) * c;
  }
}

void TWgauII_i(double c, double t, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    out[i].x = x / c;
    out[i].y = y / c - t;
  }
}

void TWgaussII_f(double e, double lon0, double c, double t, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const bool sphere = is_sphere(c);
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    if (sphere || std::fabs(lat) > kForwardLatLimit) {
      out[i].x = lon - lon0;
      out[i].y = lat;
      continue;
    }
    TWmerc_f(e, lon0, 0.0, 1, in + i, out + i, status);
    TWgauII_f(c, t, 1, out + i, out + i, status);
    const CoordinateTriple at = sphere_of_plane(out[i].x, out[i].y);
    out[i].x = at.x;
    out[i].y = at.y;
  }
}

void TWgaussII_i(double e, double lon0, double c, double t, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const bool sphere = is_sphere(c);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    if (sphere || std::fabs(y) > kInverseLatLimit) {
      out[i].x = x + lon0;
      out[i].y = y;
      continue;
    }
    const CoordinateTriple plane = plane_of_sphere(x, y);
    out[i].x = plane.x;
    out[i].y = plane.y;
    TWgauII_i(c, t, 1, out + i, out + i, status);
    TWmerc_i(e, lon0, 0.0, 1, out + i, out + i, status);
  }
}

void TWgaussII_s(double e, double lon0, double c, double t, double R, double k0, int32_t count,
                 CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) in[i].z = in[i].y;
  TWgaussII_f(e, lon0, c, t, count, in, out, status);
  if (is_sphere(c)) {
    for (int32_t i = 0; i < count; ++i) out[i].z = k0;
    return;
  }
  const double e2 = square(e);
  for (int32_t i = 0; i < count; ++i) {
    double lat = out[i].z;  // the latitude only where the arrays are one
    const double chi = out[i].y;
    double k = k0;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_BAD_LATITUDE;
    } else {
      lat = hold_off_poles(lat, 1e-14);
      k = std::cos(chi) * std::sqrt(1 - e2 * square(std::sin(lat))) * k0 * R * c / std::cos(lat);
    }
    out[i].z = k;
  }
}

void TWg_schreiber(double e, double lon0, double c, double t, double R, double A0, double A2,
                   double A4, double A6, double A8, double M0, double k0, int32_t count,
                   CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  TWgaussII_s(e, lon0, c, t, R, 1.0, count, in, out, status);
  if (!TW_OK(*status)) return;
  // The second stage multiplies the scale that the first has left in z.
  TWt_merc_xyk(0.0, 0.0, A0, A2, A4, A6, A8, M0, k0, count, out, out, status);
}
