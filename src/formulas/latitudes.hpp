// The auxiliary latitudes into each other, and the arc of the meridian.
//
// By series in the third flattening n to n^8: C. F. F. Karney, On auxiliary latitudes, Survey
// Review 56 (2023), pp. 165-180; coefficients by scripts/series/latitudes.py.  Measured against 50
// digits: within 3e-16 radians (2 nm on the earth) for e up to 0.1.  Truncation, relative, is about
// 20 n^9: kLargestSeriesN keeps it below rounding.  Beyond, exact_latitude() has the closed forms
// and iterates where there are none.
#pragma once

#include <cmath>
#include <limits>

#include "formulas/latitude_coefficients.hpp"
#include "formulas/series.hpp"
#include "points/portable.hpp"

namespace tidewater::detail {

enum class Latitude { geodetic, reduced, rectifying, conformal, authalic };

// The series keep the digits of a double up to here: e = 0.2.
inline constexpr double kLargestSeriesN = 0.01;

inline double third_flattening(double f) { return f / (2 - f); }

// One latitude from another: lat + sum of c[k - 1] sin(2 k lat).
struct LatitudeSeries {
  double c[8];

  LatitudeSeries(const LatitudeCoefficients& table, double n) {
    double power = 1;
    for (int k = 0; k < 8; ++k) {
      power *= n;
      double sum = 0;
      for (int j = 7 - k; j >= 0; --j) sum = sum * n + table.row[k][j];
      c[k] = sum * power;
    }
  }

  // What is to be added to the latitude of this sine and cosine.
  template <Number V>
  TW_INLINE V correction(SinCos<V> at) const {
    return sine_series(c, twice(at));
  }

  template <Number V>
  TW_INLINE V operator()(V lat) const {
    return lat + correction(sincos(lat));
  }
};

// The series for a pair, which must differ.
inline LatitudeSeries latitude_series(Latitude from, Latitude to, double n) {
  static constexpr LatitudeCoefficients kNone = {};
  static constexpr const LatitudeCoefficients* kTables[5][5] = {
      {&kNone, &kReducedFromGeodetic, &kRectifyingFromGeodetic, &kConformalFromGeodetic,
       &kAuthalicFromGeodetic},
      {&kGeodeticFromReduced, &kNone, &kRectifyingFromReduced, &kConformalFromReduced,
       &kAuthalicFromReduced},
      {&kGeodeticFromRectifying, &kReducedFromRectifying, &kNone, &kConformalFromRectifying,
       &kAuthalicFromRectifying},
      {&kGeodeticFromConformal, &kReducedFromConformal, &kRectifyingFromConformal, &kNone,
       &kAuthalicFromConformal},
      {&kGeodeticFromAuthalic, &kReducedFromAuthalic, &kRectifyingFromAuthalic,
       &kConformalFromAuthalic, &kNone},
  };
  return LatitudeSeries(*kTables[static_cast<int>(from)][static_cast<int>(to)], n);
}

// The Fourier coefficient k of |1 - n exp(2 i x)|, halved for k = 0: sums of products of binomials.
// F. W. Bessel, Ueber die Berechnung der geographischen Laengen und Breiten aus geodaetischen
// Vermessungen, Astronomische Nachrichten 4 (1825), section 5.
inline double meridian_coefficient(double n, int k) {
  double one = 1;  // binomial(1/2, j)
  double other = 1;
  for (int i = 0; i < k; ++i) other *= -(0.5 - i) / (i + 1) * n;  // times (-n)^k
  double sum = 0;
  for (int j = 0;; ++j) {
    const double term = one * other;
    sum += term;
    if (std::fabs(term) <= std::fabs(sum) * 1e-18 || j > 4000) return sum;
    one *= (0.5 - j) / (j + 1) * n;
    other *= (0.5 - (j + k)) / (j + k + 1) * n;
  }
}

// Radius of the sphere whose meridian is as long as the ellipsoid's.
inline double rectifying_radius(double a, double f) {
  const double n = third_flattening(f);
  return a / (1 + n) * meridian_coefficient(n, 0);
}

// Radius of the sphere of equal area, squared.
inline double authalic_radius_squared(double a, double f) {
  const double e2 = f * (2 - f);
  const double e = std::sqrt(std::fabs(e2));
  const double q = e2 == 0 ? 1 : (e2 > 0 ? portable::atanh(e) : portable::atan(e)) / e;
  return a * a * 0.5 * (1 + (1 - e2) * q);
}

// The distance along the meridian from the equator, both ways, radians and the unit of a.
struct ExactMeridianArc {
  double radius;  // of the rectifying sphere
  LatitudeSeries to_rectifying, to_geodetic;

  ExactMeridianArc(double a, double f)
      : radius(rectifying_radius(a, f)),
        to_rectifying(kRectifyingFromGeodetic, third_flattening(f)),
        to_geodetic(kGeodeticFromRectifying, third_flattening(f)) {}

  template <Number V>
  TW_INLINE V arc(V lat) const {
    return radius * to_rectifying(lat);
  }
  template <Number V>
  TW_INLINE V latitude(V arc) const {
    return to_geodetic(arc * (1 / radius));
  }
};

// --- beyond the series: any flattening below one, one point at a time --------------------------

namespace exact {

// artanh(e s) / e for e^2 of either sign
inline double eccentric(double e2, double s) {
  const double e = std::sqrt(std::fabs(e2));
  if (e * std::fabs(s) < 1e-8) return s;
  return e2 > 0 ? portable::atanh(e * s) / e : portable::atan(e * s) / e;
}

inline double reduced(double f, double lat) {
  return portable::atan2((1 - f) * portable::sin(lat), portable::cos(lat));
}

inline double conformal(double f, double lat) {
  const double e2 = f * (2 - f);
  const double s = portable::sin(lat);
  const double c = portable::cos(lat);
  const double sigma = portable::sinh(e2 * eccentric(e2, s));
  return portable::atan2(s * std::sqrt(1 + sigma * sigma) - sigma, c);
}

inline double authalic(double f, double lat) {
  const double e2 = f * (2 - f);
  const double s = std::fabs(portable::sin(lat));
  const double c = portable::cos(lat);
  const double q = s / (1 - e2 * s * s) + eccentric(e2, s);
  const double whole = 1 / (1 - e2) + eccentric(e2, 1);
  // whole - q without cancellation towards the pole
  const double t = c * c / (1 + s);  // 1 - s
  const double rest =
      t * (1 + e2 * s) / ((1 - e2) * (1 - e2 * s * s)) + eccentric(e2, t / (1 - e2 * s));
  return std::copysign(portable::atan2(q, std::sqrt(rest * (whole + q))), lat);
}

inline double rectifying(double f, double lat) {
  const double n = third_flattening(f);
  const double beta = reduced(f, lat);
  const double scale = meridian_coefficient(n, 0);
  double sum = 0;
  for (int k = 1; k < 4000; ++k) {
    const double c = meridian_coefficient(n, k) / k;
    sum += c * portable::sin(2 * k * beta);
    if (std::fabs(c) < 1e-18) break;
  }
  return beta + sum / scale;
}

inline double from_geodetic(Latitude to, double f, double lat) {
  switch (to) {
    case Latitude::reduced:
      return reduced(f, lat);
    case Latitude::rectifying:
      return rectifying(f, lat);
    case Latitude::conformal:
      return conformal(f, lat);
    case Latitude::authalic:
      return authalic(f, lat);
    case Latitude::geodetic:
      break;
  }
  return lat;
}

// By secants that stay within a shrinking bracket, one side of the equator at a time.
inline double to_geodetic(Latitude from, double f, double lat) {
  if (from == Latitude::geodetic || !(std::fabs(lat) < kHalfPi)) return lat;
  if (from == Latitude::reduced)
    return portable::atan2(portable::sin(lat), (1 - f) * portable::cos(lat));
  const double wanted = std::fabs(lat);
  double low = 0;
  double high = kHalfPi;
  double below = -wanted;
  double above = kHalfPi - wanted;
  int side = 0;
  // The Illinois variant: an end that stays twice counts half.
  for (int i = 0; i < 200 && high - low > 4e-16 * high; ++i) {
    double x = (low * above - high * below) / (above - below);
    if (!(x > low && x < high)) x = 0.5 * (low + high);
    const double y = from_geodetic(from, f, x) - wanted;
    if (y == 0) return std::copysign(x, lat);
    if (y < 0) {
      low = x;
      below = y;
      if (side < 0) above *= 0.5;
      side = -1;
    } else {
      high = x;
      above = y;
      if (side > 0) below *= 0.5;
      side = 1;
    }
  }
  return std::copysign(-below < above ? low : high, lat);
}

}  // namespace exact

// One latitude from another by closed forms and iteration, for any flattening: within 1e-15 radians
// for e up to 0.9.
inline double exact_latitude(Latitude from, Latitude to, double f, double lat) {
  return from == to ? lat : exact::from_geodetic(to, f, exact::to_geodetic(from, f, lat));
}

}  // namespace tidewater::detail
