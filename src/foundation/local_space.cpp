// A local rectangular frame on a point of the ellipsoid: its constants and the exported functions.

#include "foundation/local_space_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/local_space.h"

using namespace tidewater::detail;

namespace {

// Lengths and azimuth components below this count as zero.
constexpr double kTiny = 1e-15;

}  // namespace

void TWlsr_c(int16_t mode, double a, double e, double lon0, double lat0, double h0, double* azimuth,
             double* x0, double* y0, double* z0, double lon1, double lat1, double h1, double lon2,
             double lat2, double h2, double* matrix, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const auto origin = geocentric_position(1.0, e2, lon0, lat0, h0 / a);
  *x0 = origin.x;
  *y0 = origin.y;
  *z0 = origin.z;
  const double sin_lon = portable::sin(lon0);
  const double cos_lon = portable::cos(lon0);
  const double sin_lat = portable::sin(lat0);
  const double cos_lat = portable::cos(lat0);
  double* m = matrix;
  m[6] = cos_lat * cos_lon;
  m[7] = cos_lat * sin_lon;
  m[8] = sin_lat;
  if (mode == 1) {
    const double s = portable::sin(*azimuth);
    const double c = portable::cos(*azimuth);
    m[0] = -s * sin_lon - c * sin_lat * cos_lon;
    m[1] = s * cos_lon - c * sin_lat * sin_lon;
    m[2] = c * cos_lat;
    m[3] = c * sin_lon - s * sin_lat * cos_lon;
    m[4] = -c * cos_lon - s * sin_lat * sin_lon;
    m[5] = s * cos_lat;
    return;
  }
  const auto from = geocentric_position(1.0, e2, lon1, lat1, h1 / a);
  const auto to = geocentric_position(1.0, e2, lon2, lat2, h2 / a);
  const double dx = to.x - from.x;
  const double dy = to.y - from.y;
  const double dz = to.z - from.z;
  const double length = std::sqrt(dx * dx + dy * dy + dz * dz);
  if (length <= kTiny) {
    *status = TW_BAD_PARAMETER;
    return;
  }
  // By contract: the rows are not normalised afterwards, so a line that is not horizontal at the
  // origin gives rows shorter than one.
  m[3] = (m[7] * dz - m[8] * dy) / length;
  m[4] = (m[8] * dx - m[6] * dz) / length;
  m[5] = (m[6] * dy - m[7] * dx) / length;
  m[0] = m[8] * m[4] - m[7] * m[5];
  m[1] = m[5] * m[6] - m[3] * m[8];
  m[2] = m[7] * m[3] - m[6] * m[4];
  if (std::fabs(m[5]) > kTiny || std::fabs(m[2]) > kTiny) {
    *azimuth = portable::atan2(m[5], m[2]);
  } else if (std::fabs(m[1]) > kTiny || std::fabs(m[0]) > kTiny) {  // the origin is a pole
    *azimuth = lat0 >= 0 ? portable::atan2(m[1], -m[0]) + lon0 : portable::atan2(m[1], m[0]) - lon0;
  } else {
    *status = TW_BAD_PARAMETER;
  }
}

namespace {

// The frame with x east, y north, z up.
struct EastNorthUp {
  double x0 = 0, y0 = 0, z0 = 0;
  double matrix[9] = {};

  EastNorthUp(double a, double e, double lon0, double lat0, double h0, TWstatus* status) {
    double azimuth = kHalfPi;
    TWlsr_c(1, a, e, lon0, lat0, h0, &azimuth, &x0, &y0, &z0, 0, 0, 0, 0, 0, 0, matrix, status);
  }

  LocalFrame frame() const { return {x0, y0, z0, matrix}; }
};

}  // namespace

void TWlsr_f(double a, double e, double x0, double y0, double z0, const double* matrix,
             int32_t count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(GeodeticToLocal{e * e, 1 / a, {x0, y0, z0, matrix}, 1}, count, in, out);
}

Next LocalToGeodetic::other(const CoordinateTriple& in, CoordinateTriple* out,
                            TWstatus* status) const {
  const auto at = position(in.x, in.y, in.z);
  return geocentric.other({at.x, at.y, at.z}, out, status);
}

void TWlsr_i(double a, double e, double x0, double y0, double z0, const double* matrix,
             int32_t count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(LocalToGeodetic{a, {x0, y0, z0, matrix}, {GeodeticPosition(a, e)}}, count,
                        in, out);
}

void TWllh_to_lsr(double a, double e, double scale, double lon0, double lat0, double h0,
                  int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status) {
  const EastNorthUp local(a, e, lon0, lat0, h0, status);
  *status = over_points(GeodeticToLocal{e * e, 1 / a, local.frame(), a * scale}, count, in, out);
}

void TWlsr_to_llh(double a, double e, double scale, double lon0, double lat0, double h0,
                  int32_t count, CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const EastNorthUp local(a, e, lon0, lat0, h0, status);
  const double unit = a * scale;
  // By contract: the caller's input array is normalised in place and stays so.
  for (int32_t i = 0; i < count; ++i) {
    in[i].x /= unit;
    in[i].y /= unit;
    in[i].z /= unit;
  }
  *status =
      over_points(LocalToGeodetic{a, local.frame(), {GeodeticPosition(a, e)}}, count, in, out);
}
