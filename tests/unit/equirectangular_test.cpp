#include <gtest/gtest.h>

#include "support/points.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

TEST(Equirectangular, StandardParallel) {
  double c = kUntouched;
  TWstatus status = 0;
  TWcyl_eqr_c(degrees(60), &c, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(c, 0.5, 1e-15);
  for (const double lat : {kPi / 2, -kPi / 2, 2.0, kNaN}) {
    c = kUntouched;
    TWcyl_eqr_c(lat, &c, &status);
    EXPECT_EQ(status, TW_BAD_STANDARD_PARALLEL);
    EXPECT_EQ(c, kUntouched);
  }
  TWcyl_eqr_c(-std::nextafter(kPi / 2, 0), &c, &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

TEST(Equirectangular, ForwardByHand) {
  const double past = std::nextafter(kPi / 2, 2);
  const Points in = {{1, 0.75, 1},  {1, past, 0},  {-kPi, kPi / 2, 0},
                     {1, -past, 0}, {4, -0.25, 0}, {1, kNaN, 0}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWcyl_eqr_f(0, 0.25, 0.5, 6, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  expect_near(out[0], 0.5, 0.5, kUntouched, 0);
  expect_untouched(out[1]);
  EXPECT_EQ(out[2].x, kPi / 2);  // -pi becomes pi
  EXPECT_EQ(out[2].y, kPi / 2 - 0.25);
  expect_untouched(out[3]);
  expect_near(out[4], (4 - 2 * kPi) / 2, -0.5, kUntouched, 0);
  EXPECT_EQ(out[5].x, 0.5);
  EXPECT_TRUE(std::isnan(out[5].y));
}

TEST(Equirectangular, InverseByHand) {
  const Points in = {{0.5, 0.5, 1}, {-kPi / 2, 9, 0}, {2, 0, 0}, {-3, 0, 0}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWcyl_eqr_i(0, 0.25, 0.5, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 1, 0.75, kUntouched, 0);
  expect_near(out[1], kPi, 9.25, kUntouched, 0);  // beyond the pole, not refused
  EXPECT_EQ(out[2].x, 4 - 2 * kPi);
  EXPECT_EQ(out[3].x, 2 * kPi - 6);
}

TEST(Equirectangular, ScaleHasAWordOfItsOwn) {
  const double past = std::nextafter(kPi / 2, 2);
  const Points in = {{0, degrees(60), 0}, {0, past, 0}, {0, -past, 0}, {0, 0, 0}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWcyl_eqr_s(3, 0.5, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_NOT_CONVERGED);
  expect_near(out[0], 3, 3, 9, 1e-14);
  expect_near(out[1], 3, 3, 9, 0);
  expect_near(out[2], 3, 3, 9, 0);
  expect_near(out[3], 1.5, 3, 4.5, 0);
  TWcyl_eqr_s(3, 0.5, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

}  // namespace
