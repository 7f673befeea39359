// Lambert azimuthal equal-area projection of the sphere and the ellipsoid.

#include <cmath>

#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "projections/isometric_latitude.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

// Nearer than this to a pole or to the equator, an origin takes the polar or equatorial road.
constexpr double kAspectMargin = 1e-12;
// How far the sine of an authalic latitude may stand beyond 1 and still be held there.
constexpr double kTightLimit = 1.000000000001;
// By contract: looser in the inverse on the ellipsoid.
constexpr double kLooseLimit = 1.0005;

// Where 1 and the cosine of the distance from the origin sum to less than this, nearly all their
// digits cancel.
constexpr double kNearAntipode = 1e-6;

bool is_polar(double lat0) { return std::fabs(std::fabs(lat0) - kHalfPi) < kAspectMargin; }

// q(p) = (1 - e^2) (sin p / (1 - e^2 sin^2 p) - ln((1 - e sin p) / (1 + e sin p)) / 2e)
// (Snyder 1987, eq. 3-12).  By contract: in this plain form, to the bit, and not by authalic_q.
// Callers hold its value at the pole, which may have been worked out elsewhere, and near the pole
// one more or less in its last digit decides whether a point is held.
double q_of(double e, double e2, double s) {
  return (s / (1 - e2 * s * s) - std::log((1 - e * s) / (1 + e * s)) / (2 * e)) * (1 - e2);
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
  constexpr double kStep = 1e-7;
  if (!(std::fabs(lat + lat0) < kStep)) return;
  if (polar) {
    lat += lat <= 0 ? kStep : -kStep;
  } else if (std::fabs(std::fabs(d) - kPi) < kStep) {
    const bool inside = kPi - std::fabs(d) >= 0;
    d += (d <= 0) == inside ? kStep : -kStep;
  }
}

// From q back to the geodetic latitude, by Newton's rule (Snyder 1987, eq. 3-16).
class LatitudeOfQ {
 public:
  LatitudeOfQ(double e, double e2, double qp)
      : e_(e), e2_(e2), qp_(qp), series_(std::fabs(e) <= kSeriesEccentricity) {
    const double e4 = e2 * e2;
    const double e6 = e4 * e2;
    p2_ = e2 / 3 + 31 * e4 / 180 + 517 * e6 / 5040;
    p4_ = 23 * e4 / 360 + 251 * e6 / 3780;
    p6_ = 761 * e6 / 45360;
  }

  // u is half of q, held at 1.  False when the passes were used up.
  bool find(double q, double u, double& lat) const {
    constexpr int kMostPasses = 50;
    double tolerance = 1e-13;
    lat = std::asin(u);
    if (series_) {
      const double sin_beta = q / qp_;
      // Beyond the pole by more than rounding there is no root, and the passes would be used up.
      if (std::fabs(sin_beta) > kTightLimit) return false;
      if (std::fabs(sin_beta) >= 1) {
        lat = std::copysign(kHalfPi, sin_beta);
        return true;
      }
      lat = near(sin_beta);
      // So near to the root, what a pass leaves is of the order of the square of its step.
      tolerance = 1e-8;
    }
    double difference = 1;
    int passes = 0;
    while (!(difference <= tolerance)) {
      if (++passes == kMostPasses) return false;
      const double step = correction(q, lat);
      difference = std::fabs(step);
      lat += step;
    }
    return true;
  }

 private:
  // By the authalic latitude beta to 1e-9 (Snyder 1987, eq. 3-18).
  double near(double sin_beta) const {
    const double cos_beta = std::sqrt((1 - sin_beta) * (1 + sin_beta));
    const double s2 = 2 * sin_beta * cos_beta;
    const double c2 = 1 - 2 * sin_beta * sin_beta;
    // sin 4b = 2 s2 c2, sin 6b = s2 (4 c2^2 - 1)
    return std::asin(sin_beta) + s2 * (p2_ + 2 * c2 * p4_ + (4 * c2 * c2 - 1) * p6_);
  }

  // (q - q(lat)) w^2 / (2 (1 - e^2) cos lat).  Near a pole both q are taken off that of the pole:
  // so the difference keeps its digits where q hardly changes any more.
  double correction(double q, double lat) const {
    constexpr double kNearPole = 0.9;
    const double sin_lat = std::sin(lat);
    const double c = std::cos(lat);
    const double w = 1 - e2_ * (sin_lat * sin_lat);
    double t = 0;
    if (std::fabs(sin_lat) < kNearPole) {
      t = std::log((1 - e_ * sin_lat) / (1 + e_ * sin_lat)) / (2 * e_) + q / (1 - e2_) -
          sin_lat / w;
    } else {
      const double side = lat < 0 ? -1 : 1;
      const double s = side * sin_lat;
      const double u = c * c / (1 + s);  // 1 - sin
      const double from_pole =
          u * (1 + e2_ * s) / (w * (1 - e2_)) + std::atanh(e_ * u / (1 - e2_ * s)) / e_;
      t = side * ((side * q - qp_) / (1 - e2_) + from_pole);
    }
    return t * (w * w) / (2 * c);
  }

  double e_, e2_, qp_;
  bool series_;
  double p2_ = 0, p4_ = 0, p6_ = 0;
};

}  // namespace

void TWlam_az_eq_c(double e, double /*lon0*/, double lat0, double* e2, double* q1, double* qp,
                   double* rq, double* m1, double* sin_b1, double* cos_b1, double* sin_lat0,
                   double* cos_lat0, double* D, TWstatus* status) {
  *status = TW_SUCCESS;
  const double sin_0 = std::sin(lat0);
  const double cos_0 = std::cos(lat0);
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
  const double b1 = std::asin(q_origin / q_pole);
  const double cos_b = std::cos(b1);
  *m1 = m_origin;
  *sin_b1 = std::sin(b1);
  *cos_b1 = cos_b;
  *D = m_origin / (cos_b * radius);
}

void TWlam_az_eq_f(const CoordinateTriple* in, int32_t count, double e, double lon0, double lat0,
                   double e2, double /*q1*/, double qp, double rq, double /*m1*/, double sin_b1,
                   double cos_b1, double sin_lat0, double cos_lat0, double D, CoordinateTriple* out,
                   TWstatus* status) {
  *status = TW_SUCCESS;
  const bool sphere = e == 0;
  const bool polar = is_polar(lat0);
  const bool equatorial = std::fabs(lat0) < kAspectMargin;
  // Sine and cosine of the latitude of the origin on the sphere.
  const double s0 = equatorial ? 0 : sphere ? sin_lat0 : sin_b1;
  const double c0 = equatorial ? 1 : sphere ? cos_lat0 : cos_b1;
  for (int32_t i = 0; i < count; ++i) {
    double d = in[i].x - lon0;
    double lat = in[i].y;
    leave_antipode(polar, lat0, lat, d);
    const double sin_d = std::sin(d);
    const double cos_d = std::cos(d);

    if (polar) {
      double r = 0;
      if (sphere) {
        const double w = kQuarterPi - lat / 2;
        r = 2 * (lat0 >= 0 ? std::sin(w) : std::cos(w));
      } else {
        const double q = q_of(e, e2, std::sin(lat));
        r = std::sqrt(lat0 >= 0 ? qp - q : qp + q);
      }
      out[i].x = r * sin_d;
      out[i].y = lat0 >= 0 ? -r * cos_d : r * cos_d;
      continue;
    }

    // Sine and cosine of the latitude on the sphere: the authalic one on the ellipsoid.
    double s = std::sin(lat);
    double c = 0;
    if (sphere) {
      c = std::cos(lat);
    } else {
      s = q_of(e, e2, s) / qp;
      if (!hold_sine(kTightLimit, s, status)) return;
      c = std::sqrt((1 - s) * (1 + s));
      if (c * c0 * cos_d + s * s0 + 1 < kNearAntipode) {
        // What is left of the sum hangs on the last bit of c, so the angle itself is taken.
        const double beta = std::asin(s);
        s = std::sin(beta);
        c = std::cos(beta);
      }
    }
    const double b = std::sqrt(2 / (c * c0 * cos_d + s * s0 + 1));
    if (equatorial) {
      out[i].x = b * c * sin_d;
      out[i].y = sphere ? b * s : rq * rq * b * s;
    } else if (sphere) {
      out[i].x = b * c * sin_d;
      out[i].y = (c0 * s - c * s0 * cos_d) * b;
    } else {
      out[i].x = c * D * sin_d * (b * rq);
      out[i].y = (s * c0 - c * cos_d * s0) * (b * rq) / D;
    }
  }
}

void TWlam_az_eq_i(const CoordinateTriple* in, int32_t count, double e, double lon0, double lat0,
                   double e2, double qp, double rq, double sin_b1, double cos_b1, double sin_lat0,
                   double cos_lat0, double D, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  constexpr double kLatLimit = 1.5707963267958966;  // pi/2 and 1e-12
  const bool sphere = e == 0;
  const bool polar = is_polar(lat0);
  const LatitudeOfQ latitude_of(e, e2, qp);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    double lon = lon0;
    double lat = lat0;
    if (sphere) {
      const double rho = std::sqrt(x * x + y * y);
      if (rho != 0) {
        double u = rho / 2;
        if (!hold_sine(kTightLimit, u, status)) return;
        const double c = 2 * std::asin(u);
        const double sin_c = std::sin(c);
        const double cos_c = std::cos(c);
        if (polar) {
          lon = std::atan2(x, lat0 < 0 ? y : -y) + lon0;
        } else {
          lon = std::atan2(x * sin_c, cos_lat0 * cos_c * rho - sin_lat0 * sin_c * y) + lon0;
        }
        lat = std::asin(cos_lat0 * sin_c * y / rho + sin_lat0 * cos_c);
      }
    } else {
      double q = 0;
      if (polar) {
        const double rho = std::sqrt(x * x + y * y);
        // By contract: without its sign, so that a point past the equator comes out mirrored in it.
        q = std::fabs(qp - rho * rho);
        if (lat0 < 0) q = -q;
        lon = std::atan2(x, lat0 < 0 ? y : -y) + lon0;
      } else {
        const double rho = std::sqrt(square(x / D) + square(D * y));
        if (rho == 0) {
          q = sin_b1 * qp;
        } else {
          double u = rho / (2 * rq);
          if (!hold_sine(kLooseLimit, u, status)) return;
          const double ce = 2 * std::asin(u);
          const double sin_ce = std::sin(ce);
          const double cos_ce = std::cos(ce);
          q = (D * sin_ce * cos_b1 * y / rho + cos_ce * sin_b1) * qp;
          lon = std::atan2(x * sin_ce, D * cos_ce * cos_b1 * rho - D * D * sin_ce * sin_b1 * y) +
                lon0;
        }
      }
      double u = q / 2;
      if (!hold_sine(kLooseLimit, u, status)) return;
      if (!latitude_of.find(q, u, lat)) {
        *status = TW_NOT_CONVERGED;
        return;
      }
    }
    if (lat < -kLatLimit || lat > kLatLimit) {
      *status = TW_NOT_CONVERGED;
      return;
    }
    out[i].x = wrap_above_then_at_or_below(lon);
    out[i].y = lat;
  }
}

void TWlam_az_eq_s(const CoordinateTriple* in, int32_t count, double lon0, double lat0, double e,
                   double e2, double qp, double k0, double sin_lat0, double cos_lat0,
                   CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const bool sphere = e == 0;
  const bool polar = is_polar(lat0);
  const bool equatorial = std::fabs(lat0) < kAspectMargin;
  for (int32_t i = 0; i < count; ++i) {
    const double d = in[i].x - lon0;
    const double lat = in[i].y;
    double k = 0;
    if (!polar) {
      // By contract: the form of the sphere, also on the ellipsoid.
      k = equatorial ? std::sqrt(2 / (std::cos(lat) * std::cos(d) + 1))
                     : std::sqrt(2 / (cos_lat0 * std::cos(d) * std::cos(lat) +
                                      sin_lat0 * std::sin(lat) + 1));
    } else if (sphere) {
      const double w = kQuarterPi - lat / 2;
      k = 1 / (lat0 >= 0 ? std::cos(w) : std::sin(w));
    } else {
      const double s = std::sin(lat);
      const double q = q_of(e, e2, s);
      k = std::sqrt(lat0 >= 0 ? qp - q : q + qp) / parallel_radius(e2, s, std::cos(lat));
    }
    const double h = 1 / k;
    out[i] = {k * k0, h * k0, h * k * k0 * k0};
  }
}
