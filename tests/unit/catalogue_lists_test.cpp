// Vertical datums, undulation models, state plane zones and satellites.

#include <gtest/gtest.h>

#include <cstring>

#include "support/fake_store.hpp"
#include "support/points.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::test;

namespace {

using Type = FakeStore::Type;

class CatalogueLists : public testing::Test {
 protected:
  void SetUp() override { store_.clear(); }

  FakeStore& store_ = FakeStore::current();
  TWstatus status_ = 0;
  char text_[64] = "#";
};

TEST_F(CatalogueLists, VerticalDatumsHaveNumbersOf32Bits) {
  store_.add_table("vert_datum",
                   {{"vert_datum_num", 0, Type::kInt32}, {"vert_datum_name", 4, Type::kText}});
  store_.add_row("vert_datum", PackedRow(48).i32(0, 70000).text(4, "Second"));
  store_.add_row("vert_datum", PackedRow(48).i32(0, 4464).text(4, "First"));  // 70000 in 16 bits
  int32_t number = 0;
  TWget_vd_cnt("p", &number, &status_);
  EXPECT_EQ(number, 2);
  TWnum_to_vd("p", 70000, text_, &status_);
  EXPECT_STREQ(text_, "Second");
  TWvd_to_num("p", "Second", &number, &status_);
  EXPECT_EQ(number, 70000);
  char names[2][41];
  TWget_vd_names("p", names[0], &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_STREQ(names[0], "First");
  EXPECT_STREQ(names[1], "Second");
  EXPECT_EQ(store_.log()[store_.log().size() - 5], "search vert_datum vert_datum_name");
}

TEST_F(CatalogueLists, AVerticalDatumsNameIsCutAtTheListsEntry) {
  store_.add_table("vert_datum", {{"vert_datum_name", 4, Type::kText}});
  store_.add_row("vert_datum", PackedRow(48).text(4, std::string(43, 'n')));
  std::memset(text_, '#', sizeof text_);
  TWget_vd_names("p", text_, &status_);
  EXPECT_EQ(std::string(text_), std::string(40, 'n'));
  EXPECT_EQ(text_[41], '#');
  TWnum_to_vd("p", 0, text_, &status_);
  EXPECT_EQ(status_, TW_NO_SUCH_VERT_DATUM);  // no such key column
}

TEST_F(CatalogueLists, UndulationModels) {
  store_.add_table("undul", {{"undul_class", 0, Type::kText},
                             {"undul_name", 16, Type::kText},
                             {"number", 74, Type::kInt16}});
  store_.add_row(
      "undul",
      PackedRow(76).text(0, "geo").text(16, "Model B").text(57, "sixteen letters.").i16(74, 5));
  store_.add_row("undul", PackedRow(76).text(0, "alt").text(16, "Model A").i16(74, 6));
  int32_t count = 0;
  int16_t number = 0;
  char parameter[17] = "#";
  TWget_undl_cnt("p", &count, &status_);
  EXPECT_EQ(count, 2);
  TWnum_to_undl("p", 5, text_, &status_);
  EXPECT_STREQ(text_, "Model B");
  TWundl_to_num("p", "Model A", &number, &status_);
  EXPECT_EQ(number, 6);
  TWundl_to_clas("p", "Model A", text_, &status_);
  EXPECT_STREQ(text_, "alt");
  TWundl_to_parm("p", "geo", text_, parameter, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  EXPECT_STREQ(text_, "Model B");
  EXPECT_STREQ(parameter, "sixteen letters.");
  char names[2][41];
  TWget_undl_nam("p", names[0], &status_);
  EXPECT_STREQ(names[0], "Model A");
  EXPECT_STREQ(names[1], "Model B");
}

TEST_F(CatalogueLists, ZonesOfTheTwoSystems) {
  for (const char* table : {"spcs27_tbl", "spcs83_tbl"}) {
    store_.add_table(table, {{"zone_number", 0, Type::kInt16}, {"zone_name", 2, Type::kText}});
  }
  store_.add_row("spcs27_tbl", PackedRow(44).i16(0, 407).text(2, "California VII"));
  store_.add_row("spcs27_tbl", PackedRow(44).i16(0, 101).text(2, "Alabama East"));
  store_.add_row("spcs83_tbl", PackedRow(44).i16(0, 101).text(2, "Alabama East (83)"));
  int32_t count = 0;
  TWspcs_cnt("p", 0, &count, &status_);
  EXPECT_EQ(count, 2);
  for (const int16_t kind : std::initializer_list<int16_t>{1, 27, -1}) {  // whatever is not 0
    TWspcs_cnt("p", kind, &count, &status_);
    EXPECT_EQ(count, 1);
  }
  ZoneRecord records[3];
  std::memset(records, '#', sizeof records);
  TWspcs_get_all("p", 0, records, &status_);
  EXPECT_EQ(records[0].zone_number, 101);
  EXPECT_STREQ(records[0].zone_name, "Alabama East");
  EXPECT_EQ(records[1].zone_number, 407);
  EXPECT_STREQ(records[1].zone_name, "California VII");
  EXPECT_EQ(records[2].zone_name[0], '#');
  int16_t number = 0;
  TWsp_nam_t_num("p", 0, "California VII", &number, &status_);
  EXPECT_EQ(number, 407);
  TWsp_num_t_nam("p", 27, 101, text_, &status_);
  EXPECT_STREQ(text_, "Alabama East (83)");
  EXPECT_EQ(status_, TW_SUCCESS);
  TWsp_nam_t_num("p", 83, "California VII", &number, &status_);
  EXPECT_EQ(status_, TW_BAD_ZONE);
  EXPECT_EQ(number, 407);
}

TEST_F(CatalogueLists, SatellitesComeWithTheirAnglesInRadians) {
  store_.add_table("Satellites", {{"sat_name", 0, Type::kText}, {"id", 106, Type::kInt16}});
  PackedRow row(120);
  row.text(0, "Walker").f64(32, 0.25).f64(40, -2).f64(48, 180).f64(56, -90).f64(64, 3);
  row.f64(72, 4).f64(80, 5).f64(88, 45).i32(96, 70000).i16(100, 1).i16(102, -2).i16(104, 3);
  row.i16(106, 9);
  store_.add_row("Satellites", row);
  store_.add_row("Satellites", PackedRow(120).text(0, "Able").i16(106, 8));
  SatelliteRecord all[3];
  std::memset(all, '#', sizeof all);
  SatelliteRecord one;
  std::memset(&one, '#', sizeof one);
  TWsomps_get_all("p", all, &status_);
  EXPECT_STREQ(all[0].sat_name, "Able");
  EXPECT_EQ(all[2].sat_name[0], '#');
  TWsomps_get_sat("p", 9, &one, &status_);
  EXPECT_EQ(status_, TW_SUCCESS);
  for (const SatelliteRecord& r : {all[1], one}) {
    EXPECT_STREQ(r.sat_name, "Walker");
    EXPECT_EQ(r.real1, 0.25);
    EXPECT_EQ(r.real2, -2);
    EXPECT_DOUBLE_EQ(r.angle1, kPi);
    EXPECT_DOUBLE_EQ(r.angle2, -kPi / 2);
    EXPECT_EQ(r.real3, 3);
    EXPECT_EQ(r.real4, 4);
    EXPECT_EQ(r.real5, 5);
    EXPECT_DOUBLE_EQ(r.angle3, kPi / 4);
    EXPECT_EQ(r.count1, 70000);
    EXPECT_EQ(r.short1, 1);
    EXPECT_EQ(r.short2, -2);
    EXPECT_EQ(r.short3, 3);
    EXPECT_EQ(r.id, 9);
  }
  int32_t count = 0;
  int16_t id = 0;
  TWsomps_cnt("p", &count, &status_);
  EXPECT_EQ(count, 2);
  TWsomps_id2name("p", 8, text_, &status_);
  EXPECT_STREQ(text_, "Able");
  TWsomps_name2id("p", "Walker", &id, &status_);
  EXPECT_EQ(id, 9);
}

}  // namespace
