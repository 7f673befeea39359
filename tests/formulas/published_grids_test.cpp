// Grids of single countries: worked examples, and the formulas as they are printed in long double.

#include <gtest/gtest.h>

#include <cmath>
#include <complex>

#include "formulas/colombia_urban.hpp"
#include "formulas/krovak.hpp"
#include "formulas/oblique_mercator.hpp"
#include "formulas/oblique_stereographic.hpp"

namespace tidewater::detail {
namespace {

using Real = long double;

double degrees(double d, double m = 0, double s = 0) {
  return (d + m / 60 + s / 3600) * kRadiansPerDegree;
}
double first_eccentricity(double inverse_flattening) {
  const double f = 1 / inverse_flattening;
  return std::sqrt(f * (2 - f));
}

// --- Krovak ------------------------------------------------------------------------------------

// S-JTSK, from Greenwich.
Krovak czech(bool modified) {
  return {6377397.155,     first_eccentricity(299.1528128),
          degrees(49, 30), degrees(30, 17, 17.30311),
          degrees(78, 30), 0.9999,
          modified};
}
const double kCzechMeridian = degrees(24, 50);

// IOGP Publication 373-7-2 (2022), methods 9819 and 1042: 50 12 32.442 N, 16 50 59.179 E.
TEST(KrovakFormulas, PublishedExamples) {
  const double lon = degrees(16, 50, 59.179) - kCzechMeridian;
  const double lat = degrees(50, 12, 32.442);
  const auto plain = czech(false).forward(lon, lat);
  EXPECT_NEAR(plain.southing, 1050538.63, 0.02);
  EXPECT_NEAR(plain.westing, 568991.00, 0.02);
  // S-JTSK/05 has false origins of 5,000,000 m.
  const auto modified = czech(true).forward(lon, lat);
  EXPECT_NEAR(modified.southing + 5000000, 6050538.71, 0.02);
  EXPECT_NEAR(modified.westing + 5000000, 5568990.91, 0.02);
}

TEST(KrovakFormulas, ThereAndBack) {
  for (const bool modified : {false, true}) {
    const Krovak map = czech(modified);
    for (double lat = 47.5; lat < 51.5; lat += 0.7) {
      for (double lon = 12; lon < 23; lon += 1.3) {
        const auto grid = map.forward(degrees(lon) - kCzechMeridian, degrees(lat));
        const auto back = map.inverse(grid);
        EXPECT_NEAR(back.lon, degrees(lon) - kCzechMeridian, 4e-15);
        EXPECT_NEAR(back.lat, degrees(lat), 4e-15);
      }
    }
  }
}

// The guidance note's ten constants are those of a polynomial of complex numbers, but for its last
// two, which belong to the conjugate.
TEST(KrovakFormulas, CorrectionIsThatOfThePublishedPolynomials) {
  using Complex = std::complex<Real>;
  for (const double aside : {-200000.0, -30000.0, 0.0, 1.0, 150000.0}) {
    for (const double down : {-100000.0, 0.0, 70000.0}) {
      const Complex z(down, aside);
      const Complex sum = Complex(2.946529277e-02L, 2.515965696e-02L) +
                          Complex(1.193845912e-07L, -4.668270147e-07L) * z +
                          Complex(9.233980362e-12L, 1.523735715e-12L) * z * z +
                          Complex(1.696780024e-18L, 4.408314235e-18L) * z * z * z +
                          Complex(-3.689471323e-24L, -8.331083518e-24L) * std::conj(z * z * z * z);
      const auto got = Krovak::correction({1089000 + down, 654000 + aside});
      EXPECT_NEAR(got.southing, static_cast<double>(sum.real()), 1e-15);
      EXPECT_NEAR(got.westing, static_cast<double>(sum.imag()), 1e-15);
    }
  }
}

// --- Colombia Urban ----------------------------------------------------------------------------

// IOGP Publication 373-7-2, method 1052: Bogota, on the ellipsoid GRS 1980, at 2550 m.
TEST(ColombiaUrbanFormulas, PublishedExampleAndBack) {
  const double a = 6378137;
  const double e = first_eccentricity(298.257222101);
  const double lat0 = degrees(4, 40, 49.75);
  const double lon0 = -degrees(74, 8, 47.73);
  const ColombiaUrban map(a, e * e, lat0, 2550);
  double x, y;
  map.forward(degrees(-74, -15) - lon0, degrees(4, 48), &x, &y);
  EXPECT_NEAR(x + 92334.879, 80859.033, 6e-4);
  EXPECT_NEAR(y + 109320.965, 122543.174, 6e-4);
  for (double north = -0.5; north <= 0.5; north += 0.25) {
    for (double east = -0.5; east <= 0.5; east += 0.25) {
      double lon, lat;
      map.forward(degrees(east), lat0 + degrees(north), &x, &y);
      map.inverse(x, y, &lon, &lat);
      EXPECT_NEAR(lon, degrees(east), 2e-16);
      EXPECT_NEAR(lat, lat0 + degrees(north), 3e-16);
    }
  }
}

// Along the meridian of the origin the ordinate is the difference of latitudes times the radius
// there, at a height above the ellipsoid that both radii share.
TEST(ColombiaUrbanFormulas, OfTheSphere) {
  const ColombiaUrban map(1, 0, 0.6, 0.01);
  double x, y;
  map.forward(0.003, 0.6, &x, &y);
  EXPECT_NEAR(x, 1.01 * std::cos(0.6) * 0.003, 1e-17);
  EXPECT_NEAR(y, 1.01 * std::tan(0.6) / 2 * std::pow(std::cos(0.6) * 0.003, 2), 1e-17);
  map.forward(0, 0.607, &x, &y);
  EXPECT_EQ(x, 0);
  EXPECT_NEAR(y, 1.01 * 0.007, 1e-16);
}

// --- Oblique Mercator --------------------------------------------------------------------------

// IOGP Publication 373-7-2, method 9815: Timbalai 1948 / R.S.O. Borneo, by the centre.
TEST(ObliqueMercatorFormulas, PublishedExample) {
  const double a = 6377298.556;
  const ObliqueMercator map(first_eccentricity(300.8017), degrees(4), degrees(53, 18, 56.9537));
  const double scale = a * 0.99984;
  const double turn = degrees(53, 7, 48.3685);
  double u, v;
  ASSERT_TRUE(
      map.forward(degrees(115, 48, 19.8196) - degrees(115), degrees(5, 23, 14.1129), &u, &v));
  u -= map.centre_u;
  EXPECT_NEAR(590476.87 + scale * (v * std::cos(turn) + u * std::sin(turn)), 679245.73, 0.01);
  EXPECT_NEAR(442857.65 + scale * (u * std::cos(turn) - v * std::sin(turn)), 596562.78, 0.01);
}

// The formulas of the guidance note as they are printed, with the function of the hyperbolae by
// powers, which lose digits near the equator: hence long double.
struct PrintedObliqueMercator {
  Real e, A, B, t0, gamma0, lon0, F;

  PrintedObliqueMercator(Real e_, Real lat, Real azimuth) : e(e_) {
    const Real s = std::sin(lat), c = std::cos(lat);
    B = std::sqrt(1 + e * e * c * c * c * c / (1 - e * e));
    A = B * std::sqrt(1 - e * e) / (1 - e * e * s * s);
    t0 = co_tangent(lat);
    const Real D = B * std::sqrt(1 - e * e) / (c * std::sqrt(1 - e * e * s * s));
    F = D + std::copysign(std::sqrt(std::fmax(D * D - 1, Real{0})), lat);
    const Real H = F * std::pow(t0, B);
    const Real G = (F - 1 / F) / 2;
    gamma0 = std::asin(std::sin(azimuth) / D);
    lon0 = -std::asin(G * std::tan(gamma0)) / B;
    F = H;
  }
  Real co_tangent(Real lat) const {
    const Real s = e * std::sin(lat);
    return std::tan(static_cast<Real>(0.78539816339744830961566L) - lat / 2) /
           std::pow((1 - s) / (1 + s), e / 2);
  }
  void forward(Real lon, Real lat, Real* u, Real* v) const {
    const Real Q = F / std::pow(co_tangent(lat), B);
    const Real S = (Q - 1 / Q) / 2, T = (Q + 1 / Q) / 2;
    const Real V = std::sin(B * (lon - lon0));
    const Real U = (-V * std::cos(gamma0) + S * std::sin(gamma0)) / T;
    *v = A * std::log((1 - U) / (1 + U)) / (2 * B);
    *u =
        A / B * std::atan2(S * std::cos(gamma0) + V * std::sin(gamma0), std::cos(B * (lon - lon0)));
  }
};

TEST(ObliqueMercatorFormulas, AreThoseOfTheGuidanceNote) {
  const double e = 0.0818191908426215;
  for (const double centre : {-45.0, 4.0, 57.0}) {
    for (const double azimuth : {-53.0, 19.0, 53.3, 88.0}) {
      const ObliqueMercator map(e, degrees(centre), degrees(azimuth));
      const PrintedObliqueMercator printed(e, degrees(centre), degrees(azimuth));
      EXPECT_NEAR(map.crossing, static_cast<double>(printed.lon0), 5e-15);
      double u, v;
      map.forward(0, degrees(centre), &u, &v);
      EXPECT_NEAR(u, map.centre_u, 1e-15);
      EXPECT_NEAR(v, 0, 1e-15);
      for (double lat = -75; lat < 80; lat += 15) {
        for (double lon = -60; lon <= 60; lon += 20) {
          Real expected_u, expected_v;
          printed.forward(degrees(lon), degrees(lat), &expected_u, &expected_v);
          ASSERT_TRUE(map.forward(degrees(lon), degrees(lat), &u, &v));
          EXPECT_NEAR(u, static_cast<double>(expected_u), 1e-14) << lat << " " << lon;
          EXPECT_NEAR(v, static_cast<double>(expected_v), 1e-13) << lat << " " << lon;
          double back_lon, back_lat;
          map.inverse(u, v, &back_lon, &back_lat);
          EXPECT_NEAR(back_lat, degrees(lat), 4e-14);
          EXPECT_NEAR(std::remainder(back_lon - degrees(lon), 2 * kPi), 0, 4e-14);
        }
      }
    }
  }
}

// A line due east or west; the poles of the line and of the earth.
TEST(ObliqueMercatorFormulas, RightAnglesAndPoles) {
  const double e = 0.08;
  const ObliqueMercator east(e, degrees(47), kHalfPi);
  EXPECT_EQ(east.crossing, -kHalfPi / east.B);
  double u, v, lon, lat;
  EXPECT_TRUE(east.forward(0, degrees(47), &u, &v));
  EXPECT_NEAR(v, 0, 1e-16);
  for (const double sign : {1.0, -1.0}) {
    const ObliqueMercator map(e, degrees(40), degrees(sign * 30));
    for (const double pole : {kHalfPi, -kHalfPi}) {
      // From just short of the pole, where u and v change by little.
      double near_u, near_v;
      EXPECT_TRUE(map.forward(0.7, pole, &u, &v));
      EXPECT_TRUE(map.forward(0.7, pole * (1 - 1e-9), &near_u, &near_v));
      EXPECT_NEAR(u, near_u, 1e-8);
      EXPECT_NEAR(v, near_v, 1e-8);
      map.inverse(u, v, &lon, &lat);
      EXPECT_NEAR(lat, pole, 1e-15);
      // A millimetre from the pole, which the map shows.
      EXPECT_TRUE(map.forward(0.7, pole * (1 - 1e-10), &near_u, &near_v));
      EXPECT_GT(std::hypot(near_u - u, near_v - v), 1e-10);
      map.inverse(near_u, near_v, &lon, &lat);
      EXPECT_NEAR(lat, pole * (1 - 1e-10), 1e-15);
      EXPECT_FALSE(map.forward(0.7, pole * (1 + 1e-15), &u, &v));
    }
  }
  // The map of a line along a meridian is the transverse one: its poles lie on the equator.
  const ObliqueMercator along(0, 0, 0);
  EXPECT_FALSE(along.forward(kHalfPi, 0, &u, &v));
  EXPECT_FALSE(along.forward(-kHalfPi, 0, &u, &v));
  EXPECT_TRUE(along.forward(kHalfPi - 1e-6, 0, &u, &v));
  EXPECT_NEAR(v, std::atanh(std::sin(kHalfPi - 1e-6)), 1e-9);
  // That of the equator has the earth's: so far out the latitude is the pole's.
  const ObliqueMercator equator(0, 0, kHalfPi);
  for (const double pole : {kHalfPi, -kHalfPi}) {
    EXPECT_FALSE(equator.forward(0.3, pole, &u, &v));
    equator.inverse(0, pole > 0 ? -50 : 50, &lon, &lat);
    EXPECT_EQ(lat, pole);
  }
}

// --- Stereographic about a point ---------------------------------------------------------------

// Snyder (1987), pp. 313-315: Clarke 1866, centre 40 N 100 W, scale 0.9999; 30 N 90 W.
TEST(StereographicAboutPointFormulas, SnydersExample) {
  const StereographicAboutPoint map(std::sqrt(0.00676866), degrees(40));
  const auto at = map.forward(degrees(10), degrees(30));
  const double scale = 6378206.4 * 0.9999;
  EXPECT_NEAR(scale * at.x, 971630.8, 0.06);
  EXPECT_NEAR(scale * at.y, -1063049.3, 0.06);
}

// Snyder eq. 3-1, 14-15 and 21-24 to 21-27 as they are printed, in long double.
TEST(StereographicAboutPointFormulas, AreSnydersAndComeBack) {
  const Real e = 0.0818191908426215L;
  const Real quarter = 0.78539816339744830961566L;
  const auto conformal = [&](Real lat) {
    const Real s = e * std::sin(lat);
    return 2 * std::atan(std::tan(quarter + lat / 2) * std::pow((1 - s) / (1 + s), e / 2)) -
           2 * quarter;
  };
  for (const double centre : {-60.0, 0.0, 10.0, 52.0}) {
    const StereographicAboutPoint map(static_cast<double>(e), degrees(centre));
    const Real chi1 = conformal(degrees(centre));
    const Real s1 = std::sin(static_cast<Real>(degrees(centre)));
    const Real m1 = std::cos(static_cast<Real>(degrees(centre))) / std::sqrt(1 - e * e * s1 * s1);
    for (double lat = -80; lat <= 80; lat += 20) {
      for (double lon = -150; lon <= 150; lon += 50) {
        const Real chi = conformal(degrees(lat));
        const Real dl = degrees(lon);
        const Real A = 2 * m1 /
                       (std::cos(chi1) * (1 + std::sin(chi1) * std::sin(chi) +
                                          std::cos(chi1) * std::cos(chi) * std::cos(dl)));
        const auto at = map.forward(degrees(lon), degrees(lat));
        ASSERT_TRUE(at.plain);
        const double x = static_cast<double>(A * std::cos(chi) * std::sin(dl));
        const double y = static_cast<double>(
            A * (std::cos(chi1) * std::sin(chi) - std::sin(chi1) * std::cos(chi) * std::cos(dl)));
        const double size = 1 + std::hypot(x, y);
        EXPECT_NEAR(at.x, x, 4e-15 * size * size) << centre << " " << lat << " " << lon;
        EXPECT_NEAR(at.y, y, 4e-15 * size * size) << centre << " " << lat << " " << lon;
        const auto back = map.inverse(at.x, at.y);
        EXPECT_TRUE(back.plain);
        EXPECT_NEAR(back.y, degrees(lat), 4e-15);
        EXPECT_NEAR(back.x, degrees(lon), 8e-15);
      }
    }
  }
}

TEST(StereographicAboutPointFormulas, PolesTheAntipodeAndWhatIsNoPlace) {
  const StereographicAboutPoint map(0.08, degrees(30));
  const auto pole = map.forward(1.2, kHalfPi);
  EXPECT_TRUE(pole.plain);
  EXPECT_NEAR(pole.x, 0, 1e-15);
  EXPECT_NEAR(map.inverse(pole.x, pole.y).y, kHalfPi, 1e-15);
  EXPECT_FALSE(map.forward(kPi, -degrees(30)).plain);  // the antipode
  EXPECT_TRUE(map.forward(kPi, -degrees(30) + 1e-6).plain);
  EXPECT_FALSE(map.forward(0.0, std::nextafter(kHalfPi, 2)).plain);
  EXPECT_FALSE(map.forward(0.0, std::nan("")).plain);
  EXPECT_FALSE(map.inverse(1e8, 1.0).plain);
  EXPECT_TRUE(map.inverse(1e6, 1.0).plain);
  EXPECT_FALSE(map.inverse(std::nan(""), 0.0).plain);
}

}  // namespace
}  // namespace tidewater::detail
