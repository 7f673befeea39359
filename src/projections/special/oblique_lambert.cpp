// Oblique Lambert conformal projection: the ellipsoid on a conformal sphere, the graticule of the
// sphere turned about a pole, and a Lambert conic on it; with the constants of the Krovak case.
// IOGP Publication 373-7-2, Geomatics Guidance Note 7, part 2 (2022), method 9819.
// Each stage goes through the whole array, several points at once: where one fails, what the
// earlier ones have written is seen.

#include <cmath>

#include "formulas/wraps.hpp"
#include "projections/turn_points.hpp"
#include "tidewater/gauss_sphere.h"
#include "tidewater/geodesic.h"
#include "tidewater/lambert_conformal.h"
#include "tidewater/oblique_lambert.h"
#include "tidewater/rotated_graticule.h"

using namespace tidewater::detail;

namespace {

// Hands the word of an inner call on; success does not erase an earlier word.  False on a failure.
bool carry(TWstatus word, TWstatus* status) {
  if (word != TW_SUCCESS) *status = word;
  return TW_OK(word);
}

// A parallel beyond the pole is reflected at it.
double reflect_at_pole(double p) { return p > kHalfPi ? kHalfPi - (p - kHalfPi) : p; }

// The pole of the cone, as far from the origin as the nearer geographic pole, along an azimuth.
void find_pole(double e, double lon0, double lat0, double azimuth, double* pole_lon,
               double* pole_lat, TWstatus* status) {
  constexpr double kAtPole = kHalfPi - 1e-12;
  if (lat0 > kAtPole || lat0 < -kAtPole) {
    *pole_lon = lon0;
    *pole_lat = lat0 > 0 ? kHalfPi : -kHalfPi;
    return;
  }
  const CoordinateTriple origin = {lon0, lat0, 0};
  const CoordinateTriple near_pole = {lon0, lat0 >= 0 ? kHalfPi : -kHalfPi, 0};
  double arc = 0;
  double ignored = 0;
  double back = 0;
  TWgeodesic_inv(origin, near_pole, 1, e, &ignored, &back, &arc, status);
  if (!TW_OK(*status)) return;
  CoordinateTriple pole = {};
  TWgeodesic_dir(origin, azimuth, arc, 1, e, &pole, &back, status);
  if (!TW_OK(*status)) return;
  *pole_lon = pole.x;
  *pole_lat = pole.y;
}

// What Krovak's case holds fixed: latitude of the cone's pole on the sphere (59.71186 degrees) and
// the standard parallel (78.5 degrees).
constexpr double kKrovakPoleLat = 1.042168563805;
constexpr double kKrovakParallel = 1.370083462816;

// The constants of both cases.
void constants(bool krovak, double e, double lon0, double lat0, double d1, double d2,
               double azimuth, uint32_t use_azimuth, double* pole_lon, double* pole_lat,
               double* lat_r, double* s_lon, double* s_lat, double* offset, double* C,
               double* n_cone, double* rho0, double* g_c, double* g_t, TWstatus* status) {
  *status = TW_SUCCESS;
  if (use_azimuth != 0) {
    find_pole(e, lon0, lat0, azimuth, pole_lon, pole_lat, status);
    if (!TW_OK(*status)) return;
  }
  if (e != 0) {
    double middle = (d2 + d1) / 2 + lat0;
    if (std::fabs(middle) > kHalfPi) middle = lat0;
    double chi0 = 0;
    double radius = 0;
    TWgaussII_c(e, middle, &chi0, g_c, g_t, &radius, status);
    if (!TW_OK(*status)) return;
    CoordinateTriple image[2] = {{lon0, lat0, 0}, {*pole_lon, *pole_lat, 0}};
    TWgaussII_f(e, lon0, *g_c, *g_t, 2, image, image, status);
    if (!TW_OK(*status)) return;
    *lat_r = image[0].y;
    *s_lon = image[1].x + lon0;
    *s_lat = krovak ? kKrovakPoleLat : image[1].y;
  } else {
    *lat_r = lat0;
    *s_lon = *pole_lon;
    *s_lat = *pole_lat;
  }
  TWrotgrat_c(lon0, *lat_r, *s_lon, *s_lat, offset, status);
  if (!TW_OK(*status)) return;
  double arc = 0;
  double ignored = 0;
  double back = 0;
  TWgeodesic_inv({lon0, *lat_r, 0}, {*s_lon, *s_lat, 0}, 1, 0, &ignored, &back, &arc, status);
  if (!TW_OK(*status)) return;
  *lat_r = kHalfPi - arc;
  const double p1 = krovak ? kKrovakParallel : reflect_at_pole(*lat_r + d1);
  const double p2 = krovak ? kKrovakParallel : reflect_at_pole(*lat_r + d2);
  TWlam_c(0, lon0, *lat_r, p1, p2, C, n_cone, rho0, status);
  if (!TW_OK(*status) || !krovak) return;
  *rho0 = 0;
  *C *= 0.9999;
}

constexpr double kUpright = 1e-13;

// The points on the turned sphere: from the ellipsoid to the sphere, whose longitudes are relative
// to lon0 and have lon_added added, and about the pole unless it is the geographic pole above lon0.
// Gives the array that holds them, in or out; null on a failure.
const CoordinateTriple* to_turned_sphere(double e, double lon0, double lon_added, double lat_r,
                                         double s_lon, double s_lat, double offset, double g_c,
                                         double g_t, int32_t count, const CoordinateTriple* in,
                                         CoordinateTriple* out, TWstatus* status) {
  TWstatus word = TW_SUCCESS;
  const CoordinateTriple* points = in;
  if (e != 0) {
    TWgaussII_f(e, lon0, g_c, g_t, count, in, out, &word);
    if (!carry(word, status)) return nullptr;
    for (int32_t i = 0; i < count; ++i) out[i].x += lon_added;
    points = out;
  }
  if (std::fabs(lon0 - s_lon) >= kUpright || std::fabs(s_lat - kHalfPi) >= kUpright) {
    TWrotgrat_f(lon0, lat_r, s_lon, s_lat, offset, count, points, out, &word);
    if (!carry(word, status)) return nullptr;
    points = out;
  }
  return points;
}

}  // namespace

void TWo_lam_c(double e, double lon0, double lat0, double d1, double d2, double azimuth,
               uint32_t use_azimuth, double* pole_lon, double* pole_lat, double* lat_r,
               double* s_lon, double* s_lat, double* offset, double* C, double* n_cone,
               double* rho0, double* g_c, double* g_t, TWstatus* status) {
  constants(false, e, lon0, lat0, d1, d2, azimuth, use_azimuth, pole_lon, pole_lat, lat_r, s_lon,
            s_lat, offset, C, n_cone, rho0, g_c, g_t, status);
}

void TWkrovak_c(double e, double lon0, double lat0, double d1, double d2, double azimuth,
                uint32_t use_azimuth, double* pole_lon, double* pole_lat, double* lat_r,
                double* s_lon, double* s_lat, double* offset, double* C, double* n_cone,
                double* rho0, double* g_c, double* g_t, TWstatus* status) {
  constants(true, e, lon0, lat0, d1, d2, azimuth, use_azimuth, pole_lon, pole_lat, lat_r, s_lon,
            s_lat, offset, C, n_cone, rho0, g_c, g_t, status);
}

void TWo_lam_f(double e, double lon0, double lat_r, double C, double n_cone, double rho0,
               double s_lon, double s_lat, double turn, double offset, double g_c, double g_t,
               int32_t count, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const CoordinateTriple* points = to_turned_sphere(e, lon0, lon0, lat_r, s_lon, s_lat, offset, g_c,
                                                    g_t, count, in, out, status);
  if (!points) return;
  TWstatus word = TW_SUCCESS;
  TWlam_f(0, lon0, C, n_cone, rho0, count, points, out, &word);
  if (!carry(word, status)) return;
  turn_points(-turn, count, out);
}

void TWo_lam_i(double e, double lon0, double lat_r, double C, double n_cone, double rho0,
               double s_lon, double s_lat, double turn, double offset, double g_c, double g_t,
               int32_t count, CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  turn_points(turn, count, in);  // By contract: in the caller's input array.
  TWstatus word = TW_SUCCESS;
  TWlam_i(0, lon0, C, n_cone, rho0, count, out, in, &word);
  if (!carry(word, status)) return;
  // Unlike the forward function, this one turns for a pole that is not a number.
  if (!(std::fabs(lon0 - s_lon) < kUpright && std::fabs(s_lat - kHalfPi) < kUpright)) {
    TWrotgrat_i(lon0, lat_r, s_lon, s_lat, offset, count, out, out, &word);
    if (!carry(word, status)) return;
  }
  if (e != 0) {
    for (int32_t i = 0; i < count; ++i) out[i].x -= lon0;
    TWgaussII_i(e, lon0, g_c, g_t, count, out, out, &word);
    carry(word, status);
  }
}

void TWo_lam_s(double e, double k0, double lon0, double lat_r, double C, double n_cone,
               double s_lon, double s_lat, double offset, double g_c, double g_t, int32_t count,
               const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  // By contract: the longitudes on the sphere stay relative to lon0, unlike in the forward
  // function.
  const CoordinateTriple* points =
      to_turned_sphere(e, lon0, 0, lat_r, s_lon, s_lat, offset, g_c, g_t, count, in, out, status);
  if (!points) return;
  TWstatus word = TW_SUCCESS;
  TWlam_s(0, k0, C, n_cone, count, points, out, &word);
  carry(word, status);
}
