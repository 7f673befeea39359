// The model as an object: published values, arrays, points that fail, refusals.
#include "tidewater/magnetic_model.hpp"

#include <gtest/gtest.h>

#include <atomic>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "support/magnetic_values.hpp"
#include "systems/made_store.hpp"

namespace tidewater::test {

namespace {

TEST(MagneticModelObject, PublishedTestValues) {
  for (const PublishedField& row : kWmm2025Values) {
    const MagneticModel model("WMM2025", row.date);
    EXPECT_EQ(model.name(), "WMM2025");
    EXPECT_EQ(model.year(), row.date);
    const MagneticField field = model.field({row.lon, row.lat, 0}).field;
    EXPECT_NEAR(field.north, row.X, 0.0501);
    EXPECT_NEAR(field.east, row.Y, 0.0501);
    EXPECT_NEAR(field.down, row.Z, 0.0501);
    EXPECT_NEAR(field.total, row.F, 0.0501);
    EXPECT_NEAR(field.inclination, row.I, 0.00501);
    EXPECT_NEAR(field.declination, row.D, 0.00501);
    EXPECT_NEAR(field.horizontal, std::hypot(row.X, row.Y), 0.1);
  }
}

TEST(MagneticModelObject, ArraysAreItsPointsAndFailuresStandAlone) {
  const MagneticModel model("", 2026.5);
  constexpr std::size_t kCount = 1000;
  std::vector<double> points;  // x y z x y z ...
  for (std::size_t i = 0; i < kCount; ++i) {
    const double t = static_cast<double>(i);
    points.insert(points.end(),
                  {std::fmod(7 * t, 360) - 180, std::fmod(3.3 * t, 180) - 90, 10 * t});
  }
  points[3 * 500 + 1] = 91;
  points[3 * 600] = std::nan("");
  const Coordinates<const double> in = {points.data(), &points[1], &points[2], 3};
  for (const unsigned threads : {1u, 3u}) {
    std::vector<MagneticValue> values(kCount);
    std::vector<TWstatus> words(kCount);
    const Summary summary = model.field(kCount, in, values.data(), {words.data(), threads});
    EXPECT_EQ(summary.failed, 2u);
    for (std::size_t i = 0; i < kCount; ++i) {
      const bool bad = i == 500 || i == 600;
      ASSERT_EQ(words[i] != TW_SUCCESS, bad) << i;
      ASSERT_EQ(std::isnan(values[i].field.total), bad) << i;
      if (bad) continue;
      const MagneticValue alone =
          model.field({points[3 * i], points[3 * i + 1], points[3 * i + 2]});
      ASSERT_EQ(values[i].field.declination, alone.field.declination);
      ASSERT_EQ(values[i].yearly.total, alone.yearly.total);
    }
  }
}

// A year's change is the difference of two dates, as the model is linear in its coefficients.
TEST(MagneticModelObject, YearlyChangeIsADifferenceOfDates) {
  const Point at = {2.35, 48.85, 35};
  const MagneticValue before = MagneticModel("WMM2025", 2026).field(at);
  const MagneticValue after = MagneticModel("WMM2025", 2027).field(at);
  EXPECT_NEAR(after.field.north - before.field.north, before.yearly.north, 1e-9);
  EXPECT_NEAR(after.field.east - before.field.east, before.yearly.east, 1e-9);
  EXPECT_NEAR(after.field.down - before.field.down, before.yearly.down, 1e-9);
}

TEST(MagneticModelObject, RefusalsNameWhatThereIs) {
  const auto refused = [](const char* name, double year) {
    try {
      const MagneticModel model(name, year);
    } catch (const Error& error) {
      return std::string(error.what());
    }
    return std::string("not refused");
  };
  EXPECT_NE(refused("WMM1990", 2026).find("WMM1990"), std::string::npos);
  EXPECT_NE(refused("WMM2025", 1990).find("published for 2025 to 2030"), std::string::npos);
  EXPECT_NE(refused("WMM2025", std::nan("")), "not refused");
  EXPECT_FALSE(MagneticModel::models().empty());
}

TEST(MagneticModelObject, NamesAndTheirSeries) {
  const auto name_of = [](const char* asked) { return MagneticModel(asked, 2026).name(); };
  for (const char* asked : {"IGRF", "igrf", "IGRF-14", "igrf14", "i.g.r.f. 14"}) {
    EXPECT_EQ(name_of(asked), "IGRF-14") << asked;
  }
  for (const char* asked : {"WMM2025", "wmm", "WMM", "{wmm_2025}", ""})
    EXPECT_EQ(name_of(asked), "WMM2025");
  EXPECT_EQ(MagneticModel("igrf 13", 2022).name(), "IGRF-13");
  const MagneticModel model("IGRF-14", 1950);
  EXPECT_EQ(model.first_year(), 1900);
  EXPECT_EQ(model.last_year(), 2030);
}

// Points beyond all use have words of their own, and disturb no other; heights may be missing.
TEST(MagneticModelObject, PointsBeyondAllUse) {
  const MagneticModel model("WMM2025", 2026);
  struct Case {
    double lon, lat, height;
    TWstatus word;
  };
  const Case cases[] = {{2, 48, 0, TW_SUCCESS},
                        {721, 48, 0, TW_BAD_LONGITUDE},
                        {2, 90.1, 0, TW_BAD_LATITUDE},
                        {2, 48, 1.1e9, TW_BAD_INPUT},
                        {2, 48, std::nan(""), TW_BAD_INPUT},
                        {2, 48, 0, TW_SUCCESS},
                        {-720, -90, -1e3, TW_SUCCESS}};
  constexpr std::size_t kCount = std::size(cases);
  double lon[kCount], lat[kCount], height[kCount];
  for (std::size_t i = 0; i < kCount; ++i) {
    lon[i] = cases[i].lon;
    lat[i] = cases[i].lat;
    height[i] = cases[i].height;
  }
  MagneticValue values[kCount];
  TWstatus words[kCount];
  const Summary summary = model.field(kCount, {lon, lat, height}, values, {words, 1});
  EXPECT_EQ(summary.failed, 4u);
  EXPECT_EQ(summary.word, TW_BAD_LONGITUDE);
  for (std::size_t i = 0; i < kCount; ++i) {
    EXPECT_EQ(words[i], cases[i].word) << i;
    EXPECT_EQ(std::isnan(values[i].field.total), words[i] != TW_SUCCESS) << i;
    EXPECT_EQ(std::isnan(values[i].yearly.declination), words[i] != TW_SUCCESS) << i;
  }
  EXPECT_EQ(values[5].field.total, values[0].field.total);
  MagneticValue flat[1];
  EXPECT_TRUE(model.field(1, Coordinates<const double>{lon, lat}, flat));
  EXPECT_EQ(flat[0].field.north, values[0].field.north);
}

// A store that lacks a model, or lies about it, gives a sentence that says so, and never a figure.
TEST(MagneticModelObject, StoresThatLackOrLie) {
  const char* const before = std::getenv("TIDEWATER_STORE");
  const std::string kept = before == nullptr ? "" : before;
  const auto with_store = [&](const std::string& store, const std::function<void()>& look) {
    setenv("TIDEWATER_STORE", store.c_str(), 1);
    look();
    before == nullptr ? unsetenv("TIDEWATER_STORE") : setenv("TIDEWATER_STORE", kept.c_str(), 1);
  };
  const auto sentence = [](const std::function<void()>& make) -> std::string {
    try {
      make();
      return "not refused";
    } catch (const Error& error) {
      return error.what();
    }
  };
  with_store("/nowhere", [&] {
    for (const char* name : {"WMM2025", ""}) {
      EXPECT_EQ(sentence([&] { MagneticModel(name, 2026); }),
                "The parameter store \"/nowhere\" cannot be opened.");
    }
    EXPECT_EQ(sentence([] { MagneticModel::models(); }),
              "The parameter store \"/nowhere\" cannot be opened.");
  });
  struct Case {
    const char* what;
    std::function<void(const StoreSources&)> change;
    const char* name;
    const char* part;
  };
  const std::string head =
      "model name,model number,epoch table,reference radius,normalisation,publisher,first "
      "date,last date,interval\n";
  const Case cases[] = {
      {"no table of models",
       [](const StoreSources& s) {
         s.replace("tables.csv", "magnetic models,magnetic_model,magnetic_models.csv\n", "");
       },
       "WMM2025", "has no magnetic models."},
      {"no models", [&](const StoreSources& s) { s.write("magnetic_models.csv", head); }, "",
       "has no magnetic models."},
      {"none of that name", [&](const StoreSources& s) { s.write("magnetic_models.csv", head); },
       "WMM2025", "has no magnetic model \"WMM2025\"; MagneticModel::models() lists"},
      {"another series",
       [&](const StoreSources& s) {
         s.write("magnetic_models.csv",
                 head + "XYZ,1,wmm2025 epochs,6371200,2,nobody,2025,2030,5\n");
       },
       "WMM2025", "has no magnetic model \"WMM2025\""},
      {"no epochs",
       [](const StoreSources& s) {
         s.replace("magnetic_models.csv", "wmm2025 epochs", "wmm2099 epochs");
       },
       "WMM2025", "cannot be read"},
      {"one set",
       [](const StoreSources& s) {
         s.replace("magnetic/wmm2025_epochs.csv", "2030,12,wmm2025 rates\n", "");
       },
       "WMM2025", "has no rates of change"},
      {"no interval",
       [](const StoreSources& s) {
         s.replace("magnetic_models.csv", "1900,2030,5", "1900,2030,0");
       },
       "IGRF-14", "The epochs of the magnetic model IGRF-14 cannot be used."},
      {"no coefficients",
       [](const StoreSources& s) {
         s.replace("magnetic/wmm2025_epochs.csv", "wmm2025 rates", "wmm2099 rates");
       },
       "WMM2025", "The coefficients of WMM2025 cannot be used."},
      {"a normalisation that is none",
       [](const StoreSources& s) { s.replace("magnetic_models.csv", "6371200,2", "6371200,9"); },
       "WMM2025", "The magnetic model WMM2025 cannot be read."},
      {"rates of degree one",
       [](const StoreSources& s) {
         s.replace("magnetic/wmm2025_epochs.csv", "2030,12,", "2030,1,");
         s.write("magnetic/wmm2025_rates.csv", "n,m,C,S\n0,0,0,0\n1,0,1,0\n1,1,1,1\n");
       },
       "WMM2025", "has no field at 2026"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.what);
    const StoreSources sources;
    c.change(sources);
    const std::string store = sources.build();
    ASSERT_NE(store, "");
    with_store(store, [&] {
      const std::string why = sentence([&] { MagneticModel(c.name, 2026); });
      EXPECT_NE(why.find(c.part), std::string::npos) << why;
    });
  }
  // Of two models of one epoch that for the present alone is taken, whichever stands first; a name
  // of no letter and no digit is none.
  const StoreSources turned;
  turned.write("magnetic_models.csv", head +
                                          "IGRF-14,1,igrf14 epochs,6371200,2,IAGA,1900,2030,5\n" +
                                          "WMM2025,2,wmm2025 epochs,6371200,2,NOAA,2025,2030,5\n");
  with_store(turned.build(), [&] {
    EXPECT_EQ(MagneticModel("", 2026).name(), "WMM2025");
    EXPECT_NE(sentence([] { MagneticModel("--", 2026); }).find("no magnetic model \"--\""),
              std::string::npos);
  });
  // Coefficients whose sums no number holds leave every point its word.
  const StoreSources sources;
  sources.replace("magnetic/wmm2025_2025.csv", "-29351.8", "1e308");
  sources.replace("magnetic/wmm2025_2025.csv", "-1410.8", "1e308");
  with_store(sources.build(), [] {
    const MagneticModel model("WMM2025", 2026);
    double lon = 2, lat = 48;
    MagneticValue value;
    TWstatus word = TW_SUCCESS;
    EXPECT_EQ(model.field(1, Coordinates<const double>{&lon, &lat}, &value, {&word, 1}).failed, 1u);
    EXPECT_EQ(word, TW_RANGE_ERROR);
    EXPECT_TRUE(std::isnan(value.field.total) && std::isnan(value.yearly.total));
  });
}

Point place(unsigned i) { return {-180 + 0.7 * (i % 500), -80 + 1.3 * (i % 120), 100}; }

// A model that many threads share gives what one gives alone.
TEST(MagneticModelObject, ThreadsThatShareItDoNotMeet) {
  const MagneticModel model("", 2026.5);
  constexpr unsigned kThreads = 4;
  constexpr unsigned kEach = 4000;
  std::vector<MagneticValue> alone;
  for (unsigned i = 0; i < kThreads * kEach; ++i) alone.push_back(model.field(place(i)));
  std::atomic<unsigned> wrong{0};
  std::vector<std::thread> threads;
  for (unsigned t = 0; t < kThreads; ++t) {
    threads.emplace_back([&, t] {
      for (unsigned i = t * kEach; i < (t + 1) * kEach; ++i) {
        const MagneticValue value = model.field(place(i));
        if (std::memcmp(&value, &alone[i], sizeof value) != 0) ++wrong;
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrong, 0u);
}

}  // namespace

}  // namespace tidewater::test
