// Space oblique Mercator projection: its constants by integration along an orbit, what the contract
// says of the points that the formulas do not cover, and the exported functions.

#include "projections/special/space_oblique_mercator_points.hpp"

#include <array>
#include <cmath>
#include <cstddef>
#include <memory>
#include <new>

#include "points/portable.hpp"
#include "tidewater/space_oblique_mercator.h"

using namespace tidewater::detail;

namespace {

// Simpson's sums of K sequences f(0)..f(N) at once, N even, without the factor h / 3.
template <std::size_t K, class F>
std::array<double, K> simpson(int32_t N, F f) {
  std::array<double, K> sum{};
  const auto add = [&](double weight, int32_t j) {
    const std::array<double, K> v = f(j);
    for (std::size_t k = 0; k < K; ++k) sum[k] += weight * v[k];
  };
  add(4, 1);
  add(1, N);
  add(1, 0);
  for (int32_t j = 2; j <= N - 2; j += 2) {
    add(4, j + 1);
    add(2, j);
  }
  return sum;
}

}  // namespace

namespace tidewater::detail {

// By contract: where the passes were used up, the point is completed from the last values.
Next SpaceForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                         TWstatus* status) const {
  const auto at = place(in.x, in.y);
  *status = TW_I_LATITUDE_LIMITED;
  out->x = at.x;
  out->y = at.y;
  return Next::point;
}

Next SpaceInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                         TWstatus* status) const {
  const auto at = place(in.x, in.y);
  if (at.moving) *status = TW_I_LATITUDE_LIMITED;
  double lat = at.lat;
  if (at.at.cos == 0) {
    const double s_inc = series.track.s_inc;
    const double c_inc2 = square(series.track.c_inc);
    const double s2 = square(at.sin_ph);
    const double a = s_inc * series.track.c_inc * G;
    const double b = c_inc2 * G * G - s_inc * s_inc + s2 * e2;
    const double c2 = 1 - s2;
    const double r = std::sqrt((c2 - c_inc2 * e2) * G);
    const double width = std::sqrt(4 * a * a + b * b);
    const double side = at.at.sin < 0 ? -1 : 1;
    lat = portable::asin(side * std::sqrt(2 * a * (a + side * at.sin_ph * r) - (c2 - c_inc2) * b) /
                         width);
  }
  out->x = at.lon;
  out->y = lat;
  return Next::point;
}

}  // namespace tidewater::detail

void TWsom_c(double e, double inc, double P, double eps, double om, int16_t n_terms,
             int16_t n_points, double* Q, double* T, double* W, double* G, double* a0, double* C,
             double* S, double* X1, double* X2, double* X3, double* X4, double* R1, double* R2,
             double* R3, double* R4, double* m_sin, double* m_cos, double* sum3, double* sum4,
             TWstatus* status) {
  *status = TW_SUCCESS;
  if (n_points < 2) {
    *status = TW_BAD_INPUT;
    return;
  }
  int32_t N = n_points - 1;
  if (N % 2 != 0) ++N;
  const double h = 2 * kPi / N;
  const std::size_t size = static_cast<std::size_t>(N) + 1;
  const std::unique_ptr<double[]> speeds(new (std::nothrow) double[size]);
  const std::unique_ptr<double[]> turns(new (std::nothrow) double[size]);
  double* const s = speeds.get();
  double* const c = turns.get();
  if (!s || !c) {
    *status = TW_NO_MEMORY;
    return;
  }

  const double e2 = e * e;
  const double s_inc = portable::sin(inc);
  const double c_inc = portable::cos(inc);
  const double g = 1 - e2;
  *Q = e2 * square(s_inc) / (1 - e2);
  *T = square(s_inc) * (2 - e2) * e2 / square(1 - e2);
  *W = square((1 - e2 * square(c_inc)) / (1 - e2)) - 1;
  *G = g;

  // s: speed of the ground track with respect to L; c: turning of its tangent per unit of track
  const Orbit orbit(eps, om);
  const Track track = {*Q, *T, *W, P, s_inc, c_inc};
  const double tan2_inc = square(portable::tan(inc));
  for (int32_t j = 0; j <= N; ++j) {
    const double L = j * h;
    const double sin_L = portable::sin(L);
    const double cos_L = portable::cos(L);
    const double ph = portable::asin(sin_L * s_inc);
    const double ps = portable::atan2(portable::tan(ph), g);
    const double sin_ph = portable::sin(ph);
    const double cos_ph = portable::cos(ph);
    const double sin_ps = portable::sin(ps);
    const double cos_ps = portable::cos(ps);
    const double c2 = square(cos_ph);
    const double cp2 = square(cos_ps);
    const double cl2 = square(cos_L);
    const double sl2 = square(sin_L);
    const double R = 1 - e2 * square(sin_ps);
    const double H = (1 - (2 - e2) * c2 * e2) / g;
    const double Hd = 2 * e2 * (2 - e2) * H * cos_ph * sin_ph / g;
    const double E = orbit.eccentric_anomaly(L);
    const double U = orbit.rate(E);
    const double Ud =
        2 * eps * portable::sin(E) * square(1 - eps * portable::cos(E)) / (1 - eps * eps);
    const double L2 = c_inc / c2 - P * U;
    const double L1 = cos_ph * L2 * H / s_inc;
    const double M = sin_ph * square(H) / tan2_inc + cos_ph * Hd * cl2;
    const double Ld = (M * L2 + 2 * sin_ph * square(H) * cl2 * c_inc / c2 -
                       cos_L * square(H) * c2 * P * Ud / s_inc) /
                      s_inc;
    c[j] = -(sin_ps * cube(L1) * square(R) * cp2 +
             (sin_ps * (3 * R - g) * cl2 * L1 - cos_ps * R * Ld) * g) /
           std::sqrt(cube(square(g) * cl2 / R + square(L1) * R * cp2));
    s[j] = track.at(sl2, cos_L, U).speed();
  }

  const double third = h / 3;
  *a0 = third * (1 / (2 * kPi)) *
        simpson<1>(N, [&](int32_t j) { return std::array{s[j] * c[j]}; })[0];
  for (int32_t n = 1; n <= n_terms; ++n) {
    const double factor = 1 / (n * kPi) * third;
    const auto z = simpson<2>(N, [&](int32_t j) {
      const double angle = n * j * h;
      const double turn = s[j] * c[j];
      return std::array{portable::cos(angle) * turn, portable::sin(angle) * turn};
    });
    C[n - 1] = factor * z[0];
    S[n - 1] = factor * z[1];
  }

  // From here on c and s hold cos(theta) s and sin(theta) s; theta is without its steady part a0 L.
  for (int32_t j = 0; j <= N; ++j) {
    double theta = 0;
    for (int32_t n = 1; n <= n_terms; ++n) {
      const double angle = n * j * h;
      theta += (1 - portable::cos(angle)) * S[n - 1] + portable::sin(angle) * C[n - 1];
    }
    const double speed = s[j];
    c[j] = portable::cos(theta) * speed;
    s[j] = portable::sin(theta) * speed;
  }
  const auto mean = simpson<2>(N, [&](int32_t j) { return std::array{s[j], c[j]}; });
  *m_sin = third * (1 / (2 * kPi)) * mean[0];
  *m_cos = third * (1 / (2 * kPi)) * mean[1];

  const double k = third * (1 / kPi);
  *sum3 = 0;
  *sum4 = 0;
  for (int32_t n = 1; n <= n_terms; ++n) {
    const auto z = simpson<4>(N, [&](int32_t j) {
      const double angle = n * j * h;
      const double cos_n = portable::cos(angle);
      const double sin_n = portable::sin(angle);
      return std::array{cos_n * s[j], sin_n * s[j], sin_n * c[j], cos_n * c[j]};
    });
    const double Cs = k * z[0];
    const double Ss = k * z[1];
    const double Sc = k * z[2];
    const double Cc = k * z[3];
    const double den = static_cast<double>(n) * n - square(*a0);
    X1[n - 1] = (*a0 * Sc + n * Cs) / den;
    X2[n - 1] = (n * Cc - *a0 * Ss) / den;
    X3[n - 1] = (*a0 * Cs + n * Sc) / den;
    X4[n - 1] = (n * Ss - *a0 * Cc) / den;
    *sum3 += X3[n - 1];
    *sum4 += X4[n - 1];
  }
  if (std::fabs(*a0) > kSteady) {
    *R1 = *m_sin / *a0;
    *R2 = *m_cos / *a0;
    *R3 = *sum4 + *R2;
    *R4 = *R1 - *sum3;
  }
}

void TWsom_f(int16_t orbit, int16_t side, int16_t n_terms, double lon_n, double e, double inc,
             double P, double eps, double om, double Q, double T, double W, double G, double a0,
             const double* C, const double* S, const double* X1, const double* X2, const double* X3,
             const double* X4, double R1, double R2, double R3, double R4, double m_sin,
             double m_cos, double sum3, double sum4, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, int32_t axes, TWstatus* status) {
  const double start = (side + 4 * orbit + 2) * kPi / 2;
  const SpaceSeries series = {n_terms,
                              a0,
                              C,
                              S,
                              X1,
                              X2,
                              X3,
                              X4,
                              R1,
                              R2,
                              R3,
                              R4,
                              m_sin,
                              m_cos,
                              sum3,
                              sum4,
                              Orbit(eps, om),
                              {Q, T, W, P, portable::sin(inc), portable::cos(inc)}};
  *status = over_points(
      SpaceForward{series, lon_n, e * e, G, start, portable::sin(start) * kHalfPi, axes == 1},
      count, in, out);
}

void TWsom_i(int16_t n_terms, double lon_n, double e, double inc, double P, double eps, double om,
             double Q, double T, double W, double G, double a0, const double* C, const double* S,
             const double* X1, const double* X2, const double* X3, const double* X4, double R1,
             double R2, double R3, double R4, double m_sin, double m_cos, double sum3, double sum4,
             int32_t count, const CoordinateTriple* in, CoordinateTriple* out, int32_t axes,
             TWstatus* status) {
  const SpaceSeries series = {n_terms,
                              a0,
                              C,
                              S,
                              X1,
                              X2,
                              X3,
                              X4,
                              R1,
                              R2,
                              R3,
                              R4,
                              m_sin,
                              m_cos,
                              sum3,
                              sum4,
                              Orbit(eps, om),
                              {Q, T, W, P, portable::sin(inc), portable::cos(inc)}};
  *status = over_points(SpaceInverse{series, lon_n, e * e, inc, G, axes == 1}, count, in, out);
}

void TWsomps(int32_t paths, double lon_ref, int16_t row, int16_t path, int16_t row_first,
             int16_t row_last, int16_t row_next, double* lon_n, int16_t* side, int16_t* orbit,
             TWstatus* status) {
  *status = TW_SUCCESS;
  *lon_n = lon_ref - kTwoPi / paths * path;
  const bool descending = row_first <= row && row <= row_last;
  *side = descending ? 1 : -1;
  *orbit = !descending && row_next <= row ? 1 : 0;
}
