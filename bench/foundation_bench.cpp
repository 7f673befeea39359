#include <cmath>

#include "harness.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;

const Suite suite([] {
  const auto points = box(-180, -90, 180, 90);
  // On the central meridian the sinusoidal ordinate is the meridian arc.
  auto meridian = points;
  for (auto& p : meridian) p.x = 0;
  auto arcs = meridian;
  for (auto& p : arcs) {
    TWstatus word = 0;
    TWmerid_dist_f(kA, kE, p.y, &p.y, &word);
  }
  add({"meridian arc", "PROJ",
       [meridian] {
         double sum = 0;
         for (const auto& p : meridian) {
           double arc = 0;
           TWstatus word = 0;
           TWmerid_dist_f(kA, kE, p.y, &arc, &word);
           sum += arc;
         }
         keep(sum);
       },
       proj_kernel("+proj=sinu +ellps=GRS80", true, meridian),
       floor_kernel(meridian,
                    [](const auto& p) { return std::sin(2 * p.y) + std::cos(2 * p.y); })});
  add({"latitude at a meridian arc", "PROJ",
       [arcs] {
         double sum = 0;
         for (const auto& p : arcs) {
           double lat = 0;
           TWstatus word = 0;
           TWmerid_dist_i(kA, kE, p.y, &lat, &word);
           sum += lat;
         }
         keep(sum);
       },
       proj_kernel("+proj=sinu +ellps=GRS80", false, arcs),
       floor_kernel(points, [](const auto& p) { return std::sin(2 * p.y) + std::cos(2 * p.y); })});

  auto geocentric = points;
  TWstatus status = 0;
  TWllh_to_xyz(kA, kE, kPoints, points.data(), geocentric.data(), &status);
  add({"geodetic to geocentric", "PROJ",
       [points, out = points]() mutable {
         TWstatus word = 0;
         TWllh_to_xyz(kA, kE, kPoints, points.data(), out.data(), &word);
         keep(out.back().z);
       },
       proj_kernel("+proj=cart +ellps=GRS80", true, points),
       floor_kernel(points, [](const auto& p) {
         return std::sin(p.y) + std::cos(p.y) + std::sin(p.x) + std::cos(p.x);
       })});
  add({"geocentric to geodetic", "PROJ",
       [geocentric, out = geocentric]() mutable {
         TWstatus word = 0;
         TWxyz_to_llh(kA, kE, kPoints, geocentric.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel("+proj=cart +ellps=GRS80", false, geocentric),
       floor_kernel(points, [](const auto& p) { return std::atan2(p.y, p.x) + std::atan(p.y); })});
});

}  // namespace
