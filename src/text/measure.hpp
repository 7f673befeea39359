// What the coordinate texts need of the measure texts.
#pragma once

#include <cstdint>
#include <string>

#include "tidewater/frame.h"

namespace tidewater::detail {

// A length as text in the user's locale; a unit of exactly zero gives TW_RANGE_ERROR and no text.
std::string length_text(double value, int16_t precision, double unit, TWstatus* status);

}  // namespace tidewater::detail
