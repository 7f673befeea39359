#include "formulas/rhumb.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "formulas/rhumb_lines.hpp"

namespace tidewater::detail {
namespace {

constexpr double kA = 6378137;
constexpr double kF = 1 / 298.257223563;

TEST(RhumbFormulas, DirectGivesTheReference) {
  const RhumbLines lines(kA, kF);
  for (const auto& row : test::kRhumbLines) {
    const auto end = lines.direct<true>(row.lat1, sincos_degrees(row.azimuth), row.length);
    ASSERT_TRUE(end.plain);
    EXPECT_NEAR(end.lat, row.lat2, 3e-14);
    // Lines around a pole turn often; the ends are exact in proportion to the length.
    const double across =
        kA * kRadiansPerDegree * (end.lon - row.lon2) * std::cos(row.lat2 * kRadiansPerDegree);
    EXPECT_NEAR(across, 0, 4e-9 + 1e-15 * row.length) << row.lat1 << " by " << row.azimuth;
    EXPECT_NEAR(end.area, row.area, 0.2 + 2e-15 * std::fabs(row.area));
  }
}

TEST(RhumbFormulas, InverseGivesTheReferenceOfLinesThatKeepToTheirHalf) {
  const RhumbLines lines(kA, kF);
  int compared = 0;
  for (const auto& row : test::kRhumbLines) {
    if (std::fabs(row.lon2) > 180) continue;
    const auto line = lines.inverse<true>(row.lat1, 0.0, row.lat2, row.lon2);
    EXPECT_NEAR(line.length, row.length, 6e-9);
    EXPECT_NEAR(line.area, row.area, 0.2);
    const double azimuth = atan2_degrees(line.azimuth.sin, line.azimuth.cos);
    const double turn = std::remainder(azimuth - row.azimuth, 360) * kRadiansPerDegree;
    EXPECT_NEAR(turn * row.length, 0, 6e-9);
    ++compared;
  }
  EXPECT_GT(compared, 30);
}

TEST(RhumbFormulas, PolesAreReachedAlongTheMeridian) {
  const RhumbLines lines(kA, kF);
  const double quadrant = 10001965.729312;
  const auto up = lines.inverse<true>(0.0, 10.0, 90.0, 60.0);
  EXPECT_NEAR(up.length, quadrant, 1e-5);
  EXPECT_EQ(up.azimuth.sin, 0);
  EXPECT_GT(up.azimuth.cos, 0);
  // It winds around the pole without end: all of its longitudes' share of a half of the earth,
  // which has 510,065,621.724 km^2 (NIMA TR8350.2, table 3.3, by its authalic radius).
  const double share = 510065621.724e6 / 2 * 50 / 360;
  EXPECT_NEAR(up.area, share, 1e3);
  EXPECT_NEAR(lines.inverse<true>(90.0, 10.0, 20.0, 60.0).area, share, 1e3);
  EXPECT_NEAR(lines.inverse<true>(87.0, 10.0, 90.0, 60.0).area, share, 1e3);
  EXPECT_NEAR(lines.inverse<true>(-90.0, 10.0, -89.5, 60.0).area, -share, 1e3);
  EXPECT_NEAR(lines.inverse<true>(20.0, 10.0, -90.0, 60.0).area, -share, 1e3);
  EXPECT_NEAR(lines.inverse<true>(90.0, 10.0, 90.0, 60.0).area, share, 1e3);
  EXPECT_EQ(lines.inverse<true>(90.0, 10.0, -90.0, 60.0).area, 0);
  const auto over = lines.inverse(90.0, 10.0, -90.0, 60.0);
  EXPECT_NEAR(over.length, 2 * quadrant, 2e-5);
  EXPECT_LT(over.azimuth.cos, 0);
  EXPECT_EQ(lines.inverse(90.0, 10.0, 90.0, 60.0).length, 0);
  EXPECT_EQ(lines.inverse(30.0, 10.0, 30.0, 10.0).length, 0);
  EXPECT_TRUE(lines.direct(0.0, sincos_degrees(0.0), quadrant * (1 - 1e-12)).plain);
  EXPECT_FALSE(lines.direct(0.0, sincos_degrees(0.0), quadrant * (1 + 1e-12)).plain);
  EXPECT_FALSE(lines.direct(80.0, sincos_degrees(45.0), 5e6).plain);
}

TEST(RhumbFormulas, HalfATurnIsTakenEastwards) {
  const RhumbLines lines(kA, kF);
  EXPECT_GT(lines.inverse(10.0, 0.0, 20.0, 180.0).azimuth.sin, 0);
  EXPECT_GT(lines.inverse(10.0, 0.0, 20.0, -180.0).azimuth.sin, 0);
  EXPECT_LT(lines.inverse(10.0, 0.0, 20.0, -179.0).azimuth.sin, 0);
}

// On a sphere the rhumb line is straight in Mercator's map.
TEST(RhumbFormulas, OnTheSphere) {
  const RhumbLines lines(1, 0);
  const double psi = std::asinh(std::tan(60 * kRadiansPerDegree));
  const auto line = lines.inverse<true>(0.0, 0.0, 60.0, 40.0);
  const double lon = 40 * kRadiansPerDegree;
  EXPECT_NEAR(std::atan2(line.azimuth.sin, line.azimuth.cos), std::atan2(lon, psi), 1e-15);
  EXPECT_NEAR(line.length, std::hypot(lon, psi) * (60 * kRadiansPerDegree) / psi, 2e-15);
  EXPECT_NEAR(line.area, lon * std::log(2) / psi, 1e-15);
}

}  // namespace
}  // namespace tidewater::detail
