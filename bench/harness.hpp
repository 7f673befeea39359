// Benchmarks side by side: ours, a peer's, and the bare library calls that the formula needs, on
// the same points in the same process.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "tidewater/frame.h"

namespace tidewater::bench {

inline constexpr int32_t kPoints = 4096;

// Works once through a row's points.
using Kernel = std::function<void()>;

struct Row {
  std::string operation;  // "Mercator forward"
  std::string peer_name;  // "PROJ"; empty without a peer
  Kernel ours;
  Kernel peer;   // may be empty
  Kernel floor;  // the bare libm calls of the formula; may be empty
  int32_t points = kPoints;
};

// Adds a row to the table.  Rows are added while the program starts, in Suite objects.
void add(Row row);

// A static object of this kind in each file adds its rows.
struct Suite {
  explicit Suite(void (*rows)()) { rows(); }
};

// Points spread at random over a box of longitudes and latitudes in degrees, heights up to 1000 m.
std::vector<CoordinateTriple> box(double west, double south, double east, double north,
                                  int32_t count = kPoints);

// A PROJ operation over an array of our points, in place as proj_trans_generic works.  Forward
// takes radians.  An empty kernel where PROJ is not installed or does not know the operation.
Kernel proj_kernel(const std::string& definition, bool forward,
                   const std::vector<CoordinateTriple>& points);

// Keeps a result from being optimised away.
void keep(double value);

// Calls f on element y (latitude or northing) of every point, for a libm floor.
template <class F>
Kernel floor_kernel(const std::vector<CoordinateTriple>& points, F f) {
  return [points, f] {
    double sum = 0;
    for (const CoordinateTriple& p : points) sum += f(p);
    keep(sum);
  };
}

}  // namespace tidewater::bench
