// What single changed tokens of the projections showed to be held by no other test: places, by
// formulas written out once more, and the last double on either side of a limit.

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <functional>
#include <random>

#include "support/failing_new.hpp"
#include "support/points.hpp"
#include "tidewater/conformal.h"
#include "tidewater/datum.h"
#include "tidewater/lines.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

constexpr double kHalf = kPi / 2;
constexpr double kE = 0.0818191910428158;

// --- Chamberlin ---------------------------------------------------------------------------------

// Distance and azimuth (0 to a whole turn) on the unit sphere, by the cosines of sides.
struct Arc {
  long double distance, azimuth;

  Arc(const CoordinateTriple& p, const CoordinateTriple& q) {
    const long double lat1 = p.y, lat2 = q.y, dl = static_cast<long double>(q.x) - p.x;
    distance =
        std::acos(std::sin(lat1) * std::sin(lat2) + std::cos(lat1) * std::cos(lat2) * std::cos(dl));
    azimuth = std::atan2(
        std::sin(dl) * std::cos(lat2),
        std::cos(lat1) * std::sin(lat2) - std::sin(lat1) * std::cos(lat2) * std::cos(dl));
    if (azimuth < 0) azimuth += 2 * std::acos(-1.0L);
  }
};

double arc_azimuth(const CoordinateTriple& p, const CoordinateTriple& q) {
  return static_cast<double>(Arc(p, q).azimuth);
}

// As the system's geodesics have it, which hold what is hard by a meridian.
double geodesic_azimuth(const CoordinateTriple& p, const CoordinateTriple& q) {
  double azimuth = 0, back = 0, distance = 0;
  TWstatus status = 0;
  TWgeodesic_inv(p, q, 6000000, 0, &azimuth, &back, &distance, &status);
  return azimuth;
}

using Corners = std::array<CoordinateTriple, 3>;

// From each corner a point lies at its distance, turned from the edge that begins there by the
// angle that the cosine rule of the plane gives, to the side on which its azimuth points.
CoordinateTriple mean_of_three(const Corners& control, const std::array<double, 3>& sides,
                               const std::array<double, 3>& azimuths, const Corners& plane,
                               const CoordinateTriple& p,
                               double (*azimuth)(const CoordinateTriple&,
                                                 const CoordinateTriple&) = arc_azimuth) {
  constexpr long double kHalfTurn = 3.141592653589793238462643383279502884L;
  long double x = 0, y = 0;
  for (std::size_t j = 0; j < 3; ++j) {
    const std::size_t next = (j + 1) % 3;
    const long double d = Arc(control[j], p).distance;
    const long double other = Arc(control[next], p).distance;
    const long double side = sides[j];
    const long double angle = std::acos((d * d + side * side - other * other) / (2 * side * d));
    const long double turn = static_cast<long double>(azimuth(control[j], p)) - azimuths[j];
    const bool left = (turn > -kHalfTurn && turn < 0) || turn > kHalfTurn;
    const long double edge = std::atan2(static_cast<long double>(plane[next].y) - plane[j].y,
                                        static_cast<long double>(plane[next].x) - plane[j].x);
    // The plane's edges are as long as the sphere's.
    x += plane[j].x + d * std::cos(edge + (left ? angle : -angle));
    y += plane[j].y + d * std::sin(edge + (left ? angle : -angle));
  }
  return {static_cast<double>(x / 3), static_cast<double>(y / 3), p.z};
}

TEST(Chamberlin, PlacesOfTheSphere) {
  const Corners control = {{{-1.9, 0.96, 0}, {-1.2, 0.35, 0}, {-2.2, 0.35, 0}}};
  for (const bool turned : {false, true}) {
    const Corners corners = turned ? Corners{control[0], control[2], control[1]} : control;
    std::array<double, 3> sides = {}, azimuths = {};
    Corners plane = {};
    double lon_c = -1.8, lat_c = 0.6, rotation = 0.3;
    TWstatus status = 0;
    TWchamtri_c(nullptr, 0, 1, 0, corners.data(), sides.data(), azimuths.data(), plane.data(),
                &lon_c, &lat_c, &rotation, &status);
    ASSERT_EQ(status, TW_SUCCESS);
    std::mt19937 random(3);
    std::uniform_real_distribution<double> lon(-3, -0.6), lat(-0.6, 1.5);
    Points in(1000), out = untouched(1000);
    for (CoordinateTriple& p : in) p = {lon(random), lat(random), 7};
    TWchamtri_f(0, corners.data(), sides.data(), azimuths.data(), plane.data(), 1000, in.data(),
                out.data(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
    int inside = 0;
    for (std::size_t i = 0; i < in.size(); ++i) {
      const CoordinateTriple p = mean_of_three(corners, sides, azimuths, plane, in[i]);
      if (std::isnan(p.x)) continue;  // no triangle of the plane has these sides
      ++inside;
      expect_near(out[i], p.x, p.y, 7, 1e-13);
    }
    EXPECT_GT(inside, 800);
  }
}

TEST(Chamberlin, TheSideOfAPointStraightBehindAnEdge) {
  // The edge points due north, the point lies due south: by contract that is the right-hand side,
  // as is a point straight ahead.  Sides of the caller's own give the angle a sine.
  const Corners control = {{{0.2, 0.4, 0}, {0.2, 0.7, 0}, {0.5, 0.5, 0}}};
  const std::array<double, 3> azimuths = {0, 1, 2};
  const Corners plane = {{{0, 0, 0}, {3, 5, 0}, {2, -1, 0}}};
  const auto place = [&](double azimuth) {
    const std::array<double, 3> all = {azimuth, azimuths[1], azimuths[2]};
    const std::array<double, 3> sides = {0.35, 0.4, 0.4};
    const CoordinateTriple p = {0.2, 0.3, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWchamtri_f(0, control.data(), sides.data(), all.data(), plane.data(), 1, &p, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return out;
  };
  const CoordinateTriple behind = place(0);
  const CoordinateTriple right = place(1e-3);  // the azimuth is less than half a turn from the edge
  const CoordinateTriple left = place(-1e-3);
  EXPECT_EQ(behind.x, right.x);
  EXPECT_EQ(behind.y, right.y);
  // Distances of 0.1 and 0.4: a cosine of -0.39, and a third of 0.1 times its sine on either side.
  EXPECT_GT(std::fabs(left.x - right.x), 0.05);
}

TEST(Chamberlin, HardByACornersMeridianTheGeodesicTells) {
  // An edge due north and sides of the caller's own make the side of the point count.
  const Corners control = {{{0.2, 0.4, 0}, {0.2, 0.7, 0}, {0.5, 0.5, 0}}};
  const std::array<double, 3> azimuths = {0, 1, 2};
  const Corners plane = {{{0, 0, 0}, {0.2, std::sqrt(0.1225 - 0.04), 0}, {0.4, -0.02, 0}}};
  const std::array<double, 3> lengths = {0.35, std::hypot(0.2, plane[1].y + 0.02),
                                         std::hypot(0.4, 0.02)};
  for (const double dl : {-2e-9, -9e-10, -1e-10, -1e-13, 0.0, 1e-13, 1e-10, 9e-10, 2e-9}) {
    for (const double lat : {0.3, 0.75}) {
      const CoordinateTriple p = {0.2 + dl, lat, 3};
      CoordinateTriple out = {};
      TWstatus status = 0;
      TWchamtri_f(0, control.data(), lengths.data(), azimuths.data(), plane.data(), 1, &p, &out,
                  &status);
      EXPECT_EQ(status, TW_SUCCESS);
      const CoordinateTriple expected =
          mean_of_three(control, lengths, azimuths, plane, p, geodesic_azimuth);
      expect_near(out, expected.x, expected.y, 3, 1e-8);
    }
  }
}

TEST(Chamberlin, NoPointIsASuccess) {
  const Corners control = {{{0.2, 0.4, 0}, {0.2, 0.7, 0}, {0.5, 0.5, 0}}};
  const std::array<double, 3> three = {0.3, 0.4, 0.4};
  TWstatus status = 77;
  CoordinateTriple out = kUntouchedPoint;
  TWchamtri_f(0, control.data(), three.data(), three.data(), control.data(), 0, &out, &out,
              &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_untouched(out);
}

// --- Hotine -------------------------------------------------------------------------------------

struct Hotine {
  double e = kE, alpha = 0.7, lat0 = 0.6, B = 0, A = 0, E = 0, lon0 = 0, gamma0 = 0;

  explicit Hotine(double azimuth = 0.7) : alpha(azimuth) {
    TWstatus status = 0;
    TWo_merc_c(0, e, 0.3, 0, 0, 0, &lat0, &alpha, &B, &A, &E, &lon0, &gamma0, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  CoordinateTriple skew(double lon, double lat) const {
    const CoordinateTriple in = {lon, lat, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWo_merc_uv_k(e, alpha, gamma0, lon0, E, B, A, 0, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return out;
  }
  CoordinateTriple back(double u, double v) const {
    const CoordinateTriple in = {v * std::cos(alpha) + u * std::sin(alpha),
                                 u * std::cos(alpha) - v * std::sin(alpha), 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWo_merc_i(e, alpha, gamma0, lon0, E, B, A, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return out;
  }
};

TEST(ObliqueMercator, ThePolesFormulasBeginAtTheirLimit) {
  const Hotine h;
  double within = kHalf - 1e-10;
  while (kHalf - within >= 1e-10) within = std::nextafter(within, 2);
  const double beyond = std::nextafter(within, 0);
  // At the pole u is lat A / B whatever the longitude; short of it u takes the longitude's part.
  for (const double sign : {1.0, -1.0}) {
    EXPECT_EQ(h.skew(h.lon0 + 0.5, sign * within).x, sign * within * (h.A / h.B));
    EXPECT_NE(h.skew(h.lon0 + 0.5, sign * beyond).x, sign * beyond * (h.A / h.B));
  }
}

TEST(ObliqueMercator, WhereTheCosineVanishes) {
  // cos(B dl) of 0.9e-10 is none, of 1.1e-10 is one.
  const Hotine h;
  const auto u = [&](double cosine) { return h.skew(h.lon0 + (kHalf - cosine) / h.B, 0.4).x; };
  EXPECT_NEAR(u(1.1e-10), kHalf * h.A / h.B, 1e-9);
  EXPECT_NEAR(u(0.9e-10), kHalf * h.A, 1e-9);  // dl A B, by contract
  EXPECT_GT(std::fabs(h.A / h.B - h.A), 1e-5);
}

TEST(ObliqueMercator, TheInverseOfThePoles) {
  // There sin(u B / A) = 1 and v has exp(-v B / A) = tan(gamma0) + 1 / cos(gamma0), or its inverse.
  const Hotine h;
  const double u = kHalf * h.A / h.B;
  const double v = -std::log(std::tan(h.gamma0) + 1 / std::cos(h.gamma0)) * h.A / h.B;
  CoordinateTriple p = h.back(u, v);
  expect_near(p, h.lon0, kHalf, 0);
  p = h.back(-u, -v);
  expect_near(p, h.lon0, -kHalf, 0);
}

TEST(ObliqueMercator, ADistanceThatRoundsBelowOneIsHeld) {
  // On the equator D = B sqrt(1 - e^2) is 1 in exact arithmetic, and E = D + sqrt(D^2 - 1) too.
  int below = 0;
  for (int i = 1; i < 300; ++i) {
    const double e = 0.001 * i, e2 = e * e;
    double lat0 = 0, alpha = 0.7, B = 0, A = 0, E = 0, lon0 = 0, gamma0 = 0;
    TWstatus status = 0;
    TWo_merc_c(0, e, 0.3, 0, 0, 0, &lat0, &alpha, &B, &A, &E, &lon0, &gamma0, &status);
    EXPECT_EQ(status, TW_SUCCESS) << e;
    EXPECT_NEAR(E, 1, 1e-7) << e;
    EXPECT_NEAR(gamma0, 0.7, 1e-14) << e;
    const double D = std::sqrt(1 + e2 / (1 - e2)) * std::sqrt(1 - e2);
    below += D * D < 1;
  }
  EXPECT_GT(below, 10);
}

// --- Stereographic ------------------------------------------------------------------------------

TEST(Stereographic, TheSecantsStartAtFortyFiveDegrees) {
  // Up to 45 degrees it starts 15 degrees nearer to the equator, beyond at the equator: over a
  // hundred scales the two roads do not end in the same doubles, and the last latitude of the first
  // road is 45 degrees itself.
  constexpr double kFortyFive = 0.7853981633974483;
  const auto root = [](double lat0, double k0) {
    double C = 0, m0 = 0, chi0 = 0, lat = kUntouched;
    TWstatus status = 0;
    TWstereo_c(kE, lat0, &C, &m0, &chi0, &status);
    TWstereo_sTlat(kE, 0.2, lat0, C, m0, chi0, k0, &lat, &status);
    return lat;
  };
  const auto stated = [](double lat0, double k0, double other) {
    double C = 0, m0 = 0, chi0 = 0;
    TWstatus status = 0;
    TWstereo_c(kE, lat0, &C, &m0, &chi0, &status);
    const auto f = [&](double lat) {
      CoordinateTriple p = {0.2, lat, 0};
      return TWstereo_s(kE, k0, 0.2, lat0, C, m0, chi0, 1, &p, &p, &status) - 1;
    };
    double at = lat0;
    double f_at = f(at), f_other = f(other);
    if (std::fabs(f_other) <= std::fabs(f_at)) {
      std::swap(at, other);
      std::swap(f_at, f_other);
    }
    for (int pass = 0; pass < 30; ++pass) {
      const double d = -(other - at) * f_at / (f_other - f_at);
      other = at;
      f_other = f_at;
      at += d;
      if (std::fabs(at) > kHalf) return kNaN;  // over a pole: another test's
      f_at = f(at);
      if (std::fabs(d) <= 1e-9 || f_at == 0) break;
    }
    return C == 0 ? std::fabs(at - lat0) : at;
  };
  for (const double sign : {1.0, -1.0}) {
    int told_apart = 0;
    for (double k0 = 0.9; k0 < 0.999; k0 += 0.001) {
      const double near = sign * kFortyFive;
      const double beyond = sign * std::nextafter(kFortyFive, 1);
      const double by_fifteen = stated(near, k0, near - sign * 0.2617993877991494);
      const double by_equator = stated(near, k0, 0);
      if (std::isnan(by_fifteen) || std::isnan(by_equator)) continue;
      told_apart += by_fifteen != by_equator;
      EXPECT_EQ(root(near, k0), by_fifteen) << k0;
      EXPECT_EQ(root(beyond, k0), stated(beyond, k0, 0)) << k0;
    }
    EXPECT_GT(told_apart, 20);
  }
}

TEST(Stereographic, TheOriginAndThePolesTakeTheCentralMeridian) {
  double C = 0, m0 = 0, chi0 = 0;
  TWstatus status = 0;
  TWstereo_c(kE, 0.7, &C, &m0, &chi0, &status);
  const auto lon = [&](double x, double y) {
    const CoordinateTriple in = {x, y, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstereo_i(kE, 0.25, 0.7, C, m0, chi0, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return out.x;
  };
  double within = 1e-12;  // the last distance below the limit
  while (!(std::sqrt(within * within) < 1e-12)) within = std::nextafter(within, 0);
  EXPECT_EQ(lon(within, 0), 0.25);
  EXPECT_NE(lon(std::nextafter(within, 1), 0), 0.25);
}

TEST(Stereographic, AQuarterOfTheGlobeFromTheOrigin) {
  // On the sphere about (0, 0) the quarter lies 2 away: the quotient of the arc tangent is one by
  // 0.
  double C = 0, m0 = 0, chi0 = 0;
  TWstatus status = 0;
  TWstereo_c(0, 0, &C, &m0, &chi0, &status);
  for (const double side : {1.0, -1.0}) {
    const CoordinateTriple in = {2 * side, 0, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstereo_i(0, 0.25, 0, C, m0, chi0, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out, 0.25 + side * kHalf, 0, 1e-15);
  }
}

// --- Cassini: the printed series with a flattening that shows every term ------------------------

TEST(Cassini, PrintedSeries) {
  constexpr double e = 0.4, lon0 = 0.1, m0 = 0.2;
  constexpr double c0 = 0.9, c2 = 0.1, c4 = 0.02, c6 = -0.03, c8 = 0.01;  // the caller's own
  constexpr double d2 = 0.08, d4 = -0.03, d6 = 0.02, d8 = -0.01;
  for (const double lat : {-1.2, -0.3, 0.4, 1.1}) {
    const CoordinateTriple in = {0.7, lat, 5};
    CoordinateTriple out = in;
    TWstatus status = 0;
    TWcassini_f(e, lon0, c0, c2, c4, c6, c8, m0, 1, &in, &out, &status);
    const long double e2 = static_cast<long double>(e) * e, p = lat;
    const long double s = std::sin(p), c = std::cos(p), t = s / c, u = std::cos(2 * p);
    const long double m = c0 * p + std::sin(2 * p) * (c2 + c4 * u + c6 * u * u + c8 * u * u * u);
    const long double nu = 1 / std::sqrt(1 - e2 * s * s), T = t * t;
    const long double C = e2 * (1 - s * s) / (1 - e2),
                      A = (in.x - static_cast<long double>(lon0)) * c;
    const long double A3 = A * A * A;
    const long double x = (A - A3 * T / 6 - (8 - T + 8 * C) * A3 * A * A * T / 120) * nu;
    const long double y = ((5 - T + 6 * C) * A3 * A / 24 + A * A / 2) * t * nu + (m - m0);
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out, static_cast<double>(x), static_cast<double>(y), 5, 1e-15);

    const CoordinateTriple plane = {0.3, lat, 5};
    TWcassini_i(e, lon0, c0, m0, d2, d4, d6, d8, 1, &plane, &out, &status);
    const long double f = (m0 + p) / c0, w = std::cos(2 * f);
    const long double q = (((d8 * w + d6) * w + d4) * w + d2) * std::sin(2 * f) + f;
    const long double tq = std::tan(q), Tq = tq * tq, W = 1 - std::sin(q) * std::sin(q) * e2;
    const long double nuq = 1 / std::sqrt(W), rho = (1 - e2) / std::sqrt(W * W * W);
    const long double D = plane.x / nuq, Q = 3 * Tq + 1, D2 = D * D;
    const long double lon = (Q * D2 * D2 * D * Tq / 15 + D - D2 * D * Tq / 3) / std::cos(q) + lon0;
    const long double back = q - (D2 / 2 - Q * D2 * D2 / 24) * tq * nuq / rho;
    EXPECT_EQ(status, TW_SUCCESS);
    expect_near(out, static_cast<double>(lon), static_cast<double>(back), 5,
                1e-14 * std::fabs(static_cast<double>(lon)) + 4e-15);
  }
}

TEST(Cassini, TheInversePoleIsATrillionthWide) {
  // Without series the foot is y itself; y = 0 with all of the arc before it is north.
  for (const double m0 : {0.0, kHalf, -kHalf}) {
    const auto back = [&](double foot) {
      const CoordinateTriple in = {0.2, foot - m0, 5};
      CoordinateTriple out = kUntouchedPoint;
      TWstatus status = 0;
      TWcassini_i(kE, 0.1, 1, m0, 0, 0, 0, 0, 1, &in, &out, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      return out;
    };
    for (const double sign : {1.0, -1.0}) {
      const double y = sign * kHalf - m0;
      expect_near(back(sign * kHalf), 0.1, y < 0 ? -kHalf : kHalf, 0);
      if (m0 != 0) continue;
      double edge = kHalf - 1e-12;  // the first foot of the pole
      while (kHalf - edge < 1e-12) edge = std::nextafter(edge, 0);
      while (kHalf - edge >= 1e-12) edge = std::nextafter(edge, 2);
      EXPECT_EQ(back(sign * edge).y, sign * kHalf);
      EXPECT_NE(back(sign * std::nextafter(edge, 0)).y, sign * kHalf);
    }
  }
}

TEST(AzimuthalEqualArea, TheOriginOfAnOblique) {
  // rho = 0 has no azimuth.  On the large flattening the authalic latitude goes there and back.
  for (const double e : {0.0, kE, 0.3}) {
    double e2 = 0, q1 = 0, qp = 0, rq = 0, m1 = 0, sin_b1 = 0, cos_b1 = 0, sin_lat0 = 0;
    double cos_lat0 = 0, D = 0;
    TWstatus status = 0;
    TWlam_az_eq_c(e, 0.25, 0.7, &e2, &q1, &qp, &rq, &m1, &sin_b1, &cos_b1, &sin_lat0, &cos_lat0, &D,
                  &status);
    for (const double y : {0.0, 1e-200}) {  // the square of which is 0
      const CoordinateTriple in = {0, y, 0};
      CoordinateTriple out = kUntouchedPoint;
      TWlam_az_eq_i(&in, 1, e, 0.25, 0.7, e2, qp, rq, sin_b1, cos_b1, sin_lat0, cos_lat0, D, &out,
                    &status);
      EXPECT_EQ(status, TW_SUCCESS);
      expect_near(out, 0.25, 0.7, 1e-12);
    }
  }
}

TEST(AzimuthalEqualArea, APolarMapIsTrueHardByItsPole) {
  for (const double sign : {1.0, -1.0}) {
    double e2 = 0, q1 = 0, qp = 0, rq = 0, m1 = 0, sin_b1 = 0, cos_b1 = 0, sin_lat0 = 0;
    double cos_lat0 = 0, D = 0;
    TWstatus status = 0;
    TWlam_az_eq_c(kE, 0.25, sign * kHalf, &e2, &q1, &qp, &rq, &m1, &sin_b1, &cos_b1, &sin_lat0,
                  &cos_lat0, &D, &status);
    for (const double off : {1e-2, 1e-3, 1e-4, 1e-5, 3e-7}) {
      CoordinateTriple p = {0.3, sign * (kHalf - off), 0};
      TWlam_az_eq_s(&p, 1, 0.25, sign * kHalf, kE, e2, qp, 1, sin_lat0, cos_lat0, &p, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      // What is left of qp - q has 16 digits less those of the square of the distance.
      EXPECT_NEAR(p.x, 1, off * off + 1e-16 / (off * off) * 4);
      EXPECT_NEAR(p.y, 1, off * off + 1e-16 / (off * off) * 4);
    }
  }
}

TEST(AzimuthalEquidistant, TheWholeSphereThereAndBack) {
  // Distance and azimuth of the sphere forward; back, the side of the quarter turn is found again.
  int beyond = 0;
  for (const double lat0 : {0.0, 0.6, -0.6, 1.2, -1.3}) {
    double n1 = 0, g = 0;
    TWaz_eq_c(0, lat0, &n1, &g);
    for (double lon = -3; lon < 3.1; lon += 0.37) {
      for (double lat = -1.5; lat < 1.51; lat += 0.23) {
        const CoordinateTriple in = {0.1 + lon, lat, 0};
        const Arc arc({0.1, lat0, 0}, in);
        if (arc.distance > 3) continue;  // the antipode is a circle
        CoordinateTriple p = in;
        TWstatus status = 0;
        TWaz_eq_f(0, 0.1, lat0, n1, g, 1, &p, &p, &status);
        EXPECT_EQ(status, TW_SUCCESS);
        expect_near(p, static_cast<double>(arc.distance * std::sin(arc.azimuth)),
                    static_cast<double>(arc.distance * std::cos(arc.azimuth)), 1e-12);
        TWaz_eq_i(0, 0.1, lat0, n1, 1, &p, &p, &status);
        EXPECT_EQ(status, TW_SUCCESS);
        expect_near(p, in.x, in.y, 1e-11);
        beyond += std::fabs(lon) > 1.6;
      }
    }
  }
  EXPECT_GT(beyond, 200);
}

// --- Albers -------------------------------------------------------------------------------------

TEST(Albers, WhatTheSpheresFanDoesNotHold) {
  // (C - (rho n)^2) / n is twice the sine of the latitude: the caller's constants bring it
  // beyond 2.
  constexpr double n = 0.5, C = 1.2, rho0 = 1;
  for (const double sine : {1.025, -1.025, 1.05, -1.05}) {
    const double rho = std::sqrt((C / n - 2 * sine) / n);
    const CoordinateTriple in[2] = {{0, rho0 - rho, 3}, {0, 0, 3}};
    CoordinateTriple out[2] = {kUntouchedPoint, kUntouchedPoint};
    TWstatus status = 0;
    TWalbers_i(0, 0.1, n, C, rho0, 2, in, out, &status);
    EXPECT_EQ(status, TW_NOT_CONVERGED) << sine;
    expect_untouched(out[0]);
    expect_untouched(out[1]);
  }
  for (const double sine : {0.999, -0.999}) {
    const double rho = std::sqrt((C / n - 2 * sine) / n);
    CoordinateTriple p = {0, rho0 - rho, 3};
    TWstatus status = 0;
    TWalbers_i(0, 0.1, n, C, rho0, 1, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS) << sine;
    expect_near(p, 0.1, std::asin(sine), 1e-13);
  }
}

TEST(Albers, TheApexIsAHundredThousandthWide) {
  // On the equator of a sphere rho is sqrt(C) for n = 1, and the parallel's radius is 1.
  double edge = 1e-10;  // the last C whose root is 1e-5
  while (std::sqrt(edge) < 1e-5) edge = std::nextafter(edge, 1);
  while (std::sqrt(std::nextafter(edge, 1)) == 1e-5) edge = std::nextafter(edge, 1);
  ASSERT_EQ(std::sqrt(edge), 1e-5);
  double below = edge;
  while (std::sqrt(below) == 1e-5) below = std::nextafter(below, 0);
  const auto scale = [](double C) {
    CoordinateTriple p = {0, 0, 0};
    TWstatus status = 0;
    TWalbers_s(0, 0.5, C, 1, 1, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return p;
  };
  EXPECT_EQ(scale(below).x, 0.5);  // k = h = 1
  EXPECT_EQ(scale(below).y, 0.5);
  const CoordinateTriple p = scale(edge);
  EXPECT_NEAR(p.x, 0.5e-5, 1e-20);
  EXPECT_NEAR(p.y, 0.5e5, 1e-9);
  EXPECT_NEAR(p.z, 0.25, 1e-15);
}

// --- Perspective --------------------------------------------------------------------------------

TEST(Perspective, TenPassesForTheConstants) {
  // On an ellipsoid of no planet they are all used up, and each moves the result.
  constexpr double e2 = 0.8 * 0.8, lat0 = 0.7, height = -0.3;
  const double s = std::sin(lat0), c = std::cos(lat0), n1 = 1 / std::sqrt(1 - s * s * e2);
  double lat = lat0, distance = 0, before = 0;
  for (int pass = 0; pass < 10; ++pass) {
    before = lat;
    distance = c / std::cos(lat) * (height + n1);
    lat = lat0 - std::asin(s * n1 * e2 * c / distance);
  }
  double p = kUntouched, phi_g = kUntouched;
  TWstatus status = 0;
  TWpersp_c(1, 0.8, lat0, height, 0, &p, &phi_g, &status);
  EXPECT_EQ(status, TW_BAD_PARAMETER);
  EXPECT_NEAR(p, distance, 1e-12);
  EXPECT_NEAR(phi_g, lat, 1e-12);
  EXPECT_GT(std::fabs(lat - before), 1e-10);
}

TEST(Perspective, TheSpheresConstants) {
  double p = kUntouched, phi_g = kUntouched;
  TWstatus status = 77;
  TWpersp_c(6371000, 0, 0.7, 500000, 1000, &p, &phi_g, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(p, 501000.0 / 6371000 + 1);
  EXPECT_EQ(phi_g, 0.7);
}

// --- Polyconic ----------------------------------------------------------------------------------

TEST(Polyconic, TheEquatorsScaleEndsAtItsLimit) {
  // By contract the sphere's tangent is 0 / 0 hard by the equator, where the equator's own form,
  // 1 + d^2 / 2, no longer serves.
  const auto h = [](double lat) {
    CoordinateTriple p = {0.2, lat, 0};
    TWstatus status = 0;
    TWpolycon_s(0, 0, 1, 1, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return p.y;
  };
  for (const double sign : {1.0, -1.0}) {
    EXPECT_NEAR(h(sign * std::nextafter(1e-14, 0)), 1.02, 1e-15);
    EXPECT_TRUE(std::isnan(h(sign * 1e-14)));
  }
}

// --- Lambert conformal --------------------------------------------------------------------------

TEST(LambertConformal, HardByTheApexIsTheCentralMeridian) {
  // A cone of n = 1 on the sphere: 5e-14 from the apex the latitude is not yet the pole's, and the
  // angle at the apex counts as none.
  for (const double x : {0.0, 3e-14, -3e-14}) {
    const CoordinateTriple in = {x, 0.5, 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWlam_i(0, 0.25, 1, 1, 0.5 + 5e-14, 1, &out, &in, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(out.x, 0.25) << x;
    EXPECT_NEAR(out.y, kHalf, 1e-12);
  }
}

// --- Bonne --------------------------------------------------------------------------------------

TEST(Bonne, OnlyTheStandardParallelItselfIsTrue) {
  // The scale of the parallel's opposite is that of any other latitude.
  constexpr double lat1 = 0.7, d = 0.4;
  const double r0 = 1 / std::tan(lat1) + lat1;
  const auto h = [&](double lat) {
    CoordinateTriple p = {0.1 + d, lat, 0};
    TWstatus status = 0;
    TWbonne_s(1, lat1, 0.1, 0, r0, 1, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return p.y;
  };
  EXPECT_EQ(h(lat1), 1);
  for (const double lat : {-lat1, 0.3}) {
    const double r = r0 - lat, g = (std::cos(lat) - r * std::sin(lat)) / r * d;
    EXPECT_NEAR(h(lat), std::sqrt(g * g + 1), 1e-15);
    EXPECT_GT(h(lat), 1.001);
  }
}

// --- Sinusoidal ---------------------------------------------------------------------------------

TEST(Sinusoidal, AnOriginBeyondThePoleHasNoArcBeforeIt) {
  // The latitude is the origin's own: no arc is asked for, and none fails.
  const CoordinateTriple in = {0.3, 1.6, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 77;
  TWsinusoidal_f(0.1, 1.6, kE, kE * kE, 0.25, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(out.y, 0);
}

TEST(Sinusoidal, AnArcAHairBeyondTheQuarterIsHeldAndTold) {
  const CoordinateTriple in = {0.2, kHalf + 5e-13, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWsinusoidal_i(0.1, 0, 0, 0, 0, 1, &in, &out, &status);
  EXPECT_EQ(status, TW_I_LATITUDE_LIMITED);
  expect_near(out, 0.1, kHalf, 0);
}

TEST(Sinusoidal, TheCentralMeridianIsTrue) {
  for (double lat = -1.5; lat < 1.6; lat += 0.25) {
    CoordinateTriple p = {0.1, lat, 0};
    TWstatus status = 0;
    TWsinusoidal_s(1, 0.1, kE * kE, 1, &p, &p, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    // The fifth power of n, where the arc's series ends, is 1e-14.
    EXPECT_NEAR(p.x, 1, 1e-13) << lat;
    EXPECT_NEAR(p.y, 1, 1e-13) << lat;
  }
}

// --- Rotated graticule --------------------------------------------------------------------------

TEST(RotatedGraticule, ASineOfOneIsThePole) {
  // A billionth from the pole and from its antipode the sine is 1 to the last bit.
  for (const double sign : {1.0, -1.0}) {
    const CoordinateTriple in = {sign > 0 ? 0.5 : 0.5 + kPi, sign * (0.6 - 1e-9), 0};
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWrotgrat_f(0.1, 0.2, 0.5, 0.6, 0.3, 1, &in, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_EQ(out.y, sign * kHalf);
  }
}

// --- The general inverse, step by step ----------------------------------------------------------

using Plane = std::function<CoordinateTriple(double lon, double lat)>;

// The points at which the map is asked on the way to one target.
Points stated_walk(const Plane& map, double lon, double lat, double x, double y) {
  Points asked;
  const auto image = [&](double at_lon, double at_lat) {
    asked.push_back({at_lon, at_lat, 0});
    return map(at_lon, at_lat);
  };
  double old_lon = lon, old_lat = lat + (lat >= 1.5707913267948965 ? -5e-6 : 5e-6);
  CoordinateTriple p = image(old_lon, old_lat);
  double s = 0.1;
  for (int pass = 0; pass < 100; ++pass) {
    const CoordinateTriple f = image(lon, lat);
    const double dx = x - f.x, dy = y - f.y;
    if (std::fabs(dx) < 1e-14 && std::fabs(dy) < 1e-14) break;
    double d = std::sqrt(dy * dy + dx * dx), angle = std::atan2(dy, dx);
    const double u = std::cos(lat) * (lon - old_lon), v = lat - old_lat;
    if (std::fabs(u) < 1e-14 && std::fabs(v) < 1e-14) break;
    angle += std::atan2(v, u);
    const double ex = f.x - p.x, ey = f.y - p.y;
    if (ex != 0 || ey != 0) {
      angle -= std::atan2(ey, ex);
      s = std::sqrt(u * u + v * v) / std::sqrt(ex * ex + ey * ey);
    }
    old_lon = lon;
    old_lat = lat;
    p = f;
    d = std::min(d * s, kPi);
    const double du = std::cos(angle) * d;
    if (std::fabs(du) < kPi * std::cos(lat)) lon += du / std::cos(lat);
    lat += std::sin(angle) * d;
    while (lat < -kHalf || lat > kHalf) {
      lat = (lat < 0 ? -kPi : kPi) - lat;
      lon += lon >= 0 ? -kPi : kPi;
    }
    for (; lon > kPi; lon -= 2 * kPi) old_lon -= 2 * kPi;
    for (; lon < -kPi; lon += 2 * kPi) old_lon += 2 * kPi;
  }
  asked.push_back({lon, lat, 0});  // the answer
  return asked;
}

TEST(GenericInverse, TheWalkAsStated) {
  struct Asked {
    Plane map;
    Points points;
    static void call(TWcontext context, int32_t, const CoordinateTriple* in, CoordinateTriple* out,
                     TWstatus*) {
      auto& self = *reinterpret_cast<Asked*>(context);  // NOLINT(performance-no-int-to-ptr)
      self.points.push_back(*in);
      *out = self.map(in->x, in->y);
    }
  };
  const Plane plate = [](double lon, double lat) { return CoordinateTriple{lon, lat, 0}; };
  const Plane constant = [](double, double) { return CoordinateTriple{0.25, 0.5, 0}; };
  const Plane north = [](double lon, double lat) {
    return CoordinateTriple{(kHalf - lat) * std::sin(lon), (lat - kHalf) * std::cos(lon), 0};
  };
  const Plane south = [](double lon, double lat) {
    return CoordinateTriple{(kHalf + lat) * std::sin(lon), (kHalf + lat) * std::cos(lon), 0};
  };
  // One step's image lies one to the east of the other's.
  const Plane stairs = [](double lon, double lat) { return CoordinateTriple{lat * 2e5, lon, 0}; };
  struct Case {
    Plane map;
    double lon, lat, x, y;
  };
  int over = 0, round = 0;
  for (const Case& c : {Case{plate, 0.5, 0.25, 0.6, 0.3},
                        {plate, 3, 0.2, 3.3, 0.1},
                        {plate, -3, 0.2, -3.3, 0.1},
                        {constant, 0.1, 0.2, 0.5, 0.9},
                        {north, 0.3, 1.3, -0.2, 0.2},
                        {north, -0.3, 1.3, 0.2, 0.2},
                        {north, 2, 1.4, 0.1, 0.2},
                        {south, 0.3, -1.3, 0.2, -0.2},
                        {south, -0.3, -1.3, 0.2, -0.2},
                        {south, -2.5, -1.45, -0.1, 0.2},
                        {stairs, 0.1, 0.2, 0.5, 0.3}}) {
    const Points stated = stated_walk(c.map, c.lon, c.lat, c.x, c.y);
    Asked asked = {c.map, {}};
    CoordinateTriple p = {c.x, c.y, 0};
    TWstatus status = 0;
    TWgeneric_i(Asked::call, reinterpret_cast<TWcontext>(&asked), c.lon, c.lat, 0, 1, &p, &p,
                &status);
    EXPECT_EQ(status, TW_SUCCESS);
    asked.points.push_back({p.x, p.y, 0});
    // Of a walk without end the first steps; rounding grows from step to step.
    const std::size_t steps = std::min<std::size_t>(stated.size(), 8);
    ASSERT_GE(asked.points.size(), steps);
    for (std::size_t i = 0; i < steps; ++i) {
      expect_near(asked.points[i], stated[i].x, stated[i].y, 0, 1e-11 * std::pow(10.0, i / 2));
      if (i < 2) continue;
      over += std::fabs(stated[i].x - stated[i - 1].x) > 2.5;
      round += std::fabs(stated[i].x - stated[i - 1].x) > 5;
    }
    EXPECT_NEAR(static_cast<double>(asked.points.size()), static_cast<double>(stated.size()), 1);
  }
  EXPECT_GT(over, 2);
  EXPECT_GT(round, 1);
}

TEST(ComplexPolynomial, TheDerivativeSetsTheWord) {
  const double coefs[4] = {1, 2, 3, 4};
  double result[2] = {};
  TWstatus status = 77;
  TWcomplexpol_g(1, coefs, 0.5, 0.5, result, &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

TEST(Similarity, AScaleOfNoneIsToldOfAnyPoint) {
  const double rotation[9] = {};
  for (const int32_t count : {0, 1, 2}) {
    const Points in(2, {1, 2, 3});
    Points out = untouched(2);
    TWstatus status = 77;
    TWbw_i(count, in.data(), -1, rotation, 0, 0, 0, out.data(), &status);
    EXPECT_EQ(status, count > 0 ? TW_SINGULAR : TW_SUCCESS) << count;
  }
}

// --- Points from a tolerance --------------------------------------------------------------------

void straight(TWcontext, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
              TWstatus*) {
  std::copy_n(in, count, out);
}

TEST(ToleranceCount, TheWordIsSetAnew) {
  int32_t count = 0;
  TWstatus status = 77;
  TWtoler_to_cnt(straight, 0, {0, 0, 0}, {0.1, 0, 0}, 1, 0, 0.1, 1, &count, &status);
  EXPECT_EQ(status, TW_SUCCESS);
}

TEST(ToleranceCount, WithoutMemoryTheWordSaysSo) {
  int32_t count = -77;
  TWstatus status = 0;
  const FailingNew failing;
  TWtoler_to_cnt(straight, 0, {0, 0, 0}, {0.1, 0, 0}, 1, 0, 0.1, 1, &count, &status);
  EXPECT_EQ(status, TW_NO_MEMORY);
  EXPECT_EQ(failing.asked(), 65536);  // memory that is short may come back
}

}  // namespace
