// Meridian arc of an ellipsoid and its inverse, for callers that work through an array.
#pragma once

#include "formulas/constants.hpp"
#include "formulas/sine_series.hpp"
#include "points/elementary.hpp"
#include "tidewater/frame.h"

namespace tidewater::detail {

// The pole of a latitude that lies beyond one.
inline double hold_at_pole(double lat) { return lat < 0 ? -kHalfPi : kHalfPi; }

// The series in the third flattening n = (a - b) / (a + b), carried to n^4 and summed over cos 2p:
// arc = G (A p + T(p)).  Helmert, Die mathematischen und physikalischen Theorieen der hoeheren
// Geodaesie, vol. 1 (1880), p. 46.
class MeridianArc {
 public:
  MeridianArc(double a, double e);

  // Signed arc from the equator to lat, with the words of TWmerid_dist_f.
  TWstatus forward(double lat, double* distance) const;
  // Latitude at a signed arc, with the words of TWmerid_dist_i.
  TWstatus inverse(double distance, double* lat) const;

  // For formulas: whether the ellipsoid is one that the functions above accept, and the arc, for
  // latitudes up to the poles.
  bool good() const { return bad_ == TW_SUCCESS; }
  template <Number V>
  TW_INLINE V arc(V lat, const SinCos<V>& at) const {
    const V cos2 = (at.cos - at.sin) * (at.cos + at.sin);
    const V sum = (((t3_ * cos2 + t2_) * cos2 + t1_) * cos2 + t0_) * (2.0 * at.sin * at.cos);
    return per_radian_ * lat + g_ * sum;
  }

 private:
  friend class MeridianFoot;

  double tail(double lat) const;  // T(p)

  double a_;
  bool sphere_;
  TWstatus bad_ = TW_SUCCESS;  // what is wrong with the ellipsoid, if anything
  double n_ = 0, g_ = 0, mean_ = 0;
  double t0_ = 0, t1_ = 0, t2_ = 0, t3_ = 0;  // coefficients of T by rising power of cos 2p
  double per_radian_ = 0;                     // the arc's mean term
};

// The latitude at an arc, for formulas: by the series in the third flattening, six terms, put right
// for the terms that the arc's own series leaves out.  Within 1e-15 radians of the inverse above on
// the earth's ellipsoids, 1e-13 up to e = 0.1.
class MeridianFoot {
 public:
  explicit MeridianFoot(const MeridianArc& arc);

  // Whether the series serves the ellipsoid.
  bool serves() const { return serves_; }
  // The mean term of the quarter meridian: a longer arc has no latitude.
  double quarter() const { return quarter_; }

  template <Number V>
  TW_INLINE V latitude(V distance) const {
    const V mu = distance * over_per_radian_;
    const auto at = sincos(mu);
    return mu + series_.sum(2.0 * at.sin * at.cos, (at.cos - at.sin) * (at.cos + at.sin));
  }

 private:
  bool serves_;
  double quarter_, over_per_radian_;
  SineSeries<6> series_;
};

}  // namespace tidewater::detail
