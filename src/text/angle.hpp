// What the coordinate texts need of the angle texts.
#pragma once

#include "tidewater/angle_text.h"

namespace tidewater::detail {

// The unit with its narrow format made wide, cut at the 15 characters that fit.
AngleUnit with_wide_format(const AngleUnit& unit);

}  // namespace tidewater::detail
