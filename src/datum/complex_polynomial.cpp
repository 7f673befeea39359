// Complex polynomials of normalised plane coordinates, which are conformal, and their inverse by
// Newton's method.

#include <cmath>

#include "formulas/constants.hpp"
#include "foundation/complex.hpp"
#include "tidewater/datum.h"

using namespace tidewater::detail;

namespace {

double squared_modulus(Complex p) { return square(p.re) + square(p.im); }

// A polynomial over coefficients in pairs, real part first.
class Polynomial {
 public:
  Polynomial(int32_t order, const double* coefs) : order_(order), coefs_(coefs) {}

  Complex coef(int32_t k) const {
    const double* pair = coefs_ + 2 * static_cast<int64_t>(k);
    return {pair[0], pair[1]};
  }

  Complex value(Complex z) const {
    Complex w = coef(order_);
    for (int32_t k = order_ - 1; k >= 0; --k) w = w * z + coef(k);
    return w;
  }

  Complex derivative(Complex z) const {
    Complex s = order_ * coef(order_);
    for (int32_t k = order_ - 1; k >= 1; --k) s = s * z + k * coef(k);
    return s;
  }

 private:
  int32_t order_;
  const double* coefs_;
};

// Northing is the real part, easting the imaginary one.
struct Normalised {
  double y0, x0, sy, sx;

  Complex of(double x, double y) const { return {(y - y0) / sy, (x - x0) / sx}; }
  double x(Complex z) const { return z.im * sx + x0; }
  double y(Complex z) const { return z.re * sy + y0; }
};

// The second-degree mapping as a complex polynomial.
struct Conformal2 {
  int32_t order;
  double coefs[6];
};

Conformal2 conformal2(double a0, double a1, double a2, double b0, double b1, double b2) {
  const int32_t order = std::hypot(a2, b2) < 1e-12 ? 1 : 2;
  return {order, {b0, a0, a1, -b1, -b2, -a2}};
}

}  // namespace

void TWcomplexpol_f(int32_t order, double y0, double x0, double sy, double sx, const double* coefs,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  const Polynomial polynomial(order, coefs);
  const Normalised plane = {y0, x0, sy, sx};
  for (int32_t i = 0; i < count; ++i) {
    const Complex w = polynomial.value(plane.of(in[i].x, in[i].y));
    out[i].x = w.im;
    out[i].y = w.re;
  }
}

void TWcomplexpol_g(int32_t order, const double* coefs, double z_re, double z_im, double* result,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  const Complex s = Polynomial(order, coefs).derivative({z_re, z_im});
  result[0] = s.re;
  result[1] = s.im;
}

void TWcomplexpol_i(int32_t order, double y0, double x0, double sy, double sx, const double* coefs,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr int kMostPasses = 50;
  constexpr double kTolerance = 1e-14;  // on squared moduli
  const Polynomial polynomial(order, coefs);
  const Normalised plane = {y0, x0, sy, sx};
  const bool invertible = order >= 1 && squared_modulus(polynomial.coef(1)) > kTolerance;
  for (int32_t i = 0; i < count; ++i) {
    // By contract: each point sets the word anew, so that only the last one's is seen.
    *status = TW_SUCCESS;
    const Complex target = {in[i].y, in[i].x};
    Complex z = {0, 0};
    // By contract: the start keeps the real part of the linear solution alone.
    if (invertible) z.re = ((target - polynomial.coef(0)) / polynomial.coef(1)).re;
    int passes = 0;
    for (; passes < kMostPasses; ++passes) {
      const Complex f = polynomial.value(plane.of(plane.x(z), plane.y(z)));
      const Complex step = (f - target) / polynomial.derivative(z);
      z = z - step;
      if (squared_modulus(step) < kTolerance) break;
    }
    if (passes == kMostPasses) *status = TW_I_LATITUDE_LIMITED;
    out[i].x = plane.x(z);
    out[i].y = plane.y(z);
  }
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
