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

// Zones of any width, counted from any meridian; where a zone is so wide that its ends are no part
// of its map, they fail alone.
TEST(Methods, ZonesOfOtherWidths) {
  const Ellipsoid grs80("GRS80");
  const Projection map("transverse mercator zoned", {{"lonfirst", 0}, {"width", 3}, {"x0", 500000}},
                       grs80);
  for (const auto& [lon, zone] : {std::pair(1.0, 1), {4.6, 2}, {-1.0, 120}, {-178.9, 61}}) {
    const double centre = 3 * zone - 1.5;
    const Projection one("transverse mercator", {{"lon0", centre > 180 ? centre - 360 : centre}},
                         grs80);
    const Point at = map.forward({lon, 50});
    const Point there = one.forward({lon, 50});
    EXPECT_NEAR(at.x, zone * 1e6 + 500000 + there.x, 1e-6);
    EXPECT_NEAR(at.y, there.y, 1e-6);
    EXPECT_NEAR(map.inverse(at).x, lon, 1e-10);
  }
  EXPECT_TRUE(std::isnan(map.inverse({121.5e6, 5e6}).x));
  const Projection wide("transverse mercator zoned", {{"lonfirst", -180}, {"width", 120}}, grs80);
  const std::vector<Point> in = {{-120, 10, 0}, {-179, 1, 0}, {-110, 20, 0}, {59, 2, 0}, {0, 3, 0}};
  const Answers out = run_array(wide, in, false);
  EXPECT_EQ(out.words, (std::vector<TWstatus>{TW_SUCCESS, TW_RANGE_ERROR, TW_SUCCESS,
                                              TW_RANGE_ERROR, TW_SUCCESS}));
  for (const std::size_t i : std::vector<std::size_t>{0, 2, 4})
    EXPECT_EQ(out.points[i].x, wide.forward(in[i]).x);
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
    const Projection map(c.method, {{"lat0", c.lon == 60 ? -40 : 0}, {"lon0", 0}}, grs80);
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

// A step after which the next would be nothing is taken, too.
TEST(Methods, IteratedInversesLoseNothingNearby) {
  const Projection map("hyperbolic cassini", {{"lat0", -16.25}, {"lon0", 179.5}},
                       Ellipsoid("GRS80"));
  for (const double off : {-1.5, -1.2, -0.9, -0.005, -0.003, 0.0, 0.004, 0.0053, 1.0, 1.4}) {
    const double lat = -16.25 + off;
    const Point back = map.inverse(map.forward({179, lat}));
    EXPECT_NEAR(back.x, 179, 2e-13);
    EXPECT_NEAR(back.y, lat, 2e-13);  // 22 nm
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

namespace {

using Parameters = std::vector<std::pair<std::string, double>>;

std::string refusal(const char* method, const Parameters& parameters,
                    const Ellipsoid& ellipsoid = Ellipsoid("GRS80")) {
  try {
    const Projection map(method, parameters, ellipsoid);
    return "not refused";
  } catch (const Error& error) {
    return error.what();
  }
}

bool has(const std::string& text, const char* part) { return text.find(part) != std::string::npos; }

// Two maps of one plane, at some places.
void expect_same(const Projection& one, const Projection& other, double lon, double lat) {
  for (const double d : {0.0, 1.5, -2.25}) {
    const Point a = one.forward({lon + d, lat - d / 3});
    const Point b = other.forward({lon + d, lat - d / 3});
    EXPECT_NEAR(a.x, b.x, 1e-6) << one.method();
    EXPECT_NEAR(a.y, b.y, 1e-6) << one.method();
  }
}

}  // namespace

TEST(Methods, AParallelAtAPoleMakesNoCylinderAndNoCone) {
  for (const char* method : {"mercator", "mercator variant c", "cylindrical equal area",
                             "cylindrical equal area spherical", "equidistant cylindrical",
                             "equidistant cylindrical spherical"}) {
    for (const double lat : {90.0, -90.0}) {
      EXPECT_TRUE(has(refusal(method, {{"lat1", lat}}), "the standard parallel lies at a pole"))
          << method << " " << refusal(method, {{"lat1", lat}});
    }
    EXPECT_EQ(refusal(method, {{"lat1", 89.999}}), "not refused") << method;
  }
  for (const char* method : {"albers", "equidistant conic"}) {
    EXPECT_TRUE(has(refusal(method, {{"lat1", 30}, {"lat2", -30}}), "make no cone")) << method;
    EXPECT_TRUE(has(refusal(method, {{"lat1", 0}, {"lat2", 0}}), "make no cone")) << method;
    EXPECT_EQ(refusal(method, {{"lat1", 0}, {"lat2", 30}}), "not refused") << method;
  }
  EXPECT_TRUE(has(refusal("lambert near conformal", {{"lat0", 0}}), "makes no cone"));
  EXPECT_TRUE(has(refusal("krovak", {{"lat0", 49.5}, {"colat", 30}, {"lat1", 0}}), "not finite"))
      << refusal("krovak", {{"lat0", 49.5}, {"colat", 30}, {"lat1", 0}});
  EXPECT_TRUE(has(refusal("oblique mercator", {{"lat0", 90}}), "its centre lies at a pole"));
  EXPECT_TRUE(has(refusal("transverse mercator zoned", {{"width", 0}}), "zone width"));
  EXPECT_TRUE(has(refusal("transverse mercator", {}, Ellipsoid(6378137, 100)), "above 1/150"));
  EXPECT_TRUE(
      has(refusal("lambert conformal", {{"lat1", 90}, {"lat2", 80}}), "do not fit together"));
  EXPECT_TRUE(has(refusal("krovak", {{"lat0", -90}, {"colat", 30}, {"lat1", 78}}), "not finite"));
  EXPECT_TRUE(has(refusal("colombia urban", {{"lat0", 90}}), "its origin lies at a pole"));
  EXPECT_TRUE(has(refusal("imw polyconic", {{"lat1", 90}}), "at one that cannot serve"));
  EXPECT_TRUE(has(refusal("vertical perspective", {{"h", 0}}), "height of the viewpoint"));
  EXPECT_TRUE(has(refusal("chamberlin", {}), "make no triangle"));
  EXPECT_TRUE(has(refusal("chamberlin", {}, Ellipsoid(6378137, 50)), "flattening of 0.01"));
  EXPECT_TRUE(has(refusal("azimuthal equidistant", {}, Ellipsoid(6378137, 50)), "of 0.01"));
}

TEST(Methods, SatellitesAndTheirPaths) {
  for (const double satellite : {1.0, 2.0, 3.0, 4.0, 5.0, 7.0}) {
    const bool first_system = satellite <= 3;
    EXPECT_EQ(refusal("landsat", {{"satellite", satellite}, {"path", first_system ? 251. : 233.}}),
              "not refused");
    for (const double path : {0.0, 1.5, first_system ? 252.0 : 234.0, -3.0}) {
      EXPECT_TRUE(has(refusal("landsat", {{"satellite", satellite}, {"path", path}}),
                      first_system ? "its paths are 1 to 251" : "its paths are 1 to 233"))
          << satellite << " " << path;
    }
  }
  for (const double satellite : {0.0, 2.5, 6.0, 8.0}) {
    EXPECT_TRUE(has(refusal("landsat", {{"satellite", satellite}, {"path", 1}}),
                    "the satellites are Landsat 1 to 5 and 7"));
  }
  EXPECT_TRUE(has(refusal("space oblique mercator", {{"inclination", 99}, {"days", 1}}),
                  "less than a day"));
  EXPECT_TRUE(has(refusal("space oblique mercator", {{"inclination", 99}, {"days", 0}}),
                  "less than a day"));
  EXPECT_TRUE(has(refusal("space oblique mercator", {{"inclination", 180}, {"days", 0.07}}),
                  "between 0 and 180 degrees"));
  EXPECT_TRUE(has(refusal("malaya grid", {}, Ellipsoid(6377304.063, 300.7)), "Everest 1830"));
}

// What is not given has its usual value, which may be another parameter's; methods and parameters
// go by any of their names.
TEST(Methods, UsualValuesAndOtherNames) {
  const Ellipsoid grs80("GRS80");
  const Parameters oblique = {{"lat0", 46}, {"lon0", 7}, {"azimuth", 40}, {"k0", 0.9999}};
  Parameters with_gamma = oblique;
  with_gamma.emplace_back("gamma", 40);
  for (const char* method : {"oblique mercator", "oblique mercator variant a"}) {
    expect_same(Projection(method, oblique, grs80), Projection(method, with_gamma, grs80), 8, 47);
  }
  expect_same(Projection("lambert conformal", {{"lat0", 46}, {"lat1", 45}}, grs80),
              Projection("lambert conformal", {{"lat0", 46}, {"lat1", 45}, {"lat2", 45}}, grs80), 3,
              47);
  const Projection by_words("Lambert Conic Conformal (2SP)",
                            {{"latitude of origin", 46.5},
                             {"central meridian", 3},
                             {"first standard parallel", 44},
                             {"second standard parallel", 49},
                             {"false easting", 700000},
                             {"false northing", 6600000}},
                            grs80);
  EXPECT_EQ(by_words.method(), "Lambert Conic Conformal (2SP)");
  EXPECT_EQ(by_words.method_code(), 9802);
  for (const char* method :
       {"EPSG:9802", "lcc", "Lambert_Conformal_Conic_2SP", "Lambert_Conformal_Conic"}) {
    expect_same(by_words,
                Projection(method,
                           {{"Latitude of false origin", 46.5},
                            {"Longitude of false origin", 3},
                            {"Latitude of 1st standard parallel", 44},
                            {"Latitude of 2nd standard parallel", 49},
                            {"Easting at false origin", 700000},
                            {"Northing at false origin", 6600000}},
                           grs80),
                2, 46);
    expect_same(by_words,
                Projection(method,
                           {{"lat_0", 46.5},
                            {"lon_0", 3},
                            {"standard_parallel_1", 44},
                            {"Standard_Parallel_2", 49},
                            {"x_0", 700000},
                            {"false_northing", 6600000}},
                           grs80),
                2, 46);
  }
  EXPECT_TRUE(has(refusal("EPSG:1", {}), "There is no projection method \"EPSG:1\""));
  EXPECT_TRUE(has(refusal("EPSG:what", {}), "There is no projection method \"EPSG:what\""));
  EXPECT_TRUE(has(refusal("", {}), "There is no projection method \"\""));
  EXPECT_TRUE(has(refusal("--", {}), "There is no projection method \"--\""));
  EXPECT_TRUE(has(refusal("mercator", {{"lon0", 721}}), "is more than two turns"));
  EXPECT_TRUE(has(refusal("mercator", {{"x0", HUGE_VAL}}), "is no finite number"));
  EXPECT_TRUE(has(refusal("lambert conformal", {{"lat1", 45}, {"x0", 1e5}, {"lat2", 90.001}}),
                  "beyond a pole"));
  // A method whose scale is no k0.
  EXPECT_TRUE(has(refusal("Lambert Conic Conformal (2SP Michigan)",
                          {{"lat0", 43}, {"lat1", 44}, {"lat2", 45}, {"kell", 0}}),
                  "do not fit together"));
  EXPECT_TRUE(has(refusal("lambert conformal michigan",
                          {{"lat0", 43}, {"lat1", 44}, {"lat2", 45}, {"kell", 1e308}}),
                  "do not fit together"));
  // Each method's words and its name lead to it.
  for (const detail::Method& method : detail::methods()) {
    std::string_view rest = method.words;
    while (!rest.empty()) {
      const std::string_view words = rest.substr(0, rest.find('|'));
      rest.remove_prefix(std::min(words.size() + 1, rest.size()));
      EXPECT_EQ(detail::method_by_words(words)->code, method.code) << words;
    }
    EXPECT_EQ(detail::method_by_words(method.name)->code, method.code) << method.name;
  }
  const System polar("polar stereographic lat1=-71 lon0=0 ellps=WGS84");
  const Point there = polar.projection()->forward({30, -75});
  const Point registered = System("EPSG:3031").projection()->forward({30, -75});
  EXPECT_NEAR(there.x, registered.x, 1e-8);
  EXPECT_NEAR(there.y, registered.y, 1e-8);
}

// A definition from elsewhere may bring what no method has, or name a method that there is not.
TEST(Methods, DefinitionsThatTheTableDoesNotKnow) {
  detail::Definition definition;
  definition.kind = SystemKind::projected;
  definition.datum.ellipsoid = {"GRS 1980", 7019, 6378137, 298.257222101};
  definition.method = 9807;
  definition.parameters = {{8802, 0.1}, {424242, std::nan("")}};
  const Projection map(std::make_shared<const detail::ProjectionImpl>(definition));
  expect_same(map,
              Projection("transverse mercator", {{"lon0", 0.1 * 180 / 3.14159265358979324}},
                         Ellipsoid("GRS80")),
              6, 47);
  // It is told by nobody.
  EXPECT_EQ(map.parameters().size(), 5u);
  for (const char* name : {"", "mine"}) {
    definition.method = 9999;
    definition.name = name;
    try {
      const detail::ProjectionImpl none(definition);
      ADD_FAILURE();
    } catch (const Error& error) {
      EXPECT_EQ(std::string(error.what()),
                "There is no formula for the projection method EPSG:9999 of " +
                    std::string(*name == 0 ? "the system" : name) + ".");
    }
  }
}

// The same formulas by two roads: polar and oblique aspects, the hemispheres of a cone.
TEST(Methods, AspectsMeet) {
  const Ellipsoid intl("International 1924");
  for (const double pole : {90.0, -90.0}) {
    const double lat = pole * 0.9;
    const Projection variant_a("polar stereographic variant a", {{"lat0", pole}, {"lon0", 20}},
                               intl);
    expect_same(Projection("stereographic", {{"lat0", pole}, {"lon0", 20}}, intl), variant_a, 30,
                lat);
    // The scale of a parallel at the pole itself is the pole's.
    expect_same(Projection("polar stereographic variant b", {{"lat1", pole}, {"lon0", 20}}, intl),
                variant_a, 30, lat);
    // Equal area about a pole: that of the ellipsoid, and on the sphere the oblique formula.
    const Projection area("azimuthal equal area", {{"lat0", pole}, {"lon0", 20}}, intl);
    EXPECT_NEAR(area.factors({50, lat}).areal, 1, 1e-9);
    const Point at_pole = area.inverse({0, 0});
    EXPECT_EQ(at_pole.y, pole);
    EXPECT_EQ(at_pole.x, 20);
    EXPECT_TRUE(std::isnan(area.inverse({1.3e7, 1.3e7}).x));
    const Ellipsoid sphere(6371000, 0);
    const Projection round("azimuthal equal area", {{"lat0", pole}, {"lon0", 20}}, sphere);
    const Point there = round.forward({50, lat});
    const double rho = 2 * 6371000 * std::sin(4.5 * 3.14159265358979324 / 180);
    EXPECT_NEAR(there.x, rho / 2, 1e-6);  // thirty degrees off
    EXPECT_NEAR(there.y, (pole > 0 ? -1 : 1) * rho * std::sqrt(0.75), 1e-6);
  }
  // A cone and its image beyond the equator.
  for (const char* method : {"lambert near conformal", "equidistant conic", "albers"}) {
    SCOPED_TRACE(method);
    const auto cone = [&](double sign) {
      Parameters parameters = {{"lat0", sign * 40}, {"lon0", 0}};
      if (std::string(method) != "lambert near conformal") {
        parameters.emplace_back("lat1", sign * 35);
        parameters.emplace_back("lat2", sign * 45);
      }
      return Projection(method, parameters, intl);
    };
    const Projection north = cone(1), south = cone(-1);
    for (const double lon : {-30.0, 0.0, 12.0}) {
      const Point up = north.forward({lon, 50});
      const Point down = south.forward({lon, -50});
      EXPECT_NEAR(down.x, up.x, 1e-7);
      EXPECT_NEAR(down.y, -up.y, 1e-7);
      const Point back = south.inverse(down);
      EXPECT_NEAR(back.x, lon, 1e-10);
      EXPECT_NEAR(back.y, -50, 1e-10);
    }
  }
  // A perspective that is turned and not tilted is the vertical one, turned.
  const Projection vertical("vertical perspective", {{"lat0", 40}, {"lon0", 0}, {"h", 2e6}}, intl);
  const Projection level("tilted perspective", {{"lat0", 40}, {"lon0", 0}, {"h", 2e6}}, intl);
  expect_same(vertical, level, 2, 41);
  const Projection tilted("tilted perspective",
                          {{"lat0", 40}, {"lon0", 0}, {"h", 2e6}, {"tilt", 20}, {"azimuth", 0}},
                          intl);
  EXPECT_GT(std::hypot(tilted.forward({2, 42}).x - vertical.forward({2, 42}).x,
                       tilted.forward({2, 42}).y - vertical.forward({2, 42}).y),
            1000);
}

// Rounding may bring a latitude a hair beyond a pole, in degrees or in the plane: that is the pole,
// and what lies beyond it is not.
TEST(Methods, AHairBeyondAPoleIsThePole) {
  const Ellipsoid grs80("GRS80");
  const double hair = 3e-11;
  for (const char* method : {"equidistant cylindrical", "cylindrical equal area", "sinusoidal"}) {
    const Projection map(method, {{"lon0", 10}}, grs80);
    for (const double pole : {90.0, -90.0}) {
      const Point at = map.forward({12, pole});
      const Point beyond = map.forward({12, pole + std::copysign(hair, pole)});
      EXPECT_EQ(beyond.x, at.x) << method;
      EXPECT_EQ(beyond.y, at.y) << method;
      EXPECT_TRUE(std::isnan(map.forward({12, pole * (1 + 1e-9)}).x)) << method;
    }
  }
  // Tunisia's grid counts by degrees of latitude.
  const Projection mining("tunisia mining", {{"lat0", 0}, {"lon0", 0}}, grs80);
  const double north = mining.forward({0, 90}).y;
  const double south = mining.forward({0, -90}).y;
  EXPECT_EQ(mining.inverse({0, north * (1 + 3e-13)}).y, 90);
  EXPECT_EQ(mining.inverse({0, south * (1 + 3e-13)}).y, -90);
  EXPECT_TRUE(std::isnan(mining.inverse({0, north * (1 + 1e-9)}).y));
  EXPECT_NEAR(mining.inverse({0, south / 3}).y, -30, 1e-12);
}

// Where a point or its neighbours have no place on the map the factors have none; a sphere has.
TEST(Methods, FactorsAtTheEdges) {
  const Projection map("mercator", {}, Ellipsoid(6371000, 0));
  EXPECT_NEAR(map.factors({10, 60}).areal, 4, 1e-8);
  EXPECT_NEAR(map.factors({10, 60}).parallel, 2, 1e-9);
  const double nan = std::nan("");
  const double lon[] = {10, nan, 10, 10}, lat[] = {60, 45, nan, 89.9};
  Factors out[4];
  TWstatus words[4];
  const Summary summary = map.factors(4, Coordinates<const double>{lon, lat}, out, {words, 1});
  EXPECT_EQ(summary.failed, 3u);
  EXPECT_EQ(words[0], TW_SUCCESS);
  EXPECT_NE(words[1], TW_SUCCESS);
  EXPECT_EQ(words[2], TW_BAD_LATITUDE);
  EXPECT_EQ(words[3], TW_BAD_LATITUDE);
  for (int i = 1; i < 4; ++i) EXPECT_TRUE(std::isnan(out[i].convergence)) << i;
  // Without words.
  EXPECT_EQ(map.factors(4, Coordinates<const double>{lon, lat}, out).failed, 3u);
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
