#include "tidewater/chamberlin.h"

#include <memory>

#include "points/operations.hpp"

using namespace tidewater::test;

namespace {

// Europe's triangle; the box holds its corners' meridians and points on all sides of the edges.
struct Triangle {
  explicit Triangle(double eccentricity) : e(eccentricity) {
    control[0] = geographic(-10, 55);
    control[1] = geographic(30, 60);
    control[2] = geographic(15, 36);
    double lon = geographic(12, 50).x, lat = geographic(12, 50).y, rotation = 1.5;
    TWstatus word = 0;
    TWchamtri_c(nullptr, 0, 1, e, control, sides, azimuths, plane, &lon, &lat, &rotation, &word);
  }

  double e;
  CoordinateTriple control[3] = {};
  double sides[3] = {}, azimuths[3] = {};
  CoordinateTriple plane[3] = {};
};

Operation forward(const char* name, double e) {
  const auto t = std::make_shared<Triangle>(e);
  return {name, geographic(-40, 10, 0), geographic(60, 80, 1000),
          [t](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWchamtri_f(t->e, t->control, t->sides, t->azimuths, t->plane, n, in, out, status);
          }};
}

const Operations added{{forward("TWchamtri_f, sphere", 0), forward("TWchamtri_f", 0.0818)}};

}  // namespace
