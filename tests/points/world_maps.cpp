// Robinson, van der Grinten, the rotated graticule and the double stereographic on it.
#include <memory>

#include "points/operations.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kHalfPi = 1.5707963267948966;

using Points = const CoordinateTriple*;

struct Robinson {
  double knots[19], y[76], x[76], y0 = 0;
  Robinson() {
    TWstatus word = 0;
    TWrobin_c(knots, y, x, &y0, 0.2, &word);
  }
};
const Robinson& robinson() {
  static const Robinson table;
  return table;
}

struct Double {
  double chi_g = 0, c = 0, t = 0, C = 0, m0 = 0, chi0 = 0;
  Double() {
    TWstatus word = 0;
    TWstereo3_c(kE, 0.8, &chi_g, &c, &t, &C, &m0, &chi0, &word);
  }
};

// A triangle and the map of it.
struct Chamberlin {
  CoordinateTriple control[3] = {{-0.3, 0.5, 0}, {0.4, 0.5, 0}, {0, 1, 0}}, plane[3] = {};
  double sides[3] = {}, azimuths[3] = {};
  Chamberlin() {
    double lon = 0, lat = 0.7, rotation = kHalfPi;
    TWstatus word = 0;
    TWchamtri_c(nullptr, 0, 1, kE, control, sides, azimuths, plane, &lon, &lat, &rotation, &word);
  }
};

const Operations world_maps = {
    {"TWchamtri_f", geographic(-15, 32, -100), geographic(20, 55, 100),
     [c = Chamberlin()](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWchamtri_f(kE, c.control, c.sides, c.azimuths, c.plane, n, in, out, status);
     }},
    {"TWrobin_f", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       const Robinson& r = robinson();
       TWrobin_f(r.knots, r.y, r.x, 0.3, r.y0, n, out, in, status);
     }},
    {"TWrobin_i",
     {-2.5, -1.4, 0},
     {2.5, 1, 0},
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       const Robinson& r = robinson();
       TWrobin_i(r.knots, r.y, r.x, 0.3, r.y0, n, in, out, status);
     }},
    {"TWrobin_s", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       const Robinson& r = robinson();
       TWrobin_s(r.knots, r.y, r.x, 0.3, 0.9, 0.95, kE, 0.9, n, in, out, status);
     }},
    {"TWvdg_f", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWvdg_f(0.3, 0.1, n, in, out, status);
     }},
    {"TWvdg_i",
     {-2, -2, 0},
     {2, 2, 0},
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWvdg_i(0.3, 0.1, n, in, out, status);
     }},
    {"TWvdg_s", geographic(-180, -89), geographic(180, 89),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWvdg_s(0.9, 0.3, n, in, out, status);
     }},
    {"TWrotgrat_f", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWrotgrat_f(0.3, 0.2, 0.5, 0.8, 0.1, n, in, out, status);
     }},
    {"TWrotgrat_f, the same pole", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWrotgrat_f(0.3, 0.2, 0.5, kHalfPi, 0.1, n, in, out, status);
     }},
    {"TWrotgrat_i", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWrotgrat_i(0.3, 0.2, 0.5, 0.8, 0.1, n, in, out, status);
     }},
    {"TWstereo3_f", geographic(-10, 30), geographic(40, 60),
     [d = Double()](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWstereo3_f(kE, 0.3, d.chi_g, d.c, d.t, d.C, d.m0, d.chi0, n, in, out, status);
     }},
    {"TWstereo3_i",
     {-0.3, -0.3, 0},
     {0.3, 0.3, 0},
     [d = Double()](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWstereo3_i(kE, 0.3, d.chi_g, d.c, d.t, d.C, d.m0, d.chi0, n, in, out, status);
     }},
};

}  // namespace
