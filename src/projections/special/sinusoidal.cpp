// Sinusoidal projection: what the contract says of the points that the formulas do not cover, and
// the exported functions.

#include "projections/special/sinusoidal_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/ellipsoid.h"
#include "tidewater/sinusoidal.h"

using namespace tidewater::detail;

namespace tidewater::detail {

// Beyond a pole, or on an ellipsoid that cannot be: the words of the meridian arc, and its value.
Next SinusoidalForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                              TWstatus* status) const {
  double y = 0;
  if (!(std::fabs(in.y - lat0) <= kSinusoidalNothing)) {
    double m = 0;
    const TWstatus word = arc.forward(in.y, &m);
    if (word != TW_SUCCESS) *status = word;
    if (!TW_OK(word)) return Next::none;
    y = m - m0;
  }
  out->x = abscissa(in.x, sincos(in.y));
  out->y = y;
  return Next::point;
}

Next SinusoidalInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                              TWstatus* status) const {
  double lat = lat0;
  const TWstatus word = arc.inverse(in.y + m0, &lat);
  if (word != TW_SUCCESS) *status = word;
  if (!TW_OK(word)) return Next::none;
  out->x = longitude(in.x, lat);
  out->y = lat;
  return Next::point;
}

Next SinusoidalScale::other(const CoordinateTriple& in, CoordinateTriple* out,
                            TWstatus* status) const {
  const double lat = in.y;
  if (std::fabs(lat) - kHalfPi > kSinusoidalNothing) {
    *status = TW_BAD_LATITUDE;
    return Next::none;
  }
  double slope = 0;
  TWstatus word = TW_SUCCESS;
  TWdM_dphi(1.0, e2, lat, &slope, &word);
  if (word != TW_SUCCESS) *status = word;
  if (!TW_OK(word)) return Next::none;
  const auto at = scales(wrap_turns_below_then_above(in.x - lon0), portable::sin(lat), slope);
  *out = {at.x, at.y, at.z};
  return Next::point;
}

namespace {

SinusoidalScale scale_of(double k0, double lon0, double e2) {
  const double root = std::sqrt(1 - e2);
  const double n = (1 - root) / (1 + root);
  const double n2 = n * n;
  const double g = 1 / (1 + n);
  // The derivative of the arc's series, term by term.
  return {k0,
          lon0,
          e2,
          !(e2 >= 1e-12),
          g * (1 + n2 / 4 + n2 * n2 / 64),
          -3 * g * (n - n2 * n / 8),
          3.75 * g * (n2 - n2 * n2 / 4),
          -4.375 * g * n2 * n,
          4.921875 * g * n2 * n2};
}

}  // namespace

}  // namespace tidewater::detail

void TWsinusoidal_c(double e, double lat0, double* e2, double* m0, TWstatus* status) {
  *e2 = e * e;
  *status = MeridianArc(1.0, e).forward(lat0, m0);
}

void TWsinusoidal_f(double lon0, double lat0, double e, double e2, double m0, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(SinusoidalForward{lon0, lat0, e2, m0, MeridianArc(1.0, e)}, count, in, out);
}

void TWsinusoidal_i(double lon0, double lat0, double e, double e2, double m0, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const MeridianArc arc(1.0, e);
  *status =
      over_points(SinusoidalInverse{lon0, lat0, e2, m0, arc, MeridianFoot(arc)}, count, in, out);
}

void TWsinusoidal_s(double k0, double lon0, double e2, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status) {
  *status = over_points(scale_of(k0, lon0, e2), count, in, out);
}
