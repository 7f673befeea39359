// Stereographic projection of the ellipsoid: what the contract says of the points that the formulas
// do not cover, the searches for a latitude of true scale, and the exported functions.

#include <cmath>
#include <utility>

#include "points/portable.hpp"
#include "projections/conformal/stereographic_points.hpp"
#include "tidewater/ellipsoid.h"
#include "tidewater/stereographic.h"

using namespace tidewater::detail;

namespace tidewater::detail {

namespace {

ObliqueOrigin oblique_origin(double e, double lon0, double lat0, double m0, double chi0) {
  const auto chi = sincos(chi0);
  return {e, lon0, lat0, chi.sin, chi.cos, 2 * m0 / chi.cos};
}

double side_of(double C) { return C < 0 ? -1 : 1; }

// The latitude p with t(p) = w, by at most ten passes.  False when they were used up.
bool latitude_in_ten_passes(double e, double w, double& lat) {
  constexpr int kMostPasses = 10;
  lat = kHalfPi - 2 * portable::atan(w);
  double previous = 0;
  int passes = 0;
  do {
    previous = lat;
    lat = kHalfPi - 2 * portable::atan(w * eccentric_factor(e, portable::sin(previous)));
    ++passes;
  } while (!(std::fabs(lat - previous) <= kStereographicEpsilon) && passes < kMostPasses);
  // By contract: the count alone decides, also when the last pass did converge.
  return passes < kMostPasses;
}

Next refuse_latitude(TWstatus* status) {
  *status = TW_BAD_LATITUDE;
  return Next::point;  // the failing point stays unwritten, the others are computed
}

// By contract: points that were skipped are looked at too, with what the output held.
void hold_pole(double lon0, CoordinateTriple* out) {
  if (at_stereographic_pole(out->y)) out->x = lon0;
}

}  // namespace

Next StereographicObliqueForward::other(const CoordinateTriple&, CoordinateTriple*,
                                        TWstatus* status) const {
  return refuse_latitude(status);
}

Next StereographicPolarForward::other(const CoordinateTriple&, CoordinateTriple*,
                                      TWstatus* status) const {
  return refuse_latitude(status);
}

Next StereographicObliqueInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                                        TWstatus* status) const {
  const auto at = on_sphere(in.x, in.y);
  double lat = lat0;
  TWstatus word = TW_SUCCESS;
  if (!at.centre) TWconflat_geod(e, at.chi, &lat, &word);
  if (word != TW_SUCCESS) {
    *status = TW_BAD_LATITUDE;
  } else {
    out->x = at.centre ? lon0 : at.lon;
    out->y = lat;
  }
  hold_pole(lon0, out);
  return Next::point;
}

Next StereographicPolarInverse::other(const CoordinateTriple& in, CoordinateTriple* out,
                                      TWstatus* status) const {
  double lat = 0;
  if (latitude_in_ten_passes(e, std::sqrt(in.x * in.x + in.y * in.y) / size, lat)) {
    out->x = longitude(in.x, in.y);
    out->y = side * lat;
  } else {
    *status = TW_NOT_CONVERGED;
  }
  hold_pole(lon0, out);
  return Next::point;
}

Next StereographicObliqueScale::other(const CoordinateTriple&, CoordinateTriple*,
                                      TWstatus* status) const {
  return refuse_latitude(status);
}

Next StereographicPolarScale::other(const CoordinateTriple&, CoordinateTriple*,
                                    TWstatus* status) const {
  return refuse_latitude(status);
}

namespace {

// By contract: the one lon0 of the whole call is negated anew at each point of the south, so that
// its sign alternates along the array.  So the points cannot be done several at once.
TWstatus south_polar_inverse(StereographicPolarInverse kernel, int32_t count,
                             const CoordinateTriple* in, CoordinateTriple* out) {
  TWstatus status = TW_SUCCESS;
  double lon0 = kernel.lon0;
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple given = in[i];
    const bool centre = std::sqrt(given.x * given.x + given.y * given.y) < kStereographicEpsilon;
    if (!centre) lon0 = -lon0;
    kernel.lon0 = centre ? lon0 : -lon0;  // the sum with it is negated with the result
    one_point(kernel, given, out + i, &status);
  }
  for (int32_t i = 0; i < count; ++i) hold_pole(lon0, out + i);
  return status;
}

}  // namespace

}  // namespace tidewater::detail

void TWstereo_c(double e, double lat0, double* C, double* m0, double* chi0, TWstatus* status) {
  *status = TW_SUCCESS;
  if (std::fabs(std::fabs(lat0) - kHalfPi) < 1e-14) {
    const double size = 2 / std::sqrt(portable::pow(1 + e, 1 + e) * portable::pow(1 - e, 1 - e));
    *C = lat0 < 0 ? -size : size;
    return;
  }
  *C = 0.0;
  *m0 = parallel_radius(e * e, portable::sin(lat0), portable::cos(lat0));
  TWgeod_conflat(e, lat0, chi0, status);
}

void TWstereo_f(double e, double lon0, double lat0, double C, double m0, double chi0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  if (C == 0) {
    *status = over_points(StereographicObliqueForward{oblique_origin(e, lon0, lat0, m0, chi0)},
                          count, in, out);
  } else {
    *status = over_points(StereographicPolarForward{e, lon0, lat0, std::fabs(C), side_of(C)}, count,
                          in, out);
  }
}

void TWstereo_i(double e, double lon0, double lat0, double C, double m0, double chi0, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  if (C == 0) {
    const auto chi = sincos(chi0);
    *status = over_points(StereographicObliqueInverse{e, lon0, lat0, chi.sin, chi.cos,
                                                      chi.cos / (2 * m0), ConformalInverse(e)},
                          count, in, out);
    return;
  }
  const StereographicPolarInverse kernel = {
      e, lon0, lat0, std::fabs(C), side_of(C), ConformalInverse(e)};
  *status = C < 0 && lon0 != 0 ? south_polar_inverse(kernel, count, in, out)
                               : over_points(kernel, count, in, out);
}

double TWstereo_s(double e, double k0, double lon0, double lat0, double C, double m0, double chi0,
                  int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status) {
  // Read before anything is written: in and out may be the same array.
  const bool last_computed = count > 0 && !beyond_pole(in[count - 1].y);
  if (C == 0) {
    *status = over_points(StereographicObliqueScale{oblique_origin(e, lon0, lat0, m0, chi0), k0},
                          count, in, out);
  } else {
    *status = over_points(StereographicPolarScale{e, lon0, lat0, std::fabs(C), side_of(C), k0},
                          count, in, out);
  }
  return last_computed ? out[count - 1].x : k0;
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
