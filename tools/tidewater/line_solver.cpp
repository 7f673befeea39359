#include "line_solver.hpp"

#include <cmath>
#include <limits>

#include "tidewater/foundation.h"
#include "tidewater/lines.h"

namespace tidewater::command {

namespace {

constexpr double kPi = 3.141592653589793;
// Beyond these the library's lines count as at a pole, and as along a meridian.
constexpr double kPoleLat = kPi / 2 - 1e-14;
constexpr double kMeridional = 1e-14;

// A rhumb line whose latitude changes by less, in radians, is taken along the parallel midway: the
// difference of isometric latitudes has then lost too many digits to be multiplied by the tangent
// of the azimuth.  At this bound either way is good to a millimetre in 10 000 km.
constexpr double kNearlyParallel = 1e-6;

// A solved line must lead back to its end this closely, in metres.
constexpr double kMisclosure = 1;

// Beyond it a distance has no more meaning, and the library's direct problem, which walks from
// vertex to vertex, takes long or does not end.
constexpr double kMostTurns = 100;

bool at_pole(double lat) { return std::fabs(lat) > kPoleLat; }

double wrap_lon(double lon) { return std::fabs(lon) > kPi ? std::remainder(lon, 2 * kPi) : lon; }

// Into 0 to 2 pi, with what is a rounding below a whole turn as 0.
double wrap_azimuth(double azimuth) {
  double turned = std::fmod(azimuth, 2 * kPi);
  if (turned < 0) turned += 2 * kPi;
  return 2 * kPi - turned < 1e-12 ? 0 : turned;
}

// The azimuth at a pole of longitude lon along the meridian of another longitude.
double azimuth_at_pole(const CoordinateTriple& pole, double meridian) {
  return pole.y > 0 ? kPi + pole.x - meridian : meridian - pole.x;
}

}  // namespace

LineSolver::LineSolver(const Ellipsoid& ellipsoid, bool rhumb)
    : a_(ellipsoid.a), e_(ellipsoid.e()), f_(ellipsoid.f), rhumb_(rhumb), quarter_(arc(kPi / 2)) {}

double LineSolver::arc(double lat) const {
  double metres = 0;
  TWstatus status = TW_SUCCESS;
  TWmerid_dist_f(a_, e_, lat, &metres, &status);
  return metres;
}

double LineSolver::parallel_radius(double lat) const {
  double radius = 0;
  TWstatus status = TW_SUCCESS;
  TWRparal(a_, e_, lat, &radius, &status);
  return radius;
}

Refusal LineSolver::inverse(SolvedLine& line) const {
  const double short_way = std::remainder(line.end.x - line.start.x, 2 * kPi);
  if (rhumb_) {
    if (at_pole(line.start.y) || at_pole(line.end.y)) {
      return {TW_BAD_LATITUDE, "a rhumb line does not end at a pole"};
    }
    line.end.x = line.start.x + short_way;
    solve_rhumb(line);
  } else {
    // The equator is no shortest line between points that are nearly opposite on it.
    const bool on_equator = std::fmax(std::fabs(line.start.y), std::fabs(line.end.y)) < 1e-6;
    const bool opposite = line.start.y == -line.end.y && kPi - std::fabs(short_way) < kMeridional;
    if (on_equator && !opposite && std::fabs(short_way) > kPi * (1 - f_)) {
      return {TW_NOT_CONVERGED, "no solution found: the points are nearly antipodal"};
    }
    line.end.x = line.start.x + short_way;
    solve_geodesic(line);
  }
  line.end.x = wrap_lon(line.end.x);
  line.azimuth = wrap_azimuth(line.azimuth);
  line.back_azimuth = wrap_azimuth(line.back_azimuth);

  CoordinateTriple wanted = {line.end.x, line.end.y, 0};
  CoordinateTriple reached = along(line.start, line.azimuth, line.distance).end;
  reached.z = 0;
  TWstatus status = TW_SUCCESS;
  TWllh_to_xyz(a_, e_, 1, &wanted, &wanted, &status);
  TWllh_to_xyz(a_, e_, 1, &reached, &reached, &status);
  const double misclosure =
      std::hypot(wanted.x - reached.x, wanted.y - reached.y, wanted.z - reached.z);
  if (!(misclosure <= kMisclosure)) {
    return {TW_NOT_CONVERGED, "no solution found, as for nearly antipodal points"};
  }
  return {};
}

void LineSolver::solve_geodesic(SolvedLine& line) const {
  // The library knows no azimuths at a pole but 0 and pi.  The line is the meridian of the end that
  // is none, and the azimuth at the pole follows from the longitudes.
  CoordinateTriple start = line.start;
  CoordinateTriple end = line.end;
  const bool start_at_pole = at_pole(start.y);
  const bool end_at_pole = at_pole(end.y);
  if (start_at_pole) {
    start.x = end.x;
  } else if (end_at_pole) {
    end.x = start.x;
  }
  TWstatus status = TW_SUCCESS;
  TWgeodesic_inv(start, end, a_, e_, &line.azimuth, &line.back_azimuth, &line.distance, &status);
  if (start_at_pole) line.azimuth = azimuth_at_pole(line.start, start.x);
  if (end_at_pole) line.back_azimuth = azimuth_at_pole(line.end, end.x);
}

void LineSolver::solve_rhumb(SolvedLine& line) const {
  if (std::fabs(line.end.y - line.start.y) < kNearlyParallel) {
    const double north = arc(line.end.y) - arc(line.start.y);
    const double east =
        parallel_radius((line.start.y + line.end.y) / 2) * (line.end.x - line.start.x);
    line.azimuth = std::atan2(east, north);
    line.back_azimuth = line.azimuth + kPi;
    line.distance = std::hypot(east, north);
    return;
  }
  TWstatus status = TW_SUCCESS;
  TWrhmbline_inv(line.start, line.end, a_, e_, &line.azimuth, &line.back_azimuth, &line.distance,
                 &status);
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
    const double north = arc(line.start.y) + std::cos(line.azimuth) * line.distance;
    // a centimetre before it the turns round the pole are no longer told apart
    if (std::fabs(north) > quarter_ - 0.01) {
      return {TW_RANGE_ERROR, "the rhumb line reaches a pole"};
    }
  }
  const Reached reached = along(line.start, line.azimuth, line.distance);
  line.end = reached.end;
  line.back_azimuth = wrap_azimuth(reached.back_azimuth);
  return {};
}

int32_t LineSolver::count(const SolvedLine& line, double spacing) const {
  int32_t points = 0;
  TWstatus status = TW_SUCCESS;
  (rhumb_ ? TWrhmbline_cnt : TWgeodesic_cnt)(1, line.start, line.end, line.distance, line.azimuth,
                                             a_, e_, spacing, &points, &status);
  if (status == TW_W_NO_POINTS) return 2;  // the ends stay
  return points == std::numeric_limits<int32_t>::max() ? 0 : points;
}

CoordinateTriple LineSolver::point(const SolvedLine& line, double distance) const {
  return along(line.start, line.azimuth, distance).end;
}

LineSolver::Reached LineSolver::along(const CoordinateTriple& start, double azimuth,
                                      double distance) const {
  Reached reached;
  if (distance == 0) {
    reached = {start, azimuth + kPi};
  } else if (rhumb_) {
    reached = along_rhumb(start, azimuth, distance);
  } else {
    reached = along_geodesic(start, azimuth, distance);
  }
  reached.end.x = wrap_lon(reached.end.x);
  return reached;
}

LineSolver::Reached LineSolver::along_geodesic(CoordinateTriple start, double azimuth,
                                               double distance) const {
  if (at_pole(start.y)) {
    // along the meridian that the azimuth picks
    const bool north_pole = start.y > 0;
    start.x += north_pole ? kPi - azimuth : azimuth;
    return along_meridian(start, !north_pole, distance);
  }
  const double turned = std::fabs(std::remainder(azimuth, 2 * kPi));
  if (turned < kMeridional || turned > kPi - kMeridional) {
    return along_meridian(start, turned < kMeridional, distance);
  }
  Reached reached;
  TWstatus status = TW_SUCCESS;
  TWgeodesic_dir(start, azimuth, distance, a_, e_, &reached.end, &reached.back_azimuth, &status);
  return reached;
}

// The library's direct problem ends at a pole.  Here the line goes on down the opposite meridian,
// and its back azimuth is that of the way it runs.
LineSolver::Reached LineSolver::along_meridian(CoordinateTriple start, bool north,
                                               double distance) const {
  double from_equator = std::remainder(arc(start.y) + (north ? distance : -distance), 4 * quarter_);
  if (std::fabs(from_equator) > quarter_) {
    from_equator = std::copysign(2 * quarter_, from_equator) - from_equator;
    start.x += kPi;
    north = !north;
  }
  TWstatus status = TW_SUCCESS;
  TWmerid_dist_i(a_, e_, from_equator, &start.y, &status);
  return {start, north ? kPi : 0};
}

LineSolver::Reached LineSolver::along_rhumb(const CoordinateTriple& start, double azimuth,
                                            double distance) const {
  Reached reached;
  TWstatus status = TW_SUCCESS;
  TWrhmbline_dir(start, azimuth, distance, a_, e_, &reached.end, &reached.back_azimuth, &status);
  // This also turns a line round that runs due west, which the library takes to the east.
  if (std::fabs(reached.end.y - start.y) < kNearlyParallel) {
    const double radius = parallel_radius((start.y + reached.end.y) / 2);
    reached.end.x = start.x + distance * std::sin(azimuth) / radius;
  }
  return reached;
}

}  // namespace tidewater::command
