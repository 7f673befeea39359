// What the registry costs: reading it, looking entries up, searching names; PROJ's own look-up
// beside it.  Medians of the thread's processor time, in microseconds.

#include <algorithm>
#include <cstdio>
#include <ctime>
#include <functional>
#include <string>
#include <vector>

#include "registry.hpp"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>
#endif

namespace {

using tidewater::detail::Registry;

std::size_t kept = 0;  // what was read, so that it is read

double microseconds() {
  timespec now{};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
  return static_cast<double>(now.tv_sec) * 1e6 + static_cast<double>(now.tv_nsec) * 1e-3;
}

double median(int runs, const std::function<void()>& work) {
  std::vector<double> times;
  for (int i = 0; i < runs; ++i) {
    const double start = microseconds();
    work();
    times.push_back(microseconds() - start);
  }
  std::nth_element(times.begin(), times.begin() + runs / 2, times.end());
  return times[static_cast<std::size_t>(runs / 2)];
}

void print(const char* what, double ours, double peer = 0) {
  std::printf("%-64s %9.2f", what, ours);
  if (peer > 0) std::printf(" %9.2f %8.0f", peer, peer / ours);
  std::printf("\n");
}

}  // namespace

int main() {
  std::printf("%-64s %9s %9s %8s\n", "microseconds", "ours", "PROJ", "ratio");
  const Registry& registry = Registry::shared();
  print("reading the whole registry", median(21, [] { const Registry again(TIDEWATER_STORE); }));

  const std::vector<int> codes = registry.systems();
  std::size_t next = 0;
  const auto some_code = [&] { return codes[next = (next + 577) % codes.size()]; };
  const auto whole_system = [&](int code) {
    const auto system = registry.system(code);
    kept += system->name.size();
    if (const auto datum = registry.datum(system->datum)) {
      kept += registry.ellipsoid(datum->ellipsoid).has_value();
      kept += registry.meridian(datum->meridian).has_value();
    }
    kept += registry.system(system->base).has_value();
    kept += registry.conversion(system->conversion).has_value();
    kept += registry.unit(system->unit).has_value() + registry.area(system->area).has_value();
  };
  print("a system by code",
        median(1001, [&] { kept += registry.system(some_code())->name.size(); }));
  double peer = 0;
#ifdef TIDEWATER_HAVE_PROJ
  peer = median(1001, [&] {
    PJ* system = proj_create_from_database(
        PJ_DEFAULT_CTX, "EPSG", std::to_string(some_code()).c_str(), PJ_CATEGORY_CRS, 0, nullptr);
    kept += system != nullptr;
    proj_destroy(system);
  });
#endif
  print("a system by code with its base, conversion, datum and area",
        median(1001, [&] { whole_system(some_code()); }), peer);
  print("the operations from EPSG:4275 to EPSG:4326",
        median(501, [&] { kept += registry.operations(4275, 4326).size(); }));
  print("the 36 operations from EPSG:4230 to EPSG:4326",
        median(501, [&] { kept += registry.operations(4230, 4326).size(); }));
  print("a system by name", median(501, [&] {
          kept += static_cast<std::size_t>(registry.system("RGF93 v1 / Lambert-93")->code);
        }));
  for (const char* words : {"lambert 93", "british national", "utm"}) {
    print(("searching \"" + std::string(words) + "\"").c_str(),
          median(101, [&] { kept += registry.search(words).size(); }));
  }
  print("the names nearest to a mistyped one",
        median(51, [&] { kept += registry.suggest("lambret 93 france").size(); }));
  return kept == 0;
}
