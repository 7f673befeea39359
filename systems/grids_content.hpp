// What a grid file holds, whatever its form, and the figures between its nodes.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "tidewater/frame.h"

namespace tidewater::detail {

// A rectangle of nodes.  Angles are radians, longitudes east of Greenwich; rows run from the south,
// columns from the west.
struct Lattice {
  std::string name, parent;
  double west = 0, south = 0;
  double dx = 0, dy = 0;
  std::int64_t columns = 0, rows = 0;
  bool round = false;  // all round the Earth: the last column is the first once more
  // One value a node (undulation), two (shifts of longitude and latitude) or three (geocentric
  // translations), in the file's unit; not-a-number where there is none.
  std::vector<float> values;
  double unit = 1;  // radians or metres in one of the file's
  std::vector<std::int32_t> children;

  double width() const { return static_cast<double>(columns - 1) * dx; }
  double height() const { return static_cast<double>(rows - 1) * dy; }
};

enum class GridKind : std::uint8_t { geoid, shift, geocentric };

inline int bands_of(GridKind kind) { return static_cast<int>(kind) + 1; }

struct GridContent {
  std::string path, form, source, target;
  GridKind kind = GridKind::shift;
  bool biquadratic = false;
  std::vector<Lattice> lattices;
  std::vector<std::int32_t> roots;

  // Shift of a point, radians; false outside.  A point is found wherever its turn is.
  bool shift(double lon, double lat, double* dlon, double* dlat) const;
  // The point that the shift brings to lon, lat, by iteration; passes are told.
  TWstatus unshift(double* lon, double* lat, int* passes) const;
  // Translation of geocentric coordinates at a point, metres; false outside.
  bool translation(double lon, double lat, double (*by)[3]) const;
  // Undulation in metres, not-a-number outside.
  double undulation(double lon, double lat) const;
};

// Reads and checks a file; throws Error.
GridContent read_grid(const std::string& name, const std::vector<std::string>& folders,
                      GridKind kind);

// The GeoTIFF form of a file that is in memory; throws Error.
void read_tiff(std::span<const unsigned char> file, GridContent* content);

// One sentence about a file as an Error.
[[noreturn]] void refuse(const std::string& path, const std::string& why);

// Gives the lattice its size after its counts have been checked against each other and against the
// bytes that a file has for them.
void set_size(const std::string& path, std::int64_t columns, std::int64_t rows, int bands,
              std::int64_t most_nodes, Lattice* lattice);

}  // namespace tidewater::detail
