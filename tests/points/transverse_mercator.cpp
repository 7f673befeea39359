#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

struct Constants {
  double e, lat0, A0, A2, A4, A6, A8, M0, B2, B4, B6;

  Constants(double eccentricity, double origin) : e(eccentricity), lat0(origin) {
    TWstatus status;
    TWt_merc_c(e, 0, lat0, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4, &B6, &status);
  }
};

Operation forward(const char* name, double e) {
  return {name, geographic(-20, -90), geographic(50, 90),
          [k = Constants(e, 0.3)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                  TWstatus* status) {
            TWt_merc_f(k.e, 0.3, k.A0, k.A2, k.A4, k.A6, k.A8, k.M0, n, in, out, status);
          }};
}

Operation inverse(const char* name, double e, double reach) {
  return {name,
          {-reach, -1.8, 0},
          {reach, 1.4, 0},
          [k = Constants(e, 0.3)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                  TWstatus* status) {
            TWt_merc_i(k.e, 0.3, k.lat0, k.A0, k.M0, k.B2, k.B4, k.B6, n, in, out, status);
          }};
}

const Operations transverse_mercator = {
    forward("TWt_merc_f", kE),
    forward("TWt_merc_f, e = 0.3", 0.3),
    inverse("TWt_merc_i", kE, 0.06),
    inverse("TWt_merc_i, far", kE, 1.5),
    inverse("TWt_merc_i, out of reach", kE, 800),
    inverse("TWt_merc_i, e = 0.3", 0.3, 0.3),
    inverse("TWt_merc_i, sphere", 0, 1.5),
    {"TWt_merc_s", geographic(-50, -90), geographic(80, 90),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWt_merc_s(kE, 0.9996, 0.3, n, in, out, status);
     }},
    // The output's third element is an input.
    {"TWt_merc_xyk", geographic(-50, -90, 0.5), geographic(80, 90, 2),
     [k = Constants(kE, 0.3)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                              TWstatus* status) {
       TWt_merc_xyk(k.e, 0.3, k.A0, k.A2, k.A4, k.A6, k.A8, k.M0, 0.9996, n, in, out, status);
     }},
};

}  // namespace
