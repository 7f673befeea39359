// Runs of evenly spaced points along a geodesic or a rhumb line.

#include <cmath>
#include <cstdint>
#include <limits>

#include "tidewater/geodesic.h"
#include "tidewater/rhumb.h"

namespace {

using Inverse = decltype(&TWgeodesic_inv);
using Direct = decltype(&TWgeodesic_dir);

// Whole numbers beyond 32 bits are held at the bounds, a not-a-number gives 0.
int32_t hold_in_32_bits(double whole) {
  using Limits = std::numeric_limits<int32_t>;
  if (whole >= Limits::max()) return Limits::max();
  if (whole <= Limits::min()) return Limits::min();
  return std::isnan(whole) ? 0 : static_cast<int32_t>(whole);
}

void count_points(Inverse inverse, int16_t mode, CoordinateTriple start, CoordinateTriple end,
                  double distance, double azimuth, double a, double e, double spacing,
                  int32_t* count, TWstatus* status) {
  *status = TW_SUCCESS;
  if (mode == 0) {
    double ignored = 0;
    inverse(start, end, a, e, &azimuth, &ignored, &distance, status);
  }
  if (spacing <= distance) {
    const double q = distance / spacing;
    const double whole = std::trunc(q);
    *count = hold_in_32_bits(whole + (q - whole <= 0 ? 1 : 2));
  }
  if (spacing > distance) {
    *count = 0;
    *status = TW_W_NO_POINTS;
  }
}

void fill_points(Inverse inverse, Direct direct, int16_t mode, CoordinateTriple start,
                 CoordinateTriple end, double distance, double azimuth, double spacing, double a,
                 double e, int32_t count, CoordinateTriple* points, TWstatus* status) {
  *status = TW_SUCCESS;
  if (count < 2) {
    *status = TW_BUFFER_TOO_SMALL;
    return;
  }
  double ignored = 0;
  if (mode == 0) inverse(start, end, a, e, &azimuth, &ignored, &distance, status);
  if (spacing == 0) spacing = distance / (count - 1);
  points[0] = start;
  // Each point from the start, so that errors do not add up.
  for (int32_t i = 1; i < count; ++i) {
    direct(start, azimuth, i * spacing, a, e, &points[i], &ignored, status);
  }
  if (mode == 0) points[count - 1] = end;
}

}  // namespace

void TWgeodesic_cnt(int16_t mode, CoordinateTriple start, CoordinateTriple end, double distance,
                    double azimuth, double a, double e, double spacing, int32_t* count,
                    TWstatus* status) {
  count_points(TWgeodesic_inv, mode, start, end, distance, azimuth, a, e, spacing, count, status);
}

void TWgeodesic_buf(int16_t mode, CoordinateTriple start, CoordinateTriple end, double distance,
                    double azimuth, double spacing, double a, double e, int32_t count,
                    CoordinateTriple* points, TWstatus* status) {
  fill_points(TWgeodesic_inv, TWgeodesic_dir, mode, start, end, distance, azimuth, spacing, a, e,
              count, points, status);
}

void TWrhmbline_cnt(int16_t mode, CoordinateTriple start, CoordinateTriple end, double distance,
                    double azimuth, double a, double e, double spacing, int32_t* count,
                    TWstatus* status) {
  count_points(TWrhmbline_inv, mode, start, end, distance, azimuth, a, e, spacing, count, status);
}

void TWrhmbline_buf(int16_t mode, CoordinateTriple start, CoordinateTriple end, double distance,
                    double azimuth, double spacing, double a, double e, int32_t count,
                    CoordinateTriple* points, TWstatus* status) {
  fill_points(TWrhmbline_inv, TWrhmbline_dir, mode, start, end, distance, azimuth, spacing, a, e,
              count, points, status);
}
