#include <cmath>
#include <string>

#include "harness.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

using namespace tidewater::bench;

namespace {

constexpr double kE = 0.0818191910428158;  // GRS 80
constexpr double kA = 6378137;
constexpr double kDegree = 0.017453292519943295;
constexpr double kLon0 = 10 * kDegree;

void stereographic(const std::string& name, const std::string& definition, double lon0, double lat0,
                   double west, double south, double east, double north) {
  double C, m0, chi0;
  TWstatus word = 0;
  TWstereo_c(kE, lat0, &C, &m0, &chi0, &word);
  add({name,
       west,
       south,
       east,
       north,
       kA,
       {definition},
       TW_CALL(TWstereo_f(kE, lon0, lat0, C, m0, chi0, n, in, out, &status)),
       TW_CALL(TWstereo_i(kE, lon0, lat0, C, m0, chi0, n, in, out, &status)),
       TW_CALL(TWstereo_s(kE, 1, lon0, lat0, C, m0, chi0, n, in, out, &status))});
}

void double_stereographic() {
  const double lon0 = 25 * kDegree;
  double chi_g, c, t, C, m0, chi0;
  TWstatus word = 0;
  TWstereo3_c(kE, 46 * kDegree, &chi_g, &c, &t, &C, &m0, &chi0, &word);
  // The peer scales by the Gaussian radius of the sphere.
  const double s = 0.7193398003386512;  // sin 46
  const double radius = kA * std::sqrt(1 - kE * kE) / (1 - kE * kE * s * s);
  add({"Double stereographic",
       15,
       36,
       35,
       56,
       radius,
       {"+proj=sterea +ellps=GRS80 +lat_0=46 +lon_0=25 +k_0=1"},
       TW_CALL(TWstereo3_f(kE, lon0, chi_g, c, t, C, m0, chi0, n, in, out, &status)),
       TW_CALL(TWstereo3_i(kE, lon0, chi_g, c, t, C, m0, chi0, n, in, out, &status)),
       {}});
}

void equal_area() {
  const double lat0 = 52 * kDegree;
  double e2, q1, qp, rq, m1, sin_b1, cos_b1, sin_lat0, cos_lat0, d;
  TWstatus word = 0;
  TWlam_az_eq_c(kE, kLon0, lat0, &e2, &q1, &qp, &rq, &m1, &sin_b1, &cos_b1, &sin_lat0, &cos_lat0,
                &d, &word);
  add({"Azimuthal equal-area",
       -30,
       30,
       50,
       75,
       kA,
       {"+proj=laea +ellps=GRS80 +lat_0=52 +lon_0=10"},
       TW_CALL(TWlam_az_eq_f(in, n, kE, kLon0, lat0, e2, q1, qp, rq, m1, sin_b1, cos_b1, sin_lat0,
                             cos_lat0, d, out, &status)),
       TW_CALL(TWlam_az_eq_i(in, n, kE, kLon0, lat0, e2, qp, rq, sin_b1, cos_b1, sin_lat0, cos_lat0,
                             d, out, &status)),
       TW_CALL(
           TWlam_az_eq_s(in, n, kLon0, lat0, kE, e2, qp, 1, sin_lat0, cos_lat0, out, &status))});
}

void equidistant() {
  const double lat0 = 52 * kDegree;
  double n1, g;
  TWaz_eq_c(kE, lat0, &n1, &g);
  add({"Azimuthal equidistant",
       0,
       42,
       20,
       62,
       kA,
       {"+proj=aeqd +ellps=GRS80 +lat_0=52 +lon_0=10"},
       TW_CALL(TWaz_eq_f(kE, kLon0, lat0, n1, g, n, in, out, &status)),
       TW_CALL(TWaz_eq_i(kE, kLon0, lat0, n1, n, in, out, &status)),
       TW_CALL(TWaz_eq_s(kLon0, lat0, 1, n, in, out, &status))});
}

void gnomonic() {
  const double lat0 = 40 * kDegree;
  double c, s;
  TWstatus word = 0;
  TWgnomon_c(lat0, &c, &s, &word);
  add({"Gnomonic",
       -10,
       25,
       30,
       55,
       kA,
       {"+proj=gnom +R=6378137 +lat_0=40 +lon_0=10"},
       TW_CALL(TWgnomon_f(kLon0, lat0, c, s, n, out, in, &status)),
       TW_CALL(TWgnomon_i(kLon0, lat0, c, s, n, in, out, &status)),
       TW_CALL(TWgnomon_s(kLon0, lat0, 1, c, s, n, in, out, &status))});
}

void orthographic() {
  const double lat0 = 40 * kDegree;
  struct {
    double x, y, z, r[9];
  } o = {};
  TWstatus word = 0;
  TWortho_c(kE, kLon0, lat0, &o.x, &o.y, &o.z, o.r, &word);
  add({"Orthographic",
       -10,
       25,
       30,
       55,
       kA,
       {"+proj=ortho +ellps=GRS80 +lat_0=40 +lon_0=10"},
       TW_CALL(TWortho_f(kA, kE, kLon0, lat0, o.x, o.y, o.z, o.r, n, in, out, &status)),
       TW_CALL(TWortho_i(kA, kE, kLon0, lat0, o.x, o.y, o.z, o.r, n, in, out, &status)),
       {}});
}

// The peer knows the sphere, and points on it.
void perspective() {
  const double lat0 = 40 * kDegree, height = 2e6;
  double p, phi_g;
  TWstatus word = 0;
  TWpersp_c(kA, 0, lat0, height, 0, &p, &phi_g, &word);
  add({"Vertical perspective, sphere",
       -10,
       25,
       30,
       55,
       kA,
       {"+proj=nsper +R=6378137 +h=2000000 +lat_0=40 +lon_0=10"},
       TW_CALL(TWpersp_vert_f(kA, 0, kLon0, lat0, 0, height, p, phi_g, n, in, out, &status)),
       TW_CALL(TWpersp_vert_i(kA, 0, kLon0, lat0, 0, height, p, phi_g, n, in, out, &status)),
       {}});
}

void chamberlin() {
  struct Triangle {
    CoordinateTriple control[3];
    double sides[3], azimuths[3];
    CoordinateTriple plane[3];
  };
  Triangle t = {{{-150 * kDegree, 55 * kDegree, 0},
                 {-35 * kDegree, 55 * kDegree, 0},
                 {-92.5 * kDegree, 10 * kDegree, 0}},
                {},
                {},
                {}};
  double lon_c = -92.5 * kDegree, lat_c = 40 * kDegree, rotation = 90 * kDegree;
  TWstatus word = 0;
  TWchamtri_c(nullptr, 0, 1, 0, t.control, t.sides, t.azimuths, t.plane, &lon_c, &lat_c, &rotation,
              &word);
  add({"Chamberlin trimetric, sphere",
       -130,
       15,
       -60,
       55,
       6371007,
       {"+proj=chamb +lat_1=55 +lon_1=-150 +lat_2=55 +lon_2=-35 +lat_3=10 +lon_3=-92.5 "
        "+lon_0=-92.5 +R=6371007"},
       TW_CALL(TWchamtri_f(0, t.control, t.sides, t.azimuths, t.plane, n, in, out, &status)),
       {},
       {},
       {},
       false});
}

const Suite suite([] {
  stereographic("Stereographic, polar", "+proj=stere +ellps=GRS80 +lat_0=90 +k_0=1", 0,
                90 * kDegree, -179, 60, 179, 89);
  stereographic("Stereographic, oblique", "+proj=stere +ellps=GRS80 +lat_0=46 +lon_0=25 +k_0=1",
                25 * kDegree, 46 * kDegree, 15, 36, 35, 56);
  double_stereographic();
  equal_area();
  equidistant();
  gnomonic();
  orthographic();
  perspective();
  chamberlin();
});

}  // namespace
