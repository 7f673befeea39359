// New Zealand map grid: a complex polynomial over the Mercator plane.
// Reilly, A conformal mapping projection with minimum scale error, Survey Review 22 (1973), 57-71.

#include <cmath>

#include "formulas/constants.hpp"
#include "formulas/pole_hold.hpp"
#include "foundation/complex.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

double modulus(Complex z) { return std::sqrt(z.re * z.re + z.im * z.im); }

// Coefficients of z to z^6, for z = isometric latitude + i longitude.
constexpr Complex kCoefficients[6] = {
    {0.7557853228, 0.0},       {0.249204646, 0.003371507}, {-0.001541739, 0.04105856},
    {-0.10162907, 0.01727609}, {-0.26623489, -0.36249218}, {-0.6870983, -1.1651967},
};

Complex polynomial(Complex z) {
  Complex p = kCoefficients[5] * z;
  for (int k = 4; k >= 0; --k) p = (p + kCoefficients[k]) * z;
  return p;
}

Complex gradient(Complex z) {
  Complex p = 6 * kCoefficients[5];
  for (int k = 4; k >= 0; --k) p = p * z + (k + 1) * kCoefficients[k];
  return p;
}

// The z whose polynomial is w, by Newton's rule.  False when the passes were used up, also where
// the last of them did converge.
bool solve(Complex w, Complex& z) {
  constexpr int kMostPasses = 50;
  z = w / kCoefficients[0];
  int passes = 0;
  Complex d = {};
  do {
    d = (w - polynomial(z)) / gradient(z);
    z = z + d;
    ++passes;
  } while (!(modulus(d) < 1e-14) && passes < kMostPasses);
  return passes < kMostPasses;
}

}  // namespace

void TWn_zeal_param(double* lon_c, double* lat_c, double* false_easting, double* false_northing,
                    double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  *lon_c = 173 * kRadiansPerDegree;
  *lat_c = -41 * kRadiansPerDegree;
  *false_easting = 2510000.0;
  *false_northing = 6023150.0;
  *k0 = 1.0;
}

void TWn_zeal_c(double e, double lat0, double* y0, TWstatus* status) {
  TWmerc_c(e, lat0, y0, status);
}

void TWn_zeal_f(double e, double lon0, double /*unused*/, double y0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  TWmerc_f(e, lon0, y0, count, in, out, status);
  // By contract: a point that was skipped is taken through the polynomial with what its output
  // holds.
  for (int32_t i = 0; i < count; ++i) {
    const Complex w = polynomial({out[i].y, out[i].x});
    out[i].x = w.im;
    out[i].y = w.re;
  }
}

void TWn_zeal_i(double e, double lon0, double /*unused*/, double y0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  for (int32_t i = 0; i < count; ++i) {
    Complex z = {};
    // By contract: an iteration that ran out is not told, since the Mercator inverse sets the word
    // anew.
    solve({in[i].y, in[i].x}, z);
    out[i].x = z.im;
    out[i].y = z.re;
  }
  TWmerc_i(e, lon0, y0, count, out, out, status);
}

void TWn_zeal_s(double e, double lon0, double /*unused*/, double y0, double k0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    double lat = in[i].y;
    double k = k0;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_BAD_LATITUDE;  // the point is filled with the caller's scale
    } else {
      lat = hold_off_poles(lat, 1e-10);
      // In place: a held latitude that is refused, past the north pole, stays as the ordinate.
      CoordinateTriple mercator = {lon, lat, 0};
      TWstatus word = TW_SUCCESS;
      TWmerc_f(e, lon0, y0, 1, &mercator, &mercator, &word);
      if (!TW_OK(word)) *status = word;
      const double g = modulus(gradient({mercator.y, lon - lon0}));
      // By contract: k0 does not enter here.
      k = std::sqrt(1 - e2 * square(std::sin(lat))) * g / std::cos(lat);
    }
    out[i] = {k, k, k * k};
  }
}

void TWn_zeal_fpoly(double re, double im, double* result) {
  const Complex w = polynomial({re, im});
  result[0] = w.re;
  result[1] = w.im;
}

void TWn_zeal_grad(double re, double im, double* result) {
  const Complex g = gradient({re, im});
  result[0] = g.re;
  result[1] = g.im;
}

void TWn_zeal_ipoly(double re, double im, double* result, TWstatus* status) {
  *status = TW_SUCCESS;
  Complex z = {};
  if (!solve({re, im}, z)) *status = TW_NOT_CONVERGED;
  result[0] = z.re;
  result[1] = z.im;
}
