// Texts, units and locales for the tests.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <clocale>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "support/points.hpp"
#include "tidewater/text.h"

#ifdef _WIN32
inline int setenv(const char* name, const char* value, int) { return _putenv_s(name, value); }
inline int unsetenv(const char* name) { return _putenv_s(name, ""); }
#endif

namespace tidewater::test {

inline constexpr const char* kCommaLocale = "de_DE.UTF-8";
// Its decimal separator is U+066B, two bytes in UTF-8.
inline constexpr const char* kArabicLocale = "ps_AF.UTF-8";

// Makes a locale that of the user and of the process, and brings back what was there.
class ScopedLocale {
 public:
  explicit ScopedLocale(const char* name) : process_(std::setlocale(LC_ALL, nullptr)) {
    if (const char* user = std::getenv("LC_ALL")) user_ = user;
    setenv("LC_ALL", name, 1);
    found_ = std::setlocale(LC_ALL, "") != nullptr;
#ifdef _WIN32
    // There the user's locale is not in the environment.
    found_ = std::string_view(name) == "C";
#endif
  }
  ~ScopedLocale() {
    if (user_) {
      setenv("LC_ALL", user_->c_str(), 1);
    } else {
      unsetenv("LC_ALL");
    }
    std::setlocale(LC_ALL, process_.c_str());
  }
  ScopedLocale(const ScopedLocale&) = delete;
  ScopedLocale& operator=(const ScopedLocale&) = delete;

  bool found() const { return found_; }

 private:
  std::string process_;
  std::optional<std::string> user_;
  bool found_ = false;
};

// The tests of texts run in the plain locale, whatever the tester's own is.
class PlainLocaleTest : public ::testing::Test {
  ScopedLocale locale_{"C"};
};

inline constexpr double kArcSecond = kPi / 180 / 3600;

inline AngleUnit narrow_unit(std::string_view format, int16_t precision, int16_t mode,
                             double factor) {
  AngleUnit unit = {{""}, precision, mode, factor};
  std::copy(format.begin(), format.end(), unit.format);
  return unit;
}

inline AngleUnit decimal_degrees(int16_t mode, int16_t precision = 4) {
  return narrow_unit("deg", precision, mode, kPi / 180);
}
inline AngleUnit colon_form(int16_t mode, int16_t precision = 3) {
  return narrow_unit("dd:mm:ss", precision, mode, kArcSecond);
}
inline AngleUnit packed_form(int16_t mode, int16_t precision = 4) {
  return narrow_unit("dd.mmss", precision, mode, kArcSecond);
}

// The same unit for the wide functions; the format is plain.
inline AngleUnit widened(const AngleUnit& narrow) {
  AngleUnit unit = narrow;
  for (int i = 0; i < 16; ++i) {
    unit.wide_format[i] = static_cast<unsigned char>(narrow.format[i]);
  }
  unit.wide_format[15] = 0;
  return unit;
}

inline std::u16string wide(std::string_view plain) { return {plain.begin(), plain.end()}; }
inline std::string plain(std::u16string_view wide) {
  std::string text;
  for (const char16_t unit : wide) text += static_cast<char>(unit);
  return text;
}

// A text on the heap, in a block of its own size, so that the address sanitizer sees the next byte.
template <class Char>
std::unique_ptr<Char[]> exact(std::basic_string_view<Char> text, std::size_t room = 0) {
  auto block = std::make_unique<Char[]>(text.size() + 1 + room);
  std::copy(text.begin(), text.end(), block.get());
  return block;
}

struct Reading {
  double value;
  TWstatus status;
};

// Reads by the narrow and by the wide function, which must agree.
inline Reading read_angle(std::string_view text, const AngleUnit& unit, int16_t axis) {
  Reading narrow = {kUntouched, 0};
  TWascii_to_rad(exact(text).get(), unit, axis, &narrow.value, &narrow.status);
  Reading wide_reading = {kUntouched, 0};
  const auto block = exact<char16_t>(wide(text), 1);
  TWascii_to_rad_wide(block.get(), widened(unit), axis, &wide_reading.value, &wide_reading.status);
  EXPECT_EQ(narrow.status, wide_reading.status) << text;
  EXPECT_TRUE(narrow.value == wide_reading.value || std::isnan(narrow.value)) << text;
  return narrow;
}

// Writes by the narrow and by the wide function, which must agree.
inline std::string write_angle(double value, const AngleUnit& unit, int16_t axis) {
  const auto text = std::make_unique<char[]>(50);
  TWstatus status = 0;
  TWrad_to_ascii(value, unit, axis, text.get(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  const auto wide_text = std::make_unique<char16_t[]>(70'000);
  status = 0;
  TWrad_to_ascii_wide(value, widened(unit), axis, wide_text.get(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(text.get(), plain(wide_text.get()).substr(0, 49));
  return text.get();
}

}  // namespace tidewater::test
