#include "tidewater/lines.hpp"

#include <cmath>
#include <string>

#include "lines_points.hpp"

namespace tidewater {

namespace detail {

namespace {

LineAnswer<double> no_line() {
  const double none = std::nan("");
  return {{none, none, none, none}, false};
}

}  // namespace

LineAnswer<double> GeodesicDirect::other(const double*) const { return no_line(); }
LineAnswer<double> GeodesicAlong::other(const double*) const { return no_line(); }
LineAnswer<double> RhumbDirect::other(const double*) const { return no_line(); }
LineAnswer<double> RhumbInverse::other(const double*) const { return no_line(); }

LineAnswer<double> GeodesicInverse::other(const double* in) const {
  if (!(on_earth(in[0], in[1]) && on_earth(in[2], in[3]))) return no_line();
  return answer(area ? lines.any_line<true>(in[1], in[0], in[3], in[2])
                     : lines.any_line<false>(in[1], in[0], in[3], in[2]),
                true);
}

}  // namespace detail

namespace {

using namespace detail;

// As wide as the processor allows; the figures are the same at every width.
template <class Kernel>
Summary over_lines(const Kernel& kernel, std::size_t count, const LineArrays& arrays) {
  Summary summary;
#if defined(TIDEWATER_ONE_WIDTH)
  summary.failed = take_lines_at<points::Level::baseline>(kernel, count, arrays);
#else
  switch (count == 1 ? points::Level::one_by_one : points::level()) {
#if defined(TIDEWATER_WIDE_LANES)
    case points::Level::avx512:
      summary.failed = take_lines_at<points::Level::avx512>(kernel, count, arrays);
      break;
    case points::Level::avx2:
      summary.failed = take_lines_at<points::Level::avx2>(kernel, count, arrays);
      break;
#endif
#if defined(TIDEWATER_BASELINE_LANES)
    case points::Level::baseline:
      summary.failed = take_lines_at<points::Level::baseline>(kernel, count, arrays);
      break;
#endif
    default:
      summary.failed = take_lines<double>(kernel, count, arrays);
  }
#endif
  if (summary.failed != 0) summary.word = TW_RANGE_ERROR;
  return summary;
}

double checked_axis(double a) {
  if (a > 0 && std::isfinite(a)) return a;
  throw Error("Lines need a semi-major axis above zero, not " + std::to_string(a) + ".");
}

double checked_flattening(double f) {
  if (std::fabs(f) <= Geodesics::kLargestFlattening) return f;
  throw Error("Lines are served on ellipsoids of flattening -0.01 to 0.01, not " +
              std::to_string(f) + ".");
}

LineArrays arrays_of(const LineStarts& starts, const LineEnds& ends) {
  return {{starts.lon, starts.lat, starts.azimuth, starts.length},
          {ends.lon, ends.lat, ends.azimuth, ends.area}};
}

LineArrays arrays_of(const LinePairs& pairs, const LineCourses& courses) {
  return {{pairs.lon1, pairs.lat1, pairs.lon2, pairs.lat2},
          {courses.length, courses.azimuth1, courses.azimuth2, courses.area}};
}

// A sum that keeps what rounding takes (two sums of T. J. Dekker, 1971).
class Sum {
 public:
  void add(double v) {
    const double sum = sum_ + v;
    const double part = sum - sum_;
    rest_ += (sum_ - (sum - part)) + (v - part);
    sum_ = sum;
  }
  double value() const { return sum_ + rest_; }

 private:
  double sum_ = 0, rest_ = 0;
};

// From the sides' lengths and the areas below them.
template <class Lines>
PolygonMeasure measured(const Lines& lines, double authalic2, std::size_t count, const double* lon,
                        const double* lat) {
  if (count == 0) return {0, 0};
  constexpr std::size_t kSides = 256;
  Sum perimeter;
  Sum area;
  Sum turn;  // of longitude: whole turns for a ring around a pole
  double lon2[kSides];
  double lat2[kSides];
  double lengths[kSides];
  double areas[kSides];
  for (std::size_t at = 0; at < count; at += kSides) {
    const std::size_t sides = count - at < kSides ? count - at : kSides;
    for (std::size_t i = 0; i < sides; ++i) {
      const std::size_t next = at + i + 1 == count ? 0 : at + i + 1;
      lon2[i] = lon[next];
      lat2[i] = lat[next];
      turn.add(lines.turn(lon[at + i], lon[next]));
    }
    lines.inverse(sides, {lon + at, lat + at, lon2, lat2}, {lengths, nullptr, nullptr, areas});
    for (std::size_t i = 0; i < sides; ++i) {
      perimeter.add(lengths[i]);
      area.add(-areas[i]);
    }
  }
  const double whole = 4 * kPi * authalic2;
  const double turns = std::nearbyint(turn.value() / 360);
  area.add(std::remainder(turns, 2) * whole / 2);
  return {perimeter.value(), std::remainder(area.value(), whole)};
}

}  // namespace

struct Geodesic::Impl {
  Geodesics lines;

  Summary inverse(std::size_t count, const LinePairs& pairs, const LineCourses& courses) const {
    return over_lines(GeodesicInverse{lines, courses.area != nullptr}, count,
                      arrays_of(pairs, courses));
  }
  static double turn(double lon1, double lon2) { return degrees_between(lon1, lon2).value; }
};

Geodesic::Geodesic(double a, double f)
    : impl_(std::make_shared<const Impl>(Impl{Geodesics(checked_axis(a), checked_flattening(f))})) {
}

Geodesic::Geodesic(const Ellipsoid& ellipsoid) : Geodesic(ellipsoid.a(), ellipsoid.flattening()) {}

double Geodesic::a() const { return impl_->lines.a; }
double Geodesic::f() const { return impl_->lines.f; }

LineEnd Geodesic::direct(double lon, double lat, double azimuth, double length) const {
  LineEnd end;
  direct(1, {&lon, &lat, &azimuth, &length}, {&end.lon, &end.lat, &end.azimuth, &end.area});
  return end;
}

LineCourse Geodesic::inverse(double lon1, double lat1, double lon2, double lat2) const {
  LineCourse course;
  inverse(1, {&lon1, &lat1, &lon2, &lat2},
          {&course.length, &course.azimuth1, &course.azimuth2, &course.area});
  return course;
}

Summary Geodesic::direct(std::size_t count, const LineStarts& starts,
                         const LineEnds& ends) const noexcept {
  return over_lines(GeodesicDirect{impl_->lines, ends.area != nullptr}, count,
                    arrays_of(starts, ends));
}

Summary Geodesic::inverse(std::size_t count, const LinePairs& pairs,
                          const LineCourses& courses) const noexcept {
  return impl_->inverse(count, pairs, courses);
}

Summary Geodesic::along(double lon, double lat, double azimuth, std::size_t count,
                        const double* lengths, const LineEnds& points) const noexcept {
  const bool good = on_earth(lon, lat) && std::fabs(azimuth) <= 1e9;
  const double none = std::nan("");
  const auto line = impl_->lines.line(sincos_degrees(good ? lat : none), sincos_degrees(azimuth));
  // From nowhere every point fails.
  const LineArrays arrays = {{lengths, nullptr, nullptr, nullptr},
                             {points.lon, points.lat, points.azimuth, points.area}};
  if (!good) {
    for (double* out : arrays.out) {
      for (std::size_t i = 0; out != nullptr && i < count; ++i) out[i] = none;
    }
    Summary summary;
    summary.failed = count;
    summary.word = TW_RANGE_ERROR;
    return summary;
  }
  return over_lines(GeodesicAlong{impl_->lines, line, lon, points.area != nullptr}, count, arrays);
}

PolygonMeasure Geodesic::polygon(std::size_t count, const double* lon, const double* lat) const {
  return measured(*impl_, impl_->lines.authalic2, count, lon, lat);
}

struct Rhumb::Impl {
  RhumbLines lines;
  double f;

  Summary inverse(std::size_t count, const LinePairs& pairs, const LineCourses& courses) const {
    return over_lines(RhumbInverse{lines}, count, arrays_of(pairs, courses));
  }
  // Half a turn is taken eastwards.
  static double turn(double lon1, double lon2) {
    const double d = degrees_between(lon1, lon2).value;
    return d == -180 ? 180 : d;
  }
};

Rhumb::Rhumb(double a, double f)
    : impl_(std::make_shared<const Impl>(
          Impl{RhumbLines(checked_axis(a), checked_flattening(f)), f})) {}

Rhumb::Rhumb(const Ellipsoid& ellipsoid) : Rhumb(ellipsoid.a(), ellipsoid.flattening()) {}

double Rhumb::a() const { return impl_->lines.a; }
double Rhumb::f() const { return impl_->f; }

LineEnd Rhumb::direct(double lon, double lat, double azimuth, double length) const {
  LineEnd end;
  direct(1, {&lon, &lat, &azimuth, &length}, {&end.lon, &end.lat, &end.azimuth, &end.area});
  return end;
}

LineCourse Rhumb::inverse(double lon1, double lat1, double lon2, double lat2) const {
  LineCourse course;
  inverse(1, {&lon1, &lat1, &lon2, &lat2},
          {&course.length, &course.azimuth1, &course.azimuth2, &course.area});
  return course;
}

Summary Rhumb::direct(std::size_t count, const LineStarts& starts,
                      const LineEnds& ends) const noexcept {
  return over_lines(RhumbDirect{impl_->lines}, count, arrays_of(starts, ends));
}

Summary Rhumb::inverse(std::size_t count, const LinePairs& pairs,
                       const LineCourses& courses) const noexcept {
  return impl_->inverse(count, pairs, courses);
}

Summary Rhumb::along(double lon, double lat, double azimuth, std::size_t count,
                     const double* lengths, const LineEnds& points) const noexcept {
  Summary summary;
  constexpr std::size_t kBlock = 256;
  double lons[kBlock];
  double lats[kBlock];
  double azimuths[kBlock];
  for (std::size_t i = 0; i < kBlock; ++i) {
    lons[i] = lon;
    lats[i] = lat;
    azimuths[i] = azimuth;
  }
  const auto from = [](double* out, std::size_t at) { return out == nullptr ? out : out + at; };
  for (std::size_t at = 0; at < count; at += kBlock) {
    const std::size_t some = count - at < kBlock ? count - at : kBlock;
    const Summary part = direct(some, {lons, lats, azimuths, lengths + at},
                                {from(points.lon, at), from(points.lat, at),
                                 from(points.azimuth, at), from(points.area, at)});
    summary.failed += part.failed;
    if (summary.word == TW_SUCCESS) summary.word = part.word;
  }
  return summary;
}

PolygonMeasure Rhumb::polygon(std::size_t count, const double* lon, const double* lat) const {
  return measured(*impl_, impl_->lines.authalic2, count, lon, lat);
}

}  // namespace tidewater
