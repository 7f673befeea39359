// Meridian arc of an ellipsoid and its inverse, for callers that work through an array.
#pragma once

#include "tidewater/frame.h"

namespace tidewater::detail {

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

 private:
  double tail(double lat) const;        // T(p)
  double tail_slope(double lat) const;  // dT/dp

  double a_;
  bool sphere_;
  TWstatus bad_ = TW_SUCCESS;  // what is wrong with the ellipsoid, if anything
  double n_ = 0, g_ = 0, mean_ = 0;
  double t0_ = 0, t1_ = 0, t2_ = 0, t3_ = 0;  // coefficients of T by rising power of cos 2p
};

}  // namespace tidewater::detail
