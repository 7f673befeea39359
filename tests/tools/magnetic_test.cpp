#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "command.hpp"

using namespace tidewater::test;

namespace {

// Runs the command on the store of this build.
Outcome magnetic(const std::string& options, const std::string& input = "") {
  return shell("export TIDEWATER_STORE='" TIDEWATER_STORE "'; tidewater magnetic " + options,
               input);
}

// The figures of an answer, in the order of the header.
struct Figures {
  explicit Figures(const std::string& line) {
    const std::vector<double> all = numbers(line);
    EXPECT_EQ(all.size(), 14u) << line;
    if (all.size() != 14) return;
    D = all[0], I = all[1], H = all[2], F = all[3], X = all[4], Y = all[5], Z = all[6];
    dD = all[7], dI = all[8], dH = all[9], dF = all[10], dX = all[11], dY = all[12], dZ = all[13];
  }

  double D = NAN, I = NAN, H = NAN, F = NAN, X = NAN, Y = NAN, Z = NAN;
  double dD = NAN, dI = NAN, dH = NAN, dF = NAN, dX = NAN, dY = NAN, dZ = NAN;
};

Figures figures(const std::string& options) {
  const Outcome r = magnetic(options);
  const auto got = lines(r.out);
  EXPECT_EQ(got.size(), 2u) << options << r.err;
  return Figures(got.empty() ? "" : got.back());
}

// Half a unit of the last place that is published, and of the one that is written.
constexpr double kNanotesla = 0.1001;
constexpr double kHundredth = 0.0056;

TEST(Magnetic, PublishedTestValuesOfTheWorldMagneticModel) {
  // Test values of the WMM2025 technical report, at height 0, to the digits printed.
  const struct {
    const char* where;
    double X, Y, Z, F, I, D;
  } rows[] = {
      {"--date 2025 80 0", 6521.6, 145.9, 54791.5, 55178.5, 83.21, 1.28},
      {"--date 2025 0 120", 39677.8, -109.6, -10580.2, 41064.3, -14.93, -0.16},
      {"--date 2025 -80 240", 6117.5, 15751.9, -52022.5, 54698.2, -72.00, 68.78},
      {"--date 2027.5 80 0", 6500.8, 294.5, 54869.4, 55253.9, 83.24, 2.59},
  };
  for (const auto& row : rows) {
    const Figures f = figures(row.where);
    EXPECT_NEAR(f.X, row.X, kNanotesla) << row.where;
    EXPECT_NEAR(f.Y, row.Y, kNanotesla) << row.where;
    EXPECT_NEAR(f.Z, row.Z, kNanotesla) << row.where;
    EXPECT_NEAR(f.F, row.F, kNanotesla) << row.where;
    EXPECT_NEAR(f.H, std::hypot(row.X, row.Y), kNanotesla) << row.where;
    EXPECT_NEAR(f.I, row.I, kHundredth) << row.where;
    EXPECT_NEAR(f.D, row.D, kHundredth) << row.where;
  }
}

TEST(Magnetic, YearlyChangeOfTheWorldMagneticModel) {
  // The model is linear in time: a year's change is the difference of the published vectors of
  // 2025 and 2027.5 over 2.5 years, known to two halves of 0.1 nT.
  const Figures f = figures("--date 2025 80 0");
  const double near = 0.1 / 2.5 + 0.0501;
  EXPECT_NEAR(f.dX, (6500.8 - 6521.6) / 2.5, near);
  EXPECT_NEAR(f.dY, (294.5 - 145.9) / 2.5, near);
  EXPECT_NEAR(f.dZ, (54869.4 - 54791.5) / 2.5, near);
  // The rates of the elements are what a year brings.
  for (const char* where : {"80 0", "0 120", "-80 240 100000"}) {
    const Figures now = figures(std::string("--date 2026 ") + where);
    const Figures then = figures(std::string("--date 2027 ") + where);
    EXPECT_NEAR(now.dD, then.D - now.D, 0.00151) << where;
    EXPECT_NEAR(now.dI, then.I - now.I, 0.00151) << where;
    EXPECT_NEAR(now.dH, then.H - now.H, 0.151) << where;
    EXPECT_NEAR(now.dF, then.F - now.F, 0.151) << where;
    EXPECT_NEAR(now.dX, then.X - now.X, 0.151) << where;
  }
}

TEST(Magnetic, TheFieldStandsUprightAtTheDipPolesOfTheIgrf) {
  // Dip poles of IGRF-13 (World Data Center for Geomagnetism, BGS list of poles).
  const struct {
    const char* where;
    double sign;
  } poles[] = {{"--date 1900 70.46 -96.19", 1},
               {"--date 1900 -71.72 148.32", -1},
               {"--date 2020 86.494 162.867", 1},
               {"--date 2020 -64.081 135.866", -1}};
  for (const auto& pole : poles) {
    const Figures f = figures(std::string("--model IGRF-13 ") + pole.where);
    // half a unit of the last place is up to 0.6 km, over which H grows by some nanoteslas
    EXPECT_LT(f.H, 5) << pole.where;
    EXPECT_GT(f.I * pole.sign, 89.99) << pole.where;
  }
}

TEST(Magnetic, TheGenerationInForceIsMeantByTheSeries) {
  // accuracy/harmonics.py: the sum of the 14th generation's coefficients by its definition, 30
  // digits.
  const struct {
    const char* where;
    double X, Y, Z;
  } rows[] = {
      {"--date 2025 80 0", 6527.398, 141.596, 54782.531},
      {"--date 2026.5 48.39 -4.49", 21348.320, -13.758, 42986.403},
      {"--date 2024 -33 151 1000", 24577.841, 5372.576, -50635.511},
      {"--date 2029 0 120 100000", 37719.953, -177.213, -9862.260},
      {"--date 1952.5 48.39 -4.49", 19486.867, -3585.493, 41962.910},
      {"--date 2030 -80 240", 6273.775, 15708.998, -51549.378},
  };
  for (const auto& row : rows) {
    const Figures f = figures(std::string("--model IGRF ") + row.where);
    EXPECT_NEAR(f.X, row.X, 0.0511) << row.where;
    EXPECT_NEAR(f.Y, row.Y, 0.0511) << row.where;
    EXPECT_NEAR(f.Z, row.Z, 0.0511) << row.where;
  }
  const struct {
    const char* asked;
    const char* got;
  } names[] = {{"IGRF", "IGRF-14"},    {"igrf", "IGRF-14"},   {"IGRF14", "IGRF-14"},
               {"IGRF-13", "IGRF-13"}, {"igrf13", "IGRF-13"}, {"WMM", "WMM2025"},
               {"wmm-2025", "WMM2025"}};
  for (const auto& name : names) {
    const Outcome r = magnetic(std::string("--date 2026 --model ") + name.asked + " 1 2");
    EXPECT_EQ(r.err.rfind(std::string(name.got) + " at ", 0) != 0,
              std::string(name.got) == "IGRF-13")  // which warns first
        << r.err;
    EXPECT_NE(r.err.find(std::string(name.got) + " at "), r.err.npos) << r.err;
  }
  for (const char* none : {"IGRF-12", "igr", "IGRF1", "-", "13"}) {
    const Outcome r = magnetic(std::string("--date 2026 --model=") + none + " 1 2");
    EXPECT_EQ(r.status, 2) << none;
    EXPECT_NE(r.err.find(std::string("no magnetic model \"") + none + "\""), r.err.npos) << r.err;
  }
}

TEST(Magnetic, BetweenTwoEpochsTheIgrfIsTheirMean) {
  const Figures before = figures("--model IGRF-13 --date 1950 48.39 -4.49");
  const Figures after = figures("--model IGRF-13 --date 1955 48.39 -4.49");
  const Figures between = figures("--model IGRF-13 --date 1952.5 48.39 -4.49");
  EXPECT_NEAR(between.X, (before.X + after.X) / 2, kNanotesla);
  EXPECT_NEAR(between.Y, (before.Y + after.Y) / 2, kNanotesla);
  EXPECT_NEAR(between.Z, (before.Z + after.Z) / 2, kNanotesla);
  EXPECT_NEAR(between.dX, (after.X - before.X) / 5, 0.0701);
  EXPECT_NEAR(before.dZ, (after.Z - before.Z) / 5, 0.0701);
}

TEST(Magnetic, HeightsWeakenTheField) {
  // from five to ten radii of the earth: the dipole falls with the cube, and of the rest, which
  // falls faster, a hundredth is left
  const Figures five = figures("--date 2026 10 20 25484800");
  const Figures ten = figures("--date 2026 10 20 57340800");
  EXPECT_NEAR(ten.F / five.F, 1. / 8, 0.003);
  EXPECT_EQ(magnetic("--date 2026 10 20").out, magnetic("--date 2026 10 20 0").out);
}

TEST(Magnetic, DatesAsYearsAndDays) {
  // 182 of 365 days, and 182 of 366
  EXPECT_EQ(magnetic("--date 2026-07-02 1 2").err, "WMM2025 at 2026.499: 1 computed, 0 refused\n");
  EXPECT_EQ(magnetic("--date 2028-07-01 1 2").err, "WMM2025 at 2028.497: 1 computed, 0 refused\n");
  EXPECT_EQ(magnetic("--date 2028-02-29 1 2").status, 0);
  EXPECT_EQ(magnetic("--date 2026-01-01 1 2").out, magnetic("--date 2026 1 2").out);
  EXPECT_EQ(magnetic("--date 2026.25 1 2").err, "WMM2025 at 2026.250: 1 computed, 0 refused\n");
  const Outcome today = magnetic("1 2");
  EXPECT_EQ(today.out, magnetic("--date $(date -u +%F) 1 2").out) << today.err;
  for (const char* bad : {"2026-02-29", "2026-13-01", "2026-00-10", "2026-1-1", "2026/01/01",
                          "yesterday", "2026.5x", "1e3", ".", "nan", "2026-07-0x"}) {
    const Outcome r = magnetic(std::string("--date ") + bad + " 1 2");
    EXPECT_EQ(r.status, 2) << bad;
    EXPECT_EQ(r.out, "") << bad;
    EXPECT_EQ(r.err,
              std::string("tidewater: not a date: ") + bad + " (a decimal year, or YYYY-MM-DD)\n");
  }
}

TEST(Magnetic, DatesOutOfTheSpan) {
  // the coefficients reach from the first epoch to five years beyond the last
  for (const char* bad : {"2024.99", "2024-12-31", "2035.01", "-5", "99999999999"}) {
    const Outcome r = magnetic(std::string("--date=") + bad + " 1 2");
    EXPECT_EQ(r.status, 2) << bad;
    EXPECT_EQ(r.out, "") << bad;
    EXPECT_NE(r.err.find("tidewater: The magnetic model WMM2025 has no field at "), r.err.npos)
        << r.err;
  }
  EXPECT_EQ(magnetic("--model IGRF-13 --date 1899.9 1 2").status, 2);
  EXPECT_EQ(magnetic("--model IGRF-13 --date 1900 1 2").status, 0);
  EXPECT_EQ(magnetic("--date 2030 1 2").err, "WMM2025 at 2030.000: 1 computed, 0 refused\n");
  const Outcome r = magnetic("--date 2035 1 2");
  EXPECT_EQ(r.status, 0);
  EXPECT_EQ(r.err,
            "tidewater: WMM2025 is made for 2025.0 to 2030.0; 2035.000 is extrapolated\n"
            "WMM2025 at 2035.000: 1 computed, 0 refused\n");
}

TEST(Magnetic, ModelsAndStoresThatAreNotThere) {
  const Outcome model = magnetic("--model WMM1990 --date 2026 1 2");
  EXPECT_NE(model.err.find("has no magnetic model \"WMM1990\""), model.err.npos) << model.err;
  EXPECT_EQ(model.status, 2);
  EXPECT_EQ(magnetic("--model " + std::string(5000, 'x') + " 1 2").status, 2);
  const ScratchFolder scratch;
  scratch.write("text", "no store at all");
  for (const std::string store : {"/nowhere/tidewater.store", "text", "."}) {
    const std::string path = store[0] == '/' ? store : (scratch.path() / store).string();
    for (const char* by_name : {"", " --model WMM2025"}) {
      const Outcome r = magnetic("--date 2026 --store " + path + by_name + " 1 2");
      EXPECT_EQ(r.err, "tidewater: The parameter store \"" + path + "\" cannot be opened.\n");
      EXPECT_EQ(r.out, "");
      EXPECT_EQ(r.status, 2);
    }
  }
  // the option stands above the environment
  const std::string given = "export TIDEWATER_STORE=/nowhere; tidewater magnetic --date 2026 1 2";
  EXPECT_EQ(shell(given).status, 2);
  EXPECT_EQ(shell(given + " --store '" TIDEWATER_STORE "'").status, 0);
}

TEST(Magnetic, StoresWithoutAModelThatCanBeUsed) {
  const struct {
    const char* damage;  // to the sources of the store
    const char* word;
  } stores[] = {
      {"/^WMM2025/d;/^IGRF/d' magnetic_models.csv",
       "The store \"few.store\" has no magnetic models"},
      {"/^WMM2025/s/,2,NOAA/,3,NOAA/' magnetic_models.csv",
       "The coefficients of WMM2025 cannot be used"},
      {"/^2030/d' magnetic/wmm2025_epochs.csv",
       "The magnetic model WMM2025 has no rates of change"},
      {"s/,12,/,1,/' magnetic/wmm2025_epochs.csv", "The magnetic model WMM2025 has no field"},
      {"/^IGRF-13/s/,5$/,0/' magnetic_models.csv",
       "The epochs of the magnetic model IGRF-13 cannot be used"},
  };
  for (const auto& store : stores) {
    const ScratchFolder scratch;
    const std::string f = scratch.path().string();
    const Outcome r = shell("cp -r '" TIDEWATER_SOURCE "/data' " + f + "/data && cd " + f +
                            "/data && sed -i '" + store.damage +
                            " && twstore build ../few.store . >/dev/null && cd .. && "
                            "tidewater magnetic --store few.store --date 2026 1 2");
    EXPECT_EQ(r.status, 2) << store.damage;
    EXPECT_EQ(r.out, "") << store.damage;
    EXPECT_EQ(r.err.rfind(std::string("tidewater: ") + store.word, 0), 0u) << r.err;
  }
}

TEST(Magnetic, OneLineForEachPosition) {
  const Outcome r =
      magnetic("--date 2025", "# a comment\n\n80 0 a name, with # and , in it\n80, 0, 0; b\r\n");
  // the published values, to the digits of the columns
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 5u) << r.err;
  EXPECT_EQ(got[0],
            "#       D       I       H       F        X        Y        Z     dD     dI     dH     "
            "dF     dX     dY     dZ");
  EXPECT_EQ(got[1], "# a comment");
  EXPECT_EQ(got[2], "");
  const std::string name = " a name, with # and , in it";
  ASSERT_EQ(got[3].size(), got[0].size() + name.size()) << got[3];
  EXPECT_EQ(got[3].substr(got[0].size()), name);
  EXPECT_EQ(got[3].substr(17, 43), "  6523.2 55178.5   6521.6    145.9  54791.5");
  EXPECT_EQ(got[4], got[3].substr(0, got[0].size()) + "; b");
  EXPECT_EQ(r.err, "WMM2025 at 2025.000: 2 computed, 0 refused\n");
  EXPECT_EQ(r.status, 0);
  EXPECT_EQ(lines(magnetic("--date 2025").out), std::vector<std::string>{got[0]});
}

TEST(Magnetic, AngleFormats) {
  const std::string wanted = magnetic("--date 2026", "48.39 -4.49 120 x\n").out;
  const struct {
    const char* options;
    const char* line;
  } same[] = {
      {"--order lon-lat", "-4.49 48.39 120 x"},
      {"--format dms", "48:23:24 -4:29:24 120 x"},
      {"--format dms --hemisphere behind", "48:23:24N 4:29:24W 120 x"},
      {"--format packed --hemisphere front", "N48.2324 W4.2924 120 x"},
      {"--format grads --reverse lon", "53.766666666667 4.988888888889 120 x"},
  };
  for (const auto& s : same) {
    const Outcome r = magnetic(std::string("--date 2026 ") + s.options, std::string(s.line) + "\n");
    EXPECT_EQ(r.out, wanted) << s.line << r.err;
    // the same among the arguments
    EXPECT_EQ(magnetic(std::string("--date 2026 ") + s.options + " " + s.line).out, wanted)
        << s.line;
  }
}

TEST(Magnetic, BadLinesAreMarkedAndTold) {
  const Outcome r = magnetic("--date 2025",
                             "80 0 a\nrubbish b\n91 0 c\n10 361 d\n48x 5 e\n"
                             "0 0 -6378137 centre\n80 0 f\n5\n");
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 9u) << r.err;
  const std::string stars = "* * * * * * * * * * * * * *";
  EXPECT_EQ(Figures(got[1]).X, 6521.6);
  EXPECT_EQ(got[2], stars);
  EXPECT_EQ(got[3], stars + " c");
  EXPECT_EQ(got[4], stars + " d");
  EXPECT_EQ(got[5], stars + " e");
  EXPECT_EQ(got[6], stars + " centre");
  EXPECT_EQ(got[7], got[1].substr(0, got[1].size() - 1) + "f");  // the centre spoils nothing
  EXPECT_EQ(got[8], stars);
  EXPECT_EQ(
      r.err,
      "standard input:2: \"rubbish b\": the latitude: \"rubbish\" has \"rubbish\" in it, which "
      "is no part of an angle. (TW_BAD_TEXT)\n"
      "standard input:3: \"91 0 c\": latitude out of range (TW_BAD_LATITUDE)\n"
      "standard input:4: \"10 361 d\": longitude beyond 360 degrees (TW_BAD_LONGITUDE)\n"
      "standard input:5: \"48x 5 e\": the latitude: \"48x\" has \"x\" in it, which is no part "
      "of an angle. (TW_BAD_TEXT)\n"
      "standard input:6: \"0 0 -6378137 centre\": the formula has no answer there "
      "(TW_RANGE_ERROR)\n"
      "standard input:8: \"5\": the longitude is missing (TW_BAD_TEXT)\n"
      "WMM2025 at 2025.000: 2 computed, 6 refused\n");
  EXPECT_EQ(r.status, 1);
}

TEST(Magnetic, APositionAmongTheArguments) {
  const Outcome r = magnetic("--date 2025 80 0 Spitsbergen", "this is not read\n");
  EXPECT_EQ(r.out, magnetic("--date 2025", "80 0 Spitsbergen\n").out);
  EXPECT_EQ(magnetic("--date 2025 '80 0' Spitsbergen").out, r.out);
  const Outcome bad = magnetic("--date 2025 -91 0");
  EXPECT_EQ(bad.err,
            "command line:1: \"-91 0\": latitude out of range (TW_BAD_LATITUDE)\n"
            "WMM2025 at 2025.000: 0 computed, 1 refused\n");
  EXPECT_EQ(bad.status, 1);
}

TEST(Magnetic, FilesAndStandardInput) {
  const ScratchFolder scratch;
  scratch.write("one", "1 1 one\n");
  scratch.write("two", "2 2 two");  // no newline at the end
  const std::string f = scratch.path().string();
  const Outcome r =
      magnetic("--date 2026 --file " + f + "/one -f - -f " + f + "/two", "3 3 three\n");
  EXPECT_EQ(r.out, magnetic("--date 2026", "1 1 one\n3 3 three\n2 2 two\n").out);
  const Outcome absent = magnetic("--date 2026 --file " + f + "/three");
  EXPECT_EQ(absent.status, 2);
  EXPECT_NE(absent.err.find("three: No such file"), std::string::npos) << absent.err;
}

TEST(Magnetic, TablesKeepTheirColumns) {
  const Outcome r = magnetic("--date 2025 --csv",
                             "name,lon,lat,height\n\"a, b\",0,80,\nbad,x,1,2\nc,-240,0,12.5\n");
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 4u) << r.err;
  EXPECT_EQ(got[0],
            "name,lon,lat,height,declination,inclination,horizontal,total,north,east,down,"
            "declination_rate,inclination_rate,horizontal_rate,total_rate,north_rate,east_rate,"
            "down_rate");
  EXPECT_EQ(got[1].rfind("\"a, b\",0,80,,1.28", 0), 0u) << got[1];
  EXPECT_NE(got[1].find(",6523.2,55178.5,6521.6,145.9,54791.5,"), std::string::npos) << got[1];
  EXPECT_EQ(got[2], "bad,x,1,2,*,*,*,*,*,*,*,*,*,*,*,*,*,*");
  EXPECT_EQ(got[3].rfind("c,-240,0,12.5,-0.15", 0), 0u) << got[3];
  EXPECT_NE(r.err.find("2 computed, 1 refused"), std::string::npos) << r.err;
  EXPECT_EQ(r.status, 1);
}

TEST(Magnetic, ADateARow) {
  const Outcome r = magnetic("--csv --date-column when",
                             "lat,lon,when\n80,0,2025\n80,0,2027.5\n80,0,1890\n80,0,2025-01-01\n");
  const auto got = lines(r.out);
  ASSERT_EQ(got.size(), 5u) << r.err;
  // test values of the WMM2025 report: north, east and down
  EXPECT_NE(got[1].find(",6521.6,145.9,54791.5,"), std::string::npos) << got[1];
  EXPECT_NE(got[2].find(",6500.8,294.5,54869."), std::string::npos) << got[2];
  EXPECT_NE(got[3].find(",*,*"), std::string::npos) << got[3];
  EXPECT_EQ(got[4].substr(15), got[1].substr(9));
  EXPECT_NE(r.err.find("(TW_BAD_DATE)"), std::string::npos) << r.err;
}

TEST(Magnetic, DecimalPointWhateverTheLocale) {
  const Outcome r = shell("export LC_ALL=de_DE.UTF-8; tidewater magnetic --store '" TIDEWATER_STORE
                          "' --date 2025.0 80.0 0.0");
  EXPECT_NE(r.out.find(" 54791.5 "), std::string::npos) << r.out << r.err;
}

TEST(Magnetic, ManyLinesInBatches) {
  const auto position = [](int i) {
    return std::to_string(i % 180 - 89) + " " + std::to_string(i % 7) + " x";
  };
  constexpr int kPeriod = 180 * 7;
  constexpr int kLines = 10000;  // three batches
  const auto is_bad = [](int i) { return i % 1000 == 7; };
  std::string input;
  for (int i = 0; i < kLines; ++i) input += (is_bad(i) ? "bad" : position(i)) + "\n";
  const Outcome r = magnetic("--date 2026", input);
  auto got = lines(r.out);
  ASSERT_EQ(got.size(), kLines + 1u) << r.err;
  got.erase(got.begin());
  for (const int i : {0, 4095, 4096, 8191, 8192, 9999}) {
    EXPECT_EQ(got[static_cast<std::size_t>(i)],
              lines(magnetic("--date 2026 " + position(i)).out).at(1));
  }
  for (int i = 0; i < kLines; ++i) {
    const auto at = static_cast<std::size_t>(i);
    if (is_bad(i)) {
      EXPECT_EQ(got[at], "* * * * * * * * * * * * * *") << i;
    } else if (i >= kPeriod && !is_bad(i - kPeriod)) {
      EXPECT_EQ(got[at], got[at - kPeriod]) << i;
    }
  }
  EXPECT_NE(r.err.find("standard input:9008: \"bad\""), std::string::npos);
  EXPECT_NE(r.err.find("9990 computed, 10 refused"), std::string::npos) << r.err;
}

TEST(Magnetic, ManyLinesInBoundedMemory) {
  if (shell("ulimit -v 60000; tidewater --version").status != 0) {
    GTEST_SKIP() << "the command does not start in so little memory, as under a sanitizer";
  }
  // 80 MB; were they held, they would not fit
  const Outcome r = shell(
      "yes \"80 0$(printf %2000s x)\" | head -n 40000 | (ulimit -v 60000; "
      "tidewater magnetic --store '" TIDEWATER_STORE "' --date 2025 | tail -n 1)");
  EXPECT_NE(r.out.find(" 54791.5 "), std::string::npos) << r.out << r.err;
  EXPECT_NE(r.err.find("40000 computed, 0 refused"), std::string::npos) << r.err;
}

TEST(Magnetic, GarbageIsRefusedAndNothingElse) {
  const std::string garbage = garbage_text(200000);
  for (const char* options : {"", "--format dms --hemisphere behind"}) {
    const Outcome r = magnetic(std::string("--date 2026 ") + options, garbage);
    EXPECT_EQ(r.status, 1) << options;
  }
  EXPECT_EQ(magnetic("--date 2026 --csv", garbage).status, 2);  // no such columns
  // heights that no field reaches, and a number that is none
  const Outcome far = magnetic("--date 2026", "1 1 1" + std::string(300, '0') + " x\n1 1 1" +
                                                  std::string(400, '0') + "\n80 0 y\n");
  EXPECT_EQ(lines(far.out).at(3), lines(magnetic("--date 2026 80 0 y").out).at(1));
}

TEST(Magnetic, OptionsThatDoNotFit) {
  for (const char* options :
       {"--format dm", "--hemisphere front --reverse lat", "--order yx", "--file x 1 2", "--date",
        "--lat 5", "--model", "--file /nowhere/file"}) {
    const Outcome r = magnetic(options, "1 1\n");
    EXPECT_EQ(r.status, 2) << options;
    EXPECT_NE(r.err, "") << options;
  }
}

TEST(Magnetic, AFullDiskIsSaid) {
  if (!std::filesystem::exists("/dev/full")) GTEST_SKIP() << "no /dev/full here";
  const Outcome r = magnetic("--date 2026 1 2 >/dev/full");
  EXPECT_EQ(r.status, 2);
  EXPECT_NE(r.err.find("standard output cannot be written"), std::string::npos) << r.err;
}

TEST(Magnetic, ExamplesOfTheHelpWorkAsPrinted) {
  const Outcome help = magnetic("--help");
  EXPECT_EQ(help.status, 0);
  int examples = 0;
  for (const std::string& line : lines(help.out)) {
    const std::size_t start = line.find_first_not_of(' ');
    if (start == std::string::npos || start == 0 || line.find("magnetic --") == line.npos) continue;
    const Outcome r = shell("export TIDEWATER_STORE='" TIDEWATER_STORE "'; " + line);
    EXPECT_EQ(r.status, 0) << line << r.err;
    EXPECT_NE(r.err.find(": 1 computed, 0 refused\n"), std::string::npos) << line << r.err;
    EXPECT_EQ(lines(r.out).size(), 2u) << line;
    ++examples;
  }
  EXPECT_EQ(examples, 3);
}

}  // namespace
