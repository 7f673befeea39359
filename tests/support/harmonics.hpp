// Triangular arrays, the caller's side of a harmonic synthesis, and a summation by explicit
// Legendre functions to hold it against.
#pragma once

#include <cmath>
#include <cstdint>
#include <random>
#include <vector>

#include "support/points.hpp"
#include "tidewater/magnetic.h"

namespace tidewater::test {

// A triangular array over a block of exactly its size.
class Triangle {
 public:
  explicit Triangle(int32_t degree, double value = 0) : degree_(degree) {
    const auto rows = static_cast<std::size_t>(degree) + 1;
    block_.assign(rows * (rows + 1) / 2, value);
    for (std::size_t n = 0; n < rows; ++n) rows_.push_back(block_.data() + n * (n + 1) / 2);
  }
  // A move takes the block along, and the rows keep pointing into it.
  Triangle(Triangle&&) = default;
  Triangle& operator=(Triangle&&) = default;

  int32_t degree() const { return degree_; }
  double** rows() { return rows_.data(); }
  double operator()(int32_t n, int32_t m) const { return at(n)[m]; }
  double& operator()(int32_t n, int32_t m) { return at(n)[m]; }
  const std::vector<double>& block() const { return block_; }

 private:
  double* at(int32_t n) const { return rows_[static_cast<std::size_t>(n)]; }

  int32_t degree_;
  std::vector<double> block_;
  std::vector<double*> rows_;
};

// Cosine and sine coefficients.
struct Coefficients {
  explicit Coefficients(int32_t degree) : C(degree), S(degree) {}

  // Random ones that fall off with the degree, from a degree on.
  static void fill(Coefficients& c, unsigned seed, int32_t lowest = 0) {
    std::mt19937 random(seed);
    std::uniform_real_distribution<double> any(-1, 1);
    for (int32_t n = lowest; n <= c.C.degree(); ++n) {
      for (int32_t m = 0; m <= n; ++m) {
        c.C(n, m) = 30000 * any(random) / std::pow(2, n);
        c.S(n, m) = m == 0 ? 0 : 30000 * any(random) / std::pow(2, n);
      }
    }
  }

  Triangle C;
  Triangle S;
};

// The work arrays and remembered values of one series.
struct SynthesisCache {
  explicit SynthesisCache(int32_t degree, double value = kUntouched) {
    for (auto* sum : {&dC, &dS, &lC, &lS, &rC, &rS, &C, &S}) {
      sum->assign(static_cast<std::size_t>(degree) + 1, value);
    }
  }

  std::vector<double> dC, dS, lC, lS, rC, rS, C, S;
  double last_colat = 1e30, last_radius = 1e30;
  double tcos = kUntouched, tsin = kUntouched;
  double scale_theta = kUntouched, scale_lambda = kUntouched, scale_r = kUntouched;
};

// All that a caller of TWhar_sum() holds but the coefficients.
struct Synthesis {
  explicit Synthesis(int32_t degree, double reference_radius = 6371200)
      : N(degree), radius(reference_radius), rec_a(degree), rec_b(degree), cache(degree) {
    TWstatus status = 0;
    TWhar_recur_c(N, rec_a.rows(), rec_b.rows(), &status);
  }

  TWstatus sum(int16_t mode, Coefficients& c, int32_t count, const CoordinateTriple* in,
               CoordinateTriple* out) {
    TWstatus status = 0;
    TWhar_sum(mode, N, radius, c.C.rows(), c.S.rows(), rec_a.rows(), rec_b.rows(), cache.dC.data(),
              cache.dS.data(), cache.lC.data(), cache.lS.data(), cache.rC.data(), cache.rS.data(),
              cache.C.data(), cache.S.data(), &cache.last_colat, &cache.last_radius, &last_lon,
              tolerance, &cache.tcos, &cache.tsin, &cache.scale_theta, &cache.scale_lambda,
              &cache.scale_r, a, e, gm, gamma_equator, gamma_pole, count, in, out, &status);
    return status;
  }

  CoordinateTriple at(int16_t mode, Coefficients& c, const CoordinateTriple& point) {
    CoordinateTriple out = kUntouchedPoint;
    EXPECT_EQ(sum(mode, c, 1, &point, &out), TW_SUCCESS);
    return out;
  }

  int32_t N;
  double radius;
  Triangle rec_a, rec_b;
  SynthesisCache cache;
  double last_lon = 1e30;
  double tolerance = 0;
  double a = 6378137, e = 0.0818191908426215;
  double gm = 3986004.418e8, gamma_equator = 9.7803253359, gamma_pole = 9.8321849379;
};

// The fully normalised associated Legendre function of sin^m theta and an explicit polynomial in
// cos theta (Heiskanen and Moritz 1967, eq. 1-62, 1-77), and its derivative by theta.  No
// recurrence is used; long double keeps the figures of the alternating sum to degree 13.
struct Legendre {
  Legendre(int n, int m, double theta) {
    const auto factorial = [](int k) { return std::tgamma(static_cast<long double>(k) + 1); };
    const long double t = std::cos(static_cast<long double>(theta));
    const long double s = std::sin(static_cast<long double>(theta));
    long double q = 0;
    long double slope = 0;
    for (int k = 0; 2 * k <= n - m; ++k) {
      const int power = n - m - 2 * k;
      const long double factor = (k % 2 ? -1 : 1) * factorial(2 * n - 2 * k) /
                                 (factorial(k) * factorial(n - k) * factorial(power));
      q += factor * std::pow(t, power);
      if (power > 0) slope += factor * power * std::pow(t, power - 1);
    }
    const long double norm =
        std::sqrt((m == 0 ? 1 : 2) * (2 * n + 1) * factorial(n - m) / factorial(n + m)) /
        std::pow(2.0L, n);
    p = static_cast<double>(norm * std::pow(s, m) * q);
    dp = static_cast<double>(
        norm * ((m > 0 ? m * t * std::pow(s, m - 1) * q : 0) - std::pow(s, m + 1) * slope));
    p_over_sin = static_cast<double>(m > 0 ? norm * std::pow(s, m - 1) * q : 0);
  }

  double p = 0;
  double dp = 0;
  double p_over_sin = 0;  // for m > 0
};

struct DirectSum {
  CoordinateTriple gradient = {0, 0, 0};  // north, east, down
  double value = 0;                       // sum of q^n (C cos + S sin) P
};

// The series at a geocentric colatitude, longitude and radius, term by term.
inline DirectSum direct_sum(const Coefficients& c, double q, double theta, double lon) {
  DirectSum sum;
  for (int32_t n = 0; n <= c.C.degree(); ++n) {
    for (int32_t m = 0; m <= n; ++m) {
      const Legendre legendre(n, m, theta);
      const double qn = std::pow(q, n);
      const double along = c.C(n, m) * std::cos(m * lon) + c.S(n, m) * std::sin(m * lon);
      const double across = c.C(n, m) * std::sin(m * lon) - c.S(n, m) * std::cos(m * lon);
      sum.value += qn * along * legendre.p;
      sum.gradient.x += qn * q * q * along * legendre.dp;
      sum.gradient.y += qn * q * q * m * across * legendre.p_over_sin;
      sum.gradient.z -= qn * q * q * (n + 1) * along * legendre.p;
    }
  }
  return sum;
}

}  // namespace tidewater::test
