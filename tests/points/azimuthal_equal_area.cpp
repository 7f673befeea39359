#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kHalfPi = 1.5707963267948966;

using Points = const CoordinateTriple*;

struct Constants {
  double e, lat0;
  double e2 = 0, q1 = 0, qp = 0, rq = 1, m1 = 0, sin_b1 = 0, cos_b1 = 1, sin0 = 0, cos0 = 0, D = 1;
  Constants(double eccentricity, double latitude) : e(eccentricity), lat0(latitude) {
    TWstatus word = 0;
    TWlam_az_eq_c(e, 0.3, lat0, &e2, &q1, &qp, &rq, &m1, &sin_b1, &cos_b1, &sin0, &cos0, &D, &word);
  }
};

void add(const std::string& which, const Constants& k) {
  operations().push_back({"TWlam_az_eq_f, " + which, geographic(-180, -90), geographic(180, 90),
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWlam_az_eq_f(in, n, k.e, 0.3, k.lat0, k.e2, k.q1, k.qp, k.rq, k.m1,
                                          k.sin_b1, k.cos_b1, k.sin0, k.cos0, k.D, out, status);
                          }});
  operations().push_back({"TWlam_az_eq_i, " + which,
                          {-1.3, -1.3, 0},
                          {1.3, 1.3, 0},
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWlam_az_eq_i(in, n, k.e, 0.3, k.lat0, k.e2, k.qp, k.rq, k.sin_b1,
                                          k.cos_b1, k.sin0, k.cos0, k.D, out, status);
                          }});
  operations().push_back({"TWlam_az_eq_s, " + which, geographic(-180, -90), geographic(180, 90),
                          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
                            TWlam_az_eq_s(in, n, 0.3, k.lat0, k.e, k.e2, k.qp, 0.9, k.sin0, k.cos0,
                                          out, status);
                          }});
}

[[maybe_unused]] const bool added = [] {
  add("oblique", {kE, 0.8});
  add("equatorial", {kE, 0});
  add("north", {kE, kHalfPi});
  add("south", {kE, -kHalfPi});
  add("oblique, e = 0.3", {0.3, 0.8});
  add("oblique, sphere", {0, 0.8});
  add("equatorial, sphere", {0, 0});
  add("north, sphere", {0, kHalfPi});
  Constants other(kE, 0.8);
  other.qp = 1.9;  // not that of the ellipsoid
  add("oblique, other qp", other);
  return true;
}();

}  // namespace
