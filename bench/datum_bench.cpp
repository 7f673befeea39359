#include <array>
#include <cmath>
#include <string>

#include "harness.hpp"
#include "tidewater/datum.h"
#include "tidewater/foundation.h"

using namespace tidewater::bench;

namespace {

constexpr double kA = 6378160;
const double kE = std::sqrt((2 - 1 / 298.25) / 298.25);

// Position vector rotations of 0.4, -1.3 and 2.2 seconds.
constexpr double kSecond = 3.14159265358979323846 / 180 / 3600;
constexpr std::array<double, 9> kRotation = {1, -2.2 * kSecond, -1.3 * kSecond, 2.2 * kSecond,
                                             1, -0.4 * kSecond, 1.3 * kSecond,  0.4 * kSecond,
                                             1};

std::vector<CoordinateTriple> geocentric_of(const std::vector<CoordinateTriple>& points) {
  auto frame = points;
  TWstatus word = 0;
  TWllh_to_xyz(kA, kE, static_cast<int32_t>(points.size()), points.data(), frame.data(), &word);
  return frame;
}

// Metres of angles and of height.
double geodetic_apart(const CoordinateTriple& ours, const CoordinateTriple& peers) {
  return std::hypot(ground_apart(ours, peers), ours.z - peers.z);
}

void meridian_arc() {
  // On the central meridian the sinusoidal ordinate is the meridian arc.
  auto meridian = box(0, -90, 0, 90);
  for (auto& p : meridian) p.x = 0;
  auto arcs = meridian;
  for (auto& p : arcs) {
    TWstatus word = 0;
    TWmerid_dist_f(kA, kE, p.y, &p.y, &word);
  }
  const auto each = [](auto one) {
    return [one](int32_t n, const CoordinateTriple* in, CoordinateTriple* out) {
      for (int32_t i = 0; i < n; ++i) {
        TWstatus word = 0;
        out[i].x = 0;
        one(in[i].y, &out[i].y, &word);
      }
    };
  };
  const char* peer = "+proj=sinu +a=6378160 +rf=298.25";
  add({"Meridian arc, one call a point",
       ours(meridian, each([](double lat, double* arc, TWstatus* word) {
              TWmerid_dist_f(kA, kE, lat, arc, word);
            })),
       {"PROJ"},
       {proj(peer, true, meridian)},
       plane_apart});
  add({"Latitude at an arc, one call a point",
       ours(arcs, each([](double arc, double* lat, TWstatus* word) {
              TWmerid_dist_i(kA, kE, arc, lat, word);
            })),
       {"PROJ"},
       {proj(peer, false, arcs)},
       ground_apart});
}

const Suite suite([] {
  const auto points = box(-179, -85, 179, 85);
  const auto frame = geocentric_of(points);
  const char* cart = "+proj=cart +a=6378160 +rf=298.25";
  add({"Geodetic to geocentric",
       ours(points, TW_CALL(TWllh_to_xyz(kA, kE, n, in, out, &status))),
       {"PROJ"},
       {proj(cart, true, points)},
       space_apart});
  add({"Geocentric to geodetic",
       ours(frame, TW_CALL(TWxyz_to_llh(kA, kE, n, in, out, &status))),
       {"PROJ"},
       {proj(cart, false, frame)},
       geodetic_apart});
  meridian_arc();

  const std::string helmert =
      "+proj=helmert +convention=position_vector +x=-87.2 +y=98.1 +z=121.5 +rx=0.4 +ry=-1.3 "
      "+rz=2.2 +s=1.7";
  add({"Helmert forward",
       ours(frame,
            TW_CALL(TWbw_f(n, in, 1.7e-6, kRotation.data(), -87.2, 98.1, 121.5, out, &status))),
       {"PROJ"},
       {proj(helmert, true, frame)},
       space_apart});
  add({"Helmert inverse",
       ours(frame,
            TW_CALL(TWbw_i(n, in, 1.7e-6, kRotation.data(), -87.2, 98.1, 121.5, out, &status))),
       {"PROJ"},
       {proj(helmert, false, frame)},
       space_apart});

  const std::string molodensky =
      "+proj=molodensky +a=6378160 +rf=298.25 +da=-23 +df=-8.120449e-8 +dx=-134 +dy=-48 +dz=149";
  add({"Molodensky forward",
       ours(points,
            TW_CALL(TWmol_std_f(kA, kE, -23, -8.120449e-8, -134, -48, 149, n, in, out, &status))),
       {"PROJ"},
       {proj(molodensky, true, points)},
       geodetic_apart});
  add({"Molodensky inverse",
       ours(points,
            TW_CALL(TWmol_std_i(kA, kE, -23, -8.120449e-8, -134, -48, 149, n, in, out, &status))),
       {"PROJ"},
       {proj(molodensky, false, points)},
       geodetic_apart});
});

}  // namespace
