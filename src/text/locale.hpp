// The user's locale: the text functions adopt it for the whole process on every call.
#pragma once

#include <string>

namespace tidewater::detail {

// What the user's locale writes for the decimal separator and the signs.
struct LocaleSigns {
  std::u16string decimal_separator = u".";
  std::u16string positive = u"+";
  std::u16string negative = u"-";
};

// Leaves the process as setlocale(LC_ALL, "") leaves it.  False where there is no such locale; the
// one in force then stays.
bool adopt_user_locale();

// Adopts the user's locale and asks the platform for its signs.
LocaleSigns adopt_user_locale_signs();

}  // namespace tidewater::detail
