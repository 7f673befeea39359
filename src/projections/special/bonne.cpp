// Bonne projection: constants, what the contract says of the points that the formulas do not cover,
// and the exported functions.

#include "projections/special/bonne_points.hpp"

#include <cmath>
#include "points/portable.hpp"
#include "tidewater/bonne.h"

using namespace tidewater::detail;

namespace {

// Nearest that the standard parallel comes to the equator, and least eccentricity of an ellipsoid.
constexpr double kLeast = 1.6e-8;

}  // namespace

void TWbonne_c(double e, double* lat1, double* e2, double* c1, double* r0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (e >= 1 || e < 0) {
    *status = TW_BAD_ECCENTRICITY;
    return;
  }
  if (0 <= *lat1 && *lat1 < kLeast) *lat1 = kLeast;
  if (-kLeast < *lat1 && *lat1 < 0) *lat1 = -kLeast;
  if (e < kLeast) {
    *e2 = 0;
    *c1 = 1 / portable::tan(*lat1);
    *r0 = *c1 + *lat1;
    return;
  }
  *e2 = e * e;
  const auto at = sincos(*lat1);
  *c1 = parallel_radius(*e2, at.sin, at.cos) / at.sin;
  double arc = 0;
  *status = MeridianArc(1.0, e).forward(*lat1, &arc);
  if (TW_OK(*status)) *r0 = *c1 + arc;
}

// A latitude that the arc's function refuses, or holds at a pole.
Next BonneForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                         TWstatus* status) const {
  double distance = 0;
  const TWstatus word = meridian.forward(in.y, &distance);
  if (word != TW_SUCCESS) *status = word;
  if (!TW_OK(word)) return Next::none;
  const auto at = sincos(in.y);
  const double r = r0 - distance;
  const double d = wrap_turns_below_then_above(in.x - lon0);
  const auto turn = sincos(d * parallel_radius(e2, at.sin, at.cos) / r);
  out->x = r * turn.sin;
  out->y = c1 - r * turn.cos;
  return Next::point;
}

void TWbonne_f(double lon0, double lat1, double e, double e2, double c1, double r0, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(BonneForward{lon0, lat1, e2, c1, r0, MeridianArc(1, e)}, count, in, out);
}

// An arc that its function refuses, or holds at a pole, or an ellipsoid beyond the series.
Next BonneInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                         TWstatus* status) const {
  const double r = radius(in.x, in.y);
  double lat = 0;
  const TWstatus word = meridian.inverse(r0 - r, &lat);
  if (word != TW_SUCCESS) *status = word;
  if (!TW_OK(word)) return Next::none;
  out->x = longitude(in.x, in.y, r, lat);
  out->y = lat;
  return Next::point;
}

void TWbonne_i(double lon0, double lat1, double e, double e2, double c1, double r0, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(BonneInverse(lon0, lat1, e, e2, c1, r0), count, in, out);
}

Next BonneScale::other(const CoordinateTriple&, CoordinateTriple*, TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  return Next::none;
}

void TWbonne_s(double k0, double lat1, double lon0, double e2, double r0, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  // By contract: on the ellipsoid, too, the scale is that of the sphere, and the argument is
  // discarded.
  if (e2 != 0) r0 = 1 / portable::tan(lat1) + lat1;
  *status = over_points(BonneScale{k0, lat1, lon0, r0}, count, in, out);
}
