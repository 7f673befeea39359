// Bipolar oblique conic conformal projection: its constants, what the contract says of the points
// that the formulas do not cover, and the exported functions.

#include "projections/special/bipolar_conic_points.hpp"

#include <cmath>
#include "points/portable.hpp"
#include "tidewater/bipolar_conic.h"

using namespace tidewater::detail;

namespace {

constexpr double kDegree = kPi / 180;

// What the cone makes of a half-angle.
double tan_power(double half_angle, double n) {
  return portable::pow(portable::tan(half_angle), n);
}

}  // namespace

namespace tidewater::detail {

namespace {

BipolarPole pole_at(double lon, double lat) {
  const auto at = sincos(lat);
  return {lon, at.sin, at.cos};
}

BipolarCone cone_of(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab,
                    double az_ba, double az_c, double n, double t, double rho_c, double ab,
                    double f) {
  const auto at = sincos(az_c);
  return {pole_at(lon_a, lat_a),
          pole_at(lon_b, lat_b),
          az_ab,
          az_ba,
          n,
          t,
          rho_c,
          f,
          portable::tan(ab / 2),
          at.sin,
          at.cos};
}

}  // namespace

Next BipolarForward::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_NOT_CONVERGED;  // beyond the reach of both poles
  return Next::none;
}

Next BipolarInverse::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_NOT_CONVERGED;  // an arc's cosine beyond 1 either way
  return Next::none;
}

Next BipolarScale::other(const CoordinateTriple&, CoordinateTriple* out, TWstatus* status) const {
  *status = TW_I_LATITUDE_LIMITED;
  *out = {k0, k0, k0 * k0};  // filled with the caller's scale
  return Next::point;
}

}  // namespace tidewater::detail

void TWbipocc_param(double* lon_a, double* lat_a, double* lat_b, double* ab, double* z1, double* z2,
                    double* false_easting, double* false_northing, double* lon_c, double* lat_c,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  *lon_a = -110 * kDegree;
  *lat_a = -20 * kDegree;
  *lat_b = 45 * kDegree;
  *ab = 104 * kDegree;
  *z1 = 31 * kDegree;
  *z2 = 73 * kDegree;
  *false_easting = 0;
  *false_northing = 0;
  *lon_c = -1.274729117388117;
  *lat_c = 0.3010252384799973;
}

void TWbipocc_c(double lon_a, double lat_a, double lat_b, double ab, double z1, double z2,
                double* lon_b, double* n, double* k, double* f, double* az_ab, double* az_ba,
                double* t, double* rho_c, double* z_c, double* az_c, TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_a = portable::sin(lat_a);
  const double cos_a = portable::cos(lat_a);
  const double sin_b = portable::sin(lat_b);
  const double cos_b = portable::cos(lat_b);
  const double sin_ab = portable::sin(ab);
  *lon_b = portable::acos((portable::cos(ab) - sin_b * sin_a) / (cos_b * cos_a)) + lon_a;
  const double cone = (portable::log(portable::sin(z1)) - portable::log(portable::sin(z2))) /
                      (portable::log(portable::tan(z1 / 2)) - portable::log(portable::tan(z2 / 2)));
  const double t1 = tan_power(z1 / 2, cone);
  const double size = portable::sin(z1) / (cone * t1);
  *n = cone;
  *f = size;
  // By contract: the two angles are fixed, whatever the arguments.
  *k = 2 /
       (1 + portable::sin(z1) * tan_power(26 * kDegree, cone) / (portable::sin(52 * kDegree) * t1));
  const double cos_d = portable::cos(*lon_b - lon_a);
  const double at_a = portable::acos((sin_b * cos_a - cos_d * sin_a * cos_b) / sin_ab);
  *az_ab = at_a;
  *az_ba = portable::acos((cos_b * sin_a - cos_d * sin_b * cos_a) / sin_ab);
  const double sum = tan_power(z2 / 2, cone) + t1;
  *t = sum;
  *rho_c = sum * size / 2;
  const double z = 2 * portable::atan(portable::pow(sum / 2, 1 / cone));
  *z_c = z;
  const double p =
      portable::asin(portable::sin(z) * portable::cos(at_a) * cos_a + portable::cos(z) * sin_a);
  *az_c = portable::asin(portable::sin(at_a) * cos_a / portable::cos(p));
}

void TWbipocc_f(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab, double az_ba,
                double az_c, double n, double, double, double t, double rho_c, double ab, double f,
                int32_t count, CoordinateTriple* out, const CoordinateTriple* in,
                TWstatus* status) {
  *status = over_points(
      BipolarForward{cone_of(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, t, rho_c, ab, f)},
      count, in, out);
}

void TWbipocc_i(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab, double az_ba,
                double az_c, double n, double t, double rho_c, double ab, double f, double lon_c,
                int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = over_points(
      BipolarInverse{cone_of(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, t, rho_c, ab, f),
                     lon_c},
      count, in, out);
}

void TWbipocc_s(double, double, double k0, double lon_a, double lat_a, double lon_b, double lat_b,
                double n, double f, double az_ba, int32_t count, const CoordinateTriple* in,
                CoordinateTriple* out, TWstatus* status) {
  *status = over_points(BipolarScale{pole_at(lon_a, lat_a), pole_at(lon_b, lat_b), az_ba, n, f, k0},
                        count, in, out);
}
