#include <gtest/gtest.h>

#include <cstring>

#include "support/text.hpp"

using namespace tidewater::test;

namespace {

class CoordinateText : public PlainLocaleTest {};

struct PointReading {
  CoordinateTriple point = kUntouchedPoint;
  TWstatus status = 0;
};

PointReading read_llh(std::string_view text, const AngleUnit& unit, int16_t order,
                      double height_unit = 1) {
  PointReading read;
  TWascii_to_llh(exact(text).get(), unit, order, height_unit, &read.point, &read.status);
  return read;
}

PointReading read_enh(std::string_view text, int16_t order, double unit = 1,
                      double height_unit = 1) {
  PointReading read;
  TWascii_to_enh(exact(text).get(), order, unit, height_unit, &read.point, &read.status);
  return read;
}

PointReading read_xyz(std::string_view text, double unit = 1) {
  PointReading read;
  TWascii_to_xyz(exact(text).get(), unit, &read.point, &read.status);
  return read;
}

void expect_point(const PointReading& read, double x, double y, double z) {
  EXPECT_EQ(read.status, TW_SUCCESS);
  expect_near(read.point, x, y, z, 2e-15);
}

void expect_refused(const PointReading& read, TWstatus status) {
  EXPECT_EQ(read.status, status);
  expect_untouched(read.point);
}

std::string write_llh(const CoordinateTriple& point, const AngleUnit& unit, int16_t order,
                      int16_t with_height, int16_t height_precision = 2, double height_unit = 1) {
  const auto text = std::make_unique<char[]>(156);
  TWstatus status = 0;
  TWllh_to_ascii(&point, unit, order, with_height, height_precision, height_unit, text.get(),
                 &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return text.get();
}

std::string write_enh(const CoordinateTriple& point, int16_t order, int16_t precision, double unit,
                      int16_t with_height, int16_t height_precision = 2, double height_unit = 1) {
  const auto text = std::make_unique<char[]>(182);
  TWstatus status = 0;
  TWenh_to_ascii(&point, order, precision, unit, with_height, height_precision, height_unit,
                 text.get(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return text.get();
}

std::string write_xyz(const CoordinateTriple& point, int16_t precision, double unit) {
  const auto text = std::make_unique<char[]>(158);
  TWstatus status = 0;
  TWxyz_to_ascii(&point, precision, unit, text.get(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return text.get();
}

TEST_F(CoordinateText, WritesGeodeticCoordinates) {
  const CoordinateTriple point = {degrees(-12.5), degrees(45.25), 123.456};
  EXPECT_EQ(write_llh(point, decimal_degrees(0, 2), 0, 0), "-12.50, 45.25");
  EXPECT_EQ(write_llh(point, decimal_degrees(0, 2), 1, 0), "45.25, -12.50");
  EXPECT_EQ(write_llh(point, decimal_degrees(0, 2), -1, 0), "45.25, -12.50");
  EXPECT_EQ(write_llh(point, decimal_degrees(0, 2), 0, 1), "-12.50, 45.25, 123.46");
  EXPECT_EQ(write_llh(point, decimal_degrees(0, 2), 7, -3, 1, 2), "45.25, -12.50, 61.7");
  EXPECT_EQ(write_llh(point, decimal_degrees(4, 2), 0, 0), "W12.50, N45.25");
  EXPECT_EQ(write_llh(point, decimal_degrees(2, 2), 0, 0), "-12.50, -45.25");
  EXPECT_EQ(write_llh(point, decimal_degrees(3, 2), 0, 0), "12.50, 45.25");
  EXPECT_EQ(write_llh(point, colon_form(5, 0), 1, 1, 0), "45:15:00N, 12:30:00W, 123");
  EXPECT_EQ(write_llh(point, packed_form(0, 0), 0, 0), "-12.3000, 45.1500");
  // The unit of the height is not tested.
  EXPECT_EQ(write_llh(point, decimal_degrees(0, 0), 0, 1, 1, 0), "-12, 45, inf");
  EXPECT_EQ(write_llh(point, decimal_degrees(0, 0), 0, 1, 0, -1), "-12, 45, -123");
}

TEST_F(CoordinateText, WritesGridCoordinates) {
  const CoordinateTriple point = {500000.125, -4000000.5, 10};
  EXPECT_EQ(write_enh(point, 0, 3, 1, 0), "500000.125, -4000000.500");
  EXPECT_EQ(write_enh(point, 1, 1, 1, 0), "-4000000.5, 500000.1");
  EXPECT_EQ(write_enh(point, 0, 1, 2, 1, 2, 4), "250000.1, -2000000.2, 2.50");
  EXPECT_EQ(write_enh(point, 5, 0, -1, 5, 0, 1), "4000000, -500000, 10");
}

TEST_F(CoordinateText, WritesGeocentricCoordinates) {
  EXPECT_EQ(write_xyz({1, -2, 3.25}, 2, 1), "1.00, -2.00, 3.25");
  EXPECT_EQ(write_xyz({1, -2, 3.25}, 2, -1), "-1.00, 2.00, -3.25");
  EXPECT_EQ(write_xyz({1, -2, 3}, 1, 0.5), "2.0, -4.0, 6.0");
}

TEST_F(CoordinateText, ARefusedUnitWritesNothing) {
  const CoordinateTriple point = {1, 2, 3};
  char text[] = "#";
  TWstatus status = 0;
  TWenh_to_ascii(&point, 0, 1, 0, 1, 1, 1, text, &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_STREQ(text, "#");
  status = 0;
  TWxyz_to_ascii(&point, 1, -0.0, text, &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_STREQ(text, "#");
}

TEST_F(CoordinateText, LongFieldsAreCut) {
  // The buffers of the helpers above have the sizes that the cuts allow.
  const std::string third = "0." + std::string(16, '3');
  const CoordinateTriple point = {1.0 / 3, 1.0 / 3, 1.0 / 3};
  for (const int16_t precision : std::initializer_list<int16_t>{60, 300, 32767}) {
    const AngleUnit unit = narrow_unit("", precision, 0, 1);
    const std::string llh = write_llh(point, unit, 0, 1, precision);
    EXPECT_EQ(llh.size(), 49u + 2 + 49 + 2 + 51);
    EXPECT_EQ(llh.substr(0, 18), third);
    EXPECT_EQ(llh.substr(51, 18), third);
    EXPECT_EQ(llh.substr(102, 18), third);
    const std::string enh = write_enh(point, 0, precision, 1, 1, precision);
    EXPECT_EQ(enh.size(), 59u + 2 + 59 + 2 + 59);
    EXPECT_EQ(enh.substr(61, 18), third);
    const std::string xyz = write_xyz(point, precision, 1);
    EXPECT_EQ(xyz.size(), 51u + 2 + 51 + 2 + 51);
    EXPECT_EQ(xyz.substr(106, 18), third);
  }
  const CoordinateTriple far = {1e308, -1e308, 1e308};
  EXPECT_EQ(write_enh(far, 0, 300, 1, 1, 300).size(), 59u + 2 + 59 + 2 + 59);
  EXPECT_EQ(write_xyz(far, 300, 1).size(), 51u + 2 + 51 + 2 + 51);
}

TEST_F(CoordinateText, ReadsGeodeticCoordinates) {
  const AngleUnit unit = decimal_degrees(0);
  expect_point(read_llh("-12.5, 45.25", unit, 0), degrees(-12.5), degrees(45.25), 0);
  expect_point(read_llh("45.25, -12.5", unit, 1), degrees(-12.5), degrees(45.25), 0);
  expect_point(read_llh("45.25,-12.5", unit, -1), degrees(-12.5), degrees(45.25), 0);
  expect_point(read_llh("12.5, 45.25, 100", unit, 0, 0.5), degrees(12.5), degrees(45.25), 50);
  expect_point(read_llh(" \n 12.5,\n45.25 , -100 ", unit, 0), degrees(12.5), degrees(45.25), -100);
  expect_point(read_llh("12.5, 45.25, 1E2", unit, 0), degrees(12.5), degrees(45.25), 100);
  expect_point(read_llh("12.5, 45.25, 1, 2", unit, 0), degrees(12.5), degrees(45.25), 1);
  expect_point(read_llh("12.5, 45.25, N", unit, 0), degrees(12.5), degrees(45.25), 0);
  expect_point(read_llh("12.5, 45.25,", unit, 0), degrees(12.5), degrees(45.25), 0);
  expect_point(read_llh("12.5, 45.25,,7", unit, 0), degrees(12.5), degrees(45.25), 0);
  expect_point(read_llh("12.5W, 45.25N, 3", decimal_degrees(5), 0), degrees(-12.5), degrees(45.25),
               3);
  expect_point(read_llh("S45:15:00, E12:30:00", colon_form(4), 1), degrees(12.5), degrees(-45.25),
               0);
  expect_point(read_llh("12.3000, -45.1500", packed_form(0), 0), degrees(12.5), degrees(-45.25), 0);
  expect_point(read_llh("12.5, 45.25", decimal_degrees(2), 0), degrees(12.5), degrees(-45.25), 0);
  expect_point(read_llh("12.5, 45.25", decimal_degrees(3), 0), degrees(-12.5), degrees(45.25), 0);
}

TEST_F(CoordinateText, MissingFieldsAreEmpty) {
  const AngleUnit unit = decimal_degrees(0);
  expect_point(read_llh("12.5", unit, 0), degrees(12.5), 0, 0);
  expect_point(read_llh("12.5", unit, 1), 0, degrees(12.5), 0);
  expect_point(read_llh("", unit, 0), 0, 0, 0);
  expect_point(read_llh(",", unit, 0), 0, 0, 0);
  expect_point(read_llh(" , , ", unit, 0), 0, 0, 0);
  expect_point(read_llh(",45.25", unit, 0), 0, degrees(45.25), 0);
  expect_point(read_llh(",,5", unit, 0), 0, 0, 5);
  expect_refused(read_llh("E12.5", decimal_degrees(4), 0), TW_BAD_TEXT);
  expect_refused(read_llh("12.5E", decimal_degrees(5), 0), TW_BAD_TEXT);
  expect_refused(read_llh("", decimal_degrees(4), 0), TW_BAD_TEXT);
  expect_point(read_enh("12.5", 0), 12.5, 0, 0);
  expect_point(read_enh("12.5", 1), 0, 12.5, 0);
  expect_point(read_enh("", 0), 0, 0, 0);
  expect_point(read_enh(",,5", 0), 0, 0, 5);
  expect_point(read_enh(",7", 0), 0, 7, 0);
  expect_point(read_xyz("1"), 1, 0, 0);
  expect_point(read_xyz("1,2"), 1, 2, 0);
  expect_point(read_xyz(""), 0, 0, 0);
  expect_point(read_xyz(",,3"), 0, 0, 3);
}

TEST_F(CoordinateText, BlanksBehindAFieldAreNotSkipped) {
  expect_refused(read_llh("12.5E , 45.25N", decimal_degrees(5), 0), TW_BAD_TEXT);
  expect_refused(read_llh("12.5E, 45.25N ", decimal_degrees(5), 0), TW_BAD_TEXT);
  expect_refused(read_llh("45.25N, 12.5E ", decimal_degrees(5), 1), TW_BAD_TEXT);
  expect_point(read_llh("  E12.5 ,  N45.25 ", decimal_degrees(4), 0), degrees(12.5), degrees(45.25),
               0);
}

TEST_F(CoordinateText, AnglesAreVerified) {
  const AngleUnit unit = decimal_degrees(0);
  expect_point(read_llh("200, 0", unit, 0), degrees(-160), 0, 0);
  expect_point(read_llh("-200, 0", unit, 0), degrees(160), 0, 0);
  expect_point(read_llh("180, 90", unit, 0), kPi, kPi / 2, 0);
  expect_point(read_llh("360, -90", unit, 0), 0, -kPi / 2, 0);
  expect_refused(read_llh("360.0001, 0", unit, 0), TW_BAD_LONGITUDE);
  expect_refused(read_llh("-361, 0", unit, 0), TW_BAD_LONGITUDE);
  expect_refused(read_llh("0, 90.0001", unit, 0), TW_BAD_LATITUDE);
  expect_refused(read_llh("-91, 0", unit, 1), TW_BAD_LATITUDE);
  // The longitude is looked at first, wherever it stands.
  expect_refused(read_llh("91, 361", unit, 1), TW_BAD_LONGITUDE);
  expect_refused(read_llh("361, 91", unit, 0), TW_BAD_LONGITUDE);
  // A letter of the other axis stops here.
  expect_refused(read_llh("12.5N, 45.25E", decimal_degrees(5), 0), TW_BAD_TEXT);
  expect_refused(read_llh("12.5E, 45.25E", decimal_degrees(5), 0), TW_BAD_TEXT);
  // Its word stands, whatever the value is.
  expect_refused(read_llh("361N, 0N", decimal_degrees(5), 0), TW_BAD_TEXT);
  expect_refused(read_llh("0E, 91E", decimal_degrees(5), 0), TW_BAD_TEXT);
  expect_refused(read_llh("12:30, 45", unit, 0), TW_BAD_TEXT);
}

TEST_F(CoordinateText, ReadsGridCoordinates) {
  expect_point(read_enh("500000.5, 4000000.25", 0), 500000.5, 4000000.25, 0);
  expect_point(read_enh("500000.5, 4000000.25", 1), 4000000.25, 500000.5, 0);
  expect_point(read_enh("5, 7, 3", 0, 2, 10), 10, 14, 30);
  expect_point(read_enh("5, 7, 3", -4, -2, 10), -14, -10, 30);
  expect_point(read_enh("+5e2, -7E-1\n", 0), 500, -0.7, 0);
  expect_point(read_enh("5, 7, 3, 9", 0), 5, 7, 3);
  expect_point(read_enh("5, 7, e", 0), 5, 7, 0);
  expect_point(read_enh("5, 7, 1e2", 0), 5, 7, 100);
}

TEST_F(CoordinateText, ReadsGeocentricCoordinates) {
  expect_point(read_xyz("1.5, -2, 3"), 1.5, -2, 3);
  expect_point(read_xyz("1.5,-2,\n3", 2), 3, -4, 6);
  expect_point(read_xyz("1,2,3,4"), 1, 2, 3);
}

TEST_F(CoordinateText, RefusesOtherCharacters) {
  for (const char* text : {"1,2Q", "1;2", "1,2\t", "1,2\xC3\xA4", "\xFF", "1,2x"}) {
    expect_refused(read_llh(text, decimal_degrees(0), 0), TW_BAD_TEXT);
    expect_refused(read_enh(text, 0), TW_BAD_TEXT);
    expect_refused(read_xyz(text), TW_BAD_TEXT);
  }
  expect_refused(read_enh("1N,2", 0), TW_BAD_TEXT);
  expect_refused(read_enh("1:2", 0), TW_BAD_TEXT);
  expect_refused(read_xyz("+1,2,3"), TW_BAD_TEXT);
  expect_refused(read_xyz("1e1,2,3"), TW_BAD_TEXT);
  expect_refused(read_xyz("1E1,2,3"), TW_BAD_TEXT);
  expect_refused(read_xyz("1:1,2,3"), TW_BAD_TEXT);
}

TEST_F(CoordinateText, TextIsReadUpTo150Characters) {
  const std::string start = "1,2,3" + std::string(144, ' ');
  for (const char* rest : {"4QQ", "4"}) {
    expect_point(read_llh(start + rest, narrow_unit("", 0, 0, 0.01), 0), 0.01, 0.02, 3);
    expect_point(read_enh(start + rest, 0), 1, 2, 3);
    expect_point(read_xyz(start + rest), 1, 2, 3);
  }
  expect_refused(read_llh(start + "Q", decimal_degrees(0), 0), TW_BAD_TEXT);
  expect_refused(read_enh(start + "Q", 0), TW_BAD_TEXT);
  expect_refused(read_xyz(start + "Q"), TW_BAD_TEXT);
  const std::string zeros(148, '0');
  expect_point(read_enh("," + zeros + "78", 0), 0, 7, 0);
}

TEST_F(CoordinateText, WhatIsWrittenIsRead) {
  const CoordinateTriple point = {degrees(-123.25), degrees(45.5), 12.5};
  for (const int16_t order : std::initializer_list<int16_t>{0, 1}) {
    for (const AngleUnit& unit : {decimal_degrees(0, 9), colon_form(5, 5), colon_form(4, 0),
                                  packed_form(0, 5), decimal_degrees(1, 9)}) {
      const std::string text = write_llh(point, unit, order, 1, 2, 0.3048);
      const PointReading read = read_llh(text, unit, order, 0.3048);
      EXPECT_EQ(read.status, TW_SUCCESS) << text;
      expect_near(read.point, point.x, point.y, 1e-11);
      EXPECT_NEAR(read.point.z, point.z, 0.005 * 0.3048);
    }
    const std::string text = write_enh({5.5, -6.25, 7}, order, 3, 2, 1, 3, 4);
    expect_point(read_enh(text, order, 2, 4), 5.5, -6.25, 7);
  }
  expect_point(read_xyz(write_xyz({5.5, -6.25, 7}, 3, 2), 2), 5.5, -6.25, 7);
}

}  // namespace
