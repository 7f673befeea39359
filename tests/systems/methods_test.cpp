// What all methods share, and those that PROJ lacks worked out otherwise.  The worked examples of
// the guidance note stand in tests/published.
#include "methods.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <string_view>

#include "points/over_points.hpp"
#include "projection_impl.hpp"
#include "tidewater/transformation.hpp"

namespace tidewater::test {

namespace {

double dms(double degrees, double minutes, double seconds) {
  return std::copysign(std::fabs(degrees) + minutes / 60 + seconds / 3600, degrees);
}

struct Example {
  const char* system;
  double lon, lat;  // degrees from the system's own prime meridian
  double x, y;      // the system's unit
  double within;
};

// scripts/series/guidance_examples.py.
const Example kWorkedOut[] = {
    {"31300", dms(5, 48, 26.533), dms(50, 40, 46.461), 251763.2041555474, 153034.1325541832, 1e-6},
    {"22700", dms(34, 8, 11.291), dms(37, 31, 17.625), 15707.95986634909, 623165.9629934181, 1e-6},
    {"2985", dms(140, 4, 17.040), -dms(66, 36, 18.820), 303169.5218569701, 244055.7205006747, 1e-6},
    {"4087", 10, 55, 1113194.907932736, 6097230.313124184, 1e-6},
    {"22300", 8.22437 * 0.9, 38.97997 * 0.9, 302, 598, 1e-9},
};

TEST(Methods, WorkedOutOtherwise) {
  for (const Example& example : kWorkedOut) {
    SCOPED_TRACE(example.system);
    const System system(example.system);
    const Point there = system.projection()->forward({example.lon, example.lat});
    EXPECT_NEAR(there.x / system.unit_factor(), example.x, example.within);
    EXPECT_NEAR(there.y / system.unit_factor(), example.y, example.within);
  }
}

}  // namespace

// The zoned grid puts the zone's number before the eastings of its zones, which PROJ vouches for.
TEST(Methods, ZonedGridIsItsZones) {
  const Projection whole = System("32600").projection().value();
  for (int zone = 1; zone <= 60; ++zone) {
    const Projection map = System(std::to_string(32600 + zone)).projection().value();
    for (const double off : {-2.999, -1.0, 0.5, 2.999}) {
      const double lon = 6.0 * zone - 183 + off;
      const Point there = map.forward({lon, 47.3});
      const Point at = whole.forward({lon, 47.3});
      EXPECT_NEAR(at.x, zone * 1e6 + there.x, 1e-6) << lon;
      EXPECT_NEAR(at.y, there.y, 1e-8) << lon;
      const Point back = whole.inverse(at);
      EXPECT_NEAR(std::remainder(back.x - lon, 360), 0, 1e-11);
      EXPECT_NEAR(back.y, 47.3, 1e-11);
    }
  }
  EXPECT_TRUE(std::isnan(whole.inverse({500000, 5e6}).x));  // no zone
}

// The modified grid is the old one with its origin moved by 5,000 km each way, and bent by some
// decimetres.
TEST(Methods, ModifiedKrovakStaysByTheOldOne) {
  const Projection bent = System("5515").projection().value();
  const Projection plain = System("5513").projection().value();
  double most = 0;
  for (double lon = 12.5; lon <= 18.5; lon += 0.5) {
    for (double lat = 48.8; lat <= 50.8; lat += 0.4) {
      const Point there = bent.forward({lon, lat});
      const Point old = plain.forward({lon, lat});
      const double apart = std::hypot(there.x - 5e6 - old.x, there.y - 5e6 - old.y);
      most = std::max(most, apart);
      const Point back = bent.inverse(there);
      EXPECT_NEAR(back.x, lon, 1e-11);
      EXPECT_NEAR(back.y, lat, 1e-11);
    }
  }
  EXPECT_LT(most, 1);
  EXPECT_GT(most, 0.02);
}

namespace {

// A method with parameters that make a map, and a position on it.
struct Sample {
  Projection map;
  double lon, lat;
};

Sample sample_of(const detail::Method& method) {
  std::vector<std::pair<std::string, double>> parameters;
  double lon = 3;
  double lat = 47;
  for (const auto& parameter : method.parameters) {
    const auto* kind = detail::parameter_kind(parameter.code);
    const std::string_view form = kind->short_form;
    double value = kind->usual;
    if (form == "lat0") value = 46;
    if (form == "lat1") value = 44;
    if (form == "lat2") value = 49;
    if (form == "lon0" || form == "lon1") value = 2;
    if (form == "lon2") value = 5;
    if (form == "azimuth") value = 40;
    if (form == "gamma") value = 38;
    if (form == "x0") value = 600000;
    if (form == "y0") value = -200000;
    if (form == "h") value = 5900000;
    if (form == "colat") value = 30;
    if (form == "lat3") value = 30;
    if (form == "lon3") value = 4;
    if (form == "inclination") value = 99;
    if (form == "days") value = 0.07;
    if (form == "satellite") value = 4;
    if (form == "path") value = 199;
    if (kind->quantity == detail::Quantity::angle && kind->usual != 0)
      value *= 180 / 3.14159265358979324;
    parameters.emplace_back(kind->name, value);
  }
  // What is of some other part of the Earth.
  if (method.code == 9810 || method.code == 9829 || method.code == 9830) {
    parameters[0].second = method.code == 9810 ? 90 : 71;
  }
  if (method.code == detail::kBipolarConic) {
    lon = -100;
    lat = 10;
  }
  if (method.code == 9811) {
    parameters[0].second = -41;
    parameters[1].second = 173;
    lon = 174;
    lat = -40;
  }
  if (method.code == detail::kObliqueLambert) {
    parameters[2].second = -1;
    parameters[3].second = 1;
    parameters[4].second = 30;
  }
  if (method.code == detail::kMalaya) {
    lon = 102;
    lat = 4.5;
  }
  return {Projection(method.name, parameters,
                     method.code == detail::kMalaya ? Ellipsoid(6377304.063, 300.8017)
                                                    : Ellipsoid("International 1924")),
          lon, lat};
}

}  // namespace

// Every method has complete entries, can be made, goes forth and back, and has conformal,
// equal-area or other factors that agree with its name.
TEST(Methods, EveryOneGoesForthAndBack) {
  for (const detail::Method& method : detail::methods()) {
    SCOPED_TRACE(std::string(method.name));
    for (const auto& parameter : method.parameters) {
      ASSERT_NE(detail::parameter_kind(parameter.code), nullptr);
    }
    const auto [map, lon, lat] = sample_of(method);
    EXPECT_EQ(map.method_code(), method.code);
    EXPECT_GT(map.truth().size(), 10u);
    const Point there = map.forward({lon, lat});
    ASSERT_TRUE(std::isfinite(there.x) && std::isfinite(there.y)) << there.x << " " << there.y;
    const Point back = map.inverse(there);
    EXPECT_NEAR(back.x, lon, 1e-8);
    EXPECT_NEAR(back.y, lat, 1e-8);
    const Factors factors = map.factors({lon, lat});
    EXPECT_GT(factors.areal, 0);
    // h k is the areal scale times the sine of the angle between the graticule's lines.
    EXPECT_LE(factors.areal, factors.meridional * factors.parallel * (1 + 1e-9));
  }
}

namespace {

// What an array call gave: points and their words.
struct Answers {
  std::vector<Point> points;
  std::vector<TWstatus> words;
  Summary summary;
};

Answers run_array(const Projection& map, const std::vector<Point>& in, bool back) {
  Answers out = {
      std::vector<Point>(in.size(), {-7, -7, -7}), std::vector<TWstatus>(in.size(), 12345), {}};
  const Coordinates<const double> from = {&in[0].x, &in[0].y, &in[0].z, 3};
  const Coordinates<double> to = {&out.points[0].x, &out.points[0].y, &out.points[0].z, 3};
  out.summary = back ? map.inverse(in.size(), from, to, {out.words.data(), 1})
                     : map.forward(in.size(), from, to, {out.words.data(), 1});
  return out;
}

bool same_bits(const Point& one, const Point& other) {
  return std::memcmp(&one, &other, sizeof one) == 0 ||
         (std::isnan(one.x) && std::isnan(one.y) && std::isnan(one.z) && std::isnan(other.x) &&
          std::isnan(other.y) && std::isnan(other.z));
}

}  // namespace

// Whatever the method, the place in a block and the processor's width: a point that fails leaves
// every other point what it is alone, and has its own word.
TEST(Methods, AFailingPointDisturbsNoOther) {
  std::vector<points::Level> levels;
  const points::Level before = points::level();
  for (int i = 0; i < points::kLevels; ++i) {
    const auto level = static_cast<points::Level>(i);
    if (points::ask_for_level(level)) levels.push_back(level);
  }
  const double nan = std::nan("");
  for (const detail::Method& method : detail::methods()) {
    SCOPED_TRACE(std::string(method.name));
    const auto [map, lon, lat] = sample_of(method);
    std::vector<Point> good;
    for (int i = 0; i < 260; ++i) {
      good.push_back({lon + 0.003 * (i % 97) - 0.1, lat + 0.007 * (i % 41) - 0.1, 1.0 * i});
    }
    for (const bool back : {false, true}) {
      SCOPED_TRACE(back ? "inverse" : "forward");
      // Some of these are on some maps.
      std::vector<Point> bad = {
          {lon, 91.5},      {nan, lat},        {lon, nan},        {lon + 179.9, 0},
          {lon + 90, 1e-9}, {lon + 120, -lat}, {lon + 180, -lat}, {lon + 100, -lat / 2},
          {lon, 90},        {lon, -90}};
      if (back) {
        const Point at = map.forward({lon, lat});
        bad = {{nan, at.y},          {at.x, nan},        {1e12, at.y},         {at.x, -1e12},
               {at.x + 2.1e7, at.y}, {at.x, at.y + 2e7}, {at.x, at.y - 2.6e7}, {-5e7, 5e7},
               {at.x - 1.3e7, at.y}, {-3e5, at.y},       {at.x, at.y + 1.1e7}, {at.x, at.y - 9e6}};
      }
      std::vector<Point> in = back ? run_array(map, good, false).points : good;
      ASSERT_EQ(run_array(map, in, back).summary.failed, 0u);
      std::vector<Point> alone(in.size());
      for (std::size_t i = 0; i < in.size(); ++i) {
        alone[i] = run_array(map, {in[i]}, back).points[0];
      }
      for (const Point& odd : bad) {
        SCOPED_TRACE(std::to_string(odd.x) + " " + std::to_string(odd.y));
        const Answers odd_alone = run_array(map, {odd}, back);
        for (const points::Level level : levels) {
          points::ask_for_level(level);
          for (const auto& [count, at] : {std::pair<std::size_t, std::size_t>{2, 0},
                                          {2, 1},
                                          {19, 0},
                                          {19, 9},
                                          {19, 18},
                                          {37, 20},
                                          {260, 130}}) {
            std::vector<Point> mixed(in.begin(), in.begin() + static_cast<std::ptrdiff_t>(count));
            mixed[at] = odd;
            const Answers all = run_array(map, mixed, back);
            EXPECT_EQ(all.summary.failed, odd_alone.summary.failed);
            EXPECT_EQ(all.words[at], odd_alone.words[0]);
            EXPECT_TRUE(same_bits(all.points[at], odd_alone.points[0]))
                << all.points[at].x << " " << all.points[at].y << " for " << odd_alone.points[0].x
                << " " << odd_alone.points[0].y;
            for (std::size_t i = 0; i < count; ++i) {
              if (i == at) continue;
              ASSERT_EQ(all.words[i], TW_SUCCESS) << i << " of " << count;
              ASSERT_TRUE(same_bits(all.points[i], alone[i])) << i << " of " << count;
            }
          }
        }
        points::ask_for_level(before);
      }
    }
  }
}

// Inverses by iteration lead back from all of the map, not from the neighbourhood of the origin
// alone, or say that they do not.
TEST(Methods, IteratedInversesLeadBackFromAfar) {
  struct Case {
    const char* method;
    double farthest;  // latitude
    double lon;       // longitude
    double x, y;      // a place of the plane where nothing lies
  };
  const Ellipsoid grs80("GRS80");
  for (const Case& c :
       {Case{"hyperbolic cassini", 80, 50, 0, 6.1e6}, Case{"guam", 89, 175, 2.5e7, 9.9e6},
        Case{"lambert near conformal", 85, 60, 0, 3e8}}) {
    SCOPED_TRACE(c.method);
    const Projection map(c.method, {{"lat0", c.lon == 60 ? 40 : 0}, {"lon0", 0}}, grs80);
    for (double lat = -c.farthest; lat <= c.farthest; lat += 1) {
      for (double lon = -c.lon; lon <= c.lon; lon += c.lon / 7) {
        // The hyperbolic grid folds where the sphere's northing is the square root of two.
        const double northing =
            std::atan2(std::tan(std::fabs(lat) / 57.29577951), std::cos(lon / 57.29577951));
        if (c.farthest == 80 && northing > 1.38) continue;
        const Point there = map.forward({lon, lat});
        const Point back = map.inverse(there);
        EXPECT_NEAR(back.x, lon, 1e-8) << lat;
        EXPECT_NEAR(back.y, lat, 1e-8) << lon;
      }
    }
    TWstatus word = TW_SUCCESS;
    double x = c.x, y = c.y;
    const Coordinates<double> at = {&x, &y};
    EXPECT_EQ(map.inverse(1, at, at, {&word, 1}).failed, 1u) << x << " " << y;
    EXPECT_NE(word, TW_SUCCESS);
    EXPECT_TRUE(std::isnan(x) && std::isnan(y));
  }
}

TEST(Methods, ConformalOnesHaveNoAngularDistortion) {
  for (const char* text : {"2154", "32631", "27572", "3395", "2056", "28992", "5041", "5513"}) {
    const auto map = System(text).projection();
    const Factors factors = map->factors({6.5, 47.5});
    EXPECT_LT(factors.angular, 1e-5) << text;
    EXPECT_NEAR(factors.meridional, factors.parallel, 1e-9) << text;
    EXPECT_NEAR(factors.areal, factors.meridional * factors.parallel, 1e-8) << text;
  }
}

TEST(Methods, EqualAreaOnesKeepAreas) {
  for (const char* text : {"3035", "5070", "6933", "8857"}) {
    const auto map = System(text).projection();
    EXPECT_NEAR(map->factors({6.5, 47.5}).areal, 1, 1e-8) << text;
  }
}

// Grid north lies east of true north east of the central meridian in the north.
TEST(Methods, ConvergenceIsTheBearingOfGridNorth) {
  const auto map = System("32631").projection();
  const Factors factors = map->factors({4, 50});
  // atan(tan(dlon) sin(lat)) is the sphere's
  EXPECT_NEAR(factors.convergence,
              std::atan(std::tan(0.0174532925) * std::sin(0.872664626)) * 57.29577951, 1e-4);
  // A step to grid north goes along that bearing.
  const Point here = map->forward({4, 50});
  const Point north = map->inverse({here.x, here.y + 10});
  const double east = (north.x - 4) * std::cos(0.872664626) * 6388000;
  const double along = (north.y - 50) * 6370000;
  EXPECT_NEAR(std::atan2(east, along) * 57.29577951, factors.convergence, 0.01);
}

TEST(Methods, RefusalsAreSentences) {
  const Ellipsoid grs80("GRS80");
  const auto refused = [&](const char* method,
                           const std::vector<std::pair<std::string, double>>& parameters) {
    try {
      const Projection map(method, parameters, grs80);
      ADD_FAILURE() << method;
    } catch (const Error& error) {
      return std::string(error.what());
    }
    return std::string();
  };
  EXPECT_NE(refused("no such thing", {}).find("no such thing"), std::string::npos);
  EXPECT_NE(refused("mercator", {{"latitude of nothing", 1}}).find("takes"), std::string::npos);
  EXPECT_NE(refused("lambert conformal", {{"lat1", 95}}).find("beyond a pole"), std::string::npos);
  EXPECT_NE(refused("lambert conformal", {{"lat1", 30}, {"lat2", -30}}).find("together"),
            std::string::npos);
  EXPECT_NE(refused("transverse mercator", {{"k0", 0}}).find("above zero"), std::string::npos);
  EXPECT_NE(refused("transverse mercator", {{"lon0", std::nan("")}}).find("finite"),
            std::string::npos);
  EXPECT_NE(refused("albers", {{"lat1", 30}, {"lat2", -30}}).find("cone"), std::string::npos);
}

TEST(Methods, TheBipolarConicCarriesItsCentralScale) {
  // accuracy/formulas.py, 50 digits, and PROJ's +proj=bipc +ns outside the strip between the cones.
  const Projection map("bipolar conic", {}, Ellipsoid(6370997, 0));
  const double rows[][4] = {{-90, 40, -1427776.0991, 2533454.9814},
                            {-60, -20, 1476215.9963, -3973339.9222},
                            {-80, 10, -742558.8935, -771057.2423}};
  for (const auto& row : rows) {
    const Point there = map.forward({row[0], row[1]});
    EXPECT_NEAR(there.x, row[2], 1e-4);
    EXPECT_NEAR(there.y, row[3], 1e-4);
    const Point back = map.inverse(there);
    EXPECT_NEAR(back.x, row[0], 1e-8);
    EXPECT_NEAR(back.y, row[1], 1e-8);
  }
}

TEST(Methods, FactorsAreTheSameOnAnyNumberOfThreads) {
  const auto map = System("2154").projection();
  constexpr std::size_t kPoints = 5000;
  std::vector<double> lon(kPoints), lat(kPoints);
  for (std::size_t i = 0; i < kPoints; ++i) {
    lon[i] = -4 + 0.002 * static_cast<double>(i);
    lat[i] = i % 1000 == 999 ? 95 : 42 + 0.0015 * static_cast<double>(i);
  }
  const Coordinates<const double> in = {lon.data(), lat.data()};
  std::vector<Factors> one(kPoints), several(kPoints);
  std::vector<TWstatus> words(kPoints), words_of_several(kPoints);
  const Summary alone = map->factors(kPoints, in, one.data(), {words.data(), 1});
  const Summary together = map->factors(kPoints, in, several.data(), {words_of_several.data(), 3});
  EXPECT_EQ(alone.failed, 5u);
  EXPECT_EQ(together.failed, 5u);
  EXPECT_EQ(together.word, alone.word);
  EXPECT_EQ(words_of_several, words);
  for (std::size_t i = 0; i < kPoints; ++i) {
    ASSERT_EQ(words[i] != TW_SUCCESS, i % 1000 == 999);
    if (words[i] != TW_SUCCESS) {
      ASSERT_TRUE(std::isnan(several[i].areal));
    } else {
      ASSERT_EQ(several[i].convergence, one[i].convergence);
      ASSERT_EQ(several[i].areal, one[i].areal);
    }
  }
}

}  // namespace tidewater::test
