// How the scale functions keep a latitude off the poles.
#pragma once

#include <cmath>

#include "foundation/numeric.hpp"

namespace tidewater::detail {

// By contract: a latitude hard by the south pole is set to just past the NORTH pole, so that its
// cosine is negative and a scale comes out large and negative.
inline double hold_off_poles(double lat, double margin) {
  if (std::fabs(lat - kHalfPi) < margin) lat = kHalfPi - margin;
  if (std::fabs(lat + kHalfPi) < margin) lat = kHalfPi + margin;
  return lat;
}

}  // namespace tidewater::detail
