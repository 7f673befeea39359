// Longitude differences brought back by turns.
//
// The families do it in forms that differ in the order and the sense of their comparisons; a value
// of exactly pi or -pi comes out differently.  The names tell the order.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

// One turn at most each way; -pi becomes pi.
template <Number V>
TW_INLINE V wrap_above_then_at_or_below(V d) {
  d = select(d > kPi, d - kTwoPi, d);
  return select(d <= -kPi, d + kTwoPi, d);
}

// One turn at most each way; -pi stays.
template <Number V>
TW_INLINE V wrap_above_then_below(V d) {
  d = select(d > kPi, d - kTwoPi, d);
  return select(d < -kPi, d + kTwoPi, d);
}

// One turn at most each way, upwards first; -pi becomes pi.
template <Number V>
TW_INLINE V wrap_at_or_below_then_above(V d) {
  d = select(d <= -kPi, d + kTwoPi, d);
  return select(d > kPi, d - kTwoPi, d);
}

// One turn at most each way, upwards first; -pi stays.
template <Number V>
TW_INLINE V wrap_below_then_above(V d) {
  d = select(d < -kPi, d + kTwoPi, d);
  return select(d > kPi, d - kTwoPi, d);
}

// Adds turn (which may be negative) as long as outside(value) holds, as a loop of single steps
// would. A value that a turn no longer changes, infinities among them, is left as it is; from one
// that lies more than 65536 turns out of the goal the whole turns are taken off at once.  The goal
// is where the values that are not outside lie.
template <class Outside>
double add_turns_while(double value, double turn, Outside outside, double goal = 0) {
  if (!outside(value) || value + turn == value) return value;
  constexpr double kMostSteps = 65536;
  const double far = value - goal;
  if (!(abs(far) <= kMostSteps * abs(turn))) value = goal + __builtin_fmod(far, turn);
  while (outside(value)) value += turn;
  return value;
}

// The loops for the lanes that single steps did not bring back.
double turns_below_then_above(double d);
double turns_above_then_at_or_below(double d);
double turns_about_meridian(double lon0, double lon);

// Whole turns, upwards first; -pi and pi stay.
template <Number V>
TW_INLINE V wrap_turns_below_then_above(V d) {
  V result = wrap_below_then_above(d);
  mend(!(abs(result) <= kPi), result, [&](int i) { return turns_below_then_above(lane(d, i)); });
  return result;
}

// Whole turns, downwards first; -pi becomes pi.
template <Number V>
TW_INLINE V wrap_turns_above_then_at_or_below(V d) {
  V result = wrap_above_then_at_or_below(d);
  mend(!((result <= kPi) & (result > -kPi)), result,
       [&](int i) { return turns_above_then_at_or_below(lane(d, i)); });
  return result;
}

// Adds whole turns to lon, upwards first, until lon - lon0 lies in [-pi, pi]; a difference of
// exactly pi or -pi stays.
template <Number V>
TW_INLINE V turns_about(double lon0, V lon) {
  V result = select(lon - lon0 < -kPi, lon + kTwoPi, lon);
  result = select(result - lon0 > kPi, result - kTwoPi, result);
  mend(!(abs(result - lon0) <= kPi), result,
       [&](int i) { return turns_about_meridian(lon0, lane(lon, i)); });
  return result;
}

}  // namespace tidewater::detail
