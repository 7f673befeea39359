// Formulas of the Robinson projection of the sphere: two clamped cubic splines through its table.
// A. H. Robinson, A New Map Projection: Its Development and Characteristics, International Yearbook
// of Cartography 14 (1974), pp. 145-155; the splines after C. de Boor, A Practical Guide to Splines
// (1978), chapter IV.
#pragma once

#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

inline constexpr int kRobinsonKnots = 19;
inline constexpr double kRobinsonYScale = 1.3523319842835606;
inline constexpr double kRobinsonXScale = 0.8487;

// Which interval of rising ends a value lies in: the number of the inner ends, `stride` apart, that
// are not above it.  A value on an inner end belongs to the interval that starts there.
template <Number V>
TW_INLINE V interval_of(V value, const double* ends, int stride) {
  V i = 0.0;
  for (int k = 1; k < kRobinsonKnots - 1; ++k)
    i = i + select(value >= ends[stride * k], 1.0, V(0.0));
  return i;
}

// The offset of a row of four coefficients from the number of its interval.
template <Number V>
TW_INLINE Bits<V> row_of(V interval) {
  return shift_left(bits(interval + 0x1.8p52) & Bits<V>(int64_t{0xff}), 2);
}

// One interval's cubic.
template <class V>
struct Cubic {
  V c0, c1, c2, c3;

  TW_INLINE static Cubic at(const double* coef, Bits<V> row) {
    return {gather(coef, row), gather(coef + 1, row), gather(coef + 2, row), gather(coef + 3, row)};
  }
  TW_INLINE V value(V t) const { return ((c3 * t + c2) * t + c1) * t + c0; }
  TW_INLINE V slope(V t) const { return (3.0 * c3 * t + 2.0 * c2) * t + c1; }
};

// What all three functions are given: knots and coefficients belong to the caller.
struct RobinsonTable {
  const double* knots;
  const double* y_coef;
  const double* x_coef;

  double last() const { return knots[kRobinsonKnots - 1]; }
};

struct RobinsonForward {
  RobinsonTable table;
  double lon0, y0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const V size = abs(lat);
    const Mask<V> plain = (size <= kHalfPi) & (size >= table.knots[0]) & (size <= table.last());
    const V i = interval_of(size, table.knots, 1);
    const auto row = row_of(i);
    const V t = size - gather(table.knots, shift_right(row, 2));
    const V distance = Cubic<V>::at(table.y_coef, row).value(t);
    const V length = Cubic<V>::at(table.x_coef, row).value(t);
    return {length * (turns_about(lon0, lon) - lon0) * kRobinsonXScale,
            select(lat >= 0.0, distance, -distance) * kRobinsonYScale - y0, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct RobinsonInverse {
  RobinsonTable table;
  double lon0, y0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V signed_distance = (y + y0) / kRobinsonYScale;
    const V distance = abs(signed_distance);
    const Mask<V> plain =
        (distance >= table.y_coef[0]) & (distance <= table.y_coef[4 * (kRobinsonKnots - 1)]);
    const auto row = row_of(interval_of(distance, table.y_coef, 4));
    const auto knot = shift_right(row, 2);
    const auto cubic = Cubic<V>::at(table.y_coef, row);
    const V low = gather(table.knots, knot);
    V lat = (distance - cubic.c0) / (gather(table.y_coef + 4, row) - cubic.c0) *
                (gather(table.knots + 1, knot) - low) +
            low;
    // Newton on the cubic of this one interval; running out of passes is not reported.
    constexpr int kMostPasses = 11;
    Mask<V> moving = plain;
    for (int pass = 0; pass < kMostPasses && any(moving); ++pass) {
      const V t = lat - low;
      const V step = (cubic.value(t) - distance) / cubic.slope(t);
      lat = select(moving, lat - step, lat);
      moving = moving & !(abs(step) <= 1e-08);
    }
    const auto length_row = row_of(interval_of(lat, table.knots, 1));
    const V length = Cubic<V>::at(table.x_coef, length_row)
                         .value(lat - gather(table.knots, shift_right(length_row, 2)));
    return {x / (length * kRobinsonXScale) + lon0, select(signed_distance >= 0.0, lat, -lat),
            plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct RobinsonScale {
  RobinsonTable table;
  double lon0, radius, a, e2, k0;
  double f;  // k0 R 0.8487

  template <Number V>
  TW_INLINE Answer3<V> scales(V d, V lat, V length, V x_slope, V y_slope) const {
    const auto p = sincos(lat);
    const V parallel = a * parallel_radius(e2, p.sin, p.cos);
    const V meridian = a * meridian_radius(e2, p.sin);
    const V k = f / parallel * length;
    const V h =
        f / meridian * sqrt(d * d * x_slope * x_slope + y_slope * y_slope * 2.5389738922523355);
    // By contract: k0 does not enter the areal scale.
    const V areal = square(radius) * 1.147724155061458 / meridian / parallel * y_slope * length;
    return {k, h, areal};
  }

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const V size = abs(lat);
    // At the last knot the slope is the given one: left to other().
    const Mask<V> plain = (size < table.last()) & (size >= table.knots[0]) & (size <= kHalfPi);
    const auto row = row_of(interval_of(size, table.knots, 1));
    const V t = size - gather(table.knots, shift_right(row, 2));
    const auto x = Cubic<V>::at(table.x_coef, row);
    auto answer = scales(turns_about(lon0, lon) - lon0, size, x.value(t), x.slope(t),
                         Cubic<V>::at(table.y_coef, row).slope(t));
    answer.plain = plain;
    return answer;
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::RobinsonForward)
TIDEWATER_INSTANCE(tidewater::detail::RobinsonInverse)
TIDEWATER_INSTANCE(tidewater::detail::RobinsonScale)
