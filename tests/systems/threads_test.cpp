// Objects of every kind, made and used by many threads at once.
#include <gtest/gtest.h>

#include <atomic>
#include <cmath>
#include <filesystem>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "tidewater/grids.hpp"
#include "tidewater/lines.hpp"
#include "tidewater/magnetic_model.hpp"
#include "tidewater/position_text.hpp"
#include "tidewater/systems.h"
#include "tidewater/transformation.hpp"

namespace tidewater::test {

namespace {

constexpr int kThreads = 16;
constexpr int kRounds = 6;

// Runs the same work in all threads and counts the answers that are not the first thread's.
void by_all_threads(const std::function<double(int round)>& work) {
  std::vector<double> expected;
  for (int round = 0; round < kRounds; ++round) expected.push_back(work(round));
  std::atomic<int> wrong = 0;
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t) {
    threads.emplace_back([&, t] {
      for (int k = 0; k < kRounds; ++k) {
        const int round = (k + t) % kRounds;
        const double answer = work(round);
        const double other = expected[static_cast<std::size_t>(round)];
        if (answer != other && !(std::isnan(answer) && std::isnan(other))) ++wrong;
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrong, 0);
}

TEST(Threads, SystemsByNameAndTheirTexts) {
  const char* const names[] = {"EPSG:2154",
                               "utm:30N ED50",
                               "lambert conformal lat1=44 lat2=49 lat0=46.5 lon0=3 ellps=GRS80",
                               "+proj=omerc +lat_0=4 +lonc=115 +alpha=53 +gamma=53 +ellps=evrstSS",
                               "spcs27:0401",
                               "NTF (Paris) / Lambert zone II"};
  by_all_threads([&](int round) {
    const System system(names[round]);
    const System again(system.to_wkt("esri"));
    const Point there = again.projection()->forward({2.5 + round, 10.0 * round});
    return there.x + there.y + static_cast<double>(system.describe().size()) +
           static_cast<double>(System::search("lambert", 5).size());
  });
  by_all_threads([](int round) {
    try {
      return static_cast<double>(System("no such system " + std::to_string(round)).code());
    } catch (const Error& error) {
      return static_cast<double>(std::string(error.what()).size());
    }
  });
}

TEST(Threads, TransformationsMadeAndShared) {
  const Transformation shared{System("EPSG:4326"), System("EPSG:27700")};
  by_all_threads([&](int round) {
    TransformationOptions options;
    options.epoch = 2021.5;
    const char* const targets[] = {"EPSG:2154",  "EPSG:27700", "EPSG:3857",
                                   "EPSG:23030", "EPSG:4978",  "EPSG:28992"};
    const Transformation own{System("EPSG:4326"), System(targets[round]), options};
    std::vector<double> x(700, 0.5 + round);
    std::vector<double> y(700, 48.5);
    std::vector<TWstatus> words(700);
    const Coordinates<const double> in = {x.data(), y.data()};
    std::vector<double> to_x(700), to_y(700);
    own.forward(700, in, {to_x.data(), to_y.data()}, {words.data(), 2});
    const Point common = shared.forward({-1.0 - round, 52, 0});
    return to_x[699] + to_y[0] + common.x + common.y + static_cast<double>(own.describe().size());
  });
}

TEST(Threads, Grids) {
  const std::string folder = "/usr/share/proj";
  if (!std::filesystem::exists(folder + "/ntf_r93.gsb")) GTEST_SKIP() << "no grids in " << folder;
  const ShiftGrid shared("ntf_r93.gsb", {folder});
  by_all_threads([&](int round) {
    const ShiftGrid own("ntf_r93.gsb", {folder});
    const Point at = {-3.0 + round, 44.0 + round, 0};
    return shared.inverse(own.forward(at)).x + shared.forward(at).y;
  });
  const Transformation map{System("EPSG:27572"), System("EPSG:2154")};
  by_all_threads([&](int round) { return map.forward({6e5 + 1e4 * round, 2.2e6}).x; });
}

TEST(Threads, MagneticModelsLinesAndTexts) {
  const MagneticModel shared("", 2025.5);
  by_all_threads([&](int round) {
    const MagneticModel own("", 2025.1 + 0.1 * round);
    return own.field({10.0 * round, 45, 100}).field.declination +
           shared.field({10.0 * round, 45, 100}).field.total;
  });
  const Geodesic lines(Ellipsoid("WGS 84"));
  by_all_threads([&](int round) {
    return lines.inverse(2, 48, 170.0 + round, -47.5).length +
           static_cast<double>(format_mgrs(2, 48).size()) + parse_angle("48 51 24 N").degrees;
  });
}

TEST(Threads, InterfaceInC) {
  by_all_threads([](int round) {
    tw_system* const system = tw_system_create(round % 2 == 0 ? "EPSG:2154" : "no such system");
    double answer = static_cast<double>(std::string(tw_last_error()).size());
    if (system != nullptr) {
      answer = 1;
      tw_system_destroy(system);
    }
    return answer;
  });
}

}  // namespace

}  // namespace tidewater::test
