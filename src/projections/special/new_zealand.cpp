// New Zealand map grid: what the contract says of the points that the formulas do not cover, and
// the exported functions.

#include "projections/special/new_zealand_points.hpp"

#include <cmath>

#include "tidewater/mercator.h"
#include "tidewater/new_zealand.h"

using namespace tidewater::detail;

namespace tidewater::detail {

// Beyond a pole, or held past the north pole, where Mercator refuses the latitude and it stays as
// the ordinate.
Next GridScale::other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  if (std::fabs(in.y) > kHalfPi) {
    *out = {k0, k0, k0 * k0};  // filled with the caller's scale
    return Next::point;
  }
  const double lat = hold_off_poles(in.y, 1e-10);
  const auto at = scale(in.x - lon0, lat, sincos(lat));
  *out = {at.x, at.y, at.z};
  return Next::point;
}

}  // namespace tidewater::detail

void TWn_zeal_param(double* lon_c, double* lat_c, double* false_easting, double* false_northing,
                    double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  *lon_c = 173 * kRadiansPerDegree;
  *lat_c = -41 * kRadiansPerDegree;
  *false_easting = 2510000.0;
  *false_northing = 6023150.0;
  *k0 = 1.0;
}

void TWn_zeal_c(double e, double lat0, double* y0, TWstatus* status) {
  TWmerc_c(e, lat0, y0, status);
}

void TWn_zeal_f(double e, double lon0, double /*unused*/, double y0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  TWmerc_f(e, lon0, y0, count, in, out, status);
  // By contract: a point that was skipped is taken through the polynomial with what its output
  // holds.
  over_points(GridPolynomial{}, count, out, out);
}

void TWn_zeal_i(double e, double lon0, double /*unused*/, double y0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  // By contract: an iteration that ran out is not told, since the Mercator inverse sets the word
  // anew.
  over_points(GridRoots{}, count, in, out);
  TWmerc_i(e, lon0, y0, count, out, out, status);
}

void TWn_zeal_s(double e, double lon0, double /*unused*/, double y0, double k0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(GridScale{e, e * e, lon0, y0, k0}, count, in, out);
}

void TWn_zeal_fpoly(double re, double im, double* result) {
  const auto w = grid_polynomial<double>({re, im});
  result[0] = w.re;
  result[1] = w.im;
}

void TWn_zeal_grad(double re, double im, double* result) {
  const auto g = grid_gradient<double>({re, im});
  result[0] = g.re;
  result[1] = g.im;
}

void TWn_zeal_ipoly(double re, double im, double* result, TWstatus* status) {
  const auto root = grid_root<double>({re, im});
  *status = root.moving ? TW_NOT_CONVERGED : TW_SUCCESS;
  result[0] = root.z.re;
  result[1] = root.z.im;
}
