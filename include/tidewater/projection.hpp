/**
 * @file projection.hpp
 * Map projections by method and named parameters.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - The 65 methods of projection with a formula or series of their own, the domains of their rows:
 *   forward 353 nm (117 nm), inverse 147 um (160 nm);
 * - Projected systems of the registry, 5,135, at 16 points of their areas: 144 um (27 nm).
 */
#ifndef TIDEWATER_PROJECTION_HPP
#define TIDEWATER_PROJECTION_HPP

#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "tidewater/coordinates.hpp"
#include "tidewater/ellipsoid.hpp"

namespace tidewater {

namespace detail {
class ProjectionImpl;
}

/** How a projection distorts at a point. */
struct Factors {
  double meridional;  /**< scale along the meridian, h */
  double parallel;    /**< scale along the parallel, k */
  double areal;       /**< scale of areas */
  double convergence; /**< bearing of grid north from true north, degrees, clockwise positive */
  double angular;     /**< largest angular distortion, degrees */
};

/**
 * A map projection of an ellipsoid: longitude and latitude in degrees to easting and northing in
 * metres, both counted as the method's definition says (westing and southing where it has those).
 *
 * truth() says what holds for a method, docs/accuracy.md measures each.
 *
 * A shared handle: copies are cheap, and any number of threads may use one at once.
 */
class TW_SYSTEMS_API Projection {
 public:
  /**
   * @param method      the method in the field's words or the registry's: "transverse mercator",
   *                    "lambert conformal", "Lambert Conic Conformal (2SP)", "EPSG:9802"
   * @param parameters  by the field's words ("latitude of origin"), the registry's names or the
   *                    short forms (lat0, lon0, lat1, lat2, k0, x0, y0, azimuth ...); angles in
   *                    degrees, lengths in metres.  One that is not given has its usual value.
   * @param ellipsoid   what is projected
   * @throws Error for an unknown method, a parameter that it does not take or a value that it
   * cannot serve
   */
  Projection(std::string_view method, const std::vector<std::pair<std::string, double>>& parameters,
             const Ellipsoid& ellipsoid);

  /** The method's name in the registry's words. */
  std::string method() const;
  /** Registry code of the method; below zero for a method that the registry lacks. */
  int method_code() const;
  /** The parameters by the registry's names; degrees, metres. */
  std::vector<std::pair<std::string, double>> parameters() const;
  Ellipsoid ellipsoid() const; /**< what is projected */
  /** How true the formulas are, in words: "closed formulas and series to rounding". */
  std::string truth() const;

  /**
   * Longitude, latitude in degrees to easting, northing in metres.
   *
   * A point that has no image becomes NaN and leaves its word; points do not disturb each
   * other.  Never throws.  In place is safe where in and out are the same view.
   */
  Summary forward(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                  Run run = {}) const noexcept;
  /** Easting, northing in metres to longitude, latitude in degrees; otherwise as forward(). */
  Summary inverse(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                  Run run = {}) const noexcept;
  Point forward(Point point) const noexcept; /**< One point; NaN where it fails. */
  Point inverse(Point point) const noexcept; /**< One point; NaN where it fails. */

  /**
   * Distortion at points given as longitude, latitude in degrees, by central differences of the
   * forward formula to the sixth order, which are weakest hard by the map's edges.
   * @param count  number of points
   * @param in     longitude, latitude in degrees
   * @param out    count results; NaN where a point or its neighbourhood has no image
   * @param run    words and threads
   */
  Summary factors(std::size_t count, Coordinates<const double> in, Factors* out,
                  Run run = {}) const noexcept;
  Factors factors(Point point) const noexcept; /**< One point; NaN where it fails. */

  /** The names of all methods, in the registry's words where it has them. */
  static std::vector<std::string> methods();

  /** @private */
  explicit Projection(std::shared_ptr<const detail::ProjectionImpl> impl)
      : impl_(std::move(impl)) {}

 private:
  std::shared_ptr<const detail::ProjectionImpl> impl_;
};

}  // namespace tidewater

#endif
