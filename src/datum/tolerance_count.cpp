// How many points a line needs so that its transformed image stays within a tolerance.

#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <limits>
#include <memory>

#include "foundation/new_array.hpp"
#include "tidewater/geodesic.h"
#include "tidewater/plane.h"
#include "tidewater/rhumb.h"
#include "tidewater/tolerance_count.h"

namespace {

constexpr int16_t kGeodesic = 0;
constexpr int16_t kRhumbLine = 1;

using Points = std::unique_ptr<CoordinateTriple[]>;

Points allocate(int32_t count) {
  return tidewater::detail::new_array<CoordinateTriple>(static_cast<std::uint64_t>(count));
}

class Line {
 public:
  Line(int16_t kind, CoordinateTriple start, CoordinateTriple end, double a, double e,
       TWstatus* status)
      : fill_(kind == kGeodesic ? TWgeodesic_buf : TWrhmbline_buf), start_(start), a_(a), e_(e) {
    const auto solve = kind == kGeodesic ? TWgeodesic_inv : TWrhmbline_inv;
    double ignored = 0;
    solve(start, end, a, e, &azimuth_, &ignored, &distance_, status);
  }

  // How far the image of a line of count points departs from one of about half as many.  The word
  // is the generator's, or what transform makes of it.
  double deviation(TWtransform transform, TWcontext context, int32_t count,
                   CoordinateTriple* points, CoordinateTriple* image, TWstatus* status) const {
    fill_(1, start_, start_, distance_, azimuth_, distance_ / (count - 1), a_, e_, count, points,
          status);
    transform(context, count, points, image, status);
    double result = 0;
    TWstatus ignored = TW_SUCCESS;
    TWpt_line_dist(image, count, &result, &ignored);
    return result;
  }

 private:
  decltype(&TWgeodesic_buf) fill_;
  CoordinateTriple start_;
  double a_, e_;
  double azimuth_ = 0;
  double distance_ = 0;
};

// Towards zero; what an integer cannot hold goes to the bounds, a not-a-number to the lower one.
int32_t cut_and_clamp(double t, int32_t low, int32_t high) {
  t = std::trunc(t);
  if (t > high) return high;
  return t >= low ? static_cast<int32_t>(t) : low;
}

}  // namespace

void TWtoler_to_cnt(TWtransform transform, TWcontext context, CoordinateTriple start,
                    CoordinateTriple end, double a, double e, double tolerance, int16_t line_kind,
                    int32_t* count, TWstatus* status) {
  *status = TW_SUCCESS;
  if (tolerance == 0) {
    *status = TW_BAD_TOLERANCE;
    return;
  }
  if (line_kind != kGeodesic && line_kind != kRhumbLine) {
    *status = TW_BAD_INPUT;
    return;
  }
  const Line line(line_kind, start, end, a, e, status);

  // Doubling: 3, 5, 9, 17 and so on.  Memory that is short may come back, so a failed allocation is
  // tried again, but not for ever.
  constexpr int kMostTries = 65536;
  *count = 3;
  int32_t c = 3;
  double older = 0;
  double newer = 0;
  for (;;) {
    Points points;
    Points image;
    int tries = 0;
    do {
      points = allocate(c);
      if (points) image = allocate(c);
    } while (!image && ++tries < kMostTries);
    if (!image) {
      *status = TW_NO_MEMORY;
      return;
    }
    const double deviation =
        line.deviation(transform, context, c, points.get(), image.get(), status);
    older = newer;
    newer = deviation;
    // Three points never end the phase; a not-a-number does.
    if (!(deviation > tolerance) && c != 3) break;
    if (c > std::numeric_limits<int32_t>::max() / 2) {
      *status = TW_NO_MEMORY;
      return;
    }
    c = 2 * c - 1;
  }
  if (*status != TW_SUCCESS) return;
  if (older <= tolerance && newer <= tolerance) {
    *count = (3 + 2) / 2;
    return;
  }

  // Secant search between the last two counts.
  constexpr int kMostPasses = 100;
  int32_t c0 = (c + 1) / 2;
  int32_t c1 = c;
  const int32_t low = c0;
  const int32_t high = c1;
  int passes = 0;
  const Points points = allocate(high);
  const Points image = allocate(high);
  if (!points || !image) {
    *status = TW_NO_MEMORY;
  } else {
    while (passes < kMostPasses) {
      ++passes;
      int32_t t = cut_and_clamp(c1 - (newer - tolerance) * (c1 - c0) / (newer - older), low, high);
      if (t == c1) t += high == c1 ? -1 : 1;
      c0 = c1;
      c1 = t;
      *count = t;
      older = newer;
      newer = line.deviation(transform, context, t, points.get(), image.get(), status);
      // The end is where neighbouring counts lie on opposite sides of the tolerance.
      if (std::abs(c1 - c0) <= 1 && !(newer >= tolerance && older >= tolerance) &&
          (newer > tolerance || older > tolerance)) {
        break;
      }
    }
  }
  // By contract: the number of passes alone decides, also when the last one found the end.
  *count = passes >= kMostPasses ? high / 2 : ((c0 > c1 ? c0 : c1) + 2) / 2;
}
