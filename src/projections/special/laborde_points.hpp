// The complex cubic of the Laborde projection, which turns the lines of scale of a transverse
// Mercator plane into the azimuth of the country.
// J. P. Snyder, Album of Map Projections, USGS Professional Paper 1453 (1989), p. 219; J. Laborde,
// Traite des projections des cartes geographiques a l'usage des cartographes et des geodesiens,
// fasc. 4 (1932).
#pragma once

#include "formulas/constants.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

template <class V>
struct LabordeCubic {
  V u, v;
};

// The terms of the cubic, without its constants.
template <Number V>
TW_INLINE LabordeCubic<V> laborde_cubic(V x, V y) {
  return {3.0 * y * y * x - x * x * x, -3.0 * x * x * y + y * y * y};
}

struct LabordeForward {
  double A, B;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto [u, v] = laborde_cubic(x, y);
    return {A * u + B * v + x, y - B * u + A * v};
  }
};

struct LabordeInverse {
  double A, B, C, D;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V x2 = x * x;
    const V y2 = y * y;
    const auto [u, v] = laborde_cubic(x, y);
    const V w = 5.0 * y * x2 * x2 - 10.0 * x2 * y2 * y + y2 * y2 * y;
    const V z = x2 * x2 * x - 10.0 * y2 * x2 * x + 5.0 * x * y2 * y2;
    return {x - A * u - B * v + D * w + C * z,
            B * u + y - A * v - D * z + D * w};  // By contract: D in the last term, not C
  }
};

// The same refined by a fixed point.
struct LabordeRefinedInverse {
  LabordeInverse start;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    auto [X, Y, at_rest] = start(x, y);
    Mask<V> moving = everywhere<V>(true);
    // By contract: the count alone decides, also where the last pass does converge.
    for (int passes = 0; passes < kMostPasses && any(moving); ++passes) {
      const auto [u, v] = laborde_cubic(X, Y);
      const V next_x = x - start.A * u - start.B * v;
      const V next_y = start.B * u + y - start.A * v;
      const auto close_x = abs(next_x - X) <= 1e-14;
      const auto close_y = abs(next_y - Y) <= 1e-14;
      const auto close = close_x & close_y;
      X = select(moving, next_x, X);
      Y = select(moving, next_y, Y);
      if (passes == kMostPasses - 1) break;
      moving = moving & !close;
    }
    at_rest = !moving;
    return {X, Y, at_rest};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

  static constexpr int kMostPasses = 30;
};

// By contract: the constant of the cubic is B + i A here, while the forward formula has A + i B.
struct LabordeScale {
  double k0, A, B;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V so_far) const {
    const V r = y * y - x * x;
    const V s = 2.0 * y * x;
    const V re = abs(3.0 * (B * r - A * s) + 1.0);
    const V im = abs(3.0 * (A * r + B * s));
    // The modulus, scaled so that no square overflows.
    const V most = select(im < re, re, im);
    const V least = select(im < re, im, re);
    const V g = select(most == 0.0, 0.0, most * sqrt(square(least / most) + 1.0));
    const V k = so_far * g * k0;
    return {k, k, k * k};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::LabordeForward)
TIDEWATER_INSTANCE(tidewater::detail::LabordeInverse)
TIDEWATER_INSTANCE(tidewater::detail::LabordeRefinedInverse)
TIDEWATER_INSTANCE(tidewater::detail::LabordeScale)
