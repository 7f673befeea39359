// American polyconic projection of the ellipsoid.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 124-131.

#include <cmath>

#include "formulas/pole_hold.hpp"
#include "formulas/wraps.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

// Sines and cosines of the even multiples of a latitude, from its own.
struct Multiples {
  double sin2, cos2, sin4, cos4, sin6, cos6;

  Multiples(double sin_lat, double cos_lat)
      : sin2(2 * sin_lat * cos_lat),
        cos2(square(cos_lat) - square(sin_lat)),
        sin4(2 * sin2 * cos2),
        cos4(square(cos2) - square(sin2)),
        sin6(sin4 * cos2 + cos4 * sin2),
        cos6(cos4 * cos2 - sin4 * sin2) {}
};

// The meridian arc to e^6 (Snyder 1987, eq. 3-21), a shorter series than that of the other
// projections, and its derivative by latitude.
class ShortArc {
 public:
  explicit ShortArc(double e2)
      : f0_(1 - ((e2 * 5 / 16 + 0.75) * e2 / 4 + 1) * e2 / 4),
        f2_(((1.40625 * e2 + 3) * e2 / 4 + 3) * e2 / 8),
        f4_((11.25 * e2 + 15) * square(e2) / 256),
        f6_(cube(e2) * 0.011393229166666666),
        g6_(cube(e2) * 0.068359375) {}

  double arc(double lat, const Multiples& at) const {
    return f0_ * lat - f2_ * at.sin2 + f4_ * at.sin4 - f6_ * at.sin6;
  }

  double derivative(const Multiples& at) const {
    return f0_ - 2 * f2_ * at.cos2 + 4 * f4_ * at.cos4 - g6_ * at.cos6;
  }

 private:
  double f0_, f2_, f4_, f6_, g6_;
};

}  // namespace

void TWpolycon_c(double e, double lat0, double* m0) {
  *m0 = ShortArc(square(e)).arc(lat0, Multiples(std::sin(lat0), std::cos(lat0)));
}

void TWpolycon_f(double e, double lon0, double m0, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const ShortArc meridian(e2);
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = wrap_below_then_above(in[i].x - lon0);
    if (std::fabs(lat) < 1e-7) {
      out[i].x = d;
      out[i].y = -m0;
      continue;
    }
    const double s = std::sin(lat);
    const double c = std::cos(lat);
    const double E = s * d;
    const double radius = c / (s * std::sqrt(1 - square(s) * e2));  // nu / tan lat
    out[i].x = std::sin(E) * radius;
    out[i].y = (1 - std::cos(E)) * radius + (meridian.arc(lat, Multiples(s, c)) - m0);
  }
}

void TWpolycon_i(double e, double lon0, double m0, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const ShortArc meridian(e2);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double A = y + m0;
    if (std::fabs(A) < 1e-6) {
      out[i].x = x + lon0;
      out[i].y = 0.0;
      continue;
    }
    const double B = square(x) + square(A);
    double lat = A;
    double next;
    double s = 0;
    double C = 0;
    for (int pass = 0;; ++pass) {
      s = std::sin(lat);
      const double c = std::cos(lat);
      const Multiples at(s, c);
      C = s / c * std::sqrt(1 - square(s) * e2);
      const double Ma = meridian.arc(lat, at);
      const double Mp = meridian.derivative(at);
      const double V = square(Ma) + B;
      const double numerator = (C * Ma + 1) * A - Ma - V * C * 0.5;
      const double denominator =
          (V - 2 * Ma * A) * at.sin2 * e2 / (4 * C) + (C * Mp - 2 / at.sin2) * (A - Ma) - Mp;
      next = lat - numerator / denominator;
      const double change = std::fabs(next - lat);
      if (change < 1e-9) break;
      if (pass > 3 && change > 5.0) {
        *status = TW_DIVERGED;
        return;
      }
      if (pass > 25) {
        *status = TW_I_LATITUDE_LIMITED;
        break;
      }
      lat = next;
    }
    // By contract: the longitude belongs to the latitude before the last step.
    const bool at_pole = std::fabs(std::fabs(lat) - kHalfPi) < 1e-9;
    out[i].x = at_pole ? lon0 : std::asin(x * C) / s + lon0;  // not wrapped
    out[i].y = next;
  }
}

void TWpolycon_s(double e, double lon0, double k0, int32_t count, const CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = square(e);
  const ShortArc meridian(e2);
  double h = 0;
  double product = 0;
  for (int32_t i = 0; i < count; ++i) {
    const double d = in[i].x - lon0;
    double lat = in[i].y;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_BAD_LATITUDE;
      // By contract: the point repeats the values of the last good one, zeros where there is none.
      out[i] = {k0, h, product};
      continue;
    }
    lat = hold_off_poles(lat, 1e-14);
    const double s = std::sin(lat);
    const double c = std::cos(lat);
    double top = 0;
    double bottom = 1 - e2;
    if (std::fabs(lat) >= 1e-14) {
      const double E = d * s;
      const double v = square(s) * e2;
      const double angle =
          std::atan((E - std::sin(E)) / (1 / square(c) - std::cos(E) - v / (1 - v)));
      top = (1 - v) * square(std::sin(E / 2)) * 2 / square(s / c) + (1 - e2);
      bottom *= std::cos(angle);
    } else {
      top = meridian.derivative(Multiples(s, c)) + square(d) / 2;
    }
    h = top / bottom * k0;
    product = h * k0;
    out[i] = {k0, h, product};
  }
}
