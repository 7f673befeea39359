// Elementary functions that give the same bits at every width.
//
// Only +, -, *, /, the square root and bits, in one order.  Where a function's short road ends, the
// lanes concerned, and only they, go a longer one of the same operations (elementary.cpp), so that
// every function is total and no platform's library has a say.  The worst errors are those of
// tests/points/elementary_test.cpp against MPFR, in units in the last place.  Coefficients by
// scripts/elementary.sollya.
#pragma once

#include "points/lanes.hpp"

namespace tidewater::points {

template <class V>
struct SinCos {
  V sin, cos;
};

// The longer roads, compiled once for the plainest processor: angles beyond 1e5 radians, infinite
// ones and not-a-numbers; what is no normal positive number; exponents beyond 708; two zeros and
// sizes beyond 1e290 or below 1e-290.
SinCos<double> far_sincos(double v);
double odd_log(double v);
double far_exp(double v);
double odd_atan2(double y, double x);

// Sine and cosine of r + low, |r| up to pi/4, after a whole number of quadrants.
template <Number V>
TW_INLINE SinCos<V> sincos_of_rest(V r, V low, Bits<V> quadrant) {
  const V z = r * r;
  const V z2 = z * z;
  const V s_high =
      (0x1.71de37af4659ep-19 + z * -0x1.ae601ea7a5c27p-26) + z2 * 0x1.5e10cbcea46d5p-33;
  const V s = (0x1.1111111110c7ap-7 + z * -0x1.a01a019e9f10ap-13) + z2 * s_high;
  const V t = (z * r) * (-0x1.5555555555555p-3 + z * s);
  const V half = 0.5 * z;
  const V sine = r + (t + (low - half * low));

  const V c_high = (0x1.a01a019f3838fp-16 + z * -0x1.27e4fa02e3bf8p-22) +
                   z2 * (0x1.1eeb57d2ffc1ap-29 + z * -0x1.9073853121efap-37);
  const V c = (0x1.5555555555555p-5 + z * -0x1.6c16c16c168cap-10) + z2 * c_high;
  const V w = 1.0 - half;
  const V cosine = w + (((1.0 - w) - half) + (z2 * c - r * low));

  const auto odd = not_zero(quadrant & Bits<V>(int64_t{1}));
  const Bits<V> kSign = Bits<V>(INT64_MIN);
  const Bits<V> half_turns = shift_left(quadrant, 62);
  const Bits<V> sine_sign = half_turns & kSign;
  const Bits<V> cosine_sign = (half_turns ^ shift_left(quadrant, 63)) & kSign;
  return {number(bits(select(odd, cosine, sine)) ^ sine_sign),
          number(bits(select(odd, sine, cosine)) ^ cosine_sign)};
}

// Sine and cosine.  0.80 ulp.
template <Number V>
TW_INLINE SinCos<V> sincos(V x) {
  constexpr double kTwoOverPi = 0x1.45f306dc9c883p-1;
  // pi / 2 in three parts; a whole number of up to 17 bits times one of the first two is exact
  constexpr double kFirst = 0x1.921fb54440000p+0, kSecond = 0x1.68c234c4c0000p-39,
                   kThird = 0x1.98a2e03707345p-77;
  constexpr double kShift = 0x1.8p52;
  const V size = abs(x);
  const auto far = !(size <= 1e5);
  const V shifted = size * kTwoOverPi + kShift;
  const Bits<V> quadrant = bits(shifted);
  const V k = shifted - kShift;
  // r + low, low being what the rounding of r leaves
  const V a = size - k * kFirst;
  const V b = k * kSecond;
  const V r = a - b;
  const V low = ((a - r) - b) - k * kThird;

  SinCos<V> at = sincos_of_rest(r, low, quadrant);
  at.sin = number(bits(at.sin) ^ (bits(x) & Bits<V>(INT64_MIN)));
  if (any(far)) [[unlikely]] {
    mend(far, at.sin, [&](int i) { return far_sincos(lane(x, i)).sin; });
    mend(far, at.cos, [&](int i) { return far_sincos(lane(x, i)).cos; });
  }
  return at;
}

// Natural logarithm.  0.85 ulp.
template <Number V>
TW_INLINE V log(V x) {
  constexpr double kLn2High = 0x1.62e42fee00000p-1, kLn2Low = 0x1.a39ef35793c76p-33;
  const auto odd = !((x >= 0x1p-1022) & (x <= 0x1.fffffffffffffp1023));
  const V given = select(odd, 1.0, x);
  // given = 2^k m, m from sqrt(1/2) to sqrt(2)
  const Bits<V> offset = bits(given) - Bits<V>(int64_t{0x3fe6a09e667f3bcd});
  const Bits<V> exponent = shift_right(offset, 52);
  const V m = number(bits(given) - shift_left(exponent, 52));
  // a whole number of few bits as a double, by the magic of 2^52 + 2^51
  const V k = number(exponent + Bits<V>(int64_t{0x4338000000000000})) - 0x1.8p52;
  const V f = m - 1.0;
  const V s = f / (2.0 + f);
  const V z = s * s;
  const V z2 = z * z;
  const V high = (0x1.7462b4ac0250ap-3 + z * 0x1.39fe5b3e12402p-3) + z2 * 0x1.2b58acc866813p-3;
  const V r = z * ((0x1.5555555555558p-1 + z * 0x1.9999999995323p-2) +
                   z2 * ((0x1.2492492deec42p-2 + z * 0x1.c71c62e683353p-3) + z2 * high));
  const V half = 0.5 * f * f;
  V result = k * kLn2High - ((half - (s * (half + r) + k * kLn2Low)) - f);
  mend(odd, result, [&](int i) { return odd_log(lane(x, i)); });
  return result;
}

// log(top / low), in less time than the quotient and its logarithm.  2 ulp.
template <Number V>
TW_INLINE V log_ratio(V top, V low) {
  constexpr double kLn2High = 0x1.62e42fee00000p-1, kLn2Low = 0x1.a39ef35793c76p-33;
  constexpr double kLeast = 0x1p-1000, kMost = 0x1p1000;
  const auto odd = !((lesser(top, low) >= kLeast) & (greater(top, low) <= kMost) & (top <= kMost));
  const V a = select(odd, 1.0, top);
  const V b = select(odd, 1.0, low);
  // a / b = 2^k (1 + s) / (1 - s), 2^k being nearest in the bits' own, nearly logarithmic measure:
  // |s| up to 1/5
  const Bits<V> apart = bits(a) - bits(b) + Bits<V>(int64_t{1} << 51);
  const Bits<V> exponent = shift_right(apart, 52);
  const V k = number(exponent + Bits<V>(int64_t{0x4338000000000000})) - 0x1.8p52;
  const V c = number(bits(b) + shift_left(exponent, 52));
  const V s = (a - c) / (a + c);
  const V z = s * s;
  const V z2 = z * z;
  const V high = (0x1.746ba70d4696dp-3 + z * 0x1.39049ca9691f6p-3) + z2 * 0x1.358d9954e07cap-3;
  const V r = z * ((0x1.555555555556ep-1 + z * 0x1.999999997c893p-2) +
                   z2 * ((0x1.24924951b9575p-2 + z * 0x1.c71c3d2bf594ap-3) + z2 * high));
  V result = k * kLn2High + (2.0 * s + (s * r + k * kLn2Low));
  mend(odd, result, [&](int i) { return log(lane(top, i) / lane(low, i)); });
  return result;
}

// 2^k for whole k from -1022 to 1023.
template <Number V>
TW_INLINE V power_of_two(V k) {
  return number(shift_left(bits(k + 0x1.8p52) + Bits<V>(int64_t{1023}), 52));
}

// x = k ln 2 + r with |r| <= ln 2 / 2, and e^r - 1 = r + tail.
template <class V>
struct Expm1Parts {
  V k, r, tail;
};
template <Number V>
TW_INLINE Expm1Parts<V> expm1_parts(V x) {
  constexpr double kLn2High = 0x1.62e42fee00000p-1, kLn2Low = 0x1.a39ef35793c76p-33;
  constexpr double kOverLn2 = 0x1.71547652b82fep+0;
  const V k = nearest_whole(x * kOverLn2);
  const V a = x - k * kLn2High;
  const V b = k * kLn2Low;
  const V r = a - b;
  const V low = (a - r) - b;
  const V z = r * r;
  const V z2 = z * z;
  const V e0 = 0x1.0000000000001p-1 + r * 0x1.5555555555558p-3;
  const V e2 = 0x1.5555555553cd9p-5 + r * 0x1.111111110f8dbp-7;
  const V e4 = 0x1.6c16c178ab683p-10 + r * 0x1.a01a01afb725ep-13;
  const V e6 = 0x1.a019b8b7963dcp-16 + r * 0x1.71ddf787534fap-19;
  const V e8 = 0x1.2891d2af5d43bp-22 + r * 0x1.af61c09cbbc75p-26;
  const V e = (e0 + z * e2) + z2 * ((e4 + z * e6) + z2 * e8);
  return {k, r, z * e + (low + low * r)};
}

// Exponential.  0.95 ulp.
template <Number V>
TW_INLINE V exp(V x) {
  const auto far = !(abs(x) <= 708.0);
  const auto p = expm1_parts(x);
  V result = (1.0 + (p.r + p.tail)) * power_of_two(p.k);
  mend(far, result, [&](int i) { return far_exp(lane(x, i)); });
  return result;
}

// The arc tangent of low / top for 0 <= low <= top, from pi/4 on where upper.
template <class V>
struct OctantArc {
  V arc;
  Mask<V> upper;
};
template <Number V>
TW_INLINE OctantArc<V> octant_arc(V low, V top) {
  // atan(low / top) = pi/4 + atan((low - top) / (low + top)) in the upper half
  const auto upper = low > 0.5 * top;
  const V u = select(upper, low - top, low) / select(upper, low + top, top);
  const V z = u * u;
  const V z2 = z * z;
  const V z4 = z2 * z2;
  const V a0 = -0x1.5555555555555p-2 + z * 0x1.999999999980ap-3;
  const V a2 = -0x1.2492492481d4cp-3 + z * 0x1.c71c71bd55486p-4;
  const V a4 = -0x1.745d15ab2c3a4p-4 + z * 0x1.3b1387beabd5cp-4;
  const V a6 = -0x1.110e5047ee47fp-4 + z * 0x1.e1a203df2d4a2p-5;
  const V a8 = -0x1.ad23c9a7dca3ap-5 + z * 0x1.7aa00a40040e8p-5;
  const V a10 = (-0x1.3696a5427a0e3p-5 + z * 0x1.96179443e6092p-6) + z2 * -0x1.296419f601268p-7;
  return {u + u * (z * ((a0 + z2 * a2) + z4 * ((a4 + z2 * a6) + z4 * (a8 + z2 * a10)))), upper};
}

// The angle of (top, low) for 0 <= low <= top, from 0 to pi/4; the bits of atan2.  1.8 ulp.
template <Number V>
TW_INLINE V octant_angle(V low, V top) {
  constexpr double kQuarter = 0x1.921fb54442d18p-1, kQuarterLow = 0x1.1a62633145c07p-55;
  const auto octant = octant_arc(low, top);
  return select(octant.upper, kQuarter + (octant.arc + kQuarterLow), octant.arc);
}

// The angle of (x, y), from -pi to pi.  1.9 ulp.
template <Number V>
TW_INLINE V atan2(V y, V x) {
  constexpr double kPi = 0x1.921fb54442d18p+1, kPiLow = 0x1.1a62633145c07p-53;
  const V ay = abs(y);
  const V ax = abs(x);
  const V most = greater(ax, ay);
  const auto odd = !((most >= 1e-290) & (most <= 1e290) & (ax <= most));
  const auto [arc, upper] = octant_arc(lesser(ax, ay), most);
  // The arc stands in one of eight sectors: sector + arc or sector - arc.
  const auto steep = ay > ax;
  const auto back = not_zero(bits(x) & Bits<V>(INT64_MIN));
  const V eighths = select(upper, 0.25, V(0.0));
  const V folded = select(steep, 0.5 - eighths, eighths);
  const V turned = select(back, 1.0 - folded, folded);  // in units of pi, exact
  const auto minus = steep != back;
  const V signed_arc = select(minus, -arc, arc);
  V result = copysign(turned * kPi + (signed_arc + turned * kPiLow), y);
  mend(odd, result, [&](int i) { return odd_atan2(lane(y, i), lane(x, i)); });
  return result;
}

// Arc tangent.  1.8 ulp.
template <Number V>
TW_INLINE V atan(V x) {
  return atan2(x, V(1.0));
}

// The polynomial of the arc sine: asin(v) = v + v z N(z), z = v^2 up to 1/4.
template <Number V>
TW_INLINE V arc_sine_tail(V z) {
  const V z2 = z * z;
  const V z4 = z2 * z2;
  const V n0 = 0x1.5555555555556p-3 + z * 0x1.3333333332dcdp-4;
  const V n2 = 0x1.6db6db6e4397dp-5 + z * 0x1.f1c71c14d9f7cp-6;
  const V n4 = 0x1.6e8bb2fe27089p-6 + z * 0x1.1c4d1bf962aeap-6;
  const V n6 = 0x1.c9d1cede45b31p-7 + z * 0x1.780cd75529c69p-7;
  const V n8 = 0x1.52df11be22f86p-7 + z * 0x1.60a452f757606p-8;
  const V n10 = (0x1.205e14bbb5cbep-6 + z * -0x1.f07deae529548p-7) + z2 * 0x1.da6754b0594bcp-6;
  return z * ((n0 + z2 * n2) + z4 * ((n4 + z2 * n6) + z4 * (n8 + z2 * n10)));
}

// Arc sine; a not-a-number beyond 1.  1.9 ulp.
template <Number V>
TW_INLINE V asin(V x) {
  constexpr double kHalfPi = 0x1.921fb54442d18p+0, kHalfPiLow = 0x1.1a62633145c07p-54;
  const V a = abs(x);
  const auto outer = a > 0.5;
  const V z = select(outer, (1.0 - a) * 0.5, a * a);
  const V v = select(outer, sqrt(z), a);
  const V tail = v * arc_sine_tail(z);
  // pi/2 - 2 (v + tail), where pi/4 - v is exact
  const V rest = 2.0 * ((0.5 * kHalfPi - v) - (tail - 0.5 * kHalfPiLow));
  return copysign(select(outer, rest, v + tail), x);
}

// Arc cosine; a not-a-number beyond 1.  1.1 ulp.
template <Number V>
TW_INLINE V acos(V x) {
  constexpr double kHalfPi = 0x1.921fb54442d18p+0, kHalfPiLow = 0x1.1a62633145c07p-54;
  const V a = abs(x);
  const auto outer = a > 0.5;
  const V z = select(outer, (1.0 - a) * 0.5, a * a);
  const V v = select(outer, sqrt(z), x);
  const V tail = v * arc_sine_tail(z);
  const V twice = 2.0 * (v + tail);
  const V far = 2.0 * kHalfPi - (twice - 2.0 * kHalfPiLow);
  return select(outer, select(x > 0.0, twice, far), kHalfPi - (v - (kHalfPiLow - tail)));
}

// log(1 + x), x above -1.  1.3 ulp.
template <Number V>
TW_INLINE V log1p(V x) {
  const V u = 1.0 + x;
  const V lost = x - (u - 1.0);
  const auto tiny = abs(x) < 1e-17;
  const V safe = select((u > 0.0) & (u <= 0x1.fffffffffffffp1023), u, 1.0);
  return select(tiny, x, log(u) + select(abs(x) < 1e15, lost / safe, V(0.0)));
}

// e^x - 1.  1.8 ulp; beyond 708 either way as exp(x) - 1.
template <Number V>
TW_INLINE V expm1(V x) {
  const auto far = !(abs(x) <= 708.0);
  const auto p = expm1_parts(x);
  const V scale = power_of_two(p.k);
  const V inner = p.r + p.tail;
  V result = (scale - 1.0) + scale * inner;
  result = copysign(result, x);  // of zero too
  mend(far, result, [&](int i) { return far_exp(lane(x, i)) - 1.0; });
  return result;
}

template <class V>
struct SinhCosh {
  V sinh, cosh;
};

// Hyperbolic sine and cosine.  2 ulp; infinite beyond 709.
template <Number V>
TW_INLINE SinhCosh<V> sinhcosh(V x) {
  const V m = expm1(abs(x));
  const V grown = 1.0 + m;
  const auto huge = m > 1e300;
  const V inverse = 1.0 / grown;
  return {copysign(select(huge, m * 0.5, 0.5 * (m + m * inverse)), x), 0.5 * (grown + inverse)};
}

// Hyperbolic tangent.  2.1 ulp.
template <Number V>
TW_INLINE V tanh(V x) {
  const V m = expm1(2.0 * lesser(abs(x), V(30.0)));
  const V value = select(x == x, m / (m + 2.0), x);  // NOLINT(misc-redundant-expression)
  return copysign(value, x);
}

// Inverse hyperbolic sine.  2 ulp, up to 1e150.
template <Number V>
TW_INLINE V asinh(V x) {
  const V a = abs(x);
  return copysign(log1p(a + a * a / (1.0 + sqrt(1.0 + a * a))), x);
}

// Inverse hyperbolic tangent, |x| below 1.  2 ulp.
template <Number V>
TW_INLINE V atanh(V x) {
  const V a = abs(x);
  return copysign(0.5 * log1p(2.0 * a / (1.0 - a)), x);
}

// sqrt(x^2 + y^2) without regard to squares that over- or underflow.
template <Number V>
TW_INLINE V plain_hypot(V x, V y) {
  return sqrt(x * x + y * y);
}

}  // namespace tidewater::points
