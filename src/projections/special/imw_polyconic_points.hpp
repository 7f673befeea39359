// Formulas of the modified polyconic projection of the International Map of the World, sheet by
// sheet. J. P. Snyder, The modified polyconic projection for the IMW, Cartographica 19 (1982), pp.
// 31-43; Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 131-137, eq.
// 18-22 to 18-47.
#pragma once

#include "foundation/meridian_arc.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

inline constexpr double kSheetHeight = 4 * kPi / 180;
inline constexpr double kSheetNothing = 1e-13;  // what counts as zero
inline constexpr int kSheetPasses = 15;

struct Sheet {
  double e2, lon0, lat1, r1, r2, c, p, q, s, t;
  double sin1, sin2;  // of the bounding parallels
  MeridianArc meridian;

  Sheet(double e, double lon0_, double lat1_, double r1_, double r2_, double c_, double p_,
        double q_, double s_, double t_);

  // The plane point with its words; nothing is written on a failure.
  TWstatus forward(double lon, double lat, double* x, double* y) const;

  // Northing of the bounding parallel in the south at a longitude difference.
  template <Number V>
  TW_INLINE V south_edge_y(V d) const {
    if (abs(sin1) < kSheetNothing) return 0.0;
    return (1.0 - sincos(sin1 * d).cos) * r1;
  }

  // The same as forward() for ordinary points: within the poles and half a turn.
  template <Number V>
  TW_INLINE Answer<V> ordinary(V lon, V lat) const {
    const V d = lon - lon0;
    const auto at = sincos(lat);
    const V m = meridian.arc(lat, at);
    const V xb_mid = t * m + s;
    const V yb_mid = q * m + p;
    const V g = select(lat >= 0.0, 1.0, V(-1.0));
    const V r = at.cos / (at.sin * sqrt(1.0 - e2 * square(at.sin)));
    const V under = r * r - xb_mid * xb_mid;
    const auto flat = abs(lat) < kSheetNothing;  // the equator is a straight line
    const auto on_south_edge = abs(lat - lat1) < kSheetNothing;
    const V yc = select(on_south_edge, 0.0, g * sqrt(under) + yb_mid - r);
    // The meridian is the straight line between its points on the two bounding parallels.
    V xb = d;
    V yb = c;
    if (!(abs(sin2) < kSheetNothing)) {
      const auto north = sincos(sin2 * d);
      xb = north.sin * r2;
      yb = (1.0 - north.cos) * r2 + c;
    }
    V xa = d;
    V ya = 0.0;
    if (!(abs(sin1) < kSheetNothing)) {
      const auto south = sincos(sin1 * d);
      xa = south.sin * r1;
      ya = (1.0 - south.cos) * r1;
    }
    const V slope = (xb - xa) / (yb - ya);
    const V b = (yc + r - ya) * slope + xa;
    const V w = slope * slope + 1.0;
    const V under_x = w * (r * r) - b * b;
    const V x = (b - g * sqrt(under_x) * slope) / w;
    const V under_y = r * r - x * x;
    const V y = yc + r - g * sqrt(under_y);
    const auto real = ((under >= 0.0) | on_south_edge) & (under_x >= 0.0) & (under_y >= 0.0);
    const Mask<V> plain =
        everywhere<V>(meridian.good()) & (abs(lat) <= kHalfPi) & (abs(d) < kPi) & (flat | real);
    return {select(flat, d, x), select(flat, yb_mid, y), plain};
  }
};

struct SheetForward {
  Sheet sheet;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    return sheet.ordinary(lon, lat);
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct SheetInverse {
  Sheet sheet;
  double lat2, over_cos2;

  // By proportion over the forward formula.
  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    V lon = x * over_cos2 + sheet.lon0;
    V lat = lat2;
    Mask<V> moving = everywhere<V>(true);
    Mask<V> plain = everywhere<V>(true);
    for (int passes = 0; passes < kSheetPasses && any(moving); ++passes) {
      const auto c = sheet.ordinary(lon, lat);
      const V d = lon - sheet.lon0;
      plain = plain & (c.plain | !moving);
      moving =
          moving & c.plain & !((abs(x - c.x) < kSheetNothing) & (abs(y - c.y) < kSheetNothing));
      const V w = sheet.south_edge_y(d);
      const V next_lat = select(abs(c.y - w) <= kSheetNothing, sheet.lat1,
                                (lat - sheet.lat1) * (y - w) / (c.y - w) + sheet.lat1);
      const V next_lon = select(abs(c.x) <= kSheetNothing, sheet.lon0, d * x / c.x + sheet.lon0);
      lat = select(moving, next_lat, lat);
      lon = select(moving, next_lon, lon);
    }
    plain = plain & !moving & (abs(lat) <= kHalfPi);
    return {lon, lat, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::SheetForward)
TIDEWATER_INSTANCE(tidewater::detail::SheetInverse)
