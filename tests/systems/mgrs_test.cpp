#include <gtest/gtest.h>

#include <cmath>
#include <random>

#include "support/text.hpp"
#include "tidewater/position_text.hpp"

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
#include <GeographicLib/MGRS.hpp>
#include <GeographicLib/UTMUPS.hpp>
#endif

using namespace tidewater;

namespace {

void expect_square(std::string_view text, int zone, bool north, double easting, double northing,
                   double square) {
  const GridPosition grid = parse_mgrs(text);
  EXPECT_TRUE(grid) << text << ": " << grid.reason;
  EXPECT_EQ(grid.zone, zone) << text;
  EXPECT_EQ(grid.north, north) << text;
  EXPECT_NEAR(grid.easting, easting, 1e-9) << text;
  EXPECT_NEAR(grid.northing, northing, 1e-9) << text;
  EXPECT_DOUBLE_EQ(grid.square, square) << text;
}

void expect_refused(std::string_view text, std::string_view words) {
  const GridPosition grid = parse_mgrs(text);
  EXPECT_FALSE(grid) << text;
  EXPECT_TRUE(std::isnan(grid.easting) && std::isnan(grid.northing)) << text;
  EXPECT_NE(grid.reason.find(words), std::string::npos) << text << ": " << grid.reason;
}

// FGDC-STD-011-2001, United States National Grid, section 3: the Washington Monument is
// 18SUJ2348306479; NGA.SIG.0012 and TM 8358.1 have 18SUU8401 and 15SWC among their examples.
TEST(Mgrs, PublishedReferences) {
  expect_square("18SUJ2348306479", 18, true, 323483, 4306479, 1);
  expect_square("18SUJ23480647", 18, true, 323480, 4306470, 10);
  expect_square("18SUJ2306", 18, true, 323000, 4306000, 1000);
  expect_square("18SUJ", 18, true, 300000, 4300000, 100000);
  expect_square("15SWC", 15, true, 500000, 4200000, 100000);
  const ParsedPosition monument = position_of(parse_mgrs("18SUJ2348306479"));
  EXPECT_NEAR(monument.latitude, 38.889468, 1e-5);
  EXPECT_NEAR(monument.longitude, -77.035237, 1e-5);
  EXPECT_EQ(format_mgrs(-77.03524, 38.88947, 3), "18SUJ234064");
}

TEST(Mgrs, FormsOfTheText) {
  for (const char* text : {"31UDQ4825111932", "31U DQ 48251 11932", " 31 u dq 4825111932 ",
                           "31U\tDQ48251 11932\n", "31UDQ\r48251 11932\r\n", "31UD Q48251 11932"}) {
    expect_square(text, 31, true, 448251, 5411932, 1);
  }
  expect_square("31UDQ48251251193225", 31, true, 448251.25, 5411932.25, 0.01);
  expect_square("31UDQ4825125000011932250000", 31, true, 448251.25, 5411932.25, 1e-6);
  expect_square("1CCV", 1, false, 300000, 1900000, 100000);
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 448251.75, 5411932.25}, 5), "31UDQ4825111932");
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 448251.75, 5411932.25}, 5, true),
            "31U DQ 48251 11932");
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 448251.75, 5411932.25}, 0), "31UDQ");
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 448251.75, 5411932.25}, 7), "31UDQ48251751193225");
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 448251.75, 5411932.25}, 11),
            "31UDQ4825175000011932250000");
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 448251.75, 5411932.25}, 99),
            "31UDQ4825175000011932250000");
  EXPECT_EQ(format_mgrs(GridPosition{4, true, 448251.75, 5411932.25}, 0, true).substr(0, 3), "04U");
}

TEST(Mgrs, PolarBands) {
  // The poles themselves are the south-western corners of their squares.
  expect_square("ZAH", 0, true, 2000000, 2000000, 100000);
  expect_square("BAN", 0, false, 2000000, 2000000, 100000);
  EXPECT_EQ(format_mgrs(0, 90, 0), "ZAH");
  EXPECT_EQ(format_mgrs(0, -90, 0), "BAN");
  EXPECT_EQ(format_mgrs(0, 90, 5, true), "Z AH 00000 00000");
  EXPECT_EQ(format_mgrs(-90, 85, 0).substr(0, 1), "Y");
  EXPECT_EQ(format_mgrs(90, 85, 0).substr(0, 1), "Z");
  EXPECT_EQ(format_mgrs(-90, -85, 0).substr(0, 1), "A");
  EXPECT_EQ(format_mgrs(90, -85, 0).substr(0, 1), "B");
}

TEST(Mgrs, ZonesOfNorwayAndSvalbard) {
  EXPECT_EQ(utm_zone(2.999, 60), 31);
  EXPECT_EQ(utm_zone(3, 60), 32);
  EXPECT_EQ(utm_zone(3, 55.999), 31);
  EXPECT_EQ(utm_zone(3, 64), 31);
  EXPECT_EQ(utm_zone(8.999, 72), 31);
  EXPECT_EQ(utm_zone(9, 72), 33);
  EXPECT_EQ(utm_zone(20.999, 80), 33);
  EXPECT_EQ(utm_zone(21, 80), 35);
  EXPECT_EQ(utm_zone(32.999, 80), 35);
  EXPECT_EQ(utm_zone(33, 80), 37);
  EXPECT_EQ(utm_zone(41.999, 80), 37);
  EXPECT_EQ(utm_zone(42, 80), 38);
  EXPECT_EQ(utm_zone(10, 71.999), 32);
  EXPECT_EQ(utm_zone(-180, 0), 1);
  EXPECT_EQ(utm_zone(180, 0), 1);
  EXPECT_EQ(utm_zone(540, 0), 1);
  EXPECT_EQ(utm_zone(179.999, 0), 60);
  EXPECT_EQ(utm_zone(std::nextafter(180, 0), 0), 60);
  EXPECT_EQ(utm_zone(std::nextafter(6, 0), 0), 31);
  EXPECT_EQ(utm_zone(0, 84), 0);
  EXPECT_EQ(utm_zone(0, 83.999), 31);
  EXPECT_EQ(utm_zone(0, -80), 31);
  EXPECT_EQ(utm_zone(0, -80.001), 0);
  EXPECT_EQ(utm_zone(0, 90.001), -1);
  EXPECT_EQ(utm_zone(std::nan(""), 0), -1);
  EXPECT_EQ(utm_zone(HUGE_VAL, 0), -1);
  EXPECT_EQ(utm_zone(0, std::nan("")), -1);
}

TEST(Mgrs, ImpossibleReferencesAreRefused) {
  expect_refused("", "no grid reference");
  expect_refused("31U", "no grid reference");
  expect_refused("31UDQ 48x", "no grid reference");
  expect_refused("031UDQ", "no grid reference");
  expect_refused("31UDQ4825-11932", "no grid reference");
  expect_refused("0UDQ", "zones are 1 to 60");
  expect_refused("61UDQ", "zones are 1 to 60");
  expect_refused("31IDQ", "band I");
  expect_refused("31ODQ", "band O");
  expect_refused("31ADQ", "band A");
  expect_refused("31YDQ", "band Y");
  expect_refused("31UIQ", "column I");
  expect_refused("31UJQ", "columns of zone 31 are A to H");
  expect_refused("31UDO", "row O");
  expect_refused("31UDW", "row W");
  expect_refused("31UDH", "does not lie in band U");
  expect_refused("31XAH", "does not lie in");
  expect_refused("32XNL", "no part in band X");
  expect_refused("UDQ", "polar bands");
  expect_refused("ZKH", "columns of band Z");
  expect_refused("ZAQ", "rows of band Z");
  expect_refused("31UDQ482511193", "odd number");
  expect_refused("31UDQ 4825 11932", "unequal length");
  expect_refused("31UDQ 482 51 11932", "unequal length");
  for (const std::size_t count : {23u, 24u, 1000u}) {
    expect_refused("31UDQ" + std::string(count, '1'), "more than 11 digits each");
  }
  expect_refused(std::string(1000, '3'), "no grid reference");
  // The corner of the square that is nearest to the pole is 600 km away on both axes.
  expect_refused("YRA", "does not lie in the polar zone");
  expect_refused("AJA", "does not lie in the polar zone");
  EXPECT_TRUE(parse_mgrs("YUB1798816324"));
  for (const char* odd : {"31UDQ{", "31U@Q", "31UDQ[1", "{", "31U1DQ", "31UDQA"}) {
    expect_refused(odd, "no grid reference");
  }
  EXPECT_EQ(format_mgrs(0, 91), "");
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 50000, 5411932}), "");
  EXPECT_EQ(format_mgrs(GridPosition{61, true, 500000, 5411932}), "");
  EXPECT_EQ(format_mgrs(GridPosition{0, true, 50000, 50000}), "");
  // Beyond the letters of the polar squares, on each side.
  for (const auto& [x, y] : {std::pair{1.25e6, 2e6}, {2.75e6, 2e6}, {2e6, 1.25e6}, {2e6, 2.75e6}}) {
    EXPECT_EQ(format_mgrs(GridPosition{0, true, x, y}), "") << x << ' ' << y;
  }
  // Columns 1 to 8, latitudes of the zones and half a degree.
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 950000, 1e6}), "");
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 500000, 9.4e6}), "");
  EXPECT_EQ(format_mgrs(GridPosition{31, false, 500000, 1e6}), "");
  EXPECT_FALSE(grid_position(0, 45, 61));
  EXPECT_FALSE(grid_position(0, 45, -2));
  EXPECT_FALSE(grid_position(0, 91));
  EXPECT_FALSE(grid_position(std::nan(""), 0));
  EXPECT_FALSE(position_of(GridPosition{}));
}

TEST(Mgrs, AnotherZoneThanThePointsOwn) {
  // Half a degree to either side of Greenwich, the border of zones 30 and 31.
  const GridPosition own = grid_position(0.5, 45), other = grid_position(-0.5, 45, 31);
  EXPECT_EQ(own.zone, 31);
  EXPECT_EQ(other.zone, 31);
  EXPECT_NEAR(position_of(other).longitude, -0.5, 1e-12);
  EXPECT_NEAR(position_of(other).latitude, 45, 1e-12);
  // By the pole's grid anywhere in its hemisphere.
  const GridPosition polar = grid_position(0, 60, 0);
  EXPECT_EQ(polar.easting, 2e6);
  EXPECT_NEAR(position_of(polar).latitude, 60, 1e-12);
  EXPECT_EQ(grid_position(100, 0, 31).reason, "The point is too far from zone 31.");
  const double kNaN = std::nan("");
  for (const GridPosition& none :
       {GridPosition{31, true, 1e8, 0}, GridPosition{31, true, 500000, kNaN},
        GridPosition{0, true, kNaN, 2e6}, GridPosition{0, false, HUGE_VAL, 2e6},
        GridPosition{0, true, 2e6, -HUGE_VAL}}) {
    EXPECT_EQ(position_of(none).reason, "The grid has no point at these coordinates.");
    EXPECT_TRUE(std::isnan(position_of(none).latitude));
    EXPECT_EQ(format_mgrs(none), "");
  }
}

TEST(Mgrs, TheEquatorBelongsToTheNorth) {
  EXPECT_EQ(format_mgrs(GridPosition{31, false, 500000, 1e7}, 0), "31NEA");
  EXPECT_EQ(format_mgrs(3, 0, 5), "31NEA0000000000");
  EXPECT_EQ(format_mgrs(3, -1e-13, 5), "31MEV0000099999");
  // So near that its northing is the false northing itself, and 80 degrees more are 80.
  EXPECT_EQ(format_mgrs(3, -1e-15, 5), "31MEV0000099999");
  EXPECT_EQ(format_mgrs(GridPosition{31, true, 500000, -1}, 5), "31MEV0000099999");
}

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB

TEST(Mgrs, AgreesWithGeographicLib) {
  std::mt19937_64 random(11);
  std::uniform_real_distribution<double> lon(-180, 180);
  std::uniform_real_distribution<double> sine(-1, 1);
  for (int i = 0; i < 20000; ++i) {
    const double longitude = lon(random);
    // As many near the poles and in the north as elsewhere.
    const double latitude = i % 4 == 0   ? 70 + 20 * std::fabs(sine(random))
                            : i % 4 == 1 ? -75 - 15 * std::fabs(sine(random))
                                         : 90 * sine(random);
    int zone = 0;
    bool north = false;
    double x = 0, y = 0;
    GeographicLib::UTMUPS::Forward(latitude, longitude, zone, north, x, y);
    ASSERT_EQ(utm_zone(longitude, latitude), zone) << longitude << ' ' << latitude;
    const GridPosition ours = grid_position(longitude, latitude);
    ASSERT_TRUE(ours);
    EXPECT_NEAR(ours.easting, x, 2e-8) << longitude << ' ' << latitude;
    EXPECT_NEAR(ours.northing, y, 2e-8) << longitude << ' ' << latitude;
    EXPECT_EQ(ours.north, north);
    const ParsedPosition back = position_of(ours);
    EXPECT_NEAR(back.latitude, latitude, 1e-12);
    EXPECT_NEAR(std::remainder(back.longitude - longitude, 360) *
                    std::cos(latitude * tidewater::test::kPi / 180),
                0, 1e-12);

    const int digits = i % 12;
    std::string theirs;
    GeographicLib::MGRS::Forward(zone, north, x, y, digits, theirs);
    const std::string text = format_mgrs(GridPosition{zone, north, x, y}, digits);
    EXPECT_EQ(text, theirs);
    const GridPosition read = parse_mgrs(text);
    ASSERT_TRUE(read) << text << ": " << read.reason;
    int peer_zone = 0, peer_digits = 0;
    bool peer_north = false;
    GeographicLib::MGRS::Reverse(theirs, peer_zone, peer_north, x, y, peer_digits, false);
    EXPECT_EQ(read.zone, peer_zone);
    EXPECT_EQ(read.north, peer_north);
    EXPECT_NEAR(read.easting, x, 2e-9) << text;
    EXPECT_NEAR(read.northing, y, 2e-9) << text;
  }
}

// Whether a point of the square, on a lattice of 10 km, lies in the cell with a margin in degrees.
bool square_has_cell_point(int zone, char band, double x0, double y0, bool north, double margin) {
  for (int i = 0; i <= 10; ++i) {
    for (int k = 0; k <= 10; ++k) {
      double latitude = 0, longitude = 0;
      try {
        GeographicLib::UTMUPS::Reverse(zone, north, x0 + i * 1e4, y0 + k * 1e4, latitude,
                                       longitude);
      } catch (const GeographicLib::GeographicErr&) {
        continue;
      }
      const double south =
          -80 + 8.0 * static_cast<double>(std::string("CDEFGHJKLMNPQRSTUVWX").find(band));
      const double top = band == 'X' ? 84 : south + 8;
      if (latitude < south || latitude > top) continue;
      for (const double shift : {-margin, 0.0, margin}) {
        if (utm_zone(longitude + shift, std::min(latitude, 83.999)) == zone) return true;
      }
    }
  }
  return false;
}

// Every square of some zones: what the peer refuses is refused here, and what only we refuse has no
// point in its cell.
TEST(Mgrs, SquaresAreThoseThatExist) {
  int refused_here_alone = 0, accepted = 0;
  for (const int zone : {1, 2, 3, 31, 32, 33, 37}) {
    for (const char band : std::string("CDEFGHJKLMNPQRSTUVWX")) {
      for (char column = 'A'; column <= 'Z'; ++column) {
        for (char row = 'A'; row <= 'Z'; ++row) {
          const std::string text = std::to_string(zone) + band + column + row;
          const GridPosition grid = parse_mgrs(text);
          int peer_zone = 0, digits = 0;
          bool north = false;
          double x = 0, y = 0;
          bool peer = true;
          try {
            GeographicLib::MGRS::Reverse(text, peer_zone, north, x, y, digits, false);
          } catch (const GeographicLib::GeographicErr&) {
            peer = false;
          }
          if (grid) {
            ++accepted;
            EXPECT_TRUE(peer) << text;
            EXPECT_EQ(grid.easting, x) << text;
            EXPECT_EQ(grid.northing, y) << text;
          } else if (peer) {
            ++refused_here_alone;
            EXPECT_FALSE(square_has_cell_point(zone, band, x, y, north, 0.4)) << text;
          }
        }
      }
    }
  }
  EXPECT_GT(accepted, 5000);
  EXPECT_GT(refused_here_alone, 1000);
}

#else

TEST(Mgrs, AgreesWithGeographicLib) { GTEST_SKIP() << "GeographicLib is not on this machine"; }

#endif

}  // namespace
