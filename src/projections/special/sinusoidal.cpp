// Sinusoidal projection of the ellipsoid.

#include <cmath>

#include "formulas/wraps.hpp"
#include "foundation/meridian_arc.hpp"
#include "projections/special/turns_about.hpp"
#include "tidewater/foundation.h"
#include "tidewater/special.h"

using namespace tidewater::detail;

namespace {

// Differences up to this are none.
constexpr double kNearZero = 1e-12;
// pi/2 - 1e-12: nearer to a pole every longitude is the central one.
constexpr double kLongitudeLimit = 1.5707963267938965;

}  // namespace

void TWsinusoidal_c(double e, double lat0, double* e2, double* m0, TWstatus* status) {
  *e2 = e * e;
  *status = MeridianArc(1.0, e).forward(lat0, m0);
}

void TWsinusoidal_f(double lon0, double lat0, double e, double e2, double m0, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const MeridianArc arc(1.0, e);
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = wrap_turns_below_then_above(in[i].x - lon0);
    double x = 0;
    if (std::fabs(d) > kNearZero) {
      x = std::cos(lat) * d;
      if (e2 != 0) x /= std::sqrt(1 - e2 * square(std::sin(lat)));
    }
    double y = 0;
    if (!(std::fabs(lat - lat0) <= kNearZero)) {
      double m = 0;
      const TWstatus word = arc.forward(lat, &m);
      if (word != TW_SUCCESS) *status = word;
      if (!TW_OK(word)) return;
      y = m - m0;
    }
    out[i].x = x;
    out[i].y = y;
  }
}

void TWsinusoidal_i(double lon0, double lat0, double e, double e2, double m0, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const MeridianArc arc(1.0, e);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    double lat = lat0;
    if (!(std::fabs(y) <= kNearZero)) {
      const TWstatus word = arc.inverse(y + m0, &lat);
      if (word != TW_SUCCESS) *status = word;
      if (!TW_OK(word)) return;
    }
    double lon = lon0;
    if (std::fabs(x) > kNearZero && std::fabs(lat) <= kLongitudeLimit) {
      const double w = e2 != 0 ? std::sqrt(1 - e2 * square(std::sin(lat))) : 1;
      lon = turns_about(lon0, x * w / std::cos(lat) + lon0);
    }
    out[i].x = lon;
    out[i].y = lat;
  }
}

void TWsinusoidal_s(double k0, double lon0, double e2, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = wrap_turns_below_then_above(in[i].x - lon0);
    if (std::fabs(lat) - kHalfPi > kNearZero) {
      *status = TW_BAD_LATITUDE;
      return;
    }
    const double sin_lat = std::sin(lat);
    double h = 0;
    double areal = 1;
    if (e2 >= 1e-12) {
      const double w2 = 1 - e2 * sin_lat * sin_lat;
      const double w = w2 * std::sqrt(w2);
      const double g = sin_lat * d * (e2 - 1) / w;
      double dm = 0;
      TWstatus word = TW_SUCCESS;
      TWdM_dphi(1.0, e2, lat, &dm, &word);
      if (word != TW_SUCCESS) *status = word;
      if (!TW_OK(word)) return;
      h = std::sqrt(dm * dm + g * g) * w / (1 - e2);
      areal = dm * w / (1 - e2);
    } else {
      h = std::sqrt(d * d * sin_lat * sin_lat + 1);
    }
    // By contract: the scale along the parallel is k0 everywhere.
    out[i] = {k0, k0 * h, k0 * k0 * areal};
  }
}
