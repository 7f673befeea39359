/**
 * @file system.hpp
 * Coordinate systems by name, code, definition, PROJ string or WKT.
 *
 * Accuracy: no figure; definitions, names and units as the registry has them (docs/accuracy.md).
 */
#ifndef TIDEWATER_SYSTEM_HPP
#define TIDEWATER_SYSTEM_HPP

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "tidewater/ellipsoid.hpp"
#include "tidewater/projection.hpp"
#include "tidewater/system_kind.hpp"

namespace tidewater {

namespace detail {
struct Definition;
class SystemImpl;
}  // namespace detail

/** An area on the Earth in degrees; west is greater than east across the 180th meridian. */
struct Area {
  std::string name;   /**< empty when unknown */
  double west = -180; /**< western limit */
  double south = -90; /**< southern limit */
  double east = 180;  /**< eastern limit */
  double north = 90;  /**< northern limit */
};

/** What a search found. */
struct FoundSystem {
  int code;         /**< registry code */
  std::string name; /**< the registry's name */
  SystemKind kind;  /**< what its coordinates are */
};

/**
 * A coordinate system: what its coordinates are counted from, in which units and along which axes.
 *
 * Nothing is computed here; Projection and Transformation say how true their figures are.
 *
 * A shared handle: copies are cheap, and any number of threads may use one at once.
 */
class TW_SYSTEMS_API System {
 public:
  /**
   * From what users have:
   * - a registry code: "EPSG:2154", "2154"; a compound "EPSG:7405", or two codes "EPSG:2154+5720";
   * - a short name: "wgs84", "web mercator", "utm:30N", "ups:N", "spcs83:2900", "spcs27:0401",
   *   "geocentric:wgs84"; "utm:30N ED50" on another system's datum; "mgrs:31U", "mgrs:31UDQ4811"
   *   for the zone that a reference of the military grid stands in (references themselves are text:
   *   parse_mgrs() and format_mgrs() of position_text.hpp);
   * - a registry name that only one system bears: "RGF93 v1 / Lambert-93";
   * - a definition: "lambert conformal lat1=44 lat2=49 lat0=46.5 lon0=3 x0=700000 y0=6600000
   *   ellps=GRS80" (degrees and metres; ellps, datum or a and rf; pm, units, axes);
   * - a PROJ string, or WKT in any of its dialects.
   * @throws Error that names what was asked and what there is
   */
  explicit System(std::string_view text);

  /**
   * The same, where the zone of "utm", "ups" or "mgrs" (either of them) is found from a point.
   * @param text                "utm", "ups", "mgrs", or whatever the other constructor takes
   * @param longitude,latitude  degrees
   */
  System(std::string_view text, double longitude, double latitude);

  std::string name() const;       /**< the registry's, or the one it was given */
  int code() const;               /**< registry code, 0 without one */
  SystemKind kind() const;        /**< what its coordinates are */
  Ellipsoid ellipsoid() const;    /**< that of its datum */
  std::string datum() const;      /**< name of the datum */
  PrimeMeridian meridian() const; /**< from which its longitudes count */
  std::string unit() const;       /**< name of the unit of the horizontal axes */
  double unit_factor() const;     /**< metres or radians in one unit of the horizontal axes */
  /** The axes in the definition's own order: letters E N W S U, or "XYZ". */
  std::string axes() const;
  std::string method() const; /**< projection method; empty if there is none */
  /** Parameters by the registry's names; degrees, metres. */
  std::vector<std::pair<std::string, double>> parameters() const;
  Area area() const; /**< area of use */
  /** Projection of a projected system, without its unit. */
  std::optional<Projection> projection() const;

  /** As a PROJ string, as far as that can say it. */
  std::string to_proj() const;
  std::string to_wkt() const;                         /**< WKT 2 */
  std::string to_wkt(std::string_view dialect) const; /**< "wkt1", "esri" or "wkt2" */
  /** All of the above in words, a line each, and how true the projection's formulas are. */
  std::string describe() const;

  /**
   * Systems whose names have these words, without regard to case and accents.
   * @param words  separated by blanks; each must occur
   * @param limit  how many at most
   */
  static std::vector<FoundSystem> search(std::string_view words, std::size_t limit = 20);
  /** All systems of the registry, by code. */
  static std::vector<FoundSystem> all();

  /** @private */
  const detail::SystemImpl& impl() const { return *impl_; }
  /** @private */
  explicit System(std::shared_ptr<const detail::SystemImpl> impl) : impl_(std::move(impl)) {}

 private:
  std::shared_ptr<const detail::SystemImpl> impl_;
};

}  // namespace tidewater

#endif
