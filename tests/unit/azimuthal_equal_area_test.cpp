#include <gtest/gtest.h>

#include <random>

#include "support/numeric_scale.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/conformal.h"

using namespace tidewater::test;

namespace {

const double kE = Ellipsoid::wgs84().e;

struct EqualArea {
  double e, lon0, lat0;
  double e2 = kUntouched, q1 = kUntouched, qp = kUntouched, rq = kUntouched, m1 = kUntouched,
         sin_b1 = kUntouched, cos_b1 = kUntouched, sin_lat0 = kUntouched, cos_lat0 = kUntouched,
         D = kUntouched;

  EqualArea(double eccentricity, double lon, double lat) : e(eccentricity), lon0(lon), lat0(lat) {
    TWstatus status = 0;
    TWlam_az_eq_c(e, kNaN, lat0, &e2, &q1, &qp, &rq, &m1, &sin_b1, &cos_b1, &sin_lat0, &cos_lat0,
                  &D, &status);
    EXPECT_EQ(status, TW_SUCCESS);
  }
  TWstatus forward(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWlam_az_eq_f(in.data(), static_cast<int32_t>(in.size()), e, lon0, lat0, e2, kNaN, qp, rq, kNaN,
                  sin_b1, cos_b1, sin_lat0, cos_lat0, D, out.data(), &status);
    return status;
  }
  TWstatus inverse(const Points& in, Points& out) const {
    TWstatus status = 0;
    TWlam_az_eq_i(in.data(), static_cast<int32_t>(in.size()), e, lon0, lat0, e2, qp, rq, sin_b1,
                  cos_b1, sin_lat0, cos_lat0, D, out.data(), &status);
    return status;
  }
  CoordinateTriple forward(const CoordinateTriple& in, TWstatus word = TW_SUCCESS) const {
    Points out = untouched(1);
    EXPECT_EQ(forward(Points{in}, out), word);
    EXPECT_EQ(out[0].z, kUntouched);
    return out[0];
  }
  CoordinateTriple inverse(const CoordinateTriple& in, TWstatus word = TW_SUCCESS) const {
    Points out = untouched(1);
    EXPECT_EQ(inverse(Points{in}, out), word);
    EXPECT_EQ(out[0].z, kUntouched);
    return out[0];
  }
  CoordinateTriple scale(double k0, const CoordinateTriple& in) const {
    CoordinateTriple out = kUntouchedPoint;
    TWstatus status = 0;
    TWlam_az_eq_s(&in, 1, lon0, lat0, e, e2, qp, k0, sin_lat0, cos_lat0, &out, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    return out;
  }
};

TEST(AzimuthalEqualArea, Constants) {
  const EqualArea sphere(0, 0, 0.6);
  for (const double v : {sphere.e2, sphere.q1, sphere.qp, sphere.rq, sphere.m1, sphere.sin_b1,
                         sphere.cos_b1, sphere.D}) {
    EXPECT_EQ(v, kUntouched);
  }
  EXPECT_EQ(sphere.sin_lat0, std::sin(0.6));
  EXPECT_EQ(sphere.cos_lat0, std::cos(0.6));
  const EqualArea pole(0.1, 0, -kPi / 2 + 0.9e-12);
  for (const double v : {pole.m1, pole.sin_b1, pole.cos_b1, pole.D}) EXPECT_EQ(v, kUntouched);
  EXPECT_EQ(pole.e2, 0.1 * 0.1);
  // The formulas with the logarithm in place of the area's arc tangent.
  const auto q = [](double e, double lat) {
    const double s = std::sin(lat);
    return (1 - e * e) * (s / (1 - e * e * s * s) - std::log((1 - e * s) / (1 + e * s)) / (2 * e));
  };
  EXPECT_NEAR(pole.qp, q(0.1, kPi / 2), 2e-15);
  EXPECT_NEAR(pole.q1, -pole.qp, 1e-15);
  EXPECT_NEAR(pole.rq, std::sqrt(pole.qp / 2), 1e-16);
  const EqualArea near(0.1, 0, -kPi / 2 + 1.2e-12);
  EXPECT_NE(near.m1, kUntouched);
  const EqualArea p(0.1, 0, 0.6);
  EXPECT_NEAR(p.q1, q(0.1, 0.6), 2e-15);
  EXPECT_NEAR(p.m1, std::cos(0.6) / std::sqrt(1 - std::pow(0.1 * std::sin(0.6), 2)),
              1.2e-16);  // the last place
  EXPECT_NEAR(p.sin_b1, p.q1 / p.qp, 1e-15);
  EXPECT_NEAR(p.sin_b1 * p.sin_b1 + p.cos_b1 * p.cos_b1, 1, 1e-15);
  EXPECT_NEAR(p.D * p.cos_b1 * p.rq, p.m1, 1e-15);
}

TEST(AzimuthalEqualArea, SphereInClosedForm) {
  // The distance on the plane is 2 sin(c / 2).
  const EqualArea equator(0, 0.2, 0), north(0, 0.2, kPi / 2), south(0, 0.2, -kPi / 2);
  expect_near(equator.forward({0.2 + 1.7, 0, 0}), 2 * std::sin(0.85), 0, 1e-15);
  expect_near(equator.forward({0.2, -0.6, 0}), 0, -2 * std::sin(0.3), 1e-15);
  const double r = 2 * std::sin((kPi / 2 - 0.3) / 2);
  expect_near(north.forward({0.2, 0.3, 0}), 0, -r, 1e-15);
  expect_near(north.forward({0.2 + kPi / 2, 0.3, 0}), r, 0, 1e-15);
  expect_near(south.forward({0.2, -0.3, 0}), 0, r, 1e-15);
  expect_near(south.forward({0.2 + kPi / 2, -0.3, 0}), r, 0, 1e-15);
  for (const EqualArea& p : {equator, north, south}) {
    for (const double lat : {-0.7, 0.1, 1.2}) {
      const CoordinateTriple in = {1.1, lat, 0};
      expect_near(p.inverse(p.forward(in)), in.x, in.y, 1e-14);
    }
  }
}

TEST(AzimuthalEqualArea, PolarEllipsoid) {
  const EqualArea north(kE, 0.2, kPi / 2), south(kE, 0.2, -kPi / 2);
  const CoordinateTriple up = north.forward({0.2, 1.1, 0});
  const CoordinateTriple down = south.forward({0.2, -1.1, 0});
  EXPECT_NEAR(up.x, 0, 1e-16);
  EXPECT_LT(up.y, 0);
  EXPECT_NEAR(down.y, -up.y, 1e-14);  // y = +r cos d at the south pole
  for (const double lat : {1.5, 0.4, 0.01}) {
    // qp - q, some (pi/2 - lat)^2, carries the rounding of the two, 1e-15.
    const double tolerance = 1e-15 / (kPi / 2 - lat) + 2e-15;
    expect_near(north.inverse(north.forward({1.3, lat, 0})), 1.3, lat, tolerance);
    expect_near(south.inverse(south.forward({1.3, -lat, 0})), 1.3, -lat, tolerance);
  }
}

TEST(AzimuthalEqualArea, InverseAtAndNearThePoles) {
  // q hardly changes near a pole; the latitude is found all the same, also for a large
  // eccentricity.
  for (const double e : {kE, 0.1, 0.3}) {
    for (const double lat0 : {kPi / 2, -kPi / 2}) {
      const EqualArea p(e, 0.2, lat0);
      EXPECT_NEAR(p.inverse({0, 0, 0}).y, lat0, 2e-13) << e;
      // At the pole r = (pi/2 - |lat|) m with the meridian radius 1 / sqrt(1 - e^2) there.
      for (const double r : {1e-6, 1e-5, 1e-4, 1e-3, 1e-2}) {
        const CoordinateTriple out = p.inverse({r, 0, 0});
        // q itself is rounded to 2e-16, which is worth 1e-16 / r of latitude.
        EXPECT_NEAR((kPi / 2 - std::fabs(out.y)) / std::sqrt(1 - e * e) / r, 1,
                    2 * r * r + 3e-16 / (r * r) + 1e-12)
            << e << ' ' << r;
        EXPECT_DOUBLE_EQ(out.x, 0.2 + kPi / 2);
      }
    }
    // From an oblique origin.
    const EqualArea p(e, 0.2, 0.7);
    for (const double lat : {kPi / 2, -kPi / 2, kPi / 2 - 1e-6}) {
      // At the south pole |q| may come out one last digit above qp, and is held.
      Points out = untouched(1);
      EXPECT_EQ(p.forward(Points{{0.2, lat, 0}}, out) & 1, 1U);
      EXPECT_NEAR(p.inverse(out[0]).y, lat, 3e-8);
    }
  }
}

TEST(AzimuthalEqualArea, AntipodeIsLeft) {
  for (const double e : {0.0, kE}) {
    for (const double lat0 : {0.0, 0.6, -0.6}) {
      const EqualArea p(e, 0.2, lat0);
      for (const double d : {kPi, -kPi, kPi + 0.5e-7, -kPi - 0.5e-7, kPi - 0.5e-7}) {
        const CoordinateTriple out = p.forward({0.2 + d, -lat0, 0});
        // Some 1e-7 from the antipode the radius is all but 2.
        EXPECT_NEAR(std::hypot(out.x, out.y), 2, 0.15) << e << ' ' << lat0 << ' ' << d;
        // d is moved towards the origin inside half a turn, and on its own way beyond.
        EXPECT_EQ(out.x > 0, d > 0 ? d <= kPi : d < -kPi) << e << ' ' << lat0 << ' ' << d;
      }
    }
  }
  // Polar: the latitude is moved towards the equator.  2 sin(w) with w = pi/2 - 0.5e-7.
  const EqualArea north(0, 0.2, kPi / 2), south(0, 0.2, -kPi / 2);
  EXPECT_NEAR(north.forward({0.2, -kPi / 2, 0}).y, -2 * std::sin(kPi / 2 - 0.5e-7), 1e-16);
  EXPECT_EQ(south.forward({0.2, kPi / 2, 0}).y, 2 * std::cos(kPi / 4 - (kPi / 2 - 1e-7) / 2));
  // Twice the margin away nothing is moved.
  const EqualArea p(0, 0, 0);
  const double d = kPi - 2e-7;
  EXPECT_EQ(p.forward({d, 0, 0}).x, std::sqrt(2 / (std::cos(d) + 1)) * std::sin(d));
}

TEST(AzimuthalEqualArea, PoleWithConstantsWorkedOutElsewhere) {
  // qp by the plain logarithm: the sine at the north pole is exactly 1, and nothing is held; from a
  // polar origin the pole lies at nothing.
  for (const double e : {0.0818191908426215, 0.0822718542230039, 0.0819918899790298, 0.2}) {
    const double e2 = e * e;
    const double qp = (1 / (1 - e2) - std::log((1 - e) / (1 + e)) / (2 * e)) * (1 - e2);
    EqualArea oblique(e, 0.2, 0.7), north(e, 0.2, kPi / 2);
    EXPECT_EQ(oblique.qp, qp);
    oblique.qp = north.qp = qp;
    oblique.forward({0.5, kPi / 2, 0});
    EXPECT_EQ(north.forward({0.5, kPi / 2, 0}).y, 0);
  }
}

TEST(AzimuthalEqualArea, NearTheAntipodeTheAuthalicAngleIsTaken) {
  // The sum of 1 and the cosine of the distance is some 5e-15 here, and hangs on the last bits.
  const double e = 0.0818191908426215;
  const EqualArea p(e, 0, 0);
  const double q = (std::sin(1e-8) / (1 - e * e * std::sin(1e-8) * std::sin(1e-8)) -
                    std::log((1 - e * std::sin(1e-8)) / (1 + e * std::sin(1e-8))) / (2 * e)) *
                   (1 - e * e);
  const double b = std::asin(q / p.qp);
  const double d = kPi - 1e-7;
  const double factor = std::sqrt(2 / (std::cos(b) * std::cos(d) + 1));
  const CoordinateTriple out = p.forward({kPi, 1e-8, 0});
  EXPECT_NEAR(out.x, factor * std::cos(b) * std::sin(d), 1e-14);
  EXPECT_NEAR(out.y, p.rq * p.rq * factor * std::sin(b), 1e-14);
}

TEST(AzimuthalEqualArea, AuthalicSineBeyondOne) {
  // With a qp made smaller by hand the sine at the pole comes out a hair beyond 1, or further.
  EqualArea p(kE, 0, 0.5);
  const double qp = p.qp;
  const Points in = {{0.1, kPi / 2, 0}, {0.1, 0.2, 0}, {0.1, -kPi / 2, 0}};
  Points out = untouched(3);
  EXPECT_EQ(p.forward(in, out), TW_SUCCESS);
  p.qp = qp / (1 + 0.9e-12);
  EXPECT_EQ(p.forward(in, out), TW_I_LATITUDE_LIMITED);
  // Held at the pole: no longitude enters.
  EXPECT_EQ(out[0].x, 0);
  EXPECT_NE(out[1].x, kUntouched);
  EXPECT_EQ(out[2].x, 0);
  p.qp = qp / (1 + 1.1e-12);
  out = untouched(3);
  EXPECT_EQ(p.forward({in[1], in[0], in[1]}, out), TW_NOT_CONVERGED);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  out = untouched(3);
  EXPECT_EQ(p.forward({in[2]}, out), TW_NOT_CONVERGED);
  // A polar origin does not look at it.
  EqualArea pole(kE, 0, -kPi / 2);
  pole.qp /= 1.1;
  EXPECT_EQ(pole.forward({in[1], in[0], in[2]}, out), TW_SUCCESS);
}

TEST(AzimuthalEqualArea, OutsideTheDiscOfTheSphere) {
  for (const double lat0 : {0.0, 0.6, kPi / 2, -kPi / 2}) {
    const EqualArea p(0, 0, lat0);
    Points out = untouched(3);
    EXPECT_EQ(p.inverse({{1, 0, 0}, {2 * (1 + 1.1e-12), 0, 0}, {1, 0, 0}}, out), TW_NOT_CONVERGED);
    EXPECT_NE(out[0].x, kUntouched);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
    EXPECT_EQ(p.inverse({{0, 2 * (1 + 0.9e-12), 0}, {1, 0, 0}, {2, 0, 0}}, out),
              TW_I_LATITUDE_LIMITED);
    EXPECT_NEAR(out[0].y, -lat0, 3e-8);  // the antipode
    EXPECT_NE(out[1].x, kUntouched);
  }
}

TEST(AzimuthalEqualArea, OutsideTheDiscOfTheEllipsoid) {
  const EqualArea p(kE, 0, 0.6);
  const double edge = 2 * p.rq * p.D;  // along x
  Points out = untouched(3);
  EXPECT_EQ(p.inverse({{1, 0, 0}, {edge * 1.00051, 0, 0}, {1, 0, 0}}, out), TW_NOT_CONVERGED);
  EXPECT_NE(out[0].x, kUntouched);
  expect_untouched(out[1]);
  expect_untouched(out[2]);
  // Looser than on the sphere.
  EXPECT_EQ(p.inverse({{edge * 1.00049, 0, 0}, {1, 0, 0}}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_NEAR(out[0].y, -0.6, 1e-7);
  EXPECT_NE(out[1].x, kUntouched);
  // At a polar origin it is q that is held: beyond qp there is no latitude.
  const EqualArea pole(kE, 0, kPi / 2);
  const double rim = std::sqrt(2 * pole.qp);
  out = untouched(2);
  EXPECT_EQ(pole.inverse({{rim * 1.0001, 0, 0}, {1, 0, 0}}, out), TW_NOT_CONVERGED);
  expect_untouched(out[0]);
  expect_untouched(out[1]);
  EXPECT_EQ(pole.inverse({{rim * 1.1, 0, 0}, {1, 0, 0}}, out), TW_NOT_CONVERGED);
  expect_untouched(out[0]);
  // At the rim itself q is -qp, turned positive: wanted, though it is the wrong pole.
  EXPECT_NEAR(pole.inverse({rim * (1 - 1e-10), 0, 0}).y, kPi / 2, 3e-5);
}

TEST(AzimuthalEqualArea, PolarInverseTakesQWithoutItsSign) {
  // Past the equator q turns negative and is taken positive: the latitude comes out mirrored.
  const EqualArea p(kE, 0, kPi / 2);
  const CoordinateTriple plane = p.forward({0.3, -0.4, 0});
  EXPECT_NEAR(p.inverse(plane).y, 0.4, 1e-13);
}

TEST(AzimuthalEqualArea, PlanesOriginComesBack) {
  const EqualArea sphere(0, 0.3, 0.6), oblique(kE, 0.3, 0.6), equator(kE, 0.3, 0);
  CoordinateTriple out = sphere.inverse({0, 0, 0});
  EXPECT_EQ(out.x, 0.3);
  EXPECT_EQ(out.y, 0.6);
  out = oblique.inverse({0, 0, 0});
  EXPECT_EQ(out.x, 0.3);
  EXPECT_NEAR(out.y, 0.6, 1e-15);
  EXPECT_NEAR(equator.inverse({0, 0, 0}).y, 0, 1e-16);
  // Its longitude is wrapped like any other, one turn at most.
  EXPECT_DOUBLE_EQ(EqualArea(0, 4, 0.6).inverse({0, 0, 0}).x, 4 - 2 * kPi);
  EXPECT_EQ(EqualArea(0, -kPi, 0.6).inverse({0, 0, 0}).x, kPi);
  EXPECT_DOUBLE_EQ(EqualArea(kE, 12, 0.6).inverse({0, 0, 0}).x, 12 - 2 * kPi);
  // A latitude beyond a pole is refused: here that of an origin which is given so.
  Points beyond = untouched(2);
  EXPECT_EQ(EqualArea(0, 0, kPi / 2 + 2e-12).inverse({{0, 0, 0}, {1, 1, 0}}, beyond),
            TW_NOT_CONVERGED);
  expect_untouched(beyond[0]);
  expect_untouched(beyond[1]);
  EXPECT_EQ(EqualArea(0, 0, -kPi / 2 - 2e-12).inverse({{0, 0, 0}}, beyond), TW_NOT_CONVERGED);
  EXPECT_EQ(EqualArea(0, 0, kPi / 2 + 0.9e-12).inverse({{0, 0, 0}}, beyond), TW_SUCCESS);
}

TEST(AzimuthalEqualArea, DifferenceIsNotWrapped) {
  const EqualArea p(kE, 0, 0.6);
  const CoordinateTriple a = p.forward({1, 0.3, 0});
  const CoordinateTriple b = p.forward({1 + 2 * kPi, 0.3, 0});
  expect_near(a, b.x, b.y, 2e-15);
}

TEST(AzimuthalEqualArea, ScaleOfTheSphere) {
  for (const double lat0 : {0.0, 0.6, kPi / 2, -kPi / 2}) {
    const EqualArea p(0, 0.3, lat0);
    // Across the ray, on the meridian of origin.
    const double lat = lat0 > 1 ? 0.9 : lat0 < -1 ? -0.9 : lat0 + 0.5;
    const auto expected =
        numeric_scale([&](CoordinateTriple q) { return p.forward(q); }, 0.3, lat, 0);
    const CoordinateTriple out = p.scale(2, {0.3, lat, 0});
    EXPECT_NEAR(out.x, 2 * expected.x, 1e-10);
    EXPECT_NEAR(out.y, 2 * expected.y, 1e-10);
    EXPECT_NEAR(out.z, 4, 1e-14);
  }
}

TEST(AzimuthalEqualArea, ScaleOfTheEllipsoid) {
  // Polar: of the ellipsoid.
  for (const double lat0 : {kPi / 2, -kPi / 2}) {
    const EqualArea p(kE, 0.3, lat0);
    const double lat = lat0 > 0 ? 1.396 : -1.396;
    const auto expected =
        numeric_scale([&](CoordinateTriple q) { return p.forward(q); }, 0.8, lat, kE);
    const CoordinateTriple out = p.scale(1, {0.8, lat, 0});
    EXPECT_NEAR(out.x, expected.x, 1e-10);
    EXPECT_NEAR(out.y, expected.y, 1e-10);
  }
  // Oblique and equatorial: of the sphere, whatever the eccentricity.
  for (const double lat0 : {0.0, 0.6}) {
    const CoordinateTriple out = EqualArea(kE, 0.3, lat0).scale(1, {0.7, 0.9, 0});
    const CoordinateTriple sphere = EqualArea(0, 0.3, lat0).scale(1, {0.7, 0.9, 0});
    EXPECT_EQ(out.x, sphere.x);
    EXPECT_EQ(out.y, sphere.y);
  }
}

TEST(AzimuthalEqualArea, AreasAreKept) {
  // A quadrangle between two parallels has the area (q2 - q1) dlon / 2 on the unit ellipsoid.
  for (const double e : {0.0, 0.2}) {
    for (const double lat0 : {0.0, 0.6, kPi / 2}) {
      const EqualArea p(e, 0.3, lat0);
      const double lon = 0.8, lat = 0.4, h = 1e-3;
      const auto at = [&](double u, double v) { return p.forward({lon + u * h, lat + v * h, 0}); };
      const CoordinateTriple w = at(-1, 0), r = at(1, 0), s = at(0, -1), n = at(0, 1);
      const double area = ((r.x - w.x) * (n.y - s.y) - (r.y - w.y) * (n.x - s.x)) / (4 * h * h);
      const double q = 1 - e * e * std::sin(lat) * std::sin(lat);
      EXPECT_NEAR(area, std::cos(lat) * (1 - e * e) / (q * q), 1e-6);
    }
  }
}

TEST(AzimuthalEqualArea, RoundTripInPlace) {
  std::mt19937 random(49);
  std::uniform_real_distribution<double> lon(-2.5, 2.5), lat(-1.4, 1.4);
  for (const double e : {0.0, kE, 0.1, 0.11, 0.3}) {
    for (const double lat0 : {0.0, 0.7, -0.7}) {
      const EqualArea p(e, 0.2, lat0);
      Points in(300);
      for (auto& q : in) q = {0.2 + lon(random), lat(random), 7};
      Points out = in;
      EXPECT_EQ(p.forward(out, out), TW_SUCCESS);
      EXPECT_EQ(p.inverse(out, out), TW_SUCCESS);
      // Far from the origin the plane is compressed along the ray.
      for (std::size_t i = 0; i < in.size(); ++i) {
        expect_near(out[i], in[i].x, in[i].y, 7, 2e-12);
      }
    }
  }
}

TEST(AzimuthalEqualArea, NothingToDoAndNotANumber) {
  CoordinateTriple p = kUntouchedPoint;
  for (const int32_t count : {0, -1}) {
    for (const double e : {0.0, kE}) {
      TWstatus status = 0;
      TWlam_az_eq_f(&p, count, e, 0, 0, 0, 0, 2, 1, 1, 0, 1, 0, 1, 1, &p, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      TWlam_az_eq_i(&p, count, e, 0, 0, 0, 2, 1, 0, 1, 0, 1, 1, &p, &status);
      EXPECT_EQ(status, TW_SUCCESS);
      TWlam_az_eq_s(&p, count, 0, 0, e, 0, 2, 1, 0, 1, &p, &status);
      EXPECT_EQ(status, TW_SUCCESS);
    }
    expect_untouched(p);
  }
  for (const double e : {kE, 0.3}) {
    const EqualArea q(e, 0, 0.5);
    EXPECT_TRUE(std::isnan(q.forward({0, kNaN, 0}).x));
    Points out = untouched(1);
    EXPECT_EQ(q.inverse({{kNaN, 0, 0}}, out), TW_NOT_CONVERGED);  // the passes are used up
    expect_untouched(out[0]);
  }
  EXPECT_TRUE(std::isnan(EqualArea(0, 0, 0.5).inverse({kNaN, 0, 0}).x));
}

TEST(AzimuthalEqualArea, AgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const auto [a, e] = Ellipsoid::grs80();
  for (const double lat0 : {-90.0, -35.0, 0.0, 52.0, 90.0}) {
    const ProjPeer peer("+proj=laea +ellps=GRS80 +lon_0=12 +lat_0=" + std::to_string(lat0));
    ASSERT_TRUE(peer.ok());
    const EqualArea p(e, degrees(12), degrees(lat0));
    for (double lat = -85; lat < 90; lat += 17) {
      for (double lon = -150; lon < 190; lon += 19) {
        const CoordinateTriple in = {degrees(lon), degrees(lat), 0};
        const CoordinateTriple expected = peer.forward(in);
        expect_near(p.forward(in), expected.x / a, expected.y / a, 4e-14);
      }
    }
  }
#endif
}

TEST(AzimuthalEqualArea, TakesTheQpThatItIsGiven) {
  // The latitude is the one whose q is what the geometry gives with that qp, by bisection here.
  const double e = Ellipsoid::grs80().e;
  const double e2 = e * e;
  const auto q_of = [&](double lat) {
    const double s = std::sin(lat);
    return (s / (1 - e2 * s * s) - std::log((1 - e * s) / (1 + e * s)) / (2 * e)) * (1 - e2);
  };
  const auto latitude = [&](double q) {
    double low = -kPi / 2, high = kPi / 2;
    for (int i = 0; i < 200; ++i) (q_of((low + high) / 2) < q ? low : high) = (low + high) / 2;
    return low;
  };
  for (const double factor : {0.9, 0.97, 1 - 1e-10, 1.002}) {
    EqualArea oblique(e, 0, 0.6);
    oblique.qp *= factor;
    for (const double y : {-0.7, 0.2, 0.6}) {
      const double rho = std::fabs(oblique.D * y);
      const double ce = 2 * std::asin(rho / (2 * oblique.rq));
      const double q =
          (oblique.D * std::sin(ce) * oblique.cos_b1 * y / rho + std::cos(ce) * oblique.sin_b1) *
          oblique.qp;
      EXPECT_NEAR(oblique.inverse({0, y, 0}).y, latitude(q), 2e-13);
    }
    EqualArea north(e, 0, kPi / 2);
    north.qp *= factor;
    EXPECT_NEAR(north.inverse({0.3, 0.8, 0}).y, latitude(north.qp - 0.73), 2e-13);
  }
}

}  // namespace
