// Formulas of the vertical and tilted perspective projections of the sphere and the ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 173-181, eq. 23-1 to 23-30.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

inline constexpr int kPerspectivePasses = 10;

struct PerspectiveForward {
  bool sphere;
  double a, e2, lon0, sin0, cos0;
  double view;       // H / a
  double from_near;  // on the sphere, points nearer to the centre's direction are in sight: 1 / P
  double along, across;  // of the point of perspective from the centre, to and across the vertical

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat, V height) const {
    const auto d = sincos(lon - lon0);
    const auto p = sincos(lat);
    const V h = height * (1.0 / a);
    Mask<V> plain = everywhere<V>(true);
    V nu = 1.0;
    if (sphere) {
      plain = !(from_near > d.cos * cos0 * p.cos + sin0 * p.sin);
    } else {
      nu = 1.0 / sqrt(1.0 - square(p.sin) * e2);
    }
    const V c = (nu + h) * p.cos;
    const V s = ((1.0 - e2) * nu + h) * p.sin;
    const V k = view / (along - sin0 * s - d.cos * cos0 * c);
    return {d.sin * c * k, (across + cos0 * s - d.cos * c * sin0) * k, height, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// The line of sight through a plane point, met with a surface that is grown until it passes through
// the height of the point.
struct PerspectiveInverse {
  double a, e2, lon0, h, sin0, cos0;
  double b, d;  // P along and across the vertical of the origin
  double a1, a2, a3, a4;
  double from_centre;  // (1 - cos^2 phi_g e^2) P^2

  template <class V>
  struct Met {
    V lon, lat;
    Mask<V> moving;  // the passes were used up
  };

  template <Number V>
  TW_INLINE Met<V> meet(V plane_x, V plane_y, V height) const {
    const V x = plane_x * a;
    const V y = plane_y * a;
    const V relative = height * (1.0 / a);
    const double tilt = d * h * a3 - 2.0 * b * a1 * h;
    const V f = tilt + (b * a3 - 2.0 * d * a2) * y;
    const V quadratic = a2 * y * y + (a1 * h * h - h * a3 * y) + a4 * x * x;
    Mask<V> moving = !(height == 0.0);  // By contract: a height of exactly 0 needs one pass alone
    V grown = 1.0;
    V sine = 0.0;  // of the latitude
    V lat = 0.0;
    V inverse_t = 0.0;
    V v = 0.0;
    for (int pass = 0; pass < kPerspectivePasses; ++pass) {
      const V g = from_centre - a4 * grown;
      const V t = (2.0 * g) / (sqrt(f * f - 4.0 * g * quadratic) - f);  // the inverse of t
      const auto now = pass == 0 ? everywhere<V>(true) : moving;
      inverse_t = select(now, t, inverse_t);
      v = select(now, y * inverse_t - d, v);
      const V u = (b - h * inverse_t) * sin0 + v * cos0;
      if (pass == 0) {
        lat = atan2(u, sqrt((a4 - u * u) * a4));
        sine = u;
        if (!any(moving)) break;
        lat = select(moving, asin(u), lat);
      }
      const V w = 1.0 - square(sine) * e2;
      const V root = 1.0 / sqrt(w);
      // By contract: the sine that grows the surface is that of the latitude before this step.
      const V bigger = square(root + relative) -
                       (square(root) - square(relative) * (1.0 / (1.0 - e2))) * square(sine) * e2;
      const V next = u / (a4 * root + relative);
      const V next_lat = asin(next);
      const V moved = abs(next_lat - lat);
      lat = select(moving, next_lat, lat);
      sine = select(moving, next, sine);
      grown = select(moving, bigger, grown);
      moving = moving & !(moved < 1e-12);
      if (!any(moving)) break;
    }
    const V lon = atan2(x * inverse_t, (b - h * inverse_t) * cos0 - v * sin0) + lon0;
    return {lon, lat, moving};
  }

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V height) const {
    const auto at = meet(x, y, height);
    return {at.lon, at.lat, height, !at.moving};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// From the upright plane to the tilted one.
struct PerspectiveTilt {
  double sin_a, cos_a, cos_b;
  double slope;  // a sin b / H

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V t = x * sin_a + y * cos_a;
    const V inverse = 1.0 / (t * slope + cos_b);
    return {(x * cos_a - y * sin_a) * cos_b * inverse, t * inverse};
  }
};

struct PerspectiveUntilt {
  double sin_a, cos_a, cos_b;
  double slope;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V height) const {
    const V inverse = 1.0 / (1.0 - y * slope);
    const V u = x * inverse;
    const V v = y * cos_b * inverse;
    return {u * cos_a + sin_a * v, v * cos_a - sin_a * u, height};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::PerspectiveForward)
TIDEWATER_INSTANCE(tidewater::detail::PerspectiveInverse)
TIDEWATER_INSTANCE(tidewater::detail::PerspectiveTilt)
TIDEWATER_INSTANCE(tidewater::detail::PerspectiveUntilt)
