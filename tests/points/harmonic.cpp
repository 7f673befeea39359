#include "points/operations.hpp"
#include "support/harmonics.hpp"

using namespace tidewater::test;

namespace {

constexpr double kRadius = 6371200;

// A synthesis of its own for each call, so that calls do not share caches.
Operation synthesis(const char* name, int16_t mode, double tolerance) {
  return {name,
          {-kRadius, -kRadius, -kRadius},
          {kRadius, kRadius, kRadius},
          [=](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            Coefficients coefficients(9);
            for (int32_t d = 0; d <= 9; ++d) {
              for (int32_t m = 0; m <= d; ++m) {
                coefficients.C(d, m) = 1e4 / (1 + d + 3 * m);
                coefficients.S(d, m) = m == 0 ? 0 : -2e3 / (2 + d * m);
              }
            }
            Synthesis caches(9, kRadius);
            caches.tolerance = tolerance;
            *status = caches.sum(mode, coefficients, n, in, out);
          }};
}

const Operations harmonic = {
    synthesis("TWhar_sum, gradient", 0, 0),    synthesis("TWhar_sum, gradient, tolerance", 0, 2e6),
    synthesis("TWhar_sum, along theta", 1, 0), synthesis("TWhar_sum, along lambda", 2, 0),
    synthesis("TWhar_sum, radial", 3, 0),      synthesis("TWhar_sum, gravity", 4, 0),
};

}  // namespace
