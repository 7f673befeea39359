// The array functions that work on several points at once, each as a call with its parameters
// filled in and a box of ordinary input.  A family adds its own in tests/points/<family>.cpp; the
// tests of widths and the digests go through all of them.
#pragma once

#include <cstdint>
#include <functional>
#include <initializer_list>
#include <string>
#include <vector>

#include "tidewater/frame.h"

namespace tidewater::test {

struct Operation {
  std::string name;  // of the function, with a word for the parameters where it stands twice
  CoordinateTriple low, high;  // the box of ordinary points
  std::function<void(int32_t, const CoordinateTriple*, CoordinateTriple*, TWstatus*)> call;
};

std::vector<Operation>& operations();

// A static object of this kind in each file adds its operations.
struct Operations {
  Operations(std::initializer_list<Operation> added) {
    operations().insert(operations().end(), added);
  }
};

// Boxes of longitude and latitude in degrees, and of a plane in units of the semi-major axis.
inline CoordinateTriple geographic(double lon, double lat, double height = 0) {
  constexpr double kDegree = 0.017453292519943295;
  return {lon * kDegree, lat * kDegree, height};
}

}  // namespace tidewater::test
