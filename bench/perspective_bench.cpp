#include <cmath>

#include "harness.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kLon0 = 0.17453292519943295;  // 10 degrees
constexpr double kLat0 = 0.6981317007977318;   // 40 degrees
constexpr double kHeight = 2e6;

std::vector<CoordinateTriple> in_metres(std::vector<CoordinateTriple> plane) {
  for (auto& p : plane) p = {p.x * kA, p.y * kA, p.z};
  return plane;
}

void add_gnomonic(const std::vector<CoordinateTriple>& points) {
  const char* definition = "+proj=gnom +R=6378137 +lat_0=40 +lon_0=10";
  double c = 0;
  double s = 0;
  TWstatus status = 0;
  TWgnomon_c(kLat0, &c, &s, &status);
  auto plane = points;
  TWgnomon_f(kLon0, kLat0, c, s, kPoints, plane.data(), points.data(), &status);
  add({"Gnomonic forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWgnomon_f(kLon0, kLat0, c, s, kPoints, out.data(), points.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, true, points), Kernel()});
  add({"Gnomonic inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWgnomon_i(kLon0, kLat0, c, s, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, false, in_metres(plane)), Kernel()});
}

void add_orthographic(const std::vector<CoordinateTriple>& points) {
  struct Origin {
    double x, y, z, r[9];
  } o = {};
  const char* definition = "+proj=ortho +ellps=GRS80 +lat_0=40 +lon_0=10";
  TWstatus status = 0;
  TWortho_c(kE, kLon0, kLat0, &o.x, &o.y, &o.z, o.r, &status);
  auto plane = points;
  TWortho_f(kA, kE, kLon0, kLat0, o.x, o.y, o.z, o.r, kPoints, points.data(), plane.data(),
            &status);
  add({"Orthographic forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWortho_f(kA, kE, kLon0, kLat0, o.x, o.y, o.z, o.r, kPoints, points.data(), out.data(),
                   &word);
         keep(out.back().y);
       },
       proj_kernel(definition, true, points), Kernel()});
  add({"Orthographic inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWortho_i(kA, kE, kLon0, kLat0, o.x, o.y, o.z, o.r, kPoints, plane.data(), out.data(),
                   &word);
         keep(out.back().y);
       },
       proj_kernel(definition, false, in_metres(plane)), Kernel()});
}

// The peer knows the sphere only; so its rows are beside our sphere, and the ellipsoid alone.
void add_vertical(const std::string& name, double e, const char* definition,
                  const std::vector<CoordinateTriple>& points) {
  double p = 0;
  double phi_g = 0;
  TWstatus status = 0;
  TWpersp_c(kA, e, kLat0, kHeight, 0, &p, &phi_g, &status);
  auto plane = points;
  TWpersp_vert_f(kA, e, kLon0, kLat0, 0, kHeight, p, phi_g, kPoints, points.data(), plane.data(),
                 &status);
  add({name + " forward", definition ? "PROJ" : "",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWpersp_vert_f(kA, e, kLon0, kLat0, 0, kHeight, p, phi_g, kPoints, points.data(),
                        out.data(), &word);
         keep(out.back().y);
       },
       definition ? proj_kernel(definition, true, points) : Kernel(), Kernel()});
  add({name + " inverse", definition ? "PROJ" : "",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWpersp_vert_i(kA, e, kLon0, kLat0, 0, kHeight, p, phi_g, kPoints, plane.data(),
                        out.data(), &word);
         keep(out.back().y);
       },
       definition ? proj_kernel(definition, false, in_metres(plane)) : Kernel(), Kernel()});
}

const Suite suite([] {
  auto points = box(-10, 25, 30, 55);
  add_gnomonic(points);
  add_orthographic(points);
  add_vertical("Vertical perspective, ellipsoid with heights", kE, nullptr, points);
  for (auto& p : points) p.z = 0;
  add_vertical("Vertical perspective, sphere", 0,
               "+proj=nsper +R=6378137 +h=2000000 +lat_0=40 +lon_0=10", points);
});

}  // namespace
