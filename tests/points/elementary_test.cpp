// The elementary functions against MPFR, at 120 bits: worst error in units in the last place.

#include "points/elementary.hpp"

#include <gtest/gtest.h>
#include <mpfr.h>

#include <cmath>
#include <cstdio>
#include <random>

#include "points/portable.hpp"

namespace {

namespace points = tidewater::points;
namespace portable = tidewater::detail::portable;

class Exact {
 public:
  Exact() { mpfr_init2(value, 160); }
  ~Exact() { mpfr_clear(value); }
  Exact(const Exact&) = delete;
  Exact& operator=(const Exact&) = delete;
  mpfr_t value;
};

double ulp_error(double got, const Exact& exact) {
  const double nearest = mpfr_get_d(exact.value, MPFR_RNDN);
  const double ulp = std::nextafter(std::fabs(nearest), INFINITY) - std::fabs(nearest);
  Exact difference;
  mpfr_d_sub(difference.value, got, exact.value, MPFR_RNDN);
  return std::fabs(mpfr_get_d(difference.value, MPFR_RNDN)) / ulp;
}

using One = int (*)(mpfr_ptr, mpfr_srcptr, mpfr_rnd_t);

double worst(const char* name, double low, double high, double (*ours)(double), One theirs,
             bool by_size = false) {
  std::mt19937_64 random(7);
  std::uniform_real_distribution<double> range(by_size ? std::log(low) : low,
                                               by_size ? std::log(high) : high);
  double most = 0, at = 0;
  Exact exact;
  for (int i = 0; i < 20000; ++i) {
    double x = range(random);
    if (by_size) x = std::exp(x);
    mpfr_set_d(exact.value, x, MPFR_RNDN);
    theirs(exact.value, exact.value, MPFR_RNDN);
    const double error = ulp_error(ours(x), exact);
    if (error > most) most = error, at = x;
  }
  std::printf("%-8s %12g to %12g  %.3f ulp, at %.17g\n", name, low, high, most, at);
  return most;
}

double sine(double x) { return points::sincos(x).sin; }
double cosine(double x) { return points::sincos(x).cos; }
double logarithm(double x) { return points::log(x); }
double exponential(double x) { return points::exp(x); }
double arc_tangent(double x) { return points::atan(x); }
double arc_sine(double x) { return points::asin(x); }
double arc_cosine(double x) { return points::acos(x); }
double logarithm_1(double x) { return points::log1p(x); }
double exponential_1(double x) { return points::expm1(x); }
double hyperbolic_sine(double x) { return points::sinhcosh(x).sinh; }
double hyperbolic_cosine(double x) { return points::sinhcosh(x).cosh; }
double hyperbolic_tangent(double x) { return points::tanh(x); }
double area_sine(double x) { return points::asinh(x); }
double area_tangent(double x) { return points::atanh(x); }

TEST(Elementary, WithinTheStatedUnitsInTheLastPlace) {
  for (const double range : {0.8, 3.2, 100.0, 1e5, 1e7, 1e15}) {
    EXPECT_LT(worst("sin", -range, range, sine, mpfr_sin), 0.80);
    EXPECT_LT(worst("cos", -range, range, cosine, mpfr_cos), 0.80);
  }
  EXPECT_LT(worst("sin", 1e5, 1e308, sine, mpfr_sin, true), 0.80);
  EXPECT_LT(worst("cos", 1e5, 1e308, cosine, mpfr_cos, true), 0.80);
  EXPECT_LT(worst("log", 5e-324, 1e-307, logarithm, mpfr_log, true), 0.85);
  EXPECT_LT(worst("exp", 708, 709.78, exponential, mpfr_exp), 0.95);
  EXPECT_LT(worst("log", 0.5, 2, logarithm, mpfr_log), 0.85);
  EXPECT_LT(worst("log", 1e-300, 1e300, logarithm, mpfr_log, true), 0.85);
  EXPECT_LT(worst("exp", -1, 1, exponential, mpfr_exp), 0.95);
  EXPECT_LT(worst("exp", -700, 700, exponential, mpfr_exp), 0.95);
  EXPECT_LT(worst("atan", -1.1, 1.1, arc_tangent, mpfr_atan), 1.8);
  EXPECT_LT(worst("atan", 1e-10, 1e10, arc_tangent, mpfr_atan, true), 1.8);
  EXPECT_LT(worst("asin", -1, 1, arc_sine, mpfr_asin), 1.9);
  EXPECT_LT(worst("acos", -1, 1, arc_cosine, mpfr_acos), 1.1);
  EXPECT_LT(worst("log1p", -0.5, 2, logarithm_1, mpfr_log1p), 1.3);
  EXPECT_LT(worst("log1p", 1e-12, 1e10, logarithm_1, mpfr_log1p, true), 1.3);
  EXPECT_LT(worst("expm1", -1, 1, exponential_1, mpfr_expm1), 1.8);
  EXPECT_LT(worst("expm1", 1e-12, 600, exponential_1, mpfr_expm1, true), 1.8);
  EXPECT_LT(worst("sinh", -3, 3, hyperbolic_sine, mpfr_sinh), 2);
  EXPECT_LT(worst("cosh", -3, 3, hyperbolic_cosine, mpfr_cosh), 2);
  EXPECT_LT(worst("tanh", -3, 3, hyperbolic_tangent, mpfr_tanh), 2.1);
  EXPECT_LT(worst("asinh", -9, 9, area_sine, mpfr_asinh), 2);
  EXPECT_LT(worst("atanh", -0.99, 0.99, area_tangent, mpfr_atanh), 2);
}

// In units in the last place of the exact logarithm of the exact quotient.
double log_ratio_error(double top, double low) {
  Exact exact, divisor;
  mpfr_set_d(exact.value, top, MPFR_RNDN);
  mpfr_set_d(divisor.value, low, MPFR_RNDN);
  mpfr_div(exact.value, exact.value, divisor.value, MPFR_RNDN);
  mpfr_log(exact.value, exact.value, MPFR_RNDN);
  return ulp_error(points::log_ratio(top, low), exact);
}

TEST(Elementary, TheLogarithmOfAQuotientIsWithinItsUnitsInTheLastPlace) {
  std::mt19937_64 random(11);
  const auto between = [&](double low, double high) {
    return std::uniform_real_distribution<double>(low, high)(random);
  };
  double most = 0;
  for (int i = 0; i < 30000; ++i) {
    const double low = between(0.5, 2);
    most = std::fmax(most, log_ratio_error(between(0.5, 2), low));                   // near 1
    most = std::fmax(most, log_ratio_error(low * (1 + between(-1e-6, 1e-6)), low));  // very near
    most = std::fmax(most,
                     log_ratio_error(std::exp(between(-690, 690)), std::exp(between(-690, 690))));
  }
  std::printf("log_ratio  %.3f ulp\n", most);
  EXPECT_LT(most, 2);
  EXPECT_EQ(points::log_ratio(3.25, 3.25), 0.0);
}

TEST(Elementary, TheLogarithmOfAnOddQuotientIsThatOfTheQuotient) {
  const double values[] = {0.0, -0.0, 1.0, -2.0, 5e-324, 1e-305, 1e305, INFINITY, -INFINITY, NAN};
  for (const double top : values) {
    for (const double low : values) {
      const double expected = std::log(top / low);
      const double got = points::log_ratio(top, low);
      EXPECT_TRUE((std::isnan(got) && std::isnan(expected)) || got == expected ||
                  std::fabs(got / expected - 1) < 4e-16)
          << top << " / " << low << ": " << got << " not " << expected;
    }
  }
}

TEST(Portable, WithinTheStatedUnitsInTheLastPlace) {
  EXPECT_LT(worst("tan", -1.6, 1.6, portable::tan, mpfr_tan), 2.1);
  EXPECT_LT(worst("tan", -1e5, 1e5, portable::tan, mpfr_tan), 2.1);
  EXPECT_LT(worst("asinh", 1, 1e300, portable::asinh, mpfr_asinh, true), 2);
  std::mt19937_64 random(9);
  const auto between = [&](double low, double high) {
    return std::uniform_real_distribution<double>(low, high)(random);
  };
  double most_power = 0, most_hypot = 0;
  Exact a, b;
  for (int i = 0; i < 20000; ++i) {
    // Bases near one with large exponents, and of any size with small ones.
    const double width = std::exp(between(-20, 6));
    const double base = std::exp(between(-width, width));
    const double exponent = between(-600, 600) / std::max(width, 1e-6);
    mpfr_set_d(a.value, base, MPFR_RNDN);
    mpfr_set_d(b.value, exponent, MPFR_RNDN);
    mpfr_pow(a.value, a.value, b.value, MPFR_RNDN);
    most_power = std::max(most_power, ulp_error(portable::pow(base, exponent), a));

    const double size = std::exp(between(-690, 700));
    const double x = between(-1, 1) * size, y = between(-1, 1) * size;
    mpfr_set_d(a.value, x, MPFR_RNDN);
    mpfr_set_d(b.value, y, MPFR_RNDN);
    mpfr_hypot(a.value, a.value, b.value, MPFR_RNDN);
    most_hypot = std::max(most_hypot, ulp_error(portable::hypot(x, y), a));
  }
  std::printf("pow      %.3f ulp\nhypot    %.3f ulp\n", most_power, most_hypot);
  EXPECT_LT(most_power, 0.7);
  EXPECT_LT(most_hypot, 1.2);
}

// Whole powers that a double holds come out exactly.
TEST(Portable, ExactPowers) {
  for (int n = -22; n <= 22; ++n) {
    EXPECT_EQ(portable::pow(2, n), std::ldexp(1, n));
    const double ten = std::stod("1e" + std::to_string(n));
    EXPECT_EQ(portable::pow(10, n), ten) << n;
  }
  EXPECT_EQ(portable::pow(-3, 5), -243);
  EXPECT_EQ(portable::pow(2.25, 0.5), 1.5);
  EXPECT_EQ(portable::pow(2, -1074), 5e-324);
}

TEST(Portable, SpecialPowersAreThoseOfC) {
  const double inf = INFINITY, nan = NAN;
  const double values[] = {0.0,  -0.0,  0.5,  -0.5,  1,   -1,   2,      -2,   3,        -3, 2.5,
                           -2.5, 1e300, 1e20, -1e20, inf, -inf, 1e-320, 5e15, 9e15 + 1, nan};
  for (const double base : values) {
    for (const double exponent : values) {
      const double got = portable::pow(base, exponent), expected = std::pow(base, exponent);
      EXPECT_TRUE((std::isnan(got) && std::isnan(expected)) ||
                  (got == expected && std::signbit(got) == std::signbit(expected)) ||
                  std::fabs(got / expected - 1) < 3e-16)
          << base << " to the " << exponent << ": " << got << ", " << expected;
    }
  }
}

TEST(Portable, SpecialValuesOfTheOthers) {
  const double inf = INFINITY, nan = NAN;
  EXPECT_EQ(portable::hypot(inf, nan), inf);
  EXPECT_EQ(portable::hypot(nan, -inf), inf);
  EXPECT_TRUE(std::isnan(portable::hypot(nan, 1)));
  EXPECT_EQ(portable::hypot(3e300, 4e300), 5e300);
  EXPECT_EQ(portable::hypot(-0.0, 0), 0);
  EXPECT_EQ(portable::asinh(-inf), -inf);
  EXPECT_EQ(portable::atanh(1), inf);
  EXPECT_TRUE(std::isnan(portable::atanh(1.5)));
  EXPECT_TRUE(std::isnan(portable::tan(inf)));
  EXPECT_TRUE(std::isnan(portable::acos(1.5)));
  EXPECT_EQ(portable::cosh(-800), inf);
}

TEST(Elementary, AllRoundTheCircle) {
  std::mt19937_64 random(8);
  std::uniform_real_distribution<double> coordinate(-2, 2);
  double most = 0;
  Exact y, x;
  for (int i = 0; i < 20000; ++i) {
    const double a = coordinate(random), b = coordinate(random);
    mpfr_set_d(y.value, a, MPFR_RNDN);
    mpfr_set_d(x.value, b, MPFR_RNDN);
    mpfr_atan2(y.value, y.value, x.value, MPFR_RNDN);
    most = std::max(most, ulp_error(points::atan2(a, b), y));
  }
  std::printf("atan2    %.3f ulp\n", most);
  EXPECT_LT(most, 1.9);
}

TEST(Elementary, SignedZerosInfinitiesAndNotANumbersAreTheStandardLibrarys) {
  const double inf = INFINITY, nan = NAN;
  const double values[] = {0.0,   -0.0,   1.0, -1.0, 1e-320, -1e-320,
                           1e308, -1e308, 3e5, inf,  -inf,   nan};
  const auto same = [](double a, double b) {
    return (std::isnan(a) && std::isnan(b)) || (a == b && std::signbit(a) == std::signbit(b));
  };
  for (const double v : values) {
    // One and far angles are values like others, within the errors above.
    if (std::fabs(v) != 1 && !(std::fabs(v) > 1e5 && std::fabs(v) < inf)) {
      EXPECT_TRUE(same(sine(v), std::sin(v))) << v;
      EXPECT_TRUE(same(cosine(v), std::cos(v))) << v;
      EXPECT_TRUE(same(exponential(v), std::exp(v))) << v;
    }
    if (v <= 0 || v == 1 || v == inf) {
      EXPECT_TRUE(same(logarithm(v), std::log(v))) << v;
    }
    for (const double w : values) {
      const double got = points::atan2(v, w), expected = std::atan2(v, w);
      EXPECT_TRUE(same(got, expected) || std::fabs(got / expected - 1) < 4e-16) << v << " " << w;
    }
  }
  EXPECT_TRUE(std::isnan(arc_sine(1.0000001)));
  EXPECT_EQ(arc_sine(1), std::asin(1.0));
  EXPECT_EQ(arc_cosine(-1), std::acos(-1.0));
  EXPECT_EQ(exponential(800), inf);
  EXPECT_EQ(exponential(-800), 0);
  EXPECT_EQ(hyperbolic_tangent(40), 1);
  EXPECT_EQ(hyperbolic_sine(-0.0), 0);
  EXPECT_EQ(hyperbolic_sine(800), inf);
}

}  // namespace
