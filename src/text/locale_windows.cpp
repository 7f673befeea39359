#include <windows.h>

#include <clocale>

#include "text/locale.hpp"
#include "text/wide.hpp"

namespace tidewater::detail {

namespace {

std::u16string item_or(LCID user, LCTYPE item, const std::u16string& otherwise) {
  char text[40] = "";
  if (GetLocaleInfoA(user, item, text, sizeof text) == 0) return otherwise;
  return widen_or(text, otherwise);
}

}  // namespace

bool adopt_user_locale() { return std::setlocale(LC_ALL, "") != nullptr; }

LocaleSigns adopt_user_locale_signs() {
  adopt_user_locale();
  LocaleSigns signs;
  const LCID user = GetUserDefaultLCID();
  if (user == 0) return signs;
  signs.decimal_separator = item_or(user, LOCALE_SDECIMAL, signs.decimal_separator);
  signs.positive = item_or(user, LOCALE_SPOSITIVESIGN, signs.positive);
  signs.negative = item_or(user, LOCALE_SNEGATIVESIGN, signs.negative);
  return signs;
}

}  // namespace tidewater::detail
