#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

struct Gnomonic {
  double lon0, lat0, cos_lat0 = kUntouched, sin_lat0 = kUntouched;

  Gnomonic(double lon, double lat) : lon0(lon), lat0(lat) {
    TWstatus status = 0;
    TWgnomon_c(lat, &cos_lat0, &sin_lat0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    // Not all platforms' own functions give the last digit.
    EXPECT_NEAR(cos_lat0, std::cos(lat), 1.2e-16);
    EXPECT_NEAR(sin_lat0, std::sin(lat), 1.2e-16);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWgnomon_f(lon0, lat0, cos_lat0, sin_lat0, static_cast<int32_t>(in.size()), out.data(),
               in.data(), &status);
    return status;
  }
  CoordinateTriple forward(const CoordinateTriple& in) const {
    Points out = untouched(1);
    EXPECT_EQ(forward(Points{in}, out), TW_SUCCESS);
    EXPECT_EQ(out[0].z, kUntouched);
    return out[0];
  }
  CoordinateTriple inverse(const CoordinateTriple& in) const {
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWgnomon_i(lon0, lat0, cos_lat0, sin_lat0, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(out.z, kUntouched);
    return out;
  }
};

TEST(Gnomonic, ParametersAreZero) {
  double a = kUntouched, b = kUntouched, c = kUntouched;
  TWstatus status = 0;
  TWgnomon_param(&a, &b, &c, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(a, 0);
  EXPECT_EQ(b, 0);
  EXPECT_EQ(c, 0);
}

TEST(Gnomonic, AspectsInClosedForm) {
  // 30 degrees from the pole along 60 E of the meridian of origin: rho = tan 30.
  const double rho = std::tan(degrees(30));
  const Gnomonic north(0.2, kPi / 2), south(0.2, -kPi / 2), equator(0.2, 0);
  CoordinateTriple in = {0.2 + degrees(60), degrees(60), 0};
  CoordinateTriple out = north.forward(in);
  expect_near(out, rho * std::sin(degrees(60)), -rho / 2, 1e-15);
  expect_near(north.inverse(out), in.x, in.y, 1e-15);
  in.y = -in.y;
  out = south.forward(in);
  expect_near(out, rho * std::sin(degrees(60)), rho / 2, 1e-15);
  expect_near(south.inverse(out), in.x, in.y, 1e-15);
  out = equator.forward(in);
  expect_near(out, std::tan(degrees(60)), std::tan(degrees(-60)) * 2, 5e-15);
  expect_near(equator.inverse(out), in.x, in.y, 1e-15);
}

TEST(Gnomonic, AspectLimits) {
  // Within 5e-10 of a pole or the equator the formula of that aspect is exactly that of the pole or
  // the equator; beyond it, it is the oblique one.  The last bits are those of the
  // library's own elementary functions.
  const CoordinateTriple in = {0.3, 1.2, 0};
  const double tan_lat = std::tan(1.2);
  EXPECT_DOUBLE_EQ(Gnomonic(0, kPi / 2 - 4.9e-10).forward(in).x, std::sin(0.3) / tan_lat);
  EXPECT_DOUBLE_EQ(Gnomonic(0, kPi / 2 + 4.9e-10).forward(in).x, std::sin(0.3) / tan_lat);
  EXPECT_NE(Gnomonic(0, kPi / 2 - 5.1e-10).forward(in).x, std::sin(0.3) / tan_lat);
  EXPECT_DOUBLE_EQ(Gnomonic(0, 4.9e-10).forward(in).y, tan_lat / std::cos(0.3));
  EXPECT_DOUBLE_EQ(Gnomonic(0, -4.9e-10).forward(in).y, tan_lat / std::cos(0.3));
  EXPECT_NE(Gnomonic(0, 5.1e-10).forward(in).y, tan_lat / std::cos(0.3));
  const CoordinateTriple down = {0.3, -1.2, 0};
  EXPECT_DOUBLE_EQ(Gnomonic(0, -kPi / 2 + 4.9e-10).forward(down).y, std::cos(0.3) / tan_lat);
  EXPECT_NE(Gnomonic(0, -kPi / 2 + 5.1e-10).forward(down).y, std::cos(0.3) / tan_lat);
  // The inverse takes the longitude by the same limits.
  EXPECT_EQ(Gnomonic(0, kPi / 2 - 4.9e-10).inverse({0.1, -0.2, 0}).x, std::atan2(0.1, 0.2));
  EXPECT_NE(Gnomonic(0, kPi / 2 - 5.1e-10).inverse({0.1, -0.2, 0}).x, std::atan2(0.1, 0.2));
  EXPECT_EQ(Gnomonic(0, -kPi / 2 + 4.9e-10).inverse({0.1, 0.2, 0}).x, std::atan2(0.1, 0.2));
  EXPECT_NE(Gnomonic(0, -kPi / 2 + 5.1e-10).inverse({0.1, 0.2, 0}).x, std::atan2(0.1, 0.2));
}

TEST(Gnomonic, StopsAtTheHorizon) {
  const Gnomonic g(0, 0);
  // On the equator the cosine of the distance is that of the longitude.
  const Points in = {{0.5, 0, 0}, {kPi / 2 - 2e-13, 0, 0}, {kPi / 2 - 0.5e-13, 0, 0}, {0.1, 0, 0}};
  Points out = untouched(4);
  EXPECT_EQ(g.forward(in, out), TW_NOT_CONVERGED);
  EXPECT_EQ(out[0].x, std::tan(0.5));
  EXPECT_GT(out[1].x, 4e12);
  expect_untouched(out[2]);
  expect_untouched(out[3]);
  Points behind = untouched(1);
  EXPECT_EQ(g.forward({{2, 0, 0}}, behind), TW_NOT_CONVERGED);
  expect_untouched(behind[0]);
}

TEST(Gnomonic, InverseWraps) {
  // Towards the west of an origin at -3 the longitude passes -pi; one turn is added.
  const Gnomonic g(-3, 0.5);
  const CoordinateTriple out = g.inverse({-1, 0.2, 0});
  EXPECT_GT(out.x, 0);
  const Gnomonic east(3, 0.5);
  EXPECT_LT(east.inverse({1, 0.2, 0}).x, 0);
  // Exactly -pi and pi stay, unlike in most projections.
  const Gnomonic pole(0, kPi / 2);
  EXPECT_EQ(pole.inverse({-0.0, 1, 0}).x, -kPi);
  EXPECT_EQ(pole.inverse({0.0, 1, 0}).x, kPi);
  // The origin is wrapped too, and one turn at most is taken.
  EXPECT_DOUBLE_EQ(Gnomonic(4, 0.3).inverse({0, 0, 0}).x, 4 - 2 * kPi);
  EXPECT_DOUBLE_EQ(Gnomonic(-4, 0.3).inverse({0, 0, 0}).x, 2 * kPi - 4);
  EXPECT_DOUBLE_EQ(Gnomonic(12, 0.3).inverse({0, 0, 0}).x, 12 - 2 * kPi);
  EXPECT_EQ(Gnomonic(4, 0.3).inverse({0, 0, 0}).y, 0.3);
}

TEST(Gnomonic, ScaleIsTheDerivativeAlongAndAcrossTheRay) {
  // Due north of the origin the ray is the meridian: k across it, h along it.
  const Gnomonic g(0.4, 0.3);
  const CoordinateTriple in = {0.4, 0.8, 0};
  const auto expected =
      numeric_scale([&](CoordinateTriple p) { return g.forward(p); }, in.x, in.y, 0);
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWgnomon_s(g.lon0, 99, 2, g.cos_lat0, g.sin_lat0, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_NEAR(out.x, 2 * expected.x, 1e-10);
  EXPECT_NEAR(out.y, 2 * expected.y, 1e-9);
  EXPECT_EQ(out.z, out.x * out.y);
}

TEST(Gnomonic, ScaleBehindTheHorizonIsFilled) {
  const Gnomonic g(0, 0);
  const Points in = {{2, 0, 0}, {degrees(60), 0, 0}, {kPi, 0, 0}};
  Points out = untouched(3);
  TWstatus status = 0;
  TWgnomon_s(0, 0, 3, 1, 0, 3, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
  expect_near(out[0], 3, 3, 9, 0);
  expect_near(out[1], 6, 12, 72, 1e-13);
  expect_near(out[2], 3, 3, 9, 0);
  // A cosine of exactly 0 counts as behind.
  const CoordinateTriple p = {0, 0, 0};
  TWgnomon_s(0, 0, 3, 0, 1, 1, &p, out.data(), &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
  expect_near(out[0], 3, 3, 9, 0);
}

TEST(Gnomonic, RoundTripInPlace) {
  std::mt19937 random(49);
  std::uniform_real_distribution<double> lon(-1.2, 1.2), lat(-0.6, 0.6);
  for (const double lat0 : {0.0, 0.5, -0.3}) {
    const Gnomonic g(0.1, lat0);
    Points in(200);
    for (auto& p : in) p = {0.1 + lon(random) * 0.8, lat0 + lat(random), 5};
    Points out = in;
    TWstatus status = 0;
    TWgnomon_f(g.lon0, lat0, g.cos_lat0, g.sin_lat0, 200, out.data(), out.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWgnomon_i(g.lon0, lat0, g.cos_lat0, g.sin_lat0, 200, out.data(), out.data(), &status);
    for (std::size_t i = 0; i < in.size(); ++i) expect_near(out[i], in[i].x, in[i].y, 5, 4e-15);
  }
}

TEST(Gnomonic, NothingToDoAndNotANumber) {
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1}) {
    TWstatus status = 0;
    TWgnomon_f(0, 0, 1, 0, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWgnomon_i(0, 0, 1, 0, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWgnomon_s(0, 0, 1, 1, 0, count, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_untouched(p);
  }
  const Gnomonic g(0, 0.5);
  Points out = untouched(1);
  EXPECT_EQ(g.forward({{kNaN, 0, 0}}, out), TW_SUCCESS);  // not at or below the limit
  EXPECT_TRUE(std::isnan(out[0].x));
  TWstatus status = 0;
  const CoordinateTriple in = {kNaN, 0, 0};
  TWgnomon_s(0, 0, 3, 1, 0, 1, &in, out.data(), &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);  // not above 0
}

TEST(Gnomonic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  for (const double lat0 : {-90.0, -35.0, 0.0, 52.0, 90.0}) {
    const ProjPeer peer("+proj=gnom +R=1 +lon_0=12 +lat_0=" + std::to_string(lat0));
    ASSERT_TRUE(peer.ok());
    const Gnomonic g(degrees(12), degrees(lat0));
    for (double dlat = -25; dlat < 30; dlat += 11) {
      for (double lon = -40; lon < 60; lon += 13) {
        const double lat = lat0 + dlat;
        if (std::fabs(lat) > 89) continue;
        const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
        const CoordinateTriple expected = peer.forward(in);
        expect_near(g.forward(in), expected.x, expected.y, 3e-14);
      }
    }
  }
#endif
}

}  // namespace
