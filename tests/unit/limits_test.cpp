// Limits to the last bit: on each side of a stated limit the stated thing happens, at every place
// of a block.

#include <gtest/gtest.h>

#include <cmath>
#include <functional>

#include "support/points.hpp"
#include "tidewater/conformal.h"
#include "tidewater/datum.h"
#include "tidewater/foundation.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kHalf = kPi / 2;

double after(double v) { return std::nextafter(v, 1e300); }
double before(double v) { return std::nextafter(v, -1e300); }

using Call = std::function<void(int32_t, const CoordinateTriple*, CoordinateTriple*, TWstatus*)>;

// The word for one point, which is the same wherever it stands among good ones.
TWstatus word_of(const Call& call, const CoordinateTriple& p, const CoordinateTriple& good) {
  TWstatus alone = 0;
  CoordinateTriple out = kUntouchedPoint;
  call(1, &p, &out, &alone);
  for (std::size_t place = 0; place < 33; ++place) {
    Points in(33, good), many = untouched(33);
    in[place] = p;
    TWstatus status = 0;
    call(33, in.data(), many.data(), &status);
    EXPECT_EQ(status, alone) << place;
    const auto same = [](double a, double b) { return a == b || (std::isnan(a) && std::isnan(b)); };
    EXPECT_TRUE(same(many[place].x, out.x) && same(many[place].y, out.y)) << place;
  }
  return alone;
}

TEST(Limits, Equirectangular) {
  const Call forward = [](int32_t n, auto in, auto out, auto s) {
    TWcyl_eqr_f(0, 0, 0.8, n, in, out, s);
  };
  const Call scale = [](int32_t n, auto in, auto out, auto s) {
    TWcyl_eqr_s(2, 0.8, n, in, out, s);
  };
  for (const double sign : {1.0, -1.0}) {
    EXPECT_EQ(word_of(forward, {0, sign * kHalf, 0}, {}), TW_SUCCESS);
    EXPECT_EQ(word_of(forward, {0, sign * after(kHalf), 0}, {}), TW_BAD_LATITUDE);
    EXPECT_EQ(word_of(scale, {0, sign * kHalf, 0}, {}), TW_SUCCESS);
    EXPECT_EQ(word_of(scale, {0, sign * after(kHalf), 0}, {}), TW_NOT_CONVERGED);
  }
}

TEST(Limits, MillerInverse) {
  const Call inverse = [](int32_t n, auto in, auto out, auto s) {
    TWmiller_cyl_i(in, n, 0, 0, out, s);
  };
  for (const double sign : {1.0, -1.0}) {
    EXPECT_EQ(word_of(inverse, {1, sign * 875.0, 0}, {}), TW_SUCCESS);  // 0.8 * 875 is 700
    double beyond = 875;
    while (0.8 * beyond <= 700) beyond = after(beyond);
    EXPECT_EQ(word_of(inverse, {1, sign * beyond, 0}, {}), TW_RANGE_ERROR);
  }
}

TEST(Limits, TransverseMercator) {
  const double e = 0.0818;
  double A0, A2, A4, A6, A8, M0, B2, B4, B6;
  TWstatus status = 0;
  TWt_merc_c(e, 0, 0, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4, &B6, &status);
  const Call sphere = [](int32_t n, auto in, auto out, auto s) {
    TWt_merc_i(0.99e-12, 0, 0, 1, 0, 0, 0, 0, n, in, out, s);
  };
  const Call ellipsoid = [&](int32_t n, auto in, auto out, auto s) {
    TWt_merc_i(e, 0, 0, A0, M0, B2, B4, B6, n, in, out, s);
  };
  const Call scale = [&](int32_t n, auto in, auto out, auto s) {
    TWt_merc_s(e, 1, 0, n, in, out, s);
  };
  for (const double sign : {1.0, -1.0}) {
    EXPECT_EQ(word_of(sphere, {sign * 700, 0.3, 0}, {}), TW_SUCCESS);
    EXPECT_EQ(word_of(sphere, {sign * after(700), 0.3, 0}, {}), TW_RANGE_ERROR);
    // The mean radius is below 1 here, so that it is x / R that leaves the range.
    EXPECT_EQ(word_of(ellipsoid, {sign * 690, 0.3, 0}, {}), TW_SUCCESS);
    EXPECT_EQ(word_of(ellipsoid, {sign * 699.99, 0.3, 0}, {}), TW_RANGE_ERROR);
    EXPECT_EQ(word_of(scale, {sign * 0.8726646259971648, 0.3, 0}, {}), TW_SUCCESS);
    EXPECT_EQ(word_of(scale, {sign * after(0.8726646259971648), 0.3, 0}, {}),
              TW_I_LATITUDE_LIMITED);
    // No word at a pole.
    EXPECT_EQ(word_of(scale, {sign * 2, sign * (kHalf - 0.99e-10), 0}, {}), TW_SUCCESS);
    EXPECT_EQ(word_of(scale, {sign * 2, sign * (kHalf - 1.01e-10), 0}, {}), TW_I_LATITUDE_LIMITED);
  }
}

TEST(Limits, LambertConformal) {
  double C = 0, n = 0, rho0 = 0;
  TWstatus status = 0;
  TWlam_c(0.0818, 0, 0.4, 0.5, 0.8, &C, &n, &rho0, &status);
  const Call forward = [&](int32_t count, auto in, auto out, auto s) {
    TWlam_f(0.0818, 0, C, n, rho0, count, in, out, s);
  };
  const CoordinateTriple good = {0.1, 0.6, 0};
  EXPECT_EQ(word_of(forward, {1, kHalf, 0}, good), TW_SUCCESS);
  EXPECT_EQ(word_of(forward, {1, after(kHalf), 0}, good), TW_BAD_LATITUDE);
  EXPECT_EQ(word_of(forward, {1, -kHalf + 0.9e-14, 0}, good), TW_BAD_LATITUDE);
  EXPECT_EQ(word_of(forward, {1, -kHalf + 1.2e-14, 0}, good), TW_SUCCESS);
}

TEST(Limits, AlbersForward) {
  double n = 0, C = 0, rho0 = 0;
  TWalbers_c(0.0818, 0, 0.4, 0.5, 0.8, &n, &C, &rho0);
  const Call forward = [&](int32_t count, auto in, auto out, auto s) {
    TWalbers_f(0.0818, 0, n, C, rho0, count, in, out, s);
  };
  for (const double sign : {1.0, -1.0}) {
    EXPECT_EQ(word_of(forward, {1, sign * kHalf, 0}, {}), TW_SUCCESS);
    EXPECT_EQ(word_of(forward, {1, sign * after(kHalf), 0}, {}), TW_I_LATITUDE_LIMITED);
    EXPECT_EQ(word_of(forward, {1, sign * 1.5707963267958966, 0}, {}), TW_I_LATITUDE_LIMITED);
    EXPECT_EQ(word_of(forward, {1, sign * after(1.5707963267958966), 0}, {}), TW_BAD_LATITUDE);
  }
}

TEST(Limits, CassiniAtThePoleOfItsOrigin) {
  // By contract the pole's sign is that of y, also where the origin itself is the south pole.
  for (const double lat0 : {kHalf, -kHalf}) {
    double c0, c2, c4, c6, c8, m0, d2, d4, d6, d8;
    TWcassini_c(0.0818, 0, lat0, &c0, &c2, &c4, &c6, &c8, &m0, &d2, &d4, &d6, &d8);
    const Call inverse = [&](int32_t n, auto in, auto out, auto s) {
      TWcassini_i(0.0818, 0.3, c0, m0, d2, d4, d6, d8, n, in, out, s);
    };
    CoordinateTriple p = {0.1, 0, 0}, out = kUntouchedPoint;
    TWstatus status = 0;
    inverse(1, &p, &out, &status);
    expect_near(out, 0.3, kHalf, 0);
    p.y = -1e-14;
    inverse(1, &p, &out, &status);
    expect_near(out, 0.3, -kHalf, 0);
    EXPECT_EQ(word_of(inverse, p, {}), TW_SUCCESS);
  }
}

TEST(Limits, PolyconicOnTheEquator) {
  const Call forward = [](int32_t n, auto in, auto out, auto s) {
    TWpolycon_f(0.0818, 0, 0.25, n, in, out, s);
  };
  CoordinateTriple p = {1, before(1e-7), 0}, out = kUntouchedPoint;
  TWstatus status = 0;
  forward(1, &p, &out, &status);
  expect_near(out, 1, -0.25, 0);
  p.y = 1e-7;
  forward(1, &p, &out, &status);
  EXPECT_NE(out.y, -0.25);
  EXPECT_EQ(word_of(forward, p, {0.1, 0.2, 0}), TW_SUCCESS);
  for (const double size : {before(1e-6), 1e-6}) {
    CoordinateTriple q = {0.5, size, 0};
    TWpolycon_i(0.0818, 0.1, 0, 1, &q, &out, &status);
    EXPECT_EQ(out.y == 0, size < 1e-6);
    EXPECT_NEAR(out.x, 0.6, 1e-6);
  }
}

TEST(Limits, GeocentricAxis) {
  const Call inverse = [](int32_t n, auto in, auto out, auto s) {
    TWxyz_to_llh(6378137, 0.0818, n, in, out, s);
  };
  const CoordinateTriple good = {4e6, 1e6, 4.8e6};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  for (const double p : {before(1e-9), 1e-9}) {
    const CoordinateTriple at = {0, -p, 6e6};
    inverse(1, &at, &out, &status);
    EXPECT_EQ(out.x, p < 1e-9 ? 0 : -kHalf);
    EXPECT_EQ(word_of(inverse, at, good), TW_SUCCESS);
  }
  // Far out the ellipsoid is a point, and nothing overflows.
  const CoordinateTriple far = {3e75, -4e75, 5e75};
  inverse(1, &far, &out, &status);
  EXPECT_NEAR(out.x, std::atan2(-4, 3), 1e-15);
  EXPECT_NEAR(out.y, kPi / 4, 1e-15);
  EXPECT_NEAR(out.z / 1e75, std::sqrt(50), 1e-14);
  EXPECT_EQ(word_of(inverse, far, good), TW_SUCCESS);
}

TEST(Limits, Molodensky) {
  // At the limit the formula still serves; the next latitude goes by geocentric coordinates.
  const double limit = 1.5533430342749535;
  for (const double sign : {1.0, -1.0}) {
    CoordinateTriple in[2] = {{0.3, sign * limit, 100}, {0.3, sign * after(limit), 100}};
    CoordinateTriple out[2] = {kUntouchedPoint, kUntouchedPoint};
    TWstatus status = 0;
    TWmol_std_f(6378137, 0.0818, -251, -1.4e-5, -87, -98, -121, 2, in, out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NE(out[0].z, out[1].z);
    EXPECT_NEAR(out[0].z, out[1].z, 0.01);
    CoordinateTriple by_xyz = in[1];
    TWllh_to_xyz(6378137, 0.0818, 1, &by_xyz, &by_xyz, &status);
    by_xyz = {by_xyz.x - 87, by_xyz.y - 98, by_xyz.z - 121};
    const double f = 1 - std::sqrt(1 - 0.0818 * 0.0818) - 1.4e-5;
    TWxyz_to_llh(6378137 - 251, std::sqrt(2 * f - f * f), 1, &by_xyz, &by_xyz, &status);
    expect_near(out[1], by_xyz.x, by_xyz.y, 1e-14);
  }
}

TEST(Limits, GaussSphere) {
  const Call forward = [](int32_t n, auto in, auto out, auto s) {
    TWgaussII_f(0.0818, 0, 1.0003, 0.002, n, in, out, s);
  };
  const Call inverse = [](int32_t n, auto in, auto out, auto s) {
    TWgaussII_i(0.0818, 0, 1.0003, 0.002, n, in, out, s);
  };
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  // Beyond its bound a latitude passes through as it is, and the longitude unmultiplied.
  const auto passes = [&](const Call& call, double lat) {
    const CoordinateTriple p = {1, lat, 0};
    call(1, &p, &out, &status);
    EXPECT_EQ(word_of(call, p, {0.2, 0.3, 0}), TW_SUCCESS);
    return out.x == 1 && out.y == lat;
  };
  for (const double sign : {1.0, -1.0}) {
    EXPECT_FALSE(passes(forward, sign * 1.5707963267938965));
    EXPECT_TRUE(passes(forward, sign * after(1.5707963267938965)));
    EXPECT_FALSE(passes(inverse, sign * 1.5707963267947966));
    EXPECT_TRUE(passes(inverse, sign * after(1.5707963267947966)));
  }
}

TEST(Limits, Bonne) {
  double lat1 = 0.7, e2 = 0, c1 = 0, r0 = 0;
  TWstatus status = 0;
  TWbonne_c(0.0818, &lat1, &e2, &c1, &r0, &status);
  const Call forward = [&](int32_t n, auto in, auto out, auto s) {
    TWbonne_f(0, lat1, 0.0818, e2, c1, r0, n, in, out, s);
  };
  const Call scale = [&](int32_t n, auto in, auto out, auto s) {
    TWbonne_s(1, lat1, 0, e2, r0, n, in, out, s);
  };
  const CoordinateTriple good = {0.1, 0.6, 0};
  EXPECT_EQ(word_of(forward, {1, kHalf, 0}, good), TW_SUCCESS);
  EXPECT_EQ(word_of(forward, {1, after(kHalf), 0}, good), TW_I_LATITUDE_LIMITED);
  EXPECT_EQ(word_of(forward, {1, kHalf + 2e-12, 0}, good), TW_BAD_LATITUDE);
  EXPECT_EQ(word_of(scale, {1, kHalf + 0.9e-12, 0}, good), TW_SUCCESS);
  EXPECT_EQ(word_of(scale, {1, kHalf + 1.1e-12, 0}, good), TW_BAD_LATITUDE);
  EXPECT_EQ(word_of(scale, {0.9e-12, 3, 0}, good), TW_SUCCESS);  // on the central meridian
}

}  // namespace
