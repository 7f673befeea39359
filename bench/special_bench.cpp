#include <array>
#include <cmath>

#include "harness.hpp"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kDegree = 0.017453292519943295;

const Suite suite([] {
  TWstatus status = 0;

  // Space oblique Mercator of Landsat 1 to 3, with as many terms as the peer's series.
  constexpr int16_t kTerms = 5;
  constexpr double e = 0.08227185422300325, inc = 1.729481662386221, P = 103.2669323 / 1440;
  double Q = 0, T = 0, W = 0, G = 0, a0 = 0, R1 = 0, R2 = 0, R3 = 0, R4 = 0;
  double m_sin = 0, m_cos = 0, sum3 = 0, sum4 = 0;
  std::array<double, kTerms> C, S, X1, X2, X3, X4;
  TWsom_c(e, inc, P, 0, 2.5, kTerms, 201, &Q, &T, &W, &G, &a0, C.data(), S.data(), X1.data(),
          X2.data(), X3.data(), X4.data(), &R1, &R2, &R3, &R4, &m_sin, &m_cos, &sum3, &sum4,
          &status);
  const double lon_n = 128.87 * kDegree - 15 * 2 * 3.141592653589793 / 251;
  const auto scene = box(-80, 20, -70, 60);
  auto track = scene;
  const auto forward = [=](const CoordinateTriple* in, CoordinateTriple* out) {
    TWstatus word = 0;
    TWsom_f(0, 1, kTerms, lon_n, e, inc, P, 0, 2.5, Q, T, W, G, a0, C.data(), S.data(), X1.data(),
            X2.data(), X3.data(), X4.data(), R1, R2, R3, R4, m_sin, m_cos, sum3, sum4, kPoints, in,
            out, 1, &word);
  };
  forward(scene.data(), track.data());
  auto metres = track;
  for (auto& p : metres) p = {p.x * 6378206.4, p.y * 6378206.4, p.z};
  const char* const lsat = "+proj=lsat +lsat=1 +path=15 +a=6378206.4 +es=0.00676866";
  add({"Space oblique Mercator forward",
       "PROJ",
       [=, out = scene]() mutable {
         forward(scene.data(), out.data());
         keep(out.back().y);
       },
       proj_kernel(lsat, true, scene),
       {}});
  add({"Space oblique Mercator inverse",
       "PROJ",
       [=, out = track]() mutable {
         TWstatus word = 0;
         TWsom_i(kTerms, lon_n, e, inc, P, 0, 2.5, Q, T, W, G, a0, C.data(), S.data(), X1.data(),
                 X2.data(), X3.data(), X4.data(), R1, R2, R3, R4, m_sin, m_cos, sum3, sum4, kPoints,
                 track.data(), out.data(), 1, &word);
         keep(out.back().y);
       },
       proj_kernel(lsat, false, metres),
       {}});

  // Laborde grid of Madagascar.
  const double e_intl = std::sqrt((2 - 1 / 297.0) / 297.0);
  const double lon0 = 46.43720833 * kDegree;
  double chi0 = 0, c = 0, t = 0, R = 0, A0 = 0, A2 = 0, A4 = 0, A6 = 0, A8 = 0, M0 = 0;
  double B2 = 0, B4 = 0, B6 = 0, A = 0, B = 0, Cl = 0, D = 0;
  TWlaborde_c(e_intl, lon0, -18.9 * kDegree, 18.9 * kDegree, &chi0, &c, &t, &R, &A0, &A2, &A4, &A6,
              &A8, &M0, &B2, &B4, &B6, &A, &B, &Cl, &D, &status);
  const auto island = box(43, -26, 51, -12);
  auto grid = island;
  TWlaborde_f(e_intl, lon0, c, t, A0, A2, A4, A6, A8, M0, A, B, kPoints, island.data(), grid.data(),
              &status);
  auto grid_metres = grid;
  for (auto& p : grid_metres) p = {p.x * 6378388 * R, p.y * 6378388 * R, p.z};
  const char* const labrd = "+proj=labrd +lat_0=-18.9 +lon_0=46.43720833 +azi=18.9 +ellps=intl";
  add({"Laborde forward",
       "PROJ",
       [=, out = island]() mutable {
         TWstatus word = 0;
         TWlaborde_f(e_intl, lon0, c, t, A0, A2, A4, A6, A8, M0, A, B, kPoints, island.data(),
                     out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(labrd, true, island),
       {}});
  add({"Laborde inverse",
       "PROJ",
       [=, out = grid]() mutable {
         TWstatus word = 0;
         TWlaborde_i(e_intl, lon0, chi0, c, t, A0, M0, B2, B4, B6, 1, A, B, Cl, D, kPoints,
                     grid.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(labrd, false, grid_metres),
       {}});
});

}  // namespace
