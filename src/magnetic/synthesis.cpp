// The synthesis with the caller's caches: what of the last point serves the next, and what a caller
// finds in its arrays afterwards.

#include <algorithm>
#include <cmath>
#include <initializer_list>

#include "magnetic/synthesis_points.hpp"
#include "tidewater/ellipsoid.h"
#include "tidewater/geocentric.h"
#include "tidewater/harmonic_synthesis.h"

namespace tidewater::detail {

namespace {

// The caller's work arrays: one value for each order.
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
void sum_degrees(const HarmonicSeries& series, const Argument<double>& at, const Sums& sums) {
  const int32_t N = series.N;
  const Argument<Orders> both_at = {at.tcos, at.tsin, at.q2};
  int32_t m = 0;
  for (; m < N; m += 2) {
    DegreeSums<kMode, Orders> both(series, m);
    for (int32_t n = N - 1; n > m; --n) both.step(series, both_at, m, n);
    store(DegreeSums<kMode, double>(both, 1), m + 1, sums);
    DegreeSums<kMode, double> first(both, 0);
    first.step(series, at, m, m);  // the degree that only the first order of the pair has
    store(first, m, sums);
  }
  if (m == N) store(DegreeSums<kMode, double>(series, m), m, sums);
}

void sum_degrees(int16_t mode, const HarmonicSeries& series, const Argument<double>& at,
                 const Sums& sums) {
  switch (mode) {
    case kGradient:
      return sum_degrees<kGradient>(series, at, sums);
    case kAlongTheta:
      return sum_degrees<kAlongTheta>(series, at, sums);
    case kAlongLambda:
      return sum_degrees<kAlongLambda>(series, at, sums);
    case kRadial:
      return sum_degrees<kRadial>(series, at, sums);
    case kGravity:
      return sum_degrees<kGravity>(series, at, sums);
    default:
      return;  // By contract: another mode keeps the cache and the sines up to date alone.
  }
}

// Cosines and sines of the multiples of a longitude, in the two places of each row of rec_b that
// hold no constant: [m][m] and [m][m - 1].
void tabulate_multiples(double lon, int32_t N, double* const* rec_b) {
  const auto [s, c] = sincos(lon);
  rec_b[0][0] = 1;
  rec_b[1][1] = c;
  rec_b[1][0] = s;
  rec_b[2][2] = 2 * c * rec_b[1][1] - rec_b[0][0];
  rec_b[2][1] = 2 * c * rec_b[1][0];
  for (int32_t m = 3; m <= N; ++m) {
    rec_b[m][m] = 2 * c * rec_b[m - 1][m - 1] - rec_b[m - 2][m - 2];
    rec_b[m][m - 1] = 2 * c * rec_b[m - 1][m - 2] - rec_b[m - 2][m - 3];
  }
}

template <Mode kMode>
OrderSums<double> sum_orders(const HarmonicSeries& series, const Argument<double>& at,
                             const Sums& sums) {
  OrderChain<kMode, double> chain;
  for (int32_t m = series.N; m >= 0; --m) {
    const double cos_m = series.rec_b[m][m];
    const double sin_m = m > 0 ? series.rec_b[m][m - 1] : 0;
    Weights<double> w;
    if constexpr (kNorth<kMode>) w.B = sums.S[m] * sin_m + sums.C[m] * cos_m;
    if constexpr (kNorth<kMode> || kMode == kGravity) {
      w.A = sums.dC[m] * cos_m + sums.dS[m] * sin_m;
    }
    if constexpr (kEast<kMode>) w.L = (sums.lS[m] * sin_m + sums.lC[m] * cos_m) * m;
    if constexpr (kDown<kMode>) w.R = sums.rS[m] * sin_m + sums.rC[m] * cos_m;
    chain.descend(w, series.rec_a[m][m], at);
  }
  return chain.sums(series.rec_a[0][0]);
}

// The synthesis of one call, on the caller's caches.
class Synthesis {
 public:
  Synthesis(int16_t mode, const HarmonicSeries& series, double radius, double tolerance,
            const Sums& sums, double* last_colat, double* last_radius, double* last_lon,
            double* saved_tcos, double* saved_tsin, double* saved_scale_theta,
            double* saved_scale_lambda, double* saved_scale_r)
      : mode_(mode),
        series_(series),
        radius_(radius),
        tolerance_(tolerance),
        sums_(sums),
        last_colat_(last_colat),
        last_radius_(last_radius),
        last_lon_(last_lon),
        saved_tcos_(saved_tcos),
        saved_tsin_(saved_tsin),
        saved_scale_theta_(saved_scale_theta),
        saved_scale_lambda_(saved_scale_lambda),
        saved_scale_r_(saved_scale_r),
        at_{*saved_tcos, *saved_tsin, 0},
        scale_theta_(*saved_scale_theta),
        scale_lambda_(*saved_scale_lambda),
        scale_r_(*saved_scale_r) {}

  // What only the series over normal gravity needs.
  void set_gravity(double a, double e, double gm, double gamma_equator, double gamma_pole) {
    a_ = a;
    e_ = e;
    gm_ = gm;
    gamma_equator_ = gamma_equator;
    gamma_pole_ = gamma_pole;
  }

  // Point by point, each on what the last one left.
  void in_turn(int32_t count, const CoordinateTriple* in, CoordinateTriple* out) {
    for (int32_t i = 0; i < count; ++i) next(in[i], out[i]);
  }

  // Several points at once, with the figures that in_turn() gives.
  template <Mode kMode>
  void at_once(int32_t count, const CoordinateTriple* in, CoordinateTriple* out) {
    constexpr int32_t kChunk = 64;
    const HarmonicSums<kMode> sums = {series_, radius_};
    CoordinateTriple places[kChunk], results[kChunk];
    // By contract: until a point leaves the last call's place and meridian, that call's sums and
    // sines stand, whatever the coefficients are now.
    bool own_sums = false, own_sines = false;
    for (int32_t start = 0; start < count;) {
      const int32_t n = std::min(kChunk, count - start);
      over_points(SphericalPlace(), n, in + start, places);
      own_sums = own_sums || (same_place(places[0].x, places[0].z) ? fresh_sums<kMode>() : true);
      own_sines = own_sines || (has_turned(places[0].y) || fresh_sines());
      if (!own_sums || !own_sines) {
        const Steps steps = next(in[start], out[start]);
        own_sums |= steps.moved;
        own_sines |= steps.turned;
        ++start;
        continue;
      }
      double colat = *last_colat_, r = *last_radius_, lon = *last_lon_;
      int32_t moves = 0, turns = 0;
      for (int32_t i = 0; i < n; ++i) {
        // A point that has not left its predecessor's place or meridian is computed there.
        if (same_place(places[i].x, places[i].z)) {
          places[i].x = *last_colat_;
          places[i].z = *last_radius_;
        } else {
          *last_colat_ = places[i].x;
          *last_radius_ = places[i].z;
          ++moves;
        }
        if (has_turned(places[i].y)) {
          *last_lon_ = places[i].y;
          ++turns;
        } else {
          places[i].y = *last_lon_;
        }
      }
      if (level() < Level::avx2 && 2 * moves < n) {
        // Narrow registers gain less than the sums over degree that these points share.
        *last_colat_ = colat;
        *last_radius_ = r;
        *last_lon_ = lon;
        in_turn(n, in + start, out + start);
        start += n;
        continue;
      }
      over_points(sums, n, places, results);
      for (int32_t i = 0; i < n; ++i) {
        out[start + i].x = results[i].x;
        if constexpr (kMode == kGradient) out[start + i] = results[i];
      }
      start += n;
      // The caches are left as the last point leaves them, where one may look at them.
      const bool looked_at = start >= count || level() < Level::avx2;
      moved_ |= moves > 0;
      turned_ |= turns > 0;
      if (looked_at && moved_) move_to(*last_colat_, *last_radius_, {});
      if (looked_at && turned_) turn_to(*last_lon_);
    }
  }

 private:
  struct Steps {
    bool moved, turned;
  };

  Steps next(const CoordinateTriple& in, CoordinateTriple& out) {
    const CoordinateTriple point = in;
    const auto place = SphericalPlace()(point.x, point.y, point.z);
    const Steps steps = {!same_place(place.x, place.z), has_turned(place.y)};
    if (steps.moved) move_to(place.x, place.z, point);
    if (steps.turned) turn_to(place.y);
    write(out);
    return steps;
  }

  bool same_place(double colat, double r) const {
    return radius_ * std::fabs(colat - *last_colat_) <= tolerance_ &&
           std::fabs(r - *last_radius_) <= tolerance_;
  }
  bool has_turned(double lon) const { return radius_ * std::fabs(lon - *last_lon_) > tolerance_; }

  // Whether the caller's sums are those that this call would make at the last place.
  template <Mode kMode>
  bool fresh_sums() const {
    constexpr int32_t kOrders = HarmonicSums<kMode>::kMostDegree + 1;
    double made[8][kOrders];
    const Sums own = {made[0], made[1], made[2], made[3], made[4], made[5], made[6], made[7]};
    const double q = radius_ / *last_radius_;
    const auto [sin_colat, cos_colat] = sincos(*last_colat_);
    const Argument<double> at = {q * cos_colat, q * sin_colat, q * q};
    sum_degrees<kMode>(series_, at, own);
    const auto agree = [&](const double* given, const double* fresh, int32_t first) {
      return std::equal(given + first, given + series_.N + 1, fresh + first);
    };
    bool same = at.tcos == *saved_tcos_ && at.tsin == *saved_tsin_;
    if constexpr (kNorth<kMode>) {
      same = same && agree(sums_.dC, own.dC, 0) && agree(sums_.dS, own.dS, 1) &&
             agree(sums_.C, own.C, 0) && agree(sums_.S, own.S, 1);
    }
    if constexpr (kEast<kMode>)
      same = same && agree(sums_.lC, own.lC, 1) && agree(sums_.lS, own.lS, 1);
    if constexpr (kDown<kMode>)
      same = same && agree(sums_.rC, own.rC, 0) && agree(sums_.rS, own.rS, 1);
    return same && scale_theta_ == at.q2 && scale_lambda_ == at.q2 / sin_colat &&
           scale_r_ == -at.q2;
  }

  // Whether the table of multiples is that of the last longitude.
  bool fresh_sines() const {
    const auto [s, c] = sincos(*last_lon_);
    double* const* const table = series_.rec_b;
    double cos_below = 1, sin_below = 0, cos_m = c, sin_m = s;
    if (table[0][0] != 1) return false;
    for (int32_t m = 1; m <= series_.N; ++m) {
      if (table[m][m] != cos_m || table[m][m - 1] != sin_m) return false;
      const double cos_next = 2 * c * cos_m - cos_below;
      const double sin_next = m == 1 ? 2 * c * sin_m : 2 * c * sin_m - sin_below;
      cos_below = cos_m;
      sin_below = sin_m;
      cos_m = cos_next;
      sin_m = sin_next;
    }
    return true;
  }

  void move_to(double colat, double r, const CoordinateTriple& position) {
    *last_colat_ = colat;
    *last_radius_ = r;
    const double q = radius_ / r;
    const auto [sin_colat, cos_colat] = sincos(colat);
    at_ = {q * cos_colat, q * sin_colat, q * q};
    scale_theta_ = at_.q2;
    scale_lambda_ = at_.q2 / sin_colat;
    scale_r_ = -at_.q2;
    if (mode_ == kGravity) {
      CoordinateTriple place = {};
      double gamma = 0;
      TWstatus word = TW_SUCCESS;  // neither call can fail
      TWxyz_to_llh(a_, e_, 1, &position, &place, &word);
      TWnormal_grav(a_, e_, gamma_equator_, gamma_pole_, place.y, place.z, &gamma, &word);
      scale_theta_ = gm_ / (r * gamma);
    }
    *saved_tcos_ = at_.tcos;
    *saved_tsin_ = at_.tsin;
    *saved_scale_theta_ = scale_theta_;
    *saved_scale_lambda_ = scale_lambda_;
    *saved_scale_r_ = scale_r_;
    sum_degrees(mode_, series_, at_, sums_);
  }

  void turn_to(double lon) {
    *last_lon_ = lon;
    tabulate_multiples(lon, series_.N, series_.rec_b);
  }

  void write(CoordinateTriple& out) const {
    switch (mode_) {
      case kGradient: {
        const auto sum = sum_orders<kGradient>(series_, at_, sums_);
        out = {scale_theta_ * sum.A + scale_theta_ * sum.B, scale_lambda_ * sum.L,
               scale_r_ * sum.R};
        break;
      }
      case kAlongTheta: {
        const auto sum = sum_orders<kAlongTheta>(series_, at_, sums_);
        out.x = scale_theta_ * sum.A + scale_theta_ * sum.B;
        break;
      }
      case kAlongLambda:
        out.x = scale_lambda_ * sum_orders<kAlongLambda>(series_, at_, sums_).L;
        break;
      case kRadial:
        out.x = scale_r_ * sum_orders<kRadial>(series_, at_, sums_).R;
        break;
      case kGravity:
        out.x = scale_theta_ * sum_orders<kGravity>(series_, at_, sums_).A;
        break;
      default:
        break;
    }
  }

  int16_t mode_;
  HarmonicSeries series_;
  double radius_, tolerance_;
  Sums sums_;
  double *last_colat_, *last_radius_, *last_lon_;
  double *saved_tcos_, *saved_tsin_, *saved_scale_theta_, *saved_scale_lambda_, *saved_scale_r_;
  Argument<double> at_;
  double scale_theta_, scale_lambda_, scale_r_;
  bool moved_ = false, turned_ = false;
  double a_ = 0, e_ = 0, gm_ = 0, gamma_equator_ = 0, gamma_pole_ = 0;
};

}  // namespace

}  // namespace tidewater::detail

using namespace tidewater::detail;

void TWhar_sum(int16_t mode, int32_t N, double radius, double** C, double** S, double** rec_a,
               double** rec_b, double* sum_dC, double* sum_dS, double* sum_lC, double* sum_lS,
               double* sum_rC, double* sum_rS, double* sum_C, double* sum_S, double* last_colat,
               double* last_radius, double* last_lon, double tolerance, double* saved_tcos,
               double* saved_tsin, double* saved_scale_theta, double* saved_scale_lambda,
               double* saved_scale_r, double a, double e, double gm, double gamma_equator,
               double gamma_pole, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  *status = TW_SUCCESS;
  const HarmonicSeries series = {N, C, S, rec_a, rec_b};
  const Sums sums = {sum_dC, sum_dS, sum_lC, sum_lS, sum_rC, sum_rS, sum_C, sum_S};
  for (double* sum : {sum_dS, sum_lS, sum_rS, sum_S, sum_lC}) sum[0] = 0;
  Synthesis synthesis(mode, series, radius, tolerance, sums, last_colat, last_radius, last_lon,
                      saved_tcos, saved_tsin, saved_scale_theta, saved_scale_lambda, saved_scale_r);
  synthesis.set_gravity(a, e, gm, gamma_equator, gamma_pole);

  // Few points gain nothing from being computed at once; high degrees are not served.
  constexpr int32_t kWorthwhile = 16;
  if (level() != Level::one_by_one && count >= kWorthwhile && N >= 2 &&
      N <= HarmonicSums<kGradient>::kMostDegree) {
    switch (mode) {
      case kGradient:
        return synthesis.at_once<kGradient>(count, in, out);
      case kAlongTheta:
        return synthesis.at_once<kAlongTheta>(count, in, out);
      case kAlongLambda:
        return synthesis.at_once<kAlongLambda>(count, in, out);
      case kRadial:
        return synthesis.at_once<kRadial>(count, in, out);
      default:
        break;
    }
  }
  synthesis.in_turn(count, in, out);
}
