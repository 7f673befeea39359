#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "command.hpp"
#include "support/points.hpp"
#include "support/proj_peer.hpp"
#include "tidewater/version.h"

using namespace tidewater::test;

namespace {

// A folder that names one of the distribution's national grids.
struct NationalGrid : ScratchFolder {
  explicit NationalGrid(const std::string& name) {
    std::filesystem::create_symlink(proj_data() / (name + ".gsb"), path() / (name + ".gsb"));
    write("area.par", name + "\n");
  }
};

// The figures are those of proj and invproj, which know of no datum.
TEST(Convert, GeodeticIsOnADatumThatHasNoName) {
  const std::string map = " '+proj=tmerc +lat_0=45 +lon_0=5 +ellps=bessel'";
  EXPECT_EQ(shell("tidewater convert --from geodetic --to" + map, "45.19 5.72\n").out,
            "56574.928 21365.242\n");
  EXPECT_EQ(shell("tidewater convert -p 6 --to geodetic --from" + map, "56574.928 21365.242\n").out,
            "45.190000 5.720000\n");
  const std::string utm = " '+proj=utm +zone=30 +datum=WGS84'";
  EXPECT_EQ(shell("tidewater convert --from geodetic --to" + utm, "48.3903 -4.4863\n").out,
            "389969.007 5360749.100\n");
}

TEST(Convert, DecimalDegreesToUtm) {
  // EPSG Guidance Note 7-2 has no UTM example; these are PROJ's figures for +proj=utm +zone=30.
  const Outcome r = shell("tidewater convert", "48.3903 -4.4863 Brest\n");
  EXPECT_EQ(r.out, "389969.007 5360749.100 30N Brest\n");
  EXPECT_EQ(r.err, "1 converted, 0 outside the grids, 0 refused\n");
  EXPECT_EQ(r.status, 0);
}

TEST(Convert, AgreesWithProjInEveryZone) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  for (int zone = 1; zone <= 60; zone += 7) {
    for (const double lat : {-70.5, -12.25, 33.0, 71.0}) {
      const double lon = 6 * zone - 183 + 2.25;
      const ProjPeer peer("+proj=utm +ellps=WGS84 +zone=" + std::to_string(zone) +
                          (lat < 0 ? " +south" : ""));
      const CoordinateTriple p = peer.forward({degrees(lon), degrees(lat), 0});
      std::ostringstream input;
      input << lat << ' ' << lon << '\n';
      const Outcome r = shell("tidewater convert -p 4 -e 'WGS 84'", input.str());
      const auto n = numbers(r.out);
      ASSERT_GE(n.size(), 2u) << r.out << r.err;
      EXPECT_NEAR(n[0], p.x, 1e-3);
      // the arc's series to e^8, that of the grid's own manual, is up to 2 mm off the exact arc
      EXPECT_NEAR(n[1], p.y, 2e-3);
      const std::string name = std::to_string(zone) + (lat < 0 ? "S" : "N");
      EXPECT_NE(r.out.find(' ' + name + '\n'), std::string::npos) << r.out;
    }
  }
#endif
}

TEST(Convert, ZonesOfNorwayAndSvalbard) {
  // DMA TM 8358.1: 32V reaches from 3 to 12 E, and 31X, 33X, 35X, 37X cover 0 to 42 E
  const Outcome r = shell("tidewater convert | awk '{print $3}'",
                          "60 4\n55.9 4\n64 4\n71.9 7\n72 8.9\n72 9\n72 20.9\n72 21\n80 33\n80 42\n"
                          "-60 4\n0 -180\n0 180\n0 179.9\n");
  EXPECT_EQ(r.out, "32N\n31N\n31N\n32N\n31N\n33N\n33N\n35N\n37N\n38N\n31S\n1N\n1N\n60N\n");
}

TEST(Convert, TownsOfBrittanyThroughTheNationalGrid) {
  if (proj_data().empty() || !std::filesystem::exists(proj_data() / "ntf_r93.gsb")) {
    GTEST_SKIP() << "ntf_r93.gsb is not installed";
  }
  const NationalGrid grid("ntf_r93");
  const std::string towns = TIDEWATER_SOURCE "/examples/brittany_ntf.txt";
  const Outcome r =
      shell("tidewater convert --format dms --hemisphere behind --zone 30N --shift ntv2:" +
            grid.path().string() + " " + towns);
  EXPECT_EQ(r.status, 0) << r.err;
  EXPECT_NE(r.err.find("12 converted, 0 outside the grids, 0 refused"), std::string::npos) << r.err;
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer(
      "+proj=pipeline +step +proj=hgridshift +grids=ntf_r93.gsb "
      "+step +proj=utm +zone=30 +ellps=GRS80");
  ASSERT_TRUE(peer.ok());
  const auto given = lines(contents(towns));
  const auto got = lines(r.out);
  ASSERT_EQ(given.size(), got.size());
  int compared = 0;
  for (std::size_t i = 0; i < given.size(); ++i) {
    double d = 0, m = 0, sec = 0, e = 0, minutes = 0, t = 0;
    int name = 0;
    if (std::sscanf(given[i].c_str(), "%lf:%lf:%lfN %lf:%lf:%lfW %n", &d, &m, &sec, &e, &minutes,
                    &t, &name) != 6) {
      EXPECT_EQ(given[i], got[i]);  // the comment is passed through
      continue;
    }
    const double lat = degrees(d, m, sec);
    const double lon = -degrees(e, minutes, t);
    const CoordinateTriple expected = peer.forward({lon, lat, 0});
    const auto n = numbers(got[i]);
    ASSERT_EQ(n.size(), 2u) << got[i];
    EXPECT_NEAR(n[0], expected.x, 1e-3) << given[i];
    // 1 mm, and 0.9 mm by which the grid's own series of the arc is off the exact arc here
    EXPECT_NEAR(n[1], expected.y, 1.9e-3) << given[i];
    EXPECT_NE(got[i].find(' ' + given[i].substr(static_cast<std::size_t>(name))),
              std::string::npos);
    ++compared;
  }
  EXPECT_EQ(compared, 12);
#endif
}

TEST(Convert, NationalGridShiftAgreesWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const ProjPeer peer("+proj=hgridshift +grids=ntf_r93.gsb");
  if (!peer.ok()) GTEST_SKIP() << "ntf_r93.gsb is not installed";
  const NationalGrid grid("ntf_r93");
  std::ostringstream input;
  for (double lat = 47.6; lat < 48.8; lat += 0.21) {
    for (double lon = -4.7; lon < -1; lon += 0.83) input << lat << ' ' << lon << '\n';
  }
  const Outcome r = shell(
      "tidewater convert --to geodetic -p 12 --shift ntv2:" + grid.path().string(), input.str());
  const auto given = lines(input.str());
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), given.size()) << r.err;
  for (std::size_t i = 0; i < given.size(); ++i) {
    const auto from = numbers(given[i]);
    const auto to = numbers(got[i]);
    const CoordinateTriple expected = peer.forward({degrees(from[1]), degrees(from[0]), 0});
    ASSERT_EQ(to.size(), 2u) << got[i];
    // a hundredth of a millimetre; PROJ interpolates in single precision
    EXPECT_NEAR(degrees(to[1]), expected.x, 2e-12) << given[i];
    EXPECT_NEAR(degrees(to[0]), expected.y, 2e-12) << given[i];
  }
#endif
}

TEST(Convert, NationalGridThereAndBack) {
  if (proj_data().empty()) GTEST_SKIP() << "no national grid is installed";
  const NationalGrid grid("ntf_r93");
  const std::string shift = " --shift ntv2:" + grid.path().string();
  const Outcome r = shell("tidewater convert --to geodetic -p 10" + shift +
                              " | tidewater convert --to geodetic -p 8 --inverse" + shift,
                          "48.3903 -4.4863 Brest\n47.25 -1.55 Nantes\n");
  EXPECT_EQ(r.out, "48.39030000 -4.48630000 Brest\n47.25000000 -1.55000000 Nantes\n");
  EXPECT_EQ(r.status, 0) << r.err;
}

TEST(Convert, NationalGridServesBothSidesOfGreenwich) {
  if (proj_data().empty()) GTEST_SKIP() << "no national grid is installed";
  const NationalGrid grid("ntf_r93");
  const Outcome r = shell("tidewater convert --to geodetic --shift ntv2:" + grid.path().string(),
                          "48.85 2.35 Paris\n48.39 -4.49 Brest\n20 -30 sea\n");
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 3u);
  // RGF 93 lies south of NTF by 5.8e-5 degrees and west by 7.1e-4 in Paris
  EXPECT_NEAR(numbers(got[0]).at(0), 48.84994, 1e-5);
  EXPECT_NEAR(numbers(got[0]).at(1), 2.34929, 1e-5);
  EXPECT_EQ(got[1].rfind("48.3", 0), 0u);
  EXPECT_EQ(got[2], "* * sea");
  EXPECT_NE(r.err.find("standard input:3: \"20 -30 sea\": outside the shift grids "
                       "(TW_I_OUTSIDE_CNT)"),
            std::string::npos)
      << r.err;
  EXPECT_NE(r.err.find("2 converted, 1 outside the grids, 0 refused"), std::string::npos);
  EXPECT_EQ(r.status, 1);
}

TEST(Convert, MeadesRanchThroughNadcon) {
  TIDEWATER_NEED_SHARED_DATA();
  const Outcome r = shell(
      "tidewater convert --format dms --hemisphere behind --to geodetic --out-format dms "
      "--shift nadcon:" +
          (shared_data() / "nadcon").string(),
      "39:13:26.686N 98:32:30.506W Meades Ranch\n10:0:0N 40:0:0W Atlantic\n");
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 2u) << r.err;
  double d = 0, m = 0, s = 0, e = 0, n = 0, t = 0;
  ASSERT_EQ(std::sscanf(got[0].c_str(), "%lf:%lf:%lf %lf:%lf:%lf", &d, &m, &s, &e, &n, &t), 6);
  // published NAD 83 position 39 13 26.71220 N, 98 32 31.74604 W; the grid itself is 0.009 off
  EXPECT_EQ(d, 39);
  EXPECT_EQ(m, 13);
  EXPECT_NEAR(s, 26.71220, 0.02);
  EXPECT_EQ(e, -98);
  EXPECT_EQ(n, 32);
  EXPECT_NEAR(t, 31.74604, 0.02);
  EXPECT_EQ(got[1], "* * Atlantic");
  EXPECT_NE(r.err.find("TW_I_OUTSIDE_CNT"), std::string::npos);
  EXPECT_NE(r.err.find("1 converted, 1 outside the grids, 0 refused"), std::string::npos);
  EXPECT_EQ(r.status, 1);
}

TEST(Convert, EveryAngleFormatThereAndBack) {
  const std::string start = "48.390300000 -4.486300000 a\n-33.450000000 151.250000000 b\n";
  for (const char* form : {"degrees", "grads", "dms", "packed"}) {
    for (const char* signs : {"hemisphere sign", "hemisphere front", "hemisphere behind",
                              "reverse both", "reverse lat", "reverse lon"}) {
      for (const char* order : {"lat-lon", "lon-lat"}) {
        const std::string format = std::string("format ") + form;
        const std::string there = std::string(" --out-") + format + " --out-" + signs +
                                  " --out-order " + order + " -p 11";
        const std::string back =
            std::string(" --") + format + " --" + signs + " --order " + order + " -p 9";
        const Outcome r = shell(
            "tidewater convert --to geodetic" + there + " | tidewater convert --to geodetic" + back,
            start);
        EXPECT_EQ(r.out, start) << there << r.err;
      }
    }
  }
}

TEST(Convert, TextOfEachFormat) {
  const auto written = [](const std::string& options) {
    return shell("tidewater convert --to geodetic " + options, "-0.5 151.25\n").out;
  };
  EXPECT_EQ(written(""), "-0.500000000 151.250000000\n");
  EXPECT_EQ(written("-p 2 --out-format grads"), "-0.56 168.06\n");
  EXPECT_EQ(written("-p 1 --out-format dms"), "-0:30:00.0 151:15:00.0\n");
  EXPECT_EQ(written("-p 0 --out-format packed --out-hemisphere behind"), "0.3000S 151.1500E\n");
  EXPECT_EQ(written("-p 0 --out-format dms --out-hemisphere front --out-order lon-lat"),
            "E151:15:00 S0:30:00\n");
  EXPECT_EQ(written("-p 1 --out-reverse lon"), "-0.5 -151.2\n");
}

TEST(Convert, PackedMinusZeroIsSouth) {
  // the library's own reader takes it for positive; the command does not
  const Outcome r =
      shell("tidewater convert --to geodetic -p 3 --format packed", "-0.3000 1.3000\n");
  EXPECT_EQ(r.out, "-0.500 1.500\n");
}

TEST(Convert, GeocentricOnNamedAndGivenEllipsoids) {
  // EPSG Guidance Note 7-2, 4.1.1
  const std::string input = "53:48:33.820 2:07:46.380 73.0 WGS\n";
  const Outcome named = shell("tidewater convert --to geocentric --format dms -e wgs84", input);
  const auto n = numbers(named.out);
  ASSERT_EQ(n.size(), 3u);
  EXPECT_NEAR(n[0], 3771793.968, 1e-3);
  EXPECT_NEAR(n[1], 140253.342, 1e-3);
  EXPECT_NEAR(n[2], 5124304.349, 1e-3);
  const Outcome given =
      shell("tidewater convert --to geocentric --format dms -e 6378137,298.257223563", input);
  EXPECT_EQ(given.out, named.out);
  EXPECT_EQ(shell("tidewater convert --to geocentric -p 0 -e 1000,0", "0 90\n").out, "0 1000 0\n");
}

TEST(Convert, WhatIsNotAPositionIsPassedThrough) {
  const Outcome r =
      shell("tidewater convert --zone 30N",
            "# a comment\n\n   \n48 -3 12.5 a name, with # and , in it\n48, -3; b\r\n");
  EXPECT_EQ(r.out,
            "# a comment\n\n   \n500000.000 5316300.224 12.5 a name, with # and , in it\n"
            "500000.000 5316300.224; b\n");
  EXPECT_EQ(r.status, 0) << r.err;
}

TEST(Convert, BadLinesAreMarkedAndTold) {
  const struct {
    const char* options;
    const char* line;
    const char* word;
  } bad[] = {
      {"", "abc", "TW_BAD_TEXT"},
      {"", "48", "TW_BAD_TEXT"},
      {"", "48 -4x", "TW_BAD_TEXT"},
      {"", "48N 4N", "TW_BAD_TEXT"},
      {"", "48,5 4,25", "TW_BAD_TEXT"},
      {"", "1e1 -4", "TW_BAD_TEXT"},
      {"", ". -4", "TW_BAD_TEXT"},
      {"", "90.1 0", "TW_BAD_LATITUDE"},
      {"", "48 361", "TW_BAD_LONGITUDE"},
      {"", "84.1 0", "TW_BAD_LATITUDE"},
      {"--zone 30N", "48 60", "TW_RANGE_ERROR"},
      {"--format dms", "48:60:00 0:0:0", "TW_BAD_TEXT"},
      {"--format dms", "48:00:60 0:0:0", "TW_BAD_TEXT"},
      {"--format dms", "48:00: 0:0:0", "TW_BAD_TEXT"},
      {"--format packed", "48.6000 0.0", "TW_BAD_TEXT"},
      {"--format packed", "48.0060 0.0", "TW_BAD_TEXT"},
      {"--hemisphere front", "E48 W4", "TW_BAD_TEXT"},
      {"--hemisphere behind", "48 4", "TW_BAD_TEXT"},
      {"--hemisphere behind", "-48N 4W", "TW_BAD_TEXT"},
  };
  for (const auto& b : bad) {
    const Outcome r =
        shell(std::string("tidewater convert ") + b.options, std::string(b.line) + "\n");
    EXPECT_EQ(r.out.rfind("* *", 0), 0u) << b.line << ": " << r.out;
    EXPECT_NE(r.err.find(std::string("standard input:1: \"") + b.line + "\": "), std::string::npos)
        << r.err;
    EXPECT_NE(r.err.find(std::string("(") + b.word + ")"), std::string::npos) << b.line << r.err;
    EXPECT_NE(r.err.find("0 converted, 0 outside the grids, 1 refused"), std::string::npos);
    EXPECT_EQ(r.status, 1);
  }
}

TEST(Convert, GoodLinesAroundABadOneAreConverted) {
  const Outcome r = shell("tidewater convert --to geodetic -p 1", "1 1 a\nrubbish b\n2 2 c\n");
  EXPECT_EQ(r.out, "1.0 1.0 a\n* *\n2.0 2.0 c\n");
  EXPECT_NE(r.err.find("standard input:2: \"rubbish b\""), std::string::npos);
  EXPECT_NE(r.err.find("2 converted, 0 outside the grids, 1 refused"), std::string::npos);
}

TEST(Convert, FilesAndStandardInput) {
  const ScratchFolder scratch;
  scratch.write("one", "1 1 one\n");
  scratch.write("two", "2 2 two");  // no newline at the end
  const std::string f = scratch.path().string();
  const Outcome r =
      shell("tidewater convert --to geodetic -p 0 " + f + "/one - " + f + "/two", "3 3 three\n");
  EXPECT_EQ(r.out, "1 1 one\n3 3 three\n2 2 two\n");
  const Outcome absent = shell("tidewater convert " + f + "/three");
  EXPECT_EQ(absent.status, 2);
  EXPECT_NE(absent.err.find("three: No such file"), std::string::npos) << absent.err;
  EXPECT_EQ(shell("tidewater convert " + f).status, 2);  // a folder
}

TEST(Convert, ManyLinesInBatches) {
  std::string input;
  for (int i = 0; i < 20000; ++i) input += i % 1000 == 7 ? "bad\n" : "12.5 33.25 x\n";
  const Outcome r = shell("tidewater convert --to geodetic -p 2", input);
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 20000u);
  for (std::size_t i = 0; i < got.size(); ++i) {
    ASSERT_EQ(got[i], i % 1000 == 7 ? "* *" : "12.50 33.25 x") << i;
  }
  EXPECT_NE(r.err.find("standard input:19008: \"bad\""), std::string::npos);
  EXPECT_NE(r.err.find("19980 converted, 0 outside the grids, 20 refused"), std::string::npos);
}

TEST(Convert, ALineOfAMillionCharactersIsRefused) {
  const Outcome r = shell("tidewater convert --to geodetic -p 0",
                          "1 1 " + std::string(1000000, 'x') + "\n2 2 y\n");
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 2u);
  EXPECT_EQ(got[0].substr(0, 3), "* *");
  EXPECT_LT(got[0].size(), 70000u);  // held in bounded memory
  EXPECT_EQ(got[1], "2 2 y");
  EXPECT_LT(r.err.size(), 1000u);
}

TEST(Convert, GarbageIsRefusedAndNothingElse) {
  const std::string garbage = garbage_text(200000);
  for (const char* options : {"", "--format dms --hemisphere behind", "--format packed"}) {
    const Outcome r = shell(std::string("tidewater convert ") + options, garbage);
    EXPECT_TRUE(r.status == 0 || r.status == 1) << r.status;
  }
}

TEST(Convert, DecimalPointWhateverTheLocale) {
  const Outcome r =
      shell("export LC_ALL=de_DE.UTF-8; tidewater convert --to geodetic -p 2", "48.25 -4.75 x\n");
  EXPECT_EQ(r.out, "48.25 -4.75 x\n");
}

// EPSG Guidance Note 7-2: the position vector transformation from WGS 72 to WGS 84.
const char* const kWgs72 = "helmert:0,0,4.5,0,0,0.554,0.219";

TEST(ConvertByFormulas, HelmertOfThePublishedExample) {
  const std::string there =
      shell(std::string("tidewater convert --format dms --to geocentric --shift ") + kWgs72 +
                " --from-ellipsoid 'WGS 72' -e 'WGS 84'",
            "55:00:00 4:00:00 0 p\n")
          .out;
  const auto n = numbers(there);
  ASSERT_EQ(n.size(), 3u) << there;
  EXPECT_NEAR(n[0], 3657660.78, 0.005);
  EXPECT_NEAR(n[1], 255778.43, 0.005);
  EXPECT_NEAR(n[2], 5201387.75, 0.005);
  const Outcome geodetic =
      shell(std::string("tidewater convert --format dms --out-format dms -p 3 --to geodetic "
                        "--shift ") +
                kWgs72 + " --from-ellipsoid 'WGS 72' -e 'WGS 84'",
            "55:00:00 4:00:00 0\n");
  // the published 55 00 00.090, 4 00 00.554, 3.22 m
  EXPECT_EQ(geodetic.out.substr(0, 26), "55:00:00.090 4:00:00.554 3") << geodetic.err;
  EXPECT_NEAR(numbers(geodetic.out.substr(24)).at(0), 3.22, 0.005);
}

TEST(ConvertByFormulas, RotationsAndScaleEachTurnedBack) {
  // positions on the ellipsoid of the input, there and back over two ellipsoids
  const std::string start =
      "50.941300000 6.958300000 53.200 a\n-33.450000000 151.250000000 -12.000\n";
  const std::string shift = " --shift helmert:598.1,73.7,418.2,0.202,0.045,-2.455,6.7";
  const Outcome there = shell(
      "tidewater convert -p 12 --to geodetic" + shift + " --from-ellipsoid bessel1841 -e wgs84",
      start);
  EXPECT_NE(there.out, start);
  // the input is then on the target's ellipsoid, and the output on the source's; the transpose of
  // the small-angle matrix leaves 0.1 mm
  const Outcome back = shell("tidewater convert -p 8 --to geodetic --inverse" + shift +
                                 " --from-ellipsoid wgs84 -e bessel1841",
                             there.out);
  const auto got = lines(back.out);
  const auto wanted = lines(start);
  ASSERT_EQ(got.size(), 2u) << back.err;
  for (std::size_t i = 0; i < 2; ++i) {
    const auto g = numbers(got[i]), w = numbers(wanted[i]);
    ASSERT_EQ(g.size(), 3u);
    EXPECT_NEAR(g[0], w[0], 1e-8);
    EXPECT_NEAR(g[1], w[1], 1e-8);
    EXPECT_NEAR(g[2], w[2], 2e-3);
  }
}

TEST(ConvertByFormulas, BothDirectionsAgreeWithProj) {
  TIDEWATER_NEED_PROJ();
#ifdef TIDEWATER_HAVE_PROJ
  const struct {
    const char* shift;
    const char* from;
    const char* to;
    const char* proj;
    double inverse_tolerance;  // radians
  } cases[] = {
      {"helmert:598.1,73.7,418.2,0.202,0.045,-2.455,6.7", "bessel1841", "wgs84",
       "+proj=pipeline +step +proj=cart +ellps=bessel +step +proj=helmert +x=598.1 +y=73.7 "
       "+z=418.2 +rx=0.202 +ry=0.045 +rz=-2.455 +s=6.7 +convention=position_vector "
       "+step +inv +proj=cart +ellps=WGS84",
       2e-11},
      // the peer's way back is one pass of the formula turned round, ours two: 2 cm
      {"molodensky:84.87,96.49,116.95", "wgs84", "international1924",
       "+proj=molodensky +ellps=WGS84 +dx=84.87 +dy=96.49 +dz=116.95 +da=251 "
       "+df=1.41927023000e-05",
       3e-9},
  };
  const std::string input = "53.809394444 2.129550000 73.0\n-35.3 149.1 600\n61 -150.2 20\n0 0 0\n";
  for (const auto& c : cases) {
    const ProjPeer peer(c.proj);
    ASSERT_TRUE(peer.ok());
    for (const bool inverse : {false, true}) {
      const Outcome r =
          shell(std::string("tidewater convert --to geodetic -p 13 --shift ") + c.shift +
                    " --from-ellipsoid " + (inverse ? c.to : c.from) + " -e " +
                    (inverse ? c.from : c.to) + (inverse ? " --inverse" : ""),
                input);
      const auto given = lines(input);
      const auto got = lines(r.out);
      ASSERT_EQ(got.size(), given.size()) << r.err;
      for (std::size_t i = 0; i < given.size(); ++i) {
        const auto f = numbers(given[i]), g = numbers(got[i]);
        ASSERT_EQ(g.size(), 3u) << got[i];
        const CoordinateTriple p = {degrees(f[1]), degrees(f[0]), f[2]};
        const CoordinateTriple w = inverse ? peer.inverse(p) : peer.forward(p);
        // forward, the peers differ by the closed form of the latitude
        const double tolerance = inverse ? c.inverse_tolerance : 2e-11;
        EXPECT_NEAR(degrees(g[1]), w.x, tolerance) << c.shift << inverse << given[i];
        EXPECT_NEAR(degrees(g[0]), w.y, tolerance) << c.shift << inverse << given[i];
        EXPECT_NEAR(g[2], w.z, tolerance * 6.4e6) << c.shift << inverse << given[i];
      }
    }
  }
#endif
}

TEST(ConvertByFormulas, MolodenskyOfThePublishedExample) {
  // EPSG Guidance Note 7-2, geocentric translations from WGS 84 to ED 50: 53 48 36.565, 2 07 51.477
  // and 28.02 m; the formula differs from them by some millimetres, and centimetres of height
  const std::string shift = " --shift molodensky:84.87,96.49,116.95";
  const auto run = [&shift](const std::string& options, const std::string& line) {
    return shell("tidewater convert --format dms --out-format dms -p 3 --to geodetic" + shift +
                     options,
                 line)
        .out;
  };
  double s = 0, t = 0, h = 0;
  const std::string there =
      run(" --from-ellipsoid wgs84 -e international1924", "53:48:33.82 2:07:46.38 73\n");
  ASSERT_EQ(std::sscanf(there.c_str(), "53:48:%lf 2:07:%lf %lf", &s, &t, &h), 3) << there;
  EXPECT_NEAR(s, 36.564, 0.002);
  EXPECT_NEAR(t, 51.477, 0.001);
  EXPECT_NEAR(h, 28.05, 0.1);
  const std::string back = run(" --inverse --from-ellipsoid international1924 -e wgs84", there);
  ASSERT_EQ(std::sscanf(back.c_str(), "53:48:%lf 2:07:%lf %lf", &s, &t, &h), 3) << back;
  EXPECT_NEAR(s, 33.82, 0.0011);
  EXPECT_NEAR(t, 46.38, 0.0011);
  EXPECT_NEAR(h, 73, 0.002);
  // the same ellipsoid on both sides and no shift: nothing happens
  EXPECT_EQ(shell("tidewater convert --to geodetic -p 9 --shift molodensky:0,0,0 "
                  "--from-ellipsoid grs80",
                  "48.5 -4.5 100 x\n")
                .out,
            "48.500000000 -4.500000000 100.000000000 x\n");
}

TEST(ConvertByFormulas, FiguresThatAreNoPositionAreRefused) {
  // dz cos(lat) / M is 90.4 degrees at the equator, and 45 at 60 S: one point that has no answer
  // does not take the others with it
  const Outcome r = shell(
      "tidewater convert --to geodetic -p 3 --shift molodensky:0,0,1e7 --from-ellipsoid grs80",
      "0 0 100 a\n-60 90 100 b\n");
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 2u);
  EXPECT_EQ(got[0], "* * a");
  EXPECT_NE(got[1].substr(0, 1), "*");
  EXPECT_NE(r.err.find("(TW_RANGE_ERROR)"), std::string::npos) << r.err;
  EXPECT_NE(r.err.find("1 converted, 0 outside the grids, 1 refused"), std::string::npos) << r.err;
}

TEST(ConvertByFormulas, LongitudesBesideTheDateLineStayInRange) {
  const Outcome r = shell(
      "tidewater convert --to geodetic -p 6 --shift molodensky:0,-100,0 --from-ellipsoid grs80",
      "0 179.9999 0\n0 -179.9999 0\n");
  // 100 m to the west of a place that faces the other way is 0.000898 degrees to the east
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 2u);
  EXPECT_NEAR(numbers(got[0])[1], -179.999202, 2e-6);
  EXPECT_NEAR(numbers(got[1])[1], -179.999002, 2e-6);
}

// The undulation at a node of one of the real grids, straight from its bytes.
double undulation_at_node(const std::string& name, double lat, double lon) {
  const std::string bytes = contents(shared_data() / "geoid" / (name + ".geo"));
  const auto at = [&bytes](std::size_t offset, auto value) {
    std::memcpy(&value, bytes.data() + offset, sizeof value);
    return value;
  };
  const auto nc = static_cast<std::size_t>(at(64, std::int32_t{}));
  const float xmin = at(76, 0.0F), dx = at(80, 0.0F), ymin = at(84, 0.0F), dy = at(88, 0.0F);
  const auto column = static_cast<std::size_t>(
      std::lround((lon - static_cast<double>(xmin)) / static_cast<double>(dx)));
  const auto row = static_cast<std::size_t>(
      std::lround((lat - static_cast<double>(ymin)) / static_cast<double>(dy)));
  return static_cast<double>(at(((row + 1) * (nc + 1) + 1 + column) * 4, 0.0F));
}

TEST(ConvertHeights, GeoidBothWays) {
  TIDEWATER_NEED_SHARED_DATA();
  const double n = undulation_at_node("namer96", 40, -100);
  ASSERT_GT(std::fabs(n), 5);
  const std::string geoid = " --geoid " + (shared_data() / "geoid").string();
  const auto height = [&geoid](const std::string& options) {
    const Outcome r = shell("tidewater convert" + geoid + options, "40 -100 1000 Phillips\n");
    EXPECT_EQ(r.status, 0) << r.err;
    return numbers(r.out).back();
  };
  // the last three figures are single precision's
  EXPECT_NEAR(height(" --to geodetic"), 1000 - n, 1e-3);
  EXPECT_NEAR(height(" --zone 14N"), 1000 - n, 1e-3);
  EXPECT_NEAR(height(" --to geodetic --geoid-to-ellipsoid"), 1000 + n, 1e-3);
}

TEST(ConvertHeights, LinesWithoutHeightNeedNoGeoid) {
  TIDEWATER_NEED_SHARED_DATA();
  const std::string geoid = " --geoid " + (shared_data() / "geoid").string();
  const Outcome r = shell("tidewater convert --to geodetic -p 0" + geoid,
                          "-30 20 somewhere\n-30 20 5 outside\n40 -100 inside\n40 -100 5 inside\n");
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 4u);
  EXPECT_EQ(got[0], "-30 20 somewhere");
  EXPECT_EQ(got[1], "* * outside");
  EXPECT_EQ(got[2], "40 -100 inside");
  EXPECT_EQ(got[3].substr(0, 8), "40 -100 ");
  EXPECT_NE(r.err.find("standard input:2: \"-30 20 5 outside\": outside the geoid grids "
                       "(TW_I_OUTSIDE_GEOID)"),
            std::string::npos)
      << r.err;
  EXPECT_NE(r.err.find("3 converted, 1 outside the grids, 0 refused"), std::string::npos) << r.err;
  EXPECT_EQ(r.status, 1);
}

TEST(ConvertHeights, TheGeoidBelongsToTheDatumOfTheEllipsoidalHeight) {
  TIDEWATER_NEED_SHARED_DATA();
  // 1 km of height is added by the shift: behind it the geoid is taken off, before it put on, so
  // that the way back is the way there turned round
  const std::string options = " --to geodetic -p 9 --geoid " + (shared_data() / "geoid").string() +
                              " --shift helmert:300,200,100,1,2,3,4 --from-ellipsoid ";
  const std::string start = "40.000000000 -100.000000000 1000.000000000 x\n";
  const Outcome there = shell("tidewater convert" + options + "clarke1866 -e grs80", start);
  const Outcome back =
      shell("tidewater convert --inverse --geoid-to-ellipsoid" + options + "grs80 -e clarke1866",
            there.out);
  const auto n = numbers(back.out), s = numbers(start);
  ASSERT_EQ(n.size(), 3u) << there.err << back.err;
  EXPECT_NEAR(n[0], s[0], 3e-9);
  EXPECT_NEAR(n[1], s[1], 3e-9);
  EXPECT_NEAR(n[2], s[2], 5e-3);  // 3 seconds of rotation squared are 1.4 mm of the radius
}

TEST(ConvertHeights, GeocentricTakesEllipsoidalHeightsOnly) {
  TIDEWATER_NEED_SHARED_DATA();
  const std::string geoid = " --geoid " + (shared_data() / "geoid").string();
  const Outcome refused = shell("tidewater convert --to geocentric" + geoid, "40 -100 1\n");
  EXPECT_EQ(refused.status, 2);
  EXPECT_EQ(refused.out, "");
  const Outcome r =
      shell("tidewater convert --to geocentric --geoid-to-ellipsoid" + geoid, "40 -100 1000\n");
  const auto n = numbers(r.out);
  ASSERT_EQ(n.size(), 3u) << r.err;
  const auto [a, e] = Ellipsoid::grs80();
  const double s = std::sin(degrees(40));
  const double z = (a * (1 - e * e) / std::sqrt(1 - e * e * s * s) + 1000 +
                    undulation_at_node("namer96", 40, -100)) *
                   s;
  EXPECT_NEAR(n[2], z, 1e-3);
}

TEST(Convert, OptionsThatDoNotFit) {
  for (const char* options : {"--zone 61N",
                              "--zone 30",
                              "--zone N",
                              "--zone 0S",
                              "-e Nowhere",
                              "-e 6378137,0.5",
                              "-e 6378137,",
                              "-e -1,298",
                              "--shift nadcon:/nowhere",
                              "--shift ntv2:/nowhere",
                              "--shift ntv2:",
                              "--shift other:x",
                              "--inverse",
                              "--shift molodensky:1,2,3",
                              "--shift molodensky:1,2 --from-ellipsoid grs80",
                              "--shift molodensky:1,2,3,4 --from-ellipsoid grs80",
                              "--shift molodensky:1,2,x --from-ellipsoid grs80",
                              "--shift molodensky:1,2,inf --from-ellipsoid grs80",
                              "--shift helmert:1,2,3,4,5,6 --from-ellipsoid grs80",
                              "--shift helmert:0,0,0,0,0,0,-1e6 --from-ellipsoid grs80",
                              "--shift nadcon:/nowhere --from-ellipsoid grs80",
                              "--from-ellipsoid grs80",
                              "--shift molodensky:1,2,3 --from-ellipsoid Nowhere",
                              "--geoid /nowhere",
                              "--geoid-to-ellipsoid",
                              "--format dm",
                              "-p 99",
                              "--to moon",
                              "--hemisphere front --reverse lat"}) {
    const Outcome r = shell(std::string("tidewater convert ") + options, "1 1\n");
    EXPECT_EQ(r.status, 2) << options;
    EXPECT_EQ(r.out, "") << options;
    EXPECT_NE(r.err, "") << options;
  }
  EXPECT_EQ(shell("tidewater").status, 2);
  EXPECT_EQ(shell("tidewater nothing").status, 2);
  EXPECT_EQ(shell("tidewater --help").status, 0);
  EXPECT_EQ(shell("tidewater --version").out, TIDEWATER_VERSION "\n");
}

TEST(Convert, ExamplesOfTheHelpWorkAsPrinted) {
  const Outcome help = shell("tidewater convert --help");
  EXPECT_EQ(help.status, 0);
  int examples = 0;
  for (const std::string& line : lines(help.out)) {
    const std::size_t start = line.find_first_not_of(' ');
    if (start == std::string::npos || line.compare(start, 5, "echo ") != 0) continue;
    const Outcome r = shell(line);
    EXPECT_EQ(r.status, 0) << line << r.err;
    EXPECT_NE(r.err.find("1 converted, 0 outside the grids, 0 refused"), std::string::npos) << line;
    ++examples;
  }
  EXPECT_EQ(examples, 5);
}

TEST(Convert, AFullDiskIsSaid) {
  if (!std::filesystem::exists("/dev/full")) GTEST_SKIP() << "no /dev/full here";
  const Outcome r = shell("tidewater convert >/dev/full", "1 1\n");
  EXPECT_EQ(r.status, 2);
  EXPECT_NE(r.err.find("standard output cannot be written"), std::string::npos) << r.err;
}

TEST(Convert, ProgressOnATerminalForLongFiles) {
  if (shell("command -v script").status != 0) GTEST_SKIP() << "no terminal to be had";
  const ScratchFolder scratch;
  std::string input;
  while (input.size() < (6u << 20)) input += "12.5 33.25 some name behind the position\n";
  scratch.write("long", input);
  const std::string f = scratch.path().string();
  const Outcome r = shell("script -qec 'tidewater convert --to geodetic " + f + "/long >" + f +
                          "/out' /dev/null");
  EXPECT_NE(r.out.find("%"), std::string::npos);
  EXPECT_NE(r.out.find("##"), std::string::npos);
  // not where standard error is no terminal
  const Outcome quiet = shell("tidewater convert --to geodetic " + f + "/long >/dev/null");
  EXPECT_EQ(quiet.err.find('#'), std::string::npos);
}

}  // namespace
