// How the scale functions keep a latitude off the poles.
#pragma once

#include "formulas/constants.hpp"

namespace tidewater::detail {

// By contract: a latitude hard by the south pole is set to just past the NORTH pole, so that its
// cosine is negative and a scale comes out large and negative.
template <Number V>
TW_INLINE V hold_off_poles(V lat, double margin) {
  lat = select(abs(lat - kHalfPi) < margin, V(kHalfPi - margin), lat);
  return select(abs(lat + kHalfPi) < margin, V(kHalfPi + margin), lat);
}

}  // namespace tidewater::detail
