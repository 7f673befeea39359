// NADCON shifts: bilinear interpolation in a window of 4 by 4 nodes that is read from the grid
// files when a point leaves it.

#include <cmath>
#include <memory>
#include <new>

#include "datum/grid_file.hpp"
#include "datum/grid_window.hpp"
#include "formulas/wraps.hpp"
#include "tidewater/datum.h"
#include "tidewater/foundation.h"

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

bool read_table(std::FILE* file, unsigned char* buffer, std::int64_t record, std::int64_t column,
                double* table) {
  if (!read_exactly(file, buffer, static_cast<std::size_t>(kSide * record))) return false;
  for (int r = 0; r < kSide; ++r) {
    const unsigned char* p = buffer + r * record + column * 4;
    for (int c = 0; c < kSide; ++c) {
      table[r * kSide + c] = static_cast<double>(decode_f32(p + std::ptrdiff_t{4} * c));
    }
  }
  return true;
}

// Reads four whole records from record iy on and takes the four values from float ix on.
TWstatus read_tables(std::FILE* los, std::FILE* las, int32_t nc, std::int64_t ix, std::int64_t iy,
                     double* lon_table, double* lat_table) {
  const std::int64_t record = record_bytes(nc);
  // A window that gave way may have left its grid. Index 0 is the label of a record, and record 0
  // the header: they are read as they stand.
  if (ix < 0 || ix + kSide - 1 > nc || iy < 0 ||
      iy > std::numeric_limits<std::int64_t>::max() / record - kSide) {
    return TW_GRID_FILE_ERROR;
  }
  const std::int64_t offset = iy * record;
  const std::int64_t end = offset + kSide * record;
  if (!may_hold(los, end) && !may_hold(las, end)) return TW_GRID_FILE_ERROR;  // both too short
  const std::unique_ptr<unsigned char[]> buffer(
      new (std::nothrow) unsigned char[static_cast<std::size_t>(kSide * record)]);
  if (!buffer) return TW_NO_MEMORY;
  if (!seek_to(los, offset) || !seek_to(las, offset)) return TW_GRID_FILE_ERROR;
  const bool lon_read = read_table(los, buffer.get(), record, ix, lon_table);
  const bool lat_read = read_table(las, buffer.get(), record, ix, lat_table);
  return lon_read && lat_read ? TW_SUCCESS : TW_GRID_FILE_ERROR;
}

// False where a window gave way to a better grid so far that no cell of it serves the point.
bool has_cell(double position) { return position > -1 && position <= kSide - 1; }

// Shift in arc-seconds in the cell (ix, iy) of a table.
double interpolate(const double* table, std::int64_t ix, std::int64_t iy, double fx, double fy) {
  constexpr double kMarker = 180;  // what is larger marks a node without data
  const double* p = table + iy * kSide + ix;
  double p00 = p[0], p01 = p[kSide], p10 = p[1], p11 = p[kSide + 1];
  // By contract: no count of the markers; of several, the later ones enter the means.
  if (std::fabs(p00) > kMarker) p00 = (p11 + p10 + p01) / 3;
  if (std::fabs(p01) > kMarker) p01 = (p11 + p10 + p00) / 3;
  if (std::fabs(p10) > kMarker) p10 = (p11 + p01 + p00) / 3;
  if (std::fabs(p11) > kMarker) p11 = (p10 + p01 + p00) / 3;
  double shift = 0;
  TWstatus always = TW_SUCCESS;
  TWbilinear_interpolation(p00, p01, p10, p11, fx, fy, &shift, &always);
  return shift;
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
  *status = TW_SUCCESS;
  const int32_t chosen = first_grid_holding(*control, x, y);
  if (chosen < 0) {
    *status = TW_I_OUTSIDE_NADCON;
    return;
  }
  const NadconGrid& grid = control->grids[chosen];
  if (!grid_can_be(grid, kSide)) {
    *status = TW_GRID_FILE_ERROR;
    return;
  }
  const FileHandle los = open_grid(GridPath(control->directory, grid.name, ".los").text());
  if (!los) {
    *status = TW_GRID_FILE_ERROR;
    return;
  }
  const FileHandle las = open_grid(GridPath(control->directory, grid.name, ".las").text());
  if (!las) {
    *status = TW_GRID_FILE_ERROR;
    return;
  }

  const double dx = grid.dx;
  const double dy = grid.dy;
  const double gx = (x - grid.xmin) / dx;
  const double gy = (y - grid.ymin) / dy;
  std::int64_t ix = cut(std::floor(gx));
  std::int64_t iy = cut(std::floor(gy));
  // Columns ix - 1 to ix + 2 and rows iy - 1 to iy + 2 stay in the grid.
  if (iy + 2 >= grid.nr) {
    iy = grid.nr - 3;
  } else if (iy - 1 < 0) {
    iy = 1;
  }
  if (ix + 2 >= grid.nc) {
    ix = grid.nc - 3;
  } else if (ix - 1 < 0) {
    ix = 1;
  }
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
  const double x_ref = w.xmin + dx + (gx - std::floor(gx)) * dx;
  const double y_ref = w.ymin + dy + (gy - std::floor(gy)) * dy;
  for (int32_t g = 0; g < chosen; ++g) {
    const auto reach = reach_into(w, control->grids[g], x_ref, y_ref);
    give_way({cut(reach[kWest] / dx), cut(reach[kNorth] / dy), cut(reach[kEast] / dx),
              cut(reach[kSouth] / dy)},
             &w, &ix, &iy);
  }
  *status = read_tables(los.get(), las.get(), grid.nc, ix, iy, lon_table, lat_table);
}

void TWnadcon_f(int32_t count, const CoordinateTriple* in, const NadconControl* control,
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
    if (!holds(w, x, y)) TWloc_grids(x, y, 0, control, &held.bounds, held.lon, held.lat, status);
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
      x -= interpolate(held.lon, ix, iy, fx, fy) / 3600;  // positive west
      y += interpolate(held.lat, ix, iy, fx, fy) / 3600;
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

void TWnadcon_i(int32_t count, const CoordinateTriple* in, const NadconControl* control,
                CoordinateTriple* out, TWstatus* status) {
  constexpr double kTolerance = 1.7453292519943298e-11;  // radians: 1e-9 of a degree
  constexpr int kMostPasses = 4;
  *status = TW_SUCCESS;
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
      TWnadcon_f(1, &estimate, control, &shifted, status);
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
