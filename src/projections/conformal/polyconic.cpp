// American polyconic projection: constants, what the contract says of the points that the formulas
// do not cover, and the exported functions.

#include "projections/conformal/polyconic_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/polyconic.h"

using namespace tidewater::detail;

void TWpolycon_c(double e, double lat0, double* m0) {
  *m0 = ShortArc(e * e).arc(lat0, EvenMultiples<double>(sincos(lat0)));
}

void TWpolycon_f(double e, double lon0, double m0, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = over_points(PolyconicForward{e * e, lon0, m0, ShortArc(e * e)}, count, in, out);
}

// Newton's method with the contract's counts and words.
Next PolyconicInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                             TWstatus* status) const {
  const double A = in.y + m0_;
  const double B = square(in.x) + square(A);
  double lat = A;
  Step<double> step = {};
  for (int pass = 0;; ++pass) {
    step = newton(lat, A, B);
    const double change = std::fabs(step.next - lat);
    if (change < kConverged) break;
    if (pass > kPassesBeforeCheck && change > kDiverged) {
      *status = TW_DIVERGED;
      return Next::none;
    }
    if (pass > kMostPasses) {
      *status = TW_I_LATITUDE_LIMITED;
      break;
    }
    lat = step.next;
  }
  out->x = at_pole(lat) ? lon0_ : portable::asin(in.x * step.C) / step.sin_lat + lon0_;
  out->y = step.next;
  return Next::point;
}

void TWpolycon_i(double e, double lon0, double m0, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = over_points(PolyconicInverse(e, lon0, m0), count, in, out);
}

Next PolyconicScale::other(const CoordinateTriple&, CoordinateTriple* out, TWstatus* status) const {
  *status = TW_BAD_LATITUDE;
  // By contract: the point repeats the values of the one before it, zeros where there is none.
  const bool at_first = out == first;
  *out = {k0, at_first ? 0 : out[-1].y, at_first ? 0 : out[-1].z};
  return Next::point;
}

void TWpolycon_s(double e, double lon0, double k0, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = over_points(PolyconicScale{e * e, lon0, k0, ShortArc(e * e), out}, count, in, out);
}
