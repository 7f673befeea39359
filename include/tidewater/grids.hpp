/**
 * @file grids.hpp
 * Grids of datum shifts and of geoid undulations as objects.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Datum operation, NTv2 grid (EPSG:15948), its area: forward 7.7 um (4.9 um), inverse 1.4 nm
 *   (< 1 nm);
 * - Heights by a geoid grid, EGM96, the earth: forward < 1 nm (< 1 nm), inverse < 1 nm (< 1 nm).
 */
#ifndef TIDEWATER_GRIDS_HPP
#define TIDEWATER_GRIDS_HPP

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "tidewater/coordinates.hpp"

namespace tidewater {

namespace detail {
struct GridContent;
}

/** Where the nodes of a grid lie, degrees; west may be beyond -180, east beyond 180. */
struct GridBounds {
  double west;  /**< westernmost nodes */
  double south; /**< southernmost nodes */
  double east;  /**< easternmost nodes */
  double north; /**< northernmost nodes */
};

/**
 * A grid of datum shifts: longitude and latitude from one datum to another, bilinear between nodes.
 *
 * Three forms are read, told by content and extension:
 * - NTv2 (.gsb, little-endian; Junkins and Farley 1995), with its tree of sub-grids, of which the
 *   deepest that holds a point serves it.  Longitudes of either sign, east of Greenwich as right as
 *   west of it.
 * - NADCON (.las and .los, named by either or without extension).
 * - GeoTIFF with bands described as latitude_offset and longitude_offset, in arc-seconds, degrees
 *   or radians, one image a sub-grid; the form in which PROJ's grids are handed out.
 *
 * A file is checked once and read into memory; what happens to it afterwards does not matter.  A
 * shared handle: any number of grids may be open, copies are cheap, and any number of threads may
 * use one at once.
 */
class TW_SYSTEMS_API ShiftGrid {
 public:
  /**
   * @param name     file name; one with a folder in it, or any name where no folders are given, is
   *                 taken as it is
   * @param folders  where the name is looked for, in this order
   * @throws Error if there is no such file, or it is short, damaged or of another kind
   */
  explicit ShiftGrid(const std::string& name, const std::vector<std::string>& folders = {});

  /**
   * From the grid's source datum to its target datum.
   * @param count   number of points
   * @param in      longitude, latitude in degrees, of any turn; height
   * @param out     shifted longitude and latitude, not wrapped; height copied; may be in
   * @param status  a word for each point, or null: #TW_SUCCESS, or #TW_I_OUTSIDE_CNT outside the
   *                grid and next to nodes without data, where x, y and z become NaN
   */
  Summary forward(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                  TWstatus* status = nullptr) const noexcept;
  /**
   * The way back, by iteration until a step is within 1e-12 radians, at most 20 passes.
   * @param count   number of points
   * @param in      longitude, latitude in degrees; height
   * @param out     as forward()
   * @param status  as forward(); #TW_NOT_CONVERGED where the passes ran out
   * @param passes  how many each point took, or null
   */
  Summary inverse(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                  TWstatus* status = nullptr, int* passes = nullptr) const noexcept;
  Point forward(Point point) const noexcept; /**< One point; NaN where it fails. */
  Point inverse(Point point) const noexcept; /**< One point; NaN where it fails. */

  const std::string& path() const;        /**< the file, as it was found */
  const std::string& source() const;      /**< name of the source datum in the file; may be empty */
  const std::string& target() const;      /**< name of the target datum in the file; may be empty */
  std::vector<GridBounds> bounds() const; /**< of the grids that have no parent */
  std::string describe() const;           /**< "NTv2 grid of 2 sub-grids, NAD27 to NAD83" */

  /** For the steps of a transformation. */
  const detail::GridContent& content() const { return *content_; }

 private:
  std::shared_ptr<const detail::GridContent> content_;
};

/**
 * A grid of geoid undulations N: height above the ellipsoid less height above the geoid, metres.
 *
 * Three forms are read: .gtx (big-endian), .geo (the form of .las files), and GeoTIFF with a band
 * described as geoid_undulation, or with one band only, in metres.  A grid all round the Earth has
 * no seam.
 *
 * Otherwise as ShiftGrid.  geoid.h has a C structure of the same name outside the namespace.
 */
class TW_SYSTEMS_API GeoidGrid {
 public:
  /** How undulations are found between nodes. */
  enum class Interpolation {
    bilinear,   /**< on the four nodes around a point */
    biquadratic /**< of the second order both ways, on the three nearest nodes each way */
  };

  /**
   * @param name           file name; one with a folder in it, or any name where no folders are
   *                       given, is taken as it is
   * @param folders        where the name is looked for, in this order
   * @param interpolation  between nodes
   * @throws Error if there is no such file, or it is short, damaged or of another kind
   */
  explicit GeoidGrid(const std::string& name, const std::vector<std::string>& folders = {},
                     Interpolation interpolation = Interpolation::bilinear);

  /** N at a point in degrees; NaN outside the grid and next to nodes without data. */
  double undulation(double longitude, double latitude) const noexcept;

  /**
   * Height above the geoid to height above the ellipsoid: N is added.
   * @param count   number of points
   * @param in      longitude, latitude in degrees, of any turn; height in metres
   * @param out     longitude and latitude copied, height shifted; may be in
   * @param status  a word for each point, or null: #TW_SUCCESS, or #TW_I_OUTSIDE_GEOID where there
   *                is no N and x, y and z become NaN
   */
  Summary forward(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                  TWstatus* status = nullptr) const noexcept;
  /** Height above the ellipsoid to height above the geoid: N is taken off. */
  Summary inverse(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                  TWstatus* status = nullptr) const noexcept;

  const std::string& path() const;        /**< the file, as it was found */
  std::vector<GridBounds> bounds() const; /**< of the grids that have no parent */
  std::string describe() const;           /**< "GTX grid of 721 rows and 1440 columns" */

  /** For the steps of a transformation. */
  const detail::GridContent& content() const { return *content_; }

 private:
  std::shared_ptr<const detail::GridContent> content_;
};

}  // namespace tidewater

#endif
