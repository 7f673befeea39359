// Geodetic coordinates to and from the earth-centred rectangular frame.
// W. A. Heiskanen and H. Moritz, Physical Geodesy (1967), eq. 5-3; the way back in one step:
// B. R. Bowring, Transformation from spatial to geographical coordinates, Survey Review 23 (1976),
// pp. 323-327, with the auxiliary latitude of B. R. Bowring, The accuracy of geodetic latitude and
// height equations, Survey Review 28 (1985), pp. 202-206.
#pragma once

#include "formulas/radii.hpp"
#include "points/elementary.hpp"

namespace tidewater::detail {

template <class V>
struct Position {
  V x, y, z;
};

// X, Y, Z of longitude, latitude and height on an ellipsoid of semi-major axis a.
template <Number V>
TW_INLINE Position<V> geocentric_position(double a, double e2, V lon, V lat, V height) {
  const auto at = sincos(lat);
  const auto meridian = sincos(lon);
  const V nu = a * normal_radius(e2, at.sin);
  const V from_axis = (nu + height) * at.cos;
  return {from_axis * meridian.cos, from_axis * meridian.sin, ((1 - e2) * nu + height) * at.sin};
}

// Longitude, latitude and height of X, Y, Z off the axis.
class GeodeticPosition {
 public:
  GeodeticPosition(double a, double e)
      : a_(a), e2_(e * e), u_(e2_ * a), v_(sqrt(1 - e2_)), u_over_v_(u_ / v_) {}

  // p is the distance from the axis, r that from the centre.
  template <Number V>
  TW_INLINE Position<V> operator()(V x, V y, V z, V p, V r) const {
    // The auxiliary latitude, tan beta = (1 + u / (r v)) z v / p, by its sine and cosine.
    const V opposite = (r * v_ + u_) * z;
    const V adjacent = r * p;
    const V over = 1.0 / sqrt(square(opposite) + square(adjacent));
    const V rise = z + u_over_v_ * cube(opposite * over);
    const V run = p - u_ * cube(adjacent * over);
    // The latitude is the arc tangent of rise / run, also where run is negative.
    const V up = rise * copysign(1.0, run);
    const V out = abs(run);
    const V over_slope = 1.0 / sqrt(square(rise) + square(run));
    const V sin_lat = up * over_slope;
    // a^2 / N = a w, w = sqrt(1 - e^2 sin^2) = w^2 (1 / w)
    const V w = (1.0 - e2_ * square(sin_lat)) * normal_radius(e2_, sin_lat);
    return {atan2(y, x), atan2(up, out), z * sin_lat + p * (out * over_slope) - a_ * w};
  }

  // Half the polar axis.
  double b() const { return v_ * a_; }

 private:
  double a_, e2_, u_, v_, u_over_v_;
};

}  // namespace tidewater::detail
