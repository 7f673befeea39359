// Miller cylindrical projection: what the contract says of the points that the formulas do not
// cover, and the exported functions.

#include "tidewater/miller.h"
#include "projections/conformal/miller_points.hpp"

using namespace tidewater::detail;

void TWmiller_cyl_c(double lat0, double* y0, TWstatus* status) {
  *status = TW_SUCCESS;
  *y0 = miller_ordinate(lat0);
}

void TWmiller_cyl_f(const CoordinateTriple* in, int32_t count, double lon0, double y0,
                    CoordinateTriple* out, TWstatus* status) {
  *status = over_points(MillerForward{lon0, y0}, count, in, out);
}

Next MillerInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                          TWstatus* status) const {
  out->x = in.x + lon0;  // By contract: written before the ordinate is looked at
  *status = TW_RANGE_ERROR;
  return Next::none;  // this latitude and all later points stay unwritten
}

void TWmiller_cyl_i(const CoordinateTriple* in, int32_t count, double lon0, double y0,
                    CoordinateTriple* out, TWstatus* status) {
  *status = over_points(MillerInverse{lon0, y0}, count, in, out);
}

void TWmiller_cyl_s(const CoordinateTriple* in, int32_t count, double k0, CoordinateTriple* out,
                    TWstatus* status) {
  *status = over_points(MillerScale{k0}, count, in, out);
}
