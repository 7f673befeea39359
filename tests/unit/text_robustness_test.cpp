// Garbage through every reader and writer of texts, in buffers of exactly the promised size: what
// goes wrong is seen by the sanitizers, what is written by the checks here.

#include <gtest/gtest.h>

#include <cstring>
#include <limits>
#include <random>

#include "support/text.hpp"

using namespace tidewater::test;

namespace {

class Garbage {
 public:
  explicit Garbage(unsigned seed) : random_(seed) {}

  std::size_t below(std::size_t count) {
    return std::uniform_int_distribution<std::size_t>(0, count - 1)(random_);
  }

  // Short and long, most of characters that some reader admits.
  template <class Char>
  std::basic_string<Char> text() {
    static constexpr std::string_view kAdmitted = "0123456789NEWSnews,.+- :\n00..::--";
    const std::size_t length = below(8) == 0 ? below(400) : below(24);
    const bool wild = below(4) == 0;
    std::basic_string<Char> text;
    while (text.size() < length) {
      const bool any = wild && below(6) == 0;
      const auto c = any ? static_cast<Char>(1 + below(std::numeric_limits<Char>::max()))
                         : static_cast<Char>(kAdmitted[below(kAdmitted.size())]);
      text += c;
    }
    // A high byte now and then, also as the last one.
    if constexpr (sizeof(Char) == 1) {
      if (wild && !text.empty()) text[below(text.size())] = static_cast<char>(0x80 + below(0x80));
    }
    return text;
  }

  double number() {
    static constexpr double kOdd[] = {0,      -0.0,      1,          -1,         59.9995,     1e308,
                                      -1e308, 5e-324,    2147483647, 2147483648, -2147483649, 4e9,
                                      1e22,   kInfinity, -kInfinity, kNaN};
    if (below(3) == 0) return kOdd[below(std::size(kOdd))];
    const double size = std::ldexp(1, static_cast<int>(below(120)) - 60);
    return std::uniform_real_distribution<double>(-size, size)(random_);
  }

  int16_t integer() {
    static constexpr int16_t kOdd[] = {0, -1, -2, -3, -4, 300, 32767, -32768};
    return below(4) == 0 ? kOdd[below(std::size(kOdd))] : static_cast<int16_t>(below(9));
  }

  // Formats with and without an end; all bytes of the record are given.
  AngleUnit unit() {
    static constexpr std::string_view kFormats[] = {"dd.mmss", "dd:mm:ss", "deg", ""};
    AngleUnit unit =
        narrow_unit(kFormats[below(4)], integer(), integer(), below(2) == 0 ? kPi / 180 : number());
    if (below(4) == 0) {
      for (char& c : unit.format) c = static_cast<char>(1 + below(255));
    }
    return unit;
  }

 private:
  std::mt19937 random_;
};

bool untouched_or(double value, bool written) { return written || value == kUntouched; }

class TextRobustness : public ::testing::TestWithParam<const char*> {
 protected:
  void SetUp() override {
    locale_.emplace(GetParam());
    if (!locale_->found()) GTEST_SKIP() << "the locale " << GetParam() << " is not on this machine";
  }

 private:
  std::optional<ScopedLocale> locale_;
};

TEST_P(TextRobustness, Readers) {
  Garbage garbage(11);
  for (int i = 0; i < 1'500; ++i) {
    const AngleUnit unit = garbage.unit();
    const int16_t axis = garbage.integer();
    const double scale = garbage.number();
    const double other_scale = garbage.number();
    const std::string text = garbage.text<char>();
    const std::u16string wide_text = garbage.text<char16_t>();

    for (const auto read : {&TWascii_to_met, &TWascii_to_sq_met, &TWascii_to_cub_met}) {
      Reading reading = {kUntouched, 0};
      read(exact<char>(text).get(), scale, &reading.value, &reading.status);
      EXPECT_TRUE(reading.status == TW_SUCCESS || reading.status == TW_BAD_TEXT);
      EXPECT_TRUE(untouched_or(reading.value, reading.status == TW_SUCCESS));
    }
    for (const auto read :
         {&TWascii_to_met_wide, &TWascii_to_sq_met_wide, &TWascii_to_cub_met_wide}) {
      Reading reading = {kUntouched, 0};
      read(exact<char16_t>(wide_text).get(), scale, &reading.value, &reading.status);
      EXPECT_TRUE(reading.status == TW_SUCCESS || reading.status == TW_BAD_TEXT);
      EXPECT_TRUE(untouched_or(reading.value, reading.status == TW_SUCCESS));
    }

    Reading reading = {kUntouched, 0};
    TWascii_to_rad(exact<char>(text).get(), unit, axis, &reading.value, &reading.status);
    EXPECT_TRUE(reading.status == TW_SUCCESS || reading.status == TW_BAD_TEXT);
    const auto block = exact<char16_t>(wide_text, 1);
    TWascii_to_rad_wide(block.get(), unit, axis, &reading.value, &reading.status);
    EXPECT_TRUE(reading.status == TW_SUCCESS || reading.status == TW_BAD_TEXT);
    EXPECT_LE(std::u16string_view(block.get()).size(), wide_text.size() + 1);

    CoordinateTriple point = kUntouchedPoint;
    TWstatus status = 0;
    const auto expect_whole_or_none = [&] {
      EXPECT_TRUE(status == TW_SUCCESS || status == TW_BAD_TEXT || status == TW_BAD_LONGITUDE ||
                  status == TW_BAD_LATITUDE);
      if (status != TW_SUCCESS) expect_untouched(point);
      point = kUntouchedPoint;
    };
    TWascii_to_llh(exact<char>(text).get(), unit, axis, scale, &point, &status);
    expect_whole_or_none();
    TWascii_to_enh(exact<char>(text).get(), axis, scale, other_scale, &point, &status);
    expect_whole_or_none();
    TWascii_to_xyz(exact<char>(text).get(), scale, &point, &status);
    expect_whole_or_none();
  }
}

// Writes once with ample room and once more into a block of the size that was needed.
template <class Char, class Write>
void write_exactly(Write write) {
  constexpr std::size_t kAmple = 34'000;
  const auto ample = std::make_unique<Char[]>(kAmple);
  ample[0] = '#';
  ample[1] = 0;
  if (!write(ample.get())) {
    EXPECT_EQ(ample[0], '#');
    return;
  }
  const std::size_t length = std::char_traits<Char>::length(ample.get());
  ASSERT_LT(length, kAmple);
  const auto block = std::make_unique<Char[]>(length + 1);
  EXPECT_TRUE(write(block.get()));
  EXPECT_EQ(std::memcmp(block.get(), ample.get(), (length + 1) * sizeof(Char)), 0);
}

TEST_P(TextRobustness, Writers) {
  Garbage garbage(12);
  for (int i = 0; i < 400; ++i) {
    const AngleUnit unit = garbage.unit();
    const CoordinateTriple point = {garbage.number(), garbage.number(), garbage.number()};
    const double scale = garbage.number();
    const double height_scale = garbage.number();
    const int16_t order = garbage.integer();
    const int16_t precision = garbage.integer();
    const int16_t height_precision = garbage.integer();
    TWstatus status = 0;

    for (const auto write : {&TWmet_to_ascii, &TWsq_met_to_ascii, &TWcub_met_to_ascii}) {
      write_exactly<char>([&](char* text) {
        write(point.x, precision, scale, text, &status);
        EXPECT_TRUE(status == TW_SUCCESS || status == TW_RANGE_ERROR);
        return status == TW_SUCCESS;
      });
    }
    for (const auto write :
         {&TWmet_to_ascii_wide, &TWsq_met_to_ascii_wide, &TWcub_met_to_ascii_wide}) {
      write_exactly<char16_t>([&](char16_t* text) {
        write(point.x, precision, scale, text, &status);
        EXPECT_TRUE(status == TW_SUCCESS || status == TW_RANGE_ERROR);
        return status == TW_SUCCESS;
      });
    }
    write_exactly<char16_t>([&](char16_t* text) {
      TWrad_to_ascii_wide(point.x, unit, order, text, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      return true;
    });

    // These have buffers of a fixed size.
    TWrad_to_ascii(point.x, unit, order, std::make_unique<char[]>(50).get(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWscalr_to_asc(point.x, precision, std::make_unique<char[]>(50).get(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWllh_to_ascii(&point, unit, order, 1, height_precision, height_scale,
                   std::make_unique<char[]>(156).get(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    TWenh_to_ascii(&point, order, precision, scale, 1, height_precision, height_scale,
                   std::make_unique<char[]>(182).get(), &status);
    EXPECT_EQ(status, scale == 0 ? TW_RANGE_ERROR : TW_SUCCESS);
    TWxyz_to_ascii(&point, precision, scale, std::make_unique<char[]>(158).get(), &status);
    EXPECT_EQ(status, scale == 0 ? TW_RANGE_ERROR : TW_SUCCESS);
  }
}

TEST_P(TextRobustness, TextsOfOneCharacter) {
  for (const AngleUnit& unit : {decimal_degrees(0), colon_form(0), packed_form(0)}) {
    for (int16_t mode = 0; mode <= 5; ++mode) {
      AngleUnit moded = unit;
      moded.hemisphere_mode = mode;
      for (int c = 1; c < 256; ++c) {
        const std::string text(1, static_cast<char>(c));
        double value = 0;
        TWstatus status = 0;
        TWascii_to_rad(exact<char>(text).get(), moded, 1, &value, &status);
        EXPECT_TRUE(status == TW_SUCCESS || status == TW_BAD_TEXT);
        CoordinateTriple point;
        TWascii_to_llh(exact<char>(text).get(), moded, 0, 1, &point, &status);
        EXPECT_TRUE(status == TW_SUCCESS || status == TW_BAD_TEXT);
      }
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Locales, TextRobustness,
                         ::testing::Values("C", "C.UTF-8", kCommaLocale, kArabicLocale),
                         [](const auto& test) {
                           std::string name = test.param;
                           std::erase_if(name, [](unsigned char c) { return !std::isalnum(c); });
                           return name;
                         });

}  // namespace
