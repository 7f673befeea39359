#include <gtest/gtest.h>

#include "support/points.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

struct Answer {
  double value = kUntouched;
  TWstatus status = 0;
};

using OfTwo = void (*)(double, double, double*, TWstatus*);
using OfThree = void (*)(double, double, double, double*, TWstatus*);

Answer ask(OfTwo function, double first, double second) {
  Answer answer;
  function(first, second, &answer.value, &answer.status);
  return answer;
}

Answer ask(OfThree function, double a, double e, double third) {
  Answer answer;
  function(a, e, third, &answer.value, &answer.status);
  return answer;
}

Answer radius(OfThree f, double lat) {
  const auto [a, e] = Ellipsoid::wgs84();
  return ask(f, a, e, lat);
}

TEST(Radii, AtThePolesAndTheEquator) {
  const auto [a, e] = Ellipsoid::wgs84();
  const double b = 6356752.314245;  // published semi-minor axis
  EXPECT_DOUBLE_EQ(radius(TWRparal, 0).value, a);
  EXPECT_NEAR(radius(TWRmerid, 0).value, b * b / a, 1e-6);
  EXPECT_NEAR(radius(TWRmerid, kPi / 2).value, a * a / b, 1e-6);
  EXPECT_NEAR(radius(TWRparal, kPi / 2).value, 0, 1e-9);
  EXPECT_EQ(radius(TWRparal, kPi / 2).status, TW_SUCCESS);
  EXPECT_NEAR(radius(TWgaussian_R, 0).value, b, 1e-6);
  EXPECT_NEAR(radius(TWgaussian_R, kPi / 2).value, a * a / b, 1e-6);
}

TEST(Radii, PublishedValuesAtFortyFiveDegrees) {
  // GRS 80, Moritz 2000: M(45) = 6367381.8156, N(45) = 6388838.2901
  const auto [a, e] = Ellipsoid::grs80();
  const double lat = degrees(45);
  EXPECT_NEAR(ask(TWRmerid, a, e, lat).value, 6367381.8156, 1e-3);
  EXPECT_NEAR(ask(TWRparal, a, e, lat).value, 6388838.2901 * std::cos(lat), 1e-3);
  EXPECT_NEAR(ask(TWgaussian_R, a, e, lat).value, std::sqrt(6367381.8156 * 6388838.2901), 1e-3);
}

TEST(Radii, NoToleranceBeyondThePole) {
  const double past = std::nextafter(kPi / 2, 2);
  for (const double lat : {past, -past}) {
    EXPECT_EQ(radius(TWRparal, lat).status, TW_BAD_LATITUDE);
    EXPECT_EQ(radius(TWRparal, lat).value, kUntouched);
    EXPECT_EQ(radius(TWRmerid, lat).status, TW_BAD_LATITUDE);
    EXPECT_EQ(radius(TWRmerid, lat).value, kUntouched);
  }
  // the Gaussian radius does not look at the latitude
  EXPECT_EQ(radius(TWgaussian_R, 2).status, TW_SUCCESS);
}

TEST(EqualSpheres, PublishedRadii) {
  // GRS 80, Moritz 2000: R2 (equal surface) = 6371007.1810, R3 (equal volume) = 6371000.7900
  const auto [a, e] = Ellipsoid::grs80();
  EXPECT_NEAR(ask(TWeq_surf_R, a, e).value, 6371007.1810, 2e-3);
  EXPECT_NEAR(ask(TWeq_vol_R, a, e).value, 6371000.7900, 1e-4);
}

TEST(EqualSpheres, ASeriesNotTheClosedForm) {
  // at e = 0.5 by hand: 1 - (67/3024 / 16 + 17/360 / 4 + 1/6) / 4 with rising powers of 1/4
  const double by_hand = 1 - (0.25 / 6 + 17.0 / 360 / 16 + 67.0 / 3024 / 64);
  EXPECT_NEAR(ask(TWeq_surf_R, 1, 0.5).value, by_hand, 1e-15);
}

TEST(EqualSpheres, EccentricityOfOneIsRefused) {
  for (const auto f : {TWeq_surf_R, TWeq_vol_R}) {
    EXPECT_EQ(ask(f, 7, 0).value, 7);
    EXPECT_EQ(ask(f, 7, 1).status, TW_BAD_ECCENTRICITY);
    EXPECT_EQ(ask(f, 7, 1).value, kUntouched);
    EXPECT_EQ(ask(f, 7, -1).status, TW_BAD_ECCENTRICITY);
    EXPECT_EQ(ask(f, 7, std::nextafter(1, 0)).status, TW_SUCCESS);
  }
  EXPECT_EQ(ask(TWgaussian_R, 7, 1, 0.3).status, TW_BAD_ECCENTRICITY);
  EXPECT_EQ(ask(TWgaussian_R, 7, 1, 0.3).value, kUntouched);
}

TEST(MeridianArc, PublishedQuarterAndAnIntegral) {
  const auto [a, e] = Ellipsoid::grs80();
  // Moritz 2000: quarter of the meridian 10001965.7293
  EXPECT_NEAR(ask(TWmerid_dist_f, a, e, kPi / 2).value, 10001965.7293, 1e-4);
  // Simpson's rule over the radius of curvature is another road to the same arc
  const auto arc = [a = a, e = e](double lat) {
    const int n = 2000;
    double sum = 0;
    for (int i = 0; i <= n; ++i) {
      const double s = std::sin(lat * i / n);
      const double m = a * (1 - e * e) / std::pow(1 - e * e * s * s, 1.5);
      sum += m * (i == 0 || i == n ? 1 : i % 2 ? 4 : 2);
    }
    return sum * lat / n / 3;
  };
  for (const double lat : {-1.3, -0.4, 0.2, 0.7, 1.2, 1.5}) {
    // the series stops at n^4: n^5 a is about 1e-7 m
    EXPECT_NEAR(ask(TWmerid_dist_f, a, e, lat).value, arc(lat), 1e-6);
  }
}

TEST(MeridianArc, SphereBelowTheLimit) {
  EXPECT_EQ(ask(TWmerid_dist_f, 10, 0, 0.3).value, 3);
  EXPECT_EQ(ask(TWmerid_dist_f, 10, 1e-13, 0.3).value, 3);
  EXPECT_NEAR(ask(TWmerid_dist_f, 10, 1e-12, 0.3).value, 3, 1e-14);
  EXPECT_EQ(ask(TWmerid_dist_i, 10, 0, 3).value, 0.3);
}

TEST(MeridianArc, ChecksComeInOrder) {
  for (const auto f : {TWmerid_dist_f, TWmerid_dist_i}) {
    EXPECT_EQ(ask(f, -1, 1, 9).status, TW_BAD_ECCENTRICITY);
    EXPECT_EQ(ask(f, -1, -0.1, 9).status, TW_BAD_ECCENTRICITY);
    EXPECT_EQ(ask(f, 0, 0.1, 9).status, TW_BAD_SEMI_MAJOR);
    EXPECT_EQ(ask(f, -1, 0.1, 9).status, TW_BAD_SEMI_MAJOR);
    EXPECT_EQ(ask(f, 1, 0.1, 9).status, TW_BAD_LATITUDE);
    for (const double e : {1.0, 0.1}) EXPECT_EQ(ask(f, 0, e, 9).value, kUntouched);
    EXPECT_EQ(ask(f, 1, 0.1, 9).value, kUntouched);
  }
}

TEST(MeridianArc, AHairBeyondThePole) {
  const auto [a, e] = Ellipsoid::wgs84();
  const double quarter = ask(TWmerid_dist_f, a, e, kPi / 2).value;
  for (const double sign : {1.0, -1.0}) {
    const Answer held = ask(TWmerid_dist_f, a, e, sign * (kPi / 2 + 5e-13));
    EXPECT_EQ(held.status, TW_I_LATITUDE_LIMITED);
    EXPECT_EQ(held.value, sign * quarter);
    const Answer beyond = ask(TWmerid_dist_f, a, e, sign * (kPi / 2 + 2e-12));
    EXPECT_EQ(beyond.status, TW_BAD_LATITUDE);
    EXPECT_EQ(beyond.value, kUntouched);
  }
}

TEST(MeridianArc, InverseLimitsAreThoseOfTheMeanTerm) {
  const auto [a, e] = Ellipsoid::wgs84();
  const double f = 1 - std::sqrt(1 - e * e);
  const double n = f / (2 - f);
  const double mean = a / (1 + n) * (1 + n * n / 4 + n * n * n * n / 64);
  for (const double sign : {1.0, -1.0}) {
    const Answer held = ask(TWmerid_dist_i, a, e, sign * mean * (kPi / 2 + 5e-13));
    EXPECT_EQ(held.status, TW_I_LATITUDE_LIMITED);
    EXPECT_EQ(held.value, sign * kPi / 2);
    const Answer beyond = ask(TWmerid_dist_i, a, e, sign * mean * (kPi / 2 + 2e-12));
    EXPECT_EQ(beyond.status, TW_BAD_LATITUDE);
    EXPECT_EQ(beyond.value, kUntouched);
    const Answer sphere = ask(TWmerid_dist_i, 2, 0, sign * 2 * (kPi / 2 + 5e-13));
    EXPECT_EQ(sphere.status, TW_I_LATITUDE_LIMITED);
    EXPECT_EQ(sphere.value, sign * kPi / 2);
    EXPECT_EQ(ask(TWmerid_dist_i, 2, 0, sign * 2 * (kPi / 2 + 2e-12)).status, TW_BAD_LATITUDE);
  }
}

TEST(MeridianArc, RoundTripAndNotANumber) {
  const auto [a, e] = Ellipsoid::clarke_1866();
  for (double lat = -1.57; lat < 1.571; lat += 0.01) {
    const double arc = ask(TWmerid_dist_f, a, e, lat).value;
    EXPECT_NEAR(ask(TWmerid_dist_i, a, e, arc).value, lat, 1e-13);
  }
  // an ellipsoid flat enough for the rounds to be taken one by one
  for (double lat = -1.5; lat < 1.51; lat += 0.1) {
    const double arc = ask(TWmerid_dist_f, 1, 0.2, lat).value;
    EXPECT_NEAR(ask(TWmerid_dist_i, 1, 0.2, arc).value, lat, 1e-12);
  }
  // rounds that never come to rest run into their limit
  EXPECT_EQ(ask(TWmerid_dist_i, a, e, kNaN).status, TW_BAD_PARAMETER);
  EXPECT_EQ(ask(TWmerid_dist_i, a, e, kNaN).value, kUntouched);
  // on a very flat ellipsoid the rounds do not settle within fifty
  EXPECT_EQ(ask(TWmerid_dist_i, 1, 0.99999, 0.9).status, TW_BAD_PARAMETER);
}

TEST(MeridianArc, DerivativeTakesTheSquare) {
  const auto [a, e] = Ellipsoid::international_1924();
  for (double lat = -1.5; lat < 1.51; lat += 0.3) {
    const double step = 1e-4;
    const double numeric = (ask(TWmerid_dist_f, a, e, lat + step).value -
                            ask(TWmerid_dist_f, a, e, lat - step).value) /
                           (2 * step);
    EXPECT_NEAR(ask(TWdM_dphi, a, e * e, lat).value / numeric, 1, 1e-9);
    // the derivative of the arc is the meridian radius
    EXPECT_NEAR(ask(TWdM_dphi, a, e * e, lat).value, ask(TWRmerid, a, e, lat).value, 2e-5);
  }
}

TEST(MeridianArc, DerivativeChecks) {
  EXPECT_EQ(ask(TWdM_dphi, -1, 1, 9).status, TW_BAD_ECCENTRICITY);
  EXPECT_EQ(ask(TWdM_dphi, 0, 0.1, 9).status, TW_BAD_SEMI_MAJOR);
  EXPECT_EQ(ask(TWdM_dphi, 1, 0.1, 9).status, TW_BAD_LATITUDE);
  EXPECT_EQ(ask(TWdM_dphi, 1, 0.1, 9).value, kUntouched);
  EXPECT_EQ(ask(TWdM_dphi, 5, -0.5, 1).value, 5);  // a negative square counts as small
  EXPECT_EQ(ask(TWdM_dphi, 5, 9e-13, 1).value, 5);
  const Answer pole = ask(TWdM_dphi, 5, 0.01, kPi / 2);
  const Answer held = ask(TWdM_dphi, 5, 0.01, -kPi / 2 - 5e-13);
  EXPECT_EQ(held.status, TW_I_LATITUDE_LIMITED);
  EXPECT_NEAR(held.value, pole.value, 1e-14);
  EXPECT_EQ(ask(TWdM_dphi, 5, 0.01, kPi / 2 + 2e-12).status, TW_BAD_LATITUDE);
}

TEST(ConformalLatitude, SnydersExampleAndTheWayBack) {
  // Snyder 1987, p. 16 and 313: Clarke 1866, lat 40 has chi = 39 48 38.2
  const double e = Ellipsoid::clarke_1866().e;
  const Answer chi = ask(TWgeod_conflat, e, degrees(40));
  EXPECT_NEAR(chi.value, 0.6947910, 2e-5);
  for (double lat = -1.57; lat < 1.571; lat += 0.05) {
    const Answer there = ask(TWgeod_conflat, e, lat);
    // exp(-isometric latitude) is another road to it
    const double es = e * std::sin(lat);
    EXPECT_NEAR(there.value, std::atan(std::sinh(std::asinh(std::tan(lat)) - e * std::atanh(es))),
                1e-14);
    EXPECT_NEAR(ask(TWconflat_geod, e, there.value).value, lat, 1e-14);
  }
}

TEST(ConformalLatitude, PolesAndBeyond) {
  const double past = std::nextafter(kPi / 2, 2);
  for (const auto f : {TWgeod_conflat, TWconflat_geod}) {
    EXPECT_NEAR(ask(f, 0.08, kPi / 2).value, kPi / 2, 1e-15);
    EXPECT_NEAR(ask(f, 0.08, -kPi / 2).value, -kPi / 2, 1e-15);
    for (const double lat : {past, -past}) {
      EXPECT_EQ(ask(f, 0.08, lat).status, TW_BAD_LATITUDE);
      EXPECT_EQ(ask(f, 0.08, lat).value, kUntouched);
    }
  }
}

TEST(ConformalLatitude, TenRoundsAreABadLatitude) {
  const Answer slow = ask(TWconflat_geod, 0.9, 0.5);
  EXPECT_EQ(slow.status, TW_BAD_LATITUDE);
  EXPECT_EQ(slow.value, kUntouched);
  EXPECT_EQ(ask(TWconflat_geod, 0.08, kNaN).status, TW_BAD_LATITUDE);
}

TEST(NormalGravity, PublishedValues) {
  // GRS 80, Moritz 2000: 9.7803267715 at the equator, 9.8321863685 at the poles, 9.806199203 at 45
  const auto [a, e] = Ellipsoid::grs80();
  const auto gravity = [a = a, e = e](double lat, double height) {
    Answer g;
    TWnormal_grav(a, e, 9.7803267715, 9.8321863685, lat, height, &g.value, &g.status);
    EXPECT_EQ(g.status, TW_SUCCESS);
    return g.value;
  };
  EXPECT_NEAR(gravity(0, 0), 9.7803267715, 1e-15);
  EXPECT_NEAR(gravity(kPi / 2, 0), 9.8321863685, 1e-14);
  EXPECT_NEAR(gravity(degrees(45), 0), 9.806199203, 1e-9);
  EXPECT_NEAR(gravity(degrees(45), 1000), 9.806199203 - 0.003086, 1e-9);
}

}  // namespace
