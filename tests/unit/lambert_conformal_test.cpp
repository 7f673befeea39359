#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Cone {
  double e, lon0;
  double C = kUntouched, n = kUntouched, rho0 = kUntouched;
  TWstatus status = 0;

  Cone(double e_, double lon0_, double lat0, double lat1, double lat2) : e(e_), lon0(lon0_) {
    TWlam_c(e, kNaN, lat0, lat1, lat2, &C, &n, &rho0, &status);  // the meridian is not read
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWlam_f(e, lon0, C, n, rho0, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWlam_i(e, lon0, C, n, rho0, static_cast<int32_t>(in.size()), out.data(), in.data(), &word);
    return word;
  }
  TWstatus scale(double k0, const Points& in, Points& out) const {
    TWstatus word = 0;
    TWlam_s(e, k0, C, n, static_cast<int32_t>(in.size()), in.data(), out.data(), &word);
    return word;
  }
};

// t(p) from the isometric latitude in a form of its own.
double t_of(double e, double lat) {
  return std::exp(e * std::atanh(e * std::sin(lat)) - std::asinh(std::tan(lat)));
}

TEST(LambertConformal, SnydersNumericalExample) {
  // Snyder 1987, pp. 296-297: Clarke 1866, parallels 33 and 45 N, origin 23 N 96 W, point 35 N 75
  // W.
  const auto [a, e] = Ellipsoid::clarke_1866();
  const Cone cone(e, degrees(-96), degrees(23), degrees(33), degrees(45));
  EXPECT_EQ(cone.status, TW_SUCCESS);
  EXPECT_NEAR(cone.n, 0.6304965, 5e-8);
  EXPECT_NEAR(cone.C, 1.9523837, 5e-8);
  EXPECT_NEAR(cone.rho0 * a, 9615955.2, 0.05);
  const Points in = {{degrees(-75), degrees(35), 4}};
  Points out = untouched(1), scale = untouched(1);
  EXPECT_EQ(cone.forward(in, out), TW_SUCCESS);
  EXPECT_NEAR(out[0].x * a, 1894410.9, 0.05);
  EXPECT_NEAR(out[0].y * a, 1564649.5, 0.05);
  EXPECT_EQ(out[0].z, kUntouched);
  EXPECT_EQ(cone.scale(1, in, scale), TW_SUCCESS);
  EXPECT_NEAR(scale[0].x, 0.9970171, 5e-8);
  EXPECT_EQ(scale[0].y, scale[0].x);
  EXPECT_EQ(scale[0].z, scale[0].x * scale[0].x);
  EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);
  expect_near(out[0], in[0].x, in[0].y, 1e-14);
}

TEST(LambertConformal, SphereOfSnyder) {
  // Snyder 1987, p. 295: unit sphere, the same cone and point.
  const Cone cone(0, degrees(-96), degrees(23), degrees(33), degrees(45));
  EXPECT_NEAR(cone.n, 0.6304777, 5e-8);
  EXPECT_NEAR(cone.C, 1.9550002, 5e-8);
  EXPECT_NEAR(cone.rho0, 1.5071429, 5e-8);
  Points out = {{degrees(-75), degrees(35), 0}};
  cone.forward(out, out);
  expect_near(out[0], 0.2966785, 0.2462112, 5e-8);
  EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);  // the first pass ends it
  expect_near(out[0], degrees(-75), degrees(35), 1e-15);
}

TEST(LambertConformal, TexasSouthCentral) {
  // IOGP Publication 373-7-2, Lambert Conic Conformal (2SP): NAD27 / Texas South Central, US feet.
  const double a = 20925832.16;
  const double e = 0.08227185;
  const Cone cone(e, degrees(-99), degrees(27, 50), degrees(28, 23), degrees(30, 17));
  Points out = {{degrees(-96), degrees(28, 30), 0}};
  cone.forward(out, out);
  EXPECT_NEAR(out[0].x * a + 2000000, 2963503.91, 0.01);
  EXPECT_NEAR(out[0].y * a, 254759.80, 0.01);
}

TEST(LambertConformal, ConstantsRefuseAnOriginBeyondAPole) {
  for (const double lat0 : {std::nextafter(kPi / 2, 2), -std::nextafter(kPi / 2, 2)}) {
    const Cone cone(0.0818, 0, lat0, 0.5, 0.7);
    EXPECT_EQ(cone.status, TW_BAD_LATITUDE);
    EXPECT_EQ(cone.C, kUntouched);
    EXPECT_EQ(cone.n, kUntouched);
    EXPECT_EQ(cone.rho0, kUntouched);
  }
}

TEST(LambertConformal, ConstantsRefuseTheEquatorAlone) {
  const Cone cone(0.0818, 0, 0.1, 0, 0);
  EXPECT_EQ(cone.status, TW_BAD_PARAMETER);
  EXPECT_EQ(cone.n, kUntouched);
  const Cone near(0.0818, 0, 0.1, 0.9e-12, 0.4e-12);
  EXPECT_EQ(near.status, TW_BAD_PARAMETER);
  EXPECT_EQ(near.n, kUntouched);
  // A single parallel just off the equator is a cone, if a flat one.
  const Cone off(0.0818, 0, 0.1, 1.1e-11, 1.1e-11);
  EXPECT_EQ(off.status, TW_SUCCESS);
  EXPECT_NEAR(off.n, 1.1e-11, 1e-25);
  // Between 1e-12 and n t^n of 1e-12 there is nothing: 1.1e-12 passes both.
  EXPECT_EQ(Cone(0.0818, 0, 0.1, 1.1e-12, 1.1e-12).status, TW_SUCCESS);
}

TEST(LambertConformal, ConstantsRefuseSymmetricParallels) {
  const Cone cone(0.0818, 0, 0.1, 0.5, -0.5);
  EXPECT_EQ(cone.status, TW_BAD_PARAMETER);
  EXPECT_EQ(cone.n, 0);  // written before the test
  EXPECT_EQ(cone.C, kUntouched);
  EXPECT_EQ(cone.rho0, kUntouched);
}

TEST(LambertConformal, ConstantsRefuseParallelsWithOneT) {
  // Towards e = 1 the conformal latitude hardly moves near the equator: t is 1 on both parallels.
  const Cone cone(1 - 1e-9, 0, 0.1, 1e-5, 1.1e-5);
  EXPECT_EQ(cone.status, TW_BAD_PARAMETER);
  EXPECT_EQ(cone.n, kUntouched);
}

TEST(LambertConformal, SingleParallel) {
  const Cone cone(0.0818, 0, 0.4, 0.7, 0.7);
  EXPECT_DOUBLE_EQ(cone.n, std::sin(0.7));
  // Scale is true on the parallel, and the radius there is the cotangent times nu.
  const double nu = 1 / std::sqrt(1 - 0.0818 * 0.0818 * std::sin(0.7) * std::sin(0.7));
  EXPECT_NEAR(cone.C * std::pow(t_of(0.0818, 0.7), cone.n), nu / std::tan(0.7), 1e-15);
  Points out = untouched(1);
  cone.scale(1, {{0, 0.7, 0}}, out);
  EXPECT_NEAR(out[0].x, 1, 1e-15);
  // Parallels that differ by more than 1e-12 take the logarithms.
  EXPECT_NE(Cone(0.0818, 0, 0.4, 0.7, 0.7 + 1.1e-12).n, cone.n);
  EXPECT_EQ(Cone(0.0818, 0, 0.4, 0.7, 0.7 + 0.9e-12).n, cone.n);
}

TEST(LambertConformal, PolarParallel) {
  const double e = 0.0818;
  // Snyder 1987, eq. 21-33: rho = 2 t / sqrt((1 + e)^(1 + e) (1 - e)^(1 - e)).
  const double value = 2 / std::sqrt(std::pow(1 + e, 1 + e) * std::pow(1 - e, 1 - e));
  const Cone north(e, 0, kPi / 2, kPi / 2, kPi / 2);
  EXPECT_EQ(north.status, TW_SUCCESS);
  EXPECT_EQ(north.n, 1);
  EXPECT_NEAR(north.C, value, 1e-15);
  EXPECT_EQ(north.rho0, 0);
  const Cone south(e, 0, -kPi / 2, -kPi / 2, -kPi / 2);
  EXPECT_EQ(south.status, TW_SUCCESS);
  EXPECT_EQ(south.n, -1);
  EXPECT_NEAR(south.C, -value, 1e-15);
  EXPECT_EQ(south.rho0, 0);
  // 1e-12 from the pole and further the general formula is taken.
  const double limit = 1.5707963267938965;
  const Cone general(e, 0, 0.5, limit, limit);
  EXPECT_EQ(general.status, TW_BAD_PARAMETER);  // n t^n is 5e-13
  EXPECT_EQ(general.n, std::sin(limit));
  EXPECT_EQ(general.C, kUntouched);
  EXPECT_NEAR(Cone(e, 0, 0.5, kPi / 2 - 3e-12, kPi / 2 - 3e-12).C, value, 1e-4);
  EXPECT_NEAR(Cone(e, 0, 0.5, std::nextafter(limit, 2), std::nextafter(limit, 2)).C, value, 1e-15);
}

TEST(LambertConformal, OriginAtAPole) {
  const double e = 0.0818;
  EXPECT_EQ(Cone(e, 0, kPi / 2, 0.5, 0.7).rho0, 0);
  EXPECT_EQ(Cone(e, 0, kPi / 2, 0.5, 0.7).status, TW_SUCCESS);
  EXPECT_EQ(Cone(e, 0, kPi / 2 - 0.9e-14, 0.5, 0.7).rho0, 0);
  EXPECT_GT(Cone(e, 0, kPi / 2 - 1.1e-14, 0.5, 0.7).rho0, 0);
  EXPECT_EQ(Cone(e, 0, -kPi / 2, -0.5, -0.7).rho0, 0);
  for (const double sign : {1.0, -1.0}) {
    const Cone far(e, 0, -sign * kPi / 2, sign * 0.5, sign * 0.7);
    EXPECT_EQ(far.status, TW_BAD_LATITUDE);
    EXPECT_NE(far.n, kUntouched);
    EXPECT_NE(far.C, kUntouched);
    EXPECT_EQ(far.rho0, kUntouched);
  }
}

TEST(LambertConformal, ForwardAtTheApex) {
  const double e = 0.0818;
  for (const double sign : {1.0, -1.0}) {
    const Cone cone(e, 0.3, sign * 0.4, sign * 0.5, sign * 0.7);
    Points out = untouched(3);
    EXPECT_EQ(cone.forward({{2, sign * kPi / 2, 0},
                            {-9, sign * (kPi / 2 - 0.9e-14), 0},
                            {0.3, sign * (kPi / 2 - 1e-13), 0}},
                           out),
              TW_SUCCESS);
    expect_near(out[0], 0, cone.rho0, 0);
    expect_near(out[1], 0, cone.rho0, 0);
    EXPECT_EQ(out[2].x, 0);
    EXPECT_NE(out[2].y, cone.rho0);
  }
}

TEST(LambertConformal, ForwardStops) {
  const double e = 0.0818;
  const double past = std::nextafter(kPi / 2, 2);
  for (const double sign : {1.0, -1.0}) {
    const Cone cone(e, 0, sign * 0.4, sign * 0.5, sign * 0.7);
    for (const double bad : {-sign * kPi / 2, -sign * (kPi / 2 - 0.9e-14), past, -past, 9.0}) {
      Points out = untouched(3);
      EXPECT_EQ(cone.forward({{0.1, 0.2, 0}, {0.1, bad, 0}, {0.1, 0.3, 0}}, out), TW_BAD_LATITUDE);
      EXPECT_NE(out[0].x, kUntouched);
      expect_untouched(out[1]);
      expect_untouched(out[2]);
    }
    Points out = untouched(1);
    EXPECT_EQ(cone.forward({{0.1, -sign * (kPi / 2 - 1.1e-14), 0}}, out), TW_SUCCESS);
  }
  // With a cone constant of zero no pole is an apex.
  for (const double pole : {kPi / 2, -kPi / 2}) {
    const CoordinateTriple in = {0, pole, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWlam_f(e, 0, 1, 0, 1, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_BAD_LATITUDE);
    expect_untouched(out);
  }
}

TEST(LambertConformal, Wraps) {
  const Cone cone(0, 0, 0.4, 0.5, 0.7);
  Points out = untouched(4);
  cone.forward({{-kPi, 0.5, 0}, {kPi, 0.5, 0}, {4, 0.5, 0}, {4 - 2 * kPi, 0.5, 0}}, out);
  EXPECT_EQ(out[0].x, out[1].x);  // -pi becomes pi
  EXPECT_GT(out[0].x, 0);
  expect_near(out[2], out[3].x, out[3].y, 1e-15);
  // The inverse: a longitude of -pi comes out as pi, and one turn at most is taken off.
  const Cone east(0, 3, 0.4, 0.5, 0.7);
  Points p = {{3.2, 0.5, 0}};
  east.forward(p, p);
  east.inverse(p, p);
  EXPECT_NEAR(p[0].x, 3.2 - 2 * kPi, 1e-15);
  // On the polar cone theta is the longitude itself: atan2(-0, -1) is -pi exactly.
  const Cone polar(0, 0, kPi / 2, kPi / 2, kPi / 2);
  p = {{-0.0, 1, 0}};
  polar.inverse(p, p);
  EXPECT_EQ(p[0].x, kPi);
}

TEST(LambertConformal, InverseAtTheApex) {
  const double e = 0.0818;
  for (const double sign : {1.0, -1.0}) {
    const Cone cone(e, 4, sign * kPi / 2, sign * 0.5, sign * 0.7);
    Points out = untouched(3);
    EXPECT_EQ(cone.inverse({{0, 0, 0}, {0.6e-13, 0.6e-13, 0}, {0.5, -sign * 0.5, 0}}, out),
              TW_SUCCESS);
    expect_near(out[0], 4, sign * kPi / 2, 0);  // the wrap is undone
    expect_near(out[1], 4, sign * kPi / 2, 0);
    EXPECT_LT(out[2].x, kPi);
    // Where rho0 is not 0 a point within 1e-13 of the apex has no direction.
    const Cone other(e, 4, sign * 0.4, sign * 0.5, sign * 0.7);
    EXPECT_EQ(other.inverse({{0, other.rho0, 0}}, out), TW_SUCCESS);
    expect_near(out[0], 4, sign * kPi / 2, 0);
  }
}

TEST(LambertConformal, InverseRoundTrip) {
  std::mt19937 random(4);
  std::uniform_real_distribution<double> lon(-3, 3), lat(-1.3, 1.3);
  for (const double e : {0.0, 0.0818191910428158, 0.3}) {
    for (const double sign : {1.0, -1.0}) {
      const Cone cone(e, 0, sign * 0.4, sign * 0.5, sign * 0.7);
      Points in(300);
      for (auto& p : in) p = {lon(random), lat(random), 12};
      Points out = in;
      EXPECT_EQ(cone.forward(in, out), TW_SUCCESS);
      EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);
      for (std::size_t i = 0; i < in.size(); ++i) {
        // rho reaches 6 away from the apex, where a last bit is 1e-15
        expect_near(out[i], in[i].x, in[i].y, 12, 2e-14);
      }
    }
  }
}

TEST(LambertConformal, FifteenPasses) {
  // At e = 0.9 a pass brings the equator's latitude in by e^2 = 0.81: fifteen are not enough.
  const Cone slow(0.9, 0, 0.4, 0.5, 0.7);
  Points in = {{0.1, 0.1, 0}, {0.1, 1.5, 0}};
  Points out = untouched(2);
  slow.forward(in, out);
  EXPECT_EQ(slow.inverse(out, out), TW_I_LATITUDE_LIMITED);  // though the second point is fine
  EXPECT_NEAR(out[0].y, 0.1, 0.02);
  EXPECT_GT(std::fabs(out[0].y - 0.1), 1e-6);  // the last value stands
  EXPECT_NEAR(out[1].y, 1.5, 1e-12);
}

// The sizes of the fixed point's steps for a latitude, with powers as the formula writes them.
std::vector<double> steps_to_latitude(double e, double lat) {
  const double w = std::tan(kPi / 4 - lat / 2) *
                   std::pow((1 + e * std::sin(lat)) / (1 - e * std::sin(lat)), e / 2);
  std::vector<double> steps;
  double last = kPi / 2 - 2 * std::atan(w);
  do {
    const double es = e * std::sin(last);
    const double next = kPi / 2 - 2 * std::atan(w * std::pow((1 - es) / (1 + es), e / 2));
    steps.push_back(std::fabs(next - last));
    last = next;
  } while (steps.back() > 1e-14);
  return steps;
}

TEST(LambertConformal, RestInTheFifteenthPassIsToldToo) {
  int fourteen = 0, fifteen = 0, more = 0;
  for (double e = 0.2; e < 0.6; e += 0.002) {
    const std::vector<double> steps = steps_to_latitude(e, 0.1);
    // rounding decides where a step is next to the limit
    if (steps.back() > 5e-15 || steps[steps.size() - 2] < 1.5e-14) continue;
    const Cone cone(e, 0, 0.4, 0.5, 0.7);
    Points p = {{0.1, 0.1, 0}};
    cone.forward(p, p);
    EXPECT_EQ(cone.inverse(p, p), steps.size() < 15 ? TW_SUCCESS : TW_I_LATITUDE_LIMITED) << e;
    fourteen += steps.size() == 14;
    fifteen += steps.size() == 15;
    more += steps.size() > 15;
  }
  EXPECT_GT(fourteen, 0);
  EXPECT_GT(fifteen, 0);
  EXPECT_GT(more, 0);
}

TEST(LambertConformal, ScaleIsTheDerivative) {
  const double step = 1e-5;
  for (const double e : {0.0, 0.0818191910428158}) {
    for (const double sign : {1.0, -1.0}) {
      const Cone cone(e, 0, sign * 0.4, sign * 0.5, sign * 0.7);
      for (double lat = -1.2; lat < 1.21; lat += 0.3) {
        Points p = {{0.4, lat - step, 0}, {0.4, lat + step, 0}};
        cone.forward(p, p);
        const double w = 1 - e * e * std::sin(lat) * std::sin(lat);
        const double radius = (1 - e * e) / std::pow(w, 1.5);
        const double h = std::hypot(p[1].x - p[0].x, p[1].y - p[0].y) / (2 * step) / radius;
        Points out = untouched(1);
        EXPECT_EQ(cone.scale(2, {{0.4, lat, 0}}, out), TW_SUCCESS);
        EXPECT_NEAR(out[0].x / (2 * h), 1, 5e-9);  // the third derivative over the step
      }
    }
  }
}

TEST(LambertConformal, ScaleAtThePoles) {
  const double e = 0.0818;
  const double past = std::nextafter(kPi / 2, 2);
  const Cone polar(e, 0, kPi / 2, kPi / 2, kPi / 2);
  Points out = untouched(5);
  EXPECT_EQ(polar.scale(2,
                        {{0, past, 0},
                         {0, -past, 0},
                         {0, kPi / 2, 0},
                         {0, -kPi / 2, 0},
                         {0, -kPi / 2 + 0.9e-10, 0}},
                        out),
            TW_BAD_LATITUDE);
  expect_near(out[0], 2, 2, 4, 0);
  expect_near(out[1], 2, 2, 4, 0);
  EXPECT_NEAR(out[2].x, 2, 2e-5);  // the scale at a polar cone's apex is 1; t has six digits there
  // The south pole is held just past the north pole, where t and the radius are both negative.
  EXPECT_NEAR(out[3].x, 2, 2e-5);
  EXPECT_EQ(out[3].x, out[4].x);
  // With a cone constant that is no whole number the power of the negative t is no number.
  const Cone cone(e, 0, 0.4, 0.5, 0.7);
  EXPECT_EQ(cone.scale(1, {{0, -kPi / 2, 0}}, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].x));
  EXPECT_EQ(cone.scale(1, {{0, kPi / 2, 0}}, out), TW_SUCCESS);
  EXPECT_GT(out[0].x, 10);
  // 1.5e-10 from the south pole nothing is held.
  EXPECT_EQ(cone.scale(1, {{0, -kPi / 2 + 1.5e-10, 0}}, out), TW_SUCCESS);
  EXPECT_GT(out[0].x, 1e10);
}

TEST(LambertConformal, ScaleWhereTheParallelVanishes) {
  // On the sphere the radius at the held latitudes is their cosine: 1.00000007e-10 before the pole,
  // -0.99999995e-10 behind it, one on either side of the limit.
  const Points in = {{0, kPi / 2, 0}, {0, -kPi / 2, 0}, {0, 0.5, 0}};
  Points out = untouched(3);
  TWstatus status = 0;
  TWlam_s(0, 3, 2, 1, 1, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(out[0].x, 3, 3e-5);
  TWlam_s(0, 3, 2, 1, 3, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  expect_near(out[1], 3, 3, 9, 0);
  EXPECT_NEAR(out[2].x, 6 / (1 + std::sin(0.5)), 1e-14);
}

TEST(LambertConformal, NotANumberGoesThrough) {
  const Cone cone(0.0818, 0, 0.4, 0.5, 0.7);
  Points out = {{0.1, kNaN, 0}, {kNaN, 0.1, 0}};
  EXPECT_EQ(cone.forward(out, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].y));
  EXPECT_TRUE(std::isnan(out[1].x));
  EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].y));
  out = {{0.1, kNaN, 0}};
  EXPECT_EQ(cone.scale(1, out, out), TW_BAD_LATITUDE);  // a radius that is no number is too small
  EXPECT_EQ(out[0].x, 1);
}

TEST(LambertConformal, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const auto [a, e] = Ellipsoid::grs80();
  const struct {
    const char* definition;
    double lat0, lat1, lat2;
  } cones[] = {{"+proj=lcc +lon_0=10 +lat_0=40 +lat_1=43 +lat_2=62 +ellps=GRS80", 40, 43, 62},
               {"+proj=lcc +lon_0=10 +lat_0=-30 +lat_1=-20 +lat_2=-50 +ellps=GRS80", -30, -20, -50},
               {"+proj=lcc +lon_0=10 +lat_0=52 +lat_1=52 +ellps=GRS80", 52, 52, 52}};
  for (const auto& c : cones) {
    const ProjPeer peer(c.definition);
    ASSERT_TRUE(peer.ok());
    const Cone cone(e, degrees(10), degrees(c.lat0), degrees(c.lat1), degrees(c.lat2));
    for (double lat = -70; lat < 75; lat += 10) {
      for (double lon = -150; lon < 180; lon += 37) {
        const Points in = {{degrees(lon), degrees(lat), 0}};
        Points out = in;
        EXPECT_EQ(cone.forward(in, out), TW_SUCCESS);
        const CoordinateTriple expected = peer.forward(in[0]);
        expect_near(out[0], expected.x / a, expected.y / a, 1e-13);
        EXPECT_EQ(cone.inverse(out, out), TW_SUCCESS);
        expect_near(out[0], in[0].x, in[0].y, 2e-14);
      }
    }
  }
#endif
}

}  // namespace
