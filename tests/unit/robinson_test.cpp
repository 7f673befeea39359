#include <gtest/gtest.h>

#include <random>

#include "support/failing_new.hpp"
#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

// Robinson 1974, table: length of the parallel, distance from the equator, every 5 degrees.
constexpr double kLength[] = {1,      0.9986, 0.9954, 0.99,   0.9822, 0.973,  0.96,
                              0.9427, 0.9216, 0.8962, 0.8679, 0.835,  0.7986, 0.7597,
                              0.7186, 0.6732, 0.6213, 0.5722, 0.5322};
constexpr double kDistance[] = {0,      0.062,  0.124,  0.186,  0.248,  0.31,   0.372,
                                0.434,  0.4958, 0.5571, 0.6176, 0.6769, 0.7346, 0.7903,
                                0.8435, 0.8936, 0.9394, 0.9761, 1};
constexpr double kYUnit = 1.3523319842835606;

struct Robinson {
  std::array<double, 19> knots;
  std::array<double, 76> y_coef, x_coef;
  double y0 = kUntouched;
  TWstatus status = 0;

  explicit Robinson(double lat0 = 0) {
    y_coef.fill(kUntouched);
    x_coef.fill(kUntouched);
    TWrobin_c(knots.data(), y_coef.data(), x_coef.data(), &y0, lat0, &status);
  }
  TWstatus forward(double lon0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWrobin_f(knots.data(), y_coef.data(), x_coef.data(), lon0, y0, static_cast<int32_t>(in.size()),
              out.data(), in.data(), &word);
    return word;
  }
  TWstatus inverse(double lon0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWrobin_i(knots.data(), y_coef.data(), x_coef.data(), lon0, y0, static_cast<int32_t>(in.size()),
              in.data(), out.data(), &word);
    return word;
  }
  TWstatus scale(double radius, double a, double e, double k0, const Points& in,
                 Points& out) const {
    TWstatus word = 0;
    TWrobin_s(knots.data(), y_coef.data(), x_coef.data(), 0.1, radius, a, e, k0,
              static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
};

TEST(Robinson, MeetsTheTable) {
  const Robinson p;
  EXPECT_EQ(p.status, TW_SUCCESS);
  EXPECT_EQ(p.y0, 0);
  EXPECT_EQ(p.knots[18], kPi / 2);
  EXPECT_EQ(p.x_coef[74], kUntouched);
  EXPECT_EQ(p.y_coef[75], kUntouched);
  for (int i = 0; i < 19; ++i) {
    EXPECT_NEAR(p.knots[static_cast<std::size_t>(i)], degrees(5 * i), 3e-16);
    for (const double sign : {1.0, -1.0}) {
      const Points in = {{0.8, sign * p.knots[static_cast<std::size_t>(i)], 0}};
      Points out = untouched(1);
      EXPECT_EQ(p.forward(0.3, in, out), TW_SUCCESS);
      expect_near(out[0], 0.8487 * kLength[i] * 0.5, sign * kYUnit * kDistance[i], 1e-15);
      EXPECT_EQ(out[0].z, kUntouched);
    }
  }
}

TEST(Robinson, EndsOfTheSplines) {
  const Robinson p;
  uint32_t flag = 0;
  EXPECT_EQ(TWrobin_csderv(kPi / 2, p.knots.data(), p.y_coef.data(), 19, &flag),
            0.24006922664096747);
  EXPECT_EQ(flag, 1u);
  EXPECT_EQ(TWrobin_csderv(kPi / 2, p.knots.data(), p.x_coef.data(), 19, &flag),
            -0.43430550824143654);
  EXPECT_NEAR(TWrobin_cseval(kPi / 2, p.knots.data(), p.y_coef.data(), 19, &flag), 1, 1e-15);
  EXPECT_EQ(flag, 1u);
  EXPECT_NEAR(TWrobin_csderv(0, p.knots.data(), p.y_coef.data(), 19, &flag),
              0.062 / 0.08726646259971647, 1e-15);
  EXPECT_NEAR(TWrobin_csderv(0, p.knots.data(), p.x_coef.data(), 19, &flag), 0, 1e-17);
}

TEST(Robinson, AgreesWithProjBetweenTheKnots) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=robin +R=1");
  ASSERT_TRUE(peer.ok());
  const Robinson p;
  for (double lat = -89; lat < 90; lat += 1.7) {
    const Points in = {{2, degrees(lat), 0}};
    Points out = untouched(1);
    p.forward(0, in, out);
    const CoordinateTriple expected = peer.forward(in[0]);
    // two interpolations through a table of four digits
    expect_near(out[0], expected.x, expected.y, 2e-3);
  }
#endif
}

TEST(Robinson, OriginLatitude) {
  const Robinson north(degrees(40)), south(degrees(-40));
  EXPECT_NEAR(north.y0, 0.4958 * kYUnit, 1e-15);
  EXPECT_EQ(south.y0, -north.y0);
  const Robinson pole(kPi / 2);
  EXPECT_EQ(pole.status, TW_SUCCESS);
  EXPECT_NEAR(pole.y0, kYUnit, 1e-15);
  for (const double lat0 : {std::nextafter(kPi / 2, 2), -2.0}) {
    const Robinson beyond(lat0);
    EXPECT_EQ(beyond.status, TW_BAD_LATITUDE);
    EXPECT_NE(beyond.y0, kUntouched);  // written all the same, from the extended cubic
  }
}

TEST(Robinson, WithoutMemory) {
  for (const int from : {0, 1}) {
    const FailingNew failing(from);
    const Robinson p;
    EXPECT_EQ(p.status, TW_NO_MEMORY);
    EXPECT_EQ(failing.asked(), from + 1);  // ends at the first failure
    EXPECT_EQ(p.y0, kUntouched);
  }
}

TEST(Robinson, LatitudeHeldAtThePole) {
  const Robinson p;
  const Points in = {{0.5, kPi / 2 + 0.00005, 0}, {0.5, -kPi / 2 - 0.00005, 0}, {0.5, 0.1, 0}};
  Points out = untouched(3);
  EXPECT_EQ(p.forward(0, in, out), TW_I_LATITUDE_LIMITED);
  expect_near(out[0], 0.8487 * 0.5322 * 0.5, kYUnit, 1e-15);
  expect_near(out[1], 0.8487 * 0.5322 * 0.5, -kYUnit, 1e-15);
  EXPECT_NE(out[2].x, kUntouched);
  const Points exact = {{0.5, kPi / 2, 0}};
  EXPECT_EQ(p.forward(0, exact, out), TW_SUCCESS);
}

TEST(Robinson, ForwardStopsBeyondThePole) {
  const Robinson p;
  for (const double sign : {1.0, -1.0}) {
    const Points in = {{0.5, 0.2, 0}, {0.5, sign * (kPi / 2 + 0.0001), 0}, {0.5, 0.2, 0}};
    Points out = untouched(3);
    EXPECT_EQ(p.forward(0, in, out), TW_BAD_LATITUDE);
    EXPECT_NE(out[0].x, kUntouched);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
  }
}

TEST(Robinson, WrapByLoops) {
  const Robinson p;
  const Points in = {{0.3 + 14 * kPi, 0, 0}, {0.3 - 14 * kPi, 0, 0}, {kPi, 0, 0},      {-kPi, 0, 0},
                     {1e10, 0, 0},           {1e300, 0, 0},          {kInfinity, 0, 0}};
  Points out = untouched(in.size());
  EXPECT_EQ(p.forward(0, in, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].x, 0.3 * 0.8487, 1e-14);
  EXPECT_NEAR(out[1].x, 0.3 * 0.8487, 1e-14);
  EXPECT_EQ(out[2].x, kPi * 0.8487);
  EXPECT_EQ(out[3].x, -kPi * 0.8487);
  // the remainder of a huge longitude, formed in one step with the double turn
  EXPECT_NEAR(out[4].x / 0.8487, std::remainder(1e10, 2 * kPi), 1e-5);
  EXPECT_NE(out[5].x, kUntouched);
  EXPECT_EQ(out[6].x, kInfinity);
  // the central meridian may be far out as well
  EXPECT_EQ(p.forward(1e300, in, out), TW_SUCCESS);
  EXPECT_EQ(p.forward(kInfinity, in, out), TW_SUCCESS);
  EXPECT_EQ(p.forward(-1e10, in, out), TW_SUCCESS);
  EXPECT_LE(std::fabs(out[0].x), 0.8487 * 3.1416);
}

TEST(Robinson, RoundTrip) {
  const Robinson p(0.4);
  std::mt19937 random(8);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.57, 1.57);
  Points in(500);
  for (auto& q : in) q = {lon(random), lat(random), 2};
  Points out = in;
  EXPECT_EQ(p.forward(0.02, out, out), TW_SUCCESS);
  EXPECT_EQ(p.inverse(0.02, out, out), TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) {
    expect_near(out[i], in[i].x, in[i].y, 2, 2e-14);
  }
}

TEST(Robinson, InverseBeyondTheTable) {
  const Robinson p;
  const double slope = 0.24006922664096747 * kYUnit;
  // half of the margin beyond the pole
  const Points held = {{0, kYUnit + 0.00005 * slope, 0}, {0.1, -kYUnit - 0.00005 * slope, 0}};
  Points out = untouched(2);
  EXPECT_EQ(p.inverse(0.7, held, out), TW_I_LATITUDE_LIMITED);
  expect_near(out[0], 0.7, kPi / 2, 0);
  EXPECT_EQ(out[1].y, -kPi / 2);
  EXPECT_NEAR(out[1].x, 0.7 + 0.1 / (0.8487 * 0.5322), 1e-15);
  const Points far = {{0.1, 0.2, 0}, {0, kYUnit + 0.00011 * slope, 0}, {0.1, 0.2, 0}};
  out = untouched(3);
  EXPECT_EQ(p.inverse(0, far, out), TW_BAD_LATITUDE);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  const Points nothing = {{0.1, kNaN, 0}};
  out = untouched(1);
  EXPECT_EQ(p.inverse(0, nothing, out), TW_BAD_LATITUDE);
  expect_untouched(out[0]);
}

TEST(Robinson, InverseIsNotWrapped) {
  const Robinson p;
  const Points in = {{4, 0, 0}};
  Points out = untouched(1);
  EXPECT_EQ(p.inverse(3, in, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].x, 4 / 0.8487 + 3, 1e-14);
}

TEST(Robinson, ScaleByDifferentiation) {
  const Robinson p;
  const double e = 0.0818, a = 2, radius = 1.9;
  const auto forward = [&](const CoordinateTriple& q) {
    Points one = {q};
    p.forward(0.1, one, one);
    return CoordinateTriple{one[0].x * radius / a, one[0].y * radius / a, 0};
  };
  for (double lat = -1.5; lat < 1.5; lat += 0.17) {
    for (double lon = -2; lon < 2.2; lon += 0.9) {
      Points point = {{lon, lat, 0}};
      EXPECT_EQ(p.scale(radius, a, e, 0.9, point, point), TW_SUCCESS);
      const CoordinateTriple expected = numeric_scale(forward, lon, lat, e);
      EXPECT_NEAR(point[0].x, 0.9 * expected.x, 1e-9 * expected.x);
      EXPECT_NEAR(point[0].y, 0.9 * expected.y, 1e-8);
      EXPECT_NEAR(point[0].z, expected.z, 1e-8 * expected.z);  // without k0
    }
  }
}

TEST(Robinson, ScaleIsEvenInTheLatitude) {
  const Robinson p;
  Points north = {{1, 0.8, 0}}, south = {{1, -0.8, 0}};
  p.scale(1, 1, 0.08, 1, north, north);
  p.scale(1, 1, 0.08, 1, south, south);
  expect_near(north[0], south[0].x, south[0].y, south[0].z, 0);
}

TEST(Robinson, ScaleFillsBeyondThePole) {
  const Robinson p;
  const Points in = {{1, 2, 0}, {1, 0.5, 0}, {1, kNaN, 0}};
  Points out = untouched(3);
  EXPECT_EQ(p.scale(1, 1, 0.08, 3, in, out), TW_BAD_LATITUDE);
  expect_near(out[0], 3, 3, 9, 0);
  EXPECT_NE(out[1].x, kUntouched);
  expect_near(out[2], 3, 3, 9, 0);
}

TEST(Robinson, ScaleStopsWhereTheRadiusFails) {
  // Knots that reach beyond the pole let a latitude through that the radii refuse.
  Robinson p;
  p.knots[18] = 2;
  const Points in = {{1, 0.5, 0}, {1, 1.8, 0}, {1, 0.5, 0}};
  Points out = untouched(3);
  EXPECT_EQ(p.scale(1, 1, 0.08, 1, in, out), TW_BAD_LATITUDE);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
}

TEST(Robinson, SplineShorterThanThePoleIsReported) {
  // A flag of 2 inside the latitudes: knots that end early extend the last cubic, with a word.
  Robinson p;
  p.knots[18] = 1.5;
  const Points in = {{1, 1.55, 0}};
  Points out = untouched(1);
  EXPECT_EQ(p.forward(0, in, out), TW_I_LATITUDE_LIMITED);
  EXPECT_NE(out[0].x, kUntouched);
}

TEST(Robinson, NothingToDoAndManyPoints) {
  const Robinson p;
  Points none, guard = untouched(1);
  EXPECT_EQ(p.forward(0, none, guard), TW_SUCCESS);
  EXPECT_EQ(p.inverse(0, none, guard), TW_SUCCESS);
  EXPECT_EQ(p.scale(1, 1, 0, 1, none, guard), TW_SUCCESS);
  expect_untouched(guard[0]);
  Points many(40000, {0.5, 0.5, 0});
  EXPECT_EQ(p.forward(0, many, many), TW_SUCCESS);
  EXPECT_EQ(many.back().x, many.front().x);
}

TEST(Robinson, FarFromAHugeCentralMeridian) {
  // The wrap ends, and gives what single steps give.
  double knots[19], y_coef[76], x_coef[76], y0 = 0;
  TWstatus status = 0;
  TWrobin_c(knots, y_coef, x_coef, &y0, 0, &status);
  ASSERT_EQ(status, TW_SUCCESS);
  for (const double lon0 : {1e9, -1e9, 1e13}) {
    for (const double lon : {lon0 + 100, lon0 - 100, lon0 + 1e5, lon0 + 1}) {
      double stepped = lon;
      while (stepped - lon0 < -kPi) stepped += 2 * kPi;
      while (stepped - lon0 > kPi) stepped -= 2 * kPi;
      const CoordinateTriple in = {lon, 0, 0};
      CoordinateTriple out = {};
      TWrobin_f(knots, y_coef, x_coef, lon0, y0, 1, &out, &in, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      EXPECT_DOUBLE_EQ(out.x, 0.8487 * (stepped - lon0)) << lon0 << " " << lon;
    }
    const CoordinateTriple in = {0, 0, 0};
    CoordinateTriple out = {};
    TWrobin_f(knots, y_coef, x_coef, lon0, y0, 1, &out, &in, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_LE(std::fabs(out.x), 0.8487 * kPi * (1 + 1e-3));
  }
}

}  // namespace
