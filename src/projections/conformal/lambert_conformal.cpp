// Lambert conformal conic projection of the ellipsoid with one or two standard parallels.
// Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 104-110.

#include <cmath>

#include "formulas/pole_hold.hpp"
#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "projections/isometric_latitude.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::detail;

namespace {

constexpr double kPolarParallel = 1.5707963267938965;

bool at_north_pole(double lat) { return std::fabs(lat - kHalfPi) < 1e-14; }
bool at_south_pole(double lat) { return std::fabs(lat + kHalfPi) < 1e-14; }

double radius_of_parallel(double e, double lat) {
  return parallel_radius(square(e), std::sin(lat), std::cos(lat));
}

// t(p) of a latitude whose sine and cosine are at hand.  The half angle's tangent comes from them;
// towards the poles, where a last bit of pi/4 - p/2 counts, from that difference.
double colatitude_tangent(double e, double lat, double s, double c) {
  if (std::fabs(lat) > 1.4) return isometric_colatitude_tangent(e, lat);
  const double opposite = s < 0 ? 1 - s : c;
  const double adjacent = s < 0 ? c : 1 + s;
  return opposite / (adjacent * eccentric_factor(e, s));
}

// The latitude whose t(p) is w, by passes of the fixed point, fifteen at most.
double latitude_of(double e, double w, TWstatus* status) {
  // A pass brings a latitude nearer by the factor e^2 / (1 - e^2) at least, so that up to this
  // eccentricity they come to rest within nine: Newton's method gets there with the same word.
  if (std::fabs(e) <= kSeriesEccentricity) return latitude_at_rest(e, w);
  constexpr int kMostPasses = 15;
  double lat = kHalfPi - 2 * std::atan(w);
  double old = 0;
  int passes = 0;
  do {
    old = lat;
    lat = next_latitude(e, w, old);
    if (++passes == kMostPasses) {
      // By contract: a point that comes to rest in this very pass is told so too.
      *status = TW_I_LATITUDE_LIMITED;
      break;
    }
  } while (std::fabs(old - lat) > 1e-14);
  return lat;
}

}  // namespace

void TWlam_c(double e, double /*lon0*/, double lat0, double lat1, double lat2, double* C, double* n,
             double* rho0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (lat0 > kHalfPi || lat0 < -kHalfPi) {
    *status = TW_BAD_LATITUDE;
    return;
  }
  const bool one_parallel = std::fabs(lat1 - lat2) < 1e-12;
  if (one_parallel && std::fabs(lat1) < 1e-12) {
    *status = TW_BAD_PARAMETER;
    return;
  }
  const double t1 = isometric_colatitude_tangent(e, lat1);
  const double m1 = radius_of_parallel(e, lat1);
  if (std::fabs(lat2 - lat1) > 1e-12) {
    const double t2 = isometric_colatitude_tangent(e, lat2);
    const double m2 = radius_of_parallel(e, lat2);
    const double apart = std::log(t1) - std::log(t2);
    if (std::fabs(apart) < 1e-12) {
      *status = TW_BAD_PARAMETER;
      return;
    }
    *n = (std::log(m1) - std::log(m2)) / apart;
  } else {
    *n = std::sin(lat1);
  }

  if (one_parallel && std::fabs(lat1) > kPolarParallel) {
    // The cone has opened into the plane of the polar stereographic.
    const double value = 2 * eccentric_factor(e, 1.0) / std::sqrt(1 - square(e));
    *C = *n < 0 ? -value : value;
  } else {
    const double w = std::pow(t1, *n);
    if (std::fabs(w * *n) < 1e-12) {
      *status = TW_BAD_PARAMETER;  // n stays written: parallels symmetric about the equator
      return;
    }
    *C = m1 / (*n * w);
  }

  if (at_north_pole(lat0) || at_south_pole(lat0)) {
    const bool at_apex = at_north_pole(lat0) ? *n > 0 : *n < 0;
    if (at_apex) {
      *rho0 = 0;
    } else {
      *status = TW_BAD_LATITUDE;  // n and C stay written
    }
  } else {
    *rho0 = std::pow(isometric_colatitude_tangent(e, lat0), *n) * *C;
  }
}

void TWlam_f(double e, double lon0, double C, double n, double rho0, int32_t count,
             const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    const double lat = in[i].y;
    const double d = wrap_above_then_at_or_below(in[i].x - lon0);
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_BAD_LATITUDE;
      return;
    }
    if (at_north_pole(lat) || at_south_pole(lat)) {
      const bool at_apex = lat > 0 ? n > 0 : n < 0;
      if (!at_apex) {
        *status = TW_BAD_LATITUDE;  // unlike Mercator's, this pole ends the array
        return;
      }
      out[i].x = 0;
      out[i].y = rho0;
      continue;
    }
    const double t = colatitude_tangent(e, lat, std::sin(lat), std::cos(lat));
    const double rho = std::pow(t, n) * C;
    const double theta = d * n;
    out[i].x = rho * std::sin(theta);
    out[i].y = rho0 - rho * std::cos(theta);
  }
}

void TWlam_i(double e, double lon0, double C, double n, double rho0, int32_t count,
             CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status) {
  *status = TW_SUCCESS;
  const double sign = n < 0 ? -1 : 1;
  const double inv = 1 / n;
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    double lon = lon0;
    double lat = 0;
    if (rho0 == 0 && std::sqrt(square(x) + square(y)) < 1e-13) {
      lat = n < 0 ? -kHalfPi : kHalfPi;
    } else {
      const double from_apex = rho0 - y;
      const double rho = std::sqrt(square(x) + square(from_apex)) * sign;
      double theta = 0;
      if (std::fabs(rho) > 1e-13) {
        theta = n > 0 ? std::atan2(x, from_apex) : std::atan2(-x, -from_apex);
      }
      lon = theta * inv + lon0;
      const double w = std::pow(rho / C, inv);
      lat = latitude_of(e, w, status);
    }
    lon = wrap_at_or_below_then_above(lon);
    if (std::fabs(std::fabs(lat) - kHalfPi) < 1e-13) lon = lon0;  // as given, not wrapped
    out[i].x = lon;
    out[i].y = lat;
  }
}

void TWlam_s(double e, double k0, double C, double n, int32_t count, const CoordinateTriple* in,
             CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    double lat = in[i].y;
    double k = k0;
    if (lat > kHalfPi || lat < -kHalfPi) {
      *status = TW_BAD_LATITUDE;
    } else {
      lat = hold_off_poles(lat, 1e-10);
      const double rho = std::pow(isometric_colatitude_tangent(e, lat), n) * C;
      const double m = radius_of_parallel(e, lat);
      if (std::fabs(m) >= 1e-10) {
        k = n * k0 * rho / m;
      } else {
        *status = TW_BAD_LATITUDE;
      }
    }
    out[i] = {k, k, k * k};
  }
}
