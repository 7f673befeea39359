#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Double {
  double e, lon0, chi_g = kUntouched, c = kUntouched, t = kUntouched, C = kUntouched,
                  m0 = kUntouched, chi0 = kUntouched;

  Double(double eccentricity, double lon, double lat) : e(eccentricity), lon0(lon) {
    TWstatus status = 0;
    TWstereo3_c(e, lat, &chi_g, &c, &t, &C, &m0, &chi0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(m0, kUntouched);
    EXPECT_EQ(chi0, kUntouched);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWstereo3_f(e, lon0, chi_g, c, t, C, m0, chi0, static_cast<int32_t>(in.size()), in.data(),
                out.data(), &status);
    return status;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWstereo3_i(e, lon0, chi_g, c, t, C, m0, chi0, static_cast<int32_t>(in.size()), in.data(),
                out.data(), &status);
    return status;
  }
};

TEST(DoubleStereographic, OriginIsThePlanesOrigin) {
  const Double d(0.0818, 0.4, 0.8);
  Points out = untouched(1);
  EXPECT_EQ(d.forward({{0.4, 0.8, 0}}, out), TW_SUCCESS);
  expect_near(out[0], 0, 0, 3e-8);  // the rotation has the pole by an arc sine
  EXPECT_EQ(d.inverse({{0, 0, 0}}, out), TW_SUCCESS);
  expect_near(out[0], 0.4, 0.8, 1e-14);
}

TEST(DoubleStereographic, SphereIsTheObliqueStereographic) {
  const Double d(0, 0.4, 0.8);
  EXPECT_EQ(d.c, -1.0);
  double C = 0, m0 = 0, chi0 = 0;
  TWstatus status = 0;
  TWstereo_c(0, 0.8, &C, &m0, &chi0, &status);
  for (const auto& [lon, lat] : {std::pair{0.5, 0.9}, {0.1, -0.3}, {1.2, 1.2}}) {
    const CoordinateTriple in = {lon, lat, 0};
    CoordinateTriple expected = kUntouchedPoint;
    TWstereo_f(0, 0.4, 0.8, C, m0, chi0, 1, &in, &expected, &status);
    Points out = untouched(1);
    EXPECT_EQ(d.forward({in}, out), TW_SUCCESS);
    expect_near(out[0], expected.x, expected.y, 3e-15);
  }
}

TEST(DoubleStereographic, StopsWhereAStageFails) {
  // An eccentricity of one or more: the sphere has no radius, and the second stage is not run.
  double chi_g = kUntouched, c = kUntouched, t = kUntouched, C = kUntouched, m0 = kUntouched,
         chi0 = kUntouched;
  TWstatus status = 0;
  TWstereo3_c(1.0, 0.5, &chi_g, &c, &t, &C, &m0, &chi0, &status);
  EXPECT_EQ(status, TW_BAD_ECCENTRICITY);
  EXPECT_EQ(C, kUntouched);

  // A plane point that the last stage refuses: the inverse ends there, with the good points still
  // in the graticule of that stage.
  const Double d(0.0818, 0.4, 0.8);
  Points out = untouched(2);
  EXPECT_EQ(d.inverse({{kNaN, 0, 0}, {0, -2, 0}}, out), TW_NOT_CONVERGED);
  expect_untouched(out[0]);
  expect_near(out[1], 0.4, 0, 1e-15);  // rho = 2 is the equator of the sphere
}

TEST(DoubleStereographic, StatusIsThatOfTheLastStage) {
  // Latitudes beyond a pole pass the sphere's first stage; the rotation brings them back to good
  // ones, and the word stays good.
  const Double d(0.0818, 0.4, 0.8);
  Points out = untouched(1);
  EXPECT_EQ(d.forward({{0.5, 1.6, 0}}, out), TW_SUCCESS);
  EXPECT_TRUE(std::isfinite(out[0].x));
}

TEST(DoubleStereographic, PolarOrigin) {
  // The rotation leaves the graticule as it is; both turns of lon0 cancel.
  const Double d(0.0818, 0.4, kPi / 2);
  Points out = untouched(1);
  EXPECT_EQ(d.forward({{0.4 + kPi / 2, 1.3, 0}}, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].y, 0, 1e-15);
  EXPECT_GT(out[0].x, 0);
  EXPECT_EQ(d.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], 0.4 + kPi / 2, 1.3, 1e-13);
}

TEST(DoubleStereographic, RoundTripInPlace) {
  std::mt19937 random(3);
  std::uniform_real_distribution<double> lon(-1, 1), lat(-0.6, 0.6);
  for (const double e : {0.0, 0.0818, 0.2}) {
    const Double d(e, 0.3, 0.6);
    Points in(200);
    for (auto& p : in) p = {0.3 + lon(random), 0.6 + lat(random), 6};
    Points out = in;
    EXPECT_EQ(d.forward(out, out), TW_SUCCESS);
    EXPECT_EQ(d.inverse(out, out), TW_SUCCESS);
    // The rotation has latitudes by arc sines.
    for (std::size_t i = 0; i < in.size(); ++i) expect_near(out[i], in[i].x, in[i].y, 6, 1e-12);
  }
}

TEST(DoubleStereographic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const auto [a, e] = Ellipsoid::grs80();
  const ProjPeer peer("+proj=sterea +ellps=GRS80 +k_0=1 +lon_0=25 +lat_0=46");
  ASSERT_TRUE(peer.ok());
  const Double d(e, degrees(25), degrees(46));
  const double radius = std::sqrt(1 - e * e) / (1 - std::pow(e * std::sin(degrees(46)), 2));
  for (double lat = 36; lat < 60; lat += 3.7) {
    for (double lon = 15; lon < 40; lon += 4.1) {
      Points out = untouched(1);
      const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
      EXPECT_EQ(d.forward({in}, out), TW_SUCCESS);
      const CoordinateTriple expected = peer.forward(in);
      expect_near(out[0], expected.x / a / radius, expected.y / a / radius, 2e-14);
    }
  }
#endif
}

}  // namespace
