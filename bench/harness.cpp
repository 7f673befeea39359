#include "harness.hpp"

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <functional>
#include <random>
#include <regex>
#include <thread>

#include "points/over_points.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>
#endif

namespace tidewater::bench {

namespace {

int32_t point_count = 10000;

// Small slices, so that the step to metres finds its points in the cache.
constexpr int32_t kSlice = 512;

std::vector<Row>& rows() {
  static std::vector<Row> all;
  return all;
}

std::vector<void (*)()>& suites() {
  static std::vector<void (*)()> all;
  return all;
}

class OurSide : public Side {
 public:
  OurSide(std::vector<CoordinateTriple> in, Call call)
      : in_(std::move(in)), out_(in_), call_(std::move(call)) {}
  void run() override { call_(static_cast<int32_t>(in_.size()), in_.data(), out_.data()); }
  CoordinateTriple result(std::size_t i) override { return out_[i]; }

 private:
  std::vector<CoordinateTriple> in_, out_;
  Call call_;
};

class FunctionSide : public Side {
 public:
  FunctionSide(std::function<void()> run, std::function<CoordinateTriple(std::size_t)> result)
      : run_(std::move(run)), result_(std::move(result)) {}
  void run() override { run_(); }
  CoordinateTriple result(std::size_t i) override {
    return result_ ? result_(i) : CoordinateTriple{};
  }

 private:
  std::function<void()> run_;
  std::function<CoordinateTriple(std::size_t)> result_;
};

#ifdef TIDEWATER_HAVE_PROJ
class ProjOperation {
 public:
  explicit ProjOperation(const std::string& definition)
      : context_(proj_context_create()), operation_(proj_create(context_, definition.c_str())) {}
  ~ProjOperation() {
    proj_destroy(operation_);
    proj_context_destroy(context_);
  }
  ProjOperation(const ProjOperation&) = delete;
  ProjOperation& operator=(const ProjOperation&) = delete;
  PJ* get() const { return operation_; }

 private:
  PJ_CONTEXT* context_;
  PJ* operation_;
};

// The peer's own array of four doubles a point, the fastest of its forms.
class ProjSide : public Side {
 public:
  ProjSide(const std::string& definition, bool forward, const std::vector<CoordinateTriple>& in)
      : operation_(definition), forward_(forward) {
    for (const CoordinateTriple& p : in) in_.push_back(proj_coord(p.x, p.y, p.z, 0));
    out_ = in_;
  }
  bool ok() const { return operation_.get() != nullptr; }
  void run() override {
    std::memcpy(out_.data(), in_.data(), in_.size() * sizeof in_[0]);
    proj_trans_array(operation_.get(), forward_ ? PJ_FWD : PJ_INV, out_.size(), out_.data());
  }
  CoordinateTriple result(std::size_t i) override {
    return {out_[i].xyz.x, out_[i].xyz.y, out_[i].xyz.z};
  }

 private:
  ProjOperation operation_;
  bool forward_;
  std::vector<PJ_COORD> in_, out_;
};

class ProjScale : public Side {
 public:
  ProjScale(const std::string& definition, const std::vector<CoordinateTriple>& in)
      : operation_(definition), in_(in), out_(in) {}
  bool ok() const { return operation_.get() != nullptr; }
  void run() override {
    for (std::size_t i = 0; i < in_.size(); ++i) {
      const PJ_FACTORS f = proj_factors(operation_.get(), proj_coord(in_[i].x, in_[i].y, 0, 0));
      out_[i] = {f.parallel_scale, f.meridional_scale, f.areal_scale};
    }
  }
  CoordinateTriple result(std::size_t i) override { return out_[i]; }

 private:
  ProjOperation operation_;
  std::vector<CoordinateTriple> in_, out_;
};
#endif

double thread_nanoseconds() {
  timespec t;
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &t);
  return static_cast<double>(t.tv_sec) * 1e9 + static_cast<double>(t.tv_nsec);
}

double timed(Side& which) {
  const double start = thread_nanoseconds();
  which.run();
  return thread_nanoseconds() - start;
}

double median(std::vector<double> values) {
  std::sort(values.begin(), values.end());
  return values[values.size() / 2];
}

struct LevelColumn {
  points::Level level;
  const char* name;
};

std::vector<LevelColumn> columns_asked_for(const std::string& wanted) {
  std::vector<LevelColumn> columns;
  for (const LevelColumn& c :
       {LevelColumn{points::Level::one_by_one, "one_by_one"},
        LevelColumn{points::Level::baseline, "baseline"}, LevelColumn{points::Level::avx2, "avx2"},
        LevelColumn{points::Level::avx512, "avx512"}}) {
    if (!wanted.empty() && wanted != c.name) continue;
    if (points::ask_for_level(c.level)) columns.push_back(c);
  }
  return columns;
}

// Our time at each level and the fastest peer's, by medians; the ratios by medians of single runs.
void measure(const Row& row, const std::vector<LevelColumn>& columns, bool markdown) {
  constexpr int kRuns = 15;
  std::vector<std::vector<double>> our_times(columns.size()), peer_times(row.peers.size());
  for (int run = -1; run < kRuns; ++run) {  // the first warms up
    for (std::size_t p = 0; p < row.peers.size(); ++p) {
      const double t = timed(*row.peers[p]);
      if (run >= 0) peer_times[p].push_back(t);
    }
    for (std::size_t c = 0; c < columns.size(); ++c) {
      points::ask_for_level(columns[c].level);
      const double t = c == 0 || row.levels   ? timed(*row.ours)
                       : our_times[0].empty() ? 0
                                              : our_times[0].back();
      if (run >= 0) our_times[c].push_back(t);
    }
  }
  std::size_t fastest = 0;
  for (std::size_t p = 1; p < row.peers.size(); ++p) {
    if (median(peer_times[p]) < median(peer_times[fastest])) fastest = p;
  }
  const double n = point_count;
  std::printf(markdown ? "| %s |" : "%-46s", row.operation.c_str());
  for (std::size_t c = 0; c < columns.size(); ++c) {
    std::printf(markdown ? " %.1f |" : " %9.1f", median(our_times[c]) / n);
  }
  if (row.peers.empty()) {
    std::printf("\n");
    return;
  }
  std::printf(markdown ? " %.1f |" : " %9.1f", median(peer_times[fastest]) / n);
  for (std::size_t c = 0; c < columns.size(); ++c) {
    std::vector<double> ratios;
    for (int run = 0; run < kRuns; ++run) {
      const auto r = static_cast<std::size_t>(run);
      ratios.push_back(peer_times[fastest][r] / our_times[c][r]);
    }
    std::printf(markdown ? " %.1f |" : " %8.1fx", median(ratios));
  }
  double worst = 0;
  if (row.apart) {
    for (std::size_t i = 0; i < static_cast<std::size_t>(point_count); ++i) {
      const double d = row.apart(row.ours->result(i), row.peers[fastest]->result(i));
      if (!(d <= worst)) worst = d;
    }
    std::printf(markdown ? " %.1e %s |" : "  %8.1e %s", worst, row.unit.c_str());
  } else {
    std::printf(markdown ? " |" : "  %10s", "");
  }
  std::printf(markdown ? " %s |\n" : "  %s\n", row.peer_names[fastest].c_str());
}

void print_head(const std::vector<LevelColumn>& columns, bool markdown) {
  std::printf(markdown ? "| ns a point, %d points |" : "ns a point, %-5d points%23s", point_count,
              "");
  for (const LevelColumn& c : columns) std::printf(markdown ? " %s |" : " %9s", c.name);
  std::printf(markdown ? " peer |" : " %9s", "peer");
  for (const LevelColumn& c : columns) std::printf(markdown ? " x, %s |" : " %9s", c.name);
  std::printf(markdown ? " apart | peer is |\n" : "  %s\n", "apart       peer is");
  if (markdown) {
    std::printf("|---|");
    for (std::size_t i = 0; i < 2 * columns.size() + 3; ++i) std::printf("---|");
    std::printf("\n");
  }
}

// How much more two threads do than one in the same time, each on an array of its own.
void measure_two_threads() {
  constexpr int kRuns = 9;
  constexpr int32_t kCount = 1000000;
  const auto work = [] {
    std::vector<CoordinateTriple> in(kCount, {0.1, 0.7, 0}), out = in;
    return [in, out]() mutable {
      TWstatus status = 0;
      for (int pass = 0; pass < 10; ++pass) {
        TWmerc_f(0.0818191910428158, 0, 0, kCount, in.data(), out.data(), &status);
      }
    };
  };
  auto first = work(), second = work();
  const auto wall = [](auto run) {
    const auto start = std::chrono::steady_clock::now();
    run();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
  };
  std::vector<double> ratios;
  for (int run = 0; run < kRuns; ++run) {
    const double one = wall(first);
    const double two = wall([&] {
      std::thread other(std::ref(second));
      first();
      other.join();
    });
    ratios.push_back(2 * one / two);
  }
  std::printf(
      "\ntwo threads on arrays of their own do %.2f times the work of one (Mercator forward)\n",
      median(ratios));
}

}  // namespace

int32_t points() { return point_count; }

Suite::Suite(void (*add_rows)()) { suites().push_back(add_rows); }

void add(Row row) {
  for (std::size_t p = row.peers.size(); p-- > 0;) {
    if (row.peers[p]) continue;
    row.peers.erase(row.peers.begin() + static_cast<std::ptrdiff_t>(p));
    row.peer_names.erase(row.peer_names.begin() + static_cast<std::ptrdiff_t>(p));
  }
  rows().push_back(std::move(row));
}

std::vector<CoordinateTriple> box(double west, double south, double east, double north) {
  constexpr double kDegree = 3.14159265358979323846 / 180;
  std::mt19937 random(20);
  std::uniform_real_distribution<double> lon(west * kDegree, east * kDegree);
  std::uniform_real_distribution<double> lat(south * kDegree, north * kDegree);
  std::uniform_real_distribution<double> height(0, 1000);
  std::vector<CoordinateTriple> points(static_cast<std::size_t>(point_count));
  for (CoordinateTriple& p : points) p = {lon(random), lat(random), height(random)};
  return points;
}

std::shared_ptr<Side> ours(std::vector<CoordinateTriple> in, Call call) {
  return std::make_shared<OurSide>(std::move(in), std::move(call));
}

std::shared_ptr<Side> side(std::function<void()> run,
                           std::function<CoordinateTriple(std::size_t)> result) {
  return std::make_shared<FunctionSide>(std::move(run), std::move(result));
}

std::shared_ptr<Side> repeated(std::function<void()> once) {
  return side([once = std::move(once)] {
    for (int32_t i = 0; i < point_count; ++i) once();
  });
}

std::shared_ptr<Side> proj([[maybe_unused]] const std::string& definition,
                           [[maybe_unused]] bool forward,
                           [[maybe_unused]] const std::vector<CoordinateTriple>& in) {
#ifdef TIDEWATER_HAVE_PROJ
  auto peer = std::make_shared<ProjSide>(definition, forward, in);
  if (peer->ok()) return peer;
  std::fprintf(stderr, "PROJ does not know %s\n", definition.c_str());
#endif
  return nullptr;
}

double plane_apart(const CoordinateTriple& ours, const CoordinateTriple& peers) {
  return std::hypot(ours.x - peers.x, ours.y - peers.y);
}

double space_apart(const CoordinateTriple& ours, const CoordinateTriple& peers) {
  return std::hypot(ours.x - peers.x, ours.y - peers.y, ours.z - peers.z);
}

double ground_apart(const CoordinateTriple& ours, const CoordinateTriple& peers) {
  constexpr double kRadius = 6.4e6, kTurn = 6.28318530717958647693;
  const double d_lon = std::remainder(ours.x - peers.x, kTurn) * std::cos(peers.y);
  return kRadius * std::hypot(d_lon, ours.y - peers.y);
}

void add(const Projection& p) {
  const auto sliced = [](auto step) {
    return [step](int32_t count, const CoordinateTriple* in, CoordinateTriple* out) {
      for (int32_t i = 0; i < count; i += kSlice) {
        step(std::min(kSlice, count - i), in + i, out + i);
      }
    };
  };
  auto in = box(p.west, p.south, p.east, p.north);
  for (CoordinateTriple& point : in) point.z = 0;  // some perspectives look at the height
  const Call forward = sliced([p](int32_t n, const CoordinateTriple* from, CoordinateTriple* to) {
    TWstatus status = 0;
    p.forward(n, from, to);
    TWab_to_en(p.a, 1, 0, 0, n, to, to, &status);
  });
  const auto forward_side = ours(in, forward);
  Row row = {p.name + " forward", forward_side, {}, {}, {}};
  Row back = {p.name + " inverse", nullptr, {}, {}, ground_apart};
  forward_side->run();
  std::vector<CoordinateTriple> metres = in;
  forward(static_cast<int32_t>(in.size()), in.data(), metres.data());
  for (const std::string& definition : p.peers) {
    const std::string name =
        definition.find("+approx") != std::string::npos ? "PROJ, approx" : "PROJ";
    row.peer_names.push_back(name);
    row.peers.push_back(proj(definition, true, in));
    if (!row.peers.back()) continue;
    // The peer goes back from its own plane.
    row.peers.back()->run();
    auto peers_plane = in;
    for (std::size_t i = 0; i < in.size(); ++i) peers_plane[i] = row.peers.back()->result(i);
    back.peer_names.push_back(name);
    back.peers.push_back(proj(definition, false, peers_plane));
  }
  if (p.same_plane) {
    row.apart = [p](const CoordinateTriple& a, const CoordinateTriple& b) {
      return plane_apart(a, p.from_peer ? p.from_peer(b) : b);
    };
  }
  add(std::move(row));
  if (p.inverse) {
    back.ours =
        ours(metres, sliced([p](int32_t n, const CoordinateTriple* from, CoordinateTriple* to) {
               TWstatus status = 0;
               TWen_to_ab(p.a, 1, 0, 0, n, from, to, &status);
               p.inverse(n, to, to);
             }));
    add(std::move(back));
  }
  if (p.scale) {
    Row factors = {p.name + " scale", ours(in, p.scale), {}, {}, {}, "1"};
#ifdef TIDEWATER_HAVE_PROJ
    for (const std::string& definition : p.peers) {
      auto peer = std::make_shared<ProjScale>(definition, in);
      if (!peer->ok()) continue;
      factors.peer_names.push_back("PROJ");
      factors.peers.push_back(peer);
    }
#endif
    factors.apart = [](const CoordinateTriple& a, const CoordinateTriple& b) {
      return std::max(std::fabs(a.x - b.x), std::fabs(a.y - b.y));
    };
    add(std::move(factors));
  }
}

}  // namespace tidewater::bench

namespace {

int usage() {
  std::fputs(
      "usage: tidewater_bench [--filter REGEX] [--level one_by_one|baseline|avx2|avx512]\n"
      "                       [--points N] [--markdown]\n"
      "       tidewater_bench --threads\n",
      stderr);
  return 2;
}

}  // namespace

int main(int argc, char** argv) {
  using namespace tidewater::bench;
  std::string filter, level;
  bool markdown = false;
  for (int i = 1; i < argc; ++i) {
    const std::string option = argv[i];
    if (option == "--threads") {
      measure_two_threads();
      return 0;
    }
    if (option == "--markdown") {
      markdown = true;
    } else if (i + 1 == argc) {
      return usage();
    } else if (option == "--filter") {
      filter = argv[++i];
    } else if (option == "--level") {
      level = argv[++i];
    } else if (option == "--points") {
      point_count = std::max(1, std::atoi(argv[++i]));
    } else {
      return usage();
    }
  }
  const auto columns = columns_asked_for(level);
  if (columns.empty()) {
    std::fprintf(stderr, "this machine has no level \"%s\"\n", level.c_str());
    return 2;
  }
  for (const auto add_rows : suites()) add_rows();
  print_head(columns, markdown);
  const std::regex wanted(filter, std::regex::icase);
  for (const Row& row : rows()) {
    if (std::regex_search(row.operation, wanted)) measure(row, columns, markdown);
    std::fflush(stdout);
  }
  if (filter.empty()) measure_two_threads();
}
