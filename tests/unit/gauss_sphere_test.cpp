#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Sphere {
  double chi0 = kUntouched, c = kUntouched, t = kUntouched, R = kUntouched;
  TWstatus status = 0;

  Sphere(double e, double lat0) { TWgaussII_c(e, lat0, &chi0, &c, &t, &R, &status); }
};

// Isometric latitude in a form of its own.
double isometric(double e, double lat) {
  return std::asinh(std::tan(lat)) - e * std::atanh(e * std::sin(lat));
}

TEST(GaussSphere, PublishedExample) {
  // IOGP Publication 373-7-2, Oblique Stereographic, Amersfoort / RD New: origin 52 09 22.178 N,
  // 5 23 15.5 E, point 53 N 6 E.
  const auto [a, e] = Ellipsoid::bessel_1841();
  const double lat0 = degrees(52, 9, 22.178);
  const double lon0 = degrees(5, 23, 15.5);
  const Sphere s(e, lat0);
  EXPECT_EQ(s.status, TW_SUCCESS);
  EXPECT_NEAR(s.c, 1.000475857, 5e-10);
  EXPECT_NEAR(s.chi0, 0.909684757, 5e-10);
  EXPECT_NEAR(s.R * a, 6382644.571, 5e-4);
  const CoordinateTriple in = {degrees(6), degrees(53), 3};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWgaussII_f(e, lon0, s.c, s.t, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  // The publication's longitudes on the sphere count from Greenwich: 0.104724841, origin
  // 0.094032038.
  expect_near(out, 0.104724841 - 0.094032038, 0.924394997, 1.1e-9);
  EXPECT_EQ(out.z, kUntouched);
  TWgaussII_i(e, lon0, s.c, s.t, 1, &out, &out, &status);
  expect_near(out, in.x, in.y, kUntouched, 1e-14);
}

TEST(GaussSphere, OriginLiesAtChi0) {
  for (const double lat0 : {-1.5, -0.6, 0.0, 0.3, 1.2}) {
    for (const double e : {0.0818, 0.4}) {
      const Sphere s(e, lat0);
      CoordinateTriple p = {0.7, lat0, 0};
      TWstatus status = 0;
      TWgaussII_f(e, 0.7, s.c, s.t, 1, &p, &p, &status);
      EXPECT_EQ(p.x, 0);
      EXPECT_NEAR(p.y, s.chi0, 5e-15);
      // c and chi0 by their definitions: the scale is true and stationary at the origin.
      EXPECT_NEAR(std::sin(s.chi0) * s.c, std::sin(lat0), 1e-15);
      const double nu = 1 / std::sqrt(1 - e * e * std::sin(lat0) * std::sin(lat0));
      EXPECT_NEAR(s.R * s.c * std::cos(s.chi0), nu * std::cos(lat0), 3e-15);
    }
  }
}

TEST(GaussSphere, SphereIsMarked) {
  const Sphere s(0.9e-12, 0.5);
  EXPECT_EQ(s.status, TW_SUCCESS);
  EXPECT_EQ(s.c, -1.0);
  EXPECT_EQ(s.t, 0.0);
  EXPECT_EQ(s.chi0, 0.5);
  EXPECT_DOUBLE_EQ(s.R, 1);
  EXPECT_GT(Sphere(1e-12, 0.5).c, 0);
  // Only the longitude's origin moves, without a wrap and without a look at the latitude.
  Points p = {{4, 0.5, 7}, {-4, 9, 7}};
  TWstatus status = 0;
  TWgaussII_f(0, 3, -1, 0, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p[0], 1, 0.5, 7, 0);
  expect_near(p[1], -7, 9, 7, 0);
  TWgaussII_i(0, 3, -1, 0, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p[0], 4, 0.5, 7, 0);
  expect_near(p[1], -4, 9, 7, 0);
}

TEST(GaussSphere, OriginNearAPole) {
  const double e = 0.0818;
  const double replaced = 1.5707943267948965;
  for (const double sign : {1.0, -1.0}) {
    for (const double lat0 : {kPi / 2, kPi / 2 - 1.9e-6, kPi / 2 + 1.9e-6}) {
      const Sphere s(e, sign * lat0);
      EXPECT_EQ(s.status, TW_SUCCESS);
      EXPECT_EQ(s.chi0, sign * lat0);  // the latitude as given
      EXPECT_EQ(s.c, 1.0);
      // t and R at the replaced latitude; 2e-6 from the pole 1 - sin has four digits left.
      EXPECT_NEAR(s.t, sign * e * std::atanh(e * std::sin(replaced)), 1e-4);
      EXPECT_NEAR(s.t,
                  std::log((std::sin(sign * replaced) + 1) / (1 - std::sin(sign * replaced))) / 2 -
                      isometric(e, sign * replaced),
                  1e-9);
      const double w = 1 - e * e * std::sin(replaced) * std::sin(replaced);
      EXPECT_NEAR(s.R, std::sqrt(1 - e * e) / w, 1e-15);
    }
    const Sphere general(e, sign * (kPi / 2 - 2.1e-6));
    EXPECT_NE(general.chi0, sign * (kPi / 2 - 2.1e-6));
  }
}

TEST(GaussSphere, EccentricityOfOne) {
  const Sphere s(1.0, 0.5);
  EXPECT_EQ(s.status, TW_BAD_ECCENTRICITY);
  EXPECT_NE(s.c, kUntouched);
  EXPECT_NE(s.t, kUntouched);
  EXPECT_NE(s.chi0, kUntouched);
  EXPECT_EQ(s.R, kUntouched);
}

TEST(GaussSphere, OriginBeyondAPole) {
  // The last inner call succeeds, so no failure is told; the shift is no number.
  const Sphere s(0.0818, 2);
  EXPECT_EQ(s.status, TW_SUCCESS);
  EXPECT_TRUE(std::isnan(s.t));
  EXPECT_NE(s.R, kUntouched);
}

TEST(GaussSphere, PolesPassThrough) {
  const double forward = 1.5707963267938965;
  const double inverse = 1.5707963267947966;
  const Sphere s(0.0818, 0.5);
  Points p = {
      {4, std::nextafter(forward, 2), 0}, {4, -std::nextafter(forward, 2), 0}, {4, forward, 0}};
  TWstatus status = 0;
  TWgaussII_f(0.0818, 0.5, s.c, s.t, 3, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p[0], 3.5, std::nextafter(forward, 2), 0);  // not wrapped
  expect_near(p[1], 3.5, -std::nextafter(forward, 2), 0);
  EXPECT_NEAR(p[2].x, s.c * (3.5 - 2 * kPi), 1e-15);  // wrapped by the Mercator step
  p = {{3, std::nextafter(inverse, 2), 0}, {3, inverse, 0}, {3, std::nextafter(forward, 2), 0}};
  TWgaussII_i(0.0818, 0.5, s.c, s.t, 3, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p[0], 3.5, std::nextafter(inverse, 2), 0);
  EXPECT_NEAR(p[1].x, 3 / s.c + 0.5 - 2 * kPi, 1e-15);
  EXPECT_NEAR(p[2].x, 3 / s.c + 0.5 - 2 * kPi, 1e-15);  // the forward bound is not that of here
}

TEST(GaussSphere, LongitudeTimesCIsWrapped) {
  // Half a turn times c lies beyond pi and comes back.
  const Sphere s(0.3, 0.2);
  ASSERT_GT(s.c, 1.01);
  CoordinateTriple p = {kPi, 0.3, 0};
  TWstatus status = 0;
  TWgaussII_f(0.3, 0, s.c, s.t, 1, &p, &p, &status);
  EXPECT_NEAR(p.x, s.c * kPi - 2 * kPi, 1e-15);
}

TEST(GaussSphere, RoundTrip) {
  std::mt19937 random(3);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.55, 1.55);
  for (const double e : {0.0818191910428158, 0.3}) {
    const Sphere s(e, 0.6);
    Points in(300);
    // a longitude that c takes beyond half a turn does not come back
    for (auto& p : in) p = {lon(random) / s.c, lat(random), 12};
    Points out = in;
    TWstatus status = 0;
    TWgaussII_f(e, 0, s.c, s.t, 300, out.data(), out.data(), &status);
    TWgaussII_i(e, 0, s.c, s.t, 300, out.data(), out.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      expect_near(out[i], in[i].x, in[i].y, 12, 3e-14);
    }
  }
}

TEST(GaussSphere, ConformalByIsometricLatitudes) {
  const double e = 0.0818;
  const Sphere s(e, 0.7);
  for (double lat = -1.5; lat < 1.51; lat += 0.3) {
    CoordinateTriple p = {0.1, lat, 0};
    TWstatus status = 0;
    TWgaussII_f(e, 0, s.c, s.t, 1, &p, &p, &status);
    EXPECT_NEAR(p.y, std::atan(std::sinh(s.c * (isometric(e, lat) + s.t))), 2e-15);
  }
}

TEST(GaussSphere, StepBetweenThePlanes) {
  Points p = {{2, 3, 7}, {-1, 0.5, 7}};
  TWstatus status = 0;
  TWgauII_f(1.5, 0.25, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p[0], 3, 4.875, 7, 0);
  expect_near(p[1], -1.5, 1.125, 7, 0);
  status = 0;
  TWgauII_i(1.5, 0.25, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p[0], 2, 3, 7, 0);
  expect_near(p[1], -1, 0.5, 7, 0);
}

TEST(GaussSphere, ScaleInPlace) {
  const double e = 0.0818;
  const Sphere s(e, 0.7);
  const double step = 1e-6;
  for (double lat = -1.4; lat < 1.41; lat += 0.35) {
    Points p = {{0.3, lat - step, 0}, {0.3, lat + step, 0}};
    TWstatus status = 0;
    TWgaussII_f(e, 0.1, s.c, s.t, 2, p.data(), p.data(), &status);
    const double w = 1 - e * e * std::sin(lat) * std::sin(lat);
    const double radius = (1 - e * e) / std::pow(w, 1.5);
    const double k = (p[1].y - p[0].y) / (2 * step) * s.R / radius;
    CoordinateTriple point = {0.3, lat, 555};
    CoordinateTriple mapped = point;
    TWgaussII_f(e, 0.1, s.c, s.t, 1, &mapped, &mapped, &status);
    TWgaussII_s(e, 0.1, s.c, s.t, s.R, 2, 1, &point, &point, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(point, mapped.x, mapped.y, 0);
    EXPECT_NEAR(point.z, 2 * k, 2e-9);  // rounding over the step
  }
}

TEST(GaussSphere, ScaleAtTheOriginIsOne) {
  const Sphere s(0.0818, 0.7);
  CoordinateTriple p = {0, 0.7, 0};
  TWstatus status = 0;
  TWgaussII_s(0.0818, 0, s.c, s.t, s.R, 1, 1, &p, &p, &status);
  EXPECT_NEAR(p.z, 1, 1e-15);
}

TEST(GaussSphere, ScaleBeyondAPoleFallsBack) {
  const Sphere s(0.0818, 0.7);
  Points p = {{0, std::nextafter(kPi / 2, 2), 0}, {0, 0.7, 0}, {0, -2, 0}};
  TWstatus status = 0;
  TWgaussII_s(0.0818, 0, s.c, s.t, s.R, 3, 3, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  EXPECT_EQ(p[0].z, 3);
  EXPECT_NEAR(p[1].z, 3, 1e-14);
  EXPECT_EQ(p[2].z, 3);
  EXPECT_EQ(p[2].y, -2);
}

TEST(GaussSphere, ScaleHoldsThePoles) {
  // The poles map onto themselves; cos chi is that of the pole, cos lat that of 1e-14 from it, on
  // the far side of the north pole for the south.
  const double e = 0.0818;
  const Sphere s(e, 0.7);
  Points p = {{0, kPi / 2, 0}, {0, -kPi / 2, 0}};
  TWstatus status = 0;
  TWgaussII_s(e, 0, s.c, s.t, s.R, 1, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  const double factor = std::cos(kPi / 2) * std::sqrt(1 - e * e) * s.R * s.c;
  EXPECT_NEAR(p[0].z, factor / std::cos(kPi / 2 - 1e-14), 1e-15);
  EXPECT_NEAR(p[1].z, factor / std::cos(kPi / 2 + 1e-14), 1e-15);
  EXPECT_GT(p[0].z, 0);
  EXPECT_LT(p[1].z, 0);
}

TEST(GaussSphere, ScaleOfTheSphere) {
  Points p = {{1, 0.5, 8}, {1, 9, 8}};
  TWstatus status = 0;
  TWgaussII_s(0, 0.25, -1, 0, 1, 0.9, 2, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);  // no latitude is looked at
  expect_near(p[0], 0.75, 0.5, 0.9, 0);
  expect_near(p[1], 0.75, 9, 0.9, 0);
}

TEST(GaussSphere, ScaleWithTwoArrays) {
  // The input's heights are lost to its latitudes; the scale goes by what z of the output held.
  const double e = 0.0818;
  const Sphere s(e, 0.7);
  Points in = {{0.2, 0.3, 111}, {0.2, 0.4, 222}};
  Points out = {{0, 0, 0.9}, {0, 0, 2}};
  TWstatus status = 0;
  TWgaussII_s(e, 0, s.c, s.t, s.R, 1, 2, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  expect_near(in[0], 0.2, 0.3, 0.3, 0);
  expect_near(in[1], 0.2, 0.4, 0.4, 0);
  const double w = std::sqrt(1 - e * e * std::sin(0.9) * std::sin(0.9));
  EXPECT_NEAR(out[0].z, std::cos(out[0].y) * w * s.R * s.c / std::cos(0.9), 1e-14);
  EXPECT_EQ(out[1].z, 1);
}

// The sphere's transverse Mercator constants at the latitude of origin on the sphere.
struct SecondStage {
  double A0 = 0, A2 = 0, A4 = 0, A6 = 0, A8 = 0, M0 = 0, B2 = 0, B4 = 0, B6 = 0;

  explicit SecondStage(double chi0) {
    TWstatus status = 0;
    TWt_merc_c(0, 0, chi0, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4, &B6, &status);
  }
};

TEST(GaussSphere, SchreiberChainsTheScales) {
  const double e = 0.0818;
  const double lon0 = 0.8;
  const Sphere s(e, 0.5);
  const SecondStage m(s.chi0);
  const auto plane = [&](double lon, double lat) {
    CoordinateTriple p = {lon, lat, 5};
    TWstatus status = 0;
    TWg_schreiber(e, lon0, s.c, s.t, s.R, m.A0, m.A2, m.A4, m.A6, m.A8, m.M0, 0.9995, 1, &p, &p,
                  &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return p;
  };
  const double step = 1e-5;
  for (const double lat : {0.1, 0.5, 0.9}) {
    for (const double lon : {0.75, 0.8, 0.84}) {
      const CoordinateTriple n = plane(lon, lat + step);
      const CoordinateTriple below = plane(lon, lat - step);
      const double w = 1 - e * e * std::sin(lat) * std::sin(lat);
      const double radius = (1 - e * e) / std::pow(w, 1.5);
      const double h = std::hypot(n.x - below.x, n.y - below.y) * s.R / (2 * step) / radius;
      // x and y carry no central scale, z does
      EXPECT_NEAR(plane(lon, lat).z, 0.9995 * h, 2e-9);
    }
  }
  expect_near(plane(lon0, 0.5), 0, 0, 0.9995, 5e-15);
}

TEST(GaussSphere, SchreiberEndsAfterAFailingFirstStage) {
  const double e = 0.0818;
  const Sphere s(e, 0.5);
  const SecondStage m(s.chi0);
  Points p = {{0.1, 0.6, 0}, {0.1, 2, 0}};
  Points first = p;
  TWstatus status = 0;
  TWgaussII_s(e, 0, s.c, s.t, s.R, 1, 2, first.data(), first.data(), &status);
  TWg_schreiber(e, 0, s.c, s.t, s.R, m.A0, m.A2, m.A4, m.A6, m.A8, m.M0, 0.5, 2, p.data(), p.data(),
                &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  for (std::size_t i = 0; i < 2; ++i) expect_near(p[i], first[i].x, first[i].y, first[i].z, 0);
}

}  // namespace
