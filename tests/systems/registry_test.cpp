// The registry of the built store: against its source files, against PROJ's database where it is
// there, and against entries read by hand in the published registry.

#include "registry.hpp"

#include <gtest/gtest.h>
#include <sqlite3.h>

#include <atomic>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <limits>
#include <map>
#include <numbers>
#include <random>
#include <set>
#include <thread>

#include "csv.hpp"
#include "store_path.hpp"
#include "support/data.hpp"
#include "support/little_memory.hpp"
#include "system_impl.hpp"
#include "text_forms.hpp"

namespace fs = std::filesystem;

namespace tidewater::test {

namespace {

using detail::Found;
using detail::OperationRecord;
using detail::Parameter;
using detail::Registry;
using detail::UnitRecord;

constexpr double kDegree = std::numbers::pi / 180;

const Registry& registry() {
  static const Registry opened{std::string(TIDEWATER_STORE)};
  return opened;
}

// A source file, its cells by the names of their columns.
class Source {
 public:
  explicit Source(const std::string& name)
      : file_(tabdll::read_csv(fs::path(TIDEWATER_SOURCE) / "data/registry" / (name + ".csv"))) {}

  std::size_t size() const { return file_.records.size(); }
  const std::string& text(std::size_t row, const std::string& column) const {
    return file_.records[row].cells[file_.column(column)];
  }
  int integer(std::size_t row, const std::string& column) const {
    return std::stoi(text(row, column));
  }
  double real(std::size_t row, const std::string& column) const {
    return std::stod(text(row, column));
  }

 private:
  tabdll::CsvFile file_;
};

std::set<int> codes_of(const std::vector<OperationRecord>& operations) {
  std::set<int> out;
  for (const OperationRecord& operation : operations) out.insert(operation.code);
  return out;
}

const OperationRecord* with_code(const std::vector<OperationRecord>& operations, int code) {
  for (const OperationRecord& operation : operations) {
    if (operation.code == code) return &operation;
  }
  return nullptr;
}

// The sentence of the Error that an action throws.
template <class Action>
std::string sentence(Action action) {
  try {
    action();
  } catch (const Error& error) {
    return error.what();
  }
  ADD_FAILURE() << "no Error";
  return {};
}

bool same_parameters(const std::vector<Parameter>& a, const std::vector<Parameter>& b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (a[i].code != b[i].code || a[i].value != b[i].value || a[i].unit != b[i].unit) return false;
  }
  return true;
}

}  // namespace

// Source files

TEST(RegistryFiles, EverySystemIsFound) {
  std::size_t count = 0;
  const Source geodetic("geodetic_systems");
  constexpr SystemKind kKinds[] = {SystemKind::geocentric, SystemKind::geographic2d,
                                   SystemKind::geographic3d};
  for (std::size_t i = 0; i < geodetic.size(); ++i, ++count) {
    const auto system = registry().system(geodetic.integer(i, "code"));
    ASSERT_TRUE(system) << geodetic.text(i, "code");
    EXPECT_EQ(system->name, geodetic.text(i, "name"));
    EXPECT_EQ(system->kind, kKinds[geodetic.integer(i, "kind") - 1]);
    EXPECT_EQ(system->datum, geodetic.integer(i, "datum"));
    EXPECT_EQ(system->axes, geodetic.text(i, "axes"));
    EXPECT_EQ(system->unit, geodetic.integer(i, "unit"));
    EXPECT_EQ(system->area, geodetic.integer(i, "area"));
    EXPECT_EQ(system->base + system->conversion + system->horizontal + system->vertical, 0);
  }
  const Source projected("projected_systems");
  for (std::size_t i = 0; i < projected.size(); ++i, ++count) {
    const auto system = registry().system(projected.integer(i, "code"));
    ASSERT_TRUE(system) << projected.text(i, "code");
    EXPECT_EQ(system->name, projected.text(i, "name"));
    EXPECT_EQ(system->kind, SystemKind::projected);
    EXPECT_EQ(system->base, projected.integer(i, "base"));
    EXPECT_EQ(system->conversion, projected.integer(i, "conversion"));
    EXPECT_EQ(system->axes, projected.text(i, "axes"));
    EXPECT_EQ(system->unit, projected.integer(i, "unit"));
    EXPECT_EQ(system->area, projected.integer(i, "area"));
    // What it stands on is there, down to the ellipsoid.
    const auto base = registry().system(system->base);
    ASSERT_TRUE(base);
    EXPECT_EQ(system->datum, base->datum);
    const auto datum = registry().datum(base->datum);
    ASSERT_TRUE(datum) << system->name;
    EXPECT_TRUE(registry().ellipsoid(datum->ellipsoid)) << system->name;
    EXPECT_TRUE(registry().meridian(datum->meridian)) << system->name;
    EXPECT_TRUE(registry().area(system->area)) << system->name;
    EXPECT_TRUE(registry().unit(system->unit)) << system->name;
    EXPECT_TRUE(registry().conversion(system->conversion)) << system->name;
  }
  const Source vertical("vertical_systems");
  for (std::size_t i = 0; i < vertical.size(); ++i, ++count) {
    const auto system = registry().system(vertical.integer(i, "code"));
    ASSERT_TRUE(system) << vertical.text(i, "code");
    EXPECT_EQ(system->name, vertical.text(i, "name"));
    EXPECT_EQ(system->kind, SystemKind::vertical);
    EXPECT_EQ(system->axes, vertical.text(i, "axes"));
    EXPECT_TRUE(registry().datum(system->datum)) << system->name;
  }
  const Source compound("compound_systems");
  for (std::size_t i = 0; i < compound.size(); ++i, ++count) {
    const auto system = registry().system(compound.integer(i, "code"));
    ASSERT_TRUE(system) << compound.text(i, "code");
    EXPECT_EQ(system->name, compound.text(i, "name"));
    EXPECT_EQ(system->kind, SystemKind::compound);
    EXPECT_EQ(system->horizontal, compound.integer(i, "horizontal"));
    EXPECT_EQ(system->vertical, compound.integer(i, "vertical"));
    EXPECT_EQ(system->axes, registry().system(system->horizontal)->axes +
                                registry().system(system->vertical)->axes);
  }
  EXPECT_EQ(registry().systems().size(), count);
}

TEST(RegistryFiles, EveryOperationIsFoundWithItsValues) {
  std::size_t count = 0;
  const Source methods("method_parameters");
  std::map<int, std::vector<int>> parameters;
  for (std::size_t i = 0; i < methods.size(); ++i) {
    parameters[methods.integer(i, "method")].push_back(methods.integer(i, "parameter"));
  }
  const Source continued("transformations_continued");
  std::map<int, std::size_t> more;
  for (std::size_t i = 0; i < continued.size(); ++i) more[continued.integer(i, "operation")] = i;

  const Source transformations("transformations");
  for (std::size_t i = 0; i < transformations.size(); ++i, ++count) {
    const auto operation = registry().operation(transformations.integer(i, "code"));
    ASSERT_TRUE(operation) << transformations.text(i, "code");
    EXPECT_EQ(operation->name, transformations.text(i, "name"));
    EXPECT_EQ(operation->method, transformations.integer(i, "method"));
    EXPECT_EQ(operation->source, transformations.integer(i, "source"));
    EXPECT_EQ(operation->target, transformations.integer(i, "target"));
    EXPECT_EQ(operation->area, transformations.integer(i, "area"));
    const double accuracy = transformations.real(i, "accuracy");
    if (accuracy < 0) {
      EXPECT_TRUE(std::isnan(operation->accuracy));
    } else {
      EXPECT_EQ(operation->accuracy, accuracy);
    }
    std::vector<Parameter> expected;
    for (const int parameter : parameters.at(operation->method)) {
      const std::size_t place = expected.size() + 1;
      const Source& source = place <= 7 ? transformations : continued;
      // Values that are all zero have no further row.
      if (place > 7 && !more.contains(operation->code)) break;
      const std::size_t row = place <= 7 ? i : more.at(operation->code);
      const std::string number = std::to_string(place);
      expected.push_back(
          {parameter, source.real(row, "value" + number), source.integer(row, "unit" + number)});
    }
    EXPECT_EQ(expected.size(), parameters.at(operation->method).size()) << operation->name;
    EXPECT_TRUE(same_parameters(operation->parameters, expected)) << operation->name;
    EXPECT_TRUE(operation->grids.empty() && operation->steps.empty());
    for (const Parameter& parameter : operation->parameters) {
      EXPECT_TRUE(std::isfinite(registry().base_value(parameter))) << operation->name;
      EXPECT_NE(registry().parameter_name(parameter.code), "");
    }
    EXPECT_NE(registry().method_name(operation->method), "");
  }

  const Source grids("grid_transformations");
  for (std::size_t i = 0; i < grids.size(); ++i, ++count) {
    const auto operation = registry().operation(grids.integer(i, "code"));
    ASSERT_TRUE(operation) << grids.text(i, "code");
    EXPECT_EQ(operation->interpolation, grids.integer(i, "interpolation"));
    ASSERT_EQ(operation->grids.size(), grids.text(i, "file2").empty() ? 1U : 2U);
    EXPECT_EQ(operation->grids[0].name, grids.text(i, "file1"));
    EXPECT_GT(operation->grids[0].parameter, 0);
    if (operation->grids.size() > 1) {
      EXPECT_EQ(operation->grids[1].name, grids.text(i, "file2"));
      EXPECT_GT(operation->grids[1].parameter, 0);
    }
    EXPECT_TRUE(operation->parameters.empty() && operation->steps.empty());
  }

  const Source concatenated("concatenated_operations");
  for (std::size_t i = 0; i < concatenated.size(); ++i, ++count) {
    const auto operation = registry().operation(concatenated.integer(i, "code"));
    ASSERT_TRUE(operation) << concatenated.text(i, "code");
    EXPECT_EQ(operation->method, 0);
    ASSERT_GE(operation->steps.size(), 2U);
    for (const int step : operation->steps) {
      const auto found = registry().operation(step);
      EXPECT_TRUE(found || registry().conversion(step)) << operation->name << ", step " << step;
      EXPECT_TRUE(!found || found->steps.empty()) << operation->name;
    }
  }
  EXPECT_EQ(registry().operations().size(), count);
}

TEST(RegistryFiles, EveryConversionHasItsValues) {
  const Source source("conversions");
  for (std::size_t i = 0; i < source.size(); ++i) {
    const auto conversion = registry().conversion(source.integer(i, "code"));
    ASSERT_TRUE(conversion) << source.text(i, "code");
    EXPECT_EQ(conversion->name, source.text(i, "name"));
    EXPECT_NE(registry().method_name(conversion->method), "") << conversion->name;
    for (std::size_t p = 0; p < conversion->parameters.size(); ++p) {
      const std::string number = std::to_string(p + 1);
      EXPECT_EQ(conversion->parameters[p].value, source.real(i, "value" + number));
      EXPECT_EQ(conversion->parameters[p].unit, source.integer(i, "unit" + number));
      EXPECT_TRUE(std::isfinite(registry().base_value(conversion->parameters[p])));
    }
  }
}

TEST(RegistryFiles, CountsAgreeWithProjsDatabase) {
  const char* path = "/usr/share/proj/proj.db";
  if (!fs::exists(path)) GTEST_SKIP() << "PROJ's database not found: install proj-data";
  sqlite3* database = nullptr;
  ASSERT_EQ(sqlite3_open_v2(path, &database, SQLITE_OPEN_READONLY, nullptr), SQLITE_OK);
  const auto count = [database](const std::string& from) {
    sqlite3_stmt* statement = nullptr;
    const std::string sql =
        "SELECT count(*) FROM " + from + " WHERE auth_name = 'EPSG' AND NOT deprecated";
    EXPECT_EQ(sqlite3_prepare_v2(database, sql.c_str(), -1, &statement, nullptr), SQLITE_OK);
    EXPECT_EQ(sqlite3_step(statement), SQLITE_ROW);
    const auto rows = static_cast<std::size_t>(sqlite3_column_int64(statement, 0));
    sqlite3_finalize(statement);
    return rows;
  };
  sqlite3_stmt* statement = nullptr;
  ASSERT_EQ(sqlite3_prepare_v2(database, "SELECT value FROM metadata WHERE key = 'EPSG.VERSION'",
                               -1, &statement, nullptr),
            SQLITE_OK);
  ASSERT_EQ(sqlite3_step(statement), SQLITE_ROW);
  const std::string version = reinterpret_cast<const char*>(sqlite3_column_text(statement, 0));
  sqlite3_finalize(statement);
  if (version != "v10.076") {
    sqlite3_close(database);
    GTEST_SKIP() << "PROJ's database has the registry " << version << ", the store v10.076";
  }
  EXPECT_EQ(registry().systems().size(), count("geodetic_crs") + count("projected_crs") +
                                             count("vertical_crs") + count("compound_crs"));
  EXPECT_EQ(registry().operations().size(),
            count("helmert_transformation_table") + count("grid_transformation") +
                count("other_transformation") + count("concatenated_operation"));
  EXPECT_EQ(Source("conversions").size(), count("conversion_table"));
  EXPECT_EQ(Source("datums").size(), count("geodetic_datum") + count("vertical_datum"));
  sqlite3_close(database);
}

// Entries of the registry, read by hand

TEST(RegistrySystems, Lambert93) {
  const auto system = registry().system(2154);
  ASSERT_TRUE(system);
  EXPECT_EQ(system->name, "RGF93 v1 / Lambert-93");
  EXPECT_EQ(system->axes, "EN");
  EXPECT_EQ(registry().unit(system->unit)->name, "metre");
  EXPECT_EQ(registry().system(system->base)->code, 4171);
  const auto datum = registry().datum(system->datum);
  EXPECT_EQ(registry().ellipsoid(datum->ellipsoid)->name, "GRS 1980");
  EXPECT_EQ(registry().ellipsoid(datum->ellipsoid)->a, 6378137);
  EXPECT_EQ(registry().ellipsoid(datum->ellipsoid)->inverse_flattening, 298.257222101);
  EXPECT_EQ(registry().meridian(datum->meridian)->longitude, 0);
  const auto area = registry().area(system->area);
  EXPECT_EQ(area->west, -9.86);
  EXPECT_EQ(area->south, 41.15);
  EXPECT_EQ(area->east, 10.38);
  EXPECT_EQ(area->north, 51.56);
  const auto conversion = registry().conversion(system->conversion);
  EXPECT_EQ(conversion->method, 9802);
  const std::vector<Parameter> expected = {{8821, 46.3, 9110},   {8822, 3, 9110},
                                           {8823, 49, 9110},     {8824, 44, 9110},
                                           {8826, 700000, 9001}, {8827, 6600000, 9001}};
  EXPECT_TRUE(same_parameters(conversion->parameters, expected));
  EXPECT_DOUBLE_EQ(registry().base_value(conversion->parameters[0]), 46.5 * kDegree);
  EXPECT_DOUBLE_EQ(registry().base_value(conversion->parameters[2]), 49 * kDegree);
  EXPECT_EQ(registry().method_name(9802), "Lambert Conic Conformal (2SP)");
  EXPECT_EQ(registry().parameter_name(8826), "Easting at false origin");
}

TEST(RegistrySystems, LambertOfParisInGrads) {
  const auto system = registry().system(27572);
  ASSERT_TRUE(system);
  EXPECT_EQ(system->name, "NTF (Paris) / Lambert zone II");
  EXPECT_EQ(system->base, 4807);
  const auto base = registry().system(4807);
  EXPECT_EQ(base->axes, "NE");
  EXPECT_EQ(registry().unit(base->unit)->name, "grad");
  EXPECT_EQ(registry().unit(base->unit)->factor, std::numbers::pi / 200);
  const auto meridian = registry().meridian(registry().datum(base->datum)->meridian);
  EXPECT_EQ(meridian->name, "Paris");
  // 2.5969213 grads are 2 degrees 20 minutes 14.025 seconds
  EXPECT_NEAR(meridian->longitude, (2 + 20 / 60. + 14.025012 / 3600) * kDegree, 1e-15);
  const auto ellipsoid = registry().ellipsoid(registry().datum(base->datum)->ellipsoid);
  EXPECT_EQ(ellipsoid->name, "Clarke 1880 (IGN)");
  EXPECT_EQ(ellipsoid->a, 6378249.2);
  // 6378249.2 / (6378249.2 - 6356515)
  EXPECT_NEAR(ellipsoid->inverse_flattening, 293.4660212936265, 1e-9);
  const auto conversion = registry().conversion(system->conversion);
  EXPECT_EQ(conversion->method, 9801);
  EXPECT_DOUBLE_EQ(registry().base_value(conversion->parameters[0]), 52 * std::numbers::pi / 200);
  EXPECT_EQ(conversion->parameters[2].value, 0.99987742);
}

TEST(RegistrySystems, BritishNationalGrid) {
  const auto system = registry().system(27700);
  ASSERT_TRUE(system);
  EXPECT_EQ(system->name, "OSGB36 / British National Grid");
  const auto conversion = registry().conversion(system->conversion);
  EXPECT_EQ(conversion->method, 9807);
  const std::vector<Parameter> expected = {{8801, 49, 9102},
                                           {8802, -2, 9102},
                                           {8805, 0.9996012717, 9201},
                                           {8806, 400000, 9001},
                                           {8807, -100000, 9001}};
  EXPECT_TRUE(same_parameters(conversion->parameters, expected));
  const auto ellipsoid = registry().ellipsoid(registry().datum(system->datum)->ellipsoid);
  EXPECT_EQ(ellipsoid->name, "Airy 1830");
  EXPECT_EQ(ellipsoid->a, 6377563.396);
}

TEST(RegistrySystems, UtmAndWebMercator) {
  const auto utm = registry().system(32631);
  ASSERT_TRUE(utm);
  EXPECT_EQ(utm->name, "WGS 84 / UTM zone 31N");
  EXPECT_EQ(utm->base, 4326);
  EXPECT_DOUBLE_EQ(registry().base_value(registry().conversion(utm->conversion)->parameters[1]),
                   3 * kDegree);
  const auto web = registry().system(3857);
  ASSERT_TRUE(web);
  EXPECT_EQ(registry().conversion(web->conversion)->method, 1024);
}

TEST(RegistrySystems, Wgs84IsAnEnsembleInThreeForms) {
  const auto flat = registry().system(4326);
  ASSERT_TRUE(flat);
  EXPECT_EQ(flat->kind, SystemKind::geographic2d);
  EXPECT_EQ(flat->axes, "NE");
  EXPECT_EQ(registry().system(4979)->kind, SystemKind::geographic3d);
  EXPECT_EQ(registry().system(4979)->axes, "NEU");
  EXPECT_EQ(registry().system(4978)->kind, SystemKind::geocentric);
  EXPECT_EQ(registry().system(4978)->axes, "XYZ");
  const auto datum = registry().datum(flat->datum);
  EXPECT_EQ(datum->ensemble_accuracy, 2);
  EXPECT_TRUE(std::isnan(datum->epoch));
  EXPECT_EQ(datum->members, (std::vector<int>{1166, 1152, 1153, 1154, 1155, 1156, 1309}));
  const auto member = registry().datum(1156);  // WGS 84 (G1762)
  EXPECT_EQ(member->epoch, 2005);
  EXPECT_TRUE(std::isnan(member->ensemble_accuracy));
  EXPECT_TRUE(member->members.empty());
}

TEST(RegistrySystems, AxisOrders) {
  const std::pair<int, const char*> expected[] = {
      {31466, "NE"},                // Gauss-Kruger, DHDN
      {2193, "NE"},                 // New Zealand
      {5513, "SW"},                 // Krovak as it was
      {5514, "EN"},                 // Krovak for maps
      {2065, "SW"},                 // Krovak from Ferro
      {2053, "WS"},                 // South African Lo29
      {5041, "EN"},                 // UPS north, easting first: south along 90 E, south along 180
      {32661, "NE"},                // UPS north, northing first
      {5042, "EN"},                 // UPS south: north along 90 E, north along 0
      {32761, "NE"}, {3031, "EN"},  // Antarctica from Greenwich
      {3413, "EN"},                 // south along 45 E and 135 E of an origin at 45 W
      {3032, "EN"},                 // north along 160 E and 70 E of an origin at 70 E
      {5938, "EN"},                 // Greenland: south along 57 E and 147 E of an origin at 33 W
  };
  for (const auto& [code, axes] : expected) {
    const auto system = registry().system(code);
    ASSERT_TRUE(system) << code;
    EXPECT_EQ(system->axes, axes) << code;
  }
  EXPECT_EQ(registry().system(5831)->axes, "D");
}

TEST(RegistrySystems, WithdrawnOnesAreKnownAsSuch) {
  EXPECT_FALSE(registry().system(27582));
  const auto withdrawn = registry().deprecated(27582);
  ASSERT_TRUE(withdrawn);
  EXPECT_EQ(withdrawn->name, "NTF (Paris) / France II");
  EXPECT_EQ(withdrawn->replaced_by, 27572);
  EXPECT_FALSE(registry().deprecated(27572));
}

TEST(RegistrySystems, UnknownCodesAreEmpty) {
  for (const int code :
       {0, -1, 1, 999999, std::numeric_limits<int>::max(), std::numeric_limits<int>::min()}) {
    EXPECT_FALSE(registry().system(code));
    EXPECT_FALSE(registry().datum(code));
    EXPECT_FALSE(registry().ellipsoid(code));
    EXPECT_FALSE(registry().meridian(code));
    EXPECT_FALSE(registry().unit(code));
    EXPECT_FALSE(registry().area(code));
    EXPECT_FALSE(registry().conversion(code));
    EXPECT_FALSE(registry().operation(code));
    EXPECT_FALSE(registry().deprecated(code));
    EXPECT_EQ(registry().method_name(code), "");
    EXPECT_EQ(registry().parameter_name(code), "");
    EXPECT_TRUE(registry().operations(code, 4326).empty());
    EXPECT_TRUE(registry().operations(4326, code).empty());
    EXPECT_TRUE(registry().operations(code).empty());
  }
}

TEST(RegistryValues, Units) {
  EXPECT_EQ(registry().unit(9003)->factor, 1200 / 3937.);  // US survey foot
  EXPECT_EQ(registry().unit(9002)->factor, 0.3048);
  EXPECT_EQ(registry().unit(9122)->factor, kDegree);
  EXPECT_EQ(registry().unit(9122)->kind, UnitRecord::Kind::angle);
  EXPECT_EQ(registry().unit(9202)->factor, 1e-6);
  EXPECT_EQ(registry().unit(9202)->kind, UnitRecord::Kind::scale);
  EXPECT_EQ(registry().unit(1029)->kind, UnitRecord::Kind::time);
  EXPECT_EQ(registry().base_value({0, 2010.5, 1029}), 2010.5);
  EXPECT_EQ(registry().base_value({0, 0.25, 0}), 0.25);
  EXPECT_DOUBLE_EQ(registry().base_value({0, 3, 9104}), 3 * kDegree / 3600);
  EXPECT_NE(sentence([] {
              registry().base_value({0, 1, 9108});
            }).find("unit 9108"),
            std::string::npos);
  EXPECT_NE(sentence([] {
              registry().base_value({0, 1, 12345});
            }).find("unit 12345"),
            std::string::npos);
}

TEST(RegistryValues, SexagesimalDigits) {
  // The meridian of Bogota: 74 degrees 4 minutes 51.3 seconds west
  EXPECT_DOUBLE_EQ(registry().meridian(8904)->longitude, -(74 + 4 / 60. + 51.3 / 3600) * kDegree);
  // Digits that no double has exactly
  EXPECT_DOUBLE_EQ(registry().base_value({0, 12.27084, 9110}),
                   (12 + 27 / 60. + 8.4 / 3600) * kDegree);
  EXPECT_DOUBLE_EQ(registry().base_value({0, 0.59, 9110}), 59 / 60. * kDegree);
  EXPECT_DOUBLE_EQ(registry().base_value({0, -0.0001, 9110}), -1 / 3600. * kDegree);
  EXPECT_DOUBLE_EQ(registry().base_value({0, 46.3, 9111}), 46.5 * kDegree);
  EXPECT_DOUBLE_EQ(registry().base_value({0, -17.405, 9111}), -(17 + 40.5 / 60) * kDegree);
  EXPECT_EQ(registry().base_value({0, 0, 9110}), 0);
}

// Operations

TEST(RegistryOperations, FromNtfToWgs84) {
  const auto operations = registry().operations(4275, 4326);
  EXPECT_EQ(codes_of(operations), (std::set<int>{1193, 15960}));
  const OperationRecord* shift = with_code(operations, 1193);
  ASSERT_TRUE(shift);
  EXPECT_EQ(shift->name, "NTF to WGS 84 (1)");
  EXPECT_EQ(shift->method, 9603);
  EXPECT_EQ(shift->accuracy, 2);
  EXPECT_EQ(shift->replaced_by, 0);
  EXPECT_TRUE(same_parameters(shift->parameters,
                              {{8605, -168, 9001}, {8606, -60, 9001}, {8607, 320, 9001}}));
  const auto area = registry().area(shift->area);
  EXPECT_EQ(area->name, "France - onshore - mainland and Corsica");
  EXPECT_EQ(area->west, -4.87);
  EXPECT_EQ(area->east, 9.63);
  // A grid that runs the other way: from WGS 84 to NTF.
  const OperationRecord* grid = with_code(operations, 15960);
  ASSERT_TRUE(grid);
  EXPECT_EQ(grid->source, 4326);
  EXPECT_EQ(grid->target, 4275);
  EXPECT_EQ(grid->method, 9615);
  EXPECT_EQ(grid->accuracy, 1);
  ASSERT_EQ(grid->grids.size(), 1U);
  EXPECT_EQ(grid->grids[0].parameter, 8656);
  EXPECT_EQ(grid->grids[0].name, "rgf93_ntf.gsb");
  EXPECT_EQ(grid->grids[0].proj_name, "fr_ign_ntf_r93.tif");
  EXPECT_TRUE(grid->grids[0].proj_reversed);
  // The better one comes first.
  EXPECT_EQ(operations[0].code, 15960);
}

TEST(RegistryOperations, FromNtfToRgf93) {
  const auto operations = registry().operations(4275, 4171);
  EXPECT_EQ(codes_of(operations), (std::set<int>{9327, 15958}));
  const OperationRecord* geocentric = with_code(operations, 9327);
  ASSERT_TRUE(geocentric);
  EXPECT_EQ(geocentric->method, 1087);
  EXPECT_EQ(geocentric->accuracy, 1);
  EXPECT_EQ(geocentric->interpolation, 4171);
  ASSERT_EQ(geocentric->grids.size(), 1U);
  EXPECT_EQ(geocentric->grids[0].name, "gr3df97a.txt");
}

TEST(RegistryOperations, OneWayIsAsGoodAsTheOtherAndAllFormsOfADatumCount) {
  const auto forth = codes_of(registry().operations(4275, 4326));
  EXPECT_EQ(codes_of(registry().operations(4326, 4275)), forth);
  EXPECT_EQ(codes_of(registry().operations(27572, 4326)),
            codes_of(registry().operations(4807, 4978)));
  EXPECT_EQ(codes_of(registry().operations(4275, 4979)), forth);   // heights
  EXPECT_EQ(codes_of(registry().operations(4275, 4978)), forth);   // geocentric
  EXPECT_EQ(codes_of(registry().operations(4275, 32631)), forth);  // projected
  // Paris is another meridian, and so another datum.
  EXPECT_EQ(codes_of(registry().operations(4807, 4275)), (std::set<int>{1763, 1764}));
  EXPECT_DOUBLE_EQ(registry().base_value(registry().operation(1763)->parameters[0]),
                   2.5969213 * std::numbers::pi / 200);
}

TEST(RegistryOperations, TimeDependent) {
  // ITRF2014 to GDA2020: rates of 1.50379, 1.18346, 1.20716 milliarc-seconds a year from 2020.0
  const auto operation = registry().operation(8049);
  ASSERT_TRUE(operation);
  EXPECT_EQ(operation->method, 1056);
  ASSERT_EQ(operation->parameters.size(), 15U);
  std::map<int, Parameter> by_code;
  for (const Parameter& parameter : operation->parameters) by_code[parameter.code] = parameter;
  EXPECT_EQ(by_code[8605].value, 0);
  EXPECT_EQ(by_code[1043].value, 1.50379);
  EXPECT_EQ(by_code[1044].value, 1.18346);
  EXPECT_EQ(by_code[1045].value, 1.20716);
  EXPECT_EQ(by_code[1043].unit, 1032);
  EXPECT_EQ(by_code[1047].value, 2020);
  EXPECT_EQ(registry().base_value(by_code[1047]), 2020);
  EXPECT_NEAR(registry().base_value(by_code[1043]) * 31556925.445, 1.50379e-3 / 3600 * kDegree,
              1e-22);
}

TEST(RegistryOperations, TenParameters) {
  const auto operation = registry().operation(1078);
  ASSERT_TRUE(operation);
  ASSERT_EQ(operation->parameters.size(), 10U);
  EXPECT_EQ(operation->parameters[7].code, 8617);
  EXPECT_EQ(operation->parameters[7].value, 4098647.674);
  EXPECT_EQ(operation->parameters[9].code, 8667);
  EXPECT_EQ(operation->parameters[9].value, 4851251.093);
}

TEST(RegistryOperations, InStepsAndReplaced) {
  const auto operation = registry().operation(8094);
  ASSERT_TRUE(operation);  // NTF (Paris) to RGF93 v1 by way of NTF
  EXPECT_EQ(operation->source, 4807);
  EXPECT_EQ(operation->method, 0);
  ASSERT_EQ(operation->steps.size(), 2U);
  EXPECT_EQ(operation->steps[0], 1763);
  std::size_t replaced = 0;
  for (const int code : registry().operations()) {
    const auto one = registry().operation(code);
    if (one->replaced_by == 0) continue;
    ++replaced;
    EXPECT_NE(one->replaced_by, code);
  }
  EXPECT_GT(replaced, 100U);
}

TEST(RegistryOperations, OfEverySystemAreThoseOfItsDatum) {
  std::map<int, std::set<int>> of_datum;
  const auto datum_of = [](int code) {
    const auto system = registry().system(code);
    return system && system->kind != SystemKind::compound ? system->datum : 0;
  };
  for (const int code : registry().operations()) {
    const auto operation = registry().operation(code);
    of_datum[datum_of(operation->source)].insert(code);
    of_datum[datum_of(operation->target)].insert(code);
  }
  for (const int code : registry().systems()) {
    if (const int datum = datum_of(code)) {
      EXPECT_EQ(codes_of(registry().operations(code)), of_datum[datum]) << code;
    }
  }
}

TEST(RegistryOperations, AllOfADatumOrderedByAccuracy) {
  const auto operations = registry().operations(4275);
  EXPECT_GE(operations.size(), 14U);
  EXPECT_TRUE(codes_of(operations).contains(1763));
  for (std::size_t i = 1; i < operations.size(); ++i) {
    EXPECT_FALSE(operations[i].accuracy < operations[i - 1].accuracy);
    EXPECT_FALSE(std::isnan(operations[i - 1].accuracy) && !std::isnan(operations[i].accuracy));
  }
  // Heights: from WGS 84 to the heights of EGM2008 by one of two grids.
  EXPECT_EQ(codes_of(registry().operations(4979, 3855)), (std::set<int>{3858, 3859}));
}

// Names

TEST(RegistryNames, ByName) {
  EXPECT_EQ(registry().system("RGF93 v1 / Lambert-93")->code, 2154);
  EXPECT_EQ(registry().system("rgf93_v1_lambert_93")->code, 2154);
  EXPECT_EQ(registry().system("WGS 84")->code, 4326);  // not 4978, 4979
  EXPECT_EQ(registry().system("Web Mercator")->code, 3857);
  EXPECT_FALSE(registry().system("Lambert"));
  EXPECT_FALSE(registry().system(""));
  EXPECT_EQ(registry().datum("OSGB_1936")->code, 6277);
  EXPECT_EQ(registry().datum("WGS_1984")->code, 6326);
  EXPECT_EQ(registry().datum("World Geodetic System 1984")->code, 6326);
  EXPECT_EQ(registry().datum("Réseau Géodésique Français 1993")->code, 6171);
  EXPECT_EQ(registry().datum("reseau geodesique francais 1993")->code, 6171);
  EXPECT_EQ(registry().ellipsoid("GRS_1980")->code, 7019);
  EXPECT_EQ(registry().ellipsoid("clarke 1866")->code, 7008);
  EXPECT_EQ(registry().meridian("PARIS")->code, 8903);
  EXPECT_EQ(registry().unit("US survey foot")->code, 9003);
  EXPECT_EQ(registry().unit("Clarkes foot")->code, 9005);
  EXPECT_EQ(registry().unit("Foot_US")->code, 9003);
  EXPECT_EQ(registry().unit("Meter")->code, 9001);
  EXPECT_FALSE(registry().unit("cubit"));
}

TEST(RegistryNames, Search) {
  const auto first = [](std::string_view words) {
    const auto found = registry().search(words, 1);
    return found.empty() ? 0 : found[0].code;
  };
  EXPECT_EQ(first("lambert 93"), 2154);
  EXPECT_EQ(first("LAMBERT-93"), 2154);
  EXPECT_EQ(first("british national"), 27700);
  EXPECT_EQ(first("national british grid"), 27700);
  EXPECT_EQ(first("web mercator"), 3857);
  EXPECT_EQ(first("2154"), 2154);
  EXPECT_EQ(first("EPSG:27700"), 27700);
  EXPECT_EQ(first("wgs 84 utm zone 31n"), 32631);
  EXPECT_EQ(first("wgs 84"), 4326);
  EXPECT_EQ(first("krovak"), 2065);  // of the whole words the smallest code
  EXPECT_EQ(first("reunion 1947"), first("Réunion 1947"));
  EXPECT_NE(first("reunion 1947"), 0);
  EXPECT_TRUE(registry().search("").empty());
  EXPECT_TRUE(registry().search(" /-,. ").empty());
  EXPECT_TRUE(registry().search("no such words anywhere").empty());
  EXPECT_EQ(registry().search("utm", 7).size(), 7U);
  EXPECT_TRUE(registry().search("utm", 0).empty());

  // Whole words, then beginnings, then anywhere; no system twice.
  const auto found = registry().search("lambert 9", 1000);
  std::set<int> codes;
  for (const Found& f : found) EXPECT_TRUE(codes.insert(f.code).second) << f.code;
  EXPECT_TRUE(codes.contains(2154));
}

TEST(RegistryNames, Suggestions) {
  EXPECT_EQ(registry().suggest("Lamber-93").at(0), "RGF93 v1 / Lambert-93");
  EXPECT_EQ(registry().suggest("british nationl grid").at(0), "OSGB36 / British National Grid");
  EXPECT_EQ(registry().suggest("WSG 84").at(0), "WGS 84");
  EXPECT_LE(registry().suggest("utm zone 31").size(), 3U);
  EXPECT_TRUE(registry().suggest("").empty());
  EXPECT_TRUE(registry().suggest(std::string(5000, 'x')).empty());
}

// Threads

TEST(RegistryThreads, AThousandAtOnce) {
  const std::vector<int> systems = registry().systems();
  std::atomic<int> wrong = 0;
  std::vector<std::thread> threads;
  // 32 bits count no more bytes than the stacks of some hundred.
  const std::size_t many = sizeof(void*) < 8 ? 200 : 1000;
  for (std::size_t t = 0; t < many; ++t) {
    threads.emplace_back([&, t] {
      const Registry& shared = Registry::shared();
      for (std::size_t i = t; i < systems.size(); i += 997) {
        const auto system = shared.system(systems[i]);
        if (!system || system->name.empty()) ++wrong;
      }
      if (t % 100 == 0 && shared.search("lambert 93", 1).at(0).code != 2154) ++wrong;
      if (shared.operations(4275, 4326).size() != 2) ++wrong;
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrong, 0);
}

// Stores that are none, or no longer

class RegistryStores : public ::testing::Test {
 protected:
  std::string path(const std::string& name) const { return (folder_.path() / name).string(); }

  // A copy of the store, altered by statements.
  std::string altered(const std::string& sql) const {
    const std::string copy = path("altered.store");
    fs::copy_file(TIDEWATER_STORE, copy, fs::copy_options::overwrite_existing);
    sqlite3* database = nullptr;
    EXPECT_EQ(sqlite3_open(copy.c_str(), &database), SQLITE_OK);
    char* error = nullptr;
    EXPECT_EQ(sqlite3_exec(database, sql.c_str(), nullptr, nullptr, &error), SQLITE_OK) << error;
    sqlite3_close(database);
    return copy;
  }

  std::string refused(const std::string& store) const {
    return sentence([&] { const Registry opened(store); });
  }

  ScratchFolder folder_;
};

TEST_F(RegistryStores, AreFoundByVariableOrBesideTheLibrary) {
  const char* before = std::getenv("TIDEWATER_STORE");
  const std::string kept = before ? before : "";
  setenv("TIDEWATER_STORE", "/some/where.store", 1);
  EXPECT_EQ(detail::store_path(), "/some/where.store");
  setenv("TIDEWATER_STORE", "", 1);
  EXPECT_TRUE(fs::equivalent(detail::store_path(), TIDEWATER_STORE));
  unsetenv("TIDEWATER_STORE");
  EXPECT_TRUE(fs::equivalent(detail::store_path(), TIDEWATER_STORE));
  if (before) setenv("TIDEWATER_STORE", kept.c_str(), 1);
}

TEST_F(RegistryStores, ThatAreNoneSayTheirName) {
  EXPECT_NE(refused(path("absent")).find("absent"), std::string::npos);
  EXPECT_NE(refused(folder_.path().string()).find(folder_.path().string()), std::string::npos);
  folder_.write("garbage", std::string(10000, '\x5a'));
  EXPECT_NE(refused(path("garbage")).find("garbage"), std::string::npos);
  folder_.write("empty", "");
  EXPECT_NE(refused(path("empty")).find("empty"), std::string::npos);
}

TEST_F(RegistryStores, WithoutATableOfTheRegistryNameIt) {
  for (const char* table : {"geodetic systems",
                            "projected systems",
                            "vertical systems",
                            "compound systems",
                            "deprecated systems",
                            "datums",
                            "datum members",
                            "ellipsoids",
                            "meridians",
                            "units",
                            "areas",
                            "methods",
                            "parameters",
                            "method parameters",
                            "aliases",
                            "conversions",
                            "transformations",
                            "transformations continued",
                            "grid transformations",
                            "concatenated operations",
                            "grids"}) {
    const std::string name = table;
    const std::string words =
        refused(altered("DROP TABLE \"" + name +
                        "\"; DELETE FROM tidewater_layout WHERE \"table\" = '" + name + "'"));
    EXPECT_NE(words.find("has no registry"), std::string::npos) << words;
    EXPECT_NE(words.find("\"" + name + "\""), std::string::npos) << words;
  }
}

TEST_F(RegistryStores, CutShortAreRefused) {
  std::ifstream in(TIDEWATER_STORE, std::ios::binary);
  const std::string whole{std::istreambuf_iterator<char>(in), {}};
  for (std::size_t tenths = 0; tenths < 10; ++tenths) {
    for (const std::size_t more : {0U, 1U, 4095U}) {
      folder_.write("cut", whole.substr(0, whole.size() / 10 * tenths + more));
      EXPECT_NE(refused(path("cut")).find("cut"), std::string::npos) << tenths;
    }
  }
}

TEST_F(RegistryStores, ThatLieAreRefused) {
  const std::pair<const char*, const char*> lies[] = {
      {"UPDATE \"projected systems\" SET code = 7 WHERE code = 2154", "code"},
      {"UPDATE \"projected systems\" SET base = 1 WHERE code = 2154", "base"},
      {"UPDATE \"projected systems\" SET axes = 'Q!' WHERE code = 2154", "axes"},
      {"UPDATE \"projected systems\" SET axes = 'E' WHERE code = 2154", "axes"},
      {"UPDATE \"projected systems\" SET base = 2147483647 WHERE code = 2154", "base"},
      {"UPDATE \"projected systems\" SET axes = 'EE' WHERE code = 2154", "axes"},
      {"UPDATE \"geodetic systems\" SET kind = 0 WHERE code = 4326", "kind"},
      {"UPDATE \"geodetic systems\" SET kind = 9 WHERE code = 4326", "kind"},
      {"UPDATE \"geodetic systems\" SET axes = 'NE' WHERE code = 4979", "axes"},
      {"UPDATE \"geodetic systems\" SET axes = 'EE' WHERE code = 4326", "axes"},
      {"UPDATE \"geodetic systems\" SET axes = 'NED' WHERE code = 4979", "axes"},
      {"UPDATE \"geodetic systems\" SET axes = 'NEU' WHERE code = 4978", "axes"},
      {"UPDATE \"vertical systems\" SET axes = 'E' WHERE code = 5773", "axes"},
      {"UPDATE \"geodetic systems\" SET axes = 'NEU' WHERE code = 4326", "axes"},
      {"UPDATE \"compound systems\" SET horizontal = code WHERE code = 7405", "horizontal"},
      {"UPDATE \"compound systems\" SET vertical = 4326 WHERE code = 7405", "vertical"},
      {"UPDATE \"compound systems\" SET horizontal = 5701 WHERE code = 7405", "two axes"},
      {"UPDATE \"compound systems\" SET horizontal = 4978 WHERE code = 7405", "two axes"},
      {"UPDATE \"compound systems\" SET vertical = 999999 WHERE code = 7405", "vertical"},
      {"UPDATE ellipsoids SET semi_major_axis = -1 WHERE code = 7030", "ellipsoid"},
      {"UPDATE ellipsoids SET semi_minor_axis = -1 WHERE code = 7030", "ellipsoid"},
      {"UPDATE ellipsoids SET semi_minor_axis = 6378138 WHERE code = 7030", "ellipsoid"},
      {"UPDATE ellipsoids SET inverse_flattening = 0.5 WHERE code = 7030", "ellipsoid"},
      {"WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n LIMIT 1000001) "
       "INSERT INTO \"datum members\" SELECT 900000, i FROM n",
       "\"datum members\" has 10"},
      {"UPDATE units SET kind = 'weight' WHERE code = 9001", "kind"},
      {"UPDATE units SET factor = -1 WHERE code = 9001", "factor"},
      {"UPDATE areas SET west = 1000 WHERE code = 1262", "Earth"},
      {"UPDATE \"grid transformations\" SET file1 = '' WHERE code = 15960", "grid"},
      {"UPDATE \"concatenated operations\" SET step1 = 0 WHERE code = 8094", "steps"},
  };
  for (const auto& [sql, word] : lies) {
    const std::string words = refused(altered(sql));
    EXPECT_NE(words.find("cannot be used"), std::string::npos) << sql << ": " << words;
    EXPECT_NE(words.find(word), std::string::npos) << sql << ": " << words;
  }
}

TEST_F(RegistryStores, WhoseCellsDoNotPackAreNoStores) {
  for (const char* sql : {"UPDATE ellipsoids SET semi_major_axis = 9e999 WHERE code = 7030",
                          "UPDATE conversions SET value1 = 'a text' WHERE code = 18085",
                          "UPDATE datums SET code = 99999999999 WHERE code = 6326"}) {
    const std::string words = refused(altered(sql));
    EXPECT_NE(words.find("is not a parameter store"), std::string::npos) << sql << ": " << words;
  }
}

TEST_F(RegistryStores, DamagedAnywhereAreRefusedOrAnswer) {
  std::ifstream in(TIDEWATER_STORE, std::ios::binary);
  const std::string whole{std::istreambuf_iterator<char>(in), {}};
  std::mt19937 random(20260831);
  for (int round = 0; round < 60; ++round) {
    std::string damaged = whole;
    // From a single byte anywhere to many; in every third round in the schema too.
    for (int byte = 0; byte <= round / 2; ++byte) {
      const std::size_t reach = round % 3 == 0 && byte % 4 == 3 ? 20480 : damaged.size();
      damaged[random() % reach] = static_cast<char>(random());
    }
    folder_.write("damaged", damaged);
    try {
      const Registry opened(path("damaged"));
      for (const int code : opened.systems()) opened.system(code);
      for (const int code : opened.operations()) opened.operation(code);
      opened.operations(4275, 4326);
      opened.search("lambert 93");
      opened.suggest("lambret");
    } catch (const Error& error) {
      EXPECT_NE(std::string(error.what()).find("damaged"), std::string::npos) << error.what();
    }
  }
}

// Values that no entry of the registry has at hand.
TEST_F(RegistryStores, OfOtherEntriesAnswerAsTheyStand) {
  const Registry other(
      altered("UPDATE transformations SET accuracy = -1 WHERE code = 1193;"
              "UPDATE \"grid transformations\" SET accuracy = -1 WHERE code = 9327;"
              "UPDATE transformations SET source = 1 WHERE code = 1133;"
              "UPDATE transformations SET target = 1 WHERE code = 1134;"
              "UPDATE ellipsoids SET semi_minor_axis = semi_major_axis WHERE code = 7030;"
              "UPDATE units SET factor = 0 WHERE code = 9003;"
              "INSERT INTO aliases VALUES (0, 999999, 'no system of that code');"
              "INSERT INTO aliases VALUES (9, 2154, 'another kind of name');"
              "WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n LIMIT 20) "
              "INSERT INTO \"method parameters\" SELECT 999999, i FROM n;"
              "UPDATE transformations SET method = 999999 WHERE code IN (8049, 1193)"));
  // An accuracy that is not known goes last, whatever the codes.
  const auto operations = other.operations(4275, 4326);
  ASSERT_EQ(operations.size(), 2U);
  EXPECT_EQ(operations[0].code, 15960);
  EXPECT_EQ(operations[1].code, 1193);
  EXPECT_TRUE(std::isnan(operations[1].accuracy));
  const auto all = other.operations(4275);
  ASSERT_GT(all.size(), 3U);
  EXPECT_TRUE(std::isnan(all[all.size() - 1].accuracy) && std::isnan(all[all.size() - 2].accuracy));
  EXPECT_FALSE(std::isnan(all[all.size() - 3].accuracy));
  // From or to a system that is none leads nowhere.
  EXPECT_TRUE(with_code(registry().operations(4230), 1133));
  EXPECT_FALSE(with_code(other.operations(4230, 4326), 1133));
  EXPECT_FALSE(with_code(other.operations(4230, 4326), 1134));
  EXPECT_TRUE(other.operations(1).empty());
  // A semi-minor axis as long as the other one tells no flattening.
  EXPECT_EQ(other.ellipsoid(7030)->inverse_flattening, 298.257223563);
  EXPECT_NE(sentence([&] {
              other.base_value({0, 1, 9003});
            }).find("unit 9003, which has no factor"),
            std::string::npos);
  EXPECT_FALSE(other.system("no system of that code"));
  EXPECT_TRUE(other.search("no system of that code").empty());
  EXPECT_FALSE(other.system("another kind of name"));
  EXPECT_TRUE(other.suggest("no system of that cod").empty());
  // No more parameters than an entry has places for: 7 and 8 more.
  EXPECT_EQ(other.operation(8049)->parameters.size(), 15U);
  EXPECT_EQ(other.operation(1193)->parameters.size(), 7U);
}

// From a datum to itself leads what moves its points in time, and nothing that leaves it.
TEST(RegistryOperations, WithinOneDatum) {
  EXPECT_EQ(codes_of(registry().operations(8251, 8251)), (std::set<int>{8676}));
  EXPECT_GT(registry().operations(8251).size(), 1U);
}

TEST(RegistryFiles, EllipsoidsAreListed) {
  const Source source("ellipsoids");
  const std::vector<int> codes = registry().ellipsoids();
  ASSERT_EQ(codes.size(), source.size());
  for (std::size_t i = 0; i < source.size(); ++i) EXPECT_EQ(codes[i], source.integer(i, "code"));
}

// The process's own registry, read from a store in which something is missing that others refer to:
// each in a process of its own.
TEST_F(RegistryStores, WithHolesRefuseWhatStandsOnThem) {
  TIDEWATER_NEED_NEW_PROCESS();
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  struct Hole {
    const char* sql;
    int system;
    const char* words;
  };
  const Hole holes[] = {
      {"UPDATE \"projected systems\" SET unit = 1 WHERE code = 2154", 2154,
       "no unit 1, which RGF93 v1 / Lambert-93 refers to"},
      {"DELETE FROM datums WHERE code = 6171", 2154,
       "no datum 6171, which the definition refers to"},
      {"DELETE FROM ellipsoids WHERE code = 7019", 2154,
       "no ellipsoid 7019, which the definition refers to"},
      {"DELETE FROM meridians WHERE code = 8901", 2154, "no prime meridian 8901, which R"},
      {"DELETE FROM conversions WHERE code = 18085", 2154,
       "no conversion 18085, which RGF93 v1 / Lambert-93 refers to"},
      {"DELETE FROM datums WHERE code = 5101", 7405, "no datum 5101, which ODN height refers to"},
      {"DELETE FROM datums WHERE code = 5101", 5701, "no datum 5101, which ODN height refers to"},
      {"UPDATE \"vertical systems\" SET unit = 1 WHERE code = 5701", 7405,
       "no unit 1, which OSGB36 / British National Grid . ODN height refers to"},
      {"UPDATE \"vertical systems\" SET unit = 1 WHERE code = 5701", 5701,
       "no unit 1, which ODN height refers to"},
      // Without an area of use it is the whole Earth; sexagesimal degrees are degrees.
      {"DELETE FROM areas WHERE code = 1326; UPDATE \"projected systems\" SET area = 99999 "
       "WHERE code = 2154",
       2154, "RGF93 v1 / Lambert-93, -180 to 180"},
      {"UPDATE \"geodetic systems\" SET unit = 9110 WHERE code = 4171", 4171,
       "RGF93 v1, .* of degree"},
  };
  for (const Hole& hole : holes) {
    EXPECT_EXIT(
        {
          setenv("TIDEWATER_STORE", altered(hole.sql).c_str(), 1);
          try {
            const detail::Definition known = detail::definition_from_registry(hole.system);
            std::cerr << known.name << ", " << known.west << " to " << known.east << " of "
                      << known.unit.name;
          } catch (const Error& error) {
            std::cerr << error.what();
          }
          fs::remove_all(folder_.path());
          std::exit(0);
        },
        ::testing::ExitedWithCode(0), hole.words)
        << hole.sql;
  }
  // Without a registry a text speaks for itself.
  EXPECT_EXIT(
      {
        setenv("TIDEWATER_STORE", path("absent").c_str(), 1);
        const detail::Definition read = detail::definition_from_wkt(
            "GEOGCS[\"g\",DATUM[\"WGS_1984\",SPHEROID[\"s\",6378137,298.257223563]]]");
        std::cerr << read.datum.name << " " << read.datum.code;
        fs::remove_all(folder_.path());
        std::exit(0);
      },
      ::testing::ExitedWithCode(0), "WGS_1984 0");
}

#ifdef __linux__

// A program that stands where there is no store says where it looked, also one found by its name.
TEST_F(RegistryStores, ThatAreNowhereAreLookedForBesideTheProgram) {
  TIDEWATER_NEED_NEW_PROCESS();
  constexpr const char* kCopied = "TIDEWATER_COPIED_TEST";
  if (std::getenv(kCopied) != nullptr) {
    std::cout << sentence([] { detail::store_path(); }) << std::endl;
    return;
  }
  const fs::path program = folder_.path() / "copied_test";
  fs::copy_file("/proc/self/exe", program);
  const std::string arguments =
      " --gtest_filter=RegistryStores.ThatAreNowhereAreLookedForBesideTheProgram > " +
      path("printed");
  const std::string before =
      std::string("unset TIDEWATER_STORE GTEST_TOTAL_SHARDS GTEST_SHARD_INDEX; ") + kCopied + "=1 ";
  for (const std::string& call :
       {before + program.string(), before + "PATH=" + folder_.path().string() + " copied_test"}) {
    EXPECT_EQ(std::system((call + arguments).c_str()), 0) << call;
    std::ifstream in(path("printed"));
    const std::string printed{std::istreambuf_iterator<char>(in), {}};
    EXPECT_NE(printed.find("No parameter store was found at \""), std::string::npos) << printed;
    EXPECT_NE(printed.find("\"" + (fs::canonical(folder_.path()) / "tidewater.store").string()),
              std::string::npos)
        << printed;
    EXPECT_NE(printed.find("the environment variable TIDEWATER_STORE may name one."),
              std::string::npos);
  }
}

#endif

TEST_F(RegistryStores, WithHolesAnswerWithNothing) {
  const Registry holes(
      altered("DELETE FROM ellipsoids; DELETE FROM \"method parameters\"; DELETE FROM areas;"
              "DELETE FROM \"transformations continued\"; DELETE FROM grids; DELETE FROM methods"));
  EXPECT_FALSE(holes.ellipsoid(7030));
  EXPECT_TRUE(holes.conversion(18085)->parameters.empty());
  EXPECT_TRUE(holes.operation(1193)->parameters.empty());
  EXPECT_EQ(holes.operation(15960)->grids.at(0).parameter, 0);
  EXPECT_EQ(holes.operation(15960)->grids.at(0).proj_name, "");
  EXPECT_EQ(holes.method_name(9802), "");
  EXPECT_EQ(holes.search("lambert 93").at(0).code, 2154);
}

}  // namespace tidewater::test
