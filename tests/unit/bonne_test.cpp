#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "support/projection_checks.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

struct Bonne {
  double e, lat1, lon0;
  double e2 = kUntouched, c1 = kUntouched, r0 = kUntouched;
  TWstatus status = 0;

  Bonne(double e_, double lat1_, double lon0_) : e(e_), lat1(lat1_), lon0(lon0_) {
    TWbonne_c(e, &lat1, &e2, &c1, &r0, &status);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWbonne_f(lon0, lat1, e, e2, c1, r0, static_cast<int32_t>(in.size()), in.data(), out.data(),
              &word);
    return word;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWbonne_i(lon0, lat1, e, e2, c1, r0, static_cast<int32_t>(in.size()), in.data(), out.data(),
              &word);
    return word;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWbonne_s(k0, lat1, lon0, e2, r0, static_cast<int32_t>(in.size()), in.data(), out.data(),
              &word);
    return word;
  }
};

TEST(Bonne, SnydersNumericalExampleOfTheSphere) {
  // Snyder 1987, p. 309: sphere of radius 1, 40 N, 75 W, point 30 N, 85 W.
  const Bonne p(0, degrees(40), degrees(-75));
  EXPECT_EQ(p.status, TW_SUCCESS);
  EXPECT_EQ(p.e2, 0);
  EXPECT_DOUBLE_EQ(p.c1, 1 / std::tan(degrees(40)));
  EXPECT_DOUBLE_EQ(p.r0, p.c1 + degrees(40));
  Points out = {{degrees(-85), degrees(30), 6}};
  EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
  expect_near(out[0], -0.1508418, -0.1661807, 6, 5e-8);
  EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], degrees(-85), degrees(30), 6, 1e-14);
}

TEST(Bonne, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  for (const double lat1 : {40.0, -25.0}) {
    const ProjPeer peer("+proj=bonne +lon_0=10 +ellps=GRS80 +lat_1=" + std::to_string(lat1));
    ASSERT_TRUE(peer.ok());
    const auto [a, e] = Ellipsoid::grs80();
    const Bonne p(e, degrees(lat1), degrees(10));
    EXPECT_EQ(p.status, TW_SUCCESS);
    EXPECT_EQ(p.e2, e * e);
    for (double lat = -60; lat < 80; lat += 7.3) {
      for (double lon = -70; lon < 90; lon += 21) {
        const Points in = {{degrees(lon), degrees(lat), 0}};
        Points out = untouched(1);
        EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
        const CoordinateTriple expected = peer.forward(in[0]);
        // the series of the arc to n^4 leaves 5e-13
        expect_near(out[0], expected.x / a, expected.y / a, 2e-12);
        EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
        expect_near(out[0], in[0].x, in[0].y, 1e-11);  // the inverse arc ends at 1e-12
      }
    }
  }
#endif
}

TEST(Bonne, StandardParallelIsKeptOffTheEquator) {
  const double least = 1.6e-8;
  EXPECT_EQ(Bonne(0, 0, 0).lat1, least);
  EXPECT_EQ(Bonne(0, 1e-9, 0).lat1, least);
  EXPECT_EQ(Bonne(0, -1e-9, 0).lat1, -least);
  EXPECT_EQ(Bonne(0, least, 0).lat1, least);
  EXPECT_EQ(Bonne(0, -least, 0).lat1, -least);
  EXPECT_EQ(Bonne(0, 2e-8, 0).lat1, 2e-8);
  EXPECT_EQ(Bonne(0.08, 0, 0).lat1, least);
  EXPECT_NEAR(Bonne(0, 0, 0).c1 * least, 1, 1e-15);
}

TEST(Bonne, SphereLimitOfTheEccentricity) {
  EXPECT_EQ(Bonne(1.59e-8, 0.5, 0).e2, 0);
  EXPECT_EQ(Bonne(1.6e-8, 0.5, 0).e2, 1.6e-8 * 1.6e-8);
}

TEST(Bonne, ConstantsFail) {
  for (const double e : {1.0, 1.5, -1e-9}) {
    const Bonne p(e, 0, 0);
    EXPECT_EQ(p.status, TW_BAD_ECCENTRICITY);
    EXPECT_EQ(p.lat1, 0);  // nothing else is done
    EXPECT_EQ(p.e2, kUntouched);
    EXPECT_EQ(p.c1, kUntouched);
    EXPECT_EQ(p.r0, kUntouched);
  }
  const Bonne beyond(0.08, 2, 0);
  EXPECT_EQ(beyond.status, TW_BAD_LATITUDE);
  EXPECT_NE(beyond.c1, kUntouched);
  EXPECT_EQ(beyond.r0, kUntouched);
  const Bonne held(0.08, kPi / 2 + 5e-13, 0);
  EXPECT_EQ(held.status, TW_I_LATITUDE_LIMITED);
  EXPECT_NE(held.r0, kUntouched);
}

TEST(Bonne, AnEllipsoidThatIsNoneEndsTheArray) {
  const Bonne good(0.08, 0.7, 0.2);
  for (const double e : {1.5, -0.1}) {
    const Points in = {{0.2, 0.7, 0}, {0.3, 0.5, 0}, {0.2, 0.7, 0}};
    Points out = untouched(3);
    TWstatus status = 0;
    TWbonne_f(0.2, 0.7, e, good.e2, good.c1, good.r0, 3, in.data(), out.data(), &status);
    EXPECT_EQ(status, TW_BAD_ECCENTRICITY);
    expect_near(out[0], 0, 0, 0);  // the origin needs no arc
    expect_untouched(out[1]);
    expect_untouched(out[2]);
    const Points plane = {{0, 0, 0}, {0.1, 0.1, 0}, {0, 0, 0}};
    out = untouched(3);
    TWbonne_i(0.2, 0.7, e, good.e2, good.c1, good.r0, 3, plane.data(), out.data(), &status);
    EXPECT_EQ(status, TW_BAD_ECCENTRICITY);
    expect_near(out[0], 0.2, 0.7, 0);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
  }
}

TEST(Bonne, OriginIsExactlyZero) {
  for (const double e : {0.0, 0.08}) {
    const Bonne p(e, 0.7, 0.2);
    const Points in = {{0.2 + 0.9e-12, 0.7 - 0.9e-12, 0}, {0.2, 0.7, 0}};
    Points out = untouched(2);
    EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
    expect_near(out[0], 0, 0, 0);
    expect_near(out[1], 0, 0, 0);
    const Points plane = {{0.9e-12, -0.9e-12, 0}, {2e-12, 0, 0}};
    EXPECT_EQ(p.inverse(plane, out), TW_SUCCESS);
    expect_near(out[0], 0.2, 0.7, 0);
    EXPECT_NE(out[1].x, 0.2);
  }
}

TEST(Bonne, StandardParallelTakesItsOwnRadius) {
  // At lat1 off the central meridian: r = c1 and the angle sin(lat) d; a made-up r0 shows that it
  // is not looked at there, and that it is next to it.
  const double e = 0.08, d = 0.3, lat1 = 0.7;
  const Bonne p(e, lat1, 0);
  const Points in = {{d, lat1, 0}, {d, lat1 + 0.9e-12, 0}, {d, lat1 + 1e-9, 0}};
  Points out = untouched(3);
  TWstatus status = 0;
  TWbonne_f(0, lat1, e, p.e2, p.c1, 50, 3, in.data(), out.data(), &status);
  for (std::size_t i = 0; i < 2; ++i) {
    expect_near(out[i], p.c1 * std::sin(std::sin(lat1) * d),
                p.c1 - p.c1 * std::cos(std::sin(lat1) * d), 1e-12);
  }
  EXPECT_LT(out[2].y, -40);
}

TEST(Bonne, PolesTakeTheCentralLongitude) {
  const Bonne p(0, 0.7, 0.2);
  // a point within 1e-12 of the apex of the cone lies at the pole
  const Points in = {{0, p.c1 - (p.r0 - kPi / 2) - 0.5e-12, 0}};
  Points out = untouched(1);
  EXPECT_EQ(p.inverse(in, out), TW_SUCCESS);
  EXPECT_EQ(out[0].x, 0.2);
}

TEST(Bonne, ArcFailureStops) { expect_arc_failure_stops(Bonne(0.08, 0.7, 0), {0, 20, 0}); }

TEST(Bonne, RoundTripAndWraps) {
  std::mt19937 random(13);
  std::uniform_real_distribution<double> lon(-2.8, 2.8), lat(-1, 1.5);
  for (const double lat1 : {0.8, -0.6}) {
    for (const double e : {0.0, 0.0818}) {
      const Bonne p(e, lat1, 1.5);
      Points in(400);
      for (auto& q : in) {
        q = {1.5 + lon(random) * (std::fabs(lat1)),
             std::copysign(lat(random), 1) * (lat1 > 0 ? 1 : -1), 2};
      }
      Points out = in;
      for (auto& q : out) q.x += 6 * kPi;  // whole turns go
      EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
      EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
      for (std::size_t i = 0; i < in.size(); ++i) {
        expect_near(out[i], in[i].x, in[i].y, 2, 2e-12 / std::cos(in[i].y));
      }
    }
  }
}

TEST(Bonne, ScaleByDifferentiationOnTheSphere) {
  const Bonne p(0, 0.7, 0.1);
  const auto forward = [&](const CoordinateTriple& q) {
    Points one = {q};
    p.forward(one, one);
    return one[0];
  };
  for (double lat = -1.2; lat < 1.5; lat += 0.23) {
    for (double lon = -1.5; lon < 1.8; lon += 0.7) {
      Points point = {{lon, lat, 0}};
      EXPECT_EQ(p.scale(0.9, point, point), TW_SUCCESS);
      const CoordinateTriple expected = numeric_scale(forward, lon, lat, 0);
      EXPECT_EQ(point[0].x, 0.9);
      EXPECT_NEAR(expected.x, 1, 1e-9);
      EXPECT_NEAR(point[0].y, 0.9 * expected.y, 1e-8);
      EXPECT_EQ(point[0].z, 0.9 * 0.9);
      EXPECT_NEAR(expected.z, 1, 1e-8);
    }
  }
}

TEST(Bonne, ScaleOfTheEllipsoidIsThatOfTheSphere) {
  const Bonne sphere(0, 0.7, 0.1), ellipsoid(0.08, 0.7, 0.1);
  const Points in = {{0.5, 0.3, 0}, {0.1, 0.3, 0}, {0.5, 0.7, 0}};
  Points a = untouched(3), b = untouched(3);
  sphere.scale(1, in, a);
  ellipsoid.scale(1, in, b);
  for (std::size_t i = 0; i < 3; ++i) expect_near(b[i], a[i].x, a[i].y, a[i].z, 0);
  EXPECT_GT(a[0].y, 1);
  EXPECT_EQ(a[1].y, 1);  // the central meridian
  EXPECT_EQ(a[2].y, 1);  // the standard parallel
  // with e2 = 0 the argument r0 counts
  TWstatus status = 0;
  TWbonne_s(1, 0.7, 0.1, 0, 5, 1, in.data(), b.data(), &status);
  EXPECT_NE(b[0].y, a[0].y);
}

TEST(Bonne, ScaleStopsBeyondThePole) {
  const Bonne p(0.08, 0.7, 0);
  const Points in = {
      {0.1, kPi / 2 + 0.5e-12, 0}, {0, 3, 0}, {0.1, kPi / 2 + 2e-12, 0}, {0.1, 0, 0}};
  Points out = untouched(4);
  EXPECT_EQ(p.scale(1, in, out), TW_BAD_LATITUDE);
  EXPECT_NE(out[0].x, kUntouched);
  EXPECT_EQ(out[1].y, 1);  // on the central meridian no latitude is looked at
  expect_untouched(out[2]);
  expect_untouched(out[3]);
}

TEST(Bonne, EveryInputEnds) {
  const Bonne p(0.08, 0.7, 1e300);
  Points odd;
  for (const double v : {0.0, 1e300, static_cast<double>(kInfinity), kNaN}) {
    for (const double w : {0.1, static_cast<double>(kNaN)}) odd.push_back({v, w, 0});
  }
  Points out = odd;
  p.forward(out, out);
  out = odd;
  p.inverse(out, out);
  out = odd;
  EXPECT_EQ(p.scale(1, out, out), TW_SUCCESS);
  const Bonne nothing(kNaN, kNaN, 0);
  EXPECT_EQ(nothing.status, TW_SUCCESS);
}

}  // namespace
