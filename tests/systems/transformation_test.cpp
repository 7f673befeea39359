#include "tidewater/transformation.hpp"

#include <gtest/gtest.h>

#include <atomic>
#include <cmath>
#include <thread>
#include <vector>

#include "support/data.hpp"

namespace tidewater::test {

namespace {

constexpr double kNone = -12345.678;  // what must stay unwritten

std::string refusal(const char* source, const char* target,
                    const TransformationOptions& options = {}) {
  try {
    const Transformation made{System(source), System(target), options};
    return "not refused: " + made.describe();
  } catch (const Error& error) {
    return error.what();
  }
}

bool has(const std::string& text, const char* part) { return text.find(part) != std::string::npos; }

TransformationOptions with_operation(const char* operation) {
  TransformationOptions options;
  options.operation = operation;
  return options;
}

}  // namespace

// Worked example of the national mapping agency of France, to a millimetre: the Lambert-93 of
// 3 E, 46.5 N is its false origin.
TEST(Transformation, FalseOriginOfLambert93) {
  const Transformation map{System("EPSG:4326"), System("EPSG:2154")};
  const Point there = map.forward({3, 46.5, 77});
  EXPECT_NEAR(there.x, 700000, 1e-6);
  EXPECT_NEAR(there.y, 6600000, 1e-6);
  EXPECT_EQ(there.z, 77);
  const Point back = map.inverse(there);
  EXPECT_NEAR(back.x, 3, 1e-12);
  EXPECT_NEAR(back.y, 46.5, 1e-12);
  EXPECT_EQ(map.accuracy(), 1);
  EXPECT_EQ(map.operation(), "-EPSG:1671");
  EXPECT_TRUE(has(map.describe(), "RGF93 v1 to WGS 84 (1)"));
}

TEST(Transformation, EveryViewOfPointsGivesTheSameFigures) {
  const Transformation map{System("27700"), System("4326")};
  constexpr std::size_t kPoints = 1000;
  std::vector<double> x(kPoints), y(kPoints), z(kPoints), rx(kPoints), ry(kPoints), rz(kPoints);
  for (std::size_t i = 0; i < kPoints; ++i) {
    x[i] = 200000 + 400 * static_cast<double>(i);
    y[i] = 100000 + 700 * static_cast<double>(i);
    z[i] = static_cast<double>(i);
  }
  ASSERT_TRUE(map.forward(kPoints, Coordinates<const double>{x.data(), y.data(), z.data()},
                          Coordinates<double>{rx.data(), ry.data(), rz.data()}));
  EXPECT_EQ(rz, z);

  // Interleaved with room between, which stays as it was; in place.
  constexpr int kAxes = 5;
  std::vector<double> wide(kPoints * kAxes, kNone);
  for (std::size_t i = 0; i < kPoints; ++i) {
    wide[kAxes * i] = x[i];
    wide[kAxes * i + 1] = y[i];
    wide[kAxes * i + 2] = z[i];
  }
  const auto view = interleaved(wide.data(), kAxes);
  ASSERT_TRUE(map.forward(kPoints, view, view));
  for (std::size_t i = 0; i < kPoints; ++i) {
    ASSERT_EQ(wide[kAxes * i], rx[i]);
    ASSERT_EQ(wide[kAxes * i + 1], ry[i]);
    ASSERT_EQ(wide[kAxes * i + 2], z[i]);
    ASSERT_EQ(wide[kAxes * i + 3], kNone);
    ASSERT_EQ(wide[kAxes * i + 4], kNone);
  }

  // Single precision in, double out, and single out.
  std::vector<float> fx(x.begin(), x.end()), fy(y.begin(), y.end());
  std::vector<double> dx(kPoints), dy(kPoints);
  ASSERT_TRUE(map.forward(kPoints, Coordinates<const float>{fx.data(), fy.data()},
                          Coordinates<double>{dx.data(), dy.data()}));
  EXPECT_EQ(dx, rx);  // the figures are whole numbers, which a float holds
  EXPECT_EQ(dy, ry);
  const Coordinates<float> in_place = {fx.data(), fy.data()};
  ASSERT_TRUE(map.forward(kPoints, in_place, in_place));
  for (std::size_t i = 0; i < kPoints; ++i) {
    ASSERT_EQ(fx[i], static_cast<float>(rx[i]));
    ASSERT_EQ(fy[i], static_cast<float>(ry[i]));
  }

  // One at a time, and with a negative stride.
  for (const std::size_t i : {std::size_t{0}, std::size_t{255}, std::size_t{256}, kPoints - 1}) {
    const Point one = map.forward({x[i], y[i], z[i]});
    EXPECT_EQ(one.x, rx[i]);
    EXPECT_EQ(one.y, ry[i]);
  }
  std::vector<double> bx(kPoints), by(kPoints);
  ASSERT_TRUE(map.forward(
      kPoints,
      Coordinates<const double>{x.data() + kPoints - 1, y.data() + kPoints - 1, nullptr, -1},
      Coordinates<double>{bx.data(), by.data()}));
  EXPECT_EQ(bx[0], rx[kPoints - 1]);
  EXPECT_EQ(by[kPoints - 1], ry[0]);
}

TEST(Transformation, ThreadsGiveTheSameFigures) {
  const Transformation map{System("27572"), System("2154")};
  constexpr std::size_t kPoints = 100003;
  std::vector<double> x(kPoints), y(kPoints);
  for (std::size_t i = 0; i < kPoints; ++i) {
    x[i] = 300000 + 7.0 * static_cast<double>(i % 90000);
    y[i] = 1800000 + 7.0 * static_cast<double>(i);
  }
  x[70000] = std::nan("");
  x[99999] = std::nan("");
  std::vector<double> one_x(kPoints), one_y(kPoints), many_x(kPoints), many_y(kPoints);
  std::vector<TWstatus> one_words(kPoints), many_words(kPoints);
  const Coordinates<const double> in = {x.data(), y.data()};
  const auto one = map.forward(kPoints, in, {one_x.data(), one_y.data()}, {one_words.data(), 1});
  for (const unsigned threads : {0u, 2u, 3u, 8u}) {
    const auto many =
        map.forward(kPoints, in, {many_x.data(), many_y.data()}, {many_words.data(), threads});
    EXPECT_EQ(one.failed, many.failed);
    EXPECT_EQ(one.word, many.word);
    EXPECT_EQ(one_words, many_words);
    for (std::size_t i = 0; i < kPoints; ++i) {
      ASSERT_TRUE(one_x[i] == many_x[i] || (std::isnan(one_x[i]) && std::isnan(many_x[i])));
      ASSERT_TRUE(one_y[i] == many_y[i] || (std::isnan(one_y[i]) && std::isnan(many_y[i])));
    }
  }
}

// A thousand threads with systems of their own at once.
TEST(Transformation, AThousandThreads) {
  std::atomic<int> wrong{0};
  std::vector<std::thread> threads;
  for (int t = 0; t < 1000; ++t) {
    threads.emplace_back([t, &wrong] {
      const int zone = 1 + t % 60;
      const Transformation map{System("EPSG:4326"), System(std::to_string(32600 + zone))};
      const Point p = map.forward({zone * 6.0 - 183, 0, 0});
      if (std::fabs(p.x - 500000) > 1e-6 || std::fabs(p.y) > 1e-6) ++wrong;
    });
  }
  for (auto& thread : threads) thread.join();
  EXPECT_EQ(wrong, 0);
}

TEST(Transformation, FailingPointsDisturbNoOthers) {
  const Transformation map{System("EPSG:4326"), System("EPSG:32631")};
  const double inf = std::numeric_limits<double>::infinity();
  std::vector<double> x, y;
  std::vector<TWstatus> expected;
  for (int i = 0; i < 700; ++i) {
    x.push_back(1 + i * 0.005);
    y.push_back(40 + i * 0.01);
    expected.push_back(TW_SUCCESS);
  }
  const auto spoil = [&](std::size_t i, double lon, double lat, TWstatus word) {
    x[i] = lon;
    y[i] = lat;
    expected[i] = word;
  };
  spoil(0, 3, 90.1, TW_BAD_LATITUDE);
  spoil(17, 3, -91, TW_BAD_LATITUDE);
  spoil(255, 800, 45, TW_BAD_LONGITUDE);
  spoil(256, std::nan(""), 45, TW_BAD_INPUT);
  spoil(300, 3, inf, TW_BAD_INPUT);
  spoil(699, 120, 10, TW_RANGE_ERROR);  // far from the central meridian
  std::vector<double> ox(700, kNone), oy(700, kNone), oz(700, kNone);
  std::vector<TWstatus> words(700);
  const auto summary = map.forward(700, Coordinates<const double>{x.data(), y.data()},
                                   {ox.data(), oy.data(), oz.data()}, {words.data()});
  EXPECT_EQ(summary.failed, 6u);
  EXPECT_EQ(summary.word, TW_BAD_LATITUDE);
  for (std::size_t i = 0; i < 700; ++i) {
    ASSERT_EQ(words[i], expected[i]) << i;
    if (expected[i] != TW_SUCCESS) {
      EXPECT_TRUE(std::isnan(ox[i]) && std::isnan(oy[i]) && std::isnan(oz[i])) << i;
      continue;
    }
    const Point alone = map.forward({x[i], y[i]});
    ASSERT_EQ(ox[i], alone.x) << i;
    ASSERT_EQ(oy[i], alone.y) << i;
  }
}

TEST(Transformation, LongitudesOfAnyTurn) {
  const Transformation map{System("EPSG:4326"), System("EPSG:3832")};  // about 150 E
  const Point east = map.forward({185, 10});
  const Point west = map.forward({-175, 10});
  EXPECT_NEAR(east.x, west.x, 1e-6);
  EXPECT_NEAR(map.inverse(east).x, -175, 1e-10);
}

TEST(Transformation, NoDatumChangePassesInSilence) {
  // No operation leads from a local grid's datum in the registry to anywhere.
  const std::string why = refusal("tmerc lat0=0 lon0=9 k0=1 x0=0 y0=0 ellps=bessel", "EPSG:4326");
  EXPECT_TRUE(has(why, "No way is known")) << why;
  EXPECT_TRUE(has(why, "no shift")) << why;
  const Transformation told{System("tmerc lat0=0 lon0=9 k0=1 x0=0 y0=0 ellps=bessel"),
                            System("EPSG:4326"), with_operation("no shift")};
  EXPECT_NEAR(told.inverse({9, 0}).x, 0, 1e-9);
  EXPECT_TRUE(std::isnan(told.accuracy()));
  EXPECT_TRUE(has(told.describe(), "as asked"));
  // Its parameters to WGS 84 are a way.
  const Transformation by_parameters{
      System("tmerc lat0=0 lon0=9 k0=1 x0=0 y0=0 ellps=bessel towgs84=598.1,73.7,418.2"),
      System("EPSG:4326")};
  const Transformation by_registry{System("EPSG:4314"), System("EPSG:4326"),
                                   with_operation("EPSG:1777")};
  EXPECT_EQ(by_parameters.source().kind(), SystemKind::projected);
  EXPECT_TRUE(std::isfinite(by_registry.forward({9, 50}).x));
}

TEST(Transformation, TimeDependentOperationsWantAnEpoch) {
  TransformationOptions options = with_operation("EPSG:8880");  // ITRF2014 to ETRF2014
  EXPECT_TRUE(has(refusal("EPSG:7789", "EPSG:8401", options), "epoch"));
  options.epoch = 2020;
  const Transformation map{System("EPSG:7789"), System("EPSG:8401"), options};
  const Point p = map.forward({4027894.006, 307045.600, 4919474.910});
  // 31 years of Eurasia's plate motion since 1989 are some 0.8 m.
  EXPECT_NEAR(std::hypot(p.x - 4027894.006, p.y - 307045.600, p.z - 4919474.910), 0.8, 0.15);
  const Point back = map.inverse(p);
  // The way back takes the transposed matrix of small angles: their squares are left.
  EXPECT_NEAR(back.x, 4027894.006, 1e-5);
}

TEST(Transformation, NamedOperationsAndTheirRefusals) {
  EXPECT_TRUE(has(refusal("4326", "2154", with_operation("EPSG:99999999")), "no operation"));
  EXPECT_TRUE(has(refusal("4326", "2154", with_operation("nonsense")), "nonsense"));
  EXPECT_TRUE(has(refusal("4326", "2154", with_operation("grid:no-such.gsb")), "no-such.gsb"));
  const Transformation named{System("4277"), System("4326"), with_operation("EPSG:1314")};
  EXPECT_EQ(named.operation(), "EPSG:1314");
  // The other way round it is taken backwards.
  const Transformation backwards{System("4326"), System("4277"), with_operation("EPSG:1314")};
  EXPECT_EQ(backwards.operation(), "-EPSG:1314");
  const Point p = named.forward({-2, 53});
  const Point q = backwards.forward(p);
  EXPECT_NEAR(q.x, -2, 1e-7);
  EXPECT_NEAR(q.y, 53, 1e-7);
}

TEST(Transformation, OwnAxesAndRadians) {
  TransformationOptions options;
  options.own_axes = true;
  const Transformation own{System("EPSG:4326"), System("EPSG:31467"), options};
  const Transformation usual{System("EPSG:4326"), System("EPSG:31467")};
  const Point a = own.forward({50, 9});
  const Point b = usual.forward({9, 50});
  EXPECT_EQ(a.x, b.y);  // the registry's axes of Gauss-Krueger zones are northing, easting
  EXPECT_EQ(a.y, b.x);
  TransformationOptions radians;
  radians.radians = true;
  const Transformation angular{System("EPSG:4326"), System("EPSG:31467"), radians};
  const Point c = angular.forward({9 * 0.017453292519943295, 50 * 0.017453292519943295});
  EXPECT_NEAR(c.x, b.x, 1e-6);
  EXPECT_NEAR(c.y, b.y, 1e-6);
}

TEST(Transformation, GeocentricAndHeights) {
  const Transformation map{System("EPSG:4979"), System("geocentric:wgs84")};
  const Point p = map.forward({0, 0, 100});
  EXPECT_NEAR(p.x, 6378237, 1e-8);
  EXPECT_NEAR(p.y, 0, 1e-8);
  const Point q = map.forward({90, 45, 0});
  // N sin 45 (1 - e^2), worked out by hand
  EXPECT_NEAR(q.z, 4487348.409, 1e-3);
  const Point back = map.inverse(q);
  EXPECT_NEAR(back.y, 45, 1e-10);
  EXPECT_NEAR(back.z, 0, 1e-6);
}

TEST(Transformation, CandidatesAreRankedAndNameWhatIsMissing) {
  const auto list = Transformation::candidates(System("27700"), System("4326"));
  ASSERT_GT(list.size(), 2u);
  EXPECT_TRUE(list.front().missing.empty());
  bool grid = false;
  for (const auto& candidate : list) {
    grid |= !candidate.missing.empty() && has(candidate.missing, "grid");
  }
  EXPECT_TRUE(grid);  // the national grid of shifts is not among Debian's
  for (std::size_t i = 1; i < list.size(); ++i) {
    EXPECT_LE(list[i - 1].missing.empty() ? 0 : 1, list[i].missing.empty() ? 0 : 1);
  }
}

// The registry has the way over Paris as one operation of two steps, found one by one as well.
TEST(Transformation, CandidatesOfTheSameStepsStandOnce) {
  const auto list = Transformation::candidates(System("27572"), System("2154"));
  ASSERT_GE(list.size(), 2u);
  for (std::size_t i = 0; i < list.size(); ++i) {
    for (std::size_t k = 0; k < i; ++k) EXPECT_NE(list[i].steps, list[k].steps);
  }
}

TEST(Systems, NamesThatUsersType) {
  EXPECT_EQ(System("2154").code(), 2154);
  EXPECT_EQ(System("epsg:2154").code(), 2154);
  EXPECT_EQ(System("urn:ogc:def:crs:EPSG::2154").code(), 2154);
  EXPECT_EQ(System("utm:30N").code(), 32630);
  EXPECT_EQ(System("utm:30s").code(), 32730);
  EXPECT_EQ(System("utm 33N ED50").code(), 23033);
  EXPECT_EQ(System("utm", -3.7, 40.4).code(), 32630);
  EXPECT_EQ(System("utm", 5, 60).code(), 32632);  // Norway's wider zone
  EXPECT_EQ(System("ups:S").code(), 5042);
  EXPECT_EQ(System("mgrs", 2.35, 48.85).code(), 32631);
  EXPECT_EQ(System("usng", -77, 38.9).code(), 32618);
  EXPECT_EQ(System("mgrs", 10, 88).code(), 5041);
  EXPECT_EQ(System("mgrs", 10, -85).code(), 5042);
  EXPECT_EQ(System("mgrs:31U").code(), 32631);
  EXPECT_EQ(System("mgrs:56H").code(), 32756);
  EXPECT_EQ(System("mgrs:Z").code(), 5041);
  EXPECT_EQ(System("mgrs:a").code(), 5042);
  EXPECT_EQ(System("mgrs:31UDQ4811").code(), 32631);
  EXPECT_EQ(System("usng 18S UJ 23480 06470").code(), 32618);
  EXPECT_EQ(System("web mercator").code(), 3857);
  EXPECT_EQ(System("WGS84").code(), 4326);
  EXPECT_EQ(System("rgf93 v1 / lambert 93").code(), 2154);
  EXPECT_EQ(System("geocentric:wgs84").kind(), SystemKind::geocentric);
  EXPECT_EQ(System("spcs83:2900").method(), "Transverse Mercator");
  EXPECT_EQ(System("spcs27:0401").unit(), "US survey foot");
  EXPECT_TRUE(has(System("2154").describe(), "formulas: closed formulas"));
  EXPECT_TRUE(has(System("32631").describe(), "formulas: within 5 nm"));
  const System inline_definition(
      "lambert conformal lat1=44 lat2=49 lat0=46.5 lon0=3 x0=700000 y0=6600000 ellps=GRS80");
  const Point a = inline_definition.projection()->forward({2.3, 48.8});
  const Point b = System("2154").projection()->forward({2.3, 48.8});
  EXPECT_NEAR(a.x, b.x, 1e-8);
  EXPECT_NEAR(a.y, b.y, 1e-8);
}

TEST(Systems, RefusalsAreSentences) {
  const auto why = [](const char* text) {
    try {
      return "not refused: " + System(text).name();
    } catch (const Error& error) {
      return std::string(error.what());
    }
  };
  EXPECT_TRUE(has(why(""), "empty"));
  EXPECT_TRUE(has(why("EPSG:99999999"), "99999999"));
  EXPECT_TRUE(has(why("utm"), "zone"));
  EXPECT_TRUE(has(why("utm:61N"), "1 to 60"));
  EXPECT_TRUE(has(why("mgrs"), "parse_mgrs()"));
  EXPECT_FALSE(has(why("mgrs:61U"), "not refused"));
  EXPECT_FALSE(has(why("mgrs:31I"), "not refused"));
  EXPECT_FALSE(has(why("mgrs:31UDQ48251"), "not refused"));
  EXPECT_TRUE(has(why("utm:31"), "N or S"));
  EXPECT_TRUE(has(why("spcs83:1"), "state plane"));
  EXPECT_TRUE(has(why("no such system anywhere"), "no such system anywhere"));
  EXPECT_TRUE(has(why("lambert conformal lat1=44"), "ellps="));
  EXPECT_TRUE(has(why("lambert conformal lat1=44 ellps=GRS80 nonsense=1"), "nonsense"));
  EXPECT_TRUE(has(why("lambert conformal lat1=4x ellps=GRS80"), "4x"));
  EXPECT_TRUE(has(why("lambert 93"), "several"));
  EXPECT_TRUE(has(why("+proj=nothing"), "nothing"));
  EXPECT_TRUE(has(why("PROJCS["), ""));
}

}  // namespace tidewater::test
