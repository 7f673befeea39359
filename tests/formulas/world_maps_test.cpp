// Mollweide's and van der Grinten's maps, to rounding everywhere.
#include <gtest/gtest.h>

#include <cmath>

#include "formulas/mollweide.hpp"
#include "formulas/van_der_grinten.hpp"

namespace tidewater::detail {
namespace {

// 2 theta + sin 2 theta = pi sin phi by halving, in long double.
long double theta(double lat) {
  const long double pi = 3.141592653589793238462643L;
  long double low = -pi / 2;
  long double high = pi / 2;
  for (int i = 0; i < 70; ++i) {
    const long double middle = (low + high) / 2;
    (2 * middle + std::sin(2 * middle) < pi * std::sin(static_cast<long double>(lat)) ? low
                                                                                      : high) =
        middle;
  }
  return (low + high) / 2;
}

TEST(WorldMaps, MollweideOfEveryLatitudeAndBack) {
  const Mollweide map;
  for (int i = -899; i <= 899; ++i) {
    const double lat = i * 0.1 * kRadiansPerDegree;
    const double lon = -2.9;
    const auto to = map.forward(lon, lat);
    const long double t = theta(lat);
    EXPECT_TRUE(to.plain);
    EXPECT_NEAR(to.x, static_cast<double>(2 * std::sqrt(2.0L) / kPi * lon * std::cos(t)), 2e-15);
    EXPECT_NEAR(to.y, static_cast<double>(std::sqrt(2.0L) * std::sin(t)), 2e-15);
    const auto back = map.inverse(to.x, to.y);
    EXPECT_TRUE(back.plain);
    EXPECT_NEAR(back.y, lat, 2e-15);
    EXPECT_NEAR((back.x - lon) * std::cos(lat), 0, 1e-14);
  }
  EXPECT_EQ(map.forward(1.0, kHalfPi).x, 0);
  EXPECT_DOUBLE_EQ(map.forward(1.0, -kHalfPi).y, -std::sqrt(2.0));
  EXPECT_NEAR(map.forward(1.0, 0.0).y, 0, 1e-15);
  EXPECT_FALSE(map.forward(0.0, 1.6).plain);
  EXPECT_FALSE(map.forward(3.2, 0.0).plain);
  EXPECT_FALSE(map.forward(0.0, std::nan("")).plain);
  EXPECT_FALSE(map.inverse(0.0, 1.42).plain);
  EXPECT_FALSE(map.inverse(2.83, 0.0).plain);
  EXPECT_FALSE(map.inverse(2.0, 1.2).plain);
}

// Snyder (1987), appendix A: 160 W, 50 S on the map about 85 W, a sphere of radius 1.
TEST(WorldMaps, VanDerGrintenOfSnydersExample) {
  const VanDerGrinten map;
  const auto to = map.forward(-75 * kRadiansPerDegree, -50 * kRadiansPerDegree);
  EXPECT_NEAR(to.x, -1.1954154, 5e-8);
  EXPECT_NEAR(to.y, -0.9960733, 5e-8);
}

TEST(WorldMaps, VanDerGrintenOfTheWorldAndBack) {
  const VanDerGrinten map;
  for (int i = -90; i <= 90; ++i) {
    for (int j = -180; j <= 180; j += 3) {
      const double lat = i == 90 ? kHalfPi : i == -90 ? -kHalfPi : i * kRadiansPerDegree;
      const double lon = j == 180 ? kPi : j == -180 ? -kPi : j * kRadiansPerDegree;
      const auto to = map.forward(lon, lat);
      EXPECT_TRUE(to.plain);
      EXPECT_LE(std::hypot(to.x, to.y), kPi * (1 + 1e-15));
      const auto back = map.inverse(to.x, to.y);
      EXPECT_TRUE(back.plain);
      EXPECT_NEAR(back.y, lat, 3e-15) << i << " " << j;
      EXPECT_NEAR((back.x - lon) * std::cos(lat), 0, 3e-15) << i << " " << j;
    }
  }
  // The equator is straight, the edge a circle, the poles points.
  EXPECT_DOUBLE_EQ(map.forward(2.0, 0.0).x, 2.0);
  EXPECT_EQ(map.forward(2.0, 0.0).y, 0);
  EXPECT_NEAR(std::hypot(map.forward(kPi, 0.7).x, map.forward(kPi, 0.7).y), kPi, 1e-15);
  EXPECT_EQ(map.forward(2.0, kHalfPi).x, 0);
  EXPECT_DOUBLE_EQ(map.forward(2.0, -kHalfPi).y, -kPi);
  EXPECT_FALSE(map.forward(2.0, 1.5708).plain);
  EXPECT_FALSE(map.inverse(3.0, 1.0).plain);
  EXPECT_FALSE(map.inverse(std::nan(""), 1.0).plain);
}

}  // namespace
}  // namespace tidewater::detail
