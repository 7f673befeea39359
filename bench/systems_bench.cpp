// From system to system beside proj_create_crs_to_crs: points, and what it takes to set up.
#include <cmath>
#include <cstdlib>

#include "harness.hpp"
#include "tidewater/transformation.hpp"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>
#endif

namespace tidewater::bench {

namespace {

#ifdef TIDEWATER_HAVE_PROJ

struct Free {
  void operator()(PJ* p) const { proj_destroy(p); }
};
using Peer = std::shared_ptr<PJ>;

Peer peer(const std::string& source, const std::string& target) {
  PJ* made = proj_create_crs_to_crs(PJ_DEFAULT_CTX, source.c_str(), target.c_str(), nullptr);
  if (made == nullptr) return nullptr;
  PJ* visual = proj_normalize_for_visualization(PJ_DEFAULT_CTX, made);
  proj_destroy(made);
  return Peer(visual, Free());
}

// The operation that PROJ takes for a point, by itself: without a choice for each point.
Peer one_operation(const Peer& of, const CoordinateTriple& at) {
  proj_trans(of.get(), PJ_FWD, proj_coord(at.x, at.y, at.z, HUGE_VAL));
  return Peer(proj_trans_get_last_used_operation(of.get()), Free());
}

std::shared_ptr<Side> peer_side(const Peer& map, const std::vector<CoordinateTriple>& in) {
  if (map == nullptr) return nullptr;
  auto out = std::make_shared<std::vector<CoordinateTriple>>(in.size());
  return side(
      [map, in, out] {
        *out = in;
        constexpr std::size_t kStride = sizeof(CoordinateTriple);
        const std::size_t n = in.size();
        proj_trans_generic(map.get(), PJ_FWD, &out->data()->x, kStride, n, &out->data()->y, kStride,
                           n, &out->data()->z, kStride, n, nullptr, 0, 0);
      },
      [out](std::size_t i) { return (*out)[i]; });
}

#endif

void add_pair(const std::string& source, const std::string& target,
              const std::vector<CoordinateTriple>& in) {
  const Transformation map{System(source), System(target)};
  Row row;
  row.operation = source + " to " + target;
  row.ours = ours(in, [map](int32_t count, const CoordinateTriple* from, CoordinateTriple* to) {
    map.forward(static_cast<std::size_t>(count),
                Coordinates<const double>{&from->x, &from->y, &from->z, 3},
                Coordinates<double>{&to->x, &to->y, &to->z, 3});
  });
  Row setup;
  setup.operation = source + " to " + target + ", one set-up";
  setup.levels = false;
  // Once for a run: a peer's set-up for every point would take minutes.  The ratio is what tells.
  setup.ours = side([source, target] {
    const Transformation made{System(source), System(target)};
    if (made.accuracy() < 0) std::abort();
  });
#ifdef TIDEWATER_HAVE_PROJ
  if (const Peer whole = peer(source, target)) {
    row.peer_names = {"PROJ", "PROJ, one operation"};
    row.peers = {peer_side(whole, in), peer_side(one_operation(whole, in[0]), in)};
    row.apart = plane_apart;
    setup.peer_names = {"PROJ"};
    setup.peers = {side([source, target] { peer(source, target); })};
  }
#endif
  add(std::move(row));
  add(std::move(setup));
}

void add_rows() {
  const auto degrees = box(-4, 43, 7, 50);
  std::vector<CoordinateTriple> france = degrees;
  constexpr double kDegreesPerRadian = 57.29577951308232;
  for (auto& point : france) {
    point.x *= kDegreesPerRadian;
    point.y *= kDegreesPerRadian;
  }
  add_pair("EPSG:4326", "EPSG:2154", france);
  add_pair("EPSG:4326", "EPSG:32631", france);
  add_pair("EPSG:4326", "EPSG:3857", france);
  // The same points in the old system's metres.
  const Transformation old{System("EPSG:4326"), System("EPSG:27572")};
  std::vector<CoordinateTriple> grid = france;
  old.forward(grid.size(), Coordinates<const double>{&grid[0].x, &grid[0].y, nullptr, 3},
              Coordinates<double>{&grid[0].x, &grid[0].y, nullptr, 3});
  std::erase_if(grid, [](const CoordinateTriple& point) { return !(point.x == point.x); });
  add_pair("EPSG:27572", "EPSG:2154", grid);
}

const Suite suite(add_rows);

}  // namespace

}  // namespace tidewater::bench
