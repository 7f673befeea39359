#include "harness.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;

void transverse_mercator() {
  double A0, A2, A4, A6, A8, M0, B2, B4, B6;
  TWstatus word = 0;
  TWt_merc_c(kE, 0, 0, &A0, &A2, &A4, &A6, &A8, &M0, &B2, &B4, &B6, &word);
  add({"Transverse Mercator",
       -3.5,
       -80,
       3.5,
       80,
       kA,
       {"+proj=tmerc +ellps=GRS80", "+proj=tmerc +approx +ellps=GRS80"},
       TW_CALL(TWt_merc_f(kE, 0, A0, A2, A4, A6, A8, M0, n, in, out, &status)),
       TW_CALL(TWt_merc_i(kE, 0, 0, A0, M0, B2, B4, B6, n, in, out, &status)),
       TW_CALL(TWt_merc_s(kE, 1, 0, n, in, out, &status))});
}

void cassini() {
  double c0, c2, c4, c6, c8, m0, d2, d4, d6, d8;
  TWcassini_c(kE, 0, 0, &c0, &c2, &c4, &c6, &c8, &m0, &d2, &d4, &d6, &d8);
  add({"Cassini",
       -3,
       -80,
       3,
       80,
       kA,
       {"+proj=cass +ellps=GRS80"},
       TW_CALL(TWcassini_f(kE, 0, c0, c2, c4, c6, c8, m0, n, in, out, &status)),
       TW_CALL(TWcassini_i(kE, 0, c0, m0, d2, d4, d6, d8, n, in, out, &status)),
       {}});
}

const Suite suite([] {
  add({"Mercator",
       -179,
       -85,
       179,
       85,
       kA,
       {"+proj=merc +ellps=GRS80"},
       TW_CALL(TWmerc_f(kE, 0, 0, n, in, out, &status)),
       TW_CALL(TWmerc_i(kE, 0, 0, n, in, out, &status)),
       TW_CALL(TWmerc_s(kE, 1, n, in, out, &status))});
  add({"Miller",
       -179,
       -89,
       179,
       89,
       kA,
       {"+proj=mill +R=6378137"},
       TW_CALL(TWmiller_cyl_f(in, n, 0, 0, out, &status)),
       TW_CALL(TWmiller_cyl_i(in, n, 0, 0, out, &status)),
       TW_CALL(TWmiller_cyl_s(in, n, 1, out, &status))});
  add({"Equirectangular",
       -179,
       -89,
       179,
       89,
       kA,
       {"+proj=eqc +R=6378137"},
       TW_CALL(TWcyl_eqr_f(0, 0, 1, n, in, out, &status)),
       TW_CALL(TWcyl_eqr_i(0, 0, 1, n, in, out, &status)),
       TW_CALL(TWcyl_eqr_s(1, 1, n, in, out, &status))});
  transverse_mercator();
  cassini();
});

}  // namespace
