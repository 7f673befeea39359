// Formulas of the transverse Mercator projection of the ellipsoid, series about the central
// meridian.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 60-64;
// the last terms of the forward series: Defense Mapping Agency Technical Manual 8358.2, The
// Universal Grids (1989), chapter 2.
#pragma once

#include "formulas/meridian_series.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "points/over_points.hpp"

namespace tidewater::detail {

// Beyond this argument the hyperbolic functions of the inverse are refused.
inline constexpr double kLargestArgument = 700.0;

template <Number V>
TW_INLINE Mask<V> near_transverse_pole(V lat) {
  return abs(abs(lat) - kHalfPi) < 1e-10;
}

// What the series need of a latitude: T = tan^2, C = e'^2 cos^2.
template <class V>
struct TransverseTerms {
  V sin, cos, T, C;

  TW_INLINE TransverseTerms(double ep2, const SinCos<V>& at)
      : sin(at.sin), cos(at.cos), T(square(at.sin / at.cos)), C(ep2 * square(at.cos)) {}
};

template <class V>
struct TransversePlane {
  V x, y;
};

// The point at d from the central meridian, on the parallel whose meridian arc from the origin is
// m.
template <Number V>
TW_INLINE TransversePlane<V> transverse_series(double e2, const TransverseTerms<V>& p, V m, V d) {
  const V T = p.T;
  const V C = p.C;
  const V T2 = T * T;
  const V nu = normal_radius(e2, p.sin);
  const V q = square(p.cos) * square(d);
  const V E7 = ((179.0 - T) * T - 479.0) * T + 61.0;
  const V E5 = (((4.0 - 24.0 * T) * C + (13.0 - 64.0 * T)) * C + (14.0 - 58.0 * T)) * C +
               E7 * q * (1.0 / 42) + (5.0 - 18.0 * T) + T2;
  const V E8 = ((543.0 - T) * T - 3111.0) * T + 1385.0;
  const V E6 = ((((88.0 - 192.0 * T) * C + (324.0 - 600.0 * T)) * C + (445.0 - 680.0 * T)) * C +
                (270.0 - 330.0 * T)) *
                   C +
               E8 * q * (1.0 / 56) + (61.0 - 58.0 * T) + T2;
  const V E4 = E6 * q * (1.0 / 30) + (4.0 * C + 9.0) * C + (5.0 - T);
  const V across = p.cos * nu * d;
  return {((E5 * q * (1.0 / 20) + (1.0 - T) + C) * q * (1.0 / 6) + 1.0) * across,
          m + (E4 * q * (1.0 / 24) + 0.5) * across * p.sin * d};
}

// Point scale at d from the central meridian, for a central scale of 1.
template <Number V>
TW_INLINE V transverse_scale(double ep2, const TransverseTerms<V>& p, V d) {
  const V T = p.T;
  const V C = p.C;
  const V a2 = square(d * p.cos);
  return (((5.0 - 4.0 * T + 42.0 * C + 13.0 * square(C) - 28 * ep2) * (1.0 / 24) +
           (61.0 - 148.0 * T + 16.0 * square(T)) * (1.0 / 720) * a2) *
              a2 +
          (C + 1.0) * 0.5) *
             a2 +
         1.0;
}

// What the forward functions share of their parameters.
struct TransverseGrid {
  double e2, ep2, lon0;
  ArcSeries meridian;
  double M0;

  TransverseGrid(double e, double origin, const ArcCoefficients& a, double arc0)
      : e2(e * e), ep2(e2 / (1 - e2)), lon0(origin), meridian(ArcSeries::of(a)), M0(arc0) {}
};

struct TransverseForward {
  TransverseGrid grid;

  template <Number V>
  TW_INLINE Answer<V> operator()(V lon, V lat) const {
    // By contract: it is the longitude itself that is snapped, not its difference from lon0.
    lon = select(abs(lon) < 1e-12, 0.0, lon);
    lat = select(abs(lat) < 1e-12, 0.0, lat);
    const auto at = sincos(lat);
    const V m = grid.meridian.arc(lat, at) - grid.M0;
    const auto plane = transverse_series(grid.e2, TransverseTerms<V>(grid.ep2, at), m,
                                         wrap_above_then_at_or_below(lon - grid.lon0));
    const auto polar = near_transverse_pole(lat);
    return {select(polar, 0.0, plane.x), select(polar, m, plane.y)};
  }
};

// The third element is multiplied by the point scale.
struct TransverseForwardAndScale {
  TransverseGrid grid;
  double k0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat, V height) const {
    const auto at = sincos(lat);
    const V m = grid.meridian.arc(lat, at) - grid.M0;
    const TransverseTerms<V> terms(grid.ep2, at);
    const V d = lon - grid.lon0;
    const V k = k0 * transverse_scale(grid.ep2, terms, d);  // By contract: before the wrap
    const auto plane = transverse_series(grid.e2, terms, m, wrap_above_then_at_or_below(d));
    const auto polar = near_transverse_pole(lat);
    return {select(polar, 0.0, plane.x), select(polar, m, plane.y), height * select(polar, k0, k)};
  }
};

struct TransverseScale {
  double ep2, k0, lon0;

  template <Number V>
  TW_INLINE Answer3<V> operator()(V lon, V lat) const {
    const auto polar = near_transverse_pole(lat);
    const V d = lon - lon0;  // By contract: not wrapped
    const V value = k0 * transverse_scale(ep2, TransverseTerms<V>(ep2, sincos(lat)), d);
    const V k = select(polar, k0, value);
    const Mask<V> plain = polar | !(abs(d) > kTrustedSpan);
    return {k, k, k * k, plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

  static constexpr double kTrustedSpan = 0.8726646259971648;  // 50 degrees
};

// The unit sphere in closed form (Snyder 1987, eq. 8-6, 8-7): longitude from the central meridian,
// and latitude.
template <Number V>
TW_INLINE Answer<V> transverse_sphere_inverse(V x, V D) {
  const auto h = sinhcosh(x);
  const auto at = sincos(D);
  return {atan2(h.sinh, at.cos), asin(at.sin / h.cosh)};
}

struct TransverseSphereInverse {
  double lon0, lat0;

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const auto plain = !(abs(x) > kLargestArgument);
    const auto at = transverse_sphere_inverse(select(plain, x, 0.0), y + lat0);
    return {at.x + lon0, at.y, plain};  // not wrapped
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;
};

// The series from the footpoint, and a sphere for where they fail.
class TransverseInverse {
 public:
  TransverseInverse(double e, double lon0, double lat0, double A0, double M0, double B2, double B4,
                    double B6)
      : e2_(e * e),
        ep2_(e2_ / (1 - e2_)),
        over_polar2_(1 / (1 - e2_)),
        over_polar_(1 / sqrt(1 - e2_)),
        lon0_(lon0),
        lat0_(lat0),
        origin_(sincos(lat0)),
        over_A0_(1 / A0),
        M0_(M0),
        foot_(SineSeries<4>::of({B2, B4, B6, 0})) {}

  template <Number V>
  TW_INLINE Answer<V> operator()(V x, V y) const {
    const V w = y + M0_;
    const auto foot = foot_.latitude_and_sines(w * over_A0_);
    const auto at_pole = abs(abs(foot.lat) - kHalfPi) < 1e-12;
    auto [lon, lat, plain] = series(x, foot);
    const Mask<V> unsure = !(at_pole | surely_near_sphere(x, y, foot, lon, lat));
    if (any(unsure)) {
      // Far from the central meridian the series go astray: a conformal sphere then stands in.
      const auto reachable = !(abs(x) > kLargestArgument);
      const V near_x = select(reachable, x, 0.0);
      const V over_R = over_mean_radius(near_x, y);
      const V xr = near_x * over_R;
      const auto both = reachable & !(abs(xr) > kLargestArgument);
      const auto sphere = transverse_sphere_inverse(select(both, xr, 0.0), y * over_R + lat0_);
      const V apart = square(lon - sphere.x) + square(lat - sphere.y);
      const auto astray = unsure & (sqrt(apart) > kFarthestApart);
      lon = select(astray, sphere.x, lon);
      lat = select(astray, sphere.y, lat);
      plain = both | !unsure;
    }
    return {select(at_pole, lon0_, lon + lon0_),  // not wrapped
            select(at_pole, select(w < 0.0, -kHalfPi, V(kHalfPi)), lat), plain};
  }
  Next other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus* status) const;

 private:
  static constexpr double kFarthestApart = 0.005;

  // Snyder 1987, eq. 8-17, 8-18; the longitude from the central meridian.
  template <Number V>
  TW_INLINE Answer<V> series(V x, const FootLatitude<V>& foot) const {
    const V over_cos = 1.0 / foot.at.cos;
    const V tangent = foot.at.sin * over_cos;
    const V T = square(tangent);
    const V C = ep2_ * square(foot.at.cos);
    const V W = 1.0 - e2_ * square(foot.at.sin);  // nu / rho = W / (1 - e^2)
    const V D = x * (W * normal_radius(e2_, foot.at.sin));
    const V D2 = square(D);
    const V dlat =
        tangent * (W * over_polar2_) * D2 *
        (0.5 - ((10.0 * C + 3.0 * T + (5 - 9 * ep2_) - 4.0 * square(C)) * (1.0 / 24) -
                (45.0 * square(T) + 298.0 * C + 90.0 * T + (61 - 252 * ep2_) - 3.0 * square(C)) *
                    (1.0 / 720) * D2) *
                   D2);
    const V dlon = D *
                   (1.0 - ((2.0 * T + C + 1.0) * (1.0 / 6) - ((5 + 8 * ep2_) - 2.0 * C + 28.0 * T -
                                                              3.0 * square(C) + 24.0 * square(T)) *
                                                                 (1.0 / 120) * D2) *
                              D2) *
                   over_cos;
    return {dlon, foot.lat - dlat};
  }

  // Whether the sphere is certain to lie within the limit of the series' position, by an estimate
  // that costs a tenth of the sphere.  On its domain (e to 0.1, latitudes to 84 degrees, the
  // sphere's longitude to 0.2) the estimate is within 0.001: the radius is taken at the footpoint
  // in place of the unit sphere's latitude, which is 0.02 away at most and makes 1e-4 of R; the
  // sphere's inverse is its series from the footpoint, good to 1e-5.
  template <Number V>
  TW_INLINE Mask<V> surely_near_sphere(V x, V y, const FootLatitude<V>& foot, V found_lon,
                                       V found_lat) const {
    const V sin = foot.at.sin;
    const V cos = foot.at.cos;
    const V over_R = over_gaussian_radius(cos * origin_.cos - sin * origin_.sin);
    const V xr = x * over_R;
    const V yr = y * over_R + lat0_;
    const V off = yr - foot.lat;
    const auto small_e = everywhere<V>(e2_ <= 0.01);
    const auto small_off = abs(off) < 0.02;
    const auto small_lon = abs(xr) < 0.2 * cos;
    const auto off_poles = abs(foot.lat) < 1.47;
    const auto in_reach = abs(y) < 3.0;
    const auto in_domain = small_e & small_off & small_lon & off_poles & in_reach;
    const V half_square = square(off) * 0.5;
    const V s = sin + cos * off - sin * half_square;
    const V c = cos - sin * off - cos * half_square;
    const V a = xr * (1.0 + square(xr) * (1.0 / 6)) / c;  // the tangent of the sphere's longitude
    const V a2 = square(a);
    const V lon = a * (1.0 - a2 * (1.0 / 3 - a2 * 0.2));
    const V lat = yr - s * c * a2 * (0.5 - (3.0 + 2.0 * square(c)) * (1.0 / 24) * a2);
    return in_domain &
           (square(found_lon - lon) + square(found_lat - lat) < square(kFarthestApart - 0.001));
  }

  // Midway between the origin and the latitude that the unit sphere gives.
  template <Number V>
  TW_INLINE V over_mean_radius(V x, V y) const {
    const V sin_lat1 = sincos(y + lat0_).sin / sinhcosh(x).cosh;
    const V cos_lat1 = sqrt(1.0 - square(sin_lat1));
    return over_gaussian_radius(cos_lat1 * origin_.cos - sin_lat1 * origin_.sin);
  }

  // At the latitude g whose double has this cosine: sin^2 g = (1 - cos 2g) / 2.
  template <Number V>
  TW_INLINE V over_gaussian_radius(V cos_2g) const {
    return (1.0 - (0.5 * e2_) * (1.0 - cos_2g)) * over_polar_;
  }

  double e2_, ep2_, over_polar2_, over_polar_, lon0_, lat0_;
  SinCos<double> origin_;
  double over_A0_, M0_;
  FootSeries foot_;
};

}  // namespace tidewater::detail

TIDEWATER_INSTANCE(tidewater::detail::TransverseForward)
TIDEWATER_INSTANCE(tidewater::detail::TransverseForwardAndScale)
TIDEWATER_INSTANCE(tidewater::detail::TransverseScale)
TIDEWATER_INSTANCE(tidewater::detail::TransverseSphereInverse)
TIDEWATER_INSTANCE(tidewater::detail::TransverseInverse)
