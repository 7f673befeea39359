// Constants and longitude wraps that all families share.
#pragma once

#include <cmath>
#include <numbers>

namespace tidewater::detail {

inline constexpr double kPi = std::numbers::pi;
inline constexpr double kHalfPi = kPi / 2;
inline constexpr double kQuarterPi = kPi / 4;
inline constexpr double kTwoPi = 2 * kPi;
inline constexpr double kRadiansPerDegree = 0.017453292519943295;
inline constexpr double kDegreesPerRadian = 57.29577951308232;

constexpr double square(double v) { return v * v; }
constexpr double cube(double v) { return v * v * v; }

// The families bring a longitude difference back in forms that differ in the order and the sense of
// their comparisons; a value of exactly pi or -pi comes out differently.  The names tell the order.

// One turn at most each way; -pi becomes pi.
constexpr double wrap_above_then_at_or_below(double d) {
  if (d > kPi) d -= kTwoPi;
  if (d <= -kPi) d += kTwoPi;
  return d;
}

// One turn at most each way; -pi stays.
constexpr double wrap_above_then_below(double d) {
  if (d > kPi) d -= kTwoPi;
  if (d < -kPi) d += kTwoPi;
  return d;
}

// One turn at most each way, upwards first; -pi becomes pi.
constexpr double wrap_at_or_below_then_above(double d) {
  if (d <= -kPi) d += kTwoPi;
  if (d > kPi) d -= kTwoPi;
  return d;
}

// One turn at most each way, upwards first; -pi stays.
constexpr double wrap_below_then_above(double d) {
  if (d < -kPi) d += kTwoPi;
  if (d > kPi) d -= kTwoPi;
  return d;
}

// Adds turn (which may be negative) as long as outside(value) holds, as a loop of single steps
// would. A value that a turn no longer changes, infinities among them, is left as it is; one that
// lies more than 65536 turns out is first brought near by a remainder instead of by steps.
template <class Outside>
double add_turns_while(double value, double turn, Outside outside) {
  if (!outside(value) || value + turn == value) return value;
  constexpr double kMostSteps = 65536;
  if (std::fabs(value) > kMostSteps * std::fabs(turn)) value = std::fmod(value, turn);
  while (outside(value)) value += turn;
  return value;
}

// Whole turns, upwards first; -pi and pi stay.
inline double wrap_turns_below_then_above(double d) {
  d = add_turns_while(d, kTwoPi, [](double v) { return v < -kPi; });
  return add_turns_while(d, -kTwoPi, [](double v) { return v > kPi; });
}

// Whole turns, downwards first; -pi becomes pi.
inline double wrap_turns_above_then_at_or_below(double d) {
  d = add_turns_while(d, -kTwoPi, [](double v) { return v > kPi; });
  return add_turns_while(d, kTwoPi, [](double v) { return v <= -kPi; });
}

}  // namespace tidewater::detail
