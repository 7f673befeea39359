// Bipolar oblique conic conformal projection of the sphere: two oblique conics, with poles A and B,
// joined along the great circle through the poles.

#include <cmath>

#include "formulas/constants.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// The cosine of the largest arc that the projection reaches from its pole.
constexpr double kReach = -0.27531253;

constexpr double kDegree = kPi / 180;

// What the cone makes of a half-angle.
double tan_power(double half_angle, double n) { return std::pow(std::tan(half_angle), n); }

// A point as seen from one of the two poles.
class Pole {
 public:
  Pole(double lon, double lat) : lon_(lon), sin_(std::sin(lat)), cos_(std::cos(lat)) {}

  double lon() const { return lon_; }
  double sin() const { return sin_; }
  double cos() const { return cos_; }

  double cos_arc(double d, double sin_lat, double cos_lat) const {
    return cos_lat * std::cos(d) * cos_ + sin_lat * sin_;
  }

  // Azimuth at the pole of a point d of longitude away.
  double azimuth(double d, double tan_lat) const {
    const double east = std::sin(d);
    const double north = tan_lat * cos_ - std::cos(d) * sin_;
    return east == 0 && north == 0 ? 0 : std::atan2(east, north);
  }

 private:
  double lon_, sin_, cos_;
};

}  // namespace

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
  const double sin_a = std::sin(lat_a);
  const double cos_a = std::cos(lat_a);
  const double sin_b = std::sin(lat_b);
  const double cos_b = std::cos(lat_b);
  const double sin_ab = std::sin(ab);
  *lon_b = std::acos((std::cos(ab) - sin_b * sin_a) / (cos_b * cos_a)) + lon_a;
  const double cone = (std::log(std::sin(z1)) - std::log(std::sin(z2))) /
                      (std::log(std::tan(z1 / 2)) - std::log(std::tan(z2 / 2)));
  const double t1 = tan_power(z1 / 2, cone);
  const double size = std::sin(z1) / (cone * t1);
  *n = cone;
  *f = size;
  // By contract: the two angles are fixed, whatever the arguments.
  *k = 2 / (1 + std::sin(z1) * tan_power(26 * kDegree, cone) / (std::sin(52 * kDegree) * t1));
  const double cos_d = std::cos(*lon_b - lon_a);
  const double at_a = std::acos((sin_b * cos_a - cos_d * sin_a * cos_b) / sin_ab);
  *az_ab = at_a;
  *az_ba = std::acos((cos_b * sin_a - cos_d * sin_b * cos_a) / sin_ab);
  const double sum = tan_power(z2 / 2, cone) + t1;
  *t = sum;
  *rho_c = sum * size / 2;
  const double z = 2 * std::atan(std::pow(sum / 2, 1 / cone));
  *z_c = z;
  const double p = std::asin(std::sin(z) * std::cos(at_a) * cos_a + std::cos(z) * sin_a);
  *az_c = std::asin(std::sin(at_a) * cos_a / std::cos(p));
}

void TWbipocc_f(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab, double az_ba,
                double az_c, double n, double, double, double t, double rho_c, double ab, double f,
                int32_t count, CoordinateTriple* out, const CoordinateTriple* in,
                TWstatus* status) {
  *status = TW_SUCCESS;
  const Pole pole_a(lon_a, lat_a);
  const Pole pole_b(lon_b, lat_b);
  const double sin_c = std::sin(az_c);
  const double cos_c = std::cos(az_c);
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    const double tan_lat = std::tan(lat);
    const double db = pole_b.lon() - lon;
    const double azimuth = pole_b.azimuth(db, tan_lat);
    const bool b_side = azimuth <= az_ba;
    const double da = lon - pole_a.lon();
    const double cos_z =
        b_side ? pole_b.cos_arc(db, sin_lat, cos_lat) : pole_a.cos_arc(da, sin_lat, cos_lat);
    if (cos_z < kReach) {
      *status = TW_NOT_CONVERGED;
      return;
    }
    const double z = std::acos(cos_z);
    const double tz = tan_power(z / 2, n);
    double r = f * tz;
    const double al = std::acos((tan_power(std::fabs(ab - z) / 2, n) + tz) / t);
    double x1 = 0;
    double y1 = 0;
    if (b_side) {
      const double w = (az_ba - azimuth) * n;
      if (std::fabs(w) < al) r /= std::cos(al - w);
      x1 = r * std::sin(w);
      y1 = r * std::cos(w) - rho_c;
    } else {
      const double w = (az_ab - pole_a.azimuth(da, tan_lat)) * n;
      if (std::fabs(w) < al) r /= std::cos(w + al);
      x1 = r * std::sin(w);
      y1 = -(r * std::cos(w)) + rho_c;
    }
    out[i].x = -(cos_c * x1) - sin_c * y1;
    out[i].y = -(cos_c * y1) + sin_c * x1;
  }
}

void TWbipocc_i(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab, double az_ba,
                double az_c, double n, double t, double rho_c, double ab, double f, double lon_c,
                int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr int kMostPasses = 30;
  constexpr double kSecondOfArc = 4.848136811e-6;
  const Pole pole_a(lon_a, lat_a);
  const Pole pole_b(lon_b, lat_b);
  const double sin_c = std::sin(az_c);
  const double cos_c = std::cos(az_c);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double x1 = -(cos_c * x) + sin_c * y;
    const double y1 = -(sin_c * x) - cos_c * y;
    const bool a_side = x1 < 0;
    const double u = a_side ? rho_c - y1 : rho_c + y1;
    const double r0 = std::sqrt(u * u + x1 * x1);
    const double w = std::atan2(x1, u);
    double r = r0;
    double z = 0;
    for (int pass = 0; pass < kMostPasses; ++pass) {
      z = 2 * std::atan(std::pow(r / f, 1 / n));
      const double g = (tan_power(std::fabs(ab - z) / 2, n) + tan_power(z / 2, n)) / t;
      if (g < -1 || g > 1) {
        *status = TW_NOT_CONVERGED;
        return;
      }
      const double al = std::acos(g);
      if (std::fabs(w) >= al) break;
      const double previous = r;
      r = (a_side ? std::cos(w + al) : std::cos(al - w)) * r0;
      if (std::fabs(r - previous) <= 1e-10) break;
    }
    const Pole& pole = a_side ? pole_a : pole_b;
    const double azimuth = (a_side ? az_ab : az_ba) - w / n;
    const double cos_az = std::cos(azimuth);
    const double d = std::atan2(std::sin(azimuth), pole.cos() / std::tan(z) - cos_az * pole.sin());
    const double lat = std::asin(cos_az * std::sin(z) * pole.cos() + std::cos(z) * pole.sin());
    const bool at_pole = std::fabs(std::fabs(lat) - kHalfPi) <= kSecondOfArc;
    out[i].x = at_pole ? lon_c : a_side ? d + pole.lon() : pole.lon() - d;
    out[i].y = lat;
  }
}

void TWbipocc_s(double, double, double k0, double lon_a, double lat_a, double lon_b, double lat_b,
                double n, double f, double az_ba, int32_t count, const CoordinateTriple* in,
                CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const Pole pole_a(lon_a, lat_a);
  const Pole pole_b(lon_b, lat_b);
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    const double db = pole_b.lon() - lon;
    const bool b_side = pole_b.azimuth(db, std::tan(lat)) <= az_ba;
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    const double cos_z = b_side ? pole_b.cos_arc(db, sin_lat, cos_lat)
                                : pole_a.cos_arc(lon - pole_a.lon(), sin_lat, cos_lat);
    double k = k0;
    if (cos_z < kReach) {
      *status = TW_I_LATITUDE_LIMITED;  // the point is filled with the caller's scale
    } else {
      const double z = std::acos(cos_z);
      k = f * tan_power(z / 2, n) * n * k0 / std::sin(z);
    }
    out[i] = {k, k, k * k};
  }
}
