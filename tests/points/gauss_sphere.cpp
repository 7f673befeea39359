#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

struct Constants {
  double chi0, c, t, R;

  Constants(double e, double lat0) {
    TWstatus status;
    TWgaussII_c(e, lat0, &chi0, &c, &t, &R, &status);
  }
};

Operation forward(const char* name, double e, double lat0) {
  return {name, geographic(-180, -90), geographic(180, 90),
          [e, k = Constants(e, lat0)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                      TWstatus* status) {
            TWgaussII_f(e, 0.3, k.c, k.t, n, in, out, status);
          }};
}

Operation inverse(const char* name, double e, double lat0) {
  return {name, geographic(-180, -90), geographic(180, 90),
          [e, k = Constants(e, lat0)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                      TWstatus* status) {
            TWgaussII_i(e, 0.3, k.c, k.t, n, in, out, status);
          }};
}

// These write to their input.
template <class Call>
Operation scale(const char* name, double e, double lat0, Call call) {
  return {name, geographic(-180, -89), geographic(180, 89),
          [e, k = Constants(e, lat0), call](int32_t n, const CoordinateTriple* in,
                                            CoordinateTriple* out, TWstatus* status) {
            if (in == out) {
              call(e, k, n, out, out, status);
            } else {
              std::vector<CoordinateTriple> copy(in, in + (n > 0 ? n : 0));
              call(e, k, n, copy.data(), out, status);
            }
          }};
}

void gauss_scale(double e, const Constants& k, int32_t n, CoordinateTriple* in,
                 CoordinateTriple* out, TWstatus* status) {
  TWgaussII_s(e, 0.3, k.c, k.t, k.R, 0.9996, n, in, out, status);
}

void schreiber(double e, const Constants& k, int32_t n, CoordinateTriple* in, CoordinateTriple* out,
               TWstatus* status) {
  double A0, A2, A4, A6, A8, M0, B2, B4, B6;
  TWt_merc_c(0, 0, k.chi0, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4, &B6, status);
  TWg_schreiber(e, 0.3, k.c, k.t, k.R, A0, A2, A4, A6, A8, M0, 0.9996, n, in, out, status);
}

const Operations gauss_sphere = {
    forward("TWgaussII_f", kE, 0.9),
    forward("TWgaussII_f, sphere", 0, 0.9),
    forward("TWgaussII_f, e = 0.3", 0.3, -0.6),
    inverse("TWgaussII_i", kE, 0.9),
    inverse("TWgaussII_i, sphere", 0, 0.9),
    inverse("TWgaussII_i, e = 0.3", 0.3, -0.6),
    scale("TWgaussII_s", kE, 0.9, gauss_scale),
    scale("TWgaussII_s, sphere", 0, 0.9, gauss_scale),
    scale("TWgaussII_s, e = 0.3", 0.3, 0.9, gauss_scale),
    scale("TWg_schreiber", kE, 0.9, schreiber),
    {"TWgauII_f",
     {-3, -5, 0},
     {3, 5, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWgauII_f(1.0003, 0.002, n, in, out, status);
     }},
    {"TWgauII_i",
     {-3, -5, 0},
     {3, 5, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWgauII_i(1.0003, 0.002, n, in, out, status);
     }},
};

}  // namespace
