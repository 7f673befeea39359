// A longitude within half a turn of the central meridian.
#pragma once

#include <cmath>

#include "formulas/wraps.hpp"

namespace tidewater::detail {

// Adds whole turns to lon until lon - lon0 lies in [-pi, pi]; a difference of exactly pi or -pi
// stays.  Differences too large to be worked off in steps are brought near by a remainder.
inline double turns_about(double lon0, double lon) {
  const double d = lon - lon0;
  if (std::fabs(d) <= kPi) return lon;
  constexpr double kMostStepped = 65536 * kTwoPi;
  if (std::fabs(d) > kMostStepped) {
    const double near = wrap_turns_below_then_above(d);
    return near == d ? lon : lon0 + near;
  }
  lon = add_turns_while(
      lon, kTwoPi, [lon0](double v) { return v - lon0 < -kPi; }, lon0);
  return add_turns_while(
      lon, -kTwoPi, [lon0](double v) { return v - lon0 > kPi; }, lon0);
}

}  // namespace tidewater::detail
