// Formulas of the stereographic projection of the ellipsoid onto a plane of unit semi-major axis:
// oblique through the conformal latitude, and polar.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 160-163, eq. 21-24 to 21-40.
#pragma once

#include "formulas/arc_tangent.hpp"
#include "formulas/isometric_latitude.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// What takes a point for the origin, ends the polar inverse, and is small on the plane.
inline constexpr double kStereographicEpsilon = 1e-12;
// By contract: an inverse that ends this close to a pole takes the central meridian.
inline constexpr double kStereographicPole = 2e-12;

template <Number V>
TW_INLINE Mask<V> beyond_pole(V lat) {
  return (lat > kHalfPi) | (lat < -kHalfPi);
}

template <Number V>
TW_INLINE Mask<V> at_stereographic_origin(V lon, V lat, double lon0, double lat0) {
  return (abs(lon - lon0) < kStereographicEpsilon) & (abs(lat - lat0) < kStereographicEpsilon);
}

template <Number V>
TW_INLINE Mask<V> at_stereographic_pole(V lat) {
  return abs(abs(lat) - kHalfPi) < kStereographicPole;
}

// What the oblique road needs of its origin: scale is 2 m0 / cos chi0.
struct ObliqueOrigin {
  double e, lon0, lat0, sin_chi0, cos_chi0, scale;
};

// Snyder's A and the conformal latitude in one, without the angle: with o and a the sides of half
// the conformal colatitude, sin chi = (a^2 - o^2) / (a^2 + o^2) and cos chi = 2 a o / (a^2 + o^2).
template <class V>
struct ObliqueParts {
  V cosine, sine;  // of chi, times a^2 + o^2
  V factor;        // A / (a^2 + o^2)
  V cos_d;
};
template <Number V>
TW_INLINE ObliqueParts<V> oblique_parts(const ObliqueOrigin& origin, const SinCos<V>& lat,
                                        V cos_d) {
  const auto sides = colatitude_sides(origin.e, lat);
  const V a2 = square(sides.adjacent);
  const V o2 = square(sides.opposite);
  const V cosine = 2.0 * sides.opposite * sides.adjacent;
  const V sine = a2 - o2;
  const V sum = cos_d * origin.cos_chi0 * cosine + origin.sin_chi0 * sine + (a2 + o2);
  return {cosine, sine, origin.scale / sum, cos_d};
}

struct StereographicObliqueForward {
  ObliqueOrigin origin;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto plain = !(abs(lat) > kHalfPi);
    const auto d = sincos(lon - origin.lon0);
    const auto p = oblique_parts(origin, sincos(select(plain, lat, 0.0)), d.cos);
    const V y = (origin.cos_chi0 * p.sine - d.cos * origin.sin_chi0 * p.cosine) * p.factor;
    const auto centre = at_stereographic_origin(lon, lat, origin.lon0, origin.lat0);
    return {select(centre, 0.0, d.sin * p.factor * p.cosine), select(centre, 0.0, y), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct StereographicPolarForward {
  double e, lon0, lat0;
  double size;  // |C|
  double side;  // 1 in the north, -1 in the south

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto plain = !beyond_pole(lat);
    const auto d = sincos(lon - lon0);
    auto at = sincos(select(plain, lat, 0.0));
    at.sin = side * at.sin;
    // pi/4 - p/2 is zero at the pole itself.
    const auto pole = side * lat == kHalfPi;
    const V rho = select(pole, 0.0, size * colatitude_tangent(e, at));
    const auto centre = at_stereographic_origin(lon, lat, lon0, lat0);
    return {select(centre, 0.0, d.sin * rho), select(centre, 0.0, -side * d.cos * rho), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct StereographicObliqueInverse {
  double e, lon0, lat0, sin_chi0, cos_chi0;
  double grade;  // cos chi0 / 2 m0: the tangent of half the distance, for each unit on the plane
  ConformalInverse inverse;

  template <class V>
  struct Sphere {
    V lon, chi, sin_chi, cos_chi;
    Mask<V> centre;
  };
  // Longitude and conformal latitude.  With w = tan(ce / 2) the sine and cosine of ce are
  // 2 w / (1 + w^2) and (1 - w^2) / (1 + w^2).
  template <Number V>
  TW_INLINE Sphere<V> on_sphere(V x, V y) const {
    const V r2 = x * x + y * y;
    const V w2 = r2 * (grade * grade);
    const V u = x * (2.0 * grade);
    const V v = y * (2.0 * grade);
    const V sine = v * cos_chi0 + (1.0 - w2) * sin_chi0;
    const V along = (1.0 - w2) * cos_chi0 - v * sin_chi0;
    const V cosine = sqrt(u * u + along * along);
    const V inverse_sum = 1.0 / (1.0 + w2);
    // By contract: the plain arctangent of the quotient, so that no result lies more than a quarter
    // turn from lon0, and no wrap.
    const V lon = atan_of_quotient(u, along) + lon0;
    return {lon, atan2(sine, cosine), sine * inverse_sum, cosine * inverse_sum,
            sqrt(r2) < kStereographicEpsilon};
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto at = on_sphere(x, y);
    const V lat = select(at.centre, lat0, inverse.of_conformal(at.chi, at.sin_chi, at.cos_chi));
    const V lon = select(at.centre | at_stereographic_pole(lat), lon0, at.lon);
    // The passes of the stated iteration are never used up at e up to 0.1, but on a not-a-number.
    const Mask<V> number = lat == lat;  // NOLINT(misc-redundant-expression)
    const Mask<V> plain = everywhere<V>(abs(e) <= kSeriesEccentricity) & number;
    return {lon, lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// For an array on which lon0 stays: of the north, or lon0 = 0.
struct StereographicPolarInverse {
  double e, lon0, lat0;
  double size;  // |C|
  double side;  // 1 in the north, -1 in the south
  ConformalInverse inverse;

  template <Number V>
  TW_INLINE V longitude(V x, V y) const {
    return wrap_above_then_at_or_below(atan2(x, -side * y) + lon0);
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V r2 = x * x + y * y;
    const V rho = sqrt(r2);
    const auto centre = rho < kStereographicEpsilon;
    // tan(pi/4 - chi/2) is rho / |C|.
    const double size2 = size * size;
    const V sine = size2 - r2;
    const V cosine = (2.0 * size) * rho;
    const V inverse_sum = 1.0 / (size2 + r2);
    const V found =
        inverse.of_conformal(atan2(sine, cosine), sine * inverse_sum, cosine * inverse_sum);
    const V lat = select(centre, lat0, side * found);
    const V lon = select(centre | at_stereographic_pole(lat), lon0, longitude(x, y));
    // Six passes of the stated iteration are enough at e up to 0.1.
    const Mask<V> number = found == found;  // NOLINT(misc-redundant-expression)
    const Mask<V> plain = centre | (everywhere<V>(abs(e) <= kSeriesEccentricity) & number);
    return {lon, lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct StereographicObliqueScale {
  ObliqueOrigin origin;
  double k0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const auto plain = !beyond_pole(lat);
    const auto d = sincos(lon - origin.lon0);
    const auto at = sincos(select(plain, lat, 0.0));
    const auto p = oblique_parts(origin, at, d.cos);
    // cos chi / cos p, times a^2 + o^2: the cosine of p cancels.  By contract: at the pole itself
    // both cosines are what is left of pi/2, and their quotient is 1.
    const V quotient = select(abs(lat) == kHalfPi, abs(p.sine),
                              2.0 * (1.0 + abs(at.sin)) * eccentric_factor(origin.e, at.sin));
    const V root = sqrt(1.0 - origin.e * origin.e * square(at.sin));
    const V scale = p.factor * quotient * root * k0;
    const V k = select(at_stereographic_origin(lon, lat, origin.lon0, origin.lat0), V(k0), scale);
    return {k, k, k * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct StereographicPolarScale {
  double e, lon0, lat0;
  double size, side;
  double k0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const auto plain = !beyond_pole(lat);
    auto at = sincos(select(plain, lat, 0.0));
    at.sin = side * at.sin;
    const V rho = select(side * lat == kHalfPi, 0.0, size * colatitude_tangent(e, at));
    const V scale = rho * k0 * sqrt(1.0 - e * e * square(at.sin)) / at.cos;
    const V k = select(at_stereographic_origin(lon, lat, lon0, lat0), V(k0), scale);
    return {k, k, k * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::StereographicObliqueForward)
TIDEWATER_INSTANCE(tidewater::detail::StereographicPolarForward)
TIDEWATER_INSTANCE(tidewater::detail::StereographicObliqueInverse)
TIDEWATER_INSTANCE(tidewater::detail::StereographicPolarInverse)
TIDEWATER_INSTANCE(tidewater::detail::StereographicObliqueScale)
TIDEWATER_INSTANCE(tidewater::detail::StereographicPolarScale)
