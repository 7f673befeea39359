// Spherical-harmonic synthesis by Clenshaw's method in two stages: sums over degree for each order,
// then a sum over order.  No Legendre function is formed.
// S. A. Holmes and W. E. Featherstone, A unified approach to the Clenshaw summation and the
// recursive computation of very high degree and order normalised associated Legendre functions,
// Journal of Geodesy 76 (2002), 279-299.
#pragma once

#include "formulas/constants.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// A point this close to the axis is held off it, on the meridian of Greenwich.
inline constexpr double kAxisLimit = 1e-12;

enum Mode : int16_t { kGradient = 0, kAlongTheta = 1, kAlongLambda = 2, kRadial = 3, kGravity = 4 };

// The components that a mode gives.
template <Mode kMode>
inline constexpr bool kNorth = kMode == kGradient || kMode == kAlongTheta;
template <Mode kMode>
inline constexpr bool kEast = kMode == kGradient || kMode == kAlongLambda;
template <Mode kMode>
inline constexpr bool kDown = kMode == kGradient || kMode == kRadial;

struct HarmonicSeries {
  int32_t N;
  double* const* C;
  double* const* S;
  double* const* rec_a;
  double* const* rec_b;
};

// What the recurrences need of a point, with q = radius / r: q cos(theta), q sin(theta), q^2.
template <class Value>
struct Argument {
  Value tcos, tsin, q2;
};

// Two neighbouring orders of one point side by side.
using Orders = Lanes<2>;

// A constant or coefficient for all points; for Orders those of two orders.
template <class Value>
TW_INLINE Value take(const double* place) {
  return *place;
}
template <>
TW_INLINE Orders take<Orders>(const double* place) {
  Orders value;
  __builtin_memcpy(&value.v, place, sizeof value.v);
  return value;
}

// The sum y and its derivative d by theta, at the last degree done and at the one above it.
template <class Value>
struct Chain {
  Value y = 0.0;
  Value y_above = 0.0;
  Value d = 0.0;
  Value d_above = 0.0;

  TW_INLINE void descend(Value a_cos, Value b_q2, Value term) {
    const Value next = a_cos * y + b_q2 * y_above + term;
    y_above = y;
    y = next;
  }

  // Comes before descend(): it needs y of the degree above.
  TW_INLINE void descend_slope(Value a_cos, Value a_sin, Value b_q2) {
    const Value next = a_cos * d + b_q2 * d_above - a_sin * y;
    d_above = d;
    d = next;
  }
};

TW_INLINE Chain<double> order_of(const Chain<Orders>& chain, int j) {
  return {lane(chain.y, j), lane(chain.y_above, j), lane(chain.d, j), lane(chain.d_above, j)};
}

// The sums over degree of one order, or of a pair of them.  One pass serves all terms of a mode, so
// that constants and coefficients are read once.
template <Mode kMode, class Value>
struct DegreeSums {
  // At the degree of the series, above which y and d are zero.
  TW_INLINE DegreeSums(const HarmonicSeries& series, int32_t m) {
    const int32_t n = series.N;
    c.y = take<Value>(series.C[n] + m);
    s.y = take<Value>(series.S[n] + m);
    radial_c.y = (n + 1.0) * c.y;
    radial_s.y = (n + 1.0) * s.y;
  }

  // One order of a pair.
  TW_INLINE DegreeSums(const DegreeSums<kMode, Orders>& pair, int j)
      : c(order_of(pair.c, j)),
        s(order_of(pair.s, j)),
        radial_c(order_of(pair.radial_c, j)),
        radial_s(order_of(pair.radial_s, j)) {}

  // Goes down to degree n from n + 1.
  template <class Number>
  TW_INLINE void step(const HarmonicSeries& series, const Argument<Number>& at, int32_t m,
                      int32_t n) {
    static constexpr double kNone[2] = {};
    const auto a = take<Value>(series.rec_a[n + 1] + m);
    const auto b = take<Value>(n + 2 <= series.N ? series.rec_b[n + 2] + m : kNone);
    const auto C = take<Value>(series.C[n] + m);
    const auto S = take<Value>(series.S[n] + m);
    const Value a_cos = a * at.tcos;
    const Value a_sin = a * at.tsin;
    const Value b_q2 = b * at.q2;
    if constexpr (kNorth<kMode>) {
      c.descend_slope(a_cos, a_sin, b_q2);
      s.descend_slope(a_cos, a_sin, b_q2);
    }
    if constexpr (kMode != kRadial) {
      c.descend(a_cos, b_q2, C);
      s.descend(a_cos, b_q2, S);
    }
    if constexpr (kDown<kMode>) {
      radial_c.descend(a_cos, b_q2, (n + 1.0) * C);
      radial_s.descend(a_cos, b_q2, (n + 1.0) * S);
    }
  }

  Chain<Value> c, s;                // of the terms C and S
  Chain<Value> radial_c, radial_s;  // of the terms (n + 1) C and (n + 1) S
};

// The four sums over order, without their scales.
template <class Value>
struct OrderSums {
  Value A = 0.0, B = 0.0, L = 0.0, R = 0.0;
};

// The weights of one order: the sums over its degrees, turned by the longitude.
template <class Value>
struct Weights {
  Value A = 0.0, B = 0.0, L = 0.0, R = 0.0;
};

// Clenshaw's sums over order, from above.
template <Mode kMode, class Value>
struct OrderChain {
  Value zA = 0.0, zB = 0.0, zL = 0.0, zR = 0.0, e = 0.0;
  Value a_sin = 0.0, a_cos = 0.0;  // of the order above; nothing stands above the first

  TW_INLINE void descend(const Weights<Value>& w, double a, const Argument<Value>& at) {
    if constexpr (kNorth<kMode>) {
      e = a_sin * e + a_cos * zB;
      zB = a_sin * zB + w.B;
    }
    if constexpr (kNorth<kMode> || kMode == kGravity) zA = a_sin * zA + w.A;
    if constexpr (kEast<kMode>) zL = a_sin * zL + w.L;
    if constexpr (kDown<kMode>) zR = a_sin * zR + w.R;
    a_sin = a * at.tsin;
    a_cos = a * at.tcos;
  }

  TW_INLINE OrderSums<Value> sums(double first) const {
    return {zA * first, e * first, zL * first, zR * first};
  }
};

// Where a point stands for the synthesis: colatitude, longitude, radius.
struct SphericalPlace {
  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V z) const {
    const V r = sqrt(y * y + x * x + z * z);
    const V given = acos(z / r);
    const auto north = given < kAxisLimit;
    const auto south = given > kPi - kAxisLimit;
    const V colat = select(north, V(kAxisLimit), select(south, V(kPi - kAxisLimit), given));
    return {colat, select(north | south, 0.0, atan2(y, x)), r};
  }
};

// Sums of one mode at (colatitude, longitude, radius), several places at once: the gradient, or its
// one component as the first element.
template <Mode kMode>
struct HarmonicSums {
  // Above this degree the table of multiples would not fit the stack.
  static constexpr int32_t kMostDegree = 64;

  HarmonicSeries series;
  double radius;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V colat, V lon, V r) const {
    const V q = radius / r;
    const auto [sin_colat, cos_colat] = sincos(colat);
    const Argument<V> at = {q * cos_colat, q * sin_colat, q * q};
    const int32_t N = series.N;

    V cosines[kMostDegree + 1], sines[kMostDegree + 1];
    const auto [sin_lon, cos_lon] = sincos(lon);
    const V twice = 2.0 * cos_lon;
    cosines[0] = 1.0;
    cosines[1] = cos_lon;
    sines[0] = 0.0;
    sines[1] = sin_lon;
    cosines[2] = twice * cos_lon - cosines[0];
    sines[2] = twice * sin_lon;
    for (int32_t m = 3; m <= N; ++m) {
      cosines[m] = twice * cosines[m - 1] - cosines[m - 2];
      sines[m] = twice * sines[m - 1] - sines[m - 2];
    }

    OrderChain<kMode, V> chain;
    for (int32_t m = N; m >= 0; --m) {
      DegreeSums<kMode, V> sums(series, m);
      for (int32_t n = N - 1; n >= m; --n) sums.step(series, at, m, n);
      const V c = cosines[m], s = sines[m];
      const bool zonal = m == 0;  // a sine term has no order 0
      Weights<V> w;
      if constexpr (kNorth<kMode>) {
        w.B = (zonal ? V(0.0) : sums.s.y) * s + sums.c.y * c;
        w.A = sums.c.d * c + (zonal ? V(0.0) : sums.s.d) * s;
      }
      if constexpr (kEast<kMode>)
        w.L = ((zonal ? V(0.0) : sums.c.y) * s + -sums.s.y * c) * double(m);
      if constexpr (kDown<kMode>)
        w.R = (zonal ? V(0.0) : sums.radial_s.y) * s + sums.radial_c.y * c;
      chain.descend(w, series.rec_a[m][m], at);
    }
    const auto sum = chain.sums(series.rec_a[0][0]);

    const V scale = at.q2;
    const V theta = scale * sum.A + scale * sum.B;
    const V lambda = scale / sin_colat * sum.L;
    const V down = -scale * sum.R;
    if constexpr (kMode == kAlongTheta) return {theta, lambda, down};
    if constexpr (kMode == kAlongLambda) return {lambda, theta, down};
    if constexpr (kMode == kRadial) return {down, theta, lambda};
    return {theta, lambda, down};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::SphericalPlace)
TIDEWATER_INSTANCE(tidewater::detail::HarmonicSums<tidewater::detail::kGradient>)
TIDEWATER_INSTANCE(tidewater::detail::HarmonicSums<tidewater::detail::kAlongTheta>)
TIDEWATER_INSTANCE(tidewater::detail::HarmonicSums<tidewater::detail::kAlongLambda>)
TIDEWATER_INSTANCE(tidewater::detail::HarmonicSums<tidewater::detail::kRadial>)
