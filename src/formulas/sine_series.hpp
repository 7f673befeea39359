// Series in the sines of the even multiples of a latitude, summed in powers of one cosine.
#pragma once

#include "points/lanes.hpp"

namespace tidewater::detail {

// s[0] sin 2p + s[1] sin 4p + ... = sin 2p times a polynomial in cos 2p, since sin 2kp is sin 2p
// times the Chebyshev polynomial of the second kind U_(k-1)(cos 2p).  The coefficients of these
// series fall so fast that nothing is lost in the change.
// M. Abramowitz and I. A. Stegun, Handbook of Mathematical Functions (1964), eq. 22.3.16.
template <int N>
struct SineSeries {
  static_assert(N % 2 == 0);
  double p[N];  // by rising power of cos 2p

  static constexpr SineSeries of(const double (&s)[N]) {
    SineSeries series = {};
    double before[N] = {};  // U_(k-2)
    double u[N] = {1};      // U_(k-1)
    for (int k = 0; k < N; ++k) {
      for (int j = 0; j <= k; ++j) series.p[j] += s[k] * u[j];
      double next[N] = {};
      for (int j = 0; j < N; ++j) next[j] = (j > 0 ? 2 * u[j - 1] : 0) - before[j];
      for (int j = 0; j < N; ++j) {
        before[j] = u[j];
        u[j] = next[j];
      }
    }
    return series;
  }

  template <points::Number V>
  TW_INLINE V sum(V sin2, V cos2) const {
    const V q = cos2 * cos2;
    V r = p[N - 2] + p[N - 1] * cos2;
    for (int k = N - 4; k >= 0; k -= 2) r = (p[k] + p[k + 1] * cos2) + q * r;
    return r * sin2;
  }
};

}  // namespace tidewater::detail
