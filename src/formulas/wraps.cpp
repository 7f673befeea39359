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

}  // namespace tidewater::detail
