#include <cmath>

#include "harness.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kLon0 = 0.17453292519943295;  // 10 degrees
constexpr double kLat0 = 0.9075712110370514;   // 52 degrees

std::vector<CoordinateTriple> in_metres(std::vector<CoordinateTriple> plane) {
  for (auto& p : plane) p = {p.x * kA, p.y * kA, p.z};
  return plane;
}

void add_equidistant() {
  const auto points = box(0, 42, 20, 62);
  const char* definition = "+proj=aeqd +ellps=GRS80 +lat_0=52 +lon_0=10";
  double n1 = 0;
  double g = 0;
  TWaz_eq_c(kE, kLat0, &n1, &g);
  auto plane = points;
  TWstatus status = 0;
  TWaz_eq_f(kE, kLon0, kLat0, n1, g, kPoints, points.data(), plane.data(), &status);
  add({"Azimuthal equidistant forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWaz_eq_f(kE, kLon0, kLat0, n1, g, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, true, points), Kernel()});
  add({"Azimuthal equidistant inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWaz_eq_i(kE, kLon0, kLat0, n1, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, false, in_metres(plane)), Kernel()});
}

void add_equal_area() {
  const auto points = box(-30, 30, 50, 75);
  const char* definition = "+proj=laea +ellps=GRS80 +lat_0=52 +lon_0=10";
  double e2 = 0;
  double q1 = 0;
  double qp = 0;
  double rq = 0;
  double m1 = 0;
  double sin_b1 = 0;
  double cos_b1 = 0;
  double sin_lat0 = 0;
  double cos_lat0 = 0;
  double d = 0;
  TWstatus status = 0;
  TWlam_az_eq_c(kE, kLon0, kLat0, &e2, &q1, &qp, &rq, &m1, &sin_b1, &cos_b1, &sin_lat0, &cos_lat0,
                &d, &status);
  auto plane = points;
  TWlam_az_eq_f(points.data(), kPoints, kE, kLon0, kLat0, e2, q1, qp, rq, m1, sin_b1, cos_b1,
                sin_lat0, cos_lat0, d, plane.data(), &status);
  add({"Azimuthal equal-area forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWlam_az_eq_f(points.data(), kPoints, kE, kLon0, kLat0, e2, q1, qp, rq, m1, sin_b1, cos_b1,
                       sin_lat0, cos_lat0, d, out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, true, points), Kernel()});
  add({"Azimuthal equal-area inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWlam_az_eq_i(plane.data(), kPoints, kE, kLon0, kLat0, e2, qp, rq, sin_b1, cos_b1,
                       sin_lat0, cos_lat0, d, out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, false, in_metres(plane)), Kernel()});
}

const Suite suite([] {
  add_equidistant();
  add_equal_area();
});

}  // namespace
