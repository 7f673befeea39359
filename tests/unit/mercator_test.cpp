#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

TEST(Mercator, SnydersNumericalExample) {
  // Snyder 1987, p. 267: Clarke 1866, central meridian 180, point 35 N 75 W.
  const auto [a, e] = Ellipsoid::clarke_1866();
  TWstatus status = 0;
  double y0 = kUntouched;
  TWmerc_c(e, 0, &y0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(y0, 0, 2e-16);  // tan(pi/4) is not exactly 1
  const CoordinateTriple in = {degrees(-75), degrees(35), 7};
  CoordinateTriple out = kUntouchedPoint;
  TWmerc_f(e, degrees(180), y0, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out, 11688673.7 / a, 4139145.6 / a, 0.1 / a);
  EXPECT_EQ(out.z, kUntouched);

  CoordinateTriple scale = kUntouchedPoint;
  TWmerc_s(e, 1, 1, &in, &scale, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(scale, 1.2194146, 1.2194146, 1.2194146 * 1.2194146, 5e-8);
}

TEST(Mercator, SphereInClosedForm) {
  // Snyder 1987, p. 266: sphere of radius 1, central meridian 180, point 35 N 75 W.
  const CoordinateTriple in = {degrees(-75), degrees(35), 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWmerc_f(0, degrees(180), 0, 1, &in, &out, &status);
  expect_near(out, 1.8325957, 0.6528366, 5e-8);
  // asinh(tan(lat)) is another form of the same ordinate.
  EXPECT_NEAR(out.y, std::asinh(std::tan(in.y)), 1e-15);
}

TEST(Mercator, OriginAtThePolePasses) {
  TWstatus status = 0;
  double y0 = kUntouched;
  TWmerc_c(0.08, kPi / 2, &y0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NE(y0, kUntouched);
  y0 = kUntouched;
  TWmerc_c(0.08, std::nextafter(kPi / 2, 2), &y0, &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  EXPECT_EQ(y0, kUntouched);
  TWmerc_c(0.08, -std::nextafter(kPi / 2, 2), &y0, &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  EXPECT_EQ(y0, kUntouched);
}

TEST(Mercator, ForwardSkipsAPointAtThePole) {
  const double limit = kPi / 2 - 1e-14;
  const Points in = {{0.1, 0.2, 0},
                     {0.1, std::nextafter(limit, 2), 0},
                     {0.1, limit, 0},
                     {0.1, -std::nextafter(limit, 2), 0},
                     {0.3, -0.4, 0}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWmerc_f(0.08, 0, 0, 5, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  EXPECT_EQ(out[0].x, 0.1);
  expect_untouched(out[1]);
  EXPECT_EQ(out[2].x, 0.1);
  EXPECT_GT(out[2].y, 30);
  expect_untouched(out[3]);
  EXPECT_EQ(out[4].x, 0.3);
}

TEST(Mercator, WrapOfExactlyHalfATurn) {
  const Points in = {{-kPi, 0.5, 0}, {kPi, 0.5, 0}, {4, 0.5, 0}, {-4, 0.5, 0}, {12, 0.5, 0}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWmerc_f(0, 0, 0, 5, in.data(), out.data(), &status);
  EXPECT_EQ(out[0].x, -kPi);  // the forward comparison is strict
  EXPECT_EQ(out[1].x, kPi);
  EXPECT_DOUBLE_EQ(out[2].x, 4 - 2 * kPi);
  EXPECT_DOUBLE_EQ(out[3].x, 2 * kPi - 4);
  EXPECT_DOUBLE_EQ(out[4].x, 12 - 2 * kPi);  // one turn at most
  TWmerc_i(0, 0, 0, 5, in.data(), out.data(), &status);
  EXPECT_EQ(out[0].x, kPi);  // the inverse takes -pi to pi
  EXPECT_EQ(out[1].x, kPi);
}

TEST(Mercator, ScaleHoldsThePoles) {
  const double e = 0.0818;
  const double past = std::nextafter(kPi / 2, 2);
  const Points in = {
      {0, kPi / 2, 0}, {0, -kPi / 2, 0}, {0, past, 0}, {0, -past, 0}, {0, kPi / 2 - 2e-10, 0}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWmerc_s(e, 2, 5, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  const double large = 2 * std::sqrt(1 - e * e) * 1e10;
  EXPECT_NEAR(out[0].x / large, 1, 1e-5);
  EXPECT_NEAR(out[1].x / large, -1, 1e-5);  // the south pole is held past the north pole
  EXPECT_GT(out[1].z, 0);
  expect_near(out[2], 2, 2, 4, 0);  // filled
  expect_near(out[3], 2, 2, 4, 0);
  EXPECT_NEAR(out[4].x / (large / 2), 1, 1e-5);
}

TEST(Mercator, RoundTrip) {
  std::mt19937 random(1);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.55, 1.55);
  for (const double e : {0.0, 0.0818, 0.3}) {
    Points in(500);
    for (auto& p : in) p = {lon(random), lat(random), 12};
    Points out = in;
    double y0 = 0;
    TWstatus status = 0;
    TWmerc_c(e, 0.6, &y0, &status);
    TWmerc_f(e, 0.02, y0, 500, out.data(), out.data(), &status);
    TWmerc_i(e, 0.02, y0, 500, out.data(), out.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      // exp(y) and ln(t) cost some digits of the latitude towards the poles
      expect_near(out[i], in[i].x, in[i].y, 12, 2e-14);
    }
  }
}

TEST(Mercator, ScaleIsTheDerivativeOfTheOrdinate) {
  const double e = 0.0818;
  for (double lat = -1.5; lat < 1.51; lat += 0.25) {
    const double step = 1e-5;
    Points p = {{0, lat - step, 0}, {0, lat + step, 0}};
    TWstatus status = 0;
    TWmerc_f(e, 0, 0, 2, p.data(), p.data(), &status);
    // along the meridian: h = dy / (M dlat), with M the meridian radius of the unit ellipsoid
    const double w = 1 - e * e * std::sin(lat) * std::sin(lat);
    const double radius = (1 - e * e) / std::pow(w, 1.5);
    CoordinateTriple scale = {0, lat, 0};
    TWmerc_s(e, 1, 1, &scale, &scale, &status);
    EXPECT_NEAR((p[1].y - p[0].y) / (2 * step) / radius / scale.x, 1, 1e-6);
  }
}

TEST(Mercator, NotANumberEndsTheInverse) {
  Points p = {{0, kNaN, 0}, {0, kInfinity, 0}, {kNaN, -kInfinity, 0}};
  TWstatus status = 0;
  TWmerc_i(0.08, 0, 0, 3, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_TRUE(std::isnan(p[0].y));
  EXPECT_NEAR(p[1].y, kPi / 2, 1e-15);
  EXPECT_NEAR(p[2].y, -kPi / 2, 1e-15);
  p[0] = {0, kNaN, 0};
  TWmerc_f(0.08, 0, 0, 1, p.data(), p.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);  // the limit is no barrier to a not-a-number
  EXPECT_TRUE(std::isnan(p[0].y));
}

}  // namespace
