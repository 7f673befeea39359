#include "harness.hpp"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.08199188997902978;  // International 1924
constexpr double kA = 6378388;

const Suite suite([] {
  const auto points = box(166, -48, 179, -34);
  const char* definition = "+proj=nzmg +ellps=intl +x_0=2510000 +y_0=6023150";
  double lon0 = 0;
  double lat0 = 0;
  double false_easting = 0;
  double false_northing = 0;
  double k0 = 0;
  double y0 = 0;
  TWstatus status = 0;
  TWn_zeal_param(&lon0, &lat0, &false_easting, &false_northing, &k0, &status);
  TWn_zeal_c(kE, lat0, &y0, &status);
  auto plane = points;
  TWn_zeal_f(kE, lon0, 0, y0, kPoints, points.data(), plane.data(), &status);
  auto metres = plane;
  for (auto& p : metres) p = {p.x * kA + false_easting, p.y * kA + false_northing, p.z};
  add({"New Zealand map grid forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWn_zeal_f(kE, lon0, 0, y0, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, true, points), Kernel()});
  add({"New Zealand map grid inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWn_zeal_i(kE, lon0, 0, y0, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, false, metres), Kernel()});

  const double pole_lon = 0.3;
  const double pole_lat = 0.7;
  const double offset = 0.2;
  const auto globe = box(-179, -89, 179, 89);
  const char* rotated = "+proj=ob_tran +o_proj=longlat +o_lon_p=0 +o_lat_p=40 +lon_0=18 +R=1";
  add({"Rotated graticule forward", "PROJ",
       [=, out = globe]() mutable {
         TWstatus word = 0;
         TWrotgrat_f(0, 0, pole_lon, pole_lat, offset, kPoints, globe.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(rotated, true, globe), Kernel()});
  add({"Rotated graticule inverse", "PROJ",
       [=, out = globe]() mutable {
         TWstatus word = 0;
         TWrotgrat_i(0, 0, pole_lon, pole_lat, offset, kPoints, globe.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(rotated, false, globe), Kernel()});

  const auto sheet = box(84, 22, 92, 30);
  double c[6];
  const double lon_s = 1.5358897417550099;  // 88 degrees
  const double lat_s = 0.4537856055185257;  // 26 degrees
  TWind_phed_c(kE, lat_s, c, c + 1, c + 2, c + 3, c + 4, c + 5, &status);
  auto flat = sheet;
  TWind_phed_f(lon_s, lat_s, c[0], c[1], c[2], c[3], c[4], c[5], kPoints, sheet.data(), flat.data(),
               &status);
  add({"Indian polyhedric forward", "",
       [=, out = sheet]() mutable {
         TWstatus word = 0;
         TWind_phed_f(lon_s, lat_s, c[0], c[1], c[2], c[3], c[4], c[5], kPoints, sheet.data(),
                      out.data(), &word);
         keep(out.back().y);
       },
       Kernel(), Kernel()});
  add({"Indian polyhedric inverse", "",
       [=, out = flat]() mutable {
         TWstatus word = 0;
         TWind_phed_i(kA, lon_s, lat_s, c[0], c[1], c[2], c[3], c[4], c[5], kPoints, flat.data(),
                      out.data(), &word);
         keep(out.back().y);
       },
       Kernel(), Kernel()});
});

}  // namespace
