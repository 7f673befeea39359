#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "support/projection_checks.hpp"
#include "tidewater/foundation.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

struct Sinusoidal {
  double e, lat0, lon0;
  double e2 = kUntouched, m0 = kUntouched;
  TWstatus status = 0;

  Sinusoidal(double e_, double lat0_, double lon0_) : e(e_), lat0(lat0_), lon0(lon0_) {
    TWsinusoidal_c(e, lat0, &e2, &m0, &status);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWsinusoidal_f(lon0, lat0, e, e2, m0, static_cast<int32_t>(in.size()), in.data(), out.data(),
                   &word);
    return word;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWsinusoidal_i(lon0, lat0, e, e2, m0, static_cast<int32_t>(in.size()), in.data(), out.data(),
                   &word);
    return word;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWsinusoidal_s(k0, lon0, e2, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
};

TEST(Sinusoidal, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=sinu +lon_0=10 +ellps=GRS80");
  ASSERT_TRUE(peer.ok());
  const auto [a, e] = Ellipsoid::grs80();
  const Sinusoidal p(e, 0, degrees(10));
  for (double lat = -89; lat < 89.5; lat += 7.3) {
    for (double lon = -160; lon < 180; lon += 31) {
      const Points in = {{degrees(lon), degrees(lat), 0}};
      Points out = untouched(1);
      EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
      const CoordinateTriple expected = peer.forward(in[0]);
      // the series of the arc to n^4 leaves 5e-13
      expect_near(out[0], expected.x / a, expected.y / a, 1e-12);
    }
  }
#endif
}

TEST(Sinusoidal, ConstantsFail) {
  const Sinusoidal beyond(0.08, 2, 0);
  EXPECT_EQ(beyond.status, TW_BAD_LATITUDE);
  EXPECT_EQ(beyond.m0, kUntouched);
  EXPECT_EQ(beyond.e2, 0.08 * 0.08);
  const Sinusoidal flat(1, 0.5, 0);
  EXPECT_EQ(flat.status, TW_BAD_ECCENTRICITY);
  const Sinusoidal held(0.08, kPi / 2 + 5e-13, 0);
  EXPECT_EQ(held.status, TW_I_LATITUDE_LIMITED);
  EXPECT_NE(held.m0, kUntouched);
}

// The arc refuses the ellipsoid; on the origin's parallel none is asked for.
TEST(Sinusoidal, AnEllipsoidThatIsNoneEndsTheArray) {
  for (const double e : {1.5, -0.1}) {
    const Sinusoidal p(e, 0.5, 0.2);
    for (const bool forward : {true, false}) {
      const double on_parallel = forward ? 0.5 : 0;
      const Points in = {{0.2, on_parallel, 0}, {0.3, 0.7, 0}, {0.2, on_parallel, 0}};
      Points out = untouched(3);
      EXPECT_EQ(forward ? p.forward(in, out) : p.inverse(in, out), TW_BAD_ECCENTRICITY);
      EXPECT_EQ(out[0].y, forward ? 0 : 0.5);
      expect_untouched(out[1]);
      expect_untouched(out[2]);
    }
  }
}

TEST(Sinusoidal, SmallDifferencesCountAsNone) {
  const Sinusoidal p(0.08, 0.5, 0.25);
  const Points in = {{0.25 + 0.9e-12, 0.5 + 0.9e-12, 0}, {0.25 + 1.2e-12, 0.5 + 1.2e-12, 0}};
  Points out = untouched(2);
  EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
  expect_near(out[0], 0, 0, 0);
  EXPECT_NE(out[1].x, 0);
  EXPECT_NE(out[1].y, 0);
  const Points plane = {{0.9e-12, -0.9e-12, 0}, {1.2e-12, 1.2e-12, 0}};
  EXPECT_EQ(p.inverse(plane, out), TW_SUCCESS);
  expect_near(out[0], 0.25, 0.5, 0);
  EXPECT_NE(out[1].x, 0.25);
  EXPECT_NE(out[1].y, 0.5);
}

TEST(Sinusoidal, WrapByLoops) {
  const Sinusoidal p(0, 0, 0);
  const Points in = {{0.3 + 20 * kPi, 0, 0}, {0.3 - 20 * kPi, 0, 0}, {kPi, 0, 0},
                     {-kPi, 0, 0},           {1e300, 0, 0},          {kInfinity, 0, 0}};
  Points out = untouched(in.size());
  EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].x, 0.3, 1e-14);
  EXPECT_NEAR(out[1].x, 0.3, 1e-14);
  EXPECT_EQ(out[2].x, kPi);
  EXPECT_EQ(out[3].x, -kPi);
  EXPECT_NE(out[4].x, kUntouched);
  // the inverse wraps lon - lon0
  const Sinusoidal east(0, 0, 3);
  const Points plane = {{kPi, 0, 0}, {4, 0, 0}, {-20, 0, 0}, {1e300, 0, 0}, {kInfinity, 0, 0}};
  out = untouched(plane.size());
  EXPECT_EQ(east.inverse(plane, out), TW_SUCCESS);
  EXPECT_NEAR(std::fabs(out[0].x - 3), kPi, 1e-14);  // rounding of 3 + pi decides
  EXPECT_NEAR(out[1].x, 7 - 2 * kPi, 1e-15);
  EXPECT_NEAR(out[2].x, 3 - 20 + 6 * kPi, 1e-14);
  EXPECT_NE(out[4].x, kUntouched);
}

TEST(Sinusoidal, PolesTakeTheCentralLongitude) {
  const Sinusoidal p(0, 0, 0.7);
  const Points in = {{0.5, kPi / 2 - 0.9e-12, 0}, {1e-6, kPi / 2 - 1e-6, 0}};
  Points out = untouched(2);
  EXPECT_EQ(p.inverse(in, out), TW_SUCCESS);
  EXPECT_EQ(out[0].x, 0.7);
  EXPECT_NEAR(out[1].x, 1.7, 1e-9);
}

TEST(Sinusoidal, ArcFailureStops) {
  expect_arc_failure_stops(Sinusoidal(0.08, 0, 0), {0.1, 1.7, 0});
}

TEST(Sinusoidal, RoundTrip) {
  std::mt19937 random(9);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.56, 1.56);
  for (const double e : {0.0, 0.0818}) {
    const Sinusoidal p(e, -0.3, 0.02);
    Points in(500);
    for (auto& q : in) q = {lon(random), lat(random), 2};
    Points out = in;
    EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
    EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      // the inverse arc ends at a step of 1e-12; the longitude divides by the cosine
      expect_near(out[i], in[i].x, in[i].y, 2, 1e-12 / std::cos(in[i].y));
    }
  }
}

TEST(Sinusoidal, ScaleByDifferentiation) {
  for (const double e : {0.0, 1e-7, 0.0818}) {
    const Sinusoidal p(e, 0, 0.1);
    const auto forward = [&](const CoordinateTriple& q) {
      Points one = {q};
      p.forward(one, one);
      return one[0];
    };
    for (double lat = -1.4; lat < 1.5; lat += 0.23) {
      for (double lon = -2; lon < 2.2; lon += 0.9) {
        Points point = {{lon, lat, 0}};
        EXPECT_EQ(p.scale(0.9, point, point), TW_SUCCESS);
        const CoordinateTriple expected = numeric_scale(forward, lon, lat, e);
        EXPECT_EQ(point[0].x, 0.9);  // for every longitude
        EXPECT_NEAR(expected.x, 1, 1e-9);
        EXPECT_NEAR(point[0].y, 0.9 * expected.y, 1e-8);
        EXPECT_NEAR(point[0].z, 0.81 * expected.z, 1e-8);
      }
    }
  }
}

TEST(Sinusoidal, ScaleStopsBeyondThePole) {
  const Sinusoidal p(0.0818, 0, 0);
  const Points in = {{0.1, kPi / 2 + 0.5e-12, 0}, {0.1, kPi / 2 + 2e-12, 0}, {0.1, 0, 0}};
  Points out = untouched(3);
  EXPECT_EQ(p.scale(1, in, out), TW_BAD_LATITUDE);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  // held a hair beyond: the word of the derivative stands
  const Points held = {{0.1, kPi / 2 + 0.5e-12, 0}, {0.1, 0.3, 0}};
  EXPECT_EQ(p.scale(1, held, out), TW_I_LATITUDE_LIMITED);
  // the derivative of the arc refuses a square of one
  out = untouched(1);
  TWstatus status = 0;
  TWsinusoidal_s(1, 0, 1, 1, held.data() + 1, out.data(), &status);
  EXPECT_EQ(status, TW_BAD_ECCENTRICITY);
  expect_untouched(out[0]);
}

TEST(Sinusoidal, FarFromAHugeCentralMeridian) {
  // The wrap ends, and gives what single steps give.
  for (const double lon0 : {1e9, -1e9, 1e13}) {
    for (const double x : {100.0, -100.0, 1e5, 1.0}) {
      double stepped = x + lon0;
      while (stepped - lon0 < -kPi) stepped += 2 * kPi;
      while (stepped - lon0 > kPi) stepped -= 2 * kPi;
      const CoordinateTriple in = {x, 0, 0};
      CoordinateTriple out = {};
      TWstatus status = 0;
      TWsinusoidal_i(lon0, 0, 0, 0, 0, 1, &in, &out, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      EXPECT_EQ(out.x, stepped) << lon0 << " " << x;
    }
  }
}

}  // namespace
