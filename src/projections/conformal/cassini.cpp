// Cassini projection: constants, what the contract says of the points that the formulas do not
// cover, and the exported functions.

#include "tidewater/cassini.h"
#include "projections/conformal/cassini_points.hpp"

using namespace tidewater::detail;

void TWcassini_c(double e, double /*lon0*/, double lat0, double* c0, double* c2, double* c4,
                 double* c6, double* c8, double* m0, double* d2, double* d4, double* d6,
                 double* d8) {
  const auto meridian = ArcSeries::of(e * e);
  const auto foot = FootCoefficients::of(e * e).series();
  *c0 = meridian.c0;
  *c2 = meridian.sines.p[0];
  *c4 = meridian.sines.p[1];
  *c6 = meridian.sines.p[2];
  *c8 = meridian.sines.p[3];
  *m0 = lat0 != 0 ? meridian.arc(lat0) : 0;
  *d2 = foot.p[0];
  *d4 = foot.p[1];
  *d6 = foot.p[2];
  *d8 = foot.p[3];
}

void TWcassini_f(double e, double lon0, double c0, double c2, double c4, double c6, double c8,
                 double m0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  const double e2 = e * e;
  *status = over_points(CassiniForward{e2, e2 / (1 - e2), lon0, m0, {c0, {{c2, c4, c6, c8}}}},
                        count, in, out);
}

void TWcassini_i(double e, double lon0, double c0, double m0, double d2, double d4, double d6,
                 double d8, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  const double e2 = e * e;
  const FootSeries foot(SineSeries<4>{{d2, d4, d6, d8}});
  *status = over_points(CassiniInverse{e2, lon0, 1 / c0, m0, 1 / (1 - e2), foot}, count, in, out);
}

Next CassiniScale::other(const CoordinateTriple&, CoordinateTriple* out, TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  *out = {k0, k0, k0 * k0};
  return Next::point;
}

void TWcassini_s(double e, double lon0, double k0, double c0, double c2, double c4, double c6,
                 double c8, double m0, int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  // By contract: the latitude goes through the caller's heights, so that it reaches the scale only
  // where the arrays are one.
  for (int32_t i = 0; i < count; ++i) in[i].z = in[i].y;
  TWcassini_f(e, lon0, c0, c2, c4, c6, c8, m0, count, in, out, status);
  *status = over_points(CassiniScale{e * e, k0}, count, out, out);
}
