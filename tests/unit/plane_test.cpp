#include <gtest/gtest.h>

#include "support/points.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

TEST(Plane, GridAndBack) {
  const Points in = {{0.5, -0.25, 3}, {1, 2, 4}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWab_to_en(100, 2, 500000, -1000, 2, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 500100, -1050, kUntouched, 0);
  expect_near(out[1], 500200, -600, kUntouched, 0);
  TWen_to_ab(100, 2, 500000, -1000, 2, out.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 0.5, -0.25, kUntouched, 0);
  expect_near(out[1], 1, 2, kUntouched, 0);
  TWab_to_en(1, 1, 1, 1, 0, out.data(), out.data(), &status);
  TWen_to_ab(1, 1, 1, 1, -1, out.data(), out.data(), &status);
  expect_near(out[0], 0.5, -0.25, kUntouched, 0);
}

double deviation(const Points& points, int32_t count) {
  double d = kUntouched;
  TWstatus status = 0;
  TWpt_line_dist(points.data(), count, &d, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return d;
}

TEST(Plane, DeviationOfTheOddPoints) {
  const Points line = {{0, 0, 9}, {1, 1, -9}, {2, 2, 0}};
  EXPECT_EQ(deviation(line, 3), 0);
  // the second point stands 2 off its chord, the fourth 1; the third is an end of chords
  const Points bent = {{0, 0, 0}, {5, 2, 0}, {10, 0, 0}, {15, 1, 0}, {20, 0, 0}, {25, 9, 0}};
  EXPECT_DOUBLE_EQ(deviation(bent, 5), 2);
  EXPECT_DOUBLE_EQ(deviation(bent, 6), 2);  // the sixth has no second neighbour
  EXPECT_DOUBLE_EQ(deviation(bent, 3), 2);
  EXPECT_EQ(deviation(bent, 2), 0);
  EXPECT_EQ(deviation(bent, 0), 0);
  EXPECT_EQ(deviation(bent, -7), 0);
  // A chord of (3, 4) from (1, 1), which the point (2, 5) stands |4 3 - 1 4| / 5 off.
  const Points slanting = {{1, 1, 0}, {2, 5, 0}, {4, 5, 0}};
  EXPECT_DOUBLE_EQ(deviation(slanting, 3), 1.6);
  const Points high = {{0, 0, 0}, {0, 7, 0}, {0, 0, 0}};
  EXPECT_EQ(deviation(high, 3), 0);  // a chord of no length: nothing divided by nothing
}

TEST(Plane, BilinearCorners) {
  const auto at = [](double fx, double fy) {
    double r = kUntouched;
    TWstatus status = 0;
    TWbilinear_interpolation(1, 2, 4, 16, fx, fy, &r, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return r;
  };
  EXPECT_EQ(at(0, 0), 1);
  EXPECT_EQ(at(0, 1), 2);
  EXPECT_EQ(at(1, 0), 4);
  EXPECT_EQ(at(1, 1), 16);
  EXPECT_EQ(at(0.5, 0.5), 23.0 / 4);
}

TEST(Plane, QuadraticThroughThreeValues) {
  const auto at = [](float t) {
    const float f0 = 2, f1 = 5, f2 = 12;
    float r = 0;
    TWstatus status = 0;
    TWqterp2(&t, &f0, &f1, &f2, &r, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return r;
  };
  EXPECT_EQ(at(0), 2);
  EXPECT_EQ(at(1), 5);
  EXPECT_EQ(at(2), 12);
  EXPECT_EQ(at(0.5F), 3);  // 2 + t + 2 t^2
  EXPECT_EQ(at(1.5F), 8);
}

TEST(Plane, DifferencesAreRoundedToSinglePrecision) {
  // f1 - f0 = 1.00000001 is not a float: the rounded 1 is what is used
  const float t = 1, f0 = 1e8F, f1 = 100000008.0F, f2 = 100000016.0F;
  float r = 0;
  TWstatus status = 0;
  TWqterp2(&t, &f0, &f1, &f2, &r, &status);
  EXPECT_EQ(r, 100000008.0F);
  const float half = 0.5F, g0 = 16777216.0F, g1 = 1.0F, g2 = 16777216.0F;
  // d1 = -16777215, d2 = 16777215, dd = 33554430 -> 33554430; by hand 16777216 - 8388607.5 -
  // 4194303.75
  TWqterp2(&half, &g0, &g1, &g2, &r, &status);
  EXPECT_EQ(r, 4194304.75F);
}

}  // namespace
