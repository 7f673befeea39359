/**
 * @file magnetic_model.hpp
 * The Earth's magnetic field by the models of the store.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Magnetic field, WMM2025 at 2027.3, lat -89 to 89, to 400 km up: 5.8e-11 nT (5.0e-11 nT);
 * - Magnetic field, IGRF-14 at 2026.5, lat -89 to 89, to 400 km up: 5.5e-11 nT (5.1e-11 nT);
 * - Magnetic field, IGRF-14 at 1952.5, lat -89 to 89, to 400 km up: 6.0e-11 nT (5.3e-11 nT);
 * - Magnetic field, IGRF-13 at 2021.0, lat -89 to 89, to 400 km up: 5.5e-11 nT (5.1e-11 nT).
 */
#ifndef TIDEWATER_MAGNETIC_MODEL_HPP
#define TIDEWATER_MAGNETIC_MODEL_HPP

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "tidewater/coordinates.hpp"

namespace tidewater {

namespace detail {
class MagneticModelImpl;
}

/** The field at a point, or its change in a year. */
struct MagneticField {
  double north;       /**< component to true north, nanotesla */
  double east;        /**< component to the east, nanotesla */
  double down;        /**< component downwards, nanotesla */
  double horizontal;  /**< horizontal intensity, nanotesla */
  double total;       /**< total intensity, nanotesla */
  double declination; /**< degrees, east of true north positive */
  double inclination; /**< degrees, downwards positive */
};

/** The field at a point, and how it changes. */
struct MagneticValue {
  MagneticField field;  /**< at the model's date */
  MagneticField yearly; /**< change in a year */
};

/**
 * A spherical harmonic model of the geomagnetic field at a date.
 *
 * The published test values of WMM2025 come out to their last digit.  What a model leaves out,
 * crust and currents, is some 150 nT and half a degree of declination at a place, more near the
 * magnetic poles.
 *
 * A shared handle: copies are cheap, and any number of threads may use one at once.
 */
class TW_SYSTEMS_API MagneticModel {
 public:
  /**
   * @param name  the model's name in the store, "WMM2025" or "IGRF-13", without regard to case and
   *              hyphens; of a series, "IGRF", the generation in force; empty for the model of the
   *              newest coefficients, of several the one made for the present alone
   * @param year  decimal year
   * @throws Error if the store has no such model, or the model no field at that date
   */
  MagneticModel(std::string_view name, double year);

  const std::string& name() const; /**< its name in the store */
  double year() const;             /**< the decimal year that was asked for */
  double first_year() const;       /**< the first year for which the model is published */
  double last_year() const;        /**< the last one; the model may reach a few years further */

  /**
   * @param count  number of points
   * @param in     longitude, latitude in degrees on WGS 84, height in metres above the ellipsoid
   * @param out    count results; NaN for a point that fails
   * @param run    words and threads
   */
  Summary field(std::size_t count, Coordinates<const double> in, MagneticValue* out,
                Run run = {}) const noexcept;
  MagneticValue field(Point point) const noexcept; /**< One point; NaN where it fails. */

  /** Names of the models of the store. */
  static std::vector<std::string> models();

 private:
  std::shared_ptr<const detail::MagneticModelImpl> impl_;
};

}  // namespace tidewater

#endif
