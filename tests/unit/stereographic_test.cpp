#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

struct Stereographic {
  double e, lon0, lat0, C = kUntouched, m0 = kUntouched, chi0 = kUntouched;

  Stereographic(double eccentricity, double lon, double lat)
      : e(eccentricity), lon0(lon), lat0(lat) {
    TWstatus status = 0;
    TWstereo_c(e, lat0, &C, &m0, &chi0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWstereo_f(e, lon0, lat0, C, m0, chi0, static_cast<int32_t>(in.size()), in.data(), out.data(),
               &status);
    return status;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWstereo_i(e, lon0, lat0, C, m0, chi0, static_cast<int32_t>(in.size()), in.data(), out.data(),
               &status);
    return status;
  }
  CoordinateTriple forward(const CoordinateTriple& in) const {
    return one_point(in, [&](const Points& i, Points& o) { return forward(i, o); });
  }
  CoordinateTriple inverse(const CoordinateTriple& in) const {
    return one_point(in, [&](const Points& i, Points& o) { return inverse(i, o); });
  }
  double scale(double k0, const Points& in, Points& out, TWstatus& status) const {
    return TWstereo_s(e, k0, lon0, lat0, C, m0, chi0, static_cast<int32_t>(in.size()), in.data(),
                      out.data(), &status);
  }
  double scale(double k0, const CoordinateTriple& in) const {
    Points out = untouched(1);
    TWstatus status = 0;
    const double k = scale(k0, {in}, out, status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(out[0].x, k);
    EXPECT_EQ(out[0].y, k);
    EXPECT_EQ(out[0].z, k * k);
    return k;
  }
};

const double kE = Ellipsoid::wgs84().e;

TEST(Stereographic, SnydersObliqueExample) {
  // Snyder 1987, p. 313: Clarke 1866, origin 40 N 100 W, scale 0.9999, point 30 N 90 W.
  const auto [a, e] = Ellipsoid::clarke_1866();
  const Stereographic s(e, degrees(-100), degrees(40));
  EXPECT_EQ(s.C, 0.0);
  const CoordinateTriple in = {degrees(-90), degrees(30), 0};
  const CoordinateTriple out = s.forward(in);
  expect_near(out, 971630.8 / a / 0.9999, -1063049.3 / a / 0.9999, 0.06 / a);
  EXPECT_NEAR(s.scale(0.9999, in), 1.0121248, 5e-8);
  expect_near(s.inverse(out), in.x, in.y, 1e-13);
}

TEST(Stereographic, SnydersPolarExample) {
  // Snyder 1987, p. 315: International ellipsoid, south pole, 100 W, true at 71 S, point 75 S 150
  // E.
  const double a = 6378388, e = std::sqrt(0.00672267);
  const Stereographic s(e, degrees(-100), -kPi / 2);
  EXPECT_LT(s.C, 0);
  EXPECT_EQ(s.m0, kUntouched);
  EXPECT_EQ(s.chi0, kUntouched);
  double k0 = kUntouched;
  TWstatus status = 0;
  TWstereo_latTs(e, s.lon0, s.lat0, s.C, kNaN, kNaN, degrees(-71), &k0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  const CoordinateTriple in = {degrees(150), degrees(-75), 0};
  const CoordinateTriple out = s.forward(in);
  expect_near(out, -1540033.6 / a / k0, -560526.4 / a / k0, 0.06 / a);
  EXPECT_NEAR(s.scale(k0, in), 0.9896255, 1e-7);
  EXPECT_NEAR(s.scale(k0, {0.3, degrees(-71), 0}), 1, 1e-15);
}

TEST(Stereographic, PolarConstant) {
  // On the sphere the factor is 2; the sign is that of the pole.
  EXPECT_DOUBLE_EQ(Stereographic(0, 0, kPi / 2).C, 2);
  EXPECT_DOUBLE_EQ(Stereographic(0, 0, -kPi / 2).C, -2);
  EXPECT_NEAR(Stereographic(kE, 0, kPi / 2).C,
              2 / std::sqrt(std::exp((1 + kE) * std::log1p(kE) + (1 - kE) * std::log1p(-kE))),
              1e-15);
  // The limit of a polar origin is 1e-14.
  EXPECT_NE(Stereographic(0, 0, kPi / 2 - 0.9e-14).C, 0);
  EXPECT_EQ(Stereographic(0, 0, kPi / 2 - 1.2e-14).C, 0);
  EXPECT_NE(Stereographic(0, 0, -kPi / 2 - 0.9e-14).C, 0);
}

TEST(Stereographic, OriginBeyondAPole) {
  double C = kUntouched, m0 = kUntouched, chi0 = kUntouched;
  TWstatus status = 0;
  TWstereo_c(kE, 1.7, &C, &m0, &chi0, &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  EXPECT_EQ(C, 0);
  EXPECT_NEAR(m0, std::cos(1.7) / std::sqrt(1 - std::pow(kE * std::sin(1.7), 2)), 1e-16);
  EXPECT_EQ(chi0, kUntouched);
}

TEST(Stereographic, SphereInClosedForm) {
  // On the sphere the distance on the plane is 2 tan(c / 2).
  const Stereographic s(0, 0.2, 0);
  expect_near(s.forward({0.2 + 1, 0, 0}), 2 * std::tan(0.5), 0, 1e-15);
  expect_near(s.forward({0.2, 0.6, 0}), 0, 2 * std::tan(0.3), 1e-15);
  const Stereographic north(0, 0.2, kPi / 2);
  expect_near(north.forward({0.2, 1, 0}), 0, -2 * std::tan((kPi / 2 - 1) / 2), 1e-15);
  // The difference of longitude is not wrapped, and need not be.
  expect_near(north.forward({0.2 + kPi / 2 + 2 * kPi, 1, 0}), 2 * std::tan((kPi / 2 - 1) / 2), 0,
              1e-14);
  const Stereographic south(0, 0.2, -kPi / 2);
  expect_near(south.forward({0.2, -1, 0}), 0, 2 * std::tan((kPi / 2 - 1) / 2), 1e-15);
  expect_near(south.forward({0.2 + kPi / 2, -1, 0}), 2 * std::tan((kPi / 2 - 1) / 2), 0, 1e-15);
}

TEST(Stereographic, OriginAndItsLimits) {
  for (const double lat0 : {0.7, kPi / 2 - 1e-15, -kPi / 2 + 1e-15}) {
    const Stereographic s(kE, 0.3, lat0);
    Points out = untouched(1);
    EXPECT_EQ(s.forward({{0.3 + 0.9e-12, lat0, 0}}, out), TW_SUCCESS);
    EXPECT_EQ(out[0].x, 0);
    EXPECT_EQ(out[0].y, 0);
    EXPECT_EQ(s.scale(0.9, {0.3 + 0.9e-12, lat0, 0}), 0.9);
    // The plane's origin comes back without any search.
    const CoordinateTriple back = s.inverse({0, 0.9e-12, 0});
    EXPECT_EQ(back.x, 0.3);
    EXPECT_EQ(back.y, lat0);
  }
  const Stereographic s(kE, 0.3, 0.7);
  EXPECT_NE(s.forward({0.3 + 1.1e-12, 0.7, 0}).x, 0);
  EXPECT_NE(s.forward({0.3, 0.7 + 1.1e-12, 0}).y, 0);
  EXPECT_NE(s.inverse({0, 1.1e-12, 0}).y, 0.7);
}

TEST(Stereographic, ForwardSkipsBeyondThePoles) {
  const double past = std::nextafter(kPi / 2, 2);
  for (const double lat0 : {0.7, kPi / 2, -kPi / 2}) {
    const Stereographic s(kE, 0, lat0);
    const Points in = {{0.1, past, 0}, {0.1, 0.2, 0}, {0.1, -past, 0}, {0.1, kPi / 2, 0}};
    Points out = untouched(4);
    EXPECT_EQ(s.forward(in, out), TW_BAD_LATITUDE);
    expect_untouched(out[0]);
    EXPECT_NE(out[1].x, kUntouched);
    expect_untouched(out[2]);
    EXPECT_NE(out[3].x, kUntouched);
    EXPECT_EQ(out[3].z, kUntouched);

    out = untouched(4);
    TWstatus status = 0;
    const double k = s.scale(0.8, in, out, status);
    EXPECT_EQ(status, TW_BAD_LATITUDE);
    EXPECT_EQ(k, out[3].x);  // of the last point
    expect_untouched(out[0]);
    expect_untouched(out[2]);
    EXPECT_NE(out[1].x, kUntouched);
    // A bad last point gives the caller's scale.
    EXPECT_EQ(s.scale(0.8, {in[1], in[0]}, out, status), 0.8);
    EXPECT_EQ(status, TW_BAD_LATITUDE);
  }
}

TEST(Stereographic, OriginIsLookedForAfterTheLatitudeTest) {
  // A lat0 a hair beyond the pole is a polar origin, and a point on it is refused.
  const double past = kPi / 2 + 5e-15;
  const Stereographic s(kE, 0, past);
  Points out = untouched(1);
  EXPECT_EQ(s.forward({{0, past, 0}}, out), TW_BAD_LATITUDE);
  expect_untouched(out[0]);
}

TEST(Stereographic, SouthPolarInverseNegatesLon0AtEachPoint) {
  const double lon0 = 0.25;
  const Stereographic s(kE, lon0, -kPi / 2);
  const Points in = {{0.6, -1.2, 0}, {0.6, -1.2, 0}, {0.6, -1.2, 0}};
  Points plane = untouched(3);
  s.forward(in, plane);
  Points out = untouched(3);
  EXPECT_EQ(s.inverse(plane, out), TW_SUCCESS);
  // The first negation and that of the result leave the longitude right, the second doubles it.
  expect_near(out[0], 0.6, -1.2, 1e-14);
  expect_near(out[1], 0.6 - 2 * lon0, -1.2, 1e-14);
  expect_near(out[2], 0.6, -1.2, 1e-14);
  // A point at the origin takes lon0 as it stands, and does not turn it; a failing one does.
  const Points mixed = {plane[0], {0, 0, 0}, {kNaN, 0, 0}, {0, 0, 0}, plane[0]};
  out = untouched(5);
  EXPECT_EQ(s.inverse(mixed, out), TW_NOT_CONVERGED);
  expect_near(out[0], 0.6, -1.2, 1e-14);
  // The pole's longitude is in the end lon0 as the last point leaves it: negated three times.
  EXPECT_EQ(out[1].x, -lon0);
  EXPECT_EQ(out[1].y, -kPi / 2);
  expect_untouched(out[2]);
  EXPECT_EQ(out[3].x, -lon0);
  expect_near(out[4], 0.6, -1.2, 1e-14);
}

TEST(Stereographic, PolesTakeLon0InTheEnd) {
  // Also points that were skipped, with what the output held.
  const Stereographic s(kE, 0.4, kPi / 2);
  const Points in = {{1e-12, 1e-12, 0}, {kNaN, 0, 0}, {kNaN, 0, 0}, {kNaN, 0, 0}};
  Points out = {
      kUntouchedPoint, {7, kPi / 2 - 1.9e-12, 8}, {7, -kPi / 2, 8}, {7, kPi / 2 - 2.1e-12, 8}};
  EXPECT_EQ(s.inverse(in, out), TW_NOT_CONVERGED);
  EXPECT_EQ(out[0].x, 0.4);
  EXPECT_NEAR(out[0].y, kPi / 2, 2e-12);
  EXPECT_EQ(out[1].x, 0.4);
  EXPECT_EQ(out[1].y, kPi / 2 - 1.9e-12);
  EXPECT_EQ(out[1].z, 8);
  EXPECT_EQ(out[2].x, 0.4);
  EXPECT_EQ(out[3].x, 7);
  // On the oblique road as well.
  const Stereographic oblique(kE, 0.4, 0.3);
  out[1].x = 7;
  EXPECT_EQ(oblique.inverse({{0.1, 0.1, 0}, {kNaN, 0, 0}, {0, 0, 0}, {0, 0, 0}}, out),
            TW_BAD_LATITUDE);
  EXPECT_EQ(out[1].x, 0.4);
}

TEST(Stereographic, ObliqueInverseStaysWithinAQuarterTurn) {
  // 120 degrees in longitude from the origin the plain arctangent gives 60 degrees the other way.
  const Stereographic s(kE, 0.1, 0.6);
  const CoordinateTriple in = {0.1 + degrees(120), 0.9, 0};
  const CoordinateTriple out = s.inverse(s.forward(in));
  EXPECT_NEAR(out.x, 0.1 + degrees(120) - kPi, 1e-12);
  EXPECT_NEAR(out.y, 0.9, 1e-12);
  // The longitude is not wrapped.
  const Stereographic east(kE, 3.1, 0.6);
  EXPECT_NEAR(east.inverse(east.forward({3.3, 0.5, 0})).x, 3.3, 1e-13);
}

TEST(Stereographic, PolarInverseWraps) {
  const Stereographic s(kE, 3, kPi / 2);
  EXPECT_NEAR(s.inverse({1, 0, 0}).x, 3 + kPi / 2 - 2 * kPi, 1e-15);
  EXPECT_NEAR(s.inverse({-1, 0, 0}).x, 3 - kPi / 2, 1e-15);
  const Stereographic zero(kE, 0, kPi / 2);
  EXPECT_EQ(zero.inverse({0.0, 1, 0}).x, kPi);
  EXPECT_EQ(zero.inverse({-0.0, 1, 0}).x, kPi);  // -pi becomes pi
}

TEST(Stereographic, EccentricEllipsoidUsesUpThePasses) {
  // With an eccentricity of 0.9 the passes converge too slowly; with one of 0.3 they do not run
  // out.  Between the two, a point is looked for that converges in just the tenth pass.
  const auto polar_passes = [](double e, double w) {
    double lat = kPi / 2 - 2 * std::atan(w), old = 0;
    int passes = 0;
    do {
      old = lat;
      lat = kPi / 2 -
            2 * std::atan(std::pow((1 - e * std::sin(old)) / (1 + e * std::sin(old)), e / 2) * w);
      ++passes;
    } while (std::fabs(lat - old) > 1e-12);
    return passes;
  };
  int ninth = 0, tenth = 0, eleventh = 0;
  for (double e = 0.3; e < 0.9; e += 0.01) {
    const Stereographic s(e, 0, kPi / 2);
    for (double rho = 0.2; rho < 2; rho += 0.3) {
      const int passes = polar_passes(e, rho / s.C);
      Points out = untouched(2);
      const TWstatus status = s.inverse({{0, -rho, 0}, {0, -1e-3, 0}}, out);
      if (passes < 10) {
        EXPECT_EQ(status, TW_SUCCESS);
        EXPECT_NEAR(s.forward(out[0]).y, -rho, 1e-11);
      } else {
        EXPECT_EQ(status, TW_NOT_CONVERGED);
        expect_untouched(out[0]);
      }
      EXPECT_NE(out[1].y, kUntouched);  // skip: the loop goes on
      if (passes == 9) ++ninth;
      if (passes == 10) ++tenth;
      if (passes == 11) ++eleventh;
    }
  }
  EXPECT_GT(ninth, 0);
  EXPECT_GT(tenth, 0);
  EXPECT_GT(eleventh, 0);
}

TEST(Stereographic, ObliqueInverseTakesTheWordOfTheConformalLatitude) {
  const double e = 0.9;
  const Stereographic s(e, 0, 0.6);
  int good = 0, bad = 0;
  for (double y = -0.95; y < 2; y += 0.1) {
    // The search for the latitude, done with the function that the projection stands on.
    const double rho = std::fabs(y);
    const double ce = 2 * std::atan(rho * std::cos(s.chi0) / (2 * s.m0));
    const double chi =
        std::asin(std::sin(ce) * y * std::cos(s.chi0) / rho + std::cos(ce) * std::sin(s.chi0));
    double lat = kUntouched;
    TWstatus expected = 0;
    TWconflat_geod(e, chi, &lat, &expected);
    Points out = untouched(1);
    if (TW_OK(expected)) {
      ++good;
      EXPECT_EQ(s.inverse({{0, y, 0}}, out), TW_SUCCESS);
      EXPECT_NEAR(out[0].y, lat, 1e-14);
    } else {
      ++bad;
      EXPECT_EQ(s.inverse({{0, y, 0}}, out), TW_BAD_LATITUDE);
      expect_untouched(out[0]);
    }
  }
  EXPECT_GT(good, 0);
  EXPECT_GT(bad, 0);
}

TEST(Stereographic, ObliqueInverseBesideTheConformalLatitude) {
  // On earth's ellipsoids the latitude is not searched by passes; it is the same.
  const Stereographic s(kE, 0, 0.6);
  for (double y = -1.95; y < 2.5; y += 0.1) {
    const double ce = 2 * std::atan(std::fabs(y) * std::cos(s.chi0) / (2 * s.m0));
    const double chi = std::asin(std::copysign(std::sin(ce), y) * std::cos(s.chi0) +
                                 std::cos(ce) * std::sin(s.chi0));
    double lat = kUntouched;
    TWstatus status = 0;
    TWconflat_geod(kE, chi, &lat, &status);
    EXPECT_NEAR(s.inverse({0, y, 0}).y, lat, 2e-14 / std::cos(lat)) << y;
  }
}

TEST(Stereographic, ScaleIsTheDerivative) {
  for (const double lat0 : {0.0, 0.8, -0.4, kPi / 2, -kPi / 2}) {
    const Stereographic s(kE, 0.3, lat0);
    for (const double lat : {-1.2, -0.2, 0.9}) {
      for (const double d : {0.01, 0.9, -1.4}) {
        if (std::fabs(lat - lat0) > 2) continue;  // the steps are too coarse near the antipode
        const CoordinateTriple in = {0.3 + d, lat, 0};
        const auto expected =
            numeric_scale([&](CoordinateTriple p) { return s.forward(p); }, in.x, in.y, kE);
        const double k = s.scale(1, in);
        EXPECT_NEAR(k / expected.x, 1, 2e-11);
        EXPECT_NEAR(k / expected.y, 1, 2e-11);
        EXPECT_NEAR(s.scale(0.7, in), 0.7 * k, 1e-15 * k);
      }
    }
  }
}

TEST(Stereographic, ScaleAtAPoleOnTheObliqueRoad) {
  // Both cosines are what is left of pi/2 there: A sqrt(1 - e^2), with A at the pole.
  const Stereographic s(kE, 0.3, 0.6);
  const double a = 2 * s.m0 / std::cos(s.chi0) / (1 + std::sin(s.chi0));
  EXPECT_NEAR(s.scale(1, {0.9, kPi / 2, 0}), a * std::sqrt(1 - kE * kE), 1e-14);
}

TEST(Stereographic, ScaleWithoutPoints) {
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1}) {
    for (const double C : {0.0, 2.0, -2.0}) {
      TWstatus status = 0;
      EXPECT_EQ(TWstereo_s(kE, 0.75, 0, 0, C, 1, 0, count, &p, &p, &status), 0.75);
      EXPECT_EQ(status, TW_SUCCESS);
      TWstereo_f(kE, 0, 0, C, 1, 0, count, &p, &p, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      TWstereo_i(kE, 0, 0, C, 1, 0, count, &p, &p, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      expect_untouched(p);
    }
  }
}

double latitude_to_scale(const Stereographic& s, double lat_ts, TWstatus expected) {
  double k0 = kUntouched;
  TWstatus status = 0;
  TWstereo_latTs(s.e, s.lon0, s.lat0, s.C, s.m0, s.chi0, lat_ts, &k0, &status);
  EXPECT_EQ(status, expected);
  return k0;
}

double scale_to_latitude(const Stereographic& s, double k0, TWstatus expected) {
  double lat_ts = kUntouched;
  TWstatus status = 0;
  TWstereo_sTlat(s.e, s.lon0, s.lat0, s.C, s.m0, s.chi0, k0, &lat_ts, &status);
  EXPECT_EQ(status, expected);
  return lat_ts;
}

TEST(Stereographic, ScaleOfATrueLatitude) {
  // Sphere: k = k0 2 / (1 + cos c), so k0 = (1 + cos c) / 2.
  const Stereographic oblique(0, 0.2, 0.5), south(0, 0.2, -0.5), pole(0, 0.2, kPi / 2);
  EXPECT_NEAR(latitude_to_scale(oblique, 0.3, TW_SUCCESS), (1 + std::cos(0.3)) / 2, 1e-15);
  EXPECT_NEAR(latitude_to_scale(south, 0.3, TW_SUCCESS), (1 + std::cos(0.3)) / 2, 1e-15);
  EXPECT_NEAR(latitude_to_scale(pole, 1.1, TW_SUCCESS), (1 + std::sin(1.1)) / 2, 1e-15);
  EXPECT_EQ(latitude_to_scale(oblique, 0, TW_SUCCESS), 1.0);
  EXPECT_EQ(latitude_to_scale(pole, kPi / 2, TW_SUCCESS), 1.0);
  EXPECT_EQ(latitude_to_scale(pole, -kPi / 2, TW_SUCCESS), 1.0);  // the other pole too
  EXPECT_NE(latitude_to_scale(pole, 0, TW_SUCCESS), 1.0);
  // On the ellipsoid north and south of the origin differ: the distance is laid off southwards in
  // the north, northwards in the south and from the equator southwards.
  for (const double lat0 : {0.5, -0.5, 0.0}) {
    const Stereographic s(kE, 0.2, lat0);
    const double lat = lat0 < 0 ? lat0 + 0.3 : lat0 - 0.3;
    EXPECT_DOUBLE_EQ(latitude_to_scale(s, 0.3, TW_SUCCESS), 1 / s.scale(1, {0.2, lat, 0}));
  }
}

TEST(Stereographic, ScaleOfATrueLatitudeRefuses) {
  const double past = std::nextafter(kPi / 2, 2);
  const Stereographic oblique(kE, 0.2, 0.5), pole(kE, 0.2, kPi / 2);
  EXPECT_EQ(latitude_to_scale(oblique, past, TW_BAD_DATA), kUntouched);
  EXPECT_EQ(latitude_to_scale(oblique, -1e-300, TW_BAD_DATA), kUntouched);
  EXPECT_EQ(latitude_to_scale(pole, past, TW_BAD_DATA), kUntouched);
  EXPECT_EQ(latitude_to_scale(pole, -past, TW_BAD_DATA), kUntouched);
  EXPECT_NE(latitude_to_scale(pole, -0.1, TW_SUCCESS), kUntouched);
  // A distance over the pole, from constants of another origin: the scale function refuses the
  // latitude and answers with the 1 that it was given.
  double k0 = kUntouched;
  TWstatus status = 0;
  TWstereo_latTs(kE, 0, -1.7, 0, oblique.m0, oblique.chi0, 0.05, &k0, &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  EXPECT_EQ(k0, 1.0);
}

TEST(Stereographic, LatitudeOfATrueScale) {
  for (const double lat0 : {0.0, 0.5, -0.5, 1.2, -1.2, kPi / 2, -kPi / 2}) {
    const Stereographic s(kE, 0.2, lat0);
    EXPECT_EQ(scale_to_latitude(s, 1.0, TW_SUCCESS), s.C == 0 ? 0 : lat0);
    if (s.C == 0) {
      // The distance is that of the latitude found, wherever it lies from the origin.
      const double k0 = latitude_to_scale(s, 0.3, TW_SUCCESS);
      const double found = scale_to_latitude(s, k0, TW_SUCCESS);
      EXPECT_NEAR(found, 0.3, std::fabs(lat0) > 0.8 ? 2e-3 : 1e-9);
      const double nearest = std::min(std::fabs(k0 * s.scale(1, {0.2, lat0 - found, 0}) - 1),
                                      std::fabs(k0 * s.scale(1, {0.2, lat0 + found, 0}) - 1));
      EXPECT_LT(nearest, 1e-9);
    } else {
      const double lat = lat0 > 0 ? 1.2 : -1.2;
      const double k0 = latitude_to_scale(s, lat, TW_SUCCESS);
      EXPECT_NEAR(scale_to_latitude(s, k0, TW_SUCCESS), lat, 1e-9);
    }
  }
}

TEST(Stereographic, LatitudeOfATrueScaleRefuses) {
  const Stereographic s(kE, 0.2, 0.5), pole(kE, 0.2, kPi / 2);
  for (const double k0 : {0.0, -0.5, std::nextafter(1.0, 2.0), kInfinity}) {
    EXPECT_EQ(scale_to_latitude(s, k0, TW_BAD_SCALE_LATITUDE), kUntouched);
    EXPECT_EQ(scale_to_latitude(pole, k0, TW_BAD_SCALE_LATITUDE), kUntouched);
  }
  // No latitude makes the scale true: written all the same.
  EXPECT_NE(scale_to_latitude(pole, 1e-5, TW_RANGE_ERROR), kUntouched);
  EXPECT_TRUE(std::isnan(scale_to_latitude(s, kNaN, TW_RANGE_ERROR)));
}

TEST(Stereographic, RoundTripInPlace) {
  std::mt19937 random(47);
  std::uniform_real_distribution<double> lon(-1.5, 1.5), lat(-1.2, 1.5);
  for (const double e : {0.0, kE, 0.2}) {
    for (const double lat0 : {0.5, kPi / 2}) {
      const Stereographic s(e, 0.1, lat0);
      Points in(200);
      for (auto& p : in) p = {0.1 + lon(random), lat(random), 6};
      Points out = in;
      EXPECT_EQ(s.forward(out, out), TW_SUCCESS);
      EXPECT_EQ(s.inverse(out, out), TW_SUCCESS);
      // The passes of the inverse end at 1e-12, and a longitude is less certain near the poles.
      for (std::size_t i = 0; i < in.size(); ++i) {
        expect_near(out[i], in[i].x, in[i].y, 6, 3e-12);
      }
    }
  }
}

TEST(Stereographic, InfiniteAndNotANumber) {
  const Stereographic pole(kE, 0, kPi / 2), oblique(kE, 0, 0.5);
  Points out = untouched(1);
  EXPECT_EQ(pole.inverse({{0, -kInfinity, 0}}, out), TW_SUCCESS);
  EXPECT_EQ(out[0].y, -kPi / 2);
  out = untouched(1);
  EXPECT_EQ(pole.inverse({{0, kNaN, 0}}, out), TW_NOT_CONVERGED);
  expect_untouched(out[0]);
  EXPECT_EQ(oblique.inverse({{0, kNaN, 0}}, out), TW_BAD_LATITUDE);
  expect_untouched(out[0]);
  EXPECT_EQ(oblique.forward({{0, kNaN, 0}}, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].y));
  EXPECT_EQ(pole.forward({{0, kNaN, 0}}, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].y));
}

TEST(Stereographic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const auto [a, e] = Ellipsoid::grs80();
  for (const double lat0 : {-90.0, -35.0, 0.0, 52.0, 90.0}) {
    const ProjPeer peer("+proj=stere +ellps=GRS80 +k_0=1 +lon_0=12 +lat_0=" + std::to_string(lat0));
    ASSERT_TRUE(peer.ok());
    const Stereographic s(e, degrees(12),
                          lat0 == 90    ? kPi / 2
                          : lat0 == -90 ? -kPi / 2
                                        : degrees(lat0));
    for (double dlat = -65; dlat < 70; dlat += 11) {
      for (double lon = -70; lon < 90; lon += 13) {
        const double lat = lat0 + dlat;
        if (std::fabs(lat) > 89.9) continue;
        const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
        const CoordinateTriple expected = peer.forward(in);
        const CoordinateTriple out = s.forward(in);
        expect_near(out, expected.x / a, expected.y / a, 2e-14);
        expect_near(s.inverse(out), in.x, in.y, 1e-12);
      }
    }
  }
#endif
}

}  // namespace
