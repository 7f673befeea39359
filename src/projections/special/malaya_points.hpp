// Grid of Malaya as a pair of bivariate polynomials, fitted to the rectified skew orthomorphic
// projection: M. Hotine, The orthomorphic projection of the spheroid, Empire Survey Review 8-9
// (1946-47).
#pragma once

#include "formulas/constants.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// The table has four rows: 0 and 1 go forward, 2 and 3 back.
inline constexpr int kMalayaRow = 21;
inline constexpr double kMetresPerChain = 20.1167824946;
inline constexpr double kRadiansPerSecond = 4.84813681109536e-6;

template <class V>
struct MalayaSums {
  V E, N;
};

// Two polynomials of degree five in p and q: by powers of q, each coefficient by Horner in p.
template <Number V>
TW_INLINE MalayaSums<V> malaya_sums(const double* R, const double* S, V p, V q) {
  MalayaSums<V> sum = {V(R[0]), V(S[0])};
  int i = 1;
  for (int m = 0; m < 5; ++m) {
    V a = R[i];
    V b = S[i];
    ++i;
    for (int k = 0; k <= m; ++k, ++i) {
      a = a * p + R[i];
      b = b * p + S[i];
    }
    sum.E = sum.E * q + a;
    sum.N = sum.N * q + b;
  }
  return sum;
}

struct MalayaForward {
  const double* table;
  double lon0, lat0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    // The semi-major axis is that of Everest 1830 Modified.
    constexpr double kUnit = kMetresPerChain / 6377304.063 / 0.99984;
    const auto [E, N] = malaya_sums(table, table + kMalayaRow, lon - lon0, lat - lat0);
    return {(0.8 * E - 0.6 * N) * kUnit, (0.6 * E + 0.8 * N) * kUnit};
  }
};

struct MalayaInverse {
  const double* table;
  double lon0, lat0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V given_x, V given_y) const {
    // By contract: metres, not units of the semi-major axis.
    const V x = given_x * (1 / kMetresPerChain);
    const V y = given_y * (1 / kMetresPerChain);
    const V X = 0.8 * y - 0.6 * x + 24000.0;
    const V Y = 0.6 * y + 0.8 * x - 32000.0;
    const auto [E, N] = malaya_sums(table + 2 * kMalayaRow, table + 3 * kMalayaRow,
                                    (X - 27490.8082) * 1e-5, Y * 1e-5);
    return {N * kRadiansPerSecond + lon0, E * kRadiansPerSecond + lat0};
  }
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::MalayaForward)
TIDEWATER_INSTANCE(tidewater::detail::MalayaInverse)
