// Equidistant conic projection of the ellipsoid.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 111-115.

#include <cmath>

#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "projections/conformal/meridian_series.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

void TWconic_c(double e, double lat0, double lat1, double lat2, double* n, double* G, double* rho0,
               double* C0, double* C2, double* C4, double* C6, double* C8, double* D2, double* D4,
               double* D6, double* D8, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const ArcConstants k = ArcConstants::of(e2);
  const double M0 = lat0 != 0 ? k.meridian_arc(lat0) : 0;
  const double M1 = k.meridian_arc(lat1);
  const double m1 = parallel_radius(e2, std::sin(lat1), std::cos(lat1));
  double cone = std::sin(lat1);
  if (lat2 != lat1) {
    const double M2 = k.meridian_arc(lat2);
    const double m2 = parallel_radius(e2, std::sin(lat2), std::cos(lat2));
    cone = (m1 - m2) / (M2 - M1);
  }
  const double apex = m1 / cone + M1;
  *n = cone;
  *G = apex;
  *rho0 = apex - M0;
  *C0 = k.c0;
  *C2 = k.arc.p2;
  *C4 = k.arc.p4;
  *C6 = k.arc.p6;
  *C8 = k.arc.p8;
  *D2 = k.foot.p2;
  *D4 = k.foot.p4;
  *D6 = k.foot.p6;
  *D8 = k.foot.p8;
}

void TWconic_f(double lon0, double n, double G, double rho0, double C0, double C2, double C4,
               double C6, double C8, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const CosinePowerSeries series = {C2, C4, C6, C8};
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double theta = wrap_turns_below_then_above(in[i].x - lon0) * n;
    const double r = G - (C0 * lat + series.sum(std::sin(2 * lat), std::cos(2 * lat)));
    out[i].x = std::sin(theta) * r;
    out[i].y = rho0 - std::cos(theta) * r;
  }
}

void TWconic_i(double lon0, double n, double G, double rho0, double C0, double D2, double D4,
               double D6, double D8, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const CosinePowerSeries series = {D2, D4, D6, D8};
  const double sign = n >= 0 ? 1 : -1;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double theta = std::atan2(sign * x, sign * rho0 - sign * y);
    const double r = std::sqrt(square(rho0 - y) + square(x)) * sign;
    const double u = (G - r) / C0;
    out[i].x = theta / n + lon0;  // not wrapped
    out[i].y = u + series.sum(std::sin(2 * u), std::cos(2 * u));
  }
}

void TWconic_s(double e, double k0, double n, double G, double C0, double C2, double C4, double C6,
               double C8, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const CosinePowerSeries series = {C2, C4, C6, C8};
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double s = std::sin(lat);
    const double c = std::cos(lat);
    const double arc = C0 * lat + series.sum(2 * c * s, square(c) - square(s));
    const double k = (G - arc) * n / parallel_radius(e2, s, c);
    // By contract: h is 1 and the product carries k0 once.
    out[i] = {k * k0, k0, k * k0};
  }
}
