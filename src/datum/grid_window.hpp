// What the windows into NADCON and geoid grids share: finding the grid of a point, and moving a
// window off grids that are to be preferred.
#pragma once

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <limits>
#include <optional>
#include <utility>

#include "datum/grid_file.hpp"

namespace tidewater::detail {

// A grid holds no point of its edge.
template <class Bounds>
bool holds(const Bounds& g, double x, double y) {
  return g.xmin < x && x < g.xmax && g.ymin < y && y < g.ymax;
}

// The same without branches, for a window: which of the comparisons a scattered point fails cannot
// be foreseen.
template <class Bounds>
bool holds_at_once(const Bounds& w, double x, double y) {
  return (static_cast<int>(w.xmin < x) & static_cast<int>(x < w.xmax) &
          static_cast<int>(w.ymin < y) & static_cast<int>(y < w.ymax)) != 0;
}

// Grids of the caller's block; a count that no block can hold is cut.
template <class Control>
int32_t grids_of(const Control& control) {
  return std::min(control.grid_count, static_cast<int32_t>(std::size(control.grids)));
}

// Index of the first grid of the list that holds the point, or -1.
template <class Control>
int32_t first_grid_holding(const Control& control, double x, double y) {
  for (int32_t i = 0; i < grids_of(control); ++i) {
    if (holds(control.grids[i], x, y)) return i;
  }
  return -1;
}

// True for a grid of at least so many rows and columns, of positive spacing, whose file has a
// length that can be told.
template <class Grid>
bool grid_can_be(const Grid& g, int32_t least) {
  constexpr std::int64_t kMostBytes = std::numeric_limits<std::int64_t>::max();
  return g.nc >= least && g.nr >= least && g.dx > 0 && g.dy > 0 && std::isfinite(g.dx) &&
         std::isfinite(g.dy) && record_bytes(g.nc) <= kMostBytes / (std::int64_t{g.nr} + 1);
}

// Directions of a move, in the order in which moves are weighed.
enum Direction : std::uint8_t { kWest, kNorth, kEast, kSouth };

// How far the window reaches into grid g, by the direction in which it would have to give way,
// where the point (x, y) does not lie beyond the edge concerned; 0 where it need not.  Nothing
// where all four are 0.
template <class Window, class Grid>
std::optional<std::array<double, 4>> reach_into(const Window& w, const Grid& g, double x,
                                                double y) {
  // Most windows lie wholly inside or outside the other grid's bounds.
  const auto crosses = [](auto min, auto max, auto bound) {
    return static_cast<int>(min < bound) & static_cast<int>(max > bound);
  };
  if ((crosses(w.xmin, w.xmax, g.xmin) | crosses(w.xmin, w.xmax, g.xmax) |
       crosses(w.ymin, w.ymax, g.ymin) | crosses(w.ymin, w.ymax, g.ymax)) == 0) {
    return std::nullopt;
  }
  const bool columns_meet = w.xmin < g.xmax && w.xmax > g.xmin;
  const bool rows_meet = w.ymin < g.ymax && w.ymax > g.ymin;
  std::array<double, 4> reach = {};
  const auto between = [](auto high, auto low) {
    return static_cast<double>(high) - static_cast<double>(low);
  };
  if (w.xmin < g.xmin && w.xmax > g.xmin && rows_meet && g.xmin >= x)
    reach[kWest] = between(w.xmax, g.xmin);
  if (w.ymin < g.ymax && w.ymax > g.ymax && columns_meet && g.ymax <= y)
    reach[kNorth] = between(g.ymax, w.ymin);
  if (w.xmin < g.xmax && w.xmax > g.xmax && rows_meet && g.xmax <= x)
    reach[kEast] = between(g.xmax, w.xmin);
  if (w.ymin < g.ymin && w.ymax > g.ymin && columns_meet && g.ymin >= y)
    reach[kSouth] = between(w.ymax, g.ymin);
  if (reach == std::array<double, 4>{}) return std::nullopt;
  return reach;
}

// Moves the window, and the column and row of its reference node, by the smallest of four amounts
// (in nodes, by direction) that is not zero.
template <class Window>
void give_way(const std::array<std::int64_t, 4>& amounts, Window* w, std::int64_t* ix,
              std::int64_t* iy) {
  std::array<std::pair<std::int64_t, Direction>, 4> moves = {
      {{amounts[0], kWest}, {amounts[1], kNorth}, {amounts[2], kEast}, {amounts[3], kSouth}}};
  // By contract: this plain exchange sort, which settles the order of equal amounts in its own way.
  for (std::size_t i = 0; i < moves.size(); ++i) {
    for (std::size_t j = i + 1; j < moves.size(); ++j) {
      if (moves[i].first > moves[j].first) std::swap(moves[i], moves[j]);
    }
  }
  const auto* const move = std::find_if(moves.begin(), moves.end(),
                                        [](const auto& candidate) { return candidate.first != 0; });
  if (move == moves.end()) return;
  const auto [amount, direction] = *move;
  const bool along_x = direction == kWest || direction == kEast;
  const bool upwards = direction == kNorth || direction == kEast;
  const std::int64_t steps = upwards ? amount : -amount;
  const auto shift = [steps](auto* bound, auto spacing) {
    *bound = static_cast<decltype(spacing)>(
        static_cast<double>(*bound) + static_cast<double>(steps) * static_cast<double>(spacing));
  };
  if (along_x) {
    *ix += steps;
    shift(&w->xmin, w->dx);
    shift(&w->xmax, w->dx);
  } else {
    *iy += steps;
    shift(&w->ymin, w->dy);
    shift(&w->ymax, w->dy);
  }
}

}  // namespace tidewater::detail
