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

using Number = std::complex<double>;

// The coefficients as Reilly 1973 and the national definition give them.
const Number kA[6] = {{0.7557853228, 0.0},        {0.249204646, 0.003371507},
                      {-0.001541739, 0.04105856}, {-0.10162907, 0.01727609},
                      {-0.26623489, -0.36249218}, {-0.6870983, -1.1651967}};

struct Grid {
  double a, e, lon0, lat0, false_easting, false_northing, k0, y0;

  Grid() {
    const auto international = Ellipsoid::international_1924();
    a = international.a;
    e = international.e;
    TWstatus status = 0;
    TWn_zeal_param(&lon0, &lat0, &false_easting, &false_northing, &k0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWn_zeal_c(e, lat0, &y0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  CoordinateTriple forward(const CoordinateTriple& in) const {
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWn_zeal_f(e, lon0, kNaN, y0, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return out;
  }
};

TEST(NewZealand, Parameters) {
  const Grid g;
  EXPECT_DOUBLE_EQ(g.lon0, degrees(173));
  EXPECT_DOUBLE_EQ(g.lat0, degrees(-41));
  EXPECT_EQ(g.false_easting, 2510000.0);
  EXPECT_EQ(g.false_northing, 6023150.0);
  EXPECT_EQ(g.k0, 1.0);
}

TEST(NewZealand, SeriesOfTheNationalDefinition) {
  // The definition forms the isometric latitude by a series in the difference of latitude, in units
  // of 1e5 seconds; it meets the closed form to some 1e-10 within the country.
  const double series[10] = {0.6399175073, -0.1358797613, 0.063294409, -0.02526853, 0.0117879,
                             -0.0055161,   0.0026906,     -0.001333,   0.00067,     -0.00034};
  const Grid g;
  for (const auto& [lon, lat] : {std::pair{172.739193967, -34.444066991},
                                 {172.723105968, -40.512408980},
                                 {169.172062008, -46.651295012}}) {
    const double d = (lat + 41) * 3600e-5;
    double psi = 0;
    for (int i = 9; i >= 0; --i) psi = (psi + series[i]) * d;
    const Number z(psi, degrees(lon - 173));
    Number w = 0;
    for (int k = 0; k < 6; ++k) w += kA[k] * std::pow(z, k + 1);
    const CoordinateTriple out = g.forward({degrees(lon), degrees(lat), 0});
    EXPECT_NEAR(out.x, w.imag(), 1e-4 / g.a);
    EXPECT_NEAR(out.y, w.real(), 1e-4 / g.a);
    EXPECT_EQ(out.z, kUntouched);
  }
}

TEST(NewZealand, PolynomialAndGradient) {
  double result[2] = {kUntouched, kUntouched};
  TWn_zeal_fpoly(0, 0, result);
  EXPECT_EQ(result[0], 0);
  EXPECT_EQ(result[1], 0);
  TWn_zeal_grad(0, 0, result);
  EXPECT_EQ(result[0], 0.7557853228);
  EXPECT_EQ(result[1], 0.0);
  for (const Number z : {Number(0.1, 0.05), Number(-0.13, -0.09), Number(1, -2)}) {
    Number w = 0, g = 0;
    for (int k = 0; k < 6; ++k) {
      w += kA[k] * std::pow(z, k + 1);
      g += (k + 1.0) * kA[k] * std::pow(z, k);
    }
    TWn_zeal_fpoly(z.real(), z.imag(), result);
    EXPECT_NEAR(result[0], w.real(), 1e-14 * (1 + std::abs(w)));
    EXPECT_NEAR(result[1], w.imag(), 1e-14 * (1 + std::abs(w)));
    TWn_zeal_grad(z.real(), z.imag(), result);
    EXPECT_NEAR(result[0], g.real(), 1e-14 * (1 + std::abs(g)));
    EXPECT_NEAR(result[1], g.imag(), 1e-14 * (1 + std::abs(g)));
  }
}

TEST(NewZealand, RootOfThePolynomial) {
  for (const Number z : {Number(0.1, 0.05), Number(-0.13, -0.09), Number(0, 0), Number(1e-9, 0)}) {
    double w[2], back[2] = {kUntouched, kUntouched};
    TWn_zeal_fpoly(z.real(), z.imag(), w);
    TWstatus status = 0;
    TWn_zeal_ipoly(w[0], w[1], back, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(back[0], z.real(), 1e-15);
    EXPECT_NEAR(back[1], z.imag(), 1e-15);
  }
}

TEST(NewZealand, RootThatIsNotReached) {
  // A not-a-number never meets the tolerance; neither does a value so large that its root's last
  // digit is worth more than 1e-14.
  double z[2] = {kUntouched, kUntouched};
  TWstatus status = 0;
  TWn_zeal_ipoly(kNaN, 0, z, &status);
  EXPECT_EQ(status, TW_NOT_CONVERGED);
  EXPECT_TRUE(std::isnan(z[0]));
  z[0] = z[1] = kUntouched;
  TWn_zeal_ipoly(1e30, 1e30, z, &status);
  EXPECT_EQ(status, TW_NOT_CONVERGED);
  EXPECT_NE(z[0], kUntouched);  // delivered as it stands
  EXPECT_NE(z[1], kUntouched);
}

TEST(NewZealand, InverseDoesNotTellOfARootNotReached) {
  const Grid g;
  const Points in = {{kNaN, 0, 1}, {0, 0, 1}};
  Points out = untouched(2);
  TWstatus status = 0;
  TWn_zeal_i(g.e, g.lon0, 7, g.y0, 2, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_TRUE(std::isnan(out[0].x));
  expect_near(out[1], g.lon0, g.lat0, 1e-14);
  EXPECT_EQ(out[1].z, kUntouched);
}

TEST(NewZealand, OriginAtThePolePasses) {
  const double past = std::nextafter(kPi / 2, 2);
  for (const double lat0 : {past, -past}) {
    double y0 = kUntouched;
    TWstatus status = 0;
    TWn_zeal_c(0.08, lat0, &y0, &status);
    EXPECT_EQ(status, TW_BAD_LATITUDE);
    EXPECT_EQ(y0, kUntouched);
  }
  double y0 = kUntouched;
  TWstatus status = 0;
  TWn_zeal_c(0.08, kPi / 2, &y0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_GT(y0, 30);
}

TEST(NewZealand, SkippedPointIsReadAllTheSame) {
  const Grid g;
  const Points in = {{0.1, 2.0, 0}, {degrees(174), degrees(-40), 0}};
  Points out = {{0.05, 0.1, 9}, kUntouchedPoint};
  TWstatus status = 0;
  TWn_zeal_f(g.e, g.lon0, 0, g.y0, 2, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  double w[2];
  TWn_zeal_fpoly(0.1, 0.05, w);  // what the output held, latitude part first
  EXPECT_EQ(out[0].x, w[1]);
  EXPECT_EQ(out[0].y, w[0]);
  EXPECT_EQ(out[0].z, 9);
  const CoordinateTriple good = g.forward(in[1]);
  EXPECT_EQ(out[1].x, good.x);
  EXPECT_EQ(out[1].y, good.y);
}

TEST(NewZealand, ScaleIsTheDerivative) {
  const Grid g;
  for (const auto& [lon, lat] : {std::pair{174.0, -37.0}, {168.5, -46.2}, {173.0, -41.0}}) {
    const auto expected = numeric_scale([&](CoordinateTriple p) { return g.forward(p); },
                                        degrees(lon), degrees(lat), g.e);
    const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWn_zeal_s(g.e, g.lon0, 0, g.y0, 17, 1, &in, &out, &status);  // k0 has no part in it
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(out.x, expected.x, 1e-10);
    EXPECT_NEAR(out.x, expected.y, 1e-10);
    EXPECT_EQ(out.y, out.x);
    EXPECT_EQ(out.z, out.x * out.x);
  }
}

TEST(NewZealand, ScaleBeyondAndAtThePoles) {
  const Grid g;
  const double past = std::nextafter(kPi / 2, 2);
  const auto scale = [&](double lat, TWstatus expected) {
    const CoordinateTriple in = {g.lon0 + 0.01, lat, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWn_zeal_s(g.e, g.lon0, 0, g.y0, 3, 1, &in, &out, &status);
    EXPECT_EQ(status, expected);
    EXPECT_EQ(out.y, out.x);
    EXPECT_EQ(out.z, out.x * out.x);
    return out.x;
  };
  EXPECT_EQ(scale(past, TW_BAD_LATITUDE), 3);
  EXPECT_EQ(scale(-past, TW_BAD_LATITUDE), 3);
  const double w = std::sqrt(1 - g.e * g.e) * 1e10;
  double gradient[2];
  // The north pole is held 1e-10 short of it: the ordinate there is ln(2e10) - e atanh(e) - y0.
  TWn_zeal_grad(std::log(2e10) - g.e * std::atanh(g.e) - g.y0, 0.01, gradient);
  EXPECT_NEAR(scale(kPi / 2, TW_SUCCESS) / (w * std::hypot(gradient[0], gradient[1])), 1, 3e-6);
  // The south pole is held 1e-10 past the north pole, where Mercator refuses: its word comes
  // through, and the latitude itself stands for the ordinate.
  TWn_zeal_grad(kPi / 2 + 1e-10, 0.01, gradient);
  EXPECT_NEAR(scale(-kPi / 2, TW_BAD_LATITUDE) / (w * std::hypot(gradient[0], gradient[1])), -1,
              3e-6);
}

TEST(NewZealand, RoundTripInPlace) {
  const Grid g;
  std::mt19937 random(8);
  std::uniform_real_distribution<double> lon(degrees(166), degrees(179)),
      lat(degrees(-48), degrees(-34));
  Points in(300);
  for (auto& p : in) p = {lon(random), lat(random), 6};
  Points out = in;
  TWstatus status = 0;
  TWn_zeal_f(g.e, g.lon0, 0, g.y0, 300, out.data(), out.data(), &status);
  TWn_zeal_i(g.e, g.lon0, 0, g.y0, 300, out.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) expect_near(out[i], in[i].x, in[i].y, 6, 1e-14);
}

TEST(NewZealand, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=nzmg +x_0=2510000 +y_0=6023150 +ellps=intl");
  ASSERT_TRUE(peer.ok());
  const Grid g;
  for (double lat = -48; lat < -33; lat += 2.5) {
    for (double lon = 166; lon < 179.5; lon += 2.7) {
      const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
      const CoordinateTriple expected = peer.forward(in);
      const CoordinateTriple out = g.forward(in);
      // The peer forms the isometric latitude by the definition's series.
      EXPECT_NEAR(out.x * g.a + g.false_easting, expected.x, 5e-4);
      EXPECT_NEAR(out.y * g.a + g.false_northing, expected.y, 5e-4);
    }
  }
#endif
}

}  // namespace
