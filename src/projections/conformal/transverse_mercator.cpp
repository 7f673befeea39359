// Transverse Mercator projection of the ellipsoid by series about the central meridian.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 60-64; the
// last terms of the forward series: Defense Mapping Agency Technical Manual 8358.2, The Universal
// Grids (1989), chapter 2.

#include <cmath>

#include "formulas/wraps.hpp"
#include "projections/conformal/meridian_series.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

// Beyond this argument the hyperbolic functions of the inverse are refused.
constexpr double kLargestArgument = 700.0;

bool near_pole(double lat) { return std::fabs(std::fabs(lat) - kHalfPi) < 1e-10; }

// What the series need of a latitude.
struct LatitudeTerms {
  double sin, cos, T, C;

  LatitudeTerms(double ep2, double lat)
      : sin(std::sin(lat)), cos(std::cos(lat)), T(square(sin / cos)), C(ep2 * square(cos)) {}
};

struct Plane {
  double x, y;
};

// The point at d from the central meridian, on the parallel whose meridian arc from the origin is m
Plane series_forward(double e2, const LatitudeTerms& p, double m, double d) {
  const double T = p.T;
  const double C = p.C;
  const double T2 = T * T;
  const double nu = 1 / std::sqrt(1 - e2 * square(p.sin));
  const double q = square(p.cos) * square(d);
  const double E7 = ((179 - T) * T - 479) * T + 61;
  const double E5 = (((4 - 24 * T) * C + (13 - 64 * T)) * C + (14 - 58 * T)) * C +
                    E7 * q * (1.0 / 42) + (5 - 18 * T) + T2;
  const double E8 = ((543 - T) * T - 3111) * T + 1385;
  const double E6 =
      ((((88 - 192 * T) * C + (324 - 600 * T)) * C + (445 - 680 * T)) * C + (270 - 330 * T)) * C +
      E8 * q * (1.0 / 56) + (61 - 58 * T) + T2;
  const double E4 = E6 * q * (1.0 / 30) + (4 * C + 9) * C + (5 - T);
  const double across = p.cos * nu * d;
  return {((E5 * q * (1.0 / 20) + (1 - T) + C) * q * (1.0 / 6) + 1) * across,
          m + (E4 * q * (1.0 / 24) + 0.5) * across * p.sin * d};
}

// Point scale at d from the central meridian, for a central scale of 1.
double series_scale(double ep2, const LatitudeTerms& p, double d) {
  const double T = p.T;
  const double C = p.C;
  const double a2 = square(d * p.cos);
  return (((5 - 4 * T + 42 * C + 13 * square(C) - 28 * ep2) / 24 +
           (61 - 148 * T + 16 * square(T)) / 720 * a2) *
              a2 +
          (C + 1) / 2) *
             a2 +
         1;
}

// Hyperbolic sine and cosine from one exponential.
struct Hyperbolic {
  double sinh, cosh;

  explicit Hyperbolic(double x) {
    const double m = std::expm1(std::fabs(x));
    const double reciprocal = 1 / (m + 1);
    sinh = std::copysign((m + m * reciprocal) / 2, x);
    cosh = (m + 1 + reciprocal) / 2;
  }
};

struct Position {
  double lon, lat;  // the longitude from the central meridian
};

// Inverse on the unit sphere, in closed form (Snyder 1987, eq. 8-6, 8-7).
Position sphere_inverse(double x, double D) {
  const Hyperbolic h(x);
  return {std::atan2(h.sinh, std::cos(D)), std::asin(std::sin(D) / h.cosh)};
}

// Inverse on the ellipsoid: the series from the footpoint, and a sphere for where they fail.
class EllipsoidInverse {
 public:
  EllipsoidInverse(double e, double lat0, double A0, double M0, double B2, double B4, double B6)
      : e2_(e * e),
        ep2_(e2_ / (1 - e2_)),
        inverse_polar_(1 / std::sqrt(1 - e2_)),
        lat0_(lat0),
        sin_lat0_(std::sin(lat0)),
        cos_lat0_(std::cos(lat0)),
        A0_(A0),
        M0_(M0),
        foot_(CosinePowerSeries::of(B2, B4, B6, 0)) {}

  // False where the plane reaches further than the check can follow.
  bool operator()(double x, double y, Position* out) const {
    const double w = y + M0_;
    const double u = w / A0_;
    const double p = u + foot_.sum(std::sin(2 * u), std::cos(2 * u));
    if (std::fabs(std::fabs(p) - kHalfPi) < 1e-12) {
      *out = {0, w < 0 ? -kHalfPi : kHalfPi};
      return true;
    }
    const LatitudeTerms at(ep2_, p);
    *out = series(x, p, at);
    if (surely_near_sphere(x, y, p, at, *out)) return true;
    if (std::fabs(x) > kLargestArgument) return false;
    // Far from the central meridian the series go astray: a conformal sphere then stands in.
    const double R = mean_radius(x, y);
    const double xr = x / R;
    if (std::fabs(xr) > kLargestArgument) return false;
    const Position sphere = sphere_inverse(xr, y / R + lat0_);
    const double apart = square(out->lon - sphere.lon) + square(out->lat - sphere.lat);
    if (std::sqrt(apart) > kFarthestApart) *out = sphere;
    return true;
  }

 private:
  static constexpr double kFarthestApart = 0.005;

  // Snyder 1987, eq. 8-17, 8-18.
  Position series(double x, double p, const LatitudeTerms& at) const {
    const double T = at.T;
    const double C = at.C;
    const double W = 1 - e2_ * square(at.sin);  // nu / rho = W / (1 - e^2)
    const double D = x * std::sqrt(W);
    const double D2 = square(D);
    const double dlat =
        at.sin / at.cos * (W / (1 - e2_)) * D2 *
        (0.5 - ((10 * C + 3 * T + 5 - 4 * square(C) - 9 * ep2_) * (1.0 / 24) -
                (45 * square(T) + 298 * C + 90 * T + 61 - 252 * ep2_ - 3 * square(C)) *
                    (1.0 / 720) * D2) *
                   D2);
    const double dlon =
        D *
        (1 - ((2 * T + C + 1) * (1.0 / 6) -
              (5 - 2 * C + 28 * T - 3 * square(C) + 24 * square(T) + 8 * ep2_) * (1.0 / 120) * D2) *
                 D2) /
        at.cos;
    return {dlon, p - dlat};
  }

  // Whether the sphere is certain to lie within the limit of the series' position, by an estimate
  // that costs a tenth of the sphere.  On its domain (e to 0.1, latitudes to 84 degrees, the
  // sphere's longitude to 0.2) the estimate is within 0.001: the radius is taken at the footpoint
  // in place of the unit sphere's latitude, which is 0.02 away at most and makes 1e-4 of R; the
  // sphere's inverse is its series from the footpoint, good to 1e-5.
  bool surely_near_sphere(double x, double y, double p, const LatitudeTerms& at,
                          const Position& found) const {
    const double sin2_g = (1 - (at.cos * cos_lat0_ - at.sin * sin_lat0_)) / 2;
    const double inverse_R = (1 - e2_ * sin2_g) * inverse_polar_;
    const double xr = x * inverse_R;
    const double yr = y * inverse_R + lat0_;
    const double off = yr - p;
    if (!(std::fabs(off) < 0.02 && std::fabs(xr) < 0.2 * at.cos && std::fabs(p) < 1.47 &&
          std::fabs(y) < 3 && e2_ <= 0.01)) {
      return false;
    }
    const double half_square = square(off) / 2;
    const double s = at.sin + at.cos * off - at.sin * half_square;
    const double c = at.cos - at.sin * off - at.cos * half_square;
    const double a = xr * (1 + square(xr) / 6) / c;  // the tangent of the sphere's longitude
    const double a2 = square(a);
    const double lon = a * (1 - a2 * (1.0 / 3 - a2 / 5));
    const double lat = yr - s * c * a2 * (0.5 - (3 + 2 * square(c)) * (1.0 / 24) * a2);
    return square(found.lon - lon) + square(found.lat - lat) < square(kFarthestApart - 0.001);
  }

  // Gaussian radius midway between the origin and the latitude that the unit sphere gives.
  double mean_radius(double x, double y) const {
    const double e = std::exp(std::fabs(x));
    const double sin_lat1 = std::sin(y + lat0_) / ((e + 1 / e) / 2);
    const double cos_lat1 = std::sqrt(1 - square(sin_lat1));
    // the half angle's square: sin^2 g = (1 - cos 2g) / 2
    const double sin2_g = (1 - (cos_lat1 * cos_lat0_ - sin_lat1 * sin_lat0_)) / 2;
    return std::sqrt(1 - e2_) / (1 - e2_ * sin2_g);
  }

  double e2_, ep2_, inverse_polar_, lat0_, sin_lat0_, cos_lat0_, A0_, M0_;
  CosinePowerSeries foot_;
};

}  // namespace

void TWt_merc_c(double e, double /*lon0*/, double lat0, double* A0, double* A2, double* A4,
                double* A6, double* A8, double* M0, double* B2, double* B4, double* B6,
                TWstatus* status) {
  *status = TW_SUCCESS;
  const ArcSeries arc = ArcSeries::of(square(e));
  const FootSeries foot = FootSeries::of(square(e));
  *A0 = arc.a0;
  *A2 = arc.a2;
  *A4 = arc.a4;
  *A6 = arc.a6;
  *A8 = arc.a8;
  *M0 = lat0 != 0 ? arc.arc(lat0, std::sin(lat0), std::cos(lat0)) : 0;
  *B2 = foot.b2;
  *B4 = foot.b4;
  *B6 = foot.b6;
}

void TWt_merc_f(double e, double lon0, double A0, double A2, double A4, double A6, double A8,
                double M0, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const double ep2 = e2 / (1 - e2);
  const ArcSeries arc = {A0, A2, A4, A6, A8};
  for (int32_t i = 0; i < count; ++i) {
    double lon = in[i].x;
    double lat = in[i].y;
    // By contract: it is the longitude itself that is snapped, not its difference from lon0.
    if (std::fabs(lon) < 1e-12) lon = 0;
    if (std::fabs(lat) < 1e-12) lat = 0;
    const LatitudeTerms p(ep2, lat);
    const double m = arc.arc(lat, p.sin, p.cos) - M0;
    if (near_pole(lat)) {
      out[i].x = 0;
      out[i].y = m;
      continue;
    }
    const auto [x, y] = series_forward(e2, p, m, wrap_above_then_at_or_below(lon - lon0));
    out[i].x = x;
    out[i].y = y;
  }
}

void TWt_merc_i(double e, double lon0, double lat0, double A0, double M0, double B2, double B4,
                double B6, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                TWstatus* status) {
  *status = TW_SUCCESS;
  const bool sphere = e < 1e-12;
  const EllipsoidInverse ellipsoid(e, lat0, A0, M0, B2, B4, B6);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    Position at = {};
    bool in_range = true;
    if (sphere) {
      in_range = !(std::fabs(x) > kLargestArgument);
      if (in_range) at = sphere_inverse(x, y + lat0);
    } else {
      in_range = ellipsoid(x, y, &at);
    }
    if (!in_range) {
      *status = TW_RANGE_ERROR;
      return;
    }
    out[i].x = at.lon + lon0;  // not wrapped
    out[i].y = at.lat;
  }
}

void TWt_merc_s(double e, double k0, double lon0, int32_t count, const CoordinateTriple* in,
                CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr double kTrustedSpan = 0.8726646259971648;  // 50 degrees
  const double e2 = square(e);
  const double ep2 = e2 / (1 - e2);
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = in[i].x - lon0;  // By contract: not wrapped
    double k = k0;
    if (!near_pole(lat)) {
      k = k0 * series_scale(ep2, LatitudeTerms(ep2, lat), d);
      if (std::fabs(d) > kTrustedSpan) *status = TW_I_LATITUDE_LIMITED;
    }
    out[i] = {k, k, k * k};
  }
}

void TWt_merc_xyk(double e, double lon0, double A0, double A2, double A4, double A6, double A8,
                  double M0, double k0, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const double ep2 = e2 / (1 - e2);
  const ArcSeries arc = {A0, A2, A4, A6, A8};
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const LatitudeTerms p(ep2, lat);
    const double m = arc.arc(lat, p.sin, p.cos) - M0;
    double k = k0;
    Plane plane = {0, m};
    if (!near_pole(lat)) {
      const double d = in[i].x - lon0;
      k = k0 * series_scale(ep2, p, d);  // By contract: on the difference before the wrap
      plane = series_forward(e2, p, m, wrap_above_then_at_or_below(d));
    }
    out[i] = {plane.x, plane.y, out[i].z * k};
  }
}
