// Every level gives the bits, the status and the untouched memory of one point at a time.

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <random>

#include "points/operations.hpp"
#include "points/over_points.hpp"

using namespace tidewater::test;
using tidewater::points::ask_for_level;
using tidewater::points::Level;

namespace {

constexpr double kSentinel = -7.25e77;
constexpr int kBlock = 16;  // the widest level's points
constexpr int kMost = 3 * kBlock + 1;

struct Result {
  std::vector<CoordinateTriple> points;
  TWstatus status;
};

Result run(const Operation& operation, const std::vector<CoordinateTriple>& in, bool in_place) {
  // One element more than asked for, which must stay.
  Result r = {std::vector<CoordinateTriple>(in.size() + 1, {kSentinel, kSentinel, kSentinel}), 0};
  const auto count = static_cast<int32_t>(in.size());
  if (in_place) {
    std::copy(in.begin(), in.end(), r.points.begin());
    operation.call(count, r.points.data(), r.points.data(), &r.status);
  } else {
    operation.call(count, in.data(), r.points.data(), &r.status);
  }
  return r;
}

bool same(double a, double b) {
  // A not-a-number's sign may differ between widths.
  return std::memcmp(&a, &b, sizeof a) == 0 || (std::isnan(a) && std::isnan(b));
}

class Input {
 public:
  Input(const Operation& operation, unsigned seed) : operation_(operation), random_(seed) {}

  CoordinateTriple ordinary() {
    const auto between = [&](double low, double high) {
      return low + (high - low) * std::uniform_real_distribution<double>(0, 1)(random_);
    };
    return {between(operation_.low.x, operation_.high.x),
            between(operation_.low.y, operation_.high.y),
            between(operation_.low.z, operation_.high.z)};
  }

  // With some element replaced by one of the values at which contracts turn.
  CoordinateTriple odd() {
    constexpr double kPi = 3.14159265358979323846, kHalf = kPi / 2;
    constexpr double kInf = std::numeric_limits<double>::infinity();
    static const double values[] = {0,
                                    -0.0,
                                    kHalf,
                                    -kHalf,
                                    std::nextafter(kHalf, 2),
                                    -std::nextafter(kHalf, 2),
                                    std::nextafter(kHalf, 1),
                                    kHalf - 1e-12,
                                    -kHalf + 1e-12,
                                    kHalf - 1e-9,
                                    1.6,
                                    -1.6,
                                    kPi,
                                    -kPi,
                                    std::nextafter(kPi, 4),
                                    2 * kPi,
                                    4,
                                    -7,
                                    25,
                                    1e-160,
                                    -3e-310,
                                    1e-13,
                                    1,
                                    -1,
                                    2,
                                    1e6,
                                    -1e10,
                                    1e300,
                                    kInf,
                                    -kInf,
                                    std::nan("")};
    CoordinateTriple p = ordinary();
    double* const elements[] = {&p.x, &p.y, &p.z};
    const auto pick = [&](std::size_t n) {
      return std::uniform_int_distribution<std::size_t>(0, n - 1)(random_);
    };
    *elements[pick(2)] = values[pick(std::size(values))];
    if (pick(3) == 0) *elements[pick(3)] = values[pick(std::size(values))];
    return p;
  }

  std::vector<CoordinateTriple> points(int count, int odd_percent) {
    std::vector<CoordinateTriple> all;
    for (int i = 0; i < count; ++i) {
      const bool is_odd = std::uniform_int_distribution<int>(0, 99)(random_) < odd_percent;
      all.push_back(is_odd ? odd() : ordinary());
    }
    return all;
  }

 private:
  const Operation& operation_;
  std::mt19937 random_;
};

class Widths : public testing::TestWithParam<Operation> {
 protected:
  void TearDown() override {
    for (const Level level : {Level::baseline, Level::avx2, Level::avx512}) ask_for_level(level);
  }

  void compare(const std::vector<CoordinateTriple>& in) {
    for (const bool in_place : {false, true}) {
      ASSERT_TRUE(ask_for_level(Level::one_by_one));
      const Result expected = run(GetParam(), in, in_place);
      for (const Level level : {Level::baseline, Level::avx2, Level::avx512}) {
        if (!ask_for_level(level)) continue;
        const Result got = run(GetParam(), in, in_place);
        ASSERT_EQ(got.status, expected.status) << "level " << static_cast<int>(level);
        for (std::size_t i = 0; i < got.points.size(); ++i) {
          const CoordinateTriple &g = got.points[i], &e = expected.points[i];
          ASSERT_TRUE(same(g.x, e.x) && same(g.y, e.y) && same(g.z, e.z))
              << "level " << static_cast<int>(level) << ", " << in.size() << " points, in place "
              << in_place << ", point " << i << std::hexfloat << ": " << g.x << " " << g.y << " "
              << g.z << " instead of " << e.x << " " << e.y << " " << e.z << " for "
              << (i < in.size() ? in[i].x : 0) << " " << (i < in.size() ? in[i].y : 0) << " "
              << (i < in.size() ? in[i].z : 0);
        }
      }
    }
  }
};

TEST_P(Widths, OrdinaryPointsOfEveryCount) {
  Input input(GetParam(), 1);
  for (int count = 0; count <= kMost; ++count) compare(input.points(count, 0));
  compare(input.points(500, 0));
}

TEST_P(Widths, OddPointsAtEveryPlaceOfABlock) {
  Input input(GetParam(), 2);
  for (int round = 0; round < 8; ++round) {
    for (int place = 0; place < 2 * kBlock + 3; ++place) {
      auto in = input.points(2 * kBlock + 3, 0);
      in[static_cast<std::size_t>(place)] = input.odd();
      compare(in);
    }
  }
}

TEST_P(Widths, ManyOddPoints) {
  Input input(GetParam(), 3);
  for (const int percent : {10, 40, 100}) {
    for (int count = 1; count <= kMost; ++count) compare(input.points(count, percent));
  }
}

// A test's name from a function's.
std::string name_of(const testing::TestParamInfo<Operation>& info) {
  std::string name;
  for (const char c : info.param.name)
    name += std::isalnum(static_cast<unsigned char>(c)) ? c : '_';
  return name;
}

INSTANTIATE_TEST_SUITE_P(All, Widths, testing::ValuesIn(operations()), name_of);

TEST(Levels, TheMachineSaysWhichItHas) {
  for (const auto& [level, name] :
       {std::pair{Level::one_by_one, "one by one"}, std::pair{Level::baseline, "baseline"},
        std::pair{Level::avx2, "AVX2"}, std::pair{Level::avx512, "AVX-512"}}) {
    std::printf("%-10s %s\n", name, ask_for_level(level) ? "tested" : "not on this machine");
  }
  EXPECT_TRUE(ask_for_level(Level::one_by_one));
}

}  // namespace
