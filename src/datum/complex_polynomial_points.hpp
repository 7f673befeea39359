// Complex polynomials of normalised plane coordinates, which are conformal, and their inverse by
// Newton's method.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 203-210.
#pragma once

#include "formulas/complex.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// A polynomial over coefficients in pairs, real part first.
struct ComplexPolynomial {
  int32_t order;
  const double* coefs;

  template <Number V>
  TW_INLINE ComplexOf<V> coef(int32_t k) const {
    const double* pair = coefs + 2 * static_cast<int64_t>(k);
    return {V(pair[0]), V(pair[1])};
  }

  template <Number V>
  TW_INLINE ComplexOf<V> value(ComplexOf<V> z) const {
    ComplexOf<V> w = coef<V>(order);
    for (int32_t k = order - 1; k >= 0; --k) w = w * z + coef<V>(k);
    return w;
  }

  template <Number V>
  TW_INLINE ComplexOf<V> derivative(ComplexOf<V> z) const {
    ComplexOf<V> s = order * coef<V>(order);
    for (int32_t k = order - 1; k >= 1; --k) s = s * z + k * coef<V>(k);
    return s;
  }
};

// Northing is the real part, easting the imaginary one.
struct NormalisedPlane {
  double y0, x0, sy, sx;

  template <Number V>
  TW_INLINE ComplexOf<V> of(V x, V y) const {
    return {(y - y0) / sy, (x - x0) / sx};
  }
  template <Number V>
  TW_INLINE V x(ComplexOf<V> z) const {
    return z.im * sx + x0;
  }
  template <Number V>
  TW_INLINE V y(ComplexOf<V> z) const {
    return z.re * sy + y0;
  }
};

struct ComplexPolynomialForward {
  ComplexPolynomial polynomial;
  NormalisedPlane plane;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto w = polynomial.value(plane.of(x, y));
    return {w.im, w.re};
  }
};

struct ComplexPolynomialInverse {
  ComplexPolynomial polynomial;
  NormalisedPlane plane;
  bool linear_start;  // c_1 is not next to nothing

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const ComplexOf<V> target = {y, x};
    ComplexOf<V> z = {V(0.0), V(0.0)};
    // By contract: the start keeps the real part of the linear solution alone.
    if (linear_start) z.re = ((target - polynomial.coef<V>(0)) / polynomial.coef<V>(1)).re;
    Mask<V> moving = everywhere<V>(true);
    for (int pass = 0; pass < kMostPasses && any(moving); ++pass) {
      const auto f = polynomial.value(plane.of(plane.x(z), plane.y(z)));
      const auto step = (f - target) / polynomial.derivative(z);
      z = {select(moving, z.re - step.re, z.re), select(moving, z.im - step.im, z.im)};
      moving = moving & !(squared_modulus(step) < kTolerance);
    }
    return {plane.x(z), plane.y(z), !moving};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

  static constexpr double kTolerance = 1e-14;  // on squared moduli

 private:
  static constexpr int kMostPasses = 50;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::ComplexPolynomialForward)
TIDEWATER_INSTANCE(tidewater::detail::ComplexPolynomialInverse)
