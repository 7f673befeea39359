// Polynomials of any degree in the plane, and their inverse by Newton's method.
// W. H. Press, S. A. Teukolsky, W. T. Vetterling and B. P. Flannery, Numerical Recipes, 2nd ed.
// (1992), sections 5.3 and 9.6.
#pragma once

#include "formulas/constants.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

template <class V>
struct PlaneSlope {
  V value, x, y;
};

// Two polynomials of one degree, their terms by total degree and then by falling power of x.
struct PlanePolynomials {
  const double* first;
  const double* second;
  int32_t degree;

  // The term x^i y^j stands here in a block.
  static constexpr int64_t index_of(int64_t i, int64_t j) { return (i + j) * (i + j + 1) / 2 + j; }

  template <Number V>
  TW_INLINE V value(const double* block, V x, V y) const {
    V sum = 0.0;
    for (int64_t i = degree; i >= 0; --i) {
      V inner = 0.0;
      for (int64_t j = degree - i; j >= 0; --j) inner = inner * y + block[index_of(i, j)];
      sum = sum * x + inner;
    }
    return sum;
  }

  // Value and partial derivatives.
  template <Number V>
  TW_INLINE PlaneSlope<V> slope(const double* block, V x, V y) const {
    PlaneSlope<V> s = {V(0.0), V(0.0), V(0.0)};
    for (int64_t i = degree; i >= 0; --i) {
      V inner = 0.0;
      V inner_y = 0.0;
      for (int64_t j = degree - i; j >= 0; --j) {
        const double c = block[index_of(i, j)];
        inner = inner * y + c;
        if (j > 0) inner_y = inner_y * y + static_cast<double>(j) * c;
      }
      s.value = s.value * x + inner;
      if (i > 0) s.x = s.x * x + static_cast<double>(i) * inner;
      s.y = s.y * x + inner_y;
    }
    return s;
  }
};

struct PlanePolynomialForward {
  PlanePolynomials polynomials;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V y, V z) const {
    return {polynomials.value(polynomials.first, x, y), polynomials.value(polynomials.second, x, y),
            z};
  }
};

class PlanePolynomialInverse {
 public:
  explicit PlanePolynomialInverse(const PlanePolynomials& polynomials) : polynomials_(polynomials) {
    if (polynomials.degree >= 1) {
      a1_ = polynomials.first[1];
      a2_ = polynomials.first[2];
      b1_ = polynomials.second[1];
      b2_ = polynomials.second[2];
    }
    determinant_ = b2_ * a1_ - b1_ * a2_;
  }

  template <Number V>
  TW_INLINE Answer3<V> operator()(V target_x, V target_y, V z) const {
    const double* first = polynomials_.first;
    const double* second = polynomials_.second;
    V x = 0.0;
    V y = 0.0;
    if (determinant_ != 0) {
      const V u = target_x - first[0];
      const V v = target_y - second[0];
      x = (b2_ * u - a2_ * v) / determinant_;
      y = (a1_ * v - b1_ * u) / determinant_;
    }
    // By contract: running out of passes is not reported.
    Mask<V> moving = everywhere<V>(true);
    for (int pass = 0; pass < kMostPasses && any(moving); ++pass) {
      const auto p = polynomials_.slope(first, x, y);
      const auto q = polynomials_.slope(second, x, y);
      const V f = p.value - target_x;
      const V g = q.value - target_y;
      const V determinant = q.y * p.x - q.x * p.y;
      const auto regular = determinant != V(0.0);
      const V over = 1.0 / determinant;
      const V dx = select(regular, f * (q.y * over) - g * (p.y * over), 0.0);
      const V dy = select(regular, g * (p.x * over) - f * (q.x * over), 0.0);
      x = select(moving, x - dx, x);
      y = select(moving, y - dy, y);
      const auto close_x = abs(dx) < 1e-12;
      const auto close_y = abs(dy) < 1e-12;
      moving = moving & !(close_x & close_y);
    }
    return {x, y, z};
  }

 private:
  static constexpr int kMostPasses = 20;

  PlanePolynomials polynomials_;
  double a1_ = 0, a2_ = 0, b1_ = 0, b2_ = 0, determinant_ = 0;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::PlanePolynomialForward)
TIDEWATER_INSTANCE(tidewater::detail::PlanePolynomialInverse)
