#include "geoid.hpp"

#include "grid_folder.hpp"
#include "status_name.hpp"

namespace tidewater::command {

Geoid::Geoid(const std::string& folder) : control_(std::make_unique<GeoidControl>()) {
  const std::string directory = grid_directory(folder);
  TWstatus status = TW_SUCCESS;
  TWgeo90_c(directory.c_str(), control_.get(), &status);
  require(status, directory);
}

TWstatus Geoid::from_ellipsoid(int32_t count, CoordinateTriple* points) {
  TWstatus status = TW_SUCCESS;
  TWgeo90_i(count, points, control_.get(), points, &status);
  return status;
}

TWstatus Geoid::to_ellipsoid(int32_t count, CoordinateTriple* points) {
  TWstatus status = TW_SUCCESS;
  TWgeo90_f(count, points, control_.get(), points, &status);
  return status;
}

}  // namespace tidewater::command
