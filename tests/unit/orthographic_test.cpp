#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

const double kE = Ellipsoid::wgs84().e;

struct Orthographic {
  double e, lon0, lat0, x0 = 0, y0 = 0, z0 = 0;
  double r[9] = {};

  Orthographic(double eccentricity, double lon, double lat)
      : e(eccentricity), lon0(lon), lat0(lat) {
    TWstatus status = 0;
    TWortho_c(e, lon0, lat0, &x0, &y0, &z0, r, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  // The semi-major axis drops out: a not-a-number shows that it is not read.
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWortho_f(kNaN, e, lon0, lat0, x0, y0, z0, r, static_cast<int32_t>(in.size()), in.data(),
              out.data(), &status);
    return status;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWortho_i(kNaN, e, lon0, lat0, x0, y0, z0, r, static_cast<int32_t>(in.size()), in.data(),
              out.data(), &status);
    return status;
  }
  CoordinateTriple forward(const CoordinateTriple& in) const {
    return one_point(in, [&](const Points& i, Points& o) { return forward(i, o); });
  }
  CoordinateTriple inverse(const CoordinateTriple& in) const {
    return one_point(in, [&](const Points& i, Points& o) { return inverse(i, o); });
  }
};

TEST(Orthographic, Constants) {
  const Orthographic p(0.6, degrees(90), degrees(30));
  // N = 1 / sqrt(1 - 0.36 / 4), east = -X, up = (0, cos 30, sin 30).
  const double n = 1 / std::sqrt(1 - 0.09);
  EXPECT_NEAR(p.x0, 0, 1e-16);
  EXPECT_NEAR(p.y0, n * std::cos(degrees(30)), 1e-15);
  EXPECT_NEAR(p.z0, 0.64 * n * 0.5, 1e-15);
  const double c = std::cos(degrees(30));
  const double expected[9] = {-1, 0, 0, 0, -0.5, c, 0, c, 0.5};
  for (int i = 0; i < 9; ++i) EXPECT_NEAR(p.r[i], expected[i], 2e-16) << i;
  EXPECT_EQ(p.r[2], 0.0);
}

TEST(Orthographic, OriginAndItsLimits) {
  const Orthographic p(kE, 0.3, 0.7);
  expect_near(p.forward({0.3, 0.7, 0}), 0, 0, 0);
  expect_near(p.forward({0.3 - 0.9e-12, 0.7 + 0.9e-12, 0}), 0, 0, 0);
  EXPECT_NE(p.forward({0.3 + 1.1e-12, 0.7, 0}).x, 0);
  EXPECT_NE(p.forward({0.3, 0.7 + 1.1e-12, 0}).y, 0);
  CoordinateTriple back = p.inverse({0.9e-9, 0, 0});
  EXPECT_EQ(back.x, 0.3);
  EXPECT_EQ(back.y, 0.7);
  back = p.inverse({2e-9, 0, 0});
  EXPECT_NE(back.x, 0.3);
}

TEST(Orthographic, StopsBeyondTheHorizon) {
  const Orthographic p(0, 0, 0);
  const Points in = {{1, 0, 0}, {kPi / 2, 0, 0}, {std::nextafter(kPi / 2, 2), 0, 0}, {0.5, 0, 0}};
  Points out = untouched(4);
  EXPECT_EQ(p.forward(in, out), TW_I_LATITUDE_LIMITED);
  EXPECT_EQ(out[0].x, std::sin(1));
  EXPECT_EQ(out[1].x, 1);  // the horizon itself passes
  expect_untouched(out[2]);
  expect_untouched(out[3]);
}

TEST(Orthographic, InverseStopsOutsideTheDisc) {
  // The disc is that of the semi-minor axis.
  const double b = std::sqrt(1 - kE * kE);
  const Orthographic p(kE, 0.2, 0.6);
  Points out = untouched(3);
  EXPECT_EQ(p.inverse({{0.5, 0, 0}, {0, b * (1 + 1e-15), 0}, {0.5, 0, 0}}, out),
            TW_I_LATITUDE_LIMITED);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  const Orthographic sphere(0, 0.2, 0.6);
  out = untouched(1);
  EXPECT_EQ(sphere.inverse({{1, 0, 0}}, out), TW_I_LATITUDE_LIMITED);  // exactly 1 is outside
  expect_untouched(out[0]);
}

TEST(Orthographic, RoundTripInPlace) {
  std::mt19937 random(49);
  std::uniform_real_distribution<double> azimuth(-kPi, kPi), radius(0.001, 0.9);
  for (const double e : {0.0, kE, 0.3}) {
    for (const double lat0 : {0.0, 0.7, -1.2}) {
      const Orthographic p(e, 0.2, lat0);
      Points in(200);
      for (auto& q : in) {
        const double az = azimuth(random), r = radius(random);
        q = {r * std::sin(az), r * std::cos(az), 7};
      }
      Points out = in;
      EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
      EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
      // The iteration ends at 1e-9; the latitude of its points is in closed form, which for an
      // eccentricity of 0.3 is not better than 1e-7.
      const double tolerance = e < 0.1 ? 2e-9 : 2e-7;
      for (std::size_t i = 0; i < in.size(); ++i) {
        expect_near(out[i], in[i].x, in[i].y, 7, tolerance);
      }
    }
  }
}

TEST(Orthographic, PassesThatRunOutAreWrittenAndTheWordIsForgotten) {
  // A not-a-number is never still: 51 passes, and the last values are written.
  const Orthographic p(kE, 0.2, 0.6);
  Points out = untouched(2);
  EXPECT_EQ(p.inverse({{0.1, 0.1, 0}, {kNaN, 0, 0}}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_TRUE(std::isnan(out[1].x));
  // A later point that is computed sets the word anew.
  out = untouched(2);
  EXPECT_EQ(p.inverse({{kNaN, 0, 0}, {0.1, 0.1, 0}}, out), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].x));
  EXPECT_NE(out[1].x, kUntouched);
  // One that is the origin does not.
  EXPECT_EQ(p.inverse({{kNaN, 0, 0}, {0, 0, 0}}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_EQ(out[1].x, 0.2);
}

TEST(Orthographic, ScaleIsTheCosineOfTheDistance) {
  const Points in = {{0.3, 0.7, 0}, {0.3 + kPi, kPi / 2 - 0.7, 0}, {0.3, 0.7 - 1, 0}};
  Points out = untouched(3);
  TWstatus status = 0;
  TWortho_s(0.3, 0.7, 17, 3, in.data(), out.data(), &status);  // k0 has no part in it
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 1, 1, 1, 2e-16);
  expect_near(out[1], 1, 0, 0, 2e-16);  // on the horizon
  expect_near(out[2], 1, std::cos(1), std::cos(1), 2e-16);
  // On the meridian of origin h lies along the ray, and k is 1.
  const Orthographic p(0, 0.3, 0.7);
  const auto expected =
      numeric_scale([&](CoordinateTriple q) { return p.forward(q); }, 0.3, -0.3, 0);
  EXPECT_NEAR(out[2].y, expected.y, 1e-11);
  EXPECT_NEAR(1, expected.x, 1e-11);
}

TEST(Orthographic, ScaleBeyondAPoleKeepsThePointBefore) {
  const double past = std::nextafter(kPi / 2, 2);
  const Points in = {{0, past, 0}, {0.5, 0, 0}, {0, -past, 0}, {0.6, 0, 0}};
  Points out = untouched(4);
  TWstatus status = 0;
  TWortho_s(0, 0, 2, 4, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  expect_near(out[0], 1, 0, 0, 0);  // the first starts from zero
  expect_near(out[1], 1, std::cos(0.5), std::cos(0.5), 0);
  expect_near(out[2], 1, std::cos(0.5), std::cos(0.5), 0);
  expect_near(out[3], 1, std::cos(0.6), std::cos(0.6), 0);
}

TEST(Orthographic, ScaleHoldsThePoles) {
  // Held 1e-10 short of the north pole, and 1e-10 past the north pole for the south one.
  const Points in = {{0, kPi / 2, 0}, {0, -kPi / 2, 0}, {0, -kPi / 2 + 1.1e-10, 0}};
  Points out = untouched(3);
  TWstatus status = 0;
  TWortho_s(0, 0.5, 1, 3, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(out[0].y, std::sin(0.5) + 1e-10 * std::cos(0.5), 1e-15);
  EXPECT_NEAR(out[1].y, std::sin(0.5) - 1e-10 * std::cos(0.5), 1e-15);
  EXPECT_NEAR(out[2].y, -std::sin(0.5) + 1.1e-10 * std::cos(0.5), 1e-15);
}

TEST(Orthographic, NothingToDoAndNotANumber) {
  CoordinateTriple p = kUntouchedPoint;
  const Orthographic q(kE, 0, 0.5);
  for (const int32_t count : {0, -1}) {
    TWstatus status = 0;
    TWortho_f(1, kE, 0, 0.5, q.x0, q.y0, q.z0, q.r, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWortho_i(1, kE, 0, 0.5, q.x0, q.y0, q.z0, q.r, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWortho_s(0, 0.5, 1, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(p);
  }
  EXPECT_TRUE(std::isnan(q.forward({kNaN, 0.1, 0}).x));
}

TEST(Orthographic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const auto [a, e] = Ellipsoid::grs80();
  for (const double lat0 : {-90.0, -35.0, 0.0, 52.0, 90.0}) {
    const ProjPeer peer("+proj=ortho +ellps=GRS80 +lon_0=12 +lat_0=" + std::to_string(lat0));
    ASSERT_TRUE(peer.ok());
    const Orthographic p(e, degrees(12), degrees(lat0));
    for (double dlat = -40; dlat < 45; dlat += 11) {
      for (double lon = -40; lon < 60; lon += 13) {
        const double lat = lat0 + dlat;
        if (std::fabs(lat) > 89.9) continue;
        const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
        const CoordinateTriple expected = peer.forward(in);
        const CoordinateTriple out = p.forward(in);
        expect_near(out, expected.x / a, expected.y / a, 2e-15);
        expect_near(p.inverse(out), in.x, in.y, 1e-8);
      }
    }
  }
#endif
}

// The inverse as it is stated: the height over the origin's tangent plane by iteration.
CoordinateTriple stated_inverse(const Orthographic& p, double x, double y) {
  double z = -(x * x + y * y) / 2, held_lon = p.lon0, held_lat = p.lat0;
  CoordinateTriple llh = {};
  for (int pass = 0; pass < 50; ++pass) {
    const CoordinateTriple w = {p.x0 + p.r[0] * x + p.r[3] * y + p.r[6] * z,
                                p.y0 + p.r[1] * x + p.r[4] * y + p.r[7] * z,
                                p.z0 + p.r[2] * x + p.r[5] * y + p.r[8] * z};
    TWstatus status = 0;
    TWxyz_to_llh(1, p.e, 1, &w, &llh, &status);
    const double n = 1 / std::sqrt(1 - std::pow(p.e * std::sin(llh.y), 2));
    const double up = p.r[6] * (n * std::cos(llh.x) * std::cos(llh.y) - p.x0) +
                      p.r[7] * (n * std::sin(llh.x) * std::cos(llh.y) - p.y0) +
                      p.r[8] * ((1 - p.e * p.e) * n * std::sin(llh.y) - p.z0);
    const double still = std::max(std::fabs(llh.x - held_lon), std::fabs(llh.y - held_lat));
    if (pass > 0 && still <= 1e-9) break;
    held_lon = llh.x;
    held_lat = llh.y;
    if (up != z) z += llh.z * llh.z / (up - z);
  }
  return llh;
}

TEST(Orthographic, QuadraticBesideTheStatedIteration) {
  for (const double e : {0.0, 0.01, kE, 0.1}) {
    for (const double lat0 : {-kPi / 2, -0.9, 0.0, 0.4, 1.3}) {
      const Orthographic p(e, 0.3, lat0);
      for (double r = 1e-6; r < 0.98; r += 0.07) {
        for (double azimuth = 0.05; azimuth < 6.3; azimuth += 0.4) {
          const double x = r * std::sin(azimuth), y = r * std::cos(azimuth);
          const CoordinateTriple out = p.inverse({x, y, 0});
          const CoordinateTriple expected = stated_inverse(p, x, y);
          // its tolerance, and what the convergence of the meridians makes of it
          EXPECT_NEAR(out.y, expected.y, 4e-9) << r << " " << azimuth;
          EXPECT_NEAR(std::remainder(out.x - expected.x, 2 * kPi) * std::cos(out.y), 0, 4e-9);
        }
      }
    }
  }
}

TEST(Orthographic, LaterPointClearsTheWordOfTheRim) {
  // On the ellipsoid the disc of radius 1 - f reaches past the rim on one side: the line of sight
  // misses the surface, and the passes are used up.
  const Orthographic p(kE, 0.3, -1.08);
  const double r = std::sqrt(1 - kE * kE) * (1 - 1e-7);
  Points out = untouched(1);
  CoordinateTriple missing = {};
  for (double azimuth = 0; azimuth < 6.3 && missing.x == 0; azimuth += 0.01) {
    const CoordinateTriple in = {r * std::sin(azimuth), r * std::cos(azimuth), 0};
    if (p.inverse({in}, out) == TW_I_LATITUDE_LIMITED) missing = in;
  }
  ASSERT_NE(missing.x, 0);
  const CoordinateTriple plain = {0.1, 0.2, 0}, centre = {0, 0, 0}, outside = {1, 1, 0};
  out = untouched(3);
  EXPECT_EQ(p.inverse({missing, plain}, out), TW_SUCCESS);
  EXPECT_EQ(p.inverse({plain, missing}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_EQ(p.inverse({missing, centre}, out),
            TW_I_LATITUDE_LIMITED);  // the centre is not computed
  EXPECT_EQ(p.inverse({missing, plain, centre}, out), TW_SUCCESS);
  EXPECT_NE(out[2].x, kUntouched);
  out = untouched(3);
  EXPECT_EQ(p.inverse({plain, outside, plain}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  // In place too, where the last point is overwritten before the word is known.
  Points both = {missing, plain};
  EXPECT_EQ(p.inverse(both, both), TW_SUCCESS);
  both = {plain, missing, centre};
  EXPECT_EQ(p.inverse(both, both), TW_I_LATITUDE_LIMITED);
}

}  // namespace
