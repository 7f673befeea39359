// Projections whose ordinate is an arc of the meridian: Cassini-Soldner, American polyconic,
// equidistant conic and polar azimuthal equidistant, on the ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 92-97,
// 111-115, 124-137, 195-201, with the meridian's arc to rounding and with inverses that give the
// forward formula back.  Longitudes count from the central meridian.
#pragma once

#include <cmath>

#include "formulas/latitudes.hpp"
#include "formulas/radii.hpp"

namespace tidewater::detail {

template <class V>
struct Planar {
  V x, y;
  Mask<V> plain;
};

// Cassini-Soldner: Snyder eq. 13-7 to 13-9.  The series of the perpendicular is the definition of
// the grids that use it.
struct Cassini {
  double a, e2, m0;
  ExactMeridianArc arc;

  Cassini(double semi_major, double f, double lat0)
      : a(semi_major), e2(f * (2 - f)), m0(0), arc(1, f) {
    m0 = arc.arc(lat0);
  }

  template <Number V>
  struct Terms {
    V x, y, x_lon, y_lon, x_lat, y_lat;
  };

  // In units of a, y from the equator, with the derivatives (of the sphere's size: for Newton).
  template <Number V>
  TW_INLINE Terms<V> terms(V lon, V lat, SinCos<V> at) const {
    const V s2 = at.sin * at.sin;
    const V c2 = at.cos * at.cos;
    const V nu = normal_radius(e2, at.sin);
    const V C = (e2 / (1 - e2)) * c2;
    const V l2 = lon * lon;
    const V m = lat + arc.to_rectifying.correction(at);
    Terms<V> out;
    out.x =
        nu * at.cos * lon *
        (1.0 - l2 * s2 * (1.0 / 6) - l2 * l2 * s2 * (1.0 / 120) * (8.0 * c2 - s2 + 8.0 * C * c2));
    out.y = arc.radius * m +
            nu * at.sin * at.cos * l2 * (0.5 + l2 * (1.0 / 24) * (5.0 * c2 - s2 + 6.0 * C * c2));
    out.x_lon = nu * at.cos * (1.0 - 0.5 * l2 * s2);
    out.y_lon = nu * at.sin * at.cos * lon;
    out.x_lat = -(nu * at.sin * lon);
    out.y_lat = meridian_radius(e2, at.sin) + 0.5 * nu * l2 * (c2 - s2);
    return out;
  }

  template <Number V>
  TW_INLINE Planar<V> forward(V lon, V lat) const {
    const auto at = terms(lon, lat, sincos(lat));
    return {a * at.x, a * (at.y - m0), abs(lat) <= kHalfPi};
  }

  // The foot's latitude (eq. 13-10 to 13-13), then Newton's method until the forward formula gives
  // the point.
  template <Number V>
  TW_INLINE Planar<V> inverse(V x, V y) const {
    const V u = x * (1 / a);
    const V v = y * (1 / a) + m0;
    const V foot = arc.latitude(v);
    const auto at = sincos(foot);
    const Mask<V> inner = (abs(foot) < kHalfPi) & (abs(u) < 1.5);
    // The sphere's right triangle.
    const auto d = sincos(select(inner, u / normal_radius(e2, at.sin), 0.0));
    V lon = select(inner, atan2(d.sin, d.cos * at.cos), 0.0);
    V lat = select(inner, asin(at.sin * d.cos), 0.0);
    Mask<V> moving = inner;
    Mask<V> good = inner;
    for (int i = 0; i < 12; ++i) {
      const auto now = terms(lon, lat, sincos(lat));
      const V dx = u - now.x;
      const V dy = v - now.y;
      const V determinant = now.x_lon * now.y_lat - now.x_lat * now.y_lon;
      const V by = 1.0 / determinant;
      lon = select(moving, lon + by * (now.y_lat * dx - now.x_lat * dy), lon);
      lat = select(moving, lat + by * (now.x_lon * dy - now.y_lon * dx), lat);
      const Mask<V> rested = !moving;
      good = (moving & ((abs(dx) + abs(dy)) < 1e-7)) | (rested & good);
      moving = moving & ((abs(dx) + abs(dy)) > 1e-16);
      if (!any(moving)) break;
    }
    const Mask<V> plain = good & (abs(lat) <= kHalfPi) & (abs(lon) <= kPi);
    return {lon, lat, plain};
  }
};

// American polyconic: Snyder eq. 18-12 to 18-14, with cot phi sin E = lambda cos phi sin E / E so
// that the equator is a parallel like others.
struct Polyconic {
  double a, e2, m0;
  ExactMeridianArc arc;

  Polyconic(double semi_major, double f, double lat0)
      : a(semi_major), e2(f * (2 - f)), m0(0), arc(1, f) {
    m0 = arc.arc(lat0);
  }

  template <Number V>
  struct Terms {
    V x, y, x_lon, y_lon, x_lat, y_lat;
  };

  template <Number V>
  TW_INLINE Terms<V> terms(V lon, V lat) const {
    const auto at = sincos(lat);
    const V nu = normal_radius(e2, at.sin);
    const V E = lon * at.sin;
    const auto half = sincos(0.5 * E);
    const auto level = E == 0.0;
    const V safe = select(level, 1.0, E);
    const V sin_E = 2.0 * half.sin * half.cos;
    const V sinc = select(level, 1.0, sin_E / safe);
    const V versine = 2.0 * half.sin * half.sin;
    const V verse = select(level, 0.5, versine / (safe * safe));  // (1 - cos E) / E^2
    const V cos_E = 1.0 - versine;
    const V m = lat + arc.to_rectifying.correction(at);
    Terms<V> out;
    out.x = nu * at.cos * lon * sinc;
    out.y = arc.radius * m + nu * at.cos * at.sin * (lon * lon) * verse;
    out.x_lon = nu * at.cos * cos_E;
    out.y_lon = nu * at.cos * sin_E;
    const V bend = e2 * nu * nu * nu * at.cos * at.cos;  // nu' cot phi
    const auto equator = abs(at.sin) < 1e-12;
    out.x_lat = bend * sin_E + nu * lon * (at.cos * at.cos * cos_E - sinc) /
                                   select(equator, V(1.0), at.sin) *
                                   select(equator, V(0.0), V(1.0));
    out.y_lat = meridian_radius(e2, at.sin) + bend * versine - nu * (lon * lon) * verse +
                nu * (at.cos * at.cos) * (lon * lon) * sinc;
    return out;
  }

  template <Number V>
  TW_INLINE Planar<V> forward(V lon, V lat) const {
    const auto at = terms(lon, lat);
    const Mask<V> plain = (abs(lat) <= kHalfPi) & (abs(lon) <= kPi * (1 + 1e-15));
    return {a * at.x, a * (at.y - m0), plain};
  }

  template <Number V>
  TW_INLINE Planar<V> inverse(V x, V y) const {
    const V u = x * (1 / a);
    const V v = y * (1 / a) + m0;
    const Mask<V> inner = (abs(u) < 4.0) & (abs(v) < 4.0);
    // The circles' own geometry: from a parallel of the height that a circle of radius cot phi
    // through the point asks for (eq. 18-17 on the sphere).
    V lat = select(inner, v / (1.0 + 0.25 * u * u), 0.0);
    V lon = select(inner, u / greater(sincos(lat).cos, V(0.1)), 0.0);
    Mask<V> moving = inner;
    Mask<V> good = inner;
    for (int i = 0; i < 40; ++i) {
      const auto now = terms(lon, lat);
      const V dx = u - now.x;
      const V dy = v - now.y;
      const V by = 1.0 / (now.x_lon * now.y_lat - now.x_lat * now.y_lon);
      const V step_lon = by * (now.y_lat * dx - now.x_lat * dy);
      const V step_lat = by * (now.x_lon * dy - now.y_lon * dx);
      // far from the point small steps
      const V size = greater(abs(step_lon), abs(step_lat));
      const V part = select(size > 0.5, 0.5 / size, 1.0);
      lon = select(moving, lon + part * step_lon, lon);
      lat = select(moving, lat + part * step_lat, lat);
      const V rest = abs(dx) + abs(dy);
      const Mask<V> rested = !moving;
      good = (moving & (rest < 1e-9)) | (rested & good);
      moving = moving & (rest > 2e-16);
      if (!any(moving)) break;
    }
    const Mask<V> plain = good & (abs(lat) <= kHalfPi) & (abs(lon) <= kPi * (1 + 1e-14));
    return {lon, lat, plain};
  }
};

// Equidistant conic: Snyder eq. 16-1 to 16-4, 16-11.
struct EquidistantConic {
  double a, n, G, rho0;
  ExactMeridianArc arc;

  EquidistantConic(double semi_major, double f, double lat0, double lat1, double lat2)
      : a(semi_major), n(0), G(0), rho0(0), arc(1, f) {
    const double e2 = f * (2 - f);
    const auto parallel = [&](double lat) {
      const auto at = sincos(lat);
      return parallel_radius(e2, at.sin, at.cos);
    };
    const double m1 = parallel(lat1);
    // Where the parallels meet the quotient loses its digits, the sine is its limit.
    n = abs(lat1 - lat2) < 1e-7 ? sincos(0.5 * (lat1 + lat2)).sin
                                : (m1 - parallel(lat2)) / (arc.arc(lat2) - arc.arc(lat1));
    G = m1 / n + arc.arc(lat1);
    rho0 = G - arc.arc(lat0);
  }

  template <Number V>
  TW_INLINE Planar<V> forward(V lon, V lat) const {
    const V rho = G - arc.arc(lat);
    const auto theta = sincos(n * lon);
    return {a * (rho * theta.sin), a * (rho0 - rho * theta.cos), abs(lat) <= kHalfPi};
  }

  template <Number V>
  TW_INLINE Planar<V> inverse(V x, V y) const {
    const double side = n < 0 ? -1 : 1;
    const V u = side * (x * (1 / a));
    const V v = side * (rho0 - y * (1 / a));
    const V rho = side * plain_hypot(u, v);
    const V lat = arc.latitude(G - rho);
    const V lon = atan2(u, v) * (1 / n);
    const Mask<V> plain = (abs(lat) <= kHalfPi * (1 + 1e-15)) & (abs(lon) <= kPi * (1 + 1e-14));
    return {lon, lat, plain};
  }
};

// Azimuthal equidistant about a pole: Snyder p. 198.
struct PolarEquidistant {
  double a, pole;  // 1 north, -1 south
  double quadrant;
  ExactMeridianArc arc;

  PolarEquidistant(double semi_major, double f, double which)
      : a(semi_major), pole(which), quadrant(0), arc(1, f) {
    quadrant = arc.radius * kHalfPi;
  }

  template <Number V>
  TW_INLINE Planar<V> forward(V lon, V lat) const {
    const V rho = a * (quadrant - pole * arc.arc(lat));
    const auto at = sincos(lon);
    return {rho * at.sin, -pole * (rho * at.cos), abs(lat) <= kHalfPi};
  }

  template <Number V>
  TW_INLINE Planar<V> inverse(V x, V y) const {
    const V rho = plain_hypot(x, y) * (1 / a);
    const V lat = pole * arc.latitude(quadrant - rho);
    const V lon = atan2(x, -pole * y);
    return {lon, lesser(greater(lat, V(-kHalfPi)), V(kHalfPi)), rho <= 2 * quadrant * (1 + 1e-15)};
  }
};

}  // namespace tidewater::detail
