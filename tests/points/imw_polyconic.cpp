#include "points/operations.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

using Points = const CoordinateTriple*;

void add(const std::string& which, double lat1) {
  double r1 = 0, r2 = 0, c = 0, p = 0, q = 0, s = 0, t = 0;
  TWstatus word = 0;
  TWIMWmodPoly_c(kE, 0.3, lat1, &r1, &r2, &c, &p, &q, &s, &t, &word);
  const double degrees = lat1 * 57.29577951308232;
  operations().push_back(
      {"TWIMWmodPoly_f, " + which, geographic(14, degrees), geographic(20, degrees + 4),
       [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
         TWIMWmodPoly_f(kE, 0.3, lat1, r1, r2, c, p, q, s, t, n, in, out, status);
       }});
  operations().push_back({"TWIMWmodPoly_i, " + which,
                          {-0.03, 0, 0},
                          {0.03, 0.07, 0},
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWIMWmodPoly_i(kE, 0.3, lat1, r1, r2, c, p, q, s, t, n, in, out,
                                           status);
                          }});
}

[[maybe_unused]] const bool added = [] {
  add("north", 0.6283185307179586);
  add("from the equator", 0);
  add("to the equator", -0.06981317007977318);
  add("south", -0.6981317007977318);
  return true;
}();

}  // namespace
