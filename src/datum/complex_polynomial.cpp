// Complex polynomials in the plane: what the contract says of a point whose iteration does not end,
// and the exported functions.

#include "datum/complex_polynomial_points.hpp"

#include <cmath>
#include "points/portable.hpp"
#include "tidewater/complex_polynomial.h"

using namespace tidewater::detail;

namespace {

// The second-degree mapping as a complex polynomial.
struct Conformal2 {
  int32_t order;
  double coefs[6];
};

Conformal2 conformal2(double a0, double a1, double a2, double b0, double b1, double b2) {
  const int32_t order = portable::hypot(a2, b2) < 1e-12 ? 1 : 2;
  return {order, {b0, a0, a1, -b1, -b2, -a2}};
}

}  // namespace

void TWcomplexpol_f(int32_t order, double y0, double x0, double sy, double sx, const double* coefs,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
  *status = over_points(ComplexPolynomialForward{{order, coefs}, {y0, x0, sy, sx}}, count, in, out);
}

void TWcomplexpol_g(int32_t order, const double* coefs, double z_re, double z_im, double* result,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  const auto s = ComplexPolynomial{order, coefs}.derivative(ComplexOf<double>{z_re, z_im});
  result[0] = s.re;
  result[1] = s.im;
}

Next ComplexPolynomialInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                                     TWstatus* status) const {
  *status = TW_I_LATITUDE_LIMITED;
  const auto last = (*this)(in.x, in.y);
  out->x = last.x;
  out->y = last.y;
  return Next::point;
}

void TWcomplexpol_i(int32_t order, double y0, double x0, double sy, double sx, const double* coefs,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
  const ComplexPolynomial polynomial = {order, coefs};
  const bool linear_start = order >= 1 && squared_modulus(polynomial.coef<double>(1)) >
                                              ComplexPolynomialInverse::kTolerance;
  const ComplexPolynomialInverse kernel = {polynomial, {y0, x0, sy, sx}, linear_start};
  const CoordinateTriple last = count > 0 ? in[count - 1] : CoordinateTriple{};
  *status = over_points(kernel, count, in, out);
  // By contract: each point sets the word anew, so that only the last one's is seen.
  if (*status != TW_SUCCESS && kernel(last.x, last.y).plain) *status = TW_SUCCESS;
}

void TWconform2_f(double x0, double y0, double sx, double sy, double a0, double a1, double a2,
                  double b0, double b1, double b2, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  const auto mapping = conformal2(a0, a1, a2, b0, b1, b2);
  TWcomplexpol_f(mapping.order, y0, x0, sy, sx, mapping.coefs, count, in, out, status);
}

void TWconform2_i(double x0, double y0, double sx, double sy, double a0, double a1, double a2,
                  double b0, double b1, double b2, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  const auto mapping = conformal2(a0, a1, a2, b0, b1, b2);
  TWcomplexpol_i(mapping.order, y0, x0, sy, sx, mapping.coefs, count, in, out, status);
}
