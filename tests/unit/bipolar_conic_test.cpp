#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

struct Bipolar {
  double lon_a = kUntouched, lat_a = kUntouched, lat_b = kUntouched, ab = kUntouched,
         z1 = kUntouched, z2 = kUntouched, fe = kUntouched, fn = kUntouched, lon_c = kUntouched,
         lat_c = kUntouched;
  double lon_b = kUntouched, n = kUntouched, k = kUntouched, f = kUntouched, az_ab = kUntouched,
         az_ba = kUntouched, t = kUntouched, rho_c = kUntouched, z_c = kUntouched,
         az_c = kUntouched;

  Bipolar() {
    TWstatus status = 0;
    TWbipocc_param(&lon_a, &lat_a, &lat_b, &ab, &z1, &z2, &fe, &fn, &lon_c, &lat_c, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWbipocc_c(lon_a, lat_a, lat_b, ab, z1, z2, &lon_b, &n, &k, &f, &az_ab, &az_ba, &t, &rho_c,
               &z_c, &az_c, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }

  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWbipocc_f(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, kNaN, kNaN, t, rho_c, ab, f,
               static_cast<int32_t>(in.size()), out.data(), in.data(), &status);
    return status;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWbipocc_i(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, t, rho_c, ab, f, lon_c,
               static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    return status;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus status = 0;
    TWbipocc_s(kNaN, kNaN, k0, lon_a, lat_a, lon_b, lat_b, n, f, az_ba,
               static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    return status;
  }
};

double cos_arc(const CoordinateTriple& p, double lon, double lat) {
  return std::sin(p.y) * std::sin(lat) + std::cos(p.y) * std::cos(lat) * std::cos(p.x - lon);
}

TEST(BipolarConic, ParametersAndConstants) {
  const Bipolar b;
  EXPECT_DOUBLE_EQ(b.lon_a, degrees(-110));
  EXPECT_DOUBLE_EQ(b.lat_a, degrees(-20));
  EXPECT_DOUBLE_EQ(b.lat_b, degrees(45));
  EXPECT_DOUBLE_EQ(b.ab, degrees(104));
  EXPECT_DOUBLE_EQ(b.z1, degrees(31));
  EXPECT_DOUBLE_EQ(b.z2, degrees(73));
  EXPECT_EQ(b.fe, 0);
  EXPECT_EQ(b.fn, 0);
  EXPECT_EQ(b.lon_c, -1.274729117388117);
  EXPECT_EQ(b.lat_c, 0.3010252384799973);
  // Snyder 1987, p. 119: the figures for the map of the Americas.
  EXPECT_NEAR(b.lon_b, -degrees(19, 59, 36), degrees(0, 0, 0.6));
  EXPECT_NEAR(b.n, 0.63056, 5e-6);
  EXPECT_NEAR(b.f * b.k, 1.89725, 6e-6);  // Snyder's figures have the central scale in them
  EXPECT_NEAR(b.k, 1.03462, 6e-6);
  EXPECT_NEAR(b.az_ab, degrees(46.78203), degrees(6e-6));
  EXPECT_NEAR(b.az_ba, degrees(104.42834), degrees(6e-6));
  EXPECT_NEAR(b.t, 1.27247, 6e-6);
  EXPECT_NEAR(b.rho_c * b.k, 1.20709, 6e-6);
  EXPECT_NEAR(b.z_c, degrees(52.03888), degrees(6e-6));
  EXPECT_NEAR(b.az_c, degrees(45.81997), degrees(6e-6));
}

TEST(BipolarConic, RoundTripOnBothSides) {
  const Bipolar b;
  std::mt19937 random(1);
  std::uniform_real_distribution<double> lon(-170, -30), lat(-55, 75);
  Points in;
  while (in.size() < 400) {
    const CoordinateTriple p = {degrees(lon(random)), degrees(lat(random)), 3};
    // In the last half degree of the reach the inverse already refuses what the forward maps.
    if (cos_arc(p, b.lon_a, b.lat_a) > -0.26 && cos_arc(p, b.lon_b, b.lat_b) > -0.26) {
      in.push_back(p);
    }
  }
  Points out(400, CoordinateTriple{0, 0, 7});
  EXPECT_EQ(b.forward(in, out), TW_SUCCESS);
  Points back(400, CoordinateTriple{0, 0, 8});
  EXPECT_EQ(b.inverse(out, back), TW_SUCCESS);
  int a_side = 0;
  for (std::size_t i = 0; i < in.size(); ++i) {
    EXPECT_EQ(out[i].z, 7);
    // the inverse iterates its radius to 1e-10
    expect_near(back[i], in[i].x, in[i].y, 8, 2e-9 / std::cos(in[i].y));
    if (-(std::cos(b.az_c) * out[i].x) + std::sin(b.az_c) * out[i].y < 0) ++a_side;
  }
  EXPECT_GT(a_side, 50);
  EXPECT_LT(a_side, 350);
}

TEST(BipolarConic, ScaleIsThatOfEitherCone) {
  const Bipolar b;
  // Off the strip along the line of poles, where the two conics join, the map is conformal.
  for (const auto& p : Points{{degrees(-70), degrees(-30), 0},
                              {degrees(-110), degrees(45), 0},
                              {degrees(-60), degrees(-5), 0},
                              {degrees(-150), degrees(60), 0}}) {
    const double h = 1e-5;
    Points cross = {{p.x - h, p.y, 0}, {p.x + h, p.y, 0}, {p.x, p.y - h, 0}, {p.x, p.y + h, 0}};
    ASSERT_EQ(b.forward(cross, cross), TW_SUCCESS);
    const double k =
        std::hypot(cross[1].x - cross[0].x, cross[1].y - cross[0].y) / (2 * h * std::cos(p.y));
    const double m = std::hypot(cross[3].x - cross[2].x, cross[3].y - cross[2].y) / (2 * h);
    Points scale = {p};
    EXPECT_EQ(b.scale(2, scale, scale), TW_SUCCESS);
    EXPECT_NEAR(scale[0].x, 2 * k, 1e-8);
    EXPECT_NEAR(scale[0].y, 2 * m, 1e-8);
    EXPECT_NEAR(scale[0].z, scale[0].x * scale[0].x, 1e-15);
  }
}

TEST(BipolarConic, BeyondTheReach) {
  const Bipolar b;
  // The antipode of B is 180 degrees from it; 60 E is out of the reach of both poles.
  const Points in = {{degrees(-90), degrees(20), 0},
                     {degrees(60), degrees(-40), 0},
                     {degrees(-100), degrees(30), 0}};
  Points out = untouched(3);
  EXPECT_EQ(b.forward(in, out), TW_NOT_CONVERGED);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  EXPECT_EQ(b.scale(1.5, in, out), TW_I_LATITUDE_LIMITED);
  EXPECT_NE(out[0].x, 1.5);
  expect_near(out[1], 1.5, 1.5, 2.25, 0);  // filled
  EXPECT_NE(out[2].x, 1.5);                // and the loop goes on
  // Both sides of the limit: along the meridian of B southward, an arc of acos(-0.27531253).
  const double arc = std::acos(-0.27531253);
  for (const double side : {-1e-9, 1e-9}) {
    Points p = {{b.lon_b + kPi, kPi - b.lat_b - arc - side, 0}};  // over the north pole
    Points q = untouched(1);
    EXPECT_EQ(b.forward(p, q), side < 0 ? TW_SUCCESS : TW_NOT_CONVERGED);
  }
}

TEST(BipolarConic, InverseBeyondTheMap) {
  const Bipolar b;
  Points in = {{0.1, 0.1, 0}, {50, 50, 0}, {0.1, 0.1, 0}};
  Points out = untouched(3);
  EXPECT_EQ(b.inverse(in, out), TW_NOT_CONVERGED);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
}

TEST(BipolarConic, ThePoleHasTheLongitudeOfTheCentre) {
  const Bipolar b;
  // The inverse is good to 1e-10 and its limit is 4.8e-6 of arc.
  Points p = {{0.3, kPi / 2, 0}, {0.3, kPi / 2 - 4.7e-6, 0}, {-1.9, kPi / 2 - 5e-6, 0}};
  EXPECT_EQ(b.forward(p, p), TW_SUCCESS);
  EXPECT_EQ(b.inverse(p, p), TW_SUCCESS);
  EXPECT_EQ(p[0].x, b.lon_c);
  EXPECT_EQ(p[1].x, b.lon_c);
  EXPECT_NEAR(p[2].x, -1.9, 1e-3);
}

TEST(BipolarConic, AtThePoleBItself) {
  // Both arguments of the azimuth are 0 (or all but): the point is the apex of B's cone.
  const Bipolar b;
  Points p = {{b.lon_b, b.lat_b, 0}};
  EXPECT_EQ(b.forward(p, p), TW_SUCCESS);
  // The apex lies rho_c from the centre on the axis, turned by az_c.
  EXPECT_NEAR(std::hypot(p[0].x, p[0].y), b.rho_c, 1e-9);
}

TEST(BipolarConic, NotANumberAndNothingToDo) {
  const Bipolar b;
  Points p = {{kNaN, 0.3, 0}};
  EXPECT_EQ(b.forward(p, p), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(p[0].x));
  EXPECT_EQ(b.inverse(p, p), TW_SUCCESS);
  Points none, out = untouched(1);
  EXPECT_EQ(b.forward(none, out), TW_SUCCESS);
  EXPECT_EQ(b.inverse(none, out), TW_SUCCESS);
  EXPECT_EQ(b.scale(1, none, out), TW_SUCCESS);
  expect_untouched(out[0]);
}

TEST(BipolarConic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const auto azimuth = [](const CoordinateTriple& from, const CoordinateTriple& to) {
    const double d = to.x - from.x;
    return std::atan2(
        std::sin(d) * std::cos(to.y),
        std::cos(from.y) * std::sin(to.y) - std::sin(from.y) * std::cos(to.y) * std::cos(d));
  };
  const ProjPeer peer("+proj=bipc +ns +R=1 +lon_0=0");
  ASSERT_TRUE(peer.ok());
  const Bipolar b;
  int compared = 0;
  for (double lon = -160; lon < -35; lon += 12.5) {
    for (double lat = -50; lat < 75; lat += 12.5) {
      Points p = {{degrees(lon), degrees(lat), 0}};
      // In the strip between the cones PROJ 9 takes the half arc itself in place of its tangent.
      const double at_b = -azimuth({b.lon_b, b.lat_b, 0}, p[0]);
      const double w =
          at_b <= b.az_ba ? b.az_ba - at_b : b.az_ab - azimuth({b.lon_a, b.lat_a, 0}, p[0]);
      if (std::fabs(w * b.n) < 0.5) continue;
      const auto expected = peer.forward(p[0]);
      if (!std::isfinite(expected.x)) continue;  // PROJ ends at 104 degrees from a pole
      if (b.forward(p, p) == TW_NOT_CONVERGED) continue;
      ++compared;
      // PROJ's constants, with 20 printed digits, have the central scale in them.
      expect_near(p[0], expected.x / b.k, expected.y / b.k, 1e-13);
    }
  }
  EXPECT_GT(compared, 20);
#endif
}

}  // namespace
