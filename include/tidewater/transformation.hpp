/**
 * @file transformation.hpp
 * From one coordinate system to another.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Projected systems of the registry, 5,135, at 16 points of their areas: 144 um (27 nm);
 * - Datum operations of the registry by parameters, 3 points of their areas: 359 um (2.5 um);
 * - Geocentric coordinates, all latitudes, to 9 km up: forward 2.2 nm (1.7 nm), inverse 1.5 um
 *   (1.5 um);
 * - Datum operation, three translations (EPSG:1133), its area: forward 1.3 um (1.3 um), inverse
 *   1.9 mm (1.6 mm);
 * - Datum operation, seven parameters (EPSG:1777), its area: forward 878 nm (852 nm), inverse
 *   735 um (713 um);
 * - Datum operation, NTv2 grid (EPSG:15948), its area: forward 7.7 um (4.9 um), inverse 1.4 nm
 *   (< 1 nm);
 * - Heights by a geoid grid, EGM96, the earth: forward < 1 nm (< 1 nm), inverse < 1 nm (< 1 nm).
 */
#ifndef TIDEWATER_TRANSFORMATION_HPP
#define TIDEWATER_TRANSFORMATION_HPP

#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "tidewater/system.hpp"

namespace tidewater {

namespace detail {
class TransformationImpl;
}

/** What a transformation is asked beyond its two systems. */
struct TransformationOptions {
  /**
   * The datum step: empty lets the registry's best operation be chosen; "EPSG:1671" names one;
   * several follow each other, "EPSG:1234 EPSG:5678"; "grid:ntf_r93.gsb" a grid file of the
   * caller's, from the source's datum to the target's ("-grid:..." the other way round), its
   * longitudes from Greenwich; "geoid:egm96_15.gtx" undulations of the caller's between a compound
   * system's heights and the ellipsoid of its datum; "offset:file.gtx" offsets that are added to
   * heights of the source to give those of the target; "no shift" leaves datum and heights
   * unchanged.
   */
  std::string operation;
  /** Folders in which grids are looked for, before the usual ones. */
  std::vector<std::string> grid_folders;
  /** Coordinate epoch in decimal years, for operations that depend on time. */
  double epoch = std::numeric_limits<double>::quiet_NaN();
  /** Where the points lie; without it, where both systems are in use. */
  std::optional<Area> area;
  /** Geographic coordinates in radians instead of degrees. */
  bool radians = false;
  /** Axes in the systems' own order instead of longitude or easting first. */
  bool own_axes = false;
};

/** An operation that could serve. */
struct Candidate {
  std::string steps;   /**< as TransformationOptions::operation takes them */
  std::string name;    /**< the registry's names */
  double accuracy;     /**< metres; NaN when unknown */
  Area area;           /**< where it holds */
  std::string missing; /**< grids that were not found; empty when it can be used */
};

/**
 * The way from one coordinate system to another and back.
 *
 * Geographic coordinates are longitude, latitude in degrees and height in metres above the
 * ellipsoid; projected ones easting, northing in the system's own unit; geocentric ones X, Y, Z in
 * metres; heights of compound systems in their own unit above their vertical datum.  A system
 * without a height axis hands heights through unchanged; between heights above different surfaces
 * the registry's offsets and geoid grids are used.
 *
 * A shared handle: copies are cheap, and any number of threads may use one at once.
 */
class TW_SYSTEMS_API Transformation {
 public:
  /**
   * @throws Error where no operation between the two datums or heights is known or can be used
   * (missing grids are named), where one depends on time and no epoch is given, or where a system
   * is not understood
   */
  Transformation(const System& source, const System& target,
                 const TransformationOptions& options = {});

  /**
   * Points of the source to points of the target.
   *
   * A point that fails becomes NaN in all its axes and leaves its word; points do not
   * disturb each other.  In and out may be the same view.  Never throws.
   */
  Summary forward(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                  Run run = {}) const noexcept;
  /** The same, from single precision to single. */
  Summary forward(std::size_t count, Coordinates<const float> in, Coordinates<float> out,
                  Run run = {}) const noexcept;
  /** The same, from single precision to double. */
  Summary forward(std::size_t count, Coordinates<const float> in, Coordinates<double> out,
                  Run run = {}) const noexcept;
  /** The same, from double precision to single. */
  Summary forward(std::size_t count, Coordinates<const double> in, Coordinates<float> out,
                  Run run = {}) const noexcept;
  /** Points of the target to points of the source; otherwise as forward(). */
  Summary inverse(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                  Run run = {}) const noexcept;
  /** The same, from single precision to single. */
  Summary inverse(std::size_t count, Coordinates<const float> in, Coordinates<float> out,
                  Run run = {}) const noexcept;
  /** The same, from single precision to double. */
  Summary inverse(std::size_t count, Coordinates<const float> in, Coordinates<double> out,
                  Run run = {}) const noexcept;
  /** The same, from double precision to single. */
  Summary inverse(std::size_t count, Coordinates<const double> in, Coordinates<float> out,
                  Run run = {}) const noexcept;
  Point forward(Point point) const noexcept; /**< One point; NaN where it fails. */
  Point inverse(Point point) const noexcept; /**< One point; NaN where it fails. */

  const System& source() const; /**< the system it leads from */
  const System& target() const; /**< the system it leads to */
  /** The steps in words, a line each, with the operation taken and its accuracy. */
  std::string describe() const;
  /** Stated accuracy of the datum step in metres: 0 without one, NaN when unknown. */
  double accuracy() const;
  /** The datum step as TransformationOptions::operation takes it; empty without one. */
  std::string operation() const;
  /** Where the datum step holds. */
  Area area() const;

  /** All operations of the registry that lead from one system's datum to the other's, best first.
   */
  static std::vector<Candidate> candidates(const System& source, const System& target,
                                           const TransformationOptions& options = {});

 private:
  std::shared_ptr<const detail::TransformationImpl> impl_;
};

}  // namespace tidewater

#endif
