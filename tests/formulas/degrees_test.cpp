// Angles in degrees: quarter turns and differences are exact.

#include "formulas/degrees.hpp"

#include <gtest/gtest.h>

#include <cmath>

namespace tidewater::detail {
namespace {

TEST(Degrees, QuarterTurnsAreExact) {
  const double sines[] = {0, 1, 0, -1};
  for (int k = -4000; k <= 4000; ++k) {
    const auto at = sincos_degrees(90.0 * k);
    const int quarter = (k % 4 + 4) % 4;
    ASSERT_EQ(at.sin, sines[quarter]) << k;
    ASSERT_EQ(at.cos, sines[(quarter + 1) % 4]) << k;
    ASSERT_FALSE(std::signbit(at.cos) && at.cos == 0) << k;
  }
  for (double d = -1000; d < 1000; d += 0.9) {
    const long double radians =
        std::remainder(static_cast<long double>(d), 360) * (3.14159265358979323846264L / 180);
    EXPECT_NEAR(sincos_degrees(d).sin, static_cast<double>(std::sin(radians)), 2e-16) << d;
    EXPECT_NEAR(sincos_degrees(d).cos, static_cast<double>(std::cos(radians)), 2e-16) << d;
  }
}

TEST(Degrees, DifferencesAreExactInTwoParts) {
  const double values[] = {0, 0.1, -0.3, 1e-17, 89.99999999999999, 180, -179.95, 179.7, 359.9};
  for (const double a : values) {
    for (const double b : values) {
      const auto d = degrees_between(a, b);
      const long double difference = std::remainder(static_cast<long double>(b), 360) -
                                     std::remainder(static_cast<long double>(a), 360);
      EXPECT_EQ(static_cast<double>(
                    std::remainder(d.value + static_cast<long double>(d.rest) - difference, 360)),
                0)
          << a << " to " << b;
      EXPECT_LE(std::fabs(d.value), 180) << a << " to " << b;
      EXPECT_LT(std::fabs(d.rest), 1e-13) << a << " to " << b;
    }
  }
  EXPECT_NEAR(degrees_between(0.0, 180.05).value, -179.95, 1e-13);
  EXPECT_NEAR(degrees_between(100.0, -80.05).value, 179.95, 1e-13);
  EXPECT_EQ(degrees_between(-90.0, 90.0).value, 180);
  EXPECT_EQ(degrees_between(90.0, -90.0).value, -180);
}

TEST(Degrees, LongitudesAreBroughtWithinHalfATurn) {
  EXPECT_EQ(wrap_degrees(190.0), -170);
  EXPECT_EQ(wrap_degrees(-190.0), 170);
  EXPECT_EQ(wrap_degrees(720.5), 0.5);
  EXPECT_EQ(wrap_degrees(-12.25), -12.25);
}

}  // namespace
}  // namespace tidewater::detail
