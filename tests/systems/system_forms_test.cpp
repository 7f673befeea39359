// The forms of a system's name that other tests do not use, units by name, and the calls of the C
// interface one by one.

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <limits>
#include <string>

#include "tidewater/ellipsoid.hpp"
#include "tidewater/error.hpp"
#include "tidewater/lines.hpp"
#include "tidewater/projection.hpp"
#include "tidewater/system.hpp"
#include "tidewater/systems.h"
#include "tidewater/transformation.hpp"

namespace tidewater::test {

namespace {

// The sentence with which a text is refused; empty where it is taken.
std::string refusal(const std::string& text) {
  try {
    const System system(text);
    return "";
  } catch (const Error& error) {
    return error.what();
  }
}

std::string refusal(const std::string& text, double lon, double lat) {
  try {
    const System system(text, lon, lat);
    return "";
  } catch (const Error& error) {
    return error.what();
  }
}

void expect_refused(const std::string& text, const std::string& because) {
  const std::string sentence = refusal(text);
  EXPECT_NE(sentence.find(because), std::string::npos) << text << ": \"" << sentence << "\"";
}

Point forward(const System& system, double lon, double lat) {
  const auto projection = system.projection();
  EXPECT_TRUE(projection.has_value());
  return projection->forward({lon, lat});
}

}  // namespace

TEST(Units, ByNameAndCode) {
  const Unit metre("metre");
  EXPECT_EQ(metre.name(), "metre");
  EXPECT_EQ(metre.code(), 9001);
  EXPECT_EQ(metre.kind(), Unit::Kind::length);
  EXPECT_EQ(metre.factor(), 1);
  EXPECT_EQ(Unit("EPSG:9003").factor(), 1200.0 / 3937);
  const Unit grad("grad");
  EXPECT_EQ(grad.kind(), Unit::Kind::angle);
  EXPECT_NEAR(grad.factor(), 3.14159265358979323846 / 200, 1e-17);
  const Unit parts("parts per million");
  EXPECT_EQ(parts.kind(), Unit::Kind::scale);
  EXPECT_NEAR(parts.factor(), 1e-6, 1e-21);
  EXPECT_THROW(Unit("no such unit"), Error);
}

TEST(Ellipsoids, SemiMinorAxis) {
  EXPECT_NEAR(Ellipsoid("WGS 84").b(), 6356752.314245, 1e-6);
  EXPECT_EQ(Ellipsoid(6371000, 0).b(), 6371000);
}

TEST(SystemNames, UtmOnAnyDatum) {
  // A pair of datum and zone of the registry is that system.
  EXPECT_EQ(System("utm:31N ED50").code(), 23031);
  // Others are made: the equator at the central meridian is (500 km, 0 or 10,000 km).
  const System tokyo("utm:31S Tokyo");
  EXPECT_EQ(tokyo.code(), 0);
  EXPECT_EQ(tokyo.name(), "Tokyo / UTM zone 31S");
  EXPECT_EQ(tokyo.ellipsoid().name(), "Bessel 1841");
  const Point p = forward(tokyo, 3, 0);
  EXPECT_NEAR(p.x, 500000, 1e-6);
  EXPECT_NEAR(p.y, 1e7, 1e-6);
  // A projected system stands for its base.
  EXPECT_NE(System("utm:31N EPSG:31370").datum().find("Belg"), std::string::npos);
  expect_refused("utm:31N EPSG:5773", "is not a geographic system");
  // One that the registry knows by another name: its SHMG2015 is UTM.
  EXPECT_EQ(System("utm:30S SHGD2015").code(), 7887);
  // Zones count from Greenwich: 3 degrees less the 2.33722917 of Paris.
  const auto parameters = System("utm:31N EPSG:4807").parameters();
  EXPECT_EQ(parameters.at(1).first, "Longitude of natural origin");
  EXPECT_NEAR(parameters.at(1).second, 3 - 2.33722917, 1e-12);
  // Whatever the form of the base.
  EXPECT_EQ(System("utm:31n EPSG:4978").code(), 32631);
  EXPECT_EQ(System("utm:31N EPSG:4979").code(), 32631);
  EXPECT_EQ(System("utm:31S wgs 84").code(), 32731);
  EXPECT_EQ(System("UTM:31s WGS84").code(), 32731);
  EXPECT_THROW(System("utm", 10, 86), Error);
  EXPECT_EQ(System("ups", 10, 86).code(), 5041);
  EXPECT_EQ(System("ups", 10, -86).code(), 5042);
  EXPECT_EQ(System("ups:south").code(), 5042);
  EXPECT_EQ(System("ups:s").code(), 5042);
  EXPECT_EQ(System("ups:N").code(), 5041);
  EXPECT_EQ(System("ups north").code(), 5041);
  expect_refused("ups:X", "must say N or S");
  expect_refused("ups", "must say N or S");
  for (const char* none : {"utm:0N", "utm:61S", "utm:-5N", "utm:99999999999N"}) {
    expect_refused(none, "UTM has zones 1 to 60; \"" + std::string(none) + "\" names another.");
  }
  expect_refused("utm:31", "must say N or S after the zone");
  expect_refused("utm:31X", "must say N or S after the zone");
  expect_refused("utm", "needs a zone, as in \"utm:30N\", or a point");
  // A point that is none tells no zone.
  for (const char* name : {"utm", "ups", "mgrs"}) {
    for (const auto& [lon, lat] : {std::pair{10.0, 95.0},
                                   {10.0, std::numeric_limits<double>::quiet_NaN()},
                                   {std::numeric_limits<double>::infinity(), 10.0}}) {
      const std::string sentence = refusal(name, lon, lat);
      EXPECT_EQ(sentence, "The point that should tell the zone of \"" + std::string(name) +
                              "\" is not on the earth.");
    }
  }
}

TEST(SystemNames, ZonesOfTheMilitaryGrid) {
  EXPECT_EQ(System("mgrs:31U").code(), 32631);
  EXPECT_EQ(System("mgrs:31m").code(), 32731);
  EXPECT_EQ(System("usng:18SUJ2306").code(), 32618);
  EXPECT_EQ(System("mgrs:z").code(), 5041);
  EXPECT_EQ(System("mgrs:A").code(), 5042);
  EXPECT_EQ(System("mgrs", 3, -10).code(), 32731);
  EXPECT_EQ(System("mgrs", 3, 85).code(), 5041);
  EXPECT_EQ(System("mgrs", 3, -85).code(), 5042);
  for (const char* none : {"mgrs:0U", "mgrs:61U", "mgrs:31A", "mgrs:U"}) {
    expect_refused(none, "is no grid reference");
  }
  expect_refused("mgrs", "is a text form of positions");
}

TEST(SystemNames, GeocentricSystems) {
  EXPECT_EQ(System("geocentric:EPSG:4978").code(), 4978);
  EXPECT_EQ(System("geocentric").name(), "WGS 84 geocentric");
  const System rgf93("geocentric:EPSG:2154");
  EXPECT_EQ(rgf93.kind(), SystemKind::geocentric);
  EXPECT_EQ(rgf93.axes(), "XYZ");
  EXPECT_EQ(rgf93.datum(), System("EPSG:4171").datum());
  expect_refused("geocentric:EPSG:5773", "is not a geographic system");
}

TEST(SystemNames, OfTheRegistry) {
  EXPECT_EQ(System("crs84").code(), 4326);
  EXPECT_EQ(System("Web Mercator").code(), 3857);
  EXPECT_EQ(System("urn:ogc:def:crs:EPSG::2154").code(), 2154);
  EXPECT_EQ(System("epsg::2154").code(), 2154);
  EXPECT_EQ(System(" 2154\t\r\n").code(), 2154);
  EXPECT_EQ(System("EPSG:2154+5720").kind(), SystemKind::compound);
  // All words of one system alone.
  EXPECT_EQ(System("jordan tm").code(), 3066);
  expect_refused("Lambert zone", "could be several coordinate systems: EPSG:27571 NTF (Paris)");
  expect_refused("lambrt 93", "; the nearest names are \"RGF93 v1 / Lambert-93\", \"RGF93 v2");
  expect_refused("qqqqqqqqqqqq", "There is no coordinate system \"qqqqqqqqqqqq\".");
  expect_refused("", "is empty");
  expect_refused("EPSG:2147483648", "There is no coordinate system \"EPSG:2147483648\"");
  expect_refused("EPSG:0", "There is no coordinate system \"EPSG:0\".");
  expect_refused("EPSG:-2154", "There is no coordinate system \"EPSG:-2154\".");
  EXPECT_EQ(System("EPSG 2154").code(), 2154);
  expect_refused("EPS{:2154", "There is no coordinate system");
  expect_refused("EPSG:1", "There is no coordinate system EPSG:1 in the registry.");
  expect_refused("EPSG:27582",
                 "The registry has withdrawn EPSG:27582, NTF (Paris) / France II; EPSG:27572 takes "
                 "its place.");
  expect_refused("EPSG:2008", "The registry has withdrawn EPSG:2008, NAD27(CGQ77) / SCoPQ zone 2.");
  // Heights stand beside two axes alone, and both parts are codes.
  for (const char* none : {"EPSG:4978+5773", "EPSG:4979+5773", "EPSG:7405+5773"}) {
    expect_refused(none, "must be a horizontal system and a vertical one");
  }
  expect_refused("EPSG:2154+height", "There is no coordinate system");
  expect_refused("height+5720", "There is no coordinate system");
}

TEST(SystemNames, ObliqueStatePlaneZone) {
  // Alaska 1 of NOS NGS 5 (1989), appendix A, which the registry has as a system of its own.
  const System alaska("spcs83:5001");
  EXPECT_NE(alaska.method().find("Oblique Mercator"), std::string::npos);
  const Point p = forward(alaska, -134, 55), q = forward(System("EPSG:26931"), -134, 55);
  // The registry's azimuth is rounded to 1e-4 seconds, 0.7 mm at this distance.
  EXPECT_NEAR(p.x, q.x, 1e-3);
  EXPECT_NEAR(p.y, q.y, 1e-3);
  expect_refused("spcs83:9999", "There is no state plane zone \"9999\" in the system of 1983.");
  expect_refused("spcs27:9999", "There is no state plane zone \"9999\" in the system of 1927.");
  for (const char* none : {"spcs27", "spcs27:", "spcs83:29x0", "spcs83:29 0", "spcs83:(2900"}) {
    expect_refused(none, "There is no state plane zone \"");
  }
}

TEST(SystemNames, Definitions) {
  const System plain("transverse mercator lon0=9 k0=0.9996 x0=500000 datum=ED50");
  const Point p = forward(plain, 9, 0);
  EXPECT_NEAR(p.x, 500000, 1e-6);
  EXPECT_NEAR(p.y, 0, 1e-6);
  EXPECT_EQ(plain.ellipsoid().name(), "International 1924");
  EXPECT_EQ(plain.axes(), "EN");
  EXPECT_EQ(System("transverse mercator lon0=9 ellps=GRS80 axes=NE").axes(), "NE");
  expect_refused("transverse mercator lon0=9 ellps=GRS80 axes=XY", "two letters of E, N, W and S");
  expect_refused("transverse mercator lon0=9 ellps=GRS80 axes=ENU", "two letters of E, N, W and S");
  const System feet("transverse mercator lon0=9 ellps=GRS80 units=EPSG:9003");
  EXPECT_EQ(feet.unit_factor(), 1200.0 / 3937);
  expect_refused("transverse mercator lon0=9 ellps=GRS80 units=degree", "is no unit of length");
  expect_refused("no such method lon0=9 ellps=GRS80", "there is no projection method");
  EXPECT_EQ(System("geographic ellps=GRS80 pm=2.5").meridian().longitude(), 2.5);
  // 2.5969213 grads
  EXPECT_NEAR(System("geographic ellps=GRS80 pm=Paris").meridian().longitude(), 2.5969213 * 0.9,
              1e-12);
  // The whole turn is the last longitude of a meridian.
  EXPECT_EQ(System("geographic ellps=GRS80 pm=-360").meridian().longitude(), -360);
  expect_refused("geographic ellps=GRS80 pm=360.5", "pm is beyond a whole turn");
  expect_refused("transverse mercator lon0=9 ellps=GRS80 axes=EE", "one along each direction");
  expect_refused("transverse mercator lon0=9 ellps=GRS80 axes=NS", "one along each direction");
  const System own("longlat name=\"my own\" a=6378137 rf=298");
  EXPECT_EQ(own.name(), "my own");
  EXPECT_EQ(own.ellipsoid().inverse_flattening(), 298);
  EXPECT_EQ(own.datum(), "unknown datum on an ellipsoid");
  EXPECT_EQ(System("latlong a=6378137 b=6378137").ellipsoid().inverse_flattening(), 0);
  EXPECT_EQ(System("geographic a=6378137").ellipsoid().inverse_flattening(), 0);
  // 6378137 / 21385
  EXPECT_NEAR(System("geographic\r\na=6378137\tb=6356752").ellipsoid().inverse_flattening(),
              298.252840776, 1e-9);
  expect_refused("geographic a=6378137 b=6378138", "inverse flattening must be 3 or more");
  expect_refused("geographic pm=Paris", "it names no datum= and no ellps=");
  expect_refused("geographic datum=EPSG:5773", "\"EPSG:5773\" is not a geographic system");
  expect_refused("geographic datum=\"transverse mercator lon0=3 ellps=GRS80\"",
                 "is not a geographic system");
  expect_refused("geographic ellps=GRS80 colour=red", "\"colour\" is not known here.");
  expect_refused("transverse mercator ellps=GRS80 lat1=3",
                 "\"lat1\" is not known here; Transverse Mercator takes lat0 lon0 k0 x0 y0.");
  expect_refused("transverse mercator lon0=high ellps=GRS80", "\"high\" is no number");
  expect_refused("transverse mercator lon0=inf ellps=GRS80", "\"inf\" is no number");
  expect_refused("transverse mercator lon0=9x ellps=GRS80", "\"9x\" is no number");
  EXPECT_NEAR(forward(System("transverse mercator lon0=+9 ellps=GRS80"), 9, 0).x, 0, 1e-9);
  expect_refused("transverse mercator lon0=9 Lon0=9 ellps=GRS80", "\"lon0\" is given twice");
  expect_refused("transverse lon0=9 mercator ellps=GRS80", "\"mercator\" is no name=value");
  for (const char* seven : {"1,2", "1,2,3,4,5,6,7,8", "1,x,3", "1,2,"}) {
    expect_refused("geographic ellps=GRS80 towgs84=" + std::string(seven),
                   "towgs84 takes three or seven numbers");
  }
  EXPECT_NE(System("geographic ellps=intl towgs84=-87,-98,-121").to_proj().find("-121,0,0,0,0"),
            std::string::npos);
  expect_refused("EPSG:5773+4326", "must be a horizontal system and a vertical one");
  expect_refused("EPSG:4326+4326", "must be a horizontal system and a vertical one");
}

// One name for several methods: what is given tells, by either of the parameters' short names.
TEST(SystemNames, VariantsByWhatIsGiven) {
  const std::pair<const char*, const char*> methods[] = {
      {"lcc lat0=46 k0=0.99", "Lambert Conic Conformal (1SP)"},
      {"lcc lat1=44 lat2=48 lat0=46", "Lambert Conic Conformal (2SP)"},
      {"lcc lat_1=44 lat_2=48 lat_0=46", "Lambert Conic Conformal (2SP)"},
      {"lcc lat1=46 lat0=45", "Lambert Conic Conformal (2SP)"},
      {"lcc lat2=46 lat0=45", "Lambert Conic Conformal (2SP)"},
      {"mercator k0=0.99", "Mercator (variant A)"},
      {"mercator k_0=0.99", "Mercator (variant A)"},
      {"mercator lat1=-41", "Mercator (variant B)"},
      {"polar stereographic lat0=90 k0=0.994", "Polar Stereographic (variant A)"},
      {"polar stereographic lat1=-71", "Polar Stereographic (variant B)"},
      {"polar stereographic lat_ts=-71", "Polar Stereographic (variant B)"},
  };
  for (const auto& [words, method] : methods) {
    EXPECT_EQ(System(std::string(words) + " lon0=3 ellps=WGS84").method(), method) << words;
  }
  // The registry's Antarctic Polar Stereographic, and one parallel for two.
  const System antarctic("polar stereographic lat1=-71 lon0=0 datum=EPSG:4326");
  const Point p = forward(antarctic, 30, -75), q = forward(System("EPSG:3031"), 30, -75);
  EXPECT_NEAR(p.x, q.x, 1e-9);
  EXPECT_NEAR(p.y, q.y, 1e-9);
  const Point one = forward(System("lcc lat1=46 lat0=45 lon0=3 ellps=GRS80"), 5, 47);
  const Point two = forward(System("lcc lat1=46 lat2=46 lat0=45 lon0=3 ellps=GRS80"), 5, 47);
  EXPECT_EQ(one.x, two.x);
  EXPECT_EQ(one.y, two.y);
}

// Longitudes that count westwards and latitudes that count southwards, as the axes say.
TEST(SystemNames, GeographicAxesOfTheOtherDirection) {
  const System utm("+proj=utm +zone=31 +ellps=GRS80");
  const Point east = forward(utm, 2, 45), west = forward(utm, -2, 45);
  for (const auto& [text, lon, expected] :
       {std::tuple{"+proj=longlat +axis=enu +ellps=GRS80", 2, east},
        std::tuple{"+proj=longlat +axis=wnu +ellps=GRS80", 2, west},
        std::tuple{"geographic ellps=GRS80 axes=WN", -2, east}}) {
    TransformationOptions options;
    options.operation = "no shift";
    const Transformation map(System(text), utm, options);
    const Point p = map.forward({static_cast<double>(lon), 45});
    EXPECT_NEAR(p.x, expected.x, 1e-6) << text;
    EXPECT_NEAR(p.y, expected.y, 1e-6) << text;
    EXPECT_NEAR(map.inverse(p).x, lon, 1e-12) << text;
  }
  TransformationOptions own;
  own.operation = "no shift";
  own.own_axes = true;
  const Transformation south(System("+proj=longlat +axis=seu +ellps=GRS80"), utm, own);
  const Point p = south.forward({-45, 2});
  EXPECT_NEAR(p.x, east.x, 1e-6);
  EXPECT_NEAR(p.y, east.y, 1e-6);
}

TEST(SystemNames, ProjStrings) {
  for (const char* text : {"+proj=utm +zone=31 +ellps=GRS80", "proj=utm zone=31 ellps=GRS80",
                           "zone=31 ellps=GRS80 proj=utm", "zone=31 ellps=GRS80 +proj=utm"}) {
    EXPECT_EQ(System(text).method(), "Transverse Mercator") << text;
  }
  // Other names for one ellipsoid: figures by f, e squared, b.
  const double rf = 298.257222101, f = 1 / rf;
  const auto flattening = [](const std::string& words) {
    return System("+proj=longlat +a=6378137 " + words).ellipsoid().inverse_flattening();
  };
  EXPECT_NEAR(flattening("+rf=298.257222101"), rf, 1e-9);
  EXPECT_NEAR(flattening("+f=" + std::to_string(f)), rf, 1e-1);
  EXPECT_NEAR(flattening("+es=0.006694380022903416"), rf, 1e-9);
  EXPECT_EQ(flattening("+es=0"), 0);
  EXPECT_EQ(flattening("+f=0"), 0);
  expect_refused("+proj=longlat +a=6378137 +es=1", "+es must be from zero up to one");
  expect_refused("+proj=longlat +a=6378137 +es=-0.1", "+es must be from zero up to one");
}

TEST(SystemNames, PolarProjString) {
  const Point south = forward(System("+proj=ups +south +ellps=WGS84"), 0, -90);
  EXPECT_NEAR(south.x, 2e6, 1e-6);
  EXPECT_NEAR(south.y, 2e6, 1e-6);
  // Along the meridian of Greenwich y grows in the south and falls in the north.
  EXPECT_GT(forward(System("+proj=ups +south +ellps=WGS84"), 0, -89).y, 2e6);
  EXPECT_LT(forward(System("+proj=ups +ellps=WGS84"), 0, 89).y, 2e6);
}

TEST(SystemNames, SevenParametersInAProjString) {
  const System bessel("geographic ellps=bessel towgs84=598.1,73.7,418.2,0.202,0.045,-2.455,6.7");
  EXPECT_NE(bessel.to_proj().find("+towgs84=598.1,73.7,418.2,0.202,0.045,-2.455,6.7"),
            std::string::npos)
      << bessel.to_proj();
}

TEST(Transformations, AnEnsembleAndItsMemberAreOne) {
  // Within the 2 m that the registry states of the ensemble.
  const Transformation map(System("EPSG:4326"), System("EPSG:9057"));
  EXPECT_EQ(map.target().code(), 9057);
  const Point p = map.forward({7, 51});
  EXPECT_NEAR(p.x, 7, 2e-5);
  EXPECT_NEAR(p.y, 51, 2e-5);
  EXPECT_LE(map.accuracy(), 2);
}

TEST(Transformations, AnAreaMayBeAPoint) {
  TransformationOptions options;
  options.area = Area{"", 2, 47, 2, 47};
  const Transformation map(System("EPSG:4230"), System("EPSG:4326"), options);
  const Point p = map.forward({2, 47});
  EXPECT_GT(std::fabs(p.x - 2), 1e-5);
  EXPECT_LT(std::fabs(p.x - 2), 3e-3);
}

TEST(Lines, OfNoPlaceAreNone) {
  constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
  const Geodesic geodesic(6378137, 1 / 298.257223563);
  EXPECT_EQ(geodesic.f(), 1 / 298.257223563);
  const Rhumb rhumb(6378137, 1 / 298.257223563);
  EXPECT_EQ(rhumb.a(), 6378137);
  for (const auto& [lon1, lat1, lon2, lat2] : {std::array{0.0, 95.0, 1.0, 1.0},
                                               {0.0, 0.0, 1.0, -90.5},
                                               {kNaN, 0.0, 1.0, 1.0},
                                               {0.0, kNaN, 1.0, 1.0},
                                               {0.0, 0.0, kNaN, 1.0},
                                               {0.0, 0.0, 1.0, kNaN}}) {
    EXPECT_TRUE(std::isnan(geodesic.inverse(lon1, lat1, lon2, lat2).length));
    EXPECT_TRUE(std::isnan(rhumb.inverse(lon1, lat1, lon2, lat2).length));
  }
  // A quarter of the equator by a rhumb line.
  const LineCourse course = rhumb.inverse(0, 0, 90, 0);
  EXPECT_NEAR(course.length, 6378137 * 1.5707963267948966, 1e-6);
  EXPECT_NEAR(course.azimuth1, 90, 1e-12);
}

TEST(SystemsC, EveryTextOfASystem) {
  tw_system* system = tw_system_create_at("utm", 3, -10);
  ASSERT_NE(system, nullptr) << tw_last_error();
  EXPECT_EQ(tw_system_code(system), 32731);
  EXPECT_EQ(tw_system_unit_factor(system), 1);
  EXPECT_EQ(tw_system_unit_factor(nullptr), 0);
  char text[2000];
  EXPECT_GT(tw_system_datum(system, text, sizeof text), 0u);
  EXPECT_NE(std::string(text).find("World Geodetic System 1984"), std::string::npos);
  EXPECT_GT(tw_system_method(system, text, sizeof text), 0u);
  EXPECT_STREQ(text, "Transverse Mercator");
  EXPECT_EQ(tw_system_unit(system, text, sizeof text), 5u);
  EXPECT_STREQ(text, "metre");
  EXPECT_EQ(tw_system_axes(system, text, sizeof text), 2u);
  EXPECT_STREQ(text, "EN");
  EXPECT_GT(tw_system_describe(system, text, sizeof text), 0u);
  EXPECT_NE(std::string(text).find("UTM zone 31S"), std::string::npos);
  tw_projection* projection = tw_projection_of(system);
  ASSERT_NE(projection, nullptr);
  double xy[2] = {3, 0};
  const tw_points view = {xy, xy + 1, nullptr, 2};
  EXPECT_EQ(tw_project(projection, 0, 1, &view, &view, nullptr, 1), 0u);
  EXPECT_NEAR(xy[0], 500000, 1e-6);
  EXPECT_NEAR(xy[1], 1e7, 1e-6);
  TWstatus word = 0;
  EXPECT_EQ(tw_project(nullptr, 0, 1, &view, &view, &word, 1), 1u);
  EXPECT_EQ(word, TW_BAD_INPUT);
  tw_projection_destroy(projection);
  tw_system_destroy(system);
  EXPECT_EQ(tw_system_create_at("utm", 3, 89), nullptr);

  tw_system* geographic = tw_system_create("EPSG:4326");
  EXPECT_EQ(tw_projection_of(geographic), nullptr);
  EXPECT_STREQ(tw_last_error(), "The system is not projected.");
  tw_system_destroy(geographic);

  ASSERT_GT(tw_projection_method_count(), 0u);
  EXPECT_GT(tw_projection_method(0, text, sizeof text), 0u);
  EXPECT_EQ(tw_projection_method(tw_projection_method_count(), text, sizeof text), 0u);
}

TEST(SystemsC, CandidatesAndOptions) {
  tw_system* source = tw_system_create("EPSG:4230");
  tw_system* target = tw_system_create("EPSG:4326");
  const double area[4] = {-5, 42, 8, 51};
  tw_transformation_options options = {};
  options.area = area;
  options.grid_folders = "/nowhere\n\n/nor here";
  options.epoch = 2020.5;
  tw_candidates* list = tw_candidates_create(source, target, &options);
  ASSERT_NE(list, nullptr) << tw_last_error();
  const std::size_t count = tw_candidates_count(list);
  ASSERT_GT(count, 2u);
  EXPECT_EQ(tw_candidates_count(nullptr), 0u);
  char steps[200], text[400];
  std::string usable;
  for (std::size_t i = 0; i < count; ++i) {
    EXPECT_GT(tw_candidate_name(list, i, text, sizeof text), 0u) << i;
    tw_candidate_operation(list, i, steps, sizeof steps);
    if (usable.empty() && tw_candidate_missing(list, i, text, sizeof text) == 0) usable = steps;
  }
  EXPECT_GT(tw_candidate_accuracy(list, 0), 0);
  EXPECT_TRUE(std::isnan(tw_candidate_accuracy(list, count)));
  EXPECT_TRUE(std::isnan(tw_candidate_accuracy(nullptr, 0)));
  EXPECT_EQ(tw_candidate_name(list, count, text, sizeof text), 0u);
  tw_candidates_destroy(list);
  EXPECT_EQ(tw_candidates_create(nullptr, target, nullptr), nullptr);

  // The one named is the one taken; its points in radians and in the systems' own axes.
  ASSERT_FALSE(usable.empty());
  options.operation = usable.c_str();
  options.radians = 1;
  options.own_axes = 1;
  tw_transformation* map = tw_transformation_create(source, target, &options);
  ASSERT_NE(map, nullptr) << tw_last_error();
  EXPECT_EQ(tw_transformation_operation(map, text, sizeof text), usable.size());
  EXPECT_EQ(text, usable);
  options.radians = 0;
  options.own_axes = 0;
  tw_transformation* degrees = tw_transformation_create(source, target, &options);
  ASSERT_NE(degrees, nullptr);
  constexpr double kDegree = 3.14159265358979323846 / 180;
  double own[2] = {47 * kDegree, 2 * kDegree}, usual[2] = {2, 47};
  const tw_points own_view = {own, own + 1, nullptr, 2}, view = {usual, usual + 1, nullptr, 2};
  EXPECT_EQ(tw_transform(map, 0, 1, &own_view, &own_view, nullptr, 1), 0u);
  EXPECT_EQ(tw_transform(degrees, 0, 1, &view, &view, nullptr, 1), 0u);
  EXPECT_NEAR(own[0] / kDegree, usual[1], 1e-12);
  EXPECT_NEAR(own[1] / kDegree, usual[0], 1e-12);
  EXPECT_GT(std::fabs(usual[0] - 2), 1e-5);  // the datums differ
  float single[3] = {2, 47, 0};
  const tw_points_f single_view = {single, single + 1, nullptr, 2};
  EXPECT_EQ(tw_transform_f(degrees, 0, 1, &single_view, &single_view, nullptr, 1), 0u);
  EXPECT_NEAR(single[0], usual[0], 1e-5);
  EXPECT_NEAR(single[1], usual[1], 1e-5);
  tw_transformation_destroy(degrees);
  tw_transformation_destroy(map);
  tw_system_destroy(source);
  tw_system_destroy(target);
}

TEST(SystemsC, AnglesLinesAndNames) {
  double degrees = -7;
  EXPECT_EQ(tw_parse_angle("12\xC2\xB0 30' S", 2, 0, &degrees), 1);
  EXPECT_EQ(degrees, -12.5);
  EXPECT_EQ(tw_parse_angle("12,5", 0, 1, &degrees), 1);
  EXPECT_EQ(degrees, 12.5);
  degrees = -7;
  EXPECT_EQ(tw_parse_angle("rubbish", 0, 0, &degrees), 0);
  EXPECT_EQ(degrees, -7);
  EXPECT_STRNE(tw_last_error(), "");

  // A quarter of the equator, by either kind of line.
  for (const int32_t rhumb : {0, 1}) {
    tw_lines* lines = tw_lines_create(rhumb, 6378137, 1 / 298.257223563);
    ASSERT_NE(lines, nullptr);
    const double lon = 10, lat = 0, azimuth = 90, length = 6378137 * 1.5707963267948966;
    double end_lon = 0, end_lat = 7, end_azimuth = 0;
    EXPECT_EQ(
        tw_lines_direct(lines, 1, &lon, &lat, &azimuth, &length, &end_lon, &end_lat, &end_azimuth),
        0u);
    EXPECT_NEAR(end_lon, 100, 1e-9);
    EXPECT_NEAR(end_lat, 0, 1e-9);
    tw_lines_destroy(lines);
  }
  EXPECT_EQ(
      tw_lines_direct(nullptr, 3, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr),
      3u);

  tw_magnetic_model* model = tw_magnetic_model_create("WMM2025", 2025);
  ASSERT_NE(model, nullptr);
  char text[100];
  EXPECT_GT(tw_magnetic_model_name(model, text, sizeof text), 0u);
  EXPECT_NE(std::string(text).find("2025"), std::string::npos);
  tw_magnetic_model_destroy(model);
  tw_magnetic_value value[1];
  TWstatus word = 0;
  const double xyz[3] = {};
  const tw_points view = {const_cast<double*>(xyz), const_cast<double*>(xyz + 1), nullptr, 3};
  EXPECT_EQ(tw_magnetic_field(nullptr, 1, &view, value, &word), 1u);
  EXPECT_EQ(word, TW_BAD_INPUT);
}

}  // namespace tidewater::test
