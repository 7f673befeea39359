#include "formulas/transverse_mercator.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include "formulas/reference.hpp"

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
#include <GeographicLib/TransverseMercatorExact.hpp>
#endif

namespace tidewater::detail {
namespace {

constexpr double kA = 6378137;
constexpr double kF = 1 / 298.257223563;

// Within 5 nm against 50 digits: to 3,900 km from the meridian, from pole to pole.
TEST(TransverseMercatorSeries, GiveTheReferenceWithinFiveNanometres) {
  int within = 0;
  for (const auto& row : test::kTransverseMercator) {
    const TransverseMercator map(kA, row.f, 1);
    const auto plane = map.forward<true>(row.lon * kRadiansPerDegree, row.lat * kRadiansPerDegree);
    const auto back = map.inverse(row.x * kA, row.y * kA);
    const bool reach = row.x * kA <= TransverseMercator::kLargestEasting * map.radius;
    EXPECT_EQ(plane.plain, reach);
    EXPECT_EQ(back.plain, reach);
    if (!reach) continue;
    ++within;
    EXPECT_LT(std::hypot(plane.x - row.x * kA, plane.y - row.y * kA), 5e-9);
    EXPECT_NEAR(plane.scale, row.scale, 2e-15);
    EXPECT_NEAR(plane.convergence, row.convergence, 2e-15);
    const double across =
        (back.lon - row.lon * kRadiansPerDegree) * std::cos(row.lat * kRadiansPerDegree);
    EXPECT_LT(kA * std::hypot(back.lat - row.lat * kRadiansPerDegree, across), 5e-9);
  }
  EXPECT_GT(within, 100);
}

TEST(TransverseMercatorSeries, RefuseWhatIsTooFarAndNotANumber) {
  const TransverseMercator map(kA, kF, 0.9996);
  EXPECT_FALSE(map.forward(90 * kRadiansPerDegree, 0.0).plain);
  EXPECT_FALSE(map.forward(40 * kRadiansPerDegree, 0.1).plain);
  EXPECT_FALSE(map.forward(std::nan(""), 0.1).plain);
  EXPECT_FALSE(map.forward(0.1, std::nan("")).plain);
  const double limit = TransverseMercator::kLargestEasting * map.radius;
  EXPECT_NEAR(limit, 3900e3 * 0.9996, 100);
  EXPECT_TRUE(map.inverse(limit * (1 - 1e-15), 1e6).plain);
  EXPECT_FALSE(map.inverse(limit * (1 + 1e-15), 1e6).plain);
  EXPECT_FALSE(map.inverse(-limit * (1 + 1e-15), 1e6).plain);
  EXPECT_FALSE(map.inverse(0.0, 2.1e7).plain);
  EXPECT_FALSE(map.inverse(std::nan(""), 0.0).plain);
  EXPECT_FALSE(map.inverse(0.0, HUGE_VAL).plain);
}

TEST(TransverseMercatorSeries, PolesAndTheFarSideOfThePole) {
  const TransverseMercator map(kA, kF, 1);
  const double quadrant = ExactMeridianArc(kA, kF).arc(1.5707963267948966);
  const auto pole = map.forward<true>(70 * kRadiansPerDegree, 1.5707963267948966);
  EXPECT_NEAR(pole.x, 0, 1e-9);
  EXPECT_NEAR(pole.y, quadrant, 2e-9);
  EXPECT_NEAR(pole.scale, 1, 1e-15);
  EXPECT_NEAR(pole.convergence, 70 * kRadiansPerDegree, 1e-15);
  const auto beyond = map.forward(180 * kRadiansPerDegree, 80 * kRadiansPerDegree);
  EXPECT_NEAR(beyond.y - quadrant, quadrant - map.forward(0.0, 80 * kRadiansPerDegree).y, 4e-9);
  const auto back = map.inverse(beyond.x, beyond.y);
  EXPECT_NEAR(back.lat, 80 * kRadiansPerDegree, 1e-15);
  EXPECT_NEAR(std::fabs(back.lon), 180 * kRadiansPerDegree, 1e-14);
}

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
TEST(TransverseMercatorSeries, AgreesWithTheExactFormOfThePeer) {
  const GeographicLib::TransverseMercatorExact peer(kA, kF, 0.9996);
  const TransverseMercator map(kA, kF, 0.9996);
  double worst = 0;
  for (int i = -89; i <= 89; i += 2) {
    for (int j = 0; j <= 34; ++j) {
      const double lat = i + 0.37;
      const double lon = j + 0.11;
      const auto ours = map.forward<true>(lon * kRadiansPerDegree, lat * kRadiansPerDegree);
      if (!ours.plain) continue;
      double x = 0;
      double y = 0;
      double convergence = 0;
      double scale = 0;
      peer.Forward(0, lat, lon, x, y, convergence, scale);
      worst = std::max(worst, std::hypot(ours.x - x, ours.y - y));
      EXPECT_NEAR(ours.scale, scale, 3e-14);  // the peer's is good to some 1e-14
      EXPECT_NEAR(ours.convergence / kRadiansPerDegree, convergence, 1e-11);
    }
  }
  EXPECT_LT(worst, 15e-9);  // the peer's own error is 9 nm
  RecordProperty("worst_nm", std::to_string(worst * 1e9));
}
#endif

}  // namespace
}  // namespace tidewater::detail
