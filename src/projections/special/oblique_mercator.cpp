// Hotine oblique Mercator projection of the ellipsoid, skew coordinates rotated to the map's axes.

#include <cmath>

#include "formulas/wraps.hpp"
#include "projections/isometric_latitude.hpp"
#include "projections/special/cycle_watch.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// How far rounding may carry a sine beyond 1 before the parameters are refused.
constexpr double kSineLimit = 1.00000000000001;
// Nearer than this to a pole, the forward formulas are those of the pole.
constexpr double kPoleMargin = 1e-10;
// Nearer than this to 1, |U| has no logarithm of use.
constexpr double kUnitMargin = 1e-10;

// Arc sine that holds a value beyond 1 by rounding; false beyond that, and for a not-a-number.
bool held_asin(double sine, double* angle) {
  if (std::fabs(sine) <= 1) {
    *angle = std::asin(sine);
    return true;
  }
  if (std::fabs(sine) <= kSineLimit) {
    *angle = sine < 0 ? -kHalfPi : kHalfPi;
    return true;
  }
  return false;
}

// The latitude with t(p) = w.  The iteration ends when fifteen of its steps, not one, have been
// small, and so leaves an ellipsoid of the earth at rest, where Newton's method takes it at once.
double latitude_of(double e, double w) {
  if (std::fabs(e) <= kSeriesEccentricity) return latitude_at_rest(e, w);
  double lat = kHalfPi - 2 * std::atan(w);
  CycleWatch watch;
  for (int small_steps = 0; small_steps < 15;) {
    const double previous = lat;
    lat = next_latitude(e, w, previous);
    if (!(std::fabs(lat - previous) >= 1e-10)) {
      ++small_steps;
    } else if (watch.seen(lat)) {
      break;
    }
  }
  return lat;
}

// The constants as far as they have been worked out.
struct Constants {
  double B = 0, A = 0, E = 0, lon0 = 0, gamma0 = 0;
  double D = 0, F = 0;
};

bool solve_azimuth(double lon_c, double alpha, Constants& k) {
  const double H = k.D + k.F * std::sqrt(k.D * k.D - 1);
  const double G = (H - 1 / H) / 2;
  if (!held_asin(std::sin(alpha) / k.D, &k.gamma0)) return false;
  double angle = 0;
  if (!held_asin(std::tan(k.gamma0) * G, &angle)) return false;
  k.lon0 = lon_c - angle / k.B;
  return true;
}

bool solve_two_points(double e, double lon1, double lat1, double lon2, double lat2, double* alpha,
                      Constants& k) {
  if (std::fabs(lat1 - lat2) < 1e-14 && std::fabs(lon1 - lon2) < 1e-14) return false;
  const double dl = wrap_above_then_below(lon1 - lon2);
  const double H = std::pow(isometric_colatitude_tangent(e, lat1), k.B);
  const double L = std::pow(isometric_colatitude_tangent(e, lat2), k.B);
  if (H == 0) return false;
  const double Q = k.E / H;
  if (Q == 0) return false;
  const double G = (Q - 1 / Q) / 2;
  const double J = (k.E * k.E - L * H) / (k.E * k.E + L * H);
  if (L + H == 0) return false;
  const double P = (L - H) / (L + H);
  // By contract: the mean is of the longitudes as they came, also where their difference was
  // wrapped.
  k.lon0 = (lon1 + lon2) / 2 - std::atan(std::tan(k.B * dl / 2) * J / P) / k.B;
  const double d = wrap_above_then_below(lon1 - k.lon0);
  k.gamma0 = std::atan(std::sin(k.B * d) / G);
  return held_asin(std::sin(k.gamma0) * k.D, alpha);
}

}  // namespace

void TWo_merc_c(int16_t mode, double e, double lon_c, double lat_c, double lon2, double lat2,
                double* lat0, double* alpha, double* B, double* A, double* E, double* lon0,
                double* gamma0, TWstatus* status) {
  *status = TW_SUCCESS;
  const double origin = mode == 1 ? lat_c : *lat0;
  double azimuth = *alpha;
  const double e2 = e * e;
  const double sin0 = std::sin(origin);
  const double cos0 = std::cos(origin);
  Constants k;
  k.B = std::sqrt(1 + e2 * square(square(cos0)) / (1 - e2));
  k.A = std::sqrt(1 - e2) * k.B / (1 - e2 * sin0 * sin0);
  k.D = k.B * std::sqrt(1 - e2) / (std::sqrt(1 - e2 * sin0 * sin0) * cos0);
  if (k.D * k.D < 1) k.D = 1;
  k.F = origin < 0 ? -1 : 1;
  k.E = (k.D + k.F * std::sqrt(k.D * k.D - 1)) *
        std::pow(isometric_colatitude_tangent(e, origin), k.B);
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

void TWo_merc_uv_k(double e, double /*alpha*/, double gamma0, double lon0, double E, double B,
                   double A, int16_t want_k, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const double sin_g = std::sin(gamma0);
  const double cos_g = std::cos(gamma0);
  double u = 0;
  double v = 0;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    const double dl = wrap_above_then_below(lon - lon0);
    if (std::fabs(std::fabs(lat) - kHalfPi) >= kPoleMargin) {
      const double Q = E / std::pow(isometric_colatitude_tangent(e, lat), B);
      const double S = (Q - 1 / Q) / 2;
      const double T = (1 / Q + Q) / 2;
      const double V = std::sin(B * dl);
      const double U = (sin_g * S - cos_g * V) / T;
      if (std::fabs(std::fabs(U) - 1) < kUnitMargin) {
        *status = TW_RANGE_ERROR;  // By contract: u and v of the point before are written
      } else {
        v = std::log((1 - U) / (1 + U)) * A / 2 / B;
        const double c = std::cos(B * dl);
        // By contract: the second form multiplies by B.
        u = std::fabs(c) >= 1e-10 ? std::atan2(cos_g * S + sin_g * V, c) * A / B : dl * A * B;
      }
    } else {
      const double p = lat >= 0 ? 1 : -1;
      v = std::log(std::tan(kQuarterPi - p * gamma0 / 2)) * A / B;
      u = lat * A / B;
    }
    out[i].x = u;
    out[i].y = v;
    if (want_k) {
      out[i].z = std::cos(B * u / A) * std::sqrt(1 - e2 * square(std::sin(lat))) * A /
                 (std::cos(B * (lon - lon0)) * std::cos(lat));
    }
  }
}

void TWo_merc_rot(double alpha, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status) {
  *status = TW_SUCCESS;
  const double s = std::sin(alpha);
  const double c = std::cos(alpha);
  for (int32_t i = 0; i < count; ++i) {
    const double u = in[i].x;
    const double v = in[i].y;
    out[i].x = v * c + u * s;
    out[i].y = u * c - v * s;
  }
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
  *status = TW_SUCCESS;
  const double sin_a = std::sin(alpha);
  const double cos_a = std::cos(alpha);
  const double sin_g = std::sin(gamma0);
  const double cos_g = std::cos(gamma0);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double v = cos_a * x - sin_a * y;
    const double u = cos_a * y + sin_a * x;
    const double Q = std::exp(-(B * v / A));
    const double S = (Q - 1 / Q) / 2;
    const double T = (1 / Q + Q) / 2;
    const double V = std::sin(B * u / A);
    const double U = (sin_g * S + cos_g * V) / T;
    if (std::fabs(std::fabs(U) - 1) < kUnitMargin) {
      out[i].x = lon0;
      out[i].y = U < 0 ? -kHalfPi : kHalfPi;
      continue;
    }
    const double w = std::pow(E / std::sqrt((1 + U) / (1 - U)), 1 / B);
    out[i].x = lon0 - std::atan2(cos_g * S - sin_g * V, std::cos(B * u / A)) / B;
    out[i].y = latitude_of(e, w);
  }
}

void TWo_merc_s(double e, double k0, double alpha, double gamma0, double lon0, double E, double B,
                double A, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  TWo_merc_uv_k(e, alpha, gamma0, lon0, E, B, A, 1, count, in, out, status);
  if (!TW_OK(*status)) return;  // the array holds u, v, k
  for (int32_t i = 0; i < count; ++i) {
    const double k = out[i].z * k0;
    out[i] = {k, k, k * k};
  }
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
