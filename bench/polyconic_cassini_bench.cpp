#include <cmath>

#include "harness.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;

std::vector<CoordinateTriple> metres(std::vector<CoordinateTriple> plane) {
  for (auto& p : plane) p = {p.x * kA, p.y * kA, p.z};
  return plane;
}

double pair_of(double angle) { return std::sin(angle) + std::cos(angle); }

const Suite polyconic([] {
  const auto points = box(-30, -70, 30, 70);
  auto plane = points;
  TWstatus status = 0;
  TWpolycon_f(kE, 0, 0, kPoints, points.data(), plane.data(), &status);
  const char* peer = "+proj=poly +ellps=GRS80";
  add({"polyconic forward", "PROJ",
       [points, out = points]() mutable {
         TWstatus word = 0;
         TWpolycon_f(kE, 0, 0, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points), floor_kernel(points, [](const CoordinateTriple& p) {
         return pair_of(p.y) + pair_of(p.x) + std::sqrt(1 + p.y * p.y);
       })});
  // the least number of Newton steps is three
  add({"polyconic inverse", "PROJ",
       [plane, out = plane]() mutable {
         TWstatus word = 0;
         TWpolycon_i(kE, 0, 0, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, metres(plane)), floor_kernel(plane, [](const CoordinateTriple& p) {
         return pair_of(p.y) + pair_of(0.9 * p.y) + pair_of(0.8 * p.y) + std::asin(0.3 * p.x);
       })});
});

const Suite cassini([] {
  const auto points = box(-3, -80, 3, 80);
  double c0 = 0, c2 = 0, c4 = 0, c6 = 0, c8 = 0, m0 = 0, d2 = 0, d4 = 0, d6 = 0, d8 = 0;
  TWcassini_c(kE, 0, 0, &c0, &c2, &c4, &c6, &c8, &m0, &d2, &d4, &d6, &d8);
  auto plane = points;
  TWstatus status = 0;
  TWcassini_f(kE, 0, c0, c2, c4, c6, c8, m0, kPoints, points.data(), plane.data(), &status);
  const char* peer = "+proj=cass +ellps=GRS80";
  add({"Cassini forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWcassini_f(kE, 0, c0, c2, c4, c6, c8, m0, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points), floor_kernel(points, [](const CoordinateTriple& p) {
         return pair_of(p.y) + std::sqrt(1 + p.y * p.y);
       })});
  add({"Cassini inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWcassini_i(kE, 0, c0, m0, d2, d4, d6, d8, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, metres(plane)), floor_kernel(plane, [](const CoordinateTriple& p) {
         return pair_of(2 * p.y) + pair_of(p.y) + std::sqrt(1 + p.y * p.y);
       })});
});

}  // namespace
