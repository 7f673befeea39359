// Sinusoidal, Mollweide, Eckert IV.
#include "points/operations.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

using Points = const CoordinateTriple*;

Operation sinusoidal_forward(const char* name, double e) {
  double e2 = 0;
  double m0 = 0;
  TWstatus word = 0;
  TWsinusoidal_c(e, 0.2, &e2, &m0, &word);
  return {name, geographic(-180, -90), geographic(180, 90),
          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
            TWsinusoidal_f(0.3, 0.2, e, e2, m0, n, in, out, status);
          }};
}

Operation sinusoidal_inverse(const char* name, double e) {
  double e2 = 0;
  double m0 = 0;
  TWstatus word = 0;
  TWsinusoidal_c(e, 0.2, &e2, &m0, &word);
  return {name,
          {-1, -1.5, 0},
          {1, 1.2, 0},
          [=](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
            TWsinusoidal_i(0.3, 0.2, e, e2, m0, n, in, out, status);
          }};
}

const Operations pseudocylindrical = {
    sinusoidal_forward("TWsinusoidal_f", kE),
    sinusoidal_forward("TWsinusoidal_f, sphere", 0),
    sinusoidal_forward("TWsinusoidal_f, bad ellipsoid", -0.1),
    sinusoidal_inverse("TWsinusoidal_i", kE),
    sinusoidal_inverse("TWsinusoidal_i, sphere", 0),
    sinusoidal_inverse("TWsinusoidal_i, e = 0.3", 0.3),
    {"TWsinusoidal_s", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWsinusoidal_s(0.9, 0.3, kE * kE, n, in, out, status);
     }},
    {"TWsinusoidal_s, sphere", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWsinusoidal_s(0.9, 0.3, 0, n, in, out, status);
     }},
    // The zero of a parameter keeps its sign.
    {"TWsinusoidal_s, k0 = -0", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWsinusoidal_s(-0.0, 0.3, kE * kE, n, in, out, status);
     }},
    {"TWmollweide_f", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWmollweide_f(0.3, 0.1, n, in, out, status);
     }},
    {"TWmollweide_i",
     {-2.7, -1.5, 0},
     {2.7, 1.3, 0},
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWmollweide_i(0.3, 0.1, n, in, out, status);
     }},
    {"TWeckertIV_f", geographic(-180, -89), geographic(180, 89),
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWeckertIV_f(0.3, 0.1, n, in, out, status);
     }},
    {"TWeckertIV_i",
     {-2.6, -1.4, 0},
     {2.6, 1.2, 0},
     [](int32_t n, Points in, CoordinateTriple* out, TWstatus* status) {
       TWeckertIV_i(0.3, 0.1, n, in, out, status);
     }},
};

}  // namespace
