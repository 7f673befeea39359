// Mollweide's and van der Grinten's maps, to rounding everywhere.
#include <gtest/gtest.h>

#include <cmath>

#include "formulas/eckert4.hpp"
#include "formulas/equal_earth.hpp"
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

// t + sin t cos t + 2 sin t = (2 + pi / 2) sin phi by halving, in long double.
TEST(WorldMaps, Eckert4OfEveryLatitudeAndBack) {
  const long double pi = 3.141592653589793238462643L;
  const Eckert4 map;
  for (int i = -899; i <= 899; ++i) {
    const double lat = i * 0.1 * kRadiansPerDegree;
    const double lon = 2.9;
    long double low = -pi / 2, high = pi / 2;
    for (int k = 0; k < 70; ++k) {
      const long double t = (low + high) / 2;
      const bool below = t + std::sin(t) * std::cos(t) + 2 * std::sin(t) <
                         (2 + pi / 2) * std::sin(static_cast<long double>(lat));
      (below ? low : high) = t;
    }
    const auto to = map.forward(lon, lat);
    EXPECT_TRUE(to.plain);
    EXPECT_NEAR(to.x, static_cast<double>(2 / std::sqrt(pi * (4 + pi)) * lon * (1 + std::cos(low))),
                2e-15);
    EXPECT_NEAR(to.y, static_cast<double>(2 * std::sqrt(pi / (4 + pi)) * std::sin(low)), 2e-15);
    const auto back = map.inverse(to.x, to.y);
    EXPECT_TRUE(back.plain);
    // Next to the pole's line the ordinate hardly tells how far from it a point lies.
    const double loss = 1 / std::cos(lat);
    EXPECT_NEAR(back.y, lat, 4e-16 * loss + 1e-15);
    EXPECT_NEAR(back.x, lon, 1e-15 * loss + 2e-15);
  }
  // The poles are lines half as long as the equator.
  EXPECT_DOUBLE_EQ(map.forward(kPi, 0.0).x, 2 * map.forward(kPi, kHalfPi).x);
  EXPECT_DOUBLE_EQ(map.forward(1.0, -kHalfPi).y, -map.kY);
  EXPECT_NEAR(map.forward(1.0, 0.0).y, 0, 1e-15);
  EXPECT_FALSE(map.forward(0.0, std::nextafter(kHalfPi, 2)).plain);
  EXPECT_FALSE(map.forward(3.15, 0.0).plain);
  EXPECT_FALSE(map.forward(std::nan(""), 0.0).plain);
  EXPECT_FALSE(map.forward(0.0, std::nan("")).plain);
  EXPECT_FALSE(map.inverse(0.0, 1.33).plain);
  EXPECT_FALSE(map.inverse(2.66, 0.0).plain);
  EXPECT_FALSE(map.inverse(1.34, 1.3265).plain);
  // What rounding leaves outside of half a turn is brought to it.
  const auto edge = map.inverse(map.forward(kPi, 0.3).x * (1 + 1e-12), map.forward(kPi, 0.3).y);
  EXPECT_TRUE(edge.plain);
  EXPECT_EQ(edge.x, kPi);
}

// The polynomial of Savric, Patterson and Jenny (2019), with its powers written out.
TEST(WorldMaps, EqualEarthOfEveryLatitudeAndBack) {
  using Real = long double;
  for (int i = -90; i <= 90; ++i) {
    const double beta = i == 90 ? kHalfPi : i == -90 ? -kHalfPi : i * kRadiansPerDegree;
    const double lon = -2.2;
    const Real M = std::sqrt(3.0L) / 2;
    const Real t = std::asin(M * std::sin(static_cast<Real>(beta)));
    const Real slope = 1.340264L - 3 * 0.081106L * std::pow(t, 2) + 7 * 0.000893L * std::pow(t, 6) +
                       9 * 0.003796L * std::pow(t, 8);
    const Real height = 1.340264L * t - 0.081106L * std::pow(t, 3) + 0.000893L * std::pow(t, 7) +
                        0.003796L * std::pow(t, 9);
    double x, y;
    EqualEarth::forward(lon, beta, &x, &y);
    EXPECT_NEAR(x, static_cast<double>(lon * std::cos(t) / (M * slope)), 2e-15);
    EXPECT_NEAR(y, static_cast<double>(height), 1e-15);
    double back_lon, back_beta;
    EXPECT_TRUE(EqualEarth::inverse(x, y, &back_lon, &back_beta));
    EXPECT_NEAR(back_lon, lon, 3e-15);
    // Along the pole's line the ordinate hardly tells the latitude.
    EXPECT_NEAR(back_beta, beta, 3e-16 / std::fmax(std::cos(beta), 1.5e-8));
  }
  double x, y, lon, beta;
  EqualEarth::forward(0, kHalfPi, &x, &y);
  EXPECT_NEAR(y, 1.3173627591574, 1e-13);  // half of what the authors state as the map's height
  // Beyond the pole's line by rounding, and by more.
  EXPECT_TRUE(EqualEarth::inverse(0, y + 1e-13, &lon, &beta));
  EXPECT_EQ(beta, kHalfPi);
  EXPECT_TRUE(EqualEarth::inverse(0, -y - 1e-13, &lon, &beta));
  EXPECT_EQ(beta, -kHalfPi);
  EXPECT_FALSE(EqualEarth::inverse(0, y + 1e-11, &lon, &beta));
  EXPECT_FALSE(EqualEarth::inverse(0, -2, &lon, &beta));
  EXPECT_FALSE(EqualEarth::inverse(0, std::nan(""), &lon, &beta));
  // Beyond half a turn.
  EqualEarth::forward(kPi, 0.5, &x, &y);
  EXPECT_TRUE(EqualEarth::inverse(x, y, &lon, &beta));
  EXPECT_FALSE(EqualEarth::inverse(x + 1e-6, y, &lon, &beta));
  EXPECT_FALSE(EqualEarth::inverse(-x - 1e-6, y, &lon, &beta));
}

}  // namespace
}  // namespace tidewater::detail
