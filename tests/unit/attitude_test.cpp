#include <gtest/gtest.h>

#include "support/points.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

struct Angles {
  double a = kUntouched, b = kUntouched, c = kUntouched;
};

Angles tsa(double omega, double phi, double kappa) {
  Angles r;
  TWstatus status = 0;
  TWopk_to_tsa(omega, phi, kappa, &r.a, &r.b, &r.c, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return r;
}

Angles opk(double tilt, double swing, double azimuth) {
  Angles r;
  TWstatus status = 0;
  TWtsa_to_opk(tilt, swing, azimuth, &r.a, &r.b, &r.c, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return r;
}

Angles tsa_of_w(double x, double y, double z, double lon, double lat) {
  Angles r;
  TWstatus status = 0;
  TWWxWyWzto_tsa(x, y, z, lon, lat, &r.a, &r.b, &r.c, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return r;
}

Angles w_of_tsa(double tilt, double swing, double azimuth, double lon, double lat) {
  Angles r;
  TWstatus status = 0;
  TWtsa_toWxWyWz(tilt, swing, azimuth, lon, lat, &r.a, &r.b, &r.c, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return r;
}

void expect_angles(const Angles& r, double a, double b, double c, double tolerance = 1e-14) {
  EXPECT_NEAR(r.a, a, tolerance);
  EXPECT_NEAR(r.b, b, tolerance);
  EXPECT_NEAR(r.c, c, tolerance);
}

TEST(Attitude, MatrixIsTheProductOfThreeTurns) {
  double m[9];
  TWstatus status = 0;
  TWcalc_matrix(0, 0, 0, m, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (int i = 0; i < 9; ++i) EXPECT_EQ(m[i], i % 4 == 0 ? 1 : 0);
  TWcalc_matrix(kPi / 2, 0, 0, m, &status);
  EXPECT_NEAR(m[3], 0, 1e-16);
  EXPECT_NEAR(m[4], 0, 1e-16);
  EXPECT_EQ(m[5], 1);
  // the same turn in three steps: kappa about z, then omega about x, then phi about y
  const double w = 0.3, p = -0.2, k = 0.5;
  const double x = 0.7, y = -1.1, z = 0.4;
  TWcalc_matrix(w, p, k, m, &status);
  const double x1 = x * std::cos(k) + y * std::sin(k), y1 = -x * std::sin(k) + y * std::cos(k);
  const double y2 = y1 * std::cos(w) + z * std::sin(w), z2 = -y1 * std::sin(w) + z * std::cos(w);
  const double x3 = x1 * std::cos(p) - z2 * std::sin(p), z3 = x1 * std::sin(p) + z2 * std::cos(p);
  EXPECT_NEAR(m[0] * x + m[1] * y + m[2] * z, x3, 1e-15);
  EXPECT_NEAR(m[3] * x + m[4] * y + m[5] * z, y2, 1e-15);
  EXPECT_NEAR(m[6] * x + m[7] * y + m[8] * z, z3, 1e-15);
}

// One turn alone, of which the table has cosines on the diagonal and sines beside it.
TEST(Attitude, MatrixOfASingleTurn) {
  const double c = std::cos(0.4), s = std::sin(0.4);
  const double turns[][3] = {{0.4, 0, 0}, {0, 0.4, 0}, {0, 0, 0.4}};
  const double expected[][9] = {
      {1, 0, 0, 0, c, s, 0, -s, c}, {c, 0, -s, 0, 1, 0, s, 0, c}, {c, s, 0, -s, c, 0, 0, 0, 1}};
  for (int turn = 0; turn < 3; ++turn) {
    double m[9];
    TWstatus status = 0;
    TWcalc_matrix(turns[turn][0], turns[turn][1], turns[turn][2], m, &status);
    for (int i = 0; i < 9; ++i) EXPECT_NEAR(m[i], expected[turn][i], 1e-16) << turn << " " << i;
  }
}

TEST(Attitude, LookingStraightDown) {
  expect_angles(tsa(0, 0, 0), 0, -kPi, 0);
  const Angles turned = tsa(0, 0, 1);
  expect_angles(turned, 0, -std::atan2(std::sin(1.0), -std::cos(1.0)), 0);
  // tilted enough to have an azimuth: omega alone tilts to the north
  const Angles tilted = tsa(1e-3, 0, 0);
  EXPECT_NEAR(tilted.a, 1e-3, 1e-12);
  EXPECT_EQ(tilted.c, std::atan2(-0.0, std::sin(1e-3)));
}

TEST(Attitude, ThereAndBack) {
  const double sets[][3] = {{0.3, -0.2, 0.5}, {-0.1, 0.4, -2}, {1, 0.1, 3}, {0.01, 0.02, 0}};
  for (const auto& s : sets) {
    const Angles t = tsa(s[0], s[1], s[2]);
    expect_angles(opk(t.a, t.b, t.c), s[0], s[1], s[2], 1e-12);
    for (const double lon : {-2.0, 0.4}) {
      for (const double lat : {-1.0, 0.7}) {
        const Angles u = tsa_of_w(s[0], s[1], s[2], lon, lat);
        expect_angles(w_of_tsa(u.a, u.b, u.c, lon, lat), s[0], s[1], s[2], 1e-12);
      }
    }
  }
}

TEST(Attitude, PhiAtTheEndOfItsRange) {
  // r = -(sin azimuth sin tilt) is 1 for a tilt of pi/2 and an azimuth of -pi/2
  const Angles up = opk(kPi / 2, 0.3, -kPi / 2);
  EXPECT_EQ(up.b, kPi / 2);
  EXPECT_EQ(up.c, 0);
  EXPECT_NEAR(up.a, std::atan2(-std::cos(0.3), std::sin(0.3)), 1e-15);
  const Angles down = opk(kPi / 2, 0.3, kPi / 2);
  EXPECT_EQ(down.b, -kPi / 2);
  EXPECT_NEAR(down.a, std::atan2(-std::cos(0.3), -std::sin(0.3)), 1e-15);
}

TEST(Attitude, OmegaAtARightAngleTakesTheSine) {
  // tilt pi/2 with azimuth 0.4: cos omega vanishes, and q comes from the sine
  const Angles r = opk(kPi / 2, 0.2, 0.4);
  EXPECT_NEAR(r.a, kPi / 2, 1e-15);
  EXPECT_NEAR(r.b, -0.4, 1e-15);
}

TEST(Attitude, AtThePoleWxIsOmega) {
  // with lat = pi/2 tilt and swing are those of omega, phi, kappa; azimuth is larger by lon + pi/2
  const Angles plain = tsa(0.3, -0.2, 0.5);
  const Angles pole = tsa_of_w(0.3, -0.2, 0.5, 0.7, kPi / 2);
  EXPECT_NEAR(pole.a, plain.a, 1e-14);
  EXPECT_NEAR(pole.b, plain.b, 1e-14);
  EXPECT_NEAR(std::remainder(pole.c - plain.c - 0.7 - kPi / 2, 2 * kPi), 0, 1e-14);
}

TEST(Attitude, GeocentricRotationsLookingStraightDown) {
  // at lat = pi/2, lon = 0 no rotation leaves the camera upright
  const Angles r = tsa_of_w(0, 0, 0, 0, kPi / 2);
  EXPECT_EQ(r.c, 0);
  EXPECT_LT(r.a, 1e-12);
  // g1 = 0, g2 = 1: swing = -atan2(-(cos lon), -0) = pi/2
  EXPECT_NEAR(r.b, kPi / 2, 1e-15);
  // A turn of 0.7 about the axis seen from the meridian of 0.4: -atan2(-cos 0.3, -sin 0.3), which
  // is a right angle and 0.3.
  EXPECT_NEAR(tsa_of_w(0, 0, 0.7, 0.4, kPi / 2).b, kPi / 2 + 0.3, 1e-15);
  EXPECT_NEAR(tsa_of_w(0, 0, 0.4, 0.7, kPi / 2).b, kPi / 2 - 0.3, 1e-15);
}

TEST(Attitude, WyAtTheEndOfItsRange) {
  // tilt 0 at lon 0, lat 0: w = 1, so Wy stands at pi/2
  const Angles r = w_of_tsa(0, 0.3, 0, 0, 0);
  EXPECT_EQ(r.b, kPi / 2);
  EXPECT_EQ(r.c, 0);
  // h8 = sin(swing), h5 = 0, h3 = cos(swing): Wx = atan2(-cos 0.3, sin 0.3)
  EXPECT_NEAR(r.a, std::atan2(-std::cos(0.3), std::sin(0.3)), 1e-15);
  const Angles s = w_of_tsa(0, 0.3, 0, kPi, 0);
  EXPECT_EQ(s.b, -kPi / 2);
}

TEST(Attitude, WxAtARightAngleTakesTheSine) {
  // tilt 0, lat 0, lon 0.4: v = 0 and u = sin lon, so Wx = -pi/2 and q = -u / sin Wx = sin lon
  const Angles r = w_of_tsa(0, 0, 0, 0.4, 0);
  EXPECT_NEAR(r.a, -kPi / 2, 1e-15);
  EXPECT_NEAR(r.b, std::atan2(std::cos(0.4), std::sin(0.4)), 1e-15);
}

}  // namespace
