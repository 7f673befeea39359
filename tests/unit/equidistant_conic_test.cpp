#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "support/projection_checks.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Cone {
  double e, lon0;
  double n = 0, G = 0, rho0 = 0;
  double C0 = 0, C2 = 0, C4 = 0, C6 = 0, C8 = 0, D2 = 0, D4 = 0, D6 = 0, D8 = 0;

  Cone(double e_, double lon0_, double lat0, double lat1, double lat2) : e(e_), lon0(lon0_) {
    TWstatus status = 0;
    TWconic_c(e, lat0, lat1, lat2, &n, &G, &rho0, &C0, &C2, &C4, &C6, &C8, &D2, &D4, &D6, &D8,
              &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  void forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWconic_f(lon0, n, G, rho0, C0, C2, C4, C6, C8, static_cast<int32_t>(in.size()), in.data(),
              out.data(), &word);
    EXPECT_EQ(word, TW_SUCCESS);
  }
  void inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWconic_i(lon0, n, G, rho0, C0, D2, D4, D6, D8, static_cast<int32_t>(in.size()), in.data(),
              out.data(), &word);
    EXPECT_EQ(word, TW_SUCCESS);
  }
  void scale(double k0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWconic_s(e, k0, n, G, C0, C2, C4, C6, C8, static_cast<int32_t>(in.size()), in.data(),
              out.data(), &word);
    EXPECT_EQ(word, TW_SUCCESS);
  }
};

// The arc's terms in e^8 are not those of the full expansion: 1.5e-10 on the earth's ellipsoids.
// A radius holds two arcs, and the inverse, which goes by the true arc, about as much again.
constexpr double kSeriesGap = 3e-10;

TEST(EquidistantConic, SphereOfSnyder) {
  // Snyder 1987, p. 298: unit sphere, the same cone and point.
  const Cone cone(0, degrees(-96), degrees(23), degrees(29.5), degrees(45.5));
  Points out = {{degrees(-75), degrees(35), 0}};
  cone.forward(out, out);
  expect_near(out[0], 0.2952057, 0.2424021, 5e-8);
  cone.inverse(out, out);
  expect_near(out[0], degrees(-75), degrees(35), 1e-15);
}

TEST(EquidistantConic, Coefficients) {
  const Cone cone(0.5, 0, 0.3, 0.5, 0.5);
  MeridianByHand::expect_powers({cone.C0, cone.C2, cone.C4, cone.C6, cone.C8},
                                {cone.D2, cone.D4, cone.D6, cone.D8});
  // The arc within rho0 is the sum of the sines.
  const auto arc = MeridianByHand::arc;
  const double m1 = std::cos(0.5) / std::sqrt(1 - 0.25 * std::sin(0.5) * std::sin(0.5));
  EXPECT_NEAR(cone.G, m1 / std::sin(0.5) + arc(0.5), 4e-16);
  EXPECT_NEAR(cone.G - cone.rho0, arc(0.3), 4e-16);
  EXPECT_EQ(Cone(0.5, 0, 0, 0.5, 0.5).rho0, Cone(0.5, 0, 0, 0.5, 0.5).G);
  // Two parallels.
  const Cone two(0.5, 0, 0.3, 0.5, 0.9);
  const double m2 = std::cos(0.9) / std::sqrt(1 - 0.25 * std::sin(0.9) * std::sin(0.9));
  EXPECT_NEAR(two.n, (m1 - m2) / (arc(0.9) - arc(0.5)), 2e-15);
}

TEST(EquidistantConic, ParallelsAreComparedExactly) {
  EXPECT_EQ(Cone(0, 0, 0, 0.5, 0.5).n, std::sin(0.5));
  // One last bit apart they are two parallels, and the quotient of two last bits is what comes out.
  const Cone two(0, 0, 0, 0.5, std::nextafter(0.5, 1));
  EXPECT_NE(two.n, std::sin(0.5));
  EXPECT_NEAR(two.n, std::sin(0.5), 0.6);
}

TEST(EquidistantConic, ScaleAlongMeridianIsTrue) {
  // Distances along a meridian are those of the ellipsoid: difference of y on the central one.
  const Cone cone(0.0818191910428158, 0.2, 0.4, 0.5, 0.7);
  Points p = {{0.2, 0.3, 0}, {0.2, 1.3, 0}};
  cone.forward(p, p);
  double arc = 0;  // Simpson
  constexpr int kSteps = 2000;
  for (int i = 0; i <= kSteps; ++i) {
    const double s = 0.0818191910428158 * std::sin(0.3 + i / 2000.0);
    arc += (i == 0 || i == kSteps ? 1 : i % 2 == 1 ? 4 : 2) * std::pow(1 - s * s, -1.5);
  }
  arc *= (1 - 0.0818191910428158 * 0.0818191910428158) / (3 * kSteps);
  EXPECT_NEAR(p[1].y - p[0].y, arc, kSeriesGap);
}

TEST(EquidistantConic, WholeTurns) {
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  Points out = untouched(5);
  cone.forward({{0.4, 0.5, 0},
                {0.4 + 10 * kPi, 0.5, 0},
                {0.4 - 10 * kPi, 0.5, 0},
                {-kPi, 0.5, 0},
                {kPi, 0.5, 0}},
               out);
  expect_near(out[1], out[0].x, out[0].y, 1e-14);
  expect_near(out[2], out[0].x, out[0].y, 1e-14);
  EXPECT_LT(out[3].x, 0);  // -pi stays
  EXPECT_EQ(out[3].x, -out[4].x);
}

TEST(EquidistantConic, InverseDoesNotWrap) {
  const Cone cone(0, 3, 0.4, 0.5, 0.7);
  Points p = {{4, 0.5, 0}};
  cone.forward(p, p);
  cone.inverse(p, p);
  EXPECT_NEAR(p[0].x, 4, 1e-15);
}

TEST(EquidistantConic, NothingIsTested) {
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  Points p = {{0.1, 3, 0}, {0.1, kNaN, 0}};
  cone.forward(p, p);
  EXPECT_TRUE(std::isfinite(p[0].y));  // latitudes beyond the poles go through the series
  EXPECT_TRUE(std::isnan(p[1].y));
  cone.inverse(p, p);
  EXPECT_TRUE(std::isnan(p[1].y));
}

TEST(EquidistantConic, RoundTrip) {
  std::mt19937 random(6);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.5, 1.5);
  for (const double e : {0.0, 0.0818191910428158}) {
    for (const double sign : {1.0, -1.0}) {
      const Cone cone(e, 0.01, sign * 0.4, sign * 0.5, sign * 0.7);
      Points in(300);
      for (auto& p : in) p = {0.01 + lon(random), lat(random), 12};
      Points out = in;
      cone.forward(in, out);
      cone.inverse(out, out);
      for (std::size_t i = 0; i < in.size(); ++i) {
        expect_near(out[i], in[i].x, in[i].y, 12, e == 0 ? 1e-14 : kSeriesGap);
      }
    }
  }
}

TEST(EquidistantConic, ManyPoints) {
  // No bound but the count's own.
  const Cone cone(0, 0, 0.4, 0.5, 0.7);
  Points p(40000, CoordinateTriple{0.3, 0.6, 1});
  Points scale = p;
  cone.forward(p, p);
  expect_near(p[39999], p[0].x, p[0].y, 0);
  cone.inverse(p, p);
  expect_near(p[39999], 0.3, 0.6, 1, 1e-15);
  cone.scale(1, scale, scale);
  EXPECT_EQ(scale[39999].x, scale[0].x);
}

TEST(EquidistantConic, ScaleIsTheDerivative) {
  const double e = 0.0818191910428158;
  const double step = 1e-5;
  const Cone cone(e, 0, 0.4, 0.5, 0.7);
  for (double lat = -1.4; lat < 1.41; lat += 0.35) {
    Points p = {{0.4 - step, lat, 0}, {0.4 + step, lat, 0}};
    cone.forward(p, p);
    const double radius = std::cos(lat) / std::sqrt(1 - e * e * std::sin(lat) * std::sin(lat));
    const double k = std::hypot(p[1].x - p[0].x, p[1].y - p[0].y) / (2 * step) / radius;
    Points out = untouched(1);
    cone.scale(2, {{0.4, lat, 0}}, out);
    EXPECT_NEAR(out[0].x / (2 * k), 1, 1e-9);
    EXPECT_EQ(out[0].y, 2);
    EXPECT_EQ(out[0].z, out[0].x);  // 2 k, not 4 k
  }
  Points out = untouched(2);
  cone.scale(1, {{0, 0.5, 0}, {0, 0.7, 0}}, out);
  EXPECT_NEAR(out[0].x, 1, 1e-14);
  EXPECT_NEAR(out[1].x, 1, 1e-14);
  cone.scale(1, {{0, kPi / 2, 0}}, out);
  EXPECT_GT(out[0].x, 1e14);  // no guard at the pole
}

TEST(EquidistantConic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  // At e^2 = 0.0004 the terms in e^8 are below 2e-14.  On the earth's ellipsoid n, a quotient of
  // short arcs, is some 5e-10 off.
  const struct {
    std::string ellipsoid;
    double a, e, tolerance;
  } ellipsoids[] = {{" +a=1 +es=0.0004", 1, 0.02, 1e-12},
                    {" +ellps=GRS80", Ellipsoid::grs80().a, Ellipsoid::grs80().e, 3e-9}};
  const struct {
    std::string definition;
    double lat0, lat1, lat2;
  } cones[] = {{"+proj=eqdc +lon_0=10 +lat_0=40 +lat_1=43 +lat_2=62", 40, 43, 62},
               {"+proj=eqdc +lon_0=10 +lat_0=-5 +lat_1=-20 +lat_2=-50", -5, -20, -50}};
  for (const auto& [ellipsoid, a, e, tolerance] : ellipsoids) {
    for (const auto& c : cones) {
      const ProjPeer peer(c.definition + ellipsoid);
      ASSERT_TRUE(peer.ok());
      const Cone cone(e, degrees(10), degrees(c.lat0), degrees(c.lat1), degrees(c.lat2));
      for (double lat = -80; lat < 85; lat += 10) {
        for (double lon = -150; lon < 180; lon += 37) {
          const Points in = {{degrees(lon), degrees(lat), 0}};
          Points out = in;
          cone.forward(in, out);
          const CoordinateTriple expected = peer.forward(in[0]);
          expect_near(out[0], expected.x / a, expected.y / a, tolerance);
          cone.inverse({{expected.x / a, expected.y / a, 0}}, out);
          expect_near(out[0], in[0].x, in[0].y, tolerance);
        }
      }
    }
  }
#endif
}

}  // namespace
