// Lines as kernels of four numbers in and four out, compiled once for each level.  What a kernel
// says of lines that are not plain, other(), stands in lines.cpp.
#pragma once

#include <cstddef>

#include "formulas/geodesic.hpp"
#include "formulas/rhumb.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

inline constexpr int kLineNumbers = 4;

struct LineArrays {
  const double* in[kLineNumbers];  // null: zero
  double* out[kLineNumbers];       // null: not wanted
};

template <Number V>
struct LineAnswer {
  V value[kLineNumbers];
  Mask<V> plain;
};

// Angles beyond have lost their degrees, lengths theirs.
inline constexpr double kFarAngle = 1e9;
inline constexpr double kFarLength = 1e5;  // semi-major axes

// Latitudes end at the poles; a not-a-number is beyond.
template <Number V>
TW_INLINE Mask<V> on_earth(V lon, V lat) {
  return (abs(lat) <= 90.0) & (abs(lon) <= kFarAngle);
}

template <Number V>
TW_INLINE Mask<V> on_way(double a, V azimuth, V length) {
  return (abs(azimuth) <= kFarAngle) & (abs(length) <= kFarLength * a);
}

struct GeodesicDirect {
  Geodesics lines;
  bool area;

  template <Number V>
  TW_INLINE LineAnswer<V> operator()(V lon, V lat, V azimuth, V length) const {
    const Mask<V> plain = on_earth(lon, lat) & on_way(lines.a, azimuth, length);
    const auto start = lines.line(sincos_degrees(lat), sincos_degrees(azimuth));
    const auto end = area ? lines.position<true>(start, length) : lines.position(start, length);
    return {
        {wrap_degrees(lon + end.lon * kDegreesPerRadian), atan2_degrees(end.lat_sin, end.lat_cos),
         atan2_degrees(end.azimuth.sin, end.azimuth.cos), end.area},
        plain};
  }
  LineAnswer<double> other(const double* in) const;
};

// Points along one line: the length alone is read.
struct GeodesicAlong {
  Geodesics lines;
  Geodesics::Line<double> line;
  double lon;
  bool area;

  template <Number V>
  TW_INLINE LineAnswer<V> operator()(V length, V, V, V) const {
    const Geodesics::Line<V> wide = spread<V>();
    const auto end = area ? lines.position<true>(wide, length) : lines.position(wide, length);
    return {
        {wrap_degrees(lon + end.lon * kDegreesPerRadian), atan2_degrees(end.lat_sin, end.lat_cos),
         atan2_degrees(end.azimuth.sin, end.azimuth.cos), end.area},
        abs(length) <= kFarLength * lines.a};
  }
  LineAnswer<double> other(const double* in) const;

 private:
  template <Number V>
  TW_INLINE static SinCos<V> spread(SinCos<double> at) {
    return {V(at.sin), V(at.cos)};
  }
  template <Number V>
  TW_INLINE Geodesics::Line<V> spread() const {
    Geodesics::Line<V> wide = {spread<V>(line.alpha0),
                               spread<V>(line.sigma1),
                               spread<V>(line.omega1),
                               spread<V>(line.tau1),
                               spread<V>(line.alpha1),
                               V(line.eps),
                               V(line.scale),
                               V(line.b11),
                               {}};
    for (int l = 0; l < 6; ++l) wide.reverted.c[l] = line.reverted.c[l];
    return wide;
  }
};

struct GeodesicInverse {
  Geodesics lines;
  bool area;

  template <Number V>
  TW_INLINE LineAnswer<V> operator()(V lon1, V lat1, V lon2, V lat2) const {
    const Mask<V> fit = on_earth(lon1, lat1) & on_earth(lon2, lat2);
    const V safe1 = select(fit, lat1, 0.0);
    const V safe2 = select(fit, lat2, 0.0);
    const auto arc = area ? lines.many_lines<true>(safe1, lon1, safe2, lon2)
                          : lines.many_lines<false>(safe1, lon1, safe2, lon2);
    const Mask<V> plain = fit & arc.plain;
    return answer(arc, plain);
  }
  LineAnswer<double> other(const double* in) const;

  template <Number V>
  TW_INLINE static LineAnswer<V> answer(const GeodesicArc<V>& arc, Mask<V> plain) {
    return {{arc.length, atan2_degrees(arc.azimuth1.sin, arc.azimuth1.cos),
             atan2_degrees(arc.azimuth2.sin, arc.azimuth2.cos), arc.area},
            plain};
  }
};

struct RhumbDirect {
  RhumbLines lines;

  template <Number V>
  TW_INLINE LineAnswer<V> operator()(V lon, V lat, V azimuth, V length) const {
    const Mask<V> fit = on_earth(lon, lat) & on_way(lines.a, azimuth, length);
    const auto end = lines.direct<true>(select(fit, lat, 0.0), sincos_degrees(azimuth),
                                        select(fit, length, 0.0));
    const V course = wrap_degrees(azimuth);
    const Mask<V> plain = fit & end.plain;
    return {{wrap_degrees(lon + wrap_degrees(end.lon)), end.lat, course, end.area}, plain};
  }
  LineAnswer<double> other(const double* in) const;
};

struct RhumbInverse {
  RhumbLines lines;

  template <Number V>
  TW_INLINE LineAnswer<V> operator()(V lon1, V lat1, V lon2, V lat2) const {
    const auto line = lines.inverse<true>(lat1, lon1, lat2, lon2);
    const V azimuth = atan2_degrees(line.azimuth.sin, line.azimuth.cos);
    const Mask<V> plain = on_earth(lon1, lat1) & on_earth(lon2, lat2);
    return {{line.length, azimuth, azimuth, line.area}, plain};
  }
  LineAnswer<double> other(const double* in) const;
};

// --- the loop ----------------------------------------------------------------------------------

TW_INLINE void load_lanes(double& v, const double* at) { v = *at; }
TW_INLINE void store_lanes(double v, double* at) { *at = v; }
template <int N>
TW_INLINE void load_lanes(Lanes<N>& v, const double* at) {
  __builtin_memcpy(&v, at, sizeof v);
}
template <int N>
TW_INLINE void store_lanes(Lanes<N> v, double* at) {
  __builtin_memcpy(at, &v, sizeof v);
}
template <class T>
TW_INLINE void load_lanes(points::Pair<T>& v, const double* at) {
  load_lanes(v.a, at);
  load_lanes(v.b, at + kWidth<T>);
}
template <class T>
TW_INLINE void store_lanes(points::Pair<T> v, double* at) {
  store_lanes(v.a, at);
  store_lanes(v.b, at + kWidth<T>);
}

// Takes lines in blocks of V; the last, shorter one is filled up with its last line.  Answers how
// many lines have no result.
template <Number V, class Kernel>
TW_INLINE std::size_t take_lines(const Kernel& given_kernel, std::size_t count,
                                 const LineArrays& arrays) {
  // A copy of its own, which no store can change.
  const Kernel kernel = given_kernel;
  constexpr std::size_t W = kWidth<V>;
  std::size_t failed = 0;
  for (std::size_t i = 0; i < count; i += W) {
    const std::size_t lines = count - i < W ? count - i : W;
    double given[kLineNumbers][W];
    for (int k = 0; k < kLineNumbers; ++k) {
      const double* from = arrays.in[k];
      for (std::size_t j = 0; j < W; ++j) {
        given[k][j] = from == nullptr ? 0 : from[i + (j < lines ? j : lines - 1)];
      }
    }
    V in[kLineNumbers];
    for (int k = 0; k < kLineNumbers; ++k) load_lanes(in[k], given[k]);
    const LineAnswer<V> answer = kernel(in[0], in[1], in[2], in[3]);
    double found[kLineNumbers][W];
    for (int k = 0; k < kLineNumbers; ++k) store_lanes(answer.value[k], found[k]);
    if (!all(answer.plain)) {
      for (std::size_t j = 0; j < lines; ++j) {
        if (lane(answer.plain, static_cast<int>(j))) continue;
        const double line[kLineNumbers] = {given[0][j], given[1][j], given[2][j], given[3][j]};
        const LineAnswer<double> one = given_kernel.other(line);
        failed += one.plain ? 0 : 1;
        for (int k = 0; k < kLineNumbers; ++k) found[k][j] = one.value[k];
      }
    }
    for (int k = 0; k < kLineNumbers; ++k) {
      if (arrays.out[k] == nullptr) continue;
      for (std::size_t j = 0; j < lines; ++j) arrays.out[k][i + j] = found[k][j];
    }
  }
  return failed;
}

template <points::Level level, class Kernel>
std::size_t take_lines_at(const Kernel& kernel, std::size_t count, const LineArrays& arrays);

#ifdef TIDEWATER_LEVEL
template <points::Level level, class Kernel>
std::size_t take_lines_at(const Kernel& kernel, std::size_t count, const LineArrays& arrays) {
#if defined(TIDEWATER_ONE_WIDTH)
  // Lines have the longest formulas: one register of them takes half the room of two.
  return take_lines<points::Lanes<2>>(kernel, count, arrays);
#else
  return take_lines<typename points::BlockOf<level>::V>(kernel, count, arrays);
#endif
}
#define TIDEWATER_LINES(Kernel)                                                                  \
  template std::size_t take_lines_at<points::Level::TIDEWATER_LEVEL>(const Kernel&, std::size_t, \
                                                                     const LineArrays&);
TIDEWATER_LINES(GeodesicDirect)
TIDEWATER_LINES(GeodesicAlong)
TIDEWATER_LINES(GeodesicInverse)
TIDEWATER_LINES(RhumbDirect)
TIDEWATER_LINES(RhumbInverse)
#undef TIDEWATER_LINES
#endif

}  // namespace tidewater::detail
