#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "support/data.hpp"
#include "support/points.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kDegree = 0.017453292519943295;
constexpr double kFoot = 0.3048006096012192;
constexpr int16_t kUntouchedType = 77;

using ZoneFunction = decltype(&TWspcs27);

struct Zone {
  int16_t type = kUntouchedType;
  double lon0 = kUntouched, lat0 = kUntouched, false_easting = kUntouched,
         false_northing = kUntouched, k0 = kUntouched, lat1 = kUntouched, lat2 = kUntouched,
         lon_center = kUntouched, lat_center = kUntouched, azimuth = kUntouched;
  TWstatus status = 0;

  Zone(ZoneFunction function, const std::string& text) {
    function(text.c_str(), &type, &lon0, &lat0, &false_easting, &false_northing, &k0, &lat1, &lat2,
             &lon_center, &lat_center, &azimuth, &status);
  }
  bool untouched() const {
    for (const double v : {lon0, lat0, false_easting, false_northing, k0, lat1, lat2, lon_center,
                           lat_center, azimuth}) {
      if (v != kUntouched) return false;
    }
    return type == kUntouchedType;
  }
};

// The zones of the two systems, and those of them that are transverse Mercator.

const std::vector<int> kList1927 = {
    101,  102,  5001, 5002, 5003, 5004, 5005, 5006, 5007, 5008, 5009, 5010, 201,  202,  203,
    301,  302,  401,  402,  403,  404,  405,  406,  407,  501,  502,  503,  600,  700,  901,
    902,  903,  1001, 1002, 5101, 5102, 5103, 5104, 5105, 1101, 1102, 1103, 1201, 1202, 1301,
    1302, 1401, 1402, 1501, 1502, 1601, 1602, 1701, 1702, 1703, 1801, 1802, 1900, 2001, 2002,
    2101, 2102, 2103, 2111, 2112, 2113, 2201, 2202, 2203, 2301, 2302, 2401, 2402, 2403, 2501,
    2502, 2503, 2601, 2602, 2701, 2702, 2703, 2800, 2900, 3001, 3002, 3003, 3101, 3102, 3103,
    3104, 3200, 3301, 3302, 3401, 3402, 3501, 3502, 3601, 3602, 3701, 3702, 5201, 5202, 3800,
    5300, 3901, 3902, 4001, 4002, 4100, 4201, 4202, 4203, 4204, 4205, 4301, 4302, 4303, 4400,
    4501, 4502, 4601, 4602, 4701, 4702, 4801, 4802, 4803, 4901, 4902, 4903, 4904};

const std::vector<int> kList1983 = {
    101,  102,  5001, 5002, 5003, 5004, 5005, 5006, 5007, 5008, 5009, 5010, 201,  202,  203,  301,
    302,  401,  402,  403,  404,  405,  406,  501,  502,  503,  600,  700,  901,  902,  903,  5101,
    5102, 5103, 5104, 5105, 1001, 1002, 1101, 1102, 1103, 1201, 1202, 1301, 1302, 1401, 1402, 1501,
    1502, 1601, 1602, 1701, 1702, 1703, 1801, 1802, 1900, 2001, 2002, 2111, 2112, 2113, 2201, 2202,
    2203, 2301, 2302, 2401, 2402, 2403, 2500, 2600, 2701, 2702, 2703, 2800, 2900, 3001, 3002, 3003,
    3101, 3102, 3103, 3104, 3200, 3301, 3302, 3401, 3402, 3501, 3502, 3601, 3602, 3701, 3702, 5200,
    3800, 3900, 4001, 4002, 4100, 4201, 4202, 4203, 4204, 4205, 4301, 4302, 4303, 4400, 4501, 4502,
    4601, 4602, 4701, 4702, 4801, 4802, 4803, 4901, 4902, 4903, 4904};

const std::vector<int> kTransverse1927 = {
    101,  102,  5002, 5003, 5004, 5005, 5006, 5007, 5008, 5009, 201,  202,  203,  700,  901,
    902,  1001, 1002, 5101, 5102, 5103, 5104, 5105, 1101, 1102, 1103, 1201, 1202, 1301, 1302,
    1801, 1802, 2101, 2102, 2103, 2301, 2302, 2401, 2402, 2403, 2701, 2702, 2703, 2800, 2900,
    3001, 3002, 3003, 3101, 3102, 3103, 3800, 4400, 4901, 4902, 4903, 4904};

const std::vector<int> kTransverse1983 = {
    101,  102,  5002, 5003, 5004, 5005, 5006, 5007, 5008, 5009, 201,  202,  203,  700,
    901,  902,  5101, 5102, 5103, 5104, 5105, 1001, 1002, 1101, 1102, 1103, 1201, 1202,
    1301, 1302, 1801, 1802, 2301, 2302, 2401, 2402, 2403, 2701, 2702, 2703, 2800, 2900,
    3001, 3002, 3003, 3101, 3102, 3103, 3800, 4400, 4901, 4902, 4903, 4904};

// A row as it is published: degrees, and feet or metres.
struct Row {
  int type = 0;
  double lon0 = 0, lat0 = 0, false_easting = 0, false_northing = 0, s = 0, lat1 = 0, lat2 = 0;
};

void expect_row(const Zone& zone, const Row& row, double unit, const std::string& name) {
  SCOPED_TRACE(name);
  EXPECT_EQ(zone.status, TW_SUCCESS);
  EXPECT_EQ(zone.type, row.type);
  EXPECT_EQ(zone.lon0, row.lon0 * kDegree);
  EXPECT_EQ(zone.lat0, row.lat0 * kDegree);
  EXPECT_EQ(zone.false_easting, row.false_easting * unit);
  EXPECT_EQ(zone.false_northing, row.false_northing * unit);
  EXPECT_EQ(zone.k0, 1.0 - row.s);
  if (row.type == 1) {
    EXPECT_EQ(zone.lat1, row.lat1 * kDegree);
    EXPECT_EQ(zone.lat2, row.lat2 * kDegree);
  } else {
    EXPECT_EQ(zone.lat1, kUntouched);
    EXPECT_EQ(zone.lat2, kUntouched);
  }
  if (row.type != -1) {
    EXPECT_EQ(zone.lon_center, kUntouched);
    EXPECT_EQ(zone.lat_center, kUntouched);
    EXPECT_EQ(zone.azimuth, kUntouched);
  }
}

void expect_lists(ZoneFunction function, const std::vector<int>& list,
                  const std::vector<int>& transverse) {
  for (int number = -5400; number <= 6000; ++number) {
    const Zone zone(function, std::to_string(number));
    if (std::find(list.begin(), list.end(), number) == list.end()) {
      ASSERT_EQ(zone.status, TW_BAD_ZONE) << number;
      ASSERT_TRUE(zone.untouched()) << number;
      continue;
    }
    const bool is_transverse =
        std::find(transverse.begin(), transverse.end(), number) != transverse.end();
    ASSERT_EQ(zone.status, TW_SUCCESS) << number;
    EXPECT_EQ(zone.type, number == 5001 ? -1 : is_transverse ? 0 : 1) << number;
  }
}

TEST(StatePlane, ListsAndTypes) {
  EXPECT_EQ(kList1927.size(), 133u);
  EXPECT_EQ(kList1983.size(), 123u);
  expect_lists(TWspcs27, kList1927, kTransverse1927);
  expect_lists(TWspcs83, kList1983, kTransverse1983);
}

TEST(StatePlane, TellingRowsOf1927) {
  const double michigan = -3.8200000000099266e-05;
  const std::vector<std::pair<int, Row>> rows = {
      {101, {0, -85.83333333333333, 30.5, 500000, 0, 4e-05}},
      {5007, {0, -162, 54, 700000, 0, 1e-4}},
      {5009, {0, -170, 54, 600000, 0, 1e-4}},
      {2900, {0, -74.66666666666667, 38.833333333333336, 2000000, 0, 2.5e-05}},
      {5105, {0, -160.16666666666666, 21.666666666666668, 500000, 0, 0}},
      {407,
       {1, -118.33333333333333, 34.13333333333333, 4186692.58, 4160926.74, 0, 33.86666666666667,
        34.416666666666664}},
      {5010, {1, -176, 51, 3000000, 0, 0, 51.833333333333336, 53.833333333333336}},
      {600, {1, -72.75, 40.833333333333336, 600000, 0, 0, 41.2, 41.86666666666667}},
      {1900, {1, -77, 37.833333333333336, 800000, 0, 0, 38.3, 39.45}},
      {2001, {1, -71.5, 41, 600000, 0, 0, 41.71666666666667, 42.68333333333333}},
      {2002, {1, -70.5, 41, 200000, 0, 0, 41.28333333333333, 41.483333333333334}},
      {2101, {0, -83.66666666666667, 41.5, 500000, 0, 1.8945039999884727e-05}},
      {2102, {0, -85.75, 41.5, 500000, 0, 5.271256363637011e-05}},
      {2103, {0, -88.75, 41.5, 500000, 0, 5.271256363637011e-05}},
      {2111,
       {1, -87, 44.78333333333333, 2000000, 0, michigan, 45.483333333333334, 47.083333333333336}},
      {2112,
       {1, -84.33333333333333, 43.31666666666667, 2000000, 0, michigan, 44.18333333333333, 45.7}},
      {2113, {1, -84.33333333333333, 41.5, 2000000, 0, michigan, 42.1, 43.666666666666664}},
      {3104, {1, -74, 40.5, 2000000, 100000, 0, 40.666666666666664, 41.03333333333333}},
      {4100, {1, -86, 34.666666666666664, 2000000, 100000, 0, 35.25, 36.416666666666664}},
      {5201,
       {1, -66.43333333333334, 17.833333333333332, 500000, 0, 0, 18.033333333333335,
        18.433333333333334}},
      {5202,
       {1, -66.43333333333334, 17.833333333333332, 500000, 100000, 0, 18.033333333333335,
        18.433333333333334}},
      {5300, {1, -170, -90, 500000, -82000000, 0, -14.266666666666667, -14.266666666666667}},
  };
  for (const auto& [number, row] : rows) {
    expect_row(Zone(TWspcs27, std::to_string(number)), row, kFoot, std::to_string(number));
  }
  EXPECT_EQ(Zone(TWspcs27, "2101").k0, 0.9999810549600001);
  EXPECT_EQ(Zone(TWspcs27, "2102").k0, 0.9999472874363636);
  EXPECT_EQ(Zone(TWspcs27, "2111").k0, 1.0000382);  // a Lambert zone with a scale
  EXPECT_EQ(Zone(TWspcs27, "5105").k0, 1.0);
}

TEST(StatePlane, TellingRowsOf1983) {
  const std::vector<std::pair<int, Row>> rows = {
      {101, {0, -85.83333333333333, 30.5, 200000, 0, 4e-05}},
      {5105, {0, -160.16666666666666, 21.666666666666668, 500000, 0, 0}},
      {501,
       {1, -105.5, 39.333333333333336, 914401.8289, 304800.6096, 0, 39.71666666666667,
        40.78333333333333}},
      {600, {1, -72.75, 40.833333333333336, 304800.6096, 152400.3048, 0, 41.2, 41.86666666666667}},
      {3200, {1, -79, 33.75, 609601.22, 0, 0, 34.333333333333336, 36.166666666666664}},
      {3900, {1, -81, 31.833333333333332, 609600, 0, 0, 32.5, 34.833333333333336}},
      {2701, {0, -115.58333333333333, 34.75, 200000, 8000000, 1e-4}},
      {2500, {1, -109.5, 44.25, 600000, 0, 0, 45, 49}},
      {2600, {1, -100, 39.833333333333336, 500000, 0, 0, 40, 43}},
  };
  for (const auto& [number, row] : rows) {
    expect_row(Zone(TWspcs83, std::to_string(number)), row, 1, std::to_string(number));
  }
  for (const char* number : {"502", "503"}) {
    EXPECT_EQ(Zone(TWspcs83, number).false_easting, 914401.8289);
    EXPECT_EQ(Zone(TWspcs83, number).false_northing, 304800.6096);
  }
  EXPECT_EQ(Zone(TWspcs83, "2702").false_northing, 6000000);
  EXPECT_EQ(Zone(TWspcs83, "2703").false_northing, 4000000);
}

TEST(StatePlane, PanhandleIsInMetresInBothSystems) {
  for (const ZoneFunction function : {TWspcs27, TWspcs83}) {
    const Zone zone(function, "5001");
    EXPECT_EQ(zone.status, TW_SUCCESS);
    EXPECT_EQ(zone.type, -1);
    EXPECT_EQ(zone.lon0, -101.51403144166666 * kDegree);
    EXPECT_EQ(zone.lat0, 0);
    EXPECT_EQ(zone.false_easting, 5000000.0);
    EXPECT_EQ(zone.false_northing, -5000000.0);
    EXPECT_EQ(zone.k0, 0.9999);
    EXPECT_EQ(zone.lon_center, -133.66666666666666 * kDegree);
    EXPECT_EQ(zone.lat_center, 57.0 * kDegree);
    // The angle of a triangle with the sides 3, 4 and 5, and not in degrees.
    EXPECT_NEAR(std::sin(zone.azimuth), -0.6, 1e-15);
    EXPECT_NEAR(std::cos(zone.azimuth), 0.8, 1e-15);
    EXPECT_EQ(zone.lat1, kUntouched);
    EXPECT_EQ(zone.lat2, kUntouched);
  }
}

TEST(StatePlane, RulesOf1927) {
  // What the published zones have in common, but for those of the test of telling rows.
  const std::vector<int> reductions = {10000,  25000, 15000, 30000, 17000,  19000,  40000,
                                       100000, 11000, 12000, 16000, 160000, 200000, 28000};
  for (const int number : kList1927) {
    const Zone zone(TWspcs27, std::to_string(number));
    if (zone.type == 0 && number != 5007 && number != 5009 && number != 2900) {
      EXPECT_EQ(zone.false_easting, 500000 * kFoot) << number;
      EXPECT_EQ(zone.false_northing, 0) << number;
    }
    if (zone.type == 0 && number != 5105 && (number < 2101 || number > 2103)) {
      EXPECT_TRUE(std::any_of(reductions.begin(), reductions.end(), [&](int n) {
        return zone.k0 == 1.0 - 1.0 / n;
      })) << number;
    }
    const bool telling = number == 407 || number == 5010 || number == 600 || number == 1900 ||
                         number == 2001 || number == 2002 || number == 3104 || number == 4100 ||
                         number == 5201 || number == 5202 || number == 5300;
    if (zone.type == 1 && !telling) {
      EXPECT_EQ(zone.false_easting, 2000000 * kFoot) << number;
      EXPECT_EQ(zone.false_northing, 0) << number;
      if (number < 2111 || number > 2113) {
        EXPECT_EQ(zone.k0, 1.0) << number;
      }
    }
  }
}

TEST(StatePlane, RulesOf1983) {
  for (const int number : kList1983) {
    const Zone zone(TWspcs83, std::to_string(number));
    if (zone.type == 1) {
      EXPECT_EQ(zone.k0, 1.0) << number;
    }
  }
}

TEST(StatePlane, Text) {
  for (const char* text :
       {"101", "101AL", "101 102", "  101", "\t\n101", "+101", "00101", "101.9"}) {
    EXPECT_EQ(Zone(TWspcs27, text).false_easting, 500000 * kFoot) << text;
    EXPECT_EQ(Zone(TWspcs83, text).false_easting, 200000) << text;
  }
  // No number, a number that is no zone, and numbers that would be zone 101 in 16 or in 32 bits.
  for (const char* text :
       {"", " ", "AL101", "x", "-", "+", "-101", "0", "100", "1O1", "65637", "-65435", "4294967397",
        "18446744073709551717", "99999999999999999999999999"}) {
    for (const ZoneFunction function : {TWspcs27, TWspcs83}) {
      const Zone zone(function, text);
      EXPECT_EQ(zone.status, TW_BAD_ZONE) << text;
      EXPECT_TRUE(zone.untouched()) << text;
    }
  }
}

TEST(StatePlane, ZonesOfOneSystemOnly) {
  for (const char* text : {"407", "2101", "2102", "2103", "2501", "2502", "2503", "2601", "2602",
                           "3901", "3902", "5201", "5202", "5300"}) {
    EXPECT_EQ(Zone(TWspcs27, text).status, TW_SUCCESS) << text;
    EXPECT_TRUE(Zone(TWspcs83, text).untouched()) << text;
  }
  for (const char* text : {"2500", "2600", "3900", "5200"}) {
    EXPECT_EQ(Zone(TWspcs83, text).status, TW_SUCCESS) << text;
    EXPECT_TRUE(Zone(TWspcs27, text).untouched()) << text;
  }
}

// Every zone beside a file of the published definitions, read here on its own.
void expect_file(const char* name, ZoneFunction function, const std::vector<int>& list,
                 double unit) {
  std::ifstream file(shared_data() / name);
  ASSERT_TRUE(file);
  std::string line;
  std::getline(file, line);
  ASSERT_EQ(line,
            "zone,type,lon0,lat0,false_easting,false_northing,s,lat1,lat2,lon_center,lat_center,"
            "azimuth");
  std::vector<int> order;
  while (std::getline(file, line)) {
    std::vector<double> cells;
    std::istringstream text(line);
    for (std::string cell; std::getline(text, cell, ',');) {
      cells.push_back(cell.empty() ? 0 : std::stod(cell));
    }
    cells.resize(12);
    const int number = static_cast<int>(cells[0]);
    order.push_back(number);
    const Row row = {static_cast<int>(cells[1]),
                     cells[2],
                     cells[3],
                     cells[4],
                     cells[5],
                     cells[6],
                     cells[7],
                     cells[8]};
    const Zone zone(function, std::to_string(number));
    expect_row(zone, row, number == 5001 ? 1 : unit, std::to_string(number));
    if (row.type == -1) {
      EXPECT_EQ(zone.lon_center, cells[9] * kDegree);
      EXPECT_EQ(zone.lat_center, cells[10] * kDegree);
      EXPECT_DOUBLE_EQ(zone.azimuth, cells[11]);
    }
  }
  EXPECT_EQ(order, list);
}

TEST(StatePlane, PublishedDefinitions) {
  TIDEWATER_NEED_SHARED_DATA();
  expect_file("zones_1927.csv", TWspcs27, kList1927, kFoot);
  expect_file("zones_1983.csv", TWspcs83, kList1983, 1);
}

}  // namespace
