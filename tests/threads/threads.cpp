// Everything that is promised to be re-entrant, called by several threads at once on shared input:
// each thread gives what one thread alone gives.  Built by scripts/threads under the thread
// sanitizer, which looks for what the figures do not show.
//
//   tidewater_threads           everything; exit status 0
//   tidewater_threads control   two threads in a grid function that holds one window for the
//                               process: the sanitizer must see it

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "points/operations.hpp"
#include "support/grids.hpp"
#include "tidewater/catalogue.h"
#include "tidewater/conformal.h"
#include "tidewater/datum.h"
#include "tidewater/foundation.h"
#include "tidewater/grids.hpp"
#include "tidewater/lines.h"
#include "tidewater/lines.hpp"
#include "tidewater/magnetic.h"
#include "tidewater/magnetic_model.hpp"
#include "tidewater/position_text.hpp"
#include "tidewater/special.h"
#include "tidewater/system.hpp"
#include "tidewater/systems.h"
#include "tidewater/transformation.hpp"

using namespace tidewater::test;

namespace {

constexpr unsigned kThreads = 4;
constexpr int kRounds = 3;

int failures = 0;
int calls = 0;

// The bytes of what a call gave.
struct Bytes {
  std::string all;
  template <class T>
  Bytes& add(const T& value) {
    all.append(reinterpret_cast<const char*>(&value), sizeof value);
    return *this;
  }
};

using Call = std::function<std::string()>;

// All threads at once, some rounds each.  Nothing is called before: what is made at the first call
// is made by whoever comes first.
void together(const std::string& name, const Call& call) {
  std::vector<std::string> answers(kThreads);
  std::vector<std::thread> threads;
  for (unsigned t = 0; t < kThreads; ++t) {
    threads.emplace_back([&, t] {
      for (int round = 0; round < kRounds; ++round) answers[t] = call();
    });
  }
  for (std::thread& thread : threads) thread.join();
  const std::string alone = call();
  ++calls;
  for (const std::string& answer : answers) {
    if (answer == alone) continue;
    std::printf("%s: threads differ\n", name.c_str());
    ++failures;
    return;
  }
}

// The array functions, on one shared array of points.
void array_functions() {
  for (const Operation& operation : operations()) {
    std::vector<CoordinateTriple> in(203);
    for (std::size_t i = 0; i < in.size(); ++i) {
      const double t = static_cast<double>(i) / static_cast<double>(in.size());
      const CoordinateTriple &low = operation.low, &high = operation.high;
      in[i] = {low.x + (high.x - low.x) * t, low.y + (high.y - low.y) * (1 - t), low.z};
    }
    together(operation.name, [&] {
      std::vector<CoordinateTriple> out(in.size());
      TWstatus status = 0;
      operation.call(static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
      std::string answer(reinterpret_cast<const char*>(out.data()),
                         out.size() * sizeof(CoordinateTriple));
      return answer + std::to_string(status);
    });
  }
}

// Functions of single values, of constants and of lines.
void other_functions() {
  together("TWgeodesic_inv and TWgeodesic_dir", [] {
    double azimuth = 0, back = 0, distance = 0, end_azimuth = 0;
    CoordinateTriple end = {};
    TWstatus status = 0;
    TWgeodesic_inv({0.1, 0.8, 0}, {0.9, 0.3, 0}, 6378137, 0.0818, &azimuth, &back, &distance,
                   &status);
    TWgeodesic_dir({0.1, 0.8, 0}, 6378137, 0.0818, azimuth, distance, &end, &end_azimuth, &status);
    return Bytes().add(azimuth).add(back).add(distance).add(end).add(status).all;
  });
  together("TWt_merc_c", [] {
    double v[9] = {};
    TWstatus status = 0;
    TWt_merc_c(0.0818, 0.1, 0.2, &v[0], &v[1], &v[2], &v[3], &v[4], &v[5], &v[6], &v[7], &v[8],
               &status);
    return Bytes().add(v).add(status).all;
  });
  together("TWsom_c", [] {
    double v[13] = {}, m[2][9] = {}, sums[2] = {};
    TWstatus status = 0;
    TWsom_c(0.0818, 1.7, 0.07, 0.01, 0.2, 4, 9, &v[0], &v[1], &v[2], &v[3], &v[4], m[0], m[1],
            &v[5], &v[6], &v[7], &v[8], &v[9], &v[10], &v[11], &v[12], &v[5], &v[6], &sums[0],
            &sums[1], &status);
    return Bytes().add(v).add(m).add(sums).add(status).all;
  });
  together("TWhar_alocCtnm", [] {
    const int32_t degree = 5;
    double block[21] = {};
    double **c = nullptr, **s = nullptr;
    TWstatus status = 0;
    TWhar_alocCtnm(1, &degree, block, block, &c, &s, &status);
    const bool right = c && s && c[5] == block + 15;
    std::free(c);
    std::free(s);
    return Bytes().add(right).add(status).all;
  });
  together("catalogue functions", [] {
    Bytes bytes;
    int32_t count = 0;
    TWstatus status = 0;
    TWget_cs_cnt(TIDEWATER_STORE, -1, &count, &status);
    std::vector<char> names(static_cast<std::size_t>(count) * 41);
    TWget_cs_names(TIDEWATER_STORE, -1, names.data(), &status);
    bytes.all.assign(names.begin(), names.end());
    return bytes.add(count).add(status).all;
  });
}

// Objects that all threads share, and objects that each makes for itself.
void systems_layer(const std::string& folder) {
  using namespace tidewater;
  // The registry is read by the first that asks.
  together("System and Transformation of each thread's own", [] {
    const Transformation map{System("EPSG:4230"), System("EPSG:2154")};
    return Bytes().add(map.forward({3, 46, 0})).all + map.describe() +
           System("EPSG:27700").to_wkt();
  });
  const Transformation map{System("EPSG:27572"), System("EPSG:2154")};
  together("Transformation, shared, in threads of its own", [&] {
    std::vector<double> x(5000), y(5000);
    for (std::size_t i = 0; i < x.size(); ++i) {
      x[i] = 600000 + 10 * static_cast<double>(i);
      y[i] = 2200000;
    }
    Run run;
    run.threads = 2;
    map.forward(x.size(), {x.data(), y.data(), nullptr}, {x.data(), y.data(), nullptr}, run);
    return Bytes().add(x[4999]).add(y[4999]).add(map.inverse({x[7], y[7], 0})).all;
  });
  const ShiftGrid grid(folder + "g.las");
  const tidewater::GeoidGrid geoid(folder + "g.geo");
  together("grids, shared", [&] {
    const Point there = grid.forward({-70.3, 40.2, 0});
    return Bytes().add(there).add(grid.inverse(there)).add(geoid.undulation(-70, 40)).all;
  });
  together("grids of each thread's own", [&] {
    return ShiftGrid(folder + "g.las").describe() +
           tidewater::GeoidGrid(folder + "g.geo").describe();
  });
  const MagneticModel model("", 2026);
  together("MagneticModel", [&] {
    return Bytes().add(model.field(Point{2, 48, 0})).add(MagneticModel("", 2027).year()).all;
  });
  together("texts", [] {
    const ParsedPosition position = parse_position("48 51 24 N 2 21 E", Order::unknown, false);
    return Bytes().add(position.latitude).add(parse_mgrs("31UDQ4825111932").easting).all;
  });
  together("C interface", [] {
    tw_system* system = tw_system_create("EPSG:2154");
    tw_system* none = tw_system_create("EPSG:0");
    std::string answer = none ? "" : tw_last_error();
    char text[4000] = "";
    tw_system_describe(system, text, sizeof text);
    int32_t codes[3] = {};
    tw_system_search("lambert", codes, 3);
    tw_system_destroy(system);
    return Bytes().add(codes).all + answer + text;
  });
}

// By contract a window belongs to the process: two threads must not meet in these functions.
void control(const std::string& folder) {
  NadconControl grids = {};
  TWstatus status = 0;
  TWnadcon_c(folder.c_str(), &grids, &status);
  const auto shift = [&](double lon) {
    for (int i = 0; i < 200; ++i) {
      CoordinateTriple p = {(lon + 0.1 * i) * 0.0174533, 0.7, 0};
      TWstatus word = 0;
      TWnadcon_f(1, &p, &grids, &p, &word);
    }
  };
  std::thread other(shift, -79.0);
  shift(-75.0);
  other.join();
}

}  // namespace

int main(int count, char** words) {
  std::string folder = (std::filesystem::temp_directory_path() / "tidewater-XXXXXX").string();
  if (!mkdtemp(folder.data())) return 2;
  folder += "/";
  const GridFile grid = {-80, 30, 30, 30,
                         [](int r, int c) { return static_cast<float>(0.01 * (3 * r + c)); }};
  for (const char* name : {"g.las", "g.los", "g.geo"}) {
    std::ofstream(folder + name, std::ios::binary) << grid.bytes();
  }
  std::ofstream(folder + "area.par") << "g\n";
  if (count > 1 && std::strcmp(words[1], "control") == 0) {
    control(folder);
  } else {
    array_functions();
    other_functions();
    systems_layer(folder);
    std::printf("%d calls by %u threads at once, %d differ\n", calls, kThreads, failures);
  }
  std::filesystem::remove_all(folder);
  return failures == 0 ? 0 : 1;
}
