// A model that many threads share gives what one gives alone.

#include "tidewater/magnetic_model.hpp"

#include <gtest/gtest.h>

#include <atomic>
#include <cstring>
#include <thread>
#include <vector>

namespace {

using namespace tidewater;

Point place(unsigned i) { return {-180 + 0.7 * (i % 500), -80 + 1.3 * (i % 120), 100}; }

TEST(MagneticModel, ThreadsThatShareItDoNotMeet) {
  const MagneticModel model("", 2026.5);
  constexpr unsigned kThreads = 4;
  constexpr unsigned kEach = 4000;
  std::vector<MagneticValue> alone;
  for (unsigned i = 0; i < kThreads * kEach; ++i) alone.push_back(model.field(place(i)));
  std::atomic<unsigned> wrong{0};
  std::vector<std::thread> threads;
  for (unsigned t = 0; t < kThreads; ++t) {
    threads.emplace_back([&, t] {
      for (unsigned i = t * kEach; i < (t + 1) * kEach; ++i) {
        const MagneticValue value = model.field(place(i));
        if (std::memcmp(&value, &alone[i], sizeof value) != 0) ++wrong;
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrong, 0u);
}

}  // namespace
