// Shift grids and geoid on a track, whose points follow one another, and scattered at random, in
// calls of 10,000.  A scattered point nearly always makes a new window be loaded.
#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>

#include "harness.hpp"
#include "support/grids.hpp"
#include "tidewater/datum.h"
#include "tidewater/grids.hpp"

using namespace tidewater::bench;
namespace fs = std::filesystem;

namespace {

constexpr double kDegree = 3.14159265358979323846 / 180;

// A line of some 200 km, a point every 50 m.
std::vector<CoordinateTriple> track(double west, double south, double east, double north) {
  std::vector<CoordinateTriple> points(static_cast<std::size_t>(tidewater::bench::points()));
  for (int32_t i = 0; i < tidewater::bench::points(); ++i) {
    const double t = static_cast<double>(i) / tidewater::bench::points();
    points[static_cast<std::size_t>(i)] = {(west + t * (east - west)) * kDegree,
                                           (south + t * (north - south)) * kDegree, 100};
  }
  return points;
}

// The folder of real grids: $TIDEWATER_DATA, or shared/data beside the project.
fs::path data() {
  const char* named = std::getenv("TIDEWATER_DATA");
  return named ? named : TIDEWATER_SHARED_DATA;
}

// The peer reads no .las and .los files: it is given the same nodes as an NTv2 file, whose
// longitudes run the other way.
std::string as_national(const NadconGrid& g, const fs::path& las, const fs::path& los) {
  const std::string lat = tidewater::test::file_bytes(las), lon = tidewater::test::file_bytes(los);
  const auto value = [&g](const std::string& bytes, int row, int col) {
    const auto index = (row + 1) * (g.nc + 1) + 1 + (g.nc - 1 - col);
    return tidewater::test::f32_at(bytes, 4 * static_cast<std::size_t>(index));
  };
  constexpr double kSeconds = 3600;
  const tidewater::test::SubGrid grid{.name = "NADCON",
                                      .parent = "NONE",
                                      .s_lat = g.ymin * kSeconds,
                                      .n_lat = g.ymax * kSeconds,
                                      .e_long = -g.xmax * kSeconds,
                                      .w_long = -g.xmin * kSeconds,
                                      .inc = g.dy * kSeconds,
                                      .lat = [&](int row, int col) { return value(lat, row, col); },
                                      .lon = [&](int row, int col) { return value(lon, row, col); },
                                      .long_inc = g.dx * kSeconds};
  const fs::path path = fs::temp_directory_path() / "tidewater-bench-nadcon.gsb";
  std::ofstream(path, std::ios::binary) << tidewater::test::GsbFile{{grid}}.bytes();
  return path.string();
}

void add_nadcon() {
  const auto control = std::make_shared<NadconControl>();
  TWstatus word = 0;
  TWnadcon_c((data() / "nadcon/").string().c_str(), control.get(), &word);
  if (!TW_OK(word)) return;
  const fs::path folder = data() / "nadcon";
  const auto* const conus =
      std::ranges::find(control->grids, std::string("conus"), &NadconGrid::name);
  const std::string peer_grid = as_national(*conus, folder / "conus.las", folder / "conus.los");
  for (const auto& [name, points] :
       {std::pair{"track", track(-100, 38, -98, 39)}, {"scattered", box(-120, 30, -75, 45)}}) {
    add({std::string("NADCON forward, ") + name,
         ours(points, TW_CALL(TWnadcon_f(n, in, control.get(), out, &status))),
         {"PROJ, as NTv2"},
         {proj("+proj=hgridshift +grids=" + peer_grid, true, points)},
         ground_apart});
  }
}

// A grid that lies west of Greenwich, where ours and the peer's longitudes agree.
void add_national() {
  const fs::path folder = fs::temp_directory_path() / "tidewater-bench-ntf";
  const fs::path grid = "/usr/share/proj/ntf_r93.gsb";
  if (!fs::exists(grid)) return;
  fs::create_directories(folder);
  fs::copy_file(grid, folder / "ntf_r93.gsb", fs::copy_options::overwrite_existing);
  std::ofstream(folder / "area.par") << "ntf_r93\n";
  TWstatus word = 0;
  TWcnt_c((folder.string() + "/").c_str(), 0, &word);
  if (!TW_OK(word)) return;
  for (const auto& [name, points] :
       {std::pair{"track", track(-2, 46, -0.5, 47.5)}, {"scattered", box(-4.5, 43, -0.1, 50)}}) {
    const char* definition = "+proj=hgridshift +grids=ntf_r93.gsb";
    add({std::string("NTv2 forward, ") + name,
         ours(points, TW_CALL(TWcnt_f(n, in, 0, out, &status))),
         {"PROJ"},
         {proj(definition, true, points)},
         ground_apart});
    add({std::string("NTv2 inverse, ") + name,
         ours(points, TW_CALL(TWcnt_i(n, in, 0, out, &status))),
         {"PROJ"},
         {proj(definition, false, points)},
         ground_apart});
  }
}

void add_geoid() {
  const auto control = std::make_shared<GeoidControl>();
  TWstatus word = 0;
  TWgeo90_c((data() / "geoid/").string().c_str(), control.get(), &word);
  if (!TW_OK(word)) return;
  for (const auto& [name, points] :
       {std::pair{"track", track(-100, 38, -98, 39)}, {"scattered", box(-125, 25, -75, 50)}}) {
    // Another model and another interpolation: not compared.
    add({std::string("Geoid height, ") + name,
         ours(points, TW_CALL(TWgeo90_f(n, in, control.get(), out, &status))),
         {"PROJ, bilinear"},
         {proj("+proj=vgridshift +grids=egm96_15.gtx +multiplier=1", true, points)},
         {}});
  }
}

// The systems layer's objects, which take degrees, on the same points.
template <class Grid, class Work>
void add_object(const std::string& name, const Grid& grid, const std::string& peer_name,
                const std::shared_ptr<Side>& peer, const std::vector<CoordinateTriple>& in,
                Work work) {
  std::vector<CoordinateTriple> points = in;
  for (CoordinateTriple& p : points) p = {p.x / kDegree, p.y / kDegree, p.z};
  const auto out = std::make_shared<std::vector<CoordinateTriple>>(points);
  const auto run = [grid, points, out, work] {
    const auto* from = points.data();
    auto* to = out->data();
    work(grid, points.size(), tidewater::Coordinates<const double>{&from->x, &from->y, &from->z, 3},
         tidewater::Coordinates<double>{&to->x, &to->y, &to->z, 3});
  };
  const auto result = [out](std::size_t i) {
    const CoordinateTriple& p = (*out)[i];
    return CoordinateTriple{p.x * kDegree, p.y * kDegree, p.z};
  };
  add({name, side(run, result), {peer_name}, {peer}, ground_apart});
}

void add_objects() {
  const fs::path folder = "/usr/share/proj";
  const auto forward = [](const auto& grid, std::size_t n, auto in, auto out) {
    grid.forward(n, in, out);
  };
  const auto inverse = [](const auto& grid, std::size_t n, auto in, auto out) {
    grid.inverse(n, in, out);
  };
  if (fs::exists(folder / "ntf_r93.gsb")) {
    const tidewater::ShiftGrid grid("ntf_r93.gsb", {folder.string()});
    const auto points = box(-4.5, 43, 8, 50);
    const char* definition = "+proj=hgridshift +grids=ntf_r93.gsb";
    add_object("ShiftGrid NTv2 forward, scattered", grid, "PROJ", proj(definition, true, points),
               points, forward);
    add_object("ShiftGrid NTv2 inverse, scattered", grid, "PROJ", proj(definition, false, points),
               points, inverse);
  }
  if (fs::exists(folder / "egm96_15.gtx")) {
    const auto points = box(-180, -90, 180, 90);
    using Geoid = tidewater::GeoidGrid;
    const char* definition = "+proj=vgridshift +grids=egm96_15.gtx +multiplier=1";
    add_object("GeoidGrid bilinear, scattered", Geoid("egm96_15.gtx", {folder.string()}), "PROJ",
               proj(definition, true, points), points, forward);
    add_object("GeoidGrid biquadratic, scattered",
               Geoid("egm96_15.gtx", {folder.string()}, Geoid::Interpolation::biquadratic),
               "PROJ, bilinear", proj(definition, true, points), points, forward);
  }
}

const Suite suite([] {
  add_nadcon();
  add_national();
  add_geoid();
  add_objects();
});

}  // namespace
