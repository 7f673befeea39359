// The space oblique Mercator map: without the Earth's turn the oblique Mercator map of the sphere;
// with it, by what it promises along its track.

#include "formulas/space_oblique_mercator.hpp"

#include <gtest/gtest.h>

#include <cmath>

#include "tidewater/special.h"

namespace tidewater::detail {
namespace {

constexpr double degrees(double d) { return d * (kPi / 180); }

SpaceObliqueMercator map_of(double e2, double inclination, double ratio, double start) {
  constexpr int32_t kTerms = 24;
  TrackSeries t;
  for (auto* list : {&t.C, &t.S, &t.X1, &t.X2, &t.X3, &t.X4}) list->resize(kTerms);
  double G, a0, r1, r2, r3, r4;
  TWstatus status = 0;
  TWsom_c(std::sqrt(e2), inclination, ratio, 0, 0, kTerms, 1441, &t.Q, &t.T, &t.W, &G, &a0,
          t.C.data(), t.S.data(), t.X1.data(), t.X2.data(), t.X3.data(), t.X4.data(), &r1, &r2, &r3,
          &r4, &t.m_sin, &t.m_cos, &t.sum3, &t.sum4, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return SpaceObliqueMercator(e2, inclination, ratio, start, t);
}

// Landsat 1 on the ellipsoid of Clarke 1866 (Snyder 1987, p. 218).
constexpr double kE2 = 0.00676866;
const double kInclination = degrees(99.092);
constexpr double kRatio = 18.0 / 251;

struct Place {
  double lon, lat;
};

// The ground below a satellite at the angle L from its node, and a little aside of that.
Place ground(double L, double e2, double inclination, double ratio, double aside = 0) {
  const double x = std::cos(aside) * std::cos(L);
  const double y = std::cos(aside) * std::sin(L), z = std::sin(aside);
  const double up = y * std::sin(inclination) + z * std::cos(inclination);
  const double across = y * std::cos(inclination) - z * std::sin(inclination);
  return {std::remainder(std::atan2(across, x) - ratio * L, 2 * kPi),
          std::atan2(up, (1 - e2) * std::hypot(x, across))};
}

TEST(SpaceObliqueMercatorFormulas, WithoutTheEarthsTurnIsTheObliqueMercatorMapOfTheSphere) {
  for (const double inclination : {degrees(30), degrees(80), degrees(99)}) {
    const auto map = map_of(0, inclination, 0, 0);
    for (double L = 5; L < 360; L += 10) {
      for (double aside = -75; aside <= 75; aside += 25) {
        const Place at = ground(degrees(L), 0, inclination, 0, degrees(aside));
        double x, y, lon, lat;
        ASSERT_TRUE(map.forward(at.lon, at.lat, &x, &y)) << L << " " << aside;
        EXPECT_NEAR(x, degrees(L), 1e-13);
        EXPECT_NEAR(y, std::atanh(std::sin(degrees(aside))), 1e-13);
        ASSERT_TRUE(map.inverse(x, y, &lon, &lat));
        EXPECT_NEAR(std::remainder(lon - at.lon, 2 * kPi) * std::cos(lat), 0, 1e-13);
        EXPECT_NEAR(lat, at.lat, 1e-13);
      }
    }
  }
}

struct Vector {
  double x, y, z;
};

// From one place to another close by on the ellipsoid.
Vector way(const Place& from, const Place& to) {
  const auto position = [](const Place& at) {
    const double s = std::sin(at.lat), nu = 1 / std::sqrt(1 - kE2 * s * s);
    return Vector{nu * std::cos(at.lat) * std::cos(at.lon),
                  nu * std::cos(at.lat) * std::sin(at.lon), nu * (1 - kE2) * s};
  };
  const Vector a = position(from), b = position(to);
  return {b.x - a.x, b.y - a.y, b.z - a.z};
}

double apart(const Place& p, const Place& q) {
  const Vector v = way(p, q);
  return std::hypot(v.x, v.y, v.z);
}

// Between the ways from a place to two others, the second on the left of the first.
double angle_at(const Place& p, const Place& q, const Place& r) {
  const Vector a = way(p, q), b = way(p, r);
  return std::acos((a.x * b.x + a.y * b.y + a.z * b.z) / (apart(p, q) * apart(p, r)));
}

TEST(SpaceObliqueMercatorFormulas, TrackIsTrueToScaleAndTheMapConformalNextToIt) {
  const double start = degrees(93.63);
  const auto map = map_of(kE2, kInclination, kRatio, start);
  for (double L = 95; L < 452; L += 7) {
    const double h = 1e-4;
    const Place here = ground(degrees(L), kE2, kInclination, kRatio);
    const Place next = ground(degrees(L) + h, kE2, kInclination, kRatio);
    double x, y, x1, y1, lon, lat;
    ASSERT_TRUE(map.forward(here.lon, here.lat, &x, &y));
    ASSERT_TRUE(map.forward(next.lon, next.lat, &x1, &y1));
    // The chord is shorter than its arc by less than 1e-9 of it.
    EXPECT_NEAR(std::hypot(x1 - x, y1 - y) / apart(here, next), 1, 2e-6) << L;
    EXPECT_GT(x1, x);
    // The scan line meets the track at the angle of the ground.
    const Place aside = ground(degrees(L), kE2, kInclination, kRatio, h);
    double xa, ya;
    ASSERT_TRUE(map.forward(aside.lon, aside.lat, &xa, &ya));
    EXPECT_NEAR(std::atan2(ya - y, xa - x) - std::atan2(y1 - y, x1 - x),
                angle_at(here, next, aside), 3e-6)
        << L;
    // North and east of one scale.
    const Place north = {here.lon, here.lat + h}, east = {here.lon + h, here.lat};
    double xn, yn, xe, ye;
    ASSERT_TRUE(map.forward(north.lon, north.lat, &xn, &yn));
    ASSERT_TRUE(map.forward(east.lon, east.lat, &xe, &ye));
    const double kn = std::hypot(xn - x, yn - y) / apart(here, north);
    const double ke = std::hypot(xe - x, ye - y) / apart(here, east);
    EXPECT_NEAR(kn, 1, 3e-4) << L;
    EXPECT_NEAR(ke, 1, 3e-4) << L;
    for (const double off : {-0.014, 0.0, 0.006, 0.014}) {
      ASSERT_TRUE(map.inverse(x, y + off, &lon, &lat));
      ASSERT_TRUE(map.forward(lon, lat, &x1, &y1));
      // Where the ends of the orbit lie on each other the ground is on both.
      if (std::fabs(x1 - x) > 1) continue;
      EXPECT_NEAR(x1, x, 2e-14) << L << " " << off;
      EXPECT_NEAR(y1, y + off, 2e-14) << L << " " << off;
    }
  }
}

// Beyond its ends the map goes on for some way, and what lies on two orbits is on this one.
TEST(SpaceObliqueMercatorFormulas, EndsOfTheOrbit) {
  const double start = degrees(93.63);
  const auto map = map_of(kE2, kInclination, kRatio, start);
  double x, y, lon, lat;
  for (const double off : {0.0, 0.3}) {
    for (const double L : {start, start + 2 * kPi}) {
      const bool first = L == start;
      const Place outside = ground(first ? L - off : L + off, kE2, kInclination, kRatio);
      ASSERT_TRUE(map.forward(outside.lon, outside.lat, &x, &y));
      ASSERT_TRUE(map.inverse(x, y, &lon, &lat));
      EXPECT_NEAR(lat, outside.lat, 1e-12);
      EXPECT_NEAR(std::remainder(lon - outside.lon, 2 * kPi), 0, 1e-12);
    }
  }
  const double whole = std::hypot(map.track.m_sin, map.track.m_cos);
  EXPECT_FALSE(map.inverse(whole * (start - 0.52), 0, &lon, &lat));
  EXPECT_FALSE(map.inverse(whole * (start + 2 * kPi + 0.52), 0, &lon, &lat));
  EXPECT_TRUE(map.inverse(whole * (start - 0.48), 0, &lon, &lat));
  EXPECT_TRUE(map.inverse(whole * (start + 2 * kPi + 0.48), 0, &lon, &lat));
  // So far aside a scan line has left the flattened earth; and what is no place.
  EXPECT_TRUE(map.inverse(whole * 4, 4, &lon, &lat));
  EXPECT_FALSE(map.inverse(whole * 4, 8, &lon, &lat));
  for (const double bad : {std::nan(""), HUGE_VAL}) {
    EXPECT_FALSE(map.inverse(bad, 0, &lon, &lat));
    EXPECT_FALSE(map.inverse(4, bad, &lon, &lat));
    EXPECT_FALSE(map.forward(bad, 0.3, &x, &y));
    EXPECT_FALSE(map.forward(0.3, bad, &x, &y));
  }
}

}  // namespace
}  // namespace tidewater::detail
