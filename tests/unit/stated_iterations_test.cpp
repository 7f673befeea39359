// Where an iteration is replaced by a quicker road, or its passes are taken several points at once,
// results and words are those of the iteration as it is stated, written out here step by step.

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <random>

#include "support/points.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

struct Stated {
  double lon, lat;
  TWstatus status;
};

// --- Lambert: passes of the conformal latitude's fixed point ------------------------------------

Stated lambert(double e, double lon0, double C, double n, double rho0, const CoordinateTriple& p) {
  Stated s = {lon0, 0, TW_SUCCESS};
  const double rho = std::hypot(p.x, rho0 - p.y) * (n < 0 ? -1 : 1);
  const double theta = n > 0 ? std::atan2(p.x, rho0 - p.y) : std::atan2(-p.x, -(rho0 - p.y));
  s.lon = theta / n + lon0;
  const double w = std::pow(rho / C, 1 / n);
  s.lat = kPi / 2 - 2 * std::atan(w);
  double old = 0;
  int passes = 0;
  do {
    old = s.lat;
    const double es = e * std::sin(old);
    s.lat = kPi / 2 - 2 * std::atan(w * std::pow((1 - es) / (1 + es), e / 2));
    if (++passes == 15) {
      s.status = TW_I_LATITUDE_LIMITED;
      break;
    }
  } while (std::fabs(old - s.lat) > 1e-14);
  return s;
}

TEST(StatedIterations, LambertConformal) {
  for (const double e : {0.0, 0.01, kE, 0.0999, 0.1001, 0.3, 0.5}) {
    for (const double south : {1.0, -1.0}) {
      double C = 0, n = 0, rho0 = 0;
      TWstatus status = 0;
      TWlam_c(e, 0, south * 0.4, south * 0.5, south * 0.8, &C, &n, &rho0, &status);
      ASSERT_EQ(status, TW_SUCCESS);
      for (double lat = -1.5; lat < 1.51; lat += 0.1) {
        CoordinateTriple p = {0.7, lat, 0}, out = kUntouchedPoint;
        TWlam_f(e, 0.1, C, n, rho0, 1, &p, &p, &status);
        const Stated s = lambert(e, 0.1, C, n, rho0, p);
        TWlam_i(e, 0.1, C, n, rho0, 1, &out, &p, &status);
        EXPECT_EQ(status, s.status) << e << " " << lat;
        expect_near(out, s.lon, s.lat, 1e-14);
      }
    }
  }
}

// --- Albers: Newton's steps, watched steps, extrapolation ---------------------------------------

struct AlbersSteps {
  double e, Q, lat, delta = 0;
  int steps = 0;
  bool done = false, limited = false;

  void step() {
    const double s = std::sin(lat), c = std::cos(lat), W = 1 - e * e * (s * s);
    const double T = Q / (1 - e * e) - s / W + 0.5 / e * std::log((1 - e * s) / (1 + e * s));
    delta = T * (W * W) / (2 * c);
    lat += delta;
    if (lat > kPi / 2 || lat < -kPi / 2) {
      lat = lat > 0 ? kPi / 2 : -kPi / 2;
      limited = done = true;
    }
    ++steps;
  }

  void solve() {
    while (steps < 12) {
      step();
      if (std::fabs(delta) < 1e-13) return;
    }
    done = false;
    int stall = 0, since = 0;
    double last_ratio = 0.1, last_change = 1, last_delta = delta;
    double a = lat, b = lat, c = lat;
    while (steps < 30) {
      step();
      ++since;
      if (std::fabs(delta) < 1e-13) done = true;
      const double ratio = delta / last_delta, change = ratio - last_ratio;
      a = b;
      b = c;
      c = lat;
      const double sum = std::fabs(change) + std::fabs(last_change);
      if (std::fabs(ratio) > 0.4 && sum < 0.001 && since >= 3) {
        since = 0;
        lat = (c * a - b * b) / (c - 2 * b + a);
        delta = sum * delta * 1000.0;
        done = true;
      }
      const bool regular = std::fabs(ratio) <= 0.9 && ratio >= 0 && std::fabs(change) <= 1;
      if (!regular || done) {
        since = 0;
        if (std::fabs(delta / last_delta) < 1e-17) delta = last_delta;
        if (ratio < 0) done = true;
        const double tolerance = std::max(1.5 * std::fabs(delta), 4e-05);
        if (std::fabs(lat - kPi / 2) < tolerance) {
          lat = kPi / 2;
          break;
        }
        if (std::fabs(lat + kPi / 2) < tolerance) {
          lat = -kPi / 2;
          break;
        }
        if (++stall == 3 || done) break;
      }
      last_ratio = ratio;
      last_delta = delta;
      last_change = change;
    }
    if (steps == 30) limited = true;
  }
};

TEST(StatedIterations, Albers) {
  int held = 0, long_ones = 0;
  for (const double e : {0.001, 0.011, kE, 0.0999, 0.1001, 0.3, 0.7, 0.95}) {
    for (const double south : {1.0, -1.0}) {
      double n = 0, C = 0, rho0 = 0;
      TWalbers_c(e, 0, south * 0.4, south * 0.5, south * 0.9, &n, &C, &rho0);
      for (int k = 0; k < 400; ++k) {
        const double lat = k < 200 ? south * 0.0078 * (k - 10)
                                   : south * (kPi / 2 - std::pow(10, -0.05 * (k - 200)));
        CoordinateTriple p = {0.7, lat, 0}, out = kUntouchedPoint;
        TWstatus status = 0;
        TWalbers_f(e, 0.1, n, C, rho0, 1, &p, &p, &status);
        ASSERT_EQ(status, TW_SUCCESS);
        const double rho = std::hypot(p.x, rho0 - p.y) * south;
        AlbersSteps s = {e, (C - (rho * n) * (rho * n)) / n, 0};
        const double B = std::clamp(s.Q / 2, -1.0, 1.0);
        if (std::fabs(s.Q / 2) > 1.0000000000001) continue;
        s.lat = std::asin(B);
        s.limited = B != s.Q / 2;
        s.solve();
        held += s.limited;
        long_ones += s.steps > 12;
        TWalbers_i(e, 0.1, n, C, rho0, 1, &p, &out, &status);
        EXPECT_EQ(status, s.limited ? TW_I_LATITUDE_LIMITED : TW_SUCCESS) << e << " " << lat;
        // A step multiplies the rounding of its logarithm by 1 / 2e and divides that of its terms
        // by the cosine: a sine whose last digit differs comes to rest that far away.
        const double rounding = 1e-16 * (1 + 0.5 / e) / std::fabs(std::cos(s.lat));
        expect_near(out, 0.7, s.lat, 1e-13 + rounding);
      }
    }
  }
  // Both phases and the words were seen.
  EXPECT_GT(held, 10);
  EXPECT_GT(long_ones, 100);
}

// --- Polyconic: Newton's passes with two limits -------------------------------------------------

struct PolyconicStated : Stated {
  int passes = 0;
  bool far_at_three = false;  // pass 3 moved by more than 5, which is not looked at yet
};

PolyconicStated polyconic(double e, double lon0, double m0, double x, double y) {
  const double e2 = e * e, e4 = e2 * e2;
  const double f0 = 1 - ((e2 * 5 / 16 + 0.75) * e2 / 4 + 1) * e2 / 4;
  const double f2 = ((1.40625 * e2 + 3) * e2 / 4 + 3) * e2 / 8;
  const double f4 = (11.25 * e2 + 15) * e4 / 256;
  const double f6 = e2 * e4 * 0.011393229166666666, g6 = e2 * e4 * 0.068359375;
  PolyconicStated out = {{0, 0, TW_SUCCESS}};
  const double A = y + m0, B = x * x + A * A;
  double lat = A, C = 0;
  for (int pass = 0;; ++pass) {
    out.passes = pass;
    C = std::tan(lat) * std::sqrt(1 - std::sin(lat) * std::sin(lat) * e2);
    const double Ma =
        f0 * lat - f2 * std::sin(2 * lat) + f4 * std::sin(4 * lat) - f6 * std::sin(6 * lat);
    const double Mp =
        f0 - 2 * f2 * std::cos(2 * lat) + 4 * f4 * std::cos(4 * lat) - g6 * std::cos(6 * lat);
    const double V = Ma * Ma + B;
    const double numerator = (C * Ma + 1) * A - Ma - V * C * 0.5;
    const double denominator = (V - 2 * Ma * A) * std::sin(2 * lat) * e2 / (4 * C) +
                               (C * Mp - 2 / std::sin(2 * lat)) * (A - Ma) - Mp;
    out.lat = lat - numerator / denominator;
    const double change = std::fabs(out.lat - lat);
    if (change < 1e-9) break;
    if (pass == 3 && change > 5) out.far_at_three = true;
    if (pass > 3 && change > 5) {
      out.status = TW_DIVERGED;
      return out;
    }
    if (pass > 25) {
      out.status = TW_I_LATITUDE_LIMITED;
      break;
    }
    lat = out.lat;
  }
  out.lon =
      std::fabs(std::fabs(lat) - kPi / 2) < 1e-9 ? lon0 : std::asin(x * C) / std::sin(lat) + lon0;
  return out;
}

TEST(StatedIterations, Polyconic) {
  double m0 = 0;
  TWpolycon_c(kE, 0.5, &m0);
  std::mt19937 random(5);
  std::uniform_real_distribution<double> between(-3.2, 3.2);
  int settled = 0, diverged = 0, unlike = 0;
  for (int i = 0; i < 20000; ++i) {
    // Half of the points over the whole plane, where the passes may go anywhere.
    const double size = i % 2 ? 1.0 : 0.4;
    const CoordinateTriple p = {size * between(random), size * between(random), 0};
    const Stated s = polyconic(kE, 0.1, m0, p.x, p.y);
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWpolycon_i(kE, 0.1, m0, 1, &p, &out, &status);
    if (status == TW_DIVERGED) expect_untouched(out);
    const bool alike =
        status == s.status && (status == TW_DIVERGED || std::fabs(out.y - s.lat) < 1e-9);
    if (!alike) {
      ++unlike;
    } else {
      ++(status == TW_DIVERGED ? diverged : settled);
    }
  }
  EXPECT_GT(settled, 12000);
  EXPECT_GT(diverged, 5000);
  // Before it runs away or comes back from afar an iteration magnifies the last digits.
  EXPECT_LT(unlike, 40);
}

TEST(StatedIterations, PolyconicWhereRoundingDecidesNothing) {
  int far_and_well = 0, diverged = 0, more_than_twelve = 0;
  for (int i = 1; i < 160; ++i) {
    for (int j = 1; j < 120; ++j) {
      const double x = 0.05 * i, y = 0.031 * j;
      const PolyconicStated s = polyconic(kE, 0, 0, x, y);
      const PolyconicStated aside = polyconic(kE, 0, 0, x, y * (1 + 1e-12));
      if (aside.passes != s.passes || aside.status != s.status ||
          std::fabs(aside.lat - s.lat) > 1e-9) {
        continue;
      }
      const CoordinateTriple in = {x, y, 0};
      CoordinateTriple out = kUntouchedPoint;
      TWstatus status = 0;
      TWpolycon_i(kE, 0, 0, 1, &in, &out, &status);
      EXPECT_EQ(status, s.status) << x << " " << y;
      if (s.status == TW_DIVERGED) {
        expect_untouched(out);
        ++diverged;
        continue;
      }
      EXPECT_NEAR(out.y, s.lat, 1e-9) << x << " " << y;
      const bool neither = std::isnan(out.x) && std::isnan(s.lon);  // an arc sine of more than 1
      EXPECT_TRUE(neither || std::fabs(out.x - s.lon) < 1e-8) << x << " " << y;
      far_and_well += s.far_at_three;
      more_than_twelve += s.passes >= 12;
    }
  }
  EXPECT_GT(far_and_well, 0);
  EXPECT_GT(diverged, 0);
  EXPECT_GT(more_than_twelve, 0);
}

TEST(StatedIterations, PolyconicsLastPasses) {
  // Found by a search: starts that come to rest in the very last pass, and such as need one more.
  // They stand although the start is moved by 1e-12 of itself.
  struct Case {
    double e, x, y;
    TWstatus word;
  };
  for (const auto& [e, x, y, word] : {Case{kE, 1.234, 1.735, TW_SUCCESS},
                                      {kE, 1.844, 0.568, TW_SUCCESS},
                                      {kE, 1.940, 2.122, TW_SUCCESS},
                                      {0, 1.370, 2.665, TW_SUCCESS},
                                      {kE, 1.384, 3.607, TW_I_LATITUDE_LIMITED},
                                      {kE, 1.410, 0.145, TW_I_LATITUDE_LIMITED},
                                      {0, 1.414, 3.184, TW_I_LATITUDE_LIMITED},
                                      {0.3, 0.408, 3.013, TW_I_LATITUDE_LIMITED}}) {
    const PolyconicStated s = polyconic(e, 0.1, 0, x, y);
    EXPECT_EQ(s.passes, 26);
    EXPECT_EQ(s.status, word);
    const CoordinateTriple in = {x, y, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWpolycon_i(e, 0.1, 0, 1, &in, &out, &status);
    EXPECT_EQ(status, word) << x << " " << y;
    EXPECT_NEAR(out.y, s.lat, 1e-6) << x << " " << y;
  }
}

// --- Laborde: thirty passes, told by the count alone --------------------------------------------

TEST(StatedIterations, LabordeRefinement) {
  double A = 0, B = 0, C = 0, D = 0;
  TWstatus status = 0;
  TWlabor_c(0.33, &A, &B, &C, &D, &status);
  int in_vain = 0, refined = 0;
  for (double x = -3; x < 3; x += 0.037) {
    const CoordinateTriple p = {x, 0.4 * x + 0.1, 0};
    CoordinateTriple start = kUntouchedPoint, out = kUntouchedPoint;
    TWlabor_i(0, A, B, C, D, 1, &p, &start, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    double X = start.x, Y = start.y;
    int passes = 0;
    bool close = false;
    do {
      const double u = 3 * Y * Y * X - X * X * X, v = -3 * X * X * Y + Y * Y * Y;
      const double next_x = p.x - A * u - B * v, next_y = B * u + p.y - A * v;
      close = std::fabs(next_x - X) <= 1e-14 && std::fabs(next_y - Y) <= 1e-14;
      X = next_x;
      Y = next_y;
    } while (++passes < 30 && !close);
    TWlabor_i(1, A, B, C, D, 1, &p, &out, &status);
    EXPECT_EQ(status, passes == 30 ? TW_NOT_CONVERGED : TW_SUCCESS) << x;
    (passes == 30 ? in_vain : refined) += 1;
    if (passes < 30) expect_near(out, X, Y, 2e-14);
    if (passes == 30 && std::isfinite(X) && std::fabs(X) < 1e3) {
      EXPECT_NEAR(out.x, X, 1e-9 * std::fabs(X) + 1e-13);
    }
  }
  EXPECT_GT(in_vain, 10);
  EXPECT_GT(refined, 10);
}

// --- Bonne: the meridian's rounds ----------------------------------------------------------------

TEST(StatedIterations, BonneInverse) {
  for (const double e : {0.0, 0.01, kE, 0.0999, 0.2}) {
    double lat1 = 0.7, e2 = 0, c1 = 0, r0 = 0;
    TWstatus status = 0;
    TWbonne_c(e, &lat1, &e2, &c1, &r0, &status);
    ASSERT_EQ(status, TW_SUCCESS);
    for (double x = -1; x < 1; x += 0.13) {
      for (double y = -1; y < 0.7; y += 0.11) {
        const CoordinateTriple p = {x, y, 0};
        CoordinateTriple out = kUntouchedPoint;
        double lat = r0 - std::hypot(x, c1 - y);
        TWstatus word = TW_SUCCESS;
        if (e2 != 0) TWmerid_dist_i(1, e, lat, &lat, &word);
        TWbonne_i(0.1, lat1, e, e2, c1, r0, 1, &p, &out, &status);
        EXPECT_EQ(status, word);
        EXPECT_NEAR(out.y, lat, 1e-13);
        const double w = std::sqrt(1 - e2 * std::sin(lat) * std::sin(lat));
        EXPECT_NEAR(
            out.x,
            std::remainder(std::atan2(x, c1 - y) * std::hypot(x, c1 - y) * w / std::cos(lat),
                           2 * kPi) +
                0.1,
            2e-12 / std::cos(lat));
      }
    }
  }
}

}  // namespace
