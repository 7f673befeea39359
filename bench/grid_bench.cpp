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

constexpr int32_t kCall = 10000;
constexpr double kDegree = 3.14159265358979323846 / 180;

// A line of some 200 km, a point every 50 m.
std::vector<CoordinateTriple> track(double west, double south, double east, double north) {
  std::vector<CoordinateTriple> points(kCall);
  for (int32_t i = 0; i < kCall; ++i) {
    const double t = static_cast<double>(i) / kCall;
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
  TWstatus status = 0;
  TWnadcon_c((data() / "nadcon/").string().c_str(), control.get(), &status);
  if (!TW_OK(status)) return;
  const fs::path folder = data() / "nadcon";
  const auto* const conus =
      std::ranges::find(control->grids, std::string("conus"), &NadconGrid::name);
  const std::string peer_grid = as_national(*conus, folder / "conus.las", folder / "conus.los");
  for (const auto& [name, points] : {std::pair{"track", track(-100, 38, -98, 39)},
                                     {"scattered", box(-120, 30, -75, 45, kCall)}}) {
    const auto forward = [control, points = points, out = points]() mutable {
      TWstatus word = 0;
      TWnadcon_f(kCall, points.data(), control.get(), out.data(), &word);
      keep(out.back().y);
    };
    add({std::string("NADCON forward, ") + name,
         "PROJ (NTv2)",
         forward,
         proj_kernel("+proj=hgridshift +grids=" + peer_grid, true, points),
         {},
         kCall});
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
  TWstatus status = 0;
  TWcnt_c((folder.string() + "/").c_str(), 0, &status);
  if (!TW_OK(status)) return;
  for (const auto& [name, points] : {std::pair{"track", track(-2, 46, -0.5, 47.5)},
                                     {"scattered", box(-4.5, 43, -0.1, 50, kCall)}}) {
    const char* definition = "+proj=hgridshift +grids=ntf_r93.gsb";
    const auto forward = [points = points, out = points]() mutable {
      TWstatus word = 0;
      TWcnt_f(kCall, points.data(), 0, out.data(), &word);
      keep(out.back().y);
    };
    const auto inverse = [points = points, out = points]() mutable {
      TWstatus word = 0;
      TWcnt_i(kCall, points.data(), 0, out.data(), &word);
      keep(out.back().y);
    };
    add({std::string("NTv2 forward, ") + name,
         "PROJ",
         forward,
         proj_kernel(definition, true, points),
         {},
         kCall});
    add({std::string("NTv2 inverse, ") + name,
         "PROJ",
         inverse,
         proj_kernel(definition, false, points),
         {},
         kCall});
  }
}

void add_geoid() {
  const auto control = std::make_shared<GeoidControl>();
  TWstatus status = 0;
  TWgeo90_c((data() / "geoid/").string().c_str(), control.get(), &status);
  if (!TW_OK(status)) return;
  for (const auto& [name, points] : {std::pair{"track", track(-100, 38, -98, 39)},
                                     {"scattered", box(-125, 25, -75, 50, kCall)}}) {
    const auto forward = [control, points = points, out = points]() mutable {
      TWstatus word = 0;
      TWgeo90_f(kCall, points.data(), control.get(), out.data(), &word);
      keep(out.back().z);
    };
    add({std::string("Geoid height, ") + name,
         "PROJ (bilinear)",
         forward,
         proj_kernel("+proj=vgridshift +grids=egm96_15.gtx +multiplier=1", true, points),
         {},
         kCall});
  }
}

// The systems layer's objects, which take degrees, on the same points.
template <class Grid, class Call>
Kernel object_kernel(std::shared_ptr<Grid> grid, std::vector<CoordinateTriple> points, Call call) {
  for (CoordinateTriple& p : points) p = {p.x / kDegree, p.y / kDegree, p.z};
  return [grid, points, out = points, call]() mutable {
    call(*grid, tidewater::Coordinates<const double>{&points[0].x, &points[0].y, &points[0].z, 3},
         tidewater::Coordinates<double>{&out[0].x, &out[0].y, &out[0].z, 3});
    keep(out.back().x);
  };
}

void add_objects() {
  const fs::path proj = "/usr/share/proj";
  if (fs::exists(proj / "ntf_r93.gsb")) {
    const auto grid = std::make_shared<tidewater::ShiftGrid>((proj / "ntf_r93.gsb").string());
    const auto points = box(-4.5, 43, 8, 50, kCall);
    const char* definition = "+proj=hgridshift +grids=ntf_r93.gsb";
    const auto forward = [](const auto& g, auto in, auto out) { g.forward(kCall, in, out); };
    const auto inverse = [](const auto& g, auto in, auto out) { g.inverse(kCall, in, out); };
    add({"ShiftGrid NTv2 forward, scattered",
         "PROJ",
         object_kernel(grid, points, forward),
         proj_kernel(definition, true, points),
         {},
         kCall});
    add({"ShiftGrid NTv2 inverse, scattered",
         "PROJ",
         object_kernel(grid, points, inverse),
         proj_kernel(definition, false, points),
         {},
         kCall});
  }
  if (fs::exists(proj / "egm96_15.gtx")) {
    const auto points = box(-180, -90, 180, 90, kCall);
    const auto forward = [](const auto& g, auto in, auto out) { g.forward(kCall, in, out); };
    for (const bool quadratic : {false, true}) {
      const auto grid = std::make_shared<tidewater::GeoidGrid>(
          (proj / "egm96_15.gtx").string(), std::vector<std::string>{},
          quadratic ? tidewater::GeoidGrid::Interpolation::biquadratic
                    : tidewater::GeoidGrid::Interpolation::bilinear);
      add({quadratic ? "GeoidGrid biquadratic, scattered" : "GeoidGrid bilinear, scattered",
           "PROJ (bilinear)",
           object_kernel(grid, points, forward),
           proj_kernel("+proj=vgridshift +grids=egm96_15.gtx +multiplier=1", true, points),
           {},
           kCall});
    }
  }
}

const Suite suite([] {
  add_nadcon();
  add_national();
  add_geoid();
  add_objects();
});

}  // namespace
