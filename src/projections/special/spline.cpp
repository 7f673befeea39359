// Clamped cubic spline through any number of knots.
// de Boor, A Practical Guide to Splines (1978), chapter IV.

#include <cmath>
#include <cstdint>
#include <limits>

#include "foundation/new_array.hpp"
#include "tidewater/spline.h"

namespace {

constexpr uint32_t kInside = 1;
constexpr uint32_t kOutside = 2;
constexpr double kNoValue = std::numeric_limits<double>::quiet_NaN();

// The element for index i of an array of n values that stand stride doubles apart.
struct Column {
  const double* first;
  int32_t stride;
  double operator[](int32_t i) const { return first[static_cast<std::ptrdiff_t>(i) * stride]; }
};

// The first interval, from 0 to last, whose upper end lies above v; last where there is none.
int32_t interval_of(double v, const Column& ends, int32_t last) {
  int32_t i = 0;
  while (i < last && !(ends[i + 1] > v)) ++i;
  return i;
}

const double* row(const double* coef, int32_t i) {
  return coef + 4 * static_cast<std::ptrdiff_t>(i);
}

double value_at(const double* c, double t) { return ((c[3] * t + c[2]) * t + c[1]) * t + c[0]; }

double slope_at(const double* c, double t) { return (3 * c[3] * t + 2 * c[2]) * t + c[1]; }

}  // namespace

void TWrobin_csform(const double* knots, double* coef, int32_t n, TWstatus* status) {
  *status = TW_SUCCESS;
  if (n < 2) return;  // no interval, nothing to work out
  const std::size_t size = static_cast<std::size_t>(n);
  const auto work = tidewater::detail::new_array<double>(3 * std::uint64_t{size});
  if (!work) {
    *status = TW_NO_MEMORY;
    return;
  }
  double* const h = work.get();  // knot spacings, h[0] = 0
  double* const dd = h + size;   // divided differences, from 1
  double* const g = dd + size;   // diagonal of the system
  const auto a = [coef](std::size_t i) { return coef[4 * i]; };
  const auto b = [coef](std::size_t i) -> double& { return coef[4 * i + 1]; };

  h[0] = 0;
  for (std::size_t i = 1; i < size; ++i) {
    h[i] = knots[i] - knots[i - 1];
    dd[i] = (a(i) - a(i - 1)) / h[i];
  }
  g[0] = 1;
  g[size - 1] = 1;
  for (std::size_t j = 1; j + 1 < size; ++j) {
    b(j) = 3 * (h[j + 1] * dd[j] + dd[j + 1] * h[j]);
    g[j] = 2 * (knots[j + 1] - knots[j - 1]);
  }
  for (std::size_t i = 0; i + 2 < size; ++i) {
    const double f = -(h[i + 2] / g[i]);
    g[i + 1] += f * h[i];
    b(i + 1) += f * b(i);
  }
  for (std::size_t i = size - 1; i-- > 0;) b(i) = (b(i) - b(i + 1) * h[i]) / g[i];
  for (std::size_t i = 0; i + 1 < size; ++i) {
    const double s = dd[i + 1];
    const double u = b(i + 1) + b(i) - 2 * s;
    coef[4 * i + 2] = (s - b(i) - u) / h[i + 1];
    coef[4 * i + 3] = u / (h[i + 1] * h[i + 1]);
  }
}

double TWrobin_cseval(double x, const double* knots, const double* coef, int32_t n,
                      uint32_t* flag) {
  *flag = kOutside;
  if (n < 2) return kNoValue;
  int32_t i = n - 2;
  if (knots[0] <= x && x <= knots[n - 1]) {
    *flag = kInside;
    i = interval_of(x, {knots, 1}, n - 2);
  } else if (knots[0] > x) {
    i = 0;
  }
  return value_at(row(coef, i), x - knots[i]);
}

double TWrobin_csderv(double x, const double* knots, const double* coef, int32_t n,
                      uint32_t* flag) {
  *flag = kOutside;
  if (n < 2) return kNoValue;
  int32_t i = n - 2;
  if (knots[0] <= x && x <= knots[n - 1]) {
    *flag = kInside;
    i = interval_of(x, {knots, 1}, n - 1);
    // At the last knot the slope is the given one; the last row has no cubic to evaluate.
    if (i == n - 1) return row(coef, i)[1];
  } else if (knots[0] > x) {
    i = 0;
  }
  return slope_at(row(coef, i), x - knots[i]);
}

double TWrobin_csinv(double y, const double* knots, const double* coef, int32_t n, uint32_t* flag) {
  *flag = kOutside;
  if (n < 2) return kNoValue;
  const Column values = {coef, 4};
  int32_t i = 0;
  if (values[0] <= y && y <= values[n - 1]) {
    *flag = kInside;
    i = interval_of(y, values, n - 2);
  } else if (values[0] <= y) {
    i = n - 2;
  }
  const double* const c = row(coef, i);
  double x = (y - c[0]) / (values[i + 1] - c[0]) * (knots[i + 1] - knots[i]) + knots[i];
  // Newton on the cubic of this one interval; running out of passes is not reported.
  constexpr int kMostPasses = 11;
  for (int pass = 0; pass < kMostPasses; ++pass) {
    const double t = x - knots[i];
    const double step = (value_at(c, t) - y) / slope_at(c, t);
    x -= step;
    if (std::fabs(step) <= 1e-08) break;
  }
  return x;
}
