#include <gtest/gtest.h>

#include "support/points.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

struct Frame {
  double azimuth = kUntouched;
  double x0 = kUntouched, y0 = kUntouched, z0 = kUntouched;
  double m[9];
  TWstatus status = 0;

  Frame() { std::fill(std::begin(m), std::end(m), kUntouched); }
};

const Ellipsoid kEarth = Ellipsoid::wgs84();

Frame by_azimuth(double lon, double lat, double h, double azimuth) {
  Frame f;
  f.azimuth = azimuth;
  TWlsr_c(1, kEarth.a, kEarth.e, lon, lat, h, &f.azimuth, &f.x0, &f.y0, &f.z0, 9, 9, 9, 9, 9, 9,
          f.m, &f.status);
  return f;
}

Frame by_points(const CoordinateTriple& origin, const CoordinateTriple& from,
                const CoordinateTriple& to, int16_t mode = 0) {
  Frame f;
  TWlsr_c(mode, kEarth.a, kEarth.e, origin.x, origin.y, origin.z, &f.azimuth, &f.x0, &f.y0, &f.z0,
          from.x, from.y, from.z, to.x, to.y, to.z, f.m, &f.status);
  return f;
}

TEST(LocalSpace, PublishedTopocentricExample) {
  // EPSG Guidance Note 7-2 (2022), 4.1.3: topocentric origin 55 N 5 E 200 m on WGS 84
  CoordinateTriple p = {degrees(2, 7, 46.38), degrees(53, 48, 33.82), 73.0};
  TWstatus status = 0;
  TWllh_to_lsr(kEarth.a, kEarth.e, 1, degrees(5), degrees(55), 200, 1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(p, -189013.869, -128642.040, -4220.171, 6e-4);
  TWlsr_to_llh(kEarth.a, kEarth.e, 1, degrees(5), degrees(55), 200, 1, &p, &p, &status);
  expect_near(p, degrees(2, 7, 46.38), degrees(53, 48, 33.82), 1e-13);
  EXPECT_NEAR(p.z, 73.0, 1e-6);
}

TEST(LocalSpace, AzimuthFrameIsARotation) {
  const Frame f = by_azimuth(0.3, 0.8, 500, 0.7);
  EXPECT_EQ(f.status, TW_SUCCESS);
  EXPECT_EQ(f.azimuth, 0.7);  // read, not written
  for (int r = 0; r < 3; ++r) {
    for (int s = 0; s < 3; ++s) {
      double dot = 0;
      for (int c = 0; c < 3; ++c) dot += f.m[3 * r + c] * f.m[3 * s + c];
      EXPECT_NEAR(dot, r == s, 1e-15);
    }
  }
  // row 0 x row 1 = row 2: right-handed
  EXPECT_NEAR(f.m[0] * f.m[4] - f.m[1] * f.m[3], f.m[8], 1e-15);
  // an azimuth of pi/2 gives x east, y north, z up
  const Frame east = by_azimuth(0.3, 0.8, 0, kPi / 2);
  EXPECT_NEAR(east.m[0], -std::sin(0.3), 1e-15);
  EXPECT_NEAR(east.m[1], std::cos(0.3), 1e-15);
  EXPECT_NEAR(east.m[5], std::cos(0.8), 1e-15);
  EXPECT_NEAR(east.m[3], -std::sin(0.8) * std::cos(0.3), 1e-15);
  EXPECT_NEAR(east.m[8], std::sin(0.8), 1e-15);
}

TEST(LocalSpace, OriginIsInUnitsOfTheAxis) {
  const Frame f = by_azimuth(1.1, -0.4, 1234, 0);
  CoordinateTriple p = {1.1, -0.4, 1234};
  TWstatus status = 0;
  TWllh_to_xyz(kEarth.a, kEarth.e, 1, &p, &p, &status);
  EXPECT_NEAR(f.x0, p.x / kEarth.a, 1e-15);
  EXPECT_NEAR(f.y0, p.y / kEarth.a, 1e-15);
  EXPECT_NEAR(f.z0, p.z / kEarth.a, 1e-15);
}

TEST(LocalSpace, TwoPointsGiveTheAzimuthOfTheirLine) {
  // a short line due east at the origin's height, then due north, then steeply up
  const CoordinateTriple origin = {0.2, 0.5, 0};
  const Frame east = by_points(origin, {0.2 - 1e-6, 0.5, 0}, {0.2 + 1e-6, 0.5, 0}, 7);
  EXPECT_EQ(east.status, TW_SUCCESS);
  EXPECT_NEAR(east.azimuth, kPi / 2, 1e-9);
  const Frame north = by_points(origin, {0.2, 0.5 - 1e-6, 0}, {0.2, 0.5 + 1e-6, 0});
  EXPECT_NEAR(north.azimuth, 0, 1e-9);
  EXPECT_NEAR(north.m[2], std::cos(0.5), 1e-9);  // the x axis points north
  const Frame steep = by_points(origin, {0.2, 0.5, 0}, {0.2, 0.5 + 1e-5, 1000});
  const double length =
      std::sqrt(steep.m[0] * steep.m[0] + steep.m[1] * steep.m[1] + steep.m[2] * steep.m[2]);
  EXPECT_LT(length, 0.1);  // the rows are not normalised
  EXPECT_GT(length, 0.01);
}

TEST(LocalSpace, TwoPointsInOneAreRefused) {
  const Frame f = by_points({0.2, 0.5, 10}, {1, 1, 0}, {1, 1, 0});
  EXPECT_EQ(f.status, TW_BAD_PARAMETER);
  EXPECT_NE(f.x0, kUntouched);
  EXPECT_NEAR(f.m[8], std::sin(0.5), 1e-15);
  for (int i = 0; i < 6; ++i) EXPECT_EQ(f.m[i], kUntouched);
  EXPECT_EQ(f.azimuth, kUntouched);
}

TEST(LocalSpace, AzimuthThatCannotBeTold) {
  // at the origin the line stands upright: both horizontal rows vanish
  const Frame f = by_points({0, 0, 0}, {0, 0, 0}, {0, 0, 1000});
  EXPECT_EQ(f.status, TW_BAD_PARAMETER);
  EXPECT_EQ(f.m[0], 0);
  EXPECT_EQ(f.m[5], 0);
  EXPECT_EQ(f.azimuth, kUntouched);
}

// On the unit sphere, from a point of the first axis: the line's own length is the limit's.
TEST(LocalSpace, TwoPointsNoFartherApartThanTheLimitAreOne) {
  for (const double apart : {1e-15, std::nextafter(1e-15, 1), 1.5e-15}) {
    Frame f;
    TWlsr_c(0, 1, 0, 0, 0, 0, &f.azimuth, &f.x0, &f.y0, &f.z0, 0, 0, 0, 0, apart, 0, f.m,
            &f.status);
    EXPECT_EQ(f.status, apart > 1e-15 ? TW_SUCCESS : TW_BAD_PARAMETER) << apart;
    EXPECT_EQ(f.azimuth, apart > 1e-15 ? 0 : kUntouched) << apart;
    EXPECT_EQ(f.m[2], apart > 1e-15 ? 1 : kUntouched) << apart;
  }
}

// A line of length 1 straight up, but for so little to the north or to the east.
TEST(LocalSpace, AzimuthOfALineThatIsAlmostUpright) {
  for (const double aside : {1e-15, std::nextafter(1e-15, 1), 1.5e-15}) {
    for (const bool east : {false, true}) {
      Frame f;
      TWlsr_c(0, 1, 0, 0, 0, 0, &f.azimuth, &f.x0, &f.y0, &f.z0, 0, 0, 0, east ? aside / 2 : 0,
              east ? 0 : aside / 2, 1, f.m, &f.status);
      EXPECT_EQ(f.m[east ? 5 : 2], aside);
      // East is also the second column's, as if the origin were a pole.
      EXPECT_EQ(f.status, aside > 1e-15 ? TW_SUCCESS : TW_BAD_PARAMETER) << aside << east;
      EXPECT_EQ(f.azimuth, aside > 1e-15 ? (east ? kPi / 2 : 0) : kUntouched) << aside << east;
    }
  }
}

// Rows 1 and 0 are the vector products of the normal and the line, and of row 1 and the normal.
TEST(LocalSpace, RowsOfTwoPointsAreVectorProducts) {
  const CoordinateTriple origin = {0.7, -0.6, 300};
  CoordinateTriple ends[] = {{0.68, -0.63, 1000}, {0.73, -0.55, -200}};
  const Frame f = by_points(origin, ends[0], ends[1]);
  EXPECT_EQ(f.status, TW_SUCCESS);
  TWstatus status = 0;
  TWllh_to_xyz(kEarth.a, kEarth.e, 2, ends, ends, &status);
  const double d[] = {ends[1].x - ends[0].x, ends[1].y - ends[0].y, ends[1].z - ends[0].z};
  const double length = std::hypot(d[0], d[1], d[2]);
  const double up[] = {std::cos(-0.6) * std::cos(0.7), std::cos(-0.6) * std::sin(0.7),
                       std::sin(-0.6)};
  for (int i = 0; i < 3; ++i) {
    const int j = (i + 1) % 3, k = (i + 2) % 3;
    EXPECT_NEAR(f.m[3 + i], (up[j] * d[k] - up[k] * d[j]) / length, 1e-13);
    EXPECT_NEAR(f.m[i], f.m[3 + j] * up[k] - f.m[3 + k] * up[j], 1e-15);
    EXPECT_NEAR(f.m[6 + i], up[i], 1e-16);
  }
  // The first row lies along the line's horizontal part.
  const double rise = (up[0] * d[0] + up[1] * d[1] + up[2] * d[2]) / length;
  for (int i = 0; i < 3; ++i) EXPECT_NEAR(f.m[i], d[i] / length - rise * up[i], 1e-13);
}

TEST(LocalSpace, AtAPoleTheAzimuthComesFromTheFirstColumns) {
  // At the north pole with lon0 = 0.5 the line runs along the meridian of 0.5 + 0.3 east, away from
  // the pole: azimuth, from the meridian of lon0, by hand pi - 0.3.
  const double lat = kPi / 2;
  for (const double sign : {1.0, -1.0}) {
    const Frame f = by_points({0.5, sign * lat, 0}, {0, sign * lat, 0}, {0.8, sign * 1.5, 0}, 2);
    EXPECT_EQ(f.status, TW_SUCCESS);
    // the rows: row 1 = normal x line, row 0 = row 1 x normal
    EXPECT_NEAR(f.m[2], 0, 1e-15);
    EXPECT_NEAR(f.m[5], 0, 1e-15);
    // By the south pole the meridian of lon0 runs north, and its azimuths the other way.
    EXPECT_NEAR(f.azimuth, sign > 0 ? kPi - 0.3 : 0.3, 1e-12);
    EXPECT_NEAR(std::atan2(f.m[1], f.m[0]), 0.8, 1e-12);  // x points along the meridian of 0.8
    // Along the first axis itself, where nothing is left of the second column.
    const Frame along = by_points({0.5, sign * lat, 0}, {kPi, sign * 1.5, 0}, {0, sign * 1.5, 0});
    EXPECT_EQ(along.status, TW_SUCCESS);
    EXPECT_NEAR(along.m[1], 0, 1e-15);
    EXPECT_NEAR(std::remainder(along.azimuth - (sign > 0 ? kPi + 0.5 : -0.5), 2 * kPi), 0, 1e-12);
  }
}

TEST(LocalSpace, ForwardAndInverse) {
  const Frame f = by_azimuth(-2, -0.9, 100, 1);
  const Points in = {{-2, -0.9, 100}, {-2.01, -0.89, 3000}, {-1.99, -0.91, -50}};
  Points out = untouched(in.size());
  TWstatus status = 0;
  TWlsr_f(kEarth.a, kEarth.e, f.x0, f.y0, f.z0, f.m, 3, in.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(out[0], 0, 0, 0, 1e-15);
  TWlsr_i(kEarth.a, kEarth.e, f.x0, f.y0, f.z0, f.m, 3, out.data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  for (std::size_t i = 0; i < in.size(); ++i) {
    expect_near(out[i], in[i].x, in[i].y, 1e-13);
    EXPECT_NEAR(out[i].z, in[i].z, 1e-6);
  }
}

TEST(LocalSpace, ScaleAndTheInputThatIsChanged) {
  const double up[] = {1, 100};  // metres and centimetres
  for (const double scale : up) {
    CoordinateTriple p = {0.4, 0.6, 1};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWllh_to_lsr(kEarth.a, kEarth.e, scale, 0.4, 0.6, 0, 1, &p, &out, &status);
    expect_near(out, 0, 0, scale, 1e-8 * scale);
    CoordinateTriple local = {10 * scale, 20 * scale, 30 * scale};
    const double unit = kEarth.a * scale;
    CoordinateTriple llh = kUntouchedPoint;
    TWlsr_to_llh(kEarth.a, kEarth.e, scale, 0.4, 0.6, 0, 1, &local, &llh, &status);
    EXPECT_EQ(local.x, 10 * scale / unit);
    EXPECT_EQ(local.y, 20 * scale / unit);
    EXPECT_EQ(local.z, 30 * scale / unit);
    EXPECT_NEAR(llh.z, 30, 1e-4);
  }
  CoordinateTriple p = kUntouchedPoint;
  TWstatus status = 0;
  TWlsr_to_llh(1, 0, 1, 0, 0, 0, 0, &p, &p, &status);
  TWllh_to_lsr(1, 0, 1, 0, 0, 0, -1, &p, &p, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_untouched(p);
}

}  // namespace
