// Lambert azimuthal equal-area projection: what the contract says of the points that the formulas
// do not cover, and the exported functions.

#include "projections/conformal/azimuthal_equal_area_points.hpp"

#include <cmath>

#include "points/portable.hpp"
#include "tidewater/azimuthal_equal_area.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

// Nearer than this to a pole or to the equator, an origin takes the polar or equatorial road.
constexpr double kAspectMargin = 1e-12;
// How far the sine of an authalic latitude may stand beyond 1 and still be held there.
constexpr double kTightLimit = 1.000000000001;
// By contract: looser in the inverse on the ellipsoid.
constexpr double kLooseLimit = 1.0005;

bool is_polar(double lat0) { return std::fabs(std::fabs(lat0) - kHalfPi) < kAspectMargin; }
bool is_equatorial(double lat0) { return std::fabs(lat0) < kAspectMargin; }
double side_of(double lat0) { return lat0 >= 0 ? 1 : -1; }

// q(p) = (1 - e^2) (sin p / (1 - e^2 sin^2 p) - ln((1 - e sin p) / (1 + e sin p)) / 2e)
// (Snyder 1987, eq. 3-12).  By contract: in this plain form near a pole, and not by authalic_q.
// Callers hold its value at the pole, which may have been worked out elsewhere, and one more or
// less in its last digit decides whether a point is held.
double q_of(double e, double e2, double s) {
  return (s / (1 - e2 * s * s) - portable::log((1 - e * s) / (1 + e * s)) / (2 * e)) * (1 - e2);
}

// Holds a sine at 1 or -1.  False, with the word, when it lies beyond the limit.
bool hold_sine(double limit, double& u, TWstatus* status) {
  if (std::fabs(u) > limit) {
    *status = TW_NOT_CONVERGED;
    return false;
  }
  if (std::fabs(u) > 1) {
    u = std::copysign(1.0, u);
    *status = TW_I_LATITUDE_LIMITED;
  }
  return true;
}

// Moves a point off the antipode of the origin, where the projection has no value.
void leave_antipode(bool polar, double lat0, double& lat, double& d) {
  constexpr double kStep = kAntipodeStep;
  if (!(std::fabs(lat + lat0) < kStep)) return;
  if (polar) {
    lat += lat <= 0 ? kStep : -kStep;
  } else if (std::fabs(std::fabs(d) - kPi) < kStep) {
    const bool inside = kPi - std::fabs(d) >= 0;
    d += (d <= 0) == inside ? kStep : -kStep;
  }
}

// Whether qp is that of e, to a few units in the last place.
bool is_q_of_pole(double e, double e2, double qp) {
  return std::fabs(qp - q_of(e, e2, 1)) <= 8 * 0x1p-52;
}

// (q - q(lat)) w^2 / (2 (1 - e^2) cos lat), Newton's step from lat.  Near a pole both q are taken
// off that of the pole where qp is that: so the difference keeps its digits where q hardly changes
// any more.
double newton_step(double e, double e2, double qp, bool from_pole, double q, double lat) {
  constexpr double kNearPole = 0.9;
  const double sin_lat = portable::sin(lat);
  const double c = portable::cos(lat);
  const double w = 1 - e2 * (sin_lat * sin_lat);
  double t = 0;
  if (!from_pole || std::fabs(sin_lat) < kNearPole) {
    t = portable::log((1 - e * sin_lat) / (1 + e * sin_lat)) / (2 * e) + q / (1 - e2) - sin_lat / w;
  } else {
    const double side = lat < 0 ? -1 : 1;
    const double s = side * sin_lat;
    const double u = c * c / (1 + s);  // 1 - sin
    const double rest =
        u * (1 + e2 * s) / (w * (1 - e2)) + portable::atanh(e * u / (1 - e2 * s)) / e;
    t = side * ((side * q - qp) / (1 - e2) + rest);
  }
  return t * (w * w) / (2 * c);
}

// The latitude whose q is given, by Newton's rule (Snyder 1987, eq. 3-16) from the arc sine of u,
// half of q held at 1.  False when the passes were used up.
bool latitude_of_q(const EqualAreaOrigin& o, double q, double u, double& lat) {
  constexpr int kMostPasses = 50;
  const bool from_pole = is_q_of_pole(o.e, o.e2, o.qp);
  lat = portable::asin(u);
  if (from_pole) {
    // Beyond the pole by more than rounding there is no root, and the passes would be used up.
    const double sine = q / o.qp;
    if (std::fabs(sine) > kTightLimit) return false;
    if (std::fabs(sine) >= 1) {
      lat = std::copysign(kHalfPi, sine);
      return true;
    }
  }
  double difference = 1;
  int passes = 0;
  while (!(difference <= 1e-13)) {
    if (++passes == kMostPasses) return false;
    const double step = newton_step(o.e, o.e2, o.qp, from_pole, q, lat);
    difference = std::fabs(step);
    lat += step;
  }
  return true;
}

// The stated inverse, word for word.
Next inverse_as_stated(const EqualAreaOrigin& o, const CoordinateTriple& in, CoordinateTriple* out,
                       TWstatus* status) {
  constexpr double kLatLimit = kHalfPi + 1e-12;
  const double x = in.x;
  const double y = in.y;
  double lon = o.lon0;
  double lat = o.lat0;
  const auto fail = [&] {
    *status = TW_NOT_CONVERGED;
    return Next::none;
  };
  if (o.e == 0) {
    const double rho = std::sqrt(x * x + y * y);
    if (rho != 0) {
      double u = rho / 2;
      if (!hold_sine(kTightLimit, u, status)) return Next::none;
      const double c = 2 * portable::asin(u);
      const double sin_c = portable::sin(c);
      const double cos_c = portable::cos(c);
      if (o.polar) {
        lon = portable::atan2(x, o.lat0 < 0 ? y : -y) + o.lon0;
      } else {
        lon =
            portable::atan2(x * sin_c, o.cos_lat0 * cos_c * rho - o.sin_lat0 * sin_c * y) + o.lon0;
      }
      lat = portable::asin(o.cos_lat0 * sin_c * y / rho + o.sin_lat0 * cos_c);
    }
  } else {
    double q = 0;
    if (o.polar) {
      const double rho = std::sqrt(x * x + y * y);
      q = std::fabs(o.qp - rho * rho);
      if (o.lat0 < 0) q = -q;
      lon = portable::atan2(x, o.lat0 < 0 ? y : -y) + o.lon0;
    } else {
      const double rho = std::sqrt(square(x / o.D) + square(o.D * y));
      if (rho == 0) {
        q = o.sin_b1 * o.qp;
      } else {
        double u = rho / (2 * o.rq);
        if (!hold_sine(kLooseLimit, u, status)) return Next::none;
        const double ce = 2 * portable::asin(u);
        const double sin_ce = portable::sin(ce);
        const double cos_ce = portable::cos(ce);
        q = (o.D * sin_ce * o.cos_b1 * y / rho + cos_ce * o.sin_b1) * o.qp;
        lon = portable::atan2(x * sin_ce,
                              o.D * cos_ce * o.cos_b1 * rho - o.D * o.D * sin_ce * o.sin_b1 * y) +
              o.lon0;
      }
    }
    double u = q / 2;
    if (!hold_sine(kLooseLimit, u, status)) return Next::none;
    if (!latitude_of_q(o, q, u, lat)) return fail();
  }
  if (lat < -kLatLimit || lat > kLatLimit) return fail();
  out->x = wrap_above_then_at_or_below(lon);
  out->y = lat;
  return Next::point;
}

}  // namespace

Next EqualAreaForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                             TWstatus* status) const {
  double d = in.x - lon0;
  double lat = in.y;
  leave_antipode(false, lat0, lat, d);
  const auto at_d = sincos(d);
  double s = portable::sin(lat);
  double c = portable::cos(lat);
  if (!sphere) {
    s = q_of(e, e2, s) * over_qp;
    if (!hold_sine(kTightLimit, s, status)) return Next::none;
    c = std::sqrt((1 - s) * (1 + s));
    if (sum(at_d.cos, s, c) < kNearAntipode) {
      // What is left of the sum hangs on the last bit of c, so the angle itself is taken.
      const double beta = portable::asin(s);
      s = portable::sin(beta);
      c = portable::cos(beta);
    }
  }
  const auto answer = place(at_d, s, c);
  out->x = answer.x;
  out->y = answer.y;
  return Next::point;
}

Next EqualAreaPolarForward::other(const CoordinateTriple& in, CoordinateTriple* out,
                                  TWstatus*) const {
  double lat = in.y;
  double d = 0;
  leave_antipode(true, lat0, lat, d);
  const double w = kQuarterPi - lat / 2;
  const double r = sphere ? 2 * (side > 0 ? portable::sin(w) : portable::cos(w))
                          : std::sqrt(qp - side * q_of(e, e2, portable::sin(lat)));
  const auto answer = place(in.x, r);
  out->x = answer.x;
  out->y = answer.y;
  return Next::point;
}

Next EqualAreaInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                             TWstatus* status) const {
  return inverse_as_stated(origin, in, out, status);
}

Next EqualAreaPolarInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                                  TWstatus* status) const {
  return inverse_as_stated(origin, in, out, status);
}

Next EqualAreaScale::other(const CoordinateTriple& in, CoordinateTriple* out, TWstatus*) const {
  const double s = portable::sin(in.y);
  const auto at =
      triple(std::sqrt(qp - side * q_of(e, e2, s)) / parallel_radius(e2, s, portable::cos(in.y)));
  *out = {at.x, at.y, at.z};
  return Next::point;
}

}  // namespace tidewater::detail

void TWlam_az_eq_c(double e, double /*lon0*/, double lat0, double* e2, double* q1, double* qp,
                   double* rq, double* m1, double* sin_b1, double* cos_b1, double* sin_lat0,
                   double* cos_lat0, double* D, TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_0 = portable::sin(lat0);
  const double cos_0 = portable::cos(lat0);
  *sin_lat0 = sin_0;
  *cos_lat0 = cos_0;
  if (e == 0) return;
  const double q_origin = q_of(e, e * e, sin_0);
  const double q_pole = q_of(e, e * e, 1);
  const double radius = std::sqrt(q_pole / 2);
  *e2 = e * e;
  *q1 = q_origin;
  *qp = q_pole;
  *rq = radius;
  if (is_polar(lat0)) return;
  const double m_origin = parallel_radius(e * e, sin_0, cos_0);
  const double b1 = portable::asin(q_origin / q_pole);
  const double cos_b = portable::cos(b1);
  *m1 = m_origin;
  *sin_b1 = portable::sin(b1);
  *cos_b1 = cos_b;
  *D = m_origin / (cos_b * radius);
}

void TWlam_az_eq_f(const CoordinateTriple* in, int32_t count, double e, double lon0, double lat0,
                   double e2, double /*q1*/, double qp, double rq, double /*m1*/, double sin_b1,
                   double cos_b1, double sin_lat0, double cos_lat0, double D, CoordinateTriple* out,
                   TWstatus* status) {
  const bool sphere = e == 0;
  if (is_polar(lat0)) {
    *status = over_points(EqualAreaPolarForward{sphere, e, e2, lon0, lat0, qp, side_of(lat0)},
                          count, in, out);
    return;
  }
  const bool equatorial = is_equatorial(lat0);
  EqualAreaForward kernel = {sphere, e, e2, lon0, lat0, 1 / qp, sin_b1, cos_b1, rq * D, rq / D};
  if (sphere) {
    kernel.over_qp = kernel.x_scale = kernel.y_scale = 1;
    kernel.sin1 = sin_lat0;
    kernel.cos1 = cos_lat0;
  }
  if (equatorial) {
    kernel.sin1 = 0;
    kernel.cos1 = 1;
    kernel.x_scale = 1;
    kernel.y_scale = sphere ? 1 : rq * rq;
  }
  *status = over_points(kernel, count, in, out);
}

void TWlam_az_eq_i(const CoordinateTriple* in, int32_t count, double e, double lon0, double lat0,
                   double e2, double qp, double rq, double sin_b1, double cos_b1, double sin_lat0,
                   double cos_lat0, double D, CoordinateTriple* out, TWstatus* status) {
  const bool sphere = e == 0;
  const bool polar = is_polar(lat0);
  const EqualAreaOrigin origin = {e,      e2,     lon0,     lat0,     qp, rq,
                                  sin_b1, cos_b1, sin_lat0, cos_lat0, D,  polar};
  const bool series = sphere || (std::fabs(e) <= kSeriesEccentricity && is_q_of_pole(e, e2, qp));
  const AuthalicInverse inverse(series ? e : 0);
  if (polar) {
    // On the sphere a polar origin has the latitude formula of the others.
    *status = over_points(EqualAreaPolarInverse{origin, sphere, series, sphere ? 0.5 : 1 / qp,
                                                lat0 < 0 ? -1.0 : 1.0, inverse},
                          count, in, out);
  } else if (sphere) {
    *status = over_points(EqualAreaInverse{origin, series, 1, 1, sin_lat0, cos_lat0, inverse},
                          count, in, out);
  } else {
    *status = over_points(EqualAreaInverse{origin, series, D, 1 / rq, sin_b1, cos_b1, inverse},
                          count, in, out);
  }
}

void TWlam_az_eq_s(const CoordinateTriple* in, int32_t count, double lon0, double lat0, double e,
                   double e2, double qp, double k0, double sin_lat0, double cos_lat0,
                   CoordinateTriple* out, TWstatus* status) {
  const bool equatorial = is_equatorial(lat0);
  *status = over_points(
      EqualAreaScale{e == 0, is_polar(lat0), e, e2, lon0, qp, k0, equatorial ? 0 : sin_lat0,
                     equatorial ? 1 : cos_lat0, side_of(lat0)},
      count, in, out);
}
