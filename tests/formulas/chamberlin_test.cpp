// The Chamberlin trimetric map against circles drawn about its control points.

#include "formulas/chamberlin.hpp"

#include <gtest/gtest.h>

#include <array>
#include <cmath>

namespace tidewater::detail {
namespace {

using Position = Chamberlin::Position;
using Spot = Chamberlin::Spot;
using Real = long double;

constexpr double degrees(double d) { return d * kRadiansPerDegree; }

// Wellman's Canada and South America, and one about the date line, by turns to either side.
const std::array<Position, 3> kTriangles[] = {{Position{degrees(-150), degrees(60)},
                                               {degrees(-97.5), degrees(50)},
                                               {degrees(-45), degrees(60)}},
                                              {Position{degrees(-80), degrees(9)},
                                               {degrees(-35), degrees(9)},
                                               {degrees(-71.5), degrees(-53)}},
                                              {Position{degrees(170), degrees(-20)},
                                               {degrees(-160), degrees(-35)},
                                               {degrees(165), degrees(-50)}}};

struct Vector {
  Real x, y, z;
};

Vector direction(const Position& p) {
  const Real lon = p.lon, lat = p.lat;
  return {std::cos(lat) * std::cos(lon), std::cos(lat) * std::sin(lon), std::sin(lat)};
}

Real determinant(const Vector& a, const Vector& b, const Vector& c) {
  return a.x * (b.y * c.z - b.z * c.y) - a.y * (b.x * c.z - b.z * c.x) +
         a.z * (b.x * c.y - b.y * c.x);
}

// The map by a pair of compasses: about the ends of each side circles of the point's distances,
// which meet on the side of it on which the point lies.
template <class Distance>
Spot by_compasses(const Chamberlin& map, const std::array<Position, 3>& control, const Position& p,
                  Distance distance) {
  Real x = 0, y = 0;
  for (std::size_t j = 0; j < 3; ++j) {
    const std::size_t next = (j + 1) % 3;
    const Spot &a = map.corner[j], &b = map.corner[next];
    const Real dx = static_cast<Real>(b.x) - a.x, dy = static_cast<Real>(b.y) - a.y;
    const Real side = std::hypot(dx, dy);
    const Real da = distance(control[j], p), db = distance(control[next], p);
    // Where the circles do not meet the point nearest to both.
    Real along = (da * da - db * db + side * side) / (2 * side);
    along = std::fmin(std::fmax(along, -da), da);
    const Real off = std::sqrt(da * da - along * along);
    // Left of the side where the three directions turn to the left.
    const bool left =
        determinant(direction(control[j]), direction(control[next]), direction(p)) > 0;
    const Real aside = left ? off : -off;
    x += a.x + (along * dx - aside * dy) / side;
    y += a.y + (along * dy + aside * dx) / side;
  }
  return {static_cast<double>(x / 3), static_cast<double>(y / 3)};
}

Real on_sphere(const Position& p, const Position& q) {
  const Vector a = direction(p), b = direction(q);
  const Real dx = a.x - b.x, dy = a.y - b.y, dz = a.z - b.z;
  return 2 * std::asin(std::sqrt(dx * dx + dy * dy + dz * dz) / 2);
}

template <class Distance>
void expect_map(const Chamberlin& map, const std::array<Position, 3>& control, Distance distance) {
  EXPECT_TRUE(map.good());
  // Side by side, as long as on the earth; level with the origin.
  EXPECT_EQ(map.corner[0].y, map.corner[1].y);
  EXPECT_EQ(map.corner[2].y, 0);
  EXPECT_EQ(map.corner[0].x, -map.corner[1].x);
  for (std::size_t j = 0; j < 3; ++j) {
    const Spot &a = map.corner[j], &b = map.corner[(j + 1) % 3];
    EXPECT_NEAR(std::hypot(a.x - b.x, a.y - b.y),
                static_cast<double>(distance(control[j], control[(j + 1) % 3])), 1e-15);
    Spot at;
    EXPECT_TRUE(map.forward(control[j].lon, control[j].lat, &at));
    EXPECT_NEAR(at.x, map.corner[j].x, 1e-15);
    EXPECT_NEAR(at.y, map.corner[j].y, 1e-15);
    // There the distances from the other two hardly tell how far off a point lies.
    Position back;
    EXPECT_TRUE(map.inverse(map.corner[j].x, map.corner[j].y, &back));
    EXPECT_NEAR(back.lon, control[j].lon, 1e-7);
    EXPECT_NEAR(back.lat, control[j].lat, 1e-7);
  }
  const double lon0 = control[1].lon, lat0 = (control[0].lat + control[2].lat) / 2;
  for (int i = -4; i <= 4; ++i) {
    for (int k = -4; k <= 4; ++k) {
      const Position p = {std::remainder(lon0 + degrees(9.7 * i + 0.3), 2 * kPi),
                          lat0 + degrees(4.3 * k + 0.1)};
      Spot at;
      ASSERT_TRUE(map.forward(p.lon, p.lat, &at));
      const Spot expected = by_compasses(map, control, p, distance);
      EXPECT_NEAR(at.x, expected.x, 3e-14) << i << " " << k;
      EXPECT_NEAR(at.y, expected.y, 3e-14) << i << " " << k;
      Position back;
      ASSERT_TRUE(map.inverse(at.x, at.y, &back)) << i << " " << k;
      EXPECT_NEAR(std::remainder(back.lon - p.lon, 2 * kPi) * std::cos(p.lat), 0, 1e-13);
      EXPECT_NEAR(back.lat, p.lat, 1e-13);
      EXPECT_LE(std::fabs(back.lon), kPi);
    }
  }
}

TEST(ChamberlinFormulas, OfTheSphereIsDrawnByCompasses) {
  for (const auto& control : kTriangles) expect_map(Chamberlin(0, control), control, on_sphere);
}

TEST(ChamberlinFormulas, OfTheEllipsoidIsDrawnByCompasses) {
  const Geodesics lines(1, 1 / 298.257223563);
  for (const auto& control : kTriangles) {
    expect_map(Chamberlin(1 / 298.257223563, control), control,
               [&](const Position& p, const Position& q) -> Real {
                 return lines
                     .any_line(p.lat / kRadiansPerDegree, p.lon / kRadiansPerDegree,
                               q.lat / kRadiansPerDegree, q.lon / kRadiansPerDegree)
                     .length;
               });
  }
}

// A search that crosses the date line comes back to longitudes within half a turn.
TEST(ChamberlinFormulas, NextToTheDateLine) {
  const Chamberlin map(0, kTriangles[2]);
  for (double lon = 179; lon <= 181; lon += 0.05) {
    for (double lat = -55; lat <= -15; lat += 5) {
      Spot at;
      Position back;
      ASSERT_TRUE(map.forward(degrees(lon), degrees(lat), &at));
      ASSERT_TRUE(map.inverse(at.x, at.y, &back));
      EXPECT_LE(std::fabs(back.lon), kPi) << lon << " " << lat;
      EXPECT_NEAR(std::remainder(back.lon - degrees(lon), 2 * kPi), 0, 1e-12) << lon << " " << lat;
      EXPECT_NEAR(back.lat, degrees(lat), 1e-12) << lon << " " << lat;
    }
  }
}

// On the way from one control point to another and beyond them, where rounding puts a point further
// off than the sum of two distances.
TEST(ChamberlinFormulas, InLineWithTwoPointsOfControl) {
  const std::array<Position, 3> control = {Position{0, 0}, {0.5, 0}, {0.2, 0.4}};
  const Chamberlin map(0, control);
  for (int i = -150; i <= 200; ++i) {
    const Position p = {i * 0.01 + 0.003, 0};
    Spot at;
    ASSERT_TRUE(map.forward(p.lon, p.lat, &at));
    ASSERT_TRUE(std::isfinite(at.x) && std::isfinite(at.y)) << p.lon;
    // The side itself has the point where it is; the other two sides by their compasses.
    const Spot expected = by_compasses(map, control, p, on_sphere);
    EXPECT_NEAR(at.x, expected.x, 1e-8) << p.lon;
    EXPECT_NEAR(at.y, expected.y, 2e-8) << p.lon;
  }
}

TEST(ChamberlinFormulas, PointsThatMakeNoTriangle) {
  const auto good = [](const Position& a, const Position& b, const Position& c) {
    return Chamberlin(0, {a, b, c}).good();
  };
  EXPECT_TRUE(good({0, 0}, {0.5, 0}, {0.25, 1e-5}));
  EXPECT_FALSE(good({0, 0}, {0.5, 0}, {0.25, 0}));       // on the equator
  EXPECT_FALSE(good({0, 0.1}, {0, 0.7}, {0, -0.5}));     // on a meridian
  EXPECT_FALSE(good({0, 0}, {0.5, 0}, {0.25, 2e-7}));    // all but on a line
  EXPECT_FALSE(good({0, 0}, {3.1, 0}, {1.5, 0.5}));      // as far apart as the earth is wide
  EXPECT_FALSE(good({0.2, 0.3}, {0.2, 0.3}, {0.5, 0}));  // two in one
}

TEST(ChamberlinFormulas, WhatIsNoPlace) {
  const Chamberlin map(0, kTriangles[0]);
  Spot at;
  EXPECT_FALSE(map.forward(std::nan(""), 0.3, &at));
  EXPECT_FALSE(map.forward(0.3, std::nan(""), &at));
  EXPECT_FALSE(map.forward(0.3, 1.6, &at));
  Position back;
  EXPECT_FALSE(map.inverse(std::nan(""), 0, &back));
  EXPECT_FALSE(map.inverse(0, 1e10, &back));
  EXPECT_FALSE(map.inverse(50, 0, &back));
  // The pole, by steps that pass it, and points beyond it.
  for (const double beyond : {0.0, 0.05, 0.2}) {
    ASSERT_TRUE(map.forward(degrees(100), kHalfPi - beyond, &at));
    ASSERT_TRUE(map.inverse(at.x, at.y, &back)) << beyond;
    EXPECT_NEAR(back.lat, kHalfPi - beyond, 1e-9);
  }
}

}  // namespace
}  // namespace tidewater::detail
