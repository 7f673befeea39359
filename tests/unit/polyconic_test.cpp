#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Projection {
  double e, lon0, m0 = kUntouched;

  Projection(double e_, double lon0_, double lat0) : e(e_), lon0(lon0_) {
    TWpolycon_c(e, lat0, &m0);
  }
  void forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWpolycon_f(e, lon0, m0, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    EXPECT_EQ(word, TW_SUCCESS);
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWpolycon_i(e, lon0, m0, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWpolycon_s(e, lon0, k0, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
};

TEST(Polyconic, SnydersNumericalExample) {
  // Snyder 1987, pp. 304-306: Clarke 1866, origin 30 N 96 W, point 40 N 75 W.
  const auto [a, e] = Ellipsoid::clarke_1866();
  const Projection p(e, degrees(-96), degrees(30));
  EXPECT_NEAR(p.m0 * a, 3319933.3, 0.05);
  const Points in = {{degrees(-75), degrees(40), 4}};
  Points out = untouched(1), scale = untouched(1);
  p.forward(in, out);
  EXPECT_NEAR(out[0].x * a, 1776774.5, 0.05);
  EXPECT_NEAR(out[0].y * a, 1319657.8, 0.05);
  EXPECT_EQ(out[0].z, kUntouched);
  EXPECT_EQ(p.scale(1, in, scale), TW_SUCCESS);
  EXPECT_NEAR(scale[0].y, 1.0393954, 5e-7);
  EXPECT_EQ(scale[0].x, 1);
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  // the longitude is that of the latitude before the last step, which may be 1e-9 away
  expect_near(out[0], in[0].x, in[0].y, 1e-9);
}

TEST(Polyconic, SphereOfSnyder) {
  // Snyder 1987, p. 303: unit sphere, the same origin and point.
  const Projection p(0, degrees(-96), degrees(30));
  EXPECT_DOUBLE_EQ(p.m0, degrees(30));
  Points out = {{degrees(-75), degrees(40), 0}};
  p.forward(out, out);
  expect_near(out[0], 0.2781798, 0.2074541, 5e-8);
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], degrees(-75), degrees(40), 1e-9);
}

TEST(Polyconic, ArcOfTheOrigin) {
  // The series to e^6 with sines of its own, e = 0.5: hand arithmetic in 256ths and 3072nds.
  const double e2 = 0.25;
  const double p = 0.7;
  const double expected =
      (1 - e2 / 4 - 3 * e2 * e2 / 64 - 5 * e2 * e2 * e2 / 256) * p -
      (3 * e2 / 8 + 3 * e2 * e2 / 32 + 45 * e2 * e2 * e2 / 1024) * std::sin(2 * p) +
      (15 * e2 * e2 / 256 + 45 * e2 * e2 * e2 / 1024) * std::sin(4 * p) -
      35 * e2 * e2 * e2 / 3072 * std::sin(6 * p);
  EXPECT_NEAR(Projection(0.5, 0, p).m0, expected, 2e-16);
  EXPECT_EQ(Projection(0.5, 0, 0).m0, 0);
  EXPECT_NEAR(Projection(0.5, 0, -p).m0, -expected, 2e-16);
}

TEST(Polyconic, ForwardOnTheEquator) {
  const Projection p(0.0818, 0.1, 0.3);
  Points out = untouched(3);
  p.forward({{1.1, 0.99e-7, 0}, {1.1, -0.99e-7, 0}, {1.1, 1.01e-7, 0}}, out);
  EXPECT_EQ(out[0].x, 1.1 - 0.1);
  EXPECT_EQ(out[0].y, -p.m0);
  EXPECT_EQ(out[1].x, 1.1 - 0.1);
  EXPECT_EQ(out[1].y, -p.m0);
  EXPECT_NEAR(out[2].x, 1, 1e-13);
  // the arc of 1.01e-7 and a parallel bent by half the square of the longitude, which is formed as
  // 1 - cos(1e-7) over 1e-7
  EXPECT_NEAR(out[2].y + p.m0, 1.01e-7 * (1 - 0.0818 * 0.0818 + 0.5), 1.2e-9);
}

TEST(Polyconic, ForwardAtThePoles) {
  const Projection p(0.0818, 0, 0);
  Points out = untouched(2);
  p.forward({{1, kPi / 2, 0}, {1, -kPi / 2, 0}}, out);
  expect_near(out[0], 0, Projection(0.0818, 0, kPi / 2).m0, 1e-15);
  expect_near(out[1], 0, -Projection(0.0818, 0, kPi / 2).m0, 1e-15);
}

TEST(Polyconic, ForwardWrapsOneTurn) {
  const Projection p(0, 0, 0);
  Points out = untouched(6);
  p.forward({{-kPi, 0, 0}, {kPi, 0, 0}, {4, 0, 0}, {-4, 0, 0}, {12.5, 0, 0}, {-12.5, 0, 0}}, out);
  EXPECT_EQ(out[0].x, -kPi);  // -pi stays
  EXPECT_EQ(out[1].x, kPi);
  EXPECT_DOUBLE_EQ(out[2].x, 4 - 2 * kPi);
  EXPECT_DOUBLE_EQ(out[3].x, 2 * kPi - 4);
  EXPECT_DOUBLE_EQ(out[4].x, 12.5 - 2 * kPi);
  EXPECT_DOUBLE_EQ(out[5].x, 2 * kPi - 12.5);
}

TEST(Polyconic, RoundTrip) {
  std::mt19937 random(7);
  std::uniform_real_distribution<double> lon(-1, 1), lat(-1.4, 1.4);
  for (const double e : {0.0, 0.0818191910428158}) {
    const Projection p(e, 0.01, 0.4);
    Points in(300);
    for (auto& q : in) q = {0.01 + lon(random), lat(random), 12};
    Points out = in;
    p.forward(in, out);
    EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      // Steps below 1e-9 end it: the latitude has then all its digits, the longitude a step's less.
      EXPECT_NEAR(out[i].y, in[i].y, 1e-11);
      EXPECT_NEAR(out[i].x, in[i].x, 5e-9);
      EXPECT_EQ(out[i].z, 12);
    }
  }
}

TEST(Polyconic, InverseOnTheEquator) {
  const Projection p(0.0818, 4, 0.3);
  Points out = untouched(3);
  EXPECT_EQ(
      p.inverse({{1.5, -p.m0 + 0.99e-6, 0}, {-1.5, -p.m0 - 0.99e-6, 0}, {0.5, -p.m0 + 1.01e-6, 0}},
                out),
      TW_SUCCESS);
  expect_near(out[0], 5.5, 0, 0);  // not wrapped
  expect_near(out[1], 2.5, 0, 0);
  EXPECT_GT(out[2].y, 5e-7);
}

TEST(Polyconic, InverseOnTheCentralMeridianAndAtThePoles) {
  const Projection p(0.0818, 0.3, 0.2);
  Points out = {{0.3, 0.7, 0}, {0.3, -1.2, 0}};
  p.forward(out, out);
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  EXPECT_EQ(out[0].x, 0.3);
  EXPECT_NEAR(out[0].y, 0.7, 1e-12);
  EXPECT_EQ(out[1].x, 0.3);
  // On the sphere the arc of the pole is the pole, the start of the iteration: the longitude is
  // lon0, where x C would be beyond all sines.
  const Projection sphere(0, 0.3, 0);
  for (const double sign : {1.0, -1.0}) {
    out = {{1e-10, sign * kPi / 2, 0}};
    EXPECT_EQ(sphere.inverse(out, out), TW_SUCCESS);
    EXPECT_EQ(out[0].x, 0.3);
    EXPECT_NEAR(out[0].y, sign * kPi / 2, 1e-15);
  }
  // On the ellipsoid the arc is not the latitude, and the last step comes from further away.
  const double quarter = Projection(0.0818, 0, kPi / 2).m0;
  out = {{0, quarter - p.m0, 0}};
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  EXPECT_EQ(out[0].x, 0.3);
  EXPECT_NEAR(out[0].y, kPi / 2, 2e-8);  // what the tangent leaves of the digits
}

TEST(Polyconic, InverseRunsAway) {
  // Outside the map, and at large eccentricities also within, the steps jump between the branches
  // of the tangent.  A step beyond 5 radians after the fourth pass ends the array; passes that run
  // out do not.
  std::mt19937 random(8);
  std::uniform_real_distribution<double> within(-3, 3);
  for (const double e : {0.0818, 0.9}) {
    const Projection p(e, 0, 0);
    int diverged = 0, limited = 0, good = 0;
    for (int i = 0; i < 1000; ++i) {
      const Points in = {{0, 0, 0}, {within(random), within(random), 0}, {0.1, 0, 0}};
      Points out = untouched(3);
      const TWstatus word = p.inverse(in, out);
      EXPECT_EQ(out[0].x, 0);
      if (word == TW_DIVERGED) {
        ++diverged;
        expect_untouched(out[1]);
        expect_untouched(out[2]);
        continue;
      }
      EXPECT_NE(out[1].y, kUntouched);
      EXPECT_EQ(out[2].x, 0.1);
      word == TW_SUCCESS ? ++good : ++limited;
      EXPECT_TRUE(word == TW_SUCCESS || word == TW_I_LATITUDE_LIMITED);
    }
    EXPECT_GT(diverged, 50);
    EXPECT_GT(good, 50);
    EXPECT_GE(limited, e == 0.9 ? 50 : 0);
  }
}

TEST(Polyconic, NotANumberRunsOutOfPasses) {
  const Projection p(0.0818, 0, 0);
  Points out = {{0.1, kNaN, 0}, {0.1, 0.2, 0}};
  EXPECT_EQ(p.inverse(out, out), TW_I_LATITUDE_LIMITED);
  EXPECT_TRUE(std::isnan(out[0].y));
  EXPECT_NEAR(out[1].y, 0.2, 0.01);
  out = {{0.1, kNaN, 0}};
  p.forward(out, out);
  EXPECT_TRUE(std::isnan(out[0].y));
}

TEST(Polyconic, ScaleIsTheDerivative) {
  for (const double e : {0.0, 0.0818191910428158}) {
    const Projection p(e, 0.1, 0.4);
    for (double lat = -1.4; lat < 1.41; lat += 0.35) {
      const auto forward = [&](CoordinateTriple q) {
        Points out = untouched(1);
        p.forward({q}, out);
        return out[0];
      };
      const CoordinateTriple expected = numeric_scale(forward, 0.6, lat, e);
      Points out = untouched(1);
      EXPECT_EQ(p.scale(2, {{0.6, lat, 0}}, out), TW_SUCCESS);
      EXPECT_EQ(out[0].x, 2);
      EXPECT_NEAR(expected.x, 1, 1e-9);
      // By contract h takes 1 - e^2 for the rate of the arc: e^8 is missing.
      EXPECT_NEAR(out[0].y, 2 * expected.y, 3e-8);
      EXPECT_EQ(out[0].z, 2 * out[0].y);
    }
  }
}

TEST(Polyconic, ScaleOnTheEquator) {
  const double e2 = 0.0818 * 0.0818;
  const Projection p(0.0818, 0.1, 0.4);
  Points out = untouched(2);
  EXPECT_EQ(p.scale(1, {{0.6, 0, 0}, {0.6, 0.99e-14, 0}}, out), TW_SUCCESS);
  // M' at the equator is 1 - e^2 but for the terms that the series leaves out
  EXPECT_NEAR(out[0].y, 1 + 0.125 / (1 - e2), 1e-9);
  EXPECT_EQ(out[1].y, out[0].y);
  EXPECT_EQ(p.scale(1, {{0.6, 1e-6, 0}}, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].y, 1 + 0.125 / (1 - e2), 1e-3);  // atan of (E - sin E) over cancelling terms
}

TEST(Polyconic, ScaleOnTheSphereHardByTheEquator) {
  // The arc tangent is of 0 / 0; optimised builds must not make a number of it.
  const Projection p(0, 0, 0.4);
  Points out = untouched(1);
  EXPECT_EQ(p.scale(1, {{0.6, 1e-12, 0}}, out), TW_SUCCESS);
  EXPECT_EQ(out[0].x, 1);
  EXPECT_TRUE(std::isnan(out[0].y));
  EXPECT_TRUE(std::isnan(out[0].z));
}

TEST(Polyconic, ScaleAtThePoles) {
  const Projection p(0.0818, 0, 0.4);
  Points out = untouched(2);
  EXPECT_EQ(p.scale(1, {{0, kPi / 2, 0}, {0, -kPi / 2, 0}}, out), TW_SUCCESS);
  // on the central meridian h is true, also where the south is held past the north pole
  expect_near(out[0], 1, 1, 1, 1e-15);
  expect_near(out[1], 1, 1, 1, 1e-15);
}

TEST(Polyconic, ScaleBeyondThePolesRepeats) {
  const Projection p(0.0818, 0, 0.4);
  const double past = std::nextafter(kPi / 2, 2);
  Points out = untouched(4);
  EXPECT_EQ(p.scale(2, {{0, past, 0}, {0.5, 0.3, 0}, {0, -past, 0}, {0, 7, 0}}, out),
            TW_BAD_LATITUDE);
  expect_near(out[0], 2, 0, 0, 0);  // nothing good came before
  EXPECT_GT(out[1].y, 2);
  expect_near(out[2], 2, out[1].y, out[1].z, 0);
  expect_near(out[3], 2, out[1].y, out[1].z, 0);
}

TEST(Polyconic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  // At e^2 = 0.0004 the terms in e^8 are below 1e-15; on the earth's ellipsoids they reach 1e-10 in
  // each arc.
  const struct {
    std::string ellipsoid;
    double a, e, tolerance;
  } ellipsoids[] = {{" +a=1 +es=0.0004", 1, 0.02, 2e-14},
                    {" +ellps=GRS80", Ellipsoid::grs80().a, Ellipsoid::grs80().e, 2e-10}};
  for (const auto& [ellipsoid, a, e, tolerance] : ellipsoids) {
    const ProjPeer peer("+proj=poly +lon_0=10 +lat_0=40" + ellipsoid);
    ASSERT_TRUE(peer.ok());
    const Projection p(e, degrees(10), degrees(40));
    for (double lat = -80; lat < 85; lat += 10) {
      for (double lon = -40; lon < 61; lon += 10) {
        const Points in = {{degrees(lon), degrees(lat), 0}};
        Points out = in;
        p.forward(in, out);
        const CoordinateTriple expected = peer.forward(in[0]);
        expect_near(out[0], expected.x / a, expected.y / a, tolerance);
      }
    }
  }
#endif
}

}  // namespace
