#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

struct Graticule {
  double lon0, lat0, pole_lon, pole_lat, offset;

  CoordinateTriple forward(const CoordinateTriple& in) const {
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWrotgrat_f(lon0, lat0, pole_lon, pole_lat, offset, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(out.z, kUntouched);
    return out;
  }
  CoordinateTriple inverse(const CoordinateTriple& in) const {
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWrotgrat_i(lon0, lat0, pole_lon, pole_lat, offset, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(out.z, kUntouched);
    return out;
  }
};

double offset_of(double lon0, double lat0, double pole_lon, double pole_lat) {
  double offset = kUntouched;
  TWstatus status = 0;
  TWrotgrat_c(lon0, lat0, pole_lon, pole_lat, &offset, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return offset;
}

TEST(RotatedGraticule, OffsetIsZeroWhereOriginAndPoleAreOne) {
  EXPECT_EQ(offset_of(0.3, 0.9, 0.3, 0.9), 0);
  // A hypotenuse of 1e-12 still counts as none: the pole lies that far south of the origin.
  EXPECT_EQ(offset_of(0.3, 0.9, 0.3, 0.9 - 0.9e-12), 0);
  EXPECT_DOUBLE_EQ(offset_of(0.3, 0.9, 0.3, 0.9 - 1.1e-12), kPi);
}

TEST(RotatedGraticule, OffsetByQuarterTurns) {
  // Pole on the equator a quarter turn east of an origin on the equator: a = 1, b = 0.
  EXPECT_DOUBLE_EQ(offset_of(0, 0, kPi / 2, 0), kPi / 2);
  EXPECT_DOUBLE_EQ(offset_of(0, 0, -kPi / 2, 0), 1.5 * kPi);
  // Pole due south of the origin: a = 0, b = sin(lat0 - pole_lat) > 0, so atan2 gives 0.
  EXPECT_DOUBLE_EQ(offset_of(0.2, 0.9, 0.2, 0.4), kPi);
  // Pole due north of it: b < 0, so atan2 gives pi.
  EXPECT_DOUBLE_EQ(offset_of(0.2, 0.4, 0.2, 0.9), 0);
}

TEST(RotatedGraticule, OffsetBringsTheOriginToItsOwnMeridian) {
  for (const double pole_lon : {-2.0, 0.4, 1.3}) {
    const double lon0 = 0.1, lat0 = 0.6, pole_lat = 1.1;
    const Graticule g = {lon0, lat0, pole_lon, pole_lat, offset_of(lon0, lat0, pole_lon, pole_lat)};
    EXPECT_NEAR(g.forward({lon0, lat0, 0}).x, lon0, 2e-15);
  }
}

TEST(RotatedGraticule, SphericalTriangleInClosedForm) {
  // Pole at 0 E 0 N: a point at 90 E 0 N is a quarter turn away, due east of it.
  const Graticule g = {0, 0, 0, 0, 0};
  CoordinateTriple out = g.forward({kPi / 2, 0, 0});
  expect_near(out, kPi / 2, 0, 1e-15);
  // 60 degrees along the equator: distance 60, latitude 30.
  out = g.forward({kPi / 3, 0, 0});
  expect_near(out, kPi / 2, kPi / 6, 1e-15);
  // Due north of the pole the direction is atan2(0, -sin lat) = pi.
  out = g.forward({0, 0.3, 0});
  expect_near(out, kPi, kPi / 2 - 0.3, 1e-15);
  // Due south it is 0.
  out = g.forward({0, -0.3, 0});
  expect_near(out, 0, kPi / 2 - 0.3, 1e-15);
}

TEST(RotatedGraticule, PoleItselfAndItsAntipode) {
  const Graticule g = {0.25, 0, 0.7, 0.8, 3.0};
  CoordinateTriple out = g.forward({0.7, 0.8, 0});
  // lon0 + offset, wrapped
  expect_near(out, 3.25 - 2 * kPi, kPi / 2, 1e-8);  // the arc sine of all but 1
  EXPECT_DOUBLE_EQ(out.x, 3.25 - 2 * kPi);
  out = g.forward({0.7 - kPi, -0.8, 0});
  EXPECT_DOUBLE_EQ(out.x, 3.25 - 2 * kPi);
  EXPECT_NEAR(out.y, -kPi / 2, 1e-7);
  // Half the margin off the pole is still the pole, three times the margin is not.
  out = g.forward({0.7, 0.8 + 5e-13, 0});
  EXPECT_DOUBLE_EQ(out.x, 3.25 - 2 * kPi);
  out = g.forward({0.7, 0.8 + 3e-12, 0});
  EXPECT_NEAR(out.x, kPi + 3.25 - 2 * kPi, 1e-12);
}

TEST(RotatedGraticule, SineBeyondOneGivesThePole) {
  // cos^2 + sin^2 rounds to more than 1 for some of these latitudes; none gives a not-a-number.
  int beyond = 0;
  for (double lat = -1.5; lat < 1.5; lat += 0.01) {
    const double v = std::cos(lat) * std::cos(lat) + std::sin(lat) * std::sin(lat);
    const Graticule g = {0, 0, 0.5, lat, 0};
    const CoordinateTriple out = g.forward({0.5, lat, 0});
    EXPECT_NEAR(out.y, kPi / 2, 3e-8);
    if (v >= 1) {
      EXPECT_EQ(out.y, kPi / 2);
      if (v > 1) ++beyond;
    }
  }
  EXPECT_GT(beyond, 0);
}

TEST(RotatedGraticule, NorthPoleCopiesWithoutTheOffset) {
  const Points in = {{4, 2, 1}, {-7, -3, 1}};  // neither wrapped nor tested
  Points out = untouched(2);
  TWstatus status = 0;
  TWrotgrat_f(0.5, 0.5, 0.2, kPi / 2 - 0.9e-12, 1.5, 2, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < 2; ++i) {
    EXPECT_EQ(out[i].x, in[i].x);
    EXPECT_EQ(out[i].y, in[i].y);
    EXPECT_EQ(out[i].z, kUntouched);
  }
  // 1.1e-12 from the pole is a rotation like any other, and the offset is applied.
  const Graticule g = {0.5, 0, 0.2, kPi / 2 - 1.1e-12, 1.5};
  const CoordinateTriple turned = g.forward({0.3, 0.4, 0});
  expect_near(turned, 0.1 + 0.5 + 1.5, 0.4, 1e-11);
}

TEST(RotatedGraticule, InverseTakesTheNorthPoleAsAnyOther) {
  const Graticule g = {0.5, 0, 0.2, kPi / 2, 1.5};
  const CoordinateTriple out = g.inverse({2.1, 0.4, 0});
  expect_near(out, 2.1 - 1.5 - 0.5 + 0.2, 0.4, 1e-15);
}

TEST(RotatedGraticule, SouthPoleIsNoShortcut) {
  const Graticule g = {0, 0, 0, -kPi / 2, 0};
  // From the south pole latitudes change sign, and longitudes run the other way from half a turn.
  const CoordinateTriple out = g.forward({0.3, 0.4, 0});
  expect_near(out, kPi - 0.3, -0.4, 1e-15);
}

TEST(RotatedGraticule, LongitudesComeIntoOneTurn) {
  const Graticule g = {20 * kPi, 0, 0, 0, 0};
  EXPECT_NEAR(g.forward({0.4, 0.3, 0}).x, (Graticule{0, 0, 0, 0, 0}).forward({0.4, 0.3, 0}).x,
              1e-13);
  // Exactly half a turn: the forward result pi stays, the negative one comes to pi.
  const Graticule plain = {0, 0, 0, 0, 0};
  EXPECT_EQ(plain.forward({0, 0.3, 0}).x, kPi);
  EXPECT_EQ(plain.forward({-0.0, 0.3, 0}).x, kPi);
}

TEST(RotatedGraticule, InverseThatComesOutAtAPole) {
  // New pole at 40 N: the old north pole stands at new latitude 40, new longitude lon0 + pi.
  const double pole_lat = degrees(40);
  const Graticule g = {0.7, 0, 0.2, pole_lat, 0.1};
  const CoordinateTriple out = g.inverse({0.7 + 0.1 + kPi, pole_lat, 0});
  EXPECT_NEAR(out.y, kPi / 2, 3e-8);
  if (std::fabs(out.y - kPi / 2) < 1e-12) {
    EXPECT_EQ(out.x, 0.7);
  }
  // With the pole on the equator the same is exact: sin(pi/2) = 1.
  const Graticule flat = {0.7, 0, 0.2, 0, 0};
  const CoordinateTriple pole = flat.inverse({0.7 + kPi, 0, 0});
  EXPECT_EQ(pole.y, kPi / 2);
  EXPECT_EQ(pole.x, 0.7);
}

TEST(RotatedGraticule, RoundTripInPlace) {
  std::mt19937 random(58);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.5, 1.5);
  for (int turn = 0; turn < 20; ++turn) {
    const Graticule g = {lon(random), 0, lon(random), lat(random), lon(random)};
    Points in(50);
    for (auto& p : in) p = {lon(random), lat(random), 3};
    Points out = in;
    TWstatus status = 0;
    TWrotgrat_f(g.lon0, 9, g.pole_lon, g.pole_lat, g.offset, 50, out.data(), out.data(), &status);
    TWrotgrat_i(g.lon0, -9, g.pole_lon, g.pole_lat, g.offset, 50, out.data(), out.data(), &status);
    for (std::size_t i = 0; i < in.size(); ++i) {
      // The arc sine loses digits towards the poles, and a longitude those of the distance to one.
      EXPECT_NEAR(std::remainder(out[i].x - in[i].x, 2 * kPi), 0, 1e-12);
      EXPECT_NEAR(out[i].y, in[i].y, 1e-13);
      EXPECT_EQ(out[i].z, 3);
    }
  }
}

TEST(RotatedGraticule, NothingToDoAndNotANumber) {
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1}) {
    for (const double pole_lat : {0.5, kPi / 2}) {
      TWstatus status = 0;
      TWrotgrat_f(0, 0, 0, pole_lat, 0, count, &p, &p, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      TWrotgrat_i(0, 0, 0, pole_lat, 0, count, &p, &p, &status);
      EXPECT_EQ(status, TW_SUCCESS);
    }
    expect_untouched(p);
  }
  const Graticule g = {0, 0, 0, 0.5, 0};
  EXPECT_TRUE(std::isnan(g.forward({kNaN, 0.1, 0}).x));
  EXPECT_TRUE(std::isnan(g.inverse({kInfinity, 0.1, 0}).x));
}

TEST(RotatedGraticule, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  // A pole at 162 W 39.25 N with the meridian of 0 unturned; PROJ counts the new longitude from the
  // direction towards the old north pole, half a turn from ours.
  const ProjPeer peer("+proj=ob_tran +o_proj=longlat +o_lon_p=0 +o_lat_p=39.25 +lon_0=18 +R=1");
  ASSERT_TRUE(peer.ok());
  const Graticule g = {kPi, 0, degrees(18 - 180), degrees(39.25), 0};
  for (double lat = -80; lat < 85; lat += 23) {
    for (double lon = -170; lon < 180; lon += 37) {
      const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
      const CoordinateTriple ours = g.forward(in);
      CoordinateTriple theirs = peer.forward(in);
      EXPECT_NEAR(std::remainder(ours.x - theirs.x, 2 * kPi), 0, 1e-13) << lon << ' ' << lat;
      EXPECT_NEAR(ours.y, theirs.y, 1e-14);
    }
  }
#endif
}

}  // namespace
