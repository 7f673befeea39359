#include <gtest/gtest.h>

#include <functional>
#include <limits>

#include "support/little_memory.hpp"
#include "support/points.hpp"
#include "tidewater/datum.h"
#include "tidewater/lines.h"

#if defined(__linux__) && !defined(__SANITIZE_ADDRESS__)
#include <malloc.h>
#include <sys/resource.h>
#define TIDEWATER_CAN_STARVE
#endif

using namespace tidewater::test;

namespace {

// A transform whose deviation is told for each count, and which records what it is asked.  Its
// points zigzag by that much about a straight line.
struct Transform {
  std::function<double(int32_t count, int call)> deviation;
  std::function<TWstatus(int32_t count, int call)> word = {};
  std::vector<int32_t> counts = {};
  Points last = {};

  static void call(TWcontext context, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
    auto& self = *reinterpret_cast<Transform*>(context);  // NOLINT(performance-no-int-to-ptr)
    EXPECT_EQ(*status, TW_SUCCESS);
    self.counts.push_back(count);
    self.last.assign(in, in + count);
    const int calls = static_cast<int>(self.counts.size());
    const double d = self.deviation(count, calls);
    for (int32_t i = 0; i < count; ++i) out[i] = {static_cast<double>(i), i % 2 ? d : 0, 0};
    if (self.word && self.word(count, calls) != 0) *status = self.word(count, calls);
  }

  TWcontext context() { return reinterpret_cast<TWcontext>(this); }
};

struct Answer {
  int32_t count = -77;
  TWstatus status = 0;
};

constexpr CoordinateTriple kStart = {0.1, 0.5, 3};
constexpr CoordinateTriple kEnd = {0.2, 0.6, 4};

Answer ask(Transform& transform, double tolerance, int kind = 0) {
  Answer r;
  TWtoler_to_cnt(Transform::call, transform.context(), kStart, kEnd, 6378137, 0.0818, tolerance,
                 static_cast<int16_t>(kind), &r.count, &r.status);
  return r;
}

// The deviation of a parabola from its chords.
double parabola(int32_t count, int) { return 1 / std::pow(count - 1, 2); }

using Counts = std::vector<int32_t>;

TEST(ToleranceCount, AStraightImageNeedsTwo) {
  Transform straight = {[](int32_t, int) { return 0.0; }};
  for (const double tolerance : {1e-300, 1.0, kInfinity}) {
    straight.counts.clear();
    const auto r = ask(straight, tolerance);
    EXPECT_EQ(r.status, TW_SUCCESS);
    EXPECT_EQ(r.count, 2);
    EXPECT_EQ(straight.counts, (Counts{3, 5}));
  }
}

TEST(ToleranceCount, BadArguments) {
  Transform straight = {[](int32_t, int) { return 0.0; }};
  for (const double zero : {0.0, -0.0}) {
    for (const int kind : {0, 1, 2}) {
      const auto r = ask(straight, zero, kind);
      EXPECT_EQ(r.status, TW_BAD_TOLERANCE);
      EXPECT_EQ(r.count, -77);
    }
  }
  for (const int kind : {-1, 2, 256}) {
    const auto r = ask(straight, 1, kind);
    EXPECT_EQ(r.status, TW_BAD_INPUT);
    EXPECT_EQ(r.count, -77);
  }
  EXPECT_TRUE(straight.counts.empty());
}

TEST(ToleranceCount, SecantSearchByHand) {
  // D(c) = 1 / (c - 1)^2: 11 points are the first within 0.011.
  Transform transform = {parabola};
  auto r = ask(transform, 0.011);
  EXPECT_EQ(r.status, TW_SUCCESS);
  // 17 - 4.85; 12 - 3.14, held at 9; 9 + 1.88; 10 + 0.41 is 10 again, so one more.
  EXPECT_EQ(transform.counts, (Counts{3, 5, 9, 17, 12, 9, 10, 11}));
  EXPECT_EQ(r.count, (11 + 2) / 2);

  transform.counts.clear();
  r = ask(transform, 0.1);
  EXPECT_EQ(transform.counts, (Counts{3, 5, 4}));  // 5 - 0.4
  EXPECT_EQ(r.count, (5 + 2) / 2);

  transform.counts.clear();
  r = ask(transform, 0.12);
  EXPECT_EQ(transform.counts, (Counts{3, 5, 4, 3}));  // 5 - 0.61; 4 - 0.18
  EXPECT_EQ(r.count, (4 + 2) / 2);
}

TEST(ToleranceCount, ThreePointsNeverEndTheDoubling) {
  // Within the tolerance at 3, beyond at 5, within at 9.
  Transform transform = {[](int32_t count, int) { return count == 5 ? 2.0 : 0.5; }};
  const auto r = ask(transform, 1);
  EXPECT_EQ(r.status, TW_SUCCESS);
  ASSERT_GE(transform.counts.size(), 4u);
  EXPECT_EQ((Counts{transform.counts.begin(), transform.counts.begin() + 3}), (Counts{3, 5, 9}));
  // 9 - (0.5 - 1) 4 / (0.5 - 2) = 7.67
  EXPECT_EQ(transform.counts[3], 7);
}

TEST(ToleranceCount, APairAtTheToleranceDoesNotStop) {
  // Both at or above: the search goes on; one above, one below: it stops.  At exactly the tolerance
  // on both sides it runs out of passes.
  Transform transform = {[](int32_t count, int) { return count == 3 ? 2.0 : 1.0; }};
  const auto r = ask(transform, 1);
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_EQ(transform.counts.size(), 2u + 100u);
  EXPECT_EQ(r.count, 5 / 2);
  for (const int32_t c : transform.counts) {
    EXPECT_GE(c, 3);
    EXPECT_LE(c, 5);
  }
}

TEST(ToleranceCount, RunningOutOfPasses) {
  // After the doubling nothing ever deviates: no pair lies on both sides.
  Transform transform = {[](int32_t, int call) { return call < 3 ? 2.0 : 0.0; }};
  const auto r = ask(transform, 1);
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_EQ(transform.counts.size(), 3u + 100u);
  EXPECT_EQ(r.count, 9 / 2);
  // The end found in the hundredth pass still counts as running out.
  Transform late = {[](int32_t, int call) { return call < 3 || call >= 3 + 100 ? 2.0 : 0.0; }};
  EXPECT_EQ(ask(late, 1).count, 9 / 2);
  EXPECT_EQ(late.counts.size(), 3u + 100u);
}

TEST(ToleranceCount, AToleranceThatIsNotANumberEnds) {
  Transform transform = {parabola};
  const auto r = ask(transform, kNaN);
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_LE(transform.counts.size(), 102u);
}

TEST(ToleranceCount, TheTransformsWord) {
  // At the end of the doubling anything but success ends the search, an information word too.
  for (const TWstatus word : {TW_BAD_LATITUDE, TW_I_LATITUDE_LIMITED}) {
    Transform always = {parabola, [=](int32_t, int) { return word; }};
    const auto r = ask(always, 0.011);
    EXPECT_EQ(r.status, word);
    EXPECT_EQ(r.count, 3);
    EXPECT_EQ(always.counts, (Counts{3, 5, 9, 17}));
  }
  // An earlier trial's word is gone with the next trial.
  Transform early = {parabola,
                     [](int32_t count, int) { return count < 17 ? TW_BAD_LATITUDE : TWstatus{0}; }};
  auto r = ask(early, 0.011);
  EXPECT_EQ(r.status, TW_BAD_LATITUDE);  // 12, 9, 10, 11 come after 17
  EXPECT_EQ(r.count, 6);
  Transform passing = {parabola, [](int32_t, int call) {
                         return call == 1 || call == 6 ? TW_BAD_LATITUDE : TWstatus{0};
                       }};
  r = ask(passing, 0.011);
  EXPECT_EQ(r.status, TW_SUCCESS);
  EXPECT_EQ(r.count, 6);
}

TEST(ToleranceCount, ThePointsAreThoseOfTheLine) {
  for (const int kind : {0, 1}) {
    Transform straight = {[](int32_t, int) { return 0.0; }};
    ask(straight, 1, kind);
    const auto inverse = kind == 0 ? TWgeodesic_inv : TWrhmbline_inv;
    const auto direct = kind == 0 ? TWgeodesic_dir : TWrhmbline_dir;
    double azimuth = 0, back = 0, distance = 0;
    TWstatus status = 0;
    inverse(kStart, kEnd, 6378137, 0.0818, &azimuth, &back, &distance, &status);
    ASSERT_EQ(straight.last.size(), 5u);
    for (int i = 0; i < 5; ++i) {
      CoordinateTriple p = {};
      direct(kStart, azimuth, i * (distance / 4), 6378137, 0.0818, &p, &back, &status);
      const auto& got = straight.last[static_cast<std::size_t>(i)];
      expect_near(got, p.x, p.y, 1e-15);
      EXPECT_EQ(got.z, kStart.z);  // the last point's too
    }
  }
}

#ifdef TIDEWATER_CAN_STARVE

void limit_memory(rlim_t bytes) {
  mallopt(M_MMAP_THRESHOLD, 1 << 16);  // large blocks go back at once
  const rlimit limit = {bytes, RLIM_INFINITY};
  setrlimit(RLIMIT_AS, &limit);
}

// Exit codes of the starving processes.
int code_of(const Answer& r) {
  if (r.status != TW_NO_MEMORY) return 200;
  return r.count >= 0 && r.count < 200 ? r.count : 201;
}

TEST(ToleranceCountDeathTest, DoublingEndsWithTheMemory) {
  TIDEWATER_NEED_MEMORY_LIMIT();
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_EXIT(
      {
        // No count meets a negative tolerance.
        Transform starving = {[](int32_t count, int) {
          if (count == 4097) limit_memory(1);
          return 1.0;
        }};
        std::exit(code_of(ask(starving, -1)));
      },
      testing::ExitedWithCode(3), "");
}

TEST(ToleranceCountDeathTest, TheSecantSearchNeedsItsOwnMemory) {
  TIDEWATER_NEED_MEMORY_LIMIT();
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_EXIT(
      {
        // The doubling ends at 8193 points, whose arrays are then given back.
        int32_t last = 0;
        Transform starving = {[&](int32_t count, int) {
          last = count;
          if (count == 8193) limit_memory(1);
          return count == 8193 ? 0.5 : 2.0;
        }};
        mallopt(M_MMAP_THRESHOLD, 1 << 16);
        const auto r = ask(starving, 1);
        std::exit(r.status == TW_NO_MEMORY && last == 8193 && r.count == (8193 + 2) / 2 ? 0 : 1);
      },
      testing::ExitedWithCode(0), "");
}

#endif

}  // namespace
