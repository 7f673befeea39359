// Spherical-harmonic synthesis by Clenshaw's method in two stages: sums over degree for each order,
// then a sum over order.  No Legendre function is formed.

#include <cmath>
#include <initializer_list>

#include "foundation/numeric.hpp"
#include "tidewater/foundation.h"
#include "tidewater/magnetic.h"

using namespace tidewater;

namespace {

// A point this close to the axis is held off it, on the meridian of Greenwich.
constexpr double kAxisLimit = 1e-12;

enum Mode : int16_t { kGradient = 0, kAlongTheta = 1, kAlongLambda = 2, kRadial = 3, kGravity = 4 };

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

// y and its derivative d by theta at the last degree done and at the one above it, for kOrders
// orders.
template <int kOrders>
struct Chain {
  double y[kOrders] = {};
  double y_above[kOrders] = {};
  double d[kOrders] = {};
  double d_above[kOrders] = {};
};

// The sums over degree of kOrders neighbouring orders, m and up.  One pass serves all terms, so
// that constants and coefficients are read once, and the orders' chains overlap in the processor.
template <Mode kMode, int kOrders>
class DegreeSums {
 public:
  DegreeSums(const Series& series, const Argument& at, int32_t m)
      : series_(series), at_(at), m_(m) {
    int32_t n = series.N;
    for (; n >= m + kOrders - 1; --n) step<kOrders>(n);
    for (; n >= m; --n) step<1>(n);  // the lowest degree, which the first order alone has
  }

  void store(const Sums& sums) const {
    for (int j = 0; j < kOrders; ++j) {
      const int32_t m = m_ + j;
      if constexpr (kMode == kGravity) sums.dC[m] = c_.y[j];
      if constexpr (kSlope) sums.dC[m] = c_.d[j];
      if constexpr (kSlope) sums.C[m] = c_.y[j];
      // The recurrence is linear: that of the terms -S gives the negative of that of S.
      if constexpr (kAlong) sums.lC[m] = -s_.y[j];
      if constexpr (kOutward) sums.rC[m] = rc_.y[j];
      if (m == 0) continue;  // a sine term has no order 0
      if constexpr (kMode == kGravity) sums.dS[m] = s_.y[j];
      if constexpr (kSlope) sums.dS[m] = s_.d[j];
      if constexpr (kSlope) sums.S[m] = s_.y[j];
      if constexpr (kAlong) sums.lS[m] = c_.y[j];
      if constexpr (kOutward) sums.rS[m] = rs_.y[j];
    }
  }

 private:
  static constexpr bool kSlope = kMode == kGradient || kMode == kAlongTheta;
  static constexpr bool kAlong = kMode == kGradient || kMode == kAlongLambda;
  static constexpr bool kOutward = kMode == kGradient || kMode == kRadial;
  static constexpr bool kValue = kMode != kRadial;

  // Takes the first kLanes orders down to degree n.
  template <int kLanes>
  void step(int32_t n) {
    // Nothing stands above degree N, where y and d are zero.
    static constexpr double kNone[kOrders] = {};
    const double* a = n < series_.N ? series_.rec_a[n + 1] + m_ : kNone;
    const double* b = n < series_.N - 1 ? series_.rec_b[n + 2] + m_ : kNone;
    const double* C = series_.C[n] + m_;
    const double* S = series_.S[n] + m_;
    for (int j = 0; j < kLanes; ++j) {
      const double a_cos = a[j] * at_.tcos;
      const double a_sin = a[j] * at_.tsin;
      const double b_q2 = b[j] * at_.q2;
      if constexpr (kSlope) {
        descend_slope(c_, j, a_cos, a_sin, b_q2);
        descend_slope(s_, j, a_cos, a_sin, b_q2);
      }
      if constexpr (kValue) {
        descend(c_, j, a_cos, b_q2, C[j]);
        descend(s_, j, a_cos, b_q2, S[j]);
      }
      if constexpr (kOutward) {
        descend(rc_, j, a_cos, b_q2, (n + 1.0) * C[j]);
        descend(rs_, j, a_cos, b_q2, (n + 1.0) * S[j]);
      }
    }
  }

  using Chains = Chain<kOrders>;

  static void descend(Chains& chain, int j, double a_cos, double b_q2, double term) {
    const double y = a_cos * chain.y[j] + b_q2 * chain.y_above[j] + term;
    chain.y_above[j] = chain.y[j];
    chain.y[j] = y;
  }

  // Before descend(): the derivative needs y of the degree above.
  static void descend_slope(Chains& chain, int j, double a_cos, double a_sin, double b_q2) {
    const double d = a_cos * chain.d[j] + b_q2 * chain.d_above[j] - a_sin * chain.y[j];
    chain.d_above[j] = chain.d[j];
    chain.d[j] = d;
  }

  Series series_;
  Argument at_;
  int32_t m_;
  Chains c_, s_, rc_, rs_;
};

template <Mode kMode>
void sum_degrees(const Series& series, const Argument& at, const Sums& sums) {
  int32_t m = 0;
  for (; m < series.N; m += 2) DegreeSums<kMode, 2>(series, at, m).store(sums);
  if (m == series.N) DegreeSums<kMode, 1>(series, at, m).store(sums);
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
  constexpr bool kTheta = kMode == kGradient || kMode == kAlongTheta;
  constexpr bool kLambda = kMode == kGradient || kMode == kAlongLambda;
  constexpr bool kOutward = kMode == kGradient || kMode == kRadial;
  double zA = 0, zB = 0, zL = 0, zR = 0, e = 0;
  double a_sin = 0, a_cos = 0;  // of order m + 1; nothing stands above order N
  for (int32_t m = series.N; m >= 0; --m) {
    const double cos_m = series.rec_b[m][m];
    const double sin_m = m > 0 ? series.rec_b[m][m - 1] : 0;
    if constexpr (kTheta) {
      e = a_sin * e + a_cos * zB;
      zB = a_sin * zB + (sums.S[m] * sin_m + sums.C[m] * cos_m);
    }
    if constexpr (kTheta || kMode == kGravity) {
      zA = a_sin * zA + (sums.dC[m] * cos_m + sums.dS[m] * sin_m);
    }
    if constexpr (kLambda) {
      zL = a_sin * zL + (sums.lS[m] * sin_m + sums.lC[m] * cos_m) * m;
    }
    if constexpr (kOutward) zR = a_sin * zR + (sums.rS[m] * sin_m + sums.rC[m] * cos_m);
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
