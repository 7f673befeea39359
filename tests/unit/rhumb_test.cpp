#include <gtest/gtest.h>

#include <random>

#include "support/geographiclib_peer.hpp"
#include "support/lines.hpp"
#include "support/points.hpp"
#include "tidewater/foundation.h"
#include "tidewater/lines.h"

using namespace tidewater::test;

namespace {

constexpr auto direct = line_end<TWrhmbline_dir>;
constexpr auto inverse = line_between<TWrhmbline_inv>;

const double kThreeQuarters = 3 * kPi / 2;

double parallel(Ellipsoid ellipsoid, double lat) {
  double radius = kUntouched;
  TWstatus status = 0;
  TWRparal(ellipsoid.a, ellipsoid.e, lat, &radius, &status);
  return radius;
}

TEST(RhumbDirect, OnTheSphereInClosedForm) {
  // asinh(tan(lat)) is the Mercator ordinate of the sphere.
  const double lat1 = 0.3, azimuth = 0.7, distance = 0.4;
  const double lat2 = lat1 + distance * std::cos(azimuth);
  const double lon = std::tan(azimuth) * (std::asinh(std::tan(lat2)) - std::asinh(std::tan(lat1)));
  const auto r = direct({1, lat1, 6}, azimuth, distance, {1, 0});
  EXPECT_EQ(r.status, TW_SUCCESS);
  expect_near(r.end, 1 + lon, lat2, 6, 1e-15);
  EXPECT_DOUBLE_EQ(r.back, azimuth + kPi);
}

TEST(RhumbDirect, AlongTheMeridian) {
  const auto wgs84 = Ellipsoid::wgs84();
  double arc1 = 0, arc2 = 0;
  TWstatus status = 0;
  TWmerid_dist_f(wgs84.a, wgs84.e, 0.5, &arc1, &status);
  TWmerid_dist_f(wgs84.a, wgs84.e, 0.9, &arc2, &status);
  const auto r = direct({0.2, 0.5, 0}, 0, arc2 - arc1, wgs84);
  EXPECT_EQ(r.end.x, 0.2);  // tan(0) is 0
  EXPECT_NEAR(r.end.y, 0.9, 1e-12);
  EXPECT_EQ(r.back, kPi);
}

TEST(RhumbDirect, AlongAParallelGoesEast) {
  const auto wgs84 = Ellipsoid::wgs84();
  const double radius = parallel(wgs84, 0.8);
  for (const double azimuth : {kPi / 2, kThreeQuarters}) {
    for (const double distance : {1e6, -1e6, 3e7}) {
      const auto r = direct({3, 0.8, 4}, azimuth, distance, wgs84);
      EXPECT_EQ(r.status, TW_SUCCESS);
      EXPECT_EQ(r.end.y, 0.8);
      EXPECT_NEAR(r.end.x, 3 + distance / radius, 1e-14);  // east, and not wrapped
      EXPECT_EQ(r.end.z, 4);
    }
  }
  // A hair off pi/2 it goes by the meridian arc and a huge tangent.
  const auto r = direct({3, 0.8, 4}, kPi / 2 + 1e-15, 1e6, wgs84);
  EXPECT_NEAR(r.end.y, 0.8, 1e-12);
  EXPECT_NE(r.end.x, 3 + 1e6 / radius);
  // 3 pi/2 a hair off goes west, as it should.
  EXPECT_LT(direct({3, 0.8, 4}, std::nextafter(kThreeQuarters, 5), 1e9, wgs84).end.x, 3);
  // No other multiple is told: -pi/2 goes the general way.
  EXPECT_NE(direct({3, 0.8, 4}, -kPi / 2, 1e6, wgs84).end.x, 3 + 1e6 / radius);
}

TEST(RhumbDirect, BackAzimuth) {
  const Ellipsoid unit = {1, 0};
  EXPECT_DOUBLE_EQ(direct({0, 0, 0}, 1, 0.1, unit).back, 1 + kPi);
  EXPECT_DOUBLE_EQ(direct({0, 0, 0}, 4, 0.1, unit).back, 4 - kPi);
  EXPECT_DOUBLE_EQ(direct({0, 0, 0}, -4, 0.1, unit).back, kPi - 4);  // not brought up
  EXPECT_EQ(direct({0, 0, 0}, kThreeQuarters, 0.1, unit).back, kThreeQuarters + kPi - 2 * kPi);
  // The bound is the printed 6.283185307179585, a hair short of 2 pi.
  EXPECT_EQ(direct({0, 0, 0}, kPi, 0.1, unit).back, 0);
}

TEST(RhumbDirect, PastAPoleIsNotReported) {
  const auto wgs84 = Ellipsoid::wgs84();
  const auto r = direct({0.5, 1.5, 2}, 0.3, 5e6, wgs84);
  // The inverse arc fails; the word is that of the last call, the ordinate of the start.
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_EQ(r.end.y, kUntouched);
  EXPECT_EQ(r.end.z, 2);
  EXPECT_DOUBLE_EQ(r.back, 0.3 + kPi);
  // A start beyond a pole is, by that same call.
  EXPECT_EQ(direct({0.5, 1.6, 2}, 0.3, 1, wgs84).status, TW_BAD_LATITUDE);
  // Along a parallel nothing is called.
  EXPECT_EQ(direct({0.5, 1.6, 2}, kPi / 2, 1, wgs84).status, TW_SUCCESS);
  EXPECT_EQ(direct({0.5, 0.6, 2}, 1, 1, {1, 2}).status, TW_SUCCESS);  // nor is the ellipsoid's
}

TEST(RhumbInverse, OnePoint) {
  const auto r = inverse({0.4, 0.6, 0}, {0.4, 0.6, 9}, Ellipsoid::wgs84());
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_EQ(r.distance, 0);
  EXPECT_DOUBLE_EQ(r.azimuth, 1.5 * kPi);
  EXPECT_DOUBLE_EQ(r.back, kPi / 2);
}

TEST(RhumbInverse, AlongAParallel) {
  const auto wgs84 = Ellipsoid::wgs84();
  auto r = inverse({0.1, 0, 0}, {0.6, 0, 0}, wgs84);
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_DOUBLE_EQ(r.distance, wgs84.a * 0.5);
  EXPECT_EQ(r.azimuth, kPi / 2);
  EXPECT_DOUBLE_EQ(r.back, 1.5 * kPi);
  r = inverse({0.6, 0.9, 0}, {0.1, 0.9, 0}, wgs84);
  EXPECT_NEAR(r.distance, parallel(wgs84, 0.9) * 0.5, 1e-8);
  EXPECT_DOUBLE_EQ(r.azimuth, 1.5 * kPi);
  EXPECT_DOUBLE_EQ(r.back, kPi / 2);
  // Only an exact equality of latitudes is a parallel.  The step is several units in the last
  // place, so that the ordinates differ too.
  const double near = 0.9 + 1e-15;
  r = inverse({0.6, 0.9, 0}, {0.7, near, 0}, wgs84);
  EXPECT_NE(r.azimuth, kPi / 2);
  EXPECT_NEAR(r.azimuth, kPi / 2, 3e-14);  // 1.6e-15 in the ordinate over 0.1 in longitude
}

TEST(RhumbInverse, TheLongWayAcrossThe180thMeridian) {
  const double lat1 = 0.2, lat2 = 0.5;
  const auto r = inverse({3, lat1, 0}, {-3, lat2, 0}, {1, 0});
  const double azimuth =
      std::atan2(-6, std::asinh(std::tan(lat2)) - std::asinh(std::tan(lat1))) + 2 * kPi;
  EXPECT_NEAR(r.azimuth, azimuth, 1e-15);
  EXPECT_NEAR(r.back, azimuth - kPi, 1e-15);
  EXPECT_NEAR(r.distance, (lat2 - lat1) / std::cos(azimuth), 1e-13);  // cos(azimuth) is 0.05
}

TEST(RhumbInverse, RangesOfTheAzimuths) {
  const Ellipsoid unit = {1, 0};
  // -1e-13 stays as it is, -1e-11 is brought up.
  EXPECT_LT(inverse({0, 0, 0}, {-1e-13, 1, 0}, unit).azimuth, 0);
  EXPECT_GT(inverse({0, 0, 0}, {-1e-11, 1, 0}, unit).azimuth, 6);
  EXPECT_EQ(inverse({0, 0, 0}, {0, 1, 0}, unit).azimuth, 0);
  EXPECT_EQ(inverse({0, 0, 0}, {0, 1, 0}, unit).back, kPi);
  EXPECT_EQ(inverse({0, 1, 0}, {0, 0, 0}, unit).azimuth, kPi);
  EXPECT_EQ(inverse({0, 1, 0}, {0, 0, 0}, unit).back, 0);  // 2 pi comes down
}

TEST(RhumbInverse, TheWordIsThatOfTheLastCall) {
  const auto wgs84 = Ellipsoid::wgs84();
  EXPECT_EQ(inverse({0, 1.6, 0}, {0, 1, 0}, wgs84).status, TW_BAD_LATITUDE);
  EXPECT_EQ(inverse({0, 1, 0}, {0, 1.6, 0}, wgs84).status, TW_SUCCESS);
  EXPECT_EQ(inverse({0, 1, 0}, {0, 0.6, 0}, {1, 1}).status, TW_BAD_ECCENTRICITY);
  EXPECT_EQ(inverse({0, 1, 0}, {0.1, 1, 0}, {1, 1}).status, TW_SUCCESS);
  EXPECT_EQ(inverse({0, kPi / 2 + 5e-13, 0}, {0, 0.6, 0}, wgs84).status, TW_I_LATITUDE_LIMITED);
}

TEST(Rhumb, RoundTrip) {
  const auto clarke = Ellipsoid::clarke_1866();
  std::mt19937 random(2);
  std::uniform_real_distribution<double> lon(-3, 3), lat(-1.4, 1.4);
  for (int i = 0; i < 1000; ++i) {
    const CoordinateTriple start = {lon(random), lat(random), 0};
    const CoordinateTriple end = {lon(random), lat(random), 0};
    const auto s = inverse(start, end, clarke);
    const auto r = direct(start, s.azimuth, s.distance, clarke);
    // a line near a parallel multiplies the inverse arc's 1e-12 by its tangent
    const double tolerance = 4e-12 * (1 + std::fabs(std::tan(s.azimuth))) / std::cos(end.y);
    expect_near(r.end, end.x, end.y, tolerance);
  }
}

TEST(Rhumb, EveryArgumentEnds) {
  for (const double odd : {kNaN, kInfinity, 1e300}) {
    direct({odd, 0.2, 0}, 1, 1e6, Ellipsoid::wgs84());
    direct({0, odd, 0}, 1, 1e6, Ellipsoid::wgs84());
    direct({0, 0.2, 0}, odd, 1e6, Ellipsoid::wgs84());
    direct({0, 0.2, 0}, 1, odd, Ellipsoid::wgs84());
    direct({0, 0.2, 0}, 1, 1e6, {odd, odd});
    inverse({0, 0.2, 0}, {odd, odd, 0}, Ellipsoid::wgs84());
  }
  EXPECT_TRUE(std::isnan(inverse({0, 0.2, 0}, {kNaN, 0.3, 0}, Ellipsoid::wgs84()).distance));
}

TEST(Rhumb, AgreesWithGeographicLib) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const auto wgs84 = Ellipsoid::wgs84();
  const GeographicLib::Rhumb peer(wgs84.a, 1 / 298.257223563);
  std::mt19937 random(4);
  std::uniform_real_distribution<double> lon(-85, 85), lat(-80, 80);
  for (int i = 0; i < 1000; ++i) {
    const double lat1 = lat(random), lon1 = lon(random), lat2 = lat(random), lon2 = lon(random);
    double s = 0, azimuth = 0;
    peer.Inverse(lat1, lon1, lat2, lon2, s, azimuth);
    const auto r =
        inverse({degrees(lon1), degrees(lat1), 0}, {degrees(lon2), degrees(lat2), 0}, wgs84);
    EXPECT_NEAR(std::remainder(r.azimuth - degrees(azimuth), 2 * kPi), 0, 1e-13);
    // the arc's series is good to a micrometre, and is divided by the cosine of the azimuth
    EXPECT_NEAR(r.distance, s, 2e-6 * (1 + 1 / std::fabs(std::cos(r.azimuth))));
    const auto d = direct({degrees(lon1), degrees(lat1), 0}, degrees(azimuth), s, wgs84);
    const double tangent = 1 + std::fabs(std::tan(degrees(azimuth)));
    EXPECT_NEAR(d.end.y, degrees(lat2), 4e-12);
    EXPECT_NEAR(d.end.x, degrees(lon2), 4e-12 * tangent / std::cos(degrees(lat2)));
  }
#endif
}

}  // namespace
