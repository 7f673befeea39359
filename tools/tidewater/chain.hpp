// The steps of a conversion, from what a line says to what is written.
#pragma once

#include <array>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

#include "datum_shift.hpp"
#include "position_line.hpp"
#include "tidewater/grids.hpp"
#include "tidewater/transformation.hpp"

namespace tidewater::command {

struct ChainRequest {
  std::string from = "wgs84";
  std::string to = "utm";
  std::string operation;                                  // as TransformationOptions has it
  std::vector<std::string> grids;                         // files, or folders with a list of them
  std::string shift;                                      // by formulas
  std::optional<Ellipsoid> from_ellipsoid, to_ellipsoid;  // for it
  bool inverse = false;                                   // grids and formulas turned round
  std::string geoid;
  bool geoid_to_ellipsoid = false;
  bool anywhere = false;  // no look at areas of use
  double epoch = std::numeric_limits<double>::quiet_NaN();
};

// Arrays of points in work.
struct Batch {
  explicit Batch(std::size_t size)
      : x(size), y(size), z(size), has_z(size), zone(size), status(size), reason(size) {}
  std::size_t count = 0;
  std::vector<double> x, y, z;
  std::vector<char> has_z;
  std::vector<int> zone;  // of a grid, on either side; negative in the south
  std::vector<TWstatus> status;
  std::vector<const char*> reason;  // null: as the status says
};

// A system of one side: one that is named, or the zones of a grid, each found from its point.
class Side {
 public:
  Side(const std::string& text, const std::string& other, const std::optional<Ellipsoid>& figure);

  Kind kind() const { return kind_; }
  const System& system() const { return *system_; }
  bool by_zones() const { return kind_ == Kind::grid; }
  // Heights belong to its coordinates.
  bool has_height() const;
  std::string name() const;
  // On the other side's datum, which no text can name.
  bool nameless_datum() const { return nameless_datum_; }
  // From geographic coordinates to the zone.
  const Transformation& zone(int number) const;

 private:
  Kind kind_ = Kind::plane;
  std::optional<System> system_;  // geographic where the points have zones or references
  bool nameless_datum_ = false;
  std::string zones_on_;  // what stands behind the zone's name
  std::optional<Ellipsoid> zones_figure_;
  struct Zones {
    std::mutex lock;
    std::array<std::optional<Transformation>, 121> known;
  };
  std::shared_ptr<Zones> zones_ = std::make_shared<Zones>();
};

class Chain {
 public:
  explicit Chain(const ChainRequest& request);

  const Side& source() const { return source_; }
  const Side& target() const { return target_; }
  // Heights are changed or belong to one of the systems.
  bool uses_heights() const;

  // Coordinates become those of the target; a point that fails has its status and reason.  May be
  // called by several threads, each with a batch of its own.
  void run(Batch& batch) const;
  std::string describe() const;

 private:
  using Stage = std::vector<TWstatus>;
  void apply(const Transformation& way, Batch& batch) const;
  void run_zones(Batch& batch, bool inverse) const;
  void run_grids(Batch& batch) const;
  void run_formulas(Batch& batch) const;
  void run_geoid(Batch& batch, const std::optional<Transformation>& to_position, double sign) const;
  void check_area(Batch& batch, const double* lon, const double* lat) const;
  void check_areas(Batch& batch, bool before) const;

  ChainRequest request_;
  Side source_, target_;
  std::optional<Transformation> whole_;          // source to target in one
  std::optional<Transformation> enter_, leave_;  // around a step of the caller's own
  std::vector<ShiftGrid> grids_;
  std::unique_ptr<DatumShift> formulas_;
  std::optional<tidewater::GeoidGrid> geoid_;
  std::vector<tidewater::GeoidGrid> more_geoids_;                    // of a folder with several
  std::optional<Transformation> source_position_, target_position_;  // to longitude and latitude
  std::vector<Area> areas_;
  bool areas_before_ = false;  // the source's coordinates are positions
};

// Why a position is refused that lies far outside.
inline constexpr const char* kFarReason =
    "far outside the area of use; --anywhere converts all the same";

// Longitude and latitude from Greenwich of a system's coordinates, without any shift of datum; none
// where they are that already.
std::optional<Transformation> to_position(const System& system);

// An ellipsoid by name or as A,RF.
Ellipsoid find_ellipsoid(const std::string& text);
// "a=6378137 rf=298.257223563"
std::string figure_text(const Ellipsoid& ellipsoid);

}  // namespace tidewater::command
