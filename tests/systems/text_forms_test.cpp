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

const std::string kHeights = R"(VERT_CS["h",VERT_DATUM["v",2005],UNIT["metre",1]])";

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
  EXPECT_EQ(a.text(99), "");
  EXPECT_EQ(a.figure(0, 5), 5);
  EXPECT_EQ(a.figure(99, 5), 5);
  for (const char* date : {"2010-05-02", "2010-05-02T10:00:30.5Z", "2010-05-02T10:00+01:00"}) {
    EXPECT_EQ(parse_wkt("date[" + std::string(date) + "]")[0].children[0].value, date);
  }
  EXPECT_EQ(parse_wkt("a_z1\n\r\t[_b2]")[0].value, "A_Z1");
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
  expect_wkt_refused("GEOGCS[\"x\",-inf]", "no number");
  expect_wkt_refused("A[2010-05-02", "ends before the bracket of A is closed");
  expect_wkt_refused(std::string("A\0[1]", 5), "no bracket behind \"A\"");
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
  expect_wkt_refused(
      "GEOGCRS[\"x\",DATUM[\"d\",ELLIPSOID[\"s\",1e300,300,LENGTHUNIT[\"u\",1e300]]]]",
      "no length above zero");
  expect_wkt_refused("GEOGCS[\"x\",DATUM[\"d\",SPHEROID[\"s\",6378137,298]],PRIMEM[\"m\",400]]",
                     "PRIMEM is beyond a whole turn");
  expect_wkt_refused(projcs(R"(UNIT["metre",1])"), "PROJCS has no PROJECTION");
  expect_wkt_refused(projcs(R"(PROJECTION["Sphericon"],UNIT["metre",1])"), "\"Sphericon\"");
  expect_wkt_refused(projcs(R"(PROJECTION[1],UNIT["metre",1])"), "PROJECTION has no name");
  expect_wkt_refused(projcs(R"(PROJECTION["Transverse_Mercator"],PARAMETER["tilt",3])"),
                     "not taken by the projection method Transverse Mercator");
  expect_wkt_refused(projcs(R"(PROJECTION["Transverse_Mercator"],UNIT["nothing",0])"),
                     "not above zero");
  expect_wkt_refused(projcs(R"(PROJECTION["Transverse_Mercator"],AXIS["x",SIDEWAYS])"),
                     "no direction");
  expect_wkt_refused(projcs(R"(PROJECTION["Transverse_Mercator"],AXIS["x"])"), "no direction");
  expect_wkt_refused(kGeogcs + "," + kGeogcs, "has a GEOGCS after its system");
  expect_wkt_refused(kGeogcs + "," + kHeights + "," + kHeights, "has a VERT_CS after its system");
}

// What would give plausible figures of another meaning is refused.
TEST(Wkt, ContradictionsAreRefused) {
  const auto tmerc = [](const std::string& rest) {
    return projcs(R"(PROJECTION["Transverse_Mercator"],)" + rest);
  };
  expect_wkt_refused(
      tmerc(R"(PARAMETER["latitude_of_origin",10],PARAMETER["latitude_of_origin",20])"),
      "\"latitude_of_origin\" has two different values");
  expect_wkt_refused(tmerc(R"(PARAMETER["false_easting",1e308],UNIT["u",1000])"), "out of range");
  expect_wkt_refused(tmerc(R"(PARAMETER[latitude_of_origin,0])"), "PARAMETER has no name");
  for (const char* box : {"-91,0,0,0", "0,-181,0,0", "0,0,90.5,0", "0,0,0,1e300"}) {
    expect_wkt_refused(
        R"(GEOGCRS["g",DATUM["d",ELLIPSOID["s",6378137,298.25]],BBOX[)" + std::string(box) + "]]",
        "BBOX has a side that is not on the earth");
  }
  for (const char* unit : {R"(UNIT["degree",0.0174532925199433])", R"(UNIT["radian",1])",
                           R"(UNIT["grad",0.01570796326794897])"}) {
    expect_wkt_refused(tmerc(unit), "unit of angle where a length is needed");
  }
  // Axes that are no pair.
  for (const char* axes :
       {R"(AXIS["E",EAST])", R"(AXIS["E",EAST],AXIS["W",WEST])", R"(AXIS["x",EAST],AXIS["y",EAST])",
        R"(AXIS["N",NORTH],AXIS["H",UP])", R"(AXIS["E",EAST],AXIS["N",NORTH],AXIS["D",DOWN])",
        R"(AXIS["E",EAST],AXIS["N",NORTH],AXIS["H",UP],AXIS["H",UP])"}) {
    expect_wkt_refused(tmerc(axes), "axes that are not one along the parallel");
  }
  expect_wkt_refused(R"(VERT_CS["h",VERT_DATUM["v",2005],UNIT["metre",1],AXIS["e",EAST]])",
                     "neither up nor down");
  expect_wkt_refused(R"(VERTCS["h",VDATUM["v"],PARAMETER["Vertical_Shift",5],UNIT["metre",1]])",
                     "\"Vertical_Shift\" has a value that is not known here");
  expect_wkt_refused(R"(VERTCS["h",VDATUM["v"],PARAMETER["Direction",0],UNIT["metre",1]])",
                     "\"Direction\" has a value that is not known here");
  // Heights beside what is not two axes, and parts given twice.
  const std::string geoccs = R"(GEOCCS["x",DATUM["d",SPHEROID["s",6378137,298.257222101]],)"
                             R"(PRIMEM["Greenwich",0],UNIT["metre",1]])";
  const std::string solid = kGeogcs.substr(0, kGeogcs.size() - 1) + R"(,LINUNIT["Meter",1]])";
  const auto compound = [](const std::string& one, const std::string& other) {
    return "COMPD_CS[\"c\"," + one + "," + other + "]";
  };
  expect_wkt_refused("COMPD_CS[\"c\"," + kGeogcs + "]", "no horizontal or no vertical");
  expect_wkt_refused("COMPD_CS[\"c\",TIMECRS[\"t\"]," + kHeights + "]", "no horizontal");
  expect_wkt_refused(compound(kGeogcs, kHeights + "," + kGeogcs), "two horizontal");
  expect_wkt_refused(compound(kGeogcs, kHeights + "," + kHeights), "two vertical");
  for (const std::string& part : {geoccs, solid}) {
    expect_wkt_refused(compound(part, kHeights), "COMPD_CS has neither a map's nor");
    expect_wkt_refused(part + "," + kHeights, "has neither a map's nor");
  }
  expect_wkt_refused(kHeights + "," + kHeights, "VERT_CS has neither a map's nor");
}

TEST(Wkt, AxesHaveTheirNumbersAndAtAPoleTheirNames) {
  const auto axes_of = [](const std::string& axes) {
    return definition_from_wkt(projcs(R"(PROJECTION["Polar_Stereographic"],)"
                                      R"(PARAMETER["latitude_of_origin",90],)"
                                      R"(PARAMETER["scale_factor",0.994],)" +
                                      axes))
        .axes;
  };
  EXPECT_EQ(axes_of(R"(AXIS["n",NORTH,ORDER[2]],AXIS["e",EAST,ORDER[1]])"), "EN");
  EXPECT_EQ(axes_of(R"(AXIS["n",NORTH],AXIS["e",EAST])"), "NE");
  EXPECT_EQ(axes_of(R"(AXIS["Northing",SOUTH],AXIS["Easting",SOUTH])"), "NE");
  EXPECT_EQ(axes_of(R"(AXIS["N",SOUTH],AXIS["E",SOUTH])"), "NE");
  EXPECT_EQ(axes_of(R"(AXIS["x",NORTH],AXIS["y",NORTH])"), "EN");
  EXPECT_EQ(axes_of(R"(AXIS["one",NORTH],AXIS["other",NORTH])"), "EN");
  EXPECT_EQ(axes_of(R"(AXIS["w",west],AXIS["s",south],AXIS["h",up])"), "WSU");
  EXPECT_EQ(axes_of(R"(UNIT["metre",1])"), "EN");
  // Depths and heights, by an axis or by the parameter of .prj files.
  const auto vertical = [](const std::string& rest) {
    return definition_from_wkt("VERTCS[\"v\",VDATUM[\"d\"]," + rest + "]").axes;
  };
  EXPECT_EQ(vertical(R"(AXIS["D",DOWN])"), "D");
  EXPECT_EQ(vertical(R"(PARAMETER["Vertical_Shift",0.0],PARAMETER["Direction",-1.0])"), "D");
  EXPECT_EQ(vertical(R"(PARAMETER["Direction",1.0])"), "U");
  Definition depth = definition_from_wkt(R"(VERT_CS["v",VERT_DATUM["d",2005],AXIS["D",DOWN]])");
  for (const Wkt dialect : {Wkt::wkt1, Wkt::esri, Wkt::wkt2}) {
    EXPECT_EQ(definition_from_wkt(wkt_from_definition(depth, dialect)).axes, "D");
  }
}

// A datum is the registry's where its name or its code is and its figures are the same.
TEST(Wkt, DatumsOfTheRegistry) {
  const auto datum_of = [](const std::string& datum, const std::string& rest = "") {
    return definition_from_wkt("GEOGCS[\"g\"," + datum + rest + "]").datum.code;
  };
  const std::string figures = R"(SPHEROID["s",6378137,298.257223563])";
  for (const char* name : {"WGS_1984", "D_WGS_1984", "d_wgs_1984", "World Geodetic System 1984"}) {
    EXPECT_EQ(datum_of("DATUM[\"" + std::string(name) + "\"," + figures + "]"), 6326) << name;
  }
  EXPECT_EQ(datum_of(R"(DATUM["mine",)" + figures + R"(,AUTHORITY["EPSG","6326"]])"), 6326);
  EXPECT_EQ(datum_of(R"(DATUM["mine",)" + figures + "]", R"(,AUTHORITY["EPSG","4326"])"), 6326);
  // Another flattening or meridian, another ellipsoid under the code of a system; a code of
  // heights.
  EXPECT_EQ(datum_of(R"(DATUM["WGS_1984",SPHEROID["s",6378137,300]])"), 0);
  EXPECT_EQ(datum_of(R"(DATUM["WGS_1984",SPHEROID["s",6378138,298.257223563]])"), 0);
  EXPECT_EQ(datum_of(R"(DATUM["WGS_1984",)" + figures + "]", R"(,PRIMEM["p",5])"), 0);
  EXPECT_EQ(datum_of(R"(DATUM["mine",)" + figures + "]", R"(,AUTHORITY["EPSG","4230"])"), 0);
  EXPECT_EQ(datum_of(R"(DATUM["WGS_1984",)" + figures + R"(,AUTHORITY["EPSG","5101"]])"), 6326);
  EXPECT_EQ(datum_of(R"(DATUM["D_mine",)" + figures + "]"), 0);
  EXPECT_EQ(datum_of(R"(DATUM["mine",)" + figures + "]"), 0);
}

// Codes are whole numbers above zero; what is none is no code.
TEST(Wkt, Codes) {
  const auto code_of = [](const std::string& id) {
    return definition_from_wkt(kGeogcs.substr(0, kGeogcs.size() - 1) + "," + id + "]").code;
  };
  EXPECT_EQ(code_of(R"(AUTHORITY["EPSG","4258"])"), 4258);
  EXPECT_EQ(code_of(R"(ID["epsg",4258,"1.0"])"), 4258);
  for (const char* none :
       {R"(AUTHORITY["EPSG","-5"])", R"(AUTHORITY["EPSG","4258x"])",
        R"(AUTHORITY["EPSG","99999999999"])", R"(AUTHORITY["EPSG"])", R"(AUTHORITY["MINE","4258"])",
        R"(ID["EPSG",4258.7])", R"(ID["EPSG",0])"}) {
    EXPECT_EQ(code_of(none), 0) << none;
  }
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
  EXPECT_EQ(definition_from_wkt(R"(GEOGCS["g",DATUM["d",SPHEROID["s",6378388,297],)"
                                R"(TOWGS84[-87,-98,-121]]])")
                .datum.to_wgs84.value(),
            (std::array<double, 7>{-87, -98, -121}));
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

// One name for several methods: what is given beside it tells.
TEST(Wkt, OneNameForSeveralMethods) {
  struct Case {
    const char* text;
    int method;
    int parameter;
    double value;  // degrees where it is an angle
  };
  constexpr Case kCases[] = {
      {R"(PROJECTION["Mercator"],PARAMETER["scale_factor",0.997])", 9804, kK0, 0.997},
      {R"(PROJECTION["Mercator"],PARAMETER["standard_parallel_1",-41])", 9805, kLat1, -41},
      {R"(PROJECTION["Mercator"],PARAMETER["central_meridian",3])", 9805, kLat1, 0},
      {R"(PROJECTION["Lambert_Conformal_Conic"],PARAMETER["standard_parallel_1",46],)"
       R"(PARAMETER["latitude_of_origin",45],PARAMETER["scale_factor",0.99])",
       1102, kLat0, 46},
      {R"(PROJECTION["Lambert_Conformal_Conic"],PARAMETER["standard_parallel_1",46],)"
       R"(PARAMETER["latitude_of_origin",46],PARAMETER["scale_factor",0.99])",
       9801, kLat0, 46},
      {R"(PROJECTION["Lambert_Conformal_Conic"],PARAMETER["latitude_of_origin",46])", 9801, kLat0,
       46},
      {R"(PROJECTION["Lambert_Conformal_Conic"],PARAMETER["standard_parallel_1",46],)"
       R"(PARAMETER["standard_parallel_2",48])",
       9802, kLat2, 48},
      {R"(PROJECTION["Lambert_Conformal_Conic"],PARAMETER["standard_parallel_1",46],)"
       R"(PARAMETER["standard_parallel_2",48],PARAMETER["scale_factor",1])",
       9802, kLat1, 46},
      {R"(PROJECTION["Lambert_Conformal_Conic"],PARAMETER["standard_parallel_1",46],)"
       R"(PARAMETER["standard_parallel_2",48],PARAMETER["scale_factor",1.0000382])",
       1051, kEllipsoidScaling, 1.0000382},
      {R"(PROJECTION["Polar_Stereographic"],PARAMETER["latitude_of_origin",-90],)"
       R"(PARAMETER["scale_factor",0.994])",
       9810, kLat0, -90},
      {R"(PROJECTION["Polar_Stereographic"],PARAMETER["latitude_of_origin",-71])", 9829, kLatTrue,
       -71},
      {R"(PROJECTION["Stereographic_North_Pole"],PARAMETER["standard_parallel_1",90],)"
       R"(PARAMETER["scale_factor",0.994])",
       9810, kLat0, 90},
      {R"(PROJECTION["Stereographic_South_Pole"],PARAMETER["standard_parallel_1",-71])", 9829,
       kLatTrue, -71},
      {R"(PROJECTION["Stereographic"],PARAMETER["latitude_of_origin",-90],)"
       R"(PARAMETER["scale_factor",0.97])",
       9810, kK0, 0.97},
      {R"(PROJECTION["Stereographic"],PARAMETER["latitude_of_origin",90],)"
       R"(PARAMETER["standard_parallel_1",70])",
       9829, kLatTrue, 70},
      {R"(PROJECTION["Stereographic"],PARAMETER["latitude_of_origin",52])", kStereographic, kLat0,
       52},
      {R"(PROJECTION["Krovak"],PARAMETER["xy_plane_rotation",90],PARAMETER["x_scale",-1])", 1041,
       kPseudoScale, 1},
      {R"(PROJECTION["Krovak"],AXIS["x",SOUTH],AXIS["y",WEST])", 9819, kPseudoScale, 1},
      {R"(PROJECTION["Hotine_Oblique_Mercator_Azimuth_Center"],PARAMETER["azimuth",30])", 9815,
       kRectifiedAngle, 30},
      {R"(PROJECTION["Hotine_Oblique_Mercator_Azimuth_Center"],PARAMETER["azimuth",30],)"
       R"(PARAMETER["rectified_grid_angle",31])",
       9815, kRectifiedAngle, 31},
      // Without an azimuth there is none to take over.
      {R"(PROJECTION["Hotine_Oblique_Mercator_Azimuth_Center"],PARAMETER["scale_factor",1])", 9815,
       kRectifiedAngle, 0},
      // The words that users type.
      {R"(PROJECTION["lcc"],PARAMETER["standard_parallel_1",46])", 9802, kLat1, 46},
      // A parameter of a code that the method does not take goes by its name.
      {R"(PROJECTION["Transverse_Mercator"],)"
       R"(PARAMETER["latitude_of_origin",10,AUTHORITY["EPSG","8821"]])",
       9807, kLat0, 10},
  };
  for (const Case& c : kCases) {
    const Definition read = definition_from_wkt(projcs(c.text));
    EXPECT_EQ(read.method, c.method) << c.text;
    const bool angle = parameter_kind(c.parameter)->quantity == Quantity::angle;
    EXPECT_NEAR(read.parameter(c.parameter, NAN), c.value * (angle ? kDegree : 1), 1e-15) << c.text;
  }
  // In grads a pole is at 100.
  std::string grads =
      projcs(R"(PROJECTION["Polar_Stereographic"],PARAMETER["latitude_of_origin",-100],)"
             R"(PARAMETER["scale_factor",0.994])");
  const std::string degree = R"(UNIT["degree",0.0174532925199433])";
  grads.replace(grads.find(degree), degree.size(), R"(UNIT["grad",0.01570796326794897])");
  EXPECT_EQ(definition_from_wkt(grads).method, 9810);
  EXPECT_NEAR(definition_from_wkt(grads).parameter(kLat0), -90 * kDegree, 1e-15);
  const Definition own = definition_from_wkt(
      projcs(R"(PROJECTION["Polar_Stereographic"],PARAMETER["scale_factor",0.994],)"
             R"(PARAMETER["latitude_of_origin",-100,UNIT["grad",0.01570796326794897]])"));
  EXPECT_EQ(own.method, 9810);
  EXPECT_NEAR(own.parameter(kLat0), -90 * kDegree, 1e-15);
  // Web maps have a name of their own in PROJ's extension alone, or by their code.
  const std::string web = R"(PROJECTION["Mercator_1SP"],PARAMETER["scale_factor",1])";
  EXPECT_EQ(definition_from_wkt(projcs(web)).method, 9804);
  EXPECT_EQ(definition_from_wkt(projcs(web + R"(,EXTENSION["PROJ4","+proj=merc"])")).method, 9804);
  EXPECT_EQ(definition_from_wkt(projcs(web + R"(,EXTENSION["PROJ4","+nadgrids=@null"])")).method,
            1024);
  EXPECT_EQ(definition_from_wkt(projcs(web + R"(,AUTHORITY["EPSG","3857"])")).method, 1024);
}

TEST(Wkt, Version2HasItsUnitsWhereItLikes) {
  const auto geographic = [](const std::string& meridian, const std::string& rest) {
    return definition_from_wkt(
        R"(GEODCRS["g",DATUM["d",ELLIPSOID["s",6378249.2,293.4660212936]],)" + meridian +
        ",CS[ellipsoidal,2]," + rest + "]");
  };
  // A meridian without a unit has that of the system's angles: 2.5969213 grads.
  const double paris = 2.33722917 * kDegree;
  for (const char* rest :
       {R"(AXIS["lat",north],AXIS["lon",east],ANGLEUNIT["grad",0.01570796326794897])",
        R"(AXIS["lat",north,ANGLEUNIT["grad",0.01570796326794897]],AXIS["lon",east])"}) {
    const Definition grads = geographic(R"(PRIMEM["Paris",2.5969213])", rest);
    EXPECT_NEAR(grads.datum.meridian.longitude, paris, 1e-15) << rest;
    EXPECT_EQ(grads.axes, "NE");
    EXPECT_NEAR(grads.unit.factor, kPi / 200, 1e-17);
  }
  const Definition own =
      geographic(R"(PRIMEM["Paris",2.33722917,ANGLEUNIT["degree",0.0174532925199433]])",
                 R"(AXIS["lat",north],AXIS["lon",east],ANGLEUNIT["grad",0.01570796326794897])");
  EXPECT_NEAR(own.datum.meridian.longitude, paris, 1e-15);
  const Definition none = geographic(R"(PRIMEM["Paris",2.33722917])", R"(ID["EPSG",4807])");
  EXPECT_NEAR(none.datum.meridian.longitude, paris, 1e-15);
  EXPECT_EQ(none.unit.name, "degree");
  EXPECT_EQ(none.axes, "EN");
  // A height's unit is none of the angles'.
  const Definition solid = definition_from_wkt(
      R"(GEOGCRS["g",DATUM["d",ELLIPSOID["s",6378137,298.25]],CS[ellipsoidal,3],)"
      R"(LENGTHUNIT["foot",0.3048],ANGLEUNIT["grad",0.01570796326794897]])");
  EXPECT_EQ(solid.kind, SystemKind::geographic3d);
  EXPECT_EQ(solid.axes, "ENU");
  EXPECT_EQ(definition_from_wkt(R"(GEOGCRS["g",DATUM["d",ELLIPSOID["s",6378137,298.25]],)"
                                R"(CS[ellipsoidal,3],AXIS["lat",north],AXIS["lon",east]])")
                .axes,
            "NEU");
  EXPECT_EQ(solid.unit.name, "grad");
  // Geocentric ones, with a unit at the axes or none at all.
  const auto geocentric = [](const std::string& rest) {
    return definition_from_wkt(
        R"(GEODETICCRS["g",DATUM["d",ELLIPSOID["s",6378137,298.25]],CS[Cartesian,3])" + rest + "]");
  };
  EXPECT_EQ(geocentric("").kind, SystemKind::geocentric);
  EXPECT_EQ(geocentric("").unit.factor, 1);
  EXPECT_EQ(geocentric(R"(,AXIS["X",geocentricX,LENGTHUNIT["km",1000]])").unit.factor, 1000);
  EXPECT_EQ(geocentric(R"(,LENGTHUNIT["km",1000])").axes, "XYZ");
  // A box without a name is an area of use.
  const Definition box = definition_from_wkt(
      R"(GEOGRAPHICCRS["g",DATUM["d",ELLIPSOID["s",6378137,298.25]],CS[],BBOX[-10,170,5,-170]])");
  EXPECT_EQ(box.area, "as given");
  EXPECT_EQ(box.west, 170);
  EXPECT_EQ(box.east, -170);
  EXPECT_EQ(box.south, -10);
  EXPECT_EQ(box.north, 5);
  // The unit of a plane at its axes; without one metres.
  const auto plane = [](const std::string& rest) {
    return definition_from_wkt(
        R"(PROJECTEDCRS["p",BASEGEOGCRS["g",DATUM["d",ELLIPSOID["s",6378137,298.25]]],)"
        R"(CONVERSION["c",METHOD["Transverse Mercator"],PARAMETER["False easting",500]],)"
        R"(CS[Cartesian,2])" +
        rest + "]");
  };
  EXPECT_EQ(plane(R"(,AXIS["E",east,LENGTHUNIT["km",1000]],AXIS["N",north])").parameter(kX0), 5e5);
  EXPECT_EQ(plane("").parameter(kX0), 500);
  EXPECT_EQ(definition_from_wkt(R"(VERTICALCRS["h",VDATUM["v"],CS[vertical,1],)"
                                R"(AXIS["H",up,LENGTHUNIT["foot",0.3048]]])")
                .vertical_unit.factor,
            0.3048);
  EXPECT_EQ(definition_from_wkt(R"(VERTCRS["h",CS[vertical,1],AXIS["H",up]])").vertical_unit.factor,
            1);
}

// A bound system as other programs write it.
TEST(Wkt, BoundSystems) {
  const std::string source =
      R"(GEOGCRS["g",DATUM["d",ELLIPSOID["s",6377397.155,299.1528128]],CS[ellipsoidal,2]])";
  const std::string wgs84 =
      R"(GEOGCRS["WGS 84",DATUM["World Geodetic System 1984",ELLIPSOID["WGS 84",6378137,)"
      R"(298.257223563]],CS[ellipsoidal,2]])";
  const auto bound = [&](const std::string& target, const std::string& way) {
    return "BOUNDCRS[SOURCECRS[" + source + "]," + target + "ABRIDGEDTRANSFORMATION[\"t\"" + way +
           "]]";
  };
  const std::string to_wgs84 = "TARGETCRS[" + wgs84 + "],";
  const auto shift_of = [&](const std::string& way) {
    return definition_from_wkt(bound(to_wgs84, way)).datum.to_wgs84.value();
  };
  // By the names of the parameters, by their codes, in other units.
  EXPECT_EQ(
      shift_of(R"(,METHOD["Geocentric translations"],)"
               R"(PARAMETER["X-axis translation",598.1],)"
               R"(PARAMETER["Y-axis translation",73.7],PARAMETER["dz",418.2,ID["EPSG",8607]])"),
      (std::array<double, 7>{598.1, 73.7, 418.2}));
  const auto seven =
      shift_of(R"(,METHOD["Position Vector transformation"],)"
               R"(PARAMETER["X-axis translation",0.5981,LENGTHUNIT["km",1000]],)"
               R"(PARAMETER["X-axis rotation",1.5],)"
               R"(PARAMETER["Z-axis rotation",-2,ANGLEUNIT["arc-second",4.84813681109536E-06]],)"
               R"(PARAMETER["Scale difference",6.7,SCALEUNIT["ppm",1e-6]])");
  EXPECT_NEAR(seven[0], 598.1, 1e-12);
  EXPECT_EQ(seven[3], 1.5);
  EXPECT_NEAR(seven[5], -2, 1e-14);
  EXPECT_NEAR(seven[6], 6.7, 1e-9);
  for (const char* scale : {"1.0000067", "1.0000067,SCALEUNIT[\"unity\",1]", "6.7e-6"}) {
    EXPECT_NEAR(
        shift_of(R"(,METHOD["Position Vector transformation"],PARAMETER["Scale difference",)" +
                 std::string(scale) + "]")[6],
        6.7, 1e-9)
        << scale;
  }
  const std::string method = R"(,METHOD["Position Vector transformation"])";
  expect_wkt_refused(bound(to_wgs84, method + R"(,PARAMETER["Scale difference",6.7])"),
                     "no scale near one");
  expect_wkt_refused(bound(to_wgs84, method + R"(,PARAMETER["tilt",3])"),
                     "\"tilt\" is none of the seven");
  expect_wkt_refused(bound(to_wgs84, method + R"(,PARAMETER["x",3,ID["EPSG",8617]])"),
                     "\"x\" is none of the seven");
  expect_wkt_refused(bound(to_wgs84, method + R"(,PARAMETER["x",3,ID["EPSG",8604]])"),
                     "\"x\" is none of the seven");
  const std::string realised =
      R"t(TARGETCRS[GEOGCRS["WGS 84 (G1762)",DATUM["World Geodetic System 1984 (G1762)",)t"
      R"(ELLIPSOID["WGS 84",6378137,298.257223563]],CS[ellipsoidal,2]]],)";
  EXPECT_TRUE(definition_from_wkt(bound(realised, method)).datum.to_wgs84);
  // By another name, but of that datum.
  const std::string named =
      R"(TARGETCRS[GEOGCRS["mine",DATUM["d",ELLIPSOID["e",6378137,298.257223563],)"
      R"(ID["EPSG",6326]],CS[ellipsoidal,2]]],)";
  EXPECT_TRUE(definition_from_wkt(bound(named, method)).datum.to_wgs84);
  // To another system the figures would be another's.
  expect_wkt_refused(bound("TARGETCRS[" + source + "],", method), "TARGETCRS is g and not WGS 84");
  expect_wkt_refused(bound("TARGETCRS[],", method), "TARGETCRS is empty");
  expect_wkt_refused(bound("", method), "BOUNDCRS has no TARGETCRS");
  expect_wkt_refused("BOUNDCRS[SOURCECRS[]]", "SOURCECRS is empty");
  expect_wkt_refused("BOUNDCRS[SOURCECRS[\"x\"]]", "describes a x");
  // Beside heights it is a horizontal part like another.
  const Definition compound = definition_from_wkt(
      "COMPOUNDCRS[\"c\"," + bound(to_wgs84, method + R"(,PARAMETER["X-axis translation",5])") +
      R"(,VERTCRS["h",VDATUM["v"],CS[vertical,1]]])");
  EXPECT_EQ(compound.kind, SystemKind::compound);
  EXPECT_EQ((*compound.datum.to_wgs84)[0], 5);
}

TEST(Wkt, FilesBeginAndEndInTheirOwnWays) {
  EXPECT_EQ(definition_from_wkt("\xEF\xBB\xBF" + kGeogcs + "\r\n").name, "x");
  EXPECT_EQ(definition_from_wkt(kGeogcs + " \t" + std::string(1, '\0')).name, "x");
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

// What has no name is called unknown, what has no code has no identifier.
TEST(Wkt, WhatHasNoName) {
  Definition bare;
  bare.datum.ellipsoid = {"", 0, 6371000, 0};
  bare.datum.meridian = {"", 0, 0.1 * kDegree};
  bare.datum.to_wgs84 = {1, 2, 3, 0.5, 0, -0.25, 6};
  bare.unit = {"", 0, kDegree};
  bare.axes = "NE";
  EXPECT_EQ(wkt_from_definition(bare, Wkt::wkt1),
            R"(GEOGCS["unknown",DATUM["unknown",SPHEROID["unknown",6371000,0],)"
            R"(TOWGS84[1,2,3,0.5,0,-0.25,6]],PRIMEM["unknown",0.1],)"
            R"(UNIT["unknown",0.0174532925199433],AXIS["Latitude",NORTH],AXIS["Longitude",EAST]])");
  EXPECT_EQ(wkt_from_definition(bare, Wkt::esri),
            R"(GEOGCS["GCS_unknown",DATUM["D_unknown",SPHEROID["unknown",6371000,0]],)"
            R"(PRIMEM["unknown",0.1],UNIT["unknown",0.0174532925199433]])");
  Definition plane = bare;
  plane.datum.to_wgs84.reset();
  plane.kind = SystemKind::projected;
  plane.method = 9807;
  plane.unit = {"", 0, 0.3};
  plane.axes = "WSU";
  const std::string text = wkt_from_definition(plane, Wkt::wkt2);
  EXPECT_EQ(text.substr(0, 51), R"(PROJCRS["unknown",BASEGEOGCRS["unknown",DATUM["unkn)");
  EXPECT_NE(text.find(R"(,CONVERSION["unnamed",METHOD["Transverse Mercator",ID["EPSG",9807]],)"),
            std::string::npos);
  EXPECT_NE(text.find(R"t(,CS[Cartesian,2],AXIS["(E)",west,ORDER[1],LENGTHUNIT["unknown",0.3]],)t"
                      R"t(AXIS["(N)",south,ORDER[2],LENGTHUNIT["unknown",0.3]]])t"),
            std::string::npos)
      << text;
  Definition height;
  height.kind = SystemKind::vertical;
  height.vertical_name = "Height of mine";
  height.axes = "U";
  EXPECT_EQ(wkt_from_definition(height, Wkt::wkt2),
            R"(VERTCRS["Height of mine",VDATUM["Height of mine"],CS[vertical,1],)"
            R"t(AXIS["gravity-related height (H)",up,LENGTHUNIT["metre",1]]])t");
  EXPECT_EQ(wkt_from_definition(height, Wkt::esri),
            R"(VERTCS["Height_of_mine",VDATUM["Height_of_mine"],PARAMETER["Vertical_Shift",0.0],)"
            R"(PARAMETER["Direction",1.0],UNIT["Meter",1]])");
}

// Names of .prj files have letters and digits of any script, and one underscore for all else.
TEST(Wkt, NamesOfPrjFiles) {
  const std::pair<const char*, const char*> names[] = {
      {"  (a-z) {Z} 0/9 ", "a_z_Z_0_9"},    {"R\u00E9union 1947", "R\u00E9union_1947"},
      {"NAD83(CSRS)v6", "NAD83_CSRS_v6"},   {"a + b", "a_+_b"},
      {"[at@sign~tilde`", "at_sign_tilde"}, {"-", ""},
  };
  for (const auto& [name, written] : names) {
    Definition definition = definition_from_wkt(projcs(R"(PROJECTION["Transverse_Mercator"])"));
    definition.name = name;
    const std::string text = wkt_from_definition(definition, Wkt::esri);
    EXPECT_EQ(text.substr(0, text.find(',')), "PROJCS[\"" + std::string(written) + "\"") << name;
  }
}

// What a .prj file says is written back as it stood.
TEST(Wkt, PrjFilesThereAndBack) {
  const std::string files[] = {
      R"(GEOGCS["GCS_Mine",DATUM["D_Mine",SPHEROID["Own_1",6378000,300]],PRIMEM["Greenwich",0],)"
      R"(UNIT["Degree",0.0174532925199433]])",
      R"(GEOGCS["GCS_WGS_1984",DATUM["D_WGS_1984",SPHEROID["WGS_84",6378137,298.257223563]],)"
      R"(PRIMEM["Greenwich",0],UNIT["Degree",0.0174532925199433]])"};
  for (const std::string& file : files) {
    EXPECT_EQ(wkt_from_definition(definition_from_wkt(file), Wkt::esri), file);
  }
}

TEST(Wkt, MercatorOfPrjFiles) {
  const auto written = [](double rf, double k0) {
    Definition definition;
    definition.name = "m";
    definition.kind = SystemKind::projected;
    definition.datum.ellipsoid = {"", 0, 6371000, rf};
    definition.method = 9804;
    definition.parameters = {{kK0, k0}};
    definition.axes = "EN";
    return definition_from_wkt(wkt_from_definition(definition, Wkt::esri));
  };
  // On the sphere the scale is the cosine of the parallel of true scale.
  EXPECT_EQ(written(0, 0.5).method, 9805);
  EXPECT_NEAR(written(0, 0.5).parameter(kLat1), 60 * kDegree, 1e-14);
  EXPECT_EQ(written(0, 1).parameter(kLat1), 0);
  // On the ellipsoid k0 = cos / sqrt(1 - e2 sin2).
  const double e2 = (2 - 1 / 300.0) / 300, parallel = written(300, 0.9).parameter(kLat1);
  EXPECT_NEAR(std::cos(parallel) / std::sqrt(1 - e2 * std::pow(std::sin(parallel), 2)), 0.9, 1e-14);
  expect_refused([&] { written(300, 1.1); }, "no Mercator with a scale above one, which m has.");
  // Version 1 names the latitude of origin where it is not the equator.
  Definition odd = definition_from_proj("+proj=merc +lat_0=0 +k=0.9 +R=6371000");
  EXPECT_EQ(wkt_from_definition(odd, Wkt::wkt1).find("latitude_of_origin"), std::string::npos);
  odd.parameters[0].value = 10 * kDegree;
  EXPECT_NE(wkt_from_definition(odd, Wkt::wkt1).find(R"(PARAMETER["latitude_of_origin",10])"),
            std::string::npos);
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

// One name for several methods: what is given beside it tells.
TEST(ProjText, OneNameForSeveralMethods) {
  struct Case {
    const char* text;
    int method;
    int parameter;
    double value;  // degrees where it is an angle
  };
  constexpr Case kCases[] = {
      {"+proj=etmerc +lon_0=9", 9807, kLon0, 9},
      {"+proj=tmerc +axis=wsu +lon_0=29", 9808, kLon0, 29},
      {"+proj=tmerc +axis=WSU +lon_0=29", 9808, kLon0, 29},
      {"+proj=lcc +lat_1=46 +k_0=0.99", 9801, kLat0, 46},
      {"+proj=lcc +lat_1=46 +lat_0=46 +k=0.99", 9801, kK0, 0.99},
      {"+proj=lcc +lat_1=46 +lat_0=45 +k_0=0.99", 1102, kLat0, 46},
      {"+proj=lcc +lat_1=46 +lat_0=45", 9802, kLat2, 46},
      {"+proj=lcc +lat_1=46 +lat_2=46 +lat_0=46", 9801, kLat0, 46},
      {"+proj=lcc +lat_1=44 +lat_2=46 +k_0=1.5", 1051, kEllipsoidScaling, 1.5},
      {"+proj=lcc +lat_1=44 +lat_2=46 +k=1", 9802, kLat2, 46},
      {"+proj=lcc +lat_1=46 +axis=wnu", 9826, kLat0, 46},
      {"+proj=lcc +lat_1=46 +axis=nwu", 9826, kLat0, 46},
      {"+proj=lcc +lat_1=46 +lat_2=48 +axis=wnu", 9802, kLat2, 48},
      {"+proj=merc +k=0.99", 9804, kK0, 0.99},
      {"+proj=merc +lat_ts=0", 9804, kK0, 1},
      {"+proj=merc +lat_ts=0 +k=1", 9804, kK0, 1},
      {"+proj=merc +lat_ts=-41", 9805, kLat1, -41},
      {"+proj=webmerc", 1024, kLon0, 0},
      // Of web maps only a sphere of WGS 84's axis without a grid.
      {"+proj=merc +a=6378137 +b=6378137 +nadgrids=@null", 1024, kLon0, 0},
      {"+proj=merc +datum=WGS84 +a=6378137 +b=6378137 +nadgrids=@null", 1024, kLon0, 0},
      {"+proj=merc +a=6378137 +b=6378137", 9804, kLon0, 0},
      {"+proj=merc +a=6378137 +b=6378137 +nadgrids=x.gsb", 9804, kLon0, 0},
      {"+proj=merc +a=6378137 +nadgrids=@null", 9804, kLon0, 0},
      {"+proj=merc +R=6378137 +nadgrids=@null", 9804, kLon0, 0},
      {"+proj=merc +a=6370997 +b=6370997 +nadgrids=@null", 9804, kLon0, 0},
      {"+proj=merc +a=6378137 +b=6356752 +nadgrids=@null", 9804, kLon0, 0},
      {"+proj=omerc +lonc=9 +alpha=30", 9815, kRectifiedAngle, 30},
      {"+proj=omerc +lonc=9 +alpha=30 +gamma=31 +no_uoff", 9812, kRectifiedAngle, 31},
      {"+proj=omerc +lonc=9 +alpha=30 +no_off", 9812, kAzimuth, 30},
      {"+proj=omerc +lonc=9 +alpha=30 +no_uoff=F", 9815, kAzimuth, 30},
      {"+proj=omerc +lon_1=1 +lat_1=2 +lon_2=3 +lat_2=4", kTwoPointOblique, kLongitudeOfSecondPoint,
       3},
      {"+proj=omerc +lon_1=1 +lon_2=3 +lat_2=4", kTwoPointOblique, kLongitudeOfFirstPoint, 1},
      {"+proj=stere +lat_0=90 +lat_ts=70", 9829, kLatTrue, 70},
      {"+proj=stere +lat_0=-90 +lat_ts=-90", 9810, kLat0, -90},
      {"+proj=bonne +lat_1=45", 9827, kLat0, 45},
      {"+proj=bonne +lat_1=45 +axis=wsu", 9828, kLat0, 45},
      {"+proj=cass +lat_0=10", 9806, kLat0, 10},
      {"+proj=cass +lat_0=10 +hyperbolic", 9833, kLat0, 10},
      {"+proj=aeqd +lat_0=10 +guam", 9831, kLat0, 10},
      {"+proj=aeqd +lat_0=10 +guam=f", kAzimuthalEquidistant, kLatC, NAN},
      {"+proj=ortho +lat_0=10", 9840, kLat0, 10},
      {"+proj=utm +zone=60", 9807, kLon0, 177},
      {"+proj=utm +zone=1 +south=f", 9807, kY0, 0},
      {"+proj=ups", 9810, kK0, 0.994},
      // What Krovak is by itself: 49 30 N, 24 50 E, a cone whose axis is 30 17 17.30311 from the
      // pole, 78 30 N on it.
      {"+proj=krovak", 1041, kLatC, 49.5},
      {"+proj=krovak", 1041, kLonOrigin, 24 + 50 / 60.0},
      {"+proj=krovak", 1041, kColatitude, 30 + 17 / 60.0 + 17.30311 / 3600},
      {"+proj=krovak +axis=swu", 9819, kPseudoScale, 0.9999},
      {"+proj=krovak +lat_0=50 +lon_0=25 +alpha=30 +k_0=1", 1041, kPseudoParallel, 78.5},
      {"+proj=mod_krovak", 1043, kLatC, 49.5},
      {"+proj=mod_krovak +axis=swu", 1042, kLatC, 49.5},
  };
  for (const Case& c : kCases) {
    const Definition read = definition_from_proj(c.text);
    EXPECT_EQ(read.method, c.method) << c.text;
    if (std::isnan(c.value)) continue;
    const bool angle = parameter_kind(c.parameter)->quantity == Quantity::angle;
    EXPECT_NEAR(read.parameter(c.parameter, NAN), c.value * (angle ? kDegree : 1), 1e-15) << c.text;
  }
  EXPECT_EQ(definition_from_proj("+proj=tmerc +axis=end").axes, "EN");
  for (const char* name : {"longlat", "latlong", "lonlat", "latlon"}) {
    EXPECT_EQ(definition_from_proj("+title=mine +proj=" + std::string(name)).name, "mine");
    EXPECT_EQ(definition_from_proj("+axis=neu +proj=" + std::string(name)).axes, "NE");
  }
  EXPECT_EQ(definition_from_proj("+proj=cart +units=km").unit.factor, 1000);
}

TEST(ProjText, EllipsoidsUnitsAndMeridians) {
  const auto ellipsoid = [](const std::string& words) {
    return definition_from_proj("+proj=longlat " + words).datum.ellipsoid;
  };
  EXPECT_EQ(ellipsoid("").inverse_flattening, 298.257222101);
  EXPECT_EQ(ellipsoid("+ellps=EPSG:7001").a, 6377563.396);
  EXPECT_EQ(ellipsoid("+a=6378137").inverse_flattening, 0);
  EXPECT_EQ(ellipsoid("+a=6378137 +b=6378137").inverse_flattening, 0);
  EXPECT_EQ(ellipsoid("+R=6371000").inverse_flattening, 0);
  // A flattening that no double tells from zero.
  EXPECT_EQ(ellipsoid("+a=6378137 +es=1e-17").inverse_flattening, 0);
  EXPECT_EQ(ellipsoid("+a=6378137 +f=1e-320").inverse_flattening, 0);
  EXPECT_EQ(ellipsoid("+a=6378137 +f=0.003125").inverse_flattening, 320);
  for (const char* size : {"+a=0", "+R=0", "+a=-5", "+R=-5 +rf=300"}) {
    expect_proj_refused("+proj=longlat " + std::string(size), "semi-major axis must be above zero");
  }
  // A shape alone is no ellipsoid.
  for (const char* shape : {"b=6356752", "rf=298", "f=0.003", "es=0.0066"}) {
    expect_proj_refused("+proj=longlat +" + std::string(shape), "needs the semi-major axis +a");
  }
  expect_proj_refused("+proj=longlat +a=6378137 +b=0", "+b must be above zero");
  expect_proj_refused("+proj=longlat +a=6378137 +f=-0.003", "inverse flattening must be 3 or more");
  const auto unit = [](const std::string& words) {
    return definition_from_proj("+proj=tmerc " + words).unit;
  };
  EXPECT_EQ(unit("+to_meter=1200/3937").factor, 1200.0 / 3937);
  EXPECT_EQ(unit("+units=m +to_meter=1").code, 9001);
  EXPECT_EQ(unit("+units=us-ft").code, 9003);
  EXPECT_EQ(unit("+units=us-ft +to_meter=0.304800609601").code, 0);
  expect_proj_refused("+proj=tmerc +units=km +to_meter=1", "two different units");
  expect_proj_refused("+proj=tmerc +to_meter=1/0", "above zero");
  expect_proj_refused("+proj=tmerc +to_meter=-1", "above zero");
  const auto meridian = [](const std::string& pm) {
    return definition_from_proj("+proj=longlat +pm=" + pm).datum.meridian.longitude / kDegree;
  };
  EXPECT_NEAR(meridian("-9.131906111111"), -9.131906111111, 1e-14);
  EXPECT_NEAR(meridian("9d7'54.862\"W"), meridian("lisbon"), 1e-13);
  expect_proj_refused("+proj=longlat +pm=361", "+pm is beyond a whole turn");
  // A datum brings its ellipsoid; a grid is told, "@null" is none.
  const Definition bessel =
      definition_from_proj("+proj=longlat +datum=potsdam +ellps=bessel +nadgrids=beta.gsb");
  EXPECT_EQ(bessel.datum.code, 6314);
  EXPECT_EQ(bessel.base_code, 4314);
  EXPECT_NE(bessel.datum.name.find(" with beta.gsb"), std::string::npos);
  for (const char* datum :
       {"NAD27 +ellps=clrk66", "NAD83 +ellps=GRS80", "OSGB36 +ellps=airy", "ire65 +ellps=mod_airy",
        "nzgd49 +ellps=intl",
        "WGS84 +a=6378137 +rf="
        "298.257223563",
        "carthage +ellps=clrk80ign", "GGRS87 +ellps=GRS80", "hermannskogel +ellps=bessel",
        "WGS84 +a=6378137 +b=6356752.314245179"}) {
    EXPECT_NE(definition_from_proj("+proj=longlat +datum=" + std::string(datum)).datum.code, 0);
  }
  expect_proj_refused("+proj=longlat +datum=WGS84 +ellps=bessel", "not that of +datum=WGS84");
  expect_proj_refused("+proj=longlat +datum=NAD83 +R=6371000", "not that of +datum=NAD83");
  expect_proj_refused("+proj=merc +datum=WGS84 +a=6378137 +b=6378137", "not that of +datum=WGS84");
  EXPECT_EQ(definition_from_proj("+proj=longlat +a=5 +nadgrids=@null").datum.name,
            "unknown datum on an ellipsoid");
}

// +init stands for a system of the registry, and for nothing else.
TEST(ProjText, RegistryCodes) {
  EXPECT_EQ(definition_from_proj("+init=epsg:2154").code, 2154);
  EXPECT_EQ(definition_from_proj("+init=EPSG:2154 +no_defs +type=crs").code, 2154);
  // As some programs write it: the code, and behind it what it stands for.
  EXPECT_EQ(definition_from_proj("+init=epsg:4326 +proj=longlat +datum=WGS84 +no_defs "
                                 "+ellps=WGS84 +towgs84=0,0,0")
                .code,
            4326);
  for (const char* none : {"epsg:", "epsg", "epsg:12x", "epsg:99999999999", "mine:5"}) {
    expect_proj_refused("+init=" + std::string(none), "+init names no registry code");
  }
  expect_proj_refused("+init=epsg:1", "no coordinate system EPSG:1 ");
  expect_proj_refused("+init=epsg:2154 +units=us-ft", "+units is not known here");
  expect_proj_refused("+init=epsg:2154 +datum=NAD27", "+datum is not known here");
}

// Methods whose namesake of PROJ is another, on the sphere or on the ellipsoid alone.
TEST(ProjText, WritesOnlyWhatIsTheSame) {
  const auto written = [](double rf, int method, std::vector<ParameterValue> parameters) {
    Definition definition;
    definition.name = "p";
    definition.kind = SystemKind::projected;
    definition.datum.ellipsoid = {"", 0, 6371000, rf};
    definition.method = method;
    definition.parameters = std::move(parameters);
    definition.unit = {"", 0, 0.3};
    definition.axes = "NE";
    return proj_from_definition(definition);
  };
  const std::string tail = " +R=6371000 +to_meter=0.3 +no_defs +type=crs";
  EXPECT_EQ(written(0, 1027, {}), "+proj=laea +lat_0=0 +lon_0=0 +x_0=0 +y_0=0" + tail);
  EXPECT_EQ(written(0, 9834, {}), "+proj=cea +lat_ts=0 +lon_0=0 +x_0=0 +y_0=0" + tail);
  EXPECT_EQ(written(0, 1028, {}), "+proj=eqc +lat_ts=0 +lat_0=0 +lon_0=0 +x_0=0 +y_0=0" + tail);
  EXPECT_EQ(written(300, 1029, {}).substr(0, 20), "+proj=eqc +lat_ts=0 ");
  EXPECT_EQ(written(300, 9807, {{kK0, 0.9996}}),
            "+proj=tmerc +lat_0=0 +lon_0=0 +k_0=0.9996 +x_0=0 +y_0=0 +a=6371000 +rf=300 "
            "+to_meter=0.3 +no_defs +type=crs");
  EXPECT_EQ(written(300, 1130, {{kLatC, kPi / 4}}).substr(0, 23), "+proj=ortho +lat_0=45 +");
  EXPECT_EQ(written(0, kChamberlin, {}).substr(0, 12), "+proj=chamb ");
  EXPECT_EQ(written(300, kLandsat, {{kSatellite, 5}}).substr(0, 18), "+proj=lsat +lsat=5");
  struct Refused {
    double rf;
    int method;
    std::vector<ParameterValue> parameters;
    const char* words;
  };
  const Refused refused[] = {
      {300, 1027, {}, "PROJ takes the ellipsoid's formula"},
      {300, 9834, {}, "PROJ takes the ellipsoid's formula"},
      {300, 1028, {}, "PROJ takes the sphere's formula"},
      {300, kChamberlin, {}, "PROJ takes the sphere's formula"},
      {300, 9832, {}, "azimuthal equidistant is another formula"},
      {300, 9803, {}, "lacks the angle"},
      {300, 1044, {}, "cannot place its false origin"},
      {300, kLandsat, {{kSatellite, 7}}, "Landsat 1 to 5 alone"},
      {300, 1130, {{kAzimuth, 0.1}}, "cannot turn or scale"},
      {300, 1130, {{kLineScale, 1.5}}, "cannot turn or scale"},
      {300, 9824, {}, "PROJ lacks the method"},
      {300, 12345, {}, "The projection method of p (12345) has no form as text."},
  };
  for (const Refused& one : refused) {
    expect_refused([&] { written(one.rf, one.method, one.parameters); }, one.words);
  }
  // With a shift of its own a datum is written by its ellipsoid.
  const auto nad27 = [](const std::string& more) {
    return proj_from_definition(definition_from_proj("+proj=longlat +datum=NAD27" + more));
  };
  EXPECT_EQ(nad27(""), "+proj=longlat +datum=NAD27 +no_defs +type=crs");
  EXPECT_EQ(nad27(" +towgs84=-8,160,176"),
            "+proj=longlat +ellps=clrk66 +towgs84=-8,160,176,0,0,0,0 +no_defs +type=crs");
}

TEST(ProjText, RefusesWhatItDoesNotUnderstand) {
  expect_proj_refused("+step", "pipeline");
  expect_proj_refused("+proj=pipeline", "pipeline");
  expect_proj_refused("+proj=longlat +lat_0=5", "+lat_0 is not known here.");
  expect_proj_refused("+proj=tmerc +k=x", "+k=x is no number");
  expect_proj_refused("+proj=laea +k_0=2", "+k_0 is not known here; Lambert Azimuthal");
  expect_proj_refused("+proj=laea +k=0", "+k is not known here");
  expect_proj_refused("+proj=merc +lat_ts=0 +k_0=2",
                      "+k_0 is not known here; Mercator (variant B)");
  expect_proj_refused("+proj=tmerc +x_0=inf", "no number");
  expect_proj_refused("+proj=tmerc +lon_0=400d", "beyond 360");
  expect_proj_refused("+proj=utm +zone=0", "+zone from 1 to 60");
  expect_proj_refused("+proj=utm +zone=1.5", "+zone from 1 to 60");
  for (const char* axis : {"uen", "eeu", "ewu", "enw", "en", "e{u", "xyz", "enuu"}) {
    expect_proj_refused("+proj=tmerc +axis=" + std::string(axis), "+axis takes e or w and n or s");
  }
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
