#include "formulas/wraps.hpp"

namespace tidewater::detail {

double turns_below_then_above(double d) {
  d = add_turns_while(d, kTwoPi, [](double v) { return v < -kPi; });
  return add_turns_while(d, -kTwoPi, [](double v) { return v > kPi; });
}

double turns_above_then_at_or_below(double d) {
  d = add_turns_while(d, -kTwoPi, [](double v) { return v > kPi; });
  return add_turns_while(d, kTwoPi, [](double v) { return v <= -kPi; });
}

double turns_about_meridian(double lon0, double lon) {
  lon = add_turns_while(
      lon, kTwoPi, [lon0](double v) { return v - lon0 < -kPi; }, lon0);
  return add_turns_while(
      lon, -kTwoPi, [lon0](double v) { return v - lon0 > kPi; }, lon0);
}

}  // namespace tidewater::detail
