// Space oblique Mercator projection of the ellipsoid for a satellite on an elliptical orbit.

#include <array>
#include <cmath>
#include <cstddef>
#include <memory>
#include <new>

#include "formulas/wraps.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// An a0 smaller than this is zero but for rounding: the orbit is circular.
constexpr double kSteady = 1e-10;

// Eccentric anomaly at the angle L along the orbit.
struct Orbit {
  double eps, om, root;

  Orbit(double eps_, double om_) : eps(eps_), om(om_), root(std::sqrt((1 - eps_) / (1 + eps_))) {}
  double eccentric_anomaly(double L) const { return 2 * std::atan(std::tan((L - om) / 2) * root); }
  double mean_anomaly(double E) const { return E - eps * std::sin(E); }
  // Rate of the satellite along its orbit.
  double rate(double E) const { return square(1 - eps * std::cos(E)) / std::sqrt(1 - eps * eps); }
};

// Components of the ground track's velocity with respect to L.
struct Track {
  double Q, T, W, P, s_inc, c_inc;

  struct Velocity {
    double B1, B4;
    double speed() const { return std::sqrt(B1 * B1 + B4 * B4); }
  };
  Velocity at(double sl2, double cos_L, double U) const {
    const double A1 = 1 + Q * sl2;
    const double A2 = 1 + W * sl2;
    return {(A2 / (A1 * A1) - P * c_inc * U) * std::sqrt(A1 / A2),
            std::sqrt((1 + T * sl2) / (A2 * A1)) * cos_L * P * s_inc * U};
  }
};

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

// The Fourier series of the projection, and what follows from them at an angle along the orbit.
struct Series {
  int16_t n_terms;
  double a0;
  const double *C, *S, *X1, *X2, *X3, *X4;
  Orbit orbit;
  Track track;

  struct Terms {
    double T1, T2, Cx, Cy, speed;
  };
  // U is the satellite's rate at L.
  Terms at(double L, double U) const {
    const double s1 = std::sin(L);
    const double c1 = std::cos(L);
    double s = 0;  // sin and cos of n L, by turning on from term to term
    double c = 1;
    double theta = 0;
    Terms t{};
    for (int16_t n = 0; n < n_terms; ++n) {
      const double next = s * c1 + c * s1;
      c = c * c1 - s * s1;
      s = next;
      theta += (1 - c) * S[n] + s * C[n];
      t.T1 += s * X1[n] - c * X4[n];
      t.T2 += s * X2[n] - c * X3[n];
    }
    theta += a0 * L;
    const Track::Velocity v = track.at(s1 * s1, c1, U);
    const double sin_t = std::sin(theta);
    const double cos_t = std::cos(theta);
    t.Cx = cos_t * v.B1 - sin_t * v.B4;
    t.Cy = cos_t * v.B4 + sin_t * v.B1;
    t.speed = v.speed();
    return t;
  }
};

}  // namespace

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
  const double s_inc = std::sin(inc);
  const double c_inc = std::cos(inc);
  const double g = 1 - e2;
  *Q = e2 * square(s_inc) / (1 - e2);
  *T = square(s_inc) * (2 - e2) * e2 / square(1 - e2);
  *W = square((1 - e2 * square(c_inc)) / (1 - e2)) - 1;
  *G = g;

  // s: speed of the ground track with respect to L; c: turning of its tangent per unit of track
  const Orbit orbit(eps, om);
  const Track track = {*Q, *T, *W, P, s_inc, c_inc};
  const double tan2_inc = square(std::tan(inc));
  for (int32_t j = 0; j <= N; ++j) {
    const double L = j * h;
    const double sin_L = std::sin(L);
    const double cos_L = std::cos(L);
    const double ph = std::asin(sin_L * s_inc);
    const double ps = std::atan2(std::tan(ph), g);
    const double sin_ph = std::sin(ph);
    const double cos_ph = std::cos(ph);
    const double sin_ps = std::sin(ps);
    const double cos_ps = std::cos(ps);
    const double c2 = square(cos_ph);
    const double cp2 = square(cos_ps);
    const double cl2 = square(cos_L);
    const double sl2 = square(sin_L);
    const double R = 1 - e2 * square(sin_ps);
    const double H = (1 - (2 - e2) * c2 * e2) / g;
    const double Hd = 2 * e2 * (2 - e2) * H * cos_ph * sin_ph / g;
    const double E = orbit.eccentric_anomaly(L);
    const double U = orbit.rate(E);
    const double Ud = 2 * eps * std::sin(E) * square(1 - eps * std::cos(E)) / (1 - eps * eps);
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
      return std::array{std::cos(angle) * turn, std::sin(angle) * turn};
    });
    C[n - 1] = factor * z[0];
    S[n - 1] = factor * z[1];
  }

  // From here on c and s hold cos(theta) s and sin(theta) s; theta is without its steady part a0 L.
  for (int32_t j = 0; j <= N; ++j) {
    double theta = 0;
    for (int32_t n = 1; n <= n_terms; ++n) {
      const double angle = n * j * h;
      theta += (1 - std::cos(angle)) * S[n - 1] + std::sin(angle) * C[n - 1];
    }
    const double speed = s[j];
    c[j] = std::cos(theta) * speed;
    s[j] = std::sin(theta) * speed;
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
      const double cos_n = std::cos(angle);
      const double sin_n = std::sin(angle);
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
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const double s_inc = std::sin(inc);
  const double c_inc = std::cos(inc);
  const Series series = {
      n_terms, a0, C, S, X1, X2, X3, X4, Orbit(eps, om), {Q, T, W, P, s_inc, c_inc}};
  const double start = (side + 4 * orbit + 2) * kPi / 2;
  const double half_turn = std::sin(start) * kHalfPi;
  const double D = std::sqrt(m_cos * m_cos + m_sin * m_sin);
  for (int32_t i = 0; i < count; ++i) {
    const double d = in[i].x - lon_n;
    const double lat = in[i].y;
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    const double base = std::cos(start * P + d) < 0 ? start + half_turn : start - half_turn;
    const double rise = s_inc * std::tan(lat) * G;
    double L = start;
    double previous = 1.0;
    double E = 0;
    double lt = 0;
    for (int passes = 0; std::fabs(previous - L) > 1e-10;) {
      previous = L;
      if (++passes > 50) {
        *status =
            TW_I_LATITUDE_LIMITED;  // By contract: the point is completed from the last values
        break;
      }
      E = series.orbit.eccentric_anomaly(L);
      lt = (series.orbit.mean_anomaly(E) + om) * P + d;
      L = std::atan((rise + c_inc * std::sin(lt)) / std::cos(lt)) + base;
    }
    const double ph = std::asin((sin_lat * c_inc * G - std::sin(lt) * cos_lat * s_inc) /
                                std::sqrt(1 - e2 * sin_lat * sin_lat));
    const Series::Terms t = series.at(L, series.orbit.rate(E));
    const double y0 = std::log(std::tan(ph / 2 + kQuarterPi));
    double x = 0;
    double y = 0;
    if (std::fabs(a0) < kSteady) {
      const double X = m_sin * L + t.T1 + sum4 - y0 * t.Cx / t.speed;
      const double Y = m_cos * L + t.T2 + sum3 + y0 * t.Cy / t.speed;
      x = (X * m_sin + Y * m_cos) / D;
      y = (Y * m_sin - X * m_cos) / D;
    } else {
      const double sin_u = std::sin(a0 * L);
      const double cos_u = std::cos(a0 * L);
      x = sin_u * (t.T2 + R1) - cos_u * (R2 - t.T1) + R3 - y0 * t.Cx / t.speed;
      y = sin_u * (R2 - t.T1) + cos_u * (t.T2 + R1) - R4 + y0 * t.Cy / t.speed;
    }
    out[i].x = axes == 1 ? x : y;
    out[i].y = axes == 1 ? y : -x;
  }
}

void TWsom_i(int16_t n_terms, double lon_n, double e, double inc, double P, double eps, double om,
             double Q, double T, double W, double G, double a0, const double* C, const double* S,
             const double* X1, const double* X2, const double* X3, const double* X4, double R1,
             double R2, double R3, double R4, double m_sin, double m_cos, double sum3, double sum4,
             int32_t count, const CoordinateTriple* in, CoordinateTriple* out, int32_t axes,
             TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const double s_inc = std::sin(inc);
  const double c_inc = std::cos(inc);
  const double c_inc2 = c_inc * c_inc;
  const Series series = {
      n_terms, a0, C, S, X1, X2, X3, X4, Orbit(eps, om), {Q, T, W, P, s_inc, c_inc}};
  const double D = std::sqrt(m_cos * m_cos + m_sin * m_sin);
  const double q = c_inc2 * e2 / G;
  const bool steady = -kSteady <= a0 && a0 <= kSteady;
  for (int32_t i = 0; i < count; ++i) {
    double X = axes == 1 ? in[i].x : -in[i].y;
    double Y = axes == 1 ? in[i].y : in[i].x;
    if (std::fabs(a0) <
        kSteady) {  // By contract: strict here, and not where the branch is taken below
      const double x = X;
      X = (m_sin * x - m_cos * Y) / D;
      Y = (m_sin * Y + m_cos * x) / D;
    }
    double L = Y;
    double previous = 1.0;
    // These hold also where the first test ends the loop, for a Y hard by 1.
    Series::Terms t = series.at(L, series.orbit.rate(series.orbit.eccentric_anomaly(L)));
    for (int passes = 0; std::fabs(previous - L) > 1e-10;) {
      previous = L;
      if (++passes > 50) {
        *status =
            TW_I_LATITUDE_LIMITED;  // By contract: the point is completed from the last values
        break;
      }
      if (passes > 1) t = series.at(L, series.orbit.rate(series.orbit.eccentric_anomaly(L)));
      if (steady) {
        L = ((X - sum4 - t.T1) * t.Cy + (Y - sum3 - t.T2) * t.Cx) / (t.Cy * m_sin + t.Cx * m_cos);
      } else {
        const double c = std::cos(a0 * L);
        L = std::asin(((X - R3 - c * t.T1) * t.Cy + (t.Cy * R2 - R1 * t.Cx) * c +
                       (R4 + Y - c * t.T2) * t.Cx) /
                      ((R1 + t.T2) * t.Cy + (R2 - t.T1) * t.Cx)) /
            a0;
      }
    }
    const double v = steady
                         ? m_sin * L + sum4 + t.T1 - X
                         : std::sin(a0 * L) * (R1 + t.T2) + R3 - X - std::cos(a0 * L) * (R2 - t.T1);
    const double ph = 2 * (std::atan(std::exp(v * t.speed / t.Cx)) - kQuarterPi);
    const double mean_anomaly = series.orbit.mean_anomaly(series.orbit.eccentric_anomaly(L));
    const double sin_ph = std::sin(ph);
    const double s2 = square(sin_ph);
    const double sin_L = std::sin(L);
    const double cos_L = std::cos(L);
    const double g = (sin_L * c_inc * (1 - s2 / G) -
                      std::sqrt((1 + Q * sin_L * sin_L) * (1 - s2) - s2 * q) * s_inc * sin_ph) /
                     (1 - (q + 1) * s2);
    const double lt = std::atan2(g, cos_L);
    double lat = 0;
    if (cos_L == 0) {
      const double a = s_inc * c_inc * G;
      const double b = c_inc2 * G * G - s_inc * s_inc + s2 * e2;
      const double c2 = square(std::cos(ph));
      const double r = std::sqrt((c2 - c_inc2 * e2) * G);
      const double width = std::sqrt(4 * a * a + b * b);
      lat = std::asin(sin_L < 0 ? -std::sqrt(2 * a * (a - sin_ph * r) - (c2 - c_inc2) * b) / width
                                : std::sqrt(2 * a * (a + sin_ph * r) - (c2 - c_inc2) * b) / width);
    } else if (std::fabs(inc) <= 1e-10) {
      lat = std::asin(sin_ph / std::sqrt(s2 * e2 + G * G));
    } else {
      lat = std::atan((std::cos(lt) * std::tan(L) - std::sin(lt) * c_inc) / (s_inc * G));
    }
    out[i].x = wrap_below_then_above(lt + lon_n - (om + mean_anomaly) * P);
    out[i].y = lat;
  }
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
