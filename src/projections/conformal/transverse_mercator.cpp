// Transverse Mercator projection of the ellipsoid: constants, what the contract says of the points
// that the formulas do not cover, and the exported functions.

#include "tidewater/transverse_mercator.h"
#include "points/over_heights.hpp"
#include "projections/conformal/transverse_mercator_points.hpp"

using namespace tidewater::detail;

void TWt_merc_c(double e, double /*lon0*/, double lat0, double* A0, double* A2, double* A4,
                double* A6, double* A8, double* M0, double* B2, double* B4, double* B6,
                TWstatus* status) {
  *status = TW_SUCCESS;
  const auto arc = ArcCoefficients::of(e * e);
  const auto foot = FootCoefficients::of(e * e);
  *A0 = arc.a0;
  *A2 = arc.a2;
  *A4 = arc.a4;
  *A6 = arc.a6;
  *A8 = arc.a8;
  *M0 = lat0 != 0 ? ArcSeries::of(arc).arc(lat0) : 0;
  *B2 = foot.b2;
  *B4 = foot.b4;
  *B6 = foot.b6;
}

void TWt_merc_f(double e, double lon0, double A0, double A2, double A4, double A6, double A8,
                double M0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = over_points(TransverseForward{{e, lon0, {A0, A2, A4, A6, A8}, M0}}, count, in, out);
}

Next TransverseSphereInverse::other(const CoordinateTriple&, CoordinateTriple*,
                                    TWstatus* status) const {
  *status = TW_RANGE_ERROR;
  return Next::none;
}

Next TransverseInverse::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_RANGE_ERROR;
  return Next::none;
}

void TWt_merc_i(double e, double lon0, double lat0, double A0, double M0, double B2, double B4,
                double B6, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = e < 1e-12
                ? over_points(TransverseSphereInverse{lon0, lat0}, count, in, out)
                : over_points(TransverseInverse(e, lon0, lat0, A0, M0, B2, B4, B6), count, in, out);
}

Next TransverseScale::other(const CoordinateTriple& in, CoordinateTriple* out,
                            TWstatus* status) const {
  *status = TW_I_LATITUDE_LIMITED;  // the value is computed all the same
  const auto at = (*this)(in.x, in.y);
  *out = {at.x, at.y, at.z};
  return Next::point;
}

void TWt_merc_s(double e, double k0, double lon0, int32_t count, const CoordinateTriple* in,
                CoordinateTriple* out, TWstatus* status) {
  const double e2 = e * e;
  *status = over_points(TransverseScale{e2 / (1 - e2), k0, lon0}, count, in, out);
}

// By contract: the scale multiplies what stands in the output.
void TWt_merc_xyk(double e, double lon0, double A0, double A2, double A4, double A6, double A8,
                  double M0, double k0, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  over_points_and_heights(TransverseForwardAndScale{{e, lon0, {A0, A2, A4, A6, A8}, M0}, k0}, count,
                          in, out);
}
