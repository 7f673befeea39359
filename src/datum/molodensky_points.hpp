// Formulas of the standard Molodensky shift of geodetic coordinates between two ellipsoids.
// IOGP Publication 373-7-2, Geomatics Guidance Note 7, part 2 (2022), section 4.4.2; Defense
// Mapping Agency Technical Report 8350.2 (1991), section 7.
#pragma once

#include "formulas/radii.hpp"
#include "points/elementary.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Beyond 89 degrees the formula is ill-conditioned, and a point goes by geocentric coordinates.
inline constexpr double kGeocentricLimit = 89 * kPi / 180;

struct MolodenskyDatum {
  double a, e, e2, r;  // of the source; r is b / a
  double da, df, dx, dy, dz;
  double target_a, target_e;

  MolodenskyDatum(double source_a, double source_e, double a_shift, double f_shift, double x,
                  double y, double z)
      : a(source_a),
        e(source_e),
        e2(e * e),
        r(sqrt(1 - e2)),
        da(a_shift),
        df(f_shift),
        dx(x),
        dy(y),
        dz(z),
        target_a(a + da) {
    const double f = 1 - r + df;
    target_e = sqrt(2 * f - f * f);
  }

  template <class V>
  struct Shift {
    V lon, lat, height;
  };

  template <Number V>
  TW_INLINE Shift<V> shift(V lon, V lat, V height) const {
    const auto meridian = sincos(lon);
    const auto at = sincos(lat);
    const V unit_nu = normal_radius(e2, at.sin);
    const V w2 = 1.0 - e2 * square(at.sin);
    const V nu = a * unit_nu;
    const V rho = ((1 - e2) * nu) * square(unit_nu);
    const V along = dx * meridian.cos + dy * meridian.sin;
    const V dlat = ((rho * (1 / r) + r * nu) * at.cos * at.sin * df - along * at.sin +
                    e2 * at.cos * at.sin * unit_nu * da + dz * at.cos) /
                   (rho + height);
    const V dlon = (dy * meridian.cos - dx * meridian.sin) / ((nu + height) * at.cos);
    // a / N = sqrt(1 - e^2 sin^2)
    const V dh = along * at.cos + dz * at.sin - (w2 * unit_nu) * da + square(at.sin) * r * nu * df;
    return {dlon, dlat, dh};
  }
};

struct MolodenskyForward {
  MolodenskyDatum datum;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat, V height) const {
    const auto d = datum.shift(lon, lat, height);
    return {lon + d.lon, lat + d.lat, height + d.height, !(abs(lat) > kGeocentricLimit)};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

struct MolodenskyInverse {
  MolodenskyDatum datum;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat, V height) const {
    // By contract: two passes, no test of convergence.
    const auto first = datum.shift(lon, lat, height);
    const auto d = datum.shift(lon - first.lon, lat - first.lat, height - first.height);
    return {lon - d.lon, lat - d.lat, height - d.height, !(abs(lat) > kGeocentricLimit)};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::MolodenskyForward)
TIDEWATER_INSTANCE(tidewater::detail::MolodenskyInverse)
