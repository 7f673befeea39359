#include "formulas/geodesic.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "formulas/geodesic_lines.hpp"

namespace tidewater::detail {
namespace {

constexpr double kA = 6378137;
constexpr double kF = 1 / 298.257223563;

double degrees(SinCos<double> at) { return atan2_degrees(at.sin, at.cos); }

GeodesicArc<double> inverse(const Geodesics& lines, double lat1, double lon1, double lat2,
                            double lon2) {
  const auto arc = lines.many_lines<true>(lat1, lon1, lat2, lon2);
  return arc.plain ? arc : lines.any_line<true>(lat1, lon1, lat2, lon2);
}

TEST(GeodesicFormulas, DirectGivesTheReference) {
  const Geodesics lines(kA, kF);
  double worst = 0;
  for (const auto& row : test::kGeodesicLines) {
    const auto line = lines.line(sincos_degrees(row.lat1), sincos_degrees(row.azimuth1));
    const auto end = lines.position<true>(line, row.length);
    const double lat = atan2_degrees(end.lat_sin, end.lat_cos);
    const double lon = std::remainder(end.lon * kDegreesPerRadian - row.lon2, 360);
    worst = std::max(worst,
                     kA * kRadiansPerDegree *
                         std::hypot(lat - row.lat2, lon * std::cos(row.lat2 * kRadiansPerDegree)));
    EXPECT_NEAR(end.area, row.area, 0.3);
    const double azimuth = std::remainder(degrees(end.azimuth) - row.azimuth2, 360);
    EXPECT_NEAR(azimuth * std::cos(row.lat2 * kRadiansPerDegree), 0, 1e-13);
  }
  EXPECT_LT(worst, 7e-9);
}

TEST(GeodesicFormulas, InverseGivesTheReference) {
  const Geodesics lines(kA, kF);
  double worst = 0;
  for (const auto& row : test::kGeodesicLines) {
    const auto arc = inverse(lines, row.lat1, 0, row.lat2, row.lon2);
    worst = std::max(worst, std::fabs(arc.length - row.inverse));
    EXPECT_NEAR(arc.area, row.area, 3);  // the azimuths of nearly antipodal ends turn quickly
  }
  // Two units of the last place of the longest.  It is one, but the tests are not optimised, and
  // the root that they call on Windows rounds twice: one in four thousand is off by a unit.
  EXPECT_LT(worst, 7.5e-9);
}

TEST(GeodesicFormulas, BothRoadsOfTheInverseAgree) {
  const Geodesics lines(kA, kF);
  int compared = 0;
  for (const auto& row : test::kGeodesicLines) {
    const auto many = lines.many_lines<true>(row.lat1, 0.0, row.lat2, row.lon2);
    if (!many.plain) continue;
    const auto any = lines.any_line<true>(row.lat1, 0, row.lat2, row.lon2);
    EXPECT_NEAR(many.length, any.length, 4e-9);
    // The start's azimuth, by what it moves the end of a line that is no longer than a quadrant.
    const double turn = std::remainder(degrees(many.azimuth1) - degrees(any.azimuth1), 360);
    EXPECT_NEAR(turn * kRadiansPerDegree * std::min(many.length, 1e7), 0, 1e-8);
    ++compared;
  }
  EXPECT_GT(compared, 60);
}

TEST(GeodesicFormulas, LinesOfOnePlace) {
  const Geodesics lines(kA, kF);
  // A quadrant of the meridian (NIMA TR8350.2, table 3.3), the equator, a point itself.
  EXPECT_NEAR(inverse(lines, 0, 10, 90, 77).length, 10001965.7293, 5e-4);
  EXPECT_NEAR(inverse(lines, 90, 10, -90, 77).length, 2 * 10001965.7293, 1e-3);
  EXPECT_NEAR(inverse(lines, 0, -5, 0, 25).length, kA * 30 * kRadiansPerDegree, 1e-9);
  EXPECT_EQ(inverse(lines, 12, 34, 12, 34).length, 0);
  EXPECT_EQ(inverse(lines, 12, 34, 12, 34 + 720).length, 0);
  // Antipodes are joined over a pole.
  EXPECT_NEAR(inverse(lines, 0, 0, 0, 180).length, 2 * 10001965.7293, 1e-3);
  EXPECT_NEAR(inverse(lines, 30, 0, -30, 180).length, 2 * 10001965.7293, 1e-3);
  // C. F. F. Karney, Algorithms for geodesics (2013), table 2.
  const auto end = lines.position(lines.line(sincos_degrees(40.0), sincos_degrees(30.0)), 1e7);
  EXPECT_NEAR(atan2_degrees(end.lat_sin, end.lat_cos), 41.79331020506, 6e-12);
  EXPECT_NEAR(end.lon * kDegreesPerRadian, 137.84490004377, 6e-12);
  EXPECT_NEAR(degrees(end.azimuth), 149.09016931807, 6e-12);
  // Table 5 there: nearly antipodal.
  const auto arc = inverse(lines, -30, 0, 29.9, 179.8);
  EXPECT_NEAR(arc.length, 19989832.82761, 6e-6);
  EXPECT_NEAR(degrees(arc.azimuth1), 161.89052473633, 6e-12);
  EXPECT_NEAR(degrees(arc.azimuth2), 18.09073724574, 6e-12);
}

TEST(GeodesicFormulas, SphereAndProlate) {
  const Geodesics sphere(1, 0);
  EXPECT_NEAR(inverse(sphere, 0, 0, 0, 90).length, kHalfPi, 1e-15);
  EXPECT_NEAR(inverse(sphere, 45, 0, -45, 180).length, kPi, 1e-15);
  EXPECT_NEAR(inverse(sphere, 0, 0, 90, 0).area + 1, 1, 1e-15);
  EXPECT_NEAR(inverse(sphere, 45, 0, 45, 90).length, std::acos(0.5),
              1e-15);  // cos = sin^2 45 + cos^2 45 cos 90
  const Geodesics prolate(1, -0.01);
  // Over the equator; the meridian is longer.
  EXPECT_NEAR(inverse(prolate, 0, 0, 0, 180).length, kPi, 1e-15);
  const auto near = inverse(prolate, 0.1, 0, -0.1, 179.9);
  const auto line = prolate.line(sincos_degrees(0.1), near.azimuth1);
  const auto end = prolate.position(line, near.length);
  EXPECT_NEAR(atan2_degrees(end.lat_sin, end.lat_cos), -0.1, 1e-12);
  EXPECT_NEAR(end.lon * kDegreesPerRadian, 179.9, 1e-12);
}

TEST(GeodesicFormulas, NothingOfNotANumbers) {
  const Geodesics lines(kA, kF);
  EXPECT_FALSE(lines.any_line(91, 0, 0, 0).plain);
  EXPECT_FALSE(lines.any_line(0, std::nan(""), 0, 0).plain);
  EXPECT_TRUE(std::isnan(lines.any_line(0, 0, std::nan(""), 0).length));
}

}  // namespace
}  // namespace tidewater::detail
