// Hotine's oblique Mercator on the ellipsoid by way of the aposphere: M. Hotine, The orthomorphic
// projection of the spheroid, Empire Survey Review 8-9 (1946-47); IOGP Publication 373-7-2, methods
// 9812 and 9815.  The constants are arranged so that nothing is lost for a line that runs due east,
// or for a centre in the south.
#pragma once

#include <cmath>

#include "formulas/isometric_latitude.hpp"
#include "points/portable.hpp"

namespace tidewater::detail {

// Longitudes from the centre; u along the line, v across it, both in units of a.
struct ObliqueMercator {
  double e, A, B, log_h, crossing, centre_u, sin_gamma, cos_gamma;
  ConformalInverse latitudes;

  // The azimuth of the line at the centre.
  ObliqueMercator(double first_eccentricity, double lat, double azimuth)
      : e(first_eccentricity), latitudes(first_eccentricity) {
    const double e2 = e * e;
    const double s = portable::sin(lat);
    const double c2 = portable::cos(lat) * portable::cos(lat);
    const double w = std::sqrt(1 - e2 * s * s);
    const double slope = std::sqrt(1 - e2);
    B = std::sqrt(1 + e2 * c2 * c2 / (1 - e2));
    A = B * slope / (w * w);
    // D = B slope / (cos(lat) w), of which the square less one is G squared.
    const double G = portable::tan(lat) * slope / w;
    const double D = std::sqrt(1 + G * G);
    // ln(G + D) - B psi(lat)
    log_h = portable::asinh(G) - B * isometric_latitude(e, sincos(lat));
    const double sin_azimuth = portable::sin(azimuth);
    // A right angle's cosine is zero.
    const double cos_azimuth =
        std::fabs(std::fabs(sin_azimuth) - 1) < 1e-16 ? 0.0 : portable::cos(azimuth);
    sin_gamma = sin_azimuth / D;
    cos_gamma = std::sqrt(G * G + cos_azimuth * cos_azimuth) / D;
    // The line crosses the equator of the aposphere west of the centre by this.
    crossing = -portable::atan2(G * sin_gamma, cos_azimuth) / B;
    centre_u = A / B * portable::atan2(G, cos_azimuth);
  }

  // False on the line's own poles, where v has no bound.
  bool forward(double lon, double lat, double* u, double* v) const {
    const double angle = B * (lon - crossing);
    const double y = B * isometric_latitude(e, sincos(lat)) + log_h;
    const double S = portable::sinh(y);
    const double V = portable::sin(angle);
    const double U = (S * sin_gamma - V * cos_gamma) / portable::cosh(y);
    *u = A / B * portable::atan2(S * cos_gamma + V * sin_gamma, portable::cos(angle));
    *v = -A / B * portable::atanh(U);
    return std::fabs(U) < 1 - 1e-14;
  }

  void inverse(double u, double v, double* lon, double* lat) const {
    const double S = portable::sinh(-B / A * v);
    const double along = B / A * u;
    const double V = portable::sin(along);
    const double C = portable::cos(along);
    const double across = S * cos_gamma - V * sin_gamma;
    *lon = crossing - portable::atan2(across, C) / B;
    // artanh(up / cosh) is arsinh(up / out), which loses nothing next to a pole.
    const double up = V * cos_gamma + S * sin_gamma;
    const double out = portable::hypot(across, C);
    *lat = out == 0 ? std::copysign(kHalfPi, up)
                    : latitudes.of_isometric((portable::asinh(up / out) - log_h) / B);
  }
};

}  // namespace tidewater::detail
