// Lengths, areas, volumes and plain numbers as text.

#include "text/measure.hpp"

#include <string>
#include <string_view>

#include "text/locale.hpp"
#include "text/wide.hpp"
#include "tidewater/measure_text.h"

using namespace tidewater::detail;

namespace {

// Beyond it a narrow text is not read.
constexpr std::size_t kReadLimit = 50;
// Bytes that the text of a plain number takes at most, with its end.
constexpr std::size_t kWriteLimit = 50;

std::string quotient_text(double value, int16_t precision, double unit) {
  adopt_user_locale();
  return decimal_text(value / unit, precision);
}

// An area or a volume: unlike the unit of a length, that of these must be above zero.
std::string region_text(double value, int16_t precision, double unit, TWstatus* status) {
  *status = TW_SUCCESS;
  if (unit <= 0) {
    *status = TW_RANGE_ERROR;
    return {};
  }
  return quotient_text(value, precision, unit);
}

using MeasureText = std::string(double value, int16_t precision, double unit, TWstatus* status);

void write(MeasureText* measure_text, double value, int16_t precision, double unit, char* text,
           TWstatus* status) {
  without_exceptions(status, [&] {
    const std::string narrowed = measure_text(value, precision, unit, status);
    if (*status == TW_SUCCESS) copy_whole(narrowed, text);
  });
}

void write_wide(MeasureText* measure_text, double value, int16_t precision, double unit,
                TWchar16* text, TWstatus* status) {
  without_exceptions(status, [&] {
    const std::string narrowed = measure_text(value, precision, unit, status);
    if (*status == TW_SUCCESS) copy_whole(widen(narrowed, narrowed.size()), text);
  });
}

void read_wide(const TWchar16* text, double unit, double* value, TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    adopt_user_locale();
    const std::u16string_view given = text;
    // By contract: no comma, also where it is the locale's decimal point.
    if (given.find_first_not_of(u"0123456789.-+eE \n") != given.npos) {
      *status = TW_BAD_TEXT;
      return;
    }
    double number = 0;
    scan_number(given, &number);
    *value = unit * number;
  });
}

void read(const char* text, double unit, double* value, TWstatus* status) {
  *status = TW_SUCCESS;
  without_exceptions(status, [&] {
    adopt_user_locale();
    read_wide(widen(text, kReadLimit).c_str(), unit, value, status);
  });
}

}  // namespace

std::string tidewater::detail::length_text(double value, int16_t precision, double unit,
                                           TWstatus* status) {
  *status = TW_SUCCESS;
  if (unit == 0) {
    *status = TW_RANGE_ERROR;
    return {};
  }
  return quotient_text(value, precision, unit);
}

void TWmet_to_ascii(double value, int16_t precision, double unit, char* text, TWstatus* status) {
  write(length_text, value, precision, unit, text, status);
}

void TWmet_to_ascii_wide(double value, int16_t precision, double unit, TWchar16* text,
                         TWstatus* status) {
  write_wide(length_text, value, precision, unit, text, status);
}

void TWsq_met_to_ascii(double value, int16_t precision, double unit, char* text, TWstatus* status) {
  write(region_text, value, precision, unit, text, status);
}

void TWsq_met_to_ascii_wide(double value, int16_t precision, double unit, TWchar16* text,
                            TWstatus* status) {
  write_wide(region_text, value, precision, unit, text, status);
}

void TWcub_met_to_ascii(double value, int16_t precision, double unit, char* text,
                        TWstatus* status) {
  write(region_text, value, precision, unit, text, status);
}

void TWcub_met_to_ascii_wide(double value, int16_t precision, double unit, TWchar16* text,
                             TWstatus* status) {
  write_wide(region_text, value, precision, unit, text, status);
}

void TWascii_to_met(const char* text, double unit, double* value, TWstatus* status) {
  read(text, unit, value, status);
}

void TWascii_to_met_wide(const TWchar16* text, double unit, double* value, TWstatus* status) {
  read_wide(text, unit, value, status);
}

void TWascii_to_sq_met(const char* text, double unit, double* value, TWstatus* status) {
  read(text, unit, value, status);
}

void TWascii_to_sq_met_wide(const TWchar16* text, double unit, double* value, TWstatus* status) {
  read_wide(text, unit, value, status);
}

void TWascii_to_cub_met(const char* text, double unit, double* value, TWstatus* status) {
  read(text, unit, value, status);
}

void TWascii_to_cub_met_wide(const TWchar16* text, double unit, double* value, TWstatus* status) {
  read_wide(text, unit, value, status);
}

void TWscalr_to_asc(double value, int16_t precision, char* text, TWstatus* status) {
  without_exceptions(status, [&] {
    const std::u16string separator = adopt_user_locale_signs().decimal_separator;
    const std::string narrowed = decimal_text(value, precision);
    if (narrowed.empty()) {
      *status = TW_FAILURE;
      return;
    }
    *status = TW_SUCCESS;
    std::u16string number = widen(narrowed, narrowed.size());
    // By contract: zeros are cut also where there is no separator, so 100 at precision 0 becomes 1.
    while (number.size() > 1 && number.back() == u'0') number.pop_back();
    if (number.size() > separator.size()) {
      const std::size_t tail = number.size() - separator.size();
      if (separator.find(number[tail]) != separator.npos) number.resize(tail);
    }
    copy_cut(narrow(number), kWriteLimit, text);
  });
}
