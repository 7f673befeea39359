// Formulas of the Bonne projection of the ellipsoid.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp.
// 138-140.
#pragma once

#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "foundation/meridian_arc.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Differences up to this are none.
inline constexpr double kBonneNothing = 1e-12;
// Nearer to a pole every longitude is the central one.
inline constexpr double kBonnePole = kHalfPi - 1e-12;

struct BonneForward {
  double lon0, lat1, e2, c1, r0;
  MeridianArc meridian;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const V d = wrap_turns_below_then_above(lon - lon0);
    const auto on_parallel = abs(lat - lat1) <= kBonneNothing;
    const auto at_origin = on_parallel & (abs(d) <= kBonneNothing);
    const auto at = sincos(lat);
    const auto sphere = everywhere<V>(e2 == 0);
    const auto good = everywhere<V>(meridian.good());
    const auto short_of_poles = !(abs(lat) > kHalfPi);
    const Mask<V> plain = sphere | on_parallel | (good & short_of_poles);
    V r = r0 - lat;
    V angle = at.cos * d / r;
    if (e2 != 0) {
      r = select(on_parallel, c1, r0 - meridian.arc(lat, at));
      angle = select(on_parallel, at.sin * d, d * parallel_radius(e2, at.sin, at.cos) / r);
    }
    const auto turn = sincos(angle);
    return {select(at_origin, 0.0, r * turn.sin), select(at_origin, 0.0, c1 - r * turn.cos), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct BonneInverse {
  double lon0, lat1, e2, c1, r0;
  MeridianArc meridian;
  MeridianFoot foot;

  BonneInverse(double lon, double lat, double e, double square_e, double c, double r)
      : lon0(lon), lat1(lat), e2(square_e), c1(c), r0(r), meridian(1, e), foot(meridian) {}

  // The polar coordinates about the apex, which stand on their heads in the south.
  template <Number V>
  TW_INLINE V radius(V x, V y) const {
    const V r = plain_hypot(x, c1 - y);
    return lat1 < 0 ? -r : r;
  }
  template <Number V>
  TW_INLINE V longitude(V x, V y, V r, V lat) const {
    const auto at = sincos(lat);
    const V m = e2 != 0 ? parallel_radius(e2, at.sin, at.cos) : at.cos;
    const V dy = c1 - y;
    const V angle = lat1 < 0 ? atan2(-x, -dy) : atan2(x, dy);
    return turns_about(lon0, select(abs(lat) <= kBonnePole, angle * r / m + lon0, lon0));
  }

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto no_x = abs(x) <= kBonneNothing;
    const auto no_y = abs(y) <= kBonneNothing;
    const Mask<V> at_origin = no_x & no_y;
    const V r = radius(x, y);
    V lat = r0 - r;
    Mask<V> plain = everywhere<V>(true);
    if (e2 != 0) {
      const auto served = everywhere<V>(foot.serves());
      const auto in_reach = abs(lat) <= foot.quarter();
      plain = served & in_reach;
      lat = foot.latitude(select(plain, lat, 0.0));
      const auto on_earth = abs(lat) <= kHalfPi;
      plain = at_origin | (plain & on_earth);
    }
    return {select(at_origin, lon0, longitude(x, y, r, lat)), select(at_origin, lat1, lat), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct BonneScale {
  double k0, lat1, lon0, r0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const V d = wrap_turns_below_then_above(lon - lon0);
    // By contract: a latitude is tested only off the central meridian and the standard parallel.
    const auto off_meridian = abs(d) > kBonneNothing;
    const auto off_parallel = abs(lat - lat1) > kBonneNothing;
    const Mask<V> off = off_meridian & off_parallel;
    const auto beyond = abs(lat) - kHalfPi > kBonneNothing;
    const Mask<V> plain = !(off & beyond);
    const auto at = sincos(lat);
    const V r = r0 - lat;
    const V g = (at.cos - r * at.sin) / r * d;
    const V h = select(off, sqrt(g * g + 1.0), 1.0);
    return {V(k0), k0 * h, V(k0 * k0), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::BonneForward)
TIDEWATER_INSTANCE(tidewater::detail::BonneInverse)
TIDEWATER_INSTANCE(tidewater::detail::BonneScale)
