#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

// Everest 1830 (1937 Adjustment): e^2 = 0.006637846630199687, a = 6377276.345 m.
const double kE = std::sqrt(0.006637846630199687);
constexpr double kA = 6377276.345;

struct Series {
  double lon0, lat0;
  double c[6] = {kUntouched, kUntouched, kUntouched, kUntouched, kUntouched, kUntouched};

  Series(double e, double lon, double lat) : lon0(lon), lat0(lat) {
    TWstatus status = 0;
    TWind_phed_c(e, lat, c, c + 1, c + 2, c + 3, c + 4, c + 5, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWind_phed_f(lon0, lat0, c[0], c[1], c[2], c[3], c[4], c[5], static_cast<int32_t>(in.size()),
                 in.data(), out.data(), &status);
    return status;
  }
  TWstatus inverse(const Points& in, Points& out, double a = kA) const {
    TWstatus status = 0;
    TWind_phed_i(a, lon0, lat0, c[0], c[1], c[2], c[3], c[4], c[5], static_cast<int32_t>(in.size()),
                 in.data(), out.data(), &status);
    return status;
  }
};

TEST(IndianPolyhedric, SeriesAtThirtyDigits) {
  // The formulas evaluated with 30 digits: origin 26 N 90 E, point 27.25 N 92.5 E.
  const Series north(kE, degrees(90), degrees(26));
  const double expected[6] = {0.8993678416927448,  0.99526587288268396,  0.43629584205561431,
                              0.19712845607403299, 0.019781356866940901, 0.16775828743573793};
  for (int i = 0; i < 6; ++i) EXPECT_NEAR(north.c[i], expected[i], 2e-16);
  const Points in = {{degrees(92.5), degrees(27.25), 8}};
  Points out = untouched(1);
  EXPECT_EQ(north.forward(in, out), TW_SUCCESS);
  // The differences of the angles are rounded to 2e-16.
  expect_near(out[0], 0.038827002205013039, 0.022092235779749054, 2e-16);
  EXPECT_EQ(out[0].z, kUntouched);
  // Origin 12 S 40 W, point 10 S 43 W.
  const Series south(kE, degrees(-40), degrees(-12));
  EXPECT_EQ(south.forward({{degrees(-43), degrees(-10), 8}}, out), TW_SUCCESS);
  expect_near(out[0], -0.051600679278014725, 0.03441568109533198, 2e-16);
}

TEST(IndianPolyhedric, ParallelOfOrigin) {
  const Series s(kE, 1.4, 0.45);
  Points out = untouched(1);
  s.forward({{1.45, 0.45, 0}}, out);
  const double d = 1.45 - 1.4;
  EXPECT_DOUBLE_EQ(out[0].x, s.c[0] * d);
  EXPECT_DOUBLE_EQ(out[0].y, d * d * s.c[3]);
}

TEST(IndianPolyhedric, WrapsTheDifference) {
  const Series s(kE, 3.0, 0.45);
  Points out = untouched(3);
  s.forward({{-3.1, 0.45, 0}, {3.0 - kPi, 0.45, 0}, {3.0 + kPi + 0.1, 0.45, 0}}, out);
  EXPECT_NEAR(out[0].x, s.c[0] * (2 * kPi - 6.1), 1e-15);
  EXPECT_NEAR(out[1].x, s.c[0] * kPi, 1e-15);  // -pi becomes pi
  EXPECT_NEAR(out[2].x, s.c[0] * (0.1 - kPi), 1e-14);
}

TEST(IndianPolyhedric, RoundTrip) {
  const Series s(kE, degrees(88), degrees(26));
  std::mt19937 random(5);
  std::uniform_real_distribution<double> lon(degrees(84), degrees(92)),
      lat(degrees(22), degrees(30));
  Points in(200);
  for (auto& p : in) p = {lon(random), lat(random), 4};
  Points out = in;
  EXPECT_EQ(s.forward(out, out), TW_SUCCESS);
  EXPECT_EQ(s.inverse(out, out), TW_SUCCESS);
  // The iteration ends with a residual of 1e-9 or less, on a parallel of 0.87 at the least.
  for (std::size_t i = 0; i < in.size(); ++i) expect_near(out[i], in[i].x, in[i].y, 4, 1.2e-9);
}

TEST(IndianPolyhedric, SlowIterationRunsOutAndIsWritten) {
  // Near the pole the radius of the parallel is so small that 31 steps do not reach the end:
  // each leaves 1 - c1 of the residual.
  const Series s(kE, 0.2, degrees(80));
  const Points in = {{0.3, degrees(80.5), 0}, {0.2, degrees(80), 0}};
  Points plane = untouched(2);
  Points out = untouched(2);
  s.forward(in, plane);
  EXPECT_EQ(s.inverse(plane, out), TW_NOT_CONVERGED);
  EXPECT_NE(out[0].x, kUntouched);
  EXPECT_GT(std::fabs(out[0].x - 0.3), 1e-5);
  EXPECT_NEAR(out[0].x, 0.3, 0.01);
  // The loop has gone on.
  EXPECT_NE(out[1].x, kUntouched);
}

TEST(IndianPolyhedric, DivergenceIsSeenBeforeThePassesRunOut) {
  // Steps of more than twice the right size make the residual of x grow by the same factor each
  // pass.  With c1 = 1, all else 0 but c2 = 1: d_n = x + (d_0 - x) (1 - w)^n in both directions.
  const double w = 3;
  const double a = w / 1.5655816873108e-07;
  const double x = 0.25, y = 0.5;
  const Points in = {{x, y, 0}};
  Points out = untouched(1);
  TWstatus status = 0;
  TWind_phed_i(a, 0, 0, 1, 1, 0, 0, 0, 0, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_NOT_CONVERGED);
  // Residuals are watched from the second pass: four are held after the fifth.
  const double growth = std::pow(1 - w, 5);
  EXPECT_NEAR(out[0].x, x + (x * w - x) * growth, 1e-9);
  EXPECT_NEAR(out[0].y, y + (y * w - y) * growth, 1e-9);
}

TEST(IndianPolyhedric, StartTakesTheOriginOffPlaneValues) {
  // With steps of no size nothing moves from the start (x - lon0) 0, and the origin comes back.
  const Points in = {{5, 7, 0}};
  Points out = untouched(1);
  TWstatus status = 0;
  TWind_phed_i(0, 1, 2, 1, 1, 0, 0, 0, 0, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_NOT_CONVERGED);
  expect_near(out[0], 1, 2, 0);
  // A start that is the answer ends in one pass: c1 = c2 = 1, w = 1 and an origin at 0.
  TWind_phed_i(1 / 1.5655816873108e-07, 0, 0, 1, 1, 0, 0, 0, 0, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 5, 7, 1e-14);
  // With an origin elsewhere the first step mends the odd start: still exact.
  TWind_phed_i(1 / 1.5655816873108e-07, 1, 2, 1, 1, 0, 0, 0, 0, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 6, 9, 1e-14);
}

TEST(IndianPolyhedric, ConvergenceInTheLastPassStillReports) {
  // Pass n leaves a residual of x (1 - w)^n (the start is the first step).  x is chosen so that the
  // residual seen in pass 30 is above 1e-9, or the one seen in pass 31 below it.
  const double w = 0.5;
  const double a = w / 1.5655816873108e-07;
  const auto run = [&](double x) {
    const Points in = {{x, 0, 0}};
    Points out = untouched(1);
    TWstatus status = 0;
    TWind_phed_i(a, 0, 0, 1, 1, 0, 0, 0, 0, 1, in.data(), out.data(), &status);
    EXPECT_NEAR(out[0].x, x, 1e-8);
    return status;
  };
  // residual seen in pass n: x 0.5^n
  EXPECT_EQ(run(0.99e-9 * std::pow(2, 30)), TW_SUCCESS);
  EXPECT_EQ(run(1.01e-9 * std::pow(2, 30)), TW_NOT_CONVERGED);  // met in pass 31
}

TEST(IndianPolyhedric, NothingToDoAndNotANumber) {
  const Series s(kE, 0, 0.4);
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -5}) {
    TWstatus status = 0;
    TWind_phed_f(0, 0, 1, 1, 1, 1, 1, 1, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWind_phed_i(1, 0, 0, 1, 1, 1, 1, 1, 1, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(p);
  }
  Points out = untouched(1);
  EXPECT_EQ(s.inverse({{kNaN, 0.1, 0}}, out), TW_SUCCESS);  // the residual is no longer above 1e-9
  EXPECT_TRUE(std::isnan(out[0].x));
}

}  // namespace
