// Mollweide projection: what the contract says of the points that the formulas do not cover, and
// the exported functions.

#include "projections/special/mollweide_points.hpp"

#include <cmath>

#include "tidewater/mollweide.h"

using namespace tidewater::detail;

namespace tidewater::detail {

Next MollweideInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                             TWstatus* status) const {
  const auto at = position(in.x, in.y);
  if (!(std::fabs(at.q) > 1)) out->x = at.lon;  // the longitude of this point stands
  *status = TW_RANGE_ERROR;
  return Next::none;
}

}  // namespace tidewater::detail

void TWmollweide_c(double lat0, double* y0, TWstatus* status) {
  *status = TW_SUCCESS;
  *y0 = mollweide_half_angle(lat0).sin * std::numbers::sqrt2;
}

void TWmollweide_f(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
  *status = over_points(MollweideForward{lon0, y0}, count, in, out);
}

void TWmollweide_i(double lon0, double y0, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
  *status = over_points(MollweideInverse{lon0, y0}, count, in, out);
}
