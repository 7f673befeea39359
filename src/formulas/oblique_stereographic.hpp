// The stereographic projection of the conformal sphere about any point but a pole, over the whole
// globe but the antipode: J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper
// 1395 (1987), eq. 21-24 to 21-32, by the coordinates of the sphere's points.
#pragma once

#include "formulas/isometric_latitude.hpp"

namespace tidewater::detail {

struct StereographicAboutPoint {
  double e, sin0, cos0;  // conformal latitude of the centre
  double by;             // its cosine over twice the radius of the centre's parallel
  ConformalInverse latitudes;

  StereographicAboutPoint(double first_eccentricity, double lat)
      : e(first_eccentricity), latitudes(first_eccentricity) {
    const auto phi = sincos(lat);
    const auto sides = colatitude_sides(e, phi);
    const double o2 = sides.opposite * sides.opposite;
    const double a2 = sides.adjacent * sides.adjacent;
    sin0 = (a2 - o2) / (a2 + o2);
    cos0 = 2 * sides.opposite * sides.adjacent / (a2 + o2);
    by = cos0 * sqrt(1 - e * e * phi.sin * phi.sin) / (2 * phi.cos);
  }

  template <Number V>
  struct Planar {
    V x, y;
    Mask<V> plain;
  };

  // Longitudes from the centre; the plane in units of a.
  template <Number V>
  TW_INLINE Planar<V> forward(V lon, V lat) const {
    const Mask<V> fit = abs(lat) <= kHalfPi;
    const auto sides = colatitude_sides(e, sincos(select(fit, lat, 0.0)));
    const V o2 = sides.opposite * sides.opposite;
    const V a2 = sides.adjacent * sides.adjacent;
    const V size = 1.0 / (a2 + o2);
    const V s = (a2 - o2) * size;
    const V c = 2.0 * sides.opposite * sides.adjacent * size;
    const auto lambda = sincos(lon);
    const V east = c * lambda.sin;
    const V out = c * lambda.cos;
    const V below = 1.0 + (sin0 * s + cos0 * out);
    const Mask<V> open = below > 1e-14;
    const Mask<V> plain = fit & open;
    const V k = 1.0 / (select(open, below, 1.0) * by);
    return {k * east, k * (cos0 * s - sin0 * out), plain};
  }

  template <Number V>
  TW_INLINE Planar<V> inverse(V x, V y) const {
    const V p = x * by;
    const V q = y * by;
    const V w2 = p * p + q * q;
    // Times 1 + w2: towards the centre's meridian on the equator, east, and along the axis.
    const V out = (1.0 - w2) * cos0 - 2.0 * q * sin0;
    const V up = (1.0 - w2) * sin0 + 2.0 * q * cos0;
    const V across = plain_hypot(out, 2.0 * p);
    const auto south = up < 0.0;
    const V whole = 1.0 + w2;
    const V t = select(south, whole - up, across) / select(south, across, whole + up);
    return {atan2(2.0 * p, out), latitudes.of_tangent(t), w2 < 1e14};
  }
};

}  // namespace tidewater::detail
