// Direct and inverse problem of the rhumb line, the straight line on the Mercator map.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 46-47.

#include <cmath>

#include "formulas/constants.hpp"
#include "points/portable.hpp"
#include "tidewater/ellipsoid.h"
#include "tidewater/mercator.h"
#include "tidewater/rhumb.h"

using namespace tidewater::detail;

namespace {

double parallel_radius(double a, double e, double lat) {
  return portable::cos(lat) * a / std::sqrt(1 - e * e * square(portable::sin(lat)));
}

double into_full_turn(double azimuth) {
  if (azimuth < -1e-12) azimuth += kTwoPi;
  if (azimuth >= kTwoPi) azimuth -= kTwoPi;
  return azimuth;
}

}  // namespace

// Every inner call is given the caller's word, so that the word at the end is that of the last one;
// what a failing call leaves unwritten is used as it stands.

void TWrhmbline_dir(CoordinateTriple start, double azimuth, double distance, double a, double e,
                    CoordinateTriple* end, double* back_azimuth, TWstatus* status) {
  *status = TW_SUCCESS;
  const double lon1 = start.x;
  const double lat1 = start.y;
  if (azimuth != kHalfPi && azimuth != 3 * kHalfPi) {
    double arc = 0;
    TWmerid_dist_f(a, e, lat1, &arc, status);
    TWmerid_dist_i(a, e, arc + portable::cos(azimuth) * distance, &end->y, status);
    double y1 = 0;
    double y2 = 0;
    TWmerc_c(e, end->y, &y2, status);
    TWmerc_c(e, lat1, &y1, status);
    end->x = lon1 + (y2 - y1) * portable::tan(azimuth);
  } else {
    // By contract: a positive distance goes east for azimuth 3 pi / 2 too.
    end->x = lon1 + distance / parallel_radius(a, e, lat1);
    end->y = lat1;
  }
  end->z = start.z;
  double back = azimuth + kPi;
  if (back > kTwoPi - 1e-15) back -= kTwoPi;
  *back_azimuth = back;
}

void TWrhmbline_inv(CoordinateTriple start, CoordinateTriple end, double a, double e,
                    double* azimuth, double* back_azimuth, double* distance, TWstatus* status) {
  *status = TW_SUCCESS;
  const double lat1 = start.y;
  const double lat2 = end.y;
  double forward = 0;
  double length = 0;
  if (lat2 != lat1) {
    double y1 = 0;
    double y2 = 0;
    TWmerc_c(e, lat2, &y2, status);
    TWmerc_c(e, lat1, &y1, status);
    // By contract: the longitude difference as it stands, not the short way round.
    forward = portable::atan2(end.x - start.x, y2 - y1);
    double m1 = 0;
    double m2 = 0;
    TWmerid_dist_f(a, e, lat2, &m2, status);
    TWmerid_dist_f(a, e, lat1, &m1, status);
    length = (m2 - m1) / portable::cos(forward);
  } else {
    forward = end.x <= start.x ? 3 * kHalfPi : kHalfPi;
    length = parallel_radius(a, e, lat1) * (end.x - start.x);
  }
  *distance = std::fabs(length);
  *back_azimuth = into_full_turn(forward + kPi);
  *azimuth = into_full_turn(forward);
}
