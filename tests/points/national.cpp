// Laborde, Malaya, Bonne, oblique Lambert and Krovak.

#include <array>

#include "points/operations.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80

struct Bonne {
  double e, lat1, e2 = 0, c1 = 0, r0 = 0;

  Bonne(double eccentricity, double parallel) : e(eccentricity), lat1(parallel) {
    TWstatus status;
    TWbonne_c(e, &lat1, &e2, &c1, &r0, &status);
  }
};

Operation bonne_forward(const char* name, const Bonne& k) {
  return {name, geographic(-180, -90), geographic(180, 90),
          [k](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWbonne_f(0.3, k.lat1, k.e, k.e2, k.c1, k.r0, n, in, out, status);
          }};
}

Operation bonne_inverse(const char* name, const Bonne& k) {
  return {name,
          {-1.5, -1.2, 0},
          {1.5, 1.2, 0},
          [k](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWbonne_i(0.3, k.lat1, k.e, k.e2, k.c1, k.r0, n, in, out, status);
          }};
}

Operation bonne_scale(const char* name, const Bonne& k) {
  return {name, geographic(-180, -90), geographic(180, 90),
          [k](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
            TWbonne_s(0.9996, k.lat1, 0.3, k.e2, k.r0, n, in, out, status);
          }};
}

struct Laborde {
  double chi0, c, t, R, A0, A2, A4, A6, A8, M0, B2, B4, B6, A, B, C, D;

  Laborde() {
    TWstatus status;
    TWlaborde_c(kE, 0.8, -0.33, 0.33, &chi0, &c, &t, &R, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4,
                &B6, &A, &B, &C, &D, &status);
  }
};

Operation laborde_inverse(const char* name, int16_t mode, double reach) {
  return {name,
          {-reach, -reach, 0},
          {reach, reach, 0},
          [mode, k = Laborde()](int32_t n, const CoordinateTriple* in, CoordinateTriple* out,
                                TWstatus* status) {
            TWlabor_i(mode, k.A, k.B, k.C, k.D, n, in, out, status);
          }};
}

struct Krovak {
  double pole_lon, pole_lat, lat_r, s_lon, s_lat, offset, C, n_cone, rho0, g_c, g_t;

  Krovak() {
    TWstatus status;
    TWkrovak_c(kE, 0.43, 0.86, 0.2, 0.3, 0.5, 1, &pole_lon, &pole_lat, &lat_r, &s_lon, &s_lat,
               &offset, &C, &n_cone, &rho0, &g_c, &g_t, &status);
  }
};

const Laborde laborde;
const Krovak krovak;

const double* malaya_table() {
  static const std::array<double, 84> table = [] {
    std::array<double, 84> made;
    TWstatus status;
    TWmalaya_c(made.data(), &status);
    return made;
  }();
  return table.data();
}

const Operations national = {
    bonne_forward("TWbonne_f", {kE, 0.7}),
    bonne_forward("TWbonne_f, sphere", {0, 0.7}),
    bonne_forward("TWbonne_f, southern, e = 0.3", {0.3, -0.7}),
    bonne_inverse("TWbonne_i", {kE, 0.7}),
    bonne_inverse("TWbonne_i, southern", {kE, -0.7}),
    bonne_inverse("TWbonne_i, sphere", {0, 0.7}),
    bonne_inverse("TWbonne_i, e = 0.3", {0.3, 0.7}),
    bonne_scale("TWbonne_s", {kE, 0.7}),
    {"TWlabor_f",
     {-0.3, -0.3, 0},
     {0.3, 0.3, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWlabor_f(laborde.A, laborde.B, n, in, out, status);
     }},
    laborde_inverse("TWlabor_i", 0, 0.3),
    laborde_inverse("TWlabor_i, refined", 1, 0.3),
    laborde_inverse("TWlabor_i, refined in vain", 1, 4),
    // The output's third element is an input.
    {"TWlabor_s",
     {-0.3, -0.3, 0.5},
     {0.3, 0.3, 2},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWlabor_s(0.9996, laborde.A, laborde.B, n, in, out, status);
     }},
    {"TWlaborde_f", geographic(30, -40), geographic(60, 0),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       const Laborde& k = laborde;
       TWlaborde_f(kE, 0.8, k.c, k.t, k.A0, k.A2, k.A4, k.A6, k.A8, k.M0, k.A, k.B, n, in, out,
                   status);
     }},
    {"TWlaborde_i",
     {-0.2, -0.2, 0},
     {0.2, 0.2, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       const Laborde& k = laborde;
       TWlaborde_i(kE, 0.8, k.chi0, k.c, k.t, k.A0, k.M0, k.B2, k.B4, k.B6, 1, k.A, k.B, k.C, k.D,
                   n, in, out, status);
     }},
    // In place only: it writes to its input.
    {"TWlaborde_s", geographic(40, -30), geographic(52, -8),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       const Laborde& k = laborde;
       std::vector<CoordinateTriple> copy(in, in + (n > 0 ? n : 0));
       TWlaborde_s(kE, 0.8, k.c, k.t, k.R, k.A0, k.A2, k.A4, k.A6, k.A8, k.M0, k.A, k.B, 0.9995, n,
                   in == out ? out : copy.data(), out, status);
     }},
    {"TWmalaya_f", geographic(100, 0), geographic(105, 8),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmalaya_f(malaya_table(), 1.78, 0.07, n, in, out, status);
     }},
    {"TWmalaya_i",
     {3e5, 0, 0},
     {1e6, 8e5, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       TWmalaya_i(malaya_table(), 1.78, 0.07, n, in, out, status);
     }},
    {"TWo_lam_f", geographic(10, 40), geographic(30, 60),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       const Krovak& k = krovak;
       TWo_lam_f(kE, 0.43, k.lat_r, k.C, k.n_cone, k.rho0, k.s_lon, k.s_lat, 0.1, k.offset, k.g_c,
                 k.g_t, n, in, out, status);
     }},
    // Writes to its input.
    {"TWo_lam_i",
     {-0.3, -0.3, 0},
     {0.3, 0.3, 0},
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       const Krovak& k = krovak;
       std::vector<CoordinateTriple> copy(in, in + (n > 0 ? n : 0));
       TWo_lam_i(kE, 0.43, k.lat_r, k.C, k.n_cone, k.rho0, k.s_lon, k.s_lat, 0.1, k.offset, k.g_c,
                 k.g_t, n, in == out ? out : copy.data(), out, status);
     }},
    {"TWo_lam_s", geographic(10, 40), geographic(30, 60),
     [](int32_t n, const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status) {
       const Krovak& k = krovak;
       TWo_lam_s(kE, 0.9996, 0.43, k.lat_r, k.C, k.n_cone, k.s_lon, k.s_lat, k.offset, k.g_c, k.g_t,
                 n, in, out, status);
     }},
};

}  // namespace
