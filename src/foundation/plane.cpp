// Helpers on the plane: scale and origin of a grid, chord deviation, and two interpolators.

#include <cmath>

#include "formulas/interpolation.hpp"
#include "foundation/plane_points.hpp"
#include "tidewater/plane.h"

using namespace tidewater::detail;

void TWab_to_en(double s1, double s2, double false_easting, double false_northing, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(UnitsToGrid{s1, s2, false_easting, false_northing}, count, in, out);
}

void TWen_to_ab(double s1, double s2, double false_easting, double false_northing, int32_t count,
                const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
  *status = over_points(GridToUnits{s1, s2, false_easting, false_northing}, count, in, out);
}

void TWpt_line_dist(const CoordinateTriple* points, int32_t count, double* distance,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  double most = 0;
  for (int64_t i = 0; i + 2 < count; i += 2) {
    const double ax = points[i + 2].x - points[i].x;
    const double ay = points[i + 2].y - points[i].y;
    const double bx = points[i + 1].x - points[i].x;
    const double by = points[i + 1].y - points[i].y;
    const double d2 = square(by * ax - bx * ay) / (ay * ay + ax * ax);
    if (d2 > most) most = d2;
  }
  *distance = std::sqrt(most);
}

void TWbilinear_interpolation(double p00, double p01, double p10, double p11, double fx, double fy,
                              double* result, TWstatus* status) {
  *status = TW_SUCCESS;
  *result = tidewater::detail::bilinear(p00, p01, p10, p11, fx, fy);
}

void TWqterp2(const float* t, const float* f0, const float* f1, const float* f2, float* result,
              TWstatus* status) {
  *status = TW_SUCCESS;
  *result = tidewater::detail::quadratic(*t, *f0, *f1, *f2);
}
