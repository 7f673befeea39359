#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kHalfPi = 1.5707963267948966;

struct Origin {
  double e, lat0;
  double C = 0, m0 = 0, chi0 = 0;
  Origin(double eccentricity, double latitude) : e(eccentricity), lat0(latitude) {
    TWstatus status = 0;
    TWstereo_c(e, lat0, &C, &m0, &chi0, &status);
  }
};

Operation forward(const char* name, double e, double lat0) {
  return {name, geographic(-180, -89), geographic(180, 89),
          [o = Origin(e, lat0)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                TWstatus* status) {
            TWstereo_f(o.e, 0.3, o.lat0, o.C, o.m0, o.chi0, n, in, out, status);
          }};
}

Operation inverse(const char* name, double e, double lon0, double lat0) {
  return {name,
          {-2, -2, 0},
          {2, 2, 0},
          [o = Origin(e, lat0), lon0](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                      TWstatus* status) {
            TWstereo_i(o.e, lon0, o.lat0, o.C, o.m0, o.chi0, n, in, out, status);
          }};
}

Operation scale(const char* name, double e, double lat0) {
  return {name, geographic(-180, -89), geographic(180, 89),
          [o = Origin(e, lat0)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                TWstatus* status) {
            TWstereo_s(o.e, 0.994, 0.3, o.lat0, o.C, o.m0, o.chi0, n, in, out, status);
          }};
}

const Operations stereographic = {
    forward("TWstereo_f, oblique", kE, 0.8),
    forward("TWstereo_f, equatorial", kE, 0),
    forward("TWstereo_f, oblique, e = 0.3", 0.3, 0.8),
    forward("TWstereo_f, north", kE, kHalfPi),
    forward("TWstereo_f, south", kE, -kHalfPi),
    inverse("TWstereo_i, oblique", kE, 0.3, 0.8),
    inverse("TWstereo_i, oblique, e = 0.3", 0.3, 0.3, 0.8),
    inverse("TWstereo_i, north", kE, 0.3, kHalfPi),
    inverse("TWstereo_i, north, e = 0.3", 0.3, 0.3, kHalfPi),
    inverse("TWstereo_i, south", kE, 0, -kHalfPi),
    inverse("TWstereo_i, south, lon0", kE, 0.3, -kHalfPi),
    scale("TWstereo_s, oblique", kE, 0.8),
    scale("TWstereo_s, north", kE, kHalfPi),
    scale("TWstereo_s, south", kE, -kHalfPi),
};

}  // namespace
