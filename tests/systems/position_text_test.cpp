#include <gtest/gtest.h>

#include <cmath>

#include "support/text.hpp"
#include "tidewater/position_text.hpp"

using namespace tidewater;

namespace {

constexpr double kLatitude = 48 + 51 / 60.0 + 24 / 3600.0;
constexpr double kLongitude = 2 + 21 / 60.0 + 3 / 3600.0;

void expect_position(std::string_view text, double longitude, double latitude,
                     Order order = Order::unknown, double height = NAN, bool comma = false) {
  const ParsedPosition position = parse_position(text, order, comma);
  EXPECT_TRUE(position) << text << ": " << position.reason;
  EXPECT_NEAR(position.longitude, longitude, 1e-13) << text;
  EXPECT_NEAR(position.latitude, latitude, 1e-13) << text;
  if (std::isnan(height)) {
    EXPECT_TRUE(std::isnan(position.height)) << text;
  } else {
    EXPECT_EQ(position.height, height) << text;
  }
}

void expect_refused(std::string_view text, std::string_view words, Order order = Order::unknown) {
  const ParsedPosition position = parse_position(text, order);
  EXPECT_FALSE(position) << text;
  EXPECT_TRUE(std::isnan(position.longitude) && std::isnan(position.latitude)) << text;
  EXPECT_NE(position.reason.find(words), std::string::npos) << text << ": " << position.reason;
}

TEST(PositionFromText, PlainNumbersInTheOrderTold) {
  const auto first = Order::longitude_first;
  for (const char* text : {"2.5 48.25", "2.5,48.25", "2.5, 48.25", " 2.5 ; 48.25 \n", "2.5\t48.25",
                           "+2.5 +48.25", "2.5 \t 48.25", "2.5 / 48.25"}) {
    expect_position(text, 2.5, 48.25, first);
  }
  expect_position("48.25 2.5", 2.5, 48.25, Order::latitude_first);
  expect_position("-2.5 -48.25", -2.5, -48.25, first);
  expect_position("2.5 48.25 35", 2.5, 48.25, first, 35);
  expect_position("2.5, 48.25, -35.5 m", 2.5, 48.25, first, -35.5);
  expect_position("2.5 48.25 8848", 2.5, 48.25, first, 8848);
  expect_position("2 48", 2, 48, first);
  expect_position("2 30 48 15", 2.5, 48.25, first);
  expect_position("2 30 00 48 15 00", 2.5, 48.25, first);
  expect_position("2 30 -48 15", 2.5, -48.25, first);
  expect_position("-2 30 48 15", -2.5, 48.25, first);
  expect_position("-2 30 -48 15", -2.5, -48.25, first);
  expect_position("2:30 48:15", 2.5, 48.25, first);
  expect_position("-2:30:00 -48:15:00 12", -2.5, -48.25, first, 12);
}

TEST(PositionFromText, LettersDecide) {
  for (const char* text :
       {"48\u00B051'24\"N 2\u00B021'03\"E", "2\u00B021'03\"E 48\u00B051'24\"N", "N48 51.4 E2 21.05",
        "N48 51.4, E2 21.05", "48 51 24 N 2 21 03 E", "485124N 0022103E", "485124N0022103E",
        "N485124E0022103", "48\u00B051'24\"N, 2\u00B021'03\"", "48:51:24N;2:21:03E",
        "48-51-24N 2-21-03E", "48d51m24sN 2d21m3sE"}) {
    expect_position(text, kLongitude, kLatitude);
    expect_position(text, kLongitude, kLatitude, Order::longitude_first);
    expect_position(text, kLongitude, kLatitude, Order::latitude_first);
  }
  expect_position("48.25S 2.5W 35m", -2.5, -48.25, Order::unknown, 35);
  expect_position("48.25S 2.5W", -2.5, -48.25);
}

TEST(PositionFromText, DegreeSignsAndSignsPart) {
  expect_position("48\u00B051'24\" 2\u00B021'03\"", kLongitude, kLatitude, Order::latitude_first);
  expect_position("-48\u00B051'24\" -2\u00B021'03\"", -kLongitude, -kLatitude,
                  Order::latitude_first);
  expect_position("48.25\u00B0 -2.5\u00B0", -2.5, 48.25, Order::latitude_first);
}

TEST(PositionFromText, TheOrderIsNeverGuessed) {
  expect_refused("48.25 2.5", "order");
  expect_refused("148.25 122.5", "both are beyond 90");
  // An angle beyond 90 degrees is a longitude.
  expect_position("148.25 2.5", 148.25, 2.5);
  expect_position("2.5 148.25", 148.25, 2.5);
  // With a blank between, signs are no form of ISO 6709, which has latitude first.
  expect_position("+148.25 -002.5", 148.25, -2.5);
  expect_refused("+48.25 -002.5/", "sign amid");
  expect_refused("2.5 148.25", "beyond 90", Order::longitude_first);
}

TEST(PositionFromText, TheFormWithASolidus) {
  expect_position("+48.8577+002.2950/", 2.295, 48.8577);
  expect_position("+48.8577+002.2950/", 2.295, 48.8577, Order::longitude_first);
  expect_position("-33.8577-002.2950+12.5/", -2.295, -33.8577, Order::unknown, 12.5);
  expect_position("+485124-0022103/", -kLongitude, kLatitude);
  expect_position("+4851.4+00221.05/", kLongitude, kLatitude);
  expect_position("+48.25-002.5", -2.5, 48.25, Order::latitude_first);
}

TEST(PositionFromText, DecimalCommas) {
  const auto first = Order::longitude_first;
  expect_position("2,5; 48,25", 2.5, 48.25, first, NAN, true);
  expect_position("2,5 48,25", 2.5, 48.25, first, NAN, true);
  expect_position("2,5, 48,25", 2.5, 48.25, first, NAN, true);
  expect_position("2.5, 48.25", 2.5, 48.25, first, NAN, true);
  expect_position("48\u00B015,0'N 2\u00B030,0'E", 2.5, 48.25, first, NAN, true);
  EXPECT_FALSE(parse_position("2,5,48,25", first, true));
  // Not told, the comma parts.
  expect_position("2,48", 2, 48, first);
  expect_refused("2,5;48,25", "more than two angles", first);
}

TEST(PositionFromText, WhatIsAmbiguousOrWrongIsRefused) {
  const auto first = Order::longitude_first;
  expect_refused("", "no position", first);
  expect_refused(" \n", "no position", first);
  expect_refused("48.25", "where the second angle", first);
  expect_refused("48 51 24", "where the second angle", first);
  expect_refused("2 30 48 15 7", "where the second angle", first);
  expect_refused("-2 -48 -7", "where the second angle", first);
  expect_refused("2.5 48 35", "where the second angle", first);
  expect_refused("2.5,,48", "no angle", first);
  expect_refused(",2.5,48", "no angle", first);
  expect_refused("2.5,48,", "no height", first);
  expect_refused("2.5,48,1,2", "more than two angles", first);
  expect_refused("2.5,48,high", "\"high\"", first);
  expect_refused("2.5,48,35N", "no height", first);
  expect_refused("48N 49S", "two latitudes", first);
  expect_refused("48E 49W", "two longitudes", first);
  expect_refused("48 N 2", "where the second angle", first);
  expect_refused("48N 2E 3W", "two hemisphere letters", first);
  expect_refused("48\u00B051' E 2\u00B021'", "where the second angle", first);
  expect_refused("2.5 91", "beyond 90", first);
  expect_refused("361 45", "beyond 360", first);
  expect_refused("31UDQ4825111932", "UDQ", first);
  expect_refused("1.2.3", "two decimal marks", first);
  expect_refused("2.5 abc", "\"abc\"", first);
}

TEST(PositionFromText, NothingElseHappensToGarbage) {
  const std::string alphabet = "0123456789.,;:+-NSEW d'\"m\t/e";
  unsigned seed = 12345;
  for (unsigned i = 0; i < 200000; ++i) {
    std::string text;
    const unsigned length = 1 + i % 24;
    for (unsigned k = 0; k < length; ++k) {
      seed = seed * 1664525 + 1013904223;
      text += alphabet[(seed >> 16) % alphabet.size()];
    }
    const auto block = tidewater::test::exact<char>(text);
    for (const Order order : {Order::unknown, Order::longitude_first}) {
      const ParsedPosition p = parse_position({block.get(), text.size()}, order, i % 2 == 0);
      if (p) {
        EXPECT_LE(std::fabs(p.latitude), 90) << text;
        EXPECT_LE(std::fabs(p.longitude), 360) << text;
      } else {
        EXPECT_TRUE(std::isnan(p.latitude) && std::isnan(p.longitude)) << text;
      }
    }
  }
}

}  // namespace
