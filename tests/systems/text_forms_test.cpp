// Texts of systems by hand: what users have in their files, and what is refused with which words.
#include "text_forms.hpp"

#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <random>

#include "makers.hpp"
#include "wkt_text.hpp"

using namespace tidewater;
using namespace tidewater::detail;

namespace {

constexpr double kDegree = kPi / 180;

void expect_refused(const std::function<void()>& read, std::string_view words) {
  try {
    read();
    FAIL() << "no error: " << words;
  } catch (const Error& error) {
    const std::string what = error.what();
    EXPECT_NE(what.find(words), std::string::npos) << what;
    EXPECT_EQ(what.back(), '.') << what;
    EXPECT_LT(what.size(), 700u) << what;
  }
}
void expect_wkt_refused(std::string_view text, std::string_view words) {
  expect_refused([&] { definition_from_wkt(text); }, words);
}
void expect_proj_refused(std::string_view text, std::string_view words) {
  expect_refused([&] { definition_from_proj(text); }, words);
}

const std::string kGeogcs =
    R"(GEOGCS["x",DATUM["d",SPHEROID["s",6378137,298.257222101]],PRIMEM["Greenwich",0],)"
    R"(UNIT["degree",0.0174532925199433]])";

std::string projcs(const std::string& rest) { return "PROJCS[\"p\"," + kGeogcs + "," + rest + "]"; }

TEST(WktSyntax, BracketsQuotesAndNumbers) {
  const auto objects = parse_wkt(" A [ \"t \"\"u\"\"\" , -1.5e+3 , word , B(2,C[]) ] , D[+7] ");
  ASSERT_EQ(objects.size(), 2u);
  const WktNode& a = objects[0];
  EXPECT_TRUE(a.is("A"));
  EXPECT_EQ(a.text(0), "t \"u\"");
  EXPECT_EQ(a.figure(1, 0), -1500);
  EXPECT_EQ(a.children[2].value, "word");
  ASSERT_NE(a.find("X", "B"), nullptr);
  EXPECT_EQ(a.find("B")->figure(0, 0), 2);
  EXPECT_NE(a.find("B")->find("C"), nullptr);
  EXPECT_EQ(a.find("C"), nullptr);
  EXPECT_EQ(objects[1].figure(0, 0), 7);
  EXPECT_EQ(a.text(1), "");
  EXPECT_EQ(a.figure(0, 5), 5);
  EXPECT_EQ(a.figure(99, 5), 5);
  EXPECT_EQ(parse_wkt("date[2010-05-02T10:00Z]")[0].children[0].value, "2010-05-02T10:00Z");
}

TEST(WktSyntax, ErrorsSayWhere) {
  expect_wkt_refused("", "ends where a keyword should stand, at character 1");
  expect_wkt_refused("12", "no keyword, at character 1");
  expect_wkt_refused("GEOGCS", "no bracket behind \"GEOGCS\"");
  expect_wkt_refused("GEOGCS[", "ends where a value should stand, at character 8");
  expect_wkt_refused("GEOGCS[\"x", "within a quoted text");
  expect_wkt_refused("GEOGCS[\"x\"", "before the bracket of GEOGCS is closed");
  expect_wkt_refused("GEOGCS[\"x\" 5]", "neither a comma nor a closing bracket in GEOGCS");
  expect_wkt_refused("GEOGCS[\"x\")", "neither a comma");
  expect_wkt_refused("GEOGCS[\"x\",?]", "no number, at character 12");
  expect_wkt_refused("GEOGCS[\"x\",1e999]", "no number");
  expect_wkt_refused("GEOGCS[\"x\"]]", "behind its last bracket");
  std::string deep;
  for (int i = 0; i < 100'000; ++i) deep += "A[";
  expect_wkt_refused(deep, "deeper");
  expect_wkt_refused(std::string(2'000'000, 'A'), "longer than a megabyte");
}

TEST(Wkt, ErrorsNameWhatIsMissing) {
  expect_wkt_refused("TIMECRS[\"x\"]", "a TIMECRS");
  expect_wkt_refused("GEOGCS[\"x\"]", "GEOGCS has no DATUM");
  expect_wkt_refused("GEOGCS[\"x\",DATUM[\"d\"]]", "DATUM has no ELLIPSOID");
  expect_wkt_refused("GEOGCS[\"x\",DATUM[\"d\",SPHEROID[\"s\"]]]", "SPHEROID lacks a number");
  expect_wkt_refused("GEOGCS[\"x\",DATUM[\"d\",SPHEROID[\"s\",-1,300]]]", "semi-major axis");
  expect_wkt_refused("GEOGCS[\"x\",DATUM[\"d\",SPHEROID[\"s\",1,0.5]]]", "inverse flattening");
  expect_wkt_refused("GEOGCS[\"x\",DATUM[\"d\",SPHEROID[\"s\",1,300],TOWGS84[1,2]]]",
                     "neither three nor seven");
  expect_wkt_refused(projcs(R"(UNIT["metre",1])"), "PROJCS has no PROJECTION");
  expect_wkt_refused(projcs(R"(PROJECTION["Sphericon"],UNIT["metre",1])"), "\"Sphericon\"");
  expect_wkt_refused(projcs(R"(PROJECTION["Transverse_Mercator"],PARAMETER["tilt",3])"),
                     "not taken by the projection method Transverse Mercator");
  expect_wkt_refused(projcs(R"(PROJECTION["Transverse_Mercator"],UNIT["nothing",0])"),
                     "not above zero");
  expect_wkt_refused(projcs(R"(PROJECTION["Transverse_Mercator"],AXIS["x",SIDEWAYS])"),
                     "no direction");
  expect_wkt_refused(kGeogcs + "," + kGeogcs, "after its system");
  expect_wkt_refused("COMPD_CS[\"c\"," + kGeogcs + "]", "no horizontal or no vertical");
}

TEST(Wkt, AnglesAndLengthsHaveTheirUnits) {
  // Parameters of version 1 are in the unit of the geographic system and in that of the plane.
  const Definition lambert = definition_from_wkt(
      R"(PROJCS["z",GEOGCS["g",DATUM["d",SPHEROID["s",6378249.2,293.4660212936]],)"
      R"(PRIMEM["Paris",2.33722917],UNIT["grad",0.01570796326794897]],)"
      R"(PROJECTION["Lambert_Conformal_Conic_1SP"],PARAMETER["latitude_of_origin",52],)"
      R"(PARAMETER["central_meridian",0],PARAMETER["scale_factor",0.99987742],)"
      R"(PARAMETER["false_easting",600],PARAMETER["false_northing",2200],UNIT["km",1000]])");
  EXPECT_EQ(lambert.method, 9801);
  EXPECT_NEAR(lambert.parameter(kLat0), 46.8 * kDegree, 1e-15);
  EXPECT_EQ(lambert.parameter(kX0), 600'000);
  EXPECT_EQ(lambert.parameter(kY0), 2'200'000);
  EXPECT_EQ(lambert.unit.factor, 1000);
  EXPECT_NEAR(lambert.datum.meridian.longitude, 2.33722917 * kDegree, 1e-15);
  EXPECT_EQ(lambert.axes, "EN");
  // Paris in grads, as some writers have it.
  const Definition paris =
      definition_from_wkt(R"(GEOGCS["g",DATUM["d",SPHEROID["s",6378249.2,293.4660212936]],)"
                          R"(PRIMEM["Paris",2.5969213],UNIT["grad",0.01570796326794897]])");
  EXPECT_NEAR(paris.datum.meridian.longitude, 2.33722917 * kDegree, 1e-15);
}

TEST(Wkt, TransformationsToWgs84) {
  const Definition old = definition_from_wkt(
      R"(GEOGCS["g",DATUM["d",SPHEROID["s",6377397.155,299.1528128],)"
      R"(TOWGS84[598.1,73.7,418.2,0.202,0.045,-2.455,6.7]],UNIT["degree",0.0174532925199433]])");
  ASSERT_TRUE(old.datum.to_wgs84);
  EXPECT_EQ((*old.datum.to_wgs84)[5], -2.455);
  // Version 2 has them in a bound system, and both ways of counting rotations.
  const Definition bound = definition_from_wkt(wkt_from_definition(old, Wkt::wkt2));
  ASSERT_TRUE(bound.datum.to_wgs84);
  for (std::size_t i = 0; i < 7; ++i) {
    EXPECT_NEAR((*bound.datum.to_wgs84)[i], (*old.datum.to_wgs84)[i], 1e-9);
  }
  std::string frame = wkt_from_definition(old, Wkt::wkt2);
  frame.replace(frame.find("Position Vector"), 15, "Coordinate Frame");
  const Definition turned = definition_from_wkt(frame);
  EXPECT_NEAR((*turned.datum.to_wgs84)[5], 2.455, 1e-9);
  EXPECT_NEAR((*turned.datum.to_wgs84)[6], 6.7, 1e-9);
  frame.replace(frame.find("Coordinate Frame"), 16, "NTv2");
  expect_wkt_refused(frame, "three or seven parameters");
}

TEST(Wkt, FilesBeginAndEndInTheirOwnWays) {
  EXPECT_EQ(definition_from_wkt("\xEF\xBB\xBF" + kGeogcs + "\r\n").name, "x");
  const Definition compound = definition_from_wkt(
      kGeogcs + R"(,VERTCS["h",VDATUM["v"],PARAMETER["Vertical_Shift",0.0],UNIT["Foot",0.3048]])");
  EXPECT_EQ(compound.kind, SystemKind::compound);
  EXPECT_EQ(compound.vertical_name, "h");
  EXPECT_EQ(compound.vertical_unit.factor, 0.3048);
}

TEST(Wkt, NamesAreQuoted) {
  Definition odd = definition_from_wkt(kGeogcs);
  odd.name = "a \"quoted\" name";
  for (const Wkt version : {Wkt::wkt1, Wkt::wkt2}) {
    EXPECT_EQ(definition_from_wkt(wkt_from_definition(odd, version)).name, odd.name);
  }
}

TEST(ProjText, ReadsWhatUsersHave) {
  const Definition utm = definition_from_proj("+proj=utm +zone=33 +south +ellps=intl +units=km");
  EXPECT_EQ(utm.method, 9807);
  EXPECT_NEAR(utm.parameter(kLon0), 15 * kDegree, 1e-15);
  EXPECT_EQ(utm.parameter(kK0), 0.9996);
  EXPECT_EQ(utm.parameter(kY0), 10'000'000);
  EXPECT_EQ(utm.unit.factor, 1000);
  EXPECT_EQ(utm.datum.ellipsoid.a, 6378388);
  // Without plus signs, in degrees, minutes and seconds, in radians.
  const Definition words = definition_from_proj("proj=tmerc lat_0=49d30'N lon_0=-2 k=0.9996 R=6e6");
  EXPECT_NEAR(words.parameter(kLat0), 49.5 * kDegree, 1e-15);
  EXPECT_EQ(words.datum.ellipsoid.inverse_flattening, 0);
  EXPECT_EQ(definition_from_proj("+proj=tmerc +lon_0=0.5r +a=6378137 +rf=298").parameter(kLon0),
            0.5);
  EXPECT_NEAR(definition_from_proj("+proj=longlat +a=6378137 +b=6356752")
                  .datum.ellipsoid.inverse_flattening,
              6378137 / (6378137 - 6356752.0), 1e-9);
  EXPECT_NEAR(
      definition_from_proj("+proj=longlat +ellps=clrk80ign +pm=paris").datum.meridian.longitude,
      2.33722917 * kDegree, 1e-15);
  EXPECT_EQ(
      (*definition_from_proj("+proj=longlat +ellps=intl +towgs84=-87,-98,-121").datum.to_wgs84)[2],
      -121);
  EXPECT_EQ(definition_from_proj("+proj=lcc +lat_1=44 +lat_2=49 +ellps=GRS80").method, 9802);
  EXPECT_EQ(definition_from_proj("+proj=lcc +lat_1=46 +lat_0=46 +ellps=GRS80").method, 9801);
  EXPECT_EQ(definition_from_proj("+proj=lcc +lat_2=46 +ellps=GRS80").method, 9802);
  EXPECT_EQ(definition_from_proj("+proj=stere +lat_0=-90 +lat_ts=-71 +ellps=GRS80").method, 9829);
  EXPECT_EQ(definition_from_proj("+proj=stere +lat_0=90 +k=0.994 +ellps=GRS80").method, 9810);
  EXPECT_EQ(definition_from_proj("+proj=stere +lat_0=45 +ellps=GRS80").method, kStereographic);
  EXPECT_EQ(definition_from_proj("+proj=robin +ellps=GRS80").method, kRobinson);
  EXPECT_EQ(definition_from_proj("+proj=geocent +ellps=GRS80").kind, SystemKind::geocentric);
  EXPECT_EQ(definition_from_proj("+proj=tmerc +axis=wsu +ellps=GRS80").method, 9808);
}

TEST(ProjText, RefusesWhatItDoesNotUnderstand) {
  expect_proj_refused("", "no +proj");
  expect_proj_refused("+ellps=GRS80", "no +proj");
  expect_proj_refused("+proj=sphericon +ellps=GRS80", "no projection \"sphericon\"");
  expect_proj_refused("+proj=pipeline +step +proj=tmerc", "pipeline");
  expect_proj_refused("+proj=utm +ellps=GRS80", "+zone");
  expect_proj_refused("+proj=utm +zone=61 +ellps=GRS80", "+zone");
  expect_proj_refused("+proj=tmerc +lat_0=high +ellps=GRS80", "+lat_0");
  expect_proj_refused("+proj=tmerc +x_0=1e999 +ellps=GRS80", "no number");
  expect_proj_refused("+proj=tmerc +lat_ts=30 +ellps=GRS80", "+lat_ts is not known here");
  expect_proj_refused("+proj=tmerc +R_A +ellps=GRS80", "+R_A");
  expect_proj_refused("+proj=tmerc +datum=nowhere", "+datum=nowhere");
  expect_proj_refused("+proj=tmerc +ellps=GRS80 +units=parsec", "no unit");
  expect_proj_refused("+proj=tmerc +ellps=GRS80 +to_meter=0", "above zero");
  expect_proj_refused("+proj=tmerc +ellps=GRS80 +towgs84=1,2", "three or seven");
  expect_proj_refused("+proj=tmerc +ellps=GRS80 +towgs84=1,2,3,4,5,6,7,8", "three or seven");
  expect_proj_refused("+proj=tmerc +ellps=GRS80 +axis=up", "+axis");
  expect_proj_refused("+proj=tmerc +a=-5 +rf=300", "above zero");
  expect_proj_refused("+proj=tmerc +a=5 +b=6", "+b");
  expect_proj_refused("+proj=tmerc +a=5 +rf=1", "inverse flattening");
  expect_proj_refused("+init=mine:5", "registry code");
  expect_proj_refused(std::string(100'000, '+'), "64 kilobytes");
  std::string many;
  for (int i = 0; i < 200; ++i) many += "+a" + std::to_string(i) + "=1 ";
  expect_proj_refused(many, "hundred words");
}

// Cut anywhere, and with any byte anywhere, a text gives a definition or an error.
TEST(TextForms, DamagedTextsAreRefusedOrRead) {
  const std::string wkt = projcs(
      R"(PROJECTION["Lambert_Conformal_Conic_2SP"],PARAMETER["standard_parallel_1",49],)"
      R"(PARAMETER["false_easting",700000],UNIT["metre",1],AXIS["E",EAST],AUTHORITY["EPSG","1"])");
  const std::string proj =
      "+proj=lcc +lat_0=46.5 +lon_0=3 +lat_1=49 +lat_2=44 +x_0=7e5 +ellps=GRS80 +towgs84=0,0,0";
  std::mt19937 random(3);
  for (const std::string& whole : {wkt, proj}) {
    const bool is_wkt = whole[0] != '+';
    const auto read = [is_wkt](const std::string& text) {
      try {
        is_wkt ? definition_from_wkt(text) : definition_from_proj(text);
      } catch (const Error& error) {
        EXPECT_NE(std::string_view(error.what()), "");
      }
    };
    for (std::size_t length = 0; length < whole.size(); ++length) read(whole.substr(0, length));
    for (int i = 0; i < 3000; ++i) {
      std::string text = whole;
      for (unsigned k = 0; k <= random() % 4; ++k) {
        text[random() % text.size()] = static_cast<char>(random());
      }
      read(text);
    }
  }
}

}  // namespace
