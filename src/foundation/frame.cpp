// Checks of a single latitude or longitude, and the decimal places that a double can carry.

#include "tidewater/frame.h"

#include <cmath>
#include <iterator>

#include "formulas/wraps.hpp"

using namespace tidewater::detail;

namespace {

constexpr double kPowersUp[] = {1e0, 1e1, 1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                1e8, 1e9, 1e10, 1e11, 1e12, 1e13, 1e14, 1e15};
constexpr double kPowersDown[] = {1e-1, 1e-2,  1e-3,  1e-4,  1e-5,  1e-6,  1e-7, 1e-8,
                                  1e-9, 1e-10, 1e-11, 1e-12, 1e-13, 1e-14, 1e-15};

}  // namespace

void TWverify_lat(double lat, double* result, TWstatus* status) {
  *status = TW_SUCCESS;
  // Written so that a not-a-number is refused.
  if (!(std::fabs(lat) < kHalfPi + 1e-12)) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  if (lat > kHalfPi) lat = kHalfPi;
  if (lat < -kHalfPi) lat = -kHalfPi;
  *result = lat;
}

void TWverify_lon(double lon, double* result, TWstatus* status) {
  *status = TW_SUCCESS;
  if (!(std::fabs(lon) <= kTwoPi)) {
    *status = TW_BAD_LONGITUDE;
    return;
  }
  *result = wrap_above_then_below(lon);
}

int32_t TWget_prec(const double* value, uint16_t* precision, TWstatus* status) {
  return std::fabs(*value) >= 1 ? TWmax_f_prec(value, precision, status)
                                : TWmin_f_prec(value, precision, status);
}

int32_t TWmax_f_prec(const double* value, uint16_t* precision, TWstatus* status) {
  *status = TW_SUCCESS;
  const double size = std::fabs(*value);
  std::size_t i = 0;
  while (i + 1 < std::size(kPowersUp) && !(kPowersUp[i] > size)) ++i;
  *precision = static_cast<uint16_t>(15 - i);
  return 1;
}

int32_t TWmin_f_prec(const double* value, uint16_t* precision, TWstatus* status) {
  *status = TW_SUCCESS;
  if (*value == 0) {
    *precision = 0;
    return 1;
  }
  const double size = std::fabs(*value);
  std::size_t i = 0;
  while (i + 1 < std::size(kPowersDown) && !(kPowersDown[i] < size)) ++i;
  *precision = static_cast<uint16_t>(i + 15);
  return 1;
}
