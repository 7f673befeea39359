// Gauss's conformal mapping of the ellipsoid onto a sphere: constants, what the contract says of
// the points that the formulas do not cover, and the exported functions.

#include "projections/conformal/gauss_sphere_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/ellipsoid.h"
#include "tidewater/gauss_sphere.h"
#include "tidewater/mercator.h"
#include "tidewater/transverse_mercator.h"

using namespace tidewater::detail;

namespace {

// Origins this close to a pole are replaced by one at this distance from it.
constexpr double kPolarMargin = 2e-06;
constexpr double kPolarOrigin = kHalfPi - kPolarMargin;

bool is_sphere(double c) { return c < 0; }

}  // namespace

void TWgaussII_c(double e, double lat0, double* chi0, double* c, double* t, double* R,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  double y0 = std::nan("");  // what the shift is made of where Mercator refuses the origin
  if (e < 1e-12) {
    *chi0 = lat0;
    *c = kGaussSphereMark;
    *t = 0.0;
  } else if (std::fabs(std::fabs(lat0) - kHalfPi) < kPolarMargin) {
    *chi0 = lat0;
    *c = 1.0;
    lat0 = lat0 > 0 ? kPolarOrigin : -kPolarOrigin;
    TWmerc_c(e, lat0, &y0, status);
    const double s = portable::sin(lat0);
    *t = portable::log((s + 1) / (1 - s)) / 2 - y0;
  } else {
    TWmerc_c(e, lat0, &y0, status);
    const double s = portable::sin(lat0);
    const double e2 = square(e);
    const double ratio = std::sqrt(e2 * square(square(portable::cos(lat0))) / (1 - e2) + 1);
    const double sin_chi = s / ratio;
    *c = ratio;
    *t = portable::log((sin_chi + 1) / (1 - sin_chi)) / 2 / ratio - y0;
    *chi0 = portable::asin(sin_chi);
  }
  TWgaussian_R(1.0, e, lat0, R, status);
}

void TWgauII_f(double c, double t, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = over_points(GaussPlaneForward{c, t}, count, in, out);
}

void TWgauII_i(double c, double t, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = over_points(GaussPlaneInverse{c, t}, count, in, out);
}

void TWgaussII_f(double e, double lon0, double c, double t, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = is_sphere(c) ? over_points(GaussShift{-lon0}, count, in, out)
                         : over_points(GaussForward{{e, lon0, c, t}}, count, in, out);
}

void TWgaussII_i(double e, double lon0, double c, double t, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = is_sphere(c) ? over_points(GaussShift{lon0}, count, in, out)
                         : over_points(GaussInverse{{e, lon0, c, t}}, count, in, out);
}

Next GaussScale::other(const CoordinateTriple&, CoordinateTriple* out, TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  out->z = k0;
  return Next::point;
}

void TWgaussII_s(double e, double lon0, double c, double t, double R, double k0, int32_t count,
                 CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  // By contract: the latitude goes through the caller's heights, so that it reaches the scale only
  // where the arrays are one.
  for (int32_t i = 0; i < count; ++i) in[i].z = in[i].y;
  TWgaussII_f(e, lon0, c, t, count, in, out, status);
  if (is_sphere(c)) {
    for (int32_t i = 0; i < count; ++i) out[i].z = k0;
    return;
  }
  *status = over_points(GaussScale{e * e, k0, k0 * R * c}, count, out, out);
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
