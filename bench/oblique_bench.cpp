#include <array>
#include <cmath>

#include "harness.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kDegree = 0.017453292519943295;

void oblique_mercator() {
  double lat0 = 40 * kDegree, alpha = 35 * kDegree, B, A, E, lon0, gamma0;
  TWstatus word = 0;
  TWo_merc_c(0, kE, -120 * kDegree, 0, 0, 0, &lat0, &alpha, &B, &A, &E, &lon0, &gamma0, &word);
  add({"Oblique Mercator",
       -135,
       20,
       -105,
       60,
       kA,
       {"+proj=omerc +lat_0=40 +lonc=-120 +alpha=35 +no_uoff +ellps=GRS80"},
       TW_CALL(TWo_merc_f(kE, alpha, gamma0, lon0, E, B, A, n, in, out, &status)),
       TW_CALL(TWo_merc_i(kE, alpha, gamma0, lon0, E, B, A, n, in, out, &status)),
       TW_CALL(TWo_merc_s(kE, 1, alpha, gamma0, lon0, E, B, A, n, in, out, &status))});
}

void skew_orthomorphic() {
  const double skew = std::asin(-0.6);
  double A, B, C, lon0;
  TWstatus word = 0;
  TWrso_c(kE, 102.25 * kDegree, 4 * kDegree, skew, &A, &B, &C, &lon0, &word);
  add({"Skew orthomorphic",
       90,
       -10,
       115,
       20,
       kA,
       {"+proj=omerc +lat_0=4 +lonc=102.25 +gamma=-36.869897645844021 +no_uoff +ellps=GRS80"},
       TW_CALL(TWrso_f(lon0, skew, A, B, C, kE, n, in, out, &status)),
       TW_CALL(TWrso_i(lon0, skew, A, B, C, kE, n, in, out, &status)),
       {}});
}

void space_oblique_mercator() {
  // Landsat 1 to 3, with as many terms as the peer's series.
  constexpr int16_t kTerms = 5;
  constexpr double e = 0.08227185422300325, inc = 1.729481662386221, P = 103.2669323 / 1440;
  double Q, T, W, G, a0, R1, R2, R3, R4, m_sin, m_cos, sum3, sum4;
  std::array<double, kTerms> C, S, X1, X2, X3, X4;
  TWstatus word = 0;
  TWsom_c(e, inc, P, 0, 2.5, kTerms, 201, &Q, &T, &W, &G, &a0, C.data(), S.data(), X1.data(),
          X2.data(), X3.data(), X4.data(), &R1, &R2, &R3, &R4, &m_sin, &m_cos, &sum3, &sum4, &word);
  const double lon_n = 128.87 * kDegree - 15 * 2 * 3.141592653589793 / 251;
  add({"Space oblique Mercator",
       -80,
       20,
       -70,
       60,
       6378206.4,
       {"+proj=lsat +lsat=1 +path=15 +a=6378206.4 +es=0.00676866"},
       TW_CALL(TWsom_f(0, 1, kTerms, lon_n, e, inc, P, 0, 2.5, Q, T, W, G, a0, C.data(), S.data(),
                       X1.data(), X2.data(), X3.data(), X4.data(), R1, R2, R3, R4, m_sin, m_cos,
                       sum3, sum4, n, in, out, 1, &status)),
       TW_CALL(TWsom_i(kTerms, lon_n, e, inc, P, 0, 2.5, Q, T, W, G, a0, C.data(), S.data(),
                       X1.data(), X2.data(), X3.data(), X4.data(), R1, R2, R3, R4, m_sin, m_cos,
                       sum3, sum4, n, in, out, 1, &status)),
       {}});
}

void laborde() {
  const double e = std::sqrt((2 - 1 / 297.0) / 297.0);  // International 1924
  const double lon0 = 46.43720833 * kDegree;
  double chi0, c, t, R, A0, A2, A4, A6, A8, M0, B2, B4, B6, A, B, C, D;
  TWstatus word = 0;
  TWlaborde_c(e, lon0, -18.9 * kDegree, 18.9 * kDegree, &chi0, &c, &t, &R, &A0, &A2, &A4, &A6, &A8,
              &M0, &B2, &B4, &B6, &A, &B, &C, &D, &word);
  add({"Laborde",
       43,
       -26,
       51,
       -12,
       6378388 * R,
       {"+proj=labrd +lat_0=-18.9 +lon_0=46.43720833 +azi=18.9 +ellps=intl"},
       TW_CALL(TWlaborde_f(e, lon0, c, t, A0, A2, A4, A6, A8, M0, A, B, n, in, out, &status)),
       TW_CALL(TWlaborde_i(e, lon0, chi0, c, t, A0, M0, B2, B4, B6, 1, A, B, C, D, n, in, out,
                           &status)),
       {}});
}

void new_zealand() {
  constexpr double e = 0.08199188997902978;  // International 1924
  double lon0, lat0, false_easting, false_northing, k0, y0;
  TWstatus word = 0;
  TWn_zeal_param(&lon0, &lat0, &false_easting, &false_northing, &k0, &word);
  TWn_zeal_c(e, lat0, &y0, &word);
  add({"New Zealand map grid",
       166,
       -48,
       179,
       -34,
       6378388,
       {"+proj=nzmg +ellps=intl"},
       TW_CALL(TWn_zeal_f(e, lon0, 0, y0, n, in, out, &status)),
       TW_CALL(TWn_zeal_i(e, lon0, 0, y0, n, in, out, &status)),
       {},
       [=](CoordinateTriple p) {
         return CoordinateTriple{p.x - false_easting, p.y - false_northing, 0};
       }});
}

void rotated_graticule() {
  const auto globe = box(-179, -89, 179, 89);
  const char* peer = "+proj=ob_tran +o_proj=longlat +o_lon_p=0 +o_lat_p=40 +lon_0=18 +R=1";
  add({"Rotated graticule forward",
       ours(globe, TW_CALL(TWrotgrat_f(0, 0, 0.3, 0.7, 0.2, n, in, out, &status))),
       {"PROJ"},
       {proj(peer, true, globe)},
       {}});
  add({"Rotated graticule inverse",
       ours(globe, TW_CALL(TWrotgrat_i(0, 0, 0.3, 0.7, 0.2, n, in, out, &status))),
       {"PROJ"},
       {proj(peer, false, globe)},
       {}});
}

const Suite suite([] {
  oblique_mercator();
  skew_orthomorphic();
  space_oblique_mercator();
  laborde();
  new_zealand();
  rotated_graticule();
});

}  // namespace
