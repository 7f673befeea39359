// Polynomials of any degree in the plane, and their inverse by Newton's method: the exported
// functions.

#include "datum/plane_polynomial_points.hpp"

#include <algorithm>
#include <cmath>

#include "tidewater/plane_polynomial.h"

using namespace tidewater::detail;

namespace {

PlanePolynomials polynomials(const double* coefs, int32_t degree) {
  return {coefs, coefs + static_cast<int64_t>(degree + 1) * (degree + 2) / 2, degree};
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
  *status = over_points(PlanePolynomialForward{polynomials(coefs, d)}, count, in, out);
}

void TWnpoly2d_i(const double* coefs, int32_t d, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = over_points(PlanePolynomialInverse(polynomials(coefs, d)), count, in, out);
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
