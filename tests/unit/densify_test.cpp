#include <gtest/gtest.h>

#include <limits>

#include "support/points.hpp"
#include "tidewater/lines.h"

using namespace tidewater::test;

namespace {

const auto kWgs84 = Ellipsoid::wgs84();

// The two families have the same shape.
struct Family {
  decltype(&TWgeodesic_cnt) count_points;
  decltype(&TWgeodesic_buf) fill_points;
  decltype(&TWgeodesic_inv) inverse;
  decltype(&TWgeodesic_dir) direct;
};

const Family kFamilies[] = {
    {TWgeodesic_cnt, TWgeodesic_buf, TWgeodesic_inv, TWgeodesic_dir},
    {TWrhmbline_cnt, TWrhmbline_buf, TWrhmbline_inv, TWrhmbline_dir},
};

struct Count {
  int32_t count = -77;
  TWstatus status = 0;
};

Count count_of(const Family& family, double distance, double spacing) {
  Count r;
  family.count_points(1, {}, {}, distance, 0.5, kWgs84.a, kWgs84.e, spacing, &r.count, &r.status);
  return r;
}

TEST(PointCount, OneMoreThanTheSpacingsAndOneForARemainder) {
  for (const auto& family : kFamilies) {
    EXPECT_EQ(count_of(family, 1000, 100).count, 11);
    EXPECT_EQ(count_of(family, 1000, 100).status, TW_SUCCESS);
    EXPECT_EQ(count_of(family, 1050, 100).count, 12);
    EXPECT_EQ(count_of(family, 100, 100).count, 2);
    EXPECT_EQ(count_of(family, 199.5, 100).count, 3);
    const auto none = count_of(family, 99, 100);
    EXPECT_EQ(none.count, 0);
    EXPECT_EQ(none.status, TW_W_NO_POINTS);
    EXPECT_EQ(count_of(family, 0, std::numeric_limits<double>::min()).status, TW_W_NO_POINTS);
  }
}

TEST(PointCount, WhatNoIntegerHolds) {
  const int32_t most = std::numeric_limits<int32_t>::max();
  for (const auto& family : kFamilies) {
    EXPECT_EQ(count_of(family, 1000, 0).count, most);
    EXPECT_EQ(count_of(family, 1e20, 1).count, most);
    EXPECT_EQ(count_of(family, 2147483645.0, 1).count, 2147483646);
    EXPECT_EQ(count_of(family, 2147483646.5, 1).count, most);
    EXPECT_EQ(count_of(family, 1e20, -1).count, std::numeric_limits<int32_t>::min());
    EXPECT_EQ(count_of(family, 0, 0).status, TW_SUCCESS);
    EXPECT_EQ(count_of(family, 1000, -100).count, -9);  // -10 whole spacings and one
    // A distance that is not a number is neither reached nor missed.
    const auto nan = count_of(family, kNaN, 100);
    EXPECT_EQ(nan.count, -77);
    EXPECT_EQ(nan.status, TW_SUCCESS);
  }
}

TEST(PointCount, ByTwoEnds) {
  const CoordinateTriple start = {0.1, 0.6, 1};
  const CoordinateTriple end = {0.15, 0.62, 2};
  for (const auto& family : kFamilies) {
    double azimuth = 0, back = 0, distance = 0;
    TWstatus status = 0;
    family.inverse(start, end, kWgs84.a, kWgs84.e, &azimuth, &back, &distance, &status);
    int32_t count = 0;
    family.count_points(0, start, end, kNaN, kNaN, kWgs84.a, kWgs84.e, distance / 7.5, &count,
                        &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(count, 9);
    // Any other mode reads the distance.
    family.count_points(-1, start, end, 1000, kNaN, kWgs84.a, kWgs84.e, 100, &count, &status);
    EXPECT_EQ(count, 11);
  }
}

TEST(PointRun, FewerThanTwo) {
  for (const auto& family : kFamilies) {
    for (const int32_t count : {1, 0, -5}) {
      Points points = untouched(2);
      TWstatus status = 0;
      family.fill_points(0, {}, {1, 1, 1}, 0, 0, 0, 1, 0, count, points.data(), &status);
      EXPECT_EQ(status, TW_BUFFER_TOO_SMALL);
      expect_untouched(points[0]);
    }
  }
}

TEST(PointRun, ByAzimuthAndDistance) {
  const CoordinateTriple start = {0.1, 0.6, 1};
  for (const auto& family : kFamilies) {
    Points points = untouched(13);
    TWstatus status = 0;
    family.fill_points(1, start, {9, 9, 9}, 1050, 0.7, 100, kWgs84.a, kWgs84.e, 12, points.data(),
                       &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(points[0], 0.1, 0.6, 1, 0);
    for (int i = 1; i < 12; ++i) {  // the last lies beyond the given distance
      CoordinateTriple expected = {};
      double back = 0;
      family.direct(start, 0.7, i * 100.0, kWgs84.a, kWgs84.e, &expected, &back, &status);
      expect_near(points[static_cast<std::size_t>(i)], expected.x, expected.y, 1, 0);
    }
    expect_untouched(points[12]);
  }
}

TEST(PointRun, ByTwoEndsEndsOnTheEnd) {
  const CoordinateTriple start = {0.1, 0.6, 1};
  const CoordinateTriple end = {0.15, 0.62, 2};
  for (const auto& family : kFamilies) {
    double azimuth = 0, back = 0, distance = 0;
    TWstatus status = 0;
    family.inverse(start, end, kWgs84.a, kWgs84.e, &azimuth, &back, &distance, &status);
    Points points = untouched(9);
    family.fill_points(0, start, end, kNaN, kNaN, distance / 7.5, kWgs84.a, kWgs84.e, 9,
                       points.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(points[8], end.x, end.y, 2, 0);
    double to_end = 0;
    family.inverse(points[7], end, kWgs84.a, kWgs84.e, &azimuth, &back, &to_end, &status);
    EXPECT_NEAR(to_end, distance / 15, 1e-4);
    // Spacing 0 divides evenly, and the last but one is a whole step from the end.
    family.fill_points(0, start, end, kNaN, kNaN, 0, kWgs84.a, kWgs84.e, 9, points.data(), &status);
    family.inverse(points[7], end, kWgs84.a, kWgs84.e, &azimuth, &back, &to_end, &status);
    EXPECT_NEAR(to_end, distance / 8, 1e-4);
    for (int i = 1; i < 8; ++i) EXPECT_EQ(points[static_cast<std::size_t>(i)].z, 1);
    // Two points are the two ends.
    family.fill_points(0, start, end, kNaN, kNaN, 0, kWgs84.a, kWgs84.e, 2, points.data(), &status);
    expect_near(points[0], start.x, start.y, 1, 0);
    expect_near(points[1], end.x, end.y, 2, 0);
  }
}

TEST(PointRun, EvenDivisionByAzimuth) {
  for (const auto& family : kFamilies) {
    Points points = untouched(5);
    TWstatus status = 0;
    family.fill_points(7, {0.1, 0.6, 1}, {}, 4000, 0.7, 0, kWgs84.a, kWgs84.e, 5, points.data(),
                       &status);
    CoordinateTriple expected = {};
    double back = 0;
    family.direct({0.1, 0.6, 1}, 0.7, 4000, kWgs84.a, kWgs84.e, &expected, &back, &status);
    expect_near(points[4], expected.x, expected.y, 1, 0);
  }
}

TEST(PointRun, TheWordIsThatOfTheLastPoint) {
  // Along the meridian past the pole: the last point fails.
  Points points = untouched(4);
  TWstatus status = 0;
  TWgeodesic_buf(1, {0, 1.5, 0}, {}, 0, 0, 3e5, kWgs84.a, kWgs84.e, 4, points.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  EXPECT_EQ(points[3].y, kUntouched);
  // A failing inverse leaves its word to the points' calls; the run is written all the same.
  TWgeodesic_buf(0, {0, 0.1, 0}, {0, 2, 5}, 0, 0, 1, kWgs84.a, kWgs84.e, 3, points.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(points[2], 0, 2, 5, 0);
}

TEST(PointRun, ARhumbLineWestwardOnAParallelLiesEast) {
  Points points = untouched(3);
  TWstatus status = 0;
  TWrhmbline_buf(0, {0.2, 0.5, 0}, {0.1, 0.5, 0}, 0, 0, 0, 1, 0, 3, points.data(), &status);
  EXPECT_NEAR(points[1].x, 0.25, 1e-15);
  EXPECT_EQ(points[2].x, 0.1);
}

}  // namespace
