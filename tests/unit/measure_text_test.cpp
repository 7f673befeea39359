#include <gtest/gtest.h>

#include <cstring>

#include "support/text.hpp"

using namespace tidewater::test;

namespace {

class MeasureText : public PlainLocaleTest {};

struct Writer {
  decltype(&TWmet_to_ascii) narrow;
  decltype(&TWmet_to_ascii_wide) wide;
};
constexpr Writer kLength = {TWmet_to_ascii, TWmet_to_ascii_wide};
constexpr Writer kArea = {TWsq_met_to_ascii, TWsq_met_to_ascii_wide};
constexpr Writer kVolume = {TWcub_met_to_ascii, TWcub_met_to_ascii_wide};

struct Reader {
  decltype(&TWascii_to_met) narrow;
  decltype(&TWascii_to_met_wide) wide;
};
constexpr Reader kReaders[] = {{TWascii_to_met, TWascii_to_met_wide},
                               {TWascii_to_sq_met, TWascii_to_sq_met_wide},
                               {TWascii_to_cub_met, TWascii_to_cub_met_wide}};

// Writes by both functions, which must agree.
std::string write(const Writer& writer, double value, int16_t precision, double unit) {
  char text[500];
  TWstatus status = 0;
  writer.narrow(value, precision, unit, text, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  char16_t wide_text[500];
  status = 0;
  writer.wide(value, precision, unit, wide_text, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(text, plain(wide_text));
  return text;
}

void expect_unit_refused(const Writer& writer, double unit) {
  char text[] = "#";
  TWstatus status = 0;
  writer.narrow(5, 1, unit, text, &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_STREQ(text, "#");
  char16_t wide_text[] = u"#";
  status = 0;
  writer.wide(5, 1, unit, wide_text, &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  EXPECT_EQ(std::u16string_view(wide_text), u"#");
}

// Reads by all six functions, which must agree.
Reading read(std::string_view text, double unit) {
  Reading first = {kUntouched, 0};
  kReaders[0].narrow(exact(text).get(), unit, &first.value, &first.status);
  for (const Reader& reader : kReaders) {
    Reading narrow = {kUntouched, 0}, other = {kUntouched, 0};
    reader.narrow(exact(text).get(), unit, &narrow.value, &narrow.status);
    reader.wide(exact<char16_t>(wide(text)).get(), unit, &other.value, &other.status);
    EXPECT_EQ(narrow.status, first.status) << text;
    EXPECT_EQ(narrow.value, first.value) << text;
    EXPECT_EQ(other.status, first.status) << text;
    EXPECT_EQ(other.value, first.value) << text;
  }
  return first;
}

std::string scalar(double value, int16_t precision) {
  const auto text = std::make_unique<char[]>(50);
  TWstatus status = 0;
  TWscalr_to_asc(value, precision, text.get(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  return text.get();
}

TEST_F(MeasureText, Writes) {
  for (const Writer& writer : {kLength, kArea, kVolume}) {
    EXPECT_EQ(write(writer, 1234.5, 2, 1), "1234.50");
    EXPECT_EQ(write(writer, -1234.5, 2, 1), "-1234.50");
    EXPECT_EQ(write(writer, 3.048, 3, 0.3048), "10.000");
    EXPECT_EQ(write(writer, 2500, 0, 1000), "2");  // half to even
    EXPECT_EQ(write(writer, 1, -1, 3), "0.333333");
    EXPECT_EQ(write(writer, 0, 0, 5), "0");
    EXPECT_EQ(write(writer, 1e22, 1, 1), "10000000000000000000000.0");
    EXPECT_EQ(write(writer, kInfinity, 1, 1), "inf");
    EXPECT_EQ(write(writer, kNaN, 1, 1), "nan");
    EXPECT_EQ(write(writer, 1, 1, kNaN), "nan");  // no comparison refuses it
    EXPECT_EQ(write(writer, 5, 1, 5e-324), "inf");
    EXPECT_EQ(write(writer, 1e308, 100, 1).size(), 309u + 1 + 100);  // never cut
  }
}

TEST_F(MeasureText, OnlyALengthHasANegativeUnit) {
  EXPECT_EQ(write(kLength, 5, 1, -2), "-2.5");
  EXPECT_EQ(write(kLength, -5, 1, -2), "2.5");
  EXPECT_EQ(write(kLength, 0, 1, -2), "-0.0");
  for (const double unit : {-2.0, -5e-324, -kInfinity, 0.0, -0.0}) {
    expect_unit_refused(kArea, unit);
    expect_unit_refused(kVolume, unit);
  }
  expect_unit_refused(kLength, 0.0);
  expect_unit_refused(kLength, -0.0);
}

TEST_F(MeasureText, Reads) {
  const auto expect_value = [](std::string_view text, double unit, double value) {
    const Reading reading = read(text, unit);
    EXPECT_EQ(reading.status, TW_SUCCESS) << text;
    EXPECT_EQ(reading.value, value) << text;
  };
  expect_value("12.5", 1, 12.5);
  expect_value("12.5", 2, 25);
  expect_value("12.5", -2, -25);
  expect_value("12.5", 0, 0);
  expect_value("-12.5", 1, -12.5);
  expect_value("+12.5", 1, 12.5);
  expect_value("1.25e1", 1, 12.5);
  expect_value("1.25E+1", 1, 12.5);
  expect_value("125e-1", 1, 12.5);
  expect_value(" \n 12.5\n", 1, 12.5);
  expect_value("12 5", 1, 12);
  expect_value("1.2.5", 1, 1.2);
  expect_value("", 1, 0);
  expect_value(" ", 1, 0);
  expect_value("e5", 1, 0);
  expect_value("--5", 1, 0);
  expect_value("5e", 1, 5);
  expect_value(".5", 1, 0.5);
  expect_value("1e999", 1, kInfinity);
}

TEST_F(MeasureText, RefusesOtherCharacters) {
  for (const char* text :
       {"12,5", "12m", "0x1", "inf", "nan", "1\t", "12.5:", "N1", "1\xC3\xA4", "\xFF"}) {
    for (const Reader& reader : kReaders) {
      Reading reading = {kUntouched, 0};
      reader.narrow(text, 1, &reading.value, &reading.status);
      EXPECT_EQ(reading.status, TW_BAD_TEXT) << text;
      EXPECT_EQ(reading.value, kUntouched) << text;
      reading.status = 0;
      reader.wide(exact<char16_t>(wide(text)).get(), 1, &reading.value, &reading.status);
      EXPECT_EQ(reading.status, TW_BAD_TEXT) << text;
      EXPECT_EQ(reading.value, kUntouched) << text;
    }
  }
}

TEST_F(MeasureText, NarrowTextIsReadUpTo50Characters) {
  const std::string zeros(49, '0');
  for (const Reader& reader : kReaders) {
    Reading reading = {kUntouched, 0};
    reader.narrow((zeros + "78").c_str(), 1, &reading.value, &reading.status);
    EXPECT_EQ(reading.status, TW_SUCCESS);
    EXPECT_EQ(reading.value, 7);
    reader.narrow((zeros + "7Q").c_str(), 1, &reading.value, &reading.status);
    EXPECT_EQ(reading.status, TW_SUCCESS);
    reader.narrow((zeros + "Q").c_str(), 1, &reading.value, &reading.status);
    EXPECT_EQ(reading.status, TW_BAD_TEXT);
    reader.wide(wide(zeros + "78").c_str(), 1, &reading.value, &reading.status);
    EXPECT_EQ(reading.status, TW_SUCCESS);
    EXPECT_EQ(reading.value, 78);
  }
}

TEST_F(MeasureText, ScalarLosesItsZeros) {
  EXPECT_EQ(scalar(2.5, 3), "2.5");
  EXPECT_EQ(scalar(2, 3), "2");
  EXPECT_EQ(scalar(0, 2), "0");
  EXPECT_EQ(scalar(-0.0, 2), "-0");
  EXPECT_EQ(scalar(100, 1), "100");
  EXPECT_EQ(scalar(100.25, 2), "100.25");
  EXPECT_EQ(scalar(-2.50, 2), "-2.5");
  EXPECT_EQ(scalar(0.125, -1), "0.125");
  EXPECT_EQ(scalar(kInfinity, 2), "inf");
  EXPECT_EQ(scalar(kNaN, 2), "nan");
}

TEST_F(MeasureText, ScalarCutsTheZerosOfAWholeNumberToo) {
  EXPECT_EQ(scalar(100, 0), "1");
  EXPECT_EQ(scalar(1200, 0), "12");
  EXPECT_EQ(scalar(0, 0), "0");
  EXPECT_EQ(scalar(-0.25, 0), "-");  // of "-0" the last zero goes as well
  EXPECT_EQ(scalar(105, 0), "105");
}

TEST_F(MeasureText, ScalarIsCutAt50Bytes) {
  char text[60];
  std::memset(text, '#', sizeof text);
  TWstatus status = 0;
  TWscalr_to_asc(1.0 / 3, 100, text, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(std::strlen(text), 49u);
  EXPECT_EQ(std::string(text).substr(0, 18), "0.3333333333333333");
  EXPECT_EQ(text[50], '#');
  // The zeros go before the cut.
  EXPECT_EQ(scalar(2.5, 32767), "2.5");
}

}  // namespace
