// Geodetic coordinates to and from the earth-centred rectangular frame: the axis, and the exported
// functions.

#include "foundation/geocentric_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/geocentric.h"

using namespace tidewater::detail;

void TWllh_to_xyz(double a, double e, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = over_points(GeodeticToGeocentric{a, e * e}, count, in, out);
}

Next GeocentricToGeodetic::other(const CoordinateTriple& in, CoordinateTriple* out,
                                 TWstatus*) const {
  const double p = portable::hypot(in.x, in.y);
  if (p < kOnAxis) {
    *out = {0, in.z < 0 ? -kHalfPi : kHalfPi, std::fabs(in.z) - geodetic.b()};
  } else {  // so far out that the ellipsoid is a point
    *out = {portable::atan2(in.y, in.x), portable::atan2(in.z, p), portable::hypot(p, in.z)};
  }
  return Next::point;
}

void TWxyz_to_llh(double a, double e, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = over_points(GeocentricToGeodetic{GeodeticPosition(a, e)}, count, in, out);
}
