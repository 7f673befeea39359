#include <vector>

#include "points/operations.hpp"
#include "tidewater/magnetic.h"

using namespace tidewater::test;

namespace {

constexpr double kRadius = 6371200;
constexpr int32_t kDegree = 9;
constexpr std::size_t kRows = kDegree + 1;

// A triangular array and its rows.
struct Triangle {
  std::vector<double> block = std::vector<double>(kRows * (kRows + 1) / 2);
  std::vector<double*> rows;
  Triangle() {
    for (std::size_t n = 0; n < kRows; ++n) rows.push_back(block.data() + n * (n + 1) / 2);
  }
};

// Caches of its own for each call, so that calls do not meet each other's.
void sum(int16_t mode, double tolerance, int32_t n, const CoordinateTriple* in,
         CoordinateTriple* out, TWstatus* status) {
  Triangle C, S, a, b;
  for (std::size_t d = 0; d < kRows; ++d) {
    for (std::size_t m = 0; m <= d; ++m) {
      C.rows[d][m] = 1e4 / static_cast<double>(1 + d + 3 * m);
      S.rows[d][m] = m == 0 ? 0 : -2e3 / static_cast<double>(2 + d * m);
    }
  }
  TWhar_recur_c(kDegree, a.rows.data(), b.rows.data(), status);
  std::vector<double> sums[8];
  for (auto& s : sums) s.assign(kRows, 0);
  double last_colat = 1e30, last_radius = 1e30, last_lon = 1e30;
  double saved[5] = {};
  TWhar_sum(mode, kDegree, kRadius, C.rows.data(), S.rows.data(), a.rows.data(), b.rows.data(),
            sums[0].data(), sums[1].data(), sums[2].data(), sums[3].data(), sums[4].data(),
            sums[5].data(), sums[6].data(), sums[7].data(), &last_colat, &last_radius, &last_lon,
            tolerance, &saved[0], &saved[1], &saved[2], &saved[3], &saved[4], 6378137,
            0.0818191908426215, 3986004.418e8, 9.7803253359, 9.8321849379, n, in, out, status);
}

Operation synthesis(const char* name, int16_t mode, double tolerance) {
  return {name,
          {-kRadius, -kRadius, -kRadius},
          {kRadius, kRadius, kRadius},
          [=](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            sum(mode, tolerance, n, in, out, status);
          }};
}

const Operations harmonic = {
    synthesis("TWhar_sum, gradient", 0, 0),    synthesis("TWhar_sum, gradient, tolerance", 0, 2e6),
    synthesis("TWhar_sum, along theta", 1, 0), synthesis("TWhar_sum, along lambda", 2, 0),
    synthesis("TWhar_sum, radial", 3, 0),      synthesis("TWhar_sum, gravity", 4, 0),
};

}  // namespace
