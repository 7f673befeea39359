#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <random>

#include "support/harmonics.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

constexpr double kRadius = 6371200;

CoordinateTriple geocentric(double theta, double lon, double r) {
  return {r * std::sin(theta) * std::cos(lon), r * std::sin(theta) * std::sin(lon),
          r * std::cos(theta)};
}

TEST(HarmonicSum, AgreesWithExplicitLegendreFunctions) {
  std::mt19937 random(81);
  std::uniform_real_distribution<double> colat(0.01, 3.13), lon(-3.14, 3.14), height(-1e4, 1e6);
  for (const int32_t N : {2, 3, 4, 7, 12, 13}) {
    Coefficients c(N);
    Coefficients::fill(c, static_cast<unsigned>(N));
    Synthesis synthesis(N);
    Points in(40), out = untouched(40);
    std::vector<DirectSum> expected;
    for (auto& p : in) {
      const double theta = colat(random), lambda = lon(random), r = kRadius + height(random);
      p = geocentric(theta, lambda, r);
      expected.push_back(direct_sum(c, kRadius / r, theta, lambda));
    }
    ASSERT_EQ(synthesis.sum(0, c, 40, in.data(), out.data()), TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      const auto& g = expected[i].gradient;
      // The field is some 5e4: 1e-14 of that, times the degree.
      expect_near(out[i], g.x, g.y, g.z, 5e-9);
    }
  }
}

TEST(HarmonicSum, EachModeWritesItsComponentAlone) {
  const int32_t N = 9;
  Coefficients c(N);
  Coefficients::fill(c, 5);
  const double theta = 0.7, lon = -2.1, r = 6.5e6;
  const CoordinateTriple p = geocentric(theta, lon, r);
  const DirectSum expected = direct_sum(c, kRadius / r, theta, lon);
  const double component[] = {0, expected.gradient.x, expected.gradient.y, expected.gradient.z};
  for (const int16_t mode : {int16_t{1}, int16_t{2}, int16_t{3}}) {
    Synthesis synthesis(N);
    const CoordinateTriple out = synthesis.at(mode, c, p);
    EXPECT_NEAR(out.x, component[mode], 5e-9);
    EXPECT_EQ(out.y, kUntouched);
    EXPECT_EQ(out.z, kUntouched);
  }
}

TEST(HarmonicSum, SeriesOverNormalGravity) {
  const int32_t N = 8;
  Coefficients c(N);
  Coefficients::fill(c, 6);
  const double theta = 1.1, lon = 0.4, r = 6.4e6;
  const CoordinateTriple p = geocentric(theta, lon, r);
  Synthesis synthesis(N, 6378137);
  const CoordinateTriple out = synthesis.at(4, c, p);
  CoordinateTriple llh = {};
  double gamma = 0;
  TWstatus status = 0;
  TWxyz_to_llh(synthesis.a, synthesis.e, 1, &p, &llh, &status);
  TWnormal_grav(synthesis.a, synthesis.e, synthesis.gamma_equator, synthesis.gamma_pole, llh.y,
                llh.z, &gamma, &status);
  const double expected = synthesis.gm / (r * gamma) * direct_sum(c, 6378137 / r, theta, lon).value;
  EXPECT_NEAR(out.x / expected, 1, 1e-13);
  EXPECT_EQ(out.y, kUntouched);
  EXPECT_EQ(out.z, kUntouched);
  EXPECT_NEAR(synthesis.cache.scale_theta * r * gamma / synthesis.gm, 1, 1e-15);
}

// The work arrays that a mode fills, seen in a degree-2 series whose sums are short.
TEST(HarmonicSum, WorkArraysOfEachMode) {
  const int32_t N = 2;
  Coefficients c(N);
  for (int32_t n = 0; n <= N; ++n) {
    for (int32_t m = 0; m <= n; ++m) {
      c.C(n, m) = 1 + n + 10 * m;
      c.S(n, m) = m == 0 ? 0 : -2 - n - 20 * m;
    }
  }
  const double theta = 1.2, r = 7e6, q = kRadius / r;
  const double tcos = q * std::cos(theta), tsin = q * std::sin(theta);
  // Recursion constants of degree 2 by hand: a[1][0] = sqrt 3, a[2][0] = sqrt(15 / 4),
  // a[2][1] = sqrt 5, b[2][0] = -sqrt(5 / 4).
  const double a10 = std::sqrt(3.0), a20 = std::sqrt(15.0 / 4), a21 = std::sqrt(5.0);
  const double b20 = -std::sqrt(5.0 / 4);
  struct Values {
    double y[3], d[3];
  };
  const auto sums = [&](const auto& term) {
    Values v{};
    v.y[2] = term(2, 2);
    v.y[1] = a21 * tcos * term(2, 1) + term(1, 1);
    v.d[1] = -a21 * tsin * term(2, 1);
    const double y2 = term(2, 0), y1 = a20 * tcos * y2 + term(1, 0), d1 = -a20 * tsin * y2;
    v.y[0] = a10 * tcos * y1 + b20 * q * q * y2 + term(0, 0);
    v.d[0] = a10 * tcos * d1 - a10 * tsin * y1;
    return v;
  };
  const Values C = sums([&](int n, int m) { return c.C(n, m); });
  const Values S = sums([&](int n, int m) { return c.S(n, m); });
  const Values rC = sums([&](int n, int m) { return (n + 1) * c.C(n, m); });
  const Values rS = sums([&](int n, int m) { return (n + 1) * c.S(n, m); });

  const auto near = [](const std::vector<double>& sum, const double* expected, double sign = 1) {
    for (std::size_t m = 0; m < 3; ++m) EXPECT_NEAR(sum[m], sign * expected[m], 1e-13) << m;
  };
  // A sine sum: element 0 is set to 0 whatever the mode.
  const auto near_sine = [](const std::vector<double>& sum, const double* expected) {
    EXPECT_EQ(sum[0], 0);
    for (std::size_t m = 1; m < 3; ++m) EXPECT_NEAR(sum[m], expected[m], 1e-13) << m;
  };
  const auto left = [](const std::vector<double>& sum) {
    for (std::size_t m = 0; m < 3; ++m) EXPECT_EQ(sum[m], kUntouched) << m;
  };
  const auto left_sine = [](const std::vector<double>& sum) {
    EXPECT_EQ(sum[0], 0);
    for (std::size_t m = 1; m < 3; ++m) EXPECT_EQ(sum[m], kUntouched) << m;
  };
  const CoordinateTriple p = geocentric(theta, 0.3, r);
  for (int16_t mode = -1; mode <= 5; ++mode) {
    SCOPED_TRACE(mode);
    Synthesis synthesis(N);
    synthesis.at(mode, c, p);
    const SynthesisCache& k = synthesis.cache;
    const bool theta_wanted = mode == 0 || mode == 1;
    if (theta_wanted) {
      near(k.dC, C.d);
      near_sine(k.dS, S.d);
      near(k.C, C.y);
      near_sine(k.S, S.y);
    } else if (mode == 4) {
      near(k.dC, C.y);
      near_sine(k.dS, S.y);
      left(k.C);
      left_sine(k.S);
    } else {
      left(k.dC);
      left_sine(k.dS);
      left(k.C);
      left_sine(k.S);
    }
    if (mode == 0 || mode == 2) {
      near(k.lC, S.y, -1);
      near_sine(k.lS, C.y);
    } else {
      left_sine(k.lC);  // element 0 of this cosine sum too
      left_sine(k.lS);
    }
    if (mode == 0 || mode == 3) {
      near(k.rC, rC.y);
      near_sine(k.rS, rS.y);
    } else {
      left(k.rC);
      left_sine(k.rS);
    }
  }
}

TEST(HarmonicSum, AnotherModeKeepsTheCachesAndWritesNothing) {
  Coefficients c(3);
  Coefficients::fill(c, 1);
  const CoordinateTriple p = geocentric(0.5, 0.3, 7e6);
  for (const int16_t mode : {int16_t{-1}, int16_t{5}, int16_t{32767}}) {
    Synthesis synthesis(3);
    expect_untouched(synthesis.at(mode, c, p));
    const double q = kRadius / 7e6;
    EXPECT_NEAR(synthesis.cache.last_colat, 0.5, 1e-15);
    EXPECT_NEAR(synthesis.cache.last_radius, 7e6, 2e-9);
    EXPECT_NEAR(synthesis.last_lon, 0.3, 1e-15);
    EXPECT_NEAR(synthesis.cache.tcos, q * std::cos(0.5), 1e-15);
    EXPECT_NEAR(synthesis.cache.tsin, q * std::sin(0.5), 1e-15);
    EXPECT_NEAR(synthesis.cache.scale_theta, q * q, 1e-15);
    EXPECT_NEAR(synthesis.cache.scale_lambda, q * q / std::sin(0.5), 1e-14);
    EXPECT_NEAR(synthesis.cache.scale_r, -q * q, 1e-15);
    EXPECT_NEAR(synthesis.rec_b(3, 3), std::cos(0.9), 1e-15);
    EXPECT_NEAR(synthesis.rec_b(3, 2), std::sin(0.9), 1e-15);
  }
}

TEST(HarmonicSum, AxialDipoleInClosedForm) {
  // C[1][0] = g / sqrt 3: north -g q^3 sin(theta), east 0, down -2 g q^3 cos(theta).
  Coefficients c(2);
  const double g = -29400;
  c.C(1, 0) = g / std::sqrt(3.0);
  Synthesis synthesis(2);
  for (double theta = 0.1; theta < 3.1; theta += 0.3) {
    const CoordinateTriple out = synthesis.at(0, c, geocentric(theta, 2 * theta - 3, 6.6e6));
    const double q3 = std::pow(kRadius / 6.6e6, 3);
    expect_near(out, -g * q3 * std::sin(theta), 0, -2 * g * q3 * std::cos(theta),
                1e-10);  // 2e-15 of the field: theta comes from an arc cosine
    EXPECT_EQ(out.y, 0);
  }
}

TEST(HarmonicSum, EquatorialDipoleAndSectorInClosedForm) {
  // P[1][1] = sqrt 3 sin(theta), P[2][2] = sqrt(15) / 2 sin^2(theta).
  Coefficients c(2);
  c.C(1, 1) = 1000;
  c.S(2, 2) = 500;
  Synthesis synthesis(2);
  const double theta = 0.8, lon = 1.3, q = kRadius / 6.6e6;
  const CoordinateTriple out = synthesis.at(0, c, geocentric(theta, lon, 6.6e6));
  const double k1 = 1000 * std::sqrt(3.0) * q * q * q;
  const double k2 = 500 * std::sqrt(15.0) / 2 * q * q * q * q;
  const double s = std::sin(theta), t = std::cos(theta);
  expect_near(out, k1 * t * std::cos(lon) + k2 * 2 * s * t * std::sin(2 * lon),
              k1 * std::sin(lon) - k2 * 2 * s * std::cos(2 * lon),
              -2 * k1 * s * std::cos(lon) - 3 * k2 * s * s * std::sin(2 * lon), 3e-12);
}

TEST(HarmonicSum, MonopoleHasOnlyARadialPart) {
  Coefficients c(2);
  c.C(0, 0) = 4;
  Synthesis synthesis(2, 1);
  expect_near(synthesis.at(0, c, geocentric(1, 1, 2)), 0, 0, -1, 1e-16);
}

TEST(HarmonicSum, PointsOnTheAxisAreHeldBesideIt) {
  Coefficients c(5);
  Coefficients::fill(c, 9);
  for (const double z : {6.5e6, -6.5e6}) {
    Synthesis synthesis(5);
    const CoordinateTriple out = synthesis.at(0, c, {0, 0, z});
    const double theta = z > 0 ? 1e-12 : kPi - 1e-12;
    EXPECT_EQ(synthesis.cache.last_colat, theta);
    EXPECT_EQ(synthesis.last_lon, 0);
    const auto expected = direct_sum(c, kRadius / 6.5e6, z > 0 ? 0 : kPi, 0).gradient;
    // 1e-12 radians from the pole a field of 5e4 with degree 5 differs by some 1e-6
    expect_near(out, expected.x, expected.y, expected.z, 1e-6);
  }
}

TEST(HarmonicSum, TheLongitudeIsDroppedOnTheAxisOnly) {
  Coefficients c(2);
  Coefficients::fill(c, 9);
  // acos of the quotient cannot resolve less than some 1e-8: a point 1 m off is off the axis,
  // one 1 mm off is on it.
  Synthesis near(2);
  near.at(0, c, {0, 1, 6.5e6});
  EXPECT_NEAR(near.cache.last_colat, 1 / 6.5e6, 2e-9);
  EXPECT_NEAR(near.last_lon, kPi / 2, 1e-15);
  Synthesis on(2);
  on.at(0, c, {0, 1e-3, 6.5e6});
  EXPECT_EQ(on.cache.last_colat, 1e-12);
  EXPECT_EQ(on.last_lon, 0);
  on.at(0, c, {0, 1e-3, -6.5e6});
  EXPECT_EQ(on.cache.last_colat, kPi - 1e-12);
  EXPECT_EQ(on.last_lon, 0);
}

TEST(HarmonicSum, AnIdenticalPointSkipsBothStages) {
  const int32_t N = 4;
  Coefficients c(N);
  Coefficients::fill(c, 2);
  Synthesis synthesis(N);
  const CoordinateTriple p = geocentric(0.9, 0.7, 6.4e6);
  const CoordinateTriple first = synthesis.at(0, c, p);
  EXPECT_EQ(synthesis.at(0, c, p).x, first.x);
  // New coefficients and a spoiled table of sines go unseen until the point moves.
  const double true_sine = synthesis.rec_b(1, 0);
  synthesis.rec_b(1, 0) = 0.123;
  Coefficients other(N);
  synthesis.at(0, other, p);
  EXPECT_EQ(synthesis.rec_b(1, 0), 0.123);
  EXPECT_NE(synthesis.cache.dC[0], 0);
  synthesis.rec_b(1, 0) = true_sine;
  const CoordinateTriple stale = synthesis.at(0, other, p);
  expect_near(stale, first.x, first.y, first.z, 0);
  synthesis.cache.last_radius = 1e30;
  expect_near(synthesis.at(0, other, p), 0, 0, 0, 0);
}

TEST(HarmonicSum, AMoveInLongitudeAloneSkipsTheDegreeSums) {
  const int32_t N = 6;
  Coefficients c(N);
  Coefficients::fill(c, 3);
  Synthesis synthesis(N);
  synthesis.tolerance = 1e-3;  // a parallel is one to the rounding of X, Y, Z only
  synthesis.at(0, c, geocentric(0.9, 0.7, 6.4e6));
  synthesis.cache.dC[0] += 1000;  // a mark in the degree sums
  const CoordinateTriple p = geocentric(0.9, -1.4, 6.4e6);
  const auto expected = direct_sum(c, kRadius / 6.4e6, 0.9, -1.4).gradient;
  const double q = kRadius / 6.4e6;
  const CoordinateTriple out = synthesis.at(0, c, p);
  expect_near(out, expected.x + 1000 * q * q, expected.y, expected.z, 5e-9);
  EXPECT_NEAR(synthesis.last_lon, -1.4, 1e-15);
}

TEST(HarmonicSum, AMoveAlongTheMeridianSkipsTheSines) {
  const int32_t N = 6;
  Coefficients c(N);
  Coefficients::fill(c, 3);
  Synthesis synthesis(N);
  synthesis.tolerance = 1e-3;
  synthesis.at(0, c, geocentric(0.9, 0.7, 6.4e6));
  synthesis.rec_b(6, 5) = 0.5;  // a mark in the table
  synthesis.at(0, c, geocentric(1.3, 0.7, 6.4e6));
  EXPECT_EQ(synthesis.rec_b(6, 5), 0.5);
  EXPECT_NEAR(synthesis.cache.last_colat, 1.3, 1e-15);
}

TEST(HarmonicSum, TheToleranceIsALengthAndIncluded) {
  Coefficients c(2);
  Coefficients::fill(c, 3);
  // On the axis and the equator the figures are exact: r is Z or X.
  Synthesis synthesis(2, 1000);
  synthesis.tolerance = 8;
  synthesis.at(3, c, {0, 0, 1024});
  synthesis.at(3, c, {0, 0, 1032});
  EXPECT_EQ(synthesis.cache.last_radius, 1024);  // a move of the tolerance itself
  synthesis.at(3, c, {0, 0, std::nextafter(1032.0, 2000)});
  EXPECT_GT(synthesis.cache.last_radius, 1032);
  // the colatitude counts as an arc of the reference radius
  synthesis.cache.last_colat = 1e-12 + 0.008 - 1e-10;
  const double kept = synthesis.cache.last_colat;
  synthesis.at(3, c, {0, 0, 1032});
  EXPECT_EQ(synthesis.cache.last_colat, kept);
  synthesis.cache.last_colat = 1e-12 + 0.008 + 1e-10;
  synthesis.at(3, c, {0, 0, 1032});
  EXPECT_EQ(synthesis.cache.last_colat, 1e-12);
  // the sines: strictly above the tolerance
  synthesis.last_lon = 0.008;
  synthesis.at(3, c, {0, 0, 1032});
  EXPECT_EQ(synthesis.last_lon, 0.008);
  synthesis.last_lon = std::nextafter(0.008, 1);
  synthesis.at(3, c, {0, 0, 1032});
  EXPECT_EQ(synthesis.last_lon, 0);
  // a remembered longitude that is not a number is never left
  synthesis.last_lon = kNaN;
  synthesis.at(3, c, {1000, 1, 1});
  EXPECT_TRUE(std::isnan(synthesis.last_lon));
}

TEST(HarmonicSum, DegreeTwoFillsTheTableOfSines) {
  Coefficients c(2);
  Synthesis synthesis(2);
  synthesis.at(0, c, geocentric(1, 0.4, 6.4e6));
  EXPECT_EQ(synthesis.rec_b(0, 0), 1);
  EXPECT_NEAR(synthesis.rec_b(1, 1), std::cos(0.4), 1e-15);
  EXPECT_NEAR(synthesis.rec_b(1, 0), std::sin(0.4), 1e-15);
  EXPECT_NEAR(synthesis.rec_b(2, 2), std::cos(0.8), 1e-15);
  EXPECT_NEAR(synthesis.rec_b(2, 1), std::sin(0.8), 1e-15);
  EXPECT_EQ(synthesis.rec_b(2, 0), -std::sqrt(5.0 / 4));  // the constant beside them stays
}

TEST(HarmonicSum, InPlaceAndPointByPointGiveTheSame) {
  const int32_t N = 12;
  Coefficients c(N);
  Coefficients::fill(c, 4);
  std::mt19937 random(4);
  std::uniform_real_distribution<double> colat(0, kPi), lon(-kPi, kPi);
  Points in(50);
  for (auto& p : in) p = geocentric(colat(random), lon(random), 6.4e6);
  Points out = untouched(50);
  Synthesis whole(N), in_place(N), single(N);
  whole.sum(0, c, 50, in.data(), out.data());
  Points same = in;
  in_place.sum(0, c, 50, same.data(), same.data());
  for (std::size_t i = 0; i < in.size(); ++i) {
    expect_near(same[i], out[i].x, out[i].y, out[i].z, 0);
    expect_near(single.at(0, c, in[i]), out[i].x, out[i].y, out[i].z, 0);
  }
}

TEST(HarmonicSum, NothingToDoStillClearsTheFirstElements) {
  Coefficients c(2);
  Synthesis synthesis(2);
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1, -2147483647}) {
    synthesis.cache.lC[0] = synthesis.cache.S[0] = 3;
    EXPECT_EQ(synthesis.sum(0, c, count, &p, &p), TW_SUCCESS);
    expect_untouched(p);
    EXPECT_EQ(synthesis.cache.lC[0], 0);
    EXPECT_EQ(synthesis.cache.S[0], 0);
    EXPECT_EQ(synthesis.cache.last_colat, 1e30);
  }
}

TEST(HarmonicSum, NotANumberAndTheGeocentre) {
  Coefficients c(3);
  Coefficients::fill(c, 4);
  Synthesis synthesis(3);
  for (const CoordinateTriple& p :
       {CoordinateTriple{kNaN, 1, 1}, CoordinateTriple{0, 0, 0}, CoordinateTriple{1, 1, kNaN}}) {
    const CoordinateTriple out = synthesis.at(0, c, p);
    EXPECT_TRUE(std::isnan(out.x) && std::isnan(out.y) && std::isnan(out.z));
  }
  // and the next point is whole again
  const CoordinateTriple p = geocentric(0.6, 0.5, 6.4e6);
  const CoordinateTriple out = synthesis.at(0, c, p);
  const auto expected = direct_sum(c, kRadius / 6.4e6, 0.6, 0.5).gradient;
  expect_near(out, expected.x, expected.y, expected.z, 5e-9);
}

// Points of a track, of a parallel, of a meridian and at random, some repeated.
std::vector<CoordinateTriple> many_places() {
  std::vector<CoordinateTriple> points;
  const auto place = [](double colat, double lon) {
    const double r = 6371200;
    return CoordinateTriple{r * std::sin(colat) * std::cos(lon),
                            r * std::sin(colat) * std::sin(lon), r * std::cos(colat)};
  };
  for (int i = 0; i < 40; ++i) points.push_back(place(0.7, 0.1 * i - 2));
  for (int i = 0; i < 40; ++i) points.push_back(place(0.1 + 0.07 * i, 0.3));
  for (int i = 0; i < 5; ++i) points.push_back(points.back());
  points.push_back({0, 0, 6371200});
  points.push_back({0, 0, -6371200});
  for (int i = 0; i < 70; ++i) points.push_back(place(0.05 + 0.04 * i, 2.1 * i));
  return points;
}

TEST(HarmonicSum, AnArrayGivesTheFiguresAndLeavesTheCachesOfItsPointsOneByOne) {
  const auto points = many_places();
  for (int16_t mode = 0; mode <= 4; ++mode) {
    for (const double tolerance : {0.0, 1e-3}) {
      Coefficients c(9);
      Coefficients::fill(c, 4);
      Synthesis at_once(9), in_turn(9);
      at_once.tolerance = in_turn.tolerance = tolerance;
      std::vector<CoordinateTriple> a(points.size(), kUntouchedPoint), b = a;
      // The second round starts where the first ended; the third meets other coefficients, so that
      // the sums of a point that does not move are stale by contract.
      for (int round = 0; round < 3; ++round) {
        at_once.sum(mode, c, static_cast<int32_t>(points.size()), points.data(), a.data());
        for (std::size_t i = 0; i < points.size(); ++i) {
          in_turn.sum(mode, c, 1, &points[i], &b[i]);
        }
        for (std::size_t i = 0; i < points.size(); ++i) {
          ASSERT_EQ(a[i].x, b[i].x) << mode << " " << i;
          ASSERT_EQ(a[i].y, b[i].y) << mode << " " << i;
          ASSERT_EQ(a[i].z, b[i].z) << mode << " " << i;
        }
        EXPECT_EQ(at_once.rec_b.block(), in_turn.rec_b.block());
        EXPECT_EQ(at_once.cache.dC, in_turn.cache.dC);
        EXPECT_EQ(at_once.cache.dS, in_turn.cache.dS);
        EXPECT_EQ(at_once.cache.lC, in_turn.cache.lC);
        EXPECT_EQ(at_once.cache.lS, in_turn.cache.lS);
        EXPECT_EQ(at_once.cache.rC, in_turn.cache.rC);
        EXPECT_EQ(at_once.cache.rS, in_turn.cache.rS);
        EXPECT_EQ(at_once.cache.C, in_turn.cache.C);
        EXPECT_EQ(at_once.cache.S, in_turn.cache.S);
        EXPECT_EQ(at_once.cache.last_colat, in_turn.cache.last_colat);
        EXPECT_EQ(at_once.cache.last_radius, in_turn.cache.last_radius);
        EXPECT_EQ(at_once.last_lon, in_turn.last_lon);
        EXPECT_EQ(at_once.cache.tcos, in_turn.cache.tcos);
        EXPECT_EQ(at_once.cache.scale_theta, in_turn.cache.scale_theta);
        EXPECT_EQ(at_once.cache.scale_lambda, in_turn.cache.scale_lambda);
        EXPECT_EQ(at_once.cache.scale_r, in_turn.cache.scale_r);
        if (round == 1) {
          // back to the first point, which the third round does not leave at first
          for (auto* s : {&at_once, &in_turn}) {
            CoordinateTriple p = points[0];
            s->sum(mode, c, 1, &p, &p);
          }
          Coefficients::fill(c, 5);
        }
      }
    }
  }
}

// By contract the sums and sines of the last point stand for a point that has not left it,
// whatever has become of them: in an array as point by point.
TEST(HarmonicSum, WhatIsLeftOfTheLastPointStandsInAnArrayToo) {
  struct Change {
    const char* what;
    std::vector<int16_t> modes;  // whose figures it changes
    void (*make)(Synthesis&);
  };
  const Change changes[] = {
      {"nothing", {}, [](Synthesis&) {}},
      {"north, cosines", {0, 1}, [](Synthesis& s) { s.cache.dC[3] += 1; }},
      {"north, sines", {0, 1}, [](Synthesis& s) { s.cache.dS[2] += 1; }},
      {"value, cosines", {0, 1}, [](Synthesis& s) { s.cache.C[2] += 1; }},
      {"value, sines", {0, 1}, [](Synthesis& s) { s.cache.S[1] += 1; }},
      {"east, cosines", {0, 2}, [](Synthesis& s) { s.cache.lC[1] += 1; }},
      {"east, sines", {0, 2}, [](Synthesis& s) { s.cache.lS[4] += 1; }},
      {"down, cosines", {0, 3}, [](Synthesis& s) { s.cache.rC[0] += 1; }},
      {"down, sines", {0, 3}, [](Synthesis& s) { s.cache.rS[5] += 1; }},
      {"q cos", {0, 1}, [](Synthesis& s) { s.cache.tcos *= 1.25; }},
      {"q sin", {0, 1, 2, 3}, [](Synthesis& s) { s.cache.tsin *= 1.25; }},
      {"scale of north", {0, 1}, [](Synthesis& s) { s.cache.scale_theta *= 2; }},
      {"scale of east", {0, 2}, [](Synthesis& s) { s.cache.scale_lambda *= 2; }},
      {"scale of down", {0, 3}, [](Synthesis& s) { s.cache.scale_r *= 2; }},
      {"a cosine", {0, 1, 2, 3}, [](Synthesis& s) { s.rec_b(2, 2) += 1; }},
      {"a sine", {0, 1, 2, 3}, [](Synthesis& s) { s.rec_b(3, 2) += 1; }},
      {"cosine of nothing", {0, 1, 3}, [](Synthesis& s) { s.rec_b(0, 0) += 1; }}};
  const CoordinateTriple here = geocentric(0.7, 0.3, kRadius);
  std::vector<CoordinateTriple> points(3, here);
  for (int i = 0; i < 9; ++i) points.push_back(geocentric(0.7, 0.3 + 0.1 * i, kRadius));
  for (int i = 0; i < 9; ++i) points.push_back(geocentric(0.7 + 0.1 * i, 0.3, kRadius));
  for (const Change& change : changes) {
    for (int16_t mode = 0; mode <= 3; ++mode) {
      Coefficients c(6);
      Coefficients::fill(c, 11);
      Synthesis at_once(6), in_turn(6);
      const CoordinateTriple unchanged = at_once.at(mode, c, here);
      in_turn.at(mode, c, here);
      change.make(at_once);
      change.make(in_turn);
      std::vector<CoordinateTriple> a(points.size(), kUntouchedPoint), b = a;
      at_once.sum(mode, c, static_cast<int32_t>(points.size()), points.data(), a.data());
      for (std::size_t i = 0; i < points.size(); ++i) in_turn.sum(mode, c, 1, &points[i], &b[i]);
      const bool differs = a[0].x != unchanged.x || a[0].y != unchanged.y || a[0].z != unchanged.z;
      const bool expected =
          std::find(change.modes.begin(), change.modes.end(), mode) != change.modes.end();
      EXPECT_EQ(differs, expected) << change.what << ", mode " << mode;
      for (std::size_t i = 0; i < points.size(); ++i) {
        ASSERT_EQ(a[i].x, b[i].x) << change.what << ", mode " << mode << ", point " << i;
        ASSERT_EQ(a[i].y, b[i].y) << change.what << ", mode " << mode << ", point " << i;
        ASSERT_EQ(a[i].z, b[i].z) << change.what << ", mode " << mode << ", point " << i;
      }
    }
  }
}

// The first constant of the recursion multiplies every sum; it is 1 unless a caller sets it.
TEST(HarmonicSum, TheFirstConstantIsAFactor) {
  Coefficients c(5);
  Coefficients::fill(c, 13);
  std::vector<CoordinateTriple> points;
  for (int i = 0; i < 20; ++i) points.push_back(geocentric(0.3 + 0.1 * i, 0.2 * i, kRadius));
  for (int16_t mode = 0; mode <= 4; ++mode) {
    Synthesis plain(5), doubled(5);
    doubled.rec_a(0, 0) = 2;
    for (const int32_t count : {1, 20}) {
      std::vector<CoordinateTriple> a(points.size(), {0, 0, 0}), b = a;
      plain.sum(mode, c, count, points.data(), a.data());
      doubled.sum(mode, c, count, points.data(), b.data());
      for (std::size_t i = 0; i < points.size(); ++i) {
        EXPECT_EQ(b[i].x, 2 * a[i].x) << mode << " " << i;
        EXPECT_EQ(b[i].y, 2 * a[i].y) << mode << " " << i;
        EXPECT_EQ(b[i].z, 2 * a[i].z) << mode << " " << i;
      }
    }
  }
}

// Degrees above those that are computed several points at once.
TEST(HarmonicSum, AnArrayOfAHighDegreeIsThatOfItsPoints) {
  const int32_t degree = 66;
  Coefficients c(degree);
  Coefficients::fill(c, 12);
  Synthesis at_once(degree), in_turn(degree);
  std::vector<CoordinateTriple> points, a(20, kUntouchedPoint);
  for (int i = 0; i < 20; ++i) points.push_back(geocentric(0.3 + 0.1 * i, 0.2 * i, kRadius));
  at_once.sum(0, c, 20, points.data(), a.data());
  for (std::size_t i = 0; i < points.size(); ++i) {
    const CoordinateTriple b = in_turn.at(0, c, points[i]);
    EXPECT_EQ(a[i].x, b.x);
    EXPECT_EQ(a[i].y, b.y);
    EXPECT_EQ(a[i].z, b.z);
  }
}

}  // namespace
