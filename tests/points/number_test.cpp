// The operations of the number at each width, at every place of a block.

#include "number_points.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <vector>

#include "support/little_memory.hpp"

using tidewater::points::ask_for_level;
using tidewater::points::Level;
using tidewater::points::level;
using tidewater::points::over_points;

namespace {

constexpr Level kAll[] = {Level::one_by_one, Level::baseline, Level::avx2, Level::avx512};
constexpr std::size_t kBlock = 16;  // the widest level's points

bool same(double a, double b) {
  return std::memcmp(&a, &b, sizeof a) == 0 || (std::isnan(a) && std::isnan(b));
}

struct Case {
  double a, b, first, second;  // what is asked for, and what is answered
};

// At each level, with each case at each place of a block.
template <class Kernel, std::size_t N>
void expect_at_every_width(const Kernel& kernel, const Case (&cases)[N]) {
  for (const Level level : kAll) {
    if (!ask_for_level(level)) continue;
    for (std::size_t shift = 0; shift < N; ++shift) {
      std::vector<CoordinateTriple> points(3 * kBlock);
      for (std::size_t i = 0; i < points.size(); ++i) {
        const Case& c = cases[(i + shift) % N];
        points[i] = {c.a, c.b, 0};
      }
      over_points(kernel, static_cast<int32_t>(points.size()), points.data(), points.data());
      for (std::size_t i = 0; i < points.size(); ++i) {
        const Case& c = cases[(i + shift) % N];
        ASSERT_TRUE(same(points[i].x, c.first) && same(points[i].y, c.second))
            << "level " << static_cast<int>(level) << ", point " << i << ": " << points[i].x << " "
            << points[i].y << " for " << c.a << " and " << c.b;
      }
    }
  }
  for (const Level level : kAll) ask_for_level(level);
}

TEST(Number, TheLesserAndTheGreaterAreTheSecondWhereNeitherIs) {
  const double inf = INFINITY, nan = NAN;
  // The second is answered of equal values, of two zeros and beside a not-a-number.
  const Case cases[] = {{1, 2, 1, 2},
                        {2, 1, 1, 2},
                        {-3, -2, -3, -2},
                        {-2, -3, -3, -2},
                        {-1, 1, -1, 1},
                        {5, 5, 5, 5},
                        {0.0, -0.0, -0.0, -0.0},
                        {-0.0, 0.0, 0.0, 0.0},
                        {0.0, 0.0, 0.0, 0.0},
                        {-0.0, -0.0, -0.0, -0.0},
                        {-0.0, 5e-324, -0.0, 5e-324},
                        {0.0, -5e-324, -5e-324, 0.0},
                        {1, std::nextafter(1, 2), 1, std::nextafter(1, 2)},
                        {inf, 1e308, 1e308, inf},
                        {-inf, inf, -inf, inf},
                        {nan, 1, 1, 1},
                        {1, nan, nan, nan},
                        {nan, -0.0, -0.0, -0.0},
                        {inf, nan, nan, nan},
                        {nan, -inf, -inf, -inf},
                        {nan, nan, nan, nan}};
  expect_at_every_width(tidewater::test::LesserAndGreater{}, cases);
}

TEST(Level, IsWhatWasAskedForWhereThereIsSuchAOne) {
  EXPECT_TRUE(ask_for_level(Level::one_by_one));
  EXPECT_EQ(level(), Level::one_by_one);
#if defined(TIDEWATER_BASELINE_LANES)
  EXPECT_TRUE(ask_for_level(Level::baseline));
#endif
  for (const Level wanted : kAll) {
    const Level before = level();
    const bool there = ask_for_level(wanted);
    EXPECT_EQ(level(), there ? wanted : before);
  }
}

#if defined(__unix__)
// In a process of its own, which looks at its environment when it starts.
TEST(Level, IsNarrowedByTheEnvironment) {
  TIDEWATER_NEED_NEW_PROCESS();
  const Level started = level();
  testing::FLAGS_gtest_death_test_style = "threadsafe";
  constexpr const char* kNames[] = {"one_by_one", "baseline", "avx2", "avx512", "of nothing"};
  constexpr int kOffset = 10;
  Level widest = Level::one_by_one;
  for (const Level wanted : kAll) {
    if (ask_for_level(wanted)) widest = wanted;
  }
  for (int i = 0; i < 5; ++i) {
    setenv("TIDEWATER_LEVEL", kNames[i], 1);
    // A level that is not there gives the widest below it; a name that is none, the widest of all.
    const int expected = std::min(i, static_cast<int>(widest));
    EXPECT_EXIT(std::_Exit(kOffset + static_cast<int>(started)),
                testing::ExitedWithCode(kOffset + expected), "")
        << kNames[i];
  }
  unsetenv("TIDEWATER_LEVEL");
}
#endif

}  // namespace
