// Geodesics on an ellipsoid of revolution: direct and inverse problems and the area under a line,
// several lines at once.
// C. F. F. Karney, Algorithms for geodesics, Journal of Geodesy 87 (2013), pp. 43-55 (equation
// numbers below), with series to the sixth order, whose coefficients scripts/series/geodesics.py
// works out.
//
// Angles come and go as sine and cosine, so that callers choose the unit.  Symbols are the paper's:
// beta the reduced latitude, alpha the azimuth, sigma the arc and omega the longitude on the
// auxiliary sphere, 0 the crossing of the equator, 1 and 2 the ends.
#pragma once

#include <cmath>

#include "formulas/degrees.hpp"
#include "formulas/geodesic_coefficients.hpp"
#include "formulas/latitudes.hpp"
#include "points/portable.hpp"

namespace tidewater::detail {

// The course of a line: what was computed of it.
template <Number V>
struct GeodesicArc {
  V length;
  SinCos<V> azimuth1, azimuth2;
  V area;  // between the line and the equator, positive for eastward lines in the north; if asked
           // for
  Mask<V> plain;
};

struct Geodesics {
  static constexpr double kLargestFlattening = 0.01;
  static constexpr double kTiny = 1.4916681462400413e-154;  // its square is normal

  double a, f, b, f1, e2, ep2, authalic2;
  double i3[6][6];  // [harmonic][power of eps]
  double i4[6][6];

  Geodesics(double semi_major, double flattening)
      : a(semi_major),
        f(flattening),
        b(semi_major * (1 - flattening)),
        f1(1 - flattening),
        e2(flattening * (2 - flattening)),
        ep2(e2 / ((1 - flattening) * (1 - flattening))),
        authalic2(authalic_radius_squared(semi_major, flattening)) {
    const double n = third_flattening(f);
    for (int l = 0; l < 6; ++l) {
      for (int i = 0; i < 6; ++i) {
        i3[l][i] = polynomial(kGeodesicI3[l][i], n);
        i4[l][i] = polynomial(kGeodesicI4[l][i], n);
      }
    }
  }

  // --- series ----------------------------------------------------------------------------------

  template <Number V>
  TW_INLINE static V mean(const double (&table)[4], V eps) {
    return polynomial(table, eps * eps);
  }

  // c[l - 1] = eps^l times the polynomial of eps^2 in row l - 1
  template <Number V>
  struct Harmonics {
    V c[6];

    Harmonics() = default;
    TW_INLINE Harmonics(const double (&table)[6][3], V eps) {
      const V eps2 = eps * eps;
      V power = eps;
      for (int l = 0; l < 6; ++l) {
        V p = table[l][0];
        if (l < 4) p = table[l][0] + eps2 * table[l][1];
        if (l < 2) p = table[l][0] + eps2 * (table[l][1] + eps2 * table[l][2]);
        c[l] = p * power;
        power = power * eps;
      }
    }
    TW_INLINE V at(SinCos<V> sigma) const { return sine_series(c, twice(sigma)); }
  };

  // I3 without its linear term between two arcs, and the mean that belongs to the linear one
  // (eq. 23-25).
  template <Number V>
  TW_INLINE V longitude_lag(V eps, V sigma12, SinCos<V> sigma1, SinCos<V> sigma2) const {
    V c[5];
    V power = eps;
    for (int l = 1; l < 6; ++l) {
      V p = i3[l][5];
      for (int i = 4; i >= l; --i) p = p * eps + i3[l][i];
      c[l - 1] = p * power;
      power = power * eps;
    }
    const V lag = sine_series(c, twice(sigma2)) - sine_series(c, twice(sigma1));
    return polynomial(i3[0], eps) * sigma12 + lag;
  }

  // I4 between two arcs (eq. 62-63).
  template <Number V>
  TW_INLINE V area_between(V eps, SinCos<V> sigma1, SinCos<V> sigma2) const {
    V c[6];
    V power = 1.0;
    for (int l = 0; l < 6; ++l) {
      V p = i4[l][5];
      for (int i = 4; i >= l; --i) p = p * eps + i4[l][i];
      c[l] = p * power;
      power = power * eps;
    }
    return odd_cosines(c, sigma2) - odd_cosines(c, sigma1);
  }

  // The sum of c[l] cos((2 l + 1) x) by Clenshaw's recursion.
  template <Number V>
  TW_INLINE static V odd_cosines(const V (&c)[6], SinCos<V> x) {
    const V step = 2.0 * (x.cos - x.sin) * (x.cos + x.sin);
    V next = 0.0;
    V sum = c[5];
    for (int l = 4; l >= 0; --l) {
      const V before = step * sum - next + c[l];
      next = sum;
      sum = before;
    }
    return x.cos * (sum - next);
  }

  // eps of k^2 (eq. 16)
  template <Number V>
  TW_INLINE static V expansion(V k2) {
    return k2 / (2.0 * (1.0 + sqrt(1.0 + k2)) + k2);
  }

  // --- directions ------------------------------------------------------------------------------

  template <Number V>
  TW_INLINE static SinCos<V> unit(V sin, V cos) {
    const V by = 1.0 / sqrt(sin * sin + cos * cos);
    return {sin * by, cos * by};
  }

  // The reduced latitude (eq. 6), never quite at a pole.
  template <Number V>
  TW_INLINE SinCos<V> reduced(SinCos<V> lat) const {
    const auto beta = unit(f1 * lat.sin, lat.cos);
    return {beta.sin, greater(beta.cos, V(kTiny))};
  }

  template <Number V>
  TW_INLINE static SinCos<V> difference(SinCos<V> from, SinCos<V> to) {
    return {to.sin * from.cos - to.cos * from.sin, to.cos * from.cos + to.sin * from.sin};
  }

  // --- direct ----------------------------------------------------------------------------------

  // A line from a point on: what does not depend on the length.
  template <Number V>
  struct Line {
    SinCos<V> alpha0, sigma1, omega1, tau1, alpha1;
    V eps, scale, b11;
    Harmonics<V> reverted;
  };

  template <Number V>
  TW_INLINE Line<V> line(SinCos<V> lat1, SinCos<V> azimuth1) const {
    const auto beta = reduced(lat1);
    // eq. 5, 10 and the figures 1-2; the equator at right angles is sigma = 0
    const V salp0 = azimuth1.sin * beta.cos;
    const V calp0 = plain_hypot(azimuth1.cos, azimuth1.sin * beta.sin);
    const auto degenerate = (beta.sin == 0.0) & (azimuth1.cos == 0.0);
    const V along = select(degenerate, 1.0, beta.cos * azimuth1.cos);
    const auto sigma1 = unit(beta.sin, along);
    const V k2 = calp0 * calp0 * ep2;
    const V eps = expansion(k2);
    const Harmonics<V> c1(kGeodesicC1, eps);
    const V b11 = c1.at(sigma1);
    return {{salp0, calp0},
            sigma1,
            {salp0 * beta.sin, along},
            turned(sigma1, b11),
            azimuth1,
            eps,
            b * mean(kGeodesicA1, eps) / (1.0 - eps),
            b11,
            Harmonics<V>(kGeodesicC1Reverted, eps)};
  }

  template <Number V>
  struct Position {
    V lat_sin, lat_cos;  // not of one length; their quotient is the tangent
    V lon;               // from the start, radians, within half a turn
    SinCos<V> azimuth;   // not of one length either
    V area;
  };

  template <bool Area = false, Number V>
  TW_INLINE Position<V> position(const Line<V>& line, V length) const {
    const V tau12 = length / line.scale;
    const auto turn = sincos(tau12);
    const SinCos<V> tau2 = {line.tau1.sin * turn.cos + line.tau1.cos * turn.sin,
                            line.tau1.cos * turn.cos - line.tau1.sin * turn.sin};
    const V back = line.reverted.at(tau2);
    const V sigma12 = tau12 + (back + line.b11);
    const auto sigma2 = turned(tau2, back);
    const SinCos<V> omega2 = {line.alpha0.sin * sigma2.sin, sigma2.cos};
    const auto omega12 = difference(line.omega1, omega2);
    const V lag = f * line.alpha0.sin * longitude_lag(line.eps, sigma12, line.sigma1, sigma2);
    Position<V> out;
    out.lat_sin = line.alpha0.cos * sigma2.sin;
    out.lat_cos = f1 * plain_hypot(line.alpha0.sin, line.alpha0.cos * sigma2.cos);
    out.azimuth = {line.alpha0.sin, line.alpha0.cos * sigma2.cos};
    // The lag may exceed the wrap of omega on lines around the earth.
    out.lon = atan2(omega12.sin, omega12.cos) - lag;
    out.area = 0.0;
    if constexpr (Area) {
      // alpha2 - alpha1 without cancellation
      const auto sigma = difference(line.sigma1, sigma2);
      const V s = select(
          sigma.cos <= 0.0, line.sigma1.cos * (1.0 - sigma.cos) + sigma.sin * line.sigma1.sin,
          sigma.sin * (line.sigma1.cos * sigma.sin / (1.0 + sigma.cos) + line.sigma1.sin));
      const auto ordinary = (line.alpha0.sin != 0.0) & (line.alpha0.cos != 0.0);
      const V calp2 = line.alpha0.cos * sigma2.cos;
      const V salp12 = select(ordinary, line.alpha0.cos * line.alpha0.sin * s,
                              line.alpha0.sin * line.alpha1.cos - calp2 * line.alpha1.sin);
      const V calp12 = select(ordinary,
                              line.alpha0.sin * line.alpha0.sin +
                                  line.alpha0.cos * line.alpha0.cos * line.sigma1.cos * sigma2.cos,
                              calp2 * line.alpha1.cos + line.alpha0.sin * line.alpha1.sin);
      out.area =
          authalic2 * atan2(salp12, calp12) + a * a * e2 * (line.alpha0.cos * line.alpha0.sin) *
                                                  area_between(line.eps, line.sigma1, sigma2);
    }
    return out;
  }

  // --- inverse ---------------------------------------------------------------------------------

  // The arc that leaves beta1 at alpha1 and meets the latitude beta2.
  template <Number V>
  struct Arc {
    SinCos<V> alpha2, sigma1, sigma2, omega12;
    V salp0, calp0, sigma12, k2, eps;
  };

  template <Number V>
  TW_INLINE Arc<V> arc(SinCos<V> beta1, SinCos<V> beta2, SinCos<V> alpha1) const {
    Arc<V> out;
    out.salp0 = alpha1.sin * beta1.cos;
    out.calp0 = plain_hypot(alpha1.cos, alpha1.sin * beta1.sin);
    const V along1 = alpha1.cos * beta1.cos;
    out.sigma1 = unit(beta1.sin, along1);
    // eq. 45; the difference of squares without cancellation
    const auto same = beta2.cos == beta1.cos;
    const V squares =
        select(beta1.cos < -beta1.sin, (beta2.cos - beta1.cos) * (beta1.cos + beta2.cos),
               (beta1.sin - beta2.sin) * (beta1.sin + beta2.sin));
    const V along2 = select(same & (abs(beta2.sin) == -beta1.sin), abs(along1),
                            sqrt(greater(along1 * along1 + squares, V(0.0))));
    out.alpha2 = {select(same, alpha1.sin, out.salp0 / beta2.cos), along2 / beta2.cos};
    out.sigma2 = unit(beta2.sin, along2);
    const auto turn = difference(out.sigma1, out.sigma2);
    out.sigma12 = atan2(greater(turn.sin, V(0.0)), turn.cos);
    const SinCos<V> omega1 = unit(out.salp0 * beta1.sin, along1);
    const SinCos<V> omega2 = unit(out.salp0 * beta2.sin, along2);
    const auto omega12 = difference(omega1, omega2);
    out.omega12 = {greater(omega12.sin, V(0.0)), omega12.cos};
    out.k2 = out.calp0 * out.calp0 * ep2;
    out.eps = expansion(out.k2);
    return out;
  }

  // The longitude that an arc reaches beyond the wanted one (eq. 8 and 24), and its growth with
  // alpha1 (eq. 46).
  template <Number V>
  struct Excess {
    V lon, slope;
  };

  template <Number V>
  TW_INLINE Excess<V> excess(SinCos<V> beta1, SinCos<V> beta2, SinCos<V> lambda12,
                             const Arc<V>& at) const {
    const auto over = difference(lambda12, at.omega12);
    const V lag = f * at.salp0 * longitude_lag(at.eps, at.sigma12, at.sigma1, at.sigma2);
    Excess<V> out;
    out.lon = atan2(over.sin, over.cos) - lag;
    const V m = reduced_length(beta1, beta2, at);
    const auto vertical = at.alpha2.cos == 0.0;
    const V dn1 = sqrt(1.0 + ep2 * (beta1.sin * beta1.sin));
    out.slope = select(vertical, -2.0 * f1 * dn1 / beta1.sin,
                       m * f1 / select(vertical, V(1.0), at.alpha2.cos * beta2.cos));
    return out;
  }

  // m12 / b (eq. 38)
  template <Number V>
  TW_INLINE V reduced_length(SinCos<V> beta1, SinCos<V> beta2, const Arc<V>& at) const {
    const V a1 = mean(kGeodesicA1, at.eps) / (1.0 - at.eps);
    const V a2 = mean(kGeodesicA2, at.eps) * (1.0 - at.eps);
    Harmonics<V> c1(kGeodesicC1, at.eps);
    const Harmonics<V> c2(kGeodesicC2, at.eps);
    for (int l = 0; l < 6; ++l) c1.c[l] = a1 * c1.c[l] - a2 * c2.c[l];
    const V j12 = (a1 - a2) * at.sigma12 + (c1.at(at.sigma2) - c1.at(at.sigma1));
    const V dn1 = sqrt(1.0 + ep2 * (beta1.sin * beta1.sin));
    const V dn2 = sqrt(1.0 + ep2 * (beta2.sin * beta2.sin));
    return dn2 * (at.sigma1.cos * at.sigma2.sin) - dn1 * (at.sigma1.sin * at.sigma2.cos) -
           at.sigma1.cos * at.sigma2.cos * j12;
  }

  // The arc's length (eq. 7)
  template <Number V>
  TW_INLINE V length(const Arc<V>& at) const {
    const Harmonics<V> c1(kGeodesicC1, at.eps);
    const V scale = b * mean(kGeodesicA1, at.eps) / (1.0 - at.eps);
    return scale * (at.sigma12 + (c1.at(at.sigma2) - c1.at(at.sigma1)));
  }

  // The area below an arc (eq. 59 and 64).
  template <Number V>
  TW_INLINE V area(SinCos<V> beta1, SinCos<V> beta2, SinCos<V> alpha1, const Arc<V>& at) const {
    const auto turned_azimuth = difference(alpha1, at.alpha2);
    // By the longitudes where that keeps more digits: eq. 64.
    const V cos1 = 1.0 + beta1.cos;
    const V cos2 = 1.0 + beta2.cos;
    const auto near = (at.omega12.cos > -0.7) & (beta2.sin - beta1.sin < 1.75);
    const V y =
        select(near, at.omega12.sin * (beta1.sin * cos2 + beta2.sin * cos1), turned_azimuth.sin);
    const V x = select(near, (1.0 + at.omega12.cos) * (beta1.sin * beta2.sin + cos1 * cos2),
                       turned_azimuth.cos);
    const V alpha12 = atan2(y, x) * select(near, V(2.0), V(1.0));
    return authalic2 * alpha12 +
           a * a * e2 * (at.calp0 * at.salp0) * area_between(at.eps, at.sigma1, at.sigma2);
  }

  // The canonical form of a pair (eq. 44): beta1 not above the equator, |beta2| no greater than
  // |beta1|, the longitude difference not negative.
  template <Number V>
  struct Ends {
    SinCos<V> beta1, beta2, lambda12;
    V lambda;
    Mask<V> swapped;
    V lon_sign, lat_sign;
  };

  template <Number V>
  TW_INLINE Ends<V> ends(V lat1, V lon1, V lat2, V lon2) const {
    Ends<V> out;
    const auto between = degrees_between(lon1, lon2);
    out.lon_sign = select(between.value < 0.0, V(-1.0), V(1.0));
    const V d = abs(between.value);
    const V rest = between.rest * out.lon_sign * kRadiansPerDegree;
    const auto at = sincos_degrees(d);
    out.lambda12 = {at.sin + rest * at.cos, at.cos - rest * at.sin};
    out.lambda = d * kRadiansPerDegree + rest;
    out.swapped = abs(lat1) < abs(lat2);
    const V greater_lat = select(out.swapped, lat2, lat1);
    const V other_lat = select(out.swapped, lat1, lat2);
    out.lat_sign = select(greater_lat < 0.0, V(1.0), V(-1.0));
    out.beta1 = reduced(sincos_degrees(greater_lat * out.lat_sign));
    out.beta2 = reduced(sincos_degrees(other_lat * out.lat_sign));
    return out;
  }

  // From the canonical form back.
  template <Number V>
  TW_INLINE GeodesicArc<V> restored(const Ends<V>& given, V distance, SinCos<V> alpha1,
                                    SinCos<V> alpha2, V area12) const {
    const V swap_sign = select(given.swapped, V(-1.0), V(1.0));
    // A line that was reversed and mirrored keeps the sign of its sines.
    const V s = given.lon_sign;
    const V c = swap_sign * given.lat_sign;
    GeodesicArc<V> out;
    out.length = distance;
    out.azimuth1 = {s * select(given.swapped, alpha2.sin, alpha1.sin),
                    c * select(given.swapped, alpha2.cos, alpha1.cos)};
    out.azimuth2 = {s * select(given.swapped, alpha1.sin, alpha2.sin),
                    c * select(given.swapped, alpha1.cos, alpha2.cos)};
    out.area = area12 * (given.lon_sign * given.lat_sign);
    out.plain = everywhere<V>(true);
    return out;
  }

  // The azimuths of the great circle (eq. 49-50).
  template <Number V>
  TW_INLINE static SinCos<V> spherical_start(SinCos<V> beta1, SinCos<V> beta2, SinCos<V> omega12) {
    const V s = beta2.cos * omega12.sin;
    const V apart = beta2.sin * beta1.cos - beta2.cos * beta1.sin;  // sin(beta2 - beta1)
    const V together = beta2.sin * beta1.cos + beta2.cos * beta1.sin;
    const V square_sine = omega12.sin * omega12.sin;
    const V c = select(omega12.cos >= 0.0,
                       apart + beta2.cos * beta1.sin * square_sine / (1.0 + abs(omega12.cos)),
                       together - beta2.cos * beta1.sin * square_sine / (1.0 + abs(omega12.cos)));
    return {s, c};
  }

  // The inverse problem for the many lines: latitudes and longitudes in degrees.  Lines near the
  // antipode, along the equator or a meridian and of a few centimetres are not plain: any_line()
  // has them.
  template <bool Area = false, Number V>
  TW_INLINE GeodesicArc<V> many_lines(V lat1, V lon1, V lat2, V lon2) const {
    const auto given = ends(lat1, lon1, lat2, lon2);
    const auto& beta1 = given.beta1;
    const auto& beta2 = given.beta2;
    // The sphere's line, then the sphere's again with the longitude that belongs to it.
    const auto first = spherical_start(beta1, beta2, given.lambda12);
    const V sine = plain_hypot(first.sin, first.cos);
    const V cosine = beta1.sin * beta2.sin + beta1.cos * beta2.cos * given.lambda12.cos;
    Mask<V> plain = (given.lambda12.sin > 1e-9) & (beta1.cos > 1e-9) & (beta1.sin < -1e-3) &
                    (sine > 1e-7) & ((cosine > -0.99) | (sine > 0.1));
    const V harmless = select(plain, sine, 1.0);
    const V distance = atan2(harmless, select(plain, cosine, 0.0));
    const V lag = f * beta1.cos * (first.sin / harmless) * distance;
    const auto start = spherical_start(beta1, beta2, turned(given.lambda12, lag));
    auto alpha1 = unit(select(plain, start.sin, 1.0), select(plain, start.cos, 0.0));
    Mask<V> moving = plain;
    for (int i = 0; i < 6; ++i) {
      const auto at = arc(beta1, beta2, alpha1);
      const auto over = excess(beta1, beta2, given.lambda12, at);
      const V step = -(over.lon / over.slope);
      plain = plain & ((abs(step) < 0.05) | !moving);
      moving = moving & plain;
      const auto next = turned(alpha1, select(moving, step, 0.0));
      alpha1 = {select(moving, next.sin, alpha1.sin), select(moving, next.cos, alpha1.cos)};
      // The next step would be of the size of this one's square over the latitude's sine.
      moving = moving & (step * step > -1e-17 * beta1.sin);
      if (!any(moving)) break;
    }
    plain = plain & !moving & (alpha1.sin > 0.0);
    alpha1 = unit(alpha1.sin, alpha1.cos);
    const auto at = arc(beta1, beta2, alpha1);
    V below = 0.0;
    if constexpr (Area) below = area(beta1, beta2, alpha1, at);
    auto out = restored(given, length(at), alpha1, at.alpha2, below);
    out.plain = plain;
    return out;
  }

  // The inverse problem for any line, one at a time.
  template <bool Area = false>
  GeodesicArc<double> any_line(double lat1, double lon1, double lat2, double lon2) const {
    auto given = ends(lat1, lon1, lat2, lon2);
    if (!(std::fabs(lat1) <= 90 && std::fabs(lat2) <= 90) || !(given.lambda == given.lambda)) {
      const double none = std::nan("");
      return {none, {none, none}, {none, none}, none, false};
    }
    SinCos<double>& beta1 = given.beta1;
    const SinCos<double> beta2 = given.beta2;
    const SinCos<double> lambda12 = given.lambda12;
    if (lambda12.sin == 0 || beta1.cos == kTiny) {
      const auto at = meridian(beta1, beta2, lambda12);
      // From a pole every line is a meridian.
      if (beta1.cos == kTiny || at.sigma12 < 1 || reduced_length(beta1, beta2, at) >= 0) {
        double below = 0;
        if constexpr (Area) below = meridian_area(lambda12, at.alpha2);
        return restored(given, length(at), lambda12, at.alpha2, below);
      }
    }
    if (beta1.sin == 0 && (f <= 0 || given.lambda <= f1 * kPi)) {
      return restored(given, a * given.lambda, {1.0, 0.0}, {1.0, 0.0}, 0.0);
    }
    // The equator itself is never met at right angles from here on.
    beta1.sin = beta1.sin < -kTiny ? beta1.sin : -kTiny;
    auto alpha1 = spherical_start(beta1, beta2, lambda12);
    const double sine = plain_hypot(alpha1.sin, alpha1.cos);
    const double cosine = beta1.sin * beta2.sin + beta1.cos * beta2.cos * lambda12.cos;
    if (sine < kShort && cosine > 0) return short_line<Area>(given);
    const double n = std::fabs(third_flattening(f));
    if (cosine < 0 && sine < 6 * n * kPi * beta1.cos * beta1.cos) {
      alpha1 = antipodal_start(given, alpha1);
    }
    alpha1 = alpha1.sin > 0 ? unit(alpha1.sin, alpha1.cos) : SinCos<double>{1.0, 0.0};
    alpha1 = solved(given, alpha1);
    const auto at = arc(beta1, beta2, alpha1);
    double below = 0;
    if constexpr (Area) below = area(beta1, beta2, alpha1, at);
    return restored(given, length(at), alpha1, at.alpha2, below);
  }

 private:
  // Below this arc the sphere of the middle latitude has the line to rounding.
  static constexpr double kShort = 2e-8;

  Arc<double> meridian(SinCos<double> beta1, SinCos<double> beta2, SinCos<double> lambda12) const {
    Arc<double> at;
    at.alpha2 = {0, 1};
    at.sigma1 = unit(beta1.sin, lambda12.cos * beta1.cos);
    at.sigma2 = beta2;
    const auto turn = difference(at.sigma1, at.sigma2);
    at.sigma12 = atan2(turn.sin > 0 ? turn.sin : 0.0, turn.cos);
    at.omega12 = lambda12;
    at.salp0 = 0;
    at.calp0 = 1;
    at.k2 = ep2;
    at.eps = expansion(ep2);
    return at;
  }

  double meridian_area(SinCos<double> alpha1, SinCos<double> alpha2) const {
    auto change = difference(alpha1, alpha2);
    // Over a pole the azimuth turns by half a turn, in the sense of the longitude's growth.
    if (change.sin == 0 && change.cos < 0) change = {kTiny * alpha1.cos, -1};
    return authalic2 * atan2(change.sin, change.cos);
  }

  // eq. 47-50 with the radius of the middle latitude
  template <bool Area>
  GeodesicArc<double> short_line(const Ends<double>& given) const {
    const auto& beta1 = given.beta1;
    const auto& beta2 = given.beta2;
    const double sines = beta1.sin + beta2.sin;
    const double cosines = beta1.cos + beta2.cos;
    const double middle2 = sines * sines / (sines * sines + cosines * cosines);
    const double w = std::sqrt(1 + ep2 * middle2);
    const auto omega = sincos(given.lambda / (f1 * w));
    const auto start = spherical_start(beta1, beta2, omega);
    const double sine = plain_hypot(start.sin, start.cos);
    const double reach = portable::asin(sine) * b * w;
    if (sine == 0) return restored(given, 0.0, {0.0, 1.0}, {0.0, 1.0}, 0.0);
    const auto alpha1 = unit(start.sin, start.cos);
    // the azimuth at the other end, likewise (eq. 50)
    const double versine = omega.sin * omega.sin / (1 + omega.cos);
    const double apart = beta2.sin * beta1.cos - beta2.cos * beta1.sin;
    const auto alpha2 = unit(beta1.cos * omega.sin, apart - beta1.cos * beta2.sin * versine);
    double below = 0;
    if constexpr (Area) below = area(beta1, beta2, alpha1, arc(beta1, beta2, alpha1));
    return restored(given, reach, alpha1, alpha2, below);
  }

  // Newton's method, held between the azimuths that reach too little and too much.
  SinCos<double> solved(const Ends<double>& given, SinCos<double> alpha1) const {
    SinCos<double> low = {kTiny, 1};
    SinCos<double> high = {kTiny, -1};
    SinCos<double> best = alpha1;
    double least = 10;
    int stale = 0;
    for (int i = 0; i < 120 && stale < 5; ++i) {
      const auto over =
          excess(given.beta1, given.beta2, given.lambda12, arc(given.beta1, given.beta2, alpha1));
      if (std::fabs(over.lon) < least) {
        least = std::fabs(over.lon);
        best = alpha1;
        stale = 0;
      } else if (least < 1e-14) {
        ++stale;
      }
      if (least < 1e-16) break;
      (over.lon > 0 ? high : low) = alpha1;
      const double step = -over.lon / over.slope;
      if (over.slope > 0 && std::fabs(step) < 2) {
        const auto turn = sincos(step);
        const auto next = unit(alpha1.sin * turn.cos + alpha1.cos * turn.sin,
                               alpha1.cos * turn.cos - alpha1.sin * turn.sin);
        if (next.sin > 0 && difference(low, next).sin > 0 && difference(next, high).sin > 0) {
          alpha1 = next;
          continue;
        }
      }
      alpha1 = unit(low.sin + high.sin, low.cos + high.cos);
      if (low.sin + high.sin < 1e-100) alpha1 = {1, 0};
      if (alpha1.cos == 0) alpha1.cos = kTiny * 1e30;
      if (difference(low, high).sin <= 0 && !(low.sin == kTiny && high.sin == kTiny)) break;
    }
    return best;
  }

  // Directions from which Newton's method finds the azimuth of a nearly antipodal line (eq. 51-57).
  SinCos<double> antipodal_start(const Ends<double>& given, SinCos<double> sphere) const {
    const auto& beta1 = given.beta1;
    const auto& beta2 = given.beta2;
    // from the antipode of point 1
    const double lon = atan2(-given.lambda12.sin, -given.lambda12.cos);
    const double lat = beta2.sin * beta1.cos + beta2.cos * beta1.sin;
    double x = 0;
    double y = 0;
    double lon_scale = 0;
    if (f >= 0) {
      const double eps = expansion(beta1.sin * beta1.sin * ep2);
      lon_scale = f * beta1.cos * polynomial(i3[0], eps) * kPi;
      x = lon / lon_scale;
      y = lat / (lon_scale * beta1.cos);
    } else {
      // Prolate: longitude and latitude change their parts; the meridian through the antipode.
      const auto at = meridian(beta1, beta2, {0.0, -1.0});
      const double m = reduced_length(beta1, beta2, at);
      const double a1 = mean(kGeodesicA1, at.eps) / (1 - at.eps);
      const double a2 = mean(kGeodesicA2, at.eps) * (1 - at.eps);
      x = -1 + m / (beta1.cos * beta2.cos * (a1 - a2) * kPi);
      const double lat_scale = x < -0.01 ? lat / x : -f * beta1.cos * beta1.cos * kPi;
      lon_scale = lat_scale / beta1.cos;
      y = lon / lon_scale;
    }
    if (y > -1e-13 && x > -1 - 1e-5) {
      // on the cut itself
      if (f >= 0) {
        const double s = -x < 1 ? -x : 1.0;
        return {s, -std::sqrt((1 - s) * (1 + s))};
      }
      const double c = x > -1e-13 ? 0.0 : (x > -1 ? x : -1.0);
      return {std::sqrt((1 - c) * (1 + c)), c};
    }
    if (lon_scale == 0) return sphere;
    const double k = astroid(x, y);
    const double angle = lon_scale * (f >= 0 ? -x * k / (1 + k) : -y * (1 + k) / k);
    const auto omega = sincos(angle);
    return {beta2.cos * omega.sin,
            lat - beta2.cos * beta1.sin * omega.sin * omega.sin / (1 + omega.cos)};
  }

  // The positive root of x^2 / (1 + k)^2 + y^2 / k^2 = 1 (eq. 55), from below, where the left side
  // is convex and falls.
  static double astroid(double x, double y) {
    double k = std::fabs(y) > std::fabs(x) - 1 ? std::fabs(y) : std::fabs(x) - 1;
    if (k < 1e-100) return 1e-100;
    for (int i = 0; i < 100; ++i) {
      const double p = x / (1 + k);
      const double q = y / k;
      const double step = (p * p + q * q - 1) / (2 * (p * p / (1 + k) + q * q / k));
      k += step;
      if (!(step > 1e-10 * k)) break;
    }
    return k;
  }
};

}  // namespace tidewater::detail
