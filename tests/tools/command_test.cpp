// What all subcommands have in common: sentences for what cannot be done, exit statuses, full
// disks, documents.
#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "command.hpp"
#include "support/grids.hpp"

using namespace tidewater::test;

namespace {

void expect_refused(const std::string& command, const std::string& sentence,
                    const std::string& input = "48.85 2.35\n") {
  const Outcome r = shell(command, input);
  EXPECT_EQ(r.status, 2) << command;
  EXPECT_NE(r.err.find(sentence), std::string::npos) << command << '\n' << r.err;
}

void expect_marked(const std::string& command, const std::string& input, const std::string& out,
                   const std::string& reason) {
  const Outcome r = shell(command, input);
  EXPECT_EQ(r.status, 1) << command << input;
  EXPECT_EQ(r.out, out) << command << input;
  EXPECT_NE(r.err.find(reason), std::string::npos) << r.err;
}

TEST(Command, TheNearestWordIsSuggested) {
  expect_refused("tidewater convrt", "did you mean \"convert\"?");
  expect_refused("tidewater convert --form EPSG:2154", "did you mean \"--from\"?");
  expect_refused("tidewater systems serach x", "did you mean \"search\"?");
  expect_refused("tidewater line --rhum=1", "did you mean \"--rhumb\"?");
  expect_refused("tidewater convert --to 'lambert 92'", "RGF93 v1 / Lambert-93");
}

TEST(Command, GridsThatCannotBeUsedEndTheRunBeforeItsFirstFigure) {
  if (proj_data().empty() || !std::filesystem::exists(proj_data() / "ntf_r93.gsb")) {
    GTEST_SKIP() << "ntf_r93.gsb is not installed";
  }
  const ScratchFolder scratch;
  const std::string f = scratch.path().string();
  const std::string whole = contents(proj_data() / "ntf_r93.gsb");
  scratch.write("short.gsb", whole.substr(0, whole.size() / 2));
  scratch.write("junk.gsb", "junk");
  std::filesystem::create_directory(scratch.path() / "empty");
  const std::string start = "tidewater convert --to wgs84 --grid ";
  expect_refused(start + f + "/short.gsb", "short.gsb");
  expect_refused(start + f + "/junk.gsb", "junk.gsb");
  expect_refused(start + f + "/none.gsb", "There is no grid file");
  expect_refused(start + f + "/empty", "no grids in this folder");
  expect_refused("tidewater geoid " + f + "/junk.gsb 1 2", "junk.gsb");
  for (const char* grid : {"/short.gsb", "/junk.gsb", "/none.gsb", "/empty"}) {
    EXPECT_EQ(shell(start + f + grid, "48.85 2.35\n").out, "") << grid;
  }
}

TEST(Command, ATruncatedGridOfAnyFormEndsTheRun) {
  const auto place = [](int r, int c) { return static_cast<float>(0.01 * (3 * r + c)); };
  const std::string grid = GridFile{-80, 30, 30, 30, place}.bytes();
  GsbFile national;
  national.grids.push_back(
      {"ROOT", "NONE", 30 * 3600.0, 60 * 3600.0, 50 * 3600.0, 80 * 3600.0, 3600, place, place});
  const std::string line = "40.3 -65.4 10\n";
  const struct {
    const char* name;
    std::string bytes, options;
  } kCases[] = {{"g.las", grid, "--grid g.las"},
                {"g.los", grid, "--grid g.las"},
                {"g.las", grid, "--shift nadcon:."},
                {"g.geo", grid, "--height --geoid g.geo"},
                {"n.gsb", national.bytes(), "--grid n.gsb"},
                {"n.gsb", national.bytes(), "--shift ntv2:."}};
  for (const auto& c : kCases) {
    const ScratchFolder folder;
    for (const char* name : {"g.las", "g.los", "g.geo"}) folder.write(name, grid);
    folder.write("n.gsb", national.bytes());
    folder.write("area.par", std::string(c.options).ends_with("ntv2:.") ? "n\n" : "g\n");
    const std::string command =
        "cd " + folder.path().string() + "; tidewater convert --to geodetic " + c.options;
    EXPECT_EQ(shell(command, line).status, 0) << command << shell(command, line).err;
    // Behind the header, in the middle, and a byte before the end.
    for (const std::size_t size : {std::size_t{400}, c.bytes.size() / 2, c.bytes.size() - 1}) {
      // The end of a .gsb says nothing that is read.
      if (size + 1 == c.bytes.size() && std::string(c.name) == "n.gsb") continue;
      folder.write(c.name, c.bytes.substr(0, size));
      const Outcome r = shell(command, line + line);
      EXPECT_EQ(r.status, 2) << command << " " << size;
      EXPECT_EQ(r.out, "") << command << " " << size;
      EXPECT_NE(r.err.find(std::string(c.name).substr(0, 1)), std::string::npos) << r.err;
    }
  }
}

TEST(Command, LinesThatAreWrongSayWhatToTry) {
  expect_marked("tidewater convert", "98.39 -4.49 x\n", "* * x\n",
                "if the longitude stands first, say --order lon-lat");
  expect_marked("tidewater convert", "98.39 -4.49 x\n", "* * x\n", "latitude 98.39 out of range");
  expect_marked("tidewater convert --to wgs84", "48,39 -4,49 x\n", "* * x\n", "--decimal comma");
  expect_marked("tidewater convert --to EPSG:2154", "1.3 103.8 Singapore\n", "* * Singapore\n",
                "far outside the area of use");
  expect_marked("tidewater convert --from EPSG:2154 --to wgs84", "0 -6000000 x\n", "* * x\n",
                "far outside the area of use");
  EXPECT_EQ(shell("tidewater convert --to EPSG:2154 --anywhere", "1.3 103.8 Singapore\n").status,
            0);
  expect_marked("tidewater convert --from utm --to wgs84", "389969 5360749 x\n", "* * x\n",
                "no zone such as 30N");
  expect_marked("tidewater convert --from mgrs --to wgs84", "31IDQ x\n", "* * x\n",
                "(TW_BAD_TEXT)");
}

TEST(Command, ResultsThatAreNoNumbersAreRefused) {
  expect_refused("tidewater convert -e 6378137,1.000001", "inverse flattening");
  // beyond what the projection reaches
  const Outcome r = shell("tidewater convert --to EPSG:3857 --anywhere", "90 0 pole\n");
  EXPECT_EQ(r.out.find("nan"), std::string::npos);
  EXPECT_EQ(r.out.find("inf"), std::string::npos);
}

TEST(Command, ZeroHasNoSign) {
  const std::string line = "-0.000000000001 -0.000000000001\n";
  EXPECT_EQ(shell("tidewater convert --to wgs84 -p 3", line).out, "0.000 0.000\n");
  EXPECT_EQ(
      shell("tidewater convert --to wgs84 -p 1 --out-format dms --out-hemisphere behind", line).out,
      "0:00:00.0N 0:00:00.0E\n");
}

TEST(Command, AFullDiskIsSaidByEverySubcommand) {
  if (!std::filesystem::exists("/dev/full")) GTEST_SKIP() << "no /dev/full here";
  const ScratchFolder folder;
  folder.write("g.geo", GridFile{-80, 30, 30, 30, [](int, int) { return 1.0F; }}.bytes());
  const std::string grid = (folder.path() / "g.geo").string();
  const std::string positions = "48 3 48 4\n", table = "lat,lon\n48,3\n";
  const std::string json = R"({"type":"Point","coordinates":[3,48]})";
  const std::pair<std::string, std::string> kCommands[] = {
      {"--help", ""},
      {"--version", ""},
      {"convert --help", ""},
      {"convert", positions},
      {"convert --to wgs84", positions},
      {"convert --describe", ""},
      {"convert --csv --to 2154", table},
      {"convert --geojson --to 2154", json},
      {"line", positions},
      {"line --points 3", positions},
      {"line --points 3 --as csv", positions},
      {"line --points 3 --as geojson", positions},
      {"line --area", "0 0\n0 1\n1 1\n"},
      {"line --csv", "lat1,lon1,lat2,lon2\n1,2,3,4\n"},
      {"magnetic --date 2026 1 2", ""},
      {"magnetic --date 2026 -f -", positions},
      {"magnetic --date 2026 --csv -f -", table},
      {"factors --system 2154", positions},
      {"factors --system 2154 --json", positions},
      {"geoid " + grid + " 45 -65", ""},
      {"geoid " + grid + " -f -", "45 -65\n"},
      {"systems list", ""},
      {"systems list methods", ""},
      {"systems list zones --json", ""},
      {"systems search lambert", ""},
      {"systems show 2154", ""},
      {"systems show 2154 --as wkt2", ""},
      {"systems show 27700 --to 4326 --json", ""},
      {"doctor", ""},
      {"doctor --json", ""}};
  for (const auto& [command, input] : kCommands) {
    EXPECT_EQ(shell("tidewater " + command, input).status, 0) << command;
    const Outcome r = shell("tidewater " + command + " >/dev/full", input);
    EXPECT_EQ(r.status, 2) << command;
    EXPECT_NE(r.err.find("standard output cannot be written"), std::string::npos) << command;
  }
  // No file of these processes may grow at all; what they say goes through a pipe.
  const Outcome documents = shell("(ulimit -f 0; trap '' XFSZ; tidewater documents " +
                                  folder.path().string() + "/d 2>&1; echo $?) | cat");
  EXPECT_NE(documents.out.find("cannot be written\n2\n"), std::string::npos) << documents.out;
}

TEST(Command, TablesThatCannotBeRead) {
  expect_refused("tidewater convert --csv --to 2154", "--x must name a column; the table has a, b",
                 "a,b\n1,2\n");
  expect_refused("tidewater convert --csv --to 2154 --x c", "the table has no column \"c\"",
                 "a,b\n1,2\n");
  expect_marked("tidewater convert --csv --to 2154", "lat,lon\n46.5\n46.5,x\n",
                "lat,lon,easting,northing\n46.5,*,*\n46.5,x,*,*\n", "column lon");
}

TEST(Command, GeoJsonThatCannotBeRead) {
  const std::string command = "tidewater convert --geojson --to EPSG:2154";
  for (const char* text :
       {"{", "[1,2", R"({"type":"Point","coordinates":["a"]})", R"({"coordinates":[1]})",
        R"({"coordinates":[[1,2],3]})", R"({"coordinates":[[[[[[[1,2]]]]]]]})",
        R"({"coordinates":{"x":1}} garbage)"}) {
    const Outcome r = shell(command, text);
    EXPECT_EQ(r.status, 2) << text << r.out;
    EXPECT_NE(r.err.find("tidewater: standard input: "), std::string::npos) << r.err;
  }
  EXPECT_EQ(shell(command, garbage_text(100000)).status, 2);
  // a geometry of which a position is far outside becomes null, and the others stay
  expect_marked(
      command,
      R"({"type":"FeatureCollection","features":[{"geometry":{"type":"Point","coordinates":[100,1]},"coordinates":[1,2]},{"geometry":{"type":"Point","coordinates":[3,46.5]},"bbox":[1,2,3,4]}]})",
      R"({"type":"FeatureCollection","crs":{"type":"name","properties":{"name":"urn:ogc:def:crs:EPSG::2154"}},"features":[{"geometry":null,"coordinates":[1,2]},{"geometry":{"type":"Point","coordinates":[700000.000,6600000.000]}}]})"
      "\n",
      "geometry 1: [100.0,1.0]: far outside");
}

TEST(Command, DocumentsAreMadeFromTheOptions) {
  const ScratchFolder scratch;
  const std::string f = scratch.path().string();
  ASSERT_EQ(shell("tidewater documents " + f).status, 0);
  const std::string page = contents(scratch.path() / "man1" / "tidewater-convert.1");
  EXPECT_NE(page.find("\\-\\-no\\-shift"), std::string::npos);
  // bash offers what there is
  const std::string load = "source " + f + "/completions/tidewater.bash; ";
  const auto offered = [&](const std::string& words, int at) {
    return shell(load + "COMP_WORDS=(" + words + "); COMP_CWORD=" + std::to_string(at) +
                 "; _tidewater; echo ${COMPREPLY[@]}")
        .out;
  };
  EXPECT_EQ(offered("tidewater conv", 1), "convert\n");
  EXPECT_EQ(offered("tidewater convert --no", 2), "--no-shift\n");
  EXPECT_EQ(offered("tidewater convert --order ''", 3), "lat-lon lon-lat\n");
  EXPECT_EQ(offered("tidewater systems sh", 2), "show\n");
}

TEST(Command, MemoryDoesNotGrowWithTheInput) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "a sanitizer has memory of its own";
#endif
  if (shell("command -v python3").status != 0) GTEST_SKIP() << "python3 is not installed";
  const ScratchFolder scratch;
  scratch.write("peak.py",
                "import resource, subprocess\n"
                "subprocess.run(['bash', '-c', \"yes '48.3903 -4.4863 Brest' | head -n 2000000 | "
                "tidewater convert --to utm 2>/dev/null >/dev/null\"])\n"
                "print(resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss)\n");
  const Outcome r = shell("python3 " + scratch.path().string() + "/peak.py");
  EXPECT_LT(numbers(r.out).at(0), 64 * 1024) << "KB";
}

}  // namespace
