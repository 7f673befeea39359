#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Cone {
  double e, lon0;
  double n = kUntouched, C = kUntouched, rho0 = kUntouched;

  Cone(double e_, double lon0_, double lat0, double lat1, double lat2) : e(e_), lon0(lon0_) {
    TWalbers_c(e, kNaN, lat0, lat1, lat2, &n, &C, &rho0);  // the meridian is not read
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWalbers_f(e, lon0, n, C, rho0, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWalbers_i(e, lon0, n, C, rho0, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWalbers_s(e, k0, C, n, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
};

// q(p), written with logarithms of the sum and the difference.
double q_of(double e, double lat) {
  const double s = std::sin(lat);
  if (e == 0) return 2 * s;
  return (1 - e * e) *
         (s / (1 - e * e * s * s) + (std::log1p(e * s) - std::log1p(-e * s)) / (2 * e));
}

TEST(Albers, SnydersNumericalExample) {
  // Snyder 1987, pp. 292-294: Clarke 1866, parallels 29 30 and 45 30 N, origin 23 N 96 W, point
  // 35 N 75 W.
  const auto [a, e] = Ellipsoid::clarke_1866();
  const Cone cone(e, degrees(-96), degrees(23), degrees(29.5), degrees(45.5));
  EXPECT_NEAR(cone.n, 0.6029035, 5e-8);
  EXPECT_NEAR(cone.C, 1.3491594, 5e-8);
  EXPECT_NEAR(cone.rho0 * a, 9929079.6, 0.05);
  const Points in = {{degrees(-75), degrees(35), 4}};
  Points out = untouched(1), scale = untouched(1);
  EXPECT_EQ(cone.forward(in, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].x * a, 1885472.7, 0.05);
  EXPECT_NEAR(out[0].y * a, 1535925.0, 0.05);
  EXPECT_EQ(out[0].z, kUntouched);
  EXPECT_EQ(cone.scale(1, in, scale), TW_SUCCESS);
  expect_near(scale[0], 0.9915546, 1.0085173, 1, 5e-8);
  EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], in[0].x, in[0].y, 2e-14);
}

TEST(Albers, SphereOfSnyder) {
  // Snyder 1987, p. 291: unit sphere, the same cone and point.
  const Cone cone(0, degrees(-96), degrees(23), degrees(29.5), degrees(45.5));
  EXPECT_NEAR(cone.n, 0.6028370, 5e-8);
  EXPECT_NEAR(cone.rho0, 1.5562263, 5e-8);
  Points out = {{degrees(-75), degrees(35), 0}};
  cone.forward(out, out);
  expect_near(out[0], 0.2952720, 0.2416774, 5e-8);
  EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], degrees(-75), degrees(35), 5e-15);
}

TEST(Albers, SingleParallel) {
  const double e = 0.0818;
  const Cone cone(e, 0, 0.4, 0.7, 0.7);
  EXPECT_DOUBLE_EQ(cone.n, std::sin(0.7));
  EXPECT_EQ(Cone(e, 0, 0.4, 0.7, 0.7 + 0.9e-13).n, cone.n);
  EXPECT_NE(Cone(e, 0, 0.4, 0.7, 0.7 + 1.1e-13).n, cone.n);
  // At the parallel: scale 1, and the radius of a cone that touches.
  const double nu = 1 / std::sqrt(1 - e * e * std::sin(0.7) * std::sin(0.7));
  EXPECT_NEAR(Cone(e, 0, 0.7, 0.7, 0.7).rho0, nu / std::tan(0.7), 1e-15);
  Points out = untouched(1);
  cone.scale(1, {{0, 0.7, 0}}, out);
  expect_near(out[0], 1, 1, 1, 1e-15);
}

TEST(Albers, AuthalicFunctionWithinRho) {
  for (const double e : {0.0, 0.0818, 0.6}) {
    const Cone cone(e, 0, 0.3, 0.5, 0.7);
    for (double lat = -1.5; lat < 1.51; lat += 0.5) {
      Points out = {{0, lat, 0}};
      cone.forward(out, out);
      EXPECT_NEAR(cone.rho0 - out[0].y, std::sqrt(cone.C - cone.n * q_of(e, lat)) / cone.n, 3e-15);
    }
  }
}

TEST(Albers, ForwardHoldsALatitudeAHairBeyondAPole) {
  for (const double e : {0.0, 0.0818}) {
    const Cone cone(e, 0, 0.4, 0.5, 0.7);
    for (const double sign : {1.0, -1.0}) {
      Points out = untouched(3);
      EXPECT_EQ(cone.forward({{0.3, sign * (kPi / 2 + 1e-13), 0},
                              {0.3, sign * kPi / 2, 0},
                              {0.3, sign * 1.5707963267958966, 0}},
                             out),
                TW_I_LATITUDE_LIMITED);
      expect_near(out[0], out[1].x, out[1].y, 0);
      expect_near(out[2], out[1].x, out[1].y, 0);
      EXPECT_EQ(cone.forward({{0.3, sign * kPi / 2, 0}}, out), TW_SUCCESS);
    }
  }
}

TEST(Albers, ForwardStopsBeyondThat) {
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  const double limit = 1.5707963267958966;
  for (const double bad : {std::nextafter(limit, 2), -std::nextafter(limit, 2), kPi / 2 + 2e-12}) {
    Points out = untouched(3);
    EXPECT_EQ(cone.forward({{0.1, 0.2, 0}, {0.1, bad, 0}, {0.1, 0.3, 0}}, out), TW_BAD_LATITUDE);
    EXPECT_NE(out[0].x, kUntouched);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
  }
}

TEST(Albers, ForwardTakesOffWholeTurns) {
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  Points out = untouched(6);
  cone.forward({{0.4, 0.5, 0},
                {0.4 + 10 * kPi, 0.5, 0},
                {0.4 - 10 * kPi, 0.5, 0},
                {-kPi, 0.5, 0},
                {kPi, 0.5, 0},
                {kInfinity, 0.5, 0}},
               out);
  expect_near(out[1], out[0].x, out[0].y, 1e-14);
  expect_near(out[2], out[0].x, out[0].y, 1e-14);
  EXPECT_LT(out[3].x, 0);  // -pi stays
  EXPECT_EQ(out[3].x, -out[4].x);
  EXPECT_TRUE(std::isnan(out[5].x));
}

TEST(Albers, RoundTrip) {
  std::mt19937 random(5);
  std::uniform_real_distribution<double> lon(-3.1, 3.1), lat(-1.5, 1.5);
  for (const double e : {0.0, 0.0818191910428158, 0.5}) {
    for (const double sign : {1.0, -1.0}) {
      const Cone cone(e, 0.01, sign * 0.4, sign * 0.5, sign * 0.7);
      Points in(300);
      for (auto& p : in) p = {0.01 + lon(random), lat(random), 12};
      Points out = in;
      EXPECT_EQ(cone.forward(in, out), TW_SUCCESS);
      EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);
      for (std::size_t i = 0; i < in.size(); ++i) {
        // the last bits of C and q are worth more the nearer the pole
        expect_near(out[i], in[i].x, in[i].y, 12, 2e-15 / std::cos(in[i].y) + 5e-15);
      }
    }
  }
}

TEST(Albers, RoundTripNearThePoles) {
  // Where cos lat is small Newton's steps halve: they are watched, extrapolated, and a latitude
  // within 4e-5 may be held at the pole.
  for (const double e : {0.0818191910428158, 0.3}) {
    const Cone cone(e, 0, 0.4, 0.5, 0.7);
    for (const double sign : {1.0, -1.0}) {
      for (double colat = 1e-8; colat < 0.1; colat *= 1.7) {
        Points p = {{0.2, sign * (kPi / 2 - colat), 0}};
        cone.forward(p, p);
        const TWstatus word = cone.inverse(p, p);
        EXPECT_TRUE(word == TW_SUCCESS || word == TW_I_LATITUDE_LIMITED);
        EXPECT_NEAR(p[0].x, 0.2, 1e-14);
        EXPECT_LE(std::fabs(p[0].y), kPi / 2);
        // beyond the held zone what is lost is a last bit of q over the cosine
        EXPECT_NEAR(p[0].y, sign * (kPi / 2 - colat), colat < 1e-4 ? 4.1e-5 : 3e-15 / colat);
      }
    }
  }
}

TEST(Albers, TinyEccentricityKeepsThePrintedLogarithm) {
  // q(0.7) by the printed formula is 1.288424597276853, the sphere's 1.288435374475382: the lost
  // digits are the formula's.
  const Points in = {{0.3, 0.7, 0}};
  Points out = untouched(1);
  TWstatus status = 0;
  TWalbers_f(1e-12, 0.3, 0.5, 1.25, 0, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 0, -1.556647296418265, 1e-14);
}

TEST(Albers, InverseAtThePole) {
  // Half a step at a time towards the double root, three watched steps, one extrapolation.
  for (const double sign : {1.0, -1.0}) {
    const Cone cone(0.0818191910428158, 0, sign * 0.4, sign * 0.5, sign * 0.7);
    for (const double pole : {kPi / 2, -kPi / 2}) {
      Points p = {{0.2, pole, 0}};
      EXPECT_EQ(cone.forward(p, p), TW_SUCCESS);
      EXPECT_EQ(cone.inverse(p, p), TW_SUCCESS);
      expect_near(p[0], 0.2, pole, 2e-15);
      EXPECT_EQ(p[0].y, pole);
    }
  }
}

TEST(Albers, InversePushedPastThePole) {
  // A Q beyond that of the pole, but below 2, is no latitude's: the steps run into the pole, where
  // the vanishing cosine makes them so wide that the north pole lies within them from either side.
  const double e = 0.0818191910428158;
  for (const double sign : {1.0, -1.0}) {
    const double Q = sign * (q_of(e, kPi / 2) + 1e-9);
    const Points in = {{0, 0, 0}};
    Points out = untouched(1);
    TWstatus status = 0;
    // rho = 0 leaves C / n for Q
    TWalbers_i(e, 0.3, sign * 0.5, sign * 0.5 * Q, 0, 1, in.data(), out.data(), &status);
    EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
    expect_near(out[0], 0.3, kPi / 2, 0);
  }
}

// Inverse of the apex, rho = 0, where Q is C / n.
TWstatus inverse_of_Q(double e, double n, double Q, CoordinateTriple& out) {
  const CoordinateTriple in = {0, 0.25, 0};
  TWstatus status = 0;
  TWalbers_i(e, 0.3, n, n * Q, 0.25, 1, &in, &out, &status);
  return status;
}

TEST(Albers, SineAHairBeyondOne) {
  for (const double e : {0.0, 0.0818}) {
    for (const double sign : {1.0, -1.0}) {
      CoordinateTriple out = kUntouchedPoint;
      EXPECT_EQ(inverse_of_Q(e, 1, sign * 2 * 1.0000000000001, out), TW_I_LATITUDE_LIMITED);
      // On the ellipsoid 2 is far beyond the pole's Q, and the north pole is what comes out.
      expect_near(out, 0.3, e == 0 ? sign * kPi / 2 : kPi / 2, 0);
      out = kUntouchedPoint;
      EXPECT_EQ(inverse_of_Q(e, 1, sign * 2 * std::nextafter(1.0000000000001, 2), out),
                TW_NOT_CONVERGED);
      expect_untouched(out);
    }
  }
  CoordinateTriple out = kUntouchedPoint;
  EXPECT_EQ(inverse_of_Q(0, 1, 2, out), TW_SUCCESS);
  EXPECT_EQ(out.y, kPi / 2);
}

TEST(Albers, SphereSnapsToThePoles) {
  CoordinateTriple out = kUntouchedPoint;
  for (const double sign : {1.0, -1.0}) {
    for (const double e : {0.0, 1e-13}) {
      EXPECT_EQ(inverse_of_Q(e, 1, sign * 2 * std::cos(3.9e-7), out), TW_SUCCESS);
      EXPECT_EQ(out.y, sign * kPi / 2);
      EXPECT_EQ(inverse_of_Q(e, 1, sign * 2 * std::cos(4.1e-7), out), TW_SUCCESS);
      EXPECT_NEAR(out.y, sign * (kPi / 2 - 4.1e-7), 1e-9);  // a last bit of the sine
      EXPECT_NE(out.y, sign * kPi / 2);
    }
    // just above 1e-13 the steps are taken; the printed logarithm has three digits there, and steps
    // hard by either pole end at the north pole
    EXPECT_TRUE(TW_OK(inverse_of_Q(1.1e-13, 1, sign * 2 * std::cos(4.1e-7), out)));
    EXPECT_NEAR(out.y, kPi / 2, 4.1e-5);
  }
}

TEST(Albers, InverseOutsideTheFan) {
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  const double rim = cone.n * kPi;
  const auto on_circle = [&](double theta) {
    return CoordinateTriple{1.2 * std::sin(theta), cone.rho0 - 1.2 * std::cos(theta), 0};
  };
  Points out = untouched(4);
  EXPECT_EQ(cone.inverse({on_circle(rim - 1e-9), on_circle(-rim + 1e-9), on_circle(rim + 1e-9),
                          on_circle(0)},
                         out),
            TW_NOT_CONVERGED);
  EXPECT_NEAR(out[0].x, kPi, 1e-8);
  EXPECT_NEAR(out[1].x, -kPi, 1e-8);
  expect_untouched(out[2]);
  expect_untouched(out[3]);
  EXPECT_EQ(cone.inverse({on_circle(-rim - 1e-9)}, out), TW_NOT_CONVERGED);
}

TEST(Albers, InverseBeyondThePoles) {
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  Points out = untouched(2);
  EXPECT_EQ(cone.inverse({{0, cone.rho0 - 5, 0}, {0, 0, 0}}, out), TW_NOT_CONVERGED);
  expect_untouched(out[0]);
  expect_untouched(out[1]);
}

TEST(Albers, InverseDoesNotWrap) {
  const Cone cone(0.0818, 3, 0.4, 0.5, 0.7);
  Points p = {{4, 0.5, 0}};
  cone.forward(p, p);
  EXPECT_EQ(cone.inverse(p, p), TW_SUCCESS);
  EXPECT_NEAR(p[0].x, 4, 1e-14);
}

TEST(Albers, ScaleIsTheDerivative) {
  const double e = 0.0818191910428158;
  for (const double sign : {1.0, -1.0}) {
    const Cone cone(e, 0, sign * 0.4, sign * 0.5, sign * 0.7);
    for (double lat = -1.4; lat < 1.41; lat += 0.35) {
      const auto forward = [&](CoordinateTriple q) {
        Points out = untouched(1);
        cone.forward({q}, out);
        return out[0];
      };
      const CoordinateTriple expected = numeric_scale(forward, 0.4, lat, e);
      Points out = untouched(1);
      EXPECT_EQ(cone.scale(3, {{0.4, lat, 0}}, out), TW_SUCCESS);
      EXPECT_NEAR(out[0].x / (3 * expected.x), 1, 1e-9);
      EXPECT_NEAR(out[0].y / (3 * expected.y), 1, 5e-9);
      EXPECT_NEAR(out[0].z, 9, 1e-14);
    }
  }
}

TEST(Albers, ScaleAtThePoles) {
  Points out = untouched(2);
  const Cone polar(0.0818, 0, kPi / 2, kPi / 2, kPi / 2);
  EXPECT_EQ(polar.n, 1);
  EXPECT_EQ(polar.scale(2, {{0, kPi / 2, 0}, {0, 1.5, 0}}, out), TW_SUCCESS);
  expect_near(out[0], 2, 2, 4, 0);
  EXPECT_NEAR(out[1].x, 2, 0.01);
  const Cone south(0.0818, 0, -kPi / 2, -kPi / 2, -kPi / 2);
  EXPECT_EQ(south.scale(2, {{0, -kPi / 2, 0}}, out), TW_SUCCESS);
  expect_near(out[0], 2, 2, 4, 0);
  // The far pole of a polar cone and both poles of any other have no scale.
  EXPECT_EQ(polar.scale(2, {{0, -kPi / 2, 0}}, out), TW_SUCCESS);
  expect_near(out[0], -2, 0, 0, 0);
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  EXPECT_EQ(cone.scale(2, {{0, kPi / 2, 0}, {0, -kPi / 2, 0}}, out), TW_SUCCESS);
  expect_near(out[0], -2, 0, 0, 0);
  expect_near(out[1], -2, 0, 0, 0);
  // 1e-12 from the pole the parallel still has a radius.
  EXPECT_EQ(cone.scale(1, {{0, kPi / 2 - 1e-12, 0}}, out), TW_SUCCESS);
  EXPECT_GT(out[0].x, 1e10);
}

TEST(Albers, ScaleStopsBeyondThePoles) {
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  const double past = std::nextafter(kPi / 2, 2);
  for (const double bad : {past, -past}) {
    Points out = untouched(3);
    EXPECT_EQ(cone.scale(1, {{0, 0.5, 0}, {0, bad, 0}, {0, 0.5, 0}}, out), TW_NOT_CONVERGED);
    EXPECT_NEAR(out[0].x, 1, 1e-15);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
  }
}

TEST(Albers, NotANumberGoesThrough) {
  const Cone cone(0.0818, 0.3, 0.4, 0.5, 0.7);
  Points out = {{0.1, kNaN, 0}, {kNaN, 0.1, 0}};
  EXPECT_EQ(cone.forward(out, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].y));
  EXPECT_TRUE(std::isnan(out[1].x));
  EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);
  EXPECT_EQ(out[0].x, 0.3);  // a radius that is no number has no direction
  EXPECT_TRUE(std::isnan(out[0].y));
  out = {{0.1, kNaN, 0}};
  EXPECT_EQ(cone.scale(1, out, out), TW_SUCCESS);
  expect_near(out[0], -1, 0, 0, 0);
}

}  // namespace
