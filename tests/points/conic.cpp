// Lambert conformal, equidistant conic and polyconic.

#include "points/operations.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

struct Lambert {
  double e, C = 0, n = 0, rho0 = 0;

  Lambert(double eccentricity, double lat0, double lat1, double lat2) : e(eccentricity) {
    TWstatus status;
    TWlam_c(e, 0, lat0, lat1, lat2, &C, &n, &rho0, &status);
  }
};

Operation lambert_forward(const char* name, const Lambert& k) {
  return {name, geographic(-180, -89), geographic(180, 89),
          [k](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWlam_f(k.e, -1.7, k.C, k.n, k.rho0, n, in, out, status);
          }};
}

Operation lambert_inverse(const char* name, const Lambert& k) {
  return {name,
          {-1.5, -1.5, 0},
          {1.5, 1.5, 0},
          [k](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWlam_i(k.e, -1.7, k.C, k.n, k.rho0, n, out, in, status);
          }};
}

Operation lambert_scale(const char* name, const Lambert& k) {
  return {name, geographic(-180, -90), geographic(180, 90),
          [k](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWlam_s(k.e, 0.9996, k.C, k.n, n, in, out, status);
          }};
}

struct Equidistant {
  double e, n, G, rho0, C0, C2, C4, C6, C8, D2, D4, D6, D8;

  Equidistant(double eccentricity, double lat1, double lat2) : e(eccentricity) {
    TWstatus status;
    TWconic_c(e, 0.1, lat1, lat2, &n, &G, &rho0, &C0, &C2, &C4, &C6, &C8, &D2, &D4, &D6, &D8,
              &status);
  }
};

Operation equidistant_forward(const char* name, const Equidistant& k) {
  return {name, geographic(-180, -90), geographic(180, 90),
          [k](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWconic_f(-1.7, k.n, k.G, k.rho0, k.C0, k.C2, k.C4, k.C6, k.C8, n, in, out, status);
          }};
}

Operation equidistant_inverse(const char* name, const Equidistant& k) {
  return {name,
          {-1.5, -1, 0},
          {1.5, 1, 0},
          [k](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWconic_i(-1.7, k.n, k.G, k.rho0, k.C0, k.D2, k.D4, k.D6, k.D8, n, in, out, status);
          }};
}

Operation polyconic_inverse(const char* name, double e, CoordinateTriple low,
                            CoordinateTriple high) {
  return {name, low, high,
          [e](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWpolycon_i(e, 0.3, 0.1, n, in, out, status);
          }};
}

const Operations conic = {
    lambert_forward("TWlam_f", {kE, 0.4, 0.5, 0.8}),
    lambert_forward("TWlam_f, southern", {kE, -0.4, -0.5, -0.8}),
    lambert_forward("TWlam_f, e = 0.3", {0.3, 0.4, 0.5, 0.8}),
    lambert_inverse("TWlam_i", {kE, 0.4, 0.5, 0.8}),
    lambert_inverse("TWlam_i, southern", {kE, -0.4, -0.5, -0.8}),
    lambert_inverse("TWlam_i, sphere", {0, 0.4, 0.7, 0.7}),
    lambert_inverse("TWlam_i, at the apex", {kE, 1.5707963267948966, 0.5, 0.8}),
    lambert_inverse("TWlam_i, e = 0.3", {0.3, 0.4, 0.5, 0.8}),
    lambert_scale("TWlam_s", {kE, 0.4, 0.5, 0.8}),
    lambert_scale("TWlam_s, polar", {kE, 0.4, 1.5707963267948966, 1.5707963267948966}),
    equidistant_forward("TWconic_f", {kE, 0.5, 0.8}),
    equidistant_inverse("TWconic_i", {kE, 0.5, 0.8}),
    equidistant_inverse("TWconic_i, southern, e = 0.3", {0.3, -0.5, -0.8}),
    {"TWconic_s", geographic(-180, -90), geographic(180, 90),
     [k = Equidistant(kE, 0.5, 0.8)](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                     TWstatus* status) {
       TWconic_s(k.e, 0.9996, k.n, k.G, k.C0, k.C2, k.C4, k.C6, k.C8, n, in, out, status);
     }},
    {"TWpolycon_f", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWpolycon_f(kE, 0.3, 0.1, n, in, out, status);
     }},
    polyconic_inverse("TWpolycon_i", kE, {-0.5, -1.4, 0}, {0.5, 1.2, 0}),
    polyconic_inverse("TWpolycon_i, wide", kE, {-3, -2, 0}, {3, 2, 0}),
    polyconic_inverse("TWpolycon_i, e = 0.3", 0.3, {-0.5, -1.4, 0}, {0.5, 1.2, 0}),
    {"TWpolycon_s", geographic(-180, -90), geographic(180, 90),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWpolycon_s(kE, 0.3, 0.9996, n, in, out, status);
     }},
};

}  // namespace
