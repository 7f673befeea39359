#include <array>
#include <cmath>

#include "harness.hpp"
#include "tidewater/datum.h"
#include "tidewater/foundation.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.08181333401693114;  // +rf=298.25
constexpr double kA = 6378160;

// Position vector rotations of 0.4, -1.3 and 2.2 seconds.
constexpr double kSecond = 3.14159265358979323846 / 180 / 3600;
constexpr std::array<double, 9> kRotation = {1, -2.2 * kSecond, -1.3 * kSecond, 2.2 * kSecond,
                                             1, -0.4 * kSecond, 1.3 * kSecond,  0.4 * kSecond,
                                             1};

const Suite suite([] {
  const auto points = box(-179, -85, 179, 85);
  auto geocentric = points;
  TWstatus status = 0;
  TWllh_to_xyz(kA, kE, kPoints, points.data(), geocentric.data(), &status);

  const std::string helmert =
      "+proj=helmert +convention=position_vector +x=-87.2 +y=98.1 +z=121.5 +rx=0.4 +ry=-1.3 "
      "+rz=2.2 +s=1.7";
  add({"Helmert forward",
       "PROJ",
       [geocentric, out = geocentric]() mutable {
         TWstatus word = 0;
         TWbw_f(kPoints, geocentric.data(), 1.7e-6, kRotation.data(), -87.2, 98.1, 121.5,
                out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(helmert, true, geocentric),
       {}});
  add({"Helmert inverse",
       "PROJ",
       [geocentric, out = geocentric]() mutable {
         TWstatus word = 0;
         TWbw_i(kPoints, geocentric.data(), 1.7e-6, kRotation.data(), -87.2, 98.1, 121.5,
                out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(helmert, false, geocentric),
       {}});

  const std::string molodensky =
      "+proj=molodensky +a=6378160 +rf=298.25 +da=-23 +df=-8.120449e-8 +dx=-134 +dy=-48 +dz=149";
  const auto angles = floor_kernel(points, [](const CoordinateTriple& p) {
    return std::sin(p.x) + std::cos(p.x) + std::sin(p.y) + std::cos(p.y);
  });
  add({"Molodensky forward", "PROJ",
       [points, out = points]() mutable {
         TWstatus word = 0;
         TWmol_std_f(kA, kE, -23, -8.120449e-8, -134, -48, 149, kPoints, points.data(), out.data(),
                     &word);
         keep(out.back().y);
       },
       proj_kernel(molodensky, true, points), angles});
  add({"Molodensky inverse", "PROJ",
       [points, out = points]() mutable {
         TWstatus word = 0;
         TWmol_std_i(kA, kE, -23, -8.120449e-8, -134, -48, 149, kPoints, points.data(), out.data(),
                     &word);
         keep(out.back().y);
       },
       proj_kernel(molodensky, false, points), angles});
});

}  // namespace
