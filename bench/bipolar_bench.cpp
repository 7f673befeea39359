// The bipolar oblique conic, and its neighbours: Chamberlin, the polyconic of the map of the world,
// Krovak.

#include <cmath>

#include "harness.hpp"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kDegree = 3.14159265358979323846 / 180;
constexpr double kE = 0.0816968312225275;  // Bessel 1841

std::vector<CoordinateTriple> scaled(std::vector<CoordinateTriple> points, double factor) {
  for (CoordinateTriple& p : points) p = {p.x * factor, p.y * factor, p.z};
  return points;
}

void bipolar_rows() {
  const auto points = box(-110, 0, -70, 45);
  double lon_a, lat_a, lat_b, ab, z1, z2, fe, fn, lon_c, lat_c;
  double lon_b, n, k, f, az_ab, az_ba, t, rho_c, z_c, az_c;
  TWstatus status = 0;
  TWbipocc_param(&lon_a, &lat_a, &lat_b, &ab, &z1, &z2, &fe, &fn, &lon_c, &lat_c, &status);
  TWbipocc_c(lon_a, lat_a, lat_b, ab, z1, z2, &lon_b, &n, &k, &f, &az_ab, &az_ba, &t, &rho_c, &z_c,
             &az_c, &status);
  auto plane = points;
  TWbipocc_f(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, 0, 0, t, rho_c, ab, f, kPoints,
             plane.data(), points.data(), &status);
  const std::string peer = "+proj=bipc +ns +R=1 +lon_0=0";
  add({"Bipolar oblique conic forward", "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWbipocc_f(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, 0, 0, t, rho_c, ab, f,
                    kPoints, out.data(), points.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points), floor_kernel(points, [](const CoordinateTriple& p) {
         return std::sin(p.y) + std::cos(p.y) + std::tan(p.y) + std::sin(p.x) + std::cos(p.x) +
                std::atan2(p.x, p.y) + std::acos(p.y / 2) + std::pow(p.z, 0.63) +
                std::pow(p.z + 1, 0.63) + std::acos(p.x / 4);
       })});
  add({"Bipolar oblique conic inverse",
       "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWbipocc_i(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, n, t, rho_c, ab, f, lon_c,
                    kPoints, plane.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, scaled(plane, k)),
       {}});
}

void chamberlin_row() {
  const CoordinateTriple control[3] = {{-150 * kDegree, 55 * kDegree, 0},
                                       {-35 * kDegree, 55 * kDegree, 0},
                                       {-92.5 * kDegree, 10 * kDegree, 0}};
  struct Triangle {
    CoordinateTriple control[3];
    double sides[3];
    double azimuths[3];
    CoordinateTriple plane[3];
  };
  Triangle triangle = {{control[0], control[1], control[2]}, {}, {}, {}};
  double lon_c = -92.5 * kDegree, lat_c = 40 * kDegree, rotation = 90 * kDegree;
  TWstatus status = 0;
  TWchamtri_c(nullptr, 0, 1, 0, triangle.control, triangle.sides, triangle.azimuths, triangle.plane,
              &lon_c, &lat_c, &rotation, &status);
  const auto points = box(-130, 15, -60, 55);
  add({"Chamberlin trimetric forward (sphere)",
       "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWchamtri_f(0, triangle.control, triangle.sides, triangle.azimuths, triangle.plane,
                     kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel("+proj=chamb +lat_1=55 +lon_1=-150 +lat_2=55 +lon_2=-35 +lat_3=10 "
                   "+lon_3=-92.5 +lon_0=-92.5 +R=1",
                   true, points),
       {}});
}

void imw_rows() {
  const auto points = box(-2, 36, 2, 40);
  double r1, r2, c, p, q, s, t;
  TWstatus status = 0;
  TWIMWmodPoly_c(kE, 0, 36 * kDegree, &r1, &r2, &c, &p, &q, &s, &t, &status);
  auto plane = points;
  TWIMWmodPoly_f(kE, 0, 36 * kDegree, r1, r2, c, p, q, s, t, kPoints, points.data(), plane.data(),
                 &status);
  const std::string peer = "+proj=imw_p +lat_1=36 +lat_2=40 +lon_1=2 +a=1 +rf=299.1528128";
  add({"IMW polyconic forward",
       "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWIMWmodPoly_f(kE, 0, 36 * kDegree, r1, r2, c, p, q, s, t, kPoints, points.data(),
                        out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points),
       {}});
  add({"IMW polyconic inverse",
       "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWIMWmodPoly_i(kE, 0, 36 * kDegree, r1, r2, c, p, q, s, t, kPoints, plane.data(),
                        out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, plane),
       {}});
}

void krovak_rows() {
  const auto points = box(12, 48, 22, 51);
  const double lon0 = (24 + 50 / 60.0) * kDegree;
  double pole_lon = lon0, pole_lat = 59.75 * kDegree;
  double lat_r, s_lon, s_lat, offset, c, n, rho0, g_c, g_t;
  TWstatus status = 0;
  TWkrovak_c(kE, lon0, 49.5 * kDegree, 0, 0, 0, 0, &pole_lon, &pole_lat, &lat_r, &s_lon, &s_lat,
             &offset, &c, &n, &rho0, &g_c, &g_t, &status);
  auto plane = points;
  TWo_lam_f(kE, lon0, lat_r, c, n, rho0, s_lon, s_lat, 0, offset, g_c, g_t, kPoints, points.data(),
            plane.data(), &status);
  const std::string peer =
      "+proj=krovak +lat_0=49.5 +lon_0=24.83333333333333 +alpha=30.28813972222222 +k=0.9999 "
      "+ellps=bessel";
  // The radius of the conformal sphere on Bessel's ellipsoid, metres.
  constexpr double kRadius = 6380703.6105;
  add({"Krovak forward",
       "PROJ",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWo_lam_f(kE, lon0, lat_r, c, n, rho0, s_lon, s_lat, 0, offset, g_c, g_t, kPoints,
                   points.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, true, points),
       {}});
  add({"Krovak inverse",
       "PROJ",
       [=, out = points, work = plane]() mutable {
         TWstatus word = 0;
         work = plane;  // the call turns its input
         TWo_lam_i(kE, lon0, lat_r, c, n, rho0, s_lon, s_lat, 0, offset, g_c, g_t, kPoints,
                   work.data(), out.data(), &word);
         keep(out.back().y);
       },
       proj_kernel(peer, false, scaled(plane, kRadius)),
       {}});
}

const Suite suite([] {
  bipolar_rows();
  chamberlin_row();
  imw_rows();
  krovak_rows();
});

}  // namespace
