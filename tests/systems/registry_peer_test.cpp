// What the registry says of systems and operations, beside what PROJ reads from the same dataset.

#include <gtest/gtest.h>

#include "registry.hpp"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>

#include <cmath>
#include <map>
#include <memory>
#include <string>

namespace tidewater::test {

namespace {

using detail::Parameter;
using detail::Registry;

struct Free {
  void operator()(PJ* object) const { proj_destroy(object); }
};
using Object = std::unique_ptr<PJ, Free>;

Object from_database(int code, PJ_CATEGORY category) {
  return Object(proj_create_from_database(PJ_DEFAULT_CTX, "EPSG", std::to_string(code).c_str(),
                                          category, 0, nullptr));
}

bool has_this_registry() {
  const char* version = proj_context_get_database_metadata(PJ_DEFAULT_CTX, "EPSG.VERSION");
  return version && std::string(version) == "v10.076";
}

// Parameters in radians, metres and one, by code.  PROJ rounds the factors of units to 15 digits.
void expect_same_values(const Registry& registry, PJ* operation,
                        const std::vector<Parameter>& parameters, const std::string& name) {
  std::map<int, double> peer;
  for (int i = 0; i < proj_coordoperation_get_param_count(PJ_DEFAULT_CTX, operation); ++i) {
    const char* code = nullptr;
    double value = 0;
    double factor = 0;
    const char* unit = nullptr;
    const char* kind = nullptr;
    ASSERT_TRUE(proj_coordoperation_get_param(PJ_DEFAULT_CTX, operation, i, nullptr, nullptr, &code,
                                              &value, nullptr, &factor, &unit, nullptr, nullptr,
                                              &kind));
    // Epochs are years here.
    peer[std::stoi(code)] = kind && std::string(kind) == "time" ? value : value * factor;
  }
  ASSERT_EQ(parameters.size(), peer.size()) << name;
  for (const Parameter& parameter : parameters) {
    ASSERT_TRUE(peer.contains(parameter.code)) << name << ": " << parameter.code;
    const double value = registry.base_value(parameter);
    EXPECT_NEAR(value, peer[parameter.code], 1e-14 * std::abs(value))
        << name << ": " << registry.parameter_name(parameter.code);
  }
}

}  // namespace

TEST(RegistryBesideProj, Systems) {
  if (!has_this_registry()) GTEST_SKIP() << "PROJ's database has another version of the registry";
  const Registry registry{std::string(TIDEWATER_STORE)};
  for (const int code : registry.systems()) {
    const auto system = registry.system(code);
    if (system->kind != SystemKind::projected) continue;
    const Object peer = from_database(code, PJ_CATEGORY_CRS);
    ASSERT_TRUE(peer) << code;
    EXPECT_EQ(system->name, proj_get_name(peer.get()));

    double west = 0;
    double south = 0;
    double east = 0;
    double north = 0;
    ASSERT_TRUE(
        proj_get_area_of_use(PJ_DEFAULT_CTX, peer.get(), &west, &south, &east, &north, nullptr));
    const auto area = registry.area(system->area);
    // Of the few systems with two areas of use we take the wider, the peer the first.
    if (area->west == west && area->south == south) {
      EXPECT_EQ(area->east, east) << system->name;
      EXPECT_EQ(area->north, north) << system->name;
    } else {
      EXPECT_LE(area->west, west) << system->name;
      EXPECT_GE(area->east, east) << system->name;
    }

    const Object axes(proj_crs_get_coordinate_system(PJ_DEFAULT_CTX, peer.get()));
    for (int i = 0; i < 2; ++i) {
      const char* abbreviation = nullptr;
      const char* direction = nullptr;
      double factor = 0;
      ASSERT_TRUE(proj_cs_get_axis_info(PJ_DEFAULT_CTX, axes.get(), i, nullptr, &abbreviation,
                                        &direction, &factor, nullptr, nullptr, nullptr));
      EXPECT_NEAR(registry.unit(system->unit)->factor, factor, 1e-14 * factor) << system->name;
      const char letter = system->axes[static_cast<std::size_t>(i)];
      const std::string word = direction;
      const std::map<char, std::string> directions = {
          {'E', "east"}, {'N', "north"}, {'W', "west"}, {'S', "south"}};
      if (system->axes.find('W') != std::string::npos || word == "east" || word == "west") {
        EXPECT_EQ(directions.at(letter), word) << system->name;
      } else if (*abbreviation == 'E' || *abbreviation == 'N') {
        // At a pole the directions are "south" or "north" for both, the letters speak.
        EXPECT_EQ(letter, *abbreviation) << system->name;
      }
    }

    const Object base(proj_crs_get_geodetic_crs(PJ_DEFAULT_CTX, peer.get()));
    EXPECT_EQ(std::to_string(system->base), proj_get_id_code(base.get(), 0)) << system->name;
    const Object ellipsoid(proj_get_ellipsoid(PJ_DEFAULT_CTX, peer.get()));
    double a = 0;
    double inverse_flattening = 0;
    proj_ellipsoid_get_parameters(PJ_DEFAULT_CTX, ellipsoid.get(), &a, nullptr, nullptr,
                                  &inverse_flattening);
    const auto datum = registry.datum(system->datum);
    EXPECT_NEAR(registry.ellipsoid(datum->ellipsoid)->a, a, 1e-8) << system->name;
    EXPECT_NEAR(registry.ellipsoid(datum->ellipsoid)->inverse_flattening, inverse_flattening, 1e-9)
        << system->name;
    const Object meridian(proj_get_prime_meridian(PJ_DEFAULT_CTX, peer.get()));
    double longitude = 0;
    double factor = 0;
    proj_prime_meridian_get_parameters(PJ_DEFAULT_CTX, meridian.get(), &longitude, &factor,
                                       nullptr);
    EXPECT_NEAR(registry.meridian(datum->meridian)->longitude, longitude * factor, 1e-14)
        << system->name;

    const Object conversion(proj_crs_get_coordoperation(PJ_DEFAULT_CTX, peer.get()));
    const auto ours = registry.conversion(system->conversion);
    const char* method = nullptr;
    const char* method_code = nullptr;
    proj_coordoperation_get_method_info(PJ_DEFAULT_CTX, conversion.get(), &method, nullptr,
                                        &method_code);
    EXPECT_EQ(std::to_string(ours->method), method_code) << system->name;
    expect_same_values(registry, conversion.get(), ours->parameters, system->name);
  }
}

TEST(RegistryBesideProj, Operations) {
  if (!has_this_registry()) GTEST_SKIP() << "PROJ's database has another version of the registry";
  const Registry registry{std::string(TIDEWATER_STORE)};
  for (const int code : registry.operations()) {
    const auto operation = registry.operation(code);
    if (operation->parameters.empty()) continue;
    const Object peer = from_database(code, PJ_CATEGORY_COORDINATE_OPERATION);
    ASSERT_TRUE(peer) << code;
    EXPECT_EQ(operation->name, proj_get_name(peer.get()));
    const double accuracy = proj_coordoperation_get_accuracy(PJ_DEFAULT_CTX, peer.get());
    if (accuracy < 0) {
      EXPECT_TRUE(std::isnan(operation->accuracy)) << operation->name;
    } else {
      EXPECT_EQ(operation->accuracy, accuracy) << operation->name;
    }
    expect_same_values(registry, peer.get(), operation->parameters, operation->name);
  }
}

}  // namespace tidewater::test

#else

TEST(RegistryBesideProj, Systems) { GTEST_SKIP() << "PROJ not found: install libproj-dev"; }

#endif
