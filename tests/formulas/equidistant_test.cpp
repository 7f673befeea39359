// Projections of the meridian's arc: Snyder's examples, and his formulas in long double with the
// arc by quadrature.

#include "formulas/equidistant.hpp"

#include <gtest/gtest.h>

#include <cmath>

namespace tidewater::detail {
namespace {

using Real = long double;

constexpr double kF = 1 / 298.257223563;
constexpr Real kE2 = static_cast<Real>(kF) * (2 - static_cast<Real>(kF));
// Clarke 1866 by its square of the eccentricity.
constexpr double kClarke = 6378206.4;
const double kClarkeF = 1 - std::sqrt(1 - 0.00676866);

constexpr double degrees(double d) { return d * kRadiansPerDegree; }

// Of the meridian, by Simpson's rule on its radius.
Real arc_of(Real lat) {
  const int n = 4000;
  const Real h = lat / n;
  Real sum = 0;
  for (int i = 0; i <= n; ++i) {
    const Real s = std::sin(i * h);
    const Real w = 1 - kE2 * s * s;
    sum += (i == 0 || i == n ? 1 : i % 2 ? 4 : 2) * (1 - kE2) / (w * std::sqrt(w));
  }
  return sum * h / 3;
}

struct Expected {
  Real x, y;
};

void expect_at(const Planar<double>& got, const Expected& expected, double tolerance) {
  EXPECT_TRUE(got.plain);
  EXPECT_NEAR(got.x, static_cast<double>(expected.x), tolerance);
  EXPECT_NEAR(got.y, static_cast<double>(expected.y), tolerance);
}

template <class Map>
void expect_back(const Map& map, const Planar<double>& at, double lon, double lat,
                 double tolerance) {
  const auto back = map.inverse(at.x, at.y);
  EXPECT_TRUE(back.plain) << lon << " " << lat;
  EXPECT_NEAR(back.x, lon, tolerance) << lon << " " << lat;
  EXPECT_NEAR(back.y, lat, tolerance) << lon << " " << lat;
}

// --- Cassini-Soldner ---------------------------------------------------------------------------

// IOGP Publication 373-7-2, method 9806: Trinidad 1903, in links.
TEST(CassiniFormulas, PublishedExample) {
  const Cassini map(31706587.88, 1 / 294.2606764, degrees(10 + 26.5 / 60));
  const auto at = map.forward(degrees(-62 + 61 + 20.0 / 60), degrees(10));
  EXPECT_NEAR(at.x + 430000, 66644.94, 0.02);
  EXPECT_NEAR(at.y + 325000, 82536.22, 0.02);
}

// Snyder eq. 13-7 to 13-9.
TEST(CassiniFormulas, AreSnydersAndComeBack) {
  const Cassini map(1, kF, degrees(30));
  for (double lat = -85; lat <= 85; lat += 17) {
    for (double lon = -40; lon <= 40; lon += 10) {
      const Real s = std::sin(static_cast<Real>(degrees(lat)));
      const Real c = std::cos(static_cast<Real>(degrees(lat)));
      const Real nu = 1 / std::sqrt(1 - kE2 * s * s);
      const Real T = s * s / (c * c), C = kE2 / (1 - kE2) * c * c, A = degrees(lon) * c;
      const Real A2 = A * A;
      const Expected expected = {
          nu * (A - T * A2 * A / 6 - (8 - T + 8 * C) * T * A2 * A2 * A / 120),
          arc_of(degrees(lat)) - arc_of(degrees(30)) +
              nu * s / c * (A2 / 2 + (5 - T + 6 * C) * A2 * A2 / 24)};
      const auto at = map.forward(degrees(lon), degrees(lat));
      expect_at(at, expected, 1e-15);
      // The series leaves the earth far from the meridian in high latitudes.
      if (std::fabs(lon) * std::fabs(std::tan(degrees(lat))) < 40) {
        expect_back(map, at, degrees(lon), degrees(lat), 1e-14);
      }
    }
  }
}

TEST(CassiniFormulas, WhatIsNoPlace) {
  const Cassini map(1, kF, 0);
  EXPECT_TRUE(map.forward(0.0, kHalfPi).plain);
  EXPECT_FALSE(map.forward(0.0, std::nextafter(kHalfPi, 2)).plain);
  EXPECT_FALSE(map.forward(0.0, std::nan("")).plain);
  EXPECT_FALSE(map.inverse(1.5, 0.0).plain);
  EXPECT_FALSE(map.inverse(-1.5, 0.0).plain);
  EXPECT_TRUE(map.inverse(0.5, 0.0).plain);
  EXPECT_FALSE(map.inverse(0.1, 1.6).plain);
  EXPECT_FALSE(map.inverse(0.1, -1.6).plain);
  EXPECT_FALSE(map.inverse(std::nan(""), 0.0).plain);
  EXPECT_FALSE(map.inverse(0.0, std::nan("")).plain);
}

// --- polyconic ---------------------------------------------------------------------------------

// Snyder (1987), p. 303: origin 30 N 96 W; 40 N 75 W.
TEST(PolyconicFormulas, SnydersExample) {
  const Polyconic map(kClarke, kClarkeF, degrees(30));
  const auto at = map.forward(degrees(21), degrees(40));
  EXPECT_NEAR(at.x, 1776774.5, 0.06);
  EXPECT_NEAR(at.y, 1319657.8, 0.06);
}

// Snyder eq. 18-12 to 18-14; eq. 18-1 on the equator.
TEST(PolyconicFormulas, AreSnydersAndComeBack) {
  const Polyconic map(1, kF, degrees(-10));
  for (double lat = -88; lat <= 88; lat += 8) {
    for (double lon = -160; lon <= 160; lon += 40) {
      const Real s = std::sin(static_cast<Real>(degrees(lat)));
      const Real c = std::cos(static_cast<Real>(degrees(lat)));
      const Real radius = lat == 0 ? 0 : c / s / std::sqrt(1 - kE2 * s * s);
      const Real E = degrees(lon) * s;
      const Real x = lat == 0 ? static_cast<Real>(degrees(lon)) : radius * std::sin(E);
      const auto at = map.forward(degrees(lon), degrees(lat));
      expect_at(at, {x, arc_of(degrees(lat)) - arc_of(degrees(-10)) + radius * (1 - std::cos(E))},
                2e-15);
      if (std::fabs(lon) < 100) expect_back(map, at, degrees(lon), degrees(lat), 2e-13);
    }
  }
  const auto equator = map.forward(2.0, 0.0);
  EXPECT_EQ(equator.x, 2);
  expect_back(map, equator, 2, 0, 1e-14);
}

TEST(PolyconicFormulas, WhatIsNoPlace) {
  const Polyconic map(1, kF, 0);
  EXPECT_TRUE(map.forward(kPi, kHalfPi).plain);
  EXPECT_NEAR(map.forward(3.0, kHalfPi).x, 0, 1e-15);
  EXPECT_FALSE(map.forward(0.0, std::nextafter(kHalfPi, 2)).plain);
  EXPECT_FALSE(map.forward(3.15, 0.0).plain);
  EXPECT_FALSE(map.forward(std::nan(""), 0.0).plain);
  EXPECT_FALSE(map.inverse(4.0, 0.0).plain);
  EXPECT_FALSE(map.inverse(0.0, -4.0).plain);
  EXPECT_FALSE(map.inverse(3.3, 0.0).plain);  // east of half a turn
  EXPECT_FALSE(map.inverse(0.0, 1.6).plain);  // north of the pole
  EXPECT_FALSE(map.inverse(std::nan(""), 0.0).plain);
}

// --- equidistant conic -------------------------------------------------------------------------

// Snyder (1987), p. 298: parallels 29.5 and 45.5 N, origin 23 N 96 W; 35 N 75 W.
TEST(EquidistantConicFormulas, SnydersExample) {
  const EquidistantConic map(kClarke, kClarkeF, degrees(23), degrees(29.5), degrees(45.5));
  const auto at = map.forward(degrees(21), degrees(35));
  EXPECT_NEAR(at.x, 1885051.9, 0.06);
  EXPECT_NEAR(at.y, 1540507.6, 0.06);
}

// Snyder eq. 16-1 to 16-4, north and south.
TEST(EquidistantConicFormulas, AreSnydersAndComeBack) {
  for (const double side : {1.0, -1.0}) {
    const double lat0 = degrees(20) * side, lat1 = degrees(30) * side, lat2 = degrees(50) * side;
    const EquidistantConic map(1, kF, lat0, lat1, lat2);
    const auto parallel = [](Real lat) {
      const Real s = std::sin(lat);
      return std::cos(lat) / std::sqrt(1 - kE2 * s * s);
    };
    const Real n = (parallel(lat1) - parallel(lat2)) / (arc_of(lat2) - arc_of(lat1));
    const Real G = parallel(lat1) / n + arc_of(lat1);
    for (double lat = -90; lat <= 90; lat += 30) {
      for (double lon = -180; lon <= 180; lon += 45) {
        const double phi = lat == 90 ? kHalfPi : lat == -90 ? -kHalfPi : degrees(lat);
        const double lambda = lon == 180 ? kPi : lon == -180 ? -kPi : degrees(lon);
        const Real rho = G - arc_of(phi);
        const auto at = map.forward(lambda, phi);
        expect_at(at, {rho * std::sin(n * lambda), G - arc_of(lat0) - rho * std::cos(n * lambda)},
                  6e-15);  // of values up to 3, by a quotient of differences
        const auto back = map.inverse(at.x, at.y);
        EXPECT_TRUE(back.plain) << lat << " " << lon;
        EXPECT_NEAR(back.y, phi, 4e-15);
        EXPECT_NEAR(back.x, lambda, 1e-14);
      }
    }
  }
}

// Parallels that meet: the cone touches.
TEST(EquidistantConicFormulas, OneParallelIsTheLimitOfTwo) {
  const EquidistantConic one(1, kF, 0, degrees(40), degrees(40));
  const EquidistantConic two(1, kF, 0, degrees(40) - 1e-6, degrees(40) + 1e-6);
  EXPECT_NEAR(one.n, std::sin(degrees(40)), 1e-16);
  EXPECT_NEAR(two.n, one.n, 1e-9);
  const EquidistantConic close(1, kF, 0, degrees(40) - 0.4e-7, degrees(40) + 0.4e-7);
  EXPECT_NEAR(close.n, std::sin(degrees(40)), 1e-15);
}

TEST(EquidistantConicFormulas, WhatIsNoPlace) {
  const EquidistantConic map(1, kF, 0, degrees(30), degrees(50));
  EXPECT_FALSE(map.forward(0.0, 1.6).plain);
  EXPECT_FALSE(map.forward(0.0, std::nan("")).plain);
  const double pole = map.forward(0.0, kHalfPi).y;
  EXPECT_TRUE(map.inverse(0.0, pole).plain);
  EXPECT_FALSE(map.inverse(0.0, pole + 1e-9).plain);  // between the pole and the cone's tip
  EXPECT_FALSE(map.inverse(0.0, map.rho0).plain);
  EXPECT_FALSE(map.inverse(0.0, -3.0).plain);          // south of the pole
  EXPECT_FALSE(map.inverse(0.0, map.rho0 + 1).plain);  // in the gap of the cone
  EXPECT_FALSE(map.inverse(std::nan(""), 0.0).plain);
}

// --- azimuthal equidistant about a pole --------------------------------------------------------

TEST(PolarEquidistantFormulas, DistancesFromThePoleAreTheMeridians) {
  for (const double pole : {1.0, -1.0}) {
    const PolarEquidistant map(1, kF, pole);
    for (double lat = -90; lat <= 90; lat += 15) {
      for (double lon = -150; lon <= 180; lon += 30) {
        const double phi = lat == 90 ? kHalfPi : lat == -90 ? -kHalfPi : degrees(lat);
        const Real rho = arc_of(kHalfPi) - static_cast<Real>(pole) * arc_of(phi);
        const auto at = map.forward(degrees(lon), phi);
        expect_at(at,
                  {rho * std::sin(static_cast<Real>(degrees(lon))),
                   -static_cast<Real>(pole) * rho * std::cos(static_cast<Real>(degrees(lon)))},
                  2e-15);
        const auto back = map.inverse(at.x, at.y);
        EXPECT_TRUE(back.plain);
        EXPECT_NEAR(back.y, phi, 3e-15);
        if (phi != pole * kHalfPi) {
          EXPECT_NEAR(std::remainder(back.x - degrees(lon), 2 * kPi), 0, 1e-14);
        }
        EXPECT_LE(std::fabs(back.y), kHalfPi);
      }
    }
    EXPECT_FALSE(map.forward(0.0, 1.6).plain);
    EXPECT_FALSE(map.forward(0.0, std::nan("")).plain);
    EXPECT_FALSE(map.inverse(3.2, 0.0).plain);  // beyond the other pole
    EXPECT_FALSE(map.inverse(std::nan(""), 0.0).plain);
  }
}

}  // namespace
}  // namespace tidewater::detail
