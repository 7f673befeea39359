// Laborde projection: the ellipsoid on the Gauss conformal sphere, its transverse Mercator plane,
// and a complex cubic.  The exported functions, and a point whose refinement does not end.

#include "tidewater/laborde.h"
#include "points/over_heights.hpp"
#include "points/portable.hpp"
#include "projections/special/laborde_points.hpp"
#include "tidewater/gauss_sphere.h"
#include "tidewater/transverse_mercator.h"

using namespace tidewater::detail;

void TWlab_param(double* lon_c, double* lat_c, double* azimuth, double* false_easting,
                 double* false_northing, double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  *lon_c = 46.43720833 * kRadiansPerDegree;
  *lat_c = -18.9 * kRadiansPerDegree;
  *azimuth = 0.3298672286269283;
  *false_easting = 400000;
  *false_northing = 800000;
  *k0 = 0.9995;
}

void TWlabor_c(double azimuth, double* A, double* B, double* C, double* D, TWstatus* status) {
  *status = TW_SUCCESS;
  *A = (1 - portable::cos(2 * azimuth)) / 12;
  *B = portable::sin(2 * azimuth) / 12;
  *C = 3 * (square(*A) - square(*B));
  *D = 6 * *A * *B;
}

void TWlabor_f(double A, double B, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = over_points(LabordeForward{A, B}, count, in, out);
}

Next LabordeRefinedInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                                  TWstatus* status) const {
  *status = TW_NOT_CONVERGED;  // the point is written, the loop goes on
  const auto last = (*this)(in.x, in.y);
  out->x = last.x;
  out->y = last.y;
  return Next::point;
}

void TWlabor_i(int16_t mode, double A, double B, double C, double D, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const LabordeInverse start = {A, B, C, D};
  *status = mode == 1 ? over_points(LabordeRefinedInverse{start}, count, in, out)
                      : over_points(start, count, in, out);
}

void TWlabor_s(double k0, double A, double B, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  over_points_and_heights(LabordeScale{k0, A, B}, count, in, out);
}

void TWlaborde_c(double e, double lon0, double lat0, double azimuth, double* chi0, double* c,
                 double* t, double* R, double* A0, double* A2, double* A4, double* A6, double* A8,
                 double* M0, double* B2, double* B4, double* B6, double* A, double* B, double* C,
                 double* D, TWstatus* status) {
  static_cast<void>(lon0);
  TWgaussII_c(e, lat0, chi0, c, t, R, status);
  if (!TW_OK(*status)) return;
  TWt_merc_c(0.0, 0.0, *chi0, A0, A2, A4, A6, A8, M0, B2, B4, B6, status);
  if (!TW_OK(*status)) return;
  TWlabor_c(azimuth, A, B, C, D, status);
}

void TWlaborde_f(double e, double lon0, double c, double t, double A0, double A2, double A4,
                 double A6, double A8, double M0, double A, double B, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  TWgaussII_f(e, lon0, c, t, count, in, out, status);
  if (!TW_OK(*status)) return;
  TWt_merc_f(0.0, 0.0, A0, A2, A4, A6, A8, M0, count, out, out, status);
  if (!TW_OK(*status)) return;
  TWlabor_f(A, B, count, out, out, status);
}

void TWlaborde_i(double e, double lon0, double chi0, double c, double t, double A0, double M0,
                 double B2, double B4, double B6, int16_t mode, double A, double B, double C,
                 double D, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  TWlabor_i(mode, A, B, C, D, count, in, out, status);
  if (!TW_OK(*status)) return;
  TWt_merc_i(0.0, 0.0, chi0, A0, M0, B2, B4, B6, count, out, out, status);
  if (!TW_OK(*status)) return;
  TWgaussII_i(e, lon0, c, t, count, out, out, status);
}

void TWlaborde_s(double e, double lon0, double c, double t, double R, double A0, double A2,
                 double A4, double A6, double A8, double M0, double A, double B, double k0,
                 int32_t count, CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  TWg_schreiber(e, lon0, c, t, R, A0, A2, A4, A6, A8, M0, k0, count, in, out, status);
  // By contract: whatever the word.
  for (int32_t i = 0; i < count; ++i) {
    out[i].x *= R;
    out[i].y *= R;
  }
  if (TW_OK(*status)) TWlabor_s(1.0, A, B, count, out, out, status);
}
