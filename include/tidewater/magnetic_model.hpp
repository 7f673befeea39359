/**
 * @file magnetic_model.hpp
 * The Earth's magnetic field by the models of the store.
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

/** The field at a point: nanotesla and degrees, with the yearly change of each. */
struct MagneticField {
  double north, east, down;        /**< components, nanotesla */
  double horizontal, total;        /**< intensities, nanotesla */
  double declination, inclination; /**< degrees; declination east positive, inclination downwards */
};

/**
 * A spherical harmonic model of the geomagnetic field.
 *
 * A shared handle: copies are cheap, and any number of threads may use one at once.
 */
class TW_SYSTEMS_API MagneticModel {
 public:
  /**
   * @param name  the model's name in the store, "WMM2020", or "igrf"
   * @throws Error if there is none of that name
   */
  explicit MagneticModel(std::string_view name);

  std::string name() const;
  double first_year() const; /**< first decimal year that the model covers */
  double last_year() const;  /**< last one */

  /**
   * @param in    longitude, latitude in degrees of WGS 84, height in metres above the ellipsoid
   * @param year  decimal year; outside the model every point fails
   * @param out   count results
   */
  Summary field(std::size_t count, Coordinates<const double> in, double year, MagneticField* out,
                Run run = {}) const noexcept;
  MagneticField field(Point point, double year) const noexcept;

  /** Names of the models of the store. */
  static std::vector<std::string> models();

 private:
  std::shared_ptr<const detail::MagneticModelImpl> impl_;
};

}  // namespace tidewater

#endif
