// Benchmarks side by side: an operation at every level of the processor and its peer, on the same
// points in the same process, slice by slice in turn, in thread time.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "tidewater/frame.h"

namespace tidewater::bench {

// How many points an operation is given; --points asks for another number.
int32_t points();

// One side of a comparison.
class Side {
 public:
  virtual ~Side() = default;
  virtual void run() = 0;                              // all points once; this is timed
  virtual CoordinateTriple result(std::size_t i) = 0;  // of the last run
};
using Sides = std::vector<std::shared_ptr<Side>>;

// How far two results are apart, in metres or in what the row says.
using Apart = std::function<double(const CoordinateTriple& ours, const CoordinateTriple& peers)>;

struct Row {
  std::string operation;  // "Mercator forward"
  std::shared_ptr<Side> ours;
  std::vector<std::string> peer_names;  // "PROJ", "PROJ +approx"; the fastest counts
  Sides peers;
  Apart apart;             // empty: not compared
  std::string unit = "m";  // of the difference
  bool levels = true;      // false: the same at every level, measured once
};

// A static object of this kind in each file adds its rows once the points are known.
struct Suite {
  explicit Suite(void (*add_rows)());
};
void add(Row row);

// Points spread at random over a box of longitudes and latitudes in degrees, heights up to 1000 m.
std::vector<CoordinateTriple> box(double west, double south, double east, double north);

// An array call of ours, from in to out.
using Call = std::function<void(int32_t count, const CoordinateTriple* in, CoordinateTriple* out)>;
std::shared_ptr<Side> ours(std::vector<CoordinateTriple> in, Call call);

// Any function as a side, with a way to read its results (none: empty).
std::shared_ptr<Side> side(std::function<void()> run,
                           std::function<CoordinateTriple(std::size_t)> result = {});

// A call that takes no points, made once for each.
std::shared_ptr<Side> repeated(std::function<void()> once);

// A PROJ operation on our points in its own array form.  Null where PROJ is not installed or does
// not know the operation.
std::shared_ptr<Side> proj(const std::string& definition, bool forward,
                           const std::vector<CoordinateTriple>& in);

// The ways of comparing: metres in a plane or in space; angles in radians taken to metres.
double plane_apart(const CoordinateTriple& ours, const CoordinateTriple& peers);
double space_apart(const CoordinateTriple& ours, const CoordinateTriple& peers);
double ground_apart(const CoordinateTriple& ours, const CoordinateTriple& peers);

// A projection both ways and its scale beside PROJ's, in metres on both sides.
struct Projection {
  std::string name;
  double west, south, east, north;  // degrees
  double a;                         // metres in the unit of the plane
  std::vector<std::string> peers;   // PROJ definitions of the same
  Call forward, inverse, scale;     // in units of a; empty where there is none
  std::function<CoordinateTriple(CoordinateTriple)> from_peer = {};  // its plane to ours, metres
  bool same_plane = true;  // false: the peer turns, shifts or scales the plane in its own way
};
void add(const Projection& projection);

// A Call whose body is one call of the library on n, in, out and &status, constants by value.
#define TW_CALL(...)                                                           \
  [=]([[maybe_unused]] int32_t n, [[maybe_unused]] const CoordinateTriple* in, \
      CoordinateTriple* out) {                                                 \
    TWstatus status = 0;                                                       \
    __VA_ARGS__;                                                               \
  }

}  // namespace tidewater::bench
