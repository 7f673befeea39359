// Grids of datum shifts and of geoid undulations: finding a point's cell and interpolating in it.

#include "tidewater/grids.hpp"

#include <algorithm>
#include <cmath>
#include <limits>
#include <numbers>

#include "grids_content.hpp"

namespace tidewater {

namespace detail {

namespace {

constexpr double kTurn = 2 * std::numbers::pi;
constexpr double kDegree = std::numbers::pi / 180;
constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
// Radians within which a point that lies beyond an edge is taken to lie on it: 0.006 mm.
constexpr double kEdge = 1e-12;

// Where a point lies in a lattice: the first node of its cell, and how far it is from it, in cells.
struct Cell {
  std::int64_t column, row;
  double fx, fy;
};

// Leaves cell as it is where the lattice does not hold the point.
bool find_cell(const Lattice& g, double lon, double lat, Cell* cell) {
  double x = lon - g.west;
  if (x < -kEdge) x += kTurn;
  if (x >= kTurn - kEdge) x -= kTurn;
  const double y = lat - g.south;
  // A not-a-number is in no lattice.
  if (!(x >= -kEdge && x <= g.width() + kEdge && y >= -kEdge && y <= g.height() + kEdge)) {
    return false;
  }
  const auto along = [](double distance, double spacing, std::int64_t nodes, double* f) {
    const double u = std::max(distance / spacing, 0.0);
    const std::int64_t first = std::min(static_cast<std::int64_t>(u), nodes - 2);
    *f = std::min(u - static_cast<double>(first), 1.0);
    return first;
  };
  cell->column = along(x, g.dx, g.columns, &cell->fx);
  cell->row = along(y, g.dy, g.rows, &cell->fy);
  return true;
}

// The deepest lattice that holds a point, or null.
const Lattice* find_lattice(const GridContent& grid, double lon, double lat, Cell* cell) {
  const Lattice* found = nullptr;
  const std::vector<std::int32_t>* level = &grid.roots;
  for (bool deeper = true; deeper;) {
    deeper = false;
    for (const std::int32_t i : *level) {
      const Lattice& g = grid.lattices[static_cast<std::size_t>(i)];
      if (!find_cell(g, lon, lat, cell)) continue;
      found = &g;
      level = &g.children;
      deeper = !level->empty();
      break;
    }
  }
  return found;
}

// A longitude into [-pi, pi]; a lattice may want it a turn further, which it sees to itself.
double near_greenwich(double lon) {
  return std::fabs(lon) <= std::numbers::pi ? lon : std::remainder(lon, kTurn);
}

// Newton's second-order formula on three nodes, at t spacings from the first.
double quadratic(double t, double f0, double f1, double f2) {
  return f0 + t * (f1 - f0) + t * (t - 1) * 0.5 * (f2 - 2 * f1 + f0);
}

// The first of the three nodes nearest to a point, and its distance from it.
std::int64_t first_of_three(std::int64_t node, double f, std::int64_t nodes, double* t) {
  const std::int64_t first =
      std::clamp<std::int64_t>(f < 0.5 ? node - 1 : node, 0, std::max<std::int64_t>(nodes - 3, 0));
  *t = static_cast<double>(node - first) + f;
  return first;
}

double biquadratic(const Lattice& g, const Cell& cell) {
  double tx = 0;
  double ty = 0;
  const std::int64_t column = first_of_three(cell.column, cell.fx, g.columns, &tx);
  const std::int64_t row = first_of_three(cell.row, cell.fy, g.rows, &ty);
  double across[3];
  for (std::int64_t k = 0; k < 3; ++k) {
    const float* const p = &g.values[static_cast<std::size_t>((row + k) * g.columns + column)];
    across[k] = quadratic(tx, static_cast<double>(p[0]), static_cast<double>(p[1]),
                          static_cast<double>(p[2]));
  }
  return quadratic(ty, across[0], across[1], across[2]);
}

// One value of the bands nodes apart, from south to north and from west to east.
template <int kBands>
double bilinear(const float* south, const float* north, double fx, double fy) {
  const auto on_row = [fx](const float* p) {
    const auto west = static_cast<double>(p[0]);
    return west + (static_cast<double>(p[kBands]) - west) * fx;
  };
  const double s = on_row(south);
  return s + (on_row(north) - s) * fy;
}

}  // namespace

bool GridContent::shift(double lon, double lat, double* dlon, double* dlat) const {
  Cell cell;
  const Lattice* const g = find_lattice(*this, near_greenwich(lon), lat, &cell);
  if (!g) return false;
  const float* const south =
      &g->values[static_cast<std::size_t>(2 * (cell.row * g->columns + cell.column))];
  const float* const north = south + 2 * g->columns;
  *dlon = bilinear<2>(south, north, cell.fx, cell.fy) * g->unit;
  *dlat = bilinear<2>(south + 1, north + 1, cell.fx, cell.fy) * g->unit;
  return !std::isnan(*dlon + *dlat);
}

bool GridContent::translation(double lon, double lat, double (*by)[3]) const {
  Cell cell;
  const Lattice* const g = find_lattice(*this, near_greenwich(lon), lat, &cell);
  if (!g) return false;
  const float* const south =
      &g->values[static_cast<std::size_t>(3 * (cell.row * g->columns + cell.column))];
  const float* const north = south + 3 * g->columns;
  for (int k = 0; k < 3; ++k) {
    (*by)[k] = bilinear<3>(south + k, north + k, cell.fx, cell.fy) * g->unit;
  }
  return !std::isnan((*by)[0] + (*by)[1] + (*by)[2]);
}

namespace {

// Moves a point that lies beyond the edges by less than a cell onto them; false where it lies
// farther off all grids.
bool onto_edge(const GridContent& grid, double* lon, double* lat) {
  for (const std::int32_t i : grid.roots) {
    const Lattice& g = grid.lattices[static_cast<std::size_t>(i)];
    const double middle = g.west + g.width() / 2;
    const double x = middle + std::remainder(*lon - middle, kTurn);
    const double to_x = std::clamp(x, g.west, g.west + g.width());
    const double to_y = std::clamp(*lat, g.south, g.south + g.height());
    if (std::fabs(x - to_x) < g.dx && std::fabs(*lat - to_y) < g.dy) {
      *lon += to_x - x;
      *lat = to_y;
      return true;
    }
  }
  return false;
}

}  // namespace

TWstatus GridContent::unshift(double* lon, double* lat, int* passes) const {
  constexpr int kMostPasses = 20;
  constexpr double kTolerance = 1e-12;
  double x = *lon;
  double y = *lat;
  for (*passes = 1; *passes <= kMostPasses; ++*passes) {
    double dlon = 0;
    double dlat = 0;
    // A point just off the grid may come from inside it.
    const bool inside = shift(x, y, &dlon, &dlat);
    if (!inside) {
      double edge_x = x;
      double edge_y = y;
      if (!onto_edge(*this, &edge_x, &edge_y) || !shift(edge_x, edge_y, &dlon, &dlat)) {
        return TW_I_OUTSIDE_CNT;
      }
    }
    const double step_x = *lon - dlon - x;
    const double step_y = *lat - dlat - y;
    x += step_x;
    y += step_y;
    if (std::fabs(step_x) <= kTolerance && std::fabs(step_y) <= kTolerance) {
      if (!inside) return TW_I_OUTSIDE_CNT;
      *lon = x;
      *lat = y;
      return TW_SUCCESS;
    }
  }
  *passes = kMostPasses;
  return TW_NOT_CONVERGED;
}

double GridContent::undulation(double lon, double lat) const {
  Cell cell;
  const Lattice* const g = find_lattice(*this, near_greenwich(lon), lat, &cell);
  if (!g) return kNaN;
  if (biquadratic) return detail::biquadratic(*g, cell) * g->unit;
  const float* const south =
      &g->values[static_cast<std::size_t>(cell.row * g->columns + cell.column)];
  return bilinear<1>(south, south + g->columns, cell.fx, cell.fy) * g->unit;
}

namespace {

// Runs points, given in degrees, through work(i, x, y, z), which changes them and gives their word.
template <class Work>
Summary each_point(std::size_t count, const Coordinates<const double>& in,
                   const Coordinates<double>& out, TWstatus* status, Work work) {
  Summary summary;
  for (std::size_t i = 0; i < count; ++i) {
    const std::ptrdiff_t at = static_cast<std::ptrdiff_t>(i);
    double x = in.x[at * in.stride];
    double y = in.y[at * in.stride];
    double z = in.z ? in.z[at * in.stride] : 0;
    const TWstatus word = work(i, &x, &y, &z);
    if (word != TW_SUCCESS) {
      x = y = z = kNaN;
      if (summary.failed++ == 0) summary.word = word;
    }
    out.x[at * out.stride] = x;
    out.y[at * out.stride] = y;
    if (out.z) out.z[at * out.stride] = z;
    if (status) status[i] = word;
  }
  return summary;
}

std::vector<GridBounds> bounds_of(const GridContent& grid) {
  std::vector<GridBounds> bounds;
  for (const std::int32_t i : grid.roots) {
    const Lattice& g = grid.lattices[static_cast<std::size_t>(i)];
    bounds.push_back({g.west / kDegree, g.south / kDegree, (g.west + g.width()) / kDegree,
                      (g.south + g.height()) / kDegree});
  }
  return bounds;
}

std::string describe_grid(const GridContent& grid) {
  std::string text = grid.form + " grid of ";
  if (grid.lattices.size() == 1) {
    const Lattice& g = grid.lattices.front();
    text += std::to_string(g.rows) + " rows and " + std::to_string(g.columns - (g.round ? 1 : 0)) +
            " columns";
  } else {
    text += std::to_string(grid.lattices.size()) + " sub-grids";
  }
  if (!grid.source.empty() && !grid.target.empty()) {
    text += ", " + grid.source + " to " + grid.target;
  }
  return text;
}

}  // namespace

}  // namespace detail

using namespace detail;

ShiftGrid::ShiftGrid(const std::string& name, const std::vector<std::string>& folders)
    : content_(std::make_shared<GridContent>(read_grid(name, folders, GridKind::shift))) {}

Summary ShiftGrid::forward(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                           TWstatus* status) const noexcept {
  return each_point(count, in, out, status, [this](std::size_t, double* x, double* y, double*) {
    double dlon = 0;
    double dlat = 0;
    if (!content_->shift(*x * kDegree, *y * kDegree, &dlon, &dlat)) return TW_I_OUTSIDE_CNT;
    *x += dlon / kDegree;
    *y += dlat / kDegree;
    return TW_SUCCESS;
  });
}

Summary ShiftGrid::inverse(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                           TWstatus* status, int* passes) const noexcept {
  return each_point(count, in, out, status,
                    [&, this](std::size_t i, double* x, double* y, double*) {
                      const double lon = *x * kDegree;
                      const double lat = *y * kDegree;
                      double to_lon = lon;
                      double to_lat = lat;
                      int taken = 0;
                      const TWstatus word = content_->unshift(&to_lon, &to_lat, &taken);
                      if (passes) passes[i] = taken;
                      *x += (to_lon - lon) / kDegree;
                      *y += (to_lat - lat) / kDegree;
                      return word;
                    });
}

Point ShiftGrid::forward(Point p) const noexcept {
  forward(1, {&p.x, &p.y, &p.z}, {&p.x, &p.y, &p.z});
  return p;
}

Point ShiftGrid::inverse(Point p) const noexcept {
  inverse(1, {&p.x, &p.y, &p.z}, {&p.x, &p.y, &p.z});
  return p;
}

const std::string& ShiftGrid::path() const { return content_->path; }
const std::string& ShiftGrid::source() const { return content_->source; }
const std::string& ShiftGrid::target() const { return content_->target; }
std::vector<GridBounds> ShiftGrid::bounds() const { return bounds_of(*content_); }
std::string ShiftGrid::describe() const { return describe_grid(*content_); }

namespace {

GridContent read_geoid(const std::string& name, const std::vector<std::string>& folders,
                       GeoidGrid::Interpolation interpolation) {
  GridContent content = read_grid(name, folders, GridKind::geoid);
  content.biquadratic = interpolation == GeoidGrid::Interpolation::biquadratic;
  for (const Lattice& g : content.lattices) {
    if (content.biquadratic && (g.columns < 3 || g.rows < 3)) {
      refuse(content.path,
             "has fewer than the three rows and columns of biquadratic interpolation");
    }
  }
  return content;
}

// The undulation is added with sign 1, taken off with sign -1.
Summary shift_heights(const GridContent& grid, double sign, std::size_t count,
                      const Coordinates<const double>& in, const Coordinates<double>& out,
                      TWstatus* status) {
  return each_point(count, in, out, status,
                    [&grid, sign](std::size_t, const double* x, const double* y, double* z) {
                      const double n = grid.undulation(*x * kDegree, *y * kDegree);
                      *z += sign * n;
                      return std::isnan(n) ? TW_I_OUTSIDE_GEOID : TW_SUCCESS;
                    });
}

}  // namespace

GeoidGrid::GeoidGrid(const std::string& name, const std::vector<std::string>& folders,
                     Interpolation interpolation)
    : content_(std::make_shared<GridContent>(read_geoid(name, folders, interpolation))) {}

double GeoidGrid::undulation(double longitude, double latitude) const noexcept {
  return content_->undulation(longitude * kDegree, latitude * kDegree);
}

Summary GeoidGrid::forward(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                           TWstatus* status) const noexcept {
  return shift_heights(*content_, 1, count, in, out, status);
}

Summary GeoidGrid::inverse(std::size_t count, Coordinates<const double> in, Coordinates<double> out,
                           TWstatus* status) const noexcept {
  return shift_heights(*content_, -1, count, in, out, status);
}

const std::string& GeoidGrid::path() const { return content_->path; }
std::vector<GridBounds> GeoidGrid::bounds() const { return bounds_of(*content_); }
std::string GeoidGrid::describe() const { return describe_grid(*content_); }

}  // namespace tidewater
