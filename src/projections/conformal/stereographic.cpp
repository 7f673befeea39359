// Stereographic projection of the ellipsoid: oblique through the conformal latitude, and polar.

#include <cmath>
#include <utility>

#include "formulas/radii.hpp"
#include "formulas/wraps.hpp"
#include "projections/isometric_latitude.hpp"
#include "tidewater/conformal.h"
#include "tidewater/foundation.h"

using namespace tidewater::detail;

namespace {

// What takes a point for the origin, ends the polar inverse, and is small on the plane.
constexpr double kEpsilon = 1e-12;

bool beyond_pole(double lat) { return lat > kHalfPi || lat < -kHalfPi; }

bool at_origin(double lon, double lat, double lon0, double lat0) {
  return std::fabs(lon - lon0) < kEpsilon && std::fabs(lat - lat0) < kEpsilon;
}

struct SineCosine {
  double sin, cos;
};

// Sine and cosine of the conformal latitude of lat, without the angle: with T its half-angle
// tangent tan(chi/2 + pi/4), they are (T^2 - 1) / (T^2 + 1) and 2 T / (T^2 + 1).
SineCosine conformal_sine_cosine(double e, double lat) {
  const double s = std::sin(lat);
  const double c = std::cos(lat);
  // tan(lat/2 + pi/4), in the form that does not cancel
  const double tangent = lat < 0 ? c / (1 - s) : (1 + s) / c;
  const double t = tangent * eccentric_factor(e, s);
  const double t2 = t * t;
  return {(t2 - 1) / (t2 + 1), 2 * t / (t2 + 1)};
}

// The oblique road: C is zero, and m0 and chi0 describe the origin.
class Oblique {
 public:
  Oblique(double m0, double chi0)
      : sin_chi0_(std::sin(chi0)), cos_chi0_(std::cos(chi0)), scale_(2 * m0 / cos_chi0_) {}

  // The factor A of both coordinates and of the scale (Snyder 1987, eq. 21-27).
  double factor(double cos_d, SineCosine chi) const {
    return scale_ / (cos_d * cos_chi0_ * chi.cos + sin_chi0_ * chi.sin + 1);
  }
  double sin_chi0() const { return sin_chi0_; }
  double cos_chi0() const { return cos_chi0_; }

 private:
  double sin_chi0_, cos_chi0_, scale_;
};

void oblique_forward(double e, double lon0, double lat0, double m0, double chi0, int32_t count,
                     const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const Oblique origin(m0, chi0);
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    if (std::fabs(lat) > kHalfPi) {
      *status = TW_BAD_LATITUDE;
      continue;
    }
    if (at_origin(lon, lat, lon0, lat0)) {
      out[i].x = 0;
      out[i].y = 0;
      continue;
    }
    const SineCosine chi = conformal_sine_cosine(e, lat);
    const double d = lon - lon0;
    const double cos_d = std::cos(d);
    const double a = origin.factor(cos_d, chi);
    out[i].x = std::sin(d) * a * chi.cos;
    out[i].y = (origin.cos_chi0() * chi.sin - cos_d * origin.sin_chi0() * chi.cos) * a;
  }
}

void polar_forward(double e, double lon0, double lat0, double C, int32_t count,
                   const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const double sign = C < 0 ? -1 : 1;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    const double lat = in[i].y;
    if (beyond_pole(lat)) {
      *status = TW_BAD_LATITUDE;
      continue;
    }
    if (at_origin(lon, lat, lon0, lat0)) {
      out[i].x = 0;
      out[i].y = 0;
      continue;
    }
    const double rho = std::fabs(C) * isometric_colatitude_tangent(e, sign * lat);
    const double d = sign * (lon - lon0);
    out[i].x = sign * (std::sin(d) * rho);
    out[i].y = sign * (-std::cos(d) * rho);
  }
}

// The latitude of a conformal latitude that is given by its sine.  False where TWconflat_geod
// refuses it: not a number, or its passes used up.
bool latitude_of_conformal(double e, double sin_chi, double& lat) {
  if (std::fabs(e) <= kSeriesEccentricity) {
    // The passes are never used up there.  The root is tan(pi/4 - chi/2).
    lat = latitude_at_rest(e, std::sqrt((1 - sin_chi) / (1 + sin_chi)));
    return !std::isnan(lat);
  }
  TWstatus word = TW_SUCCESS;
  TWconflat_geod(e, std::asin(sin_chi), &lat, &word);
  return word == TW_SUCCESS;
}

void oblique_inverse(double e, double lon0, double lat0, double m0, double chi0, int32_t count,
                     const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  const double sin_chi0 = std::sin(chi0);
  const double cos_chi0 = std::cos(chi0);
  for (int32_t i = 0; i < count; ++i) {
    const double x = in[i].x;
    const double y = in[i].y;
    const double rho = std::sqrt(x * x + y * y);
    if (rho < kEpsilon) {
      out[i].x = lon0;
      out[i].y = lat0;
      continue;
    }
    const double ce = 2 * std::atan(rho * cos_chi0 / (2 * m0));
    const double sin_ce = std::sin(ce);
    const double cos_ce = std::cos(ce);
    double lat = 0;
    if (!latitude_of_conformal(e, sin_ce * y * cos_chi0 / rho + cos_ce * sin_chi0, lat)) {
      *status = TW_BAD_LATITUDE;
      continue;
    }
    // By contract: the plain arctangent of the quotient, so that no result lies more than a quarter
    // turn from lon0, and no wrap.
    out[i].x = std::atan(sin_ce * x / (cos_ce * rho * cos_chi0 - sin_ce * y * sin_chi0)) + lon0;
    out[i].y = lat;
  }
}

// The latitude p with t(p) = w, by at most ten passes.  False when they were used up.
bool latitude_of_tangent(double e, double w, double& lat) {
  if (std::fabs(e) <= kSeriesEccentricity) {
    // Six passes are enough there: what they come to rest at is found directly.
    lat = latitude_at_rest(e, w);
    return !std::isnan(lat);
  }
  constexpr int kMostPasses = 10;
  lat = kHalfPi - 2 * std::atan(w);
  double previous = 0;
  int passes = 0;
  do {
    previous = lat;
    lat = next_latitude(e, w, previous);
    ++passes;
  } while (!(std::fabs(lat - previous) <= kEpsilon) && passes < kMostPasses);
  // By contract: the count alone decides, also when the last pass did converge.
  return passes < kMostPasses;
}

// Returns lon0 as the loop leaves it.
double polar_inverse(double e, double lon0, double lat0, double C, int32_t count,
                     const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  for (int32_t i = 0; i < count; ++i) {
    double x = in[i].x;
    double y = in[i].y;
    const double rho = std::sqrt(x * x + y * y);
    if (rho < kEpsilon) {
      out[i].x = lon0;
      out[i].y = lat0;
      continue;
    }
    if (C < 0) {
      // By contract: the one lon0 of the whole call is negated anew at each point of the south, so
      // that its sign alternates along the array.
      lon0 = -lon0;
      x = -x;
      y = -y;
    }
    const double w = rho / std::fabs(C);
    double lat = 0;
    if (!latitude_of_tangent(e, w, lat)) {
      *status = TW_NOT_CONVERGED;
      continue;
    }
    double lon = std::atan2(x, -y) + lon0;
    if (C < 0) {
      lat = -lat;
      lon = -lon;
    }
    out[i].x = wrap_above_then_at_or_below(lon);
    out[i].y = lat;
  }
  return lon0;
}

}  // namespace

void TWstereo_c(double e, double lat0, double* C, double* m0, double* chi0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (std::fabs(std::fabs(lat0) - kHalfPi) < 1e-14) {
    const double size = 2 / std::sqrt(std::pow(1 + e, 1 + e) * std::pow(1 - e, 1 - e));
    *C = lat0 < 0 ? -size : size;
    return;
  }
  *C = 0.0;
  *m0 = parallel_radius(e * e, std::sin(lat0), std::cos(lat0));
  TWgeod_conflat(e, lat0, chi0, status);
}

void TWstereo_f(double e, double lon0, double lat0, double C, double m0, double chi0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  if (C == 0) {
    oblique_forward(e, lon0, lat0, m0, chi0, count, in, out, status);
  } else {
    polar_forward(e, lon0, lat0, C, count, in, out, status);
  }
}

void TWstereo_i(double e, double lon0, double lat0, double C, double m0, double chi0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  if (C == 0) {
    oblique_inverse(e, lon0, lat0, m0, chi0, count, in, out, status);
  } else {
    lon0 = polar_inverse(e, lon0, lat0, C, count, in, out, status);
  }
  // By contract: points that were skipped are looked at too, with what the output held.
  for (int32_t i = 0; i < count; ++i) {
    if (std::fabs(std::fabs(out[i].y) - kHalfPi) < 2e-12) out[i].x = lon0;
  }
}

double TWstereo_s(double e, double k0, double lon0, double lat0, double C, double m0, double chi0,
                  int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status) {
  *status = TW_SUCCESS;
  const bool oblique = C == 0;
  const Oblique origin = oblique ? Oblique(m0, chi0) : Oblique(1, 0);
  double k = k0;
  for (int32_t i = 0; i < count; ++i) {
    const double lon = in[i].x;
    double lat = in[i].y;
    if (beyond_pole(lat)) {
      *status = TW_BAD_LATITUDE;
      k = k0;  // for the caller that reads the value returned; the point stays unwritten
      continue;
    }
    if (at_origin(lon, lat, lon0, lat0)) {
      k = k0;
    } else {
      // At a pole the cosines of lat and of the conformal latitude are both what is left of pi/2,
      // and their quotient is finite: the angle itself is formed here.
      double size = 0;  // of the parallel, drawn over true
      if (oblique) {
        double chi = 0;
        TWstatus word = TW_SUCCESS;
        TWgeod_conflat(e, lat, &chi, &word);
        const SineCosine of_chi = {std::sin(chi), std::cos(chi)};
        size = origin.factor(std::cos(lon - lon0), of_chi) * of_chi.cos;
      } else {
        if (C < 0) lat = -lat;
        size = std::fabs(C) * isometric_colatitude_tangent(e, lat);
      }
      k = size * k0 / parallel_radius(e * e, std::sin(lat), std::cos(lat));
    }
    out[i] = {k, k, k * k};
  }
  return k;
}

void TWstereo_latTs(double e, double lon0, double lat0, double C, double m0, double chi0,
                    double lat_ts, double* k0, TWstatus* status) {
  *status = TW_SUCCESS;
  const bool oblique = C == 0;
  if (std::fabs(lat_ts) > kHalfPi || (oblique && lat_ts < 0)) {
    *status = TW_BAD_DATA;
    return;
  }
  if (oblique ? lat_ts == 0 : std::fabs(lat_ts) == kHalfPi) {
    *k0 = 1.0;
    return;
  }
  CoordinateTriple point = {lon0, lat_ts, 0};
  // On the oblique road lat_ts is a distance from the origin, laid off towards the south pole in
  // the northern hemisphere and towards the north pole in the southern.
  if (oblique) point.y = lat0 < 0 ? lat0 + lat_ts : lat0 - lat_ts;
  *k0 = 1.0 / TWstereo_s(e, 1.0, lon0, lat0, C, m0, chi0, 1, &point, &point, status);
}

void TWstereo_sTlat(double e, double lon0, double lat0, double C, double m0, double chi0, double k0,
                    double* lat_ts, TWstatus* status) {
  *status = TW_SUCCESS;
  if (k0 <= 0 || k0 > 1) {
    *status = TW_BAD_SCALE_LATITUDE;
    return;
  }
  double root = lat0;
  if (k0 != 1.0) {
    // Each evaluation sets the word anew: the last one stands.
    const auto excess = [&](double lat) {
      CoordinateTriple point = {lon0, lat, 0};
      return TWstereo_s(e, k0, lon0, lat0, C, m0, chi0, 1, &point, &point, status) - 1.0;
    };
    constexpr double kFifteenDegrees = 0.2617993877991494;
    constexpr int kMostPasses = 30;
    double other = 0.0;
    if (std::fabs(lat0) <= kQuarterPi) {
      other = lat0 < 0 ? lat0 + kFifteenDegrees : lat0 - kFifteenDegrees;
    }
    double f_root = excess(root);
    double f_other = excess(other);
    if (std::fabs(f_other) <= std::fabs(f_root)) {
      std::swap(root, other);
      std::swap(f_root, f_other);
    }
    int passes = 0;
    double d = 0;
    do {
      d = -(other - root) * f_root / (f_other - f_root);
      const double previous = other;
      other = root;
      f_other = f_root;
      root += d;
      // A step over a pole is laid off from the pole instead, and failing that the interval halved.
      if (root > kHalfPi) root = kHalfPi - d / 2;
      if (root < -kHalfPi) root = -kHalfPi - d / 2;
      if (beyond_pole(root)) root = (previous + other) / 2;
      f_root = excess(root);
      ++passes;
    } while (!(std::fabs(d) <= 1e-9 || f_root == 0) && passes < kMostPasses);
    // By contract: the count alone decides, and the result is written all the same.
    if (passes == kMostPasses || std::fabs(root) > kHalfPi) *status = TW_RANGE_ERROR;
  }
  *lat_ts = C == 0 ? std::fabs(root - lat0) : root;
}
