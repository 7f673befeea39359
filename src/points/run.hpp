// The loop over blocks of points.  For the generated level sources alone: the level is the
// processor that the including source is compiled for.
#pragma once

#ifndef TIDEWATER_LEVEL
#error "run.hpp belongs to the level sources"
#endif

#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::points {

template <Level level>
struct BlockOf;
template <>
struct BlockOf<Level::baseline> {
  using V = Pair<Lanes<2>>;
};
template <>
struct BlockOf<Level::avx2> {
  using V = Pair<Lanes<4>>;
};
template <>
struct BlockOf<Level::avx512> {
  using V = Pair<Lanes<8>>;
};

template <class T>
struct Three {
  T x, y, z;
};

// Elements i + 3 k of three registers in a row that hold N points.
template <int N>
TW_INLINE Three<Lanes<N>> load(const CoordinateTriple* in) {
  using Vector = typename Lanes<N>::Vector;
  Vector a, b, c;
  const double* at = &in->x;
  __builtin_memcpy(&a, at, sizeof a);
  __builtin_memcpy(&b, at + N, sizeof b);
  __builtin_memcpy(&c, at + 2 * N, sizeof c);
  if constexpr (N == 2) {
    return {__builtin_shufflevector(a, b, 0, 3), __builtin_shufflevector(a, c, 1, 2),
            __builtin_shufflevector(b, c, 0, 3)};
  } else if constexpr (N == 4) {
    // a = x0 y0 z0 x1, b = y1 z1 x2 y2, c = z2 x3 y3 z3
    const Vector xy = __builtin_shufflevector(b, c, 2, 3, 5, 6);  // x2 y2 x3 y3
    const Vector yz = __builtin_shufflevector(a, b, 1, 2, 4, 5);  // y0 z0 y1 z1
    return {__builtin_shufflevector(a, xy, 0, 3, 4, 6), __builtin_shufflevector(yz, xy, 0, 2, 5, 7),
            __builtin_shufflevector(yz, c, 1, 3, 4, 7)};
  } else {
    const Vector x01 = __builtin_shufflevector(a, b, 0, 3, 6, 9, 12, 15, 0, 0);
    const Vector y01 = __builtin_shufflevector(a, b, 1, 4, 7, 10, 13, 0, 0, 0);
    const Vector z01 = __builtin_shufflevector(a, b, 2, 5, 8, 11, 14, 0, 0, 0);
    return {__builtin_shufflevector(x01, c, 0, 1, 2, 3, 4, 5, 10, 13),
            __builtin_shufflevector(y01, c, 0, 1, 2, 3, 4, 8, 11, 14),
            __builtin_shufflevector(z01, c, 0, 1, 2, 3, 4, 9, 12, 15)};
  }
}

template <class V>
struct Memory;

template <int N>
struct Memory<Lanes<N>> {
  TW_INLINE static Three<Lanes<N>> load_block(const CoordinateTriple* in) { return load<N>(in); }

  // Pairs of x and y; z is not touched.
  TW_INLINE static void store_block(CoordinateTriple* out, Lanes<N> x, Lanes<N> y) {
    typedef double Two __attribute__((vector_size(16)));
    // x and y by turns, of the points with even and with odd numbers.
    typename Lanes<N>::Vector even, odd;
    if constexpr (N == 2) {
      even = __builtin_shufflevector(x.v, y.v, 0, 2);
      odd = __builtin_shufflevector(x.v, y.v, 1, 3);
    } else if constexpr (N == 4) {
      even = __builtin_shufflevector(x.v, y.v, 0, 4, 2, 6);
      odd = __builtin_shufflevector(x.v, y.v, 1, 5, 3, 7);
    } else {
      even = __builtin_shufflevector(x.v, y.v, 0, 8, 2, 10, 4, 12, 6, 14);
      odd = __builtin_shufflevector(x.v, y.v, 1, 9, 3, 11, 5, 13, 7, 15);
    }
    for (int i = 0; i < N; i += 2) {
      const Two first = {even[i], even[i + 1]};
      const Two second = {odd[i], odd[i + 1]};
      __builtin_memcpy(&out[i].x, &first, 16);
      __builtin_memcpy(&out[i + 1].x, &second, 16);
    }
  }

  TW_INLINE static void store_block(CoordinateTriple* out, Lanes<N> x, Lanes<N> y, Lanes<N> z) {
    typename Lanes<N>::Vector a, b, c;
    if constexpr (N == 2) {
      a = __builtin_shufflevector(x.v, y.v, 0, 2);
      b = __builtin_shufflevector(z.v, x.v, 0, 3);
      c = __builtin_shufflevector(y.v, z.v, 1, 3);
    } else if constexpr (N == 4) {
      const auto xy_low = __builtin_shufflevector(x.v, y.v, 0, 4, 1, 5);   // x0 y0 x1 y1
      const auto xy_high = __builtin_shufflevector(x.v, y.v, 2, 6, 3, 7);  // x2 y2 x3 y3
      a = __builtin_shufflevector(xy_low, z.v, 0, 1, 4, 2);
      const auto yz = __builtin_shufflevector(xy_low, z.v, 3, 5, 3, 5);  // y1 z1
      b = __builtin_shufflevector(yz, xy_high, 0, 1, 4, 5);
      c = __builtin_shufflevector(xy_high, z.v, 6, 2, 3, 7);
    } else {
      const auto xy_a = __builtin_shufflevector(x.v, y.v, 0, 8, 0, 1, 9, 0, 2, 10);
      a = __builtin_shufflevector(xy_a, z.v, 0, 1, 8, 3, 4, 9, 6, 7);
      const auto xy_b = __builtin_shufflevector(x.v, y.v, 0, 3, 11, 0, 4, 12, 0, 5);
      b = __builtin_shufflevector(xy_b, z.v, 10, 1, 2, 11, 4, 5, 12, 7);
      const auto xy_c = __builtin_shufflevector(x.v, y.v, 13, 0, 6, 14, 0, 7, 15, 0);
      c = __builtin_shufflevector(xy_c, z.v, 0, 13, 2, 3, 14, 5, 6, 15);
    }
    double* at = &out->x;
    __builtin_memcpy(at, &a, sizeof a);
    __builtin_memcpy(at + N, &b, sizeof b);
    __builtin_memcpy(at + 2 * N, &c, sizeof c);
  }
};

template <class T>
struct Memory<Pair<T>> {
  static constexpr int kHalf = kWidth<T>;

  TW_INLINE static Three<Pair<T>> load_block(const CoordinateTriple* in) {
    const auto p = Memory<T>::load_block(in);
    const auto q = Memory<T>::load_block(in + kHalf);
    return {Pair<T>(p.x, q.x), Pair<T>(p.y, q.y), Pair<T>(p.z, q.z)};
  }
  TW_INLINE static void store_block(CoordinateTriple* out, Pair<T> x, Pair<T> y) {
    Memory<T>::store_block(out, x.a, y.a);
    Memory<T>::store_block(out + kHalf, x.b, y.b);
  }
  TW_INLINE static void store_block(CoordinateTriple* out, Pair<T> x, Pair<T> y, Pair<T> z) {
    Memory<T>::store_block(out, x.a, y.a, z.a);
    Memory<T>::store_block(out + kHalf, x.b, y.b, z.b);
  }
};

template <class V, class Kernel>
TW_INLINE auto ask(const Kernel& kernel, const CoordinateTriple* block) {
  const auto p = Memory<V>::load_block(block);
  if constexpr (TakesThree<Kernel>) {
    return kernel(p.x, p.y, p.z);
  } else {
    return kernel(p.x, p.y);
  }
}

// A block in which not every point is plain, or which is cut short: in order, point by point.
template <class V, class Kernel, class AnswerOfBlock>
[[gnu::noinline]] Next walk(const Kernel& kernel, const AnswerOfBlock& answer, int points,
                            const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  // Read before anything is written: in and out may be the same array.
  CoordinateTriple given[kWidth<V>];
  for (int j = 0; j < points; ++j) given[j] = in[j];
  for (int j = 0; j < points; ++j) {
    if constexpr (requires { &Kernel::other; }) {
      if (!lane(answer.plain, j)) {
        if (kernel.other(given[j], out + j, status) == Next::none) return Next::none;
        continue;
      }
    }
    out[j].x = lane(answer.x, j);
    out[j].y = lane(answer.y, j);
    if constexpr (requires { answer.z; }) out[j].z = lane(answer.z, j);
  }
  return Next::point;
}

template <Level level, class Kernel>
int32_t run(const Kernel& given_kernel, int32_t count, const CoordinateTriple* in,
            CoordinateTriple* out, TWstatus* status) {
  using V = typename BlockOf<level>::V;
  constexpr int W = kWidth<V>;
  // A copy of its own, which no store through out can change: its members stay in registers.
  const Kernel kernel = given_kernel;
  CoordinateTriple last[W];
  int32_t i = 0;
  while (count - i > kFew || (W <= kFew && count - i >= W)) {
    const int points = count - i < W ? count - i : W;
    const CoordinateTriple* block = in + i;
    if (points < W) [[unlikely]] {  // the last block is filled up with its last point
      for (int j = 0; j < W; ++j) last[j] = block[j < points ? j : points - 1];
      block = last;
    }
    const auto answer = ask<V>(kernel, block);
    const bool whole = points == W;
    const bool plain = all(answer.plain);
    if (whole && plain) [[likely]] {
      if constexpr (requires { answer.z; }) {
        Memory<V>::store_block(out + i, answer.x, answer.y, answer.z);
      } else {
        Memory<V>::store_block(out + i, answer.x, answer.y);
      }
    } else {
      const auto kept = answer;  // so that the answer itself may stay in registers
      if (walk<V>(given_kernel, kept, points, in + i, out + i, status) == Next::none) return count;
    }
    i += points;
  }
  return i;
}

}  // namespace tidewater::points

#define TIDEWATER_INSTANCE(Kernel)                                                            \
  template int32_t tidewater::points::run<tidewater::points::Level::TIDEWATER_LEVEL, Kernel>( \
      const Kernel&, int32_t, const CoordinateTriple*, CoordinateTriple*, TWstatus*);
