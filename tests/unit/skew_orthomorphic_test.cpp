#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

struct Skew {
  double e, skew;
  double A = kUntouched, B = kUntouched, C = kUntouched, lon0 = kUntouched;
  TWstatus status = 0;

  Skew(double e_, double lon_c, double lat_c, double skew_) : e(e_), skew(skew_) {
    TWrso_c(e, lon_c, lat_c, skew, &A, &B, &C, &lon0, &status);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWrso_f(lon0, skew, A, B, C, e, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWrso_i(lon0, skew, A, B, C, e, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWrso_s(e, k0, kNaN, kNaN, skew, lon0, A, B, C, static_cast<int32_t>(in.size()), in.data(),
            out.data(), &word);
    return word;
  }
};

Ellipsoid everest_1948() { return Ellipsoid::from_inverse_flattening(6377304.063, 300.8017); }

Skew malaya() {
  double lon_c = 0, lat_c = 0, skew = 0, fe = 0, fn = 0, k0 = 0;
  TWstatus status = 0;
  TWrso_param(&lon_c, &lat_c, &skew, &fe, &fn, &k0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return Skew(everest_1948().e, lon_c, lat_c, skew);
}

TEST(SkewOrthomorphic, Parameters) {
  double v[6] = {};
  TWstatus status = 0;
  TWrso_param(&v[0], &v[1], &v[2], &v[3], &v[4], &v[5], &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(v[0], degrees(102.25), 3e-16);
  EXPECT_NEAR(v[1], degrees(4), 1e-17);
  EXPECT_NEAR(v[2], -std::atan2(3.0, 4.0), 2e-16);  // the 3-4-5 triangle
  EXPECT_EQ(v[3], 804671.2998);
  EXPECT_EQ(v[4], 0);
  EXPECT_EQ(v[5], 0.99984);
}

TEST(SkewOrthomorphic, GuidanceNoteExampleOfBorneo) {
  // IOGP Publication 373-7-2, Timbalai 1948 / RSO Borneo: the line crosses at 53d07'48.3685", whose
  // sine is 0.8; constants and the grid point in metres.
  const auto [a, e] = Ellipsoid::from_inverse_flattening(6377298.556, 300.8017);
  const double k = 0.99984;
  const Skew p(e, degrees(115), degrees(4), std::asin(0.8));
  EXPECT_EQ(p.status, TW_SUCCESS);
  EXPECT_NEAR(p.B, 1.003303209, 5e-10);
  EXPECT_NEAR(p.A * a * k, 6376278.686, 5e-4);
  EXPECT_NEAR(p.lon0, 1.914373469, 5e-9);
  const Points in = {{degrees(115, 48, 19.8196), degrees(5, 23, 14.1129), 3}};
  Points out = untouched(1);
  EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
  expect_near(out[0], 679245.73 / a / k, 596562.78 / a / k, 6e-3 / a);
  EXPECT_EQ(out[0].z, kUntouched);
}

TEST(SkewOrthomorphic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer(
      "+proj=omerc +lat_0=4 +lonc=102.25 +gamma=-36.869897645844021 +no_uoff +a=6377304.063 "
      "+rf=300.8017");
  ASSERT_TRUE(peer.ok());
  const Skew p = malaya();
  const double a = everest_1948().a;
  for (double lat = -20; lat < 30; lat += 3.7) {
    for (double lon = 85; lon < 120; lon += 2.9) {
      const Points in = {{degrees(lon), degrees(lat), 0}};
      Points out = untouched(1);
      EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
      const CoordinateTriple expected = peer.forward(in[0]);
      expect_near(out[0], expected.x / a, expected.y / a, 2e-14);
    }
  }
#endif
}

TEST(SkewOrthomorphic, RoundTrip) {
  std::mt19937 random(5);
  std::uniform_real_distribution<double> off(-0.6, 0.6);
  for (const double e : {0.0, 0.0818, 0.3}) {
    const Skew p(e, 1.7, 0.5, -0.6);
    Points in(400);
    for (auto& q : in) q = {1.7 + off(random), 0.2 + off(random), 5};
    Points out = in;
    EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
    EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) {
      expect_near(out[i], in[i].x, in[i].y, 5, 2e-14);
    }
  }
}

TEST(SkewOrthomorphic, CentreAtTheEquatorIsNotTested) {
  // r is sqrt(rho / nu) B / cos, exactly 1 at the equator: rounding decides on which side it falls,
  // and the square root of a negative number goes through.
  int failures = 0;
  for (double e = 0.06; e < 0.1; e += 1e-4) {
    const Skew p(e, 1, 0, 0.5);
    if (std::isnan(p.C)) {
      ++failures;
      EXPECT_TRUE(std::isnan(p.lon0));  // a not-a-number passes both comparisons
    } else {
      EXPECT_NEAR(p.C, 0, 3e-8);
      EXPECT_NEAR(p.lon0, 1, 3e-8);
    }
    EXPECT_EQ(p.status, TW_SUCCESS);
  }
  EXPECT_GT(failures, 0);
  EXPECT_LT(failures, 400);
}

TEST(SkewOrthomorphic, ConstantsOutOfRange) {
  // W = B psi + C is ln(r + sqrt(r^2 - 1)) with r about 1 / cos(lat_c): sinh(W) = tan(lat_c) on the
  // sphere, so that tan(lat_c) tan(skew) decides.
  const Skew good(0, 1, 0.5, std::atan(0.999 / std::tan(0.5)));
  EXPECT_EQ(good.status, TW_SUCCESS);
  EXPECT_NEAR(good.lon0, 1 - std::asin(0.999), 1e-12);
  const Skew bad(0, 1, 0.5, std::atan(1.001 / std::tan(0.5)));
  EXPECT_EQ(bad.status, TW_BAD_PARAMETER);
  EXPECT_EQ(bad.lon0, kUntouched);
  EXPECT_EQ(bad.A, 1);
  EXPECT_EQ(bad.B, 1);
  EXPECT_NEAR(bad.C, 0, 1e-15);
}

TEST(SkewOrthomorphic, ForwardStopsBeyondTheHyperbolicLimit) {
  // W = psi B + C: a large constant C puts any point beyond the limit.
  const Points in = {{0.1, 0.2, 0}, {0.2, 0.3, 0}, {0.3, 0.1, 0}};
  const double psi = std::atanh(std::sin(0.3));  // sphere
  Points out = untouched(3);
  TWstatus status = 0;
  TWrso_f(0, 0.5, 1, 1, 700 - psi + 1e-10, 0, 3, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  out = untouched(3);
  TWrso_f(0, 0.5, 1, 1, 700 - psi - 1e-10, 0, 3, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NE(out[2].x, kUntouched);
  out = untouched(3);
  TWrso_s(0, 1, 0, 0, 0.5, 0, 1, 1, -700 - std::atanh(std::sin(0.2)) + 0.05, 3, in.data(),
          out.data(), &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_NE(out[1].x, kUntouched);
  expect_untouched(out[2]);
}

TEST(SkewOrthomorphic, InverseStopsBeyondTheHyperbolicLimit) {
  // skew 0 leaves v = x.
  const Points in = {{0.1, 0.2, 0}, {700, 0.1, 0}, {-700.0000001, 0, 0}, {0.1, 0.2, 0}};
  Points out = untouched(4);
  TWstatus status = 0;
  TWrso_i(0, 0, 1, 1, 0, 0, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_NE(out[1].x, kUntouched);
  expect_untouched(out[2]);
  expect_untouched(out[3]);
}

TEST(SkewOrthomorphic, ScaleByDifferentiation) {
  const Skew p = malaya();
  const auto forward = [&](const CoordinateTriple& q) {
    Points one = {q};
    p.forward(one, one);
    return one[0];
  };
  for (double lon = 1.6; lon < 2.0; lon += 0.1) {
    for (double lat = -0.3; lat < 0.5; lat += 0.13) {
      Points point = {{lon, lat, 0}};
      EXPECT_EQ(p.scale(0.99984, point, point), TW_SUCCESS);
      const CoordinateTriple expected = numeric_scale(forward, lon, lat, p.e);
      EXPECT_NEAR(point[0].x, 0.99984 * expected.x, 1e-10);
      EXPECT_EQ(point[0].y, point[0].x);
      EXPECT_NEAR(point[0].z, 0.99984 * 0.99984 * expected.z, 1e-10);
    }
  }
}

TEST(SkewOrthomorphic, ScaleWhereTheCosineIsZero) {
  // No double has a cosine of exactly zero; the division is made even hard by the pole.
  const Points in = {{0.1, kPi / 2, 0}};
  Points out = untouched(1);
  TWstatus status = 0;
  TWrso_s(0, 1, 0, 0, 0.5, 0, 1, 1, 0, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NE(out[0].x, kUntouched);
}

TEST(SkewOrthomorphic, ScaleAtThePole) {
  // With C = 2 the arc tangent is a quarter turn to the last bit, and its cosine that of the
  // latitude: k = A k0 sqrt(1 - e^2) / cos(d).
  const double d = 0.3;
  const Points in = {{-d, kPi / 2, 0}};
  Points out = untouched(1);
  TWstatus status = 0;
  TWrso_s(0.1, 0.9, 0, 0, 0.2, 0, 1, 1, 2, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(out[0].x, 0.9 * std::sqrt(1 - 0.01) / std::cos(d), 1e-14);
}

TEST(SkewOrthomorphic, EveryInputLeavesTheInverse) {
  Points in;
  for (const double v : {0.0, 0.5, -3.0, 600.0, kNaN}) {
    for (const double w : {0.0, 0.7, -100.0, kNaN}) in.push_back({v, w, 0});
  }
  for (const double e : {0.0, 0.0818, 0.5, 0.999, 0.9999999999, 1.0, 1.5, -0.3, kNaN}) {
    Points out = untouched(in.size());
    TWstatus status = 0;
    TWrso_i(0.1, 0.3, 1, 1, 0, e, static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
    for (const auto& q : out) EXPECT_NE(q.y, kUntouched);
  }
  const Points infinite = {{0, kInfinity, 0}};
  Points out = untouched(1);
  TWstatus status = 0;
  TWrso_i(0.1, 0, 1, 1, 0, 0.08, 1, infinite.data(), out.data(), &status);
  EXPECT_TRUE(std::isnan(out[0].y));
}

}  // namespace
