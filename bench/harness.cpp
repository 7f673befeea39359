#include "harness.hpp"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <map>
#include <random>

#ifdef TIDEWATER_HAVE_PROJ
#include "support/proj_peer.hpp"
#endif

namespace tidewater::bench {

namespace {

std::vector<Row>& rows() {
  static std::vector<Row> all;
  return all;
}

const char* const kSides[] = {"tidewater", "peer", "libm"};

// Collects the median of each side; the table is printed at the end.
class Collector : public benchmark::ConsoleReporter {
 public:
  bool ReportContext(const Context& context) override {
    benchmark::BenchmarkReporter::PrintBasicContext(&GetErrorStream(), context);
    return true;
  }
  void ReportRuns(const std::vector<Run>& runs) override {
    for (const Run& run : runs) {
      if (run.run_type == Run::RT_Aggregate && run.aggregate_name == "median") {
        medians[run.run_name.function_name] = run.GetAdjustedRealTime();
        std::fputc('.', stderr);
      }
    }
  }
  std::map<std::string, double> medians;
};

void print_table(const std::map<std::string, double>& medians) {
  std::printf("\n%-44s %12s %12s %8s %10s %8s\n", "operation", "tidewater", "peer", "ratio", "libm",
              "ratio");
  std::printf("%-44s %12s %12s %8s %10s %8s\n", "", "ns/point", "ns/point", "peer/us", "ns/point",
              "us/libm");
  for (const Row& row : rows()) {
    const auto side = [&](int i) {
      const auto found = medians.find(row.operation + "/" + kSides[i]);
      return found == medians.end() ? 0.0 : found->second / row.points;
    };
    const double ours = side(0), peer = side(1), floor = side(2);
    if (ours == 0) continue;
    std::printf("%-44s %12.1f", row.operation.c_str(), ours);
    if (peer > 0) {
      std::printf(" %12.1f %7.1fx", peer, peer / ours);
    } else {
      std::printf(" %12s %8s", "-", "-");
    }
    if (floor > 0) {
      std::printf(" %10.1f %7.2fx", floor, ours / floor);
    } else {
      std::printf(" %10s %8s", "-", "-");
    }
    std::printf("  %s\n", row.peer_name.c_str());
  }
}

}  // namespace

void add(Row row) { rows().push_back(std::move(row)); }

std::vector<CoordinateTriple> box(double west, double south, double east, double north,
                                  int32_t count) {
  constexpr double kDegree = 3.14159265358979323846 / 180;
  std::mt19937 random(20);
  std::uniform_real_distribution<double> lon(west * kDegree, east * kDegree);
  std::uniform_real_distribution<double> lat(south * kDegree, north * kDegree);
  std::uniform_real_distribution<double> height(0, 1000);
  std::vector<CoordinateTriple> points(static_cast<std::size_t>(count));
  for (CoordinateTriple& p : points) p = {lon(random), lat(random), height(random)};
  return points;
}

Kernel proj_kernel([[maybe_unused]] const std::string& definition, [[maybe_unused]] bool forward,
                   [[maybe_unused]] const std::vector<CoordinateTriple>& points) {
#ifdef TIDEWATER_HAVE_PROJ
  const auto peer = std::make_shared<test::ProjPeer>(definition);
  if (!peer->ok()) return {};
  return [peer, forward, points, work = points]() mutable {
    work = points;  // the copy costs a fraction of a nanosecond a point
    constexpr std::size_t stride = sizeof(CoordinateTriple);
    proj_trans_generic(peer->operation(), forward ? PJ_FWD : PJ_INV, &work[0].x, stride,
                       work.size(), &work[0].y, stride, work.size(), &work[0].z, stride,
                       work.size(), nullptr, 0, 0);
    keep(work.back().x);
  };
#else
  return {};
#endif
}

void keep(double value) { benchmark::DoNotOptimize(value); }

}  // namespace tidewater::bench

int main(int argc, char** argv) {
  using namespace tidewater::bench;
  benchmark::Initialize(&argc, argv);
  for (const Row& row : rows()) {
    const Kernel* kernels[] = {&row.ours, &row.peer, &row.floor};
    for (int i = 0; i < 3; ++i) {
      if (!*kernels[i]) continue;
      benchmark::RegisterBenchmark((row.operation + "/" + kSides[i]).c_str(),
                                   [kernel = *kernels[i]](benchmark::State& state) {
                                     for (auto _ : state) kernel();
                                   })
          ->Repetitions(5)
          ->MinTime(0.02)
          ->ReportAggregatesOnly();
    }
  }
  Collector collector;
  benchmark::RunSpecifiedBenchmarks(&collector);
  print_table(collector.medians);
}
