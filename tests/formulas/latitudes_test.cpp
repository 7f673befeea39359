#include "formulas/latitudes.hpp"

#include <gtest/gtest.h>

#include <cmath>

#include "formulas/reference.hpp"

namespace tidewater::detail {
namespace {

using test::kLatitudes;

constexpr int kKinds = 5;

TEST(Latitudes, SeriesGiveTheReferenceToRounding) {
  int compared = 0;
  for (const auto& row : kLatitudes) {
    const double n = third_flattening(row.f);
    if (std::fabs(n) > kLargestSeriesN) continue;
    for (int from = 0; from < kKinds; ++from) {
      for (int to = 0; to < kKinds; ++to) {
        if (from == to) continue;
        const auto series =
            latitude_series(static_cast<Latitude>(from), static_cast<Latitude>(to), n);
        EXPECT_NEAR(series(row.lat[from]), row.lat[to], 3e-16 + 2e-16 * row.lat[to])
            << "f " << row.f << ", " << from << " to " << to;
        EXPECT_EQ(series(-row.lat[from]), -series(row.lat[from]));
        ++compared;
      }
    }
  }
  EXPECT_EQ(compared, 3 * 10 * 20);  // three ellipsoids are within reach
}

TEST(Latitudes, ClosedFormsAndIterationGiveTheReferenceAtAnyFlattening) {
  for (const auto& row : kLatitudes) {
    for (int from = 0; from < kKinds; ++from) {
      for (int to = 0; to < kKinds; ++to) {
        EXPECT_NEAR(exact_latitude(static_cast<Latitude>(from), static_cast<Latitude>(to), row.f,
                                   row.lat[from]),
                    row.lat[to], 1e-15)
            << "f " << row.f << ", " << from << " to " << to;
      }
    }
  }
}

// What the series leave out grows as the ninth power of the flattening: at the limit it is
// rounding.
TEST(Latitudes, SeriesAreTheClosedFormsUpToTheirLimit) {
  for (const double n : {kLargestSeriesN, -kLargestSeriesN}) {
    const double f = 2 * n / (1 + n);
    for (int from = 0; from < kKinds; ++from) {
      for (int to = 0; to < kKinds; ++to) {
        if (from == to) continue;
        const auto series =
            latitude_series(static_cast<Latitude>(from), static_cast<Latitude>(to), n);
        for (double lat = -1.5; lat < 1.6; lat += 0.25) {
          EXPECT_NEAR(
              series(lat),
              exact_latitude(static_cast<Latitude>(from), static_cast<Latitude>(to), f, lat), 3e-15)
              << n << ", " << from << " to " << to << " of " << lat;
        }
      }
    }
  }
}

TEST(Latitudes, PolesAndTheEquatorStayThemselves) {
  const double pole = 1.5707963267948966;
  for (int from = 0; from < kKinds; ++from) {
    for (int to = 0; to < kKinds; ++to) {
      if (from == to) continue;
      const auto series =
          latitude_series(static_cast<Latitude>(from), static_cast<Latitude>(to), 1.0 / 600);
      EXPECT_EQ(series(0.0), 0.0);
      EXPECT_NEAR(series(pole), pole, 2.3e-16);
      EXPECT_NEAR(
          exact_latitude(static_cast<Latitude>(from), static_cast<Latitude>(to), 0.1, -pole), -pole,
          2.3e-16);
    }
  }
}

TEST(Latitudes, MeridianArcOfTheWorldGeodeticSystem) {
  // The quadrant of WGS 84: 10 001 965.729 m (NIMA TR8350.2, 2000, table 3.3)
  const ExactMeridianArc arc(6378137, 1 / 298.257223563);
  EXPECT_NEAR(arc.arc(1.5707963267948966), 10001965.7293, 5e-4);
  for (const auto& row : kLatitudes) {
    const ExactMeridianArc on(1, row.f);
    if (std::fabs(third_flattening(row.f)) > kLargestSeriesN) continue;
    EXPECT_NEAR(on.arc(row.lat[0]), on.radius * row.lat[2], 4e-16);
    // Two roundings more than the series alone.
    EXPECT_NEAR(on.latitude(on.radius * row.lat[2]), row.lat[0], 7e-16);
  }
}

TEST(Latitudes, SphereOfEqualAreaHasTheEllipsoidsArea) {
  // R. M. Toms and others print 6371007.1809 m for WGS 84 (NIMA TR8350.2, table 3.3).
  EXPECT_NEAR(std::sqrt(authalic_radius_squared(6378137, 1 / 298.257223563)), 6371007.1809, 1e-4);
  EXPECT_EQ(authalic_radius_squared(2, 0), 4);
}

}  // namespace
}  // namespace tidewater::detail
