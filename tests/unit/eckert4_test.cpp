#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

const double kYUnit = 2 * std::sqrt(kPi / (4 + kPi));

TWstatus forward(const Points& in, Points& out, double lon0 = 0, double y0 = 0) {
  TWstatus status = 0;
  TWeckertIV_f(lon0, y0, static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
  return status;
}

TEST(EckertIV, LongitudeIsNotWrapped) {
  Points out = {{10, 0, 0}};
  EXPECT_EQ(forward(out, out, -3), TW_SUCCESS);
  EXPECT_NEAR(out[0].x, 13 * 4 / std::sqrt(kPi * (4 + kPi)), 1e-14);
}

TEST(EckertIV, ConstantsStopAtANegativeStep) {
  // North of the equator the first step is positive and the iteration goes on; south of it the
  // first step is negative and the first estimate stands.
  TWstatus status = 0;
  double north = kUntouched, south = kUntouched;
  const double lat = degrees(50);
  TWeckertIV_c(lat, &north, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  TWeckertIV_c(-lat, &south, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  Points exact = {{0, lat, 0}};
  EXPECT_EQ(forward(exact, exact), TW_SUCCESS);
  EXPECT_NEAR(north, exact[0].y, 1e-9);  // after an overshoot the step is negative, too
  // one step from half the latitude, by hand
  double t = -lat / 2;
  t -= (t + std::sin(t) * std::cos(t) + 2 * std::sin(t) - (2 + kPi / 2) * std::sin(-lat)) /
       (2 * std::cos(t) * (1 + std::cos(t)));
  EXPECT_NEAR(south, std::sin(t) * kYUnit, 1e-15);
  EXPECT_GT(std::fabs(south + north), 1e-3);
  // so that the origin is not at 0
  Points origin = {{0, -lat, 0}};
  EXPECT_EQ(forward(origin, origin, 0, south), TW_SUCCESS);
  EXPECT_GT(std::fabs(origin[0].y), 1e-3);
}

TEST(EckertIV, ForwardStopsWhenItReachesFiftyPasses) {
  // At the pole the root is a double one and each step takes half the way; far outside the
  // latitudes Newton wanders.  Whatever the point, the loop ends there.
  Points in = {{0.5, 0.5, 0}, {0.5, 0, 0}, {0.5, 0.5, 0}};
  int stopped = 0;
  for (double lat = 1.6; lat < 400; lat += 0.37) {
    in[1].y = lat;
    Points out = untouched(3);
    const TWstatus status = forward(in, out);
    EXPECT_NE(out[0].x, kUntouched);
    if (status == TW_NOT_CONVERGED) {
      ++stopped;
      expect_untouched(out[1]);
      expect_untouched(out[2]);
    } else {
      EXPECT_EQ(status, TW_SUCCESS);
      EXPECT_NE(out[2].x, kUntouched);
    }
  }
  EXPECT_GT(stopped, 0);
  for (const double lat : {kNaN, static_cast<double>(kInfinity)}) {  // no step is ever small enough
    in[1].y = lat;
    Points out = untouched(3);
    EXPECT_EQ(forward(in, out), TW_NOT_CONVERGED);
    EXPECT_NE(out[0].x, kUntouched);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
  }
}

TEST(EckertIV, NearThePole) {
  for (double u = 1e-15; u < 0.1; u *= 3) {
    Points out = {{0, kPi / 2 - u, 0}};
    const TWstatus status = forward(out, out);
    if (status == TW_SUCCESS) {
      // with w = pi/2 - t: w^2 = (2 + pi/2) u^2 / 2 but for terms of u^3
      EXPECT_NEAR(out[0].y, kYUnit * (1 - (2 + kPi / 2) * u * u / 4), 2 * u * u * u + 1e-14);
    } else {
      EXPECT_EQ(status, TW_NOT_CONVERGED);
    }
  }
}

TEST(EckertIV, NearThePoleThePassesComeToRest) {
  // Newton's passes from half the latitude, as stated; the root by w = pi/2 - t to its third power:
  // t + sin t cos t + 2 sin t = (2 + pi/2) sin p is w^2 (1 + w / 3 ...) = (2 + pi/2) u^2 / 2.
  for (const double u : {4.9e-4, 3e-4, 1e-4, 3e-5, 1e-5}) {
    for (const double sign : {1.0, -1.0}) {
      Points out = {{0.7, sign * (kPi / 2 - u), 0}};
      EXPECT_EQ(forward(out, out), TW_SUCCESS) << u;
      long double low = 1, high = 1.57079632679489662L;
      const long double target = (2 + std::acos(-1.0L) / 2) * std::cos(static_cast<long double>(u));
      for (int k = 0; k < 80; ++k) {
        const long double t = (low + high) / 2;
        (t + std::sin(t) * std::cos(t) + 2 * std::sin(t) < target ? low : high) = t;
      }
      const auto sine = static_cast<double>(std::sin(low));
      const auto cosine = static_cast<double>(std::cos(low));
      // Where the derivative goes to zero rounding moves the root: by 1e-16 over w.
      EXPECT_NEAR(out[0].y, sign * kYUnit * sine, 1e-14);
      EXPECT_NEAR(out[0].x, 2 / std::sqrt(kPi * (4 + kPi)) * 0.7 * (1 + cosine), 1e-15 / u);
    }
  }
}

TEST(EckertIV, EveryInputLeavesTheConstants) {
  for (const double lat : {kPi / 2, -kPi / 2, 3.0, 100.0, 1e17, -1e17, 1e300, -1e300,
                           static_cast<double>(kInfinity), kNaN}) {
    double y0 = kUntouched;
    TWstatus status = 0;
    TWeckertIV_c(lat, &y0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NE(y0, kUntouched);
  }
  double y0 = 0;
  TWstatus status = 0;
  TWeckertIV_c(kPi / 2, &y0, &status);
  EXPECT_NEAR(y0, kYUnit, 1e-14);
}

TEST(EckertIV, InverseClampsTheOrdinate) {
  const Points in = {{0.3, kYUnit + 1, 0}, {0.3, -kYUnit - 1, 0}, {0, kYUnit, 0}, {0, kNaN, 0}};
  Points out = untouched(4);
  TWstatus status = 0;
  TWeckertIV_i(0.7, 0, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  // the arc sine near 1 turns a rounding into 2e-8
  EXPECT_NEAR(out[0].y, kPi / 2, 3e-8);
  EXPECT_NEAR(out[0].x, 0.7 + std::sqrt(kPi * (4 + kPi)) * 0.3 / 2, 1e-15);
  EXPECT_NEAR(out[1].y, -kPi / 2, 3e-8);
  for (const double sign : {1.0, -1.0}) {
    CoordinateTriple p = {0.3, sign * 1.05 * kYUnit, 0};
    TWeckertIV_i(0.7, 0, 1, &p, &p, &status);
    EXPECT_NEAR(p.y, sign * kPi / 2, 3e-8);
  }
  EXPECT_NEAR(out[2].y, kPi / 2, 3e-8);
  EXPECT_TRUE(std::isnan(out[3].y));
}

TEST(EckertIV, MoreThan32767Points) {
  const int32_t n = 70000;
  Points many(static_cast<std::size_t>(n));
  for (int32_t i = 0; i < n; ++i) {
    many[static_cast<std::size_t>(i)] = {0, 1.2 * i / n, 0};
  }
  Points out = many;
  EXPECT_EQ(forward(out, out), TW_SUCCESS);
  TWstatus status = 0;
  TWeckertIV_i(0, 0, n, out.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < many.size(); i += 997) EXPECT_NEAR(out[i].y, many[i].y, 1e-14);
  EXPECT_NEAR(out.back().y, many.back().y, 1e-14);
}

TEST(EckertIV, RoundTrip) {
  std::mt19937 random(12);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.5, 1.5);
  Points in(500);
  for (auto& q : in) q = {lon(random), lat(random), 2};
  Points out = in;
  EXPECT_EQ(forward(out, out, 0.02, 0.3), TW_SUCCESS);
  TWstatus status = 0;
  TWeckertIV_i(0.02, 0.3, 500, out.data(), out.data(), &status);
  for (std::size_t i = 0; i < in.size(); ++i) {
    expect_near(out[i], in[i].x, in[i].y, 2, 1e-13);  // two arc sines, one of them near 1
  }
}

}  // namespace
