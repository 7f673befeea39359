#include <gtest/gtest.h>

#include <random>

#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/foundation.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

struct Sheet {
  double e, lon0, lat1;
  double r1 = kUntouched, r2 = kUntouched, c = kUntouched, p = kUntouched, q = kUntouched,
         s = kUntouched, t = kUntouched;
  TWstatus status = 0;

  Sheet(double e_, double lon0_, double lat1_) : e(e_), lon0(lon0_), lat1(lat1_) {
    TWIMWmodPoly_c(e, kNaN, lat1, &r1, &r2, &c, &p, &q, &s, &t, &status);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWIMWmodPoly_f(e, lon0, lat1, r1, r2, c, p, q, s, t, static_cast<int32_t>(in.size()), in.data(),
                   out.data(), &word);
    return word;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWIMWmodPoly_i(e, lon0, lat1, r1, r2, c, p, q, s, t, static_cast<int32_t>(in.size()), in.data(),
                   out.data(), &word);
    return word;
  }
};

const double kE = Ellipsoid::clarke_1866().e;

double arc_between(double e, double lat1, double lat2) {
  double m1 = 0, m2 = 0;
  TWstatus status = 0;
  TWmerid_dist_f(1, e, lat1, &m1, &status);
  TWmerid_dist_f(1, e, lat2, &m2, &status);
  return m2 - m1;
}

TEST(ImwPolyconic, SheetBounds) {
  struct Case {
    double lat, half;
  };
  const double sixty = 1.0471975511965976, seventy_six = 1.3264502315156903;
  for (const auto& [lat, half] : {Case{0.2, 2},
                                  {-0.2, 2},
                                  {std::nextafter(sixty, 0), 2},
                                  {sixty, 4},
                                  {-sixty, 4},
                                  {std::nextafter(seventy_six, 0), 4},
                                  {seventy_six, 8},
                                  {-seventy_six, 8}}) {
    double lon_w = 0, lon_e = 0, lat1 = 0, lat2 = 0;
    TWstatus status = 0;
    TWIMWmodP_stp(0.3, lat, &lon_w, &lon_e, &lat1, &lat2, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(lon_w, 0.3 - degrees(half), 1e-16);
    EXPECT_NEAR(lon_e, 0.3 + degrees(half), 1e-16);
    EXPECT_EQ(lat1, lat);
    EXPECT_NEAR(lat2, lat + degrees(4), 1e-16);
  }
}

TEST(ImwPolyconic, SheetsThatDoNotFit) {
  const double most = kPi / 2 - 2 * kPi / 180 * 2;
  struct Case {
    double lat;
    bool fits;
  };
  for (const auto& [lat, fits] : {Case{most, true},
                                  {std::nextafter(most, 2), false},
                                  {-kPi / 2, true},
                                  {std::nextafter(-kPi / 2, -2), false}}) {
    double a = kUntouched, b = kUntouched, c = kUntouched, d = kUntouched;
    TWstatus status = 0;
    TWIMWmodP_stp(0.3, lat, &a, &b, &c, &d, &status);
    EXPECT_EQ(status, fits ? TW_SUCCESS : TW_BAD_LATITUDE);
    EXPECT_EQ(a == kUntouched, !fits);
    EXPECT_EQ(d == kUntouched, !fits);
    const Sheet sheet(kE, 0, lat);
    EXPECT_EQ(sheet.status, fits ? TW_SUCCESS : TW_BAD_LATITUDE);
    EXPECT_EQ(sheet.r1 == kUntouched, !fits);
    EXPECT_EQ(sheet.t == kUntouched, !fits);
  }
  EXPECT_EQ(Sheet(1.5, 0, 0.5).status, TW_BAD_ECCENTRICITY);  // of the meridian arc
}

TEST(ImwPolyconic, IsNearlyThePlainPolyconic) {
  // The modified projection departs from the polyconic by some tens of metres on a sheet.
  const auto [a, e] = Ellipsoid::clarke_1866();
  const Sheet sheet(e, degrees(-75), degrees(36));
  ASSERT_EQ(sheet.status, TW_SUCCESS);
  Points p = {{degrees(-76), degrees(39), 0}};
  EXPECT_EQ(sheet.forward(p, p), TW_SUCCESS);
  const double nu = 1 / std::sqrt(1 - e * e * std::sin(degrees(39)) * std::sin(degrees(39)));
  const double cot = 1 / std::tan(degrees(39));
  const double angle = degrees(-1) * std::sin(degrees(39));
  expect_near(p[0], nu * cot * std::sin(angle),
              arc_between(e, degrees(36), degrees(39)) + nu * cot * (1 - std::cos(angle)), 300 / a);
}

TEST(ImwPolyconic, AWholeTurnAsideIsTheSamePlace) {
  // Beyond half a turn a point goes a road of its own, to the same image.
  for (const double lat1 : {degrees(36), 0.0, degrees(-4), degrees(-40)}) {
    const Sheet sheet(kE, 0.1, lat1);
    for (double north = 0; north < 4.1; north += 0.5) {
      for (const double east : {-0.04, 0.0, 0.03}) {
        Points here = {{0.1 + east, lat1 + degrees(north), 0}};
        // up to a whole turn from the central meridian
        const double turn = east <= 0 ? 2 * kPi : -2 * kPi;
        Points aside = {{0.1 + east + turn, here[0].y, 0}};
        EXPECT_EQ(sheet.forward(here, here), TW_SUCCESS);
        EXPECT_EQ(sheet.forward(aside, aside), TW_SUCCESS);
        // What rounding leaves of radii of up to 60.
        expect_near(aside[0], here[0].x, here[0].y, 5e-14);
      }
    }
  }
}

TEST(ImwPolyconic, EdgesAreTrueArcs) {
  // The bounding parallels are polyconic arcs, true to scale; the meridians 2 degrees out are too.
  for (const double south : {degrees(36), degrees(-40), degrees(64)}) {
    const Sheet sheet(kE, 0.1, south);
    const double north = south + degrees(4);
    const double dl = south > 1 ? degrees(4) : degrees(2);
    for (const double lat : {south, north}) {
      const double nu = 1 / std::sqrt(1 - kE * kE * std::sin(lat) * std::sin(lat));
      const double radius = nu / std::tan(lat);
      for (const double d : {-dl, -dl / 2, dl / 3, dl}) {
        Points p = {{0.1 + d, lat, 0}};
        ASSERT_EQ(sheet.forward(p, p), TW_SUCCESS);
        EXPECT_NEAR(p[0].x, radius * std::sin(d * std::sin(lat)), 1e-12);
        const double base = lat == south ? 0 : sheet.c;
        EXPECT_NEAR(p[0].y, base + radius * (1 - std::cos(d * std::sin(lat))), 1e-12);
      }
    }
    for (const double side : {-dl, dl}) {
      Points ends = {{0.1 + side, south, 0}, {0.1 + side, north, 0}, {0.1 + side, south + 0.03, 0}};
      ASSERT_EQ(sheet.forward(ends, ends), TW_SUCCESS);
      EXPECT_NEAR(std::hypot(ends[1].x - ends[0].x, ends[1].y - ends[0].y),
                  arc_between(kE, south, north), 1e-12);
      EXPECT_NEAR(std::hypot(ends[2].x - ends[0].x, ends[2].y - ends[0].y),
                  arc_between(kE, south, south + 0.03), 1e-10);
    }
  }
}

TEST(ImwPolyconic, SheetAtTheEquator) {
  // From the equator, and to it: the equator is a straight line.
  for (const double south : {0.0, -2 * kPi / 180 * 2}) {
    const Sheet sheet(kE, 0, south);
    ASSERT_EQ(sheet.status, TW_SUCCESS);
    EXPECT_EQ(south == 0 ? sheet.r1 : sheet.r2, 0);
    Points p = {{0.03, 0, 0}, {0.03, 1e-14, 0}, {-0.02, 0.5e-13, 0}};
    EXPECT_EQ(sheet.forward(p, p), TW_SUCCESS);
    for (std::size_t i = 0; i < 3; ++i) {
      EXPECT_NEAR(p[i].x, i == 2 ? -0.02 : 0.03, 1e-16);
      EXPECT_NEAR(p[i].y, south == 0 ? 0 : sheet.c, 1e-13);
    }
    Points q = {{0.02, south + 0.03, 4}};
    EXPECT_EQ(sheet.forward(q, q), TW_SUCCESS);
    EXPECT_EQ(sheet.inverse(q, q), TW_SUCCESS);
    expect_near(q[0], 0.02, south + 0.03, 4, 1e-12);
  }
}

TEST(ImwPolyconic, RoundTrip) {
  std::mt19937 random(6);
  std::uniform_real_distribution<double> unit(-1, 1);
  for (const double south : {degrees(36), degrees(-40), degrees(64), degrees(80), degrees(-84)}) {
    const Sheet sheet(kE, 0.4, south);
    const double dl = std::fabs(south) > 1.3 ? 8 : std::fabs(south) > 1 ? 4 : 2;
    Points in(100);
    for (auto& p : in) {
      p = {0.4 + degrees(dl) * unit(random), south + degrees(2) * (1 + unit(random)), 0};
    }
    Points out = in;
    EXPECT_EQ(sheet.forward(in, out), TW_SUCCESS);
    EXPECT_EQ(sheet.inverse(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < in.size(); ++i) expect_near(out[i], in[i].x, in[i].y, 2e-12);
  }
}

TEST(ImwPolyconic, ForwardFailures) {
  const Sheet sheet(kE, 0, degrees(36));
  const CoordinateTriple good = {0.01, degrees(37), 0};
  struct Case {
    CoordinateTriple bad;
    TWstatus word;
  };
  for (const auto& [bad, word] :
       {Case{{0.01, 1.571, 0}, TW_BAD_LATITUDE},
        {{0.01, -1.571, 0}, TW_BAD_LATITUDE},
        {{0.01, 1.5707963277948966 + 1e-12, 0}, TW_BAD_LATITUDE},
        {{6.3, degrees(37), 0}, TW_BAD_LONGITUDE},
        // at the pole the parallel's radius is 0 and its centre far from the meridian
        {{0.01, kPi / 2, 0}, TW_RANGE_ERROR}}) {
    Points out = untouched(3);
    EXPECT_EQ(sheet.forward({good, bad, good}, out), word);
    EXPECT_NE(out[0].x, kUntouched);
    EXPECT_EQ(out[0].z, kUntouched);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
  }
  // An ellipsoid that the arc refuses.
  Points out = untouched(1);
  TWstatus status = 0;
  TWIMWmodPoly_f(1.5, 0, 0.6, 1, 1, 0.07, 0, 1, 0.03, 0, 1, &good, out.data(), &status);
  EXPECT_EQ(status, TW_BAD_ECCENTRICITY);
  expect_untouched(out[0]);
}

TEST(ImwPolyconic, JustBeyondAPole) {
  // A latitude within 1e-9 beyond the pole is held there.  With constants under which the pole
  // itself has an answer (t = s = 0 puts its meridian on the axis) the point is written.
  const double lat1 = kPi / 2 - 0.08;
  for (const double beyond : {1e-12, 9e-10}) {
    Points out = untouched(1);
    TWstatus status = 0;
    const CoordinateTriple in = {0, kPi / 2 + beyond, 0};
    TWIMWmodPoly_f(kE, 0, lat1, 0.08, 0.01, 0.07, 0, 1, 0, 0, 1, &in, out.data(), &status);
    EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
    EXPECT_NEAR(out[0].x, 0, 1e-15);
    EXPECT_NEAR(out[0].y, arc_between(kE, 0, kPi / 2), 1e-14);
  }
}

TEST(ImwPolyconic, InverseRunsOut) {
  const Sheet sheet(kE, 0, degrees(36));
  // Far off the sheet the forward function fails, or the passes run out: the point is written and
  // the loop goes on.
  const Points good = {{0.01, 0.03, 0}};
  Points out = untouched(3);
  EXPECT_EQ(sheet.inverse({{0.01, 0.03, 0}, {3, 20, 0}, {0.01, 0.03, 0}}, out),
            TW_I_LATITUDE_LIMITED);
  EXPECT_NE(out[1].x, kUntouched);
  EXPECT_LE(std::fabs(out[1].y), kPi / 2);
  EXPECT_EQ(out[2].x, out[0].x);
  EXPECT_EQ(sheet.inverse({{kNaN, 0, 0}}, out), TW_I_LATITUDE_LIMITED);
}

TEST(ImwPolyconic, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  struct Case {
    const char* definition;
    double south, dl;
  };
  for (const auto& [definition, south, dl] :
       {Case{"+proj=imw_p +lat_1=36 +lat_2=40 +lon_1=2 +a=1 +rf=294.9786982138982", 36, 2},
        {"+proj=imw_p +lat_1=-40 +lat_2=-36 +lon_1=2 +a=1 +rf=294.9786982138982", -40, 2},
        {"+proj=imw_p +lat_1=64 +lat_2=68 +lon_1=4 +a=1 +rf=294.9786982138982", 64, 4}}) {
    const ProjPeer peer(definition);
    ASSERT_TRUE(peer.ok());
    const auto ellipsoid = Ellipsoid::from_inverse_flattening(1, 294.9786982138982);
    const Sheet sheet(ellipsoid.e, 0, degrees(south));
    for (double u = 0.1; u < 1; u += 0.2) {
      for (double v = -1; v <= 1; v += 0.25) {
        Points p = {{degrees(dl * v), degrees(south + 4 * u), 0}};
        const auto expected = peer.forward(p[0]);
        ASSERT_EQ(sheet.forward(p, p), TW_SUCCESS);
        // the arcs' series differ by some 1e-13
        expect_near(p[0], expected.x, expected.y, 2e-12);
      }
    }
  }
#endif
}

}  // namespace
