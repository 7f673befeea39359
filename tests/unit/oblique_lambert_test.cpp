#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"
#include "tidewater/lines.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

struct Cone {
  double e, lon0, lat0, d1, d2;
  double azimuth = kNaN;
  uint32_t use_azimuth = 0;
  double pole_lon = kUntouched, pole_lat = kUntouched;
  double turn = 0;
  double lat_r = kUntouched, s_lon = kUntouched, s_lat = kUntouched, offset = kUntouched,
         c = kUntouched, n = kUntouched, rho0 = kUntouched, g_c = kUntouched, g_t = kUntouched;

  TWstatus set_up(bool krovak = false) {
    TWstatus status = 0;
    const auto call = krovak ? TWkrovak_c : TWo_lam_c;
    call(e, lon0, lat0, d1, d2, azimuth, use_azimuth, &pole_lon, &pole_lat, &lat_r, &s_lon, &s_lat,
         &offset, &c, &n, &rho0, &g_c, &g_t, &status);
    return status;
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWo_lam_f(e, lon0, lat_r, c, n, rho0, s_lon, s_lat, turn, offset, g_c, g_t,
              static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    return status;
  }
  TWstatus inverse(Points& in, Points& out) const {
    TWstatus status = 0;
    TWo_lam_i(e, lon0, lat_r, c, n, rho0, s_lon, s_lat, turn, offset, g_c, g_t,
              static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    return status;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus status = 0;
    TWo_lam_s(e, k0, lon0, lat_r, c, n, s_lon, s_lat, offset, g_c, g_t,
              static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    return status;
  }
};

const double kE = Ellipsoid::bessel_1841().e;

Cone oblique(double e) {
  Cone cone = {e, 0.3, 0.8, -0.05, 0.07};
  cone.azimuth = 0.6;
  cone.use_azimuth = 1;
  return cone;
}

TEST(ObliqueLambert, AnUprightConeIsTheLambertConic) {
  // On the sphere with the cone's pole at the geographic pole nothing is turned.
  Cone cone = {0, 0.3, 0.8, -0.05, 0.07};
  cone.pole_lon = 0.3;
  cone.pole_lat = kPi / 2;
  EXPECT_EQ(cone.set_up(), TW_SUCCESS);
  EXPECT_EQ(cone.g_c, kUntouched);  // not written for the sphere
  EXPECT_EQ(cone.g_t, kUntouched);
  EXPECT_EQ(cone.s_lon, 0.3);
  EXPECT_EQ(cone.s_lat, kPi / 2);
  EXPECT_NEAR(cone.lat_r, 0.8, 1e-15);
  double c = 0, n = 0, rho0 = 0;
  TWstatus status = 0;
  TWlam_c(0, 0.3, cone.lat_r, cone.lat_r - 0.05, cone.lat_r + 0.07, &c, &n, &rho0, &status);
  EXPECT_EQ(cone.c, c);
  EXPECT_EQ(cone.n, n);
  EXPECT_EQ(cone.rho0, rho0);
  const Points in = {{0.1, 0.7, 1}, {0.5, 0.95, 2}};
  Points expected = in, out = in;
  TWlam_f(0, 0.3, c, n, rho0, 2, in.data(), expected.data(), &status);
  EXPECT_EQ(cone.forward(in, out), TW_SUCCESS);
  for (std::size_t i = 0; i < 2; ++i) {
    expect_near(out[i], expected[i].x, expected[i].y, expected[i].z, 0);
  }
  // Nor on the way back.
  Points given = expected, plane = expected, back = untouched(2), expected_back = untouched(2);
  EXPECT_EQ(cone.inverse(given, back), TW_SUCCESS);
  TWlam_i(0, 0.3, c, n, rho0, 2, expected_back.data(), plane.data(), &status);
  for (std::size_t i = 0; i < 2; ++i) {
    expect_near(back[i], expected_back[i].x, expected_back[i].y, 0);
    expect_near(back[i], in[i].x, in[i].y, 1e-14);
  }
  // With a pole aside of lon0, or short of the geographic one, it turns: by the offset.
  for (const bool aside : {true, false}) {
    Cone turned = cone;
    (aside ? turned.s_lon : turned.s_lat) -= 0.1;
    given = expected;
    EXPECT_EQ(turned.inverse(given, back), TW_SUCCESS);
    EXPECT_GT(std::fabs(back[0].x - in[0].x), 0.01) << aside;
  }
  // Both sides of the margin of 1e-13: a pole further off turns the graticule, by the offset.
  cone.offset = 1;
  cone.s_lat = kPi / 2 - 0.9e-13;
  cone.forward(in, out);
  EXPECT_EQ(out[0].x, expected[0].x);
  cone.s_lat = kPi / 2 - 2e-12;
  cone.forward(in, out);
  EXPECT_GT(std::fabs(out[0].x - expected[0].x), 0.1);
  cone.s_lat = kPi / 2;
  cone.s_lon = 0.3 + 2e-13;
  Points moved = in;
  EXPECT_EQ(cone.forward(in, moved), TW_SUCCESS);  // TWrotgrat_f() copies at a pole
  EXPECT_EQ(moved[0].x, expected[0].x);
}

TEST(ObliqueLambert, PoleFromAnAzimuth) {
  Cone cone = oblique(0);
  EXPECT_EQ(cone.set_up(), TW_SUCCESS);
  // As far from the origin as the geographic pole, along the azimuth.
  CoordinateTriple pole = {};
  double back = 0;
  TWstatus status = 0;
  TWgeodesic_dir({0.3, 0.8, 0}, 0.6, kPi / 2 - 0.8, 1, 0, &pole, &back, &status);
  EXPECT_NEAR(cone.pole_lon, pole.x, 1e-15);
  EXPECT_NEAR(cone.pole_lat, pole.y, 1e-15);
  EXPECT_NEAR(cone.lat_r, 0.8, 1e-14);
  // In the south it is as far as the south pole.
  Cone south = oblique(kE);
  south.lat0 = -0.8;
  south.set_up();
  double azimuth = 0, distance = 0, quarter = 0, arc = 0;
  // (in metres: on a unit ellipsoid the inverse iteration ends too soon)
  TWgeodesic_inv({0.3, -0.8, 0}, {south.pole_lon, south.pole_lat, 0}, 6e6, kE, &azimuth, &back,
                 &distance, &status);
  TWmerid_dist_f(1, kE, kPi / 2, &quarter, &status);
  TWmerid_dist_f(1, kE, 0.8, &arc, &status);
  EXPECT_NEAR(azimuth, 0.6, 1e-9);
  EXPECT_NEAR(distance / 6e6, quarter - arc, 2e-11);
  // An origin at a pole is its own pole.
  for (const double sign : {1.0, -1.0}) {
    Cone at = oblique(0);
    at.lat0 = sign * (kPi / 2 - 0.9e-12);
    at.set_up();
    EXPECT_EQ(at.pole_lon, 0.3);
    EXPECT_EQ(at.pole_lat, sign * kPi / 2);
    at.lat0 = sign * (kPi / 2 - 3e-12);
    at.set_up();
    EXPECT_NE(at.pole_lon, 0.3);
  }
}

// The sphere is that of the middle parallel; where that would lie beyond a pole, of the origin.
TEST(ObliqueLambert, SphereOfAMiddleParallelBeyondThePole) {
  for (const double sign : {1.0, -1.0}) {
    for (const double spread : {0.3, 0.5}) {
      Cone cone = {kE, 0.3, sign * 1.2, sign * spread, sign * spread};
      cone.pole_lon = 0.4;
      cone.pole_lat = 1;
      cone.set_up();
      double chi0 = 0, c = 0, t = 0, radius = 0;
      TWstatus status = 0;
      TWgaussII_c(kE, spread < 0.4 ? sign * 1.5 : sign * 1.2, &chi0, &c, &t, &radius, &status);
      EXPECT_EQ(cone.g_c, c) << spread;
      EXPECT_EQ(cone.g_t, t) << spread;
    }
  }
}

TEST(ObliqueLambert, TheOriginIsOnTheAxis) {
  for (const double e : {0.0, kE}) {
    Cone cone = oblique(e);
    ASSERT_EQ(cone.set_up(), TW_SUCCESS);
    Points p = {{0.3, 0.8, 5}};
    ASSERT_EQ(cone.forward(p, p), TW_SUCCESS);
    expect_near(p[0], 0, 0, 5, 1e-12);
  }
}

TEST(ObliqueLambert, IsConformal) {
  for (const double e : {0.0, kE}) {
    Cone cone = oblique(e);
    ASSERT_EQ(cone.set_up(), TW_SUCCESS);
    for (const auto& p : Points{{0.3, 0.8, 0}, {0.1, 0.6, 0}, {0.6, 0.9, 0}}) {
      const double h = 1e-5;
      Points cross = {{p.x - h, p.y, 0}, {p.x + h, p.y, 0}, {p.x, p.y - h, 0}, {p.x, p.y + h, 0}};
      ASSERT_EQ(cone.forward(cross, cross), TW_SUCCESS);
      const double w = 1 - e * e * std::sin(p.y) * std::sin(p.y);
      const double parallel = 2 * h * std::cos(p.y) / std::sqrt(w);
      const double meridian = 2 * h * (1 - e * e) / std::pow(w, 1.5);
      const double ex = (cross[1].x - cross[0].x) / parallel;
      const double ey = (cross[1].y - cross[0].y) / parallel;
      const double nx = (cross[3].x - cross[2].x) / meridian;
      const double ny = (cross[3].y - cross[2].y) / meridian;
      // North is a quarter turn to the left of east, with the same scale.
      EXPECT_NEAR(nx, -ey, 2e-9);
      EXPECT_NEAR(ny, ex, 2e-9);
      if (e == 0) {
        Points s = {p};
        EXPECT_EQ(cone.scale(3, s, s), TW_SUCCESS);
        EXPECT_NEAR(s[0].x, 3 * std::hypot(ex, ey), 6e-9);
        EXPECT_EQ(s[0].y, s[0].x);
      }
    }
  }
}

TEST(ObliqueLambert, ScaleOnTheEllipsoidReadsRelativeLongitudes) {
  // As for the sphere's point moved by -lon0.
  Cone cone = oblique(kE);
  ASSERT_EQ(cone.set_up(), TW_SUCCESS);
  const CoordinateTriple in = {0.35, 0.75, 0};
  CoordinateTriple expected = in;
  TWstatus status = 0;
  TWgaussII_f(kE, 0.3, cone.g_c, cone.g_t, 1, &in, &expected, &status);
  TWrotgrat_f(0.3, cone.lat_r, cone.s_lon, cone.s_lat, cone.offset, 1, &expected, &expected,
              &status);
  TWlam_s(0, 1, cone.c, cone.n, 1, &expected, &expected, &status);
  Points out = untouched(1);
  EXPECT_EQ(cone.scale(1, {in}, out), TW_SUCCESS);
  expect_near(out[0], expected.x, expected.y, expected.z, 0);
}

TEST(ObliqueLambert, RoundTripAndTheChangedInput) {
  std::mt19937 random(8);
  std::uniform_real_distribution<double> unit(-0.2, 0.2);
  for (const double e : {0.0, kE}) {
    Cone cone = oblique(e);
    cone.turn = 0.7;
    ASSERT_EQ(cone.set_up(), TW_SUCCESS);
    Points in(100);
    for (auto& p : in) p = {0.3 + unit(random), 0.8 + unit(random), 2};
    Points plane = in;
    ASSERT_EQ(cone.forward(in, plane), TW_SUCCESS);
    // turn takes the plane back by that angle.
    Cone straight = cone;
    straight.turn = 0;
    Points unturned = in;
    straight.forward(in, unturned);
    expect_near(plane[0], unturned[0].x * std::cos(0.7) + unturned[0].y * std::sin(0.7),
                unturned[0].y * std::cos(0.7) - unturned[0].x * std::sin(0.7), 1e-15);
    Points out = untouched(100);
    Points given = plane;
    ASSERT_EQ(cone.inverse(given, out), TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      expect_near(out[i], in[i].x, in[i].y, 1e-12);
      EXPECT_EQ(out[i].z, kUntouched);
      expect_near(given[i], unturned[i].x, unturned[i].y, 1e-15);  // turned in place
    }
  }
}

TEST(ObliqueLambert, Failures) {
  // The conformal sphere of a disc.
  Cone disc = oblique(1);
  disc.use_azimuth = 0;
  disc.pole_lon = 0.4;
  disc.pole_lat = 1;
  EXPECT_EQ(disc.set_up(), TW_BAD_ECCENTRICITY);
  EXPECT_EQ(disc.lat_r, kUntouched);
  EXPECT_EQ(disc.c, kUntouched);
  // The pole's distance, along the meridian.
  Cone refused = oblique(1.5);
  EXPECT_EQ(refused.set_up(), TW_BAD_ECCENTRICITY);
  EXPECT_EQ(refused.pole_lon, kUntouched);
  // A cone without an opening: parallels symmetrical about the equator.
  Cone flat = {0, 0, 0.5, -0.2, 0.2};
  flat.pole_lon = 0;
  flat.pole_lat = 0.5 + kPi / 2;  // the origin comes to the equator of the turned sphere
  EXPECT_NE(flat.set_up() & 1u, 1u);
  // TWlam_f() refuses the cone's far pole and stops: what is turned on the sphere stands in out.
  Cone cone = oblique(0);
  ASSERT_EQ(cone.set_up(), TW_SUCCESS);
  Points out = untouched(2);
  const Points in = {{cone.pole_lon - kPi, -cone.pole_lat, 0}, {0.3, 0.8, 0}};
  EXPECT_EQ(cone.forward(in, out), TW_BAD_LATITUDE);
  EXPECT_NE(out[1].y, kUntouched);
}

// The published case: EPSG Guidance Note 7-2, method 9819.
Cone krovak(double e) {
  Cone cone = {e, degrees(24, 50), degrees(49, 30), 0, 0};
  cone.pole_lon = degrees(24, 50);
  cone.pole_lat = degrees(59, 45);
  return cone;
}

// Radius of the conformal sphere.
double krovak_radius() {
  const auto [a, e] = Ellipsoid::bessel_1841();
  double radius = 0;
  TWstatus status = 0;
  TWgaussian_R(a, e, degrees(49, 30), &radius, &status);
  return radius;
}

TEST(Krovak, WhatIsFixed) {
  Cone cone = krovak(kE);
  EXPECT_EQ(cone.set_up(true), TW_SUCCESS);
  EXPECT_EQ(cone.s_lat, 1.042168563805);
  EXPECT_EQ(cone.rho0, 0);
  EXPECT_NEAR(cone.n, std::sin(1.370083462816), 1e-15);
  double c = 0, n = 0, rho0 = 0;
  TWstatus status = 0;
  TWlam_c(0, 0, cone.lat_r, 1.370083462816, 1.370083462816, &c, &n, &rho0, &status);
  EXPECT_EQ(cone.c, c * 0.9999);
  // The distances of parallels choose the sphere alone.
  Cone other = krovak(kE);
  other.d1 = other.d2 = 0.01;
  other.set_up(true);
  EXPECT_EQ(other.n, cone.n);
  EXPECT_NE(other.g_c, cone.g_c);
  // On the sphere the pole is the caller's.
  Cone sphere = krovak(0);
  EXPECT_EQ(sphere.set_up(true), TW_SUCCESS);
  EXPECT_EQ(sphere.s_lat, degrees(59, 45));
  EXPECT_EQ(sphere.rho0, 0);
  // A failure comes before the last two.
  Cone bad = krovak(0);
  bad.lat0 = 5;
  EXPECT_NE(bad.set_up(true) & 1u, 1u);
  EXPECT_EQ(bad.rho0, kUntouched);
}

TEST(Krovak, PublishedExample) {
  // 50 12 32.442 N, 16 50 59.179 E: southing 1050538.63, westing 568990.997.
  Cone cone = krovak(kE);
  ASSERT_EQ(cone.set_up(true), TW_SUCCESS);
  Points p = {{degrees(16, 50, 59.179), degrees(50, 12, 32.442), 0}};
  ASSERT_EQ(cone.forward(p, p), TW_SUCCESS);
  const double r = krovak_radius();
  EXPECT_NEAR(p[0].y * r, -1050538.63, 0.02);  // 0.001 of a second is 3 cm
  EXPECT_NEAR(p[0].x * r, -568990.997, 0.02);
}

TEST(Krovak, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer(
      "+proj=krovak +lat_0=49.5 +lon_0=24.83333333333333 +alpha=30.28813972222222 +k=0.9999 "
      "+ellps=bessel");
  ASSERT_TRUE(peer.ok());
  Cone cone = krovak(kE);
  ASSERT_EQ(cone.set_up(true), TW_SUCCESS);
  const double r = krovak_radius();
  for (double lon = 12; lon < 23; lon += 1.7) {
    for (double lat = 47.5; lat < 51.5; lat += 0.9) {
      Points p = {{degrees(lon), degrees(lat), 0}};
      const auto expected = peer.forward(p[0]);
      ASSERT_EQ(cone.forward(p, p), TW_SUCCESS);
      // the fixed pole and parallel are stored to 12 decimals
      EXPECT_NEAR(p[0].x * r, expected.x, 1e-4);
      EXPECT_NEAR(p[0].y * r, expected.y, 1e-4);
    }
  }
#endif
}

}  // namespace
