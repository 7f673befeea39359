#include <gtest/gtest.h>

#include <complex>
#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

using Complex = std::complex<double>;

struct Cubic {
  double A = kUntouched, B = kUntouched, C = kUntouched, D = kUntouched;
  explicit Cubic(double azimuth) {
    TWstatus status = 0;
    TWlabor_c(azimuth, &A, &B, &C, &D, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
};

struct Laborde {
  double e, lon0;
  double chi0 = kUntouched, c = 0, t = 0, R = 0;
  double A0 = 0, A2 = 0, A4 = 0, A6 = 0, A8 = 0, M0 = 0, B2 = 0, B4 = 0, B6 = 0;
  double A = kUntouched, B = 0, C = 0, D = 0;
  TWstatus status = 0;

  Laborde(double e_, double lon0_, double lat0, double azimuth) : e(e_), lon0(lon0_) {
    TWlaborde_c(e, lon0, lat0, azimuth, &chi0, &c, &t, &R, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4,
                &B6, &A, &B, &C, &D, &status);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWlaborde_f(e, lon0, c, t, A0, A2, A4, A6, A8, M0, A, B, static_cast<int32_t>(in.size()),
                in.data(), out.data(), &word);
    return word;
  }
  TWstatus inverse(int16_t mode, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWlaborde_i(e, lon0, chi0, c, t, A0, M0, B2, B4, B6, mode, A, B, C, D,
                static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
  TWstatus scale(double k0, Points& in, Points& out) const {
    TWstatus word = 0;
    TWlaborde_s(e, lon0, c, t, R, A0, A2, A4, A6, A8, M0, A, B, k0, static_cast<int32_t>(in.size()),
                in.data(), out.data(), &word);
    return word;
  }
};

// IOGP Publication 373-7-2, Laborde oblique Mercator: Tananarive / Laborde Grid.
Laborde tananarive() {
  return Laborde(Ellipsoid::international_1924().e, degrees(46, 26, 14.025), -degrees(18, 54),
                 degrees(18, 54));
}

TEST(Laborde, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=labrd +lat_0=-18.9 +lon_0=46.43722916666667 +azi=18.9 +ellps=intl");
  ASSERT_TRUE(peer.ok());
  const double a = Ellipsoid::international_1924().a;
  const Laborde p = tananarive();
  for (double lat = -26; lat < -11; lat += 1.7) {
    for (double lon = 43; lon < 51; lon += 1.3) {
      const Points in = {{degrees(lon), degrees(lat), 0}};
      Points out = untouched(1);
      EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
      const CoordinateTriple expected = peer.forward(in[0]);
      // the peer's series in the longitude is carried to its fifth power: some 0.01 m here
      expect_near(out[0], expected.x / a / p.R, expected.y / a / p.R, 0.05 / a);
    }
  }
#endif
}

TEST(Laborde, Parameters) {
  double v[6] = {};
  TWstatus status = 0;
  TWlab_param(&v[0], &v[1], &v[2], &v[3], &v[4], &v[5], &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(v[0], degrees(46.43720833), 3e-16);
  EXPECT_NEAR(v[1], degrees(-18.9), 1e-16);
  EXPECT_EQ(v[2], 0.3298672286269283);
  EXPECT_EQ(v[3], 400000);
  EXPECT_EQ(v[4], 800000);
  EXPECT_EQ(v[5], 0.9995);
}

TEST(Laborde, ConstantsOfTheCubic) {
  const Cubic zero(0);
  EXPECT_EQ(zero.A, 0);
  EXPECT_EQ(zero.B, 0);
  EXPECT_EQ(zero.C, 0);
  EXPECT_EQ(zero.D, 0);
  const Cubic half(kPi / 4);  // 2 azimuth = 90 degrees
  EXPECT_NEAR(half.A, 1.0 / 12, 1e-17);
  EXPECT_NEAR(half.B, 1.0 / 12, 1e-17);
  EXPECT_NEAR(half.C, 0, 1e-17);
  EXPECT_NEAR(half.D, 1.0 / 24, 1e-17);
  const Cubic sixty(kPi / 3);  // cos 120 = -1/2
  EXPECT_NEAR(sixty.A, 0.125, 1e-16);
  EXPECT_NEAR(sixty.B, std::sqrt(3) / 24, 1e-16);
  EXPECT_NEAR(sixty.C, 3 * (1.0 / 64 - 3.0 / 576), 1e-16);
  EXPECT_NEAR(sixty.D, 6 * 0.125 * std::sqrt(3) / 24, 1e-16);
}

TEST(Laborde, CubicIsZPlusCZCubed) {
  const Cubic k(0.4);
  const Points in = {{0.1, -0.05, 7}, {-0.3, 0.2, 7}, {0, 0, 7}};
  Points out = untouched(3);
  TWstatus status = 0;
  TWlabor_f(k.A, k.B, 3, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < 3; ++i) {
    const Complex z(in[i].y, in[i].x);
    const Complex w = z + Complex(k.A, k.B) * z * z * z;
    expect_near(out[i], w.imag(), w.real(), kUntouched, 1e-16);
  }
  expect_near(out[2], 0, 0, 0);
}

TEST(Laborde, AzimuthZeroIsTheIdentity) {
  const Points in = {{0.1, -0.05, 0.9}, {-3, 2, 1.1}};
  Points out = untouched(2);
  TWstatus status = 0;
  TWlabor_f(0, 0, 2, in.data(), out.data(), &status);
  expect_near(out[0], 0.1, -0.05, 0);
  expect_near(out[1], -3, 2, 0);
  for (const int16_t mode : {int16_t{0}, int16_t{1}}) {
    TWlabor_i(mode, 0, 0, 0, 0, 2, in.data(), out.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out[1], -3, 2, 0);
  }
  Points scale = in;
  TWlabor_s(2, 0, 0, 2, in.data(), scale.data(), &status);
  expect_near(scale[0], 1.8, 1.8, 1.8 * 1.8, 1e-15);  // z of the output is the scale so far
  expect_near(scale[1], 2.2, 2.2, 2.2 * 2.2, 1e-15);
}

TEST(Laborde, InverseSeriesByHand) {
  // x = 1, y = 2: u = 12 - 1, v = -6 + 8, w = 10 - 80 + 32, z = 1 - 40 + 80.
  const double A = 1e-3, B = 2e-3, C = 3e-5, D = 5e-5;
  const Points in = {{1, 2, 0}};
  Points out = untouched(1);
  TWstatus status = 0;
  TWlabor_i(0, A, B, C, D, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(out[0].x, 1 - A * 11 - B * 2 + D * -38 + C * 41, 1e-15);
  EXPECT_NEAR(out[0].y, 2 + B * 11 - A * 2 - D * 41 + D * -38, 1e-15);  // D twice
  EXPECT_EQ(out[0].z, kUntouched);
}

TEST(Laborde, RefinedInverseMeetsTheForward) {
  const Cubic k(0.33);
  std::mt19937 random(6);
  std::uniform_real_distribution<double> off(-0.15, 0.15);
  Points in(300);
  for (auto& q : in) q = {off(random), off(random), 1};
  Points out = in;
  TWstatus status = 0;
  TWlabor_f(k.A, k.B, 300, out.data(), out.data(), &status);
  Points plain = out;
  TWlabor_i(1, k.A, k.B, k.C, k.D, 300, out.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  TWlabor_i(0, k.A, k.B, k.C, k.D, 300, plain.data(), plain.data(), &status);
  for (std::size_t i = 0; i < in.size(); ++i) {
    expect_near(out[i], in[i].x, in[i].y, 1e-15);
    // the series alone leaves its wrong term: |C - D| w, up to 1e-5
    expect_near(plain[i], in[i].x, in[i].y, 2e-5);
  }
}

TEST(Laborde, RefinementThatRunsOutOfPasses) {
  const Points in = {{0.1, 0.1, 0}, {3, 3, 0}, {0.1, 0.1, 0}, {kNaN, 0, 0}};
  Points out = untouched(4);
  const Cubic k(0.8);
  TWstatus status = 0;
  TWlabor_i(1, k.A, k.B, k.C, k.D, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_NOT_CONVERGED);
  EXPECT_NE(out[1].x, kUntouched);  // written as it stands
  expect_near(out[2], out[0].x, out[0].y, 0);
  EXPECT_TRUE(std::isnan(out[3].x));
  // mode 0 sets no failure
  TWlabor_i(0, k.A, k.B, k.C, k.D, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

TEST(Laborde, CountOfThirtyReportsEvenIfItConverges) {
  // With A and B chosen so that the passes shrink by about 3 |c z^2| each time, some point needs
  // exactly thirty of them; its value is then as good as that of its neighbours.
  const Cubic k(kPi / 4);
  int first_failure = 0;
  for (int i = 1; i < 4000 && !first_failure; ++i) {
    const double r = i * 1e-3;
    CoordinateTriple p = {r, 0.3 * r, 0};
    TWstatus status = 0;
    TWlabor_f(k.A, k.B, 1, &p, &p, &status);
    TWlabor_i(1, k.A, k.B, k.C, k.D, 1, &p, &p, &status);
    if (status == TW_NOT_CONVERGED) {
      first_failure = i;
      expect_near(p, r, 0.3 * r, 3e-14);
    }
  }
  EXPECT_GT(first_failure, 100);
}

TEST(Laborde, ScaleOfTheCubicByHand) {
  // p = y, q = x; (B + iA)(p + iq)^2, times 3, plus 1.
  const double A = 0.03, B = 0.07;
  const Points in = {{0.2, 0.5, 0}, {0, 0.5, 0}};
  Points out = {{0, 0, 0.9}, {0, 0, 1}};
  TWstatus status = 0;
  TWlabor_s(1.1, A, B, 2, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < 2; ++i) {
    const Complex z(in[i].y, in[i].x);
    const double k = std::abs(1.0 + 3.0 * Complex(B, A) * z * z) * (i == 0 ? 0.9 : 1) * 1.1;
    expect_near(out[i], k, k, k * k, 1e-15);
  }
  // One part zero: the size of the other.
  Points one = {{0, 0, 1}};
  const Points at = {{0, 2, 0}};
  TWlabor_s(1, 0, -1.0 / 12, 1, at.data(), one.data(), &status);  // 1 - 3 * 4 / 12 = 0
  EXPECT_NEAR(one[0].x, 0, 1e-16);
  one[0].z = 1;
  TWlabor_s(1, 1e-3, 0, 1, at.data(), one.data(), &status);  // 1 + i 0.012: re > im
  EXPECT_NEAR(one[0].x, std::hypot(1, 0.012), 1e-16);
  one[0].z = 1;
  TWlabor_s(1, 1, 0, 1, at.data(), one.data(), &status);  // 1 + 12 i: re < im
  EXPECT_NEAR(one[0].x, std::hypot(1, 12), 4e-15);
}

// The third element is an input, and goes along in arrays of any length.
TEST(Laborde, ScaleOfManyPointsIsThatOfEach) {
  const Cubic cubic(0.3);
  for (const int32_t count : {1, 255, 256, 257, 600}) {
    const auto size = static_cast<std::size_t>(count);
    Points in(size), out(size + 1, kUntouchedPoint);
    for (std::size_t i = 0; i < size; ++i) {
      in[i] = {0.0001 * static_cast<double>(i), 0.02, 7};
      out[i] = {8, 9, 1 + 0.001 * static_cast<double>(i)};
    }
    Points each = out;
    TWstatus status = 0;
    TWlabor_s(0.9995, cubic.A, cubic.B, count, in.data(), out.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    for (std::size_t i = 0; i < size; ++i) {
      TWlabor_s(0.9995, cubic.A, cubic.B, 1, &in[i], &each[i], &status);
      ASSERT_EQ(out[i].x, each[i].x) << count << " " << i;
      ASSERT_EQ(out[i].z, each[i].z) << count << " " << i;
    }
    expect_untouched(out[size]);
  }
}

TEST(Laborde, ScaleOfTheChain) {
  // With azimuth 45 degrees A is B, and the exchanged constants do no harm: the scale is that of
  // the whole projection.
  const double e = Ellipsoid::international_1924().e;
  const Laborde p(e, 0.8, -0.33, kPi / 4);
  const auto forward = [&](const CoordinateTriple& q) {
    Points one = {q};
    p.forward(one, one);
    return CoordinateTriple{one[0].x * p.R, one[0].y * p.R, 0};
  };
  for (double lon = 0.75; lon < 0.86; lon += 0.03) {
    for (double lat = -0.4; lat < -0.25; lat += 0.04) {
      Points point = {{lon, lat, 0}};
      EXPECT_EQ(p.scale(0.9995, point, point), TW_SUCCESS);
      const CoordinateTriple expected = numeric_scale(forward, lon, lat, e);
      // the cubic sees x and y in units of the semi-major axis here, of the sphere's radius in the
      // forward: R differs from 1 by 0.003, and the cubic's share of the scale is below 3e-3
      EXPECT_NEAR(point[0].x, 0.9995 * expected.x, 2e-5);
      EXPECT_EQ(point[0].x, point[0].y);
      EXPECT_EQ(point[0].z, point[0].x * point[0].x);
    }
  }
}

TEST(Laborde, ScaleOfAFailingArray) {
  const Laborde p = tananarive();
  const Points in = {{0.8, -0.3, 0}, {0.8, 2, 0}};
  Points chain = in, stages = in;
  EXPECT_EQ(p.scale(0.9995, chain, chain), TW_BAD_LATITUDE);
  TWstatus status = 0;
  TWg_schreiber(p.e, p.lon0, p.c, p.t, p.R, p.A0, p.A2, p.A4, p.A6, p.A8, p.M0, 0.9995, 2,
                stages.data(), stages.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  for (std::size_t i = 0; i < 2; ++i) {  // multiplied by R whatever the word, and not taken further
    EXPECT_EQ(chain[i].x, stages[i].x * p.R);
    EXPECT_EQ(chain[i].y, stages[i].y * p.R);
    EXPECT_EQ(chain[i].z, stages[i].z);
  }
}

TEST(Laborde, FailingStagesSkipTheLaterOnes) {
  const Laborde p = tananarive();
  const Points in = {{0.01, 0.02, 0}, {20, 20, 0}};
  Points out = untouched(2), first = untouched(2);
  EXPECT_EQ(p.inverse(1, in, out), TW_NOT_CONVERGED);
  TWstatus status = 0;
  TWlabor_i(1, p.A, p.B, p.C, p.D, 2, in.data(), first.data(), &status);
  // the whole array holds the first stage
  EXPECT_EQ(out[0].x, first[0].x);
  EXPECT_EQ(out[0].y, first[0].y);
  // the second stage refuses an abscissa above 700; the third is left out
  const Points far = {{0.01, 0.02, 0}, {701, 0, 0}};
  Laborde plain(0.08, 0.8, -0.33, 0);
  out = untouched(2);
  EXPECT_EQ(plain.inverse(0, far, out), TW_RANGE_ERROR);
  EXPECT_LT(out[0].x, 0.1);  // no central meridian added
}

TEST(Laborde, RoundTrip) {
  const Laborde p = tananarive();
  std::mt19937 random(7);
  std::uniform_real_distribution<double> off(-0.12, 0.12);
  Points in(300);
  for (auto& q : in) q = {p.lon0 + off(random), -0.33 + off(random), 4};
  Points out = in;
  EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
  EXPECT_EQ(p.inverse(1, out, out), TW_SUCCESS);
  // the forward transverse Mercator is a series in the longitude, the inverse on the sphere is
  // closed
  for (std::size_t i = 0; i < in.size(); ++i) expect_near(out[i], in[i].x, in[i].y, 4, 2e-11);
}

}  // namespace
