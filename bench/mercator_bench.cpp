#include <cmath>

#include "harness.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;

const Suite suite([] {
  const auto points = box(-179, -85, 179, 85);
  auto plane = points;
  TWstatus status = 0;
  TWmerc_f(kE, 0, 0, kPoints, points.data(), plane.data(), &status);
  auto plane_metres = plane;
  for (auto& p : plane_metres) p = {p.x * kA, p.y * kA, p.z};

  add({"Mercator forward", "PROJ",
       [points, out = points]() mutable {
         TWstatus word = 0;
         TWmerc_f(kE, 0, 0, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel("+proj=merc +ellps=GRS80", true, points),
       floor_kernel(points, [](const CoordinateTriple& p) {
         return std::log(std::tan(p.y)) + std::sin(p.y) + std::atanh(0.05 * p.y);
       })});
  add({"Mercator inverse", "PROJ",
       [plane, out = plane]() mutable {
         TWstatus word = 0;
         TWmerc_i(kE, 0, 0, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel("+proj=merc +ellps=GRS80", false, plane_metres),
       floor_kernel(plane, [](const CoordinateTriple& p) {
         return std::exp(p.y) + std::atan(p.y) + std::sin(p.y) + std::atanh(0.02 * p.y);
       })});
});

}  // namespace
