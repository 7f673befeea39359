// Robinson projection of the sphere by two clamped cubic splines through its table.

#include <cmath>

#include "formulas/wraps.hpp"
#include "projections/special/turns_about.hpp"
#include "tidewater/foundation.h"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

constexpr int32_t kKnots = 19;
constexpr double kSpacing = 0.08726646259971647;  // 5 degrees
constexpr double kYScale = 1.3523319842835606;
constexpr double kXScale = 0.8487;
// How far beyond a pole a latitude is held there instead of refused.
constexpr double kPoleMargin = 0.0001;

// Distance of the parallels from the equator, and their length, every 5 degrees.
// Robinson, A New Map Projection: Its Development and Characteristics, International Yearbook of
// Cartography 14 (1974), pp. 145-155.
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
  *y0 = signed_distance(lat0, knots, y_coef, &flag) * kYScale;
  if (flag != 1) *status = TW_BAD_LATITUDE;
}

void TWrobin_f(const double* knots, const double* y_coef, const double* x_coef, double lon0,
               double y0, int32_t count, CoordinateTriple* out, const CoordinateTriple* in,
               TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = turns_about(lon0, in[i].x);
    double lat = in[i].y;
    if (std::fabs(lat) > kHalfPi) {
      if (lat > kHalfPi && lat < kHalfPi + kPoleMargin) {
        lat = kHalfPi;
      } else if (lat < -kHalfPi && lat > -kHalfPi - kPoleMargin) {
        lat = -kHalfPi;
      } else {
        *status = TW_BAD_LATITUDE;
        return;
      }
      *status = TW_I_LATITUDE_LIMITED;
    }
    uint32_t flag = 0;
    const double distance = signed_distance(lat, knots, y_coef, &flag);
    if (flag == 2) *status = TW_I_LATITUDE_LIMITED;
    const double length = TWrobin_cseval(std::fabs(lat), knots, x_coef, kKnots, &flag);
    out[i].x = length * (lon - lon0) * kXScale;
    out[i].y = distance * kYScale - y0;
  }
}

void TWrobin_i(const double* knots, const double* y_coef, const double* x_coef, double lon0,
               double y0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double distance = (in[i].y + y0) / kYScale;
    uint32_t flag = 0;
    double lat = TWrobin_csinv(std::fabs(distance), knots, y_coef, kKnots, &flag);
    if (flag == 2) {
      // By contract: a distance beyond the table fails also where it gives a latitude short of the
      // pole.
      if (!(kHalfPi < lat && lat < kHalfPi + kPoleMargin)) {
        *status = TW_BAD_LATITUDE;
        return;
      }
      lat = kHalfPi;
      *status = TW_I_LATITUDE_LIMITED;
    }
    const double length = TWrobin_cseval(lat, knots, x_coef, kKnots, &flag);
    out[i].x = x / (length * kXScale) + lon0;
    out[i].y = distance >= 0 ? lat : -lat;
  }
}

void TWrobin_s(const double* knots, const double* y_coef, const double* x_coef, double lon0,
               double radius, double a, double e, double k0, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double f = k0 * radius * kXScale;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = std::fabs(in[i].y);
    uint32_t flags[3] = {};
    const double length = TWrobin_cseval(lat, knots, x_coef, kKnots, &flags[0]);
    const double dy = TWrobin_csderv(lat, knots, y_coef, kKnots, &flags[1]);
    const double dx = TWrobin_csderv(lat, knots, x_coef, kKnots, &flags[2]);
    if (flags[0] != 1 || flags[1] != 1 || flags[2] != 1) {
      *status = TW_BAD_LATITUDE;
      out[i] = {k0, k0, k0 * k0};
      continue;
    }
    TWstatus word = TW_SUCCESS;
    double parallel = 0;
    double meridian = 0;
    TWRparal(a, e, lat, &parallel, &word);
    if (TW_OK(word)) TWRmerid(a, e, lat, &meridian, &word);
    if (!TW_OK(word)) {
      *status = word;
      return;
    }
    const double k = f / parallel * length;
    const double d = turns_about(lon0, in[i].x) - lon0;
    const double h = f / meridian * std::sqrt(d * d * dx * dx + dy * dy * 2.5389738922523355);
    // By contract: k0 does not enter the areal scale.
    const double areal = square(radius) * 1.147724155061458 / meridian / parallel * dy * length;
    out[i] = {k, h, areal};
  }
}
