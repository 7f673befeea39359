// Formulas of the Cassini projection of the ellipsoid, series about the central meridian.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 92-95.
#pragma once

#include "formulas/meridian_series.hpp"
#include "formulas/pole_hold.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

struct CassiniForward {
  double e2, ep2, lon0, m0;  // ep2 = e^2 / (1 - e^2)
  ArcSeries meridian;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    const auto at = sincos(lat);
    const V tangent = at.sin / at.cos;
    const V nu = normal_radius(e2, at.sin);
    const V T = square(tangent);
    const V C = ep2 * (1.0 - square(at.sin));
    const V A = wrap_turns_below_then_above(lon - lon0) * at.cos;
    const V A2 = square(A);
    const V A2T = A2 * T;
    return {A * nu * (1.0 - A2T * (1.0 / 6 + (8.0 - T + 8.0 * C) * A2 * (1.0 / 120))),
            A2 * (0.5 + (5.0 - T + 6.0 * C) * A2 * (1.0 / 24)) * tangent * nu +
                (meridian.arc(lat, at) - m0)};
  }
};

struct CassiniInverse {
  double e2, lon0, over_c0, m0, over_polar2;  // over_polar2 = 1 / (1 - e^2)
  FootSeries foot_series;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto foot = foot_series.latitude_and_sines((m0 + y) * over_c0);
    const auto at_pole = abs(abs(foot.lat) - kHalfPi) < 1e-12;
    const V over_cos = 1.0 / foot.at.cos;
    const V tangent = foot.at.sin * over_cos;
    const V T = square(tangent);
    const V W = 1.0 - square(foot.at.sin) * e2;  // nu / rho = W / (1 - e^2)
    const V D = x * (W * normal_radius(e2, foot.at.sin));
    const V D2 = square(D);
    const V Q = 3.0 * T + 1.0;
    const V lon = D * (1.0 - D2 * T * (1.0 / 3 - Q * D2 * (1.0 / 15))) * over_cos + lon0;
    const V lat = foot.lat - D2 * (0.5 - Q * D2 * (1.0 / 24)) * tangent * (W * over_polar2);
    return {select(at_pole, lon0, lon),
            select(at_pole, select(y < 0.0, -kHalfPi, V(kHalfPi)), lat)};
  }
};

// At the plane's x, with the latitude beside it.
struct CassiniScale {
  double e2, k0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V x, V /*y*/, V lat) const {
    const auto plain = !((lat > kHalfPi) | (lat < -kHalfPi));
    const V s = sincos(hold_off_poles(select(plain, lat, 0.0), 1e-10)).sin;
    const V W = 1.0 - square(s) * e2;
    const V h = (square(x) * square(W) * (1 / ((1 - e2) * 2)) + 1.0) * k0;
    return {V(k0), h, k0 * h, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::CassiniForward)
TIDEWATER_INSTANCE(tidewater::detail::CassiniInverse)
TIDEWATER_INSTANCE(tidewater::detail::CassiniScale)
