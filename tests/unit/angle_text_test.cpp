#include <gtest/gtest.h>

#include <cstdio>
#include <cstring>
#include <limits>
#include <random>

#include "support/text.hpp"

using namespace tidewater::test;

namespace {

class AngleText : public PlainLocaleTest {};

constexpr int16_t kBothAxes[] = {0, 1};

void expect_read(std::string_view text, const AngleUnit& unit, int16_t axis, double value) {
  const Reading read = read_angle(text, unit, axis);
  EXPECT_EQ(read.status, TW_SUCCESS) << text;
  EXPECT_NEAR(read.value, value, 2e-15) << text;
}

void expect_refused(std::string_view text, const AngleUnit& unit, int16_t axis) {
  const Reading read = read_angle(text, unit, axis);
  EXPECT_EQ(read.status, TW_BAD_TEXT) << text;
  EXPECT_EQ(read.value, kUntouched) << text;
}

// A letter of the other axis: the word says so, the value is there.
void expect_wrong_letter(std::string_view text, const AngleUnit& unit, int16_t axis, double value) {
  const Reading read = read_angle(text, unit, axis);
  EXPECT_EQ(read.status, TW_BAD_TEXT) << text;
  EXPECT_NEAR(read.value, value, 2e-15) << text;
}

std::string text_after_reading(std::string_view text, const AngleUnit& unit, int16_t axis) {
  const auto block = exact<char16_t>(wide(text), 1);
  double value = 0;
  TWstatus status = 0;
  TWascii_to_rad_wide(block.get(), widened(unit), axis, &value, &status);
  return plain(block.get());
}

TEST_F(AngleText, ReadsTheColonForm) {
  const AngleUnit unit = colon_form(0);
  expect_read("12:30:00", unit, 0, degrees(12.5));
  expect_read("-12:30:00", unit, 0, degrees(-12.5));
  expect_read("-0:30:00", unit, 0, degrees(-0.5));
  expect_read("+0:30:00", unit, 0, degrees(0.5));
  expect_read("12:30:05.25", unit, 1, degrees(12, 30, 5.25));
  expect_read("12:30", unit, 0, degrees(12.5));
  expect_read("12", unit, 0, degrees(12));
  expect_read("12.5:15", unit, 0, degrees(12.75));
  expect_read("", unit, 0, 0);
  expect_read(" ", unit, 0, 0);
  // Minutes and seconds as they stand.
  expect_read("1:90:90", unit, 0, degrees(1, 90, 90));
  expect_read("1:-30", unit, 0, degrees(0.5));
  expect_read("-1:-30", unit, 0, degrees(-0.5));
  // A blank in front of the sign hides it.
  expect_read(" -12:30:00", unit, 0, degrees(12.5));
  expect_read(" 12:30:00", unit, 0, degrees(12.5));
  // Blanks are skipped behind a colon and not before it.
  expect_read("12: 30: 06", unit, 0, degrees(12, 30, 6));
  expect_read("12 :30:06", unit, 0, degrees(12));
  expect_read("12:30 :06", unit, 0, degrees(12.5));
  // The first part that does not scan ends the scan.
  expect_read("12::30", unit, 0, degrees(12));
  expect_read(":30:30", unit, 0, 0);
  expect_read("-:30:30", unit, 0, 0);
  expect_read("12N:30", unit, 0, degrees(12));
  expect_read("12:30:06:40", unit, 0, degrees(12, 30, 6));
  // Any text with a colon is the form.
  expect_read("12:30:00", narrow_unit(":", 0, 0, kArcSecond), 0, degrees(12.5));
}

TEST_F(AngleText, ReadsThePackedForm) {
  const AngleUnit unit = packed_form(0);
  expect_read("-12.3000", unit, 0, degrees(-12.5));
  expect_read("-0.3000", unit, 0, degrees(0.5));  // the degrees are tested, not their text
  expect_read("12.5", unit, 0, degrees(12, 50));
  expect_read("12.05", unit, 0, degrees(12, 5));
  expect_read("12.300525", unit, 0, degrees(12, 30, 5.25));
  expect_read("12.30052", unit, 0, degrees(12, 30, 5.2));
  expect_read("12.305", unit, 0, degrees(12, 30, 50));
  expect_read("12.3005", unit, 0, degrees(12, 30, 5));
  expect_read("12", unit, 0, degrees(12));
  expect_read("12.", unit, 0, degrees(12));
  expect_read(".3", unit, 0, degrees(0, 30));
  expect_read(".", unit, 0, 0);
  expect_read("", unit, 0, 0);
  expect_read(" -12.3", unit, 0, degrees(-12.5));
  // A piece of one digit and a blank is two characters.
  expect_read("12.5 ", unit, 0, degrees(12, 5));
  expect_read("12.305 ", unit, 0, degrees(12, 30, 5));
  expect_read("12.9999", unit, 0, degrees(12, 99, 99));
  expect_read("12.-3", unit, 0, degrees(12, -3));
  expect_read("-12.-3", unit, 0, degrees(-12, 3));
  // A second full stop stands in the digits.
  expect_read("12.30.5", unit, 0, degrees(12, 30, 0.5));
  expect_read("12.3005.5", unit, 0, degrees(12, 30, 5));  // the fraction is ".", "." and "5"
  // A letter ends the piece it stands in; a colon is admitted and ends the number, too.
  expect_read("12N.30", unit, 0, degrees(12, 30));
  expect_read("12.3N05", unit, 0, degrees(12, 3, 5));
  expect_read("12:59.30", unit, 0, degrees(12, 30));
}

TEST_F(AngleText, ReadsDecimalUnits) {
  const AngleUnit unit = decimal_degrees(0);
  expect_read("12.5", unit, 0, degrees(12.5));
  expect_read("-12.5", unit, 1, degrees(-12.5));
  expect_read("+12.5", unit, 1, degrees(12.5));
  expect_read(" \n 12.5", unit, 0, degrees(12.5));
  expect_read("50", narrow_unit("gon", 0, 0, kPi / 200), 0, kPi / 4);
  expect_read("1.5", narrow_unit("", 0, 0, 1), 0, 1.5);
  // Like "dd.mmss", but not exactly it.
  expect_read("12.5", narrow_unit("dd.mmsss", 0, 0, kPi / 180), 0, degrees(12.5));
  expect_read("12.5", narrow_unit("DD.MMSS", 0, 0, kPi / 180), 0, degrees(12.5));
  expect_read("", unit, 0, 0);
  expect_read("   ", unit, 0, 0);
  expect_read("+-5", unit, 0, 0);
  expect_read("- 5", unit, 0, 0);
  expect_read("5 6", unit, 0, degrees(5));
  expect_read("5-6", unit, 0, degrees(5));
  expect_refused("12:30", unit, 0);
  expect_refused("12.5:", unit, 1);
}

TEST_F(AngleText, LettersInTheModesWithoutLettersEndTheNumber) {
  const AngleUnit unit = decimal_degrees(0);
  expect_read("12.5N", unit, 0, degrees(12.5));
  expect_read("12.5w", unit, 1, degrees(12.5));
  expect_read("N12.5", unit, 1, 0);
  expect_read("NEWS", unit, 1, 0);
  // An E is an exponent where digits follow.
  expect_read("1E1", unit, 0, degrees(10));
  expect_read("150e-1", unit, 0, degrees(15));
  expect_read("12.5E", unit, 0, degrees(12.5));
  expect_read("12.5E+", unit, 0, degrees(12.5));
  expect_read("12E1S", unit, 0, degrees(120));
}

TEST_F(AngleText, RefusesOtherCharacters) {
  for (const char* text : {"12.5Q", "12,5", "0x10", "inf", "nan", "12.5\t", "12\xB0", "\xFF"}) {
    Reading read = {kUntouched, 0};
    TWascii_to_rad(text, decimal_degrees(0), 0, &read.value, &read.status);
    EXPECT_EQ(read.status, TW_BAD_TEXT) << text;
    EXPECT_EQ(read.value, kUntouched) << text;
  }
  for (const char16_t* text : {u"12.5Q", u"12\u00B0", u"\uFFFD", u"１", u"\xD83D\xDE00"}) {
    const auto block = exact<char16_t>(text, 1);
    Reading read = {kUntouched, 0};
    TWascii_to_rad_wide(block.get(), widened(decimal_degrees(0)), 0, &read.value, &read.status);
    EXPECT_EQ(read.status, TW_BAD_TEXT);
    EXPECT_EQ(read.value, kUntouched);
    EXPECT_EQ(std::u16string_view(block.get()), text);
  }
}

TEST_F(AngleText, ReadsALetterInFront) {
  const AngleUnit unit = decimal_degrees(4);
  expect_read("N12.5", unit, 1, degrees(12.5));
  expect_read("n12.5", unit, 1, degrees(12.5));
  expect_read("S12.5", unit, 1, degrees(-12.5));
  expect_read("s12.5", unit, 1, degrees(-12.5));
  expect_read("E12.5", unit, 0, degrees(12.5));
  expect_read("e12.5", unit, 0, degrees(12.5));
  expect_read("W12.5", unit, 0, degrees(-12.5));
  expect_read("w12.5", unit, 0, degrees(-12.5));
  expect_read("N 12.5", unit, 1, degrees(12.5));
  expect_read("S 12.5", unit, 1, 0);  // a sign and a blank are no number
  expect_read("N-12.5", unit, 1, degrees(-12.5));
  expect_read("S-12.5", unit, 1, 0);
  expect_read("N12.5S", unit, 1, degrees(12.5));  // a second letter is not looked at
  expect_read("W12:30:00", colon_form(4), 0, degrees(-12.5));
  expect_read("S0:30", colon_form(4), 1, degrees(-0.5));
  expect_read("E12:30:00", colon_form(4), 0, degrees(12.5));
  expect_read("W12.3000", packed_form(4), 0, degrees(-12.5));
  expect_read("S0.3000", packed_form(4), 1, degrees(0.5));
  expect_read("N", unit, 1, 0);
  expect_read("S", unit, 1, 0);
  expect_refused("12.5", unit, 1);
  expect_refused("12.5N", unit, 1);
  expect_refused(" N12.5", unit, 1);
  expect_refused("", unit, 1);
  expect_refused("N12:30", unit, 1);
  EXPECT_EQ(text_after_reading("N12.5", unit, 1), " 12.5");
  EXPECT_EQ(text_after_reading("S12.5", unit, 1), "-12.5");
  EXPECT_EQ(text_after_reading("E12.5", unit, 1), "E12.5");
  EXPECT_EQ(text_after_reading("S", unit, 1), "-");
}

TEST_F(AngleText, ReadsALetterBehind) {
  const AngleUnit unit = decimal_degrees(5);
  expect_read("12.5 S", unit, 1, degrees(-12.5));
  expect_read("12.5S", unit, 1, degrees(-12.5));
  expect_read("12.5s", unit, 1, degrees(-12.5));
  expect_read("12.5N", unit, 1, degrees(12.5));
  expect_read("12.5n", unit, 1, degrees(12.5));
  expect_read("12.5E", unit, 0, degrees(12.5));
  expect_read("12.5e", unit, 0, degrees(12.5));
  expect_read("12.5W", unit, 0, degrees(-12.5));
  expect_read("12.5w", unit, 0, degrees(-12.5));
  expect_read("-12.5S", unit, 1, 0);
  expect_read("12:30:00W", colon_form(5), 0, degrees(-12.5));
  expect_read(" 12:30:00W", colon_form(5), 0, 0);  // "- 12:30:00"
  expect_read("12.3000S", packed_form(5), 1, degrees(-12.5));
  expect_read("12.5N", packed_form(5), 1, degrees(12, 5));  // the letter has become a blank
  expect_read("12.5S", packed_form(5), 1, degrees(-12, -50));
  expect_read("N", unit, 1, 0);
  expect_read("S", unit, 1, 0);
  expect_refused("12.5", unit, 1);
  expect_refused("N12.5", unit, 1);
  expect_refused("12.5N ", unit, 1);
  expect_refused("N12.5N", unit, 1);
  expect_refused("", unit, 1);
  EXPECT_EQ(text_after_reading("12.5 S", unit, 1), "-12.5 ");
  EXPECT_EQ(text_after_reading("12.5 N", unit, 1), "12.5  ");
  EXPECT_EQ(text_after_reading("12.5E", unit, 1), "12.5E");
  EXPECT_EQ(text_after_reading("W", unit, 0), "-");
}

TEST_F(AngleText, ALetterOfTheOtherAxisGivesWordAndValue) {
  expect_wrong_letter("E12.5", decimal_degrees(4), 1, 0);  // no number stands in front
  expect_wrong_letter("N12.5", decimal_degrees(4), 0, 0);
  expect_wrong_letter("12.5E", decimal_degrees(5), 1, degrees(12.5));
  expect_wrong_letter("12.5W", decimal_degrees(5), 1, degrees(12.5));
  expect_wrong_letter("12.5N", decimal_degrees(5), 0, degrees(12.5));
  expect_wrong_letter("12.5S", decimal_degrees(5), 0, degrees(12.5));
  expect_wrong_letter("12:30S", colon_form(5), 0, degrees(12.5));
  // With another axis no letter fits.
  for (const int16_t axis : std::initializer_list<int16_t>{-1, 2, 256}) {
    for (const char* text : {"12.5E", "12.5W", "12.5N", "12.5S"}) {
      expect_wrong_letter(text, decimal_degrees(5), axis, degrees(12.5));
    }
  }
}

TEST_F(AngleText, ReadingReversesTheAxesOfTheMode) {
  for (const int16_t axis : kBothAxes) {
    expect_read("12.5", decimal_degrees(0), axis, degrees(12.5));
    expect_read("12.5", decimal_degrees(1), axis, degrees(-12.5));
    expect_read("12.5", decimal_degrees(2), axis, degrees(axis == 1 ? -12.5 : 12.5));
    expect_read("12.5", decimal_degrees(3), axis, degrees(axis == 0 ? -12.5 : 12.5));
    expect_read("-12:30", colon_form(1), axis, degrees(12.5));
    expect_read("12.3000", packed_form(1), axis, degrees(-12.5));
    expect_read("12.5N", decimal_degrees(6), axis, degrees(12.5));
    expect_read("12.5N", decimal_degrees(-1), axis, degrees(12.5));
  }
  expect_read("12.5", decimal_degrees(1), 7, degrees(-12.5));
  expect_read("12.5", decimal_degrees(2), 7, degrees(12.5));
  expect_read("12.5", decimal_degrees(3), 7, degrees(12.5));
}

TEST_F(AngleText, NarrowTextIsReadUpTo150Characters) {
  // The 150th character is read, the one behind it is not.
  const std::string zeros(149, '0');
  Reading read = {kUntouched, 0};
  TWascii_to_rad((zeros + "78").c_str(), narrow_unit("", 0, 0, 1), 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);
  EXPECT_EQ(read.value, 7);
  TWascii_to_rad((zeros + "7Q").c_str(), narrow_unit("", 0, 0, 1), 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);
  TWascii_to_rad((zeros + "Q7").c_str(), narrow_unit("", 0, 0, 1), 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_BAD_TEXT);
  TWascii_to_rad((zeros + "7S").c_str(), narrow_unit("", 0, 5, 1), 1, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_BAD_TEXT);
  TWascii_to_rad((zeros + "W").c_str(), narrow_unit("", 0, 5, 1), 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);
  EXPECT_EQ(read.value, 0);
  // Wide text has no such limit.
  const auto block = exact<char16_t>(wide(zeros + "78"), 1);
  TWascii_to_rad_wide(block.get(), widened(narrow_unit("", 0, 0, 1)), 0, &read.value, &read.status);
  EXPECT_EQ(read.value, 78);
}

TEST_F(AngleText, NarrowTextStaysAsItWas) {
  const std::string text = "12.5 S";
  const auto block = exact<char>(text);
  double value = 0;
  TWstatus status = 0;
  TWascii_to_rad(block.get(), decimal_degrees(5), 1, &value, &status);
  EXPECT_EQ(block.get(), text);
}

TEST_F(AngleText, FormatsWithoutAnEndStopAtTheField) {
  // Behind the field stand precision and mode.
  AngleUnit unit = narrow_unit("", 0x3A3A, 0, 1);  // colons, if they were read as text
  std::memset(unit.format, 'x', sizeof unit.format);
  Reading read = {kUntouched, 0};
  TWascii_to_rad("12:30", unit, 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_BAD_TEXT);
  // Fifteen characters of a narrow format fit.
  unit.format[15] = ':';
  TWascii_to_rad("12:30", unit, 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_BAD_TEXT);
  unit.format[14] = ':';
  TWascii_to_rad("12:30", unit, 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);

  AngleUnit wide_unit = narrow_unit("", 0x3A, 0, 1);
  std::fill(std::begin(wide_unit.wide_format), std::end(wide_unit.wide_format), u'x');
  const auto block = exact<char16_t>(u"12:30", 1);
  TWascii_to_rad_wide(block.get(), wide_unit, 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_BAD_TEXT);
  // A byte of a narrow format that is no character does not matter.
  const AngleUnit odd = narrow_unit("dd\xB0mm:ss", 0, 0, 1);
  TWascii_to_rad("1:1:1", odd, 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);
  EXPECT_EQ(read.value, 3661);
}

TEST_F(AngleText, NumbersScanAsTheCLibraryScansThem) {
  // Texts of the admitted characters, against the library's own scanner.
  std::mt19937 random(7);
  const std::string_view letters = "0123456789NEWSnews-+ .\n0123456789eE.-";
  std::uniform_int_distribution<std::size_t> pick(0, letters.size() - 1), length(0, 9);
  for (int i = 0; i < 20'000; ++i) {
    std::string text;
    for (std::size_t n = length(random); n > 0; --n) text += letters[pick(random)];
    double theirs = 0;
    std::sscanf(text.c_str(), "%lf", &theirs);
    const Reading ours = read_angle(text, narrow_unit("", 0, 0, 1), 0);
    EXPECT_EQ(ours.status, TW_SUCCESS) << text;
    EXPECT_EQ(ours.value, theirs) << text;
  }
}

TEST_F(AngleText, WritesDecimalUnits) {
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0), 0), "12.5000");
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(0), 1), "-12.5000");
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 0), 0), "12");  // half to even
  EXPECT_EQ(write_angle(degrees(12.6), decimal_degrees(0, 0), 0), "13");
  EXPECT_EQ(write_angle(1.25, narrow_unit("", -1, 0, 1), 0), "1.250000");
  EXPECT_EQ(write_angle(1.25, narrow_unit("", -32768, 0, 1), 0), "1.250000");
  EXPECT_EQ(write_angle(kPi / 4, narrow_unit("gon", 2, 0, kPi / 200), 0), "50.00");
  EXPECT_EQ(write_angle(0, decimal_degrees(0, 2), 0), "0.00");
}

TEST_F(AngleText, WritingReversesTheAxesOfTheMode) {
  for (const int16_t axis : kBothAxes) {
    EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(1, 1), axis), "-12.5");
    EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(2, 1), axis),
              axis == 1 ? "-12.5" : "12.5");
    EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(3, 1), axis),
              axis == 0 ? "-12.5" : "12.5");
    EXPECT_EQ(write_angle(degrees(-12.5), colon_form(1, 0), axis), "12:30:00");
    EXPECT_EQ(write_angle(degrees(12.5), packed_form(1, 0), axis), "-12.3000");
  }
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(1, 1), 7), "-12.5");
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(2, 1), 7), "12.5");
}

TEST_F(AngleText, WritesTheColonForm) {
  EXPECT_EQ(write_angle(degrees(12, 30, 5.25), colon_form(0, 2), 0), "12:30:05.25");
  EXPECT_EQ(write_angle(-degrees(12, 30, 5.25), colon_form(0, 2), 0), "-12:30:05.25");
  EXPECT_EQ(write_angle(-degrees(0, 30, 5.25), colon_form(0, 1), 0), "-0:30:05.2");
  EXPECT_EQ(write_angle(degrees(7, 5, 3), colon_form(0, 1), 0), "7:05:03.0");
  EXPECT_EQ(write_angle(degrees(7, 5, 3), colon_form(0, 0), 0), "7:05:03");
  EXPECT_EQ(write_angle(-degrees(7, 5, 3.5001), colon_form(0, 0), 0), "-7:05:04");
  EXPECT_EQ(write_angle(0, colon_form(0, 0), 0), "0:00:00");
  EXPECT_EQ(write_angle(0, colon_form(0, 3), 0), "0:00:00.000");
  EXPECT_EQ(write_angle(degrees(179, 59, 59.9), colon_form(0, 1), 0), "179:59:59.9");
}

TEST_F(AngleText, WritesThePackedForm) {
  EXPECT_EQ(write_angle(degrees(12, 30, 5.25), packed_form(0, 2), 0), "12.300525");
  EXPECT_EQ(write_angle(-degrees(12, 30, 5.25), packed_form(0, 2), 0), "-12.300525");
  EXPECT_EQ(write_angle(-degrees(0, 30, 5.25), packed_form(0, 3), 0), "-0.3005250");
  EXPECT_EQ(write_angle(degrees(7, 5, 3), packed_form(0, 0), 0), "7.0503");
  EXPECT_EQ(write_angle(-degrees(7, 5, 3), packed_form(0, 0), 0), "-7.0503");
  EXPECT_EQ(write_angle(degrees(7, 5, 3), packed_form(0, 1), 0), "7.05030");
}

TEST_F(AngleText, SecondsThatWouldReachSixtyAreCarried) {
  EXPECT_EQ(write_angle(degrees(12, 30, 59.9996), colon_form(0, 3), 0), "12:31:00.000");
  EXPECT_EQ(write_angle(degrees(12, 30, 59.9994), colon_form(0, 3), 0), "12:30:59.999");
  EXPECT_EQ(write_angle(degrees(12, 59, 59.9996), colon_form(0, 3), 0), "13:00:00.000");
  EXPECT_EQ(write_angle(-degrees(12, 59, 59.9996), colon_form(0, 3), 0), "-13:00:00.000");
  EXPECT_EQ(write_angle(degrees(12, 59, 59.9996), packed_form(0, 3), 0), "13.0000000");
  EXPECT_EQ(write_angle(degrees(12, 59, 59.6), colon_form(0, 0), 0), "13:00:00");
  EXPECT_EQ(write_angle(degrees(12, 58, 59.6), packed_form(0, 0), 0), "12.5900");
  EXPECT_EQ(write_angle(degrees(12, 58, 59.4), packed_form(0, 0), 0), "12.5859");
}

TEST_F(AngleText, TheBoundOfTheCarryIsIncluded) {
  // In units of a second, and in radians at any minute of the circle.
  EXPECT_EQ(write_angle(59.9995, narrow_unit(":", 3, 0, 1), 0), "0:01:00.000");
  EXPECT_EQ(write_angle(59.5, narrow_unit(":", 0, 0, 1), 0), "0:01:00");
  EXPECT_EQ(write_angle(std::nextafter(59.5, 0) - 1e-12, narrow_unit(":", 0, 0, 1), 0), "0:00:59");
  EXPECT_EQ(write_angle(59.9375, narrow_unit(":", 1, 0, 1), 0), "0:00:59.9");
  // Larger values hold 59.9995 less truly; what the double holds decides, on the seconds alone.
  EXPECT_EQ(write_angle(1192319.9995, narrow_unit(":", 3, 0, 1), 0), "331:11:59.999");
  EXPECT_EQ(write_angle(std::nextafter(1192319.9995, 2e6), narrow_unit(":", 3, 0, 1), 0),
            "331:12:00.000");
  int carried = 0, kept = 0;
  for (int minute = 0; minute < 360 * 60; minute += 7) {
    const double seconds = minute * 60.0 + 59.9995;
    // The exact remainder; the allowance is 4 epsilon times 60.
    const bool carries = 60 - std::fmod(seconds, 60) <= 0.0005 + 0x1p-50 * 60;
    ++(carries ? carried : kept);
    char expected[32];
    if (carries) {
      std::snprintf(expected, sizeof expected, "%d:%02d:00.000", (minute + 1) / 60,
                    (minute + 1) % 60);
    } else {
      std::snprintf(expected, sizeof expected, "%d:%02d:59.999", minute / 60, minute % 60);
    }
    EXPECT_EQ(write_angle(seconds, narrow_unit(":", 3, 0, 1), 0), expected);
  }
  EXPECT_GT(carried, 500);
  EXPECT_GT(kept, 500);
}

TEST_F(AngleText, WritesTheLetter) {
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(4, 1), 0), "W12.5");
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(4, 1), 0), "E12.5");
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(4, 1), 1), "S12.5");
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(4, 1), 1), "N12.5");
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(5, 1), 0), "12.5W");
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(5, 1), 0), "12.5E");
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(5, 1), 1), "12.5S");
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(5, 1), 1), "12.5N");
  EXPECT_EQ(write_angle(0, decimal_degrees(5, 1), 1), "0.0N");
  EXPECT_EQ(write_angle(-degrees(0, 30, 5), colon_form(4, 0), 0), "W0:30:05");
  EXPECT_EQ(write_angle(-degrees(0, 30, 5), packed_form(5, 1), 1), "0.30050S");
  // A value that rounds to zero keeps its side.
  EXPECT_EQ(write_angle(-1e-9, decimal_degrees(4, 1), 0), "W0.0");
  // No letter for another axis; the sign stays.
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(4, 1), 2), "-12.5");
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(5, 1), -1), "-12.5");
  // Nor in other modes.
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(6, 1), 0), "-12.5");
}

TEST_F(AngleText, NegativePrecisionOfTheSexagesimalForms) {
  // The precision counts as omitted, so six decimals; half a unit is 5 and 50 seconds.
  EXPECT_EQ(write_angle(degrees(12, 30, 25), colon_form(0, -1), 0), "12:30:25.000000");
  EXPECT_EQ(write_angle(degrees(12, 30, 55.5), colon_form(0, -1), 0), "12:31:0.000000");
  EXPECT_EQ(write_angle(degrees(12, 30, 15), colon_form(0, -2), 0), "12:31:0.000000");
  EXPECT_EQ(write_angle(degrees(12, 30, 15), packed_form(0, -32768), 0),
            "12.31" + std::string(44, '0'));
}

TEST_F(AngleText, NotFiniteValuesAreWrittenAsTheCLibraryWritesThem) {
  for (const AngleUnit& unit : {decimal_degrees(0), colon_form(0, 0), colon_form(0, 3),
                                packed_form(0, 0), packed_form(0, 3)}) {
    EXPECT_EQ(write_angle(kInfinity, unit, 0), "inf");
    EXPECT_EQ(write_angle(-kInfinity, unit, 0), "-inf");
    EXPECT_EQ(write_angle(kNaN, unit, 0), "nan");
  }
  EXPECT_EQ(write_angle(-kInfinity, colon_form(4), 0), "Winf");
  EXPECT_EQ(write_angle(kInfinity, colon_form(5), 1), "infN");
  EXPECT_EQ(write_angle(1, narrow_unit(":", 2, 0, 0), 0), "inf");
}

TEST_F(AngleText, SecondsBeyondAnIntegerStayInTheSeconds) {
  // 2147483647 seconds are 596523 degrees 14 minutes 7 seconds.
  EXPECT_EQ(write_angle(2147483646, narrow_unit(":", 0, 0, 1), 0), "596523:14:06");
  EXPECT_EQ(write_angle(2147483647, narrow_unit(":", 0, 0, 1), 0), "596523:14:07");
  EXPECT_EQ(write_angle(2147483649, narrow_unit(":", 1, 0, 1), 0), "596523:14:09.0");
  EXPECT_EQ(write_angle(1e300, narrow_unit(":", 0, 0, 1), 0), "596523:14:2147483647");
  EXPECT_EQ(write_angle(1e20, narrow_unit(":", 1, 0, 1), 0), "596523:14:99999999997852516352.0");
  EXPECT_NO_FATAL_FAILURE(write_angle(1e300, narrow_unit("dd.mmss", 300, 0, 1), 0));
  EXPECT_NO_FATAL_FAILURE(write_angle(1e300, narrow_unit(":", 1, 0, -1), 0));
}

TEST_F(AngleText, NarrowTextIsCutAt50Bytes) {
  // The 50th byte is the end of the text.
  for (const int16_t precision : std::initializer_list<int16_t>{46, 47, 48, 60, 32767}) {
    char text[60];
    std::memset(text, '#', sizeof text);
    TWstatus status = 0;
    TWrad_to_ascii(0.5, narrow_unit("", precision, 0, 1), 0, text, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    const std::size_t length = precision == 46 ? 48 : 49;
    EXPECT_EQ(std::string(text), "0.5" + std::string(length - 3, '0'));
    EXPECT_EQ(text[50], '#');
  }
}

TEST_F(AngleText, WideTextIsWhole) {
  const auto text = std::make_unique<char16_t[]>(2 + 32767 + 1);
  TWstatus status = 0;
  TWrad_to_ascii_wide(0.5, widened(narrow_unit("", 32767, 0, 1)), 0, text.get(), &status);
  EXPECT_EQ(plain(text.get()), "0.5" + std::string(32766, '0'));
}

TEST_F(AngleText, RoundTrip) {
  std::mt19937 random(3);
  std::uniform_real_distribution<double> angle(-kPi, kPi);
  for (int i = 0; i < 300; ++i) {
    const double value = angle(random);
    for (const int16_t axis : kBothAxes) {
      for (int16_t mode = 0; mode <= 5; ++mode) {
        for (AngleUnit unit : {decimal_degrees(mode, 10), colon_form(mode, 7)}) {
          const Reading read = read_angle(write_angle(value, unit, axis), unit, axis);
          EXPECT_EQ(read.status, TW_SUCCESS);
          EXPECT_NEAR(read.value, value, 1e-12);  // what the decimals hold
        }
      }
      // The packed form loses the sign below a degree.
      if (std::fabs(value) > degrees(1)) {
        const AngleUnit unit = packed_form(0, 7);
        EXPECT_NEAR(read_angle(write_angle(value, unit, axis), unit, axis).value, value, 1e-12);
      }
    }
  }
}

}  // namespace
