// The user's locale: the text functions adopt it for the whole process on every call.
#pragma once

#include <clocale>
#include <string>

namespace tidewater::detail {

// What the user's locale writes for the decimal separator and the signs.
struct LocaleSigns {
  std::u16string decimal_separator = u".";
  std::u16string positive = u"+";
  std::u16string negative = u"-";
};

// False where there is no such locale; the one in force then stays.
inline bool adopt_user_locale() { return std::setlocale(LC_ALL, "") != nullptr; }

// Adopts the user's locale and asks the platform for its signs.
LocaleSigns adopt_user_locale_signs();

}  // namespace tidewater::detail
