#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

TEST(Geocentric, PublishedExample) {
  // EPSG Guidance Note 7-2 (2022), 4.1.1: WGS 84, 53 48 33.820 N, 2 07 46.380 E, 73.0 m
  const auto [a, e] = Ellipsoid::wgs84();
  CoordinateTriple p = {degrees(2, 7, 46.380), degrees(53, 48, 33.820), 73.0};
  TWstatus status = 0;
  TWllh_to_xyz(a, e, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p, 3771793.968, 140253.342, 5124304.349, 6e-4);
  TWxyz_to_llh(a, e, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  // one step in closed form, not iterated
  expect_near(p, degrees(2, 7, 46.380), degrees(53, 48, 33.820), 1e-12);
  EXPECT_NEAR(p.z, 73.0, 1e-8);
}

TEST(Geocentric, AxisAndCentre) {
  const auto [a, e] = Ellipsoid::wgs84();
  const double b = a * std::sqrt(1 - e * e);
  const Points in = {{0, 0, 0}, {0, 0, -6400000}, {3e-10, -4e-10, 7000000}, {5e-10, 0, -1}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWxyz_to_llh(a, e, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 0, kPi / 2, -b, 0);
  expect_near(out[1], 0, -kPi / 2, 6400000 - b, 0);
  expect_near(out[2], 0, kPi / 2, 7000000 - b, 0);
  expect_near(out[3], 0, -kPi / 2, 1 - b, 0);
}

TEST(Geocentric, JustOffTheAxisTakesTheGeneralRoad) {
  const auto [a, e] = Ellipsoid::wgs84();
  const double b = a * std::sqrt(1 - e * e);
  const Points in = {{0, 2e-9, b + 10}, {-1e-9, 0, -b - 10}, {0, 1e-9, 1e80}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWxyz_to_llh(a, e, 3, in.data(), out.data(), &status);
  expect_near(out[0], kPi / 2, kPi / 2, 10, 1e-8);
  expect_near(out[1], kPi, -kPi / 2, 10, 1e-8);
  expect_near(out[2], kPi / 2, kPi / 2, 1e80, 1e64);
}

TEST(Geocentric, TheStatedFormulaToTheLastBits) {
  // The same single step with its auxiliary latitude formed as an angle.
  const auto [a, e] = Ellipsoid::international_1924();
  const double e2 = e * e, u = e2 * a, v = std::sqrt(1 - e2);
  std::mt19937 random(3);
  std::uniform_real_distribution<double> any(-2e7, 2e7);
  for (int i = 0; i < 1000; ++i) {
    const CoordinateTriple in = {any(random), any(random), any(random)};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWxyz_to_llh(a, e, 1, &in, &out, &status);
    const double p = std::hypot(in.x, in.y), r = std::hypot(p, in.z);
    const double beta = std::atan((1 + u / (r * v)) * (in.z * v / p));
    const double lat = std::atan((in.z + u * std::pow(std::sin(beta), 3) / v) /
                                 (p - u * std::pow(std::cos(beta), 3)));
    const double n = a / std::sqrt(1 - e2 * std::sin(lat) * std::sin(lat));
    expect_near(out, std::atan2(in.y, in.x), lat, 1e-15);
    // Heights up to 2.8e7, whose last place is 3.7e-9: four of them for two sums of products.
    EXPECT_NEAR(out.z, in.z * std::sin(lat) + p * std::cos(lat) - a * a / n, 1.5e-8);
  }
}

TEST(Geocentric, RoundTripNearTheSurface) {
  const auto [a, e] = Ellipsoid::grs80();
  std::mt19937 random(2);
  std::uniform_real_distribution<double> lon(-kPi, kPi), lat(-kPi / 2, kPi / 2), h(-5000, 20000);
  for (int i = 0; i < 1000; ++i) {
    const CoordinateTriple in = {lon(random), lat(random), h(random)};
    CoordinateTriple p = in;
    TWstatus status = 0;
    TWllh_to_xyz(a, e, 1, &p, &p, &status);
    TWxyz_to_llh(a, e, 1, &p, &p, &status);
    expect_near(p, in.x, in.y, 2e-11);  // one step, not iterated: a tenth of a millimetre
    EXPECT_NEAR(p.z, in.z, 1e-6);
  }
}

TEST(Geocentric, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=cart +ellps=bessel");
  ASSERT_TRUE(peer.ok());
  const auto [a, e] = Ellipsoid::bessel_1841();
  for (double lat = -1.5; lat < 1.5; lat += 0.3) {
    const CoordinateTriple in = {2 * lat, lat, 500};
    CoordinateTriple p = in;
    TWstatus status = 0;
    TWllh_to_xyz(a, e, 1, &p, &p, &status);
    const CoordinateTriple expected = peer.forward(in);
    expect_near(p, expected.x, expected.y, expected.z, 1e-8);
  }
#endif
}

}  // namespace
