#include <gtest/gtest.h>

#include <functional>

#include "support/points.hpp"
#include "tidewater/conformal.h"
#include "tidewater/special.h"

using namespace tidewater::test;

namespace {

using Record = std::array<double, 9>;

// A transformation with a domain, that counts its calls.
struct Transformation {
  std::function<CoordinateTriple(const CoordinateTriple&)> map = [](const CoordinateTriple& p) {
    return p;
  };
  std::function<TWstatus(const CoordinateTriple&)> word = [](const CoordinateTriple&) {
    return TW_SUCCESS;
  };
  std::vector<int32_t> counts;

  static void call(void* context, int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                   TWstatus* status) {
    auto& self = *static_cast<Transformation*>(context);
    self.counts.push_back(count);
    *status = TW_SUCCESS;
    for (int32_t i = 0; i < count; ++i) {
      const CoordinateTriple p = in[i];
      const TWstatus w = self.word(p);
      if (w != TW_SUCCESS) *status = w;
      if (TW_OK(w)) out[i] = self.map(p);
    }
  }
};

TWstatus jacobian(Transformation& t, const Points& in, std::vector<Record>& out,
                  double step = 0.125) {
  TWstatus status = 0;
  TWget_jacobian(Transformation::call, &t, step, 2 * step, 4 * step,
                 static_cast<int32_t>(in.size()), in.data(), out[0].data(), &status);
  return status;
}

Record unwritten() {
  Record r;
  r.fill(kUntouched);
  return r;
}

// Quadratic in each element: central differences are exact, one-sided ones are off by step.
CoordinateTriple quadratic(const CoordinateTriple& p) {
  return {p.x * p.x + 2 * p.y, p.y * p.y + 3 * p.z, p.z * p.z + 5 * p.x};
}

TEST(Jacobian, Identity) {
  Transformation t;
  std::vector<Record> out(2, unwritten());
  EXPECT_EQ(jacobian(t, {{1, 2, 3}, {-4, 5, 6}}, out), TW_SUCCESS);
  const Record unit = {1, 0, 0, 0, 1, 0, 0, 0, 1};
  EXPECT_EQ(out[0], unit);
  EXPECT_EQ(out[1], unit);
  EXPECT_EQ(t.counts, (std::vector<int32_t>{6, 6}));
}

TEST(Jacobian, CentralDifferencesOfAQuadratic) {
  Transformation t;
  t.map = quadratic;
  std::vector<Record> out(1, unwritten());
  EXPECT_EQ(jacobian(t, {{1, 2, 3}}, out), TW_SUCCESS);
  EXPECT_EQ(out[0], (Record{2, 0, 5, 2, 4, 0, 0, 3, 6}));
}

TEST(Jacobian, NeighbourThatFailsGivesAOneSidedDifference) {
  for (const int side : {+1, -1}) {
    Transformation t;
    t.map = quadratic;
    t.word = [side](const CoordinateTriple& p) {
      return side * (p.y - 2) > 0.1 ? TW_BAD_LATITUDE : TW_SUCCESS;
    };
    std::vector<Record> out(2, unwritten());
    EXPECT_EQ(jacobian(t, {{1, 2, 3}, {1, 1, 3}}, out), side > 0 ? TW_SUCCESS : TW_BAD_LATITUDE);
    // backward (plus failed): slope 2 y - step; forward: 2 y + step, with a step of 0.25 along y
    EXPECT_EQ(out[0], (Record{2, 0, 5, 2, 4 - side * 0.25, 0, 0, 3, 6}));
    // six at once, the base, then two for each axis
    EXPECT_EQ((std::vector<int32_t>(t.counts.begin(), t.counts.begin() + 8)),
              (std::vector<int32_t>{6, 1, 1, 1, 1, 1, 1, 1}));
    if (side < 0) {
      EXPECT_EQ(out[1], unwritten());  // its base point lies outside
    }
  }
}

TEST(Jacobian, BasePointThatFailsEndsTheCall) {
  Transformation t;
  t.word = [](const CoordinateTriple& p) { return p.x > 10 ? TW_NOT_CONVERGED : TW_SUCCESS; };
  std::vector<Record> out(3, unwritten());
  EXPECT_EQ(jacobian(t, {{1, 2, 3}, {11, 2, 3}, {1, 2, 3}}, out), TW_NOT_CONVERGED);
  EXPECT_NE(out[0], unwritten());
  EXPECT_EQ(out[1], unwritten());
  EXPECT_EQ(out[2], unwritten());
}

TEST(Jacobian, BothNeighboursFailingEndTheCall) {
  Transformation t;
  t.word = [](const CoordinateTriple& p) {  // a plane of points: z must be 3
    return p.z != 3 ? TW_RANGE_ERROR : TW_SUCCESS;
  };
  std::vector<Record> out(2, unwritten());
  EXPECT_EQ(jacobian(t, {{1, 2, 3}, {1, 2, 3}}, out), TW_RANGE_ERROR);
  EXPECT_EQ(out[0], unwritten());  // whole or not at all
  EXPECT_EQ(out[1], unwritten());
}

TEST(Jacobian, WordThatTheCallerSees) {
  Transformation t;
  t.word = [](const CoordinateTriple& p) -> TWstatus {
    if (p.x > 1.1) return TW_BAD_LATITUDE;  // fails one neighbour of x = 1
    if (p.x == 1.0 && p.y == 2.0 && p.z == 3.0) return TW_I_LATITUDE_LIMITED;  // the base itself
    return TW_SUCCESS;
  };
  std::vector<Record> out(2, unwritten());
  // the slow way leaves the word of the base point
  EXPECT_EQ(jacobian(t, {{1, 2, 3}}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_EQ(out[0][0], 1);
  // a later call of the transformation sets it anew
  EXPECT_EQ(jacobian(t, {{1, 2, 3}, {0, 2, 3}}, out), TW_SUCCESS);
  // information passes as good on the fast way
  Transformation always;
  always.word = [](const CoordinateTriple&) { return TW_I_LATITUDE_LIMITED; };
  EXPECT_EQ(jacobian(always, {{1, 2, 3}}, out), TW_I_LATITUDE_LIMITED);
  EXPECT_EQ(always.counts.size(), 1u);
}

TEST(Jacobian, NothingToDo) {
  Transformation t;
  Record r = unwritten();
  TWstatus status = 0;
  TWget_jacobian(Transformation::call, &t, 1, 1, 1, 0, nullptr, r.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  TWget_jacobian(Transformation::call, &t, 1, 1, 1, -1, nullptr, r.data(), &status);
  EXPECT_EQ(r, unwritten());
  EXPECT_TRUE(t.counts.empty());
  CoordinateTriple q = kUntouchedPoint;
  double c = kUntouched;
  TWJ_to_scales(1, 0, 0, &q, r.data(), &q, &status);
  TWJ_to_slopes(-1, r.data(), &q, &status);
  TWJ_to_merconv(0, r.data(), &c, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  expect_untouched(q);
  EXPECT_EQ(c, kUntouched);
}

TEST(Jacobian, ScalesOfMercator) {
  const double e = 0.0818, a = 6378137;
  Transformation t;
  t.map = [&](CoordinateTriple p) {
    TWstatus status = 0;
    TWmerc_f(e, 0, 0, 1, &p, &p, &status);
    return CoordinateTriple{p.x * a, p.y * a, p.z};
  };
  std::vector<Record> records(1);
  for (double lat = -1.2; lat < 1.3; lat += 0.3) {
    CoordinateTriple p = {0.3, lat, 100};
    EXPECT_EQ(jacobian(t, {p}, records, 1e-5), TW_SUCCESS);
    CoordinateTriple expected = p, scale = kUntouchedPoint;
    TWstatus status = 0;
    TWmerc_s(e, 1, 1, &expected, &expected, &status);
    TWJ_to_scales(a, e, 1, &p, records[0].data(), &scale, &status);
    EXPECT_EQ(status, TW_SUCCESS);
    // third derivatives times the square of the step
    expect_near(scale, expected.x, expected.y, expected.z, 3e-8);
    double convergence = kUntouched;
    TWJ_to_merconv(1, records[0].data(), &convergence, &status);
    EXPECT_NEAR(convergence, 0, 1e-15);
  }
}

TEST(Jacobian, ScalesByHand) {
  // On the unit sphere at 60 N the parallel has half the radius.
  const Record r = {3, 4, 99, 5, 12, 99, 99, 99, 99};
  const Record both[2] = {r, r};
  const Points in = {{0, kPi / 3, 0}, {0, std::nextafter(kPi / 2, 2), 0}};
  Points out = untouched(2);
  TWstatus status = 0;
  TWJ_to_scales(1, 0, 2, in.data(), both[0].data(), out.data(), &status);
  EXPECT_EQ(status, TW_BAD_LATITUDE);
  expect_near(out[0], 10, 13, 2 * (3 * 12 - 5 * 4), 1e-13);
  expect_near(out[1], 1, 1, 1, 0);
  // exactly the pole passes and divides by next to nothing; a not-a-number passes, too
  const Points pole = {{0, kPi / 2, 0}, {0, -kPi / 2, 0}, {0, kNaN, 0}};
  const Record three[3] = {r, r, r};
  out = untouched(3);
  TWJ_to_scales(1, 0, 3, pole.data(), three[0].data(), out.data(), &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_GT(out[0].x, 1e15);
  EXPECT_GT(out[1].x, 1e15);
  EXPECT_TRUE(std::isnan(out[2].x));
}

TEST(Jacobian, SlopesUseElementThreeTwice) {
  const Record r = {2, 99, 0, 3, 5, 0, 0, 0, 0};
  CoordinateTriple out = kUntouchedPoint;
  TWstatus status = 0;
  TWJ_to_slopes(1, r.data(), &out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  const double t1 = std::atan2(3, 2), t2 = std::atan2(5, 3);
  expect_near(out, t1, t2, t2 - t1, 0);
}

TEST(Jacobian, MeridianConvergence) {
  const Record records[] = {{1, 0, 0, 0, 1, 0, 0, 0, 1},    // identity
                            {0, 0, 0, -1, 1, 0, 0, 0, 0},   // north turned west by 45 degrees
                            {0, 0, 0, -1, -1, 0, 0, 0, 0},  // t2 = -135 degrees
                            {0, 0, 0, 0, -1, 0, 0, 0, 0},   // t2 = -90: exactly -pi becomes pi
                            {0, 0, 0, 1, 0, 0, 0, 0, 0}};
  double out[6] = {kUntouched, kUntouched, kUntouched, kUntouched, kUntouched, kUntouched};
  TWstatus status = 0;
  TWJ_to_merconv(5, records[0].data(), out, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(out[0], 0);
  EXPECT_NEAR(out[1], kPi / 4, 1e-15);
  EXPECT_NEAR(out[2], 3 * kPi / 4, 1e-15);
  EXPECT_EQ(out[3], kPi);
  EXPECT_NEAR(out[4], -kPi / 2, 1e-15);
  EXPECT_EQ(out[5], kUntouched);
}

}  // namespace
