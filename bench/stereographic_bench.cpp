#include <cmath>

#include "harness.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kDegree = 0.017453292519943295;

// Rows of one origin beside the peer's definition of it.
void add_aspect(const std::string& name, const std::string& definition, double lon0, double lat0,
                const std::vector<CoordinateTriple>& points) {
  double C = 0;
  double m0 = 0;
  double chi0 = 0;
  TWstatus status = 0;
  TWstereo_c(kE, lat0, &C, &m0, &chi0, &status);
  auto plane = points;
  TWstereo_f(kE, lon0, lat0, C, m0, chi0, kPoints, points.data(), plane.data(), &status);
  auto metres = plane;
  for (auto& p : metres) p = {p.x * kA, p.y * kA, p.z};
  add({name + " forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWstereo_f(kE, lon0, lat0, C, m0, chi0, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, true, points), floor_kernel(points, [](const CoordinateTriple& p) {
         return std::sin(p.x) + std::cos(p.x) + std::sin(p.y) + std::cos(p.y);
       })});
  add({name + " inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWstereo_i(kE, lon0, lat0, C, m0, chi0, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, false, metres), floor_kernel(plane, [](const CoordinateTriple& p) {
         return std::atan(p.y) + std::atan2(p.x, p.y);
       })});
}

const Suite suite([] {
  add_aspect("Polar stereographic", "+proj=stere +ellps=GRS80 +lat_0=90 +k_0=1", 0, kDegree * 90,
             box(-179, 60, 179, 89));
  add_aspect("Oblique stereographic", "+proj=stere +ellps=GRS80 +lat_0=46 +lon_0=25 +k_0=1",
             25 * kDegree, 46 * kDegree, box(15, 36, 35, 56));

  const auto points = box(15, 36, 35, 56);
  const double lon0 = 25 * kDegree;
  double chi_g = 0;
  double c = 0;
  double t = 0;
  double C = 0;
  double m0 = 0;
  double chi0 = 0;
  TWstatus status = 0;
  TWstereo3_c(kE, 46 * kDegree, &chi_g, &c, &t, &C, &m0, &chi0, &status);
  auto plane = points;
  TWstereo3_f(kE, lon0, chi_g, c, t, C, m0, chi0, kPoints, points.data(), plane.data(), &status);
  // The peer scales by the Gaussian radius of the sphere; nearly a is near enough for timing.
  auto metres = plane;
  for (auto& p : metres) p = {p.x * kA, p.y * kA, p.z};
  const char* definition = "+proj=sterea +ellps=GRS80 +lat_0=46 +lon_0=25 +k_0=1";
  add({"Double stereographic forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWstereo3_f(kE, lon0, chi_g, c, t, C, m0, chi0, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, true, points), Kernel()});
  add({"Double stereographic inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWstereo3_i(kE, lon0, chi_g, c, t, C, m0, chi0, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(definition, false, metres), Kernel()});
});

}  // namespace
