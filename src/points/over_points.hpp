// What an exported array function calls: a formula, once for each point, in blocks as wide as the
// processor allows.
//
// A formula is a value, its kernel: parameters as members, and a call operator
//
//   template <class V> TW_INLINE Answer<V> operator()(V lon, V lat) const;
//
// or, for three coordinates, Answer3<V> operator()(V x, V y, V z).  The answer says which lanes are
// `plain`, that is, covered by the formula.  All points of a block plain: the block is stored.
// Otherwise the block is walked in order, point by point, and those that are not plain are handed
// to
//
//   Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
//
// which writes what the contract says of them (nothing, a fill, another formula's value), sets the
// status word, and says whether the array goes on.  A kernel whose formula covers every point has
// no other().
#pragma once

#include "points/lanes.hpp"
#include "tidewater/frame.h"

namespace tidewater::points {

template <class V>
struct Answer {
  V x, y;
  Mask<V> plain = everywhere<V>(true);
};

// An answer that writes the third element too.
template <class V>
struct Answer3 {
  V x, y, z;
  Mask<V> plain = everywhere<V>(true);
};

enum class Next { point, none };  // go on with the next point, or leave the rest as it is

// How many points are worked on at once, narrowest first.
enum class Level { one_by_one, baseline, avx2, avx512 };
inline constexpr int kLevels = 4;

// The widest level of this processor, or what was asked for.  The environment variable
// TIDEWATER_LEVEL ("one_by_one", "baseline", "avx2", "avx512") narrows it: results are the same to
// the last bit at every level.
Level level() noexcept;

// For tests and benchmarks: the level from now on; false, and nothing changed, where the processor
// or the build lacks it.
bool ask_for_level(Level wanted) noexcept;

// Up to this many points are done one by one.  Where every byte counts a kernel is compiled for
// blocks alone, and few points fill one up.
#if defined(TIDEWATER_ONE_WIDTH)
inline constexpr int32_t kFew = 0;
#else
inline constexpr int32_t kFew = 4;
#endif

template <class Kernel>
concept TakesThree = requires(const Kernel& kernel, double v) {
  kernel(v, v, v);
};

// Takes a kernel through the points from `first` on in blocks of the level; answers how far it
// came: the count, or the first of some few points that are left.  Compiled in the level's own
// source.
template <Level level, class Kernel>
int32_t run(const Kernel& kernel, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
            TWstatus* status);

template <class Kernel>
TW_INLINE Next one_point(const Kernel& kernel, const CoordinateTriple& in, CoordinateTriple* out,
                         TWstatus* status) {
  const auto answer = [&] {
    if constexpr (TakesThree<Kernel>) {
      return kernel(in.x, in.y, in.z);
    } else {
      return kernel(in.x, in.y);
    }
  }();
  if constexpr (requires { &Kernel::other; }) {
    if (!answer.plain) [[unlikely]] {
      const Kernel kept = kernel;  // so that the kernel itself may stay in registers
      return kept.other(in, out, status);
    }
  }
  out->x = answer.x;
  out->y = answer.y;
  if constexpr (requires { answer.z; }) out->z = answer.z;
  return Next::point;
}

// A block or more of points: as over_points().
template <class Kernel>
[[gnu::noinline]] TWstatus over_many_points(const Kernel& kernel, int32_t count,
                                            const CoordinateTriple* in, CoordinateTriple* out) {
  TWstatus status = TW_SUCCESS;
#if defined(TIDEWATER_ONE_WIDTH)
  run<Level::baseline>(kernel, count, in, out, &status);
#else
  int32_t i = 0;
  switch (level()) {
#if defined(TIDEWATER_WIDE_LANES)
    case Level::avx512:
      // Below one block of it the narrower one wastes less.
      i = count >= 16 ? run<Level::avx512>(kernel, count, in, out, &status)
                      : run<Level::avx2>(kernel, count, in, out, &status);
      break;
    case Level::avx2:
      i = run<Level::avx2>(kernel, count, in, out, &status);
      break;
#endif
#if defined(TIDEWATER_BASELINE_LANES)
    case Level::baseline:
      i = run<Level::baseline>(kernel, count, in, out, &status);
      break;
#endif
    default:
      break;
  }
  for (; i < count; ++i) {
    if (one_point(kernel, in[i], out + i, &status) == Next::none) break;
  }
#endif
  return status;
}

// The loop over points of every array function: the status word of the whole array.
//
// Inline, and with a copy of the kernel for the road of many points: a kernel of a few points whose
// address nobody takes stays in registers.
template <class Kernel>
TW_INLINE TWstatus over_points(const Kernel& kernel, int32_t count, const CoordinateTriple* in,
                               CoordinateTriple* out) {
  if (count > kFew) {
    const Kernel kept = kernel;
    return over_many_points(kept, count, in, out);
  }
  TWstatus status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    if (one_point(kernel, in[i], out + i, &status) == Next::none) break;
  }
  return status;
}

}  // namespace tidewater::points

// Compiles a kernel for a level in that level's source, and says elsewhere that it is compiled.
#ifndef TIDEWATER_LEVEL
#define TIDEWATER_INSTANCE(Kernel)
#endif
