#include <gtest/gtest.h>

#include <charconv>
#include <clocale>
#include <cmath>
#include <random>

#include "number_text.hpp"
#include "support/text.hpp"
#include "tidewater/position_text.hpp"

using namespace tidewater;

namespace {

void expect_angle(std::string_view text, double degrees, Axis axis = Axis::unknown) {
  const ParsedAngle angle = parse_angle(text);
  EXPECT_TRUE(angle) << text << ": " << angle.reason;
  EXPECT_NEAR(angle.degrees, degrees, 2e-14 * std::fabs(degrees)) << text;
  EXPECT_EQ(angle.axis, axis) << text;
}

// The sentence holds these words, and the text itself where it is short.
void expect_refused(std::string_view text, std::string_view words, Axis axis = Axis::unknown,
                    bool comma = false) {
  const ParsedAngle angle = parse_angle(text, axis, comma);
  EXPECT_FALSE(angle) << text;
  EXPECT_TRUE(std::isnan(angle.degrees)) << text;
  EXPECT_NE(angle.reason.find(words), std::string::npos) << text << ": " << angle.reason;
  EXPECT_EQ(angle.reason.empty() ? ' ' : angle.reason.back(), '.') << angle.reason;
}

constexpr double kFull = 48 + 51 / 60.0 + 24 / 3600.0;

TEST(AngleFromText, DecimalDegrees) {
  expect_angle("48.5", 48.5);
  expect_angle("-48.5", -48.5);
  expect_angle("+48.5", 48.5);
  expect_angle("  48.5 \r\n", 48.5);
  expect_angle(".5", 0.5);
  expect_angle("5.", 5);
  expect_angle("360", 360);
  expect_angle("1.5e-05", 1.5e-5);
  expect_angle("1.5E+01", 15);
  expect_angle(
      "\u2212"
      "48.5",
      -48.5);
  expect_angle("48.5\u00B0", 48.5);
  expect_angle("48.5 deg", 48.5);
  expect_angle("48.5d", 48.5);
}

TEST(AngleFromText, Letters) {
  expect_angle("48.5N", 48.5, Axis::latitude);
  expect_angle("48.5 s", -48.5, Axis::latitude);
  expect_angle("W 148.5", -148.5, Axis::longitude);
  expect_angle("e148.5", 148.5, Axis::longitude);
  expect_angle("48.5 north", 48.5, Axis::latitude);
  expect_angle("West 48.5", -48.5, Axis::longitude);
  expect_angle("048.5N", 48.5, Axis::latitude);
}

TEST(AngleFromText, DegreesMinutesSeconds) {
  for (const char* text :
       {"48\u00B051'24\"N", "48 51 24 N", "48d51'24\"N", "48d51m24sN", "48:51:24N", "N48:51:24",
        "N 48\u00B0 51\u2032 24\u2033", "48\u00B051\u201924\u201DN", "48\u00BA51'24''N",
        "48\u00B051\u203224\u2032\u2032N", "48-51-24N", "48deg 51min 24sec N", "48 51.4 N",
        "N48 51.4", "48\u00B051.4'N",
        "\x34\x38\xB0"
        "51'24\"N",
        "48\u00B0 51\u00B4 24\u2033 N"}) {
    expect_angle(text, kFull, Axis::latitude);
  }
  expect_angle("48d51'24\"", kFull);
  expect_angle("48d51m24s", kFull);
  expect_angle("-48:51:24", -kFull);
  expect_angle("-0:30:00", -0.5);
  expect_angle("-0 30", -0.5);
  expect_angle("48:51:24.5S", -(kFull + 0.5 / 3600), Axis::latitude);
  expect_angle("30'", 0.5);
  expect_angle("36\"", 0.01);
  expect_angle("48\u00B036\"", 48.01);
  expect_angle("0\u00B059'59.9999\"", 59.0 / 60 + 59.9999 / 3600);
}

TEST(AngleFromText, PackedDigitsNeedTheirLetter) {
  expect_angle("485124N", kFull, Axis::latitude);
  expect_angle("4851N", 48.85, Axis::latitude);
  expect_angle("4851.4N", kFull, Axis::latitude);
  expect_angle("N485124.5", kFull + 0.5 / 3600, Axis::latitude);
  expect_angle("0022107.5W", -(2 + 21 / 60.0 + 7.5 / 3600), Axis::longitude);
  expect_angle("01230E", 12.5, Axis::longitude);
  expect_angle("123E", 123, Axis::longitude);
  expect_angle("12E", 12, Axis::longitude);
  expect_refused("485124", "need a hemisphere letter");
  expect_refused("-485124", "need a hemisphere letter");
  expect_refused("1230E", "DDDMM");
  expect_refused("123005E", "DDDMMSS");
  expect_refused("0485124N", "DDMMSS");
  expect_refused("12345678N", "DDMMSS");
  expect_refused("486024N", "minutes of 60");
  expect_refused("485160N", "seconds of 60");
}

TEST(AngleFromText, WhatIsAmbiguousOrWrongIsRefused) {
  expect_refused("", "no angle");
  expect_refused("   ", "no angle");
  expect_refused("N", "no number");
  expect_refused("-", "no number");
  expect_refused("-48.5N", "both a sign and");
  expect_refused("+48.5S", "both a sign and");
  expect_refused("N48.5S", "two hemisphere letters");
  expect_refused("N48.5N", "two hemisphere letters");
  expect_refused("48 N 51", "amid the figures");
  expect_refused("48 -51 24", "sign amid");
  expect_refused("48 - 51", "sign amid");
  expect_refused("48 60 24", "minutes of 60");
  expect_refused("48 59 60", "seconds of 60");
  expect_refused("48.5 30", "only the last part");
  expect_refused("48 51.5 30", "only the last part");
  expect_refused("48 51 24 12", "more parts");
  expect_refused("48'51\u00B0", "degrees behind minutes");
  expect_refused("48\u00B0\u00B0", "without a number");
  expect_refused("48::51", "colon");
  expect_refused(":48", "colon");
  expect_refused("48:", "colon");
  expect_refused("48,5", "comma");
  expect_refused("48.5.1", "two decimal marks");
  expect_refused("48.5;", "more in it");
  expect_refused("48.5 O", "west in French");
  expect_refused("48.5 o", "write W or E");
  expect_refused("48.5 OE", "\"OE\"");
  expect_refused("48.5x", "\"x\"");
  EXPECT_EQ(parse_angle(std::string(100, '\x80')).reason,
            "\"...\" has \"...\" in it, which is no part of an angle.");
  // A long text is cut between two characters.
  expect_refused(std::string(59, ' ') + std::string(59, '1') + "\u00E9\u00E9 x",
                 "\"" + std::string(59, '1') + "...\" has \"\u00E9\"");
  expect_refused("nan", "\"nan\"");
  expect_refused("inf", "\"inf\"");
  expect_refused("48.5#", "\"#\"");
  expect_refused("48.5 NE", "\"NE\"");
  expect_refused("360.0001", "beyond 360");
  expect_refused("90.0001N", "beyond 90");
  expect_refused("1e+99", "beyond 360");
  expect_refused("1e+999", "beyond 360");
  expect_refused(std::string(400, '9'), "too large");
  expect_refused(std::string(400, '1') + " 1", "beyond 360");
  expect_refused("91", "beyond 90", Axis::latitude);
  expect_refused("45E", "letter E", Axis::latitude);
  expect_refused("45N", "letter N", Axis::longitude);
  std::string many;
  for (int i = 0; i < 100; ++i) many += "1 ";
  expect_refused(many, "more parts");
  EXPECT_LT(parse_angle(many).reason.size(), 150u);
}

TEST(AngleFromText, ACommaIsADecimalMarkWhereTold) {
  EXPECT_EQ(parse_angle("48,5", Axis::unknown, true).degrees, 48.5);
  EXPECT_EQ(parse_angle("48.5", Axis::unknown, true).degrees, 48.5);
  EXPECT_NEAR(parse_angle("48\u00B051,4'N", Axis::unknown, true).degrees, kFull, 1e-13);
  // More digits than a double holds exactly.
  EXPECT_EQ(parse_angle("48,5000000000000000000000001", Axis::unknown, true).degrees, 48.5);
  expect_refused("1,234,5", "two decimal marks", Axis::unknown, true);
  expect_refused("48,", "comma", Axis::unknown, true);
}

TEST(AngleFromText, PlainNumbersAreTheNearestDoublesInEveryLocale) {
  const tidewater::test::ScopedLocale comma(tidewater::test::kCommaLocale);
  std::mt19937_64 random(5);
  std::uniform_real_distribution<double> degrees(-360, 360);
  for (int i = 0; i < 20000; ++i) {
    const double value = degrees(random);
    char text[64];
    auto end = std::to_chars(text, text + 64, value).ptr;
    EXPECT_EQ(parse_angle({text, end}).degrees, value);
    const int decimals = i % 20;
    end = std::to_chars(text, text + 64, value, std::chars_format::fixed, decimals).ptr;
    double expected = 0;
    std::from_chars(text, end, expected);
    EXPECT_EQ(parse_angle({text, end}).degrees, expected);
  }
}

// More digits than a double has: too large is infinite, too small is nothing.
TEST(AngleFromText, DigitsBeyondADouble) {
  const auto value = [](const std::string& text) {
    const detail::Digits digits = detail::read_digits(text.data(), text.data() + text.size());
    EXPECT_EQ(digits.end, text.data() + text.size());
    return digits.value;
  };
  const std::string ones(450, '1');
  EXPECT_EQ(value(ones), HUGE_VAL);
  EXPECT_EQ(value(ones + ".5"), HUGE_VAL);
  EXPECT_EQ(value("0." + std::string(350, '0') + "1"), 0);
  EXPECT_EQ(value("0." + std::string(300, '0') + "1"), 1e-301);
  EXPECT_EQ(value("0." + ones), 1 / 9.0);
}

// Each byte in the middle, at the beginning and at the end, and every text cut at each place.
TEST(AngleFromText, NothingElseHappensToGarbage) {
  for (int byte = 0; byte < 256; ++byte) {
    for (std::string text : {"48?51", "?48", "48.5?", "?"}) {
      text[text.find('?')] = static_cast<char>(byte);
      const auto block = tidewater::test::exact<char>(text);
      const ParsedAngle angle = parse_angle({block.get(), text.size()});
      EXPECT_EQ(angle.reason.empty(), !std::isnan(angle.degrees));
    }
  }
  const std::string whole = "N 48\u00B0 51\u2032 24.5\u2033";
  for (std::size_t length = 0; length <= whole.size(); ++length) {
    std::string cut = whole.substr(0, length);
    const auto block = std::make_unique<char[]>(length);
    std::copy(cut.begin(), cut.end(), block.get());
    const ParsedAngle angle = parse_angle({block.get(), length});
    EXPECT_EQ(angle.reason.empty(), !std::isnan(angle.degrees));
  }
}

std::string written(double degrees, AngleForm form, AngleMarks marks, int precision,
                    Axis axis = Axis::unknown) {
  return format_angle(degrees, {form, marks, precision, axis});
}

TEST(AngleToText, Forms) {
  using enum AngleForm;
  using enum AngleMarks;
  EXPECT_EQ(format_angle(48.5), "48.50000000");
  EXPECT_EQ(written(-48.5, degrees, none, 1), "-48.5");
  EXPECT_EQ(written(-48.5, degrees, none, 1, Axis::latitude), "48.5S");
  EXPECT_EQ(written(48.5, degrees, symbols, 1, Axis::longitude), "48.5\u00B0E");
  EXPECT_EQ(written(kFull, seconds, symbols, 0, Axis::latitude), "48\u00B051\u203224\u2033N");
  EXPECT_EQ(written(kFull, seconds, plain, 2, Axis::latitude), "48d51'24.00\"N");
  EXPECT_EQ(written(-kFull, seconds, colons, 1), "-48:51:24.0");
  EXPECT_EQ(written(-kFull, seconds, none, 1), "-48:51:24.0");
  EXPECT_EQ(written(kFull, minutes, blanks, 2, Axis::latitude), "48 51.40N");
  EXPECT_EQ(written(kFull, packed, none, 0, Axis::latitude), "485124N");
  EXPECT_EQ(written(-2.5, packed, none, 1, Axis::longitude), "0023000.0W");
  EXPECT_EQ(written(12.5, packed, none, 0), "0123000");
  // What no latitude or longitude has is not to be read as one: 123.5 N would be 23 degrees 30.
  for (const auto& [degrees, axis] : {std::pair{123.5, Axis::latitude},
                                      {-99.9999999, Axis::latitude},
                                      {1234.5, Axis::longitude},
                                      {999.99999999, Axis::longitude}}) {
    EXPECT_FALSE(parse_angle(written(degrees, packed, none, 0, axis), axis)) << degrees;
  }
  EXPECT_EQ(written(99.5, packed, none, 0, Axis::latitude), "993000N");
  EXPECT_EQ(written(719.5, packed, none, 0, Axis::longitude), "7193000E");
  EXPECT_EQ(written(-0.5, seconds, colons, 0), "-0:30:00");
}

TEST(AngleToText, RoundingCarriesAndKeepsNoSignOfZero) {
  using enum AngleForm;
  using enum AngleMarks;
  EXPECT_EQ(written(12 + 59 / 60.0 + 59.9996 / 3600, seconds, colons, 3), "13:00:00.000");
  EXPECT_EQ(written(12 + 59 / 60.0 + 59.9994 / 3600, seconds, colons, 3), "12:59:59.999");
  EXPECT_EQ(written(12.99999, minutes, colons, 2), "13:00.00");
  EXPECT_EQ(written(-1e-9, degrees, none, 4), "0.0000");
  EXPECT_EQ(written(-1e-9, seconds, colons, 1), "0:00:00.0");
  EXPECT_EQ(written(-1e-9, degrees, none, 4, Axis::longitude), "0.0000E");
  EXPECT_EQ(written(-0.0, degrees, none, 0), "0");
  EXPECT_EQ(written(-0.5, degrees, none, 0), "0");  // to even
  for (const double odd : {std::nan(""), HUGE_VAL, -HUGE_VAL, 1.1e6}) {
    EXPECT_EQ(format_angle(odd), "nan");
  }
  EXPECT_LE(written(-1e6, seconds, symbols, 99, Axis::latitude).size(), kAngleTextSize);
  EXPECT_LE(written(-1e6, packed, none, 99).size(), kAngleTextSize);
  EXPECT_LE(written(-1e6, degrees, symbols, 99).size(), kAngleTextSize);
  EXPECT_EQ(written(1.5, degrees, none, -3), "2");
}

TEST(AngleToText, WhatIsWrittenIsReadBack) {
  using enum AngleForm;
  std::mt19937 random(7);
  std::uniform_real_distribution<double> any(-90, 90);
  for (int i = 0; i < 5000; ++i) {
    const double value = any(random);
    for (const AngleForm form : {degrees, minutes, seconds, packed}) {
      for (const AngleMarks marks : {AngleMarks::none, AngleMarks::symbols, AngleMarks::plain,
                                     AngleMarks::colons, AngleMarks::blanks}) {
        for (const Axis axis : {Axis::unknown, Axis::longitude, Axis::latitude}) {
          if (form == packed && axis == Axis::unknown) continue;
          const std::string text = format_angle(value, {form, marks, 9, axis});
          const ParsedAngle angle = parse_angle(text);
          ASSERT_TRUE(angle) << text << ": " << angle.reason;
          EXPECT_NEAR(angle.degrees, value, form == degrees ? 6e-10 : 1e-11) << text;
          EXPECT_EQ(angle.axis, axis) << text;
        }
      }
    }
  }
}

}  // namespace
