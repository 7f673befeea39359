// Meridian arc of the ellipsoid of unit semi-major axis, and the latitude at an arc, by series.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), eq. 3-21, 3-26.
// By contract: the arc's terms in e^8 are not those of the full expansion.  On the earth's
// ellipsoids that makes up to 1.5e-10, a millimetre.
#pragma once

#include <cmath>

#include "formulas/constants.hpp"

namespace tidewater::detail {

// arc(p) = a0 p - a2 sin 2p + a4 sin 4p - a6 sin 6p + a8 sin 8p.
struct ArcSeries {
  double a0, a2, a4, a6, a8;

  static ArcSeries of(double e2) {
    const double e4 = e2 * e2;
    const double e6 = e2 * e4;
    const double e8 = e4 * e4;
    return {1 - e2 / 4 - 3 * e4 / 64 - 5 * e6 / 256 - 175 * e8 / 16384,
            0.375 * (e2 + e4 / 4 + 15 * e6 / 128 - 455 * e8 / 4096),
            0.05859375 * (e4 + 3 * e6 / 4 - 77 * e8 / 128),
            0.011393229166666666 * (e6 - 41 * e8 / 32), -315 * e8 / 131072};
  }

  // The multiple angles follow from the one sine and cosine of the latitude.
  double arc(double lat, double sin_lat, double cos_lat) const {
    const double s2 = square(sin_lat);
    const double sin2 = 2 * cos_lat * sin_lat;
    const double cos2 = square(cos_lat) - s2;
    const double sin4 = (8 * ((1 - s2) * cos_lat) - 4 * cos_lat) * sin_lat;
    const double cos4 = square(cos2) - square(sin2);
    const double sin6 = sin4 * cos2 + cos4 * sin2;
    const double sin8 = 2 * sin4 * cos4;
    return a0 * lat - a2 * sin2 + a4 * sin4 - a6 * sin6 + a8 * sin8;
  }
};

// Latitude at the rectifying latitude u: u + b2 sin 2u + b4 sin 4u + b6 sin 6u + b8 sin 8u.
struct FootSeries {
  double b2, b4, b6, b8;

  static FootSeries of(double e2) {
    const double root = std::sqrt(1 - e2);
    const double e1 = (1 - root) / (1 + root);
    const double e1_2 = e1 * e1;
    const double e1_3 = e1_2 * e1;
    const double e1_4 = e1_2 * e1_2;
    return {3 * e1 / 2 - 27 * e1_3 / 32, 21 * e1_2 / 16 - 55 * e1_4 / 32, 151 * e1_3 / 96,
            1097 * e1_4 / 512};
  }
};

// s2 sin 2p + s4 sin 4p + s6 sin 6p + s8 sin 8p put in order of the powers of cos 2p.
struct CosinePowerSeries {
  double p2, p4, p6, p8;

  static constexpr CosinePowerSeries of(double s2, double s4, double s6, double s8) {
    return {s2 - s6, 2 * s4 - 4 * s8, 4 * s6, 8 * s8};
  }

  constexpr double sum(double sin2, double cos2) const {
    return (((p8 * cos2 + p6) * cos2 + p4) * cos2 + p2) * sin2;
  }
};

// What the projections that use the form in powers of the cosine share.
struct ArcConstants {
  double c0;
  CosinePowerSeries arc;   // of the latitude
  CosinePowerSeries foot;  // of the rectifying latitude

  static ArcConstants of(double e2) {
    const ArcSeries a = ArcSeries::of(e2);
    const FootSeries b = FootSeries::of(e2);
    return {a.a0, CosinePowerSeries::of(-a.a2, a.a4, -a.a6, a.a8),
            CosinePowerSeries::of(b.b2, b.b4, b.b6, b.b8)};
  }

  double meridian_arc(double lat) const {
    return c0 * lat + arc.sum(std::sin(2 * lat), std::cos(2 * lat));
  }
};

}  // namespace tidewater::detail
