#include <cmath>

#include "harness.hpp"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kDegree = 0.017453292519943295;

const Suite suite([] {
  const auto points = box(-135, 20, -105, 60);
  double lat0 = 40 * kDegree, alpha = 35 * kDegree;
  double B = 0, A = 0, E = 0, lon0 = 0, gamma0 = 0;
  TWstatus status = 0;
  TWo_merc_c(0, kE, -120 * kDegree, 0, 0, 0, &lat0, &alpha, &B, &A, &E, &lon0, &gamma0, &status);
  auto plane = points;
  TWo_merc_f(kE, alpha, gamma0, lon0, E, B, A, kPoints, points.data(), plane.data(), &status);
  auto metres = plane;
  for (auto& p : metres) p = {p.x * kA, p.y * kA, p.z};
  const char* const peer = "+proj=omerc +lat_0=40 +lonc=-120 +alpha=35 +no_uoff +ellps=GRS80";

  const auto forward_floor = floor_kernel(points, [](const CoordinateTriple& p) {
    return std::tan(p.y) + std::sin(p.y) + std::pow(p.y, 1.001) + std::sin(p.x) + std::cos(p.x) +
           std::log(2 + p.y) + std::atan2(p.y, p.x);
  });
  const auto inverse_floor = floor_kernel(plane, [](const CoordinateTriple& p) {
    return std::exp(p.x) + std::sin(p.y) + std::cos(p.y) + std::pow(2 + p.y, 0.999) +
           std::atan(p.y) + std::atan2(p.y, p.x);
  });
  add({"Oblique Mercator forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWo_merc_f(kE, alpha, gamma0, lon0, E, B, A, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points), forward_floor});
  add({"Oblique Mercator inverse", "PROJ",
       [=, out = plane]() mutable {
         TWstatus word = 0;
         TWo_merc_i(kE, alpha, gamma0, lon0, E, B, A, kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, metres), inverse_floor});

  const double skew = std::asin(-0.6);
  double C = 0;
  double As = 0, Bs = 0, lon0s = 0;
  TWrso_c(kE, 102.25 * kDegree, 4 * kDegree, skew, &As, &Bs, &C, &lon0s, &status);
  const auto malaya = box(90, -10, 115, 20);
  auto skew_plane = malaya;
  TWrso_f(lon0s, skew, As, Bs, C, kE, kPoints, malaya.data(), skew_plane.data(), &status);
  auto skew_metres = skew_plane;
  for (auto& p : skew_metres) p = {p.x * kA, p.y * kA, p.z};
  const char* const skew_peer =
      "+proj=omerc +lat_0=4 +lonc=102.25 +gamma=-36.869897645844021 +no_uoff +ellps=GRS80";
  add({"Skew orthomorphic forward", "PROJ",
       [=, out = malaya]() mutable {
         TWstatus word = 0;
         TWrso_f(lon0s, skew, As, Bs, C, kE, kPoints, malaya.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(skew_peer, true, malaya), forward_floor});
  add({"Skew orthomorphic inverse", "PROJ",
       [=, out = skew_plane]() mutable {
         TWstatus word = 0;
         TWrso_i(lon0s, skew, As, Bs, C, kE, kPoints, skew_plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(skew_peer, false, skew_metres), inverse_floor});
});

}  // namespace
