#include <gtest/gtest.h>

#include <cstring>

#include "support/points.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;

namespace {

constexpr double kSecond = kPi / 180 / 3600;

MreTerm term(double coefficient, int u, int v) {
  MreTerm t = {};
  t.coefficient = coefficient;
  t.power_u = static_cast<int16_t>(u);
  t.power_v = static_cast<int16_t>(v);
  return t;
}

using Terms = std::vector<MreTerm>;

struct Model {
  Terms lon, lat, height;
  double k = 0.5, lon_offset = -2, lat_offset = 3;

  CoordinateTriple run(CoordinateTriple p, int direction, int range) const {
    TWstatus status = 0;
    const auto size = [](const Terms& t) { return static_cast<int32_t>(t.size()); };
    const auto shift = [&](Points points) {
      TWmre(static_cast<int32_t>(points.size()), static_cast<int16_t>(direction),
            static_cast<int16_t>(range), size(lon), size(lat), size(height), k, lon_offset,
            lat_offset, lon.data(), lat.data(), height.data(), points.data(), points.data(),
            &status);
      EXPECT_EQ(status, TW_SUCCESS);
      return points;
    };
    const Points alone = shift({p});
    // Many points go another road, to the same bits.
    for (const CoordinateTriple& q : shift(Points(9, p))) {
      EXPECT_EQ(std::memcmp(&q, alone.data(), sizeof q), 0);
    }
    return alone[0];
  }
};

TEST(Regression, SumsOfPowers) {
  // At 8 E, 5 N: U = 0.5 (5 + 3) = 4, V = 0.5 (8 - 2) = 3.
  const Model model = {{term(1, 0, 0), term(0.5, 1, 0)},
                       {term(2, 0, 1), term(-1, 1, 1), term(0.01, 2, 3)},
                       {term(10, 0, 0), term(0.001, 9, 0), term(0.002, 0, 9)}};
  const CoordinateTriple in = {degrees(8), degrees(5), 100};
  const double dlon = (1 + 2) * kSecond;
  const double dlat = (6 - 12 + 0.01 * 16 * 27) * kSecond;
  const double dh = 10 + 0.001 * 262144 + 0.002 * 19683;
  for (const int direction : {1, -1, 7}) {
    const auto p = model.run(in, direction, 0);
    EXPECT_NEAR(p.x, in.x + dlon, 1e-16);
    EXPECT_NEAR(p.y, in.y + dlat, 1e-16);
    EXPECT_NEAR(p.z, in.z + dh, 1e-9);
  }
  const auto p = model.run(in, 0, 0);
  EXPECT_NEAR(p.x, in.x - dlon, 1e-16);
  EXPECT_NEAR(p.y, in.y - dlat, 1e-16);
  EXPECT_NEAR(p.z, in.z - dh, 1e-9);
  // There and back is not exact: the sums are those of the shifted point.
  const auto back = model.run(model.run(in, 1, 0), 0, 0);
  EXPECT_NE(back.z, in.z);
  EXPECT_NEAR(back.z, in.z, 1);
}

TEST(Regression, LongitudeRanges) {
  // The height sum shows the longitude in degrees itself.
  const Model model = {{}, {}, {term(1, 0, 1)}, 1, 0, 0};
  const auto lon_seen = [&](double lon, int range) {
    return model.run({degrees(lon), 0, 0}, 1, range).z;
  };
  EXPECT_NEAR(lon_seen(-10, 0), -10, 1e-12);
  EXPECT_NEAR(lon_seen(-10, 1), 350, 1e-12);
  EXPECT_NEAR(lon_seen(190, 0), -170, 1e-12);
  EXPECT_NEAR(lon_seen(190, 2), -170, 1e-12);
  EXPECT_NEAR(lon_seen(190, 1), 190, 1e-12);
  EXPECT_NEAR(lon_seen(-190, 0), 170, 1e-12);
  EXPECT_NEAR(lon_seen(-730, 0), -10, 1e-10);
  EXPECT_NEAR(lon_seen(-730, 1), 350, 1e-10);
  EXPECT_NEAR(lon_seen(730, 0), 10, 1e-10);
  EXPECT_NEAR(lon_seen(730, 1), 730, 1e-10);  // no upper bound
  EXPECT_EQ(lon_seen(0, 1), 0);
  EXPECT_EQ(lon_seen(180, 0), 180);
  EXPECT_EQ(lon_seen(-180, 0), -180);
  // The output longitude is that of the input, not of the range.
  EXPECT_EQ(model.run({-3, 0, 0}, 1, 1).x, -3);
  for (const double odd : {kNaN, kInfinity, -kInfinity, 1e300, -1e300}) {
    lon_seen(odd, 0);
    lon_seen(odd, 1);
  }
}

TEST(Regression, PowersBeyondTheTableReadNothingElse) {
  const Model model = {{}, {}, {term(1, 12, 0), term(1, 0, -1)}};
  EXPECT_NEAR(model.run({degrees(8), degrees(5), 0}, 1, 0).z, std::pow(4, 12) + 1.0 / 3, 1e-6);
  const Model next = {{}, {}, {term(1, 10, 0), term(1, 0, 10)}};
  EXPECT_NEAR(next.run({degrees(8), degrees(5), 0}, 1, 0).z, std::pow(4, 10) + std::pow(3, 10),
              1e-6);
  // One such power of either base, in any of the three sums: U = 4, V = 3.
  const CoordinateTriple at = {degrees(8), degrees(5), 0};
  for (const MreTerm& odd : {term(1, -2, 1), term(1, 2, -1), term(1, 10, 0), term(1, 0, 10)}) {
    const double sum = std::pow(4, odd.power_u) * std::pow(3, odd.power_v);
    const Model in_lon = {{odd}, {}, {}}, in_lat = {{}, {odd}, {}}, in_height = {{}, {}, {odd}};
    EXPECT_NEAR(in_lon.run(at, 1, 0).x, at.x + sum * kSecond, 1e-15 * sum);
    EXPECT_NEAR(in_lat.run(at, 1, 0).y, at.y + sum * kSecond, 1e-15 * sum);
    EXPECT_NEAR(in_height.run(at, 1, 0).z, sum, 1e-14 * sum);
  }
}

TEST(Regression, NothingToDo) {
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1}) {
    TWstatus status = 0;
    TWmre(count, 1, 0, 0, 0, 0, 1, 0, 0, nullptr, nullptr, nullptr, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(p);
  }
  const Model empty;
  expect_near(empty.run({0.1, 0.2, 3}, 1, 0), 0.1, 0.2, 3, 0);
}

}  // namespace
