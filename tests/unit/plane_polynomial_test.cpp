#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;

namespace {

TEST(PlanePolynomial, TermsGoByDegreeAndByFallingPowerOfX) {
  // At x = 2, y = 10 the terms 1; x, y; x^2, xy, y^2; x^3, x^2 y, x y^2, y^3 are all different.
  const double terms[10] = {1, 2, 10, 4, 20, 100, 8, 40, 200, 1000};
  const CoordinateTriple in = {2, 10, 5};
  for (int k = 0; k < 10; ++k) {
    double coefs[20] = {};
    coefs[k] = 3;
    coefs[10 + 9 - k] = 7;
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWnpoly2d_f(coefs, 3, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out, 3 * terms[k], 7 * terms[9 - k], 5, 0);
  }
}

TEST(PlanePolynomial, DegreeZero) {
  const double coefs[] = {4, -9};
  CoordinateTriple p = {2, 10, 5};
  TWstatus status = 0;
  TWnpoly2d_f(coefs, 0, 1, &p, &p, &status);
  expect_near(p, 4, -9, 5, 0);
  // Nothing can be inverted: the estimate stays at the origin.
  TWnpoly2d_i(coefs, 0, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p, 0, 0, 5, 0);
}

TEST(PlanePolynomial, LinearInverseIsExact) {
  // x' = 1 + 2x + y, y' = 3 + x + 3y
  const double coefs[] = {1, 2, 1, 3, 1, 3};
  CoordinateTriple p = {1 + 2 * 4 + 6, 3 + 4 + 3 * 6, 8};
  TWstatus status = 0;
  TWnpoly2d_i(coefs, 1, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p, 4, 6, 8, 1e-15);
}

TEST(PlanePolynomial, InverseOfARegularOne) {
  const double coefs[] = {0.3,  1.1,  -0.2, 0.03, 0.01, -0.02, 0.004, -0.003, 0.002,  0.001,
                          -0.7, 0.15, 0.9,  0.02, 0.04, 0.01,  0.002, 0.005,  -0.001, 0.003};
  std::mt19937 random(9);
  std::uniform_real_distribution<double> unit(-1, 1);
  for (int i = 0; i < 200; ++i) {
    const CoordinateTriple in = {unit(random), unit(random), 4};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWnpoly2d_f(coefs, 3, 1, &in, &out, &status);
    TWnpoly2d_i(coefs, 3, 1, &out, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out, in.x, in.y, 4, 2e-15);
  }
}

TEST(PlanePolynomial, InverseWithoutLinearTermsStartsAtTheOrigin) {
  // x' = x^2, y' = y: D is 0 at the start and at the origin, so that nothing moves.
  const double squares[] = {0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0};
  CoordinateTriple p = {4, 2, 1};
  TWstatus status = 0;
  TWnpoly2d_i(squares, 2, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p, 0, 0, 1, 0);
}

TEST(PlanePolynomial, RunningOutOfPassesIsNotReported) {
  // x' = x + x^2 never reaches -10: the estimate wanders, the points after it are done.
  const double coefs[] = {0, 1, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0};
  Points p = {{-10, 2, 1}, {6, 3, 1}, {kNaN, 0, 1}};
  TWstatus status = 0;
  TWnpoly2d_i(coefs, 2, 3, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(p[0].y, 2, 1e-12);
  expect_near(p[1], 2, 3, 1, 1e-15);
  EXPECT_TRUE(std::isnan(p[2].x));
}

struct Normalised {
  double x0 = 0, y0 = 0, sx = 1, sy = 1;
};

TWstatus second_degree(Normalised n, const double (&a)[6], const double (&b)[6], bool forward,
                       const Points& in, Points& out) {
  TWstatus status = 0;
  const auto call = forward ? TWpoly2deg_f : TWpoly2deg_i;
  call(n.x0, n.y0, n.sx, n.sy, a[0], a[1], a[2], a[3], a[4], a[5], b[0], b[1], b[2], b[3], b[4],
       b[5], static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
  return status;
}

constexpr double kA[6] = {1, 2, 3, 4, 5, 6};
constexpr double kB[6] = {-1, 7, -2, 1, 2, -3};

TEST(SecondDegree, NormalisesInPlaceOnly) {
  const Normalised n = {1000, 2000, 10, 20};
  Points in = {{1020, 2060, 7}};  // 2, 3 when normalised
  Points out = untouched(1);
  EXPECT_EQ(second_degree(n, kA, kB, true, in, out), TW_SUCCESS);
  const double x = 1020, y = 2060;
  expect_near(out[0], 1 + 2 * x + 3 * y + 4 * x * x + 5 * x * y + 6 * y * y,
              -1 + 7 * x - 2 * y + x * x + 2 * x * y - 3 * y * y, 7, 1e-7);
  EXPECT_EQ(in[0].x, 1020);
  EXPECT_EQ(second_degree(n, kA, kB, true, in, in), TW_SUCCESS);
  expect_near(in[0], 1 + 4 + 9 + 16 + 30 + 54, -1 + 14 - 6 + 4 + 12 - 27, 7, 1e-13);
}

TEST(SecondDegree, TheInverseAlwaysNormalises) {
  const Normalised n = {1000, 2000, 10, 20};
  const double a[6] = {1, 2, 0.3, 0.01, 0.02, 0.03};
  const double b[6] = {-1, 0.7, 2, 0.02, 0.01, -0.03};
  Points p = {{1020, 2060, 7}};
  second_degree(n, a, b, true, p, p);
  Points out = untouched(1);
  EXPECT_EQ(second_degree(n, a, b, false, p, out), TW_SUCCESS);
  expect_near(out[0], 1020, 2060, 7, 1e-11);
  second_degree(n, a, b, false, p, p);
  expect_near(p[0], 1020, 2060, 7, 1e-11);
}

TEST(SecondDegree, NegligibleTermsAreDropped) {
  Points in = {{1e6, 1e6, 0}};
  Points out = untouched(1);
  for (int k = 0; k < 6; ++k) {
    double a[6] = {0, 1, 0, 9e-13, 9e-13, 9e-13};
    double b[6] = {0, 0, 1, 9e-13, 9e-13, -9e-13};
    second_degree({}, a, b, true, in, out);
    expect_near(out[0], 1e6, 1e6, 0, 0);
    second_degree({}, a, b, false, in, out);
    expect_near(out[0], 1e6, 1e6, 0, 0);
    // One of them at the limit brings all of them in.
    (k < 3 ? a[3 + k] : b[k]) = k % 2 ? 1e-12 : -1e-12;
    second_degree({}, a, b, true, in, out);
    EXPECT_GT(std::fabs(out[0].x - 1e6), 0.5);
  }
}

}  // namespace
