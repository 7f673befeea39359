// Formulas of the van der Grinten projection of the unit sphere.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 239-242, eq. 29-1 to 29-18; the inverse in closed form after D. P. Rubincam, Latitude and
// longitude from van der Grinten grid coordinates, The American Cartographer 8 (1981), pp. 177-180.
#pragma once

#include "formulas/wraps.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Nearer than this to an axis, the formulas are those of the axis.
inline constexpr double kGrintenAxis = 0.0003;
// The scale has no value this close to a pole.
inline constexpr double kGrintenScaleLimit = kHalfPi - 1e-14;
// Nearer to a pole, or to the outer circle, the stated iteration ends too far from its root, or
// with a word: there it is gone through.
inline constexpr double kGrintenPole = 0.01;
inline constexpr double kGrintenCircle = 0.9999;

// cos(asin(s)); a not-a-number for a sine beyond 1.
template <Number V>
TW_INLINE V cosine_of_sine(V s) {
  return sqrt((1.0 - s) * (1.0 + s));
}

// Ordinate of the latitude on the central meridian: pi tan(theta / 2) with sin(theta) = 2 |lat| /
// pi.
template <Number V>
TW_INLINE V grinten_axis_ordinate(V lat) {
  const V s = abs(lat) * (2 / kPi);
  const V y = s / (1.0 + cosine_of_sine(s)) * kPi;
  return select(lat < 0.0, -y, y);
}

struct GrintenForward {
  double lon0, y0;

  // In the order of operations that is printed: towards both axes differences cancel, and a
  // rounding more shows.
  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const V d = wrap_below_then_above(lon - lon0);
    const V s = 2.0 * abs(lat / kPi);
    const V c = cosine_of_sine(s);
    const V axis = s / (1.0 + c) * kPi;
    const auto inside = (abs(d) >= kGrintenAxis) & (abs(lat) >= kGrintenAxis);
    const auto pole = abs(lat) == kHalfPi;
    const V size = select(inside, abs(d), 1.0);
    const V sine = select(inside, s, 0.5);
    const V A = abs(kPi / size - size / kPi) * 0.5;
    const V G = c / (sine + c - 1.0);
    const V P = (2.0 / sine - 1.0) * G;
    const V P2 = P * P;
    const V q = A * A + P2;
    const V u = (G - P2) * A / q;
    const V X = sqrt(u * u - (G * G - P2) / q) + u;
    const V Y = kPi * sqrt(1.0 - X * X - 2.0 * A * abs(X));
    const V x = select(inside, copysign(X, d) * kPi, d);
    const V y = select(inside & !pole, Y, axis);
    return {select(pole, 0.0, x), select(lat < 0.0, -y, y) - y0};
  }
};

struct GrintenInverse {
  double lon0, y0;

  template <Number V>
  TW_INLINE Mask<V> inside(V x, V yy) const {
    return (abs(x) >= kGrintenAxis) & (abs(yy) >= kGrintenAxis);
  }

  // Off the axes.
  template <Number V>
  TW_INLINE V longitude(V x, V yy) const {
    const V X = x * (1 / kPi);
    const V Y = yy * (1 / kPi);
    const V Q = (1.0 - X * X - Y * Y) / (2.0 * abs(X));
    const V d = (sqrt(Q * Q + 1.0) - Q) * kPi;
    return select(x < 0.0, lon0 - d, lon0 + d);
  }

  // The size v of the latitude, in units of pi, is a root of c3 v^3 + c2 v^2 + c1 v + Y^2 = 0,
  // found by its arc cosine and put right by one step of Newton's method.
  template <Number V>
  TW_INLINE V latitude(V X2, V Y) const {
    const V Y2 = Y * Y;
    const V r2 = X2 + Y2;
    const V c1 = -Y * (1.0 + r2);
    const V c2 = c1 - 2.0 * Y2 + X2;
    const V c3 = 1.0 - 2.0 * c1 + 2.0 * Y2 + r2 * r2;
    const V over = 1.0 / c3;
    const V b = c2 * over * (1.0 / 3);
    const V a1 = c1 * over - 3.0 * b * b;
    const V d = Y2 * over + 2.0 * cube(b) - b * c1 * over;
    const V half = sqrt(a1 * (-1.0 / 3));
    const V cosine = 1.5 * d / (a1 * half);
    const V held = select(abs(cosine) > 1.0, copysign(1.0, cosine), cosine);
    V v = -2.0 * half * sincos(acos(held) * (1.0 / 3) + kPi / 3).cos - b;
    v = v - (((c3 * v + c2) * v + c1) * v + Y2) / ((3.0 * c3 * v + 2.0 * c2) * v + c1);
    return v * kPi;
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V yy = y + y0;
    const auto general = inside(x, yy);
    const V gx = select(general, x, 1.0);
    const V Y = abs(select(general, yy, 1.0)) * (1 / kPi);
    const V X2 = square(gx * (1 / kPi));
    const V found = latitude(X2, Y);
    // sin(2 atan w) = 2 w / (1 + w^2)
    const V w = abs(yy) * (1 / kPi);
    const V axis = w / (1.0 + w * w) * kPi;
    const V lat = select(general, found, axis);
    const auto good = (X2 + Y * Y <= kGrintenCircle) & (found <= kHalfPi - kGrintenPole);
    const Mask<V> plain = good | !general;
    return {select(general, longitude(gx, yy), lon0 + x), select(yy < 0.0, -lat, lat), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct GrintenScale {
  double k0, lon0;

  template <class V>
  struct Partials {
    V x_lon, x_lat, y_lon, y_lat;
  };

  // Derivatives of x and y by longitude difference d and latitude p.
  template <Number V>
  TW_INLINE Partials<V> partials(V given_d, V given_p) const {
    constexpr double R = 9.869604401089358;  // pi^2
    const auto flat = abs(given_p) < kGrintenAxis;
    const auto central = abs(given_d) <= kGrintenAxis;
    const V p = select(flat, 1.0, given_p);
    const V d = select(central, 1.0, given_d);
    const V S = sqrt(R - 4.0 * p * p);
    // pi - S = 4 p^2 / (pi + S), in the form that does not cancel
    const V over_S = 2.0 / (kPi + S);
    const V A = kPi * p * over_S;
    const V over_t = 1.0 / (kPi - abs(p));
    const V B = p * kPi * over_t;
    const V N = R - A * A;
    const V over_D = 1.0 / (B - A);
    const V G = N * 0.5 * over_D;
    const V H = G - A;
    const V E = R * over_t * over_t;
    const V dA = (2.0 / S - over_S) * kPi;
    const V dG = (H * dA - E * G) * over_D;
    const V sg = select(G >= 0.0, 1.0, V(-1.0));
    const V W = (dG - dA) * sg;

    const V d2 = d * d;
    const V over_d = 0.5 / d;
    const V J = (d2 - R) * over_d;
    const V K = (R + d2) * abs(over_d);
    const V L = (R + d2) * 2.0 * over_d * over_d;
    const V over_size = 1.0 / abs(d);
    const V f1 = W * abs(H);
    const V f2 = 2.0 * dG * G - 2.0 * f1;
    const V f3 = 2.0 * dG * G + 2.0 * f1;
    const V H2 = H * H;
    const V G2 = G * G;
    const V KJ = K * K + J * J;
    const V C = sqrt(2.0 * H2 * KJ + 2.0 * R * G2 - square(G2 - H2) - R * R);
    const V sp = select(p * d >= 0.0, 1.0, V(-1.0));
    const V over_den = 0.5 / (G2 + J * J);
    const V over_C = 1.0 / C;
    const V M = G2 + H2;
    const V X = (sp * G * C + (M - R) * J) * over_den;
    const V x_lat = ((sp * (2.0 * R * G2 * over_C + C) - 4.0 * G * X) * dG +
                     (2.0 * f1 * KJ - f2 * (G2 - H2)) * (G * over_C) * sp + f3 * J) *
                    over_den;
    const V x_lon = (H2 * G * over_C * sp * (2.0 * L * J + 2.0 * (J * over_size) * K) +
                     (M - R - 4.0 * X * J) * L) *
                    over_den;
    const V over_G = 1.0 / G;
    const V y_lon = (x_lon * J + X * L) * over_G;
    const V y_lat =
        (f2 * G - (2.0 * X * J + R + G2 - H2) * dG + 2.0 * x_lat * G * J) * 0.5 * over_G * over_G;
    return {select(flat, 1.0, select(central, 1.0 - A * A * (1.0 / R), x_lon)),
            select(flat | central, 0.0, x_lat), select(flat | central, 0.0, y_lon),
            select(flat, 1.0, select(central, dG - sg * W, y_lat))};
  }

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const Mask<V> plain = !((lat >= kGrintenScaleLimit) | (lat <= -kGrintenScaleLimit));
    const auto j = partials(wrap_above_then_at_or_below(lon - lon0), lat);
    const V m1 = sqrt(j.x_lon * j.x_lon + j.y_lon * j.y_lon);
    const V m2 = sqrt(j.x_lat * j.x_lat + j.y_lat * j.y_lat);
    const V k = k0 * m1 / sincos(lat).cos;
    const V h = k0 * m2;
    const V c = abs(j.x_lon * j.x_lat + j.y_lat * j.y_lon) / (m2 * m1);
    return {k, h, sqrt(1.0 - c * c) * h * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::GrintenForward)
TIDEWATER_INSTANCE(tidewater::detail::GrintenInverse)
TIDEWATER_INSTANCE(tidewater::detail::GrintenScale)
