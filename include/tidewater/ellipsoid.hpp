/**
 * @file ellipsoid.hpp
 * Ellipsoids, prime meridians and units: small values, which any number of threads may read.
 *
 * Accuracy: no figure; definitions, names and units as the registry has them (docs/accuracy.md).
 */
#ifndef TIDEWATER_ELLIPSOID_HPP
#define TIDEWATER_ELLIPSOID_HPP

#include <string>
#include <string_view>
#include <vector>

#include "tidewater/error.hpp"

namespace tidewater {

/** An ellipsoid of revolution, or a sphere.  A value: copies are independent. */
class TW_SYSTEMS_API Ellipsoid {
 public:
  /**
   * By name or registry code: "GRS 1980", "GRS80", "clarke 1866", "EPSG:7019".
   * @throws Error if there is none of that name
   */
  explicit Ellipsoid(std::string_view name);
  /**
   * By its figures.
   * @param a                   semi-major axis, metres, above zero
   * @param inverse_flattening  1/f, above 1; 0 for a sphere
   * @throws Error for figures that make no ellipsoid
   */
  Ellipsoid(double a, double inverse_flattening);

  const std::string& name() const { return name_; } /**< empty if made from figures */
  int code() const { return code_; }                /**< registry code, 0 without one */
  double a() const { return a_; }                   /**< semi-major axis, metres */
  double b() const;                                 /**< semi-minor axis, metres */
  double inverse_flattening() const { return inverse_flattening_; } /**< 0 for a sphere */
  /** f = (a - b) / a; 0 for a sphere. */
  double flattening() const { return inverse_flattening_ == 0 ? 0 : 1 / inverse_flattening_; }
  double eccentricity() const; /**< first eccentricity */

  /** The names of the registry's ellipsoids. */
  static std::vector<std::string> names();

 private:
  std::string name_;
  int code_ = 0;
  double a_, inverse_flattening_;
};

/** A prime meridian. */
class TW_SYSTEMS_API PrimeMeridian {
 public:
  /**
   * By name or registry code: "Paris", "EPSG:8903".
   * @throws Error if there is none of that name
   */
  explicit PrimeMeridian(std::string_view name);
  /** @param degrees  longitude from Greenwich, east positive */
  explicit PrimeMeridian(double degrees) : longitude_(degrees) {}

  const std::string& name() const { return name_; } /**< empty if made from degrees */
  int code() const { return code_; }                /**< registry code, 0 without one */
  double longitude() const { return longitude_; }   /**< degrees east of Greenwich */

 private:
  std::string name_;
  int code_ = 0;
  double longitude_;
};

/** A unit of length or of angle. */
class TW_SYSTEMS_API Unit {
 public:
  /** What it measures. */
  enum class Kind { length, angle, scale };
  /**
   * By name or registry code: "metre", "US survey foot", "us-ft", "degree", "grad", "EPSG:9003".
   * @throws Error if there is none of that name
   */
  explicit Unit(std::string_view name);

  const std::string& name() const { return name_; } /**< the registry's name */
  int code() const { return code_; }                /**< registry code, 0 without one */
  Kind kind() const { return kind_; }               /**< what it measures */
  double factor() const { return factor_; }         /**< metres or radians in one unit */

 private:
  std::string name_;
  int code_ = 0;
  Kind kind_ = Kind::length;
  double factor_ = 1;
};

}  // namespace tidewater

#endif
