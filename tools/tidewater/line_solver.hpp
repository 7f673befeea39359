// Geodesic and rhumb lines as the line command solves them: in radians, with its own refusals.
#pragma once

#include <cstdint>

#include "ellipsoid.hpp"
#include "tidewater/frame.h"
#include "tidewater/lines.hpp"

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
  // Throws tidewater::Error for an ellipsoid whose lines are not served.
  LineSolver(const Ellipsoid& ellipsoid, bool rhumb);

  // From start and end, the short way round.
  Refusal inverse(SolvedLine& line) const;

  // From start, azimuth and distance, of which a negative one goes the other way.
  Refusal direct(SolvedLine& line) const;

  // Points that a spacing needs, both ends included; 0 where they cannot be counted.
  int32_t count(const SolvedLine& line, double spacing) const;

  // The point of a line at a distance from its start.
  CoordinateTriple point(const SolvedLine& line, double distance) const;

 private:
  LineEnd reached(const CoordinateTriple& start, double azimuth, double distance) const;

  Geodesic geodesic_;
  Rhumb rhumb_line_;
  bool rhumb_;
  double quarter_;  // meridian arc from the equator to a pole
};

}  // namespace tidewater::command
