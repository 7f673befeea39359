// Datum operations: which there are between two systems, and the steps that carry them out.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "block.hpp"
#include "definition.hpp"
#include "registry.hpp"
#include "tidewater/transformation.hpp"

namespace tidewater::detail {

// An operation of the registry in one direction.
struct Link {
  OperationRecord operation;
  bool reversed;
};

// A way from one datum to another.
struct Way {
  std::vector<Link> links;  // none where the datum stays
  std::string name;
  double accuracy = 0;  // metres, NaN when unknown
  Area area;
  std::string missing;  // grids that were not found, or what else hinders it; empty when usable
};

// The ways between the datums of two systems, the best first; those that cannot be used stand last.
std::vector<Way> ways(const Definition& source, const Definition& target,
                      const TransformationOptions& options);

// One operation that the caller has named.
Way way_by_operation(const OperationRecord& operation, bool reversed,
                     const TransformationOptions& options);

// Is the datum the same, so that nothing has to be done?
bool same_datum(const DatumDefinition& a, const DatumDefinition& b);

// A step between longitudes from Greenwich, latitudes (radians) and heights that tells of itself,
// where no way does.
class DatumStep : public Step {
 public:
  virtual std::string describe() const = 0;
};

// The ellipsoid and the prime meridian that an operation's figures are meant for.
struct Frame {
  double a, e, meridian;  // metres, one, radians
};
Frame frame_of(const DatumDefinition& datum);

// "EPSG:1671 RGF93 to WGS 84 (1)", "inverse of ...".
std::string in_words(const Link& link);

// A parameter in radians, metres or one; 0 where the operation has none.
double value_of(const OperationRecord& operation, int code);

// Methods by parameters.
bool is_similarity_or_offset(int method);
bool depends_on_time(int method);
std::unique_ptr<const Step> similarity_or_offset(const Link& link, const Frame& source,
                                                 const Frame& target, double epoch, bool flat);

// Methods by grids of longitude and latitude shifts, or of geocentric translations.
bool is_shift_grid(int method);
bool is_geocentric_grid(int method);
// The file that serves an operation, empty where there is none in the folders.
std::string shift_grid_file(const OperationRecord& operation,
                            const std::vector<std::string>& folders);
std::unique_ptr<const Step> shift_grid_step(const Link& link, const Frame& source,
                                            const Frame& target,
                                            const std::vector<std::string>& folders, bool flat);
// A grid of the caller's, whose longitudes are from Greenwich.
std::unique_ptr<const DatumStep> shift_grid_step(const std::string& file, bool reversed,
                                                 const std::vector<std::string>& folders);

// Where a grid of the caller's is looked for: a path is taken as it is.
std::vector<std::string> folders_for(const std::string& file,
                                     const std::vector<std::string>& folders);

// Methods by grids of undulations, from heights above the ellipsoid to those above the geoid.
bool is_geoid_grid(int method);
// The file that serves an operation, empty where there is none in the folders.
std::string geoid_grid_file(const OperationRecord& operation,
                            const std::vector<std::string>& folders);
std::unique_ptr<const DatumStep> geoid_step(const Link& link,
                                            const std::vector<std::string>& folders);
// A grid of the caller's.
std::unique_ptr<const DatumStep> geoid_step(const std::string& file, bool to_geoid,
                                            const std::vector<std::string>& folders);

// A grid of offsets from one vertical datum to another; those of a file of the caller's count from
// the source.
bool is_offset_grid(int method);
std::unique_ptr<const DatumStep> offset_grid_step(const Link& link,
                                                  const std::vector<std::string>& folders);
std::unique_ptr<const DatumStep> offset_grid_step(const std::string& file,
                                                  const std::vector<std::string>& folders);

// Offsets between two vertical datums; the frame is that of the positions.
bool is_height_offset(int method);
std::unique_ptr<const DatumStep> height_offset_step(const Link& link, const Frame& frame);

// The ways by one operation from a source to a target, of which either or both are vertical systems
// and 0 stands for heights above an ellipsoid: the best first, those that cannot be used last.
std::vector<Way> height_ways(int source, int target, const Definition& own, const Area& wanted,
                             const TransformationOptions& options);
// The geographic system on whose ellipsoid the heights of a link by geoid stand.
int geographic_of(const Link& link);
// Where points of both systems lie.
Area area_of_both(const Definition& source, const Definition& target,
                  const TransformationOptions& options);

// What carries out one operation of a way that lacks nothing; null where it changes nothing. `flat`
// takes every position to lie on the ellipsoid.  Throws an Error where its grid cannot be read.
std::unique_ptr<const Step> datum_step(const Link& link, const TransformationOptions& options,
                                       bool flat);
// Position vector parameters of a definition (towgs84), from its datum to WGS 84.
std::unique_ptr<const DatumStep> towgs84_step(const DatumDefinition& datum, bool reversed,
                                              bool flat);

}  // namespace tidewater::detail
