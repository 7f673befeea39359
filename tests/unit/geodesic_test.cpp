#include <gtest/gtest.h>

#include <random>

#include "support/geographiclib_peer.hpp"
#include "support/lines.hpp"
#include "support/points.hpp"
#include "tidewater/foundation.h"
#include "tidewater/lines.h"

using namespace tidewater::test;

namespace {

constexpr auto direct = line_end<TWgeodesic_dir>;
constexpr auto inverse = line_between<TWgeodesic_inv>;

double arc_of(Ellipsoid ellipsoid, double lat) {
  double arc = kUntouched;
  TWstatus status = 0;
  TWmerid_dist_f(ellipsoid.a, ellipsoid.e, lat, &arc, &status);
  return arc;
}

double sin_reduced(double e, double lat) {
  return std::sin(std::atan(std::sqrt(1 - e * e) * std::tan(lat)));
}

double cos_reduced(double e, double lat) {
  return std::cos(std::atan(std::sqrt(1 - e * e) * std::tan(lat)));
}

// ---- The integrals from the vertex.

struct Integrals {
  double arc = kUntouched;
  double lon = kUntouched;
  TWstatus status = 0;
};

Integrals integrals(double x, double k, int16_t flag, double e) {
  Integrals r;
  const double e2 = e * e;
  geodesic_int(x, k, flag, 2, e2, e2 / (1 - e2), &r.arc, &r.lon, &r.status);
  return r;
}

template <class F>
double simpson(double from, double to, F f) {
  const int pieces = 2000;
  const double h = (to - from) / pieces;
  double sum = f(from) + f(to);
  for (int i = 1; i < pieces; ++i) sum += (i % 2 ? 4 : 2) * f(from + i * h);
  return sum * h / 3;
}

// sqrt(1 + v) by the binomial series to the fifth power.
double root_to_five_terms(double v) {
  return 1 + v * (1.0 / 2 + v * (-1.0 / 8 + v * (1.0 / 16 + v * (-5.0 / 128 + v * 7.0 / 256))));
}

TEST(GeodesicIntegral, IsTheExpansionToFiveTerms) {
  // Numerical integration of the expanded integrands, on an ellipsoid so flat that a missing or a
  // further term would show.
  const double e = 0.4;
  const double e2 = e * e;
  const double ep2 = e2 / (1 - e2);
  for (const double k : {0.1, 0.5, 0.9, 0.999}) {
    for (const double r : {-0.9, -0.3, 0.0, 0.4, 0.95}) {
      const double theta = std::acos(r);
      const double arc = 2 * simpson(0, theta, [&](double u) {
                           return root_to_five_terms(ep2 * k * k * std::cos(u) * std::cos(u));
                         });
      const double sphere = std::atan2(std::sin(theta), std::sqrt(1 - k * k) * r);
      const double lon = sphere - std::sqrt(1 - k * k) * simpson(0, theta, [&](double u) {
                                    const double w = 1 - k * k * std::cos(u) * std::cos(u);
                                    return (1 - root_to_five_terms(-e2 * w)) / w;
                                  });
      const auto got = integrals(k * r, k, 0, e);
      EXPECT_EQ(got.status, TW_SUCCESS);
      EXPECT_NEAR(got.arc, arc, 1e-13 * 4);
      EXPECT_NEAR(got.lon, lon, 1e-13 * 4);
      const auto other = integrals(k * r, k, 1, e);
      EXPECT_EQ(other.arc, got.arc);
      EXPECT_EQ(other.lon, got.lon);
    }
  }
}

TEST(GeodesicIntegral, OnTheEarthIsTheTrueIntegral) {
  const double e = Ellipsoid::wgs84().e;
  const double ep2 = e * e / (1 - e * e);
  const double k = 0.7;
  const double theta = 2;
  const double arc = 2 * simpson(0, theta, [&](double u) {
                       return std::sqrt(1 + ep2 * k * k * std::cos(u) * std::cos(u));
                     });
  // the sixth term of the series is 21/1024 (e'^2 k^2)^6, about 2e-17
  EXPECT_NEAR(integrals(k * std::cos(theta), k, 0, e).arc, arc, 1e-13);
}

TEST(GeodesicIntegral, AtTheVertexAndBeyond) {
  for (const double x : {0.5, -0.5, 0.6, -0.6}) {
    const auto r = integrals(x, 0.5, 0, 0.08);
    EXPECT_EQ(r.arc, 0);
    EXPECT_EQ(r.lon, 0);
  }
  // Flag 1 pulls a point back to the vertex on the positive side alone.
  for (const double x : {0.5, 0.6}) {
    const auto r = integrals(x, 0.5, 1, 0.08);
    EXPECT_EQ(r.arc, 0);
    EXPECT_EQ(r.lon, 0);
  }
  EXPECT_TRUE(std::isnan(integrals(-0.6, 0.5, 1, 0.08).arc));
  // A pull of 1e-18 shows where k itself is that small: r = 0 in place of 1.
  EXPECT_NEAR(integrals(1e-18, 1e-18, 1, 0).arc, 2 * (kPi / 2), 1e-15);
  // The whole half-wave, from vertex to vertex, for the opposite point.
  EXPECT_NEAR(integrals(-0.5, 0.5, 1, 0).arc, 2 * kPi, 1e-15);
}

// ---- LineEnd problem.

TEST(GeodesicDirect, NoDistanceIsTheStart) {
  for (const double e : {0.0, 0.08}) {
    for (const double azimuth : {0.0, 1.0, 3.0, -2.0, kNaN}) {
      const auto r = direct({7, 2, 33}, azimuth, 0, {6e6, e});
      EXPECT_EQ(r.status, TW_SUCCESS);
      expect_near(r.end, 7, 2, 33, 0);
      EXPECT_EQ(r.back, kPi);
    }
  }
}

TEST(GeodesicDirect, AlongTheMeridian) {
  const auto wgs84 = Ellipsoid::wgs84();
  const double lat1 = degrees(20);
  const double lat2 = degrees(31);
  const double length = arc_of(wgs84, lat2) - arc_of(wgs84, lat1);
  for (const double azimuth : {0.0, -2 * kPi, 2 * kPi, 4 * kPi, 9e-15, -9e-15}) {
    const auto r = direct({5, lat1, 9}, azimuth, length, wgs84);
    EXPECT_EQ(r.status, TW_SUCCESS);
    EXPECT_EQ(r.end.x, 5);
    EXPECT_NEAR(r.end.y, lat2, 1e-12);  // the inverse arc is good to 1e-12
    EXPECT_EQ(r.end.z, 9);
    EXPECT_EQ(r.back, kPi);
  }
  for (const double azimuth : {kPi, -kPi, 3 * kPi, -3 * kPi, kPi - 5e-15}) {
    const auto r = direct({5, lat2, 9}, azimuth, length, wgs84);
    EXPECT_EQ(r.end.x, 5);
    EXPECT_NEAR(r.end.y, lat1, 1e-12);
    EXPECT_EQ(r.back, kPi);  // pi southward too
  }
  // Just off the meridian the back azimuth is computed.
  EXPECT_NEAR(direct({0, lat1, 0}, 2e-14, length, wgs84).back, kPi, 1e-13);
  const auto south = direct({0, lat2, 0}, kPi - 2e-14, length, wgs84);
  EXPECT_NEAR(south.back, 2 * kPi, 1e-13);
}

TEST(GeodesicDirect, MeridianTakesTheSphereToo) {
  // The meridian is looked for before the sphere.
  const auto r = direct({1, 0.5, 0}, kPi, 0.25, {1, 0});
  EXPECT_DOUBLE_EQ(r.end.y, 0.25);
  EXPECT_EQ(r.back, kPi);
}

TEST(GeodesicDirect, PastAPole) {
  const auto wgs84 = Ellipsoid::wgs84();
  auto r = direct({0.3, degrees(80), 4}, 0, 3e6, wgs84);
  EXPECT_EQ(r.status, TW_BAD_LATITUDE);
  EXPECT_EQ(r.end.x, 0.3);
  EXPECT_EQ(r.end.y, kUntouched);
  EXPECT_EQ(r.end.z, 4);
  EXPECT_EQ(r.back, kPi);
  // An ellipsoid that the arc functions refuse.
  r = direct({0.3, 0.4, 4}, 0, 1, {1, 1.5});
  EXPECT_EQ(r.status, TW_BAD_ECCENTRICITY);
  EXPECT_EQ(r.end.y, kUntouched);
  // The word of the arc from the equator to the start is not looked at: the inverse arc's stands.
  r = direct({0.3, 2, 4}, 0, 1, {1, 0.08});
  EXPECT_EQ(r.status, TW_SUCCESS);
  // An information word: within the tolerance of the quarter meridian.
  r = direct({0.3, 0, 4}, 0, kPi / 2 + 5e-13, {1, 0});
  EXPECT_EQ(r.status, TW_I_LATITUDE_LIMITED);
  EXPECT_EQ(r.end.y, kPi / 2);
}

TEST(GeodesicDirect, Sphere) {
  const Ellipsoid unit = {1, 0};
  auto r = direct({0.2, 0, 3}, kPi / 2, 1, unit);
  EXPECT_EQ(r.status, TW_SUCCESS);
  expect_near(r.end, 1.2, 0, 3, 1e-15);
  EXPECT_NEAR(r.back, -kPi / 2, 1e-15);  // in the range of atan2
  // Not wrapped.
  r = direct({3, 0, 3}, kPi / 2, 1, unit);
  EXPECT_NEAR(r.end.x, 4, 1e-15);
  // Half an octant: from the equator, azimuth 45 degrees, a quarter turn, to latitude 45 degrees.
  r = direct({0, 0, 0}, kPi / 4, kPi / 2, unit);
  expect_near(r.end, kPi / 2, kPi / 4, 1e-15);
  EXPECT_NEAR(r.back, -kPi / 2, 1e-15);
  // From the poles.
  r = direct({1, kPi / 2, 0}, 0.3, 0.5, unit);
  expect_near(r.end, 0.7, kPi / 2 - 0.5, 1e-15);
  r = direct({1, -kPi / 2, 0}, 0.3, 0.5, unit);
  expect_near(r.end, 1.3, -kPi / 2 + 0.5, 1e-15);
  // Hard by a pole the formula is the general one.
  r = direct({1, std::nextafter(kPi / 2, 0), 0}, 0.3, 0.5, unit);
  EXPECT_NEAR(r.end.y, kPi / 2 - 0.5, 1e-15);
  EXPECT_NEAR(r.end.x, 1 + kPi - 0.3, 1e-15);
  // A negative eccentricity is a sphere as well.
  r = direct({0.2, 0, 3}, kPi / 2, 1, {1, -0.5});
  expect_near(r.end, 1.2, 0, 3, 1e-15);
}

TEST(GeodesicDirect, TheSphereEndsBelowAnEccentricityOf1e12) {
  const CoordinateTriple start = {0, 0.5, 0};
  EXPECT_LT(direct(start, 1, 0.3, {1, 0.999e-12}).back, 0);
  const auto r = direct(start, 1, 0.3, {1, 1e-12});
  EXPECT_GT(r.back, kPi);
  EXPECT_NEAR(r.back - 2 * kPi, direct(start, 1, 0.3, {1, 0}).back, 1e-14);
}

TEST(GeodesicDirect, AlongTheEquator) {
  const auto [a, e] = Ellipsoid::wgs84();
  auto r = direct({0.5, 0, 8}, kPi / 2, 1e6, {a, e});
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_DOUBLE_EQ(r.end.x, 0.5 + 1e6 / a);
  EXPECT_EQ(r.end.y, 0);
  EXPECT_EQ(r.end.z, 8);
  EXPECT_EQ(r.back, kPi / 2 + kPi);
  r = direct({0.5, 0, 8}, -kPi / 2, 1e6, {a, e});
  EXPECT_DOUBLE_EQ(r.end.x, 0.5 - 1e6 / a);
  EXPECT_EQ(r.back, kPi / 2);
  // Wrapped both ways, over any number of turns.
  EXPECT_NEAR(direct({3, 0, 0}, kPi / 2, a, {a, e}).end.x, 4 - 2 * kPi, 1e-15);
  EXPECT_NEAR(direct({-3, 0, 0}, -kPi / 2, a, {a, e}).end.x, -4 + 2 * kPi, 1e-15);
  EXPECT_NEAR(direct({0.25, 0, 0}, kPi / 2, 20 * kPi * a, {a, e}).end.x, 0.25, 1e-13);
  // Half a turn stays on the side that it comes from.
  EXPECT_EQ(direct({0, 0, 0}, kPi / 2, kPi, {1, e}).end.x, kPi);
  EXPECT_EQ(direct({0, 0, 0}, -kPi / 2, kPi, {1, e}).end.x, -kPi);
  // Just off the equator it is an ordinary line.
  EXPECT_GT(direct({0, 0, 0}, kPi / 2 - 1e-10, 1e6, {a, e}).end.y, 0);
}

TEST(GeodesicDirect, MirrorsTheSouth) {
  const auto wgs84 = Ellipsoid::wgs84();
  for (const double distance : {2e6, 9e6, 1.7e7, 3.3e7}) {
    const auto north = direct({0.1, 0.6, 0}, 0.8, distance, wgs84);
    const auto south = direct({0.1, -0.6, 0}, kPi - 0.8, distance, wgs84);
    EXPECT_NEAR(south.end.y, -north.end.y, 1e-15);
    EXPECT_NEAR(south.end.x, north.end.x, 1e-15);
    EXPECT_NEAR(std::cos(south.back), -std::cos(north.back), 1e-14);
    EXPECT_NEAR(std::sin(south.back), std::sin(north.back), 1e-14);
    // and the west
    const auto west = direct({-0.1, 0.6, 0}, -0.8, distance, wgs84);
    EXPECT_NEAR(west.end.y, north.end.y, 1e-15);
    EXPECT_NEAR(west.end.x, -north.end.x, 1e-15);
  }
  // A start on the equator goes to the side that its azimuth says.
  EXPECT_GT(direct({0, 0, 0}, 1, 1e6, wgs84).end.y, 0.05);
  EXPECT_LT(direct({0, 0, 0}, 2, 1e6, wgs84).end.y, -0.05);
}

TEST(GeodesicDirect, HardByTheVertexTheLongitudeIsAProduct) {
  // Below 0.01 of the unit of a the longitude from the vertex is (arc / b) m, whatever the unit.
  const Ellipsoid wgs84 = Ellipsoid::wgs84();
  const double b = wgs84.a * std::sqrt(1 - wgs84.e * wgs84.e);
  const double lat = degrees(60);
  const double m = cos_reduced(wgs84.e, lat);
  auto r = direct({0, lat, 0}, kPi / 2, 0.0099, wgs84);
  EXPECT_NEAR(r.end.x / (0.0099 / b * m), 1, 1e-12);
  // Further off it is the true one, about arc / (a cos(beta)).
  r = direct({0, lat, 0}, kPi / 2, 100, wgs84);
  EXPECT_NEAR(r.end.x / (100 / wgs84.a / m), 1, 1e-5);
  // The limit is not scaled: on a unit ellipsoid it is half a degree of arc.
  r = direct({0, lat, 0}, kPi / 2, 0.0099, {1, wgs84.e});
  EXPECT_NEAR(r.end.x / (0.0099 / (b / wgs84.a) * m), 1, 1e-12);
  // From the limit on it is the true one there too; the sphere's is atan(tan(arc) / cos(lat)).
  r = direct({0, lat, 0}, kPi / 2, 0.01, {1, 1e-12});
  EXPECT_NEAR(r.end.x, std::atan(std::tan(0.01) / std::cos(lat)), 1e-13);
}

TEST(GeodesicDirect, CountsWholeHalfWaves) {
  // After two half-waves the line is at its vertex again: the same latitude, and a longitude short
  // of a turn by twice what the ellipsoid takes off.
  const auto wgs84 = Ellipsoid::wgs84();
  const double lat = degrees(40);
  const double k = sin_reduced(wgs84.e, lat);
  const double e2 = wgs84.e * wgs84.e;
  const double ep2 = e2 / (1 - e2);
  double quarter = 0;
  double lon = 0;
  TWstatus status = 0;
  geodesic_int(0, k, 1, wgs84.a * std::sqrt(1 - e2), e2, ep2, &quarter, &lon, &status);
  for (const int waves : {1, 2, 3, 8}) {
    // stops a little short of the vertex, where the latitude is well determined
    const auto short_of = direct({0, lat, 0}, kPi / 2, 2 * waves * quarter - 2e6, wgs84);
    const auto before = direct({0, lat, 0}, -kPi / 2, 2e6, wgs84);
    EXPECT_NEAR(short_of.end.y, waves % 2 ? -before.end.y : before.end.y, 1e-14);
    double expected = 2 * waves * lon + before.end.x;
    expected -= 2 * kPi * std::round(expected / (2 * kPi));
    EXPECT_NEAR(short_of.end.x, expected, 1e-14);
  }
  // So many that they are not counted one by one: an even number leaves the latitude alone.
  const auto near = direct({0, lat, 0}, kPi / 2, 1e6, wgs84);
  const auto far = direct({0, lat, 0}, kPi / 2, 1e6 + 2 * 200000 * quarter, wgs84);
  EXPECT_NEAR(far.end.y, near.end.y, 1e-9);  // the distance itself is good to 1e-3 of a metre
  const auto odd = direct({0, lat, 0}, kPi / 2, 1e6 + 2 * 200001 * quarter, wgs84);
  EXPECT_NEAR(odd.end.y, -near.end.y, 1e-9);
}

TEST(GeodesicDirect, LongitudeMargin) {
  const auto wgs84 = Ellipsoid::wgs84();
  const auto lon_after = [&](double lon) {
    return direct({lon, 0.5, 0}, 1e-13, 1000, wgs84).end.x;
  };
  EXPECT_NEAR(lon_after(kPi + 5e-11), kPi + 5e-11, 1e-15);  // stays above pi
  EXPECT_NEAR(lon_after(kPi + 2e-10), -kPi + 2e-10, 1e-15);
  EXPECT_NEAR(lon_after(-kPi + 2e-10), -kPi + 2e-10, 1e-15);
  EXPECT_NEAR(lon_after(-kPi + 5e-11), kPi + 5e-11, 1e-15);  // goes up to above pi
  EXPECT_NEAR(lon_after(-kPi - 1), kPi - 1, 1e-15);
  EXPECT_NEAR(lon_after(15), 15 - 4 * kPi, 2e-15);
  EXPECT_NEAR(lon_after(-15), -15 + 4 * kPi, 2e-15);
}

TEST(GeodesicDirect, BackAzimuthOfAFullTurnIsZero) {
  // Southward from hard by the pole: the line all but follows a meridian.
  const auto r = direct({0, degrees(89.9), 0}, kPi - 2e-14, 9e6, Ellipsoid::wgs84());
  EXPECT_NEAR(r.back, 0, 1e-15);
}

TEST(GeodesicDirect, NegativeDistanceGoesTheOtherWay) {
  const auto wgs84 = Ellipsoid::wgs84();
  const auto back = direct({0.4, 0.3, 0}, 1.2, -3e6, wgs84);
  const auto other = direct({0.4, 0.3, 0}, 1.2 + kPi, 3e6, wgs84);
  expect_near(back.end, other.end.x, other.end.y, 1e-14);
}

TEST(GeodesicDirect, EveryArgumentEnds) {
  const auto wgs84 = Ellipsoid::wgs84();
  for (const double odd : {kNaN, kInfinity, -kInfinity, 1e300, -1e300, 1e18, 1e25}) {
    const auto by_distance = direct({0.1, 0.2, 0}, 1, odd, wgs84);
    EXPECT_EQ(by_distance.status, TW_SUCCESS);
    direct({0.1, 0.2, 0}, odd, 1e6, wgs84);
    direct({odd, 0.2, 0}, 1, 1e6, wgs84);
    direct({0.1, odd, 0}, 1, 1e6, wgs84);
    direct({0.1, 0.2, 0}, 1, 1e6, {odd, wgs84.e});
    direct({0.1, 0.2, 0}, 1, 1e6, {-6e6, wgs84.e});
    direct({0.1, 0.2, 0}, 1, 1e6, {0, wgs84.e});
    direct({0.1, 0.2, 0}, 1, 1e6, {6e6, odd});
    direct({odd, 0, 0}, kPi / 2, 1e6, wgs84);
    direct({0.1, 0, 0}, kPi / 2, odd, wgs84);
  }
  EXPECT_TRUE(std::isnan(direct({0.1, 0.2, 0}, 1, kNaN, wgs84).end.y));
  EXPECT_TRUE(std::isnan(direct({0.1, 0.2, 0}, 1, kInfinity, wgs84).end.y));
  EXPECT_TRUE(std::isnan(direct({kNaN, 0.2, 0}, 1, 1e6, wgs84).end.x));
}

TEST(GeodesicDirect, AgreesWithGeographicLib) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const auto wgs84 = Ellipsoid::wgs84();
  const GeographicLib::Geodesic peer(wgs84.a, 1 / 298.257223563);
  std::mt19937 random(7);
  // Vertices between 5 and 80 degrees and starts off the vertex, where the sines are well
  // determined.
  std::uniform_real_distribution<double> lon(-180, 180), lat(-80, 80), azimuth(-360, 360),
      distance(0, 1e8);
  int compared = 0;
  for (int i = 0; i < 4000; ++i) {
    const double lat1 = lat(random), lon1 = lon(random), az1 = azimuth(random);
    const double s = distance(random) * (i % 3 == 0 ? 1e-3 : 1);
    const double m = std::fabs(std::cos(degrees(lat1)) * std::sin(degrees(az1)));
    if (m < std::cos(degrees(80)) || m > std::cos(degrees(5))) continue;
    if (std::fabs(std::cos(degrees(az1))) < 0.02) continue;
    double lat2 = 0, lon2 = 0, az2 = 0;
    peer.Direct(lat1, lon1, az1, s, lat2, lon2, az2);
    const auto r = direct({degrees(lon1), degrees(lat1), 0}, degrees(az1), s, wgs84);
    ++compared;
    // 1e-13 is 0.6 micrometres; the rounding of the degrees grows with the length
    const double tolerance = 1e-13 * (1 + s / 1e7);
    EXPECT_NEAR(r.end.y, degrees(lat2), tolerance) << lat1 << " " << az1 << " " << s;
    EXPECT_NEAR(std::remainder(r.end.x - degrees(lon2), 2 * kPi), 0, 10 * tolerance);
    EXPECT_NEAR(std::remainder(r.back - degrees(az2 + 180), 2 * kPi), 0, 10 * tolerance);
    EXPECT_GE(r.back, 0);
    EXPECT_LT(r.back, 2 * kPi);
  }
  EXPECT_GT(compared, 2000);
#endif
}

// ---- LineBetween problem.

TEST(GeodesicInverse, OnePoint) {
  for (const double shift : {0.0, 9e-15, -9e-15}) {
    const auto r = inverse({shift, 0.5 + shift, 1}, {0, 0.5, 2}, Ellipsoid::wgs84());
    EXPECT_EQ(r.status, TW_SUCCESS);
    EXPECT_EQ(r.distance, 0);
    EXPECT_EQ(r.azimuth, 0);
    EXPECT_EQ(r.back, kPi);
  }
  EXPECT_GT(inverse({0, 0.5 + 2e-14, 0}, {0, 0.5, 0}, Ellipsoid::wgs84()).distance, 1e-8);
}

TEST(GeodesicInverse, AlongTheMeridian) {
  const auto wgs84 = Ellipsoid::wgs84();
  const double lats[] = {-1.2, -0.3, 0, 0.4, 1.5};
  for (const double lat1 : lats) {
    for (const double lat2 : lats) {
      if (lat1 == lat2) continue;
      const auto r = inverse({2, lat1, 0}, {2, lat2, 0}, wgs84);
      EXPECT_EQ(r.status, TW_SUCCESS);
      EXPECT_NEAR(r.distance, std::fabs(arc_of(wgs84, lat1) - arc_of(wgs84, lat2)), 1e-8);
      EXPECT_EQ(r.azimuth, lat2 > lat1 ? 0 : kPi);
      EXPECT_EQ(r.back, lat2 > lat1 ? kPi : 0);
    }
  }
}

TEST(GeodesicInverse, AtAPole) {
  const auto wgs84 = Ellipsoid::wgs84();
  const double quarter = arc_of(wgs84, kPi / 2);
  auto r = inverse({2, 0.7, 0}, {-1, kPi / 2, 0}, wgs84);
  EXPECT_NEAR(r.distance, quarter - arc_of(wgs84, 0.7), 1e-8);
  EXPECT_EQ(r.azimuth, 0);
  EXPECT_EQ(r.back, kPi);
  r = inverse({2, -kPi / 2, 0}, {-1, 0.7, 0}, wgs84);
  EXPECT_NEAR(r.distance, quarter + arc_of(wgs84, 0.7), 1e-8);
  EXPECT_EQ(r.azimuth, 0);
  EXPECT_EQ(r.back, kPi);
  r = inverse({2, 0.7, 0}, {-1, -kPi / 2, 0}, wgs84);
  EXPECT_EQ(r.azimuth, kPi);
  EXPECT_EQ(r.back, 0);
  // Also on the other side of the earth, where no antipode is meant.
  r = inverse({0, 0.7, 0}, {kPi, kPi / 2, 0}, wgs84);
  EXPECT_NEAR(r.distance, quarter - arc_of(wgs84, 0.7), 1e-8);
  EXPECT_EQ(r.azimuth, 0);
  // By contract: so near to the pole that its sine is 1 the iteration finds nothing, and the answer
  // is the sine of the sphere's arc between the reduced latitudes.
  const double sine = wgs84.a * cos_reduced(wgs84.e, 0.3);
  for (const double sign : {1.0, -1.0}) {
    const double pole = sign * (kPi / 2 - 1e-9);
    r = inverse({1.5, pole, 0}, {-1, sign * 0.3, 0}, wgs84);
    EXPECT_NEAR(r.distance, sine, 0.02);
    r = inverse({1.5, sign * 0.3, 0}, {-1, pole, 0}, wgs84);
    EXPECT_NEAR(r.distance, sine, 0.02);
  }
  // Within 1e-14 of the pole is at the pole, further off is not.
  EXPECT_EQ(inverse({2, 0.7, 0}, {-1, kPi / 2 - 9e-15, 0}, wgs84).azimuth, 0);
  EXPECT_NE(inverse({2, 0.7, 0}, {-1, kPi / 2 - 2e-14, 0}, wgs84).azimuth, 0);
  EXPECT_EQ(inverse({2, kPi / 2 - 9e-15, 0}, {-1, 0.7, 0}, wgs84).azimuth, kPi);
  // The sphere takes the meridian as well.
  EXPECT_NEAR(inverse({2, 0.7, 0}, {-1, kPi / 2, 0}, {1, 0}).distance, kPi / 2 - 0.7, 1e-15);
}

TEST(GeodesicInverse, AntipodalOnAMeridianCircle) {
  const auto wgs84 = Ellipsoid::wgs84();
  const double half = 2 * arc_of(wgs84, kPi / 2);
  for (const double lat : {0.0, 0.5, -0.5}) {
    for (const double turn : {kPi, -kPi, kPi + 5e-15}) {
      const auto r = inverse({1, lat, 0}, {1 - turn, -lat, 0}, wgs84);
      EXPECT_EQ(r.status, TW_SUCCESS);
      EXPECT_EQ(r.distance, half);
      EXPECT_EQ(r.azimuth, 0);
      EXPECT_EQ(r.back, 0);
    }
  }
  // The latitudes are compared exactly.
  EXPECT_NE(inverse({1, 0.5, 0}, {1 - kPi, -std::nextafter(0.5, 1), 0}, wgs84).distance, half);
}

TEST(GeodesicInverse, MeridianFailures) {
  const auto wgs84 = Ellipsoid::wgs84();
  auto r = inverse({1, 2, 0}, {1, 0.5, 0}, wgs84);
  EXPECT_EQ(r.status, TW_BAD_LATITUDE);
  EXPECT_EQ(r.distance, kUntouched);
  EXPECT_EQ(r.azimuth, kUntouched + 2 * kPi);  // the caller's own value, brought up
  EXPECT_EQ(r.back, kUntouched + 2 * kPi);
  TWstatus status = 0;
  double azimuth = 5, back = -1e-13, distance = 7;
  TWgeodesic_inv({1, 2, 0}, {1, 0.5, 0}, wgs84.a, wgs84.e, &azimuth, &back, &distance, &status);
  EXPECT_EQ(azimuth, 5);
  EXPECT_EQ(back, -1e-13);  // not below the margin
  // A bad end leaves its word, and the rest is computed.
  r = inverse({1, 0.5, 0}, {1, 2, 0}, wgs84);
  EXPECT_EQ(r.status, TW_BAD_LATITUDE);
  EXPECT_NE(r.distance, kUntouched);
  EXPECT_NE(r.azimuth, kUntouched);
  r = inverse({1, 0.5, 0}, {1, 0.6, 0}, {6e6, 1});
  EXPECT_EQ(r.status, TW_BAD_ECCENTRICITY);
  EXPECT_EQ(r.distance, kUntouched);
  r = inverse({1, 0.5, 0}, {1, 0.6, 0}, {-1, 0.08});
  EXPECT_EQ(r.status, TW_BAD_SEMI_MAJOR);
  // An information word does not stop.
  r = inverse({1, kPi / 2 + 5e-13, 0}, {2, 0.6, 0}, wgs84);
  EXPECT_EQ(r.status, TW_SUCCESS);  // of the last call
  EXPECT_NEAR(r.distance, arc_of(wgs84, kPi / 2) - arc_of(wgs84, 0.6), 1e-8);
}

TEST(GeodesicInverse, Sphere) {
  const Ellipsoid unit = {1, 0};
  auto r = inverse({0, 0, 0}, {kPi / 2, kPi / 4, 0}, unit);
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_NEAR(r.distance, kPi / 2, 1e-15);
  EXPECT_NEAR(r.azimuth, kPi / 4, 1e-15);
  EXPECT_NEAR(r.back, 1.5 * kPi, 1e-15);  // brought up from below zero
  // A longitude difference of more than half a turn, either way.
  for (const double turn : {-2 * kPi, 0.0, 2 * kPi, 6 * kPi}) {
    r = inverse({0.1, 0.3, 0}, {0.9 - turn, 0.8, 0}, unit);
    const double cos_s =
        std::sin(0.3) * std::sin(0.8) + std::cos(0.3) * std::cos(0.8) * std::cos(0.8);
    EXPECT_NEAR(r.distance, std::acos(cos_s), 1e-14);
    EXPECT_NEAR(std::sin(r.azimuth), std::cos(0.8) * std::sin(0.8) / std::sin(r.distance), 1e-14);
  }
  // Antipodal but for a hair: the haversine does not leave its range.
  r = inverse({0, 0.3, 0}, {kPi - 1e-9, -0.3, 0}, {-3, 0});
  EXPECT_NEAR(r.distance, 3 * kPi, 1e-7);  // the size of it, whatever the sign of a
}

TEST(GeodesicInverse, AlongTheEquatorGivesTheArcOfIt) {
  const auto wgs84 = Ellipsoid::wgs84();
  for (const double lon : {1e-6, 0.5, 2.0, 3.1}) {
    auto r = inverse({0, 0, 0}, {lon, 0, 0}, wgs84);
    EXPECT_EQ(r.status, TW_SUCCESS);
    EXPECT_NEAR(r.distance, wgs84.a * lon, wgs84.a * 1e-15);
    EXPECT_NEAR(r.azimuth, kPi / 2, 1e-15);
    EXPECT_NEAR(r.back, 1.5 * kPi, 1e-15);
    r = inverse({lon, 0, 0}, {0, 0, 0}, wgs84);
    EXPECT_NEAR(r.azimuth, 1.5 * kPi, 1e-15);
    EXPECT_NEAR(r.back, kPi / 2, 1e-15);
  }
  // The short way round.
  EXPECT_NEAR(inverse({3, 0, 0}, {-3, 0, 0}, wgs84).distance, wgs84.a * (2 * kPi - 6), 1e-8);
}

TEST(GeodesicInverse, OnAParallelIsShorterThanTheParallel) {
  const auto wgs84 = Ellipsoid::wgs84();
  double radius = 0;
  TWstatus status = 0;
  TWRparal(wgs84.a, wgs84.e, degrees(40), &radius, &status);
  const auto r = inverse({0, degrees(40), 0}, {degrees(20), degrees(40), 0}, wgs84);
  EXPECT_LT(r.distance, radius * degrees(20) - 3000);
  EXPECT_GT(r.distance, radius * degrees(20) * 0.99);
  EXPECT_NEAR(r.azimuth + r.back, 2 * kPi, 1e-12);  // symmetrical about the middle
}

TEST(GeodesicInverse, NearlyAntipodalPointsAreNotSolved) {
  // What stays is a times the sine of the arc on the auxiliary sphere.
  const auto wgs84 = Ellipsoid::wgs84();
  const double lat1 = degrees(0.5), lat2 = degrees(-0.4), dl = degrees(179.5);
  const auto r = inverse({0, lat1, 0}, {dl, lat2, 0}, wgs84);
  EXPECT_EQ(r.status, TW_SUCCESS);
  const double cos_arc = sin_reduced(wgs84.e, lat1) * sin_reduced(wgs84.e, lat2) +
                         cos_reduced(wgs84.e, lat1) * cos_reduced(wgs84.e, lat2) * std::cos(dl);
  EXPECT_NEAR(r.distance, wgs84.a * std::sqrt(1 - cos_arc * cos_arc), 1e-6);
  EXPECT_LT(r.distance, 70000);
  EXPECT_GT(r.distance, 20000);
}

TEST(GeodesicInverse, OnAUnitEllipsoidTheIterationEndsTooSoon) {
  // Its limit of 0.0001 is not scaled: the change falls below it before it is small enough to be
  // accepted, and the first estimate stays.
  const double e = 0.0818;
  const auto r = inverse({0, 0.3, 0}, {0.9, 0.8, 0}, {1, e});
  const double cos_arc = sin_reduced(e, 0.3) * sin_reduced(e, 0.8) +
                         cos_reduced(e, 0.3) * cos_reduced(e, 0.8) * std::cos(0.9);
  EXPECT_NEAR(r.distance, std::sqrt(1 - cos_arc * cos_arc), 1e-15);
  // In metres the same line is solved.
  const double solved = inverse({0, 0.3, 0}, {0.9, 0.8, 0}, {6e6, e}).distance / 6e6;
  EXPECT_NEAR(solved, std::acos(cos_arc), 5e-3);
  EXPECT_GT(solved, r.distance + 0.05);
}

TEST(GeodesicInverse, EveryArgumentEnds) {
  const auto wgs84 = Ellipsoid::wgs84();
  for (const double odd : {kNaN, kInfinity, -kInfinity, 1e300, -1e300}) {
    inverse({odd, 0.2, 0}, {1, 0.3, 0}, wgs84);
    inverse({0, odd, 0}, {1, 0.3, 0}, wgs84);
    inverse({0, 0.2, 0}, {1, odd, 0}, wgs84);
    inverse({0, 0.2, 0}, {1, 0.3, 0}, {odd, wgs84.e});
    inverse({0, 0.2, 0}, {1, 0.3, 0}, {wgs84.a, odd});
    inverse({odd, 0.2, 0}, {1, 0.3, 0}, {1, 0});
  }
  EXPECT_TRUE(std::isnan(inverse({kNaN, 0.2, 0}, {1, 0.3, 0}, wgs84).azimuth));
}

TEST(GeodesicInverse, ComesBackByTheDirectProblem) {
  const auto clarke = Ellipsoid::clarke_1866();
  std::mt19937 random(11);
  std::uniform_real_distribution<double> lon(-1.2, 1.2), lat(-1.2, 1.2);
  for (int i = 0; i < 500; ++i) {
    const CoordinateTriple start = {lon(random), lat(random), 5};
    const CoordinateTriple end = {start.x + lon(random), lat(random), 6};
    const auto s = inverse(start, end, clarke);
    if (std::fabs(std::cos(s.azimuth)) < 0.02 || std::fabs(std::cos(s.back)) < 0.02) continue;
    const auto r = direct(start, s.azimuth, s.distance, clarke);
    // the inverse is good to a tenth of a millimetre
    expect_near(r.end, end.x, end.y, 5, 1e-4 / 6.4e6 / std::cos(end.y));
    EXPECT_NEAR(std::remainder(r.back - s.back, 2 * kPi), 0, 1e-8);
  }
}

TEST(GeodesicInverse, AgreesWithGeographicLib) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const auto wgs84 = Ellipsoid::wgs84();
  const GeographicLib::Geodesic peer(wgs84.a, 1 / 298.257223563);
  std::mt19937 random(5);
  std::uniform_real_distribution<double> lon(-180, 180), lat(-88, 88);
  int compared = 0;
  for (int i = 0; i < 4000; ++i) {
    const double lat1 = lat(random), lon1 = lon(random);
    double lat2 = lat(random), lon2 = lon(random);
    if (i % 4 == 0) {  // short lines
      lat2 = lat1 + lat2 * 1e-3;
      lon2 = lon1 + lon2 * 1e-3;
    }
    double s = 0, az1 = 0, az2 = 0;
    const double arc = peer.Inverse(lat1, lon1, lat2, lon2, s, az1, az2);
    // Away from the antipode, and from lines that leave a point due east or west, whose vertex may
    // lie ahead on the sphere and behind on the ellipsoid.
    const auto crosswise = [](double az) { return std::fabs(std::cos(degrees(az))) < 0.02; };
    if (arc > 175 || crosswise(az1) || crosswise(az2)) continue;
    ++compared;
    const auto r =
        inverse({degrees(lon1), degrees(lat1), 0}, {degrees(lon2), degrees(lat2), 0}, wgs84);
    EXPECT_NEAR(r.distance, s, 1e-4) << lat1 << " " << lon1 << " " << lat2 << " " << lon2;
    // metres across the line at its other end
    EXPECT_NEAR(std::remainder(r.azimuth - degrees(az1), 2 * kPi) * s, 0, 1e-3);
    EXPECT_NEAR(std::remainder(r.back - degrees(az2 + 180), 2 * kPi) * s, 0, 1e-3);
    EXPECT_GE(r.azimuth, -1e-12);
    EXPECT_LT(r.azimuth, 2 * kPi);
  }
  EXPECT_GT(compared, 3000);
#endif
}

TEST(GeodesicInverse, ALineDueEastMayBeDecidedOnTheWrongSide) {
  // At the end the sphere's azimuth and the ellipsoid's lie on different sides of due east: the
  // iteration rests on the vertex, and the length is short by 1.4 km of 11273.
  const auto r =
      inverse({degrees(178.65328824776589), degrees(-9.0419705354068896), 0},
              {degrees(-84.361366921366553), degrees(51.870062104361466), 0}, Ellipsoid::wgs84());
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_LT(r.distance, 11273003.735 - 1000);  // GeographicLib's figure
  EXPECT_GT(r.distance, 11273003.735 - 2000);
}

}  // namespace
