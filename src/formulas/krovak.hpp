// Krovak oblique conformal conic, and its modification by polynomials: IOGP Publication 373-7-2,
// Geomatics Guidance Note 7, part 2 (2022), methods 9819, 1041, 1042 and 1043.
#pragma once

#include <cmath>

#include "formulas/constants.hpp"
#include "points/portable.hpp"

namespace tidewater::detail {

// Southing and westing in metres without false origin, from the longitude east of the origin.
struct Krovak {
  double e, B, t0, n, r0, sin_axis, cos_axis, parallel;
  bool modified;

  Krovak(double a, double first_eccentricity, double lat_centre, double colatitude,
         double pseudo_parallel, double k, bool with_polynomials)
      : e(first_eccentricity),
        n(portable::sin(pseudo_parallel)),
        sin_axis(portable::sin(colatitude)),
        cos_axis(portable::cos(colatitude)),
        parallel(portable::tan(kQuarterPi + pseudo_parallel / 2)),
        modified(with_polynomials) {
    const double s = portable::sin(lat_centre);
    const double c2 = portable::cos(lat_centre) * portable::cos(lat_centre);
    const double A = a * std::sqrt(1 - e * e) / (1 - e * e * s * s);
    B = std::sqrt(1 + e * e * c2 * c2 / (1 - e * e));
    const double gamma0 = portable::asin(s / B);
    t0 = portable::tan(kQuarterPi + gamma0 / 2) *
         portable::pow((1 + e * s) / (1 - e * s), e * B / 2) /
         portable::pow(portable::tan(kQuarterPi + lat_centre / 2), B);
    r0 = k * A / portable::tan(pseudo_parallel);
  }

  struct Grid {
    double southing, westing;
  };

  // The polynomials' correction about their own origin.
  static Grid correction(Grid at) {
    const double x = at.southing - 1089000.0;
    const double y = at.westing - 654000.0;
    const double x2 = x * x;
    const double y2 = y * y;
    const double p4 = x2 * x2 + y2 * y2 - 6 * x2 * y2;
    const double q4 = 4 * x * y * (x2 - y2);
    return {kC[0] + kC[2] * x - kC[3] * y - 2 * kC[5] * x * y + kC[4] * (x2 - y2) +
                kC[6] * x * (x2 - 3 * y2) - kC[7] * y * (3 * x2 - y2) + kC[8] * q4 + kC[9] * p4,
            kC[1] + kC[2] * y + kC[3] * x + 2 * kC[4] * x * y + kC[5] * (x2 - y2) +
                kC[7] * x * (x2 - 3 * y2) + kC[6] * y * (3 * x2 - y2) - kC[9] * q4 + kC[8] * p4};
  }

  Grid forward(double lon, double lat) const {
    const double es = e * portable::sin(lat);
    const double U =
        2 * (portable::atan(t0 * portable::pow(portable::tan(lat / 2 + kQuarterPi), B) /
                            portable::pow((1 + es) / (1 - es), e * B / 2)) -
             kQuarterPi);
    const double V = -B * lon;
    const double T = portable::asin(cos_axis * portable::sin(U) +
                                    sin_axis * portable::cos(U) * portable::cos(V));
    const double D = portable::atan2(
        portable::cos(U) * portable::sin(V),
        cos_axis * portable::cos(U) * portable::cos(V) - sin_axis * portable::sin(U));
    const double theta = n * D;
    const double r = r0 * portable::pow(parallel / portable::tan(T / 2 + kQuarterPi), n);
    Grid grid{r * portable::cos(theta), r * portable::sin(theta)};
    if (modified) {
      const Grid d = correction(grid);
      grid.southing -= d.southing;
      grid.westing -= d.westing;
    }
    return grid;
  }

  struct Position {
    double lon, lat;
  };

  Position inverse(Grid grid) const {
    if (modified) {
      Grid plain = grid;
      for (int i = 0; i < 4; ++i) {
        const Grid d = correction(plain);
        plain = {grid.southing + d.southing, grid.westing + d.westing};
      }
      grid = plain;
    }
    const double r = portable::hypot(grid.southing, grid.westing);
    const double D = portable::atan2(grid.westing, grid.southing) / n;
    const double T = 2 * (portable::atan(portable::pow(r0 / r, 1 / n) * parallel) - kQuarterPi);
    const double U = portable::asin(cos_axis * portable::sin(T) -
                                    sin_axis * portable::cos(T) * portable::cos(D));
    const double V = portable::atan2(
        portable::cos(T) * portable::sin(D),
        sin_axis * portable::sin(T) + cos_axis * portable::cos(T) * portable::cos(D));
    const double u = portable::pow(portable::tan(U / 2 + kQuarterPi) / t0, 1 / B);
    double lat = U;
    for (int i = 0; i < 30; ++i) {
      const double es = e * portable::sin(lat);
      const double next =
          2 * (portable::atan(u * portable::pow((1 + es) / (1 - es), e / 2)) - kQuarterPi);
      const bool rest = std::fabs(next - lat) < 1e-16;
      lat = next;
      if (rest) break;
    }
    return {-V / B, lat};
  }

 private:
  static constexpr double kC[10] = {
      2.946529277e-02, 2.515965696e-02, 1.193845912e-07, -4.668270147e-07, 9.233980362e-12,
      1.523735715e-12, 1.696780024e-18, 4.408314235e-18, -8.331083518e-24, -3.689471323e-24};
};

}  // namespace tidewater::detail
