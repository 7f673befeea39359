// Twenty everyday tasks, each a command of at most eight words; what a task's figures should be
// comes from published examples, from hand calculation or from the way back.
#include <gtest/gtest.h>

#include <cmath>
#include <sstream>
#include <string>
#include <vector>

#include "command.hpp"
#include "tidewater/version.h"

using namespace tidewater::test;

namespace {

// Runs a command, which must have at most eight words, and be well.
std::string run(const std::string& command, const std::string& input) {
  std::istringstream words(command);
  int count = 0;
  for (std::string word; words >> word;) ++count;
  EXPECT_LE(count, 8) << command;
  const Outcome r = shell(command, input);
  EXPECT_EQ(r.status, 0) << command << '\n' << r.err;
  return r.out;
}

void expect_near(const std::string& got, const std::vector<double>& wanted, double tolerance) {
  const auto n = numbers(got);
  ASSERT_GE(n.size(), wanted.size()) << got;
  for (std::size_t i = 0; i < wanted.size(); ++i) EXPECT_NEAR(n[i], wanted[i], tolerance) << got;
}

TEST(Tasks, AUtmAndBack) {
  const std::string there = run("tidewater convert --to utm", "48.3903 -4.4863 Brest\n");
  EXPECT_EQ(there, "389969.007 5360749.100 30N Brest\n");
  EXPECT_EQ(run("tidewater convert --from utm --to wgs84 -p 7", there),
            "48.3903000 -4.4863000 Brest\n");
  EXPECT_EQ(run("tidewater convert --from utm:30N --to wgs84 -p 7", there),
            "48.3903000 -4.4863000 30N Brest\n");
}

TEST(Tasks, BLambert93) {
  // the false origin: 46.5 N 3 E
  EXPECT_EQ(run("tidewater convert --to EPSG:2154", "46.5 3 origin\n"),
            "700000.000 6600000.000 origin\n");
  EXPECT_EQ(run("tidewater convert --from EPSG:2154 --to wgs84 -p 7", "700000 6600000\n"),
            "46.5000000 3.0000000\n");
}

TEST(Tasks, CBritishGrid) {
  // Ordnance Survey, A guide to coordinate systems in Great Britain, annex C: 52 39 27.2531 N,
  // 1 43 4.5177 E on OSGB 36 is 651409.903, 313177.270
  expect_near(
      run("tidewater convert --from EPSG:4277 --to EPSG:27700", "52:39:27.2531N 1:43:04.5177E\n"),
      {651409.903, 313177.270}, 0.002);
}

TEST(Tasks, DStatePlaneInFeet) {
  // EPSG Guidance Note 7-2: NAD 27 / Texas South Central, 28 30 N 96 W
  expect_near(run("tidewater convert --from EPSG:4267 --to EPSG:32040", "28:30:00N 96:00:00W\n"),
              {2963503.91, 254759.80}, 0.005);
}

TEST(Tasks, EPolarMaps) {
  // EPSG Guidance Note 7-2, polar stereographic variant B has its own example; here the true-scale
  // parallel at a meridian of the map: easting 0
  const std::string south = run("tidewater convert --to EPSG:3031", "-71 0\n");
  expect_near(south, {0}, 0.001);
  const std::string north = run("tidewater convert --to EPSG:3413", "70 -45\n");
  expect_near(north, {0}, 0.001);
  expect_near(run("tidewater convert --from EPSG:3031 --to wgs84", south), {-71, 0}, 1e-8);
  expect_near(run("tidewater convert --from EPSG:3413 --to wgs84", north), {70, -45}, 1e-8);
}

TEST(Tasks, FWebMercator) {
  // EPSG Guidance Note 7-2: 24 22 54.433 N, 100 20 W
  expect_near(run("tidewater convert --to EPSG:3857", "24:22:54.433N 100:20:00W\n"),
              {-11169055.58, 2800000.00}, 0.01);
}

TEST(Tasks, GAnyCode) {
  // EPSG Guidance Note 7-2: Amersfoort / RD New, 53 N 6 E
  expect_near(run("tidewater convert --from EPSG:4289 --to EPSG:28992", "53 6\n"),
              {196105.283, 557057.739}, 0.002);
  // and Lambert azimuthal of Europe, 50 N 5 E
  expect_near(run("tidewater convert --to EPSG:3035", "50 5\n"), {3962799.45, 2999718.85}, 0.006);
}

TEST(Tasks, HNadcon) {
  TIDEWATER_NEED_SHARED_DATA();
  // published NAD 83 position of Meades Ranch: 39 13 26.71220 N, 98 32 31.74604 W; the grid itself
  // is 0.009 seconds off
  expect_near(run("tidewater convert --from EPSG:4267 --to EPSG:4269 --grid=" +
                      (shared_data() / "nadcon").string(),
                  "39:13:26.686N 98:32:30.506W Meades Ranch\n"),
              {39 + (13 + 26.71220 / 60) / 60, -(98 + (32 + 31.74604 / 60) / 60)}, 5.6e-6);
}

TEST(Tasks, HNationalGrid) {
  if (proj_data().empty() || !std::filesystem::exists(proj_data() / "ntf_r93.gsb")) {
    GTEST_SKIP() << "ntf_r93.gsb is not installed";
  }
  const std::string grid = (proj_data() / "ntf_r93.gsb").string();
  // RGF 93 lies south of NTF by 5.8e-5 degrees and west by 7.1e-4 in Paris
  expect_near(
      run("tidewater convert --from EPSG:4275 --to EPSG:4171 --grid " + grid, "48.85 2.35\n"),
      {48.84994, 2.34929}, 1e-5);
}

TEST(Tasks, ISevenParameters) {
  // EPSG Guidance Note 7-2: WGS 72 to WGS 84, 55 N 4 E, 0 m
  const std::string got =
      run("tidewater convert --to geodetic --shift helmert:0,0,4.5,0,0,0.554,0.219 "
          "--from-ellipsoid=WGS72 -e=WGS84",
          "55 4 0\n");
  expect_near(got, {55 + 0.090 / 3600, 4 + 0.554 / 3600},
              1.5e-7);  // half of the last digit printed
  EXPECT_NEAR(numbers(got).at(2), 3.22, 0.005);
}

TEST(Tasks, JEllipsoidToGeoid) {
  if (proj_data().empty() || !std::filesystem::exists(proj_data() / "egm96_15.gtx")) {
    GTEST_SKIP() << "egm96_15.gtx is not installed";
  }
  const std::string grid = (proj_data() / "egm96_15.gtx").string();
  const double n = numbers(run("tidewater geoid " + grid + " 48.39 -4.49", "")).at(0);
  EXPECT_NEAR(n, 51.4, 0.5);  // the geoid of Brittany
  expect_near(run("tidewater convert --to wgs84 --geoid " + grid, "48.39 -4.49 100\n"),
              {48.39, -4.49, 100 - n}, 0.002);
}

TEST(Tasks, KCityPairsFromCsv) {
  // Geoscience Australia, Flinders Peak to Buninyong on GRS 80: 54972.271 m
  const std::string got =
      run("tidewater line --csv",
          "name,lat1,lon1,lat2,lon2\n\"F, B\",-37:57:03.72030,144:25:29.52440,-37:39:10.15610,"
          "143:55:35.38390\n");
  const auto rows = lines(got);
  ASSERT_EQ(rows.size(), 2u);
  EXPECT_EQ(rows[0], "name,lat1,lon1,lat2,lon2,azimuth,back_azimuth,distance");
  EXPECT_EQ(rows[1].substr(rows[1].rfind(',')), ",54972.271");
}

TEST(Tasks, LDensifyToGeoJson) {
  const std::string got =
      run("tidewater line --points 3 --as geojson -p 4", "0 170 0 -170 over the date line\n");
  EXPECT_NE(got.find("[[170.0000,0.0000],[180.0000,0.0000],[190.0000,0.0000]]"), got.npos) << got;
}

TEST(Tasks, MDeclinationByPlaceAndDate) {
  // WMM2025 report: 80 N 0 E, 2027.5: 2.59
  EXPECT_NEAR(numbers(lines(run("tidewater magnetic --date 2027.5 80 0", "")).at(1)).at(0), 2.59,
              0.0056);
}

TEST(Tasks, NAnglesInAllForms) {
  for (const char* text : {
           "48.39 -4.49",
           "48:23:24 -4:29:24",
           "48:23:24N 4:29:24W",
           "N48:23:24 W4:29:24",
           "48d23m24s -4d29m24s",
           "48\xC2\xB0"
           "23'24\"N 4\xC2\xB0"
           "29'24\"W",
           "48\xC2\xB0"
           "23.4'N, 4\xC2\xB0"
           "29.4'W",
           "48 23 24 N 4 29 24 W",
           "4.49W 48.39N",
           "+48.39-004.49/",
       }) {
    EXPECT_EQ(run("tidewater convert --to wgs84 -p 6", std::string(text) + " Brest\n"),
              "48.390000 -4.490000 Brest\n")
        << text;
  }
  EXPECT_EQ(run("tidewater convert --decimal comma --to wgs84 -p 2", "48,39 -4,49 Brest\n"),
            "48.39 -4.49 Brest\n");
  EXPECT_EQ(run("tidewater convert --to wgs84 -p 2", "48.39 -4.49 17 avenue Foch\n"),
            "48.39 -4.49 17 avenue Foch\n");
  EXPECT_EQ(run("tidewater convert --to wgs84 -p 2", "48.39 -4.49 17\n1 2 3.5 x\n"),
            "48.39 -4.49 17.00\n1.00 2.00 3.50 x\n");
}

TEST(Tasks, OCsvFiles) {
  EXPECT_EQ(run("tidewater convert --csv --to EPSG:2154",
                "\xEF\xBB\xBFname;lon;lat;note\r\n\"a;\"\"b\"\"\";3;46.5;x\r\n\"two\nlines\";3;46."
                "5;\r\n"),
            "name;lon;lat;note;easting;northing\r\n"
            "\"a;\"\"b\"\"\";3;46.5;x;700000.000;6600000.000\r\n"
            "\"two\nlines\";3;46.5;;700000.000;6600000.000\r\n");
  EXPECT_EQ(run("tidewater convert --csv --x=E --y=N --from=2154 --to=wgs84 --in-place",
                "N,what,E\n6600000,origin,700000\n"),
            "N,what,E\n46.500000000,origin,3.000000000\n");
}

TEST(Tasks, PGeoJsonFiles) {
  const std::string point =
      R"({"type":"Feature","properties":{"coordinates":[1,2],"n":1.50},"geometry":{"type":"Point","coordinates":[3,46.5]}})";
  EXPECT_EQ(
      run("tidewater convert --geojson --to EPSG:2154", point + "\n" + point),
      R"({"type":"Feature","properties":{"coordinates":[1,2],"n":1.50},"geometry":{"type":"Point","coordinates":[700000.000,6600000.000]},"crs":{"type":"name","properties":{"name":"urn:ogc:def:crs:EPSG::2154"}}})"
      "\n"
      R"({"type":"Feature","properties":{"coordinates":[1,2],"n":1.50},"geometry":{"type":"Point","coordinates":[700000.000,6600000.000]},"crs":{"type":"name","properties":{"name":"urn:ogc:def:crs:EPSG::2154"}}})"
      "\n");
  // the old member tells the system of the input
  EXPECT_EQ(
      run("tidewater convert --geojson --to wgs84 -p 6",
          R"({"type":"GeometryCollection","crs":{"type":"name","properties":{"name":"EPSG:2154"}},"geometries":[{"type":"LineString","coordinates":[[700000,6600000,5],[700000,6600000]]}]})"),
      R"({"type":"GeometryCollection","geometries":[{"type":"LineString","coordinates":[[3.000000,46.500000,5.000000],[3.000000,46.500000]]}]})"
      "\n");
}

TEST(Tasks, QMilitaryGrid) {
  EXPECT_EQ(run("tidewater convert --to mgrs", "48.858198377 2.294495998 Paris\n"),
            "31UDQ4825111932 Paris\n");
  EXPECT_EQ(run("tidewater convert --from mgrs --to wgs84 -p 4", "31U DQ 48251 11932 Paris\n"),
            "48.8582 2.2945 Paris\n");
}

TEST(Tasks, RConvergenceAndScale) {
  // On the central meridian of a zone: 0.9996, and no convergence
  const auto n = numbers(lines(run("tidewater factors --system EPSG:32631", "48 3\n")).at(1));
  ASSERT_EQ(n.size(), 5u);
  EXPECT_NEAR(n[0], 0.9996, 1e-8);
  EXPECT_NEAR(n[1], 0.9996, 1e-8);
  EXPECT_NEAR(n[3], 0, 1e-6);
  // three degrees away the convergence is about 3 sin(48)
  EXPECT_NEAR(numbers(lines(run("tidewater factors --system EPSG:32631", "48 6\n")).at(1)).at(3),
              3 * std::sin(48 * 0.017453292519943295), 2e-3);
}

TEST(Tasks, SListings) {
  EXPECT_EQ(run("tidewater systems search lambert 93 --limit 1", ""),
            "EPSG:2154\tprojected\tRGF93 v1 / Lambert-93\n");
  EXPECT_GT(lines(run("tidewater systems list", "")).size(), 5000u);
  EXPECT_GT(lines(run("tidewater systems list zones", "")).size(), 120u);
  EXPECT_NE(run("tidewater systems list ellipsoids", "").find("Clarke 1866\n"), std::string::npos);
  EXPECT_NE(run("tidewater systems list methods", "").find("Transverse Mercator"),
            std::string::npos);
  const std::string shown = run("tidewater systems show EPSG:4277 --to EPSG:4326", "");
  EXPECT_NE(shown.find("OSGB36"), std::string::npos) << shown;
  EXPECT_NE(shown.find("operations to WGS 84, best first"), std::string::npos) << shown;
  EXPECT_EQ(run("tidewater systems show EPSG:2154 --json", "").front(), '{');
  EXPECT_NE(run("tidewater doctor", "").find("version: " TIDEWATER_VERSION), std::string::npos);
}

TEST(Tasks, TMillionsThroughAPipe) {
  const Outcome r = shell(
      "yes '48.3903 -4.4863 Brest' | head -n 5000000 | tidewater convert --to utm | "
      "sort -u | head -n 3");
  EXPECT_EQ(r.out, "389969.007 5360749.100 30N Brest\n");
  EXPECT_NE(r.err.find("5000000 converted, 0 outside the grids, 0 refused"), r.err.npos) << r.err;
}

}  // namespace
