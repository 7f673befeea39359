// Hotine's oblique Mercator and the rectified skew orthomorphic.
#include "points/operations.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

using Points = const CoordinateTriple*;

void add_hotine(const std::string& which, double e) {
  double lat0 = -0.33;
  double alpha = 0.33;
  double B = 0, A = 0, E = 0, lon0 = 0, g = 0;
  TWstatus word = 0;
  TWo_merc_c(0, e, 0.81, 0, 0, 0, &lat0, &alpha, &B, &A, &E, &lon0, &g, &word);
  const auto low = geographic(30, -60);
  const auto high = geographic(70, 60);
  operations().push_back({"TWo_merc_f, " + which, low, high,
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWo_merc_f(e, alpha, g, lon0, E, B, A, n, in, out, status);
                          }});
  operations().push_back({"TWo_merc_uv_k, " + which, low, high,
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWo_merc_uv_k(e, alpha, g, lon0, E, B, A, 1, n, in, out, status);
                          }});
  operations().push_back({"TWo_merc_rot, " + which,
                          {-1, -1, 0},
                          {1, 1, 0},
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWo_merc_rot(alpha, n, in, out, status);
                          }});
  operations().push_back({"TWo_merc_i, " + which,
                          {-1, -1, 0},
                          {1, 1, 0},
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWo_merc_i(e, alpha, g, lon0, E, B, A, n, in, out, status);
                          }});
  operations().push_back({"TWo_merc_s, " + which, low, high,
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWo_merc_s(e, 0.9995, alpha, g, lon0, E, B, A, n, in, out, status);
                          }});
}

void add_skew(const std::string& which, double e) {
  double A = 0, B = 0, C = 0, lon0 = 0;
  constexpr double kSkew = -0.6435011087932844;
  TWstatus word = 0;
  TWrso_c(e, 1.78, 0.07, kSkew, &A, &B, &C, &lon0, &word);
  const auto low = geographic(80, -60);
  const auto high = geographic(140, 60);
  operations().push_back({"TWrso_f, " + which, low, high,
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWrso_f(lon0, kSkew, A, B, C, e, n, in, out, status);
                          }});
  operations().push_back({"TWrso_i, " + which,
                          {-1, -1, 0},
                          {1, 1, 0},
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWrso_i(lon0, kSkew, A, B, C, e, n, in, out, status);
                          }});
  operations().push_back({"TWrso_s, " + which, low, high,
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWrso_s(e, 0.9998, 0, 0, kSkew, lon0, A, B, C, n, in, out, status);
                          }});
}

[[maybe_unused]] const bool added = [] {
  add_hotine("ellipsoid", kE);
  add_hotine("e = 0.3", 0.3);
  add_skew("ellipsoid", kE);
  add_skew("e = 0.3", 0.3);
  return true;
}();

}  // namespace
