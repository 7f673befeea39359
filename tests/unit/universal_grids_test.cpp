#include <gtest/gtest.h>

#include "support/points.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

TEST(UniversalGrids, CentralMeridianOfAZone) {
  TWstatus status = 0;
  double lon0 = kUntouched;
  const auto degrees_of = [&](int16_t zone) {
    TWrslv_utmzone(zone, &lon0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return lon0 * 180 / kPi;
  };
  EXPECT_DOUBLE_EQ(degrees_of(1), -177);
  EXPECT_DOUBLE_EQ(degrees_of(30), -3);
  EXPECT_DOUBLE_EQ(degrees_of(31), 3);
  EXPECT_DOUBLE_EQ(degrees_of(60), 177);
  for (const int zone : {INT16_MIN, -1, 0, 61, INT16_MAX}) {
    lon0 = kUntouched;
    TWrslv_utmzone(static_cast<int16_t>(zone), &lon0, &status);
    EXPECT_EQ(status, TW_BAD_ZONE);
    EXPECT_EQ(lon0, kUntouched);
  }
}

TEST(UniversalGrids, FalseNorthingOfAHemisphere) {
  TWstatus status = 0;
  double northing = kUntouched;
  TWrslv_utmhemi(0, &northing, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(northing, 0);
  TWrslv_utmhemi(1, &northing, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(northing, 1e7);
  for (const int hemisphere : {-1, 2}) {
    northing = kUntouched;
    TWrslv_utmhemi(static_cast<int16_t>(hemisphere), &northing, &status);
    EXPECT_EQ(status, TW_BAD_HEMISPHERE);
    EXPECT_EQ(northing, kUntouched);
  }
}

TEST(UniversalGrids, PolarStereographic) {
  const struct {
    int16_t hemisphere;
    TWstatus status;
    double lat0;
  } cases[] = {{0, TW_SUCCESS, kPi / 2},
               {1, TW_SUCCESS, -kPi / 2},
               {2, TW_BAD_HEMISPHERE, kUntouched},
               {-1, TW_BAD_HEMISPHERE, kUntouched}};
  for (const auto& expected : cases) {
    TWstatus status = 0;
    double lon0 = kUntouched, lat0 = kUntouched, easting = kUntouched, northing = kUntouched;
    double k0 = kUntouched;
    TWups(expected.hemisphere, &lon0, &lat0, &easting, &northing, &k0, &status);
    EXPECT_EQ(status, expected.status);
    EXPECT_EQ(lat0, expected.lat0);
    EXPECT_EQ(lon0, 0);
    EXPECT_EQ(easting, 2e6);
    EXPECT_EQ(northing, 2e6);
    EXPECT_EQ(k0, 0.994);
  }
}

TEST(UniversalGrids, BritishNationalGrid) {
  TWstatus status = 0;
  double lon0 = 0, lat0 = 0, easting = 0, northing = 0, k0 = 0;
  TWuk_n_grid(&lon0, &lat0, &easting, &northing, &k0, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_DOUBLE_EQ(lon0, degrees(-2));
  EXPECT_DOUBLE_EQ(lat0, degrees(49));
  EXPECT_EQ(easting, 400000);
  EXPECT_EQ(northing, -100000);
  EXPECT_EQ(k0, 0.9996012717);
}

}  // namespace
