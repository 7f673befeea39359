#include <array>
#include <cmath>

#include "harness.hpp"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;

using Call = std::function<void(const CoordinateTriple* in, CoordinateTriple* out)>;

// Both ways of a projection beside PROJ's.
void add_both(const std::string& name, double radius, const std::string& definition,
              const Call& forward, const Call& inverse, const Kernel& floor) {
  const auto points = box(-175, -80, 175, 80);
  auto plane = points;
  forward(points.data(), plane.data());
  auto peer_plane = plane;
  for (auto& p : peer_plane) p = {p.x * radius, p.y * radius, p.z};
  const auto kernel = [](const Call& call, const std::vector<CoordinateTriple>& in) {
    return [call, in, out = in]() mutable {
      call(in.data(), out.data());
      keep(out.back().y);
    };
  };
  add({name + " forward", "PROJ", kernel(forward, points), proj_kernel(definition, true, points),
       floor});
  add({name + " inverse", "PROJ", kernel(inverse, plane),
       proj_kernel(definition, false, peer_plane), floor});
}

const Suite suite([] {
  const auto points = box(-175, -80, 175, 80);
  TWstatus status = 0;

  double e2 = 0, m0 = 0;
  TWsinusoidal_c(kE, 0, &e2, &m0, &status);
  add_both(
      "Sinusoidal", kA, "+proj=sinu +ellps=GRS80",
      [=](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWsinusoidal_f(0, 0, kE, e2, m0, kPoints, in, out, &word);
      },
      [=](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWsinusoidal_i(0, 0, kE, e2, m0, kPoints, in, out, &word);
      },
      floor_kernel(points, [](const CoordinateTriple& p) {
        return std::sin(p.y) + std::cos(p.y) + std::sin(2 * p.y) + std::cos(2 * p.y);
      }));

  const auto newton_floor = floor_kernel(points, [](const CoordinateTriple& p) {
    double sum = 0;  // about four passes
    for (int pass = 0; pass < 4; ++pass) sum += std::sin(p.y + pass) + std::cos(p.y + pass);
    return sum;
  });
  add_both(
      "Mollweide", 1, "+proj=moll +R=1",
      [](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWmollweide_f(0, 0, kPoints, in, out, &word);
      },
      [](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWmollweide_i(0, 0, kPoints, in, out, &word);
      },
      newton_floor);
  add_both(
      "Eckert IV", 1, "+proj=eck4 +R=1",
      [](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWeckertIV_f(0, 0, kPoints, in, out, &word);
      },
      [](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWeckertIV_i(0, 0, kPoints, in, out, &word);
      },
      newton_floor);

  std::array<double, 19> knots;
  std::array<double, 76> y_coef, x_coef;
  double y0 = 0;
  TWrobin_c(knots.data(), y_coef.data(), x_coef.data(), &y0, 0, &status);
  add_both(
      "Robinson", 1, "+proj=robin +R=1",
      [=](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWrobin_f(knots.data(), y_coef.data(), x_coef.data(), 0, y0, kPoints, out, in, &word);
      },
      [=](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWrobin_i(knots.data(), y_coef.data(), x_coef.data(), 0, y0, kPoints, in, out, &word);
      },
      {});

  add_both(
      "Van der Grinten", 1, "+proj=vandg +R=1",
      [](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWvdg_f(0, 0, kPoints, in, out, &word);
      },
      [](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWvdg_i(0, 0, kPoints, in, out, &word);
      },
      {});

  double lat1 = 0.7, c1 = 0, r0 = 0, bonne_e2 = 0;
  TWbonne_c(kE, &lat1, &bonne_e2, &c1, &r0, &status);
  add_both(
      "Bonne", kA, "+proj=bonne +lat_1=40.107045659157627 +ellps=GRS80",
      [=](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWbonne_f(0, lat1, kE, bonne_e2, c1, r0, kPoints, in, out, &word);
      },
      [=](const CoordinateTriple* in, CoordinateTriple* out) {
        TWstatus word = 0;
        TWbonne_i(0, lat1, kE, bonne_e2, c1, r0, kPoints, in, out, &word);
      },
      floor_kernel(points, [](const CoordinateTriple& p) {
        return std::sin(p.y) + std::cos(p.y) + std::sin(2 * p.y) + std::cos(2 * p.y) +
               std::sin(p.x) + std::cos(p.x);
      }));
});

}  // namespace
