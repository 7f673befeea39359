#include <gtest/gtest.h>

#include <cstdlib>
#include <optional>
#include <string>
#include <thread>

#include "support/data.hpp"
#include "support/text.hpp"

using namespace tidewater::test;

namespace {

// The user has the locale; the process begins in the plain one.
class LocaleText : public ::testing::Test {
 protected:
  void use(const char* name) {
    locale_.emplace(name);
    if (!locale_->found()) GTEST_SKIP() << "the locale " << name << " is not on this machine";
    std::setlocale(LC_ALL, "C");
  }

  static std::string process_locale() { return std::setlocale(LC_ALL, nullptr); }

 private:
  std::optional<ScopedLocale> locale_;
};

class CommaLocaleText : public LocaleText {
 protected:
  void SetUp() override { use(kCommaLocale); }
};

class ArabicLocaleText : public LocaleText {
 protected:
  void SetUp() override { use(kArabicLocale); }
};

void expect_read(std::string_view text, const AngleUnit& unit, double value) {
  const Reading read = read_angle(text, unit, 0);
  EXPECT_EQ(read.status, TW_SUCCESS) << text;
  EXPECT_NEAR(read.value, value, 2e-15) << text;
}

void expect_refused(std::string_view text, const AngleUnit& unit) {
  const Reading read = read_angle(text, unit, 0);
  EXPECT_EQ(read.status, TW_BAD_TEXT) << text;
  EXPECT_EQ(read.value, kUntouched) << text;
}

TEST_F(CommaLocaleText, AnglesAreReadWithAComma) {
  expect_read("12,5", decimal_degrees(0), degrees(12.5));
  expect_read("-12,5", decimal_degrees(0), degrees(-12.5));
  expect_read("12,5W", decimal_degrees(5), degrees(-12.5));
  expect_read("W12,5", decimal_degrees(4), degrees(-12.5));
  expect_read("12:30:05,25", colon_form(0), degrees(12, 30, 5.25));
  // The full stop is not among the characters, so the packed form has degrees only.
  expect_refused("12.5", decimal_degrees(0));
  expect_refused("12.3000", packed_form(0));
  expect_read("12,5", packed_form(0), degrees(12.5));
  expect_read("-12,5", packed_form(0), degrees(-12.5));
}

TEST_F(CommaLocaleText, AnglesAreWrittenWithAComma) {
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(0, 2), 0), "-12,50");
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(5, 2), 0), "12,50W");
  EXPECT_EQ(write_angle(degrees(12, 30, 5.25), colon_form(0, 2), 0), "12:30:05,25");
  // The packed form loses a second full stop only.
  EXPECT_EQ(write_angle(degrees(12, 30, 5.25), packed_form(0, 2), 0), "12.3005,25");
  EXPECT_EQ(write_angle(degrees(12, 30, 5), packed_form(0, 0), 0), "12.3005");
}

TEST_F(CommaLocaleText, Measures) {
  char text[60];
  TWstatus status = 0;
  TWmet_to_ascii(1234567.5, 2, 1, text, &status);
  EXPECT_STREQ(text, "1234567,50");
  char16_t wide_text[60];
  TWsq_met_to_ascii_wide(1234567.5, 2, 1, wide_text, &status);
  EXPECT_EQ(std::u16string_view(wide_text), u"1234567,50");

  double value = kUntouched;
  TWascii_to_met("12,5", 1, &value, &status);
  EXPECT_EQ(status, TW_BAD_TEXT);
  EXPECT_EQ(value, kUntouched);
  // The full stop is admitted and ends the number.
  TWascii_to_met("12.5", 1, &value, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(value, 12);
}

TEST_F(CommaLocaleText, ScalarsLoseTheComma) {
  char text[50];
  TWstatus status = 0;
  TWscalr_to_asc(2.5, 3, text, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_STREQ(text, "2,5");
  TWscalr_to_asc(200, 3, text, &status);
  EXPECT_STREQ(text, "200");
}

TEST_F(CommaLocaleText, CoordinatesHaveOneSignForBoth) {
  const CoordinateTriple point = {1.5, -2.25, 3.5};
  char text[200];
  TWstatus status = 0;
  TWenh_to_ascii(&point, 0, 2, 1, 1, 1, 1, text, &status);
  EXPECT_STREQ(text, "1,50, -2,25, 3,5");
  TWxyz_to_ascii(&point, 1, 1, text, &status);
  EXPECT_STREQ(text, "1,5, -2,2, 3,5");
  const CoordinateTriple geodetic = {degrees(12.5), degrees(45.25), 3.5};
  TWllh_to_ascii(&geodetic, decimal_degrees(0, 1), 0, 1, 1, 1, text, &status);
  EXPECT_STREQ(text, "12,5, 45,2, 3,5");

  CoordinateTriple read = kUntouchedPoint;
  TWascii_to_enh("10,20,5,5", 0, 1, 1, &read, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(read, 10, 20, 5.5, 0);  // the height is all that stands behind the second comma
  TWascii_to_xyz("1.5,2,3", 1, &read, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(read, 1, 2, 3, 0);
  TWascii_to_llh("12,5", decimal_degrees(0), 0, 1, &read, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_near(read, degrees(12), degrees(5), 0, 1e-15);
  // What the line admits, the field does not.
  read = kUntouchedPoint;
  TWascii_to_llh("12.5,5", decimal_degrees(0), 0, 1, &read, &status);
  EXPECT_EQ(status, TW_BAD_TEXT);
  expect_untouched(read);
}

TEST_F(CommaLocaleText, EveryCallLeavesTheUsersLocale) {
  const CoordinateTriple point = {0.1, 0.2, 3};
  CoordinateTriple out;
  char text[200];
  char16_t wide_text[200] = u"1";
  double value = 0;
  TWstatus status = 0;
  const AngleUnit unit = decimal_degrees(0);
  const auto expect_adopted = [&](auto call) {
    std::setlocale(LC_ALL, "C");
    call();
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(process_locale(), kCommaLocale);
  };
  expect_adopted([&] { TWascii_to_rad("1", unit, 0, &value, &status); });
  expect_adopted([&] { TWascii_to_rad_wide(wide_text, widened(unit), 0, &value, &status); });
  expect_adopted([&] { TWrad_to_ascii(1, unit, 0, text, &status); });
  expect_adopted([&] { TWrad_to_ascii_wide(1, widened(unit), 0, wide_text, &status); });
  expect_adopted([&] { TWmet_to_ascii(1, 1, 1, text, &status); });
  expect_adopted([&] { TWcub_met_to_ascii_wide(1, 1, 1, wide_text, &status); });
  expect_adopted([&] { TWascii_to_sq_met("1", 1, &value, &status); });
  expect_adopted([&] { TWascii_to_met_wide(u"1", 1, &value, &status); });
  expect_adopted([&] { TWscalr_to_asc(1, 1, text, &status); });
  expect_adopted([&] { TWllh_to_ascii(&point, unit, 0, 1, 1, 1, text, &status); });
  expect_adopted([&] { TWenh_to_ascii(&point, 0, 1, 1, 1, 1, 1, text, &status); });
  expect_adopted([&] { TWxyz_to_ascii(&point, 1, 1, text, &status); });
  expect_adopted([&] { TWascii_to_llh("1,1", unit, 0, 1, &out, &status); });
  expect_adopted([&] { TWascii_to_enh("1,1", 0, 1, 1, &out, &status); });
  expect_adopted([&] { TWascii_to_xyz("1,1,1", 1, &out, &status); });

  // A refused unit comes before the locale, a refused character of a coordinate as well.
  std::setlocale(LC_ALL, "C");
  TWmet_to_ascii(1, 1, 0, text, &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  TWsq_met_to_ascii(1, 1, -1, text, &status);
  TWcub_met_to_ascii_wide(1, 1, 0, wide_text, &status);
  EXPECT_EQ(status, TW_RANGE_ERROR);
  TWascii_to_llh("Q", unit, 0, 1, &out, &status);
  TWascii_to_enh("Q", 0, 1, 1, &out, &status);
  TWascii_to_xyz("Q", 1, &out, &status);
  EXPECT_EQ(status, TW_BAD_TEXT);
  EXPECT_EQ(process_locale(), "C");
  // A refused character of an angle or a measure comes after it.
  TWascii_to_rad("Q", unit, 0, &value, &status);
  EXPECT_EQ(process_locale(), kCommaLocale);
  std::setlocale(LC_ALL, "C");
  TWascii_to_met("Q", 1, &value, &status);
  EXPECT_EQ(process_locale(), kCommaLocale);
}

TEST_F(CommaLocaleText, NarrowTextIsWidenedByTheLocale) {
  Reading read = {kUntouched, 0};
  for (const char* text : {"12\xC2\xB0", "\xC3", "\xC3\xC3", "\xFF", "12\xF0\x9F\x98\x80"}) {
    TWascii_to_rad(text, decimal_degrees(0), 0, &read.value, &read.status);
    EXPECT_EQ(read.status, TW_BAD_TEXT);
  }
  // Fifteen characters of a format fit, however many bytes they have.
  const AngleUnit accents = narrow_unit("ääääääääääääää:", 0, 0, 1);
  TWascii_to_rad("1:1:1", accents, 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);
  EXPECT_EQ(read.value, 3661);
  const AngleUnit more = narrow_unit("äääääääääääääää:", 0, 0, 1);
  TWascii_to_rad("1:1:1", more, 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_BAD_TEXT);
  // One that ends in half a character.
  AngleUnit half = narrow_unit(std::string(32, 'x'), 0, 0, 1);
  half.format[31] = '\xC3';
  TWascii_to_rad("1", half, 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);
}

TEST_F(ArabicLocaleText, ASeparatorOfTwoBytes) {
  Reading read = {kUntouched, 0};
  TWascii_to_rad("12\u066B5", decimal_degrees(0), 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);
  EXPECT_NEAR(read.value, degrees(12.5), 1e-15);
  const auto block = exact<char16_t>(u"12:30:05\u066B25 W", 1);
  TWascii_to_rad_wide(block.get(), widened(colon_form(5)), 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_SUCCESS);
  EXPECT_NEAR(read.value, -degrees(12, 30, 5.25), 1e-15);
  TWascii_to_rad("12.5", decimal_degrees(0), 0, &read.value, &read.status);
  EXPECT_EQ(read.status, TW_BAD_TEXT);

  char text[50];
  TWstatus status = 0;
  TWrad_to_ascii(degrees(-12.5), decimal_degrees(4, 1), 0, text, &status);
  EXPECT_STREQ(text, "W12\u066B5");
  char16_t wide_text[50];
  TWrad_to_ascii_wide(degrees(-12.5), widened(decimal_degrees(4, 1)), 0, wide_text, &status);
  EXPECT_EQ(std::u16string_view(wide_text), u"W12\u066B5");
  TWcub_met_to_ascii_wide(12.5, 1, 1, wide_text, &status);
  EXPECT_EQ(std::u16string_view(wide_text), u"12\u066B5");
  TWscalr_to_asc(2.5, 3, text, &status);
  EXPECT_STREQ(text, "2\u066B5");
  TWscalr_to_asc(200, 3, text, &status);
  EXPECT_STREQ(text, "200");
  // The cut falls between characters: 48 digits, then a separator that does not fit whole.
  TWrad_to_ascii(2e47, narrow_unit("", 1, 0, 1), 0, text, &status);
  EXPECT_EQ(std::string(text).size(), 48u);
  TWrad_to_ascii(2e46, narrow_unit("", 1, 0, 1), 0, text, &status);
  EXPECT_EQ(std::string(text).substr(47), "\u066B");
}

TEST_F(LocaleText, ALocaleThatIsNotThereGivesTheDefaults) {
  TIDEWATER_NOT_ON_WINDOWS("the user's locale is always there");
  const ScopedLocale nowhere("xx_XX.UTF-8");
  ASSERT_FALSE(nowhere.found());
  std::setlocale(LC_ALL, "C");
  expect_read("+12.5", decimal_degrees(0), degrees(12.5));
  expect_read("12.5W", decimal_degrees(5), degrees(-12.5));
  expect_refused("12,5", decimal_degrees(0));
  EXPECT_EQ(write_angle(degrees(-12.5), decimal_degrees(0, 1), 0), "-12.5");
  char text[50];
  TWstatus status = 0;
  TWscalr_to_asc(2, 3, text, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_STREQ(text, "2");
  EXPECT_EQ(process_locale(), "C");
}

TEST_F(LocaleText, TheUsersLocaleIsAskedForOnEveryCall) {
  if (!ScopedLocale(kCommaLocale).found()) {
    GTEST_SKIP() << "the locale " << kCommaLocale << " is not on this machine";
  }
  for (int i = 0; i < 2; ++i) {
    {
      const ScopedLocale comma(kCommaLocale);
      EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), "12,5");
    }
    const ScopedLocale plain("C");
    EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), "12.5");
  }
}

// What the last adoption left may be gone in any of these ways.
TEST_F(CommaLocaleText, AChangeInBetweenIsSeen) {
  const auto expect_written = [](const char* text) {
    EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), text);
    // Nothing has changed: the second call passes the adoption over.
    EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), text);
  };
  expect_written("12,5");
  // One category of the process, the others stay.
  std::setlocale(LC_NUMERIC, "C");
  expect_written("12,5");
  EXPECT_EQ(process_locale(), kCommaLocale);
  std::setlocale(LC_TIME, "C");
  expect_written("12,5");
  EXPECT_EQ(process_locale(), kCommaLocale);

  // The entries of the environment, in the order of their rank.
  const char* const lang = std::getenv("LANG");
  const std::optional<std::string> lang_before =
      lang != nullptr ? std::optional<std::string>(lang) : std::nullopt;
  unsetenv("LC_ALL");
  setenv("LANG", "C", 1);
  expect_written("12.5");
  setenv("LC_NUMERIC", kCommaLocale, 1);
  expect_written("12,5");
  setenv("LC_NUMERIC", "C", 1);
  expect_written("12.5");
  setenv("LANG", kCommaLocale, 1);
  expect_written("12.5");
  unsetenv("LC_NUMERIC");
  expect_written("12,5");
  // Another category alone leaves a locale of several names.
  setenv("LC_TIME", "C", 1);
  expect_written("12,5");
  EXPECT_NE(process_locale().find("LC_TIME=C"), std::string::npos);
  setenv("LC_ALL", "C", 1);
  expect_written("12.5");
  EXPECT_EQ(process_locale(), "C");
  unsetenv("LC_TIME");
  if (lang_before) {
    setenv("LANG", lang_before->c_str(), 1);
  } else {
    unsetenv("LANG");
  }
}

TEST_F(CommaLocaleText, AnEnvironmentTooLongToBeRememberedIsAskedEachTime) {
  setenv("LC_UNHEARD_OF", std::string(2000, 'x').c_str(), 1);
  for (int i = 0; i < 2; ++i) {
    EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), "12,5");
    std::setlocale(LC_ALL, "C");
  }
  unsetenv("LC_UNHEARD_OF");
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), "12,5");
}

TEST_F(CommaLocaleText, EachThreadSeesTheChange) {
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), "12,5");
  std::thread([] {
    EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), "12,5");
    std::setlocale(LC_ALL, "C");
  }).join();
  EXPECT_EQ(write_angle(degrees(12.5), decimal_degrees(0, 1), 0), "12,5");
  EXPECT_EQ(process_locale(), kCommaLocale);
}

}  // namespace
