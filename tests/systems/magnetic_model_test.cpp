// The model as an object: published values, arrays, points that fail, refusals.
#include "tidewater/magnetic_model.hpp"

#include <gtest/gtest.h>

#include <atomic>
#include <cmath>
#include <cstring>
#include <string>
#include <thread>
#include <vector>

#include "support/magnetic_values.hpp"

namespace tidewater::test {

namespace {

TEST(MagneticModelObject, PublishedTestValues) {
  for (const PublishedField& row : kWmm2025Values) {
    const MagneticModel model("WMM2025", row.date);
    EXPECT_EQ(model.name(), "WMM2025");
    EXPECT_EQ(model.year(), row.date);
    const MagneticField field = model.field({row.lon, row.lat, 0}).field;
    EXPECT_NEAR(field.north, row.X, 0.0501);
    EXPECT_NEAR(field.east, row.Y, 0.0501);
    EXPECT_NEAR(field.down, row.Z, 0.0501);
    EXPECT_NEAR(field.total, row.F, 0.0501);
    EXPECT_NEAR(field.inclination, row.I, 0.00501);
    EXPECT_NEAR(field.declination, row.D, 0.00501);
    EXPECT_NEAR(field.horizontal, std::hypot(row.X, row.Y), 0.1);
  }
}

TEST(MagneticModelObject, ArraysAreItsPointsAndFailuresStandAlone) {
  const MagneticModel model("", 2026.5);
  constexpr std::size_t kCount = 1000;
  std::vector<double> points;  // x y z x y z ...
  for (std::size_t i = 0; i < kCount; ++i) {
    const double t = static_cast<double>(i);
    points.insert(points.end(),
                  {std::fmod(7 * t, 360) - 180, std::fmod(3.3 * t, 180) - 90, 10 * t});
  }
  points[3 * 500 + 1] = 91;
  points[3 * 600] = std::nan("");
  const Coordinates<const double> in = {points.data(), &points[1], &points[2], 3};
  for (const unsigned threads : {1u, 3u}) {
    std::vector<MagneticValue> values(kCount);
    std::vector<TWstatus> words(kCount);
    const Summary summary = model.field(kCount, in, values.data(), {words.data(), threads});
    EXPECT_EQ(summary.failed, 2u);
    for (std::size_t i = 0; i < kCount; ++i) {
      const bool bad = i == 500 || i == 600;
      ASSERT_EQ(words[i] != TW_SUCCESS, bad) << i;
      ASSERT_EQ(std::isnan(values[i].field.total), bad) << i;
      if (bad) continue;
      const MagneticValue alone =
          model.field({points[3 * i], points[3 * i + 1], points[3 * i + 2]});
      ASSERT_EQ(values[i].field.declination, alone.field.declination);
      ASSERT_EQ(values[i].yearly.total, alone.yearly.total);
    }
  }
}

// A year's change is the difference of two dates, as the model is linear in its coefficients.
TEST(MagneticModelObject, YearlyChangeIsADifferenceOfDates) {
  const Point at = {2.35, 48.85, 35};
  const MagneticValue before = MagneticModel("WMM2025", 2026).field(at);
  const MagneticValue after = MagneticModel("WMM2025", 2027).field(at);
  EXPECT_NEAR(after.field.north - before.field.north, before.yearly.north, 1e-9);
  EXPECT_NEAR(after.field.east - before.field.east, before.yearly.east, 1e-9);
  EXPECT_NEAR(after.field.down - before.field.down, before.yearly.down, 1e-9);
}

TEST(MagneticModelObject, RefusalsNameWhatThereIs) {
  const auto refused = [](const char* name, double year) {
    try {
      const MagneticModel model(name, year);
    } catch (const Error& error) {
      return std::string(error.what());
    }
    return std::string("not refused");
  };
  EXPECT_NE(refused("WMM1990", 2026).find("WMM1990"), std::string::npos);
  EXPECT_NE(refused("WMM2025", 1990).find("published for 2025 to 2030"), std::string::npos);
  EXPECT_NE(refused("WMM2025", std::nan("")), "not refused");
  EXPECT_FALSE(MagneticModel::models().empty());
}

Point place(unsigned i) { return {-180 + 0.7 * (i % 500), -80 + 1.3 * (i % 120), 100}; }

// A model that many threads share gives what one gives alone.
TEST(MagneticModelObject, ThreadsThatShareItDoNotMeet) {
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

}  // namespace tidewater::test
