#include <gtest/gtest.h>

#include <functional>

#include "support/points.hpp"
#include "tidewater/conformal.h"
#include "tidewater/datum.h"

using namespace tidewater::test;

namespace {

// A forward map that counts its calls and may fail at one of them.
struct Map {
  std::function<CoordinateTriple(CoordinateTriple)> image;
  int calls = 0;
  int fails_at = 0;
  TWstatus word = TW_NOT_CONVERGED;
  std::vector<CoordinateTriple> seen = {};

  static void call(TWcontext context, int32_t count, const CoordinateTriple* in,
                   CoordinateTriple* out, TWstatus* status) {
    auto& self = *reinterpret_cast<Map*>(context);  // NOLINT(performance-no-int-to-ptr)
    EXPECT_EQ(count, 1);
    EXPECT_EQ(*status, TW_SUCCESS);
    self.seen.push_back(*in);
    if (++self.calls == self.fails_at) *status = self.word;
    const auto p = self.image(*in);
    out->x = p.x;
    out->y = p.y;
  }

  TWcontext context() { return reinterpret_cast<TWcontext>(this); }

  TWstatus invert(double lon, double lat, const Points& in, Points& out) {
    TWstatus status = 0;
    TWgeneric_i(call, context(), lon, lat, kNaN, static_cast<int32_t>(in.size()), in.data(),
                out.data(), &status);
    return status;
  }
};

CoordinateTriple plate(CoordinateTriple p) { return {p.x, p.y, 0}; }

CoordinateTriple mercator(CoordinateTriple p) {
  TWstatus status = 0;
  TWmerc_f(0.0818, 0, 0, 1, &p, &p, &status);
  return p;
}

TEST(GenericInverse, InvertsMercator) {
  Map map = {mercator};
  const Points places = {{0.1, 0.2, 0}, {0.3, 0.5, 0}, {1.5, -1.2, 0}, {-2.5, 0.9, 0}};
  Points plane;
  for (const auto& p : places) plane.push_back(mercator(p));
  Points out(4, CoordinateTriple{0, 0, 5});
  EXPECT_EQ(map.invert(0, 0, plane, out), TW_SUCCESS);
  for (std::size_t i = 0; i < 4; ++i) expect_near(out[i], places[i].x, places[i].y, 5, 1e-13);
}

TEST(GenericInverse, TurnedAndScaledPlane) {
  // The walk learns turn and scale from its own steps.
  Map map = {[](CoordinateTriple p) {
    const auto q = mercator(p);
    return CoordinateTriple{30 * (q.x * std::cos(2.0) - q.y * std::sin(2.0)),
                            30 * (q.x * std::sin(2.0) + q.y * std::cos(2.0)), 0};
  }};
  const CoordinateTriple place = {0.4, 0.7, 0};
  Points out = untouched(1);
  EXPECT_EQ(map.invert(0.1, 0.3, {map.image(place)}, out), TW_SUCCESS);
  expect_near(out[0], 0.4, 0.7, 1e-13);
  EXPECT_EQ(out[0].z, kUntouched);
}

TEST(GenericInverse, FirstStepsByHand) {
  Map map = {plate, 0, 3};
  Points out = untouched(1);
  EXPECT_EQ(map.invert(0.5, 0.25, {{0.6, 0.25, 0}}, out), TW_NOT_CONVERGED);
  ASSERT_EQ(map.seen.size(), 3u);
  // The previous point lies a little north, the estimate is the start.
  expect_near(map.seen[0], 0.5, 0.25 + 5e-6, 0);
  expect_near(map.seen[1], 0.5, 0.25, 0);
  // There the plane's step from the previous point was (0, -5e-6) like the sphere's: the map is
  // true to scale along the meridian, so the walk goes 0.1 eastward, over cos(lat).
  expect_near(map.seen[2], 0.5 + 0.1 / std::cos(0.25), 0.25, 1e-12);
  expect_untouched(out[0]);
}

TEST(GenericInverse, StartHardByTheNorthPoleLooksSouth) {
  const double limit = 1.5707913267948965;
  for (const auto& [lat, offset] : {std::pair{limit, -5e-6},
                                    {std::nextafter(limit, 0), 5e-6},
                                    {kPi / 2, -5e-6},
                                    {-kPi / 2, 5e-6}}) {
    Map map = {plate, 0, 1};
    Points out = untouched(1);
    map.invert(0.5, lat, {{0, 0, 0}}, out);
    expect_near(map.seen[0], 0.5, lat + offset, 0);
  }
}

TEST(GenericInverse, BadStart) {
  Map map = {plate};
  Points out = untouched(1);
  for (const double lat : {1.6, -1.6, std::nextafter(kPi / 2, 2)}) {
    EXPECT_EQ(map.invert(0, lat, {{0, 0, 0}}, out), TW_NOT_CONVERGED);
    EXPECT_EQ(map.calls, 0);
    expect_untouched(out[0]);
  }
}

TEST(GenericInverse, AFailingMapStops) {
  const Points plane = {{0.1, 0.1, 0}, {0.2, 0.2, 0}, {0.3, 0.3, 0}};
  // How many calls the first point takes.
  Map counting = {plate};
  Points out = untouched(3);
  counting.invert(0, 0, {plane[0]}, out);
  const int first = counting.calls;
  for (const int more : {1, 2}) {  // at the previous point, and at the estimate
    Map map = {plate, 0, first + more, TW_BAD_LATITUDE};
    out = untouched(3);
    EXPECT_EQ(map.invert(0, 0, plane, out), TW_NOT_CONVERGED);
    EXPECT_EQ(map.calls, first + more);
    EXPECT_NEAR(out[0].x, 0.1, 1e-13);
    expect_untouched(out[1]);
    expect_untouched(out[2]);
  }
  // A warning is a failure, an information word is none.
  Map warned = {plate, 0, 1, TW_W_NO_POINTS};
  EXPECT_EQ(warned.invert(0, 0, plane, out), TW_NOT_CONVERGED);
  Map informed = {plate, 0, first, TW_I_LATITUDE_LIMITED};
  EXPECT_EQ(informed.invert(0, 0, plane, out), TW_I_LATITUDE_LIMITED);
  EXPECT_NEAR(out[2].x, 0.3, 1e-13);
}

TEST(GenericInverse, GoesOnFromThePointBefore) {
  Map map = {plate};
  Points out = untouched(2);
  map.invert(0, 0, {{0.4, 0.3, 0}, {0.4, 0.3, 0}}, out);
  // The second point is found where the first one ended: two calls.
  Map alone = {plate};
  Points one = untouched(1);
  alone.invert(0, 0, {{0.4, 0.3, 0}}, one);
  EXPECT_EQ(map.calls, alone.calls + 2);
  expect_near(out[1], one[0].x, one[0].y, 0);
}

TEST(GenericInverse, ACeaselessWalkEndsAfter100Passes) {
  // A constant map: the error never falls.
  Map map = {[](CoordinateTriple) { return CoordinateTriple{0, 0, 0}; }};
  Points out = untouched(1);
  EXPECT_EQ(map.invert(0, 0, {{100, 100, 0}}, out), TW_SUCCESS);
  EXPECT_EQ(map.calls, 101);
  EXPECT_LE(std::fabs(out[0].x), kPi);
  EXPECT_LE(std::fabs(out[0].y), kPi / 2);
}

TEST(GenericInverse, OverAPole) {
  // Polar azimuthal equidistant: the walk goes straight over the pole.
  Map map = {[](CoordinateTriple p) {
    const double r = kPi / 2 - p.y;
    return CoordinateTriple{r * std::sin(p.x), -r * std::cos(p.x), 0};
  }};
  const CoordinateTriple place = {3.0, 1.4, 0};
  Points out = untouched(1);
  EXPECT_EQ(map.invert(0, 1.3, {map.image(place)}, out), TW_SUCCESS);
  expect_near(out[0], 3.0, 1.4, 1e-12);
}

TEST(GenericInverse, AcrossThe180thMeridian) {
  Map map = {[](CoordinateTriple p) {
    const double d = std::remainder(p.x - 3, 2 * kPi);  // a plane about longitude 3
    return CoordinateTriple{d, p.y, 0};
  }};
  Points out = untouched(1);
  EXPECT_EQ(map.invert(3, 0.1, {{0.4, 0.2, 0}}, out), TW_SUCCESS);
  expect_near(out[0], 3.4 - 2 * kPi, 0.2, 1e-13);
  // And from a start that is many turns out.
  EXPECT_EQ(map.invert(3 + 20 * kPi, 0.1, {{0.4, 0.2, 0}}, out), TW_SUCCESS);
  expect_near(out[0], 3.4 - 2 * kPi, 0.2, 1e-12);
}

TEST(GenericInverse, NotANumberEnds) {
  for (const double odd : {kNaN, kInfinity, 1e300}) {
    Map map = {plate};
    Points out = untouched(1);
    map.invert(0, 0, {{odd, 0, 0}}, out);
    map.invert(odd, 0, {{0.1, 0, 0}}, out);
  }
  Map nan = {[](CoordinateTriple) { return CoordinateTriple{kNaN, kNaN, 0}; }};
  Points out = untouched(1);
  EXPECT_EQ(nan.invert(0, kNaN, {{0.1, 0, 0}}, out), TW_SUCCESS);
  EXPECT_EQ(nan.calls, 101);
}

TEST(GenericInverse, NothingToDo) {
  Map map = {plate};
  Points none, out = untouched(1);
  EXPECT_EQ(map.invert(0, 0, none, out), TW_SUCCESS);
  EXPECT_EQ(map.calls, 0);
}

}  // namespace
