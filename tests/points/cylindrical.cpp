// Equirectangular, Miller and Cassini.

#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

struct Cassini {
  double e, c0, c2, c4, c6, c8, m0, d2, d4, d6, d8;

  explicit Cassini(double eccentricity) : e(eccentricity) {
    TWcassini_c(e, 0, 0.7, &c0, &c2, &c4, &c6, &c8, &m0, &d2, &d4, &d6, &d8);
  }
};

Operation cassini_forward(const char* name, double e) {
  return {name, geographic(-20, -90), geographic(50, 90),
          [k = Cassini(e)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                           TWstatus* status) {
            TWcassini_f(k.e, 0.3, k.c0, k.c2, k.c4, k.c6, k.c8, k.m0, n, in, out, status);
          }};
}

Operation cassini_inverse(const char* name, double e) {
  return {name,
          {-0.3, -2, 0},
          {0.3, 0.9, 0},
          [k = Cassini(e)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                           TWstatus* status) {
            TWcassini_i(k.e, 0.3, k.c0, k.m0, k.d2, k.d4, k.d6, k.d8, n, in, out, status);
          }};
}

const Operations cylindrical = {
    {"TWcyl_eqr_f", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWcyl_eqr_f(0.3, 0.1, 0.8, n, in, out, status);
     }},
    {"TWcyl_eqr_i",
     {-2.6, -1.6, 0},
     {2.6, 1.5, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWcyl_eqr_i(0.3, 0.1, 0.8, n, in, out, status);
     }},
    {"TWcyl_eqr_s", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWcyl_eqr_s(0.9996, 0.8, n, in, out, status);
     }},
    {"TWmiller_cyl_f", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmiller_cyl_f(in, n, 0.3, 0.1, out, status);
     }},
    {"TWmiller_cyl_i",
     {-3.2, -2.3, 0},
     {3.2, 2.3, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmiller_cyl_i(in, n, 0.3, 0.1, out, status);
     }},
    {"TWmiller_cyl_s", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmiller_cyl_s(in, n, 0.9996, out, status);
     }},
    cassini_forward("TWcassini_f", kE),
    cassini_forward("TWcassini_f, e = 0.3", 0.3),
    cassini_inverse("TWcassini_i", kE),
    cassini_inverse("TWcassini_i, e = 0.3", 0.3),
    // Writes to its input.
    {"TWcassini_s", geographic(-20, -90), geographic(50, 90),
     [k = Cassini(kE)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status) {
       std::vector<CoordinateTriple> copy(in, in + (n > 0 ? n : 0));
       TWcassini_s(k.e, 0.3, 0.9996, k.c0, k.c2, k.c4, k.c6, k.c8, k.m0, n,
                   in == out ? out : copy.data(), out, status);
     }},
};

}  // namespace
