// Cassini projection of the ellipsoid by series about the central meridian.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 92-95.

#include <cmath>

#include "formulas/pole_hold.hpp"
#include "formulas/wraps.hpp"
#include "projections/conformal/meridian_series.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

void TWcassini_c(double e, double /*lon0*/, double lat0, double* c0, double* c2, double* c4,
                 double* c6, double* c8, double* m0, double* d2, double* d4, double* d6,
                 double* d8) {
  const ArcConstants k = ArcConstants::of(square(e));
  *c0 = k.c0;
  *c2 = k.arc.p2;
  *c4 = k.arc.p4;
  *c6 = k.arc.p6;
  *c8 = k.arc.p8;
  *m0 = lat0 != 0 ? k.meridian_arc(lat0) : 0;
  *d2 = k.foot.p2;
  *d4 = k.foot.p4;
  *d6 = k.foot.p6;
  *d8 = k.foot.p8;
}

void TWcassini_f(double e, double lon0, double c0, double c2, double c4, double c6, double c8,
                 double m0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const double ep2 = e2 / (1 - e2);
  const CosinePowerSeries series = {c2, c4, c6, c8};
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double s = std::sin(lat);
    const double c = std::cos(lat);
    const double tangent = s / c;
    const double m = c0 * lat + series.sum(2 * c * s, square(c) - square(s));
    const double nu = 1 / std::sqrt(1 - e2 * square(s));
    const double T = square(tangent);
    const double C = ep2 * (1 - square(s));
    const double A = wrap_turns_below_then_above(in[i].x - lon0) * c;
    const double A2 = square(A);
    const double A4 = square(A2);
    out[i].x = (A - A2 * A * T * (1.0 / 6) - (8 - T + 8 * C) * A4 * A * T * (1.0 / 120)) * nu;
    out[i].y = ((5 - T + 6 * C) * A4 * (1.0 / 24) + A2 / 2) * tangent * nu + (m - m0);
  }
}

void TWcassini_i(double e, double lon0, double c0, double m0, double d2, double d4, double d6,
                 double d8, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const CosinePowerSeries series = {d2, d4, d6, d8};
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double u = (m0 + y) / c0;
    const double p = series.sum(std::sin(2 * u), std::cos(2 * u)) + u;
    if (std::fabs(std::fabs(p) - kHalfPi) < 1e-12) {
      out[i].x = lon0;
      out[i].y = y < 0 ? -kHalfPi : kHalfPi;
      continue;
    }
    const double s = std::sin(p);
    const double c = std::cos(p);
    const double tangent = s / c;
    const double T = square(tangent);
    const double W = 1 - square(s) * e2;  // nu / rho = W / (1 - e^2)
    const double D = x * std::sqrt(W);
    const double D2 = square(D);
    const double D4 = square(D2);
    const double Q = 3 * T + 1;
    out[i].x = (Q * D4 * D * T * (1.0 / 15) + D - D2 * D * T * (1.0 / 3)) / c + lon0;
    out[i].y = p - (D2 / 2 - Q * D4 * (1.0 / 24)) * tangent * (W / (1 - e2));
  }
}

void TWcassini_s(double e, double lon0, double k0, double c0, double c2, double c4, double c6,
                 double c8, double m0, int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) in[i].z = in[i].y;
  TWcassini_f(e, lon0, c0, c2, c4, c6, c8, m0, count, in, out, status);
  const double e2 = square(e);
  for (int32_t i = 0; i < count; ++i) {
    const double x = out[i].x;
    double lat = out[i].z;  // the latitude only where the arrays are one
    double h = k0;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_BAD_LATITUDE;
    } else {
      lat = hold_off_poles(lat, 1e-10);
      const double W = 1 - square(std::sin(lat)) * e2;
      h = (square(x) * square(W) / ((1 - e2) * 2) + 1) * k0;
    }
    out[i] = {k0, h, k0 * h};
  }
}
