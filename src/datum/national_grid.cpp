// Shifts by a national grid file of the NTv2 format: a forest of sub-grids, the deepest of which
// serves a point, read through a block of 4 by 4 nodes.
// D. J. Junkins and S. A. Farley, NTv2: National Transformation Version 2 Developer's Guide,
// Geomatics Canada (1995).

#include <algorithm>
#include <array>
#include <cmath>
#include <cstring>
#include <limits>
#include <new>

#include "datum/grid_file.hpp"
#include "formulas/wraps.hpp"
#include "foundation/new_array.hpp"
#include "tidewater/national_grid.h"

using namespace tidewater::detail;

namespace {

constexpr double kArcSecondsPerRadian = 180 * 3600 / kPi;
constexpr double kRadiansPerArcSecond = kPi / 180 / 3600;
constexpr double kEdge = 2e-7;  // arc-seconds within which a point lies on an edge

constexpr int kListLine = 260;
constexpr int64_t kRecordBytes = 16;
constexpr std::size_t kHeaderBytes = 176;  // 11 records, of the file and of each sub-grid
constexpr int32_t kHeaderRecords = 11;
constexpr int32_t kMostRecords = std::numeric_limits<int32_t>::max();
constexpr int32_t kSide = 4;  // nodes of the block each way
constexpr int32_t kNone = -1;

using Name = std::array<char, 8>;  // padded with blanks, not terminated
constexpr Name kNoParent = {'N', 'O', 'N', 'E', ' ', ' ', ' ', ' '};

struct CntSubGrid {
  Name name;
  Name parent;
  double s_lat, n_lat, e_long, w_long, lat_inc, long_inc;  // arc-seconds, positive west
  int32_t gs_count;
  int32_t first_record;  // of its nodes, from 0
  int64_t rows, cols;
  int32_t first_child, last_child;  // range of its children in the table of children
};

// A sub-grid by its parent's name.
struct Child {
  Name parent;
  int32_t grid;
};

struct Node {
  float lat_shift, lon_shift, lat_accuracy, lon_accuracy;  // arc-seconds
};

// The open grid and the block of nodes around the last point.  They belong to the process.
struct {
  std::FILE* file;
  Name to_system;
  Name from_system;
  int32_t count;  // sub-grids in the table; fewer than the file has where one failed
  int32_t block_grid = kNone;
  int64_t block_col;
  int64_t block_row;
  Node block[kSide][kSide];
  CntSubGrid* subgrids;
  Child* children;     // sorted by parent, those of one parent in the order of the file
  int32_t first_root;  // range of those without a parent
  int32_t last_root;
  TWstatus read_status = TW_SUCCESS;
} held;

// By contract: an earlier grid is neither closed nor freed when another is opened.  This list keeps
// what it leaves behind in reach, so that a leak checker tells it from memory lost by mistake.
struct OpenedGrid {
  std::FILE* file;
  CntSubGrid* subgrids;
  Child* children;
  OpenedGrid* earlier;
};
OpenedGrid* opened_grids = nullptr;

Name decode_name(const unsigned char* p) {
  Name name;
  std::memcpy(name.data(), p, name.size());
  return name;
}

// Whole spacings in a distance that is given in spacings.
int64_t whole_spacings(double distance) { return cut(std::fabs(distance) + 1e-12); }

// Nodes on a line from a to b, never below 1.
int64_t node_count(double a, double b, double inc) { return whole_spacings((a - b) / inc) + 1; }

CntSubGrid decode_subgrid(const unsigned char* p, int32_t first_record) {
  CntSubGrid g = {.name = decode_name(p + 8),
                  .parent = decode_name(p + 24),
                  .s_lat = decode_f64(p + 72),
                  .n_lat = decode_f64(p + 88),
                  .e_long = decode_f64(p + 104),
                  .w_long = decode_f64(p + 120),
                  .lat_inc = decode_f64(p + 136),
                  .long_inc = decode_f64(p + 152),
                  .gs_count = decode_i32(p + 168),
                  .first_record = first_record,
                  .rows = 0,
                  .cols = 0,
                  .first_child = 0,
                  .last_child = 0};
  g.rows = node_count(g.n_lat, g.s_lat, g.lat_inc);
  g.cols = node_count(g.w_long, g.e_long, g.long_inc);
  return g;
}

// False for spacings and bounds that cannot be, and for a count of nodes that is not that of rows
// and columns.
bool subgrid_can_be(const CntSubGrid& g) {
  return g.lat_inc > 0 && g.long_inc > 0 && std::isfinite(g.n_lat - g.s_lat) &&
         std::isfinite(g.w_long - g.e_long) && g.rows * g.cols == g.gs_count;
}

// Where a point stands to a sub-grid.  South and east edges are inside; beyond north and west edges
// there is no cell.
enum Code : uint8_t { kInside, kNorthEdge, kWestEdge, kNorthWestCorner, kOutside };

Code classify(const CntSubGrid& g, double x, double y) {
  if (y + kEdge < g.s_lat || y - kEdge > g.n_lat || x + kEdge < g.e_long || x - kEdge > g.w_long) {
    return kOutside;
  }
  const bool north = std::fabs(y - g.n_lat) <= kEdge;
  const bool west = std::fabs(x - g.w_long) <= kEdge;
  if (north) return west ? kNorthWestCorner : kNorthEdge;
  return west ? kWestEdge : kInside;
}

// The deepest sub-grid on the way down from the roots, with the point's code in it.
struct Found {
  int32_t grid = kNone;
  Code code = kOutside;
};

// Of the children from first to before last, other than the one named.
Found best_child(int32_t first, int32_t last, int32_t except, double x, double y) {
  Found best;
  for (int32_t k = first; k < last && best.code != kInside; ++k) {
    const int32_t i = held.children[k].grid;
    if (i == except) continue;
    const Code code = classify(held.subgrids[i], x, y);
    if (code < best.code) best = {i, code};
  }
  return best;
}

Found find_subgrid(double x, double y) {
  Found found = best_child(held.first_root, held.last_root, kNone, x, y);
  // Names in a damaged file may run in a circle.  The way down is told by the last found sub-grid
  // alone, so that one which is met again ends it: of all that were passed the one at the last
  // power of two is kept for the comparison.
  int32_t passed = kNone;
  int64_t next_kept = 1;
  for (int64_t level = 1; found.grid != kNone && found.grid != passed; ++level) {
    if (level == next_kept) {
      passed = found.grid;
      next_kept *= 2;
    }
    const CntSubGrid& g = held.subgrids[found.grid];
    const Found deeper = best_child(g.first_child, g.last_child, found.grid, x, y);
    if (deeper.grid == kNone) break;
    found = deeper;
  }
  return found;
}

Node decode_node(const unsigned char* p) {
  return {decode_f32(p), decode_f32(p + 4), decode_f32(p + 8), decode_f32(p + 12)};
}

// A cell between four nodes: two values on each of its sides that a shift is interpolated from.
struct Cell {
  int32_t grid = kNone;
  uint8_t code = 0;
  int64_t row = 0, col = 0;
  struct Sides {
    double south, south_step, north, north_step;

    double at(double fx, double fy) const {
      const double on_south = south + south_step * fx;
      const double on_north = north + north_step * fx;
      return on_south + (on_north - on_south) * fy;
    }
  };
  Sides lon = {}, lat = {};
};

// The open file for the time of one call.
struct Call {
  Call() = default;
  Call(const Call&) = delete;
  Call& operator=(const Call&) = delete;
  ~Call() { settle(); }

  // Brings the block's nodes from the image into the block.
  void settle() {
    if (!nodes) return;
    for (int r = 0; r < kSide; ++r) {
      for (int c = 0; c < kSide; ++c) {
        held.block[r][c] = decode_node(nodes + r * row_bytes + c * kRecordBytes);
      }
    }
    nodes = nullptr;
  }

  FileImage image;
  std::int64_t budget = kImageBudget;
  // The first node of the block where it stands in the image; most blocks serve a single point, so
  // that they are brought into held.block only when another is read or the call ends.
  const unsigned char* nodes = nullptr;
  int64_t row_bytes = 0;
  // That of the last point: the passes of an inverse, and points in a row, mostly stay in one.
  Cell cell;
};

// Moves the block so that it begins one node south and east of a node of a sub-grid, as far as the
// sub-grid reaches.
void load_block(int32_t grid, int64_t node_row, int64_t node_col, Call* call) {
  const CntSubGrid& g = held.subgrids[grid];
  const int64_t row = std::max<int64_t>(std::min(node_row - 1, g.rows - kSide), 0);
  const int64_t col = std::max<int64_t>(std::min(node_col - 1, g.cols - kSide), 0);
  if (held.block_grid == grid && held.block_row == row && held.block_col == col) return;
  // By contract: the block counts as moved even where it cannot be read.
  held.block_grid = grid;
  held.block_row = row;
  held.block_col = col;
  constexpr int64_t kNodesBytes = kSide * kRecordBytes;
  const int64_t row_bytes = g.cols * kRecordBytes;
  const int64_t offset = (g.first_record + row * g.cols + col) * kRecordBytes;
  // By contract: four reads of four records each, also where a sub-grid has fewer rows or columns
  // and they reach into what follows, or behind the end of the file.
  const unsigned char* const in_memory =
      call->image.at(offset, (kSide - 1) * row_bytes + kNodesBytes);
  if (in_memory) {
    call->nodes = in_memory;
    call->row_bytes = row_bytes;
    return;
  }
  call->settle();
  // One read for the four rows saves most of the time of a load, as long as they are near enough.
  constexpr int64_t kMostBytes = 32768;
  unsigned char bytes[kMostBytes];
  const int rows_at_once = (kSide - 1) * row_bytes + kNodesBytes <= kMostBytes ? kSide : 1;
  for (int r = 0; r < kSide; r += rows_at_once) {
    const int64_t span = (rows_at_once - 1) * row_bytes + kNodesBytes;
    std::size_t read = 0;
    if (seek_to(held.file, offset + r * row_bytes)) {
      read = std::fread(bytes, 1, static_cast<std::size_t>(span), held.file);
    }
    for (int k = 0; k < rows_at_once; ++k) {
      if (k * row_bytes + kNodesBytes > static_cast<int64_t>(read)) {
        held.read_status = TW_GSB_READ_ERROR;  // the row keeps what it held
        continue;
      }
      for (int c = 0; c < kSide; ++c) {
        held.block[r + k][c] = decode_node(bytes + k * row_bytes + c * kRecordBytes);
      }
    }
  }
  call->image.count_load(held.file, &call->budget);
}

// Shifts in arc-seconds.
struct Shift {
  double lon, lat;
};

// Without branches: which of the comparisons a scattered point fails cannot be foreseen.
bool in_block(int64_t row, int64_t col) {
  const auto within = [](int64_t offset) {
    return static_cast<int>(static_cast<uint64_t>(offset) < uint64_t{kSide});
  };
  return (within(row - held.block_row) & within(col - held.block_col)) != 0;
}

// Reads the nodes of a cell, moving the block where it does not hold them.
Cell cell_at(const Found& found, int64_t row, int64_t col, Call* call) {
  const CntSubGrid& g = held.subgrids[found.grid];
  const int64_t to_west = found.code == kInside || found.code == kNorthEdge ? 1 : 0;
  const int64_t to_north = found.code == kInside || found.code == kWestEdge ? 1 : 0;
  // By contract: at the corner the fourth node is still that of the cell, which has all the weight
  // for a point that lies a hair before it.  Beyond the sub-grid there is none, and next to no
  // weight.
  const bool own_corner = found.code == kNorthWestCorner && row + 1 < g.rows && col + 1 < g.cols;
  const int64_t to_corner_row = own_corner ? 1 : to_north;
  const int64_t to_corner_col = own_corner ? 1 : to_west;
  const int held_already = static_cast<int>(held.block_grid == found.grid) &
                           static_cast<int>(in_block(row, col)) &
                           static_cast<int>(in_block(row + to_corner_row, col + to_corner_col));
  if (held_already == 0) {
    load_block(found.grid, row, col, call);
  }

  // Rounding may put a point a node beyond a sub-grid of absurdly small spacing.
  const int64_t r = std::clamp<int64_t>(row - held.block_row, 0, kSide - 1);
  const int64_t c = std::clamp<int64_t>(col - held.block_col, 0, kSide - 1);
  const auto in_block = [](int64_t index) { return std::min<int64_t>(index, kSide - 1); };
  const auto node = [call](int64_t in_row, int64_t in_col) {
    if (!call->nodes) return held.block[in_row][in_col];
    return decode_node(call->nodes + in_row * call->row_bytes + in_col * kRecordBytes);
  };
  const Node base = node(r, c);
  const Node west = node(r, in_block(c + to_west));
  const Node north = node(in_block(r + to_north), c);
  const Node northwest = node(in_block(r + to_corner_row), in_block(c + to_corner_col));
  const auto sides = [&](float Node::*field) {
    const auto b = static_cast<double>(base.*field);
    const auto n = static_cast<double>(north.*field);
    return Cell::Sides{b, static_cast<double>(west.*field) - b, n,
                       static_cast<double>(northwest.*field) - n};
  };
  return {found.grid, found.code, row, col, sides(&Node::lon_shift), sides(&Node::lat_shift)};
}

Shift interpolate(const Found& found, double x, double y, Call* call) {
  const CntSubGrid& g = held.subgrids[found.grid];
  const double u = (x - g.e_long) / g.long_inc;
  const double v = (y - g.s_lat) / g.lat_inc;
  // The base node of the cell, from 0; on an edge it serves for the nodes beyond as well.
  const int64_t row = whole_spacings(v);
  const int64_t col = whole_spacings(u);
  const double fx = u - static_cast<double>(col);
  const double fy = v - static_cast<double>(row);
  Cell& cell = call->cell;
  if (cell.grid != found.grid || cell.row != row || cell.col != col || cell.code != found.code) {
    cell = cell_at(found, row, col, call);
  }
  return {cell.lon.at(fx, fy), cell.lat.at(fx, fy)};
}

// Shift of a point in radians, with the call's word; unwritten outside all sub-grids.
TWstatus shift_at(double lon, double lat, double* lon_shift, double* lat_shift, Call* call) {
  lon = add_turns_while(lon, kTwoPi, [](double v) { return v <= 0; });
  lon = add_turns_while(lon, -kTwoPi, [](double v) { return v > kTwoPi; });
  lon = add_turns_while(lon, -kTwoPi, [](double v) { return v >= kPi; });
  // By contract: the sub-grids' longitudes, positive west, are compared with the magnitude alone,
  // so that a point east of Greenwich takes the shift of its mirror image.
  const double sign = lon >= 0 ? 1 : -1;
  const double x = std::fabs(lon) * kArcSecondsPerRadian;
  const double y = lat * kArcSecondsPerRadian;
  const Found found = find_subgrid(x, y);
  if (found.grid == kNone) return TW_I_OUTSIDE_CNT;
  held.read_status = TW_SUCCESS;
  const Shift shift = interpolate(found, x, y, call);
  *lon_shift = shift.lon * sign * kRadiansPerArcSecond;
  *lat_shift = shift.lat * kRadiansPerArcSecond;
  return held.read_status;
}

// Gives each sub-grid the range of its children.
void index_children() {
  Child* const end = held.children + held.count;
  for (int32_t i = 0; i < held.count; ++i) held.children[i] = {held.subgrids[i].parent, i};
  std::sort(held.children, end, [](const Child& a, const Child& b) {
    return a.parent != b.parent ? a.parent < b.parent : a.grid < b.grid;
  });
  const auto range_of = [end](const Name& parent, int32_t* first, int32_t* last) {
    const Child* const begin =
        std::lower_bound(held.children, end, parent,
                         [](const Child& c, const Name& name) { return c.parent < name; });
    const Child* const behind =
        std::upper_bound(held.children, end, parent,
                         [](const Name& name, const Child& c) { return name < c.parent; });
    *first = static_cast<int32_t>(begin - held.children);
    *last = static_cast<int32_t>(behind - held.children);
  };
  range_of(kNoParent, &held.first_root, &held.last_root);
  for (int32_t i = 0; i < held.count; ++i) {
    CntSubGrid& g = held.subgrids[i];
    range_of(g.name, &g.first_child, &g.last_child);
  }
}

// Reads the header of the file and those of its sub-grids.
TWstatus read_headers() {
  unsigned char header[kHeaderBytes];
  if (!read_exactly(held.file, header, kHeaderBytes) || decode_i32(header + 8) != kHeaderRecords ||
      decode_i32(header + 24) != kHeaderRecords) {
    return TW_GSB_READ_ERROR;
  }
  held.to_system = decode_name(header + 104);
  held.from_system = decode_name(header + 88);
  const int32_t num_file = decode_i32(header + 40);
  // Each sub-grid has a header: a damaged count must not ask for a table larger than the file.
  constexpr auto kBytes = static_cast<int64_t>(kHeaderBytes);
  if (num_file < 0 || num_file > length_of(held.file) / kBytes - 1) return TW_GSB_READ_ERROR;
  held.subgrids = new_array<CntSubGrid>(static_cast<uint64_t>(num_file)).release();
  opened_grids->subgrids = held.subgrids;
  held.children = new_array<Child>(static_cast<uint64_t>(num_file)).release();
  opened_grids->children = held.children;
  if (!held.subgrids || !held.children) return TW_NO_MEMORY;
  int64_t record = kHeaderRecords;
  for (int32_t i = 0; i < num_file; ++i) {
    const int64_t first_node = record + kHeaderRecords;
    if (first_node > kMostRecords || !seek_to(held.file, record * kRecordBytes) ||
        !read_exactly(held.file, header, kHeaderBytes)) {
      return TW_GSB_READ_ERROR;
    }
    const CntSubGrid grid = decode_subgrid(header, static_cast<int32_t>(first_node));
    if (!subgrid_can_be(grid)) return TW_GSB_READ_ERROR;
    held.subgrids[i] = grid;
    held.count = i + 1;
    record = first_node + grid.gs_count;
  }
  return TW_SUCCESS;
}

// Forgets the open grid.
void clear_state() {
  held.count = 0;
  held.file = nullptr;
  held.subgrids = nullptr;
  held.children = nullptr;
  held.first_root = 0;
  held.last_root = 0;
  held.block_grid = kNone;
}

}  // namespace

void TWget_cnt_fnam(const char* directory, char* name, TWstatus* status) {
  *status = TW_SUCCESS;
  const FileHandle list = open_grid_list(directory);
  char line[kListLine];
  // Only the first line counts; without a name in it the list is as good as empty.
  if (!list || !next_line(list.get(), line, kListLine) || !first_token(line, name)) {
    *status = TW_GRID_NOT_FOUND;
  }
}

void TWrd_cnt_fhdr(const char* path, int32_t flag, TWstatus* status) {
  *status = TW_SUCCESS;
  FileHandle file;
  if (flag == 0) file = open_grid(path);
  if (!file) {
    *status = TW_GSB_READ_ERROR;
    return;
  }
  auto* opened = new (std::nothrow) OpenedGrid{file.get(), nullptr, nullptr, opened_grids};
  if (!opened) {
    *status = TW_NO_MEMORY;
    return;
  }
  opened_grids = opened;
  clear_state();
  held.file = file.release();
  *status = read_headers();
  index_children();  // also of a table that ends early
}

void TWcnt_c(const char* directory, int32_t /*reserved*/, TWstatus* status) {
  char name[kListLine];
  TWget_cnt_fnam(directory, name, status);
  if (!TW_OK(*status)) return;
  clear_state();
  TWrd_cnt_fhdr(GridPath(directory, name, ".gsb").text(), 0, status);
}

void TWcnt_to_from(int32_t /*reserved*/, char* from, char* to, TWstatus* status) {
  *status = TW_SUCCESS;
  *std::copy(held.from_system.begin(), held.from_system.end(), from) = '\0';
  *std::copy(held.to_system.begin(), held.to_system.end(), to) = '\0';
}

void TWload_cnt_local_grid(int32_t sub_grid, int32_t record) {
  if (sub_grid < 0 || sub_grid >= held.count) return;
  const CntSubGrid& g = held.subgrids[sub_grid];
  const int64_t offset = int64_t{record} - g.first_record - 1;
  Call call;
  load_block(sub_grid, offset / g.cols, offset % g.cols, &call);
}

void TWget_cnt_shift(CoordinateTriple point, int32_t /*reserved*/, double* lon_shift,
                     double* lat_shift, TWstatus* status) {
  Call call;
  *status = shift_at(point.x, point.y, lon_shift, lat_shift, &call);
}

void TWcnt_f(int32_t count, const CoordinateTriple* in, int32_t /*reserved*/, CoordinateTriple* out,
             TWstatus* status) {
  *status = TW_SUCCESS;
  Call call;
  bool outside = false;
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple point = in[i];
    double dlon = 0;
    double dlat = 0;
    *status = shift_at(point.x, point.y, &dlon, &dlat, &call);
    if (!TW_OK(*status)) return;
    if (*status == TW_I_OUTSIDE_CNT) {
      out[i] = point;
      outside = true;
      *status = TW_SUCCESS;
    } else {
      out[i] = {point.x + dlon, point.y + dlat, point.z};
    }
  }
  if (outside) *status = TW_I_OUTSIDE_CNT;
}

void TWcnt_i(int32_t count, const CoordinateTriple* in, int32_t /*reserved*/, CoordinateTriple* out,
             TWstatus* status) {
  constexpr int kPasses = 4;
  *status = TW_SUCCESS;
  Call call;
  bool outside = false;
  for (int32_t i = 0; i < count; ++i) {
    const CoordinateTriple point = in[i];
    double dlon = 0;
    double dlat = 0;
    for (int pass = 0; pass < kPasses; ++pass) {
      // A pass outside leaves the shifts as they are.
      *status = shift_at(point.x - dlon, point.y - dlat, &dlon, &dlat, &call);
      if (!TW_OK(*status)) return;
    }
    if (*status == TW_I_OUTSIDE_CNT) {  // the last pass alone decides
      out[i] = point;
      outside = true;
      *status = TW_SUCCESS;
    } else {
      out[i] = {point.x - dlon, point.y - dlat, point.z};
    }
  }
  if (outside) *status = TW_I_OUTSIDE_CNT;
}
