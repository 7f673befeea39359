#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/datum.h"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

// A datum shift as its publisher tells it.
struct Shift {
  Ellipsoid source;
  double da, df, dx, dy, dz;

  void forward(const CoordinateTriple* in, CoordinateTriple* out, int32_t count,
               TWstatus* status) const {
    TWmol_std_f(source.a, source.e, da, df, dx, dy, dz, count, in, out, status);
  }
  void inverse(const CoordinateTriple* in, CoordinateTriple* out, int32_t count,
               TWstatus* status) const {
    TWmol_std_i(source.a, source.e, da, df, dx, dy, dz, count, in, out, status);
  }
  CoordinateTriple forward(CoordinateTriple p) const {
    TWstatus status = 0;
    forward(&p, &p, 1, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return p;
  }
  CoordinateTriple inverse(CoordinateTriple p) const {
    TWstatus status = 0;
    inverse(&p, &p, 1, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return p;
  }
  Ellipsoid target() const {
    const double f = 1 - std::sqrt(1 - source.e * source.e) + df;
    return {source.a + da, std::sqrt(f * (2 - f))};
  }
  // The shift that the formula approximates.
  CoordinateTriple by_geocentric(CoordinateTriple p) const {
    TWstatus status = 0;
    TWllh_to_xyz(source.a, source.e, 1, &p, &p, &status);
    p = {p.x + dx, p.y + dy, p.z + dz};
    TWxyz_to_llh(target().a, target().e, 1, &p, &p, &status);
    return p;
  }
};

// WGS 84 to ED 50: EPSG Guidance Note 7-2, geocentric translations and abridged Molodensky.
const Shift kToEd50 = {Ellipsoid::wgs84(), 251, 1.41927e-5, 84.87, 96.49, 116.95};

TEST(Molodensky, PublishedExample) {
  const auto p = kToEd50.forward({degrees(2, 7, 46.38), degrees(53, 48, 33.82), 73});
  // By the geocentric translations of the same note: 53 48 36.565, 2 7 51.477, 28.02.
  EXPECT_NEAR(p.x, degrees(2, 7, 51.477), degrees(0, 0, 0.001));
  EXPECT_NEAR(p.y, degrees(53, 48, 36.565), degrees(0, 0, 0.001));
  EXPECT_NEAR(p.z, 28.02, 0.02);
}

TEST(Molodensky, IsTheGeocentricShiftToItsSecondOrder) {
  // Second order: shift^2 / radius, some millimetres.
  std::mt19937 random(3);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.3, 1.3), height(-100, 4000);
  for (int i = 0; i < 300; ++i) {
    const CoordinateTriple in = {lon(random), lat(random), height(random)};
    const auto got = kToEd50.forward(in);
    const auto expected = kToEd50.by_geocentric(in);
    EXPECT_NEAR(got.x, expected.x, 0.02 / 6.4e6 / std::cos(in.y));
    EXPECT_NEAR(got.y, expected.y, 0.02 / 6.4e6);
    EXPECT_NEAR(got.z, expected.z, 0.02);
    // Two passes backward take most of it back.
    const auto back = kToEd50.inverse(got);
    EXPECT_NEAR(back.x, in.x, 1e-12 / std::cos(in.y));
    EXPECT_NEAR(back.y, in.y, 1e-12);
    EXPECT_NEAR(back.z, in.z, 1e-5);
  }
}

TEST(Molodensky, EachParameterByItself) {
  // At latitude 0 and longitude 0 the axes of X, Y, Z are up, east and north.
  const Ellipsoid sphere = {100, 0};
  auto shift = [&](double da, double df, double dx, double dy, double dz, CoordinateTriple p) {
    return Shift{sphere, da, df, dx, dy, dz}.forward(p);
  };
  expect_near(shift(0, 0, 1, 0, 0, {0, 0, 0}), 0, 0, 1, 1e-15);
  expect_near(shift(0, 0, 0, 1, 0, {0, 0, 0}), 0.01, 0, 0, 1e-15);
  expect_near(shift(0, 0, 0, 0, 1, {0, 0, 0}), 0, 0.01, 0, 1e-15);
  expect_near(shift(1, 0, 0, 0, 0, {0, 0, 0}), 0, 0, -1, 1e-15);
  // At height 100 the angles halve.
  expect_near(shift(0, 0, 0, 1, 0, {0, 0, 100}), 0.005, 0, 100, 1e-15);
  expect_near(shift(0, 0, 0, 0, 1, {0, 0, 100}), 0, 0.005, 100, 1e-15);
  // At longitude 90 degrees, latitude 45.
  const double s = std::sqrt(0.5);
  expect_near(shift(0, 0, 1, 0, 0, {kPi / 2, kPi / 4, 0}), kPi / 2 - 0.01 / s, kPi / 4, 0, 1e-15);
  expect_near(shift(0, 0, 0, 1, 0, {kPi / 2, kPi / 4, 0}), kPi / 2, kPi / 4 - 0.01 * s, s, 1e-15);
  // A flattening of the target: (1 + 1) cos sin df = df in latitude, sin^2 a df in height.
  expect_near(shift(0, 0.001, 0, 0, 0, {0, kPi / 4, 0}), 0, kPi / 4 + 0.001, 0.05, 1e-15);
}

TEST(Molodensky, SwitchesBeyond89Degrees) {
  const double limit = 1.5533430342749535;
  // A large shift tells the formula from the exact way.
  const Shift shift = {Ellipsoid::wgs84(), 251, 1.41927e-5, 8000, 9000, 0};
  for (const double sign : {1.0, -1.0}) {
    const CoordinateTriple at = {0.3, sign * limit, 50};
    const CoordinateTriple past = {0.3, sign * std::nextafter(limit, 2), 50};
    const auto exact = shift.by_geocentric(past);
    expect_near(shift.forward(past), exact.x, exact.y, exact.z, 0);
    const auto formula = shift.forward(at);
    EXPECT_GT(std::fabs(formula.x - exact.x), 1e-4);
    // The height's second-order term.
    EXPECT_GT(std::fabs(formula.z - exact.z), 1e-1);
    // Backward.
    const auto back = shift.inverse(past);
    const auto again = shift.by_geocentric(back);
    EXPECT_NEAR(again.x, past.x, 1e-10);
    EXPECT_NEAR(again.y, past.y, 1e-12);
    EXPECT_NEAR(again.z, past.z, 1e-6);
    EXPECT_GT(std::fabs(shift.inverse(at).x - back.x), 1e-5);
  }
}

TEST(Molodensky, TheInverseMakesTwoPasses) {
  // On a sphere at the equator with a shift along Z alone: dlat(p) = dz cos(lat) / a and
  // dh(p) = dz sin(lat), by hand in two passes.
  const Shift shift = {{1, 0}, 0, 0, 0, 0, 0.2};
  const double lat1 = 0.5 - 0.2 * std::cos(0.5) / 1;
  const double h1 = 0 - 0.2 * std::sin(0.5);
  const double lat2 = 0.5 - 0.2 * std::cos(lat1) / (1 + h1);
  const double h2 = 0 - 0.2 * std::sin(lat1);
  expect_near(shift.inverse({0, 0.5, 0}), 0, lat2, h2, 1e-15);
}

TEST(Molodensky, InPlaceAndNothingToDo) {
  Points p = {{0.1, 0.2, 30}, {0.4, 1.56, 60}};
  Points out = untouched(2);
  TWstatus status = 0;
  kToEd50.forward(p.data(), out.data(), 2, &status);
  kToEd50.forward(p.data(), p.data(), 2, &status);
  for (std::size_t i = 0; i < 2; ++i) expect_near(p[i], out[i].x, out[i].y, out[i].z, 0);
  out = untouched(1);
  for (const int32_t count : {0, -1}) {
    kToEd50.forward(p.data(), out.data(), count, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    kToEd50.inverse(p.data(), out.data(), count, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(out[0]);
  }
}

TEST(Molodensky, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer(
      "+proj=molodensky +a=6378160 +rf=298.25 +da=-23 +df=-8.120449e-8 +dx=-134 +dy=-48 +dz=149");
  ASSERT_TRUE(peer.ok());
  const Shift shift = {
      Ellipsoid::from_inverse_flattening(6378160, 298.25), -23, -8.120449e-8, -134, -48, 149};
  for (double lat = -85; lat < 86; lat += 17) {
    for (double lon = -170; lon < 180; lon += 41) {
      const CoordinateTriple in = {degrees(lon), degrees(lat), 700};
      const auto expected = peer.forward(in);
      const auto got = shift.forward(in);
      expect_near(got, expected.x, expected.y, 1e-13);
      EXPECT_NEAR(got.z, expected.z, 1e-7);
    }
  }
#endif
}

}  // namespace
