#include <atomic>
#include <cstdlib>
#include <cstring>

#include "points/over_points.hpp"

namespace tidewater::points {

namespace {

// Asks the processor, and through it the system, which registers may be used.
bool has(Level wanted) {
  switch (wanted) {
    case Level::one_by_one:
#if defined(TIDEWATER_BASELINE_LANES)
    case Level::baseline:
#endif
      return true;
#if defined(TIDEWATER_WIDE_LANES)
    case Level::avx2:
      return __builtin_cpu_supports("avx2");
    case Level::avx512:
      return __builtin_cpu_supports("avx2") && __builtin_cpu_supports("avx512f") &&
             __builtin_cpu_supports("avx512dq") && __builtin_cpu_supports("avx512vl") &&
             __builtin_cpu_supports("avx512bw");
#endif
    default:
      return false;
  }
}

constexpr const char* kNames[kLevels] = {"one_by_one", "baseline", "avx2", "avx512"};

Level widest() {
#if defined(TIDEWATER_WIDE_LANES)
  __builtin_cpu_init();
#endif
  int most = kLevels - 1;
  if (const char* asked = std::getenv("TIDEWATER_LEVEL")) {
    for (int i = 0; i < kLevels; ++i) {
      if (std::strcmp(asked, kNames[i]) == 0) most = i;
    }
  }
  while (!has(static_cast<Level>(most))) --most;
  return static_cast<Level>(most);
}

// Set while the library is loaded; before that it says one by one, which is right too.
std::atomic<Level> chosen{Level::one_by_one};
[[maybe_unused]] const bool looked = (chosen.store(widest()), true);

}  // namespace

Level level() noexcept { return chosen.load(std::memory_order_relaxed); }

bool ask_for_level(Level wanted) noexcept {
  if (!has(wanted)) return false;
  chosen.store(wanted, std::memory_order_relaxed);
  return true;
}

}  // namespace tidewater::points
