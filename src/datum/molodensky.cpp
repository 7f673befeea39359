// Standard Molodensky shift: the way through geocentric space near the poles, and the exported
// functions.

#include "tidewater/molodensky.h"
#include "datum/molodensky_points.hpp"
#include "tidewater/geocentric.h"

using namespace tidewater::detail;

// By contract: the inner calls set the word anew, so that it is that of the last such point.
Next MolodenskyForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                              TWstatus* status) const {
  CoordinateTriple p = in;
  TWllh_to_xyz(datum.a, datum.e, 1, &p, &p, status);
  p = {p.x + datum.dx, p.y + datum.dy, p.z + datum.dz};
  TWxyz_to_llh(datum.target_a, datum.target_e, 1, &p, out, status);
  return Next::point;
}

void TWmol_std_f(double a, double e, double da, double df, double dx, double dy, double dz,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = over_points(MolodenskyForward{{a, e, da, df, dx, dy, dz}}, count, in, out);
}

Next MolodenskyInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                              TWstatus* status) const {
  CoordinateTriple p = in;
  TWllh_to_xyz(datum.target_a, datum.target_e, 1, &p, &p, status);
  p = {p.x - datum.dx, p.y - datum.dy, p.z - datum.dz};
  TWxyz_to_llh(datum.a, datum.e, 1, &p, out, status);
  return Next::point;
}

void TWmol_std_i(double a, double e, double da, double df, double dx, double dy, double dz,
                 int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                 TWstatus* status) {
  *status = over_points(MolodenskyInverse{{a, e, da, df, dx, dy, dz}}, count, in, out);
}
