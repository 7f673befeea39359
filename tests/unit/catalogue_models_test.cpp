// Regression, complex and magnetic models.

#include <gtest/gtest.h>

#include <cstring>

#include "support/fake_store.hpp"
#include "support/points.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::test;

namespace {

using Type = FakeStore::Type;

class CatalogueModels : public testing::Test {
 protected:
  void SetUp() override { store_.clear(); }

  FakeStore& store_ = FakeStore::current();
  TWstatus status_ = 0;
};

class RegressionModels : public CatalogueModels {
 protected:
  void SetUp() override {
    CatalogueModels::SetUp();
    store_.add_table("mre models", {{"model name", 0, Type::kText}, {"num", 44, Type::kInt32}});
    PackedRow row(144);
    row.text(0, "North").i32(44, 70000).f64(48, 0.05).text(74, "a table of 20 chars.");
    row.text(95, "lat").text(116, "height").i32(140, 12345);
    store_.add_row("mre models", row);
    store_.add_table("a table of 20 chars.", {});
    store_.add_table("lat", {});
    store_.add_table("height", {});
    for (int i = 0; i < 3; ++i) {
      store_.add_row("a table of 20 chars.",
                     PackedRow(16).f64(0, 1.5 + i).i16(8, static_cast<int16_t>(i)).i16(10, 9));
    }
    store_.add_row("lat", PackedRow(16).f64(0, 8));
  }
};

TEST_F(RegressionModels, AMissIsWritten) {
  int32_t number = 99;
  char name[44] = "#";
  TWmre_num("p", "South", &number, &status_);
  EXPECT_EQ(status_, TW_NO_SUCH_MODEL);
  EXPECT_EQ(number, 0);
  TWmre_nam("p", 4464, name, &status_);
  EXPECT_EQ(status_, TW_NO_SUCH_MODEL);
  EXPECT_STREQ(name, "");
  EXPECT_EQ(store_.closes(), 2);
}

TEST_F(RegressionModels, NothingIsWrittenWhereTheTableIsMissing) {
  store_.fail(StoreCall::kReset);
  int32_t number = 99;
  TWmre_num("p", "North", &number, &status_);
  EXPECT_EQ(status_, TW_PF_TABLE_ERROR);
  EXPECT_EQ(number, 99);
}

TEST_F(RegressionModels, RowAndSizesOfItsThreeTables) {
  char name[44];
  char names[41];
  int32_t number = 0;
  int32_t counts[3] = {-1, -1, -1};
  char row[145];
  std::memset(row, '#', sizeof row);
  TWmre_num("p", "North", &number, &status_);
  EXPECT_EQ(number, 70000);
  TWmre_nam("p", number, name, &status_);
  EXPECT_STREQ(name, "North");
  TWmre_names("p", names, &status_);
  EXPECT_STREQ(names, "North");
  TWmre_mdl_info("p", number, row, &counts[0], &counts[1], &counts[2], &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(counts[0], 3);
  EXPECT_EQ(counts[1], 1);
  EXPECT_EQ(counts[2], 0);
  EXPECT_STREQ(row + 74, "a table of 20 chars.");
  EXPECT_STREQ(row + 116, "height");
  int32_t last = 0;
  std::memcpy(&last, row + 140, sizeof last);
  EXPECT_EQ(last, 12345);
  EXPECT_EQ(row[144], '#');
}

TEST_F(RegressionModels, TheFirstUncountedTableEndsTheInformation) {
  store_.fail(StoreCall::kRows, FakeStore::kOtherSuccess, 2);
  int32_t counts[3] = {-1, -1, -1};
  char row[144];
  TWmre_mdl_info("p", 70000, row, &counts[0], &counts[1], &counts[2], &status_);
  EXPECT_EQ(status_, TW_PF_TABLE_ERROR);
  EXPECT_STREQ(row, "North");
  EXPECT_EQ(counts[0], 3);
  EXPECT_EQ(counts[1], -1);
  EXPECT_EQ(counts[2], -1);
  EXPECT_EQ(store_.calls(StoreCall::kRows), 2);
}

TEST_F(RegressionModels, TermsOfTheThreeTables) {
  MreTerm a[4];
  MreTerm b[1];
  std::memset(a, '#', sizeof a);
  TWmre_coef_buf("p", "a table of 20 chars.", "lat", "height", 3, 1, 0, a, b, nullptr, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(a[0].coefficient, 1.5);
  EXPECT_EQ(a[2].coefficient, 3.5);
  EXPECT_EQ(a[2].power_u, 2);
  EXPECT_EQ(a[2].power_v, 9);
  EXPECT_EQ(a[3].power_u, 0x2323);
  EXPECT_EQ(b[0].coefficient, 8);
  EXPECT_EQ(store_.calls(StoreCall::kSearch), 0);
}

TEST_F(RegressionModels, OnlyTheLastRowOfATableIsJudged) {
  MreTerm a[3];
  MreTerm b[1];
  a[1].coefficient = kUntouched;
  b[0].coefficient = kUntouched;
  store_.fail(StoreCall::kNext, FakeStore::kSomeFailure, 2);
  TWmre_coef_buf("p", "a table of 20 chars.", "lat", "height", 3, 1, 0, a, b, nullptr, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(a[1].coefficient, kUntouched);
  EXPECT_EQ(a[2].coefficient, 2.5);
  EXPECT_EQ(b[0].coefficient, 8);

  b[0].coefficient = kUntouched;
  store_.fail(StoreCall::kNext, FakeStore::kSomeFailure, 3);
  TWmre_coef_buf("p", "a table of 20 chars.", "lat", "height", 3, 1, 0, a, b, nullptr, &status_);
  EXPECT_EQ(status_, TW_PF_TABLE_ERROR);
  EXPECT_EQ(b[0].coefficient, kUntouched);
  EXPECT_EQ(store_.closes(), 2);
}

TEST_F(RegressionModels, AShortTableLeavesTheRestOfTheTerms) {
  MreTerm b[2];
  b[1].coefficient = kUntouched;
  TWmre_coef_buf("p", "lat", "lat", "lat", 2, 0, 0, b, nullptr, nullptr, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(b[0].coefficient, 8);
  EXPECT_EQ(b[1].coefficient, kUntouched);
}

TEST_F(CatalogueModels, MoreTermsThan16BitsCount) {
  store_.add_table("long", {});
  PackedRow row(16);
  for (int i = 0; i < 40000; ++i) store_.add_row("long", row.f64(0, i));
  std::vector<MreTerm> terms(40000);
  TWmre_coef_buf("p", "long", "long", "long", 40000, 0, 0, terms.data(), nullptr, nullptr,
                 &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(terms.back().coefficient, 39999);
}

TEST_F(CatalogueModels, ComplexModels) {
  store_.add_table("Complex Models",
                   {{"Model Name", 0, Type::kText}, {"Number", 44, Type::kInt32}});
  PackedRow model(112);
  model.text(0, "Grid").i32(44, 3).text(88, "a table's name of 23 ch").f64(48, 7);
  store_.add_row("Complex Models", model);
  store_.add_table("a table's name of 23 ch", {});
  store_.add_row("a table's name of 23 ch", PackedRow(24).i32(0, 1).f64(8, 1.5).f64(16, -2.5));
  store_.add_row("a table's name of 23 ch", PackedRow(24).i32(0, 2).f64(8, 3.5).f64(16, 4.5));

  int32_t count = 0;
  int32_t number = 0;
  char name[44];
  char names[41];
  char row[113];
  row[112] = '#';
  TWcpx_cnt("p", &count, &status_);
  EXPECT_EQ(count, 1);
  TWcpx_names("p", names, &status_);
  EXPECT_STREQ(names, "Grid");
  EXPECT_EQ(store_.log()[5], "search Complex Models Model Name");
  TWcpx_num("p", "Grid", &number, &status_);
  EXPECT_EQ(number, 3);
  TWcpx_nam("p", 3, name, &status_);
  EXPECT_STREQ(name, "Grid");
  TWcpx_mdl_info("p", 3, row, &count, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(count, 2);
  EXPECT_EQ(row[112], '#');
  EXPECT_STREQ(row + 88, "a table's name of 23 ch");
  // One more than there are: the last row is repeated.
  double c[7] = {0, 0, 0, 0, 0, 0, kUntouched};
  TWcpx_coef_buf("p", "a table's name of 23 ch", 3, c, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  const double expected[7] = {1.5, -2.5, 3.5, 4.5, 3.5, 4.5, kUntouched};
  for (int i = 0; i < 7; ++i) EXPECT_EQ(c[i], expected[i]) << i;

  TWcpx_num("p", "grid", &number, &status_);
  EXPECT_EQ(status_, TW_NO_SUCH_MODEL);
  EXPECT_EQ(number, 0);
  TWcpx_nam("p", 4, name, &status_);
  EXPECT_EQ(status_, TW_NO_SUCH_MODEL);
  EXPECT_STREQ(name, "");
}

// What TWmagmdl_info writes.
struct MagneticModel {
  char name[42] = "#";
  int16_t number = 99;
  char epoch_table[28] = "#";
  double constant_1 = kUntouched;
  int16_t normalisation = 99;
  char text[30] = "#";
  double lower = kUntouched;
  double upper = kUntouched;
  double constant_2 = kUntouched;
  int32_t epochs = 99;

  TWstatus read(int16_t by_name) {
    TWstatus status = 0;
    TWmagmdl_info("p", name, &number, by_name, epoch_table, &constant_1, &normalisation, text,
                  &lower, &upper, &constant_2, &epochs, &status);
    return status;
  }
  // How many of the fields that are tested were written, in their order.
  int written() const {
    return (constant_1 != kUntouched) + (normalisation != 99) + (lower != kUntouched) +
           (upper != kUntouched) + (constant_2 != kUntouched) + (epochs != 99);
  }
};

class MagneticModels : public CatalogueModels {
 protected:
  void SetUp() override {
    CatalogueModels::SetUp();
    store_.add_table("magnetic models",
                     {{"model name", 0, Type::kText}, {"model number", 42, Type::kInt16}});
    store_.add_table("an epoch table of 27 chars.", {{"Epoch date", 0, Type::kDouble}});
    store_.add_row("an epoch table of 27 chars.", PackedRow(48));
  }
  static PackedRow model() {
    PackedRow row(136);
    row.text(0, "Field").i16(42, 5).text(44, "an epoch table of 27 chars.").f64(72, 6371200);
    row.i16(80, 2).text(82, "a text of twenty-nine letters").f64(112, 1900).f64(120, 2030);
    row.f64(128, 5);
    return row;
  }
  void expect(const PackedRow& row, TWstatus word, int written) {
    SetUp();
    store_.add_row("magnetic models", row);
    MagneticModel m;
    m.number = 5;
    EXPECT_EQ(m.read(0), word);
    EXPECT_EQ(m.written(), written);
    EXPECT_STREQ(m.name, "Field");
    EXPECT_STREQ(m.text, "a text of twenty-nine letters");  // the texts come first
    EXPECT_EQ(store_.closes(), 1);
  }
};

TEST_F(MagneticModels, AllOfOneByEitherKey) {
  store_.add_row("magnetic models", model());
  MagneticModel m;
  m.number = 5;
  EXPECT_EQ(m.read(0), TW_SUCCESS);
  EXPECT_STREQ(m.name, "Field");
  EXPECT_STREQ(m.epoch_table, "an epoch table of 27 chars.");
  EXPECT_EQ(m.constant_1, 6371200);
  EXPECT_EQ(m.normalisation, 2);
  EXPECT_STREQ(m.text, "a text of twenty-nine letters");
  EXPECT_EQ(m.lower, 1900);
  EXPECT_EQ(m.upper, 2030);
  EXPECT_EQ(m.constant_2, 5);
  EXPECT_EQ(m.epochs, 1);

  MagneticModel by_name;
  std::strcpy(by_name.name, "Field");
  EXPECT_EQ(by_name.read(-1), TW_SUCCESS);
  EXPECT_EQ(by_name.number, 5);
  EXPECT_EQ(by_name.written(), 6);
  MagneticModel missing;
  missing.number = 6;
  EXPECT_EQ(missing.read(0), TW_NO_SUCH_MODEL);
  EXPECT_STREQ(missing.name, "#");
  EXPECT_STREQ(missing.epoch_table, "#");
}

TEST_F(MagneticModels, NumberZeroIsANameAlone) {
  store_.add_row("magnetic models", PackedRow(136).text(0, "None").text(44, "e"));
  MagneticModel m;
  m.number = 0;
  EXPECT_EQ(m.read(0), TW_SUCCESS);
  EXPECT_STREQ(m.name, "None");
  EXPECT_STREQ(m.epoch_table, "#");
  EXPECT_STREQ(m.text, "#");
  EXPECT_EQ(m.written(), 0);
}

TEST_F(MagneticModels, EachFieldAtItsLimit) {
  expect(model().f64(72, 0), TW_BAD_DATA, 0);
  expect(model().f64(72, kNaN), TW_BAD_DATA, 0);
  expect(model().f64(72, 5e-324), TW_SUCCESS, 6);
  expect(model().i16(80, -1), TW_BAD_HARMONIC_MODEL, 1);
  expect(model().i16(80, 4), TW_BAD_HARMONIC_MODEL, 1);
  expect(model().i16(80, 0), TW_SUCCESS, 6);
  expect(model().i16(80, 3), TW_SUCCESS, 6);
  expect(model().f64(112, -5e-324), TW_BAD_DATA, 2);
  expect(model().f64(112, 2030.5), TW_BAD_DATA, 2);
  expect(model().f64(112, kNaN), TW_BAD_DATA, 2);
  expect(model().f64(112, 2030), TW_SUCCESS, 6);
  expect(model().f64(112, 0).f64(120, 0), TW_BAD_DATA, 3);
  expect(model().f64(112, 0).f64(120, 5e-324), TW_SUCCESS, 6);
  expect(model().f64(128, -5e-324), TW_BAD_DATA, 4);
  expect(model().f64(128, kNaN), TW_BAD_DATA, 4);
  expect(model().f64(128, 0), TW_SUCCESS, 6);
  expect(model().text(44, "no such table"), TW_BAD_DATA, 5);
}

TEST_F(MagneticModels, NamesAndNumbers) {
  store_.add_row("magnetic models", model());
  store_.add_row("magnetic models", PackedRow(136).text(0, "Another").i16(42, 6));
  int32_t count = 0;
  int16_t number = 0;
  char name[42];
  char names[2][41];
  TWmag_mdl_cnt("p", &count, &status_);
  EXPECT_EQ(count, 2);
  TWmagmdl_names("p", names[0], &status_);
  EXPECT_STREQ(names[0], "Another");
  EXPECT_STREQ(names[1], "Field");
  TWmm_nam_t_num("p", "Another", &number, &status_);
  EXPECT_EQ(number, 6);
  TWmm_num_t_nam("p", 5, name, &status_);
  EXPECT_STREQ(name, "Field");
  EXPECT_EQ(status_, TW_SUCCESS);
}

class MagneticEpochs : public CatalogueModels {
 protected:
  void add(double date, int16_t degree, const char* table) {
    store_.add_table("e", {{"Epoch date", 0, Type::kDouble}});
    store_.add_row("e", PackedRow(48).f64(0, date).i16(8, degree).text(10, table));
  }
  TWstatus read() {
    TWepoch_info("p", "e", degrees_, epochs_, names_[0], &status_);
    EXPECT_EQ(store_.closes(), 1);
    return status_;
  }
  int32_t degrees_[3] = {99, 99, 99};
  double epochs_[3] = {kUntouched, kUntouched, kUntouched};
  char names_[3][33] = {"#", "#", "#"};
};

TEST_F(MagneticEpochs, ComeInTheOrderOfTheirDates) {
  add(2005, 13, "a coefficient table of 32 chars.");
  add(2000, 10, "first");
  EXPECT_EQ(read(), TW_SUCCESS);
  EXPECT_EQ(epochs_[0], 2000);
  EXPECT_EQ(degrees_[0], 10);
  EXPECT_STREQ(names_[0], "first");
  EXPECT_EQ(epochs_[1], 2005);
  EXPECT_EQ(degrees_[1], 13);
  EXPECT_STREQ(names_[1], "a coefficient table of 32 chars.");
  EXPECT_EQ(epochs_[2], kUntouched);
  EXPECT_EQ(store_.log()[2], "search e Epoch date");
}

TEST_F(MagneticEpochs, EqualDatesStopTheWalk) {
  add(2000, 10, "a");
  add(2000, 10, "b");
  add(2005, 10, "c");
  EXPECT_EQ(read(), TW_BAD_DATA);
  EXPECT_EQ(epochs_[0], 2000);
  EXPECT_EQ(epochs_[1], kUntouched);
  EXPECT_EQ(degrees_[1], 99);
}

TEST_F(MagneticEpochs, ANotANumberAmongDatesStopsTheWalk) {
  add(kNaN, 10, "a");
  add(2000, 10, "b");
  EXPECT_EQ(read(), TW_BAD_DATA);
  EXPECT_EQ(degrees_[0], 10);
  EXPECT_EQ(degrees_[1], 99);
}

TEST_F(MagneticEpochs, ADegreeOfZeroStopsBehindItsDate) {
  add(-1, 1, "a");  // no limit stands below the first date
  add(2000, 0, "b");
  EXPECT_EQ(read(), TW_BAD_DATA);
  EXPECT_EQ(epochs_[0], -1);
  EXPECT_EQ(degrees_[0], 1);
  EXPECT_EQ(epochs_[1], 2000);
  EXPECT_EQ(degrees_[1], 99);
  EXPECT_STREQ(names_[1], "#");
}

TEST_F(CatalogueModels, CoefficientSets) {
  store_.add_table("full", {});
  store_.add_table("short", {});
  for (int i = 0; i < 4; ++i) {
    store_.add_row("full", PackedRow(24).f64(0, -7).f64(8, 10 + i).f64(16, 20 + i));
  }
  store_.add_row("short", PackedRow(24).f64(8, 1).f64(16, 2));
  const int32_t degrees[] = {1, 1};
  char names[2][33] = {"full", "short"};
  double c[8];
  double s[8];
  std::fill(c, c + 8, kUntouched);
  std::fill(s, s + 8, kUntouched);
  double* c_rows[2][2] = {{c, c + 1}, {c + 4, c + 5}};
  double* s_rows[2][2] = {{s, s + 1}, {s + 4, s + 5}};
  double** c_sets[2] = {c_rows[0], c_rows[1]};
  double** s_sets[2] = {s_rows[0], s_rows[1]};
  TWmm_coef_info("p", 2, degrees, names[0], c_sets, s_sets, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  const double expected_c[8] = {10, 11, 12, kUntouched, 1, 1, 1, kUntouched};
  const double expected_s[8] = {20, 21, 22, kUntouched, 2, 2, 2, kUntouched};
  for (int i = 0; i < 8; ++i) {
    EXPECT_EQ(c[i], expected_c[i]) << i;
    EXPECT_EQ(s[i], expected_s[i]) << i;
  }
  EXPECT_EQ(store_.opens(), 1);
  EXPECT_EQ(store_.closes(), 1);
  EXPECT_EQ(store_.log()[2], "search full -");

  TWmm_coef_info("p", 0, degrees, names[0], nullptr, nullptr, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(store_.closes(), 2);
}

TEST_F(CatalogueModels, ACoefficientTablesNameIsCutAtItsEntry) {
  char names[33];
  std::memset(names, 'n', sizeof names);
  const int32_t degree = 0;
  TWmm_coef_info("p", 1, &degree, names, nullptr, nullptr, &status_);
  EXPECT_EQ(status_, TW_PF_TABLE_ERROR);
  EXPECT_EQ(store_.log()[1], "reset " + std::string(32, 'n'));
}

}  // namespace
