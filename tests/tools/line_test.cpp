#include <gtest/gtest.h>

#include <cmath>
#include <random>
#include <sstream>
#include <string>
#include <vector>

#include "command.hpp"
#include "support/geographiclib_peer.hpp"
#include "support/points.hpp"

using namespace tidewater::test;

namespace {

// Runs python3 on what a command writes: its json module reads it back.
std::string python(const std::string& command, const std::string& program,
                   const std::string& input) {
  const ScratchFolder scratch;
  scratch.write(
      "program.py",
      "import json, sys\ndata = json.load(open(sys.argv[1], encoding='utf-8'))\n" + program);
  const std::string f = scratch.path().string();
  const Outcome r = shell(
      command + " >" + f + "/out && true; PYTHONUTF8=1 python3 " + f + "/program.py " + f + "/out",
      input);
  return r.status == 0 ? r.out : r.out + r.err;
}

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
std::vector<double> solved(const std::string& options, const std::string& line) {
  return numbers(shell("tidewater line " + options, line + "\n").out);
}

double turn_between(double a, double b) { return std::fabs(std::remainder(a - b, 360)); }

// Metres between two positions in degrees.
double apart(const GeographicLib::Geodesic& earth, double lat1, double lon1, double lat2,
             double lon2) {
  double distance = 0;
  earth.Inverse(lat1, lon1, lat2, lon2, distance);
  return distance;
}

std::string position_line(std::initializer_list<double> fields) {
  std::ostringstream text;
  text.precision(12);
  text << std::fixed;
  for (const double field : fields) text << field << ' ';
  return text.str() + '\n';
}
#endif

TEST(Line, VincentysPublishedLine) {
  // Geoscience Australia, Flinders Peak to Buninyong on GRS 80: 54972.271 m, 306 52 05.37 and back
  // 127 10 25.07
  const std::string line =
      "-37:57:03.72030 144:25:29.52440 -37:39:10.15610 143:55:35.38390 Buninyong\n";
  const Outcome r = shell("tidewater line --format dms --out-format dms -p 2", line);
  EXPECT_EQ(r.out, "306:52:05.37 127:10:25.07 54972.271 Buninyong\n");
  EXPECT_EQ(r.err, "1 solved, 0 refused\n");
  EXPECT_EQ(r.status, 0);
  const Outcome direct = shell("tidewater line --direct --format dms --out-format dms -p 4",
                               "-37:57:03.72030 144:25:29.52440 306:52:05.37 54972.271 Flinders\n");
  // the azimuth given is rounded to 0.01, and so is the published one back
  EXPECT_EQ(direct.out.substr(0, 41), "-37:39:10.1561 143:55:35.3839 127:10:25.0") << direct.err;
}

TEST(Line, GeodesicsAgreeWithThePeer) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const GeographicLib::Geodesic earth(6378137, 1 / 298.257222101);
  std::mt19937 random(11);
  std::uniform_real_distribution<double> lat(-90, 90), lon(-180, 180), log_distance(-1, 7.2);
  std::string inverse, direct;
  for (int i = 0; i < 2000; ++i) {
    inverse += position_line({lat(random), lon(random), lat(random), lon(random)});
    direct +=
        position_line({lat(random), lon(random), lon(random), std::pow(10, log_distance(random))});
  }
  const auto given = lines(inverse);
  const auto got = lines(shell("tidewater line -p 12", inverse).out);
  ASSERT_EQ(got.size(), given.size());
  int refused = 0;
  for (std::size_t i = 0; i < given.size(); ++i) {
    const auto f = numbers(given[i]), g = numbers(got[i]);
    if (g.empty()) {
      ++refused;
      continue;
    }
    double distance = 0, azimuth = 0, ahead = 0;
    earth.Inverse(f[0], f[1], f[2], f[3], distance, azimuth, ahead);
    EXPECT_NEAR(g[2], distance, 1e-3) << given[i];
    // a tenth of a metre across
    const double across = 0.1 / degrees(1) / (6.4e6 * std::sin(distance / 6.371e6));
    EXPECT_LT(turn_between(g[0], azimuth), across) << given[i];
    EXPECT_LT(turn_between(g[1], ahead + 180), across) << given[i];
  }
  EXPECT_LE(refused, 2);  // one random line in some thousands is nearly antipodal
  const auto starts = lines(direct);
  const auto ends = lines(shell("tidewater line --direct -p 12", direct).out);
  ASSERT_EQ(ends.size(), starts.size());
  for (std::size_t i = 0; i < starts.size(); ++i) {
    const auto f = numbers(starts[i]), g = numbers(ends[i]);
    ASSERT_EQ(g.size(), 3u) << starts[i];
    double to_lat = 0, to_lon = 0, ahead = 0;
    earth.Direct(f[0], f[1], f[2], f[3], to_lat, to_lon, ahead);
    // the library's decimetres for lines that pass beside a pole
    EXPECT_LT(apart(earth, g[0], g[1], to_lat, to_lon), 0.1) << starts[i];
    EXPECT_LT(turn_between(g[2], ahead + 180) * std::cos(degrees(to_lat)), 1e-6) << starts[i];
  }
#endif
}

TEST(Line, NearlyAntipodalPointsAreSolved) {
  const Outcome r = shell("tidewater line", "0 0 0 180\n");
  EXPECT_NEAR(numbers(r.out).at(2), 20003931.459, 0.001);  // half a meridian of GRS 80
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const GeographicLib::Geodesic earth(6378137, 1 / 298.257222101);
  std::mt19937 random(12);
  std::uniform_real_distribution<double> lat(-90, 90), lon(-180, 180), near(-1.5, 1.5),
      exponent(-9, 0);
  std::string input;
  for (int i = 0; i < 1500; ++i) {
    const double from_lat =
        i % 3 == 0 ? near(random) * std::pow(10, exponent(random)) : lat(random);
    const double from_lon = lon(random);
    const double scale = i % 3 == 1 ? std::pow(10, exponent(random)) : 1;
    input += position_line({from_lat, from_lon,
                            std::fmax(-90, std::fmin(90, -from_lat + near(random) * scale)),
                            std::remainder(from_lon + 180 + near(random) * scale, 360)});
  }
  const auto given = lines(input);
  const auto answers = lines(shell("tidewater line", input).out);
  ASSERT_EQ(answers.size(), given.size());
  for (std::size_t i = 0; i < given.size(); ++i) {
    const auto f = numbers(given[i]), g = numbers(answers[i]);
    ASSERT_EQ(g.size(), 3u) << given[i];
    // three decimals are written
    EXPECT_NEAR(g[2], apart(earth, f[0], f[1], f[2], f[3]), 0.00051) << given[i];
  }
#endif
}

TEST(Line, LinesThatLeaveDueEastKeepTheirMillimetres) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  // the library's own inverse is up to metres off here, and up to kilometres for the longer ones
  const GeographicLib::Geodesic earth(6378137, 1 / 298.257222101);
  std::mt19937 random(13);
  std::uniform_real_distribution<double> lat(-75, 75), lon(-180, 180), log_distance(-2, 6.5),
      away(-0.001, 0.001);
  std::string input;
  for (int i = 0; i < 1500; ++i) {
    const double from_lat = lat(random), from_lon = lon(random);
    double to_lat = 0, to_lon = 0;
    const double azimuth = 90 + (i % 2 == 0 ? 0 : away(random));
    earth.Direct(from_lat, from_lon, azimuth, std::pow(10, log_distance(random)), to_lat, to_lon);
    input += position_line({from_lat, from_lon, to_lat, to_lon});
  }
  const auto given = lines(input);
  const auto got = lines(shell("tidewater line", input).out);
  ASSERT_EQ(got.size(), given.size());
  for (std::size_t i = 0; i < given.size(); ++i) {
    const auto f = numbers(given[i]), g = numbers(got[i]);
    ASSERT_EQ(g.size(), 3u) << given[i];
    const double wanted = apart(earth, f[0], f[1], f[2], f[3]);
    // beyond 1 km the library's direct problem, by which the line is found, knows 6 cm
    EXPECT_NEAR(g[2], wanted, wanted < 1000 ? 1.1e-3 : 0.1) << given[i];
  }
#endif
}

TEST(Line, MeridiansGoOnBeyondThePole) {
  const std::string input =
      "85 10 0 1000000\n-85 10 180 1000000\n85 10 180 -1000000\n10 20 180 100\n10 20 0 0 still\n";
  const Outcome r = shell("tidewater line --direct", input);
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 5u) << r.err;
  // 85 N is 558 456 m from the pole of GRS 80; 441 544 m lie beyond
  EXPECT_EQ(got[0], "86.046774504 -170.000000000 0.000000000");
  EXPECT_EQ(got[1], "-86.046774504 -170.000000000 180.000000000");
  EXPECT_EQ(got[2], got[0]);
  EXPECT_EQ(numbers(got[3])[2], 0);  // a line to the south looks back to the north
  EXPECT_EQ(got[4], "10.000000000 20.000000000 180.000000000 still");
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const GeographicLib::Geodesic earth(6378137, 1 / 298.257222101);
  double lat = 0, lon = 0;
  earth.Direct(85, 10, 0, 1000000, lat, lon);
  EXPECT_LT(apart(earth, 86.046774504, -170, lat, lon), 1e-3);
  // once and a half round the world
  earth.Direct(40, 10, 180, 60e6, lat, lon);
  const auto end = solved("--direct", "40 10 180 60000000");
  EXPECT_LT(apart(earth, end.at(0), end.at(1), lat, lon), 1e-3);
#endif
}

TEST(Line, PolesHaveTheAzimuthsOfTheirLongitudes) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const GeographicLib::Geodesic earth(6378137, 1 / 298.257222101);
  const double ends[][4] = {{90, 10, 60, 50},   {-90, 10, 60, 50}, {60, 50, 90, 10},
                            {60, 50, -90, -10}, {90, 30, -90, 40}, {90, -170, 45, 170}};
  for (const auto& p : ends) {
    double distance = 0, azimuth = 0, ahead = 0;
    earth.Inverse(p[0], p[1], p[2], p[3], distance, azimuth, ahead);
    const auto n = solved("-p 9", position_line({p[0], p[1], p[2], p[3]}));
    ASSERT_EQ(n.size(), 3u);
    EXPECT_NEAR(n[2], distance, 1e-3);
    const bool pole_to_pole = std::fabs(p[0]) == 90 && std::fabs(p[2]) == 90;
    if (!pole_to_pole) {  // any meridian serves between the poles
      EXPECT_LT(turn_between(n[0], azimuth), 1e-8) << p[0] << ' ' << p[2];
      EXPECT_LT(turn_between(n[1], ahead + 180), 1e-8) << p[0] << ' ' << p[2];
    }
    const auto there = solved("--direct", position_line({p[0], p[1], n[0], n[2]}));
    EXPECT_LT(apart(earth, there.at(0), there.at(1), p[2], p[3]), 2e-3) << p[0] << ' ' << p[2];
  }
#endif
}

TEST(Line, StartsNearAPole) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  // 56 m from the pole, nearly along the parallel
  const GeographicLib::Geodesic earth(6378137, 1 / 298.257222101);
  double lat = 0, lon = 0;
  earth.Direct(-89.9995056796, -10, 90.049998243, 19029262, lat, lon);
  const auto n = solved("--direct", "-89.9995056796 -10 90.049998243 19029262 x");
  ASSERT_EQ(n.size(), 3u);
  EXPECT_LT(apart(earth, n[0], n[1], lat, lon), 1e-3);
#endif
}

TEST(Line, OnTheSphereByHand) {
  // a degree of a great circle of the radius 180/pi * 1000 is 1000 long
  const std::string sphere = "-p 6 -e 57295.77951308232,0 ";
  EXPECT_EQ(shell("tidewater line " + sphere, "0 10 0 -20\n0 0 30 90\n").out,
            "270.000000 90.000000 30000.000\n60.000000 270.000000 90000.000\n");
  EXPECT_EQ(
      shell("tidewater line --direct " + sphere, "0 0 90 90000\n60 0 0 200000\n0 170 90 30000\n")
          .out,
      "0.000000 90.000000 270.000000\n-80.000000 180.000000 0.000000\n"
      "0.000000 -160.000000 270.000000\n");
  // along a parallel of 60 degrees a degree of longitude is 500 long
  EXPECT_EQ(shell("tidewater line --rhumb " + sphere, "60 175 60 -175\n60 -175 60 175\n").out,
            "90.000000 270.000000 5000.000\n270.000000 90.000000 5000.000\n");
  EXPECT_EQ(shell("tidewater line --rhumb --direct " + sphere,
                  "60 175 90 5000\n60 -175 270 5000\n60 -175 90 -5000\n")
                .out,
            "60.000000 -175.000000 270.000000\n60.000000 175.000000 90.000000\n"
            "60.000000 175.000000 90.000000\n");
}

TEST(Line, RhumbLinesAgreeWithThePeer) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const GeographicLib::Geodesic earth(6378137, 1 / 298.257222101);
  const GeographicLib::Rhumb rhumb(6378137, 1 / 298.257222101);
  std::mt19937 random(14);
  std::uniform_real_distribution<double> lat(-89, 89), lon(-180, 180), exponent(-12, 0),
      part(-1, 1), log_distance(-1, 6.5);
  std::string inverse, direct;
  for (int i = 0; i < 1500; ++i) {
    const double from = lat(random);
    // every other one is nearly or exactly along a parallel
    const double to = i % 4 == 0   ? from
                      : i % 2 == 0 ? from + part(random) * std::pow(10, exponent(random))
                                   : lat(random);
    inverse += position_line({from, lon(random), to, lon(random)});
    const double azimuth = i % 4 == 0   ? 270
                           : i % 2 == 0 ? 90 + part(random) * std::pow(10, exponent(random))
                                        : lon(random);
    direct +=
        position_line({lat(random) / 2, lon(random), azimuth, std::pow(10, log_distance(random))});
  }
  const auto given = lines(inverse);
  const auto got = lines(shell("tidewater line --rhumb -p 10", inverse).out);
  ASSERT_EQ(got.size(), given.size());
  for (std::size_t i = 0; i < given.size(); ++i) {
    const auto f = numbers(given[i]), g = numbers(got[i]);
    ASSERT_EQ(g.size(), 3u) << given[i];
    double distance = 0, azimuth = 0;
    rhumb.Inverse(f[0], f[1], f[2], f[3], distance, azimuth);
    // a centimetre where the latitude changes by some metres over half the world
    EXPECT_NEAR(g[2], distance, 0.012) << given[i];
    EXPECT_LT(turn_between(g[0], azimuth), 1e-7) << given[i];
    EXPECT_LT(turn_between(g[1], azimuth + 180), 1e-7) << given[i];
  }
  const auto starts = lines(direct);
  const auto ends = lines(shell("tidewater line --rhumb --direct -p 10", direct).out);
  ASSERT_EQ(ends.size(), starts.size());
  for (std::size_t i = 0; i < starts.size(); ++i) {
    const auto f = numbers(starts[i]), g = numbers(ends[i]);
    ASSERT_EQ(g.size(), 3u) << starts[i];
    double to_lat = 0, to_lon = 0;
    rhumb.Direct(f[0], f[1], f[2], f[3], to_lat, to_lon);
    EXPECT_LT(apart(earth, g[0], g[1], to_lat, to_lon), 0.01) << starts[i];
  }
#endif
}

TEST(Line, RhumbLinesEndAtAPoleAndNotBeyond) {
  // Along the meridian: the quarter of GRS 80 is 10001965.729 m, and that of 10 degrees 1105854.833
  const Outcome inverse = shell("tidewater line --rhumb", "90 0 10 10 a\n10 10 -90 0 b\n");
  const auto ends = lines(inverse.out);
  ASSERT_EQ(ends.size(), 2u) << inverse.err;
  EXPECT_NEAR(numbers(ends[0]).at(2), 10001965.729 - 1105854.833, 0.001);
  EXPECT_NEAR(numbers(ends[1]).at(2), 10001965.729 + 1105854.833, 0.001);
  // the pole is 558 456 m away, or as much over the cosine of 60 degrees
  const Outcome direct = shell("tidewater line --rhumb --direct",
                               "85 0 0 558400\n85 0 0 558500\n85 0 60 1116800\n85 0 60 1117000\n");
  const auto got = lines(direct.out);
  ASSERT_EQ(got.size(), 4u);
  EXPECT_EQ(numbers(got[0]).size(), 3u);
  EXPECT_EQ(got[1], "* * *");
  EXPECT_EQ(numbers(got[2]).size(), 3u);
  EXPECT_EQ(got[3], "* * *");
  EXPECT_NE(direct.err.find("the rhumb line reaches a pole (TW_RANGE_ERROR)"), std::string::npos);
}

TEST(Line, AngleFormatsOfConvert) {
  EXPECT_EQ(shell("tidewater line --direct --format dms --hemisphere behind --order lon-lat "
                  "--out-format grads --out-hemisphere front --out-order lon-lat -p 4 "
                  "-e 57295.77951308232,0",
                  "10:00:00W 0:00:00N 90:00:00 19000; a\n")
                .out,
            "E10.0000 N0.0000 300.0000; a\n");
  EXPECT_EQ(shell("tidewater line --format packed --reverse lon --out-format packed -p 0 "
                  "-e 57295.77951308232,0",
                  "0.0000 10.3000 0.0000 -10.3000\n")
                .out,
            "90.0000 270.0000 21000.000\n");
}

TEST(Line, WhatIsNoLineIsPassedThroughOrRefused) {
  const Outcome r = shell("tidewater line --direct",
                          "# a comment\n\n10 20 0 0, kept, as is\n10 20 0\n10 20 361 5\n"
                          "91 20 0 5 a\n10 20 x 5 b\n10 20 0 1e5 c\n");
  EXPECT_EQ(r.out,
            "# a comment\n\n10.000000000 20.000000000 180.000000000, kept, as is\n* * *\n* * *\n"
            "* * * a\n* * * b\n* * * c\n");
  EXPECT_NE(r.err.find("standard input:4: \"10 20 0\": the distance is no number (TW_BAD_TEXT)"),
            std::string::npos)
      << r.err;
  EXPECT_NE(r.err.find("\"10 20 361 5\": an azimuth beyond 360 degrees (TW_RANGE_ERROR)"),
            std::string::npos)
      << r.err;
  EXPECT_NE(r.err.find("(TW_BAD_LATITUDE)"), std::string::npos);
  EXPECT_NE(r.err.find("1 solved, 5 refused"), std::string::npos) << r.err;
  EXPECT_EQ(r.status, 1);
  const Outcome inverse = shell("tidewater line", "1 2 3\n1 2 3 4x d\n1 2 3 4 5 e\n");
  const auto got = lines(inverse.out);
  EXPECT_EQ(got.at(0), "* * *");
  EXPECT_EQ(got.at(1), "* * * d");
  EXPECT_EQ(got.at(2).substr(got.at(2).size() - 4), " 5 e");
}

TEST(Line, PointsAsText) {
  const std::string sphere = " -p 1 -e 57295.77951308232,0";
  EXPECT_EQ(
      shell("tidewater line --points 3" + sphere, "0 170 0 -160 a\n# note\nbad\n0 0 10 0\n").out,
      "0.0 170.0 a\n0.0 -175.0 a\n0.0 -160.0 a\n# note\n\n* *\n\n0.0 0.0\n5.0 0.0\n"
      "10.0 0.0\n");
  // whole spacings; a remainder ends at the line's own end, in the direct problem too
  EXPECT_EQ(shell("tidewater line --spacing 5000" + sphere, "0 0 0 10\n").out,
            "0.0 0.0\n0.0 5.0\n0.0 10.0\n");
  EXPECT_EQ(
      shell("tidewater line --direct --spacing 4000 --out-order lon-lat" + sphere, "0 0 90 10000\n")
          .out,
      "0.0 0.0\n4.0 0.0\n8.0 0.0\n10.0 0.0\n");
  // a spacing above the length leaves the ends
  EXPECT_EQ(shell("tidewater line --spacing 20000" + sphere, "0 0 0 10\n0 0 0 0\n").out,
            "0.0 0.0\n0.0 10.0\n\n0.0 0.0\n0.0 0.0\n");
  // to the west along a parallel
  EXPECT_EQ(shell("tidewater line --rhumb --points 3" + sphere, "60 -170 60 160\n").out,
            "60.0 -170.0\n60.0 175.0\n60.0 160.0\n");
  // over a pole
  EXPECT_EQ(shell("tidewater line --direct --spacing 10000" + sphere, "80 0 0 20000\n").out,
            "80.0 0.0\n90.0 0.0\n80.0 180.0\n");
}

TEST(Line, PointsLieOnTheLine) {
  TIDEWATER_NEED_GEOGRAPHICLIB();
#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
  const GeographicLib::Geodesic earth(6378137, 1 / 298.257222101);
  const GeographicLib::Rhumb rhumb(6378137, 1 / 298.257222101);
  double distance = 0, azimuth = 0, ahead = 0;
  const std::string line = "48.3903 -4.4863 46.8139 -71.2082\n";
  earth.Inverse(48.3903, -4.4863, 46.8139, -71.2082, distance, azimuth, ahead);
  const auto geodesic = lines(shell("tidewater line --points 11", line).out);
  ASSERT_EQ(geodesic.size(), 11u);
  for (std::size_t i = 0; i < geodesic.size(); ++i) {
    double lat = 0, lon = 0;
    earth.Direct(48.3903, -4.4863, azimuth, distance * static_cast<double>(i) / 10, lat, lon);
    const auto p = numbers(geodesic[i]);
    EXPECT_LT(apart(earth, p.at(0), p.at(1), lat, lon), 1e-3) << i;
  }
  rhumb.Inverse(48.3903, -4.4863, 46.8139, -71.2082, distance, azimuth);
  const auto course = lines(shell("tidewater line --rhumb --spacing 1000000", line).out);
  ASSERT_EQ(course.size(), 7u);  // 5020 km
  for (std::size_t i = 0; i < course.size(); ++i) {
    double lat = 0, lon = 0;
    rhumb.Direct(48.3903, -4.4863, azimuth, std::fmin(1e6 * static_cast<double>(i), distance), lat,
                 lon);
    const auto p = numbers(course[i]);
    EXPECT_LT(apart(earth, p.at(0), p.at(1), lat, lon), 1e-3) << i;
  }
#endif
}

TEST(Line, PointsAsCsv) {
  const Outcome r = shell("tidewater line --as csv --points 2 -p 2 --out-format dms",
                          "# note\n10 20 11 21 a, b\nbad\n\n30 179 30 -179\n");
  EXPECT_EQ(r.out,
            "line,point,lon,lat\n1,1,20.00,10.00\n1,2,21.00,11.00\n3,1,179.00,30.00\n"
            "3,2,-179.00,30.00\n");
  EXPECT_NE(r.err.find("2 solved, 1 refused"), std::string::npos);
}

TEST(Line, PointsAsGeoJson) {
  if (shell("command -v python3").status != 0) GTEST_SKIP() << "python3 is not installed";
  const std::string command = "tidewater line --as geojson --points 3 -p 6 -e 57295.77951308232,0";
  EXPECT_EQ(python(command,
                   "print(data['type'])\n"
                   "for f in data['features']:\n"
                   "  g = f['geometry']\n"
                   "  print(f['type'], g['type'], g['coordinates'], f['properties'])\n",
                   "# note\n0 170 0 -170 over the line\nbad\n0 0 10 0\n"),
            "FeatureCollection\n"
            "Feature LineString [[170.0, 0.0], [180.0, 0.0], [190.0, 0.0]] "
            "{'azimuth': 90.0, 'distance': 20000.0, 'text': 'over the line'}\n"
            "Feature LineString [[0.0, 0.0], [0.0, 5.0], [0.0, 10.0]] "
            "{'azimuth': 0.0, 'distance': 10000.0, 'text': ''}\n");
  EXPECT_EQ(python(command, "print(data)\n", ""),
            "{'type': 'FeatureCollection', 'features': []}\n");
}

TEST(Line, GeoJsonIsValidWhateverTheTextHolds) {
  if (shell("command -v python3").status != 0) GTEST_SKIP() << "python3 is not installed";
  using namespace std::string_literals;
  // quotes and backslashes, every control character, characters of two, three and four bytes; a
  // lone tail byte, overlong forms, a surrogate, beyond the last character, and one cut off
  const std::string text = "\"q\" \\ \x01\x1f\x7f\t "s + "\0"s +
                           " \xc3\xa9\xe2\x82\xac\xf0\x9f\x8c\x8a" +
                           " \x80 \xc0\xaf \xe0\x80\xaf \xed\xa0\x80 \xf4\x90\x80\x80 \xe2\x82";
  const std::string seen =
      "print(json.dumps(data['features'][0]['properties']['text'], ensure_ascii=True))\n";
  EXPECT_EQ(python("tidewater line --as geojson --points 2", seen, "0 0 1 1, " + text + "\n"),
            "\"\\\"q\\\" \\\\ \\u0001\\u001f\\u007f\\t \\u0000 \\u00e9\\u20ac\\ud83c\\udf0a"
            " \\ufffd \\ufffd\\ufffd \\ufffd\\ufffd\\ufffd \\ufffd\\ufffd\\ufffd"
            " \\ufffd\\ufffd\\ufffd\\ufffd \\ufffd\\ufffd\"\n");
  std::string garbage;
  unsigned state = 1;
  for (int i = 0; i < 20000; ++i) {
    if (i % 40 == 0) garbage += "\n0 0 1 1 ";
    state = state * 1664525u + 1013904223u;
    garbage += static_cast<char>(state >> 24);
  }
  const std::string counted =
      python("tidewater line --as geojson --points 2", "print(len(data['features']))\n", garbage);
  EXPECT_GT(std::atoi(counted.c_str()), 450) << counted;
}

TEST(Line, ManyPointsInBoundedMemory) {
  // 3 million points; were they held, they would not fit
  if (shell("ulimit -v 60000; tidewater --version").status != 0) {
    GTEST_SKIP() << "the command does not start in so little memory, as under a sanitizer";
  }
  const Outcome r =
      shell("ulimit -v 60000; tidewater line --as csv --spacing 1 -p 5 | tail -n 1", "0 0 0 27\n");
  EXPECT_NE(r.out.find(",27.00000,0.00000\n"), std::string::npos) << r.out << r.err;
}

TEST(Line, OptionsThatDoNotFit) {
  for (const char* options :
       {"--points 1", "--points 3 --spacing 5", "--spacing 0", "--spacing -5", "--spacing nan",
        "--as csv", "--as geojson", "--as svg --points 3", "-e Nowhere", "--format dm", "-p 99",
        "--hemisphere front --reverse lat", "/nowhere/file"}) {
    const Outcome r = shell(std::string("tidewater line ") + options, "1 1 2 2\n");
    EXPECT_EQ(r.status, 2) << options;
    EXPECT_EQ(r.out, "") << options;
    EXPECT_NE(r.err, "") << options;
  }
}

TEST(Line, ExamplesOfTheHelpWorkAsPrinted) {
  const Outcome help = shell("tidewater line --help");
  EXPECT_EQ(help.status, 0);
  int examples = 0;
  for (const std::string& line : lines(help.out)) {
    const std::size_t start = line.find_first_not_of(' ');
    if (start == std::string::npos || line.compare(start, 5, "echo ") != 0) continue;
    const Outcome r = shell(line);
    EXPECT_EQ(r.status, 0) << line << r.err;
    EXPECT_EQ(r.err, "1 solved, 0 refused\n") << line;
    EXPECT_NE(r.out, "") << line;
    ++examples;
  }
  EXPECT_EQ(examples, 4);
}

TEST(Line, AFullDiskIsSaid) {
  if (!std::filesystem::exists("/dev/full")) GTEST_SKIP() << "no /dev/full here";
  const Outcome r = shell("tidewater line >/dev/full", "1 1 2 2\n");
  EXPECT_EQ(r.status, 2);
  EXPECT_NE(r.err.find("standard output cannot be written"), std::string::npos) << r.err;
}

}  // namespace
