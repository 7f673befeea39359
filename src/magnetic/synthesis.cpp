// Spherical-harmonic synthesis by Clenshaw's method in two stages: sums over degree for each order,
// then a sum over order.  No Legendre function is formed.

#include <cmath>
#include <cstring>
#include <initializer_list>

#include "formulas/constants.hpp"
#include "tidewater/foundation.h"
#include "tidewater/magnetic.h"

using namespace tidewater::detail;

namespace {

// A point this close to the axis is held off it, on the meridian of Greenwich.
constexpr double kAxisLimit = 1e-12;

enum Mode : int16_t { kGradient = 0, kAlongTheta = 1, kAlongLambda = 2, kRadial = 3, kGravity = 4 };

// The components that a mode gives.
template <Mode kMode>
constexpr bool kNorth = kMode == kGradient || kMode == kAlongTheta;
template <Mode kMode>
constexpr bool kEast = kMode == kGradient || kMode == kAlongLambda;
template <Mode kMode>
constexpr bool kDown = kMode == kGradient || kMode == kRadial;

struct Series {
  int32_t N;
  double* const* C;
  double* const* S;
  double* const* rec_a;
  double* const* rec_b;
};

// The work arrays: one value for each order.
struct Sums {
  double* dC;
  double* dS;
  double* lC;
  double* lS;
  double* rC;
  double* rS;
  double* C;
  double* S;
};

// What the recurrences need of a point, with q = radius / r: q cos(theta), q sin(theta), q^2.
struct Argument {
  double tcos;
  double tsin;
  double q2;
};

// Two neighbouring orders side by side; arithmetic goes element by element.
using Pair = double __attribute__((vector_size(2 * sizeof(double))));

template <class Value>
Value load(const double* place) {
  Value value;
  std::memcpy(&value, place, sizeof value);
  return value;
}

// The sum y and its derivative d by theta, at the last degree done and at the one above it.
template <class Value>
struct Chain {
  Value y = {};
  Value y_above = {};
  Value d = {};
  Value d_above = {};

  void descend(Value a_cos, Value b_q2, Value term) {
    const Value next = a_cos * y + b_q2 * y_above + term;
    y_above = y;
    y = next;
  }

  // Comes before descend(): it needs y of the degree above.
  void descend_slope(Value a_cos, Value a_sin, Value b_q2) {
    const Value next = a_cos * d + b_q2 * d_above - a_sin * y;
    d_above = d;
    d = next;
  }
};

Chain<double> lane(const Chain<Pair>& chain, int j) {
  return {chain.y[j], chain.y_above[j], chain.d[j], chain.d_above[j]};
}

// The sums over degree of one order, or of a pair.  One pass serves all terms of a mode, so that
// constants and coefficients are read once.
template <Mode kMode, class Value>
struct DegreeSums {
  // At the degree of the series, above which y and d are zero.
  DegreeSums(const Series& series, int32_t m) {
    const int32_t n = series.N;
    c.y = load<Value>(series.C[n] + m);
    s.y = load<Value>(series.S[n] + m);
    radial_c.y = (n + 1.0) * c.y;
    radial_s.y = (n + 1.0) * s.y;
  }

  // One order of a pair.
  DegreeSums(const DegreeSums<kMode, Pair>& pair, int j)
      : c(lane(pair.c, j)),
        s(lane(pair.s, j)),
        radial_c(lane(pair.radial_c, j)),
        radial_s(lane(pair.radial_s, j)) {}

  // Goes down to degree n from n + 1.
  void step(const Series& series, const Argument& at, int32_t m, int32_t n) {
    static constexpr double kNone[2] = {};
    const auto a = load<Value>(series.rec_a[n + 1] + m);
    const auto b = load<Value>(n + 2 <= series.N ? series.rec_b[n + 2] + m : kNone);
    const auto C = load<Value>(series.C[n] + m);
    const auto S = load<Value>(series.S[n] + m);
    const Value a_cos = a * at.tcos;
    const Value a_sin = a * at.tsin;
    const Value b_q2 = b * at.q2;
    if constexpr (kNorth<kMode>) {
      c.descend_slope(a_cos, a_sin, b_q2);
      s.descend_slope(a_cos, a_sin, b_q2);
    }
    if constexpr (kMode != kRadial) {
      c.descend(a_cos, b_q2, C);
      s.descend(a_cos, b_q2, S);
    }
    if constexpr (kDown<kMode>) {
      radial_c.descend(a_cos, b_q2, (n + 1.0) * C);
      radial_s.descend(a_cos, b_q2, (n + 1.0) * S);
    }
  }

  Chain<Value> c, s;                // of the terms C and S
  Chain<Value> radial_c, radial_s;  // of the terms (n + 1) C and (n + 1) S
};

template <Mode kMode>
void store(const DegreeSums<kMode, double>& of, int32_t m, const Sums& sums) {
  if constexpr (kMode == kGravity) sums.dC[m] = of.c.y;
  if constexpr (kNorth<kMode>) sums.dC[m] = of.c.d;
  if constexpr (kNorth<kMode>) sums.C[m] = of.c.y;
  // The recurrence is linear: the terms -S give the negative of what S gives.
  if constexpr (kEast<kMode>) sums.lC[m] = -of.s.y;
  if constexpr (kDown<kMode>) sums.rC[m] = of.radial_c.y;
  if (m == 0) return;  // a sine term has no order 0
  if constexpr (kMode == kGravity) sums.dS[m] = of.s.y;
  if constexpr (kNorth<kMode>) sums.dS[m] = of.s.d;
  if constexpr (kNorth<kMode>) sums.S[m] = of.s.y;
  if constexpr (kEast<kMode>) sums.lS[m] = of.c.y;
  if constexpr (kDown<kMode>) sums.rS[m] = of.radial_s.y;
}

template <Mode kMode>
void sum_degrees(const Series& series, const Argument& at, const Sums& sums) {
  const int32_t N = series.N;
  int32_t m = 0;
  for (; m < N; m += 2) {
    DegreeSums<kMode, Pair> both(series, m);
    for (int32_t n = N - 1; n > m; --n) both.step(series, at, m, n);
    store(DegreeSums<kMode, double>(both, 1), m + 1, sums);
    DegreeSums<kMode, double> first(both, 0);
    first.step(series, at, m, m);  // the degree that only the first order of the pair has
    store(first, m, sums);
  }
  if (m == N) store(DegreeSums<kMode, double>(series, m), m, sums);
}

// Cosines and sines of the multiples of a longitude, in the two places of each row of rec_b that
// hold no constant: [m][m] and [m][m - 1].
void tabulate_multiples(double lon, int32_t N, double* const* rec_b) {
  const double c = std::cos(lon);
  rec_b[0][0] = 1;
  rec_b[1][1] = c;
  rec_b[1][0] = std::sin(lon);
  rec_b[2][2] = 2 * c * rec_b[1][1] - rec_b[0][0];
  rec_b[2][1] = 2 * c * rec_b[1][0];
  for (int32_t m = 3; m <= N; ++m) {
    rec_b[m][m] = 2 * c * rec_b[m - 1][m - 1] - rec_b[m - 2][m - 2];
    rec_b[m][m - 1] = 2 * c * rec_b[m - 1][m - 2] - rec_b[m - 2][m - 3];
  }
}

// The four sums over order, without their scales.
struct OrderSums {
  double A = 0;
  double B = 0;
  double L = 0;
  double R = 0;
};

template <Mode kMode>
OrderSums sum_orders(const Series& series, const Argument& at, const Sums& sums) {
  double zA = 0, zB = 0, zL = 0, zR = 0, e = 0;
  double a_sin = 0, a_cos = 0;  // of order m + 1; nothing stands above order N
  for (int32_t m = series.N; m >= 0; --m) {
    const double cos_m = series.rec_b[m][m];
    const double sin_m = m > 0 ? series.rec_b[m][m - 1] : 0;
    if constexpr (kNorth<kMode>) {
      e = a_sin * e + a_cos * zB;
      zB = a_sin * zB + (sums.S[m] * sin_m + sums.C[m] * cos_m);
    }
    if constexpr (kNorth<kMode> || kMode == kGravity) {
      zA = a_sin * zA + (sums.dC[m] * cos_m + sums.dS[m] * sin_m);
    }
    if constexpr (kEast<kMode>) {
      zL = a_sin * zL + (sums.lS[m] * sin_m + sums.lC[m] * cos_m) * m;
    }
    if constexpr (kDown<kMode>) zR = a_sin * zR + (sums.rS[m] * sin_m + sums.rC[m] * cos_m);
    a_sin = series.rec_a[m][m] * at.tsin;
    a_cos = series.rec_a[m][m] * at.tcos;
  }
  const double first = series.rec_a[0][0];
  return {zA * first, e * first, zL * first, zR * first};
}

}  // namespace

void TWhar_sum(int16_t mode, int32_t N, double radius, double** C, double** S, double** rec_a,
               double** rec_b, double* sum_dC, double* sum_dS, double* sum_lC, double* sum_lS,
               double* sum_rC, double* sum_rS, double* sum_C, double* sum_S, double* last_colat,
               double* last_radius, double* last_lon, double tolerance, double* saved_tcos,
               double* saved_tsin, double* saved_scale_theta, double* saved_scale_lambda,
               double* saved_scale_r, double a, double e, double gm, double gamma_equator,
               double gamma_pole, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = TW_SUCCESS;
  const Series series = {N, C, S, rec_a, rec_b};
  const Sums sums = {sum_dC, sum_dS, sum_lC, sum_lS, sum_rC, sum_rS, sum_C, sum_S};
  Argument at = {*saved_tcos, *saved_tsin, 0};
  double scale_theta = *saved_scale_theta;
  double scale_lambda = *saved_scale_lambda;
  double scale_r = *saved_scale_r;
  for (double* sum : {sum_dS, sum_lS, sum_rS, sum_S, sum_lC}) sum[0] = 0;

  for (int32_t i = 0; i < count; ++i) {
    const auto [x, y, z] = in[i];
    const double r = std::sqrt(y * y + x * x + z * z);
    double colat = std::acos(z / r);
    double lon = 0;
    if (colat < kAxisLimit) {
      colat = kAxisLimit;
    } else if (colat > kPi - kAxisLimit) {
      colat = kPi - kAxisLimit;
    } else {
      lon = std::atan2(y, x);
    }

    const bool same_place = radius * std::fabs(colat - *last_colat) <= tolerance &&
                            std::fabs(r - *last_radius) <= tolerance;
    if (!same_place) {
      *last_colat = colat;
      *last_radius = r;
      const double q = radius / r;
      const double sin_colat = std::sin(colat);
      at.q2 = q * q;
      at.tcos = q * std::cos(colat);
      at.tsin = q * sin_colat;
      scale_theta = at.q2;
      scale_lambda = at.q2 / sin_colat;
      scale_r = -at.q2;
      if (mode == kGravity) {
        const CoordinateTriple position = {x, y, z};
        CoordinateTriple place = {};
        double gamma = 0;
        TWstatus word = TW_SUCCESS;  // neither call can fail
        TWxyz_to_llh(a, e, 1, &position, &place, &word);
        TWnormal_grav(a, e, gamma_equator, gamma_pole, place.y, place.z, &gamma, &word);
        scale_theta = gm / (r * gamma);
      }
      *saved_tcos = at.tcos;
      *saved_tsin = at.tsin;
      *saved_scale_theta = scale_theta;
      *saved_scale_lambda = scale_lambda;
      *saved_scale_r = scale_r;
      switch (mode) {
        case kGradient:
          sum_degrees<kGradient>(series, at, sums);
          break;
        case kAlongTheta:
          sum_degrees<kAlongTheta>(series, at, sums);
          break;
        case kAlongLambda:
          sum_degrees<kAlongLambda>(series, at, sums);
          break;
        case kRadial:
          sum_degrees<kRadial>(series, at, sums);
          break;
        case kGravity:
          sum_degrees<kGravity>(series, at, sums);
          break;
        default:
          break;  // wanted: another mode keeps the cache and the sines up to date alone
      }
    }

    if (radius * std::fabs(lon - *last_lon) > tolerance) {
      *last_lon = lon;
      tabulate_multiples(lon, N, rec_b);
    }

    switch (mode) {
      case kGradient: {
        const OrderSums sum = sum_orders<kGradient>(series, at, sums);
        out[i] = {scale_theta * sum.A + scale_theta * sum.B, scale_lambda * sum.L, scale_r * sum.R};
        break;
      }
      case kAlongTheta: {
        const OrderSums sum = sum_orders<kAlongTheta>(series, at, sums);
        out[i].x = scale_theta * sum.A + scale_theta * sum.B;
        break;
      }
      case kAlongLambda:
        out[i].x = scale_lambda * sum_orders<kAlongLambda>(series, at, sums).L;
        break;
      case kRadial:
        out[i].x = scale_r * sum_orders<kRadial>(series, at, sums).R;
        break;
      case kGravity:
        out[i].x = scale_theta * sum_orders<kGravity>(series, at, sums).A;
        break;
      default:
        break;
    }
  }
}
