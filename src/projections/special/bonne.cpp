// Bonne projection of the ellipsoid.

#include <cmath>

#include "formulas/wraps.hpp"
#include "foundation/meridian_arc.hpp"
#include "projections/special/turns_about.hpp"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// Differences up to this are none.
constexpr double kNearZero = 1e-12;
// pi/2 - 1e-12: nearer to a pole every longitude is the central one.
constexpr double kLongitudeLimit = 1.5707963267938965;
// Nearest that the standard parallel comes to the equator, and least eccentricity of an ellipsoid.
constexpr double kLeast = 1.6e-8;

}  // namespace

void TWbonne_c(double e, double* lat1, double* e2, double* c1, double* r0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (e >= 1 || e < 0) {
    *status = TW_BAD_ECCENTRICITY;
    return;
  }
  if (0 <= *lat1 && *lat1 < kLeast) *lat1 = kLeast;
  if (-kLeast < *lat1 && *lat1 < 0) *lat1 = -kLeast;
  if (e < kLeast) {
    *e2 = 0;
    *c1 = 1 / std::tan(*lat1);
    *r0 = *c1 + *lat1;
    return;
  }
  *e2 = e * e;
  const double s = std::sin(*lat1);
  *c1 = std::cos(*lat1) / std::sqrt(1 - *e2 * s * s) / s;
  double arc = 0;
  *status = MeridianArc(1.0, e).forward(*lat1, &arc);
  if (TW_OK(*status)) *r0 = *c1 + arc;
}

void TWbonne_f(double lon0, double lat1, double e, double e2, double c1, double r0, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const MeridianArc arc(1.0, e);
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = wrap_turns_below_then_above(in[i].x - lon0);
    const double dp = std::fabs(lat - lat1);
    if (std::fabs(d) <= kNearZero && dp <= kNearZero) {
      out[i].x = 0;
      out[i].y = 0;
      continue;
    }
    double r = c1;
    double angle = 0;
    if (e2 == 0) {
      r = r0 - lat;
      angle = std::cos(lat) * d / r;
    } else if (dp <= kNearZero) {
      angle = std::sin(lat) * d;
    } else {
      const double m = std::cos(lat) / std::sqrt(1 - e2 * square(std::sin(lat)));
      double distance = 0;
      const TWstatus word = arc.forward(lat, &distance);
      if (word != TW_SUCCESS) *status = word;
      if (!TW_OK(word)) return;
      r = r0 - distance;
      angle = d * m / r;
    }
    out[i].x = r * std::sin(angle);
    out[i].y = c1 - r * std::cos(angle);
  }
}

void TWbonne_i(double lon0, double lat1, double e, double e2, double c1, double r0, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const MeridianArc arc(1.0, e);
  for (int32_t i = 0; i < count; ++i) {
    double x = in[i].x;
    const double y = in[i].y;
    if (std::fabs(y) <= kNearZero && std::fabs(x) <= kNearZero) {
      out[i].x = lon0;
      out[i].y = lat1;
      continue;
    }
    double dy = c1 - y;
    double r = std::sqrt(x * x + dy * dy);
    if (lat1 < 0) {
      r = -r;
      x = -x;
      dy = -dy;
    }
    double lat = r0 - r;
    if (e2 != 0) {
      const TWstatus word = arc.inverse(r0 - r, &lat);
      if (word != TW_SUCCESS) *status = word;
      if (!TW_OK(word)) return;
    }
    double lon = lon0;
    if (std::fabs(lat) <= kLongitudeLimit) {
      double m = std::cos(lat);
      if (e2 != 0) m /= std::sqrt(1 - e2 * square(std::sin(lat)));
      lon = turns_about(lon0, std::atan2(x, dy) * r / m + lon0);
    }
    out[i].x = lon;
    out[i].y = lat;
  }
}

void TWbonne_s(double k0, double lat1, double lon0, double e2, double r0, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  // By contract: on the ellipsoid, too, the scale is that of the sphere, and the argument is
  // discarded.
  if (e2 != 0) r0 = 1 / std::tan(lat1) + lat1;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = wrap_turns_below_then_above(in[i].x - lon0);
    double h = 1;
    // By contract: a latitude is tested only off the central meridian and the standard parallel.
    if (std::fabs(d) > kNearZero && std::fabs(lat - lat1) > kNearZero) {
      if (std::fabs(lat) - kHalfPi > kNearZero) {
        *status = TW_BAD_LATITUDE;
        return;
      }
      const double r = r0 - lat;
      const double g = (std::cos(lat) - r * std::sin(lat)) / r * d;
      h = std::sqrt(g * g + 1);
    }
    out[i] = {k0, k0 * h, k0 * k0};
  }
}
