#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

// The projection of one ellipsoid with its constants.
struct Projection {
  double e, lon0, lat0;
  double A0 = kUntouched, A2 = kUntouched, A4 = kUntouched, A6 = kUntouched, A8 = kUntouched;
  double M0 = kUntouched, B2 = kUntouched, B4 = kUntouched, B6 = kUntouched;

  Projection(double e_, double lon0_, double lat0_) : e(e_), lon0(lon0_), lat0(lat0_) {
    TWstatus status = 0;
    TWt_merc_c(e, lon0, lat0, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4, &B6, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }

  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWt_merc_f(e, lon0, A0, A2, A4, A6, A8, M0, static_cast<int32_t>(in.size()), in.data(),
               out.data(), &status);
    return status;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWt_merc_i(e, lon0, lat0, A0, M0, B2, B4, B6, static_cast<int32_t>(in.size()), in.data(),
               out.data(), &status);
    return status;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus status = 0;
    TWt_merc_s(e, k0, lon0, static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    return status;
  }
  TWstatus forward_and_scale(double k0, const Points& in, Points& out) const {
    TWstatus status = 0;
    TWt_merc_xyk(e, lon0, A0, A2, A4, A6, A8, M0, k0, static_cast<int32_t>(in.size()), in.data(),
                 out.data(), &status);
    return status;
  }
  CoordinateTriple forward(const CoordinateTriple& p) const {
    Points out = {p};
    forward({p}, out);
    return out[0];
  }
};

// The terms in e^8 with which the arc is required depart from the full expansion by up to 0.08 e^8
// on the earth's ellipsoids, some 1 mm there; an arc between two latitudes by twice as much, and
// the footpoint, which goes by the true arc, by about as much again.
constexpr double kArcGap = 1.6e-10;
constexpr double kSeriesGap = 3e-10;

// Meridian arc of the unit ellipsoid by Simpson's rule over the radius of curvature.
double arc_by_quadrature(double e, double lat) {
  constexpr int kSteps = 2000;
  const double step = lat / kSteps;
  double sum = 0;
  for (int i = 0; i <= kSteps; ++i) {
    const double s = e * std::sin(i * step);
    const double weight = i == 0 || i == kSteps ? 1 : i % 2 == 1 ? 4 : 2;
    sum += weight * std::pow(1 - s * s, -1.5);
  }
  return sum * step / 3 * (1 - e * e);
}

TEST(TransverseMercator, SnydersNumericalExample) {
  // Snyder 1987, pp. 269-270: Clarke 1866, k0 0.9996, central meridian 75 W, point 40 30 N 73 30 W.
  const auto [a, e] = Ellipsoid::clarke_1866();
  const Projection p(e, degrees(-75), 0);
  EXPECT_EQ(p.M0, 0);
  const Points in = {{degrees(-73.5), degrees(40.5), 5}};
  Points out = untouched(1);
  EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].x * a * 0.9996, 127106.5, 0.05);
  EXPECT_NEAR(out[0].y * a * 0.9996, 4484124.4, 0.05);
  EXPECT_EQ(out[0].z, kUntouched);
  Points scale = untouched(1);
  EXPECT_EQ(p.scale(0.9996, in, scale), TW_SUCCESS);
  EXPECT_NEAR(scale[0].x, 0.9997989, 5e-8);
  EXPECT_EQ(scale[0].y, scale[0].x);
  EXPECT_EQ(scale[0].z, scale[0].x * scale[0].x);
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], in[0].x, in[0].y, kSeriesGap);
}

TEST(TransverseMercator, SphereOfSnyder) {
  // Snyder 1987, p. 268: unit sphere, central meridian 75 W, point 40 30 N 73 30 W.
  const Projection p(0, degrees(-75), 0);
  const Points in = {{degrees(-73.5), degrees(40.5), 0}};
  Points out = untouched(1);
  EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
  expect_near(out[0], 0.0199077, 0.7070276, 5e-8);
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], in[0].x, in[0].y, 1e-14);
}

TEST(TransverseMercator, BritishNationalGrid) {
  // Ordnance Survey, A Guide to Coordinate Systems in Great Britain, annexe C: Caister water tower.
  double lon0 = 0, lat0 = 0, easting = 0, northing = 0, k0 = 0;
  TWstatus status = 0;
  TWuk_n_grid(&lon0, &lat0, &easting, &northing, &k0, &status);
  const double a = 6377563.396;
  const double b = 6356256.910;
  const Projection p(std::sqrt(1 - b * b / (a * a)), lon0, lat0);
  const CoordinateTriple out = p.forward({degrees(1, 43, 4.5177), degrees(52, 39, 27.2531), 0});
  EXPECT_NEAR(out.x * a * k0 + easting, 651409.903, 0.001);
  EXPECT_NEAR(out.y * a * k0 + northing, 313177.270, 0.001);
}

TEST(TransverseMercator, Coefficients) {
  // e = 0.5 and rational arithmetic by hand; the footpoint with sqrt(3/4) to 30 digits.
  const Projection half(0.5, kNaN, 0);  // the central meridian is not read
  EXPECT_DOUBLE_EQ(half.A0, 0.9342234134674072265625);
  EXPECT_DOUBLE_EQ(half.A2, 0.10013329982757568359375);
  EXPECT_DOUBLE_EQ(half.A4, 0.00421106815338134765625);
  EXPECT_DOUBLE_EQ(half.A6, 0.00012099742889404296875);
  EXPECT_DOUBLE_EQ(half.A8, -0.0000093877315521240234375);
  EXPECT_NEAR(half.B2, 0.107382885854105041585945454517, 1e-16);
  EXPECT_NEAR(half.B4, 0.00671997354878231697450566772015, 1e-17);
  EXPECT_NEAR(half.B6, 0.000582130600337170180936431649508, 1e-18);
  EXPECT_EQ(half.M0, 0);

  const double e = Ellipsoid::grs80().e;
  const Projection p(e, 0, 0.9);
  EXPECT_NEAR(p.M0,
              p.A0 * 0.9 - p.A2 * std::sin(1.8) + p.A4 * std::sin(3.6) - p.A6 * std::sin(5.4) +
                  p.A8 * std::sin(7.2),
              2e-16);
  EXPECT_NEAR(p.M0, arc_by_quadrature(e, 0.9), kArcGap);
  EXPECT_NEAR(p.A0, arc_by_quadrature(e, kPi / 2) / (kPi / 2),
              1e-13);  // what e^10 adds
  const double u = arc_by_quadrature(e, 0.9) / p.A0;
  EXPECT_NEAR(u + p.B2 * std::sin(2 * u) + p.B4 * std::sin(4 * u) + p.B6 * std::sin(6 * u), 0.9,
              2e-11);  // 1097/512 e1^4 is left out, 1.7e-11
  EXPECT_EQ(Projection(e, 0, -0.0).M0, 0);
  EXPECT_FALSE(std::signbit(Projection(e, 0, -0.0).M0));
}

TEST(TransverseMercator, PoleAndOrigin) {
  const double e = Ellipsoid::grs80().e;
  const Projection p(e, 0.3, 0.4);
  const double quarter = p.A0 * kPi / 2;
  const Points in = {{2.0, kPi / 2, 0},  {2.0, -kPi / 2, 0},          {2.0, kPi / 2 - 0.9e-10, 0},
                     {0.3, 0, 0},        {2.0, kPi / 2 - 1.1e-10, 0}, {2.0, kPi / 2 + 0.9e-10, 0},
                     {2.0, 1.1 - kPi, 0}};
  Points out = untouched(in.size());
  EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
  EXPECT_EQ(out[0].x, 0);
  EXPECT_NEAR(out[0].y, quarter - p.M0, 1e-15);
  EXPECT_EQ(out[1].x, 0);
  EXPECT_NEAR(out[1].y, -quarter - p.M0, 1e-15);
  EXPECT_EQ(out[2].x, 0);
  EXPECT_NEAR(out[2].y, quarter - p.M0, 1e-10);
  EXPECT_LT(out[2].y, quarter - p.M0);  // the arc of the latitude itself
  EXPECT_EQ(out[3].x, 0);
  EXPECT_EQ(out[3].y, -p.M0);
  EXPECT_NE(out[4].x, 0);
  EXPECT_EQ(out[5].x, 0);
  EXPECT_TRUE(std::isfinite(out[6].y));  // any latitude goes through the series
}

TEST(TransverseMercator, SmallLongitudeAndLatitudeAreSnapped) {
  const double e = Ellipsoid::grs80().e;
  const Projection p(e, 0, 0);
  const Points in = {{1e-13, 0.5, 0}, {1.1e-12, 0.5, 0}, {0.01, -9e-13, 0}, {0.01, 1.1e-12, 0}};
  Points out = untouched(in.size());
  p.forward(in, out);
  EXPECT_EQ(out[0].x, 0);
  EXPECT_GT(out[1].x, 9e-13);
  EXPECT_EQ(out[2].y, 0);
  EXPECT_GT(out[3].y, 1e-12);
  p.forward_and_scale(1, in, out);
  EXPECT_GT(out[0].x, 8e-14);
  EXPECT_LT(out[2].y, -8e-13);
  // It is not the difference that is snapped.
  const Projection q(e, 0.25, 0);
  EXPECT_NE(q.forward({0.25 + 1e-13, 0.5, 0}).x, 0);
}

TEST(TransverseMercator, WrapOfTheForward) {
  const Projection p(0, 0, 0);
  const auto x_at = [&](double lon) { return p.forward({lon, 1.2, 0}).x; };
  EXPECT_EQ(x_at(-kPi), x_at(kPi));  // -pi becomes pi
  EXPECT_GT(x_at(-kPi), 0);
  EXPECT_DOUBLE_EQ(x_at(6), x_at(6 - 2 * kPi));
  EXPECT_DOUBLE_EQ(x_at(-6), x_at(2 * kPi - 6));
  EXPECT_GT(std::fabs(x_at(12.5)), 1);  // one turn at most: 6.2 off, not -0.07
}

TEST(TransverseMercator, RoundTrip) {
  std::mt19937 random(2);
  std::uniform_real_distribution<double> dlon(-degrees(3), degrees(3)), lat(-1.35, 1.35);
  for (const double e : {0.0, 0.0818191910428158}) {
    const Projection p(e, 0.2, 0.3);
    Points in(500);
    for (auto& point : in) point = {0.2 + dlon(random), lat(random), 12};
    Points out = in;
    EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
    EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      // on the sphere the forward series leaves d^9 cos^9 of some hundredths
      expect_near(out[i], in[i].x, in[i].y, 12, e == 0 ? 1e-13 : kSeriesGap);
    }
  }
}

TEST(TransverseMercator, ScaleIsTheDerivative) {
  const double e = Ellipsoid::grs80().e;
  const Projection p(e, 0.1, 0.3);
  const double step = 1e-5;
  for (double lat = -1.4; lat < 1.41; lat += 0.35) {
    for (const double d : {-0.06, -0.02, 0.0, 0.05}) {
      const CoordinateTriple n = p.forward({0.1 + d, lat + step, 0});
      const CoordinateTriple s = p.forward({0.1 + d, lat - step, 0});
      const double w = 1 - e * e * std::sin(lat) * std::sin(lat);
      const double radius = (1 - e * e) / std::pow(w, 1.5);
      const double h = std::hypot(n.x - s.x, n.y - s.y) / (2 * step) / radius;
      Points out = untouched(1);
      EXPECT_EQ(p.scale(1, {{0.1 + d, lat, 0}}, out), TW_SUCCESS);
      EXPECT_NEAR(out[0].x, h, 2e-9);  // rounding over the step, and the last terms of the series
    }
  }
}

TEST(TransverseMercator, ScaleBeyondFiftyDegrees) {
  const double limit = 0.8726646259971648;
  const Projection p(0.08, 0, 0);
  Points out = untouched(1);
  EXPECT_EQ(p.scale(1, {{limit, 0.5, 0}}, out), TW_SUCCESS);
  EXPECT_EQ(p.scale(1, {{-limit, 0.5, 0}}, out), TW_SUCCESS);
  const double beyond = std::nextafter(limit, 1);
  EXPECT_EQ(p.scale(1, {{-beyond, 0.5, 0}}, out), TW_I_LATITUDE_LIMITED);
  out = untouched(3);
  EXPECT_EQ(p.scale(2, {{0.01, 0.5, 0}, {beyond, 0.5, 0}, {0.02, 0.5, 0}}, out),
            TW_I_LATITUDE_LIMITED);  // the word stays to the end
  EXPECT_GT(out[1].x, out[2].x);     // the value is computed all the same
  EXPECT_GT(out[2].x, 2);
  // A whole turn less 10 degrees is 350 degrees.
  EXPECT_EQ(p.scale(1, {{degrees(350), 0.5, 0}}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_GT(out[0].x, 100);
}

TEST(TransverseMercator, ScaleAtThePoles) {
  const Projection p(0.08, 0, 0);
  Points out = untouched(4);
  EXPECT_EQ(p.scale(0.9996,
                    {{3, kPi / 2, 0},
                     {3, -kPi / 2, 0},
                     {3, kPi / 2 + 0.9e-10, 0},
                     {0.1, kPi / 2 - 1.1e-10, 0}},
                    out),
            TW_SUCCESS);  // no word at a pole, however far the meridian
  for (std::size_t i = 0; i < 3; ++i) expect_near(out[i], 0.9996, 0.9996, 0.9996 * 0.9996, 0);
  EXPECT_NEAR(out[3].x, 0.9996, 1e-15);
}

TEST(TransverseMercator, ForwardAndScale) {
  const Projection p(Ellipsoid::grs80().e, 0.2, 0.3);
  const Points in = {{0.21, 0.8, 77}, {0.25, -0.6, 77}, {3, kPi / 2, 77}, {0.1, 1.4, 77}};
  Points plane = untouched(4), scale = untouched(4), both = untouched(4);
  p.forward(in, plane);
  p.scale(0.9996, in, scale);
  for (auto& point : both) point.z = 1;
  EXPECT_EQ(p.forward_and_scale(0.9996, in, both), TW_SUCCESS);
  for (std::size_t i = 0; i < 4; ++i) {
    expect_near(both[i], plane[i].x, plane[i].y, scale[i].x, 1e-15);
  }
  EXPECT_EQ(both[2].z, 0.9996);
  // z of the output is multiplied, so a second call compounds; z of the input is not read.
  EXPECT_EQ(p.forward_and_scale(0.9996, in, both), TW_SUCCESS);
  for (std::size_t i = 0; i < 4; ++i) EXPECT_NEAR(both[i].z, scale[i].x * scale[i].x, 1e-15);
  // In place the caller's z is scaled.
  Points same = in;
  p.forward_and_scale(1, same, same);
  EXPECT_NEAR(same[0].z, 77 * scale[0].x / 0.9996, 1e-12);
  EXPECT_NEAR(same[0].x, plane[0].x, 1e-16);
}

TEST(TransverseMercator, ForwardAndScaleBeyondATurn) {
  // x and y of a point 10 degrees to the west, but the scale of 350 degrees.
  const Projection p(Ellipsoid::grs80().e, 0, 0);
  Points far = {{0, 0, 1}}, west = {{0, 0, 1}}, scale = untouched(1);
  EXPECT_EQ(p.forward_and_scale(1, {{degrees(350), 0.5, 0}}, far), TW_SUCCESS);
  p.forward_and_scale(1, {{degrees(-10), 0.5, 0}}, west);
  p.scale(1, {{degrees(350), 0.5, 0}}, scale);
  expect_near(far[0], west[0].x, west[0].y, 1e-14);
  EXPECT_EQ(far[0].z, scale[0].x);
  EXPECT_GT(far[0].z, 100);
}

TEST(TransverseMercator, InverseOnTheSphereUsesLat0) {
  const Projection p(0, 0.5, 0.3);
  EXPECT_EQ(p.M0, 0.3);
  // lat0 counts, M0 does not: sin lat = sin D / cosh x, tan(lon - lon0) = sinh x / cos D, D = 0.5.
  CoordinateTriple point = {0.4, 0.2, 0};
  TWstatus status = 0;
  TWt_merc_i(0.9e-12, 0.5, 0.3, kNaN, kNaN, kNaN, kNaN, kNaN, 1, &point, &point, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(std::sin(point.y) * std::cosh(0.4), std::sin(0.5), 1e-15);
  EXPECT_NEAR(std::tan(point.x - 0.5) * std::cos(0.5), std::sinh(0.4), 1e-15);
  // From 1e-12 on the ellipsoid's constants are read.
  point = {0.4, 0.2, 0};
  TWt_merc_i(1e-12, 0.5, 0.3, 1, 0.3, 0, 0, 0, 1, &point, &point, &status);
  EXPECT_NEAR(std::sin(point.y) * std::cosh(0.4), std::sin(0.5), 1e-4);  // the series, to x^6
  EXPECT_GT(std::fabs(std::sin(point.y) * std::cosh(0.4) - std::sin(0.5)), 1e-9);
}

// The sphere that stands in for the series, written out from its definition.
CoordinateTriple sphere_beside(double e, double lon0, double lat0, double x, double y) {
  const double lat1 = std::asin(std::sin(y + lat0) / std::cosh(x));
  const double sg = std::sin((lat1 + lat0) / 2);
  const double R = std::sqrt(1 - e * e) / (1 - e * e * sg * sg);
  return {std::atan2(std::sinh(x / R), std::cos(y / R + lat0)) + lon0,
          std::asin(std::sin(y / R + lat0) / std::cosh(x / R)), 0};
}

TEST(TransverseMercator, SphereStandsInForTheSeries) {
  const double e = Ellipsoid::grs80().e;
  const Projection p(e, 0.5, 0.3);
  for (const double x : {-5.0, -1.5, 1.5, 2.0, 20.0, 600.0}) {
    for (const double y : {-1.0, 0.1, 0.9}) {
      Points out = {{x, y, 9}};
      EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
      const CoordinateTriple expected = sphere_beside(e, 0.5, 0.3, x, y);
      expect_near(out[0], expected.x, expected.y, 9, 4e-15);
    }
  }
  // Close to the central meridian the series stands: it inverts the forward function, from which
  // the sphere departs by up to the limit.
  const CoordinateTriple plane = p.forward({0.55, 0.9, 0});
  Points out = {plane};
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], 0.55, 0.9, kSeriesGap);
  const CoordinateTriple sphere = sphere_beside(e, 0.5, 0.3, plane.x, plane.y);
  EXPECT_GT(std::hypot(sphere.x - 0.55, sphere.y - 0.9), 1e-4);
  EXPECT_LT(std::hypot(sphere.x - 0.55, sphere.y - 0.9), 0.005);
}

TEST(TransverseMercator, LimitOfTheSphereBesideTheSeries) {
  // Along a parallel the two solutions drift apart steadily: up to 0.005 the series stands, beyond
  // it the sphere.
  const double e = 0.0999;
  const Projection p(e, 0, 0);
  int series = 0, spheres = 0;
  for (double x = 0; x < 1.2; x += 0.003) {
    Points out = {{x, 0.35, 0}};
    p.inverse(out, out);
    const CoordinateTriple sphere = sphere_beside(e, 0, 0, x, 0.35);
    const double apart = std::hypot(out[0].x - sphere.x, out[0].y - sphere.y);
    if (apart < 4e-15) {
      ++spheres;
    } else {
      ++series;
      EXPECT_LE(apart, 0.005);
    }
  }
  EXPECT_GT(series, 10);
  EXPECT_GT(spheres, 10);
}

TEST(TransverseMercator, InverseAtThePole) {
  const double e = Ellipsoid::grs80().e;
  const Projection p(e, 0.5, 0.2);
  const double quarter = p.A0 * kPi / 2;
  Points out = {{0.1, quarter - p.M0, 0},
                {900, -quarter - p.M0, 0},  // neither the series nor the check is looked at
                {0.1, quarter - p.M0 - 0.5e-12, 0}};
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], 0.5, kPi / 2, 0);
  expect_near(out[1], 0.5, -kPi / 2, 0);
  expect_near(out[2], 0.5, kPi / 2, 0);
}

TEST(TransverseMercator, InverseStopsOutOfRange) {
  for (const double e : {0.0, 0.0818}) {
    const Projection p(e, 0, 0);
    const double x = e == 0 ? 700.0 : 690.0;
    Points in = {{0.01, 0.3, 0}, {x, 0.3, 0}, {std::nextafter(700.0, 800), 0.3, 0}, {0, 0.1, 0}};
    Points out = untouched(4);
    EXPECT_EQ(p.inverse(in, out), TW_RANGE_ERROR);
    EXPECT_NE(out[0].x, kUntouched);
    EXPECT_NEAR(out[1].x, kPi / 2, 1e-15);  // sinh x is beyond all cosines
    EXPECT_NEAR(out[1].y, 0, 1e-15);
    expect_untouched(out[2]);
    expect_untouched(out[3]);
  }
  // x / R is beyond the limit before x is, where R is below 1.
  const Projection p(0.5, 0, 0);
  const Points in = {{-690.0, 0.3, 0}, {0, 0.1, 0}};
  Points out = untouched(2);
  EXPECT_EQ(p.inverse(in, out), TW_RANGE_ERROR);
  expect_untouched(out[0]);
  expect_untouched(out[1]);
}

TEST(TransverseMercator, InverseDoesNotWrap) {
  const Projection p(0.0818, 3.1, 0);
  const CoordinateTriple plane = p.forward({3.15, 0.5, 0});
  Points out = {plane};
  p.inverse(out, out);
  EXPECT_NEAR(out[0].x, 3.15, 1e-10);
}

TEST(TransverseMercator, NotANumberGoesThrough) {
  const Projection p(0.0818, 0, 0);
  Points out = {{kNaN, 0.5, 0}, {0.1, kNaN, 0}};
  EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].x));
  EXPECT_TRUE(std::isnan(out[1].y));
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].x));
  EXPECT_TRUE(std::isnan(out[1].y));
  out = {{kNaN, 0.5, 0}};
  EXPECT_EQ(p.scale(1, out, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].x));
}

TEST(TransverseMercator, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  // At e^2 = 0.0004 the terms in e^8 are below 2e-14, and the footpoint's e1^4 with them.
  const struct {
    std::string ellipsoid;
    double a, e, tolerance;
  } ellipsoids[] = {{" +a=1 +es=0.0004", 1, 0.02, 1e-12},
                    {" +ellps=GRS80", Ellipsoid::grs80().a, Ellipsoid::grs80().e, kSeriesGap}};
  for (const auto& [ellipsoid, a, e, tolerance] : ellipsoids) {
    const ProjPeer peer("+proj=tmerc +lon_0=9 +lat_0=20" + ellipsoid);
    ASSERT_TRUE(peer.ok());
    const Projection p(e, degrees(9), degrees(20));
    for (double lat = -77; lat < 77.5; lat += 7) {
      for (double lon = 6; lon < 12.1; lon += 0.5) {
        const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
        const CoordinateTriple expected = peer.forward(in);
        const CoordinateTriple out = p.forward(in);
        EXPECT_NEAR(out.x, expected.x / a, 1e-12);
        EXPECT_NEAR(out.y, expected.y / a, tolerance);
        Points back = {{expected.x / a, expected.y / a, 0}};
        EXPECT_EQ(p.inverse(back, back), TW_SUCCESS);
        EXPECT_NEAR(back[0].x, in.x, 1.6e-10);            // the next term, (61 + ...) D^7 / 5040
        EXPECT_NEAR(back[0].y, in.y, tolerance + 1e-12);  // and (1385 + ...) D^8 / 40320
      }
    }
  }
#endif
}

}  // namespace
