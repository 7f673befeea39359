#include "tidewater/transformation.hpp"

#include <gtest/gtest.h>

#include <atomic>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <thread>
#include <vector>

#include "operation.hpp"
#include "support/data.hpp"
#include "support/grids.hpp"
#include "support/little_memory.hpp"
#include "systems/made_store.hpp"

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
  // 32 bits count no more bytes than the stacks of some hundred.
  const int many = sizeof(void*) < 8 ? 200 : 1000;
  for (int t = 0; t < many; ++t) {
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

// --- ways that the registry has no single operation for

// Through another datum, or through the same one on Greenwich: what the single steps give one after
// the other, which the peer vouches for.
TEST(Transformation, OverDatumsInBetween) {
  struct Chain {
    const char* systems[4];  // the last ones null
    const char* steps[3];
    double lon, lat;  // in the first system
    double accuracy;  // metres
  };
  const Chain chains[] = {
      // A concatenated operation of the registry, backwards; two over a third datum.
      {{"4741", "4230", "4326"}, {"EPSG:15866", "EPSG:1311"}, -7, 62, 1},
      {{"4326", "4230", "4741"}, {"-EPSG:1311", "-EPSG:15866"}, -7, 62, 1},
      {{"5681", "4258", "4326"}, {"EPSG:5826", "EPSG:1149"}, 10, 51, 1},
      {{"4677", "4678", "4676"}, {"EPSG:1064", "-EPSG:1063"}, 103, 18, 2.15},
      // From another meridian, to another meridian, both.
      {{"4804", "4257", "4326"}, {"EPSG:1260", "EPSG:1837"}, 12.5, -4, 999},
      {{"4326", "4257", "4804"}, {"-EPSG:1837", "-EPSG:1260"}, 119.4, -4, 999},
      {{"4805", "3906", "4326"}, {"EPSG:3913", "EPSG:3962"}, 33, 45, 6},
      {{"4801", "4149"}, {"EPSG:1765"}, 0.1, 47, 0},
      {{"4149", "4801"}, {"-EPSG:1765"}, 7.5, 47, 0},
  };
  for (const Chain& chain : chains) {
    std::string steps;
    std::vector<Transformation> single;
    for (int i = 0; i < 3 && chain.steps[i] != nullptr; ++i) {
      steps += (i == 0 ? "" : " ") + std::string(chain.steps[i]);
      single.emplace_back(System(chain.systems[i]), System(chain.systems[i + 1]),
                          with_operation(chain.steps[i]));
    }
    SCOPED_TRACE(steps);
    const Transformation whole{System(chain.systems[0]), System(chain.systems[single.size()])};
    EXPECT_EQ(whole.operation(), steps) << whole.describe();
    EXPECT_NEAR(whole.accuracy(), chain.accuracy, 1e-9);
    Point expected = {chain.lon, chain.lat};
    for (const Transformation& step : single) expected = step.forward(expected);
    const Point there = whole.forward({chain.lon, chain.lat});
    // A chain of systems without heights drops what the ellipsoids lie apart between its steps.
    EXPECT_NEAR(there.x, expected.x, 3e-8);
    EXPECT_NEAR(there.y, expected.y, 3e-8);
    const Point back = whole.inverse(there);
    EXPECT_NEAR(back.x, chain.lon, 1e-7);
    EXPECT_NEAR(back.y, chain.lat, 1e-7);
  }
}

// A realisation has few operations of its own; its ensemble's serve it, in both directions.
TEST(Transformation, OverTheEnsembleOfARealisation) {
  struct Case {
    const char* realisation;
    const char* other;
    const char* ensemble;
    double lon, lat;
    double apart;  // metres between the realisation and the ensemble, as it is stated
  };
  for (const Case& c : {Case{"EPSG:9067", "EPSG:4326", "EPSG:4258", 10, 50, 0.1},
                        Case{"EPSG:9067", "EPSG:4230", "EPSG:4258", 20, 75, 0.1},
                        Case{"EPSG:9060", "EPSG:4326", "EPSG:4258", -2, 53, 0.1},
                        Case{"EPSG:9057", "EPSG:4277", "EPSG:4326", -2, 53, 2}}) {
    SCOPED_TRACE(std::string(c.realisation) + " " + c.other);
    const Transformation there{System(c.realisation), System(c.other)};
    const Transformation back{System(c.other), System(c.realisation)};
    const Transformation whole{System(c.ensemble), System(c.other),
                               with_operation(there.operation().c_str())};
    const Point at = there.forward({c.lon, c.lat});
    EXPECT_NEAR(at.x, whole.forward({c.lon, c.lat}).x, 1e-12);
    EXPECT_NEAR(at.y, whole.forward({c.lon, c.lat}).y, 1e-12);
    EXPECT_NEAR(there.accuracy(), whole.accuracy() + c.apart, 1e-9);
    EXPECT_NEAR(back.accuracy(), there.accuracy(), 1e-9);
    EXPECT_NEAR(back.forward(at).x, c.lon, 1e-7);
    EXPECT_NEAR(back.forward(at).y, c.lat, 1e-7);
  }
}

// No candidate goes somewhere and straight back.
TEST(Transformation, CandidatesDoNotTakeBackAStep) {
  for (const auto& [source, target] : {std::pair("4677", "4676"),
                                       {"4149", "4326"},
                                       {"4801", "4326"},
                                       {"4801", "4807"},
                                       {"4275", "4806"}}) {
    SCOPED_TRACE(std::string(source) + " to " + target);
    const auto list = Transformation::candidates(System(source), System(target));
    EXPECT_FALSE(list.empty());
    for (const Candidate& candidate : list) {
      std::string before;
      std::string rest = candidate.steps + " ";
      while (!rest.empty()) {
        const std::string step = rest.substr(0, rest.find(' '));
        rest.erase(0, step.size() + 1);
        EXPECT_NE("-" + step, before) << candidate.steps;
        EXPECT_NE(step, "-" + before) << candidate.steps;
        before = step;
      }
    }
  }
}

// Swiss surveyors' old grid: the registry's newer operation wants a grid, which few have; the one
// that it replaced serves meanwhile.  The position of the old observatory of Berne on WGS 84 is the
// peer's.
TEST(Transformation, AnOperationServesWhereItsSuccessorLacksTheGrid) {
  for (const char* file : {"CHENyx06_ETRS.gsb", "ch_swisstopo_CHENyx06_ETRS.tif"}) {
    for (const char* folder : {"/usr/share/proj/", "/usr/local/share/proj/"}) {
      if (std::filesystem::exists(std::string(folder) + file)) GTEST_SKIP() << "the grid is there";
    }
  }
  const Transformation map{System("EPSG:21781"), System("EPSG:4326")};
  EXPECT_EQ(map.operation(), "EPSG:1766");
  EXPECT_EQ(map.accuracy(), 1.5);
  const Point berne = map.forward({600000, 200000});
  EXPECT_NEAR(berne.x, 7.4386324209, 1e-9);
  EXPECT_NEAR(berne.y, 46.9510827719, 1e-9);
  // The one before it stays retired.
  for (const Candidate& candidate :
       Transformation::candidates(System("EPSG:4149"), System("EPSG:4326"))) {
    EXPECT_FALSE(has(candidate.steps, "EPSG:1753")) << candidate.steps;
  }
  // Of several that lack their grids none but the last is told.
  for (const auto& [source, target, retired] : {std::tuple("EPSG:4277", "EPSG:4258", "EPSG:5338"),
                                                {"EPSG:4202", "EPSG:4283", "EPSG:1464"},
                                                {"EPSG:4202", "EPSG:4283", "EPSG:1596"}}) {
    for (const Candidate& candidate : Transformation::candidates(System(source), System(target))) {
      EXPECT_NE(candidate.steps, retired);
    }
  }
  // With the grid the newer one is taken.
  const ScratchFolder folder;
  SubGrid grid = {"CH",
                  "NONE",
                  45.5 * 3600,
                  48.5 * 3600,
                  -11 * 3600,
                  -5.5 * 3600,
                  1800.0,
                  [](int, int) { return -4.0F; },
                  [](int, int) { return 3.0F; }};
  folder.write("CHENyx06_ETRS.gsb", GsbFile{{grid}}.bytes());
  TransformationOptions options;
  options.grid_folders = {folder.directory()};
  const Transformation by_grid{System("EPSG:4149"), System("EPSG:4326"), options};
  EXPECT_EQ(by_grid.operation(), "EPSG:7788");
  EXPECT_FALSE(has(by_grid.describe(), "(2)")) << by_grid.describe();
  EXPECT_NEAR(by_grid.forward({7.5, 47}).y, 47 - 4.0 / 3600, 1e-12);
  EXPECT_NEAR(by_grid.forward({7.5, 47}).x, 7.5 - 3.0 / 3600, 1e-12);  // positive west in the file
}

// The area of a way lies where maps have it, also beyond the 180th meridian.
TEST(Transformation, AreasOfWaysOverThe180thMeridian) {
  for (const auto& [source, target] : {std::pair("4267", "4137"), {"4137", "4267"}}) {
    for (const Candidate& candidate : Transformation::candidates(System(source), System(target))) {
      SCOPED_TRACE(candidate.steps + " " + candidate.area.name);
      EXPECT_GE(candidate.area.west, -180);
      EXPECT_LT(candidate.area.west, 180);
      EXPECT_LE(candidate.area.east, 180);
      // St. Paul Island
      if (candidate.area.name.empty()) continue;
      EXPECT_NEAR(candidate.area.west, -170.5, 0.2);
      EXPECT_NEAR(candidate.area.east, -170.0, 0.2);
    }
  }
}

// --- definitions that no registry has

// A definition names its datum only; the registry's operations of that datum serve it.
TEST(Transformation, DefinitionsByTheirDatumAlone) {
  const Transformation by_code{System("EPSG:26718"), System("EPSG:4326"),
                               with_operation("EPSG:1172")};
  const Point expected = by_code.forward({500000, 5000000});
  for (const char* text :
       {"+proj=utm +zone=18 +datum=NAD27",
        "PROJCRS[\"mine\",BASEGEOGCRS[\"NAD27\",DATUM[\"North American Datum 1927\","
        "ELLIPSOID[\"Clarke 1866\",6378206.4,294.978698213898]],ID[\"EPSG\",4267]],"
        "CONVERSION[\"UTM zone 18N\",METHOD[\"Transverse Mercator\",ID[\"EPSG\",9807]],"
        "PARAMETER[\"Latitude of natural origin\",0,ANGLEUNIT[\"degree\",0.0174532925199433]],"
        "PARAMETER[\"Longitude of natural origin\",-75,ANGLEUNIT[\"degree\",0.0174532925199433]],"
        "PARAMETER[\"Scale factor at natural origin\",0.9996,SCALEUNIT[\"unity\",1]],"
        "PARAMETER[\"False easting\",500000,LENGTHUNIT[\"metre\",1]],"
        "PARAMETER[\"False northing\",0,LENGTHUNIT[\"metre\",1]]],CS[Cartesian,2],"
        "AXIS[\"(E)\",east],AXIS[\"(N)\",north],LENGTHUNIT[\"metre\",1]]"}) {
    SCOPED_TRACE(text);
    TransformationOptions options;
    options.area = Area{"", -76, 44, -74, 46};
    const Transformation map{System(text), System("EPSG:4326"), options};
    EXPECT_TRUE(has(map.describe(), "NAD27 to WGS 84")) << map.describe();
    const Transformation named{System(text), System("EPSG:4326"), with_operation("EPSG:1172")};
    const Point there = named.forward({500000, 5000000});
    EXPECT_NEAR(there.x, expected.x, 1e-11);
    EXPECT_NEAR(there.y, expected.y, 1e-11);
  }
}

// Whatever a definition says of itself and of its base, its datum counts.
TEST(Transformation, DatumsThatADefinitionNamesByTheirCode) {
  const auto base = [](const char* datum, const char* system) {
    return "PROJCS[\"x\",GEOGCS[\"y\",DATUM[\"D_y\",SPHEROID[\"Clarke 1866\",6378206.4,"
           "294.978698213898],AUTHORITY[\"EPSG\",\"" +
           std::string(datum) + "\"]],PRIMEM[\"Greenwich\",0],UNIT[\"degree\",0.0174532925199433]" +
           system +
           "],PROJECTION[\"Mercator_1SP\"],PARAMETER[\"central_meridian\",0],UNIT[\"metre\",1]]";
  };
  const auto operations = [](const std::string& text) {
    std::string list;
    for (const Candidate& one : Transformation::candidates(System(text), System("EPSG:4326"))) {
      list += one.steps + ";";
    }
    return list;
  };
  const std::string of_nad27 = operations("EPSG:4267");
  EXPECT_TRUE(has(of_nad27, "EPSG:1172;"));
  // The datum's code alone, with the base system's, and with another base system's.
  const char* const own = ",AUTHORITY[\"EPSG\",\"4267\"]";
  const char* const other = ",AUTHORITY[\"EPSG\",\"4230\"]";
  for (const char* system : {"", own, other}) {
    EXPECT_TRUE(has(operations(base("6267", system)), "EPSG:1172;")) << system;
  }
  // A datum of the registry's that no system has, and a code that is none.
  EXPECT_EQ(operations(base("6008", "")), "");
  EXPECT_EQ(operations(base("999999", "")), "");
  EXPECT_TRUE(has(refusal(base("999999", "").c_str(), "EPSG:4326"), "No way is known"));
  // A compound system's horizontal part without a code.
  const std::string compound = "COMPD_CS[\"c\"," + base("6267", "") +
                               ",VERT_CS[\"h\",VERT_DATUM[\"d\",2005],UNIT[\"metre\",1]]]";
  EXPECT_TRUE(has(operations(compound), "EPSG:1172;"));
}

// Bounds that go round the Earth without its poles, bounds that meet nowhere, and the caller's.
TEST(Transformation, AreasThatSystemsShare) {
  const auto operations = [](const char* source, const char* target,
                             std::optional<Area> area = {}) {
    TransformationOptions options;
    options.area = std::move(area);
    std::string list;
    for (const Candidate& one :
         Transformation::candidates(System(source), System(target), options)) {
      list += one.steps + ";";
    }
    return list;
  };
  // World Mercator ends at 80 south and 84 north, which holds all of NAD27's use.
  const std::string all = operations("EPSG:4267", "EPSG:4326");
  EXPECT_FALSE(all.empty());
  EXPECT_EQ(operations("EPSG:4267", "EPSG:3395"), all);
  EXPECT_EQ(operations("EPSG:4326", "EPSG:4267"), operations("EPSG:3395", "EPSG:4267"));
  // Around the south pole there is none of it: the first system's area counts.
  EXPECT_EQ(operations("EPSG:4267", "EPSG:5042"), all);
  EXPECT_EQ(operations("EPSG:5042", "EPSG:4267"), "");
  // and no operation of North America holds in Europe.
  EXPECT_EQ(operations("EPSG:4267", "EPSG:4230"), "");
  // A point of the caller's: Key West has the operations of the contiguous states, not of Alaska.
  const std::string key_west =
      operations("EPSG:4267", "EPSG:4326", Area{"", -81.8, 24.55, -81.8, 24.55});
  EXPECT_TRUE(has(key_west, "EPSG:1173;")) << key_west;
  EXPECT_FALSE(has(key_west, "EPSG:1176;")) << key_west;
  const std::string fairbanks =
      operations("EPSG:4267", "EPSG:4326", Area{"", -147.7, 64.8, -147.7, 64.8});
  EXPECT_FALSE(has(fairbanks, "EPSG:1173;")) << fairbanks;
  EXPECT_TRUE(has(fairbanks, "EPSG:1176;")) << fairbanks;
}

// Two unknown datums are one where name, ellipsoid and parameters are.
TEST(Transformation, UnknownDatumsThatAreTheSame) {
  const auto text = [](const char* lon0, const char* rest) {
    return "tmerc lat0=0 lon0=" + std::string(lon0) + " " + rest;
  };
  const Transformation map{System(text("9", "ellps=bessel")), System(text("12", "ellps=bessel"))};
  EXPECT_EQ(map.accuracy(), 0);
  EXPECT_NEAR(map.forward({0, 0}).y, 0, 1e-9);
  // On the equator the other map's northing is the same, its easting a turn of three degrees off.
  EXPECT_TRUE(has(refusal(text("9", "ellps=bessel").c_str(), text("12", "ellps=airy").c_str()),
                  "No way is known"));
  EXPECT_TRUE(has(refusal(text("9", "a=6377397.155 rf=299.1528128").c_str(),
                          text("9", "a=6377397.155 rf=299.15").c_str()),
                  "No way is known"));
  EXPECT_TRUE(has(refusal(text("9", "a=6377397.155 rf=299.1528128").c_str(),
                          text("9", "a=6377397 rf=299.1528128").c_str()),
                  "No way is known"));
  EXPECT_TRUE(has(
      refusal(text("9", "ellps=bessel towgs84=1,2,3").c_str(), text("9", "ellps=bessel").c_str()),
      "No way is known"));
  const Transformation same{System(text("9", "ellps=bessel towgs84=1,2,3")),
                            System(text("12", "ellps=bessel towgs84=1,2,3"))};
  EXPECT_EQ(same.operation(), "");
  EXPECT_EQ(same.accuracy(), 0);
}

// Parameters to WGS 84 of either side, joined with the registry's operation of the other.
TEST(Transformation, ParametersToWgs84OfEitherSide) {
  const char* const own = "longlat ellps=bessel towgs84=598.1,73.7,418.2,0.202,0.045,-2.455,6.7";
  const System mine(own);
  const System wgs84("EPSG:4326");
  const Transformation to_wgs84{mine, wgs84};
  // The registry's own operation of these figures.
  const Transformation registered{System("EPSG:4314"), wgs84, with_operation("EPSG:1777")};
  const Point at = {10, 50};
  EXPECT_NEAR(to_wgs84.forward(at).x, registered.forward(at).x, 1e-12);
  EXPECT_NEAR(to_wgs84.forward(at).y, registered.forward(at).y, 1e-12);
  const Transformation from_wgs84{wgs84, mine};
  EXPECT_NEAR(from_wgs84.forward(at).x, to_wgs84.inverse(at).x, 1e-14);
  EXPECT_NEAR(from_wgs84.forward(at).y, to_wgs84.inverse(at).y, 1e-14);
  EXPECT_TRUE(std::isnan(from_wgs84.accuracy()));
  EXPECT_EQ(from_wgs84.describe(),
            "1. inverse of the parameters to WGS 84 of the definition of unknown datum on Bessel "
            "1841\naccuracy of the datum step: unknown\n");
  // Over WGS 84 to a datum of the registry, and from it.
  const Transformation over{mine, System("EPSG:4230")};
  const Transformation last{wgs84, System("EPSG:4230"), with_operation(over.operation().c_str())};
  EXPECT_TRUE(has(over.operation(), "-EPSG:1133")) << over.operation();
  const Point by_hand = last.forward(to_wgs84.forward(at));
  EXPECT_NEAR(over.forward(at).x, by_hand.x, 3e-8);
  EXPECT_NEAR(over.forward(at).y, by_hand.y, 3e-8);
  const Transformation under{System("EPSG:4230"), mine};
  EXPECT_NEAR(under.forward(by_hand).x, at.x, 3e-8);
  EXPECT_NEAR(under.forward(by_hand).y, at.y, 3e-8);
  // Both sides.
  const Transformation both{mine, System("longlat ellps=airy towgs84=375,-111,431")};
  const Transformation other{System("longlat ellps=airy towgs84=375,-111,431"), wgs84};
  const Point there = other.inverse(to_wgs84.forward(at));
  EXPECT_NEAR(both.forward(at).x, there.x, 3e-8);
  EXPECT_NEAR(both.forward(at).y, there.y, 3e-8);
  // WGS 84 is not known from everywhere: both sides say so.
  for (const auto& [source, target] :
       {std::pair(own, "EPSG:4821"), {"EPSG:4821", own}, {own, "EPSG:4122"}, {"EPSG:4122", own}}) {
    EXPECT_TRUE(has(refusal(source, target), "No way is known")) << refusal(source, target);
  }
}

// Parameters to WGS 84 that change nothing but the ellipsoid or the scale, on a sphere too.
TEST(Transformation, ParametersThatAreAlmostNothing) {
  const Transformation sphere{System("+proj=longlat +R=6371000 +towgs84=0,0,0"),
                              System("EPSG:4326")};
  // The sphere's centre is the ellipsoid's; where its 45th parallel lies, iterated by hand.
  EXPECT_NEAR(sphere.forward({10, 45}).y, 45.19231502383479, 1e-10);
  const Transformation scaled{System("longlat ellps=WGS84 towgs84=0,0,0,0,0,0,10"),
                              System("geocentric:wgs84")};
  EXPECT_NEAR(scaled.forward({0, 0, 0}).x, 6378137 * 1.00001, 1e-6);
  // The registry's operation between two ellipsoids, of zeros alone, changes heights.
  const Transformation heights{System("EPSG:7682"), System("EPSG:4979"),
                               with_operation("EPSG:9773")};
  EXPECT_NEAR(heights.forward({37, 55, 100}).z, 99.46227155439556, 1e-6);  // likewise
}

TEST(Transformation, NoShiftBetweenSystemsOfOneDatumSaysNothing) {
  const Transformation map{System("EPSG:32631"), System("EPSG:32632"), with_operation("no shift")};
  EXPECT_EQ(map.accuracy(), 0);
  EXPECT_FALSE(has(map.describe(), "as asked"));
}

// --- named operations

TEST(Transformation, SeveralNamedOperationsFollowEachOther) {
  const Transformation chain{System("4277"), System("4171"),
                             with_operation("EPSG:1314 -EPSG:1671")};
  const Transformation first{System("4277"), System("4326"), with_operation("EPSG:1314")};
  const Transformation last{System("4326"), System("4171"), with_operation("EPSG:1671")};
  const Point there = chain.forward({-2, 53});
  const Point expected = last.forward(first.forward({-2, 53}));
  EXPECT_NEAR(there.x, expected.x, 3e-8);
  EXPECT_NEAR(there.y, expected.y, 3e-8);
  EXPECT_EQ(chain.operation(), "EPSG:1314 -EPSG:1671");
  // What it tells of itself makes it again.
  const Transformation again{System("4277"), System("4171"),
                             with_operation(chain.operation().c_str())};
  EXPECT_EQ(again.forward({-2, 53}).x, there.x);
}

TEST(Transformation, NamedOperationsThatCannotServe) {
  // Steps that the registry lacks, or that do not join.
  for (const char* code : {"EPSG:7965", "EPSG:10146"}) {
    const std::string why = refusal("4277", "4326", with_operation(code));
    EXPECT_TRUE(has(why, code) && has(why, "do not join")) << why;
  }
  // A method without a formula here, and a grid that is not there.
  std::string why = refusal("4289", "4258", with_operation("EPSG:1751"));
  EXPECT_TRUE(has(why, "not refused")) << why;
  why = refusal("4267", "4269", with_operation("EPSG:8549"));
  EXPECT_TRUE(has(why, "EPSG:8549, NAD27 to NAD83 (8), needs the method NADCON5 (2D)")) << why;
  why = refusal("4267", "4269", with_operation("EPSG:1243"));
  EXPECT_TRUE(has(why, "needs the grid alaska.las") && has(why, "alaska.los")) << why;
  // All ways want what is not there: the sentence tells the first of them.
  why = refusal("4267", "4137");
  EXPECT_TRUE(has(why,
                  "The ways from the datum North American Datum 1927 to St. Paul Island need "
                  "what is not there: NAD27 to NAD83"))
      << why;
  EXPECT_TRUE(has(why, "; name an operation, give a grid, or say \"no shift\"")) << why;
}

// --- points

TEST(Transformation, FiguresBeyondAllUseAreRefused) {
  const Transformation map{System("EPSG:32631"), System("EPSG:4979")};
  struct Case {
    double x, y, z;
    TWstatus word;
  };
  for (const Case& c : {Case{5e5, 5e6, 1e101, TW_BAD_INPUT}, Case{1e101, 5e6, 0, TW_BAD_INPUT},
                        Case{5e5, -1e101, 0, TW_BAD_INPUT}, Case{5e5, 5e6, 8848, TW_SUCCESS}}) {
    double x = c.x, y = c.y, z = c.z;
    TWstatus word = 77;
    const Coordinates<double> at = {&x, &y, &z};
    const Summary summary = map.forward(1, at, at, {&word, 1});
    EXPECT_EQ(word, c.word);
    EXPECT_EQ(summary.word, c.word);
    EXPECT_EQ(std::isnan(x) && std::isnan(y) && std::isnan(z), c.word != TW_SUCCESS);
  }
}

TEST(Transformation, DoublesToFloats) {
  const Transformation map{System("EPSG:4326"), System("EPSG:32631")};
  const double lon[2] = {3, 4}, lat[2] = {45, 46}, height[2] = {10, 20};
  float x[2], y[2], z[2];
  ASSERT_TRUE(
      map.forward(2, Coordinates<const double>{lon, lat, height}, Coordinates<float>{x, y, z}));
  EXPECT_EQ(x[1], static_cast<float>(map.forward({4, 46}).x));
  EXPECT_EQ(z[0], 10.0F);
  double back_x[2], back_y[2];
  ASSERT_TRUE(map.inverse(2, Coordinates<const float>{x, y}, Coordinates<double>{back_x, back_y}));
  EXPECT_NEAR(back_x[0], 3, 1e-6);
  float both_x[2], both_y[2];
  ASSERT_TRUE(map.inverse(2, Coordinates<const float>{x, y}, Coordinates<float>{both_x, both_y}));
  EXPECT_EQ(both_y[1], static_cast<float>(back_y[1]));
  const float height_of_both[2] = {10, 20};
  float both_z[2];
  double back_z[2];
  ASSERT_TRUE(map.inverse(2, Coordinates<const float>{x, y, height_of_both},
                          Coordinates<float>{both_x, both_y, both_z}));
  EXPECT_EQ(both_z[1], 20.0F);
  ASSERT_TRUE(map.inverse(2, Coordinates<const float>{x, y, height_of_both},
                          Coordinates<double>{back_x, back_y, back_z}));
  EXPECT_EQ(back_z[0], 10);
  float narrow_x[2], narrow_y[2];
  const double wide_x[2] = {x[0], x[1]}, wide_y[2] = {y[0], y[1]};
  ASSERT_TRUE(map.inverse(2, Coordinates<const double>{wide_x, wide_y},
                          Coordinates<float>{narrow_x, narrow_y}));
  EXPECT_EQ(narrow_x[1], static_cast<float>(back_x[1]));
}

// Single precision has the same words and not-a-numbers, whatever comes in and goes out.
template <class In, class Out>
void expect_words_of_singles(const Transformation& map) {
  const In lon[] = {3, 3, 500, 100, 4}, lat[] = {45, 91, 45, 1, 46};
  Out x[5], y[5], z[5];
  TWstatus words[5];
  const Summary summary =
      map.forward(5, Coordinates<const In>{lon, lat}, Coordinates<Out>{x, y, z}, {words, 1});
  EXPECT_EQ(summary.failed, 2u);
  EXPECT_EQ(summary.word, TW_BAD_LATITUDE);
  EXPECT_EQ(words[3], TW_RANGE_ERROR);
  for (const int i : {1, 3}) EXPECT_TRUE(std::isnan(x[i]) && std::isnan(y[i]) && std::isnan(z[i]));
  for (const int i : {0, 4}) {
    const Point alone = map.forward({static_cast<double>(lon[i]), static_cast<double>(lat[i])});
    EXPECT_EQ(words[i], TW_SUCCESS);
    EXPECT_EQ(x[i], static_cast<Out>(alone.x));
    EXPECT_EQ(z[i], 0);
  }
  EXPECT_EQ(map.forward(5, Coordinates<const In>{lon, lat}, Coordinates<Out>{x, y}).failed, 2u);
}

TEST(Transformation, SinglesThatFail) {
  const Transformation map{System("EPSG:4326"), System("EPSG:32631")};
  expect_words_of_singles<float, float>(map);
  expect_words_of_singles<float, double>(map);
  expect_words_of_singles<double, float>(map);
  expect_words_of_singles<double, double>(map);
}

// A step of the registry's in itself: where nothing changes there is none; other meridians, axes,
// flattenings or a scale are enough for one.  The meridian is where the figures count from.
TEST(Transformation, StepsThatChangeNothingAreNone) {
  const detail::Frame greenwich = {6378137, 0.08, 0};
  const detail::Frame paris = {6378137, 0.08, 0.04};
  const auto step = [](double scale, const detail::Frame& source, const detail::Frame& target) {
    detail::OperationRecord record = {};
    record.method = 9606;
    record.parameters = {{8611, scale, 9202}};
    return detail::similarity_or_offset({record, false}, source, target, 2020, false);
  };
  EXPECT_EQ(step(0, greenwich, greenwich), nullptr);
  EXPECT_NE(step(1, greenwich, greenwich), nullptr);
  EXPECT_NE(step(0, greenwich, {6378137.1, 0.08, 0}), nullptr);
  EXPECT_NE(step(0, greenwich, {6378137, 0.0801, 0}), nullptr);
  for (const auto& [source, target, by] :
       {std::tuple(greenwich, paris, 0.04), {paris, greenwich, -0.04}, {paris, paris, 0.0}}) {
    const auto turned = step(10, source, target);
    ASSERT_NE(turned, nullptr);
    CoordinateTriple one[2] = {{0.5, 0.3, 100}, {-3, 1.2, 0}}, other[2];
    TWstatus words[2] = {TW_SUCCESS, TW_SUCCESS};
    detail::Block block = {2, one, other, words};
    turned->run(block, false);
    // A scale leaves directions from the centre as they are.
    EXPECT_NEAR(block.now[0].x, 0.5 + by, 1e-15);
    EXPECT_NEAR(block.now[1].x, -3 + by, 1e-15);
    EXPECT_NEAR(block.now[0].z, 100 + 63.8, 0.3);
    turned->run(block, true);
    EXPECT_NEAR(block.now[0].x, 0.5, 1e-15);
    EXPECT_NEAR(block.now[0].y, 0.3, 1e-12);
  }
}

// Methods of all kinds of loops, with points that fail in the first step or in the last one, below
// a block, at its border and in the next.
TEST(Transformation, FailingPointsDisturbNoOthersWhateverTheMethod) {
  struct Case {
    const char* source;
    const char* target;
    double x, y;  // in the source, in whose neighbourhood all goes well
    double bad_x, bad_y;
  };
  const Case cases[] = {
      // Hyperbolic Cassini-Soldner, which works point by point
      {"EPSG:4748", "EPSG:3139", 178.8, -16.25, 178.8, -90.5},
      {"EPSG:3139", "EPSG:4748", 1.2e6, 1.6e6, 1e9, 1.6e6},
      {"EPSG:4326", "EPSG:32631", 3, 47, 123, 0.5},
      {"EPSG:32631", "EPSG:2154", 5e5, 5.2e6, 5e8, 5.2e6},
      {"EPSG:3035", "EPSG:32631", 4.2e6, 3.2e6, 3e7, 3.2e6},
      {"EPSG:5514", "EPSG:4156", -7e5, -1.1e6, 1e101, -1.1e6},
      {"EPSG:32600", "EPSG:4326", 31.5e6, 5.2e6, 61.5e6, 5.2e6},
      {"EPSG:4326", "EPSG:6931", 10, 60, 10, 100},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.source) + " to " + c.target);
    const Transformation map{System(c.source), System(c.target)};
    const double step = std::fabs(c.x) < 720 ? 1e-4 : 10;
    const auto is_bad = [](std::size_t i) { return i == 1 || i == 100 || i == 255 || i == 300; };
    for (const std::size_t count : {std::size_t{3}, std::size_t{200}, std::size_t{600}}) {
      std::vector<double> x, y;
      for (std::size_t i = 0; i < count; ++i) {
        const bool bad = is_bad(i);
        x.push_back(bad ? c.bad_x : c.x + step * static_cast<double>(i));
        y.push_back(bad ? c.bad_y : c.y + step * static_cast<double>(i % 50));
      }
      std::vector<double> ox(count, kNone), oy(count, kNone);
      std::vector<TWstatus> words(count);
      const Summary summary = map.forward(count, Coordinates<const double>{x.data(), y.data()},
                                          {ox.data(), oy.data()}, {words.data(), 1});
      EXPECT_EQ(summary.failed, count == 3 ? 1u : count == 200 ? 2u : 4u);
      for (std::size_t i = 0; i < count; ++i) {
        TWstatus alone_word = TW_SUCCESS;
        double alone_x = 0, alone_y = 0;
        map.forward(1, Coordinates<const double>{&x[i], &y[i]}, {&alone_x, &alone_y},
                    {&alone_word, 1});
        ASSERT_EQ(words[i], alone_word) << i << " of " << count;
        ASSERT_EQ(words[i] != TW_SUCCESS, is_bad(i)) << i << " of " << count;
        ASSERT_TRUE(ox[i] == alone_x || (std::isnan(ox[i]) && std::isnan(alone_x)))
            << i << " of " << count;
        ASSERT_TRUE(oy[i] == alone_y || (std::isnan(oy[i]) && std::isnan(alone_y)))
            << i << " of " << count;
      }
    }
  }
}

// --- registries that lie

namespace {

// What a process of its own finds with such a store, which a process reads once: true where every
// system and operation of it gives an answer or a sentence.
bool all_is_answered() {
  const auto no_way = [](const char* source, const char* target, const char* operation,
                         const char* part) {
    const std::string why = refusal(source, target, with_operation(operation));
    if (has(why, part)) return true;
    std::fprintf(stderr, "%s to %s: %s\n", source, target, why.c_str());
    return false;
  };
  bool good = true;
  // Operations that are their own steps, or each other's, are none.
  good &= no_way("EPSG:4230", "EPSG:4326", "EPSG:990001", "do not join");
  good &= no_way("EPSG:4230", "EPSG:4326", "EPSG:990002", "do not join");
  const auto check = [&good](bool holds, const char* what) {
    if (!holds) std::fprintf(stderr, "not so: %s\n", what);
    good &= holds;
  };
  std::string all;
  for (const Candidate& candidate :
       Transformation::candidates(System("EPSG:4230"), System("EPSG:4326"))) {
    all += candidate.steps + (candidate.area.name.empty() ? "!;" : ";");
  }
  check(!has(all, "99000"), "no candidate is its own step");
  check(has(all, "EPSG:990010!;"), "an operation whose area is not there holds anywhere");
  check(has(all, "EPSG:990013"), "an operation of unknown accuracy serves");
  check(!has(all, "EPSG:990011"), "what was replaced by what is not there stays replaced");
  // A system without a datum, and an operation from a system that is not there.
  good &= no_way("EPSG:990020", "EPSG:4326", "", "990099");
  good &= no_way("EPSG:4230", "EPSG:4326", "EPSG:990012", "The registry has no datum");
  // A unit that has no size.
  good &= no_way("EPSG:990030", "EPSG:4326", "", "The unit of No unit has no size.");
  good &= no_way("EPSG:4326+990031", "EPSG:4979", "", "has no size.");
  return good;
}

}  // namespace

TEST(RegistryThatLies, GivesSentences) {
  TIDEWATER_NEED_NEW_PROCESS();
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  const StoreSources sources;
  const std::string values = ",-87,9001,-98,9001,-121,9001,0,0,0,0,0,0,0,0";
  for (const auto& [table, line] :
       {std::pair<const char*, std::string>{"concatenated_operations",
                                            "990001,Circle,4230,4326,1262,1,0,990001,0,0,0"},
        {"concatenated_operations", "990002,Two,4230,4326,1262,1,0,990003,0,0,0"},
        {"concatenated_operations", "990003,Two back,4230,4326,1262,1,0,990002,0,0,0"},
        {"transformations", "990010,Nowhere,9603,4230,4326,999999,999,0" + values},
        {"transformations", "990011,Replaced,9603,4230,4326,1262,10,999999" + values},
        {"transformations", "990012,From nothing,9603,990098,4326,1262,10,0" + values},
        {"transformations", "990013,Unknown,9603,4230,4326,1262,-1,0" + values},
        {"geodetic_systems", "990020,No datum,2,990099,NE,9122,1262"},
        {"units", "990040,nothing,length,0"},
        {"vertical_systems", "990031,No height,5100,U,990040,1262"},
        {"projected_systems", "990030,No unit,4326,16031,EN,990040,1262"}}) {
    sources.append("registry/" + std::string(table) + ".csv", line);
  }
  const std::string store = sources.build();
  ASSERT_NE(store, "");
  EXPECT_EXIT(
      {
        setenv("TIDEWATER_STORE", store.c_str(), 1);
        std::exit(all_is_answered() ? 0 : 1);
      },
      testing::ExitedWithCode(0), "");
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
