// Geoid undulation: quadratic interpolation in a window of 22 by 22 nodes that is read from the
// grid files when a point leaves it.

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <memory>
#include <optional>

#include "datum/grid_file.hpp"
#include "datum/grid_window.hpp"
#include "formulas/interpolation.hpp"
#include "formulas/wraps.hpp"
#include "tidewater/geoid.h"

using namespace tidewater::detail;

namespace {

constexpr int kListLine = 275;
constexpr std::size_t kNameColumn = 15;
constexpr int32_t kMostGrids = 50;
constexpr int32_t kSide = 22;        // nodes of the window each way
constexpr int32_t kHalf = 11;        // nodes from a point's own to the window's last
constexpr int32_t kLower = 10;       // nodes from a point's own to the window's first
constexpr int32_t kLeastNodes = 12;  // of a grid each way: the window is placed by so many

// The window that the last load left. It belongs to the process, not to a control block.
struct {
  GeoidWindow bounds;
  float data[kSide * kSide];  // metres, south to north, west to east
  int32_t grid;
} held;

double wide(float value) { return static_cast<double>(value); }

float narrow(double value) { return static_cast<float>(value); }

// Nodes in a length, to the nearest.
std::int64_t nodes_in(double length, double spacing) { return cut(length / spacing + 0.5); }

bool read_grid(const char* directory, const char* name, GeoidGrid* grid) {
  GridHeader header;
  if (!read_header(directory, name, ".geo", &header)) return false;
  copy_text(name, grid->name);
  grid->nc = header.nc;
  grid->nr = header.nr;
  grid->xmin = header.xmin;
  grid->ymin = header.ymin;
  // The counts become doubles first: a damaged one has no predecessor among the integers.
  grid->xmax = narrow((static_cast<double>(header.nc) - 1) * wide(header.dx) + wide(header.xmin));
  grid->ymax = narrow((static_cast<double>(header.nr) - 1) * wide(header.dy) + wide(header.ymin));
  grid->dx = header.dx;
  grid->dy = header.dy;
  return true;
}

// The window gives way to every other grid, better or worse, seen from the point itself.
void give_way_to_others(const GeoidControl& control, int32_t chosen, double x, double y,
                        GeoidWindow* w, std::int64_t* ix, std::int64_t* iy) {
  const double dx = wide(w->dx);
  const double dy = wide(w->dy);
  const auto amount = [](double reach, double spacing) {
    const std::int64_t nodes = nodes_in(reach, spacing);
    return nodes > 0 ? nodes - 1 : nodes;  // the window keeps a node on the other's edge
  };
  for (int32_t g = 0; g < grids_of(control); ++g) {
    if (g == chosen) continue;
    const auto reach = reach_into(*w, control.grids[g], x, y);
    if (!reach) continue;
    const auto& [west, north, east, south] = *reach;
    give_way({amount(west, dx), amount(north, dy), amount(east, dx), amount(south, dy)}, w, ix, iy);
  }
}

void clip(float grid_min, float grid_max, double spacing, float* min, float* max, int32_t* count) {
  std::int64_t nodes = *count;
  if (*min < grid_min) {
    nodes -= nodes_in(wide(grid_min) - wide(*min), spacing);
    *min = grid_min;
  }
  if (*max > grid_max) {
    nodes -= nodes_in(wide(*max) - wide(grid_max), spacing);
    *max = grid_max;
  }
  // Fewer than none is none: a window that gave way may have left its grid.
  *count = static_cast<int32_t>(std::max<std::int64_t>(nodes, 0));
}

// Where a window's nodes stand in its file.
struct WindowPlace {
  std::int64_t column, row;  // of its first node in the grid
  std::int64_t record;       // bytes of a record
  std::int64_t offset, size;

  std::int64_t first_byte() const { return (column + 1) * 4; }  // of a record's first node
};

// Nothing for a window of no nodes, or one that reaches beyond the records.
std::optional<WindowPlace> place_in_file(const GeoidGrid& grid, const GeoidWindow& w) {
  const std::int64_t record = record_bytes(grid.nc);
  const std::int64_t column = nodes_in(wide(w.xmin) - wide(grid.xmin), wide(grid.dx));
  const std::int64_t row = nodes_in(wide(w.ymin) - wide(grid.ymin), wide(grid.dy));
  const std::int64_t first_record = row + 1;
  const std::int64_t first_float = column + 1;
  if (w.nc < 1 || w.nr < 1 || first_float < 0 || first_float + w.nc > std::int64_t{grid.nc} + 1 ||
      first_record < 0 || first_record > std::numeric_limits<std::int64_t>::max() / record - w.nr) {
    return std::nullopt;
  }
  return WindowPlace{column, row, record, first_record * record, w.nr * record};
}

void decode_nodes(const unsigned char* first, std::int64_t record, int32_t nr, int32_t nc,
                  float* data) {
  for (int32_t r = 0; r < nr; ++r) {
    for (int32_t c = 0; c < nc; ++c) {
      data[r * kSide + c] = decode_f32(first + r * record + std::ptrdiff_t{4} * c);
    }
  }
}

TWstatus read_window(std::FILE* file, const WindowPlace& place, const GeoidWindow& w, float* data) {
  if (!may_hold(file, place.offset + place.size)) return TW_GEOID_READ_ERROR;
  const std::unique_ptr<unsigned char[]> buffer = make_buffer(place.size);
  if (!buffer) return TW_NO_MEMORY;
  const auto size = static_cast<std::size_t>(place.size);
  if (!seek_to(file, place.offset) || !read_exactly(file, buffer.get(), size)) {
    return TW_GEOID_READ_ERROR;
  }
  decode_nodes(buffer.get() + place.first_byte(), place.record, w.nr, w.nc, data);
  return TW_SUCCESS;
}

// The nodes of a window where they stand in a file that is in memory.  They are brought into its
// data only when the window or the call ends: most windows serve a single point.
struct NodesInMemory {
  const unsigned char* first = nullptr;
  std::int64_t record = 0;
  int32_t nr = 0, nc = 0;

  void settle(float* data) {
    if (first) decode_nodes(first, record, nr, nc, data);
    first = nullptr;
  }
};

// Where a point stands on one axis: the first of its three nodes in the window, and its distance
// from it in spacings.
struct Stand {
  std::int64_t node;
  float t;
};

Stand stand_of(double value, std::int64_t in_grid, double grid_min, std::int64_t window_node,
               double spacing, int32_t count) {
  std::int64_t node = in_grid - window_node;
  const std::int64_t beyond = std::max<std::int64_t>(node + 3 - count, 0);
  node -= beyond;
  in_grid -= beyond;
  const float t = narrow((value - static_cast<double>(in_grid) * spacing - grid_min) / spacing);
  const bool nearer = t < 0.5F && node >= 1;
  return {node - nearer, t + static_cast<float>(nearer)};
}

// One call: its files, and where the nodes of the held window are.
class Call {
 public:
  Call() = default;
  Call(const Call&) = delete;
  Call& operator=(const Call&) = delete;
  ~Call() { nodes_.settle(held.data); }

  // Finds the grid of a point and places the window, whose nodes are then in its data, or in memory
  // where the call has the file there.
  TWstatus locate(double x, double y, const GeoidControl& control, GeoidWindow* window, float* data,
                  int32_t* grid_index);

  TWstatus undulation(double lon, double lat, const GeoidControl& control, double* undulation);

 private:
  std::optional<CallFiles<1>> files_;  // from the first load on
  NodesInMemory nodes_;
  // Column and row of the held window's first node in the grid, once they are known.
  std::int64_t column_ = 0, row_ = 0;
  bool placed_ = false;
  std::int64_t cell_x_ = 0, cell_y_ = 0;  // of the point at hand, in the grid
};

TWstatus Call::locate(double x, double y, const GeoidControl& control, GeoidWindow* window,
                      float* data, int32_t* grid_index) {
  if (!files_) files_.emplace();
  placed_ = false;
  *grid_index = 0;
  const int32_t chosen = first_grid_holding(control, x, y);
  if (chosen < 0) return TW_I_OUTSIDE_GEOID;
  const GeoidGrid& grid = control.grids[chosen];
  if (!grid_can_be(grid, kLeastNodes)) return TW_GEOID_READ_ERROR;
  const auto open = [&] {
    return files_->open(chosen, {GridPath(control.directory, grid.name, ".geo")});
  };
  const FileImage& image = files_->image(chosen, 0);
  if (!image.whole() && !open()) return TW_GEOID_READ_ERROR;
  *grid_index = chosen;

  const double dx = wide(grid.dx);
  const double dy = wide(grid.dy);
  // The point lies beyond the first node, so that the cut is the floor.
  cell_x_ = cut((x - wide(grid.xmin)) / dx);
  cell_y_ = cut((y - wide(grid.ymin)) / dy);
  std::int64_t ix = cell_x_;
  std::int64_t iy = cell_y_;
  // Without branches: which points lie near an edge cannot be foreseen.
  const auto held_inside = [](std::int64_t node, int32_t nodes) {
    const std::int64_t last = std::int64_t{nodes} - kHalf - 1;
    return node > last ? last : std::max<std::int64_t>(node, kLower);
  };
  ix = held_inside(ix, grid.nc);
  iy = held_inside(iy, grid.nr);
  GeoidWindow& w = *window;
  w.nc = kSide;
  w.nr = kSide;
  w.dx = grid.dx;
  w.dy = grid.dy;
  w.xmin = narrow(wide(grid.xmin) + static_cast<double>(ix - kLower) * dx);
  w.ymin = narrow(wide(grid.ymin) + static_cast<double>(iy - kLower) * dy);
  w.xmax = narrow(wide(w.xmin) + (kSide - 1) * dx);
  w.ymax = narrow(wide(w.ymin) + (kSide - 1) * dy);
  give_way_to_others(control, chosen, x, y, &w, &ix, &iy);
  clip(grid.xmin, grid.xmax, dx, &w.xmin, &w.xmax, &w.nc);
  clip(grid.ymin, grid.ymax, dy, &w.ymin, &w.ymax, &w.nr);

  const std::optional<WindowPlace> place = place_in_file(grid, w);
  if (place) {
    column_ = place->column;
    row_ = place->row;
    placed_ = true;
    const unsigned char* const bytes = image.at(place->offset, place->size);
    // Nodes of a smaller window leave those of the one before it standing around them.
    if (w.nc < nodes_.nc || w.nr < nodes_.nr) nodes_.settle(data);
    if (bytes) {
      nodes_ = {bytes + place->first_byte(), place->record, w.nr, w.nc};
      return TW_SUCCESS;
    }
  }
  nodes_.settle(data);
  if (!place || !open()) return TW_GEOID_READ_ERROR;
  const TWstatus word = read_window(files_->file(0), *place, w, data);
  files_->count_load();
  return word;
}

TWstatus Call::undulation(double lon, double lat, const GeoidControl& control, double* undulation) {
  double x = lon * kDegreesPerRadian;
  const double y = lat * kDegreesPerRadian;
  x = add_turns_while(x, -360, [](double v) { return v > 0; });
  x = add_turns_while(x, 360, [](double v) { return v <= -360; });
  const GeoidWindow& w = held.bounds;
  // All four comparisons at once: which of them a scattered point fails cannot be foreseen.
  const auto inside = [](double value, float spacing, float min, float max) {
    // The outer cell all round is not used.
    return static_cast<int>(value - wide(spacing) > wide(min)) &
           static_cast<int>(value + wide(spacing) < wide(max));
  };
  if ((inside(x, w.dx, w.xmin, w.xmax) & inside(y, w.dy, w.ymin, w.ymax)) == 0) {
    const TWstatus word = locate(x, y, control, &held.bounds, held.data, &held.grid);
    if (word != TW_SUCCESS) return word;
  } else {
    cell_x_ = cut((x - wide(control.grids[held.grid].xmin)) / wide(w.dx));
    cell_y_ = cut((y - wide(control.grids[held.grid].ymin)) / wide(w.dy));
  }
  // By contract: bounds of the grid that has the window's index in this block, whichever it is.
  const GeoidGrid& grid = control.grids[held.grid];
  if (!placed_) {
    column_ = nodes_in(wide(w.xmin) - wide(grid.xmin), wide(w.dx));
    row_ = nodes_in(wide(w.ymin) - wide(grid.ymin), wide(w.dy));
    placed_ = true;
  }
  const Stand column = stand_of(x, cell_x_, wide(grid.xmin), column_, wide(w.dx), w.nc);
  const Stand row = stand_of(y, cell_y_, wide(grid.ymin), row_, wide(w.dy), w.nr);
  if (column.node < 0 || row.node < 0) {
    // The window gave way to other grids so far that three nodes for the point are not in it.
    return TW_GEOID_READ_ERROR;
  }
  float across[3];
  for (int k = 0; k < 3; ++k) {
    if (nodes_.first) {
      const unsigned char* const p =
          nodes_.first + (row.node + k) * nodes_.record + column.node * 4;
      across[k] = quadratic(column.t, decode_f32(p), decode_f32(p + 4), decode_f32(p + 8));
    } else {
      const float* const p = held.data + (row.node + k) * kSide + column.node;
      across[k] = quadratic(column.t, p[0], p[1], p[2]);
    }
  }
  *undulation = wide(quadratic(row.t, across[0], across[1], across[2]));
  return TW_SUCCESS;
}

// The loop of the two directions: the undulation is added with sign 1, taken off with sign -1.
void shift_heights(double sign, int32_t count, const CoordinateTriple* in,
                   const GeoidControl* control, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  Call call;
  bool outside = false;
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple point = in[i];
    double undulation = 0;
    *status = call.undulation(point.x, point.y, *control, &undulation);
    if (!TW_OK(*status)) return;
    out[i] = point;
    if (*status == TW_I_OUTSIDE_GEOID) {
      outside = true;
      *status = TW_SUCCESS;
    } else {
      out[i].z = point.z + sign * undulation;
    }
  }
  if (outside) *status = TW_I_OUTSIDE_GEOID;
}

}  // namespace

int32_t TWgeo90_c(const char* directory, GeoidControl* control, TWstatus* status) {
  *status = TW_SUCCESS;
  const FileHandle list = open_grid_list(directory);
  if (!list) {
    *status = TW_GEOID_FILE_ERROR;
    return 1;
  }
  copy_text(directory, control->directory);
  int32_t count = 0;
  char line[kListLine];
  char name[kListLine];
  while (count < kMostGrids && next_line(list.get(), line, kListLine)) {
    if (line[0] == '*' || !first_token(line, name)) continue;
    if (std::strlen(line) <= kNameColumn || !first_token(line + kNameColumn, name)) {
      *status = TW_GEOID_FILE_ERROR;
      return 1;
    }
    if (!read_grid(directory, name, &control->grids[count])) {
      *status = TW_GEOID_READ_ERROR;
      return 1;
    }
    ++count;
  }
  control->grid_count = count;
  return 1;
}

void TWgeo90_local(double x, double y, double /*unused*/, const GeoidControl* control,
                   GeoidWindow* window, float* data, int32_t* grid_index, TWstatus* status) {
  *status = Call().locate(x, y, *control, window, data, grid_index);
}

void TWget_geo90(double lon, double lat, double /*unused*/, const GeoidControl* control,
                 double* undulation, TWstatus* status) {
  *status = Call().undulation(lon, lat, *control, undulation);
}

void TWgeo90_f(int32_t count, const CoordinateTriple* in, const GeoidControl* control,
               CoordinateTriple* out, TWstatus* status) {
  shift_heights(1, count, in, control, out, status);
}

void TWgeo90_i(int32_t count, const CoordinateTriple* in, const GeoidControl* control,
               CoordinateTriple* out, TWstatus* status) {
  shift_heights(-1, count, in, control, out, status);
}
