#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

const double kE = Ellipsoid::wgs84().e;

struct Equidistant {
  double e, lon0, lat0, n1 = kUntouched, g = kUntouched;

  Equidistant(double eccentricity, double lon, double lat) : e(eccentricity), lon0(lon), lat0(lat) {
    TWaz_eq_c(e, lat0, &n1, &g);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWaz_eq_f(e, lon0, lat0, n1, g, static_cast<int32_t>(in.size()), in.data(), out.data(),
              &status);
    return status;
  }
  CoordinateTriple forward(const CoordinateTriple& in) const {
    return one_point(in, [&](const Points& i, Points& o) { return forward(i, o); });
  }
  CoordinateTriple inverse(const CoordinateTriple& in) const {
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWaz_eq_i(e, lon0, lat0, n1, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(out.z, kUntouched);
    return out;
  }
};

double arc(double e, double lat) {
  double distance = kUntouched;
  TWstatus status = 0;
  TWmerid_dist_f(1, e, lat, &distance, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return distance;
}

TEST(AzimuthalEquidistant, Constants) {
  const Equidistant p(0.6, 0, degrees(30));
  EXPECT_NEAR(p.n1, 1 / std::sqrt(1 - 0.09), 1e-15);
  EXPECT_NEAR(p.g, 0.3 / 0.8, 1e-15);
}

TEST(AzimuthalEquidistant, AQuarterTurnFromAnEquatorialOrigin) {
  // Step by step, with the tangent of the rounded auxiliary latitude: the arc sine at 1 turns one
  // last digit of its argument into 1e-8.
  const double e = 0.0818191908426215;
  const double lat = 0.6316844268433592;
  const Equidistant p(e, 0, 0);
  const double psi = std::atan(std::tan(lat) * (1 - e * e));
  const double azimuth = std::atan2(1.0, std::tan(psi) - std::cos(kPi / 2) * 0);
  const double s = std::asin(std::cos(psi) / std::sin(azimuth));
  const double h2 = std::pow(std::cos(azimuth) * e / std::sqrt(1 - e * e), 2);
  const double c = s * (1 - s * s * h2 * (1 - h2) / 6 + std::pow(s, 4) / 120 * (4 - 7 * h2) * h2);
  expect_near(p.forward({kPi / 2, lat, 0}), std::sin(azimuth) * c, std::cos(azimuth) * c, 1e-14);
}

TEST(AzimuthalEquidistant, PolarExample) {
  // Snyder 1987, p. 339: International ellipsoid, north pole, 100 W, point 80 N 5 E.
  const double a = 6378388, e = std::sqrt(0.00672267);
  const Equidistant p(e, degrees(-100), kPi / 2);
  const CoordinateTriple out = p.forward({degrees(5), degrees(80), 0});
  // The series is within some decimetres 1100 km from its origin.
  EXPECT_NEAR(out.x * a, 1078828.3, 0.15);
  EXPECT_NEAR(out.y * a, 289071.2, 0.15);
  // So is the inverse, which takes a polar longitude straight from the azimuth.
  const CoordinateTriple back = p.inverse(out);
  EXPECT_NEAR(back.x, degrees(5), 1e-14);
  EXPECT_NEAR(back.y, degrees(80), 3e-8);
  const Equidistant south(e, 0.3, -kPi / 2);
  EXPECT_NEAR(south.inverse({0.1, 0.2, 0}).x, std::atan2(0.1, 0.2) + 0.3, 1e-15);
}

TEST(AzimuthalEquidistant, OriginAndItsLimits) {
  const Equidistant p(kE, 0.3, 0.7);
  expect_near(p.forward({0.3, 0.7, 0}), 0, 0, 0);
  expect_near(p.forward({0.3 + 0.9e-12, 0.7 - 0.9e-12, 0}), 0, 0, 0);
  EXPECT_NE(p.forward({0.3 + 1.1e-12, 0.7, 0}).x, 0);
  EXPECT_NE(p.forward({0.3, 0.7 + 1.1e-12, 0}).y, 0);
  const CoordinateTriple back = p.inverse({0.9e-9, 0, 0});
  EXPECT_EQ(back.x, 0.3);
  EXPECT_EQ(back.y, 0.7);
  EXPECT_NE(p.inverse({1.1e-9, 0, 0}).x, 0.3);
}

TEST(AzimuthalEquidistant, SphereInClosedForm) {
  const Equidistant p(0, 0.2, 0);
  expect_near(p.forward({1.4, 0, 0}), 1.2, 0, 1e-15);
  expect_near(p.forward({0.2 - 2.5, 0, 0}), -2.5, 0, 1e-14);  // past a quarter turn
  expect_near(p.forward({0.2, -1.1, 0}), 0, -1.1, 1e-15);
  expect_near(p.forward({0.2, 0.8, 0}), 0, 0.8, 1e-15);
  // The poles, from an origin off the equator: the azimuth is exactly 0 or -pi.
  const Equidistant q(0, 0.2, 0.5);
  CoordinateTriple out = q.forward({2, kPi / 2, 0});
  expect_near(out, 0, kPi / 2 - 0.5, 1e-15);
  EXPECT_EQ(out.x, 0);
  out = q.forward({0.7, -kPi / 2, 0});
  expect_near(out, 0, -kPi / 2 - 0.5, 1e-15);
  EXPECT_NE(out.x, 0);  // the sine of -pi is not quite 0
  // A polar origin: distances from the pole, whatever the longitude.
  const Equidistant north(0, 0, kPi / 2), south(0, 0, -kPi / 2);
  expect_near(north.forward({0, 1.2, 0}), 0, -(kPi / 2 - 1.2), 2e-15);
  expect_near(north.forward({0.5, 1.2, 0}), (kPi / 2 - 1.2) * std::sin(0.5),
              -(kPi / 2 - 1.2) * std::cos(0.5), 1e-14);
  expect_near(south.forward({0, -1.2, 0}), 0, kPi / 2 - 1.2, 2e-15);
}

TEST(AzimuthalEquidistant, MeridianRoad) {
  // Down the meridian of origin, more than a quarter turn away, the distance is the arc itself.
  const Equidistant p(kE, 0.2, 0.9);
  CoordinateTriple out = p.forward({0.2, -1.2, 0});
  expect_near(out, 0, -(arc(kE, 0.9) + arc(kE, 1.2)), 1e-15);
  // Over the pole, on the other side of the globe.
  out = p.forward({0.2 + kPi, 1.1, 0});
  expect_near(out, 0, 2 * arc(kE, kPi / 2) - arc(kE, 0.9) - arc(kE, 1.1), 1e-15);
  out = p.forward({0.2 - kPi, 0.1, 0});
  expect_near(out, 0, 2 * arc(kE, kPi / 2) - arc(kE, 0.9) - arc(kE, 0.1), 1e-15);
  // From a southern origin the way over the pole is the southern one.
  const Equidistant south(kE, 0.2, -0.9);
  out = south.forward({0.2 + kPi, -1.1, 0});
  expect_near(out, 0, -(2 * arc(kE, kPi / 2) - arc(kE, 0.9) - arc(kE, 1.1)), 1e-15);
  // Within a quarter turn on the same meridian the series serves, close to the arc.
  out = p.forward({0.2, 0.7, 0});
  EXPECT_NEAR(out.y, arc(kE, 0.7) - arc(kE, 0.9), 1e-9);
  EXPECT_NE(out.y, arc(kE, 0.7) - arc(kE, 0.9));
}

TEST(AzimuthalEquidistant, MeridianRoadFromThePoles) {
  // The azimuth is taken from the longitude: half a turn less d from the north pole, d from the
  // south.
  const Equidistant north(kE, 0.2, kPi / 2), south(kE, 0.2, -kPi / 2);
  const double quarter = arc(kE, kPi / 2);
  CoordinateTriple out = north.forward({0.2, -0.5, 0});
  expect_near(out, 0, -(quarter + arc(kE, 0.5)), 1e-15);
  out = south.forward({0.2, 0.5, 0});
  expect_near(out, 0, quarter + arc(kE, 0.5), 1e-15);
}

TEST(AzimuthalEquidistant, StatusIsThatOfTheLastArc) {
  // A latitude beyond the pole is refused by the first arc, and the word is that of the last one.
  const Equidistant p(kE, 0.2, 0.9);
  Points out = untouched(1);
  EXPECT_EQ(p.forward({{0.2, -1.7, 0}}, out), TW_SUCCESS);
  EXPECT_NE(out[0].y, kUntouched);
  // An origin beyond the pole by 5e-13 is held there, which the arc of the origin tells.
  const Equidistant beyond(kE, 0.2, kPi / 2 + 5e-13);
  EXPECT_EQ(beyond.forward({{0.2, -1, 0}}, out), TW_I_LATITUDE_LIMITED);
  // The word stands when later points take the series.
  out = untouched(2);
  EXPECT_EQ(beyond.forward({{0.2, -1, 0}, {0.5, 1.4, 0}}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_NE(out[1].x, kUntouched);
  // Over the pole the quarter arc is the last, and does not hold anything.
  EXPECT_EQ(beyond.forward({{0.2 + kPi, -0.5, 0}}, out), TW_SUCCESS);
}

TEST(AzimuthalEquidistant, EquatorIsNoMeridian) {
  // From an equatorial origin a point of the equator lies due east: the series, as a circle.
  const Equidistant p(kE, 0, 0);
  expect_near(p.forward({2, 0, 0}), 2, 0, 1e-14);
  expect_near(p.forward({-3, 0, 0}), -3, 0, 1e-14);
  expect_near(p.inverse({1.3, 0, 0}), 1.3, 0, 1e-14);
}

TEST(AzimuthalEquidistant, InverseBeyondAQuarterTurnOfLongitude) {
  const Equidistant p(0, 0.1, 0.9);
  for (const double d : {2.0, -2.0, 3.0, -3.0}) {
    const CoordinateTriple in = {0.1 + d, 0.8, 0};
    expect_near(p.inverse(p.forward(in)), in.x, in.y, 1e-14);
  }
  // Straight over the pole: the azimuth is exactly 0, and the longitude half a turn away.
  const CoordinateTriple over = p.inverse({0, kPi / 2 - 0.9 + 0.3, 0});
  EXPECT_EQ(over.x, kPi + 0.1);
  EXPECT_NEAR(over.y, kPi / 2 - 0.3, 1e-14);
  // Short of the pole it is the origin's own.
  EXPECT_EQ(p.inverse({0, kPi / 2 - 0.9 - 0.3, 0}).x, 0.1);
}

TEST(AzimuthalEquidistant, PolarLimitsOfTheInverse) {
  // The pole is recognised by the sine: 1e-9, that is 4.5e-5 radians.
  const CoordinateTriple in = {0.1, 0.2, 0};
  EXPECT_EQ(Equidistant(0, 0, kPi / 2 - 4.4e-5).inverse(in).x, std::atan2(0.1, -0.2));
  EXPECT_NE(Equidistant(0, 0, kPi / 2 - 4.6e-5).inverse(in).x, std::atan2(0.1, -0.2));
  EXPECT_EQ(Equidistant(0, 0, -kPi / 2 + 4.4e-5).inverse(in).x, std::atan2(0.1, 0.2));
  EXPECT_NE(Equidistant(0, 0, -kPi / 2 + 4.6e-5).inverse(in).x, std::atan2(0.1, 0.2));
}

TEST(AzimuthalEquidistant, ScaleIsTheDerivativeAcrossTheRay) {
  // On the meridian of origin k lies across the ray.
  const Equidistant p(0, 0.3, 0.4);
  for (const double lat : {-0.6, 0.1, 1.2}) {
    const auto expected =
        numeric_scale([&](CoordinateTriple q) { return p.forward(q); }, 0.3, lat, 0);
    const CoordinateTriple in = {0.3, lat, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWaz_eq_s(0.3, 0.4, 2, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(out.x, 2 * expected.x, 1e-10);
    EXPECT_EQ(out.y, 2);
    EXPECT_NEAR(expected.y, 1, 1e-10);
    EXPECT_EQ(out.z, out.x * 2);
  }
  // Snyder 1987, p. 337: c = 148.97 degrees from 40 N 100 W to 20 S 100 E.
  const CoordinateTriple in = {degrees(100), degrees(-20), 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWaz_eq_s(degrees(-100), degrees(40), 1, 1, &in, &out, &status);
  const double c = std::hypot(-5.8311398, 5.5444634) / 3;
  EXPECT_NEAR(out.x, c / std::sin(c), 1e-6);
}

TEST(AzimuthalEquidistant, ScaleFromThePoles) {
  const CoordinateTriple in = {2, 0.5, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWaz_eq_s(0, kPi / 2 - 0.9e-10, 3, 1, &in, &out, &status);
  EXPECT_EQ(out.x, (kPi / 2 - 0.5) * 3 / std::cos(0.5));
  TWaz_eq_s(0, -kPi / 2 + 0.9e-10, 3, 1, &in, &out, &status);
  EXPECT_EQ(out.x, (kPi / 2 + 0.5) * 3 / std::cos(0.5));
  TWaz_eq_s(0, kPi / 2 - 1.1e-10, 3, 1, &in, &out, &status);
  EXPECT_NE(out.x, (kPi / 2 - 0.5) * 3 / std::cos(0.5));
  TWaz_eq_s(0, -kPi / 2 + 1.1e-10, 3, 1, &in, &out, &status);
  EXPECT_NE(out.x, (kPi / 2 + 0.5) * 3 / std::cos(0.5));
  EXPECT_EQ(status, TW_SUCCESS);
}

TEST(AzimuthalEquidistant, ScaleAtTheOriginIsNotANumber) {
  const CoordinateTriple in = {0, 0, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWaz_eq_s(0, 0, 1, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out.x));
  EXPECT_EQ(out.y, 1);
}

TEST(AzimuthalEquidistant, ScaleFillsBeyondThePoles) {
  const double past = std::nextafter(kPi / 2, 2);
  const Points in = {{0, past, 0}, {0, -past, 0}, {kPi / 2, 0, 0}, {0, kPi / 2, 0}};
  Points out = untouched(4);
  TWstatus status = 0;
  TWaz_eq_s(0, 0, 2, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  expect_near(out[0], 2, 2, 4, 0);
  expect_near(out[1], 2, 2, 4, 0);
  expect_near(out[2], kPi, 2, 2 * kPi, 1e-15);
  expect_near(out[3], kPi, 2, 2 * kPi, 1e-15);
}

TEST(AzimuthalEquidistant, RoundTripInPlace) {
  std::mt19937 random(48);
  std::uniform_real_distribution<double> offset(-0.05, 0.05);
  for (const double lat0 : {0.0, 0.6, -1.1}) {
    const Equidistant p(kE, 0.1, lat0);
    Points in(200);
    for (auto& q : in) q = {0.1 + offset(random), lat0 + offset(random), 5};
    Points out = in;
    EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
    TWstatus status = 0;
    TWaz_eq_i(p.e, p.lon0, p.lat0, p.n1, 200, out.data(), out.data(), &status);
    // Forward and inverse are different series: they meet to a millimetre within 450 km.
    for (std::size_t i = 0; i < in.size(); ++i) expect_near(out[i], in[i].x, in[i].y, 5, 2e-10);
  }
}

TEST(AzimuthalEquidistant, NothingToDoAndNotANumber) {
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1}) {
    TWstatus status = 0;
    TWaz_eq_f(kE, 0, 0, 1, 0, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWaz_eq_i(kE, 0, 0, 1, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWaz_eq_s(0, 0, 1, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(p);
  }
  const Equidistant q(kE, 0, 0.5);
  EXPECT_TRUE(std::isnan(q.forward({kNaN, 0.1, 0}).x));
  EXPECT_TRUE(std::isnan(q.inverse({kNaN, 0.1, 0}).y));
}

TEST(AzimuthalEquidistant, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const auto [a, e] = Ellipsoid::grs80();
  for (const double lat0 : {-60.0, 0.0, 35.0}) {
    const ProjPeer sphere("+proj=aeqd +R=1 +lon_0=12 +lat_0=" + std::to_string(lat0));
    const ProjPeer ellipsoid("+proj=aeqd +ellps=GRS80 +lon_0=12 +lat_0=" + std::to_string(lat0));
    ASSERT_TRUE(sphere.ok());
    ASSERT_TRUE(ellipsoid.ok());
    const Equidistant s(0, degrees(12), degrees(lat0)), p(e, degrees(12), degrees(lat0));
    for (double lat = -85; lat < 90; lat += 17) {
      for (double lon = -150; lon < 190; lon += 19) {
        const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
        const CoordinateTriple expected = sphere.forward(in);
        expect_near(s.forward(in), expected.x, expected.y, 1e-12);  // some lie by the antipode
      }
    }
    // The peer solves the geodesic.  The series has its distance within millimetres 600 km away,
    // and the azimuth of the normal section, which is off that of the geodesic by up to
    // e^2 s^2 / 12, that is 6e-6.
    for (double dlat = -4; dlat <= 4; dlat += 1.6) {
      for (double dlon = -4; dlon <= 4; dlon += 1.6) {
        const CoordinateTriple in = {degrees(12 + dlon), degrees(lat0 + dlat), 0};
        const CoordinateTriple expected = ellipsoid.forward(in);
        const CoordinateTriple out = p.forward(in);
        EXPECT_NEAR(std::hypot(out.x, out.y) * a, std::hypot(expected.x, expected.y), 5e-3);
        expect_near(out, expected.x / a, expected.y / a, 6e-6 * std::hypot(out.x, out.y));
      }
    }
  }
#endif
}

}  // namespace
