#include <gtest/gtest.h>

#include <complex>
#include <random>

#include "support/points.hpp"
#include "tidewater/datum.h"

using namespace tidewater::test;

namespace {

using Complex = std::complex<double>;
using namespace std::complex_literals;

// A fourth-order polynomial that is regular near the origin.
constexpr double kCoefs[] = {0.1, -0.2, 1.1, 0.3, 0.04, -0.02, 0.01, 0.03, -0.005, 0.002};

Complex coef(std::size_t k) { return {kCoefs[2 * k], kCoefs[2 * k + 1]}; }

TEST(ComplexPolynomial, IsTheSumOfPowers) {
  for (const Complex z : {0.3 + 0.4i, -1.0 + 0.2i, 0.0 - 0.7i}) {
    Complex value = 0, derivative = 0;
    for (std::size_t k = 0; k < 5; ++k) {
      value += coef(k) * std::pow(z, static_cast<int>(k));
      if (k > 0) {
        derivative += static_cast<double>(k) * coef(k) * std::pow(z, static_cast<int>(k) - 1);
      }
    }
    // Northing is the real part: Y = (y - y0) / sy, X = (x - x0) / sx.
    const CoordinateTriple in = {500 + 20 * z.imag(), 300 + 10 * z.real(), 6};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWcomplexpol_f(4, 300, 500, 10, 20, kCoefs, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out, value.imag(), value.real(), 1e-14);
    EXPECT_EQ(out.z, kUntouched);
    double got[2] = {};
    TWcomplexpol_g(4, kCoefs, z.real(), z.imag(), got, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(got[0], derivative.real(), 1e-14);
    EXPECT_NEAR(got[1], derivative.imag(), 1e-14);
  }
}

TEST(ComplexPolynomial, LowOrders) {
  const double identity[] = {0, 0, 1, 0};
  CoordinateTriple p = {520, 330, 1};
  TWstatus status = 0;
  TWcomplexpol_f(1, 300, 500, 10, 20, identity, 1, &p, &p, &status);
  expect_near(p, 1, 3, 1, 0);  // normalised
  double slope[2] = {9, 9};
  TWcomplexpol_g(1, identity, 4, 5, slope, &status);
  EXPECT_EQ(slope[0], 1);
  EXPECT_EQ(slope[1], 0);
  // Order 0 is a constant, and has nothing to invert.
  const double constant[] = {7, 8};
  TWcomplexpol_f(0, 0, 0, 1, 1, constant, 1, &p, &p, &status);
  expect_near(p, 8, 7, 1, 0);
  TWcomplexpol_i(0, 0, 0, 1, 1, constant, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
}

TEST(ComplexPolynomial, InverseComesBack) {
  std::mt19937 random(1);
  std::uniform_real_distribution<double> unit(-0.5, 0.5);
  for (int i = 0; i < 200; ++i) {
    const CoordinateTriple in = {500 + 20 * unit(random), 300 + 10 * unit(random), 6};
    CoordinateTriple out = {0, 0, 6};
    TWstatus status = 0;
    TWcomplexpol_f(4, 300, 500, 10, 20, kCoefs, 1, &in, &out, &status);
    TWcomplexpol_i(4, 300, 500, 10, 20, kCoefs, 1, &out, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out, in.x, in.y, 6, 5e-13);
  }
}

TEST(ComplexPolynomial, TheStartIsTheRealPartAlone) {
  // z^2 = -4 + 0i with c1 = 2e-7 i, just large enough to start from: (t - c0) / c1 = 2e7 i has no
  // real part, and Newton from 0 on the (nearly) real axis cannot tell +2i from -2i: by hand, the
  // first step from 0 is t / c1.
  const double coefs[] = {0, 0, 0, 2e-7, 1, 0};
  CoordinateTriple p = {0, -4, 0};
  TWstatus status = 0;
  TWcomplexpol_i(2, 0, 0, 1, 1, coefs, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(std::fabs(p.x), 2, 1e-6);
  EXPECT_NEAR(p.y, 0, 1e-6);
  // c1 below the limit: the start is 0, where the derivative vanishes for c1 = 0.
  const double square[] = {0, 0, 0, 0, 1, 0};
  p = {0, 4, 0};
  TWcomplexpol_i(2, 0, 0, 1, 1, square, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
  EXPECT_TRUE(std::isnan(p.x));
  // An observable start: z^3 + z = t.  From the real part 10 of t = 10 + 30i Newton falls on one of
  // three roots; walked by hand with complex arithmetic.
  const double cubic[] = {0, 0, 1, 0, 0, 0, 1, 0};
  Complex z = 10;
  for (int pass = 0; pass < 60; ++pass) {
    z -= (z * z * z + z - (10.0 + 30i)) / (3.0 * z * z + 1.0);
  }
  p = {30, 10, 0};
  TWcomplexpol_i(3, 0, 0, 1, 1, cubic, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p, z.imag(), z.real(), 1e-12);
}

TEST(ComplexPolynomial, OnlyTheLastPointReports) {
  const double square[] = {0, 0, 0, 0, 1, 0};  // no start but the saddle at 0
  const double line[] = {0, 0, 1, 0};
  Points p = {{0, 4, 0}, {0, 0, 0}};
  TWstatus status = 0;
  // z^2 = 0 from 0: 0 / 0.  Both fail, so that the word stands.
  TWcomplexpol_i(2, 0, 0, 1, 1, square, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
  // A not-a-number before a good point goes unreported, behind it does not.
  p = {{kNaN, 4, 0}, {1, 2, 0}};
  TWcomplexpol_i(1, 0, 0, 1, 1, line, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_TRUE(std::isnan(p[0].x));
  expect_near(p[1], 1, 2, 0);
  p = {{1, 2, 0}, {kNaN, 4, 0}};
  TWcomplexpol_i(1, 0, 0, 1, 1, line, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
  expect_near(p[0], 1, 2, 0);
}

TEST(Conformal2, IsTheSecondDegreeFormula) {
  const double x0 = 100, y0 = 200, sx = 10, sy = 20;
  const double a0 = 1, a1 = 2, a2 = 0.3, b0 = 4, b1 = 0.5, b2 = -0.06;
  const CoordinateTriple in = {115, 230, 9};
  const double x = 1.5, y = 1.5;
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWconform2_f(x0, y0, sx, sy, a0, a1, a2, b0, b1, b2, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, a0 + a1 * x - b1 * y + a2 * (x * x - y * y) - 2 * b2 * x * y,
              b0 + b1 * x + a1 * y + b2 * (x * x - y * y) + 2 * a2 * x * y, 1e-14);
  EXPECT_EQ(out.z, kUntouched);
  TWconform2_i(x0, y0, sx, sy, a0, a1, a2, b0, b1, b2, 1, &out, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, 115, 230, 1e-12);
}

TEST(Conformal2, NegligibleSecondDegreeIsDropped) {
  CoordinateTriple p = {1e9, 2e9, 5};
  TWstatus status = 0;
  TWconform2_f(0, 0, 1, 1, 0, 1, 7e-13, 0, 0, 7e-13, 1, &p, &p, &status);  // hypot 9.9e-13
  expect_near(p, 1e9, 2e9, 5, 0);
  TWconform2_f(0, 0, 1, 1, 0, 1, 8e-13, 0, 0, 7e-13, 1, &p, &p, &status);  // hypot 1.06e-12
  EXPECT_GT(std::fabs(p.x - 1e9), 1e5);
}

}  // namespace
