// Modified polyconic projection of the International Map of the World: its constants, what the
// contract says of the points that the formulas do not cover, and the exported functions.

#include "projections/special/imw_polyconic_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/frame.h"
#include "tidewater/imw_polyconic.h"

using namespace tidewater::detail;

namespace {

constexpr double kTwoDegrees = 2 * kPi / 180;
constexpr double kFourDegrees = kSheetHeight;
constexpr double kEightDegrees = kTwoDegrees * 4;

// Half the width of a sheet: it grows towards the poles.
double half_width(double lat) {
  const double size = std::fabs(lat);
  if (size >= 1.3264502315156903) return kEightDegrees;            // 76 degrees
  return size >= 1.0471975511965976 ? kFourDegrees : kTwoDegrees;  // 60 degrees
}

// Whether a sheet can begin at this latitude.
bool is_south_edge(double lat) { return !(lat > kHalfPi - kFourDegrees || lat < -kHalfPi); }

// Radius of the polyconic arc of a parallel.
double arc_radius(double e2, double lat) {
  return 1 / std::sqrt(1 - e2 * square(portable::sin(lat))) / portable::tan(lat);
}

}  // namespace

namespace tidewater::detail {

Sheet::Sheet(double e, double lon0_, double lat1_, double r1_, double r2_, double c_, double p_,
             double q_, double s_, double t_)
    : e2(e * e),
      lon0(lon0_),
      lat1(lat1_),
      r1(r1_),
      r2(r2_),
      c(c_),
      p(p_),
      q(q_),
      s(s_),
      t(t_),
      sin1(portable::sin(lat1)),
      sin2(portable::sin(lat1 + kFourDegrees)),
      meridian(1, e) {}

TWstatus Sheet::forward(double lon, double lat, double* x, double* y) const {
  TWstatus status = TW_SUCCESS;
  if (std::fabs(lat) > kHalfPi + 1e-9) return TW_BAD_LATITUDE;
  if (std::fabs(lat) > kHalfPi) {
    lat = hold_at_pole(lat);
    status = TW_I_LATITUDE_LIMITED;
  }
  double m = 0;
  const TWstatus arc_status = meridian.forward(lat, &m);
  if (!TW_OK(arc_status)) return arc_status;
  const double xb_mid = t * m + s;
  const double yb_mid = q * m + p;
  const bool curved = std::fabs(lat) >= kSheetNothing;
  double r = 0;
  double yc = yb_mid;
  if (curved) {
    const double g = lat >= 0 ? 1 : -1;
    if (std::fabs(lat) <= kHalfPi - 1e-13) r = arc_radius(e2, lat);
    yc = 0;
    if (std::fabs(lat - lat1) >= kSheetNothing) {
      const double under = r * r - xb_mid * xb_mid;
      if (under < 0) return TW_RANGE_ERROR;
      yc = g * std::sqrt(under) + yb_mid - r;
    }
  }
  double d = 0;
  TWstatus lon_status = TW_SUCCESS;
  TWverify_lon(lon - lon0, &d, &lon_status);
  if (!TW_OK(lon_status)) return lon_status;
  if (!curved) {
    *x = d;
    *y = yc;
    return status;
  }
  // The meridian is the straight line between its points on the two bounding parallels.
  double xb = d;
  double yb = c;
  if (!(std::fabs(sin2) < kSheetNothing)) {
    xb = portable::sin(sin2 * d) * r2;
    yb = (1 - portable::cos(sin2 * d)) * r2 + c;
  }
  const double xa = std::fabs(sin1) < kSheetNothing ? d : portable::sin(sin1 * d) * r1;
  const double ya = south_edge_y(d);
  const double slope = (xb - xa) / (yb - ya);
  const double b = (yc + r - ya) * slope + xa;
  const double g = lat >= 0 ? -1 : 1;
  const double w = slope * slope + 1;
  const double under_x = w * (r * r) - b * b;
  if (under_x < 0) return TW_RANGE_ERROR;
  const double at_x = (g * std::sqrt(under_x) * slope + b) / w;
  const double under_y = r * r - at_x * at_x;
  if (under_y < 0) return TW_RANGE_ERROR;
  *x = at_x;
  *y = g * std::sqrt(under_y) + yc + r;
  return status;
}

Next SheetForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                         TWstatus* status) const {
  const TWstatus word = sheet.forward(in.x, in.y, &out->x, &out->y);
  if (word != TW_SUCCESS) *status = word;
  return TW_OK(word) ? Next::point : Next::none;
}

Next SheetInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                         TWstatus* status) const {
  const double x = in.x;
  const double y = in.y;
  double lon = x * over_cos2 + sheet.lon0;
  double lat = lat2;
  int passes = 0;
  for (; passes < kSheetPasses; ++passes) {
    const double d = lon - sheet.lon0;
    double xc = 0;
    double yc = 0;
    if (!TW_OK(sheet.forward(lon, lat, &xc, &yc))) {
      *status = TW_I_LATITUDE_LIMITED;
      break;
    }
    if (std::fabs(x - xc) < kSheetNothing && std::fabs(y - yc) < kSheetNothing) break;
    const double w = sheet.south_edge_y(d);
    lat = std::fabs(yc - w) <= kSheetNothing ? sheet.lat1
                                             : (lat - sheet.lat1) * (y - w) / (yc - w) + sheet.lat1;
    lon = std::fabs(xc) <= kSheetNothing ? sheet.lon0 : d * x / xc + sheet.lon0;
  }
  if (passes == kSheetPasses) *status = TW_I_LATITUDE_LIMITED;
  if (std::fabs(lat) > kHalfPi) {
    lat = hold_at_pole(lat);
    *status = TW_I_LATITUDE_LIMITED;
  }
  out->x = lon;
  out->y = lat;
  return Next::point;
}

}  // namespace tidewater::detail

void TWIMWmodP_stp(double lon0, double lat, double* lon_w, double* lon_e, double* lat1,
                   double* lat2, TWstatus* status) {
  *status = TW_SUCCESS;
  if (!is_south_edge(lat)) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  const double dl = half_width(lat);
  *lat1 = lat;
  *lat2 = lat + kFourDegrees;
  *lon_w = lon0 - dl;
  *lon_e = lon0 + dl;
}

void TWIMWmodPoly_c(double e, double, double lat1, double* r1, double* r2, double* c, double* p,
                    double* q, double* s, double* t, TWstatus* status) {
  *status = TW_SUCCESS;
  if (!is_south_edge(lat1)) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  const double dl = half_width(lat1);
  const MeridianArc meridian(1, e);
  double r[2];
  double x[2];
  double y[2];
  double m[2] = {0, 0};
  for (int i = 0; i < 2; ++i) {
    const double lat = i == 0 ? lat1 : lat1 + kFourDegrees;
    double angle = 0;
    if (std::fabs(portable::tan(lat)) >= kSheetNothing) {
      r[i] = arc_radius(e * e, lat);
      angle = portable::sin(lat) * dl;
      x[i] = portable::sin(angle) * r[i];
      const TWstatus word = meridian.forward(lat, &m[i]);
      if (word != TW_SUCCESS) *status = word;
    } else {
      r[i] = 0;
      x[i] = dl;
    }
    y[i] = (1 - portable::cos(angle)) * r[i];
  }
  const double d = m[1] - m[0];
  const double yc = std::sqrt(d * d - square(x[1] - x[0])) + y[0];
  *c = yc - y[1];
  *p = (m[1] * y[0] - m[0] * yc) / d;
  *q = (yc - y[0]) / d;
  *s = (m[1] * x[0] - m[0] * x[1]) / d;
  *t = (x[1] - x[0]) / d;
  *r1 = r[0];
  *r2 = r[1];
}

void TWIMWmodPoly_f(double e, double lon0, double lat1, double r1, double r2, double c, double p,
                    double q, double s, double t, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status) {
  *status = over_points(SheetForward{Sheet(e, lon0, lat1, r1, r2, c, p, q, s, t)}, count, in, out);
}

void TWIMWmodPoly_i(double e, double lon0, double lat1, double r1, double r2, double c, double p,
                    double q, double s, double t, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status) {
  const double lat2 = lat1 + kFourDegrees;
  *status = over_points(
      SheetInverse{Sheet(e, lon0, lat1, r1, r2, c, p, q, s, t), lat2, 1 / portable::cos(lat2)},
      count, in, out);
}
