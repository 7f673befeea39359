// Formulas of the space oblique Mercator projection of the ellipsoid for a satellite on an
// elliptical orbit. J. P. Snyder, Space oblique Mercator projection: mathematical development, USGS
// Bulletin 1518 (1981), pp. 48-80.
#pragma once

#include "formulas/arc_tangent.hpp"
#include "formulas/constants.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// An a0 smaller than this is zero but for rounding: the orbit is circular.
inline constexpr double kSteady = 1e-10;
inline constexpr int kSpacePasses = 50;
inline constexpr double kSpaceTolerance = 1e-10;

// Eccentric anomaly at the angle L along the orbit.
struct Orbit {
  double eps, om, root, over_root;

  Orbit(double eccentricity, double perigee)
      : eps(eccentricity),
        om(perigee),
        root(sqrt((1 - eccentricity) / (1 + eccentricity))),
        over_root(1 / sqrt(1 - eccentricity * eccentricity)) {}

  template <Number V>
  TW_INLINE V eccentric_anomaly(V L) const {
    if (eps == 0) return (L - om) - kTwoPi * nearest_whole((L - om) * (1 / kTwoPi));
    const auto half = sincos((L - om) * 0.5);
    return 2.0 * atan_of_quotient(half.sin * root, half.cos);
  }
  template <Number V>
  TW_INLINE V mean_anomaly(V E) const {
    if (eps == 0) return E;
    return E - eps * sincos(E).sin;
  }
  // Rate of the satellite along its orbit.
  template <Number V>
  TW_INLINE V rate(V E) const {
    if (eps == 0) return 1.0;
    return square(1.0 - eps * sincos(E).cos) * over_root;
  }
};

// Components of the ground track's velocity with respect to L.
struct Track {
  double Q, T, W, P, s_inc, c_inc;

  template <class V>
  struct Velocity {
    V B1, B4;
    TW_INLINE V speed() const { return sqrt(B1 * B1 + B4 * B4); }
  };
  template <Number V>
  TW_INLINE Velocity<V> at(V sl2, V cos_L, V U) const {
    const V A1 = 1.0 + Q * sl2;
    const V A2 = 1.0 + W * sl2;
    return {(A2 / (A1 * A1) - P * c_inc * U) * sqrt(A1 / A2),
            sqrt((1.0 + T * sl2) / (A2 * A1)) * cos_L * (P * s_inc) * U};
  }
};

// The Fourier series of the projection, and what follows from them at an angle along the orbit.
struct SpaceSeries {
  int16_t n_terms;
  double a0;
  const double *C, *S, *X1, *X2, *X3, *X4;
  double R1, R2, R3, R4, m_sin, m_cos, sum3, sum4;
  Orbit orbit;
  Track track;

  template <class V>
  struct Terms {
    V T1, T2, Cx, Cy, speed;
  };
  // U is the satellite's rate at L.
  template <Number V>
  TW_INLINE Terms<V> at(V L, V U) const {
    const auto first = sincos(L);
    V s = 0.0;  // sin and cos of n L, by turning on from term to term
    V c = 1.0;
    V theta = 0.0;
    Terms<V> t = {V(0.0), V(0.0), V(0.0), V(0.0), V(0.0)};
    for (int n = 0; n < n_terms; ++n) {
      const V next = s * first.cos + c * first.sin;
      c = c * first.cos - s * first.sin;
      s = next;
      theta = theta + (1.0 - c) * S[n] + s * C[n];
      t.T1 = t.T1 + (s * X1[n] - c * X4[n]);
      t.T2 = t.T2 + (s * X2[n] - c * X3[n]);
    }
    theta = theta + a0 * L;
    const auto v = track.at(first.sin * first.sin, first.cos, U);
    const auto turned = sincos(theta);
    t.Cx = turned.cos * v.B1 - turned.sin * v.B4;
    t.Cy = turned.cos * v.B4 + turned.sin * v.B1;
    t.speed = v.speed();
    return t;
  }
};

struct SpaceForward {
  SpaceSeries series;
  double lon_n, e2, G, start, half_turn;
  bool x_first;

  template <class V>
  struct Place {
    V x, y;
    Mask<V> moving;  // the passes were used up
  };
  template <Number V>
  TW_INLINE Place<V> place(V lon, V lat) const {
    const auto& [Q, T, W, P, s_inc, c_inc] = series.track;
    const double m_sin = series.m_sin;
    const double m_cos = series.m_cos;
    const V d = lon - lon_n;
    const auto p = sincos(lat);
    const V base =
        select(sincos(start * P + d).cos < 0.0, V(start + half_turn), V(start - half_turn));
    const V rise = p.sin / p.cos * (s_inc * G);
    V L = start;
    V E = 0.0;
    SinCos<V> t = {V(0.0), V(1.0)};  // of the longitude from the node
    Mask<V> moving = abs(1.0 - L) > kSpaceTolerance;
    for (int pass = 0; pass < kSpacePasses && any(moving); ++pass) {
      const V anomaly = series.orbit.eccentric_anomaly(L);
      const auto at = sincos((series.orbit.mean_anomaly(anomaly) + series.orbit.om) * P + d);
      const V next = atan_of_quotient(rise + c_inc * at.sin, at.cos) + base;
      const V step = abs(next - L);
      E = select(moving, anomaly, E);
      t = {select(moving, at.sin, t.sin), select(moving, at.cos, t.cos)};
      L = select(moving, next, L);
      moving = moving & (step > kSpaceTolerance);
    }
    const V sine = (p.sin * (c_inc * G) - t.sin * p.cos * s_inc) / sqrt(1.0 - e2 * square(p.sin));
    const auto terms = series.at(L, series.orbit.rate(E));
    // ln tan(ph / 2 + pi/4) of the transformed latitude ph, by the speed
    const V y0 = 0.5 * log_ratio(1.0 + sine, 1.0 - sine) / terms.speed;
    V x;
    V y;
    if (abs(series.a0) < kSteady) {
      const V X = m_sin * L + terms.T1 + series.sum4 - y0 * terms.Cx;
      const V Y = m_cos * L + terms.T2 + series.sum3 + y0 * terms.Cy;
      const double over = 1 / sqrt(m_cos * m_cos + m_sin * m_sin);
      x = (X * m_sin + Y * m_cos) * over;
      y = (Y * m_sin - X * m_cos) * over;
    } else {
      const auto u = sincos(series.a0 * L);
      x = u.sin * (terms.T2 + series.R1) - u.cos * (series.R2 - terms.T1) + series.R3 -
          y0 * terms.Cx;
      y = u.sin * (series.R2 - terms.T1) + u.cos * (terms.T2 + series.R1) - series.R4 +
          y0 * terms.Cy;
    }
    if (x_first) return {x, y, moving};
    return {y, -x, moving};
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto at = place(lon, lat);
    return {at.x, at.y, !at.moving};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct SpaceInverse {
  SpaceSeries series;
  double lon_n, e2, inc, G;
  bool x_first;

  template <class V>
  struct Place {
    V lon, lat;
    V sin_ph;        // of the transformed latitude
    SinCos<V> at;    // of the angle along the orbit
    Mask<V> moving;  // the passes were used up
  };
  template <Number V>
  TW_INLINE Place<V> place(V x, V y) const {
    const auto& [Q, T, W, P, s_inc, c_inc] = series.track;
    const double a0 = series.a0;
    const double m_sin = series.m_sin;
    const double m_cos = series.m_cos;
    const double R1 = series.R1;
    const double R2 = series.R2;
    const bool steady = -kSteady <= a0 && a0 <= kSteady;
    V X = x_first ? x : -y;
    V Y = x_first ? y : x;
    if (abs(a0) < kSteady) {  // By contract: strict here, and not where the branch is taken below
      const double over = 1 / sqrt(m_cos * m_cos + m_sin * m_sin);
      const V given = X;
      X = (m_sin * given - m_cos * Y) * over;
      Y = (m_sin * Y + m_cos * given) * over;
    }
    V L = Y;
    // These hold also where the first test ends the loop, for a Y hard by 1.
    auto t = series.at(L, series.orbit.rate(series.orbit.eccentric_anomaly(L)));
    Mask<V> moving = abs(1.0 - L) > kSpaceTolerance;
    for (int pass = 0; pass < kSpacePasses && any(moving); ++pass) {
      if (pass > 0) {
        const auto now = series.at(L, series.orbit.rate(series.orbit.eccentric_anomaly(L)));
        t = {select(moving, now.T1, t.T1), select(moving, now.T2, t.T2),
             select(moving, now.Cx, t.Cx), select(moving, now.Cy, t.Cy),
             select(moving, now.speed, t.speed)};
      }
      V next;
      if (steady) {
        next = ((X - series.sum4 - t.T1) * t.Cy + (Y - series.sum3 - t.T2) * t.Cx) /
               (t.Cy * m_sin + t.Cx * m_cos);
      } else {
        const V c = sincos(a0 * L).cos;
        next = asin(((X - series.R3 - c * t.T1) * t.Cy + (t.Cy * R2 - R1 * t.Cx) * c +
                     (series.R4 + Y - c * t.T2) * t.Cx) /
                    ((R1 + t.T2) * t.Cy + (R2 - t.T1) * t.Cx)) /
               a0;
      }
      const V step = abs(L - next);
      L = select(moving, next, L);
      moving = moving & (step > kSpaceTolerance);
    }
    V v;
    if (steady) {
      v = m_sin * L + series.sum4 + t.T1 - X;
    } else {
      const auto u = sincos(a0 * L);
      v = u.sin * (R1 + t.T2) + series.R3 - X - u.cos * (R2 - t.T1);
    }
    const V sin_ph = tanh(v * t.speed / t.Cx);
    const V anomaly = series.orbit.mean_anomaly(series.orbit.eccentric_anomaly(L));
    const V s2 = square(sin_ph);
    const auto at = sincos(L);
    const double q = c_inc * c_inc * e2 / G;
    const V g = (at.sin * c_inc * (1.0 - s2 * (1 / G)) -
                 sqrt((1.0 + Q * at.sin * at.sin) * (1.0 - s2) - s2 * q) * s_inc * sin_ph) /
                (1.0 - (q + 1.0) * s2);
    const V lon = atan2(g, at.cos) + lon_n - (series.orbit.om + anomaly) * P;
    V lat;
    if (abs(inc) <= 1e-10) {
      lat = asin(sin_ph / sqrt(s2 * e2 + G * G));
    } else {
      lat = atan_of_quotient((at.sin - g * c_inc), sqrt(at.cos * at.cos + g * g) * (s_inc * G));
    }
    return {wrap_below_then_above(lon), lat, sin_ph, at, moving};
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto at = place(x, y);
    const Mask<V> plain = !(at.moving | (at.at.cos == 0.0));
    return {at.lon, at.lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::SpaceForward)
TIDEWATER_INSTANCE(tidewater::detail::SpaceInverse)
