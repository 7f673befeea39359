// Robinson projection: its table, what the contract says of the points that the formulas do not
// cover, and the exported functions.

#include "projections/special/robinson_points.hpp"

#include <cmath>

#include "tidewater/robinson.h"
#include "tidewater/spline.h"

using namespace tidewater::detail;

namespace {

constexpr int32_t kKnots = kRobinsonKnots;
constexpr double kSpacing = 0.08726646259971647;  // 5 degrees
// How far beyond a pole a latitude is held there instead of refused.
constexpr double kPoleMargin = 0.0001;

// Distance of the parallels from the equator, and their length, every 5 degrees.
constexpr double kDistance[kKnots] = {0.0,    0.062,  0.124,  0.186,  0.248,  0.31,   0.372,
                                      0.434,  0.4958, 0.5571, 0.6176, 0.6769, 0.7346, 0.7903,
                                      0.8435, 0.8936, 0.9394, 0.9761, 1.0};
constexpr double kLength[kKnots] = {1.0,    0.9986, 0.9954, 0.99,   0.9822, 0.973,  0.96,
                                    0.9427, 0.9216, 0.8962, 0.8679, 0.835,  0.7986, 0.7597,
                                    0.7186, 0.6732, 0.6213, 0.5722, 0.5322};

void form(const double* knots, const double* values, double start_slope, double end_slope,
          double* coef, TWstatus* status) {
  for (int32_t i = 0; i < kKnots; ++i) coef[4 * i] = values[i];
  coef[1] = start_slope;
  coef[4 * (kKnots - 1) + 1] = end_slope;
  TWrobin_csform(knots, coef, kKnots, status);
}

// The odd extension of the y spline to the south.
double signed_distance(double lat, const double* knots, const double* y_coef, uint32_t* flag) {
  return lat >= 0 ? TWrobin_cseval(lat, knots, y_coef, kKnots, flag)
                  : -TWrobin_cseval(-lat, knots, y_coef, kKnots, flag);
}

}  // namespace

void TWrobin_c(double* knots, double* y_coef, double* x_coef, double* y0, double lat0,
               TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < kKnots - 1; ++i) knots[i] = i * kSpacing;
  knots[kKnots - 1] = kHalfPi;
  form(knots, kDistance, 0.062 / kSpacing, 0.24006922664096747, y_coef, status);
  if (*status != TW_SUCCESS) return;
  form(knots, kLength, 0, -0.43430550824143654, x_coef, status);
  if (*status != TW_SUCCESS) return;
  uint32_t flag = 0;
  *y0 = signed_distance(lat0, knots, y_coef, &flag) * kRobinsonYScale;
  if (flag != 1) *status = TW_BAD_LATITUDE;
}

namespace tidewater::detail {

// A latitude beyond a pole or the table, or that is not a number.
Next RobinsonForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                            TWstatus* status) const {
  const auto& [knots, y_coef, x_coef] = table;
  double lat = in.y;
  if (std::fabs(lat) > kHalfPi) {
    if (lat > kHalfPi && lat < kHalfPi + kPoleMargin) {
      lat = kHalfPi;
    } else if (lat < -kHalfPi && lat > -kHalfPi - kPoleMargin) {
      lat = -kHalfPi;
    } else {
      *status = TW_BAD_LATITUDE;
      return Next::none;
    }
    *status = TW_I_LATITUDE_LIMITED;
  }
  uint32_t flag = 0;
  const double distance = signed_distance(lat, knots, y_coef, &flag);
  if (flag == 2) *status = TW_I_LATITUDE_LIMITED;
  const double length = TWrobin_cseval(std::fabs(lat), knots, x_coef, kKnots, &flag);
  out->x = length * (turns_about(lon0, in.x) - lon0) * kRobinsonXScale;
  out->y = distance * kRobinsonYScale - y0;
  return Next::point;
}

// A distance beyond the table, or that is not a number.
Next RobinsonInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                            TWstatus* status) const {
  const auto& [knots, y_coef, x_coef] = table;
  const double distance = (in.y + y0) / kRobinsonYScale;
  uint32_t flag = 0;
  const double lat = TWrobin_csinv(std::fabs(distance), knots, y_coef, kKnots, &flag);
  // By contract: a distance beyond the table fails also where it gives a latitude short of the
  // pole.
  if (!(kHalfPi < lat && lat < kHalfPi + kPoleMargin)) {
    *status = TW_BAD_LATITUDE;
    return Next::none;
  }
  *status = TW_I_LATITUDE_LIMITED;
  const double length = TWrobin_cseval(kHalfPi, knots, x_coef, kKnots, &flag);
  out->x = in.x / (length * kRobinsonXScale) + lon0;
  out->y = std::copysign(kHalfPi, distance);
  return Next::point;
}

// At the last knot and beyond the table.
Next RobinsonScale::other(const CoordinateTriple& in, CoordinateTriple* out,
                          TWstatus* status) const {
  const auto& [knots, y_coef, x_coef] = table;
  const double lat = std::fabs(in.y);
  uint32_t flags[3] = {};
  const double length = TWrobin_cseval(lat, knots, x_coef, kKnots, &flags[0]);
  const double dy = TWrobin_csderv(lat, knots, y_coef, kKnots, &flags[1]);
  const double dx = TWrobin_csderv(lat, knots, x_coef, kKnots, &flags[2]);
  if (flags[0] != 1 || flags[1] != 1 || flags[2] != 1) {
    *status = TW_BAD_LATITUDE;
    *out = {k0, k0, k0 * k0};
    return Next::point;
  }
  if (lat > kHalfPi) {  // in a table that reaches further: the word of the radii
    *status = TW_BAD_LATITUDE;
    return Next::none;
  }
  const auto at = scales(turns_about(lon0, in.x) - lon0, lat, length, dx, dy);
  *out = {at.x, at.y, at.z};
  return Next::point;
}

}  // namespace tidewater::detail

void TWrobin_f(const double* knots, const double* y_coef, const double* x_coef, double lon0,
               double y0, int32_t count, CoordinateTriple* out, const CoordinateTriple* in,
               TWstatus* status) {
  *status = over_points(RobinsonForward{{knots, y_coef, x_coef}, lon0, y0}, count, in, out);
}

void TWrobin_i(const double* knots, const double* y_coef, const double* x_coef, double lon0,
               double y0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = over_points(RobinsonInverse{{knots, y_coef, x_coef}, lon0, y0}, count, in, out);
}

void TWrobin_s(const double* knots, const double* y_coef, const double* x_coef, double lon0,
               double radius, double a, double e, double k0, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(
      RobinsonScale{
          {knots, y_coef, x_coef}, lon0, radius, a, e * e, k0, k0 * radius * kRobinsonXScale},
      count, in, out);
}
