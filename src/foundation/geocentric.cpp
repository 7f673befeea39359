// Geodetic coordinates to and from the earth-centred rectangular frame.

#include <cmath>

#include "formulas/constants.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::detail;

void TWllh_to_xyz(double a, double e, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  for (int32_t i = 0; i < count; ++i) {
    const auto [lon, lat, height] = in[i];
    const double sin_lat = std::sin(lat);
    const double cos_lat = std::cos(lat);
    const double nu = a / std::sqrt(1 - e2 * square(sin_lat));
    out[i].x = (nu + height) * cos_lat * std::cos(lon);
    out[i].y = (nu + height) * cos_lat * std::sin(lon);
    out[i].z = ((1 - e2) * nu + height) * sin_lat;
  }
}

void TWxyz_to_llh(double a, double e, int32_t count, const CoordinateTriple* in,
                  CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double e2 = e * e;
  const double u = e2 * a;
  const double v = std::sqrt(1 - e2);
  const double b = v * a;
  for (int32_t i = 0; i < count; ++i) {
    const auto [x, y, z] = in[i];
    const double p = std::sqrt(x * x + y * y);
    if (p < 1e-9) {  // on the axis
      out[i] = {0, z < 0 ? -kHalfPi : kHalfPi, std::fabs(z) - b};
      continue;
    }
    const double r = std::sqrt(p * p + z * z);
    // beta is the auxiliary latitude; only its sine and cosine are needed, so no angle is formed.
    const double tan_beta = (1 + u / (r * v)) * (z * v / p);
    const double cos_beta = 1 / std::sqrt(1 + square(tan_beta));
    const double sin_beta = tan_beta * cos_beta;
    const double rise = z + u * cube(sin_beta) / v;
    const double run = p - u * cube(cos_beta);
    const double slope = std::sqrt(rise * rise + run * run);
    const double sin_lat = std::copysign(1.0, run) * rise / slope;
    const double cos_lat = std::fabs(run) / slope;
    // a^2 / N with N = a / w is a w.
    const double w = std::sqrt(1 - e2 * square(sin_lat));
    out[i] = {std::atan2(y, x), std::atan(rise / run), z * sin_lat + p * cos_lat - a * w};
  }
}
