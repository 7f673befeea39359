#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kHalfPi = 1.5707963267948966;

using Points = const CoordinateTriple*;

void add(const std::string& which, double e, double lat0) {
  double n1 = 0;
  double g = 0;
  TWaz_eq_c(e, lat0, &n1, &g);
  operations().push_back({"TWaz_eq_f, " + which, geographic(-180, -90), geographic(180, 90),
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWaz_eq_f(e, 0.3, lat0, n1, g, n, in, out, status);
                          }});
  operations().push_back({"TWaz_eq_i, " + which,
                          {-2, -2, 0},
                          {2, 2, 0},
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWaz_eq_i(e, 0.3, lat0, n1, n, in, out, status);
                          }});
  operations().push_back({"TWaz_eq_s, " + which, geographic(-180, -90), geographic(180, 90),
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWaz_eq_s(0.3, lat0, 0.9, n, in, out, status);
                          }});
}

[[maybe_unused]] const bool added = [] {
  add("oblique", kE, 0.8);
  add("equatorial", kE, 0);
  add("north", kE, kHalfPi);
  add("south", kE, -kHalfPi);
  add("sphere", 0, 0.8);
  add("bad ellipsoid", -0.1, 0.8);
  return true;
}();

}  // namespace
