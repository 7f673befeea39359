// Mercator projection: what the contract says of the points that the formulas do not cover, and the
// exported functions.

#include <cmath>

#include "projections/conformal/mercator_points.hpp"
#include "tidewater/mercator.h"

using namespace tidewater::detail;

void TWmerc_c(double e, double lat0, double* y0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (std::fabs(lat0) > kHalfPi) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  *y0 = isometric_latitude(e, sincos(lat0));
}

Next MercatorForward::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  return Next::point;  // the failing point stays unwritten, the others are computed
}

void TWmerc_f(double e, double lon0, double y0, int32_t count, const CoordinateTriple* in,
              CoordinateTriple* out, TWstatus* status) {
  *status = over_points(MercatorForward{e, lon0, y0}, count, in, out);
}

void TWmerc_i(double e, double lon0, double y0, int32_t count, const CoordinateTriple* in,
              CoordinateTriple* out, TWstatus* status) {
  *status = over_points(MercatorInverse{lon0, y0, ConformalInverse(e)}, count, in, out);
}

Next MercatorScale::other(const CoordinateTriple&, CoordinateTriple* out, TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  *out = {k0, k0, k0 * k0};  // filled with the caller's scale
  return Next::point;
}

void TWmerc_s(double e, double k0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
              TWstatus* status) {
  *status = over_points(MercatorScale{e * e, k0}, count, in, out);
}
