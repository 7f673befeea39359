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
// of the azimuth.  At this bound the loss is a centimetre in 20 000 km.
constexpr double kNearlyParallel = 1e-6;

// A shorter line is taken in the plane of its middle (Gauss's mid-latitude formulas, within 0.1
// mm): the library loses up to decimetres of a line that leaves a point nearly due east or west,
// however short it is.
constexpr double kShortLine = 1000;  // metres
constexpr double kShortSpan = 1e-3;  // radians of longitude

// A solved line that leads back to its end this closely, in metres, is left as it is; one that does
// not come as close as the second bound is refused.
constexpr double kClosed = 1e-3;
constexpr double kMisclosure = 0.1;
// Nearer to the antipode there may be several geodesics, and the one found need not be the
// shortest.
constexpr double kNearlyAntipodal = 0.02;  // radians

// Beyond it a distance has no more meaning, and the library's direct problem, which walks from
// vertex to vertex, takes long or does not end.
constexpr double kMostTurns = 100;

bool at_pole(double lat) { return std::fabs(lat) > kPoleLat; }

bool is_meridional(double azimuth) {
  const double turned = std::fabs(std::remainder(azimuth, 2 * kPi));
  return turned < kMeridional || turned > kPi - kMeridional;
}

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

  if (!rhumb_ && misclosure(line) > kClosed) improve(line);
  if (!(misclosure(line) <= kMisclosure)) {
    return {TW_NOT_CONVERGED, "no solution found, as for nearly antipodal points"};
  }
  return {};
}

// What is missing at the end of a line, in metres to the north and to the east.
LineSolver::Offset LineSolver::offset(const SolvedLine& line, const Reached& reached) const {
  return {arc(line.end.y) - arc(reached.end.y),
          parallel_radius(line.end.y) * std::remainder(line.end.x - reached.end.x, 2 * kPi)};
}

double LineSolver::misclosure(const SolvedLine& line) const {
  const Offset missing = offset(line, along(line.start, line.azimuth, line.distance));
  return std::hypot(missing.north, missing.east);
}

// The library decides on the sphere whether the vertex lies ahead of a point, and can be metres to
// kilometres off for a line that leaves one nearly due east or west.  Such a line is found by
// shooting: Newton's method on azimuth and distance of the direct problem, from the sphere's.
void LineSolver::improve(SolvedLine& line) const {
  constexpr int kPasses = 20;
  SolvedLine trial = line;
  TWstatus status = TW_SUCCESS;
  TWgeodesic_inv(line.start, line.end, a_, 0, &trial.azimuth, &trial.back_azimuth, &trial.distance,
                 &status);
  if (trial.distance > (kPi - kNearlyAntipodal) * a_) return;
  double least = misclosure(line);
  for (int pass = 0; pass < kPasses; ++pass) {
    const Reached reached = along(trial.start, trial.azimuth, trial.distance);
    const Offset missing = offset(trial, reached);
    const double size = std::hypot(missing.north, missing.east);
    if (size < least) {
      least = size;
      line = trial;
      line.azimuth = wrap_azimuth(trial.azimuth);
      line.back_azimuth = wrap_azimuth(reached.back_azimuth);
    }
    if (!(size > kClosed)) return;
    const double heading = reached.back_azimuth + kPi;
    const double ahead = missing.north * std::cos(heading) + missing.east * std::sin(heading);
    const double aside = missing.east * std::cos(heading) - missing.north * std::sin(heading);
    trial.azimuth += aside / (a_ * std::sin(trial.distance / a_));
    trial.distance = std::fabs(trial.distance + ahead);
  }
}

// Metres by which the library may misplace the far end of a line that starts near its vertex and
// near a pole.  There the arc from the vertex is known to a rounding divided by itself, and at a
// vertex at a pole's distance m (radians) the longitude only to a rounding divided by m.
double LineSolver::loss_at_start(const CoordinateTriple& start, double azimuth) const {
  constexpr double kRounding = 1.1e-16;
  if (std::fabs(std::cos(azimuth)) < 1e-15) return 0;  // the start is the vertex
  const double m = std::cos(start.y) * std::fabs(std::sin(azimuth));
  const double north = std::cos(start.y) * std::cos(azimuth);
  const double from_vertex = std::atan2(std::fabs(north), std::fabs(std::sin(start.y)));
  return a_ * std::fmin(kRounding / m, m) / std::fmax(from_vertex, 1e-8);
}

bool LineSolver::solve_short(SolvedLine& line) const {
  const double span = line.end.x - line.start.x;
  const double middle = (line.start.y + line.end.y) / 2;
  const double north = (arc(line.end.y) - arc(line.start.y)) * std::cos(span / 2);
  const double east = parallel_radius(middle) * span;
  if (std::fabs(span) > kShortSpan || std::hypot(north, east) > kShortLine) return false;
  const double azimuth = std::atan2(east, north);
  const double turn = span * std::sin(middle) / 2;  // half the meridians' convergence
  line.azimuth = azimuth - turn;
  line.back_azimuth = azimuth + turn + kPi;
  line.distance = std::hypot(north, east);
  return true;
}

void LineSolver::solve_geodesic(SolvedLine& line) const {
  if (solve_short(line)) return;
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
  if (!rhumb_ && !is_short(line.start, line.distance) && !is_meridional(line.azimuth) &&
      !at_pole(line.start.y) && loss_at_start(line.start, line.azimuth) > 1) {
    return {TW_NOT_CONVERGED, "the start is too near a pole for the line to be told"};
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
  if (is_meridional(azimuth)) return along_meridian(start, std::cos(azimuth) > 0, distance);
  if (is_short(start, distance)) return along_short(start, azimuth, distance);
  Reached reached;
  TWstatus status = TW_SUCCESS;
  TWgeodesic_dir(start, azimuth, distance, a_, e_, &reached.end, &reached.back_azimuth, &status);
  // On the sphere it looks back the short way round, also along a line longer than half a turn.
  if (e_ == 0 && std::sin(distance / a_) < 0) reached.back_azimuth += kPi;
  return reached;
}

bool LineSolver::is_short(const CoordinateTriple& start, double distance) const {
  return distance <= kShortLine && distance <= kShortSpan * parallel_radius(start.y);
}

LineSolver::Reached LineSolver::along_short(const CoordinateTriple& start, double azimuth,
                                            double distance) const {
  constexpr int kPasses = 5;  // each is a thousand times closer than the one before
  Reached reached = {start, 0};
  double turn = 0;
  for (int pass = 0; pass < kPasses; ++pass) {
    const double middle = (start.y + reached.end.y) / 2;
    const double span = distance * std::sin(azimuth + turn) / parallel_radius(middle);
    const double north = distance * std::cos(azimuth + turn) / std::cos(span / 2);
    TWstatus status = TW_SUCCESS;
    TWmerid_dist_i(a_, e_, arc(start.y) + north, &reached.end.y, &status);
    reached.end.x = start.x + span;
    turn = span * std::sin(middle) / 2;
  }
  reached.back_azimuth = azimuth + 2 * turn + kPi;
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
