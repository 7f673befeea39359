// Coordinate systems and datum models: two tables of one form.

#include <gtest/gtest.h>

#include <cstring>

#include "support/fake_store.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::test;

namespace {

using Type = FakeStore::Type;

struct Family {
  const char* table;
  const char* prefix;
  TWstatus missing;
  decltype(&TWget_cs_cnt) count;
  decltype(&TWget_cs_names) names;
  decltype(&TWnum_to_cs) number_to_name;
  decltype(&TWnum_to_class) number_to_class;
  decltype(&TWcs_to_num) name_to_number;
  decltype(&TWcs_to_class) name_to_class;
  decltype(&TWclass_to_cs) class_to_name;
  decltype(&TWclass_to_num) class_to_number;
  decltype(&TWclass_to_fid) class_to_form;
};

const Family kFamilies[] = {
    {"system", "cs", TW_NO_SUCH_SYSTEM, TWget_cs_cnt, TWget_cs_names, TWnum_to_cs, TWnum_to_class,
     TWcs_to_num, TWcs_to_class, TWclass_to_cs, TWclass_to_num, TWclass_to_fid},
    {"dt_models", "dt", TW_NO_SUCH_MODEL, TWget_dt_cnt, TWget_dt_names, TWnum_to_dt, TWdt_num_t_cls,
     TWdt_to_num, TWdt_to_class, TWclass_to_dt, TWdt_cls_t_num, TWdt_cls_t_fid}};

class ClassTable : public testing::TestWithParam<Family> {
 protected:
  void SetUp() override {
    store_.clear();
    const std::string prefix = f_.prefix;
    store_.add_table(f_.table, {{prefix + "_class", 0, Type::kText},
                                {prefix + "_name", 16, Type::kText},
                                {prefix + "_num", 58, Type::kInt16}});
  }
  void add(const char* cls, const char* name, int16_t number, int16_t form, int32_t mask) {
    store_.add_row(
        f_.table,
        PackedRow(68).text(0, cls).text(16, name).i16(58, number).i16(60, form).i32(64, mask));
  }
  int32_t count(int16_t mask) {
    int32_t n = -99;
    f_.count("p", mask, &n, &status_);
    EXPECT_EQ(status_, TW_SUCCESS);
    return n;
  }

  const Family& f_ = GetParam();
  FakeStore& store_ = FakeStore::current();
  TWstatus status_ = 0;
};

TEST_P(ClassTable, MaskIsWidenedWithItsSign) {
  add("a", "A", 1, 0, 0x1);
  add("b", "B", 2, 0, 0x6);
  add("c", "C", 3, 0, 0x10000);  // only a negative mask reaches the upper half
  add("d", "D", 4, 0, INT32_MIN);
  add("e", "E", 5, 0, 0);  // no mask takes a row without bits
  EXPECT_EQ(count(0), 0);
  EXPECT_EQ(count(1), 1);
  EXPECT_EQ(count(7), 2);
  EXPECT_EQ(count(0x7FFF), 2);
  EXPECT_EQ(count(INT16_MIN), 2);
  EXPECT_EQ(count(-1), 4);
}

TEST_P(ClassTable, ListMakesTheSelectionOfTheCountInNameOrder) {
  add("z", "Zulu", 1, 0, 1);
  add("m", "mike", 2, 0, 2);
  add("a", "Alpha", 3, 0, 3);
  char names[4][41];
  std::memset(names, '#', sizeof names);
  f_.names("p", 1, names[0], &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(count(1), 2);
  EXPECT_STREQ(names[0], "Alpha");
  EXPECT_STREQ(names[1], "Zulu");
  EXPECT_EQ(names[0][6], '#');  // nothing behind the terminator
  EXPECT_EQ(names[2][0], '#');
  const std::string search = std::string("search ") + f_.table + " " + f_.prefix + "_name";
  EXPECT_EQ(store_.log()[2], search);
}

TEST_P(ClassTable, EmptyTableCountsZeroAndListsNothing) {
  char name = '#';
  EXPECT_EQ(count(-1), 0);
  f_.names("p", -1, &name, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(name, '#');
}

TEST_P(ClassTable, AllKeysLeadToTheRow) {
  add("first", "First system", 11, 3, 1);
  add("fifteen chars..", "A name of forty characters, all of them.", -12, -4, 1);
  char text[41];
  int16_t number = 0;
  f_.number_to_name("p", -12, text, &status_);
  EXPECT_STREQ(text, "A name of forty characters, all of them.");
  f_.number_to_class("p", -12, text, &status_);
  EXPECT_STREQ(text, "fifteen chars..");
  f_.name_to_number("p", "A name of forty characters, all of them.", &number, &status_);
  EXPECT_EQ(number, -12);
  f_.name_to_class("p", "First system", text, &status_);
  EXPECT_STREQ(text, "first");
  f_.class_to_name("p", "first", text, &status_);
  EXPECT_STREQ(text, "First system");
  f_.class_to_number("p", "first", &number, &status_);
  EXPECT_EQ(number, 11);
  f_.class_to_form("p", "fifteen chars..", &number, &status_);
  EXPECT_EQ(number, -4);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_EQ(store_.opens(), 7);
  EXPECT_EQ(store_.closes(), 7);
}

TEST_P(ClassTable, UnknownKeysLeaveTheOutput) {
  add("a", "A", 1, 0, 1);
  char text[41] = "#";
  int16_t number = 99;
  f_.number_to_name("p", 2, text, &status_);
  EXPECT_EQ(status_, f_.missing);
  f_.class_to_number("p", "A", &number, &status_);
  EXPECT_EQ(status_, f_.missing);
  EXPECT_STREQ(text, "#");
  EXPECT_EQ(number, 99);
  EXPECT_EQ(store_.closes(), 2);
}

TEST_P(ClassTable, TextWithoutTerminatorIsCutAtItsField) {
  PackedRow row(68);
  row.text(0, std::string(16, 'c')).text(16, std::string(42, 'n')).i16(58, 1).i32(64, 1);
  store_.add_row(f_.table, row);
  char text[43];
  std::memset(text, '#', sizeof text);
  f_.number_to_name("p", 1, text, &status_);
  EXPECT_EQ(std::string(text), std::string(40, 'n'));
  EXPECT_EQ(text[41], '#');
  f_.number_to_class("p", 1, text, &status_);
  EXPECT_EQ(std::string(text), std::string(15, 'c'));
  std::memset(text, '#', sizeof text);
  f_.names("p", 1, text, &status_);
  EXPECT_EQ(std::string(text), std::string(40, 'n'));
  EXPECT_EQ(text[41], '#');
}

TEST_P(ClassTable, ARowThatCannotBeReadStillCounts) {
  // By contract: a walk ends at the end-of-table word alone.
  add("a", "A", 1, 0, 1);
  add("b", "B", 2, 0, 1);
  store_.fail(StoreCall::kNext, FakeStore::kSomeFailure, 2);
  EXPECT_EQ(count(1), 3);  // A, the bad row with what A left, B
  store_.fail(StoreCall::kNext, FakeStore::kSomeFailure, 1);
  EXPECT_EQ(count(1), 2);  // nothing stands in the row yet: no mask takes it
}

INSTANTIATE_TEST_SUITE_P(Both, ClassTable, testing::ValuesIn(kFamilies),
                         [](const auto& tested) { return std::string(tested.param.table); });

}  // namespace
