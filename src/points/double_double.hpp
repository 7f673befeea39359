// A number as the sum of two doubles, for what needs more digits than one holds.
//
// T. J. Dekker, "A floating-point technique for extending the available precision", Numerische
// Mathematik 18, 1971.  Without the fused operations that only some processors have.
#pragma once

#include "points/lanes.hpp"

namespace tidewater::points {

struct DoubleDouble {
  double high, low;  // |low| is at most half a unit in the last place of high
};

inline DoubleDouble exact_sum(double a, double b) {
  const double sum = a + b;
  const double from_b = sum - a;
  return {sum, (a - (sum - from_b)) + (b - from_b)};
}

// Both below 2^970 in size.
inline DoubleDouble exact_product(double a, double b) {
  const auto split = [](double v) {
    const double wide = v * 0x1.0000002p+27;
    const double high = wide - (wide - v);
    return DoubleDouble{high, v - high};
  };
  const double product = a * b;
  const auto p = split(a), q = split(b);
  return {product, ((p.high * q.high - product) + p.high * q.low + p.low * q.high) + p.low * q.low};
}

inline DoubleDouble normalized(double high, double low) {
  const double sum = high + low;
  return {sum, low - (sum - high)};
}

inline DoubleDouble operator+(DoubleDouble a, double b) {
  const auto sum = exact_sum(a.high, b);
  return normalized(sum.high, sum.low + a.low);
}
inline DoubleDouble operator+(DoubleDouble a, DoubleDouble b) {
  const auto sum = exact_sum(a.high, b.high);
  return normalized(sum.high, sum.low + (a.low + b.low));
}
inline DoubleDouble operator*(DoubleDouble a, DoubleDouble b) {
  const auto product = exact_product(a.high, b.high);
  return normalized(product.high, product.low + (a.high * b.low + a.low * b.high));
}
inline DoubleDouble operator*(DoubleDouble a, double b) { return a * DoubleDouble{b, 0}; }

}  // namespace tidewater::points
