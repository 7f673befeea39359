// Geodesic and rhumb lines as the line command solves them: the library's problems, with the cases
// that they leave to the caller.
#pragma once

#include <cstdint>

#include "ellipsoid.hpp"
#include "tidewater/frame.h"

namespace tidewater::command {

// A solved line.  Azimuths are radians from 0 to 2 pi, the distance metres and not negative.  An
// azimuth at a pole is that of the meridian that the point's longitude names.
struct SolvedLine {
  CoordinateTriple start = {};
  CoordinateTriple end = {};
  double azimuth = 0;
  double back_azimuth = 0;  // at the end, towards the start
  double distance = 0;
};

// Why a line was not solved.
struct Refusal {
  TWstatus status = TW_SUCCESS;
  const char* reason = nullptr;

  explicit operator bool() const { return status != TW_SUCCESS; }
};

class LineSolver {
 public:
  LineSolver(const Ellipsoid& ellipsoid, bool rhumb);

  // From start and end, the short way round.  The library's inverse problem gives a false distance
  // where it finds no solution; such a line is refused with TW_NOT_CONVERGED.
  Refusal inverse(SolvedLine& line) const;

  // From start, azimuth and distance, of which a negative one goes the other way.
  Refusal direct(SolvedLine& line) const;

  // Points that a spacing needs, both ends included; 0 where they cannot be counted.
  int32_t count(const SolvedLine& line, double spacing) const;

  // The point of a line at a distance from its start.
  CoordinateTriple point(const SolvedLine& line, double distance) const;

 private:
  // End and back azimuth of the line from start.
  struct Reached {
    CoordinateTriple end = {};
    double back_azimuth = 0;
  };
  Reached along_geodesic(CoordinateTriple start, double azimuth, double distance) const;
  Reached along_short(const CoordinateTriple& start, double azimuth, double distance) const;
  Reached along_meridian(CoordinateTriple start, bool north, double distance) const;
  Reached along_rhumb(const CoordinateTriple& start, double azimuth, double distance) const;
  Reached along(const CoordinateTriple& start, double azimuth, double distance) const;

  struct Offset {
    double north = 0;
    double east = 0;
  };
  Offset offset(const SolvedLine& line, const Reached& reached) const;
  double misclosure(const SolvedLine& line) const;
  double loss_at_start(const CoordinateTriple& start, double azimuth) const;
  bool is_short(const CoordinateTriple& start, double distance) const;

  void improve(SolvedLine& line) const;
  // False, with line as it was, where the line is not short.
  bool solve_short(SolvedLine& line) const;
  void solve_geodesic(SolvedLine& line) const;
  void solve_rhumb(SolvedLine& line) const;
  double arc(double lat) const;
  double parallel_radius(double lat) const;

  double a_;
  double e_;
  double f_;
  bool rhumb_;
  double quarter_;  // meridian arc from the equator to a pole
};

}  // namespace tidewater::command
