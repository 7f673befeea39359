/**
 * @file system_kind.hpp
 * What a coordinate system's coordinates are.
 */
#ifndef TIDEWATER_SYSTEM_KIND_HPP
#define TIDEWATER_SYSTEM_KIND_HPP

namespace tidewater {

/** What a coordinate system's coordinates are. */
enum class SystemKind {
  geographic2d, /**< longitude and latitude */
  geographic3d, /**< longitude, latitude and height above the ellipsoid */
  geocentric,   /**< X, Y, Z from the Earth's centre */
  projected,    /**< easting and northing in a map's plane */
  vertical,     /**< a height or depth alone */
  compound,     /**< a horizontal system with a vertical one */
};

}  // namespace tidewater

#endif
