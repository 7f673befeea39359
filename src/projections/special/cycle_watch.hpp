// Ends an iteration without a limit of passes that comes back to a value it has had before.
#pragma once

#include <cstdint>
#include <limits>

namespace tidewater::detail {

// Brent, An improved Monte Carlo factorization algorithm, BIT 20 (1980): a value is kept for twice
// as many passes each time, so that a cycle of any length is seen, and one that converges is not.
class CycleWatch {
 public:
  bool seen(double value) {
    if (value == kept_) return true;
    if (++passes_ == span_) {
      kept_ = value;
      passes_ = 0;
      span_ *= 2;
    }
    return false;
  }

 private:
  double kept_ = std::numeric_limits<double>::quiet_NaN();
  uint64_t passes_ = 0;
  uint64_t span_ = 1;
};

}  // namespace tidewater::detail
