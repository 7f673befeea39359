// The store that comes with the library, read by the library's own functions.

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <vector>

#include "support/data.hpp"
#include "support/grids.hpp"
#include "support/points.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::test;

namespace {

constexpr const char* kStore = TIDEWATER_STORE;
using Names = std::vector<std::array<char, 41>>;

class FirstStore : public testing::Test {
 protected:
  ~FirstStore() override { EXPECT_EQ(status_, TW_SUCCESS); }
  static void expect_ordered(const Names& names) {
    for (std::size_t i = 1; i < names.size(); ++i) {
      EXPECT_LT(std::string(names[i - 1].data()), std::string(names[i].data()));
    }
  }

  TWstatus status_ = TW_SUCCESS;
};

TEST_F(FirstStore, SystemsLeadToThemselvesByEveryKey) {
  int32_t count = 0;
  TWget_cs_cnt(kStore, -1, &count, &status_);
  ASSERT_GT(count, 40);
  Names names(static_cast<std::size_t>(count));
  TWget_cs_names(kStore, -1, names[0].data(), &status_);
  expect_ordered(names);
  for (const auto& entry : names) {
    int16_t number = 0;
    int16_t same = 0;
    char cls[16];
    char name[41];
    TWcs_to_num(kStore, entry.data(), &number, &status_);
    TWnum_to_cs(kStore, number, name, &status_);
    EXPECT_STREQ(name, entry.data());
    TWcs_to_class(kStore, name, cls, &status_);
    TWclass_to_num(kStore, cls, &same, &status_);
    EXPECT_EQ(same, number);
    TWclass_to_fid(kStore, cls, &same, &status_);
    EXPECT_TRUE(same >= 1 && same <= 3) << name;
  }
  int32_t conformal = 0;
  TWget_cs_cnt(kStore, 128, &conformal, &status_);
  EXPECT_GT(conformal, 10);
  EXPECT_LT(conformal, count);
}

TEST_F(FirstStore, DatumModels) {
  int32_t count = 0;
  TWget_dt_cnt(kStore, -1, &count, &status_);
  EXPECT_EQ(count, 11);
  char cls[16];
  int16_t number = 0;
  TWdt_to_class(kStore, "Standard Molodensky", cls, &status_);
  EXPECT_STREQ(cls, "mol_std");
  TWdt_cls_t_num(kStore, "nadcon", &number, &status_);
  TWdt_num_t_cls(kStore, number, cls, &status_);
  EXPECT_STREQ(cls, "nadcon");
}

TEST_F(FirstStore, VerticalDatumsUnderTheirEpsgCodes) {
  int32_t count = 0;
  TWget_vd_cnt(kStore, &count, &status_);
  Names names(static_cast<std::size_t>(count));
  TWget_vd_names(kStore, names[0].data(), &status_);
  expect_ordered(names);
  char name[44];
  int32_t number = 0;
  TWnum_to_vd(kStore, 5703, name, &status_);
  EXPECT_STREQ(name, "NAVD 88");
  TWvd_to_num(kStore, "Normaal Amsterdams Peil", &number, &status_);
  EXPECT_EQ(number, 5709);
}

TEST_F(FirstStore, UndulationModelsNameTheirGrids) {
  char name[41];
  char grid[17];
  TWundl_to_parm(kStore, "egm96_namer", name, grid, &status_);
  EXPECT_STREQ(name, "EGM96, North America");
  EXPECT_STREQ(grid, "namer96");
  TIDEWATER_NEED_SHARED_DATA();
  EXPECT_TRUE(std::filesystem::exists(shared_data() / "geoid" / (std::string(grid) + ".geo")));
}

// The numbers in the first column of a file of the real data.
std::set<int> first_column(const std::string& file) {
  std::ifstream in(shared_data() / file);
  std::set<int> numbers;
  std::string line;
  for (std::getline(in, line); std::getline(in, line);) numbers.insert(std::stoi(line));
  return numbers;
}

TEST_F(FirstStore, ZonesOfBothSystemsAllHaveNames) {
  for (const auto& [kind, file, total] :
       {std::tuple<int16_t, const char*, int>(0, "zones_1927.csv", 133),
        std::tuple<int16_t, const char*, int>(83, "zones_1983.csv", 123)}) {
    int32_t count = 0;
    TWspcs_cnt(kStore, kind, &count, &status_);
    ASSERT_EQ(count, total);
    std::vector<ZoneRecord> zones(static_cast<std::size_t>(count));
    TWspcs_get_all(kStore, kind, zones.data(), &status_);
    std::set<int> numbers;
    for (const ZoneRecord& zone : zones) {
      int16_t number = 0;
      TWsp_nam_t_num(kStore, kind, zone.zone_name, &number, &status_);
      EXPECT_EQ(number, zone.zone_number);
      numbers.insert(number);
    }
    EXPECT_TRUE(shared_data().empty() || numbers == first_column(file));
  }
  char name[42];
  TWsp_num_t_nam(kStore, 0, 101, name, &status_);
  EXPECT_STREQ(name, "Alabama East");
  TWsp_num_t_nam(kStore, 0, 5300, name, &status_);
  EXPECT_STREQ(name, "American Samoa");
  TWsp_num_t_nam(kStore, 83, 4202, name, &status_);
  EXPECT_STREQ(name, "Texas North Central");
}

TEST_F(FirstStore, SatellitesFollowSnyder) {
  int32_t count = 0;
  TWsomps_cnt(kStore, &count, &status_);
  ASSERT_EQ(count, 6);
  std::vector<SatelliteRecord> all(6);
  TWsomps_get_all(kStore, all.data(), &status_);
  for (const SatelliteRecord& s : all) {
    const bool first_series = s.id <= 3;
    // As many orbits as paths in a whole number of days: 18 and 16.
    EXPECT_NEAR(s.real1 * s.count1, first_series ? 18 : 16, 1e-13);
    EXPECT_DOUBLE_EQ(s.angle1, degrees(first_series ? 99.092 : 98.2));
    EXPECT_EQ(s.angle2, 0);
    EXPECT_DOUBLE_EQ(s.angle3, degrees(first_series ? 128.87 : 129.30));
    EXPECT_LT(s.short1, s.short2);
    EXPECT_EQ(s.short3, s.short2 + 1);
  }
  SatelliteRecord landsat;
  int16_t id = 0;
  TWsomps_name2id(kStore, "Landsat 5", &id, &status_);
  TWsomps_get_sat(kStore, id, &landsat, &status_);
  EXPECT_STREQ(landsat.sat_name, "Landsat 5");
}

// A node of a NADCON-format file: 273 columns, record 0 is the header, value 0 of a record a label.
double node(const std::string& bytes, int row, int column) {
  const auto offset = static_cast<std::size_t>(((row + 1) * 274 + column + 1) * 4);
  return static_cast<double>(f32_at(bytes, offset));
}

std::string bytes_of(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

double sum(const std::vector<MreTerm>& terms, double u, double v) {
  double total = 0;
  for (const MreTerm& t : terms) {
    total += t.coefficient * std::pow(u, t.power_u) * std::pow(v, t.power_v);
  }
  return total;
}

TEST_F(FirstStore, TheRegressionFollowsTheGridThatItWasFittedTo) {
  TIDEWATER_NEED_SHARED_DATA();
  int32_t number = 0;
  TWmre_num(kStore, "NAD 27 to NAD 83, regression of conus", &number, &status_);
  char row[144];
  int32_t n[3];
  TWmre_mdl_info(kStore, number, row, &n[0], &n[1], &n[2], &status_);
  ASSERT_EQ(n[0], 36);
  ASSERT_EQ(n[1], 36);
  EXPECT_EQ(n[2], 0);
  std::vector<MreTerm> lon(36);
  std::vector<MreTerm> lat(36);
  TWmre_coef_buf(kStore, row + 74, row + 95, row + 116, n[0], n[1], n[2], lon.data(), lat.data(),
                 nullptr, &status_);
  double k[3];  // K, longitude offset, latitude offset
  int16_t range = 99;
  std::memcpy(k, row + 48, sizeof k);
  std::memcpy(&range, row + 72, sizeof range);
  EXPECT_EQ(range, 0);
  const std::string los = bytes_of(shared_data() / "nadcon/conus.los");
  const std::string las = bytes_of(shared_data() / "nadcon/conus.las");
  for (int r = 0; r < 121; r += 7) {
    for (int c = 0; c < 273; c += 9) {
      const double u = k[0] * (20 + 0.25 * r + k[2]);
      const double v = k[0] * (-131 + 0.25 * c + k[1]);
      EXPECT_NEAR(sum(lon, u, v), -node(los, r, c), 0.45);  // the file is positive west
      EXPECT_NEAR(sum(lat, u, v), node(las, r, c), 0.26);
    }
  }
}

TEST_F(FirstStore, NewZealandMapGrid) {
  int32_t number = 0;
  int32_t count = 0;
  char row[112];
  TWcpx_num(kStore, "New Zealand Map Grid", &number, &status_);
  TWcpx_mdl_info(kStore, number, row, &count, &status_);
  ASSERT_EQ(count, 7);
  double c[14];
  TWcpx_coef_buf(kStore, row + 88, count, c, &status_);
  EXPECT_EQ(c[0], 0);
  EXPECT_EQ(c[2], 0.7557853228);
  EXPECT_EQ(c[5], 0.003371507);
  EXPECT_EQ(c[13], -1.1651967);
}

// A magnetic model as its users read it: the whole row, the epochs, the coefficients.
struct Model {
  char name[42];
  int16_t number = 0;
  char epoch_table[28];
  double radius = 0;
  int16_t normalisation = 0;
  char text[30];
  double first = 0;
  double last = 0;
  double interval = 0;
  std::vector<int32_t> degrees;
  std::vector<double> epochs;
  std::vector<std::vector<std::vector<double>>> c, s;

  TWstatus read(const char* wanted) {
    TWstatus status = 0;
    int32_t sets = 0;
    std::snprintf(name, sizeof name, "%s", wanted);
    TWmagmdl_info(kStore, name, &number, 1, epoch_table, &radius, &normalisation, text, &first,
                  &last, &interval, &sets, &status);
    if (status != TW_SUCCESS) return status;
    const auto k = static_cast<std::size_t>(sets);
    degrees.resize(k);
    epochs.resize(k);
    std::vector<char> tables(k * 33);
    TWepoch_info(kStore, epoch_table, degrees.data(), epochs.data(), tables.data(), &status);
    if (status != TW_SUCCESS) return status;
    std::vector<std::vector<double*>> c_rows(k), s_rows(k);
    std::vector<double**> c_sets, s_sets;
    c.resize(k);
    s.resize(k);
    for (std::size_t i = 0; i < k; ++i) {
      for (std::size_t n = 0; n <= static_cast<std::size_t>(degrees[i]); ++n) {
        c[i].emplace_back(n + 1, kUntouched);
        s[i].emplace_back(n + 1, kUntouched);
      }
      for (auto& row : c[i]) c_rows[i].push_back(row.data());
      for (auto& row : s[i]) s_rows[i].push_back(row.data());
      c_sets.push_back(c_rows[i].data());
      s_sets.push_back(s_rows[i].data());
    }
    TWmm_coef_info(kStore, sets, degrees.data(), tables.data(), c_sets.data(), s_sets.data(),
                   &status);
    return status;
  }
};

// The cells of a comma-separated file, behind its header.
std::vector<std::vector<double>> numbers_of(const std::filesystem::path& path) {
  std::ifstream in(path);
  std::vector<std::vector<double>> rows;
  std::string line;
  for (std::getline(in, line); std::getline(in, line);) {
    std::stringstream cells(line);
    rows.emplace_back();
    for (std::string cell; std::getline(cells, cell, ',');) rows.back().push_back(std::stod(cell));
  }
  return rows;
}

TEST_F(FirstStore, Wmm2025) {
  Model m;
  ASSERT_EQ(m.read("WMM2025"), TW_SUCCESS);
  EXPECT_EQ(m.radius, 6371200);
  EXPECT_EQ(m.normalisation, 2);
  EXPECT_EQ(m.first, 2025);
  EXPECT_EQ(m.last, 2030);
  EXPECT_EQ(m.epochs, (std::vector<double>{2025, 2030}));
  EXPECT_EQ(m.degrees, (std::vector<int32_t>{12, 12}));
  EXPECT_EQ(m.c[0][0][0], 0);
  EXPECT_EQ(m.c[0][1][0], -29351.8);
  EXPECT_EQ(m.s[1][1][1], -21.5);
  TIDEWATER_NEED_SHARED_DATA();
  for (const auto& row : numbers_of(shared_data() / "magnetic/wmm2025.csv")) {
    const auto n = static_cast<std::size_t>(row[0]);
    const auto order = static_cast<std::size_t>(row[1]);
    EXPECT_EQ(m.c[0][n][order], row[2]);
    EXPECT_EQ(m.s[0][n][order], row[3]);
    EXPECT_EQ(m.c[1][n][order], row[4]);
    EXPECT_EQ(m.s[1][n][order], row[5]);
  }
}

// A generation of the reference field holds the figures of its published table; the set behind the
// last epoch is the fifth part of the difference of the last two columns.
void expect_published(const Model& m, std::size_t epochs, const char* table) {
  ASSERT_EQ(m.epochs.size(), epochs + 1);
  for (std::size_t i = 0; i <= epochs; ++i) {
    EXPECT_EQ(m.epochs[i], 1900 + 5 * static_cast<double>(i));
    EXPECT_EQ(m.degrees[i], i < 19 ? 10 : 13);
  }
  EXPECT_EQ(m.interval, 5);
  TIDEWATER_NEED_SHARED_DATA();
  for (const auto& row : numbers_of(shared_data() / table)) {
    const auto n = static_cast<std::size_t>(row[0]);
    const auto order = static_cast<std::size_t>(std::fabs(row[1]));
    const auto& sets = row[1] < 0 ? m.s : m.c;
    for (std::size_t i = 0; i < epochs; ++i) {
      if (n > static_cast<std::size_t>(m.degrees[i])) {
        EXPECT_EQ(row[2 + i], 0);  // nothing is left out
      } else {
        EXPECT_EQ(sets[i][n][order], row[2 + i]) << n << " " << row[1] << " " << m.epochs[i];
      }
    }
    EXPECT_NEAR(sets[epochs][n][order], (row[2 + epochs] - row[1 + epochs]) / 5, 1e-9);
  }
}

TEST_F(FirstStore, Igrf13) {
  Model m;
  ASSERT_EQ(m.read("IGRF-13"), TW_SUCCESS);
  EXPECT_EQ(m.last, 2025);
  expect_published(m, 25, "magnetic/igrf13.csv");
}

TEST_F(FirstStore, Igrf14) {
  Model m;
  ASSERT_EQ(m.read("IGRF-14"), TW_SUCCESS);
  EXPECT_EQ(m.first, 1900);
  EXPECT_EQ(m.last, 2030);
  // Dipole terms of 2025.0, and their rates, as the table prints them.
  EXPECT_EQ(m.c[25][1][0], -29350.0);
  EXPECT_EQ(m.s[25][1][1], 4545.5);
  EXPECT_NEAR(m.c[26][1][0], 12.6, 1e-9);
  expect_published(m, 26, "magnetic/igrf14.csv");
}

}  // namespace
