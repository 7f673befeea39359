// Colombia Urban: an azimuthal plane at the height of a town.  IOGP Publication 373-7-2, Geomatics
// Guidance Note 7, part 2, method 1052.
#pragma once

#include <cmath>

#include "formulas/constants.hpp"
#include "points/portable.hpp"

namespace tidewater::detail {

struct ColombiaUrban {
  double a, e2, lat0, h0, rho0, A, B;

  ColombiaUrban(double semi_major, double eccentricity2, double lat_origin, double height)
      : a(semi_major), e2(eccentricity2), lat0(lat_origin), h0(height) {
    rho0 = meridional(lat0);
    const double nu0 = transverse(portable::sin(lat0));
    A = 1 + h0 / nu0;
    B = portable::tan(lat0) / (2 * rho0 * nu0);
  }

  double transverse(double s) const { return a / std::sqrt(1 - e2 * s * s); }
  double meridional(double lat) const {
    const double s = portable::sin(lat);
    const double w = 1 - e2 * s * s;
    return a * (1 - e2) / (w * std::sqrt(w));
  }

  void forward(double lon, double lat, double* x, double* y) const {
    const double p = transverse(portable::sin(lat)) * portable::cos(lat) * lon;
    const double G = 1 + h0 / meridional((lat0 + lat) / 2);
    *x = A * p;
    *y = G * rho0 * ((lat - lat0) + B * p * p);
  }

  // By iteration of the forward formula; the guidance note's direct form is within 0.1 mm of it in
  // a town.
  void inverse(double x, double y, double* lon, double* lat) const {
    const double p = x / A;
    double at = lat0;
    for (int i = 0; i < 30; ++i) {
      const double G = 1 + h0 / meridional((lat0 + at) / 2);
      const double next = lat0 + y / (G * rho0) - B * p * p;
      const bool rest = std::fabs(next - at) < 1e-16;
      at = next;
      if (rest) break;
    }
    *lat = at;
    *lon = p / (transverse(portable::sin(at)) * portable::cos(at));
  }
};

}  // namespace tidewater::detail
