#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Perspective {
  double a, e, lon0, lat0, h0, h, p = kUntouched, phi_g = kUntouched;
  double tilt_a = 0, tilt_b = 0, rot = kPi;

  Perspective(Ellipsoid ellipsoid, double lon, double lat, double height, double surface = 0)
      : a(ellipsoid.a), e(ellipsoid.e), lon0(lon), lat0(lat), h0(surface), h(height) {
    TWstatus status = 0;
    TWpersp_c(a, e, lat0, h, h0, &p, &phi_g, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWpersp_vert_f(a, e, lon0, lat0, kNaN, h, p, phi_g, static_cast<int32_t>(in.size()), in.data(),
                   out.data(), &status);
    return status;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWpersp_vert_i(a, e, lon0, lat0, kNaN, h, p, phi_g, static_cast<int32_t>(in.size()), in.data(),
                   out.data(), &status);
    return status;
  }
  TWstatus tilted(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWpersp_f(a, e, lon0, lat0, kNaN, h, p, phi_g, tilt_a, tilt_b, rot,
              static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    return status;
  }
  TWstatus untilted(Points& in, Points& out) const {
    TWstatus status = 0;
    TWpersp_i(a, e, lon0, lat0, kNaN, h, p, phi_g, tilt_a, tilt_b, rot,
              static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    return status;
  }
  CoordinateTriple forward(const CoordinateTriple& in) const {
    Points out = untouched(1);
    EXPECT_EQ(forward(Points{in}, out), TW_SUCCESS);
    return out[0];
  }
  CoordinateTriple inverse(const CoordinateTriple& in) const {
    Points out = untouched(1);
    EXPECT_EQ(inverse(Points{in}, out), TW_SUCCESS);
    return out[0];
  }
};

TEST(Perspective, EllipsoidalExample) {
  // EPSG Guidance Note 7-2, vertical perspective: WGS 84, 5900 km above 55 N 5 E at 200 m.
  const Ellipsoid wgs84 = Ellipsoid::wgs84();
  const Perspective v(wgs84, degrees(5), degrees(55), 5900e3, 200);
  const CoordinateTriple in = {degrees(2, 7, 46.38), degrees(53, 48, 33.82), 73};
  const CoordinateTriple out = v.forward(in);
  expect_near(out, -188878.767 / wgs84.a, -128550.090 / wgs84.a, 6e-4 / wgs84.a);
  EXPECT_EQ(out.z, 73);
  expect_near(v.inverse(out), in.x, in.y, 1e-13);
}

// The point of perspective and a point of the ground in geocentric space, seen in the axes of the
// origin: what a camera straight above would draw on the plane at distance h.
CoordinateTriple camera(const Perspective& v, const CoordinateTriple& in) {
  const auto geocentric = [&](double lon, double lat, double height) {
    const double n = v.a / std::sqrt(1 - std::pow(v.e * std::sin(lat), 2));
    return std::array<double, 3>{(n + height) * std::cos(lat) * std::cos(lon),
                                 (n + height) * std::cos(lat) * std::sin(lon),
                                 ((1 - v.e * v.e) * n + height) * std::sin(lat)};
  };
  const auto eye = geocentric(v.lon0, v.lat0, v.h0 + v.h);
  const auto ground = geocentric(in.x, in.y, in.z);
  const double sl = std::sin(v.lon0), cl = std::cos(v.lon0), sp = std::sin(v.lat0),
               cp = std::cos(v.lat0);
  const double d[3] = {ground[0] - eye[0], ground[1] - eye[1], ground[2] - eye[2]};
  const double east = -sl * d[0] + cl * d[1];
  const double north = -sp * cl * d[0] - sp * sl * d[1] + cp * d[2];
  const double down = -(cp * cl * d[0] + cp * sl * d[1] + sp * d[2]);
  return {east * v.h / down / v.a, north * v.h / down / v.a, in.z};
}

TEST(Perspective, AsACameraWouldSeeIt) {
  for (const Ellipsoid& ellipsoid :
       {Ellipsoid{6371e3, 0}, Ellipsoid::wgs84(), Ellipsoid{2, 0.12}}) {
    for (const double lat0 : {0.0, 0.7, -1.2}) {
      const double unit = ellipsoid.a;
      const Perspective v(ellipsoid, 0.3, lat0, 0.4 * unit, 0.01 * unit);
      for (const double height : {0.0, 0.02 * unit, -0.005 * unit}) {
        for (const double d : {-0.3, 0.0, 0.4}) {
          const CoordinateTriple in = {0.3 + d, lat0 + 0.2 - d, height};
          const CoordinateTriple expected = camera(v, in);
          const CoordinateTriple out = v.forward(in);
          expect_near(out, expected.x, expected.y, 2e-15);
          EXPECT_EQ(out.z, height);
          const CoordinateTriple back = v.inverse(out);
          expect_near(back, in.x, in.y, 1e-11);
          EXPECT_EQ(back.z, height);
        }
      }
    }
  }
}

TEST(Perspective, ConstantsThatDoNotSettle) {
  // A centre distance that the asin cannot take is not a number, which is not above the limit.
  double p = kUntouched, phi_g = kUntouched;
  TWstatus status = 0;
  TWpersp_c(1, 0.8, 0.7, -1.35, 0, &p, &phi_g, &status);
  EXPECT_NE(p, kUntouched);
  EXPECT_NE(phi_g, kUntouched);
  // A point of perspective not far above the centre, with a large eccentricity, is still moving
  // after ten passes: the values stand.
  p = phi_g = kUntouched;
  TWpersp_c(1, 0.8, 0.7, -0.3, 0, &p, &phi_g, &status);
  EXPECT_EQ(status, TW_BAD_PARAMETER);
  EXPECT_NE(p, kUntouched);
  EXPECT_NE(phi_g, kUntouched);
}

TEST(Perspective, ConstantsOfTheEllipsoid) {
  // P and phi_g are the polar coordinates of the point of perspective in the meridian plane.
  const Ellipsoid wgs84 = Ellipsoid::wgs84();
  for (const double lat0 : {0.0, 0.7, -1.5}) {
    const Perspective v(wgs84, 0, lat0, 500e3, 200);
    const double n = 1 / std::sqrt(1 - std::pow(wgs84.e * std::sin(lat0), 2));
    const double h = 500200 / wgs84.a;
    const double x = (n + h) * std::cos(lat0);
    const double z = (n * (1 - wgs84.e * wgs84.e) + h) * std::sin(lat0);
    EXPECT_NEAR(v.p, std::hypot(x, z), 1e-14);
    EXPECT_NEAR(v.phi_g, std::atan2(z, x), 1e-14);
  }
}

TEST(Perspective, SphereStopsAtTheHorizon) {
  // From a radius above the surface the horizon is 60 degrees away.
  const Perspective v({1, 0}, 0, 0, 1);
  EXPECT_EQ(v.p, 2);
  const Points in = {{degrees(59.999999), 0, 5}, {degrees(60.000001), 0, 5}, {0.1, 0, 5}};
  Points out = untouched(3);
  EXPECT_EQ(v.forward(in, out), TW_NOT_CONVERGED);
  EXPECT_EQ(out[0].z, 5);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  // A cosine of exactly 1/P passes.
  const Perspective near({1, 0}, 0, 0, 0);
  EXPECT_EQ(near.forward(Points{{0, 0, 0}}, out), TW_SUCCESS);
  // The ellipsoid draws what lies behind.
  const Perspective w({1, 0.08}, 0, 0, 1);
  out = untouched(2);
  EXPECT_EQ(w.forward({{2, 0, 5}, {0.1, 0, 5}}, out), TW_SUCCESS);
  EXPECT_NE(out[0].x, kUntouched);
  // A failing vertical perspective is neither tilted nor turned.
  Perspective tilted = v;
  tilted.tilt_b = 0.3;
  tilted.rot = 1;
  Points upright = untouched(3);
  EXPECT_EQ(v.forward(in, upright), TW_NOT_CONVERGED);
  out = untouched(3);
  EXPECT_EQ(tilted.tilted(in, out), TW_NOT_CONVERGED);
  EXPECT_EQ(out[0].x, upright[0].x);
  EXPECT_EQ(out[0].y, upright[0].y);
  expect_untouched(out[2]);
}

TEST(Perspective, PassesThatRunOut) {
  for (const double e : {0.0, 0.08}) {
    const Perspective v({1, e}, 0, 0.5, 1);
    // Outside the disc there is no point of the surface: a square root of less than nothing.  With
    // a height the passes never end by themselves.
    Points out = untouched(3);
    EXPECT_EQ(v.inverse({{5, 5, 0.1}, {0.1, 0.1, 0}, {5, 5, 0}}, out), TW_I_LATITUDE_LIMITED);
    EXPECT_TRUE(std::isnan(out[0].x));
    EXPECT_EQ(out[0].z, 0.1);
    EXPECT_TRUE(std::isfinite(out[1].x));
    // A height of exactly 0 ends in the first pass, and is never too many.
    EXPECT_EQ(v.inverse({{5, 5, 0}, {0.1, 0.1, 0}}, out), TW_SUCCESS);
    EXPECT_TRUE(std::isnan(out[0].x));
  }
}

TEST(Perspective, TiltedPlaneInSpace) {
  // A ray from the eye at (0, 0, h) through the point of the level plane meets a plane that is
  // tilted about the axis at tilt_a through the origin.
  Perspective v({1, 0}, 0.3, 0.6, 0.5);
  v.tilt_a = 0.4;
  v.tilt_b = 0.25;
  const Points in = {{0.5, 0.7, 0}, {0.2, 0.5, 0}, {0.3, 0.4, 0.01}};
  Points level = untouched(3), out = untouched(3);
  EXPECT_EQ(v.forward(in, level), TW_SUCCESS);
  EXPECT_EQ(v.tilted(in, out), TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) {
    // In-plane axes of the tilted plane: u = (cos a, -sin a, 0), w = (sin a cos b, cos a cos b, sin
    // b).
    const double sa = std::sin(0.4), ca = std::cos(0.4), sb = std::sin(0.25), cb = std::cos(0.25);
    const double normal[3] = {-sa * sb, -ca * sb, cb};
    const double ray[3] = {level[i].x, level[i].y, -v.h};
    const double t =
        -(normal[2] * v.h) / (normal[0] * ray[0] + normal[1] * ray[1] + normal[2] * ray[2]);
    const double at[3] = {t * ray[0], t * ray[1], v.h + t * ray[2]};
    EXPECT_NEAR(out[i].x, ca * at[0] - sa * at[1], 1e-15);
    EXPECT_NEAR(out[i].y, sa * cb * at[0] + ca * cb * at[1] + sb * at[2], 1e-15);
    EXPECT_EQ(out[i].z, in[i].z);
  }
}

TEST(Perspective, Rotation) {
  Perspective v({1, 0.08}, 0.3, 0.6, 0.5);
  const Points in = {{0.5, 0.7, 0}};
  Points level = untouched(1), out = untouched(1);
  v.forward(in, level);
  for (const double rot : {kPi, -kPi, kPi + 0.9e-12}) {
    v.rot = rot;
    EXPECT_EQ(v.tilted(in, out), TW_SUCCESS);
    EXPECT_EQ(out[0].x, level[0].x);
    EXPECT_EQ(out[0].y, level[0].y);
  }
  v.rot = kPi + 1.2e-12;
  v.tilted(in, out);
  EXPECT_NE(out[0].x, level[0].x);
  v.rot = 0;  // turns by half a turn
  v.tilted(in, out);
  expect_near(out[0], -level[0].x, -level[0].y, 1e-16);
  v.rot = kPi + kPi / 2;  // a quarter turn clockwise
  v.tilted(in, out);
  expect_near(out[0], level[0].y, -level[0].x, 1e-16);
  // One angle of tilt alone is a tilt: by tilt_a the image turns counter-clockwise.
  v.rot = kPi;
  v.tilt_a = kPi / 2;
  v.tilted(in, out);
  expect_near(out[0], -level[0].y, level[0].x, 1e-16);
}

TEST(Perspective, InverseChangesItsInput) {
  Perspective v({1, 0.08}, 0.3, 0.6, 0.5);
  v.rot = 1;
  const Points in = {{0.5, 0.7, 0.01}};
  Points image = untouched(1), level = untouched(1), out = untouched(1);
  v.forward(in, level);
  v.tilted(in, image);
  const CoordinateTriple before = image[0];
  EXPECT_EQ(v.untilted(image, out), TW_SUCCESS);
  expect_near(out[0], in[0].x, in[0].y, 0.01, 1e-12);
  // The rotation has been taken off the input itself.
  expect_near(image[0], level[0].x, level[0].y, 0.01, 1e-15);
  EXPECT_NE(image[0].x, before.x);
  // A second call turns it once more, and answers otherwise.
  EXPECT_EQ(v.untilted(image, out), TW_SUCCESS);
  EXPECT_GT(std::fabs(out[0].x - in[0].x), 0.01);
  // Without a rotation the input stays, also when it is tilted.
  v.rot = -kPi;
  v.tilt_b = 0.2;
  v.tilted(in, image);
  const CoordinateTriple kept = image[0];
  EXPECT_EQ(v.untilted(image, out), TW_SUCCESS);
  EXPECT_EQ(image[0].x, kept.x);
  EXPECT_EQ(image[0].y, kept.y);
  expect_near(out[0], in[0].x, in[0].y, 0.01, 1e-12);
}

TEST(Perspective, TiltedRoundTripInPlace) {
  std::mt19937 random(23);
  std::uniform_real_distribution<double> offset(-0.2, 0.2), angle(-3, 3), height(0, 0.01);
  for (const double e : {0.0, 0.0818}) {
    for (int turn = 0; turn < 20; ++turn) {
      Perspective v({1, e}, 0.3, 0.6, 0.3);
      v.tilt_a = angle(random);
      v.tilt_b = angle(random) / 10;
      v.rot = angle(random);
      Points in(50);
      for (auto& q : in) q = {0.3 + offset(random), 0.6 + offset(random), height(random)};
      Points out = in;
      EXPECT_EQ(v.tilted(out, out), TW_SUCCESS);
      EXPECT_EQ(v.untilted(out, out), TW_SUCCESS);
      // The passes of the inverse end at 1e-12.
      for (std::size_t i = 0; i < in.size(); ++i) {
        expect_near(out[i], in[i].x, in[i].y, in[i].z, 2e-11);
      }
    }
  }
}

TEST(Perspective, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer level("+proj=nsper +R=6371000 +h=2000000 +lon_0=12 +lat_0=40");
  const ProjPeer tilted("+proj=tpers +R=6371000 +h=2000000 +lon_0=12 +lat_0=40 +azi=20 +tilt=10");
  ASSERT_TRUE(level.ok());
  ASSERT_TRUE(tilted.ok());
  const Perspective v({6371000, 0}, degrees(12), degrees(40), 2e6);
  // The peer's azimuth turns the image, its tilt foreshortens it.
  Perspective t = v;
  t.tilt_a = degrees(20);
  t.tilt_b = degrees(10);
  for (double lat = 25; lat < 60; lat += 7) {
    for (double lon = -5; lon < 30; lon += 7) {
      const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
      CoordinateTriple expected = level.forward(in);
      expect_near(v.forward(in), expected.x / v.a, expected.y / v.a, 1e-15);
      expected = tilted.forward(in);
      Points out = untouched(1);
      EXPECT_EQ(t.tilted({in}, out), TW_SUCCESS);
      EXPECT_NEAR(std::hypot(out[0].x, out[0].y), std::hypot(expected.x, expected.y) / v.a, 1e-14);
    }
  }
#endif
}

}  // namespace
