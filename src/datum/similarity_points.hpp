// Formulas of the similarity transformations of geocentric coordinates.
// IOGP Publication 373-7-2, Geomatics Guidance Note 7, part 2: coordinate frame rotation and
// Molodensky-Badekas.
#pragma once

#include "formulas/constants.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// The position vector rotated: IOGP Publication 373-7-2, Geomatics Guidance Note 7, part 2 (2022),
// sections 4.3.3 and 4.3.5.
struct SimilarityForward {
  const double* r;  // nine, row by row
  double scale;
  CoordinateTriple from, to;  // the centre in the source and in the target datum

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V z) const {
    const V u = (x - from.x) * scale;
    const V v = (y - from.y) * scale;
    const V w = (z - from.z) * scale;
    return {r[0] * u + r[1] * v + r[2] * w + to.x, r[3] * u + r[4] * v + r[5] * w + to.y,
            r[6] * u + r[7] * v + r[8] * w + to.z};
  }
};

// The transposed matrix takes the place of an inverse.
struct SimilarityInverse {
  const double* r;
  double over_scale;
  CoordinateTriple from, to;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V z) const {
    const V u = x - to.x;
    const V v = y - to.y;
    const V w = z - to.z;
    return {(r[0] * u + r[3] * v + r[6] * w) * over_scale + from.x,
            (r[1] * u + r[4] * v + r[7] * w) * over_scale + from.y,
            (r[2] * u + r[5] * v + r[8] * w) * over_scale + from.z};
  }
};

struct ConstantShift {
  double dx, dy, dz;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V z) const {
    return {x + dx, y + dy, z + dz};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::SimilarityForward)
TIDEWATER_INSTANCE(tidewater::detail::SimilarityInverse)
TIDEWATER_INSTANCE(tidewater::detail::ConstantShift)
