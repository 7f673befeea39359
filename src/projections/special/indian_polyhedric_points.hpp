// Formulas of the polyhedric projection of the Indian quarter-inch sheets: a short power series
// about an origin, and its inverse by small steps.
// Survey of India, Auxiliary Tables, 5th edition (1907), polyhedric projection.
#pragma once

#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

inline constexpr int kPolyhedricPasses = 30;
inline constexpr double kPolyhedricTolerance = 1e-09;

struct PolyhedricSeries {
  double c1, c2, c3, c4, c5, c6;

  template <Number V>
  TW_INLINE V x(V d, V p) const {
    return (c1 - p * c3) * d;
  }
  template <Number V>
  TW_INLINE V y(V d, V p) const {
    return (p * (c5 * c4) + p * p * c6 + c2) * p + d * d * c4;
  }
};

struct PolyhedricForward {
  double lon0, lat0;
  PolyhedricSeries series;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const V d = wrap_above_then_at_or_below(lon - lon0);
    const V p = lat - lat0;
    return {series.x(d, p), series.y(d, p)};
  }
};

struct PolyhedricInverse {
  double lon0, lat0;
  double w;  // what turns a residual into a step
  PolyhedricSeries series;

  // Points whose residual rises on the way, or that use up the passes, are gone through one by one.
  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    // By contract: the origin's angles are taken off plane values for the start.
    V d = (x - lon0) * w;
    V p = (y - lat0) * w;
    V r = 1e10;
    Mask<V> moving = everywhere<V>(true);
    Mask<V> rises = everywhere<V>(false);
    for (int pass = 1; pass <= kPolyhedricPasses && any(moving); ++pass) {
      const V ey = y - series.y(d, p);
      const V ex = x - series.x(d, p);
      d = select(moving, d + w * ex, d);
      p = select(moving, p + w * ey, p);
      const V residual = sqrt(ex * ex + ey * ey);
      if (pass > 2) rises = rises | (moving & (residual > r));
      r = select(moving, residual, r);
      moving = moving & (r > kPolyhedricTolerance);
    }
    const Mask<V> plain = !(rises | moving);
    return {d + lon0, p + lat0, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::PolyhedricForward)
TIDEWATER_INSTANCE(tidewater::detail::PolyhedricInverse)
