// Local distortion of any transformation of points, by finite differences.  Points go one by one:
// the time is the caller's transformation's, and the records of nine are not points.
// J. P. Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987), pp. 20-26,
// for the scale factors.

#include <cmath>

#include "formulas/wraps.hpp"
#include "points/portable.hpp"
#include "tidewater/ellipsoid.h"
#include "tidewater/jacobian.h"

using namespace tidewater::detail;

namespace {

// Derivatives of a point's three output elements by each of its three input elements.
constexpr int kRecord = 9;

// (to - from) / width: one row of a record.
void difference(const CoordinateTriple& from, const CoordinateTriple& to, double width,
                double* row) {
  row[0] = (to.x - from.x) / width;
  row[1] = (to.y - from.y) / width;
  row[2] = (to.z - from.z) / width;
}

// Azimuthal slope of the north-going axis.
double north_slope(const double* record) { return portable::atan2(record[4], record[3]); }

}  // namespace

void TWget_jacobian(TWtransform_ptr transform, void* context, double step0, double step1,
                    double step2, int32_t count, const CoordinateTriple* in, double* jacobians,
                    TWstatus* status) {
  *status = TW_SUCCESS;
  const double steps[3] = {step0, step1, step2};
  // A point at a time: the caller's function takes the time, and sees six points a call.
  for (int32_t i = 0; i < count; ++i, jacobians += kRecord) {
    const CoordinateTriple p = in[i];
    // minus and plus along each of the three axes
    const CoordinateTriple moved[6] = {{p.x - step0, p.y, p.z}, {p.x + step0, p.y, p.z},
                                       {p.x, p.y - step1, p.z}, {p.x, p.y + step1, p.z},
                                       {p.x, p.y, p.z - step2}, {p.x, p.y, p.z + step2}};
    CoordinateTriple image[6] = {};
    double record[kRecord];
    transform(context, 6, moved, image, status);
    if (TW_OK(*status)) {
      for (int axis = 0; axis < 3; ++axis) {
        difference(image[2 * axis], image[2 * axis + 1], 2 * steps[axis], record + 3 * axis);
      }
    } else {
      // One point at a time, so that a neighbour outside the domain costs accuracy only.
      *status = TW_SUCCESS;
      CoordinateTriple base = {};
      transform(context, 1, &p, &base, status);
      if (!TW_OK(*status)) return;
      for (int axis = 0; axis < 3; ++axis) {
        CoordinateTriple& minus = image[2 * axis];
        CoordinateTriple& plus = image[2 * axis + 1];
        double* const row = record + 3 * axis;
        TWstatus word = TW_SUCCESS;
        transform(context, 1, &moved[2 * axis], &minus, &word);
        if (TW_OK(word)) {
          transform(context, 1, &moved[2 * axis + 1], &plus, &word);
          if (TW_OK(word)) {
            difference(minus, plus, 2 * steps[axis], row);
          } else {
            difference(minus, base, steps[axis], row);
          }
        } else {
          transform(context, 1, &moved[2 * axis + 1], &plus, status);
          if (!TW_OK(*status)) return;
          difference(base, plus, steps[axis], row);
        }
      }
    }
    for (int k = 0; k < kRecord; ++k) jacobians[k] = record[k];
  }
}

void TWJ_to_scales(double a, double e, int32_t count, const CoordinateTriple* in,
                   const double* jacobians, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i, jacobians += kRecord) {
    const double lat = in[i].y;
    if (std::fabs(lat) > kHalfPi) {
      *status = TW_BAD_LATITUDE;
      out[i] = {1.0, 1.0, 1.0};
      continue;
    }
    TWstatus word = TW_SUCCESS;  // both succeed for every latitude that passes the test
    double parallel = 0;
    double meridian = 0;
    TWRparal(a, e, lat, &parallel, &word);
    TWRmerid(a, e, lat, &meridian, &word);
    const double a1 = jacobians[0] / parallel;
    const double a2 = jacobians[1] / parallel;
    const double b1 = jacobians[3] / meridian;
    const double b2 = jacobians[4] / meridian;
    out[i] = {std::sqrt(a1 * a1 + a2 * a2), std::sqrt(b1 * b1 + b2 * b2),
              std::fabs(a1 * b2 - b1 * a2)};
  }
}

void TWJ_to_slopes(int32_t count, const double* jacobians, CoordinateTriple* out,
                   TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i, jacobians += kRecord) {
    const double t2 = north_slope(jacobians);
    // By contract: element 3 and not element 1, the slope of the east-going axis.
    const double t1 = portable::atan2(jacobians[3], jacobians[0]);
    out[i] = {t1, t2, t2 - t1};
  }
}

void TWJ_to_merconv(int32_t count, const double* jacobians, double* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i, jacobians += kRecord) {
    out[i] = wrap_at_or_below_then_above(north_slope(jacobians) - kHalfPi);
  }
}
