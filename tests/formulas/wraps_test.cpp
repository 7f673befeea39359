#include "formulas/wraps.hpp"

#include <gtest/gtest.h>

#include "formulas/isometric_latitude.hpp"
#include "formulas/pole_hold.hpp"
#include "support/points.hpp"

using namespace tidewater::detail;
using tidewater::test::kInfinity;
using tidewater::test::kNaN;

namespace {

TEST(Wraps, DifferInWhatBecomesOfHalfATurn) {
  EXPECT_EQ(wrap_above_then_at_or_below(-kPi), kPi);
  EXPECT_EQ(wrap_above_then_below(-kPi), -kPi);
  EXPECT_EQ(wrap_at_or_below_then_above(-kPi), kPi);
  EXPECT_EQ(wrap_below_then_above(-kPi), -kPi);
  EXPECT_EQ(wrap_turns_below_then_above(-kPi), -kPi);
  EXPECT_EQ(wrap_turns_above_then_at_or_below(-kPi), kPi);
  using Wrap = double (*)(double);
  for (const Wrap wrap :
       {Wrap(wrap_above_then_at_or_below<double>), Wrap(wrap_above_then_below<double>),
        Wrap(wrap_at_or_below_then_above<double>), Wrap(wrap_below_then_above<double>)}) {
    EXPECT_EQ(wrap(kPi), kPi);
    EXPECT_EQ(wrap(1.0), 1);
    EXPECT_EQ(wrap(4), 4 - kTwoPi);
    EXPECT_EQ(wrap(-4), kTwoPi - 4);
    EXPECT_EQ(wrap(20), 20 - kTwoPi);  // one turn at most
    EXPECT_TRUE(std::isnan(wrap(kNaN)));
  }
}

TEST(Wraps, WholeTurnsAreTheFiguresOfSingleSteps) {
  for (const double start : {-31.0, 31.0, 1000.0, -12345.0, 400000.0}) {
    double stepped = start;
    while (stepped < -kPi) stepped += kTwoPi;
    while (stepped > kPi) stepped -= kTwoPi;
    EXPECT_EQ(wrap_turns_below_then_above(start), stepped);
  }
}

// Odd multiples of half a turn, which steps bring back exactly: the double of pi has zeros at its
// end.
TEST(Wraps, WholeTurnsEndAtHalfATurnOnTheSideThatTheyComeFrom) {
  for (const double n : {1.0, 3.0, 5.0, 7.0}) {
    EXPECT_EQ(wrap_turns_below_then_above(-n * kPi), -kPi) << n;
    EXPECT_EQ(wrap_turns_below_then_above(n * kPi), kPi) << n;
    EXPECT_EQ(wrap_turns_above_then_at_or_below(-n * kPi), kPi) << n;
    EXPECT_EQ(wrap_turns_above_then_at_or_below(n * kPi), kPi) << n;
    EXPECT_EQ(turns_about(kPi, (1 - n) * kPi), 0) << n;
    EXPECT_EQ(turns_about(kPi, (1 + n) * kPi), kTwoPi) << n;
    EXPECT_EQ(turns_about(-kPi, (n - 1) * kPi), 0) << n;
    EXPECT_EQ(turns_about(-kPi, -(n + 1) * kPi), -kTwoPi) << n;
  }
}

TEST(Wraps, AboutAnyMeridian) {
  for (const double lon0 : {-50.0, -2.0, 0.0, 3.0, 1000.0}) {
    for (const double off : {-1e7, -40.0, -7.0, -3.0, 0.0, 3.0, 7.0, 40.0, 1e7}) {
      EXPECT_NEAR(turns_about(lon0, lon0 + off), lon0 + std::remainder(off, kTwoPi), 1e-8)
          << lon0 << " " << off;
    }
  }
  EXPECT_EQ(turns_about(2.0, kInfinity), kInfinity);
  EXPECT_TRUE(std::isnan(turns_about(2.0, kNaN)));
  EXPECT_EQ(turns_about(kNaN, 2.0), 2);
}

TEST(Wraps, EndAtOnceForWhatCannotBeBroughtBack) {
  EXPECT_EQ(wrap_turns_below_then_above(1e300), 1e300);
  EXPECT_EQ(wrap_turns_below_then_above(-kInfinity), -kInfinity);
  EXPECT_EQ(wrap_turns_above_then_at_or_below(kInfinity), kInfinity);
  EXPECT_TRUE(std::isnan(wrap_turns_below_then_above(kNaN)));
  // far out, but a turn still changes it
  const double near = wrap_turns_below_then_above(1e12);
  EXPECT_LE(std::fabs(near), kPi);
  EXPECT_NEAR(near, std::remainder(1e12, kTwoPi), 1e-9);
}

TEST(IsometricLatitude, FactorIsThePower) {
  for (const double e : {0.0, 0.0818, 0.1, 0.2, 0.9}) {
    for (double s = -1; s <= 1; s += 0.125) {
      const double power = std::pow((1 - e * s) / (1 + e * s), e / 2);
      EXPECT_NEAR(eccentric_factor(e, s) / power, 1, 1e-15 / (1 - e));
    }
  }
  EXPECT_TRUE(std::isnan(eccentric_factor(1.5, 0.9)));  // a negative base
  EXPECT_EQ(eccentric_factor(1, 1.0), 0);
}

TEST(IsometricLatitude, RestsWhereTheFixedPointRests) {
  for (const double e : {0.0, 0.0818, 0.1, 0.3, 0.8}) {
    for (double t = 1e-8; t < 1e9; t *= 3.7) {
      double lat = kHalfPi - 2 * std::atan(t);
      double previous = 0;
      do {
        previous = lat;
        lat =
            kHalfPi -
            2 * std::atan(t * std::pow((1 - e * std::sin(previous)) / (1 + e * std::sin(previous)),
                                       e / 2));
      } while (std::fabs(lat - previous) > 1e-14);
      // the fixed point stops short by its last step times its contraction
      EXPECT_NEAR(ConformalInverse(e).of_tangent(t), lat, 2e-15 + 1e-14 * e * e / (1 - e * e));
      EXPECT_NEAR(ConformalInverse(e).of_isometric(-std::log(t)), lat,
                  6e-15 + 1e-14 * e * e / (1 - e * e));
    }
  }
  const ConformalInverse earth(0.08);
  EXPECT_EQ(earth.of_tangent(kInfinity), -kHalfPi);
  EXPECT_EQ(earth.of_tangent(0.0), kHalfPi);
  EXPECT_TRUE(std::isnan(earth.of_tangent(kNaN)));
}

TEST(PoleHold, TheSouthPoleGoesPastTheNorthPole) {
  EXPECT_EQ(hold_off_poles(kHalfPi, 1e-10), kHalfPi - 1e-10);
  EXPECT_EQ(hold_off_poles(-kHalfPi, 1e-10), kHalfPi + 1e-10);
  EXPECT_EQ(hold_off_poles(kHalfPi - 2e-10, 1e-10), kHalfPi - 2e-10);
  EXPECT_EQ(hold_off_poles(-kHalfPi + 2e-10, 1e-10), -kHalfPi + 2e-10);
}

}  // namespace
