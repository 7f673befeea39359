// The number of a formula: one double, a register of them, or two registers.
//
// A formula is a template on its number V.  With V = double it works on one point; with Lanes<N>, a
// vector of N doubles by the compilers' own extension, on N; with Pair<Lanes<N>> on twice as many,
// so that one register's work fills the other's waits.  All give the same bits: the same operations
// in the same order, none fused.
//
// Comparisons give a Mask<V>, combined by &, | and !, and used by select().
#pragma once

#include <float.h>
#include <stdint.h>

#if defined(__SSE2__)
#include <immintrin.h>
#elif defined(__aarch64__)
#include <arm_neon.h>
#elif defined(__wasm_simd128__)
#include <wasm_simd128.h>
#endif

// On every function of a formula: a function that stayed a symbol of its own could be linked from
// an object that was compiled for a wider processor.
#define TW_INLINE [[gnu::always_inline]] inline

#if FLT_EVAL_METHOD != 0 && FLT_EVAL_METHOD != 1
#error \
    "Doubles must be rounded at each step: x87 arithmetic gives other figures (-msse2 -mfpmath=sse)"
#endif

namespace tidewater::points {

// --- One double --------------------------------------------------------------------------------

template <class V>
struct NumberTraits;

template <class V>
concept Number = requires {
  typename NumberTraits<V>::Mask;
};

template <class V>
using Mask = typename NumberTraits<V>::Mask;
template <class V>
using Bits = typename NumberTraits<V>::Bits;  // the 64 bits of each double, as signed integers
template <class V>
inline constexpr int kWidth = NumberTraits<V>::kWidth;

template <>
struct NumberTraits<double> {
  using Mask = bool;
  using Bits = int64_t;
  static constexpr int kWidth = 1;
};

TW_INLINE int64_t bits(double v) { return __builtin_bit_cast(int64_t, v); }
TW_INLINE double number(int64_t b) { return __builtin_bit_cast(double, b); }
TW_INLINE bool not_zero(int64_t b) { return b != 0; }
TW_INLINE bool any(bool m) { return m; }
TW_INLINE bool all(bool m) { return m; }
TW_INLINE double sqrt(double v) { return __builtin_sqrt(v); }
TW_INLINE double abs(double v) { return __builtin_fabs(v); }
TW_INLINE double copysign(double v, double sign) { return __builtin_copysign(v, sign); }
TW_INLINE double select(bool m, double a, double b) { return m ? a : b; }
TW_INLINE int64_t select(bool m, int64_t a, int64_t b) { return m ? a : b; }
TW_INLINE int64_t shift_left(int64_t b, int n) {
  return static_cast<int64_t>(static_cast<uint64_t>(b) << n);
}
TW_INLINE int64_t shift_right(int64_t b, int n) { return b >> n; }  // keeps the sign
TW_INLINE double lane(double v, int) { return v; }
TW_INLINE bool lane(bool m, int) { return m; }

// f(i), for the few values that a formula's short road does not cover.
template <class F>
TW_INLINE void mend(bool m, double& result, F f) {
  if (m) [[unlikely]] {
    result = f(0);
  }
}

// --- A register of doubles ---------------------------------------------------------------------

template <int N>
struct Register;
template <>
struct Register<2> {
  typedef double Doubles __attribute__((vector_size(16)));
  typedef int64_t Integers __attribute__((vector_size(16)));
};
template <>
struct Register<4> {
  typedef double Doubles __attribute__((vector_size(32)));
  typedef int64_t Integers __attribute__((vector_size(32)));
};
template <>
struct Register<8> {
  typedef double Doubles __attribute__((vector_size(64)));
  typedef int64_t Integers __attribute__((vector_size(64)));
};

template <int N>
struct LanesMask;
template <int N>
struct LanesBits;

template <int N>
struct Lanes {
  using Vector = typename Register<N>::Doubles;
  Vector v;

  Lanes() = default;
  TW_INLINE Lanes(Vector vector) : v(vector) {}
  // Less nothing, and not nothing plus it: a negative zero stays one.
  TW_INLINE Lanes(double value) : v(value - Vector{}) {
#if defined(__wasm_simd128__)
    // Constants that the compiler does not see through: in the browser the inverse of transverse
    // Mercator is quicker by a twelfth so, and nothing is slower.
    if (__builtin_constant_p(value)) asm("" : "+r"(v));
#endif
  }

  TW_INLINE friend Lanes operator+(Lanes a, Lanes b) { return a.v + b.v; }
  TW_INLINE friend Lanes operator-(Lanes a, Lanes b) { return a.v - b.v; }
  TW_INLINE friend Lanes operator*(Lanes a, Lanes b) { return a.v * b.v; }
  TW_INLINE friend Lanes operator/(Lanes a, Lanes b) { return a.v / b.v; }
  TW_INLINE friend Lanes operator-(Lanes a) { return -a.v; }
  TW_INLINE friend LanesMask<N> operator<(Lanes a, Lanes b) { return {a.v < b.v}; }
  TW_INLINE friend LanesMask<N> operator<=(Lanes a, Lanes b) { return {a.v <= b.v}; }
  TW_INLINE friend LanesMask<N> operator>(Lanes a, Lanes b) { return {a.v > b.v}; }
  TW_INLINE friend LanesMask<N> operator>=(Lanes a, Lanes b) { return {a.v >= b.v}; }
  TW_INLINE friend LanesMask<N> operator==(Lanes a, Lanes b) { return {a.v == b.v}; }
  TW_INLINE friend LanesMask<N> operator!=(Lanes a, Lanes b) { return {a.v != b.v}; }
};

template <int N>
struct LanesBits {
  using Vector = typename Register<N>::Integers;
  Vector v;

  LanesBits() = default;
  TW_INLINE LanesBits(Vector vector) : v(vector) {}
  TW_INLINE LanesBits(int64_t value) : v(Vector{} + value) {}

  TW_INLINE friend LanesBits operator+(LanesBits a, LanesBits b) { return a.v + b.v; }
  TW_INLINE friend LanesBits operator-(LanesBits a, LanesBits b) { return a.v - b.v; }
  TW_INLINE friend LanesBits operator&(LanesBits a, LanesBits b) { return a.v & b.v; }
  TW_INLINE friend LanesBits operator|(LanesBits a, LanesBits b) { return a.v | b.v; }
  TW_INLINE friend LanesBits operator^(LanesBits a, LanesBits b) { return a.v ^ b.v; }
};

template <int N>
struct LanesMask {
  typename LanesBits<N>::Vector m;  // all bits of a lane set, or none

  TW_INLINE friend LanesMask operator&(LanesMask a, LanesMask b) { return {a.m & b.m}; }
  TW_INLINE friend LanesMask operator|(LanesMask a, LanesMask b) { return {a.m | b.m}; }
  TW_INLINE friend LanesMask operator!=(LanesMask a, LanesMask b) { return {a.m ^ b.m}; }
  TW_INLINE friend LanesMask operator!(LanesMask a) { return {~a.m}; }
};

template <int N>
struct NumberTraits<Lanes<N>> {
  using Mask = LanesMask<N>;
  using Bits = LanesBits<N>;
  static constexpr int kWidth = N;
};

template <int N>
TW_INLINE LanesBits<N> bits(Lanes<N> a) {
  return __builtin_bit_cast(typename LanesBits<N>::Vector, a.v);
}
template <int N>
TW_INLINE Lanes<N> number(LanesBits<N> a) {
  return __builtin_bit_cast(typename Lanes<N>::Vector, a.v);
}
template <int N>
TW_INLINE LanesMask<N> not_zero(LanesBits<N> a) {
  return {a.v != typename LanesBits<N>::Vector{}};
}
template <int N>
TW_INLINE LanesBits<N> shift_left(LanesBits<N> a, int n) {
  return a.v << n;
}
template <int N>
TW_INLINE LanesBits<N> shift_right(LanesBits<N> a, int n) {
  return a.v >> n;
}
template <int N>
TW_INLINE double lane(Lanes<N> a, int i) {
  return a.v[i];
}
template <int N>
TW_INLINE bool lane(LanesMask<N> a, int i) {
  return a.m[i] != 0;
}

template <int N>
TW_INLINE bool any(LanesMask<N> a) {
#if defined(__AVX512DQ__)
  if constexpr (N == 8) return _mm512_movepi64_mask(__builtin_bit_cast(__m512i, a.m)) != 0;
#endif
#if defined(__AVX__)
  if constexpr (N == 4) return _mm256_movemask_pd(__builtin_bit_cast(__m256d, a.m)) != 0;
#endif
#if defined(__SSE2__)
  if constexpr (N == 2) return _mm_movemask_pd(__builtin_bit_cast(__m128d, a.m)) != 0;
#elif defined(__wasm_simd128__)
  if constexpr (N == 2) return wasm_v128_any_true(__builtin_bit_cast(v128_t, a.m));
#endif
  int64_t either = 0;
  for (int i = 0; i < N; ++i) either |= a.m[i];
  return either != 0;
}
template <int N>
TW_INLINE bool all(LanesMask<N> a) {
  return !any(!a);
}

template <int N>
TW_INLINE Lanes<N> select(LanesMask<N> m, Lanes<N> a, Lanes<N> b) {
#if defined(__SSE2__) && !defined(__SSE4_1__)
  // Without a blend the compilers test lane by lane.
  const auto x = bits(a).v, y = bits(b).v;
  return number(LanesBits<N>((x & m.m) | (y & ~m.m)));
#else
  return m.m ? a.v : b.v;
#endif
}
template <int N>
TW_INLINE Lanes<N> select(LanesMask<N> m, Lanes<N> a, double b) {
  return select(m, a, Lanes<N>(b));
}
template <int N>
TW_INLINE Lanes<N> select(LanesMask<N> m, double a, Lanes<N> b) {
  return select(m, Lanes<N>(a), b);
}

template <int N>
TW_INLINE Lanes<N> abs(Lanes<N> a) {
#if defined(__wasm_simd128__)
  return __builtin_bit_cast(typename Lanes<N>::Vector,
                            wasm_f64x2_abs(__builtin_bit_cast(v128_t, a.v)));
#else
  return number(bits(a) & LanesBits<N>(INT64_MAX));
#endif
}
template <int N>
TW_INLINE Lanes<N> copysign(Lanes<N> a, Lanes<N> sign) {
  return number((bits(a) & LanesBits<N>(INT64_MAX)) | (bits(sign) & LanesBits<N>(INT64_MIN)));
}

template <int N>
TW_INLINE Lanes<N> sqrt(Lanes<N> a) {
#if defined(__AVX512F__)
  // The masked form: GCC 12 warns of an uninitialised source in the plain one.
  if constexpr (N == 8) {
    return __builtin_bit_cast(typename Lanes<N>::Vector,
                              _mm512_maskz_sqrt_pd(0xff, __builtin_bit_cast(__m512d, a.v)));
  }
#endif
#if defined(__AVX__)
  if constexpr (N == 4) {
    return __builtin_bit_cast(typename Lanes<N>::Vector,
                              _mm256_sqrt_pd(__builtin_bit_cast(__m256d, a.v)));
  }
#endif
#if defined(__SSE2__)
  if constexpr (N == 2) {
    return __builtin_bit_cast(typename Lanes<N>::Vector,
                              _mm_sqrt_pd(__builtin_bit_cast(__m128d, a.v)));
  }
#elif defined(__aarch64__)
  if constexpr (N == 2) {
    return __builtin_bit_cast(typename Lanes<N>::Vector,
                              vsqrtq_f64(__builtin_bit_cast(float64x2_t, a.v)));
  }
#elif defined(__wasm_simd128__)
  if constexpr (N == 2) {
    return __builtin_bit_cast(typename Lanes<N>::Vector,
                              wasm_f64x2_sqrt(__builtin_bit_cast(v128_t, a.v)));
  }
#endif
  typename Lanes<N>::Vector r{};
  for (int i = 0; i < N; ++i) r[i] = __builtin_sqrt(a.v[i]);
  return r;
}

// f(i) in place of each lane i that the mask names.
template <int N, class F>
TW_INLINE void mend(LanesMask<N> m, Lanes<N>& result, F f) {
  if (any(m)) [[unlikely]] {
    // Not unrolled: that would keep parts of the lanes at hand on the road that every block goes.
#pragma GCC unroll 1
    for (int i = 0; i < N; ++i) {
      if (m.m[i] != 0) result.v[i] = f(i);
    }
  }
}

// The doubles that stand at whole offsets from one place.
TW_INLINE double gather(const double* from, int64_t offset) { return from[offset]; }
template <int N>
TW_INLINE Lanes<N> gather(const double* from, LanesBits<N> offset) {
  typename Lanes<N>::Vector r{};
  for (int i = 0; i < N; ++i) r[i] = from[offset.v[i]];
  return r;
}

// --- Two registers -----------------------------------------------------------------------------

template <class T>
struct Pair {
  T a, b;

  Pair() = default;
  TW_INLINE Pair(T first, T second) : a(first), b(second) {}
  TW_INLINE Pair(double value) requires Number<T> : a(value), b(value) {}
  TW_INLINE Pair(int64_t value) requires(!Number<T>) && requires { T(value); }
      : a(value), b(value) {}

      TW_INLINE friend auto operator+(Pair p, Pair q) { return Pair(p.a + q.a, p.b + q.b); }
      TW_INLINE friend auto operator-(Pair p, Pair q) { return Pair(p.a - q.a, p.b - q.b); }
      TW_INLINE friend auto operator*(Pair p, Pair q) { return Pair(p.a * q.a, p.b * q.b); }
      TW_INLINE friend auto operator/(Pair p, Pair q) { return Pair(p.a / q.a, p.b / q.b); }
      TW_INLINE friend auto operator-(Pair p) { return Pair(-p.a, -p.b); }
      TW_INLINE friend auto operator&(Pair p, Pair q) { return Pair(p.a & q.a, p.b & q.b); }
      TW_INLINE friend auto operator|(Pair p, Pair q) { return Pair(p.a | q.a, p.b | q.b); }
      TW_INLINE friend auto operator^(Pair p, Pair q) { return Pair(p.a ^ q.a, p.b ^ q.b); }
      TW_INLINE friend auto operator!(Pair p) { return Pair(!p.a, !p.b); }
      TW_INLINE friend auto operator<(Pair p, Pair q) { return pair(p.a < q.a, p.b < q.b); }
      TW_INLINE friend auto operator<=(Pair p, Pair q) { return pair(p.a <= q.a, p.b <= q.b); }
      TW_INLINE friend auto operator>(Pair p, Pair q) { return pair(p.a > q.a, p.b > q.b); }
      TW_INLINE friend auto operator>=(Pair p, Pair q) { return pair(p.a >= q.a, p.b >= q.b); }
      TW_INLINE friend auto operator==(Pair p, Pair q) { return pair(p.a == q.a, p.b == q.b); }
      TW_INLINE friend auto operator!=(Pair p, Pair q) { return pair(p.a != q.a, p.b != q.b); }

      template <class U>
      TW_INLINE static Pair<U> pair(U first, U second) {
        return Pair<U>(first, second);
      }
};

template <class T>
struct NumberTraits<Pair<T>> {
  using Mask = Pair<typename NumberTraits<T>::Mask>;
  using Bits = Pair<typename NumberTraits<T>::Bits>;
  static constexpr int kWidth = 2 * NumberTraits<T>::kWidth;
};

template <class T>
TW_INLINE auto bits(Pair<T> p) {
  return Pair(bits(p.a), bits(p.b));
}
template <class T>
TW_INLINE auto number(Pair<T> p) {
  return Pair(number(p.a), number(p.b));
}
template <class T>
TW_INLINE auto not_zero(Pair<T> p) {
  return Pair(not_zero(p.a), not_zero(p.b));
}
template <class T>
TW_INLINE auto shift_left(Pair<T> p, int n) {
  return Pair(shift_left(p.a, n), shift_left(p.b, n));
}
template <class T>
TW_INLINE auto shift_right(Pair<T> p, int n) {
  return Pair(shift_right(p.a, n), shift_right(p.b, n));
}
template <class T>
TW_INLINE bool any(Pair<T> p) {
  return any(p.a | p.b);
}
template <class T>
TW_INLINE bool all(Pair<T> p) {
  return all(p.a & p.b);
}
template <class M, class T>
TW_INLINE Pair<T> select(Pair<M> m, Pair<T> p, Pair<T> q) {
  return Pair<T>(select(m.a, p.a, q.a), select(m.b, p.b, q.b));
}
template <class M, class T>
TW_INLINE Pair<T> select(Pair<M> m, Pair<T> p, double q) {
  return Pair<T>(select(m.a, p.a, q), select(m.b, p.b, q));
}
template <class M, class T>
TW_INLINE Pair<T> select(Pair<M> m, double p, Pair<T> q) {
  return Pair<T>(select(m.a, p, q.a), select(m.b, p, q.b));
}
template <class T>
TW_INLINE Pair<T> abs(Pair<T> p) {
  return Pair<T>(abs(p.a), abs(p.b));
}
template <class T>
TW_INLINE Pair<T> copysign(Pair<T> p, Pair<T> sign) {
  return Pair<T>(copysign(p.a, sign.a), copysign(p.b, sign.b));
}
template <class T>
TW_INLINE Pair<T> sqrt(Pair<T> p) {
  return Pair<T>(sqrt(p.a), sqrt(p.b));
}
template <class B>
TW_INLINE auto gather(const double* from, Pair<B> offset) {
  return Pair(gather(from, offset.a), gather(from, offset.b));
}
template <class T>
TW_INLINE auto lane(Pair<T> p, int i) {
  constexpr int half = sizeof(T) / sizeof(double);
  return i < half ? lane(p.a, i) : lane(p.b, i - half);
}
template <class M, class T, class F>
TW_INLINE void mend(Pair<M> m, Pair<T>& result, F f) {
  if (any(m)) [[unlikely]] {
    mend(m.a, result.a, f);
    mend(m.b, result.b, [&](int i) { return f(i + kWidth<T>); });
  }
}

// --- For every number --------------------------------------------------------------------------

// The mask that says the same of every lane.
template <Number V>
TW_INLINE Mask<V> everywhere(bool value) {
  return V(value ? 1.0 : 0.0) != V(0.0);
}

template <Number V>
TW_INLINE constexpr V square(V v) {
  return v * v;
}
template <Number V>
TW_INLINE constexpr V cube(V v) {
  return v * v * v;
}
template <Number V>
TW_INLINE V copysign(V v, double sign) requires(!__is_same(V, double)) {
  return copysign(v, V(sign));
}
template <Number V>
TW_INLINE V copysign(double v, V sign) requires(!__is_same(V, double)) {
  return copysign(V(v), sign);
}

// The lesser and the greater; the second where one is a not-a-number or both are zeros.
template <Number V>
TW_INLINE V lesser(V a, V b) {
  return select(a < b, a, b);
}
template <Number V>
TW_INLINE V greater(V a, V b) {
  return select(a > b, a, b);
}
#if defined(__SSE2__)
// The processor's own have exactly this rule.
template <int N>
TW_INLINE Lanes<N> lesser(Lanes<N> a, Lanes<N> b) {
#if defined(__AVX512F__)
  if constexpr (N == 8) return _mm512_maskz_min_pd(0xff, a.v, b.v);
#endif
#if defined(__AVX__)
  if constexpr (N == 4) return _mm256_min_pd(a.v, b.v);
#endif
  if constexpr (N == 2) return _mm_min_pd(a.v, b.v);
}
template <int N>
TW_INLINE Lanes<N> greater(Lanes<N> a, Lanes<N> b) {
#if defined(__AVX512F__)
  if constexpr (N == 8) return _mm512_maskz_max_pd(0xff, a.v, b.v);
#endif
#if defined(__AVX__)
  if constexpr (N == 4) return _mm256_max_pd(a.v, b.v);
#endif
  if constexpr (N == 2) return _mm_max_pd(a.v, b.v);
}
template <class T>
TW_INLINE Pair<T> lesser(Pair<T> p, Pair<T> q) {
  return Pair<T>(lesser(p.a, q.a), lesser(p.b, q.b));
}
template <class T>
TW_INLINE Pair<T> greater(Pair<T> p, Pair<T> q) {
  return Pair<T>(greater(p.a, q.a), greater(p.b, q.b));
}
#endif

// The nearest whole number, ties to even; for |v| below 2^51.
template <Number V>
TW_INLINE V nearest_whole(V v) {
  constexpr double kShift = 0x1.8p52;
  return (v + kShift) - kShift;
}

}  // namespace tidewater::points
