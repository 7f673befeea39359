// Reference ellipsoids by name, or by their two figures.
#pragma once

#include <string>

namespace tidewater::command {

struct Ellipsoid {
  double a = 0;  // semi-major axis, metres
  double f = 0;  // flattening

  double e() const;  // first eccentricity
};

// A name of the list below, whatever its capitals, blanks and hyphens; or "A,RF": semi-major axis
// in metres and inverse flattening (0 for a sphere).  Throws std::invalid_argument.
Ellipsoid find_ellipsoid(const std::string& text);

// The names, for the help text.
std::string ellipsoid_names();

}  // namespace tidewater::command
