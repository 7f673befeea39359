#include <cmath>

#include "harness.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kDegree = 0.017453292519943295;

std::vector<CoordinateTriple> metres(std::vector<CoordinateTriple> plane) {
  for (auto& p : plane) p = {p.x * kA, p.y * kA, p.z};
  return plane;
}

double pair_of_pairs(const CoordinateTriple& p) {
  return std::sin(p.y) + std::cos(p.y) + std::sin(p.x) + std::cos(p.x);
}

double polar_angle(const CoordinateTriple& p) {
  return std::atan2(p.x, p.y) + std::sqrt(p.x * p.x + p.y * p.y);
}

const Suite lambert([] {
  const auto points = box(-60, 0, 60, 85);
  double C = 0, n = 0, rho0 = 0;
  TWstatus status = 0;
  TWlam_c(kE, 0, 40 * kDegree, 43 * kDegree, 62 * kDegree, &C, &n, &rho0, &status);
  auto plane = points;
  TWlam_f(kE, 0, C, n, rho0, kPoints, points.data(), plane.data(), &status);
  const char* peer = "+proj=lcc +lat_0=40 +lat_1=43 +lat_2=62 +ellps=GRS80";
  add({"Lambert conformal forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWlam_f(kE, 0, C, n, rho0, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points), floor_kernel(points, [](const CoordinateTriple& p) {
         return pair_of_pairs(p) + std::tan(p.y) + std::pow(p.y, 0.7);
       })});
  add({"Lambert conformal inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWlam_i(kE, 0, C, n, rho0, kPoints, out.data(), plane.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, metres(plane)), floor_kernel(plane, [](const CoordinateTriple& p) {
         return polar_angle(p) + std::pow(std::fabs(p.y), 0.7) + std::atan(p.y);
       })});
});

const Suite albers([] {
  const auto points = box(-60, 0, 60, 80);
  double C = 0, n = 0, rho0 = 0;
  TWstatus status = 0;
  TWalbers_c(kE, 0, 40 * kDegree, 43 * kDegree, 62 * kDegree, &n, &C, &rho0);
  auto plane = points;
  TWalbers_f(kE, 0, n, C, rho0, kPoints, points.data(), plane.data(), &status);
  const char* peer = "+proj=aea +lat_0=40 +lat_1=43 +lat_2=62 +ellps=GRS80";
  add({"Albers forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWalbers_f(kE, 0, n, C, rho0, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points), floor_kernel(points, [](const CoordinateTriple& p) {
         return std::sin(p.y) + std::sin(p.x) + std::cos(p.x) + std::atanh(0.08 * p.y);
       })});
  add({"Albers inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWalbers_i(kE, 0, n, C, rho0, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, metres(plane)), floor_kernel(plane, [](const CoordinateTriple& p) {
         return polar_angle(p) + std::asin(0.5 * p.y) + std::sin(p.y) + std::cos(p.y) +
                std::atanh(0.08 * p.y);
       })});
});

const Suite equidistant([] {
  const auto points = box(-60, 0, 60, 85);
  double n = 0, G = 0, rho0 = 0, C0 = 0, C2 = 0, C4 = 0, C6 = 0, C8 = 0;
  double D2 = 0, D4 = 0, D6 = 0, D8 = 0;
  TWstatus status = 0;
  TWconic_c(kE, 40 * kDegree, 43 * kDegree, 62 * kDegree, &n, &G, &rho0, &C0, &C2, &C4, &C6, &C8,
            &D2, &D4, &D6, &D8, &status);
  auto plane = points;
  TWconic_f(0, n, G, rho0, C0, C2, C4, C6, C8, kPoints, points.data(), plane.data(), &status);
  const char* peer = "+proj=eqdc +lat_0=40 +lat_1=43 +lat_2=62 +ellps=GRS80";
  add({"equidistant conic forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWconic_f(0, n, G, rho0, C0, C2, C4, C6, C8, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points), floor_kernel(points, pair_of_pairs)});
  add({"equidistant conic inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWconic_i(0, n, G, rho0, C0, D2, D4, D6, D8, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, metres(plane)), floor_kernel(plane, [](const CoordinateTriple& p) {
         return polar_angle(p) + std::sin(p.y) + std::cos(p.y);
       })});
});

}  // namespace
