// One number for each array function, the same on every machine and at every level: a hash of the
// results of a thousand ordinary points.  scripts/digests compares it between processors.

#include <cinttypes>
#include <cstdio>
#include <cstring>

#include "points/operations.hpp"
#include "points/over_points.hpp"

using namespace tidewater::test;

namespace {

// A generator of our own: the standard's distributions differ between libraries.
struct Steps {
  uint64_t state = 88172645463325252u;
  double next() {
    state ^= state << 13;
    state ^= state >> 7;
    state ^= state << 17;
    return static_cast<double>(state >> 11) * 0x1p-53;
  }
};

uint64_t hash_of(const std::vector<CoordinateTriple>& points, TWstatus status) {
  uint64_t hash = 14695981039346656037u ^ status;  // FNV-1a, by words
  for (const CoordinateTriple& p : points) {
    for (const double v : {p.x, p.y, p.z}) {
      uint64_t b = 0;
      if (v == v) std::memcpy(&b, &v, sizeof b);
      hash = (hash ^ b) * 1099511628211u;
      hash ^= hash >> 29;
    }
  }
  return hash;
}

}  // namespace

int main() {
  using tidewater::points::ask_for_level;
  using tidewater::points::Level;
  bool agree = true;
  for (const Operation& operation : operations()) {
    Steps steps;
    std::vector<CoordinateTriple> in(1000);
    for (CoordinateTriple& p : in) {
      const CoordinateTriple &low = operation.low, &high = operation.high;
      p.x = low.x + (high.x - low.x) * steps.next();
      p.y = low.y + (high.y - low.y) * steps.next();
      p.z = low.z + (high.z - low.z) * steps.next();
    }
    uint64_t first = 0;
    for (const Level level : {Level::one_by_one, Level::baseline, Level::avx2, Level::avx512}) {
      if (!ask_for_level(level)) continue;
      std::vector<CoordinateTriple> out(in.size());
      TWstatus status = 0;
      operation.call(static_cast<int32_t>(in.size()), in.data(), out.data(), &status);
      const uint64_t hash = hash_of(out, status);
      if (level == Level::one_by_one) first = hash;
      if (hash != first) agree = false;
    }
    std::printf("%-40s %016" PRIx64 "\n", operation.name.c_str(), first);
  }
  if (!agree) std::puts("levels differ");
  return agree ? 0 : 1;
}
