// The loop for functions that read the output's third element: what an earlier stage has left
// there is an input too.
#pragma once

#include <algorithm>

#include "points/over_points.hpp"

namespace tidewater::points {

// A kernel of three coordinates, whose formula covers every point, over the first two of `in` and
// the third of `out`.
template <class Kernel>
void over_points_and_heights(const Kernel& kernel, int32_t count, const CoordinateTriple* in,
                             CoordinateTriple* out) requires(!requires { &Kernel::other; }) {
  constexpr int32_t kMany = 256;
  CoordinateTriple given[kMany];
  for (int32_t done = 0; done < count;) {
    const int32_t some = std::min(kMany, count - done);
    for (int32_t i = 0; i < some; ++i) given[i] = {in[done + i].x, in[done + i].y, out[done + i].z};
    over_points(kernel, some, given, out + done);
    done += some;
  }
}

}  // namespace tidewater::points
