// The registry of systems, datums and operations, as it stands in the parameter store.
#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "tidewater/error.hpp"
#include "tidewater/system_kind.hpp"

namespace tidewater::detail {

// Codes are those of the registry (EPSG); 0 stands for none.

struct Parameter {
  int code;
  double value;  // in the unit, as the registry has it
  int unit;      // 9110, sexagesimal degrees DDD.MMSSsss, is a unit without a factor
};

struct GridName {
  int parameter;
  std::string name;            // the registry's file name
  std::string proj_name;       // PROJ's name of its own form of the grid, empty where it has none
  bool proj_reversed = false;  // PROJ's form holds the shifts the other way
};

struct SystemRecord {
  int code;
  std::string name;
  SystemKind kind;
  int base;   // the geographic system of a projected one
  int datum;  // geodetic or vertical (their codes do not overlap); of a projected system that of
              // its base, of a compound one that of its horizontal part
  int conversion;  // of a projected system
  int unit;        // of the axes; of geographic 3D systems that of the angles, heights are metres
  // The axes in the registry's order: E N W S U D, and XYZ for geocentric ones.  Axes at a pole
  // have the letters of the conversion's easting and northing.
  std::string axes;
  int horizontal, vertical;  // the parts of a compound system
  int area;
};

struct DatumRecord {
  int code;
  std::string name;
  int ellipsoid, meridian;   // 0 for a vertical datum
  int area;                  // 0 where the registry has none
  double epoch;              // of the frame, decimal years; NaN for a static one
  double ensemble_accuracy;  // metres; NaN where it is no ensemble
  std::vector<int> members;  // the datums of an ensemble
};

struct EllipsoidRecord {
  int code;
  std::string name;
  double a;                   // metres
  double inverse_flattening;  // 0 for a sphere
};

struct MeridianRecord {
  int code;
  std::string name;
  double longitude;  // radians from Greenwich, east positive
};

struct UnitRecord {
  int code;
  std::string name;
  double factor;  // to metres, radians, one, seconds or rates of these; 0 for texts of sexagesimal
                  // digits
  enum class Kind { length, angle, scale, time } kind;
};

struct AreaRecord {
  int code;
  std::string name;
  double west, south, east, north;  // degrees; west > east across the 180th meridian
};

struct ConversionRecord {
  int code;
  std::string name;
  int method;
  std::vector<Parameter> parameters;
};

// A change of datum or of heights.  A parameter that the registry gives as a file is a GridName.
struct OperationRecord {
  int code;
  std::string name;
  int method;  // 0 for a concatenated operation
  int source, target;
  int interpolation;  // the system in which a grid is read, 0 where it is the source
  int area;
  double accuracy;  // metres, NaN unknown
  int replaced_by;  // a later operation between the same two systems, 0 where there is none
  std::vector<Parameter> parameters;
  std::vector<GridName> grids;
  std::vector<int> steps;  // of a concatenated operation, in order; a step may have to be inverted
};

// A system that the registry has withdrawn.
struct DeprecatedSystem {
  int code;
  std::string name;
  int replaced_by;  // 0 where nothing takes its place
};

// A system that a search has found, the best first.
struct Found {
  int code;
  std::string name;
  SystemKind kind;
};

// The constructor reads everything into memory.  After it no call reads the store, and any number
// of threads may call at once.  The reading opens a store of its own on the calling thread and
// closes it: a walk that the thread has open through the store operations ends.
class Registry {
 public:
  // The registry of the store that the environment variable TIDEWATER_STORE names, else of the one
  // beside the library; read at the first call.  Throws an Error where there is none; the next call
  // tries again.
  static const Registry& shared();

  // The registry of a store.  Throws an Error where the store cannot be read or has no registry.
  explicit Registry(const std::string& path);
  ~Registry();
  Registry(const Registry&) = delete;
  Registry& operator=(const Registry&) = delete;

  // By code; empty where the registry has none.
  std::optional<SystemRecord> system(int code) const;
  std::optional<DatumRecord> datum(int code) const;
  std::optional<EllipsoidRecord> ellipsoid(int code) const;
  std::optional<MeridianRecord> meridian(int code) const;
  std::optional<UnitRecord> unit(int code) const;
  std::optional<AreaRecord> area(int code) const;
  std::optional<ConversionRecord> conversion(int code) const;
  std::optional<OperationRecord> operation(int code) const;
  // The other records are of what the registry has not withdrawn.
  std::optional<DeprecatedSystem> deprecated(int code) const;
  // The registry's names of methods and parameters; empty where it has none.
  std::string method_name(int code) const;
  std::string parameter_name(int code) const;

  // A parameter's value in radians, metres, one, decimal years, or these per second.  Throws an
  // Error where the unit is none that numbers have.
  double base_value(const Parameter& parameter) const;

  // By name or other name, without regard to case, accents, blanks and punctuation; of several the
  // oldest entry.
  std::optional<SystemRecord> system(std::string_view name) const;
  std::optional<DatumRecord> datum(std::string_view name) const;
  std::optional<EllipsoidRecord> ellipsoid(std::string_view name) const;
  std::optional<MeridianRecord> meridian(std::string_view name) const;
  std::optional<UnitRecord> unit(std::string_view name) const;

  // All codes, ascending.
  std::vector<int> systems() const;
  std::vector<int> operations() const;
  std::vector<int> ellipsoids() const;

  // The operations between the datums of two systems, in both directions: an operation stands for
  // all systems of its datums, geographic (2D, 3D) and geocentric, and for those projected from
  // them.  A compound system stands for itself alone.  Ordered by accuracy (unknown last), then
  // code.
  std::vector<OperationRecord> operations(int source, int target) const;
  // The operations from or to the datum of a system, likewise.
  std::vector<OperationRecord> operations(int system) const;

  // Systems whose names have all the words, or a code; without regard to case and accents.  First
  // those whose name is the words, then those that have them as whole words, then as beginnings of
  // words, then anywhere; among equals projected and geographic ones with the smaller code.
  std::vector<Found> search(std::string_view words, std::size_t limit = 20) const;
  // The names of systems that are nearest to a mistyped one.
  std::vector<std::string> suggest(std::string_view name, std::size_t limit = 3) const;

 private:
  struct Tables;
  std::unique_ptr<const Tables> tables_;
};

}  // namespace tidewater::detail
