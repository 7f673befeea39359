// Hotine oblique Mercator projection: its constants, what the contract says of the points that the
// formulas do not cover, and the exported functions.

#include "projections/special/oblique_mercator_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/oblique_mercator.h"

using namespace tidewater::detail;

namespace {

// How far rounding may carry a sine beyond 1 before the parameters are refused.
constexpr double kSineLimit = 1.00000000000001;

// Arc sine that holds a value beyond 1 by rounding; false beyond that, and for a not-a-number.
bool held_asin(double sine, double* angle) {
  if (std::fabs(sine) <= 1) {
    *angle = portable::asin(sine);
    return true;
  }
  if (std::fabs(sine) <= kSineLimit) {
    *angle = sine < 0 ? -kHalfPi : kHalfPi;
    return true;
  }
  return false;
}

// t(p), which is zero at the double that is the north pole.
double tangent_at(double e, double lat) {
  return lat == kHalfPi ? 0 : colatitude_tangent(e, sincos(lat));
}

// The constants as far as they have been worked out.
struct Constants {
  double B = 0, A = 0, E = 0, lon0 = 0, gamma0 = 0;
  double D = 0, F = 0;
};

bool solve_azimuth(double lon_c, double alpha, Constants& k) {
  const double H = k.D + k.F * std::sqrt(k.D * k.D - 1);
  const double G = (H - 1 / H) / 2;
  if (!held_asin(portable::sin(alpha) / k.D, &k.gamma0)) return false;
  double angle = 0;
  if (!held_asin(portable::tan(k.gamma0) * G, &angle)) return false;
  k.lon0 = lon_c - angle / k.B;
  return true;
}

bool solve_two_points(double e, double lon1, double lat1, double lon2, double lat2, double* alpha,
                      Constants& k) {
  if (std::fabs(lat1 - lat2) < 1e-14 && std::fabs(lon1 - lon2) < 1e-14) return false;
  const double dl = wrap_above_then_below(lon1 - lon2);
  const double H = portable::pow(tangent_at(e, lat1), k.B);
  const double L = portable::pow(tangent_at(e, lat2), k.B);
  if (H == 0) return false;
  const double Q = k.E / H;
  if (Q == 0) return false;
  const double G = (Q - 1 / Q) / 2;
  const double J = (k.E * k.E - L * H) / (k.E * k.E + L * H);
  if (L + H == 0) return false;
  const double P = (L - H) / (L + H);
  // By contract: the mean is of the longitudes as they came, also where their difference was
  // wrapped.
  k.lon0 = (lon1 + lon2) / 2 - portable::atan(portable::tan(k.B * dl / 2) * J / P) / k.B;
  const double d = wrap_above_then_below(lon1 - k.lon0);
  k.gamma0 = portable::atan(portable::sin(k.B * d) / G);
  return held_asin(portable::sin(k.gamma0) * k.D, alpha);
}

}  // namespace

void TWo_merc_c(int16_t mode, double e, double lon_c, double lat_c, double lon2, double lat2,
                double* lat0, double* alpha, double* B, double* A, double* E, double* lon0,
                double* gamma0, TWstatus* status) {
  *status = TW_SUCCESS;
  const double origin = mode == 1 ? lat_c : *lat0;
  double azimuth = *alpha;
  const double e2 = e * e;
  const double sin0 = portable::sin(origin);
  const double cos0 = portable::cos(origin);
  Constants k;
  k.B = std::sqrt(1 + e2 * square(square(cos0)) / (1 - e2));
  k.A = std::sqrt(1 - e2) * k.B / (1 - e2 * sin0 * sin0);
  k.D = k.B * std::sqrt(1 - e2) / (std::sqrt(1 - e2 * sin0 * sin0) * cos0);
  if (k.D * k.D < 1) k.D = 1;
  k.F = origin < 0 ? -1 : 1;
  k.E = (k.D + k.F * std::sqrt(k.D * k.D - 1)) * portable::pow(tangent_at(e, origin), k.B);
  const bool solved = mode == 2 ? solve_two_points(e, lon_c, lat_c, lon2, lat2, &azimuth, k)
                                : solve_azimuth(lon_c, azimuth, k);
  if (!solved) *status = TW_BAD_PARAMETER;
  if (azimuth < 0) azimuth += kTwoPi;
  *lat0 = origin;
  *alpha = azimuth;
  *B = k.B;
  *A = k.A;
  *E = k.E;
  *lon0 = k.lon0;
  *gamma0 = k.gamma0;
}

namespace tidewater::detail {

namespace {

HotineForward forward_of(double e, double gamma0, double lon0, double E, double B, double A,
                         const CoordinateTriple* out) {
  const auto at = sincos(gamma0);
  const auto at_pole = [&](double side) {
    return portable::log(portable::tan(kQuarterPi - side * gamma0 / 2)) * A / B;
  };
  return {e, lon0, E, B, A, at.sin, at.cos, at_pole(1), at_pole(-1), out};
}

// By contract: u and v of the point before are written, or 0 at the first.
Next hold_skew(const CoordinateTriple* first, CoordinateTriple* out, TWstatus* status) {
  *status = TW_RANGE_ERROR;
  out->x = out == first ? 0 : out[-1].x;
  out->y = out == first ? 0 : out[-1].y;
  return Next::point;
}

}  // namespace

Next HotineForward::other(const CoordinateTriple&, CoordinateTriple* out, TWstatus* status) const {
  return hold_skew(first, out, status);
}

Next HotineScale::other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const {
  hold_skew(forward.first, out, status);
  out->z = forward.scale(out->x, in.x, sincos(in.y));
  return Next::point;
}

}  // namespace tidewater::detail

void TWo_merc_uv_k(double e, double /*alpha*/, double gamma0, double lon0, double E, double B,
                   double A, int16_t want_k, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
  const HotineForward forward = forward_of(e, gamma0, lon0, E, B, A, out);
  *status = want_k ? over_points(HotineScale{forward}, count, in, out)
                   : over_points(forward, count, in, out);
}

void TWo_merc_rot(double alpha, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status) {
  const auto at = sincos(alpha);
  *status = over_points(HotineTurn{at.sin, at.cos}, count, in, out);
}

void TWo_merc_f(double e, double alpha, double gamma0, double lon0, double E, double B, double A,
                int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  TWo_merc_uv_k(e, alpha, gamma0, lon0, E, B, A, 0, count, in, out, status);
  // By contract: one failing point leaves the whole array in skew coordinates.
  if (*status == TW_SUCCESS) TWo_merc_rot(alpha, count, out, out, status);
}

void TWo_merc_i(double e, double alpha, double gamma0, double lon0, double E, double B, double A,
                int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  const auto a = sincos(alpha);
  const auto g = sincos(gamma0);
  // The stated iteration ends when fifteen of its steps, not one, have been small, and so at rest,
  // where the inverse of the isometric latitude takes it at once.
  *status = over_points(
      HotineInverse{a.sin, a.cos, g.sin, g.cos, lon0, portable::log(E), B, A, ConformalInverse(e)},
      count, in, out);
}

void TWo_merc_s(double e, double k0, double alpha, double gamma0, double lon0, double E, double B,
                double A, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  TWo_merc_uv_k(e, alpha, gamma0, lon0, E, B, A, 1, count, in, out, status);
  if (!TW_OK(*status)) return;  // the array holds u, v, k
  over_points(HotineTriple{k0}, count, out, out);
}

void TWmadagascar(double* azimuth, double* lon_c, double* lat_c, double* false_easting,
                  double* false_northing, double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr auto radians = [](double d, double m, double s) {
    return ((d * 60 + m) * 60 + s) * kPi / 648000.0;
  };
  *azimuth = radians(18, 54, 0);
  *lon_c = radians(46, 26, 13.95);
  *lat_c = radians(-18, -54, 0);
  *false_easting = 400000;
  *false_northing = 800000;
  *k0 = 0.9995;
}
