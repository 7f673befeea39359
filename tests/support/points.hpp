// Points, sentinels and comparison for the tests.
#pragma once

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <limits>
#include <vector>

#include "tidewater/frame.h"

namespace tidewater::test {

inline constexpr double kPi = 3.14159265358979323846;
inline constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
inline constexpr double kInfinity = std::numeric_limits<double>::infinity();

// What an output holds before a call, so that an unwritten element is seen to be unwritten.
inline constexpr double kUntouched = -987654.321;
inline constexpr CoordinateTriple kUntouchedPoint = {kUntouched, kUntouched, kUntouched};

constexpr double degrees(double d, double m = 0, double s = 0) {
  return (d + m / 60 + s / 3600) * (kPi / 180);
}

using Points = std::vector<CoordinateTriple>;

inline Points untouched(std::size_t count) { return Points(count, kUntouchedPoint); }

// One point through a function of arrays, call(in, out), which must succeed and leave z unwritten.
template <class Call>
CoordinateTriple one_point(const CoordinateTriple& in, Call call) {
  Points out = untouched(1);
  EXPECT_EQ(call(Points{in}, out), TW_SUCCESS);
  EXPECT_EQ(out[0].z, kUntouched);
  return out[0];
}

inline void expect_near(const CoordinateTriple& p, double x, double y, double tolerance) {
  EXPECT_NEAR(p.x, x, tolerance);
  EXPECT_NEAR(p.y, y, tolerance);
}

inline void expect_near(const CoordinateTriple& p, double x, double y, double z, double tolerance) {
  expect_near(p, x, y, tolerance);
  EXPECT_NEAR(p.z, z, tolerance);
}

inline void expect_untouched(const CoordinateTriple& p) {
  EXPECT_EQ(p.x, kUntouched);
  EXPECT_EQ(p.y, kUntouched);
  EXPECT_EQ(p.z, kUntouched);
}

// An ellipsoid as the published examples name it.
struct Ellipsoid {
  double a;
  double e;

  static Ellipsoid from_inverse_flattening(double a, double rf) {
    const double f = 1 / rf;
    return {a, std::sqrt(f * (2 - f))};
  }
  static Ellipsoid clarke_1866() { return {6378206.4, std::sqrt(0.00676866)}; }  // as Snyder 1987
  static Ellipsoid grs80() { return from_inverse_flattening(6378137, 298.257222101); }
  static Ellipsoid wgs84() { return from_inverse_flattening(6378137, 298.257223563); }
  static Ellipsoid international_1924() { return from_inverse_flattening(6378388, 297); }
  static Ellipsoid bessel_1841() { return from_inverse_flattening(6377397.155, 299.1528128); }
};

}  // namespace tidewater::test
