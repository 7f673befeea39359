#include "tidewater/frame.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>

#include "support/points.hpp"

using namespace tidewater::test;

namespace {

TEST(StatusWords, AreBuiltFromFacilityMessageAndSeverity) {
  // facility 0x0FCF, message 0x1000 + number, severity 1 success, 2 error, 0 warning, 3 information
  const auto word = [](uint32_t number, uint32_t severity) {
    return (0x0FCFu << 16) | ((0x1000 + number) << 3) | severity;
  };
  const TWstatus errors[] = {TW_FAILURE,
                             TW_RANGE_ERROR,
                             TW_BAD_ECCENTRICITY,
                             TW_BAD_LONGITUDE,
                             TW_BAD_LATITUDE,
                             TW_BAD_SCALE_LATITUDE,
                             TW_BAD_DATE,
                             TW_BAD_STANDARD_PARALLEL,
                             TW_BAD_SEMI_MAJOR,
                             TW_DIVERGED,
                             TW_BAD_ZONE,
                             TW_BAD_HEMISPHERE,
                             TW_BAD_TEXT,
                             TW_BAD_INPUT,
                             TW_NOT_CONVERGED,
                             TW_NO_MEMORY,
                             TW_BAD_DATA,
                             TW_BAD_PARAMETER,
                             TW_SINGULAR,
                             TW_NO_SUCH_MODEL,
                             TW_BAD_HARMONIC_MODEL,
                             TW_GEOID_FILE_ERROR,
                             TW_GRID_FILE_ERROR,
                             TW_BAD_TOLERANCE,
                             TW_NO_SUCH_SYSTEM,
                             TW_PF_OPEN_ERROR,
                             TW_PF_TABLE_ERROR,
                             TW_NO_SUCH_VERT_DATUM,
                             TW_BUFFER_TOO_SMALL,
                             TW_GEOID_READ_ERROR,
                             TW_GSB_READ_ERROR,
                             TW_GRID_NOT_FOUND,
                             TW_NO_SUCH_SATELLITE};
  EXPECT_EQ(TW_SUCCESS, word(1, 1));
  EXPECT_TRUE(TW_OK(TW_SUCCESS));
  uint32_t number = 2;
  for (const TWstatus error : errors) {
    EXPECT_EQ(error, word(number++, 2));
    EXPECT_FALSE(TW_OK(error));
  }
  EXPECT_EQ(number, 35u);
  EXPECT_EQ(TW_W_NO_POINTS, word(35, 0));
  EXPECT_FALSE(TW_OK(TW_W_NO_POINTS));
  for (const TWstatus information :
       {TW_I_LATITUDE_LIMITED, TW_I_OUTSIDE_NADCON, TW_I_OUTSIDE_GEOID, TW_I_OUTSIDE_CNT}) {
    EXPECT_EQ(information, word(++number, 3));
    EXPECT_TRUE(TW_OK(information));
  }
}

struct Checked {
  double result = kUntouched;
  TWstatus status = 0;
};

Checked latitude(double lat) {
  Checked c;
  TWverify_lat(lat, &c.result, &c.status);
  return c;
}

Checked longitude(double lon) {
  Checked c;
  TWverify_lon(lon, &c.result, &c.status);
  return c;
}

TEST(VerifyLat, HoldsAHairBeyondThePole) {
  EXPECT_EQ(latitude(0.5).result, 0.5);
  EXPECT_EQ(latitude(0.5).status, TW_SUCCESS);
  EXPECT_EQ(latitude(kPi / 2 + 5e-13).result, kPi / 2);
  EXPECT_EQ(latitude(kPi / 2 + 5e-13).status, TW_SUCCESS);
  EXPECT_EQ(latitude(-kPi / 2 - 5e-13).result, -kPi / 2);
  EXPECT_EQ(latitude(-kPi / 2).result, -kPi / 2);
}

TEST(VerifyLat, RefusesFromTheLimitOn) {
  const double limit = kPi / 2 + 1e-12;
  EXPECT_EQ(latitude(std::nextafter(limit, 0)).status, TW_SUCCESS);
  for (const double lat : {limit, -limit, 2.0, -2.0, kInfinity, kNaN}) {
    EXPECT_EQ(latitude(lat).status, TW_BAD_LATITUDE);
    EXPECT_EQ(latitude(lat).result, kUntouched);
  }
}

TEST(VerifyLon, FoldsOneTurn) {
  EXPECT_EQ(longitude(3.5).result, 3.5 - 2 * kPi);
  EXPECT_EQ(longitude(-3.5).result, 2 * kPi - 3.5);
  EXPECT_EQ(longitude(kPi).result, kPi);
  EXPECT_EQ(longitude(-kPi).result, -kPi);
  EXPECT_EQ(longitude(2 * kPi).result, 0);
  EXPECT_EQ(longitude(-2 * kPi).result, 0);
  EXPECT_EQ(longitude(-2 * kPi).status, TW_SUCCESS);
}

TEST(VerifyLon, RefusesBeyondTwoPi) {
  for (const double lon : {std::nextafter(2 * kPi, 7), -std::nextafter(2 * kPi, 7), 7.0, kNaN}) {
    EXPECT_EQ(longitude(lon).status, TW_BAD_LONGITUDE);
    EXPECT_EQ(longitude(lon).result, kUntouched);
  }
}

template <class F>
uint16_t precision(F f, double value) {
  uint16_t places = 999;
  TWstatus status = 0;
  f(&value, &places, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return places;
}

TEST(Precision, OfLargeNumbers) {
  EXPECT_EQ(precision(TWmax_f_prec, 1), 14);
  EXPECT_EQ(precision(TWmax_f_prec, -1), 14);
  EXPECT_EQ(precision(TWmax_f_prec, 999), 12);
  EXPECT_EQ(precision(TWmax_f_prec, 1000), 11);
  EXPECT_EQ(precision(TWmax_f_prec, 0), 15);
  EXPECT_EQ(precision(TWmax_f_prec, 0.5), 15);
  EXPECT_EQ(precision(TWmax_f_prec, 9.9e14), 0);
  EXPECT_EQ(precision(TWmax_f_prec, 1e15), 0);
  EXPECT_EQ(precision(TWmax_f_prec, 1e300), 0);
  EXPECT_EQ(precision(TWmax_f_prec, kNaN), 0);
}

// The fewest places change at each power of ten, and nowhere else.
TEST(Precision, ChangesAtEachPowerOfTen) {
  for (int n = 0; n <= 14; ++n) {
    const double power = std::stod("1e" + std::to_string(n));
    EXPECT_EQ(precision(TWmax_f_prec, power), 14 - n) << n;
    EXPECT_EQ(precision(TWmax_f_prec, std::nextafter(power, 0)), 15 - n) << n;
    const double part = std::stod("1e-" + std::to_string(n));
    if (n == 0) continue;
    EXPECT_EQ(precision(TWmin_f_prec, std::nextafter(part, 1)), 14 + n) << n;
    EXPECT_EQ(precision(TWmin_f_prec, part), 15 + n) << n;
  }
}

TEST(Precision, OfSmallNumbers) {
  EXPECT_EQ(precision(TWmin_f_prec, 0), 0);
  EXPECT_EQ(precision(TWmin_f_prec, 0.5), 15);
  EXPECT_EQ(precision(TWmin_f_prec, -0.5), 15);
  EXPECT_EQ(precision(TWmin_f_prec, 0.1), 16);
  EXPECT_EQ(precision(TWmin_f_prec, 0.001), 18);
  EXPECT_EQ(precision(TWmin_f_prec, 2e-14), 28);
  EXPECT_EQ(precision(TWmin_f_prec, 1e-15), 29);
  EXPECT_EQ(precision(TWmin_f_prec, 1e-40), 29);
  EXPECT_EQ(precision(TWmin_f_prec, kNaN), 29);
  EXPECT_EQ(precision(TWmin_f_prec, 7), 15);
}

TEST(Precision, ChoosesByMagnitude) {
  EXPECT_EQ(precision(TWget_prec, 1.0), 14);
  EXPECT_EQ(precision(TWget_prec, 0.9999), 15);
  EXPECT_EQ(precision(TWget_prec, 0), 0);
  EXPECT_EQ(precision(TWget_prec, -1000), 11);
  EXPECT_EQ(precision(TWget_prec, kNaN), 29);
}

}  // namespace
