#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

// Everything that the functions of the family take, from one call of TWo_merc_c.
struct Oblique {
  double e = 0;
  double lat0 = kUntouched, alpha = kUntouched;
  double B = kUntouched, A = kUntouched, E = kUntouched, lon0 = kUntouched, gamma0 = kUntouched;
  TWstatus status = 0;

  Oblique(int16_t mode, double e_, double lon_c, double lat_c, double lon2, double lat2,
          double lat0_, double alpha_)
      : e(e_), lat0(lat0_), alpha(alpha_) {
    TWo_merc_c(mode, e, lon_c, lat_c, lon2, lat2, &lat0, &alpha, &B, &A, &E, &lon0, &gamma0,
               &status);
  }
  TWstatus uv_k(int16_t want_k, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWo_merc_uv_k(e, alpha, gamma0, lon0, E, B, A, want_k, static_cast<int32_t>(in.size()),
                  in.data(), out.data(), &word);
    return word;
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWo_merc_f(e, alpha, gamma0, lon0, E, B, A, static_cast<int32_t>(in.size()), in.data(),
               out.data(), &word);
    return word;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWo_merc_i(e, alpha, gamma0, lon0, E, B, A, static_cast<int32_t>(in.size()), in.data(),
               out.data(), &word);
    return word;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWo_merc_s(e, k0, alpha, gamma0, lon0, E, B, A, static_cast<int32_t>(in.size()), in.data(),
               out.data(), &word);
    return word;
  }
};

// Timbalai 1948 / RSO Borneo, as EPSG Guidance Note 7-2 works it out.
Ellipsoid everest_1967() { return Ellipsoid::from_inverse_flattening(6377298.556, 300.8017); }
Oblique borneo(int16_t mode = 1) {
  return Oblique(mode, everest_1967().e, degrees(115), degrees(4), 0, 0, mode == 1 ? 9 : degrees(4),
                 degrees(53, 18, 56.9537));
}

TEST(ObliqueMercator, GuidanceNoteExample) {
  // IOGP Publication 373-7-2, Hotine oblique Mercator, example Timbalai 1948 / RSO Borneo (m).
  const Oblique p = borneo();
  const double a = everest_1967().a;
  const double k = 0.99984;
  EXPECT_EQ(p.status, TW_SUCCESS);
  EXPECT_EQ(p.lat0, degrees(4));  // mode 1 hands the latitude of the centre back
  EXPECT_NEAR(p.B, 1.003303209, 5e-10);
  EXPECT_NEAR(p.A * a * k, 6376278.686, 5e-4);
  EXPECT_NEAR(p.gamma0, 0.927295218, 5e-10);
  EXPECT_NEAR(p.lon0, 1.914373469, 5e-10);
  EXPECT_NEAR(p.E, 1.000002991, 5e-10);

  const Points in = {{degrees(115, 48, 19.8196), degrees(5, 23, 14.1129), 3}};
  Points out = untouched(1);
  EXPECT_EQ(p.uv_k(0, in, out), TW_SUCCESS);
  expect_near(out[0], 901334.257 / a / k, -69702.787 / a / k, 1e-3 / a);
  EXPECT_EQ(out[0].z, kUntouched);
  // That grid is rotated by another angle than the azimuth of the line.
  TWstatus status = 0;
  TWo_merc_rot(degrees(53, 7, 48.3685), 1, out.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 679245.73 / a / k, 596562.78 / a / k, 6e-3 / a);
}

TEST(ObliqueMercator, ModesZeroAndOneDifferInTheOriginOnly) {
  const Oblique zero = borneo(0);
  const Oblique one = borneo(1);
  const Oblique other(7, everest_1967().e, degrees(115), 99, 0, 0, degrees(4),
                      degrees(53, 18, 56.9537));
  for (const Oblique& p : {zero, other}) {
    EXPECT_EQ(p.status, TW_SUCCESS);
    EXPECT_EQ(p.lat0, one.lat0);
    EXPECT_EQ(p.E, one.E);
    EXPECT_EQ(p.lon0, one.lon0);
    EXPECT_EQ(p.gamma0, one.gamma0);
  }
}

TEST(ObliqueMercator, TwoPointsOnTheLineGiveTheSameProjection) {
  // Two points of the central line, found by the inverse of the azimuth form, give it back.
  const Oblique line = borneo();
  const double c = std::cos(line.alpha), s = std::sin(line.alpha);
  Points ends = {{0.1 * s, 0.1 * c, 0}, {0.2 * s, 0.2 * c, 0}};
  EXPECT_EQ(line.inverse(ends, ends), TW_SUCCESS);
  const Oblique two(2, line.e, ends[0].x, ends[0].y, ends[1].x, ends[1].y, line.lat0, 0.7);
  EXPECT_EQ(two.status, TW_SUCCESS);
  EXPECT_EQ(two.lat0, line.lat0);
  EXPECT_EQ(two.B, line.B);
  EXPECT_EQ(two.A, line.A);
  EXPECT_EQ(two.E, line.E);
  // atan(sin(B d) / G) and the inverse's 1e-15 over a base of 0.1
  EXPECT_NEAR(two.lon0, line.lon0, 1e-13);
  EXPECT_NEAR(two.gamma0, line.gamma0, 1e-13);
  EXPECT_NEAR(two.alpha, line.alpha, 1e-13);
}

// By symmetry the line of two points on a parallel runs due east half-way between them.
TEST(ObliqueMercator, TwoPointsOnOneParallel) {
  const Oblique p(2, 0.08, 0.2, 0.7, 0.5, 0.7, 0.7, 0);
  EXPECT_EQ(p.status, TW_SUCCESS);
  const Points in = {{0.2, 0.7, 0}, {0.5, 0.7, 0}, {0.35, 0.72, 0}};
  Points out = in;
  EXPECT_EQ(p.uv_k(0, in, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].y, 0, 1e-14);  // on the line
  EXPECT_NEAR(out[1].y, 0, 1e-14);
  // North of the line, which bulges by the square of half the chord times tan(0.7) / 2.
  EXPECT_NEAR(std::fabs(out[2].y), 0.02 - std::pow(0.15 * std::cos(0.7), 2) * std::tan(0.7) / 2,
              2e-4);
}

TEST(ObliqueMercator, NegativeAzimuthGainsATurn) {
  const Oblique azimuth(0, 0.08, 0, 0, 0, 0, 0.6, -0.1);
  EXPECT_EQ(azimuth.status, TW_SUCCESS);
  EXPECT_DOUBLE_EQ(azimuth.alpha, 2 * kPi - 0.1);
  const Oblique south(2, 0.08, 0.3, 0.7, 0.5, 0.4, 0.6, 0.2);  // falls to the east
  EXPECT_EQ(south.status, TW_SUCCESS);
  EXPECT_GT(south.alpha, kPi);
  EXPECT_LT(south.alpha, 2 * kPi);
  const Oblique refused(2, 0.08, 0.3, 0.7, 0.3, 0.7, 0.6, -0.25);
  EXPECT_EQ(refused.status, TW_BAD_PARAMETER);
  EXPECT_DOUBLE_EQ(refused.alpha, 2 * kPi - 0.25);
}

TEST(ObliqueMercator, SineBeyondOneIsHeldOrRefused) {
  // At the equator of a sphere D is 1, so that sin(alpha) / D is the sine itself: no real azimuth
  // carries it beyond 1.  In the two-point form sin(gamma0) D can be: D is 1 / cos(lat0) there.
  const Oblique pole_line(0, 0, 0.4, 0, 0, 0, 0, kPi / 2);
  EXPECT_EQ(pole_line.status, TW_SUCCESS);
  EXPECT_EQ(pole_line.gamma0, kPi / 2);
  const Oblique back(0, 0, 0.4, 0, 0, 0, 0, -kPi / 2);
  EXPECT_EQ(back.gamma0, -kPi / 2);

  // A line along the equator has gamma0 = 90 degrees; seen from an origin at 0.5 it is refused.
  const Oblique beyond(2, 0, 0.1, 1e-9, 0.9, -1e-9, 0.5, 0.3);
  EXPECT_EQ(beyond.status, TW_BAD_PARAMETER);
  EXPECT_EQ(beyond.alpha, 0.3);  // kept
  EXPECT_NE(beyond.lon0, 0);     // reached
  EXPECT_NE(beyond.gamma0, 0);
  // tan(gamma0) G beyond 1 by more than rounding: none from the azimuth form, where both come from
  // one azimuth; a not-a-number is refused.
  const Oblique nothing(0, 0.08, 0, 0, 0, 0, 0.6, kNaN);
  EXPECT_EQ(nothing.status, TW_BAD_PARAMETER);
  EXPECT_EQ(nothing.gamma0, 0);
  EXPECT_EQ(nothing.lon0, 0);
  EXPECT_NEAR(nothing.B, std::sqrt(1 + 0.0064 * std::pow(std::cos(0.6), 4) / 0.9936), 1e-15);
}

TEST(ObliqueMercator, AzimuthOfNinetyDegreesPutsTheCrossingAQuarterTurnAway) {
  // alpha = 90 degrees at lat0 on the sphere: a great circle whose vertex is the centre.  Rounding
  // takes tan(gamma0) G to either side of 1; both roads give the same longitude.
  for (double lat0 = 0.05; lat0 < 1.5; lat0 += 0.05) {
    for (const double sign : {1.0, -1.0}) {
      const Oblique p(0, 0, 0.3, 0, 0, 0, sign * lat0, kPi / 2);
      EXPECT_EQ(p.status, TW_SUCCESS);
      // asin near 1 turns a rounding of 1e-16 into 1e-8
      EXPECT_NEAR(p.lon0, 0.3 - sign * kPi / 2, 1e-6);
      EXPECT_NEAR(p.gamma0, kPi / 2 - lat0, 1e-7);
    }
  }
}

TEST(ObliqueMercator, TwoPointFormRefusesWhatHasNoLine) {
  const double tiny = 0.9e-14;
  const Oblique same(2, 0.08, 0.3, 0.7, 0.3 + tiny, 0.7 - tiny, 0.6, 0.2);
  EXPECT_EQ(same.status, TW_BAD_PARAMETER);
  EXPECT_EQ(same.alpha, 0.2);
  EXPECT_EQ(same.lon0, 0);
  EXPECT_EQ(same.gamma0, 0);
  EXPECT_GT(same.B, 1);
  EXPECT_GT(same.A, 0);
  EXPECT_GT(same.E, 0);
  // The first point at the north pole: its tangent of half the colatitude is zero.
  const Oblique pole(2, 0.08, 0.3, kPi / 2, 0.4, 0.7, 0.6, 0.2);
  EXPECT_EQ(pole.status, TW_BAD_PARAMETER);
  EXPECT_EQ(pole.lon0, 0);
  // The origin at the pole: the division by a cosine near zero is not tested, E is zero.
  const Oblique origin(2, 0.08, 0.3, 0.5, 0.4, 0.7, kPi / 2, 0.2);
  EXPECT_EQ(origin.E, 0);
  EXPECT_EQ(origin.status, TW_BAD_PARAMETER);
  EXPECT_EQ(origin.lon0, 0);
  EXPECT_EQ(origin.lat0, kPi / 2);
}

TEST(ObliqueMercator, TwoPointFormUsesTheMeanOfTheRawLongitudes) {
  // The same two points with the second given one turn on: the mean moves by half a turn.
  const Oblique plain(2, 0.08, 3.0, 0.3, -3.0, 0.5, 0.4, 0);
  const Oblique turned(2, 0.08, 3.0, 0.3, -3.0 + 2 * kPi, 0.5, 0.4, 0);
  EXPECT_EQ(turned.status, TW_SUCCESS);
  EXPECT_NEAR(plain.lon0, turned.lon0 - kPi, 1e-13);
}

TEST(ObliqueMercator, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer azimuth("+proj=omerc +lat_0=40 +lonc=-120 +alpha=35 +no_uoff +k=1 +ellps=GRS80");
  const ProjPeer points(
      "+proj=omerc +lat_0=-10 +lon_1=20 +lat_1=-25 +lon_2=45 +lat_2=15 +no_uoff "
      "+ellps=GRS80");
  ASSERT_TRUE(azimuth.ok() && points.ok());
  const auto [a, e] = Ellipsoid::grs80();
  const Oblique ours[2] = {
      Oblique(1, e, degrees(-120), degrees(40), 0, 0, 0, degrees(35)),
      Oblique(2, e, degrees(20), degrees(-25), degrees(45), degrees(15), degrees(-10), 0)};
  const ProjPeer* peers[2] = {&azimuth, &points};
  std::mt19937 random(3);
  std::uniform_real_distribution<double> off(-0.6, 0.6);
  for (int which = 0; which < 2; ++which) {
    const Oblique& p = ours[which];
    EXPECT_EQ(p.status, TW_SUCCESS);
    const double lon_c = which == 0 ? degrees(-120) : degrees(32);
    // PROJ counts u of a two-point line from its centre and has no switch against it.
    Points origin = {{lon_c, p.lat0, 0}};
    const CoordinateTriple theirs = peers[which]->forward(origin[0]);
    EXPECT_EQ(p.forward(origin, origin), TW_SUCCESS);
    const double shift_x = which == 0 ? 0 : theirs.x / a - origin[0].x;
    const double shift_y = which == 0 ? 0 : theirs.y / a - origin[0].y;
    for (int i = 0; i < 200; ++i) {
      const Points in = {{lon_c + off(random), p.lat0 + off(random), 0}};
      Points out = untouched(1);
      EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
      const CoordinateTriple expected = peers[which]->forward(in[0]);
      // a few roundings of coordinates of size 1, and PROJ's own
      expect_near(out[0], expected.x / a - shift_x, expected.y / a - shift_y, 2e-14);
      EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
      expect_near(out[0], in[0].x, in[0].y, 2e-14);
    }
  }
#endif
}

TEST(ObliqueMercator, RoundTrip) {
  std::mt19937 random(4);
  std::uniform_real_distribution<double> off(-0.7, 0.7);
  for (const double e : {0.0, 0.0818, 0.3}) {  // the last takes the counted iteration
    const Oblique p(0, e, 0.2, 0, 0, 0, -0.5, 0.9);
    Points in(400);
    for (auto& q : in) q = {0.2 + off(random), -0.5 + off(random), 5};
    Points out = in;
    EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
    EXPECT_EQ(out[0].z, 5);
    EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      expect_near(out[i], in[i].x, in[i].y, 5, 2e-14);
    }
  }
}

TEST(ObliqueMercator, CountedIterationStopsAfterFifteenSmallSteps) {
  // At e = 0.95 a step shrinks by little: fifteen steps below 1e-10 leave a remainder that is
  // neither that of one such step nor zero.  Worked out here by the definition.
  const double e = 0.95;
  const Oblique p(0, e, 0, 0, 0, 0, 0.3, 0.4);
  const Points plane = {{0.05, 0.1, 0}};
  Points out = untouched(1);
  EXPECT_EQ(p.inverse(plane, out), TW_SUCCESS);
  Points again = untouched(1);
  EXPECT_EQ(p.forward(out, again), TW_SUCCESS);
  const double residual = std::hypot(again[0].x - plane[0].x, again[0].y - plane[0].y);
  EXPECT_LT(residual, 1e-9);
  // one small step alone would leave 1e-10 / (1 - 0.9)
  EXPECT_LT(residual, 1e-9 * std::pow(0.9025, 14));
}

TEST(ObliqueMercator, PoleFormulas) {
  const Oblique p(0, 0.0818, 0.2, 0, 0, 0, 0.5, 0.9);
  const double near = kPi / 2 - 0.9e-10;
  const Points in = {{0.3, kPi / 2, 0}, {-2, near, 0}, {0.3, -kPi / 2, 0}, {1, -near, 0}};
  Points out = untouched(4);
  EXPECT_EQ(p.uv_k(0, in, out), TW_SUCCESS);
  const double r = p.A / p.B;
  const double north = r * std::log(std::tan(kPi / 4 - p.gamma0 / 2));
  const double south = r * std::log(std::tan(kPi / 4 + p.gamma0 / 2));
  EXPECT_DOUBLE_EQ(out[0].x, kPi / 2 * r);
  EXPECT_DOUBLE_EQ(out[0].y, north);
  EXPECT_DOUBLE_EQ(out[1].x, near * r);
  EXPECT_DOUBLE_EQ(out[1].y, north);
  EXPECT_DOUBLE_EQ(out[2].x, -kPi / 2 * r);
  EXPECT_DOUBLE_EQ(out[2].y, south);
  EXPECT_DOUBLE_EQ(out[3].y, south);
  // Just outside the margin the general formulas meet those of the pole.
  const Points outside = {{0.3, kPi / 2 - 1.1e-10, 0}};
  EXPECT_EQ(p.uv_k(0, outside, out), TW_SUCCESS);
  expect_near(out[0], kPi / 2 * r, north, 1e-8);
  EXPECT_NE(out[0].y, north);
  // Beyond the pole by more than the margin the logarithm of a negative number; a not-a-number
  // takes the pole's road as a south pole.
  const Points bad = {{0.3, kNaN, 0}};
  EXPECT_EQ(p.uv_k(0, bad, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].x));
  EXPECT_DOUBLE_EQ(out[0].y, south);
}

// Where |U| is 1 the point lies a quarter turn off the line.
Points with_failing(const Oblique& p) {
  // On the sphere with gamma0 = 0 (azimuth 0) U is -sin(lon - lon0) cos(lat).
  return {{p.lon0 + kPi / 2, 0, 0},
          {p.lon0 + 0.1, 0.2, 0},
          {p.lon0 - kPi / 2, 0, 0},
          {p.lon0 + kPi / 2, 1e-12, 0},
          {p.lon0 + 0.3, 0.4, 0}};
}

TEST(ObliqueMercator, FailingPointRepeatsTheOneBefore) {
  const Oblique p(0, 0, 0.2, 0, 0, 0, 0, 0.0);
  EXPECT_EQ(p.gamma0, 0);
  const Points in = with_failing(p);
  Points out = untouched(5);
  EXPECT_EQ(p.uv_k(0, in, out), TW_RANGE_ERROR);
  expect_near(out[0], 0, 0, 0);  // the first point: zeros
  EXPECT_NEAR(out[1].y, std::atanh(std::sin(0.1) * std::cos(0.2)), 1e-15);
  expect_near(out[2], out[1].x, out[1].y, 0);
  expect_near(out[3], out[1].x, out[1].y, 0);
  EXPECT_NEAR(out[4].y, std::atanh(std::sin(0.3) * std::cos(0.4)), 1e-15);
  EXPECT_EQ(out[4].z, kUntouched);
}

TEST(ObliqueMercator, FailureLeavesTheArrayUnrotatedAndUnscaled) {
  const Oblique p(0, 0, 0.2, 0, 0, 0, 0, 0.0);
  const Points in = with_failing(p);
  Points skew = untouched(5), out = untouched(5);
  p.uv_k(1, in, skew);
  EXPECT_EQ(p.forward(in, out), TW_RANGE_ERROR);
  for (std::size_t i = 0; i < 5; ++i) expect_near(out[i], skew[i].x, skew[i].y, 0);
  out = untouched(5);
  EXPECT_EQ(p.scale(2, in, out), TW_RANGE_ERROR);
  for (std::size_t i = 0; i < 5; ++i) {
    EXPECT_EQ(out[i].x, skew[i].x);
    EXPECT_EQ(out[i].y, skew[i].y);
    EXPECT_NE(out[i].z, kUntouched);  // k is written at a failing point, too
  }
}

TEST(ObliqueMercator, QuarterTurnOfLongitudeTakesTheSecondForm) {
  // On the sphere B is 1: dl = pi/2 has a cosine of 6e-17.
  const Oblique p(0, 0, 0, 0, 0, 0, 0.5, 0.9);
  const Points in = {{p.lon0 + kPi / 2, 0.3, 0}};
  Points out = untouched(1);
  EXPECT_EQ(p.uv_k(0, in, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].x, kPi / 2 * p.A * p.B, 1e-15);
  // With an ellipsoid, multiplied by B where one would look for a division.
  const Oblique q(0, 0.3, 0, 0, 0, 0, 0.5, 0.9);
  const Points at = {{q.lon0 + kPi / 2 / q.B, 0.3, 0}};
  EXPECT_EQ(q.uv_k(0, at, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].x, kPi / 2 * q.A, 1e-14);
  EXPECT_GT(std::fabs(kPi / 2 * q.A - kPi / 2 * q.A / q.B / q.B), 0.01);
}

TEST(ObliqueMercator, WrapOfTheForwardDifference) {
  const Oblique p(0, 0.08, 0.2, 0, 0, 0, 0.5, 0.9);
  const Points in = {{0.3, 0.4, 0}, {0.3 + 2 * kPi, 0.4, 0}, {0.3 - 2 * kPi, 0.4, 0}};
  Points out = untouched(3);
  EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
  expect_near(out[1], out[0].x, out[0].y, 3e-15);
  expect_near(out[2], out[0].x, out[0].y, 3e-15);
}

TEST(ObliqueMercator, InverseAtTheEndsOfTheAposphere) {
  const Oblique p(0, 0, 0.2, 0, 0, 0, 0, 0.0);  // the transverse case: U = sin(u)
  EXPECT_EQ(p.alpha, 0);
  const Points in = {{0, kPi / 2, 0}, {0, -kPi / 2, 0}};
  Points out = untouched(2);
  EXPECT_EQ(p.inverse(in, out), TW_SUCCESS);
  expect_near(out[0], p.lon0, kPi / 2, 0);
  expect_near(out[1], p.lon0, -kPi / 2, 0);
  EXPECT_EQ(out[0].z, kUntouched);
}

TEST(ObliqueMercator, ScaleByDifferentiation) {
  const double e = 0.0818;
  const Oblique p(0, e, 0.2, 0, 0, 0, 0.5, 0.9);
  const auto forward = [&](const CoordinateTriple& q) {
    Points one = {q};
    p.forward(one, one);
    return one[0];
  };
  for (double lon = -0.3; lon < 0.8; lon += 0.25) {
    for (double lat = 0; lat < 1.1; lat += 0.25) {
      Points point = {{lon, lat, 0}};
      EXPECT_EQ(p.scale(0.9996, point, point), TW_SUCCESS);
      const CoordinateTriple expected = numeric_scale(forward, lon, lat, e);
      EXPECT_NEAR(point[0].x, 0.9996 * expected.x, 1e-10);
      EXPECT_NEAR(point[0].y, 0.9996 * expected.y, 1e-10);
      EXPECT_NEAR(point[0].z, 0.9996 * 0.9996 * expected.z, 1e-10);
    }
  }
}

TEST(ObliqueMercator, ScaleUsesTheRawDifferenceOfLongitude) {
  // A turn added changes cos(B dl) where B is not 1, so that k changes while u and v do not.
  const Oblique p(0, 0.3, 0.2, 0, 0, 0, 0.5, 0.9);
  const Points in = {{0.3, 0.4, 0}, {0.3 + 2 * kPi, 0.4, 0}};
  Points out = untouched(2);
  EXPECT_EQ(p.uv_k(1, in, out), TW_SUCCESS);
  expect_near(out[1], out[0].x, out[0].y, 1e-14);
  const double d = 0.3 - p.lon0;
  EXPECT_NEAR(out[1].z / out[0].z, std::cos(p.B * d) / std::cos(p.B * (d + 2 * kPi)), 1e-13);
  EXPECT_GT(std::fabs(out[1].z / out[0].z - 1), 1e-3);
}

TEST(ObliqueMercator, EveryInputLeavesTheInverse) {
  Points in;
  for (const double v : {0.0, 0.5, -3.0, 1e3, 1e300, kInfinity, -kInfinity, kNaN}) {
    for (const double w : {0.0, 0.7, -1e5, kInfinity, kNaN}) in.push_back({v, w, 0});
  }
  for (const double e : {0.0, 0.0818, 0.5, 0.999, 0.999999, 1.0, 1.5, -0.3, kNaN, kInfinity}) {
    const Oblique p(0, e, 0.2, 0, 0, 0, 0.5, 0.9);
    Points out = untouched(in.size());
    EXPECT_EQ(p.inverse(in, out), TW_SUCCESS);
    for (const auto& q : out) EXPECT_NE(q.y, kUntouched);
    p.forward(in, out);
  }
}

TEST(ObliqueMercator, ParametersOfMadagascar) {
  double v[6] = {};
  TWstatus status = 0;
  TWmadagascar(&v[0], &v[1], &v[2], &v[3], &v[4], &v[5], &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(v[0], degrees(18.9), 1e-16);
  EXPECT_NEAR(v[1], degrees(46, 26, 13.95), 3e-16);
  EXPECT_EQ(v[2], -v[0]);
  EXPECT_EQ(v[3], 400000);
  EXPECT_EQ(v[4], 800000);
  EXPECT_EQ(v[5], 0.9995);
}

TEST(ObliqueMercator, InverseOfNearlyFlatEllipsoidsIsQuick) {
  // The passes of a plain fixed point take seconds a point here; the root is that of the isometric
  // latitude, which with these constants is -x.
  for (const double flat : {1e-3, 1e-6, 1e-9}) {
    const double e = 1 - flat;
    for (const double x : {1e-300, 1e-20, 1e-9, 1e-6, 1e-3, 0.3, 3.0}) {
      const CoordinateTriple in = {x, 0, 0};
      CoordinateTriple out = {};
      TWstatus status = 0;
      TWo_merc_i(e, 0, kPi / 2, 0, 1, 1, 1, 1, &in, &out, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      const double found = std::asinh(std::tan(out.y)) - e * std::atanh(e * std::sin(out.y));
      EXPECT_NEAR(found, -x, 1e-12 + 1e-6 * x) << e;
    }
  }
}

}  // namespace
