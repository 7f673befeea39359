#include "points/operations.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

using Points = const CoordinateTriple*;

struct Bipolar {
  double lon_a, lat_a, lat_b, ab, z1, z2, fe, fn, lon_c, lat_c;
  double lon_b, n, k, f, az_ab, az_ba, t, rho_c, z_c, az_c;
  Bipolar() {
    TWstatus word = 0;
    TWbipocc_param(&lon_a, &lat_a, &lat_b, &ab, &z1, &z2, &fe, &fn, &lon_c, &lat_c, &word);
    TWbipocc_c(lon_a, lat_a, lat_b, ab, z1, z2, &lon_b, &n, &k, &f, &az_ab, &az_ba, &t, &rho_c,
               &z_c, &az_c, &word);
  }
};

const Operations bipolar = {
    {"TWbipocc_f", geographic(-120, -50), geographic(-40, 70),
     [b = Bipolar()](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWbipocc_f(b.lon_a, b.lat_a, b.lon_b, b.lat_b, b.az_ab, b.az_ba, b.az_c, b.n, 0, 0, b.t,
                  b.rho_c, b.ab, b.f, n, out, in, status);
     }},
    {"TWbipocc_i",
     {-0.6, -1, 0},
     {0.6, 1, 0},
     [b = Bipolar()](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWbipocc_i(b.lon_a, b.lat_a, b.lon_b, b.lat_b, b.az_ab, b.az_ba, b.az_c, b.n, b.t, b.rho_c,
                  b.ab, b.f, b.lon_c, n, in, out, status);
     }},
    {"TWbipocc_s", geographic(-180, -90), geographic(180, 90),
     [b = Bipolar()](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWbipocc_s(0, 0, 0.9, b.lon_a, b.lat_a, b.lon_b, b.lat_b, b.n, b.f, b.az_ba, n, in, out,
                  status);
     }},
};

}  // namespace
