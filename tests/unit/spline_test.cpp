#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include "support/failing_new.hpp"
#include "support/points.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

double cubic(double x) { return ((0.3 * x - 1) * x + 2) * x + 0.5; }
double cubic_slope(double x) { return (0.9 * x - 2) * x + 2; }

// A spline with the ends clamped to the slopes of a cubic is that cubic.
struct Spline {
  std::vector<double> knots = {0, 0.7, 1, 2.5, 3};
  std::vector<double> coef;
  TWstatus status = 0;

  Spline() : coef(20, kUntouched) {
    for (std::size_t i = 0; i < 5; ++i) coef[4 * i] = cubic(knots[i]);
    coef[1] = cubic_slope(0);
    coef[17] = cubic_slope(3);
    TWrobin_csform(knots.data(), coef.data(), 5, &status);
  }
  double eval(double x, uint32_t* flag) const {
    return TWrobin_cseval(x, knots.data(), coef.data(), 5, flag);
  }
  double slope(double x, uint32_t* flag) const {
    return TWrobin_csderv(x, knots.data(), coef.data(), 5, flag);
  }
  double inverse(double y, uint32_t* flag) const {
    return TWrobin_csinv(y, knots.data(), coef.data(), 5, flag);
  }
};

TEST(Spline, ReproducesACubic) {
  const Spline s;
  EXPECT_EQ(s.status, TW_SUCCESS);
  for (double x = 0; x <= 3; x += 0.01) {
    uint32_t flag = 0;
    EXPECT_NEAR(s.eval(x, &flag), cubic(x), 1e-14);
    EXPECT_EQ(flag, 1u);
    EXPECT_NEAR(s.slope(x, &flag), cubic_slope(x), 1e-13);
    EXPECT_EQ(flag, 1u);
    EXPECT_NEAR(s.inverse(cubic(x), &flag), x, 1e-13);
    EXPECT_EQ(flag, 1u);
  }
  EXPECT_EQ(s.coef[18], kUntouched);  // c and d of the last row
  EXPECT_EQ(s.coef[19], kUntouched);
}

TEST(Spline, ClampedNaturalExample) {
  // Knots 0, 1, 2 with values 0, 1, 0 and level ends, solved by hand: the slope at 1 is 0, the rows
  // are 3 t^2 - 2 t^3 and 1 - 3 t^2 + 2 t^3.
  const double knots[] = {0, 1, 2};
  double coef[12] = {0, 0, 9, 9, 1, 9, 9, 9, 0, 0, 9, 9};
  TWstatus status = 0;
  TWrobin_csform(knots, coef, 3, &status);
  const double expected[12] = {0, 0, 3, -2, 1, 0, -3, 2, 0, 0, 9, 9};
  for (int i = 0; i < 12; ++i) EXPECT_NEAR(coef[i], expected[i], 1e-15) << i;
}

TEST(Spline, TwoKnots) {
  // One cubic with both slopes given: Hermite's.
  const double knots[] = {1, 3};
  double coef[8] = {5, 1, 0, 0, 9, -1, kUntouched, kUntouched};
  TWstatus status = 0;
  TWrobin_csform(knots, coef, 2, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  uint32_t flag = 0;
  EXPECT_NEAR(TWrobin_cseval(2, knots, coef, 2, &flag), 7 + 0.5, 1e-15);  // (5+9)/2 + 2 (1+1)/8
  EXPECT_EQ(TWrobin_cseval(3, knots, coef, 2, &flag), 9);
  EXPECT_EQ(TWrobin_csderv(3, knots, coef, 2, &flag), -1);
}

TEST(Spline, KnotsBelongToTheIntervalThatStartsThere) {
  // Rows that do not meet show which row is used.
  const double knots[] = {0, 1, 2};
  const double coef[] = {10, 1, 0, 0, 20, 2, 0, 0, 30, 3, kNaN, kNaN};
  uint32_t flag = 0;
  EXPECT_EQ(TWrobin_cseval(0, knots, coef, 3, &flag), 10);
  EXPECT_EQ(TWrobin_cseval(0.9375, knots, coef, 3, &flag), 10.9375);
  EXPECT_EQ(TWrobin_cseval(1, knots, coef, 3, &flag), 20);
  EXPECT_EQ(TWrobin_cseval(2, knots, coef, 3, &flag), 22);  // the last interval at full length
  EXPECT_EQ(flag, 1u);
  EXPECT_EQ(TWrobin_csderv(1, knots, coef, 3, &flag), 2);
  EXPECT_EQ(TWrobin_csderv(2, knots, coef, 3, &flag), 3);  // the given end slope
  EXPECT_EQ(flag, 1u);
  // outside, the outermost rows go on
  EXPECT_EQ(TWrobin_cseval(-1, knots, coef, 3, &flag), 9);
  EXPECT_EQ(flag, 2u);
  EXPECT_EQ(TWrobin_cseval(3, knots, coef, 3, &flag), 24);
  EXPECT_EQ(flag, 2u);
  EXPECT_EQ(TWrobin_csderv(-1, knots, coef, 3, &flag), 1);
  EXPECT_EQ(flag, 2u);
  EXPECT_EQ(TWrobin_csderv(3, knots, coef, 3, &flag), 2);
  EXPECT_EQ(flag, 2u);
  // the inverse searches the values
  EXPECT_EQ(TWrobin_csinv(15, knots, coef, 3, &flag), 5);
  EXPECT_EQ(flag, 1u);
  EXPECT_EQ(TWrobin_csinv(20, knots, coef, 3, &flag), 1);
  EXPECT_EQ(TWrobin_csinv(30, knots, coef, 3, &flag), 6);
  EXPECT_EQ(flag, 1u);
  EXPECT_DOUBLE_EQ(TWrobin_csinv(9, knots, coef, 3, &flag), -1);
  EXPECT_EQ(flag, 2u);
  EXPECT_DOUBLE_EQ(TWrobin_csinv(32, knots, coef, 3, &flag), 7);
  EXPECT_EQ(flag, 2u);
}

TEST(Spline, InverseStopsAfterElevenPasses) {
  // x^3 - 2 x + 2 = 0 from 0 goes round between 0 and 1 for ever: the passes end on one of them.
  const double knots[] = {0, 1};
  const double coef[] = {2, -2, 0, 1, 2, 0, 0, 0};  // value 2 at both ends of the search
  uint32_t flag = 0;
  // y = 0 is below a[0]; the start (0 - 2) / (2 - 2) is not finite and stays so
  EXPECT_FALSE(std::isfinite(TWrobin_csinv(0, knots, coef, 2, &flag)));
  EXPECT_EQ(flag, 2u);
  const double round[] = {2, -2, 0, 1, 4, 0, 0, 0};
  // start: (0 - 2) / 2 = -1; Newton from -1 for t^3 - 2 t + 2 converges to the real root
  EXPECT_NEAR(TWrobin_csinv(0, knots, round, 2, &flag), -1.7692923542386314, 1e-12);
  // a triple root takes a third off each time: eleven passes leave (2/3)^11 of the way
  const double flat[] = {-1, 3, -3, 1, 0.5, 0, 0, 0};  // (t - 1)^3
  const double start = 1.0 / 1.5;
  EXPECT_NEAR(1 - TWrobin_csinv(0, knots, flat, 2, &flag), (1 - start) * std::pow(2.0 / 3, 11),
              1e-12);
}

TEST(Spline, NotANumber) {
  const Spline s;
  uint32_t flag = 0;
  EXPECT_TRUE(std::isnan(s.eval(kNaN, &flag)));
  EXPECT_EQ(flag, 2u);
  EXPECT_TRUE(std::isnan(s.slope(kNaN, &flag)));
  EXPECT_EQ(flag, 2u);
  EXPECT_TRUE(std::isnan(s.inverse(kNaN, &flag)));
  EXPECT_EQ(flag, 2u);
  s.inverse(kInfinity, &flag);
  EXPECT_EQ(flag, 2u);
}

TEST(Spline, TooFewKnots) {
  for (const int32_t n : {1, 0, -1, std::numeric_limits<int32_t>::min()}) {
    const double knots[] = {1};
    double coef[] = {5, 6, 7, 8};
    TWstatus status = 0;
    TWrobin_csform(knots, coef, n, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(coef[1], 6);
    uint32_t flag = 0;
    EXPECT_TRUE(std::isnan(TWrobin_cseval(1, knots, coef, n, &flag)));
    EXPECT_EQ(flag, 2u);
    EXPECT_TRUE(std::isnan(TWrobin_csderv(1, knots, coef, n, &flag)));
    EXPECT_EQ(flag, 2u);
    EXPECT_TRUE(std::isnan(TWrobin_csinv(5, knots, coef, n, &flag)));
    EXPECT_EQ(flag, 2u);
  }
}

TEST(Spline, WithoutMemoryNothingIsWritten) {
  const double knots[] = {0, 1, 2};
  double coef[12] = {0, 0, 9, 9, 1, 9, 9, 9, 0, 0, 9, 9};
  TWstatus status = 0;
  const FailingNew failing;
  TWrobin_csform(knots, coef, 3, &status);
  EXPECT_EQ(failing.asked(), 1);
  EXPECT_EQ(status, TW_NO_MEMORY);
  // More bytes than a pointer of 32 bits counts.
  status = 0;
  TWrobin_csform(knots, coef, 2147483647, &status);
  EXPECT_EQ(status, TW_NO_MEMORY);
  const double expected[12] = {0, 0, 9, 9, 1, 9, 9, 9, 0, 0, 9, 9};
  for (int i = 0; i < 12; ++i) EXPECT_EQ(coef[i], expected[i]);
}

TEST(Spline, ManyKnots) {
  const int32_t n = 40000;
  std::vector<double> knots(static_cast<std::size_t>(n)), coef(4 * static_cast<std::size_t>(n));
  for (std::size_t i = 0; i < knots.size(); ++i) {
    knots[i] = static_cast<double>(i) / n;
    coef[4 * i] = cubic(knots[i]);
  }
  coef[1] = cubic_slope(knots.front());
  coef[coef.size() - 3] = cubic_slope(knots.back());
  TWstatus status = 0;
  TWrobin_csform(knots.data(), coef.data(), n, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  uint32_t flag = 0;
  EXPECT_NEAR(TWrobin_cseval(0.987654321, knots.data(), coef.data(), n, &flag), cubic(0.987654321),
              1e-13);
}

}  // namespace
