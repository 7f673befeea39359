#include "points/portable.hpp"

#include <cmath>

#include "points/double_double.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail::portable {

namespace {

using points::DoubleDouble;

constexpr double kInf = __builtin_inf();

// The natural logarithm of a finite positive number with a relative error of 2^-68.
DoubleDouble long_log(double v) {
  double k = 0;
  if (v < 0x1p-1022) {
    v *= 0x1p54;
    k = -54;
  }
  // v = 2^k m, m from sqrt(1/2) to sqrt(2)
  const int64_t offset = points::bits(v) - 0x3fe6a09e667f3bcd;
  const int64_t exponent = points::shift_right(offset, 52);
  const double m = points::number(points::bits(v) - points::shift_left(exponent, 52));
  k += static_cast<double>(exponent);

  // log m = 2 s + 2 s^3 / 3 + 2 s^5 / 5 ..., s = (m - 1) / (m + 1), s^2 up to 0.03
  const auto bottom = points::exact_sum(m, 1);
  const double quotient = (m - 1) / bottom.high;
  const auto back = points::exact_product(quotient, bottom.high);
  const auto s = points::normalized(
      quotient, (((m - 1) - back.high) - back.low - quotient * bottom.low) / bottom.high);
  const auto z = s * s;
  constexpr double kRest[] = {2.0 / 25, 2.0 / 23, 2.0 / 21, 2.0 / 19, 2.0 / 17,
                              2.0 / 15, 2.0 / 13, 2.0 / 11, 2.0 / 9,  2.0 / 7};
  double rest = 2.0 / 27;
  for (const double c : kRest) rest = rest * z.high + c;
  const auto fifth = DoubleDouble{0x1.999999999999ap-2, -0x1.999999999999ap-56} + rest * z.high;
  const auto third = DoubleDouble{0x1.5555555555555p-1, 0x1.5555555555555p-55} + z * fifth;
  const auto log_m = DoubleDouble{2 * s.high, 2 * s.low} + s * z * third;

  // ln 2 in three parts; k times one of the first two is exact
  const auto log_2k = points::exact_sum(k * 0x1.62e42fee00000p-1, k * 0x1.a39ef35793000p-33);
  return DoubleDouble{log_2k.high, log_2k.low + k * 0x1.8ece600fcbdacp-74} + log_m;
}

// e^y for a y of twice the digits, |y| up to 746.
double exp_of(DoubleDouble y) {
  constexpr double kOverLn2 = 0x1.71547652b82fep+0;
  const double k = points::nearest_whole(y.high * kOverLn2);
  const auto r = DoubleDouble{y.high - k * 0x1.62e42fee00000p-1, y.low} +
                 DoubleDouble{-(k * 0x1.a39ef35793000p-33), -(k * 0x1.8ece600fcbdacp-74)};
  // 1 + r + r^2 / 2 with twice the digits, the rest, r^3 / 3! to r^14 / 14!, with one's
  constexpr double kRest[] = {1.0 / 6227020800, 1.0 / 479001600, 1.0 / 39916800, 1.0 / 3628800,
                              1.0 / 362880,     1.0 / 40320,     1.0 / 5040,     1.0 / 720,
                              1.0 / 120,        1.0 / 24,        1.0 / 6};
  double rest = 1.0 / 87178291200;
  for (const double c : kRest) rest = rest * r.high + c;
  const auto square_of_r = r * r;
  const auto sum = r + DoubleDouble{0.5 * square_of_r.high, 0.5 * square_of_r.low} +
                   square_of_r.high * r.high * rest;
  const auto value = points::exact_sum(1, sum.high);
  // By half the power twice: the other half may be out of range.
  const double half = points::nearest_whole(0.5 * k);
  return (value.high + (value.low + sum.low)) * points::power_of_two(half) *
         points::power_of_two(k - half);
}

}  // namespace

double sin(double v) { return points::sincos(v).sin; }
double cos(double v) { return points::sincos(v).cos; }
double tan(double v) {
  const auto at = points::sincos(v);
  return at.sin / at.cos;
}
double asin(double v) { return points::asin(v); }
double acos(double v) { return points::acos(v); }
double atan(double v) { return points::atan(v); }
double atan2(double y, double x) { return points::atan2(y, x); }
double sinh(double v) { return points::sinhcosh(v).sinh; }
double cosh(double v) { return points::sinhcosh(v).cosh; }
double asinh(double v) {
  constexpr double kLn2 = 0x1.62e42fefa39efp-1;
  const double size = std::fabs(v);
  return size < 1e150 ? points::asinh(v) : std::copysign(points::log(size) + kLn2, v);
}
double atanh(double v) { return points::atanh(v); }
double log(double v) { return points::log(v); }

// The special values are those of C, Annex F.
double pow(double base, double exponent) {
  if (exponent == 0 || base == 1) return 1;
  if (base != base || exponent != exponent) return base + exponent;
  const double size = std::fabs(base), power = std::fabs(exponent);
  const bool whole = power >= 0x1p52 || std::floor(power) == power;
  const bool odd = whole && power < 0x1p53 && std::fmod(power, 2) == 1;
  const double sign = odd && std::signbit(base) ? -1 : 1;
  if (size == 0) return sign * (exponent > 0 ? 0 : kInf);
  if (size == kInf) return sign * (exponent > 0 ? kInf : 0);
  // A power of this size leaves nothing between zero and infinity.
  if (power >= 0x1p64) return size == 1 ? 1 : (size > 1) == (exponent > 0) ? kInf : 0;
  if (base < 0 && !whole) return __builtin_nan("");
  const auto y = long_log(size) * exponent;
  if (y.high > 709.79) return sign * kInf;
  if (y.high < -745.14) return sign * 0;
  return sign * exp_of(y);
}

double hypot(double x, double y) {
  if (std::isinf(x) || std::isinf(y)) return kInf;
  const double most = std::fmax(std::fabs(x), std::fabs(y));
  if (most > 1e150) return points::plain_hypot(x * 0x1p-600, y * 0x1p-600) * 0x1p600;
  if (most < 1e-140) return points::plain_hypot(x * 0x1p600, y * 0x1p600) * 0x1p-600;
  return points::plain_hypot(x, y);
}

}  // namespace tidewater::detail::portable
