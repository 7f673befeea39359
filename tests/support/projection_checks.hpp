// Checks that several families share.
#pragma once

#include "support/points.hpp"

namespace tidewater::test {

// A failure of the meridian arc ends both ways: what stands before it is written, what stands
// behind it is not, and a latitude just beyond a pole is clamped, with a word that only a failure
// replaces. The plane point lies beyond every arc.
template <class Family>
void expect_arc_failure_stops(const Family& family, const CoordinateTriple& beyond) {
  const CoordinateTriple good = {0.1, 0.2, 0}, clamped = {0.1, kPi / 2 + 5e-13, 0};
  Points out = untouched(4);
  EXPECT_EQ(family.forward(Points{good, clamped, {0.1, 2, 0}, good}, out), TW_BAD_LATITUDE);
  EXPECT_NE(out[0].x, kUntouched);
  EXPECT_NE(out[1].x, kUntouched);
  expect_untouched(out[2]);
  expect_untouched(out[3]);
  EXPECT_EQ(family.forward(Points{clamped, good}, out), TW_I_LATITUDE_LIMITED);
  out = untouched(3);
  EXPECT_EQ(family.inverse(Points{good, beyond, good}, out), TW_BAD_LATITUDE);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
}

// The meridian series of an eccentricity of 0.5 in rational arithmetic by hand: the sines of 2p to
// 8p of the arc and of the latitude, and the same by powers of cos 2p.
struct MeridianByHand {
  static constexpr double mean = 0.9342234134674072265625;
  static constexpr double s2 = -0.10013329982757568359375, s4 = 0.00421106815338134765625;
  static constexpr double s6 = -0.00012099742889404296875, s8 = -0.0000093877315521240234375;
  static constexpr double b2 = 0.107382885854105041586, b4 = 0.00671997354878231697451;
  static constexpr double b6 = 0.000582130600337170180936, b8 = 0.0000569319797659769742541;

  static double arc(double p) {
    return mean * p + s2 * std::sin(2 * p) + s4 * std::sin(4 * p) + s6 * std::sin(6 * p) +
           s8 * std::sin(8 * p);
  }
  static void expect_powers(const std::array<double, 5>& c, const std::array<double, 4>& d) {
    EXPECT_DOUBLE_EQ(c[0], mean);
    EXPECT_NEAR(c[1], s2 - s6, 1e-16);
    EXPECT_NEAR(c[2], 2 * s4 - 4 * s8, 1e-17);
    EXPECT_NEAR(c[3], 4 * s6, 1e-18);
    EXPECT_NEAR(c[4], 8 * s8, 1e-19);
    EXPECT_NEAR(d[0], b2 - b6, 1e-16);
    EXPECT_NEAR(d[1], 2 * b4 - 4 * b8, 1e-17);
    EXPECT_NEAR(d[2], 4 * b6, 4e-18);
    EXPECT_NEAR(d[3], 8 * b8, 4e-18);
  }
};

}  // namespace tidewater::test
