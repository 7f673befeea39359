// The vocabulary of formulas for a plain double, until several points at once are here.
#pragma once

#include <cmath>

#define TW_INLINE inline __attribute__((always_inline))

namespace tidewater::points {

template <class V>
struct SinCos {
  V sin, cos;
};

TW_INLINE double select(bool m, double a, double b) { return m ? a : b; }
TW_INLINE bool any(bool m) { return m; }
TW_INLINE bool all(bool m) { return m; }
TW_INLINE double abs(double x) { return __builtin_fabs(x); }
TW_INLINE double sqrt(double x) { return __builtin_sqrt(x); }
TW_INLINE double copysign(double x, double y) { return __builtin_copysign(x, y); }
TW_INLINE double min(double x, double y) { return y < x ? y : x; }
TW_INLINE double max(double x, double y) { return x < y ? y : x; }
TW_INLINE double floor(double x) { return __builtin_floor(x); }
TW_INLINE double round_even(double x) { return __builtin_nearbyint(x); }
TW_INLINE SinCos<double> sincos(double x) { return {std::sin(x), std::cos(x)}; }
TW_INLINE double log(double x) { return std::log(x); }
TW_INLINE double exp(double x) { return std::exp(x); }
TW_INLINE double atan(double x) { return std::atan(x); }
TW_INLINE double atan2(double y, double x) { return std::atan2(y, x); }
TW_INLINE double asin(double x) { return std::asin(x); }
TW_INLINE double asinh(double x) { return std::asinh(x); }
TW_INLINE double sinh(double x) { return std::sinh(x); }
TW_INLINE double cosh(double x) { return std::cosh(x); }
TW_INLINE double hypot(double x, double y) { return __builtin_sqrt(x * x + y * y); }

}  // namespace tidewater::points
