// Equirectangular projection: what the contract says of the points that the formulas do not cover,
// and the exported functions.

#include "projections/conformal/equirectangular_points.hpp"

#include <cmath>

#include "tidewater/equirectangular.h"

using namespace tidewater::detail;

void TWcyl_eqr_c(double lat1, double* cos_lat1, TWstatus* status) {
  *status = TW_SUCCESS;
  if (!(std::fabs(lat1) < kHalfPi)) {
    *status = TW_BAD_STANDARD_PARALLEL;
    return;
  }
  *cos_lat1 = sincos(lat1).cos;
}

Next EquirectangularForward::other(const CoordinateTriple&, CoordinateTriple*,
                                   TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  return Next::point;  // the failing point stays unwritten, the others are computed
}

void TWcyl_eqr_f(double lon0, double lat0, double cos_lat1, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(EquirectangularForward{lon0, lat0, cos_lat1}, count, in, out);
}

void TWcyl_eqr_i(double lon0, double lat0, double cos_lat1, int32_t count,
                 const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(EquirectangularInverse{lon0, lat0, cos_lat1}, count, in, out);
}

Next EquirectangularScale::other(const CoordinateTriple&, CoordinateTriple* out,
                                 TWstatus* status) const {
  *status = TW_NOT_CONVERGED;  // By contract: this member alone does not say TW_BAD_LATITUDE
  *out = {k0, k0, k0 * k0};
  return Next::point;
}

void TWcyl_eqr_s(double k0, double cos_lat1, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = over_points(EquirectangularScale{k0, cos_lat1}, count, in, out);
}
