// Polynomials of any degree in the plane, and their inverse by Newton's method.

#include <algorithm>
#include <cmath>

#include "tidewater/datum.h"

namespace {

int64_t terms_of(int32_t degree) {
  const int64_t d = degree;
  return (d + 1) * (d + 2) / 2;
}

// The term x^i y^j stands here in a block.
int64_t index_of(int64_t i, int64_t j) { return (i + j) * (i + j + 1) / 2 + j; }

double value_at(const double* block, int32_t degree, double x, double y) {
  double value = 0;
  for (int64_t i = degree; i >= 0; --i) {
    double inner = 0;
    for (int64_t j = degree - i; j >= 0; --j) inner = inner * y + block[index_of(i, j)];
    value = value * x + inner;
  }
  return value;
}

struct Slope {
  double value = 0;
  double x = 0;
  double y = 0;
};

// Value and partial derivatives.
Slope slope_at(const double* block, int32_t degree, double x, double y) {
  Slope s;
  for (int64_t i = degree; i >= 0; --i) {
    double inner = 0;
    double inner_y = 0;
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

// Second-degree terms all below this are dropped.
constexpr double kNegligible = 1e-12;

struct SecondDegree {
  int32_t degree;
  double coefs[12];
};

SecondDegree second_degree(const double (&a)[6], const double (&b)[6]) {
  const auto counts = [](double c) { return std::fabs(c) >= kNegligible; };
  const bool full = std::any_of(a + 3, a + 6, counts) || std::any_of(b + 3, b + 6, counts);
  if (full) return {2, {a[0], a[1], a[2], a[3], a[4], a[5], b[0], b[1], b[2], b[3], b[4], b[5]}};
  return {1, {a[0], a[1], a[2], b[0], b[1], b[2]}};
}

}  // namespace

void TWnpoly2d_f(const double* coefs, int32_t d, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double* second = coefs + terms_of(d);
  for (int32_t i = 0; i < count; ++i) {
    const auto [x, y, z] = in[i];
    out[i] = {value_at(coefs, d, x, y), value_at(second, d, x, y), z};
  }
}

void TWnpoly2d_i(const double* coefs, int32_t d, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr int kMostPasses = 20;
  const double* second = coefs + terms_of(d);
  const bool linear_terms = d >= 1;
  const double a1 = linear_terms ? coefs[1] : 0;
  const double a2 = linear_terms ? coefs[2] : 0;
  const double b1 = linear_terms ? second[1] : 0;
  const double b2 = linear_terms ? second[2] : 0;
  const double start_determinant = b2 * a1 - b1 * a2;
  for (int32_t i = 0; i < count; ++i) {
    const auto [target_x, target_y, z] = in[i];
    double x = 0;
    double y = 0;
    if (start_determinant != 0) {
      const double u = target_x - coefs[0];
      const double v = target_y - second[0];
      x = (b2 * u - a2 * v) / start_determinant;
      y = (-b1 * u + a1 * v) / start_determinant;
    }
    for (int pass = 0; pass < kMostPasses; ++pass) {
      const Slope p = slope_at(coefs, d, x, y);
      const Slope q = slope_at(second, d, x, y);
      const double f = p.value - target_x;
      const double g = q.value - target_y;
      const double determinant = q.y * p.x - q.x * p.y;
      double dx = 0;
      double dy = 0;
      if (determinant != 0) {
        dx = f * (q.y / determinant) + g * (-p.y / determinant);
        dy = f * (-q.x / determinant) + g * (p.x / determinant);
      }
      x -= dx;
      y -= dy;
      if (std::fabs(dx) < 1e-12 && std::fabs(dy) < 1e-12) break;
    }
    out[i] = {x, y, z};
  }
}

void TWpoly2deg_f(double x0, double y0, double sx, double sy, double a0, double a1, double a2,
                  double a3, double a4, double a5, double b0, double b1, double b2, double b3,
                  double b4, double b5, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const auto polynomial = second_degree({a0, a1, a2, a3, a4, a5}, {b0, b1, b2, b3, b4, b5});
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    out[i].x = (x - x0) / sx;
    out[i].y = (y - y0) / sy;
  }
  // By contract: the polynomial reads the input array, so that the normalisation takes effect only
  // where the output is the same array.
  TWnpoly2d_f(polynomial.coefs, polynomial.degree, count, in, out, status);
}

void TWpoly2deg_i(double x0, double y0, double sx, double sy, double a0, double a1, double a2,
                  double a3, double a4, double a5, double b0, double b1, double b2, double b3,
                  double b4, double b5, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  const auto polynomial = second_degree({a0, a1, a2, a3, a4, a5}, {b0, b1, b2, b3, b4, b5});
  TWnpoly2d_i(polynomial.coefs, polynomial.degree, count, in, out, status);
  for (int32_t i = 0; i < count; ++i) {
    out[i].x = out[i].x * sx + x0;
    out[i].y = out[i].y * sy + y0;
  }
}
