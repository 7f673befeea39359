// Formulas of the azimuthal equidistant projection of the unit ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 191-202, eq. 25-1 to 25-30, the ellipsoid by Clarke's formula for the long geodesic.
#pragma once

#include "foundation/meridian_arc.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// What counts as nothing in the forward function: a distance from the origin, from a pole, a sine.
inline constexpr double kEquidistantNothing = 1e-12;
// A plane point this close to the centre is the origin.
inline constexpr double kEquidistantCentre = 1e-9;

struct AzimuthalEquidistantForward {
  double e, e2, lon0, lat0, n1, g;
  double sin0, cos0;
  double h0;  // e cos lat0 / sqrt(1 - e^2)
  MeridianArc arc;

  // Distance on the plane for the distance s on the sphere.
  template <Number V>
  TW_INLINE V distance(V s, V cos_az) const {
    const V h = cos_az * h0;
    const V h2 = h * h;
    const V s2 = s * s;
    const V s4 = s2 * s2;
    return abs(n1 * s *
               (1.0 - s2 * h2 * (1.0 - h2) * (1.0 / 6) +
                (s2 * s * (1.0 / 8)) * (1.0 - 2.0 * h2) * h * g +
                (s4 * (1.0 / 120)) * ((4.0 - 7.0 * h2) * h2 - 3.0 * (1.0 - 7.0 * h2) * (g * g)) -
                (s4 * s * (1.0 / 48)) * h * g));
  }

  // With T the tangent of the latitude as seen along the normal of the origin, the azimuth is that
  // of (sin d, T cos lat0 - cos d sin lat0), and sine and cosine of the distance are as the length
  // of that is to T sin lat0 + cos d cos lat0.
  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const V d = lon - lon0;
    const auto at_d = sincos(d);
    const auto p = sincos(lat);
    const V w = sqrt(1.0 - e2 * square(p.sin));
    const V T = (sin0 * e2 * n1 * w + p.sin * (1.0 - e2)) / p.cos;
    const V north = T * cos0 - at_d.cos * sin0;
    const V length = sqrt(square(at_d.sin) + square(north));
    const V over_length = 1.0 / length;
    const V sin_az = at_d.sin * over_length;
    const V cos_az = north * over_length;
    // By contract: the geodetic latitude decides on which side of a quarter turn a point lies, and
    // the arc sine of the distance is laid off from there.
    const V cosine = at_d.cos * p.cos * cos0 + p.sin * sin0;
    const auto far = (cosine < -(0x1p-53 - 0x1.1a62633145c07p-54)) & (cosine >= -1.0);
    const V angle = atan2(length, abs(T * sin0 + at_d.cos * cos0));
    const V c = distance(select(far, kPi - angle, angle), cos_az);
    const auto centre = (abs(lat - lat0) < kEquidistantNothing) & (abs(d) < kEquidistantNothing);
    const auto special =
        (abs(sin_az) < kEquidistantNothing) | (abs(abs(lat) - kHalfPi) < kEquidistantNothing);
    const Mask<V> plain = centre | !special;
    return {select(centre, 0.0, sin_az * c), select(centre, 0.0, cos_az * c), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct AzimuthalEquidistantInverse {
  bool north, polar;
  double e2, lon0, lat0, n1;
  double sin0, cos0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V given_y) const {
    const V y = north ? -given_y : given_y;
    const V c = sqrt(x * x + y * y);
    const auto centre = c < kEquidistantCentre;
    const V over_c = 1.0 / select(centre, 1.0, c);
    const V sin_az = x * over_c;
    const V cos_az = y * over_c;
    const double over = 1.0 / (1.0 - e2);
    const V a = -(cos_az * cos_az) * (e2 * cos0 * cos0 * over);
    const V b = cos_az * (1.0 - a) * (3.0 * e2 * cos0 * sin0 * over);
    const V dd = c * (1.0 / n1);
    const V dd3 = dd * dd * dd;
    const V ee =
        dd - a * (1.0 + a) * dd3 * (1.0 / 6) - b * (3.0 * a + 1.0) * (dd3 * dd) * (1.0 / 24);
    const V f = 1.0 - a * (ee * ee) * 0.5 - b * (ee * ee * ee) * (1.0 / 6);
    const auto at = sincos(ee);
    // Sine and cosine of psi, the latitude as seen along the normal of the origin, and of the
    // longitude from there.
    const V sin_psi = cos_az * at.sin * cos0 + at.cos * sin0;
    const V across = sin_az * at.sin;
    const V along = at.cos * cos0 - cos_az * at.sin * sin0;
    const V cos_psi = sqrt(across * across + along * along);
    const V lat = atan2(sin_psi - f * (e2 * sin0), cos_psi * (1.0 - e2));
    V l;
    if (polar) {
      l = atan2(x, y);
    } else {
      // By contract: an arc sine, put on the far side where the sphere, of radius 1, says so.
      const auto on_sphere = sincos(c);
      const auto far = cos0 * on_sphere.cos * c - sin0 * on_sphere.sin * given_y < 0.0;
      const V near = atan2(across, abs(along));
      l = select(far & (near != 0.0), copysign(kPi, near) - near, near);
      // The sign of the plain arc sine is lost straight over the pole.
      l = select((x == 0.0) & (given_y > 0.0) & (c > kHalfPi - lat0 + 1e-9), kPi, l);
    }
    return {select(centre, lon0, l + lon0), select(centre, lat0, lat)};
  }
};

struct AzimuthalEquidistantScale {
  double lon0, lat0, k0;
  double sin0, cos0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    constexpr double kNearPole = 1e-10;
    const Mask<V> plain = !((lat > kHalfPi) | (lat < -kHalfPi));
    const auto p = sincos(lat);
    V k;
    if (lat0 > kHalfPi - kNearPole) {
      k = (kHalfPi - lat) * k0 / p.cos;
    } else if (lat0 < -kHalfPi + kNearPole) {
      k = (lat + kHalfPi) * k0 / p.cos;
    } else {
      // By contract: at the origin this is 0/0, and stays so.
      const V c = acos(sincos(lon - lon0).cos * p.cos * cos0 + p.sin * sin0);
      k = c * k0 / sincos(c).sin;
    }
    return {k, V(k0), k * k0, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::AzimuthalEquidistantForward)
TIDEWATER_INSTANCE(tidewater::detail::AzimuthalEquidistantInverse)
TIDEWATER_INSTANCE(tidewater::detail::AzimuthalEquidistantScale)
