// Double stereographic: the ellipsoid onto the Gauss sphere, that turned to its pole, that
// projected.
// IOGP Publication 373-7-2, Geomatics Guidance Note 7, part 2 (2022), method 9809.

#include "tidewater/double_stereographic.h"
#include "formulas/constants.hpp"
#include "tidewater/gauss_sphere.h"
#include "tidewater/rotated_graticule.h"
#include "tidewater/stereographic.h"

using namespace tidewater::detail;

// Each inner call sets the caller's word anew; one that fails ends the chain with what stands.

void TWstereo3_c(double e, double lat0, double* chi_g, double* c, double* t, double* C, double* m0,
                 double* chi0, TWstatus* status) {
  double radius = 0;
  TWgaussII_c(e, lat0, chi_g, c, t, &radius, status);
  if (TW_OK(*status)) TWstereo_c(0.0, kHalfPi, C, m0, chi0, status);
}

void TWstereo3_f(double e, double lon0, double chi_g, double c, double t, double C, double m0,
                 double chi0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  TWgaussII_f(e, lon0, c, t, count, in, out, status);
  if (!TW_OK(*status)) return;
  for (int32_t i = 0; i < count; ++i) out[i].x += lon0;
  TWrotgrat_f(lon0, chi_g, lon0, chi_g, 0.0, count, out, out, status);
  if (!TW_OK(*status)) return;
  TWstereo_f(0.0, lon0, kHalfPi, C, m0, chi0, count, out, out, status);
}

void TWstereo3_i(double e, double lon0, double chi_g, double c, double t, double C, double m0,
                 double chi0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  TWstereo_i(0.0, lon0, kHalfPi, C, m0, chi0, count, in, out, status);
  if (!TW_OK(*status)) return;
  TWrotgrat_i(lon0, chi_g, lon0, chi_g, 0.0, count, out, out, status);
  if (!TW_OK(*status)) return;
  for (int32_t i = 0; i < count; ++i) out[i].x -= lon0;
  TWgaussII_i(e, lon0, c, t, count, out, out, status);
}
