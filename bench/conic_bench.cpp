#include "harness.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kDegree = 0.017453292519943295;

void lambert_conformal() {
  double C, N, rho0;
  TWstatus word = 0;
  TWlam_c(kE, 0, 40 * kDegree, 43 * kDegree, 62 * kDegree, &C, &N, &rho0, &word);
  add({"Lambert conformal",
       -60,
       0,
       60,
       85,
       kA,
       {"+proj=lcc +lat_0=40 +lat_1=43 +lat_2=62 +ellps=GRS80"},
       TW_CALL(TWlam_f(kE, 0, C, N, rho0, n, in, out, &status)),
       TW_CALL(TWlam_i(kE, 0, C, N, rho0, n, out, in, &status)),
       TW_CALL(TWlam_s(kE, 1, C, N, n, in, out, &status))});
}

void albers() {
  double C, N, rho0;
  TWalbers_c(kE, 0, 40 * kDegree, 43 * kDegree, 62 * kDegree, &N, &C, &rho0);
  add({"Albers",
       -60,
       0,
       60,
       80,
       kA,
       {"+proj=aea +lat_0=40 +lat_1=43 +lat_2=62 +ellps=GRS80"},
       TW_CALL(TWalbers_f(kE, 0, N, C, rho0, n, in, out, &status)),
       TW_CALL(TWalbers_i(kE, 0, N, C, rho0, n, in, out, &status)),
       TW_CALL(TWalbers_s(kE, 1, C, N, n, in, out, &status))});
}

void equidistant_conic() {
  double N, G, rho0, C0, C2, C4, C6, C8, D2, D4, D6, D8;
  TWstatus word = 0;
  TWconic_c(kE, 40 * kDegree, 43 * kDegree, 62 * kDegree, &N, &G, &rho0, &C0, &C2, &C4, &C6, &C8,
            &D2, &D4, &D6, &D8, &word);
  add({"Equidistant conic",
       -60,
       0,
       60,
       85,
       kA,
       {"+proj=eqdc +lat_0=40 +lat_1=43 +lat_2=62 +ellps=GRS80"},
       TW_CALL(TWconic_f(0, N, G, rho0, C0, C2, C4, C6, C8, n, in, out, &status)),
       TW_CALL(TWconic_i(0, N, G, rho0, C0, D2, D4, D6, D8, n, in, out, &status)),
       TW_CALL(TWconic_s(kE, 1, N, G, C0, C2, C4, C6, C8, n, in, out, &status))});
}

void polyconic() {
  add({"Polyconic",
       -30,
       -70,
       30,
       70,
       kA,
       {"+proj=poly +ellps=GRS80"},
       TW_CALL(TWpolycon_f(kE, 0, 0, n, in, out, &status)),
       TW_CALL(TWpolycon_i(kE, 0, 0, n, in, out, &status)),
       TW_CALL(TWpolycon_s(kE, 0, 1, n, in, out, &status))});
}

void bonne() {
  double lat1 = 0.7, c1, r0, e2;
  TWstatus word = 0;
  TWbonne_c(kE, &lat1, &e2, &c1, &r0, &word);
  add({"Bonne",
       -175,
       -80,
       175,
       80,
       kA,
       {"+proj=bonne +lat_1=40.107045659157627 +ellps=GRS80"},
       TW_CALL(TWbonne_f(0, lat1, kE, e2, c1, r0, n, in, out, &status)),
       TW_CALL(TWbonne_i(0, lat1, kE, e2, c1, r0, n, in, out, &status)),
       TW_CALL(TWbonne_s(1, lat1, 0, e2, r0, n, in, out, &status))});
}

void imw_polyconic() {
  constexpr double e = 0.0816968312225275;  // Bessel 1841
  double r1, r2, c, p, q, s, t;
  TWstatus word = 0;
  TWIMWmodPoly_c(e, 0, 36 * kDegree, &r1, &r2, &c, &p, &q, &s, &t, &word);
  add({"IMW polyconic",
       -2,
       36,
       2,
       40,
       6377397.155,
       {"+proj=imw_p +lat_1=36 +lat_2=40 +lon_1=2 +ellps=bessel"},
       TW_CALL(TWIMWmodPoly_f(e, 0, 36 * kDegree, r1, r2, c, p, q, s, t, n, in, out, &status)),
       TW_CALL(TWIMWmodPoly_i(e, 0, 36 * kDegree, r1, r2, c, p, q, s, t, n, in, out, &status)),
       {}});
}

void krovak() {
  constexpr double e = 0.0816968312225275;  // Bessel 1841
  constexpr double kRadius = 6380703.6105;  // the conformal sphere's, metres
  const double lon0 = (24 + 50 / 60.0) * kDegree;
  double pole_lon = lon0, pole_lat = 59.75 * kDegree;
  double lat_r, s_lon, s_lat, offset, c, N, rho0, g_c, g_t;
  TWstatus word = 0;
  TWkrovak_c(e, lon0, 49.5 * kDegree, 0, 0, 0, 0, &pole_lon, &pole_lat, &lat_r, &s_lon, &s_lat,
             &offset, &c, &N, &rho0, &g_c, &g_t, &word);
  add({"Krovak",
       12,
       48,
       22,
       51,
       kRadius,
       {"+proj=krovak +lat_0=49.5 +lon_0=24.83333333333333 +alpha=30.28813972222222 +k=0.9999 "
        "+ellps=bessel"},
       TW_CALL(TWo_lam_f(e, lon0, lat_r, c, N, rho0, s_lon, s_lat, 0, offset, g_c, g_t, n, in, out,
                         &status)),
       // the call turns its input, which is its output here
       TW_CALL(TWo_lam_i(e, lon0, lat_r, c, N, rho0, s_lon, s_lat, 0, offset, g_c, g_t, n, out, out,
                         &status)),
       TW_CALL(TWo_lam_s(e, 0.9999, lon0, lat_r, c, N, s_lon, s_lat, offset, g_c, g_t, n, in, out,
                         &status))});
}

void bipolar() {
  double lon_a, lat_a, lat_b, ab, z1, z2, fe, fn, lon_c, lat_c;
  double lon_b, N, k, f, az_ab, az_ba, t, rho_c, z_c, az_c;
  TWstatus word = 0;
  TWbipocc_param(&lon_a, &lat_a, &lat_b, &ab, &z1, &z2, &fe, &fn, &lon_c, &lat_c, &word);
  TWbipocc_c(lon_a, lat_a, lat_b, ab, z1, z2, &lon_b, &N, &k, &f, &az_ab, &az_ba, &t, &rho_c, &z_c,
             &az_c, &word);
  add({"Bipolar oblique conic",
       -110,
       0,
       -70,
       45,
       6371007,
       {"+proj=bipc +ns +R=6371007 +lon_0=0"},
       TW_CALL(TWbipocc_f(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, N, 0, 0, t, rho_c, ab, f,
                          n, out, in, &status)),
       TW_CALL(TWbipocc_i(lon_a, lat_a, lon_b, lat_b, az_ab, az_ba, az_c, N, t, rho_c, ab, f, lon_c,
                          n, in, out, &status)),
       {},
       {},
       false});
}

const Suite suite([] {
  lambert_conformal();
  albers();
  equidistant_conic();
  polyconic();
  bonne();
  imw_polyconic();
  krovak();
  bipolar();
});

}  // namespace
