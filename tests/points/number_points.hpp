// Formulas of one operation of the number each, so that it can be tried at every width.
#pragma once

#include "points/over_points.hpp"

namespace tidewater::test {

struct LesserAndGreater {
  template <points::Number V>
  TW_INLINE points::Answer<V> operator()(V a, V b) const {
    return {points::lesser(a, b), points::greater(a, b)};
  }
};

}  // namespace tidewater::test

TIDEWATER_INSTANCE(tidewater::test::LesserAndGreater)
