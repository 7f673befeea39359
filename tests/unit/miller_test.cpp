#include <gtest/gtest.h>

#include "support/points.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

TEST(Miller, SnydersNumericalExample) {
  // Snyder 1987, p. 287: sphere of radius 1, central meridian 0, point 50 N 75 W
  double y0 = kUntouched;
  TWstatus status = 0;
  TWmiller_cyl_c(0, &y0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(y0, 0, 2e-16);
  const CoordinateTriple in = {degrees(-75), degrees(50), 5};
  CoordinateTriple p = kUntouchedPoint;
  TWmiller_cyl_f(&in, 1, 0, y0, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p, -1.3089969, 0.9536371, 5e-8);
  EXPECT_EQ(p.z, kUntouched);
  TWmiller_cyl_i(&p, 1, 0, y0, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p, in.x, in.y, 1e-15);
  CoordinateTriple scale = kUntouchedPoint;
  TWmiller_cyl_s(&in, 1, 1, &scale, &status);
  expect_near(scale, 1.5557238, 1.3054073, 1.5557238 * 1.3054073, 2e-7);
  TWmiller_cyl_s(&in, 1, 2, &scale, &status);
  expect_near(scale, 2 * 1.5557238, 2 * 1.3054073, 4 * 1.5557238 * 1.3054073, 1e-6);
}

TEST(Miller, OrdinateOfTheOrigin) {
  double y0 = kUntouched;
  TWstatus status = 0;
  TWmiller_cyl_c(degrees(50), &y0, &status);
  EXPECT_NEAR(y0, 0.9536371, 5e-8);
  TWmiller_cyl_c(kPi / 2, &y0, &status);  // the pole has a finite ordinate
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(y0, 2.3034125, 5e-8);
}

TEST(Miller, HalfATurnBecomesPlusPi) {
  const Points in = {{-kPi, 0, 0}, {kPi, 0, 0}, {5, 0, 0}, {-5, 0, 0}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWmiller_cyl_f(in.data(), 4, 0, 0, out.data(), &status);
  EXPECT_EQ(out[0].x, kPi);
  EXPECT_EQ(out[1].x, kPi);
  EXPECT_EQ(out[2].x, 5 - 2 * kPi);
  EXPECT_EQ(out[3].x, 2 * kPi - 5);
}

TEST(Miller, InverseStopsBeyondSevenHundred) {
  const double y0 = 0.25;
  const double limit = 875 - y0;  // 0.8 (y + y0) = 700 exactly
  const Points in = {{5, 0.5, 0}, {1, limit, 0}, {2, limit + 1e-9, 0}, {3, 0.5, 0}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWmiller_cyl_i(in.data(), 4, 0.5, y0, out.data(), &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_EQ(out[0].x, 5.5);  // not wrapped
  EXPECT_EQ(out[1].x, 1.5);
  EXPECT_NEAR(out[1].y, kPi / 2 / 0.8, 1e-15);
  EXPECT_EQ(out[2].x, 2.5);  // written before the failure is seen
  EXPECT_EQ(out[2].y, kUntouched);
  expect_untouched(out[3]);
  const CoordinateTriple low = {0, -limit - 2 * y0 - 1e-9, 0};
  TWmiller_cyl_i(&low, 1, 0, y0, out.data(), &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
}

TEST(Miller, ScaleIsTheDerivative) {
  for (double lat = -1.5; lat < 1.51; lat += 0.5) {
    const double step = 1e-5;
    Points p = {{0, lat - step, 0}, {0, lat + step, 0}};
    TWstatus status = 0;
    TWmiller_cyl_f(p.data(), 2, 0, 0, p.data(), &status);
    CoordinateTriple s = {0, lat, 0};
    TWmiller_cyl_s(&s, 1, 1, &s, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR((p[1].y - p[0].y) / (2 * step) / s.y, 1, 1e-8);
    EXPECT_NEAR(s.x * std::cos(lat), 1, 1e-14);
  }
}

}  // namespace
