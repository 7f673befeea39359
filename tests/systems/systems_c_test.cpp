// The C interface: handles, sentences, buffers, failing points.
#include "tidewater/systems.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <fstream>
#include <string>
#include <vector>

#include "support/little_memory.hpp"

#ifdef __linux__
#include <unistd.h>
#endif

namespace tidewater::test {

TEST(SystemsC, FromNamesToFigures) {
  tw_system* source = tw_system_create("EPSG:4326");
  tw_system* target = tw_system_create("EPSG:2154");
  ASSERT_TRUE(source != nullptr && target != nullptr);
  EXPECT_EQ(tw_system_code(target), 2154);
  EXPECT_EQ(tw_system_kind(target), TW_PROJECTED);
  tw_transformation* map = tw_transformation_create(source, target, nullptr);
  ASSERT_NE(map, nullptr) << tw_last_error();
  // A handle keeps what it needs.
  tw_system_destroy(source);
  tw_system_destroy(target);
  double xy[4] = {3, 46.5, 3, 95};
  TWstatus words[2] = {};
  const tw_points view = {xy, xy + 1, nullptr, 2};
  EXPECT_EQ(tw_transform(map, 0, 2, &view, &view, words, 1), 1u);
  EXPECT_NEAR(xy[0], 700000, 1e-6);
  EXPECT_NEAR(xy[1], 6600000, 1e-6);
  EXPECT_TRUE(std::isnan(xy[2]) && std::isnan(xy[3]));
  EXPECT_EQ(words[0], TW_SUCCESS);
  EXPECT_EQ(words[1], TW_BAD_LATITUDE);
  EXPECT_EQ(tw_transform(map, 1, 1, &view, &view, nullptr, 0), 0u);
  EXPECT_NEAR(xy[0], 3, 1e-12);
  EXPECT_EQ(tw_transformation_accuracy(map), 1);
  tw_transformation_destroy(map);
}

TEST(SystemsC, TextsAreCutAndNeverOverrun) {
  tw_system* system = tw_system_create("2154");
  ASSERT_NE(system, nullptr);
  char text[8];
  std::memset(text, '#', sizeof text);
  const std::size_t length = tw_system_name(system, text, 5);
  EXPECT_EQ(length, std::strlen("RGF93 v1 / Lambert-93"));
  EXPECT_STREQ(text, "RGF9");
  EXPECT_EQ(text[5], '#');
  EXPECT_EQ(tw_system_name(system, nullptr, 0), length);
  EXPECT_EQ(tw_system_text(system, "nonsense", text, sizeof text), 0u);
  EXPECT_NE(std::string(tw_last_error()).find("nonsense"), std::string::npos);
  EXPECT_GT(tw_system_text(system, "wkt2", nullptr, 0), 100u);
  double bounds[4];
  EXPECT_EQ(tw_system_area(system, bounds), 1);
  EXPECT_LT(bounds[0], bounds[2]);
  tw_system_destroy(system);
}

TEST(SystemsC, NullsAreAnswered) {
  EXPECT_EQ(tw_system_create(nullptr), nullptr);
  EXPECT_EQ(tw_system_create("no such system"), nullptr);
  EXPECT_NE(std::string(tw_last_error()).find("no such system"), std::string::npos);
  EXPECT_EQ(tw_transformation_create(nullptr, nullptr, nullptr), nullptr);
  TWstatus words[2] = {};
  double xy[4] = {};
  const tw_points view = {xy, xy + 1, nullptr, 2};
  EXPECT_EQ(tw_transform(nullptr, 0, 2, &view, &view, words, 1), 2u);
  EXPECT_EQ(words[1], TW_BAD_INPUT);
  tw_system_destroy(nullptr);
  tw_transformation_destroy(nullptr);
  tw_projection_destroy(nullptr);
  tw_candidates_destroy(nullptr);
  tw_lines_destroy(nullptr);
  tw_magnetic_model_destroy(nullptr);
  char text[4] = "abc";
  EXPECT_EQ(tw_system_name(nullptr, text, sizeof text), 0u);
  EXPECT_STREQ(text, "");
}

// Each pointer that is needed, null in turn: all points fail, in every word that was asked for.
TEST(SystemsC, NullPlacesFailEveryPoint) {
  tw_system* system = tw_system_create("EPSG:32631");
  tw_projection* map = tw_projection_of(system);
  tw_magnetic_model* model = tw_magnetic_model_create(nullptr, 2026);
  ASSERT_TRUE(map != nullptr && model != nullptr) << tw_last_error();
  double x[2] = {3, 4}, y[2] = {10, 11};
  const tw_points whole = {x, y, nullptr, 1};
  const tw_points no_x = {nullptr, y, nullptr, 1}, no_y = {x, nullptr, nullptr, 1};
  tw_factors factors[2];
  tw_magnetic_value values[2];
  TWstatus words[2];
  const auto expect_all_fail = [&](auto call) {
    words[0] = words[1] = TW_SUCCESS;
    EXPECT_EQ(call(words), 2u);
    EXPECT_TRUE(words[0] == TW_BAD_INPUT && words[1] == TW_BAD_INPUT);
    EXPECT_EQ(call(nullptr), 2u);
  };
  const tw_points* const bad[] = {nullptr, &no_x, &no_y};
  for (const tw_points* one : bad) {
    expect_all_fail([&](TWstatus* s) { return tw_project(map, 0, 2, one, &whole, s, 1); });
    expect_all_fail([&](TWstatus* s) { return tw_project(map, 0, 2, &whole, one, s, 1); });
    expect_all_fail([&](TWstatus* s) { return tw_project_factors(map, 2, one, factors, s); });
    expect_all_fail([&](TWstatus* s) { return tw_magnetic_field(model, 2, one, values, s); });
  }
  expect_all_fail([&](TWstatus* s) { return tw_project_factors(nullptr, 2, &whole, factors, s); });
  expect_all_fail([&](TWstatus* s) { return tw_project_factors(map, 2, &whole, nullptr, s); });
  expect_all_fail([&](TWstatus* s) { return tw_magnetic_field(model, 2, &whole, nullptr, s); });
  EXPECT_TRUE(x[0] == 3 && x[1] == 4 && y[0] == 10 && y[1] == 11);
  // No points are no failures, whatever the places.
  EXPECT_EQ(tw_project(nullptr, 0, 0, nullptr, nullptr, nullptr, 1), 0u);
  EXPECT_EQ(tw_project_factors(nullptr, 0, nullptr, nullptr, nullptr), 0u);
  EXPECT_EQ(tw_magnetic_field(nullptr, 0, nullptr, nullptr, nullptr), 0u);
  EXPECT_EQ(tw_system_code(nullptr), 0);
  EXPECT_EQ(tw_system_kind(nullptr), TW_GEOGRAPHIC_2D);
  EXPECT_TRUE(std::isnan(tw_transformation_accuracy(nullptr)));
  EXPECT_EQ(tw_lines_inverse(nullptr, 3, x, y, x, y, nullptr, nullptr, nullptr), 3u);
  EXPECT_EQ(tw_projection_create(nullptr, 0, nullptr, nullptr, 6378137, 298), nullptr);
  EXPECT_STREQ(tw_last_error(), "A text that is needed was null.");
  EXPECT_EQ(tw_transformation_create(system, nullptr, nullptr), nullptr);
  EXPECT_STREQ(tw_last_error(), "A handle that is needed was null.");
  EXPECT_EQ(tw_candidates_create(system, nullptr, nullptr), nullptr);
  EXPECT_EQ(tw_system_create_at(nullptr, 3, 4), nullptr);
  tw_magnetic_model_destroy(model);
  tw_projection_destroy(map);
  tw_system_destroy(system);
}

// More points than are worked on at once: 64.
TEST(SystemsC, FactorsAndFieldsOfManyPoints) {
  tw_system* system = tw_system_create("EPSG:32631");
  tw_projection* map = tw_projection_of(system);
  tw_magnetic_model* model = tw_magnetic_model_create("WMM2025", 2025);
  ASSERT_TRUE(map != nullptr && model != nullptr) << tw_last_error();
  constexpr std::size_t kCount = 130;
  std::vector<double> xy;
  for (std::size_t i = 0; i < kCount; ++i) {
    xy.push_back(3 + 0.01 * static_cast<double>(i));
    xy.push_back(i % 50 == 49 ? 95 : 10);
  }
  const tw_points view = {xy.data(), xy.data() + 1, nullptr, 2};
  std::vector<tw_factors> factors(kCount);
  std::vector<tw_magnetic_value> values(kCount);
  std::vector<TWstatus> words(kCount), field_words(kCount);
  EXPECT_EQ(tw_project_factors(map, kCount, &view, factors.data(), words.data()), 2u);
  EXPECT_EQ(tw_magnetic_field(model, kCount, &view, values.data(), field_words.data()), 2u);
  EXPECT_EQ(tw_magnetic_field(model, kCount, &view, values.data(), nullptr), 2u);
  for (std::size_t i = 0; i < kCount; ++i) {
    const tw_points one = {&xy[2 * i], &xy[2 * i + 1], nullptr, 2};
    tw_factors alone;
    tw_magnetic_value alone_there;
    TWstatus word = 7, field_word = 7;
    tw_project_factors(map, 1, &one, &alone, &word);
    tw_magnetic_field(model, 1, &one, &alone_there, &field_word);
    EXPECT_EQ(words[i], word) << i;
    EXPECT_EQ(field_words[i], field_word) << i;
    EXPECT_EQ(word != TW_SUCCESS, i % 50 == 49) << i;
    EXPECT_EQ(std::memcmp(&factors[i], &alone, sizeof alone), 0) << i;
    // The sums go on from the longitude before.
    if (word != TW_SUCCESS) {
      EXPECT_TRUE(std::isnan(values[i].total) && std::isnan(alone_there.yearly_total));
    } else {
      EXPECT_NEAR(values[i].north, alone_there.north, 1e-9) << i;
      EXPECT_NEAR(values[i].yearly_inclination, alone_there.yearly_inclination, 1e-12) << i;
    }
  }
  tw_magnetic_model_destroy(model);
  tw_projection_destroy(map);
  tw_system_destroy(system);
}

TEST(SystemsC, SystemsAsTextsAndFound) {
  tw_system* own = tw_system_create("geographic ellps=GRS80");
  ASSERT_NE(own, nullptr) << tw_last_error();
  char text[200] = "#";
  EXPECT_GT(tw_system_text(own, "proj", text, sizeof text), 0u);
  EXPECT_EQ(std::string(text).substr(0, 26), "+proj=longlat +ellps=GRS80");
  text[0] = '#';
  EXPECT_GT(tw_system_name(own, text, 0), 0u);
  EXPECT_EQ(tw_system_name(nullptr, text, 0), 0u);
  EXPECT_EQ(text[0], '#');
  // Its area is not known: the whole Earth.
  double bounds[4] = {};
  EXPECT_EQ(tw_system_area(own, bounds), 0);
  EXPECT_TRUE(bounds[0] == -180 && bounds[1] == -90 && bounds[2] == 180 && bounds[3] == 90);
  tw_system_destroy(own);
  int32_t codes[3] = {-7, -7, -7};
  EXPECT_EQ(tw_system_search("lambert 93", codes, 2), 2u);
  EXPECT_EQ(codes[0], 2154);
  EXPECT_EQ(codes[2], -7);
  EXPECT_EQ(tw_system_search("no such words anywhere", codes, 3), 0u);
  EXPECT_EQ(tw_system_search(nullptr, codes, 3), 0u);

  tw_system* source = tw_system_create("EPSG:4326");
  tw_system* target = tw_system_create("EPSG:2154");
  const tw_transformation_options usual = {};
  tw_transformation* map = tw_transformation_create(source, target, &usual);
  ASSERT_NE(map, nullptr) << tw_last_error();
  const std::size_t length = tw_transformation_describe(map, nullptr, 0);
  EXPECT_GT(tw_transformation_describe(map, text, sizeof text), 0u);
  EXPECT_GE(length, std::strlen(text));
  EXPECT_NE(std::string(text).find("Lambert"), std::string::npos) << text;
  tw_transformation_destroy(map);
  tw_system_destroy(source);
  tw_system_destroy(target);
}

TEST(SystemsC, TextsThatAreRefusedLeaveTheirPlaces) {
  double position[3] = {-7, -7, -7}, degrees = -7;
  EXPECT_EQ(tw_parse_mgrs("31UDO", position), 0);
  EXPECT_NE(std::string(tw_last_error()).find("row O"), std::string::npos);
  EXPECT_EQ(tw_parse_mgrs(nullptr, position), 0);
  // An axis or an order that is none would be taken for another.
  for (const int32_t none : {-1, 3}) {
    EXPECT_EQ(tw_parse_angle("12", none, 0, &degrees), 0);
    EXPECT_STREQ(tw_last_error(), "An axis or order is none of 0, 1 and 2.");
    EXPECT_EQ(tw_parse_position("12 13", none, 0, position), 0);
    EXPECT_STREQ(tw_last_error(), "An axis or order is none of 0, 1 and 2.");
  }
  EXPECT_TRUE(position[0] == -7 && position[1] == -7 && position[2] == -7 && degrees == -7);
  EXPECT_EQ(tw_parse_position("12 13", 1, 0, position), 1);
  EXPECT_TRUE(position[0] == 12 && position[1] == 13 && std::isnan(position[2]));
  EXPECT_EQ(tw_parse_position("12 13", 2, 0, position), 1);
  EXPECT_TRUE(position[0] == 13 && position[1] == 12);
  char text[20];
  EXPECT_EQ(tw_format_mgrs(-77.03524, 38.88947, 3, text, sizeof text), 11u);
  EXPECT_STREQ(text, "18SUJ234064");
  EXPECT_EQ(tw_format_mgrs(0, 91, 3, text, sizeof text), 0u);
  EXPECT_STREQ(text, "");
}

TEST(SystemsC, Polygons) {
  // The octant of a sphere: a quarter of the great circle thrice, an eighth of its surface.
  tw_lines* sphere = tw_lines_create(0, 1, 0);
  ASSERT_NE(sphere, nullptr) << tw_last_error();
  const double lon[3] = {0, 90, 0}, lat[3] = {0, 0, 90};
  double perimeter = 0, area = 0;
  tw_lines_polygon(sphere, 3, lon, lat, &perimeter, &area);
  constexpr double kPi = 3.14159265358979323846;
  EXPECT_NEAR(perimeter, 1.5 * kPi, 1e-14);
  EXPECT_NEAR(area, kPi / 2, 1e-14);
  double alone = 0;
  tw_lines_polygon(sphere, 3, lon, lat, nullptr, &alone);
  EXPECT_EQ(alone, area);
  tw_lines_polygon(sphere, 3, lon, lat, &alone, nullptr);
  EXPECT_EQ(alone, perimeter);
  tw_lines_destroy(sphere);
  tw_lines_polygon(nullptr, 3, lon, lat, &perimeter, &area);
  EXPECT_TRUE(std::isnan(perimeter) && std::isnan(area));
  for (const int32_t rhumb : {0, 1}) {
    EXPECT_EQ(tw_lines_create(rhumb, -1, 0), nullptr);
    EXPECT_STRNE(tw_last_error(), "");
  }
}

#if defined(__linux__) && !defined(__SANITIZE_ADDRESS__)

// A memory that runs out has its sentence.
TEST(SystemsC, WithoutMemory) {
  if (emulated()) GTEST_SKIP() << "an emulated processor holds no limit of memory";
  const std::string huge(64u << 20, 'x');
  rlimit before;
  ASSERT_EQ(getrlimit(RLIMIT_AS, &before), 0);
  std::ifstream pages("/proc/self/statm");
  std::size_t in_use = 0;
  pages >> in_use;
  rlimit limit = before;
  limit.rlim_cur = in_use * static_cast<std::size_t>(sysconf(_SC_PAGESIZE)) + (16u << 20);
  ASSERT_EQ(setrlimit(RLIMIT_AS, &limit), 0);
  tw_system* system = tw_system_create(huge.c_str());
  setrlimit(RLIMIT_AS, &before);
  EXPECT_EQ(system, nullptr);
  EXPECT_STREQ(tw_last_error(), "There is not enough memory.");
}

#endif

TEST(SystemsC, EveryWordHasItsText) {
  EXPECT_STRNE(tw_status_text(TW_BAD_LATITUDE), tw_status_text(TW_BAD_LONGITUDE));
  EXPECT_STREQ(tw_status_text(7), "There is no such status word.");
}

TEST(SystemsC, HeadersAndLibraryAreOfOneVersion) {
  EXPECT_STREQ(tw_version(), TIDEWATER_VERSION);
  EXPECT_EQ(std::to_string(TIDEWATER_VERSION_MAJOR) + "." +
                std::to_string(TIDEWATER_VERSION_MINOR) + "." +
                std::to_string(TIDEWATER_VERSION_PATCH),
            TIDEWATER_VERSION);
}

TEST(SystemsC, ProjectionsAndFactors) {
  const char* names[] = {"latitude of origin", "lon0", "x0"};
  const double values[] = {0, 3, 500000};
  tw_projection* map =
      tw_projection_create("transverse mercator", 3, names, values, 6378137, 298.257223563);
  ASSERT_NE(map, nullptr) << tw_last_error();
  double xy[4] = {3, 10, 4, 10};
  const tw_points view = {xy, xy + 1, nullptr, 2};
  tw_factors factors[2];
  EXPECT_EQ(tw_project_factors(map, 2, &view, factors, nullptr), 0u);
  EXPECT_NEAR(factors[0].parallel, 1, 1e-10);
  EXPECT_GT(factors[1].convergence, 0);
  EXPECT_EQ(tw_project(map, 0, 2, &view, &view, nullptr, 1), 0u);
  EXPECT_NEAR(xy[0], 500000, 1e-7);
  tw_projection_destroy(map);
  EXPECT_GT(tw_projection_method_count(), 50u);
}

// Test values of the World Magnetic Model 2025's report: 80 N, 0 E, height 0, 2025.0.
TEST(SystemsC, MagneticField) {
  tw_magnetic_model* model = tw_magnetic_model_create("WMM2025", 2025.0);
  ASSERT_NE(model, nullptr) << tw_last_error();
  double xyz[6] = {0, 80, 0, 0, 95, 0};
  const tw_points view = {xyz, xyz + 1, xyz + 2, 3};
  tw_magnetic_value value[2];
  TWstatus words[2];
  EXPECT_EQ(tw_magnetic_field(model, 2, &view, value, words), 1u);
  EXPECT_NEAR(value[0].north, 6521.6, 0.06);
  EXPECT_NEAR(value[0].east, 145.9, 0.06);
  EXPECT_NEAR(value[0].down, 54791.5, 0.06);
  EXPECT_NEAR(value[0].declination, 1.28, 0.006);
  EXPECT_EQ(words[1], TW_BAD_LATITUDE);
  EXPECT_TRUE(std::isnan(value[1].total));
  tw_magnetic_model_destroy(model);
  EXPECT_EQ(tw_magnetic_model_create("WMM2025", 1800), nullptr);
  EXPECT_EQ(tw_magnetic_model_create("nothing", 2025), nullptr);
}

TEST(SystemsC, LinesAndPositions) {
  tw_lines* lines = tw_lines_create(0, 6378137, 1 / 298.257223563);
  ASSERT_NE(lines, nullptr);
  const double lon1 = 0, lat1 = 0, lon2 = 90, lat2 = 0;
  double length = 0;
  EXPECT_EQ(tw_lines_inverse(lines, 1, &lon1, &lat1, &lon2, &lat2, &length, nullptr, nullptr), 0u);
  EXPECT_NEAR(length, 6378137 * 1.5707963267948966, 1e-7);
  tw_lines_destroy(lines);
  double position[3];
  EXPECT_EQ(tw_parse_position("48°51'24\"N 2°21'03\"E", 0, 0, position), 1);
  EXPECT_NEAR(position[1], 48.856666667, 1e-9);
  EXPECT_EQ(tw_parse_position("rubbish", 0, 0, position), 0);
  EXPECT_STRNE(tw_last_error(), "");
  EXPECT_EQ(tw_parse_mgrs("31UDQ4825111932", position), 1);
  EXPECT_NEAR(position[0], 2.2945, 0.001);
}

}  // namespace tidewater::test
