#include <cmath>

#include "harness.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;

const Suite transverse_mercator([] {
  const auto points = box(-3, -80, 3, 80);
  double A0 = 0, A2 = 0, A4 = 0, A6 = 0, A8 = 0, M0 = 0, B2 = 0, B4 = 0, B6 = 0;
  TWstatus status = 0;
  TWt_merc_c(kE, 0, 0, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4, &B6, &status);
  auto plane = points;
  TWt_merc_f(kE, 0, A0, A2, A4, A6, A8, M0, kPoints, points.data(), plane.data(), &status);
  auto plane_metres = plane;
  for (auto& p : plane_metres) p = {p.x * kA, p.y * kA, p.z};

  const auto one_latitude = [](const CoordinateTriple& p) {
    return std::sin(p.y) + std::cos(p.y) + std::sqrt(1 + p.y * p.y);
  };
  const auto forward = [=, out = points]() mutable {
    TWstatus word = 0;
    TWt_merc_f(kE, 0, A0, A2, A4, A6, A8, M0, kPoints, points.data(), out.data(), &word);
    keep(out.back().y);
  };
  const auto inverse = [=, out = plane]() mutable {
    TWstatus word = 0;
    TWt_merc_i(kE, 0, 0, A0, M0, B2, B4, B6, kPoints, plane.data(), out.data(), &word);
    keep(out.back().y);
  };
  const Kernel forward_floor = floor_kernel(points, one_latitude);
  const Kernel inverse_floor = floor_kernel(plane, [](const CoordinateTriple& p) {
    return std::sin(p.y) + std::cos(p.y) + std::sin(2 * p.y) + std::cos(2 * p.y) +
           std::sqrt(1 + p.y * p.y);
  });
  add({"transverse Mercator forward", "PROJ", forward,
       proj_kernel("+proj=tmerc +ellps=GRS80", true, points), forward_floor});
  add({"transverse Mercator forward, both by series", "PROJ", forward,
       proj_kernel("+proj=tmerc +approx +ellps=GRS80", true, points), forward_floor});
  add({"transverse Mercator inverse", "PROJ", inverse,
       proj_kernel("+proj=tmerc +ellps=GRS80", false, plane_metres), inverse_floor});
  add({"transverse Mercator inverse, both by series", "PROJ", inverse,
       proj_kernel("+proj=tmerc +approx +ellps=GRS80", false, plane_metres), inverse_floor});
  add({"transverse Mercator forward and scale",
       "",
       [=, out = points]() mutable {
         TWstatus word = 0;
         for (auto& p : out) p.z = 1;
         TWt_merc_xyk(kE, 0, A0, A2, A4, A6, A8, M0, 1, kPoints, points.data(), out.data(), &word);
         keep(out.back().z);
       },
       {},
       forward_floor});
});

const Suite gauss_sphere([] {
  const auto points = box(-10, -80, 10, 80);
  double chi0 = 0, c = 0, t = 0, R = 0;
  TWstatus status = 0;
  TWgaussII_c(kE, 0.9, &chi0, &c, &t, &R, &status);
  auto sphere = points;
  TWgaussII_f(kE, 0, c, t, kPoints, points.data(), sphere.data(), &status);

  add({"conformal sphere forward",
       "",
       [=, out = points]() mutable {
         TWstatus word = 0;
         TWgaussII_f(kE, 0, c, t, kPoints, points.data(), out.data(), &word);
         keep(out.back().y);
       },
       {},
       floor_kernel(points, [](const CoordinateTriple& p) {
         return std::log(std::tan(p.y)) + std::sin(p.y) + std::exp(p.y) + std::atan(p.y);
       })});
  add({"conformal sphere inverse",
       "",
       [=, out = sphere]() mutable {
         TWstatus word = 0;
         TWgaussII_i(kE, 0, c, t, kPoints, sphere.data(), out.data(), &word);
         keep(out.back().y);
       },
       {},
       floor_kernel(sphere, [](const CoordinateTriple& p) {
         return std::log(std::tan(p.y)) + std::exp(p.y) + std::atan(p.y);
       })});
});

}  // namespace
