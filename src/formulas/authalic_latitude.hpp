// The function q of the equal-area projections, and the geodetic latitude of an authalic one.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), eq. 3-11,
// 3-12; the series back in the third flattening: C. F. F. Karney, On auxiliary latitudes, Survey
// Review 56 (2023), pp. 165-180, eq. A19.
#pragma once

#include "formulas/isometric_latitude.hpp"
#include "formulas/sine_series.hpp"

namespace tidewater::detail {

// Below this eccentricity, which is far below that of any ellipsoid of the earth, the logarithm of
// q as it is printed loses digits.
inline constexpr double kLogarithmEccentricity = 0.01;

// ln((1 - e sin p) / (1 + e sin p)) / 2e, as it is printed.
template <Number V>
TW_INLINE V authalic_logarithm(double e, V sin_lat) {
  const V es = e * sin_lat;
  return 0.5 / e * log((1.0 - es) / (1.0 + es));
}

// q(p) = (1 - e^2) (sin p / (1 - e^2 sin^2 p) - ln((1 - e sin p) / (1 + e sin p)) / 2e), and its
// limit 2 sin p on the sphere.
template <Number V>
TW_INLINE V authalic_q(double e, V sin_lat) {
  if (e == 0) return 2.0 * sin_lat;
  const double e2 = e * e;
  const V x = e2 * square(sin_lat);
  if (abs(e) < kLogarithmEccentricity) {
    // By contract: the printed logarithm where it differs from -atanh(e sin p) / e by more than the
    // last digits, so that the figures stay those of the formula.
    return (sin_lat / (1.0 - x) - authalic_logarithm(e, sin_lat)) * (1 - e2);
  }
  if (abs(e) <= kSeriesEccentricity) {
    // 1 / (1 - x) + atanh(sqrt x) / sqrt x = 2 sum of (k + 1) / (2 k + 1) x^k
    const V x2 = x * x;
    const V high = (5.0 / 9 + x * (6.0 / 11)) + x2 * (7.0 / 13 + x * (8.0 / 15));
    return (2 * (1 - e2)) * sin_lat *
           ((1.0 + x * (2.0 / 3)) + x2 * ((3.0 / 5 + x * (4.0 / 7)) + x2 * high));
  }
  return (sin_lat / (1.0 - x) + eccentric_term(e, sin_lat) / e2) * (1 - e2);
}

// From the authalic latitude xi, sin xi = q(p) / q(pi/2), back to the geodetic latitude p: six
// terms in the third flattening, within 4.4e-16 radians up to e = kSeriesEccentricity.  Beyond, the
// series does not serve.
class AuthalicInverse {
 public:
  explicit AuthalicInverse(double e) : AuthalicInverse(e, third_flattening_of(e)) {}

  // xi is given with its sine and cosine.
  template <Number V>
  TW_INLINE V of_authalic(V xi, V sin_xi, V cos_xi) const {
    return xi + series_.sum(2.0 * sin_xi * cos_xi, (cos_xi - sin_xi) * (cos_xi + sin_xi));
  }

  // The latitude whose q is given; a not-a-number where q is more than that of the pole.
  template <Number V>
  TW_INLINE V of_q(V q) const {
    const V s = q * over_pole_;
    return of_authalic(asin(s), s, sqrt((1.0 - s) * (1.0 + s)));
  }

  double q_of_pole() const { return pole_; }

 private:
  static double third_flattening_of(double e) {
    const double root = sqrt(1 - e * e);
    return (1 - root) / (1 + root);
  }

  AuthalicInverse(double e, double n)
      : pole_(authalic_q(e, 1.0)),
        over_pole_(1 / pole_),
        series_(SineSeries<6>::of(
            {n * (4.0 / 3 +
                  n * (4.0 / 45 + n * (-16.0 / 35 + n * (-2582.0 / 14175 +
                                                         n * (60136.0 / 467775 +
                                                              n * (28112932.0 / 212837625)))))),
             n * n *
                 (46.0 / 45 +
                  n * (152.0 / 945 + n * (-11966.0 / 14175 +
                                          n * (-21016.0 / 51975 + n * (251310128.0 / 638512875))))),
             n * n * n *
                 (3044.0 / 2835 +
                  n * (3802.0 / 14175 + n * (-94388.0 / 66825 + n * (-8797648.0 / 10945935)))),
             n * n * n * n *
                 (6059.0 / 4725 + n * (41072.0 / 93555 + n * (-1472637812.0 / 638512875))),
             n * n * n * n * n * (768272.0 / 467775 + n * (455935736.0 / 638512875)),
             n * n * n * n * n * n * (4210684958.0 / 1915538625)})) {}

  double pole_, over_pole_;
  SineSeries<6> series_;
};

}  // namespace tidewater::detail
