// NADCON shifts: bilinear interpolation in a window of 4 by 4 nodes that is read from the grid
// files when a point leaves it.
// W. T. Dewhurst, NADCON: The Application of Minimum Curvature-Derived Surfaces in the
// Transformation of Positional Data, NOAA Technical Memorandum NOS NGS-50 (1990).

#include <algorithm>
#include <cmath>
#include <limits>
#include <memory>
#include <optional>

#include "datum/grid_file.hpp"
#include "datum/grid_window.hpp"
#include "formulas/interpolation.hpp"
#include "formulas/wraps.hpp"
#include "tidewater/nadcon.h"

using namespace tidewater::detail;

namespace {

constexpr int kListLine = 260;
constexpr int32_t kMostGrids = 50;
constexpr int32_t kSide = 4;  // nodes of the window each way

// The window that the last load left, and its tables of arc-seconds, south to north, west to east.
// It belongs to the process, not to a control block.
struct {
  NadconWindow bounds;
  double lon[kSide * kSide];
  double lat[kSide * kSide];
} held;

TWstatus read_grid(const char* directory, const char* name, NadconGrid* grid) {
  GridHeader las;
  GridHeader los;
  if (!read_header(directory, name, ".las", &las) || !read_header(directory, name, ".los", &los) ||
      las != los) {
    return TW_GRID_FILE_ERROR;
  }
  copy_text(name, grid->name);
  grid->nc = las.nc;
  grid->nr = las.nr;
  grid->xmin = static_cast<double>(las.xmin);
  grid->ymin = static_cast<double>(las.ymin);
  grid->dx = static_cast<double>(las.dx);
  grid->dy = static_cast<double>(las.dy);
  // The counts become doubles first: a damaged one has no predecessor among the integers.
  grid->xmax = (static_cast<double>(las.nc) - 1) * grid->dx + grid->xmin;
  grid->ymax = (static_cast<double>(las.nr) - 1) * grid->dy + grid->ymin;
  return TW_SUCCESS;
}

// Four values of four records each.
void decode_nodes(const unsigned char* first, std::int64_t record, double* table) {
  for (int r = 0; r < kSide; ++r) {
    for (int c = 0; c < kSide; ++c) {
      table[r * kSide + c] =
          static_cast<double>(decode_f32(first + r * record + std::ptrdiff_t{4} * c));
    }
  }
}

// Reads four whole records from record iy on and takes the four values from float ix on.
TWstatus read_tables(std::FILE* los, std::FILE* las, int32_t nc, std::int64_t ix, std::int64_t iy,
                     double* lon_table, double* lat_table) {
  const std::int64_t record = record_bytes(nc);
  const std::int64_t offset = iy * record;
  const std::int64_t end = offset + kSide * record;
  if (!may_hold(los, end) && !may_hold(las, end)) return TW_GRID_FILE_ERROR;  // both too short
  const std::unique_ptr<unsigned char[]> buffer = make_buffer(kSide * record);
  if (!buffer) return TW_NO_MEMORY;
  const auto size = static_cast<std::size_t>(kSide * record);
  if (!seek_to(los, offset) || !seek_to(las, offset)) return TW_GRID_FILE_ERROR;
  const bool lon_read = read_exactly(los, buffer.get(), size);
  if (lon_read) decode_nodes(buffer.get() + ix * 4, record, lon_table);
  const bool lat_read = read_exactly(las, buffer.get(), size);
  if (lat_read) decode_nodes(buffer.get() + ix * 4, record, lat_table);
  return lon_read && lat_read ? TW_SUCCESS : TW_GRID_FILE_ERROR;
}

// The nodes of a window where they stand in files that are in memory.  They are brought into its
// tables only when the window or the call ends: most windows serve a single point.
struct NodesInMemory {
  const unsigned char* los = nullptr;
  const unsigned char* las = nullptr;
  std::int64_t record = 0;

  void settle(double* lon_table, double* lat_table) {
    if (!los) return;
    decode_nodes(los, record, lon_table);
    decode_nodes(las, record, lat_table);
    los = nullptr;
  }
};

// False where a window gave way to a better grid so far that no cell of it serves the point.
bool has_cell(double position) { return position > -1 && position <= kSide - 1; }

// Shift in arc-seconds within a cell, from the values at its origin, a step north, a step east and
// across.
double interpolate(double p00, double p01, double p10, double p11, double fx, double fy) {
  constexpr double kMarker = 180;  // what is larger marks a node without data
  // By contract: no count of the markers; of several, the later ones enter the means.
  if (std::fabs(p00) > kMarker) p00 = (p11 + p10 + p01) / 3;
  if (std::fabs(p01) > kMarker) p01 = (p11 + p10 + p00) / 3;
  if (std::fabs(p10) > kMarker) p10 = (p11 + p01 + p00) / 3;
  if (std::fabs(p11) > kMarker) p11 = (p10 + p01 + p00) / 3;
  return bilinear(p00, p01, p10, p11, fx, fy);
}

// Finds the grid of a point and places the window, whose nodes are then in its tables, or in
// memory where the call has the files there.
TWstatus locate(double x, double y, const NadconControl& control, NadconWindow* window,
                double* lon_table, double* lat_table, CallFiles<2>* files, NodesInMemory* nodes) {
  const int32_t chosen = first_grid_holding(control, x, y);
  if (chosen < 0) return TW_I_OUTSIDE_NADCON;
  const NadconGrid& grid = control.grids[chosen];
  if (!grid_can_be(grid, kSide)) return TW_GRID_FILE_ERROR;
  const auto open = [&] {
    return files->open(chosen, {GridPath(control.directory, grid.name, ".los"),
                                GridPath(control.directory, grid.name, ".las")});
  };
  const FileImage& los = files->image(chosen, 0);
  const FileImage& las = files->image(chosen, 1);
  if (!(los.whole() && las.whole()) && !open()) return TW_GRID_FILE_ERROR;

  const double dx = grid.dx;
  const double dy = grid.dy;
  const double gx = (x - grid.xmin) / dx;
  const double gy = (y - grid.ymin) / dy;
  // The point lies beyond the first node, so that the cut is the floor.
  std::int64_t ix = cut(gx);
  std::int64_t iy = cut(gy);
  const double in_cell_x = gx - static_cast<double>(ix);
  const double in_cell_y = gy - static_cast<double>(iy);
  // Columns ix - 1 to ix + 2 and rows iy - 1 to iy + 2 stay in the grid.
  ix = ix > grid.nc - 3 ? grid.nc - 3 : std::max<std::int64_t>(ix, 1);
  iy = iy > grid.nr - 3 ? grid.nr - 3 : std::max<std::int64_t>(iy, 1);
  NadconWindow& w = *window;
  w.nc = kSide;
  w.nr = kSide;
  w.xmin = grid.xmin + static_cast<double>(ix - 1) * dx;
  w.ymin = grid.ymin + static_cast<double>(iy - 1) * dy;
  w.xmax = w.xmin + 3 * dx;
  w.ymax = w.ymin + 3 * dy;
  w.dx = dx;
  w.dy = dy;

  // The window gives way to better grids, seen from a point in its centre cell.
  const double x_ref = w.xmin + dx + in_cell_x * dx;
  const double y_ref = w.ymin + dy + in_cell_y * dy;
  for (int32_t g = 0; g < chosen; ++g) {
    const auto reach = reach_into(w, control.grids[g], x_ref, y_ref);
    if (!reach) continue;
    const auto& [west, north, east, south] = *reach;
    give_way({cut(west / dx), cut(north / dy), cut(east / dx), cut(south / dy)}, &w, &ix, &iy);
  }

  const std::int64_t record = record_bytes(grid.nc);
  // A window that gave way may have left its grid. Index 0 is the label of a record, and record 0
  // the header: they are read as they stand.
  const bool in_records = ix >= 0 && ix + kSide - 1 <= grid.nc && iy >= 0 &&
                          iy <= std::numeric_limits<std::int64_t>::max() / record - kSide;
  if (in_records) {
    const unsigned char* const los_bytes = los.at(iy * record, kSide * record);
    const unsigned char* const las_bytes = las.at(iy * record, kSide * record);
    if (los_bytes && las_bytes) {
      *nodes = {los_bytes + ix * 4, las_bytes + ix * 4, record};
      return TW_SUCCESS;
    }
  }
  nodes->settle(lon_table, lat_table);
  if (!in_records || !open()) return TW_GRID_FILE_ERROR;
  const TWstatus word =
      read_tables(files->file(0), files->file(1), grid.nc, ix, iy, lon_table, lat_table);
  files->count_load();
  return word;
}

// One array call: its files, and where the nodes of the held window are.
class Call {
 public:
  Call() = default;
  Call(const Call&) = delete;
  Call& operator=(const Call&) = delete;
  ~Call() { nodes_.settle(held.lon, held.lat); }

  void shift(int32_t count, const CoordinateTriple* in, const NadconControl& control,
             CoordinateTriple* out, TWstatus* status);

 private:
  double lon_shift(std::int64_t ix, std::int64_t iy, double fx, double fy) const {
    return in_cell(held.lon, nodes_.los, ix, iy, fx, fy);
  }
  double lat_shift(std::int64_t ix, std::int64_t iy, double fx, double fy) const {
    return in_cell(held.lat, nodes_.los ? nodes_.las : nullptr, ix, iy, fx, fy);
  }
  double in_cell(const double* table, const unsigned char* in_memory, std::int64_t ix,
                 std::int64_t iy, double fx, double fy) const {
    if (in_memory) {
      const unsigned char* const p = in_memory + iy * nodes_.record + ix * 4;
      const auto value = [](const unsigned char* q) { return static_cast<double>(decode_f32(q)); };
      return interpolate(value(p), value(p + nodes_.record), value(p + 4),
                         value(p + nodes_.record + 4), fx, fy);
    }
    const double* const p = table + iy * kSide + ix;
    return interpolate(p[0], p[kSide], p[1], p[kSide + 1], fx, fy);
  }

  std::optional<CallFiles<2>> files_;  // from the first load on
  NodesInMemory nodes_;
};

void Call::shift(int32_t count, const CoordinateTriple* in, const NadconControl& control,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  bool outside = false;
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple point = in[i];
    double x = point.x * kDegreesPerRadian;
    double y = point.y * kDegreesPerRadian;
    x = add_turns_while(x, -360, [](double v) { return v > 0; });
    x = add_turns_while(x, 360, [](double v) { return v <= -360; });
    const NadconWindow& w = held.bounds;
    if (!holds_at_once(w, x, y)) {
      if (!files_) files_.emplace();
      *status = locate(x, y, control, &held.bounds, held.lon, held.lat, &*files_, &nodes_);
    }
    if (*status == TW_SUCCESS) {
      const double u = (x - w.xmin) / w.dx;
      const double v = (y - w.ymin) / w.dy;
      if (!has_cell(u) || !has_cell(v)) {
        *status = TW_GRID_FILE_ERROR;
        continue;
      }
      // A point just short of the far edge may round up to it.
      const std::int64_t ix = std::min<std::int64_t>(cut(u), kSide - 2);
      const std::int64_t iy = std::min<std::int64_t>(cut(v), kSide - 2);
      const double fx = u - static_cast<double>(ix);
      const double fy = v - static_cast<double>(iy);
      x -= lon_shift(ix, iy, fx, fy) / 3600;  // positive west
      y += lat_shift(ix, iy, fx, fy) / 3600;
      x = add_turns_while(x, -360, [](double d) { return d > 180; });
      x = add_turns_while(x, 360, [](double d) { return d <= -180; });
      out[i] = {x / kDegreesPerRadian, y / kDegreesPerRadian, point.z};
    } else if (*status == TW_I_OUTSIDE_NADCON) {
      out[i] = {wrap_turns_above_then_at_or_below(point.x), point.y, point.z};
      outside = true;
      *status = TW_SUCCESS;
    }
    // Any other word stands, and keeps points unwritten, until a window is loaded again.
  }
  if (outside) *status = TW_I_OUTSIDE_NADCON;
}

}  // namespace

int32_t TWnadcon_c(const char* directory, NadconControl* control, TWstatus* status) {
  *status = TW_SUCCESS;
  const FileHandle list = open_grid_list(directory);
  char line[kListLine];
  char name[kListLine];
  bool more = list && next_line(list.get(), line, kListLine);
  if (!list || (more && !first_token(line, name))) {
    *status = TW_GRID_NOT_FOUND;
    return 1;
  }
  copy_text(directory, control->directory);
  int32_t count = 0;
  while (more) {
    *status = read_grid(directory, name, &control->grids[count]);
    if (*status != TW_SUCCESS) return 1;
    more = ++count < kMostGrids && next_line(list.get(), line, kListLine);
    // By contract: a line without a name repeats the one above it, in a slot of its own.
    if (more) first_token(line, name);
  }
  control->grid_count = count;
  return 1;
}

void TWloc_grids(double x, double y, double /*unused*/, const NadconControl* control,
                 NadconWindow* window, double* lon_table, double* lat_table, TWstatus* status) {
  CallFiles<2> files;
  NodesInMemory nodes;
  *status = locate(x, y, *control, window, lon_table, lat_table, &files, &nodes);
}

void TWnadcon_f(int32_t count, const CoordinateTriple* in, const NadconControl* control,
                CoordinateTriple* out, TWstatus* status) {
  Call().shift(count, in, *control, out, status);
}

void TWnadcon_i(int32_t count, const CoordinateTriple* in, const NadconControl* control,
                CoordinateTriple* out, TWstatus* status) {
  constexpr double kTolerance = 1.7453292519943298e-11;  // radians: 1e-9 of a degree
  constexpr int kMostPasses = 4;
  *status = TW_SUCCESS;
  Call call;
  bool outside = false;
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple point = in[i];
    const double lon = wrap_turns_above_then_at_or_below(point.x);
    CoordinateTriple estimate = point;
    double dlon = 0;
    double dlat = 0;
    int passes = 0;
    do {
      CoordinateTriple shifted;
      call.shift(1, &estimate, *control, &shifted, status);
      if (*status != TW_SUCCESS) break;
      dlon = lon - shifted.x;
      dlat = point.y - shifted.y;
      if (std::fabs(dlon) > kTolerance) estimate.x += dlon;
      if (std::fabs(dlat) > kTolerance) estimate.y += dlat;
      ++passes;
      // By contract: one difference within the tolerance is enough.
    } while (passes < kMostPasses && std::fabs(dlon) > kTolerance && std::fabs(dlat) > kTolerance);
    if (*status == TW_SUCCESS) {
      out[i] = estimate;
    } else if (*status == TW_I_OUTSIDE_NADCON) {
      out[i] = point;
      outside = true;
    }
    // By contract: also where a file failed and the caller's own longitude stands there.
    out[i].x = wrap_turns_above_then_at_or_below(out[i].x);
  }
  if (outside) *status = TW_I_OUTSIDE_NADCON;
}
