#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kRoot2 = 1.4142135623730951;

CoordinateTriple forward(double lon, double lat, double lon0 = 0, double y0 = 0) {
  const CoordinateTriple in = {lon, lat, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWmollweide_f(lon0, y0, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(out.z, kUntouched);
  return out;
}

TEST(Mollweide, AreaNorthOfAParallel) {
  // Another form of the condition: the ellipse's area south of y is that of the sphere's zone,
  // theta + sin(theta) cos(theta) = (pi / 2) sin(lat) with y = sqrt(2) sin(theta).
  for (double lat = -1.55; lat < 1.56; lat += 0.05) {
    const double theta = std::asin(forward(0, lat).y / kRoot2);
    EXPECT_NEAR(theta + std::sin(theta) * std::cos(theta), kPi / 2 * std::sin(lat), 2e-15);
  }
}

TEST(Mollweide, LongitudeIsNotWrapped) {
  EXPECT_NEAR(forward(10, 0, -3).x, kRoot2 * 2 / kPi * 13, 1e-14);
}

TEST(Mollweide, OriginLatitude) {
  double y0 = kUntouched;
  TWstatus status = 0;
  TWmollweide_c(degrees(-50), &y0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(y0, forward(0, degrees(-50)).y);
  EXPECT_EQ(forward(0, degrees(-50), 0, y0).y, 0);
}

TEST(Mollweide, Poles) {
  // The root is a triple one there: a third of the distance goes with each step until rounding, at
  // 1e-5 radians, leaves nothing to step by; the ordinate is the cosine of half that.
  double y0 = kUntouched;
  TWstatus status = 0;
  TWmollweide_c(kPi / 2, &y0, &status);
  EXPECT_NEAR(y0, kRoot2, 5e-11);
  TWmollweide_c(-kPi / 2, &y0, &status);
  EXPECT_NEAR(y0, -kRoot2, 5e-11);
}

TEST(Mollweide, IterationEndsEverywhereNearThePoles) {
  // Around 1e-3 from a pole the steps are rounding above the tolerance and go round for ever.
  std::mt19937 random(10);
  std::uniform_real_distribution<double> exponent(-17, 0);
  for (int i = 0; i < 20000; ++i) {
    const double u = std::pow(10, exponent(random));
    const double lat = kPi / 2 - u;
    if (lat < 0) continue;
    const double y = forward(0, lat).y;
    // near the pole theta is pi/2 - (3 pi u^2 / 4)^(1/3) / ..: (2 w)^3 / 6 = pi u^2 / 2
    if (u < 1e-4) {
      const double w = std::cbrt(3 * kPi * u * u) / 2;
      EXPECT_NEAR(y, kRoot2 * std::cos(w), 1e-9);
    }
    const double theta = std::asin(y / kRoot2);
    EXPECT_NEAR(theta + std::sin(theta) * std::cos(theta), kPi / 2 * std::sin(lat), 1e-13);
  }
  for (const double u : {0.0010846618002797806, 0.00034354173916646029, 0.0013094743044433275,
                         0.00077330440348112443, 0.00027123014654812679}) {
    for (const double sign : {1.0, -1.0}) {
      const double theta = std::asin(forward(0, sign * (kPi / 2 - u)).y / kRoot2);
      EXPECT_NEAR(theta + std::sin(theta) * std::cos(theta), sign * kPi / 2 * std::cos(u), 1e-14);
    }
  }
}

TEST(Mollweide, EveryInputLeavesTheIteration) {
  for (const double lat : {1.6, 3.0, 3.14159265, 10.0, 1e3, 1e10, 1e17, 1e100, 1e300, -1e308,
                           static_cast<double>(kInfinity), -kInfinity, kNaN}) {
    forward(0.5, lat);
    double y0 = 0;
    TWstatus status = 0;
    TWmollweide_c(lat, &y0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  EXPECT_TRUE(std::isnan(forward(0, kNaN).y));
  EXPECT_TRUE(std::isnan(forward(0, kInfinity).y));
}

TEST(Mollweide, InverseStopsOutsideTheMap) {
  const Points in = {{0.5, 0.5, 0}, {0.5, kRoot2 * (1 + 1e-15), 0}, {0.5, 0.5, 0}};
  Points out = untouched(3);
  TWstatus status = 0;
  TWmollweide_i(0, 0, 3, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  // exactly the edge passes, to the pole; the sine there does not exceed 1
  const Points edge = {{0, kRoot2, 0}, {0, -kRoot2, 0}};
  TWmollweide_i(0.3, 0, 2, edge.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(out[0].y, kPi / 2, 2e-8);  // the arc sine near 1
  EXPECT_NEAR(out[1].y, -kPi / 2, 2e-8);
  EXPECT_EQ(out[0].x, 0.3);
}

TEST(Mollweide, RoundTrip) {
  std::mt19937 random(11);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.5, 1.5);
  Points in(500);
  for (auto& q : in) q = {lon(random), lat(random), 2};
  Points out = in;
  TWstatus status = 0;
  double y0 = 0;
  TWmollweide_c(0.4, &y0, &status);
  TWmollweide_f(0.02, y0, 500, out.data(), out.data(), &status);
  TWmollweide_i(0.02, y0, 500, out.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) {
    expect_near(out[i], in[i].x, in[i].y, 2, 2e-13);  // two arc sines and a division by a cosine
  }
}

TEST(Mollweide, NothingToDoAndNotANumber) {
  CoordinateTriple q = kUntouchedPoint;
  TWstatus status = 0;
  TWmollweide_f(0, 0, 0, &q, &q, &status);
  TWmollweide_i(0, 0, -1, &q, &q, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_untouched(q);
  q = {0.1, kNaN, 0};
  TWmollweide_i(0, 0, 1, &q, &q, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_TRUE(std::isnan(q.y));
}

}  // namespace
