// Gnomonic, orthographic, vertical and tilted perspective.
#include <array>

#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kHalfPi = 1.5707963267948966;

using Points = const CoordinateTriple*;

std::array<Operation, 3> gnomonic(const char* aspect, double lat0) {
  double c = 0;
  double s = 0;
  TWstatus word = 0;
  TWgnomon_c(lat0, &c, &s, &word);
  const double lat = lat0 * 57.29577951308232;
  const auto low = geographic(-180, lat - 40 < -90 ? -90 : lat - 40);
  const auto high = geographic(180, lat + 40 > 90 ? 90 : lat + 40);
  const auto name = [&](const char* function) { return std::string(function) + ", " + aspect; };
  // A first point beyond the horizon ends an array: the ordinary box lies within it.
  const auto near_low = lat0 > 1.5 || lat0 < -1.5 ? low : geographic(-40, lat - 40);
  const auto near_high = lat0 > 1.5 || lat0 < -1.5 ? high : geographic(70, lat + 40);
  return {{{name("TWgnomon_f"), near_low, near_high,
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWgnomon_f(0.3, lat0, c, s, n, out, in, status);
            }},
           {name("TWgnomon_i"),
            {-2, -2, 0},
            {2, 2, 0},
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWgnomon_i(0.3, lat0, c, s, n, in, out, status);
            }},
           {name("TWgnomon_s"), low, high,
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWgnomon_s(0.3, lat0, 0.9, c, s, n, in, out, status);
            }}}};
}

std::array<Operation, 3> orthographic(const char* which, double e, double lat0) {
  struct Constants {
    double x, y, z, r[9];
  } o{};
  TWstatus word = 0;
  TWortho_c(e, 0.3, lat0, &o.x, &o.y, &o.z, o.r, &word);
  const double lat = lat0 * 57.29577951308232;
  const auto name = [&](const char* function) { return std::string(function) + ", " + which; };
  return {{{name("TWortho_f"), geographic(-10, lat - 40), geographic(45, lat + 40),
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWortho_f(kA, e, 0.3, lat0, o.x, o.y, o.z, o.r, n, in, out, status);
            }},
           {name("TWortho_i"),
            {-0.7, -0.7, 0},
            {0.7, 0.7, 0},
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWortho_i(kA, e, 0.3, lat0, o.x, o.y, o.z, o.r, n, in, out, status);
            }},
           {name("TWortho_s"), geographic(-180, -90), geographic(180, 90),
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWortho_s(0.3, lat0, 0.9, n, in, out, status);
            }}}};
}

std::array<Operation, 5> perspective(const char* which, double e) {
  constexpr double kLat0 = 0.7;
  constexpr double kView = 5e6;
  double p = 0;
  double g = 0;
  TWstatus word = 0;
  TWpersp_c(kA, e, kLat0, kView, 100, &p, &g, &word);
  const auto name = [&](const char* function) { return std::string(function) + ", " + which; };
  return {{{name("TWpersp_vert_f"), geographic(-10, 10, -1000), geographic(40, 70, 9000),
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWpersp_vert_f(kA, e, 0.3, kLat0, 100, kView, p, g, n, in, out, status);
            }},
           {name("TWpersp_vert_i, on the surface"),
            {-0.3, -0.3, 0},
            {0.3, 0.3, 0},
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWpersp_vert_i(kA, e, 0.3, kLat0, 100, kView, p, g, n, in, out, status);
            }},
           {name("TWpersp_vert_i"),
            {-0.3, -0.3, -1000},
            {0.3, 0.3, 9000},
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWpersp_vert_i(kA, e, 0.3, kLat0, 100, kView, p, g, n, in, out, status);
            }},
           {name("TWpersp_f"), geographic(-10, 10, -1000), geographic(40, 70, 9000),
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              TWpersp_f(kA, e, 0.3, kLat0, 100, kView, p, g, 0.2, 0.1, 0.4, n, in, out, status);
            }},
           // Writes to its input.
           {name("TWpersp_i"),
            {-0.3, -0.3, -1000},
            {0.3, 0.3, 9000},
            [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
              std::vector<CoordinateTriple> copy(in, in + (n > 0 ? n : 0));
              TWpersp_i(kA, e, 0.3, kLat0, 100, kView, p, g, 0.2, 0.1, 0.4, n,
                        in == out ? out : copy.data(), out, status);
            }}}};
}

template <std::size_t N>
void add(const std::array<Operation, N>& added) {
  operations().insert(operations().end(), added.begin(), added.end());
}

[[maybe_unused]] const bool added = [] {
  add(gnomonic("north", kHalfPi));
  add(gnomonic("south", -kHalfPi));
  add(gnomonic("equatorial", 0));
  add(gnomonic("oblique", 0.7));
  add(orthographic("ellipsoid", kE, 0.7));
  add(orthographic("north", kE, kHalfPi));
  add(orthographic("sphere", 0, 0.7));
  add(orthographic("e = 0.3", 0.3, 0.7));
  add(perspective("ellipsoid", kE));
  add(perspective("sphere", 0));
  return true;
}();

}  // namespace
