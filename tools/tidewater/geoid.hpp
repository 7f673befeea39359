// Heights above the ellipsoid and above the geoid, by the grids that --geoid names.
#pragma once

#include <memory>
#include <string>

#include "tidewater/datum.h"

namespace tidewater::command {

class Geoid {
 public:
  // A folder with area.par and its grids.  Throws std::runtime_error when they cannot be used.
  explicit Geoid(const std::string& folder);

  // Both change heights in place, like the library's array calls.
  TWstatus from_ellipsoid(int32_t count, CoordinateTriple* points);
  TWstatus to_ellipsoid(int32_t count, CoordinateTriple* points);

 private:
  std::unique_ptr<GeoidControl> control_;
};

}  // namespace tidewater::command
