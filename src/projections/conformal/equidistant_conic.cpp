// Equidistant conic projection: constants and the exported functions.

#include "tidewater/equidistant_conic.h"
#include "projections/conformal/equidistant_conic_points.hpp"

using namespace tidewater::detail;

void TWconic_c(double e, double lat0, double lat1, double lat2, double* n, double* G, double* rho0,
               double* C0, double* C2, double* C4, double* C6, double* C8, double* D2, double* D4,
               double* D6, double* D8, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const auto meridian = ArcSeries::of(e2);
  const auto foot = FootCoefficients::of(e2).series();
  const double M0 = lat0 != 0 ? meridian.arc(lat0) : 0;
  const double M1 = meridian.arc(lat1);
  const auto at1 = sincos(lat1);
  const double m1 = parallel_radius(e2, at1.sin, at1.cos);
  double cone = at1.sin;
  if (lat2 != lat1) {
    const double M2 = meridian.arc(lat2);
    const auto at2 = sincos(lat2);
    const double m2 = parallel_radius(e2, at2.sin, at2.cos);
    cone = (m1 - m2) / (M2 - M1);
  }
  const double apex = m1 / cone + M1;
  *n = cone;
  *G = apex;
  *rho0 = apex - M0;
  *C0 = meridian.c0;
  *C2 = meridian.sines.p[0];
  *C4 = meridian.sines.p[1];
  *C6 = meridian.sines.p[2];
  *C8 = meridian.sines.p[3];
  *D2 = foot.p[0];
  *D4 = foot.p[1];
  *D6 = foot.p[2];
  *D8 = foot.p[3];
}

void TWconic_f(double lon0, double n, double G, double rho0, double C0, double C2, double C4,
               double C6, double C8, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out, TWstatus* status) {
  *status = over_points(EquidistantConicForward{lon0, n, G, rho0, {C0, {{C2, C4, C6, C8}}}}, count,
                        in, out);
}

void TWconic_i(double lon0, double n, double G, double rho0, double C0, double D2, double D4,
               double D6, double D8, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out, TWstatus* status) {
  const double sign = n >= 0 ? 1 : -1;
  const FootSeries foot(SineSeries<4>{{D2, D4, D6, D8}});
  *status = over_points(EquidistantConicInverse{lon0, 1 / n, sign, G, rho0, 1 / C0, foot}, count,
                        in, out);
}

void TWconic_s(double e, double k0, double n, double G, double C0, double C2, double C4, double C6,
               double C8, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status =
      over_points(EquidistantConicScale{e * e, k0, n, G, {C0, {{C2, C4, C6, C8}}}}, count, in, out);
}
