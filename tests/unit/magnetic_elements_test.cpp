#include <gtest/gtest.h>

#include <cmath>
#include <fstream>
#include <random>
#include <sstream>
#include <string>

#include "support/data.hpp"
#include "support/harmonics.hpp"
#include "support/little_memory.hpp"
#include "support/magnetic_values.hpp"
#include "tidewater/foundation.h"

using namespace tidewater::test;

namespace {

constexpr double kPoleMargin = 1e-12;

// Two series and what TWhar_mag_val() and TWhar_mag_var() give for some points.
struct Field {
  explicit Field(int32_t degree, int32_t rate_degree = 0)
      : synthesis(degree),
        sec(rate_degree ? rate_degree : degree),
        main(degree),
        secular(rate_degree ? rate_degree : degree) {}

  void resize(std::size_t count) {
    field = sec_field = tidewater::test::untouched(count);
    const MagneticElements none = {kUntouched, kUntouched, kUntouched, kUntouched};
    elements.assign(count, none);
    rates.assign(count, none);
  }

  TWstatus val(const Points& points) {
    resize(points.size());
    return val(static_cast<int32_t>(points.size()), points.data(), field.data());
  }
  TWstatus val(int32_t count, const CoordinateTriple* points, CoordinateTriple* out) {
    TWstatus status = 0;
    Synthesis& s = synthesis;
    SynthesisCache& k = s.cache;
    TWhar_mag_val(s.N, s.radius, main.C.rows(), main.S.rows(), s.rec_a.rows(), s.rec_b.rows(),
                  k.dC.data(), k.dS.data(), k.lC.data(), k.lS.data(), k.rC.data(), k.rS.data(),
                  k.C.data(), k.S.data(), &k.last_colat, &k.last_radius, &s.last_lon, s.tolerance,
                  &k.tcos, &k.tsin, &k.scale_theta, &k.scale_lambda, &k.scale_r, s.a, s.e, count,
                  points, out, elements.data(), &status);
    return status;
  }

  TWstatus var(const Points& points) {
    resize(points.size());
    return var(static_cast<int32_t>(points.size()), points.data(), field.data(), sec_field.data());
  }
  TWstatus var(int32_t count, const CoordinateTriple* points, CoordinateTriple* out,
               CoordinateTriple* sec_out) {
    TWstatus status = 0;
    Synthesis& s = synthesis;
    SynthesisCache& k = s.cache;
    TWhar_mag_var(s.N, s.radius, main.C.rows(), main.S.rows(), s.rec_a.rows(), s.rec_b.rows(),
                  k.dC.data(), k.dS.data(), k.lC.data(), k.lS.data(), k.rC.data(), k.rS.data(),
                  k.C.data(), k.S.data(), &k.last_colat, &k.last_radius, &s.last_lon, s.tolerance,
                  &k.tcos, &k.tsin, &k.scale_theta, &k.scale_lambda, &k.scale_r, secular.C.degree(),
                  secular.C.rows(), secular.S.rows(), sec.dC.data(), sec.dS.data(), sec.lC.data(),
                  sec.lS.data(), sec.rC.data(), sec.rS.data(), sec.C.data(), sec.S.data(),
                  &sec.last_colat, &sec.last_radius, &sec.tcos, &sec.tsin, &sec.scale_theta,
                  &sec.scale_lambda, &sec.scale_r, s.a, s.e, count, points, out, elements.data(),
                  sec_out, rates.data(), &status);
    return status;
  }

  Synthesis synthesis;
  SynthesisCache sec;
  Coefficients main, secular;
  Points field, sec_field;
  std::vector<MagneticElements> elements, rates;
};

// A published model at a date, read from the folder of real data.
class Model {
 public:
  // The World Magnetic Model 2025: epoch 2025.0 and yearly rates.
  static void read_wmm2025(Field& f, double date) {
    std::ifstream file(shared_data() / "magnetic" / "wmm2025.csv");
    ASSERT_TRUE(file);
    std::string line;
    std::getline(file, line);
    while (std::getline(file, line)) {
      const std::vector<double> v = numbers(line);
      const auto n = static_cast<int32_t>(v[0]), m = static_cast<int32_t>(v[1]);
      f.main.C(n, m) = v[2] + (date - 2025) * v[4];
      f.main.S(n, m) = v[3] + (date - 2025) * v[5];
      f.secular.C(n, m) = v[4];
      f.secular.S(n, m) = v[5];
    }
    normalise(f);
  }

  // The 13th generation of the IGRF at an epoch.
  static void read_igrf13(Field& f, const std::string& epoch) {
    std::ifstream file(shared_data() / "magnetic" / "igrf13.csv");
    ASSERT_TRUE(file);
    std::string line;
    std::getline(file, line);
    std::size_t column = 0;
    std::stringstream head(line);
    for (std::string name; std::getline(head, name, ',') && name != epoch;) ++column;
    while (std::getline(file, line)) {
      const std::vector<double> v = numbers(line);
      const auto n = static_cast<int32_t>(v[0]), m = static_cast<int32_t>(v[1]);
      (m < 0 ? f.main.S(n, -m) : f.main.C(n, m)) = v[column];
    }
    normalise(f);
  }

 private:
  static std::vector<double> numbers(const std::string& line) {
    std::vector<double> values;
    std::stringstream in(line);
    for (std::string field; std::getline(in, field, ',');) values.push_back(std::stod(field));
    return values;
  }
  static void normalise(Field& f) {
    TWstatus status = 0;
    TWhar_normaliz(2, f.main.C.degree(), f.main.C.rows(), f.main.S.rows(), &status);
    TWhar_normaliz(2, f.secular.C.degree(), f.secular.C.rows(), f.secular.S.rows(), &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
};

constexpr double kDegree = kPi / 180;
const double kSqrt3 = std::sqrt(3.0);

TEST(MagneticElements, PublishedTestValuesOfTheWorldMagneticModel) {
  TIDEWATER_NEED_SHARED_DATA();
  for (const PublishedField& row : kWmm2025Values) {
    Field f(12);
    Model::read_wmm2025(f, row.date);
    ASSERT_EQ(f.val({{degrees(row.lon), degrees(row.lat), 0}}), TW_SUCCESS);
    expect_near(f.field[0], row.X, row.Y, row.Z, 0.0501);
    EXPECT_NEAR(f.elements[0].total, row.F, 0.0501);
    EXPECT_NEAR(f.elements[0].inclination / kDegree, row.I, 0.00501);
    EXPECT_NEAR(f.elements[0].declination / kDegree, row.D, 0.00501);
  }
}

TEST(MagneticElements, TheFieldStandsUprightAtTheDipPolesOfTheIgrf) {
  TIDEWATER_NEED_SHARED_DATA();
  // Dip poles of IGRF-13 for 2020.0 (World Data Center for Geomagnetism, BGS list of poles):
  // 86.494 N 162.867 E and 64.081 S 135.866 E.
  Field f(13);
  Model::read_igrf13(f, "2020.0");
  f.val({{degrees(162.867), degrees(86.494), 0}, {degrees(135.866), degrees(-64.081), 0}});
  // half a unit of the last place is some 60 m, over which H grows by a nanotesla at most
  EXPECT_LT(f.elements[0].horizontal, 1);
  EXPECT_LT(f.elements[1].horizontal, 1);
  EXPECT_GT(f.elements[0].inclination, 0);
  EXPECT_LT(f.elements[1].inclination, 0);
}

TEST(MagneticElements, AgreeWithExplicitLegendreFunctions) {
  const int32_t N = 13;
  Field f(N, 8);
  Coefficients::fill(f.main, 13, 1);
  Coefficients::fill(f.secular, 14, 1);
  std::mt19937 random(82);
  std::uniform_real_distribution<double> lon(-kPi, kPi), lat(-1.55, 1.55), height(-5e3, 8e5);
  Points points(60);
  for (auto& p : points) p = {lon(random), lat(random), height(random)};
  ASSERT_EQ(f.var(points), TW_SUCCESS);
  const double a = f.synthesis.a, e2 = f.synthesis.e * f.synthesis.e;
  for (std::size_t i = 0; i < points.size(); ++i) {
    const double lambda = points[i].x, phi = points[i].y, h = points[i].z;
    const double nu = a / std::sqrt(1 - e2 * std::sin(phi) * std::sin(phi));
    const double across = (nu + h) * std::cos(phi), along = ((1 - e2) * nu + h) * std::sin(phi);
    const double theta = std::atan2(across, along),
                 q = f.synthesis.radius / std::hypot(across, along);
    const auto in_frame = [&](const Coefficients& c) {
      const CoordinateTriple g = direct_sum(c, q, theta, lambda).gradient;
      const double psi = kPi / 2 - theta;  // by components on the axis and the equator
      const double axis = g.x * std::cos(psi) - g.z * std::sin(psi);
      const double out = -g.x * std::sin(psi) - g.z * std::cos(psi);
      return CoordinateTriple{axis * std::cos(phi) - out * std::sin(phi), g.y,
                              -axis * std::sin(phi) - out * std::cos(phi)};
    };
    const CoordinateTriple now = in_frame(f.main), change = in_frame(f.secular);
    const double near = 1e-8;  // of some 5e4
    expect_near(f.field[i], now.x, now.y, now.z, near);
    expect_near(f.sec_field[i], change.x, change.y, change.z, near);
    const auto elements = [](const CoordinateTriple& b) {
      const double H = std::sqrt(b.x * b.x + b.y * b.y);
      return MagneticElements{std::atan2(b.y, b.x), std::atan(b.z / H), H,
                              std::sqrt(H * H + b.z * b.z)};
    };
    const MagneticElements at = elements(now);
    const MagneticElements later = elements({now.x + change.x, now.y + change.y, now.z + change.z});
    const double angle = near / std::min(at.horizontal, later.horizontal);
    EXPECT_NEAR(f.elements[i].declination, at.declination, angle);
    EXPECT_NEAR(f.elements[i].inclination, at.inclination, angle);
    EXPECT_NEAR(f.elements[i].horizontal, at.horizontal, near);
    EXPECT_NEAR(f.elements[i].total, at.total, near);
    const double turn = std::remainder(later.declination - at.declination, 2 * kPi);
    EXPECT_NEAR(f.rates[i].declination, turn, 2 * angle);
    EXPECT_NEAR(f.rates[i].inclination, later.inclination - at.inclination, 2 * angle);
    EXPECT_NEAR(f.rates[i].horizontal, later.horizontal - at.horizontal, 2 * near);
    EXPECT_NEAR(f.rates[i].total, later.total - at.total, 2 * near);
  }
}

TEST(MagneticElements, TheFrameTurnsToTheGeodeticNormal) {
  // A monopole that draws to the centre: seen at latitude 45 it leans north by the angle between
  // the two normals, tan(phi - psi) = e^2 sin cos / (1 - e^2 sin^2) on the ellipsoid.
  Field f(2);
  f.main.C(0, 0) = -1;
  f.val({{0.3, kPi / 4, 0}});
  const double e2 = f.synthesis.e * f.synthesis.e;
  EXPECT_NEAR(f.field[0].x / f.field[0].z, e2 / 2 / (1 - e2 / 2), 1e-15);
  EXPECT_GT(f.field[0].z, 0);
}

// On a sphere of the reference radius the field of degree 1 is, in (C11, S11, C10) without the
// factor sqrt 3: north (C11 cos + S11 sin) cos theta - C10 sin theta, east C11 sin - S11 cos.
Field on_sphere(double C10, double C11, double S11) {
  Field f(2);
  f.synthesis.a = f.synthesis.radius;
  f.synthesis.e = 0;
  f.main.C(1, 0) = C10 / kSqrt3;
  f.main.C(1, 1) = C11 / kSqrt3;
  f.main.S(1, 1) = S11 / kSqrt3;
  return f;
}

TEST(MagneticElements, NoDeclinationWithoutAHorizontalIntensity) {
  struct Case {
    double east, declination;
  };
  for (const Case& c : {Case{1e-13, 0}, Case{0.999e-12, 0}, Case{1.001e-12, kPi / 2}}) {
    Field f = on_sphere(0, 0, -c.east);
    f.main.C(0, 0) = -1;  // draws straight down
    ASSERT_EQ(f.val({{0, 0, 0}}), TW_SUCCESS);
    EXPECT_NEAR(f.elements[0].horizontal, c.east, 1e-16);
    EXPECT_NEAR(f.elements[0].declination, c.declination, 1e-3);
    EXPECT_NEAR(f.elements[0].inclination, kPi / 2, 2e-12);
  }
}

TEST(MagneticElements, AtThePolesTheDeclinationCountsFromGreenwich) {
  struct Case {
    double lat, lon, declination;
  };
  // C11 = 1, S11 = -1: north-east at the north pole on the meridian of Greenwich, south-east at the
  // south pole.
  const double north = kPi / 4, south = 3 * kPi / 4, half = kPi / 2;
  const double limit = half - kPoleMargin;
  const Case cases[] = {
      {half, 1, north + 1},
      {half, 3, north + 3 - 2 * kPi},     // one turn back
      {half, -4, north - 4 + 2 * kPi},    // one turn on
      {half, -10, north - 10 + 2 * kPi},  // and no more than one
      {-half, 1, south - 1},
      {-half, -2, south + 2 - 2 * kPi},
      {std::nextafter(limit, 2), 1, north + 1},
      {limit, 1, north},  // strictly above
      {std::nextafter(-limit, -2), 1, south - 1},
      {-limit, 1, south},
  };
  for (const Case& c : cases) {
    Field f = on_sphere(0, 1, -1);
    ASSERT_EQ(f.val({{c.lon, c.lat, 0}}), TW_SUCCESS);
    EXPECT_NEAR(f.elements[0].declination, c.declination, 1e-11) << c.lat << ' ' << c.lon;
    EXPECT_NEAR(f.elements[0].horizontal, std::sqrt(2.0), 1e-11);
  }
}

TEST(MagneticElements, ADeclinationOfHalfATurnIsPositive) {
  Field f = on_sphere(1, 0, 0);  // a dipole upside down: the field points south
  f.val({{0.5, 0.3, 0}, {-0.5, -0.3, 0}});
  EXPECT_EQ(f.elements[0].declination, kPi);
  EXPECT_EQ(f.elements[1].declination, kPi);
}

TEST(MagneticElements, RatesAreDifferencesOverOneUnit) {
  // At the equator and Greenwich north is -C10, east -S11, down -2 C11.
  Field f = on_sphere(-3, 2, -4);
  f.secular.C(1, 0) = -2 / kSqrt3;
  f.secular.C(1, 1) = 1.5 / kSqrt3;
  f.secular.S(1, 1) = -8 / kSqrt3;
  ASSERT_EQ(f.var({{0, 0, 0}}), TW_SUCCESS);
  // now (3, 4, -4): H 5; then (5, 12, -7): H 13
  expect_near(f.field[0], 3, 4, -4, 1e-14);
  expect_near(f.sec_field[0], 2, 8, -3, 1e-14);
  const double F = std::sqrt(41.0), F1 = std::sqrt(218.0);
  EXPECT_NEAR(f.elements[0].declination, std::atan(4.0 / 3), 1e-14);
  EXPECT_NEAR(f.elements[0].inclination, -std::atan(4.0 / 5), 1e-14);
  EXPECT_NEAR(f.elements[0].horizontal, 5, 1e-14);
  EXPECT_NEAR(f.elements[0].total, F, 1e-14);
  EXPECT_NEAR(f.rates[0].declination, std::atan(12.0 / 5) - std::atan(4.0 / 3), 1e-14);
  EXPECT_NEAR(f.rates[0].inclination, -std::atan(7.0 / 13) + std::atan(4.0 / 5), 1e-14);
  EXPECT_NEAR(f.rates[0].horizontal, 8, 2e-14);
  EXPECT_NEAR(f.rates[0].total, F1 - F, 2e-14);
}

TEST(MagneticElements, TheRateOfTheDeclinationTurnsTheShortWay) {
  // from 3 to -3 radians, and back
  for (const double sign : {1.0, -1.0}) {
    Field f = on_sphere(-std::cos(3.0), 0, -std::sin(3.0) * sign);
    f.secular.S(1, 1) = 2 * std::sin(3.0) * sign / kSqrt3;
    ASSERT_EQ(f.var({{0, 0, 0}}), TW_SUCCESS);
    EXPECT_NEAR(f.elements[0].declination, 3 * sign, 1e-14);
    EXPECT_NEAR(f.rates[0].declination, (2 * kPi - 6) * sign, 1e-14);
  }
}

TEST(MagneticElements, TheRateOfTheDeclinationKnowsNoLeastIntensity) {
  Field f = on_sphere(0, 0, 0);
  f.main.C(0, 0) = -1;
  f.secular.S(1, 1) = -1e-13 / kSqrt3;  // east
  ASSERT_EQ(f.var({{0, 0, 0}}), TW_SUCCESS);
  EXPECT_EQ(f.elements[0].declination, 0);
  EXPECT_NEAR(f.rates[0].declination, kPi / 2, 1e-3);
}

TEST(MagneticElements, RatesAtThePolesAreNotCountedFromGreenwich) {
  Field f = on_sphere(0, 1, -1);
  f.secular.C(1, 1) = -1 / kSqrt3;  // to due east on the meridian of Greenwich
  ASSERT_EQ(f.var({{1, kPi / 2, 0}}), TW_SUCCESS);
  EXPECT_NEAR(f.elements[0].declination, kPi / 4 + 1, 1e-11);
  EXPECT_NEAR(f.rates[0].declination, kPi / 4, 1e-11);
}

TEST(MagneticElements, TheFieldMayBeWrittenOverThePoints) {
  const Points points = {{1, kPi / 2, 0}, {0.3, 0.7, 1000}, {-2, -1.2, 500}};
  Field apart(5, 4), over(5, 4);
  for (Field* f : {&apart, &over}) {
    Coefficients::fill(f->main, 3);
    Coefficients::fill(f->secular, 4);
  }
  const auto same = [](const MagneticElements& p, const MagneticElements& q) {
    return p.declination == q.declination && p.inclination == q.inclination &&
           p.horizontal == q.horizontal && p.total == q.total;
  };
  ASSERT_EQ(apart.var(points), TW_SUCCESS);
  over.resize(3);
  Points work = points;
  ASSERT_EQ(over.val(3, work.data(), work.data()), TW_SUCCESS);
  for (std::size_t i = 0; i < 3; ++i) {
    EXPECT_TRUE(same(over.elements[i], apart.elements[i]));
    expect_near(work[i], apart.field[i].x, apart.field[i].y, apart.field[i].z, 0);
  }
  work = points;
  ASSERT_EQ(over.var(3, work.data(), over.field.data(), work.data()), TW_SUCCESS);
  for (std::size_t i = 0; i < 3; ++i) {
    EXPECT_TRUE(same(over.elements[i], apart.elements[i]));
    EXPECT_TRUE(same(over.rates[i], apart.rates[i]));
    expect_near(work[i], apart.sec_field[i].x, apart.sec_field[i].y, apart.sec_field[i].z, 0);
  }
}

TEST(MagneticElements, NothingToDo) {
  Field f(2);
  f.resize(1);
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1, -2147483647}) {
    EXPECT_EQ(f.val(count, &p, &p), TW_SUCCESS);
    EXPECT_EQ(f.var(count, &p, &p, &p), TW_SUCCESS);
    expect_untouched(p);
    EXPECT_EQ(f.elements[0].total, kUntouched);
    EXPECT_EQ(f.rates[0].total, kUntouched);
  }
}

TEST(MagneticElements, NotANumberStaysWithItsPoint) {
  Field f(4);
  Coefficients::fill(f.main, 3);
  Coefficients::fill(f.secular, 4);
  ASSERT_EQ(f.var({{0.3, kNaN, 0}, {0.3, 0.7, 0}, {kInfinity, 0, 0}}), TW_SUCCESS);
  EXPECT_TRUE(std::isnan(f.elements[0].inclination));
  EXPECT_EQ(f.elements[0].declination, 0);  // its H is not above the least
  EXPECT_TRUE(std::isfinite(f.elements[1].declination + f.rates[1].declination));
  EXPECT_TRUE(std::isnan(f.elements[2].total));
}

TEST(MagneticElements, NoMemoryForThePositions) {
  TIDEWATER_NEED_MEMORY_LIMIT();
  expect_with_little_memory([] {
    Field f(2);
    f.resize(1);
    const CoordinateTriple p = {0, 0, 0};
    return f.val(2147483647, &p, f.field.data()) == TW_NO_MEMORY &&
           f.var(2147483647, &p, f.field.data(), f.sec_field.data()) == TW_NO_MEMORY &&
           f.field[0].x == kUntouched && f.sec_field[0].x == kUntouched &&
           f.elements[0].total == kUntouched && f.rates[0].total == kUntouched;
  });
}

}  // namespace
