#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "support/projection_checks.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Projection {
  double e, lon0;
  double c0 = 0, c2 = 0, c4 = 0, c6 = 0, c8 = 0, m0 = 0, d2 = 0, d4 = 0, d6 = 0, d8 = 0;

  Projection(double e_, double lon0_, double lat0) : e(e_), lon0(lon0_) {
    TWcassini_c(e, kNaN, lat0, &c0, &c2, &c4, &c6, &c8, &m0, &d2, &d4, &d6, &d8);
  }
  void forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWcassini_f(e, lon0, c0, c2, c4, c6, c8, m0, static_cast<int32_t>(in.size()), in.data(),
                out.data(), &word);
    EXPECT_EQ(word, TW_SUCCESS);
  }
  void inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWcassini_i(e, lon0, c0, m0, d2, d4, d6, d8, static_cast<int32_t>(in.size()), in.data(),
                out.data(), &word);
    EXPECT_EQ(word, TW_SUCCESS);
  }
  TWstatus scale(double k0, Points& in, Points& out) const {
    TWstatus word = 0;
    TWcassini_s(e, lon0, k0, c0, c2, c4, c6, c8, m0, static_cast<int32_t>(in.size()), in.data(),
                out.data(), &word);
    return word;
  }
};

// The arc's terms in e^8 are not those of the full expansion: 1.6e-10 on the earth's ellipsoids,
// twice for an arc between two latitudes or against the inverse, which goes by the true arc.
constexpr double kSeriesGap = 3.2e-10;

TEST(Cassini, TrinidadGrid) {
  // IOGP Publication 373-7-2, Cassini-Soldner: Trinidad 1903 on Clarke 1858, links of 0.66 Clarke's
  // feet, point 10 00 00 N 62 00 00 W.
  const double a = 31706587.88;
  const double e = std::sqrt(1 - (20855233.0 * 20855233.0) / (20926348.0 * 20926348.0));
  const Projection p(e, degrees(-61, -20), degrees(10, 26, 30));
  Points out = {{degrees(-62), degrees(10), 0}};
  p.forward(out, out);
  EXPECT_NEAR(out[0].x * a + 430000, 66644.94, 0.01);
  EXPECT_NEAR(out[0].y * a + 325000, 82536.22, 0.01);
}

TEST(Cassini, Coefficients) {
  const Projection p(0.5, 0, 0.3);
  MeridianByHand::expect_powers({p.c0, p.c2, p.c4, p.c6, p.c8}, {p.d2, p.d4, p.d6, p.d8});
  EXPECT_NEAR(p.m0, MeridianByHand::arc(0.3), 1e-16);
  EXPECT_EQ(Projection(0.5, 0, 0).m0, 0);
}

TEST(Cassini, SphereInClosedForm) {
  // Snyder 1987, eq. 13-1, 13-2: x = asin(cos lat sin d), y = atan(tan lat / cos d) - lat0.
  const Projection p(0, 0.2, 0.3);
  EXPECT_EQ(p.m0, 0.3);
  for (const double lat : {-1.0, -0.2, 0.4, 1.1}) {
    for (const double d : {-0.03, 0.01, 0.04}) {
      Points out = {{0.2 + d, lat, 0}};
      p.forward(out, out);
      expect_near(out[0], std::asin(std::cos(lat) * std::sin(d)),
                  std::atan(std::tan(lat) / std::cos(d)) - 0.3, 2e-9);  // the terms left out, d^6
    }
  }
}

TEST(Cassini, ForwardTakesOffWholeTurns) {
  const Projection p(0.0818, 0, 0);
  Points out = untouched(5);
  p.forward({{0.04, 0.5, 0},
             {0.04 + 6 * kPi, 0.5, 0},
             {0.04 - 6 * kPi, 0.5, 0},
             {-kPi, 0.5, 0},
             {kPi, 0.5, 0}},
            out);
  expect_near(out[1], out[0].x, out[0].y, 1e-14);
  expect_near(out[2], out[0].x, out[0].y, 1e-14);
  EXPECT_EQ(out[3].x, -out[4].x);  // -pi stays
  EXPECT_NE(out[3].x, 0);
}

TEST(Cassini, NothingFails) {
  const Projection p(0.0818, 0, 0);
  Points out = {{0.1, 3, 0}, {0.1, kNaN, 0}, {1, kPi / 2, 0}};
  p.forward(out, out);
  EXPECT_TRUE(std::isfinite(out[0].y));
  EXPECT_TRUE(std::isnan(out[1].y));
  expect_near(out[2], 0, p.c0 * kPi / 2, 1e-15);
  p.inverse(out, out);
  EXPECT_TRUE(std::isnan(out[1].y));
}

TEST(Cassini, InverseAtThePoles) {
  const Projection p(0.0818, 4, 0.3);
  const double quarter = p.c0 * kPi / 2;
  Points out = {{0.1, quarter - p.m0, 0},
                {0.1, -quarter - p.m0, 0},
                {0.1, quarter - p.m0 - 0.5e-12, 0},
                {1e-3, quarter - p.m0 - 1e-2, 0}};
  p.inverse(out, out);
  expect_near(out[0], 4, kPi / 2, 0);
  expect_near(out[1], 4, -kPi / 2, 0);
  expect_near(out[2], 4, kPi / 2, 0);
  EXPECT_GT(out[3].x, 4.05);
  // Which pole goes by y, not by the arc: an origin beyond the pole leaves a negative y north.
  const Projection beyond(0.0818, 4, 2);
  out = {{0.1, quarter - beyond.m0, 0}};
  ASSERT_LT(out[0].y, 0);
  beyond.inverse(out, out);
  expect_near(out[0], 4, -kPi / 2, 0);
}

TEST(Cassini, RoundTrip) {
  std::mt19937 random(9);
  std::uniform_real_distribution<double> lon(-0.02, 0.02), lat(-1.3, 1.3);
  for (const double e : {0.0, 0.0818191910428158}) {
    const Projection p(e, 3.14, 0.4);
    Points in(300);
    for (auto& q : in) q = {3.14 + lon(random), lat(random), 12};
    Points out = in;
    p.forward(in, out);
    p.inverse(out, out);
    for (std::size_t i = 0; i < in.size(); ++i) {
      // not wrapped; the series leave terms of D^6 tan^5 or so, 0.02 to the sixth being 6e-11
      expect_near(out[i], in[i].x, in[i].y, 12, 1e-10 + (e == 0 ? 0 : kSeriesGap));
    }
  }
}

TEST(Cassini, ScaleInPlace) {
  // h along the central meridian's direction, 1 + x^2 / 2 R^2: the rate of y by the geodesic's
  // foot, here against x of the forward function and the radii of curvature.
  const double e = 0.0818191910428158;
  const Projection p(e, 0.1, 0.4);
  for (double lat = -1.4; lat < 1.41; lat += 0.35) {
    Points plane = {{0.13, lat, 0}};
    p.forward(plane, plane);
    const double w = 1 - e * e * std::sin(lat) * std::sin(lat);
    const double R2 = (1 - e * e) / (w * w);
    Points q = {{0.13, lat, 555}};
    EXPECT_EQ(p.scale(2, q, q), TW_SUCCESS);
    EXPECT_EQ(q[0].x, 2);
    EXPECT_NEAR(q[0].y, 2 * (1 + plane[0].x * plane[0].x / (2 * R2)), 1e-15);
    EXPECT_EQ(q[0].z, 2 * q[0].y);
  }
}

TEST(Cassini, ScaleIsTheDerivative) {
  // On the equator the meridian runs along y: h = dy / (M dlat), by differences.
  const double e = 0.0818191910428158;
  const double step = 1e-5;
  const Projection p(e, 0, 0);
  Points n = {{0.03, step, 0}, {0.03, -step, 0}};
  p.forward(n, n);
  Points q = {{0.03, 0, 0}};
  EXPECT_EQ(p.scale(1, q, q), TW_SUCCESS);
  EXPECT_NEAR(q[0].y, (n[0].y - n[1].y) / (2 * step) / (1 - e * e), 5e-7);  // x^4 5/24
}

TEST(Cassini, ScaleBeyondThePoles) {
  const Projection p(0.0818, 0, 0);
  const double past = std::nextafter(kPi / 2, 2);
  Points q = {{0.02, past, 0}, {0.02, 0.5, 0}, {0.02, -past, 0}};
  EXPECT_EQ(p.scale(3, q, q), TW_BAD_LATITUDE);
  expect_near(q[0], 3, 3, 9, 0);
  EXPECT_GT(q[1].y, 3);
  expect_near(q[2], 3, 3, 9, 0);
  // At the poles x is 0 and h is k0.
  q = {{0.02, kPi / 2, 0}, {0.02, -kPi / 2, 0}};
  EXPECT_EQ(p.scale(3, q, q), TW_SUCCESS);
  expect_near(q[0], 3, 3, 9, 0);
  expect_near(q[1], 3, 3, 9, 0);
}

TEST(Cassini, ScaleWithTwoArrays) {
  const double e = 0.0818;
  const Projection p(e, 0, 0);
  Points in = {{0.02, 0.3, 111}, {0.02, 0.3, 222}};
  Points out = {{0, 0, 0.9}, {0, 0, 2}};
  EXPECT_EQ(p.scale(1, in, out), TW_BAD_LATITUDE);
  expect_near(in[0], 0.02, 0.3, 0.3, 0);
  expect_near(in[1], 0.02, 0.3, 0.3, 0);
  Points plane = {{0.02, 0.3, 0}};
  p.forward(plane, plane);
  const double w = 1 - e * e * std::sin(0.9) * std::sin(0.9);
  EXPECT_NEAR(out[0].y, 1 + plane[0].x * plane[0].x * w * w / (2 * (1 - e * e)), 1e-15);
  expect_near(out[1], 1, 1, 1, 0);
}

TEST(Cassini, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  // At e^2 = 0.0004 the terms in e^8 are below 2e-14.
  const struct {
    std::string ellipsoid;
    double a, e, tolerance;
  } ellipsoids[] = {{" +a=1 +es=0.0004", 1, 0.02, 1e-14},
                    {" +ellps=GRS80", Ellipsoid::grs80().a, Ellipsoid::grs80().e, kSeriesGap}};
  for (const auto& [ellipsoid, a, e, tolerance] : ellipsoids) {
    const ProjPeer peer("+proj=cass +lon_0=10 +lat_0=40" + ellipsoid);
    ASSERT_TRUE(peer.ok());
    const Projection p(e, degrees(10), degrees(40));
    for (double lat = -80; lat < 85; lat += 10) {
      for (double lon = 8; lon < 12.1; lon += 0.5) {
        const Points in = {{degrees(lon), degrees(lat), 0}};
        Points out = in;
        p.forward(in, out);
        const CoordinateTriple expected = peer.forward(in[0]);
        EXPECT_NEAR(out[0].x, expected.x / a, 1e-14);
        EXPECT_NEAR(out[0].y, expected.y / a, tolerance);
      }
    }
  }
#endif
}

}  // namespace
