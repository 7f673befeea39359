// Azimuthal equidistant projection: what the contract says of the points that the formulas do not
// cover, and the exported functions.

#include "projections/conformal/azimuthal_equidistant_points.hpp"

#include <algorithm>
#include <cmath>

#include "points/portable.hpp"
#include "tidewater/azimuthal_equidistant.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

// Nearer a pole than this, the meridian road takes the azimuth from the longitude.
constexpr double kPolarOrigin = kHalfPi - 1e-12;
// -(pi/2)^2: the product of two latitudes is never smaller, but for rounding.
constexpr double kLeastProduct = -2.4674011002691976;

double nu(double e2, double sin_lat) { return 1 / std::sqrt(1 - e2 * sin_lat * sin_lat); }

// Puts an angle that an arc sine has brought into a quarter turn on the far side of it.
double beyond_quarter(double s) {
  if (s > 0) s = kPi - s;
  if (s < 0) s = -kPi - s;
  return s;
}

}  // namespace

// At a pole, and along the meridian of the origin.
Next AzimuthalEquidistantForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                                        TWstatus* status) const {
  const double d = in.x - lon0;
  const double lat = in.y;
  const bool polar = std::fabs(std::fabs(lat0) - kHalfPi) < kEquidistantNothing;
  const double sin_lat = portable::sin(lat);
  const double cos_lat = portable::cos(lat);
  const double sin_d = portable::sin(d);
  const double cos_d = portable::cos(d);

  // psi is the latitude of the point as seen along the normal of the origin.
  double psi = lat;
  double azimuth = 0;
  if (std::fabs(std::fabs(lat) - kHalfPi) < kEquidistantNothing) {
    if (std::fabs(lat + kHalfPi) < kEquidistantNothing) azimuth = -kPi;
  } else {
    psi = portable::atan(sin0 * e2 * n1 / (cos_lat * nu(e2, sin_lat)) +
                         portable::tan(lat) * (1 - e2));
    // The tangent is that of the rounded psi, as its cosine is below: a quarter turn away, the
    // arc sine of their quotient magnifies what they differ by.
    azimuth = portable::atan2(sin_d, portable::tan(psi) * cos0 - cos_d * sin0);
  }
  double sin_az = portable::sin(azimuth);
  double cos_az = portable::cos(azimuth);
  const bool on_meridian = std::fabs(sin_az) < kEquidistantNothing;
  // By contract: the arc cosine is not held, and is not a number a hair beyond the antipode.
  // Below zero alone it can be more than a quarter turn.
  const double cc = cos_d * cos_lat * cos0 + sin_lat * sin0;
  const bool far_side = cc <= 0 && portable::acos(cc) > kHalfPi;

  double c = 0;
  if (on_meridian && (far_side || std::fabs(d) > kHalfPi)) {
    // Along the meridian and past a quarter turn the series is left for the arc.  Each arc sets
    // the word anew: that of the last one stands.
    double m1 = 0;
    double m0 = 0;
    *status = arc.forward(lat, &m1);
    *status = arc.forward(lat0, &m0);
    if (std::fabs(d) >= kHalfPi && lat * lat0 >= kLeastProduct) {
      double quarter = 0;
      *status = arc.forward(kHalfPi, &quarter);
      c = 2 * quarter - std::fabs(m0 + m1);  // over the pole
    } else {
      c = std::fabs(m1 - m0);
      if (lat0 > kPolarOrigin) {
        sin_az = portable::sin(kPi - d);
        cos_az = portable::cos(kPi - d);
      } else if (lat0 < -kPolarOrigin) {
        sin_az = sin_d;
        cos_az = cos_d;
      }
    }
  } else {
    double s = 0;
    if (on_meridian) {
      s = portable::asin(portable::sin(psi) * cos0 - portable::cos(psi) * sin0);
      if (!(cos_az >= 0)) s = -s;
      if (polar) s = std::fabs(s);
    } else {
      s = portable::asin(std::clamp(sin_d * portable::cos(psi) / sin_az, -1.0, 1.0));
    }
    if (far_side) s = beyond_quarter(s);
    c = distance(s, cos_az);
  }
  out->x = sin_az * c;
  out->y = cos_az * c;
  return Next::point;
}

Next AzimuthalEquidistantScale::other(const CoordinateTriple&, CoordinateTriple* out,
                                      TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  *out = {k0, k0, k0 * k0};  // filled with the caller's scale
  return Next::point;
}

}  // namespace tidewater::detail

void TWaz_eq_c(double e, double lat0, double* n1, double* g) {
  const double s = portable::sin(lat0);
  *n1 = nu(e * e, s);
  *g = e * s / std::sqrt(1 - e * e);
}

void TWaz_eq_f(double e, double lon0, double lat0, double n1, double g, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const auto at = sincos(lat0);
  *status = over_points(
      AzimuthalEquidistantForward{e, e * e, lon0, lat0, n1, g, at.sin, at.cos,
                                  e * at.cos / std::sqrt(1 - e * e), MeridianArc(1.0, e)},
      count, in, out);
}

void TWaz_eq_i(double e, double lon0, double lat0, double n1, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  constexpr double kNearPole = 1e-9;  // of the sine of lat0
  const auto at = sincos(lat0);
  const bool north = std::fabs(at.sin - 1) < kNearPole;
  const bool south = std::fabs(at.sin + 1) < kNearPole;
  *status = over_points(
      AzimuthalEquidistantInverse{north, north || south, e * e, lon0, lat0, n1, at.sin, at.cos},
      count, in, out);
}

void TWaz_eq_s(double lon0, double lat0, double k0, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out, TWstatus* status) {
  const auto at = sincos(lat0);
  *status = over_points(AzimuthalEquidistantScale{lon0, lat0, k0, at.sin, at.cos}, count, in, out);
}
