#include <clocale>

#include "text/locale.hpp"
#include "text/wide.hpp"

namespace tidewater::detail {

LocaleSigns adopt_user_locale_signs() {
  LocaleSigns signs;
  if (!adopt_user_locale()) return signs;
  const std::lconv* locale = std::localeconv();
  signs.decimal_separator = widen_or(locale->decimal_point, signs.decimal_separator);
  signs.positive = widen_or(locale->positive_sign, signs.positive);
  signs.negative = widen_or(locale->negative_sign, signs.negative);
  return signs;
}

}  // namespace tidewater::detail
