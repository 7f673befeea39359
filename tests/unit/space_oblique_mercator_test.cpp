#include <gtest/gtest.h>

#include <array>
#include <vector>

#include "support/failing_new.hpp"
#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

// One orbit with all that the functions take.
struct Som {
  double e, inc, P, eps, om;
  int16_t n_terms;
  double lon_n = 2.0;
  int16_t orbit = 0, side = 1;
  int32_t axes = 1;
  double Q = kUntouched, T = kUntouched, W = kUntouched, G = kUntouched, a0 = kUntouched;
  std::vector<double> C, S, X1, X2, X3, X4;
  double R1 = kUntouched, R2 = kUntouched, R3 = kUntouched, R4 = kUntouched;
  double m_sin = kUntouched, m_cos = kUntouched, sum3 = kUntouched, sum4 = kUntouched;
  TWstatus status = 0;

  Som(double e_, double inc_, double P_, double eps_, double om_, int16_t terms = 20,
      int16_t n_points = 401)
      : e(e_), inc(inc_), P(P_), eps(eps_), om(om_), n_terms(terms) {
    const std::size_t size = static_cast<std::size_t>(terms > 0 ? terms : 0) + 1;
    for (auto* array : {&C, &S, &X1, &X2, &X3, &X4}) array->assign(size, kUntouched);
    TWsom_c(e, inc, P, eps, om, n_terms, n_points, &Q, &T, &W, &G, &a0, C.data(), S.data(),
            X1.data(), X2.data(), X3.data(), X4.data(), &R1, &R2, &R3, &R4, &m_sin, &m_cos, &sum3,
            &sum4, &status);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWsom_f(orbit, side, n_terms, lon_n, e, inc, P, eps, om, Q, T, W, G, a0, C.data(), S.data(),
            X1.data(), X2.data(), X3.data(), X4.data(), R1, R2, R3, R4, m_sin, m_cos, sum3, sum4,
            static_cast<int32_t>(in.size()), in.data(), out.data(), axes, &word);
    return word;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus word = 0;
    TWsom_i(n_terms, lon_n, e, inc, P, eps, om, Q, T, W, G, a0, C.data(), S.data(), X1.data(),
            X2.data(), X3.data(), X4.data(), R1, R2, R3, R4, m_sin, m_cos, sum3, sum4,
            static_cast<int32_t>(in.size()), in.data(), out.data(), axes, &word);
    return word;
  }
  // Longitude and latitude of the ground track at the angle L from the node, by the geometry of
  // the orbit: the satellite stands over the geocentric direction (L, inc), the earth has turned.
  CoordinateTriple track(double L) const {
    const double E = 2 * std::atan(std::tan((L - om) / 2) * std::sqrt((1 - eps) / (1 + eps)));
    const double geocentric = std::asin(std::sin(L) * std::sin(inc));
    const double right = std::atan2(std::sin(L) * std::cos(inc), std::cos(L));
    const double lon = right + lon_n - (E - eps * std::sin(E) + om) * P;
    return {std::remainder(lon, 2 * kPi), std::atan(std::tan(geocentric) / (1 - e * e)), 0};
  }
};

// Landsat 1 to 3 on Clarke 1866 (Snyder 1987, p. 218): 251 orbits in 18 days.
const double kE = Ellipsoid::clarke_1866().e;
const double kInclination = degrees(99.092);
constexpr double kRatio = 18.0 / 251;

// The anomaly is counted within half a turn of the perigee, which stands mid-way of the day side
// here, so that the track does not jump in what the tests look at.
constexpr double kPerigee = 2.5;
Som landsat() { return Som(kE, kInclination, kRatio, 0, kPerigee); }
Som elliptical() { return Som(kE, kInclination, kRatio, 0.01, kPerigee); }

TEST(SpaceObliqueMercator, ClosedConstants) {
  const Som p = landsat();
  EXPECT_EQ(p.status, TW_SUCCESS);
  const double e2 = 0.00676866, s2 = std::pow(std::sin(kInclination), 2);
  EXPECT_NEAR(p.Q, e2 * s2 / (1 - e2), 1e-17);
  EXPECT_NEAR(p.T, e2 * s2 * (2 - e2) / ((1 - e2) * (1 - e2)), 1e-16);
  EXPECT_NEAR(p.W, std::pow((1 - e2 * (1 - s2)) / (1 - e2), 2) - 1, 1e-15);
  EXPECT_NEAR(p.G, 1 - e2, 1e-16);
}

TEST(SpaceObliqueMercator, CircularOrbitHasNoSteadyTurning) {
  const Som p = landsat();
  EXPECT_LT(std::fabs(p.a0), 1e-14);
  for (const double r : {p.R1, p.R2, p.R3, p.R4}) EXPECT_EQ(r, kUntouched);
  double sum3 = 0, sum4 = 0;
  for (int n = 0; n < 20; ++n) {
    sum3 += p.X3[static_cast<std::size_t>(n)];
    sum4 += p.X4[static_cast<std::size_t>(n)];
  }
  EXPECT_DOUBLE_EQ(p.sum3, sum3);
  EXPECT_DOUBLE_EQ(p.sum4, sum4);
  EXPECT_EQ(p.C[20], kUntouched);  // nothing behind n_terms
  EXPECT_EQ(p.X4[20], kUntouched);
}

TEST(SpaceObliqueMercator, EllipticalOrbitTurns) {
  const Som p = elliptical();
  EXPECT_EQ(p.status, TW_SUCCESS);
  EXPECT_GT(std::fabs(p.a0), 1e-10);
  EXPECT_EQ(p.R1, p.m_sin / p.a0);
  EXPECT_EQ(p.R2, p.m_cos / p.a0);
  EXPECT_EQ(p.R3, p.sum4 + p.R2);
  EXPECT_EQ(p.R4, p.R1 - p.sum3);
}

TEST(SpaceObliqueMercator, TrackIsOfTrueScaleAndConformal) {
  // Along the ground track both scales are 1: within 1e-6, says Snyder 1981, p. 31.
  for (const Som& p : {landsat(), elliptical(), Som(kE, kInclination, kRatio, 0.1, 2.0)}) {
    const auto forward = [&](const CoordinateTriple& q) {
      Points one = {q};
      p.forward(one, one);
      return one[0];
    };
    for (double L = 1.9; L < 4.6; L += 0.3) {
      const CoordinateTriple at = p.track(L);
      const CoordinateTriple scale = numeric_scale(forward, at.x, at.y, kE);
      expect_near(scale, 1, 1, 1, 1.2e-6);
      // half a degree aside the scale has grown by the square of the distance over two
      const double side = degrees(0.5);
      const CoordinateTriple off = numeric_scale(forward, at.x + side, at.y, kE);
      const double distance = side * std::cos(at.y);
      expect_near(off, 1 + distance * distance / 2, 1 + distance * distance / 2,
                  1 + distance * distance, 2e-5);
    }
  }
}

TEST(SpaceObliqueMercator, TrackIsNearlyStraight) {
  const Som p = landsat();
  for (double L = 1.9; L < 4.6; L += 0.3) {
    Points one = {p.track(L)};
    EXPECT_EQ(p.forward(one, one), TW_SUCCESS);
    // along-track x grows as the track does; y swings about the axis by the turning of the earth
    EXPECT_NEAR(one[0].x, L * 1.0058, 0.01);
    EXPECT_NEAR(one[0].y, 0.1434 * std::sin(L), 0.001);  // C1 of Snyder 1987, p. 218
  }
}

TEST(SpaceObliqueMercator, AgreesWithProjToItsSimplerSeries) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=lsat +lsat=1 +path=15 +a=6378206.4 +es=0.00676866");
  ASSERT_TRUE(peer.ok());
  Som p(kE, 1.729481662386221, 103.2669323 / 1440, 0, 0);
  TWstatus status = 0;
  TWsomps(251, degrees(128.87), 0, 15, 0, 0, 0, &p.lon_n, &p.side, &p.orbit, &status);
  for (const CoordinateTriple& q : {CoordinateTriple{degrees(-73), degrees(40), 0},
                                    CoordinateTriple{degrees(-70), degrees(50), 0},
                                    CoordinateTriple{degrees(-79), degrees(20), 0}}) {
    Points out = {q};
    EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
    const CoordinateTriple theirs = peer.forward(q);
    // The peer takes the turning of the track as a sine with one constant; ours integrates it.
    // That moves points by up to 1e-4 of the radius.
    expect_near(out[0], theirs.x / 6378206.4, theirs.y / 6378206.4, 1.2e-4);
  }
#endif
}

TEST(SpaceObliqueMercator, RoundTrip) {
  for (Som p : {landsat(), elliptical()}) {
    for (const int32_t axes : {1, 0, -1, 2}) {
      p.axes = axes;
      for (double L = 1.8; L < 4.6; L += 0.17) {
        for (const double off : {-0.05, 0.0, 0.03}) {
          CoordinateTriple at = p.track(L);
          at.x = std::remainder(at.x + off, 2 * kPi);
          at.z = 9;
          Points one = {at};
          EXPECT_EQ(p.forward(one, one), TW_SUCCESS);
          EXPECT_EQ(one[0].z, 9);
          EXPECT_EQ(p.inverse(one, one), TW_SUCCESS);
          // both iterations end at a step of 1e-10, and the next would be far smaller
          expect_near(one[0], at.x, at.y, 9, 1e-10);
        }
      }
    }
  }
}

TEST(SpaceObliqueMercator, OtherSideOfTheOrbit) {
  // Ascending passes are found from side -1, those of the next orbit one turn further along.
  Som p = landsat();
  for (const int16_t orbit : {int16_t{0}, int16_t{1}}) {
    p.side = -1;
    p.orbit = orbit;
    for (const double L : {0.4, 0.9, 1.3}) {
      const double along = L + 2 * kPi * orbit;
      const CoordinateTriple at = p.track(along);
      Points one = {at};
      EXPECT_EQ(p.forward(one, one), TW_SUCCESS);
      EXPECT_NEAR(one[0].x, along * 1.0058, 0.01);
      EXPECT_EQ(p.inverse(one, one), TW_SUCCESS);
      expect_near(one[0], at.x, at.y, 1e-10);
    }
  }
}

TEST(SpaceObliqueMercator, AxesTurnThePlane) {
  Som p = landsat();
  Points one = {p.track(2.5)}, other = one;
  EXPECT_EQ(p.forward(one, one), TW_SUCCESS);
  p.axes = 0;
  EXPECT_EQ(p.forward(other, other), TW_SUCCESS);
  EXPECT_EQ(other[0].x, one[0].y);
  EXPECT_EQ(other[0].y, -one[0].x);
}

TEST(SpaceObliqueMercator, EvenGridGainsAPoint) {
  const Som even(kE, kInclination, kRatio, 0.01, 0.4, 6, 64);
  const Som odd(kE, kInclination, kRatio, 0.01, 0.4, 6, 65);
  const Som finer(kE, kInclination, kRatio, 0.01, 0.4, 6, 67);
  EXPECT_EQ(even.a0, odd.a0);
  EXPECT_EQ(even.C, odd.C);
  EXPECT_EQ(even.X4, odd.X4);
  EXPECT_NE(even.C, finer.C);
}

TEST(SpaceObliqueMercator, GridsOfAllSizes) {
  for (const int16_t bad : {int16_t{1}, int16_t{0}, int16_t{-1}, int16_t{-32768}}) {
    const Som p(kE, kInclination, kRatio, 0, 0, 3, bad);
    EXPECT_EQ(p.status, TW_BAD_INPUT);
    EXPECT_EQ(p.Q, kUntouched);
    EXPECT_EQ(p.sum4, kUntouched);
    EXPECT_EQ(p.C[0], kUntouched);
  }
  for (const int16_t small : {int16_t{2}, int16_t{3}}) {
    const Som p(kE, kInclination, kRatio, 0, 0, 3, small);
    EXPECT_EQ(p.status, TW_SUCCESS);
    EXPECT_NE(p.sum4, kUntouched);
  }
  const Som good(kE, kInclination, kRatio, 0, 0, 3, 1001);
  for (const int16_t large : {int16_t{32766}, int16_t{32767}}) {
    const Som p(kE, kInclination, kRatio, 0, 0, 3, large);
    EXPECT_EQ(p.status, TW_SUCCESS);
    // Simpson's rule over a whole period of a smooth function: 1000 intervals are exact
    EXPECT_NEAR(p.m_cos, good.m_cos, 1e-12);
    EXPECT_NEAR(p.S[2], good.S[2], 1e-12);
  }
}

TEST(SpaceObliqueMercator, NoTerms) {
  for (const int16_t terms : {int16_t{0}, int16_t{-5}}) {
    const Som p(kE, kInclination, kRatio, 0, 0, terms, 101);
    EXPECT_EQ(p.status, TW_SUCCESS);
    EXPECT_EQ(p.sum3, 0);
    EXPECT_EQ(p.m_sin, 0);
    EXPECT_EQ(p.C[0], kUntouched);
    Points one = {p.track(2.5)};
    EXPECT_EQ(p.forward(one, one), TW_SUCCESS);
    EXPECT_EQ(p.inverse(one, one), TW_SUCCESS);
  }
}

TEST(SpaceObliqueMercator, WithoutMemoryNothingIsWritten) {
  for (const int from : {0, 1}) {  // the first or the second of the two scratch arrays
    const FailingNew failing(from);
    const Som p = landsat();
    EXPECT_EQ(failing.asked(), 2);
    EXPECT_EQ(p.status, TW_NO_MEMORY);
    EXPECT_EQ(p.Q, kUntouched);
    EXPECT_EQ(p.a0, kUntouched);
    EXPECT_EQ(p.C[0], kUntouched);
    EXPECT_EQ(p.m_cos, kUntouched);
  }
}

TEST(SpaceObliqueMercator, IterationThatRunsOutIsInformation) {
  // A parallel hard by the turning point of the track, and a point that converges at its end.
  Som p = landsat();
  const CoordinateTriple hard = {p.track(1.6).x, degrees(80.85), 0};
  const CoordinateTriple easy = p.track(2.5);
  Points in;
  for (double lon = -3.1; lon < 3.1; lon += 0.1) in.push_back({lon, hard.y, 0});
  in.push_back({0, degrees(89.9), 0});
  in.push_back(easy);
  Points out = untouched(in.size());
  p.forward(in, out);
  Points alone = {easy};
  EXPECT_EQ(p.forward(alone, alone), TW_SUCCESS);
  EXPECT_EQ(out.back().x, alone[0].x);
  for (const auto& q : out) EXPECT_NE(q.x, kUntouched);
  // a P near 1 keeps the fixed point from settling
  Som fast(kE, kInclination, 1.7, 0, 0);
  Points many = untouched(in.size());
  EXPECT_EQ(fast.forward(in, many), TW_I_LATITUDE_LIMITED);
  for (const auto& q : many) EXPECT_NE(q.x, kUntouched);
  // the inverse far outside the swath, likewise; a later good point does not clear the word
  Points plane, back;
  for (double y = -1.5; y < 1.5; y += 0.05) plane.push_back({2.5, y, 0});
  plane.push_back(alone[0]);
  back = untouched(plane.size());
  fast.inverse(plane, back);
  p.inverse(plane, back);
  EXPECT_NEAR(back.back().y, easy.y, 1e-10);
  for (const auto& q : back) EXPECT_NE(q.y, kUntouched);
}

TEST(SpaceObliqueMercator, InverseThatStartsAtOneMakesNoPass) {
  // On the elliptical road the start is y itself: 1 meets the first test at once.
  const Som p = elliptical();
  Points at = {{0.2, 1, 0}, {0.2, 1 + 0.5e-10, 0}, {0.2, 1 + 1.5e-10, 0}};
  EXPECT_EQ(p.inverse(at, at), TW_SUCCESS);
  for (const auto& q : at) {
    EXPECT_TRUE(std::isfinite(q.x));
    EXPECT_TRUE(std::isfinite(q.y));
  }
}

TEST(SpaceObliqueMercator, NotANumberAndInfinityLeaveTheLoops) {
  for (const Som& p : {landsat(), elliptical()}) {
    const Points in = {{kNaN, 0.1, 0},      {0.1, kNaN, 0},     {kInfinity, 0.1, 0},
                       {0.1, kInfinity, 0}, {1e300, -1e300, 0}, {-kInfinity, -kInfinity, 0}};
    Points out = untouched(in.size());
    p.forward(in, out);
    for (const auto& q : out) EXPECT_NE(q.x, kUntouched);
    EXPECT_TRUE(std::isnan(out[0].x));
    out = untouched(in.size());
    p.inverse(in, out);
    for (const auto& q : out) EXPECT_NE(q.x, kUntouched);
  }
  const Som nothing(kNaN, kInclination, kRatio, kNaN, 0);
  EXPECT_EQ(nothing.status, TW_SUCCESS);
}

TEST(SpaceObliqueMercator, EquatorialOrbitInverse) {
  // inclination 0: every division by its sine is one by zero, the inverse has a road of its own.
  Som p = landsat();
  p.inc = 0;
  Points at = {{2.5, 0.05, 0}};
  p.inverse(at, at);
  EXPECT_NE(at[0].y, 0.05);
}

TEST(SpaceObliqueMercator, PathAndRow) {
  struct Case {
    int16_t row, side, orbit;
  };
  // day side rows 10 to 100, next orbit from row 180
  const Case cases[] = {{9, -1, 0},   {10, 1, 0},   {55, 1, 0},   {100, 1, 0},
                        {101, -1, 0}, {179, -1, 0}, {180, -1, 1}, {200, -1, 1}};
  for (const Case& c : cases) {
    double lon_n = 0;
    int16_t side = 0, orbit = 9;
    TWstatus status = 0;
    TWsomps(251, 2.25, c.row, 15, 10, 100, 180, &lon_n, &side, &orbit, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    EXPECT_NEAR(lon_n, 2.25 - 15 * 2 * kPi / 251, 1e-15);
    EXPECT_EQ(side, c.side) << c.row;
    EXPECT_EQ(orbit, c.orbit) << c.row;
  }
  // row_next inside the day side does not count
  double lon_n = 0;
  int16_t side = 0, orbit = 9;
  TWstatus status = 0;
  TWsomps(251, 2.25, 50, 0, 10, 100, 20, &lon_n, &side, &orbit, &status);
  EXPECT_EQ(lon_n, 2.25);
  EXPECT_EQ(side, 1);
  EXPECT_EQ(orbit, 0);
}

// The integrals, series and places as they are stated, worked out once more at 50 digits (mpmath),
// on a coarse grid of 33 points and with three terms, so that every term shows.
struct Stated {
  double eps, a0;
  std::array<double, 3> C, S, X1, X2, X3, X4;
  double m_sin, m_cos, sum3, sum4;
  std::array<double, 4> R;
  std::array<CoordinateTriple, 3> forward;  // of kGround
  std::array<CoordinateTriple, 3> inverse;  // of kPlane
  std::array<CoordinateTriple, 2>
      equatorial;  // of kPlane's first and last, with an inclination of 0
};
const Points kGround = {{1.2, 0.5, 0}, {1, -0.6, 0}, {1.3, 1.2, 0}};
const Points kPlane = {{2.5, 0.1, 0}, {3.4, -0.2, 0}, {0.1, 2.6, 0}};
const Stated kCircular = {
    0,
    0,
    {0, 0, 0},
    {0.139064524097534431, 0, 0.0000108911720841987811},
    {-0.138764611866568624, -0.000145556474476011117, -0.0000300646297295202392},
    {0.0194241415308473023, -0.00103984454876697568, 4.20841895554938538e-6},
    {0, 0, 0},
    {0, 0, 0},
    0.139146543932863994,
    0.994052485189858906,
    0,
    0,
    {kUntouched, kUntouched, kUntouched, kUntouched},
    {{{6.98465478610739561, 0.683934821754984408, 0},
      {5.40102621263965294, 0.956668404275818226, 0},
      {7.57560682637581454, 0.221037911780803581, 0}}},
    {{{-1.19922230953916192, 0.646996161317966733, 0},
      {-1.58036942800677324, -0.231477364234521709, 0},
      {0.557817478596056379, -0.0872192563481028117, 0}}},
    {{{-1.96931480698865359, 0.0149639058296070754, 0},
      {2.39367094835663571, 1.43971669828740796, 0}}}};
const Stated kElliptical = {
    0.05,
    -0.00135388377287967438,
    {3.56510233816692266e-6, 0.00200199876346588104, -0.000121164910258183676},
    {0.139056631985375989, -0.00472928556724346033, 0.000128098604839699146},
    {-0.138961144366253778, 0.00225714829779035503, -0.0000606461137722343678},
    {0.017972278291848078, -0.00134836783960819222, 0.000083497987354001804},
    {-0.0000652514872297202133, -0.000125285834342272861, 0.0000364504165231971423},
    {-8.86050375678611564e-6, 0.00101186679289570957, -0.0000374738661299482512},
    0.134627990884469364,
    0.994679087651772291,
    -0.000154086905048795932,
    0.000965532423008975205,
    {-99.4383665579499837, -734.685729733001094, -734.684764200578085, -99.4382124710449349},
    {{{0.226864348594855135, 7.01031404522391738, 0},
      {-0.238095760101219885, 5.47752500265060324, 0},
      {0.759980424238225734, 7.53936880712458093, 0}}},
    {{{-2.89076703599038293, 0.170173443996773972, 0},
      {-2.78186384411664003, 0.130603485533200281, 0},
      {-1.0411141628268261, 0.533890185883139563, 0}}},
    {{{2.09202800890398602, -1.42819907727572192, 0},
      {-1.89526939959992658, 0.167988790099139287, 0}}}};

TEST(SpaceObliqueMercator, AsStated) {
  for (const Stated& stated : {kCircular, kElliptical}) {
    Som p(0.08, 1.7, 0.07, stated.eps, 0.4, 3, 33);
    EXPECT_NEAR(p.Q, 0.006334293695908087, 2e-17);
    EXPECT_NEAR(p.T, 0.0127093879953324902, 2e-17);
    EXPECT_NEAR(p.W, 0.0127087106684421949, 5e-16);
    EXPECT_NEAR(p.a0, stated.a0, 5e-16);
    for (std::size_t n = 0; n < 3; ++n) {
      EXPECT_NEAR(p.C[n], stated.C[n], 5e-16);
      EXPECT_NEAR(p.S[n], stated.S[n], 5e-16);
      EXPECT_NEAR(p.X1[n], stated.X1[n], 5e-16);
      EXPECT_NEAR(p.X2[n], stated.X2[n], 5e-16);
      EXPECT_NEAR(p.X3[n], stated.X3[n], 5e-16);
      EXPECT_NEAR(p.X4[n], stated.X4[n], 5e-16);
    }
    EXPECT_NEAR(p.m_sin, stated.m_sin, 5e-16);
    EXPECT_NEAR(p.m_cos, stated.m_cos, 1e-15);
    EXPECT_NEAR(p.sum3, stated.sum3, 5e-16);
    EXPECT_NEAR(p.sum4, stated.sum4, 5e-16);
    const double R[] = {p.R1, p.R2, p.R3, p.R4};
    // what rounding leaves of a0, 5e-16 of 1e-3
    for (std::size_t k = 0; k < 4; ++k) EXPECT_NEAR(R[k], stated.R[k], 5e-10);

    Points out = kGround;
    EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < 3; ++i) {
      expect_near(out[i], stated.forward[i].x, stated.forward[i].y, 2e-12);
    }
    out = kPlane;
    EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < 3; ++i) {
      expect_near(out[i], stated.inverse[i].x, stated.inverse[i].y, 1e-11);
    }
    p.inc = 0;
    out = {kPlane[0], kPlane[2]};
    EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
    for (std::size_t i = 0; i < 2; ++i) {
      expect_near(out[i], stated.equatorial[i].x, stated.equatorial[i].y, 1e-10);
    }
  }
}

TEST(SpaceObliqueMercator, ATurningOfATenBillionthIsSteady) {
  constexpr double kLimit = 1e-10;
  Som p = landsat();
  p.R1 = p.R2 = p.R3 = p.R4 = 1000;
  const CoordinateTriple at = p.track(2.5);
  const auto forward = [&](double a0) {
    p.a0 = a0;
    Points one = {at};
    EXPECT_EQ(p.forward(one, one), TW_SUCCESS);
    return one[0];
  };
  const auto inverse = [&](double a0, const CoordinateTriple& in) {
    p.a0 = a0;
    Points one = {in};
    p.inverse(one, one);
    return one[0];
  };
  for (const double sign : {1.0, -1.0}) {
    // Forward: the linear road below the limit, at it that of the constants R.
    const CoordinateTriple linear = forward(sign * std::nextafter(kLimit, 0));
    EXPECT_NEAR(linear.x, forward(0).x, 1e-8);
    EXPECT_GT(std::fabs(forward(sign * kLimit).x - linear.x), 0.01);
    // Inverse, by contract: below the limit the plane is turned and the road linear; at it the road
    // alone is, so that the caller has to turn.
    const double D = std::hypot(p.m_cos, p.m_sin);
    const CoordinateTriple turned = {(p.m_sin * linear.x - p.m_cos * linear.y) / D,
                                     (p.m_sin * linear.y + p.m_cos * linear.x) / D, 0};
    expect_near(inverse(sign * std::nextafter(kLimit, 0), linear), at.x, at.y, 1e-10);
    expect_near(inverse(sign * kLimit, turned), at.x, at.y, 1e-10);
    const CoordinateTriple other = inverse(sign * std::nextafter(kLimit, 1), turned);
    EXPECT_FALSE(std::fabs(other.x - at.x) < 1e-3);
  }
}

}  // namespace
