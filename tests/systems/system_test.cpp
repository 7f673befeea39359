// Ellipsoids, meridians and units by name, and what a system tells of itself.
#include "tidewater/system.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <clocale>
#include <cmath>
#include <string>

#include "tidewater/ellipsoid.hpp"

namespace tidewater::test {

namespace {

bool has(const std::string& text, const char* part) { return text.find(part) != std::string::npos; }

template <class Make>
std::string sentence(const Make& make) {
  try {
    make();
    return "not refused";
  } catch (const Error& error) {
    return error.what();
  }
}

}  // namespace

TEST(Ellipsoids, ByAnyOfTheirNames) {
  // The polar axis and the eccentricity of WGS 84 as its definition has them (NIMA TR8350.2).
  for (const char* name : {"WGS 84", "wgs84", "EPSG:7030"}) {
    const Ellipsoid wgs84(name);
    EXPECT_EQ(wgs84.code(), 7030) << name;
    EXPECT_EQ(wgs84.name(), "WGS 84") << name;
    EXPECT_NEAR(wgs84.b(), 6356752.3142, 5e-5);
    EXPECT_NEAR(wgs84.eccentricity(), 8.1819190842622e-2, 1e-15);
  }
  struct Alias {
    const char* name;
    const char* registered;
  };
  for (const Alias& alias : {Alias{"grs80", "GRS 1980"},
                             {"GRS 80", "GRS 1980"},
                             {"wgs 84", "WGS 84"},
                             {"wgs72", "WGS 72"},
                             {"grs67", "GRS 1967"},
                             {"clrk66", "Clarke 1866"},
                             {"clarke66", "Clarke 1866"},
                             {"clrk80", "Clarke 1880 (RGS)"},
                             {"clarke80", "Clarke 1880 (RGS)"},
                             {"clrk80ign", "Clarke 1880 (IGN)"},
                             {"intl", "International 1924"},
                             {"hayford", "International 1924"},
                             {"international", "International 1924"},
                             {"bessel", "Bessel 1841"},
                             {"bess_nam", "Bessel Namibia (GLM)"},
                             {"airy", "Airy 1830"},
                             {"mod_airy", "Airy Modified 1849"},
                             {"krass", "Krassowsky 1940"},
                             {"krassovsky", "Krassowsky 1940"},
                             {"aust_SA", "Australian National Spheroid"},
                             {"helmert", "Helmert 1906"},
                             {"evrst30", "Everest 1830 (1937 Adjustment)"},
                             {"plessis", "Plessis 1817"},
                             {"cgcs2000", "CGCS2000"},
                             {"pz90", "PZ-90"}}) {
    EXPECT_EQ(Ellipsoid(alias.name).name(), alias.registered) << alias.name;
  }
  EXPECT_EQ(Ellipsoid(6371000, 0).eccentricity(), 0);
  EXPECT_EQ(Ellipsoid(6371000, 0).b(), 6371000);
  EXPECT_EQ(Ellipsoid(6378137, 3).flattening(), 1.0 / 3);
  const auto names = Ellipsoid::names();
  EXPECT_NE(std::find(names.begin(), names.end(), "GRS 1980"), names.end());
  EXPECT_GT(names.size(), 40u);
  for (const std::string& name : names) EXPECT_EQ(Ellipsoid(name).name(), name);
}

TEST(Ellipsoids, RefusalsAreSentences) {
  for (const char* name : {"nobody's", "EPSG:99999", "EPSG:9001", ""}) {
    EXPECT_EQ(sentence([&] { Ellipsoid{name}; }),
              "The registry has no ellipsoid \"" + std::string(name) + "\".");
  }
  const double nan = std::nan("");
  for (const double a : {0.0, -6378137.0, HUGE_VAL, nan}) {
    EXPECT_TRUE(has(sentence([&] { Ellipsoid(a, 300); }), "must be above zero and finite")) << a;
  }
  for (const double rf : {2.999, 1.0, -300.0, nan}) {
    EXPECT_TRUE(has(sentence([&] { Ellipsoid(6378137, rf); }), "must be 3 or more, or 0")) << rf;
  }
  EXPECT_EQ(sentence([] { PrimeMeridian{"Atlantis"}; }),
            "The registry has no prime meridian \"Atlantis\".");
  EXPECT_EQ(sentence([] { PrimeMeridian{"EPSG:7030"}; }),
            "The registry has no prime meridian \"EPSG:7030\".");
  EXPECT_EQ(sentence([] { Unit{"EPSG:7030"}; }), "The registry has no unit \"EPSG:7030\".");
  EXPECT_EQ(sentence([] { Unit{"ell"}; }), "The registry has no unit \"ell\".");
}

TEST(Units, ByAnyOfTheirNames) {
  struct Case {
    const char* name;
    int code;
    double factor;
    Unit::Kind kind;
  };
  for (const Case& c : {Case{"us ft", 9003, 1200.0 / 3937, Unit::Kind::length},
                        Case{"metre", 9001, 1, Unit::Kind::length},
                        Case{"EPSG:9002", 9002, 0.3048, Unit::Kind::length},
                        Case{"deg", 9102, 0.017453292519943295, Unit::Kind::angle},
                        Case{"gon", 9105, 0.015707963267948967, Unit::Kind::angle},
                        Case{"parts per million", 9202, 1e-6, Unit::Kind::scale},
                        Case{"EPSG:9201", 9201, 1, Unit::Kind::scale},
                        Case{"year", 1029, 31556925.445, Unit::Kind::scale}}) {
    SCOPED_TRACE(c.name);
    const Unit unit(c.name);
    EXPECT_EQ(unit.code(), c.code);
    EXPECT_NEAR(unit.factor(), c.factor, 1e-14 * c.factor);
    EXPECT_EQ(unit.kind(), c.kind);
  }
  // Every short form is a unit of the registry's.
  for (const char* name :
       {"m",     "meter",          "meters", "metres", "km",   "ft",  "feet",  "us foot",
        "us-ft", "US survey feet", "ftUS",   "ind_ft", "yd",   "ch",  "link",  "degrees",
        "rad",   "radians",        "grads",  "ind_yd", "fath", "kmi", "us_ch", "us_mi",
        "mi"}) {
    EXPECT_GT(Unit(name).factor(), 0) << name;
  }
  EXPECT_NEAR(PrimeMeridian("Paris").longitude(), 2.33722917, 1e-12);
  EXPECT_EQ(PrimeMeridian("EPSG:8901").longitude(), 0);
}

TEST(Systems, TellWhatTheyAre) {
  const System heights("EPSG:5720");
  EXPECT_EQ(heights.kind(), SystemKind::vertical);
  EXPECT_EQ(heights.datum(), "Nivellement General de la France - IGN69");
  EXPECT_EQ(heights.unit(), "metre");
  EXPECT_EQ(heights.unit_factor(), 1);
  EXPECT_EQ(heights.method(), "");
  EXPECT_TRUE(heights.parameters().empty());
  EXPECT_FALSE(heights.projection());
  EXPECT_EQ(
      heights.describe(),
      "NGF-IGN69 height (EPSG:5720)\nkind: vertical\nheights: NGF-IGN69 height (metre)\nunit: "
      "metre\naxes: U\narea of use: France - mainland onshore (-4.87 to 8.23, 42.33 to "
      "51.14)\n");
  const System compound("EPSG:2154+5720");
  EXPECT_TRUE(has(compound.describe(), "kind: compound"));
  EXPECT_TRUE(has(compound.describe(), "heights: NGF-IGN69 height (metre)"));
  EXPECT_TRUE(has(compound.describe(), "method: Lambert Conic Conformal (2SP)"));
  EXPECT_TRUE(has(compound.describe(), "Easting at false origin: 700000"));
  const System wgs84("EPSG:4326");
  EXPECT_EQ(wgs84.datum(), "World Geodetic System 1984 ensemble");
  EXPECT_EQ(wgs84.method(), "");
  EXPECT_TRUE(wgs84.parameters().empty());
  EXPECT_TRUE(has(wgs84.describe(), "ellipsoid: WGS 84, a = 6378137 m, 1/f = 298.257223563"));
  const System paris("EPSG:4807");
  EXPECT_TRUE(has(paris.describe(), "prime meridian: Paris 2.33722917 degrees east of Greenwich"));
  EXPECT_NEAR(paris.meridian().longitude(), 2.33722917, 1e-12);
  // An ellipsoid without a name, a sphere, a meridian of its own.
  const System own("tmerc lat0=0 lon0=9 a=6378000 rf=300");
  EXPECT_TRUE(has(own.describe(), "\nellipsoid: a = 6378000 m, 1/f = 300\n")) << own.describe();
  EXPECT_EQ(own.ellipsoid().a(), 6378000);
  EXPECT_EQ(own.code(), 0);
  const System sphere("+proj=merc +R=6371000 +pm=10.5");
  EXPECT_FALSE(has(sphere.describe(), "1/f")) << sphere.describe();
  EXPECT_TRUE(has(sphere.describe(), " 10.5 degrees east of Greenwich")) << sphere.describe();
  EXPECT_NEAR(sphere.meridian().longitude(), 10.5, 1e-12);
  EXPECT_EQ(sphere.ellipsoid().inverse_flattening(), 0);
  // Dialects of WKT
  EXPECT_TRUE(has(wgs84.to_wkt("wkt1"), "GEOGCS[\"WGS 84\""));
  EXPECT_TRUE(has(wgs84.to_wkt("esri"), "GEOGCS[\"GCS_WGS"));
  EXPECT_EQ(wgs84.to_wkt("wkt2"), wgs84.to_wkt());
  EXPECT_TRUE(has(sentence([&] { wgs84.to_wkt("wkt3"); }), "no dialect \"wkt3\""));
}

// A locale's decimal mark does not reach the words.
TEST(Systems, TellTheSameInEveryLocale) {
  const std::string before = std::setlocale(LC_NUMERIC, nullptr);
  if (std::setlocale(LC_NUMERIC, "de_DE.UTF-8") == nullptr) {
    GTEST_SKIP() << "the locale de_DE.UTF-8 is not installed";
  }
  const std::string german = System("EPSG:4807").describe();
  std::setlocale(LC_NUMERIC, before.c_str());
  EXPECT_EQ(german, System("EPSG:4807").describe());
}

TEST(Systems, AllAreThoseThatCanBeAskedFor) {
  const auto all = System::all();
  EXPECT_GT(all.size(), 5000u);
  int last = 0;
  for (const FoundSystem& one : all) {
    EXPECT_GT(one.code, last);
    last = one.code;
    EXPECT_FALSE(one.name.empty());
  }
  const auto lambert =
      std::find_if(all.begin(), all.end(), [](const FoundSystem& one) { return one.code == 2154; });
  ASSERT_NE(lambert, all.end());
  EXPECT_EQ(lambert->name, "RGF93 v1 / Lambert-93");
  EXPECT_EQ(lambert->kind, SystemKind::projected);
}

}  // namespace tidewater::test
