#include "line_solver.hpp"

#include <algorithm>
#include <cmath>
#include <limits>

namespace tidewater::command {

namespace {

constexpr double kPi = 3.141592653589793;
constexpr double kDegree = 0.017453292519943295;
// Beyond it a point counts as at a pole.
constexpr double kPoleLat = kPi / 2 - 1e-14;
// Beyond it a distance has no more meaning.
constexpr double kMostTurns = 100;
// Closer to a pole the turns of a rhumb line around it are no longer told apart.
constexpr double kRhumbEnd = 0.01;  // metres

bool at_pole(double lat) { return std::fabs(lat) > kPoleLat; }

double degrees(double angle) { return angle / kDegree; }

double latitude(const CoordinateTriple& point) { return std::clamp(degrees(point.y), -90.0, 90.0); }

// Into 0 to 2 pi, with what is a rounding below a whole turn as 0.
double wrap_azimuth(double azimuth) {
  double turned = std::fmod(azimuth, 2 * kPi);
  if (turned < 0) turned += 2 * kPi;
  return 2 * kPi - turned < 1e-12 ? 0 : turned;
}

}  // namespace

LineSolver::LineSolver(const Ellipsoid& ellipsoid, bool rhumb)
    : geodesic_(ellipsoid.a, ellipsoid.f),
      rhumb_line_(ellipsoid.a, ellipsoid.f),
      rhumb_(rhumb),
      quarter_(geodesic_.inverse(0, 0, 0, 90).length) {}

Refusal LineSolver::inverse(SolvedLine& line) const {
  if (rhumb_ && (at_pole(line.start.y) || at_pole(line.end.y))) {
    return {TW_BAD_LATITUDE, "a rhumb line does not end at a pole"};
  }
  const double lon1 = degrees(line.start.x);
  const double lon2 = degrees(line.end.x);
  const LineCourse course =
      rhumb_ ? rhumb_line_.inverse(lon1, latitude(line.start), lon2, latitude(line.end))
             : geodesic_.inverse(lon1, latitude(line.start), lon2, latitude(line.end));
  if (!std::isfinite(course.length)) return {TW_RANGE_ERROR, "the points are not on the ellipsoid"};
  line.distance = course.length;
  line.azimuth = wrap_azimuth(course.azimuth1 * kDegree);
  line.back_azimuth = wrap_azimuth(course.azimuth2 * kDegree + kPi);
  return {};
}

Refusal LineSolver::direct(SolvedLine& line) const {
  if (line.distance < 0) {
    line.distance = -line.distance;
    line.azimuth += kPi;
  }
  line.azimuth = wrap_azimuth(line.azimuth);
  if (!(line.distance <= kMostTurns * 4 * quarter_)) {
    return {TW_RANGE_ERROR, "more than a hundred times round the ellipsoid"};
  }
  if (rhumb_) {
    if (at_pole(line.start.y)) return {TW_BAD_LATITUDE, "a rhumb line does not start at a pole"};
    const double from_equator = geodesic_.inverse(0, 0, 0, latitude(line.start)).length;
    const double north =
        std::copysign(from_equator, line.start.y) + std::cos(line.azimuth) * line.distance;
    if (std::fabs(north) > quarter_ - kRhumbEnd) {
      return {TW_RANGE_ERROR, "the rhumb line reaches a pole"};
    }
  }
  const LineEnd end = reached(line.start, line.azimuth, line.distance);
  if (!std::isfinite(end.lat)) return {TW_RANGE_ERROR, "the line has no end"};
  line.end = {end.lon * kDegree, end.lat * kDegree, 0};
  line.back_azimuth = wrap_azimuth(end.azimuth * kDegree + kPi);
  return {};
}

LineEnd LineSolver::reached(const CoordinateTriple& start, double azimuth, double distance) const {
  const double lon = degrees(start.x);
  const double lat = latitude(start);
  return rhumb_ ? rhumb_line_.direct(lon, lat, degrees(azimuth), distance)
                : geodesic_.direct(lon, lat, degrees(azimuth), distance);
}

int32_t LineSolver::count(const SolvedLine& line, double spacing) const {
  const double whole = std::ceil(line.distance / spacing) + 1;
  if (!(whole < std::numeric_limits<int32_t>::max())) return 0;
  return std::max(2, static_cast<int32_t>(whole));
}

CoordinateTriple LineSolver::point(const SolvedLine& line, double distance) const {
  const LineEnd end = reached(line.start, line.azimuth, distance);
  return {end.lon * kDegree, end.lat * kDegree, 0};
}

}  // namespace tidewater::command
