// The C interface: handles, sentences, buffers, failing points.
#include "tidewater/systems.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <string>

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
