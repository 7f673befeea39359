// Vertical datums, undulation models, state plane zones and satellites.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <ostream>
#include <string>

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
  EXPECT_EQ(store_.log()[store_.log().size() - 6], "search vert_datum vert_datum_name");
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

TEST(CatalogueRecords, HaveTheLayoutOfTheirRows) {
  EXPECT_EQ(sizeof(ZoneRecord), 44u);
  EXPECT_EQ(offsetof(ZoneRecord, zone_name), 2u);
  EXPECT_EQ(sizeof(SatelliteRecord), 120u);
  EXPECT_EQ(offsetof(SatelliteRecord, real1), 32u);
  EXPECT_EQ(offsetof(SatelliteRecord, angle1), 48u);
  EXPECT_EQ(offsetof(SatelliteRecord, real3), 64u);
  EXPECT_EQ(offsetof(SatelliteRecord, angle3), 88u);
  EXPECT_EQ(offsetof(SatelliteRecord, count1), 96u);
  EXPECT_EQ(offsetof(SatelliteRecord, short1), 100u);
  EXPECT_EQ(offsetof(SatelliteRecord, id), 106u);
  EXPECT_EQ(sizeof(MreTerm), 16u);
  EXPECT_EQ(offsetof(MreTerm, power_u), 8u);
  EXPECT_EQ(offsetof(MreTerm, power_v), 10u);
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

// A list that is sized by its table's row count.
struct CountedList {
  const char* table;
  const char* column;
  std::size_t offset;      // of the name in the row
  FakeStore::Type type;    // of the column
  std::size_t entry;       // bytes from one entry to the next
  std::size_t first_byte;  // of an entry that is written
  TWstatus too_long;
  void (*read)(char* out, TWstatus* status);
};

const CountedList kCountedLists[] = {
    {"vert_datum", "vert_datum_name", 4, Type::kText, 41, 0, TW_PF_TABLE_ERROR,
     [](char* out, TWstatus* status) { TWget_vd_names("p", out, status); }},
    {"undul", "undul_name", 16, Type::kText, 41, 0, TW_PF_TABLE_ERROR,
     [](char* out, TWstatus* status) { TWget_undl_nam("p", out, status); }},
    {"spcs27_tbl", "zone_name", 2, Type::kText, sizeof(ZoneRecord), 2, TW_PF_TABLE_ERROR,
     [](char* out, TWstatus* status) {
       TWspcs_get_all("p", 0, reinterpret_cast<ZoneRecord*>(out), status);
     }},
    {"Satellites", "sat_name", 0, Type::kText, sizeof(SatelliteRecord), 0, TW_PF_TABLE_ERROR,
     [](char* out, TWstatus* status) {
       TWsomps_get_all("p", reinterpret_cast<SatelliteRecord*>(out), status);
     }},
    {"mre models", "model name", 0, Type::kText, 41, 0, TW_PF_TABLE_ERROR,
     [](char* out, TWstatus* status) { TWmre_names("p", out, status); }},
    {"Complex Models", "Model Name", 0, Type::kText, 41, 0, TW_PF_TABLE_ERROR,
     [](char* out, TWstatus* status) { TWcpx_names("p", out, status); }},
    {"magnetic models", "model name", 0, Type::kText, 41, 0, TW_PF_TABLE_ERROR,
     [](char* out, TWstatus* status) { TWmagmdl_names("p", out, status); }},
    {"epochs", "Epoch date", 0, Type::kDouble, 33, 0, TW_BAD_DATA, [](char* out, TWstatus* status) {
       int32_t degrees[8];
       double dates[8];
       TWepoch_info("p", "epochs", degrees, dates, out, status);
     }}};

std::ostream& operator<<(std::ostream& out, const CountedList& list) { return out << list.table; }

class CountedLists : public testing::TestWithParam<CountedList> {
 protected:
  // Three rows, of which the store tells another number.
  void SetUp() override {
    const CountedList& list = GetParam();
    store_.clear();
    store_.add_table(list.table, {{list.column, list.offset, list.type}});
    for (int i = 1; i <= 3; ++i) {
      PackedRow row(144);
      if (list.type == Type::kText) {
        row.text(list.offset, "N" + std::to_string(i));
      } else {
        row.f64(list.offset, i).i16(8, 1).text(10, "N");
      }
      store_.add_row(list.table, row);
    }
    std::memset(out_, '#', sizeof out_);
  }
  TWstatus read() {
    TWstatus status = 0;
    GetParam().read(reinterpret_cast<char*>(out_), &status);
    return status;
  }
  // How many entries were written, one behind the other.
  std::size_t written() const {
    const char* bytes = reinterpret_cast<const char*>(out_);
    std::size_t n = 0;
    while (bytes[n * GetParam().entry + GetParam().first_byte] != '#') ++n;
    for (std::size_t i = n * GetParam().entry; i < sizeof out_; ++i) EXPECT_EQ(bytes[i], '#') << i;
    return n;
  }

  FakeStore& store_ = FakeStore::current();
  double out_[128];
};

TEST_P(CountedLists, HaveNeverMoreEntriesThanTheStoreCounts) {
  EXPECT_EQ(read(), TW_SUCCESS);
  for (const int32_t count : {0, 1, 2, 4, 2147483647}) {
    SetUp();
    store_.lie_about_rows(GetParam().table, count);
    // A walk that ends before the count is no failure.
    EXPECT_EQ(read(), count < 3 ? GetParam().too_long : TW_SUCCESS) << count;
    EXPECT_EQ(written(), static_cast<std::size_t>(std::min(count, 3)));
    EXPECT_EQ(store_.closes(), 1);
  }
  for (const int32_t count : {-1, -2147483647}) {
    SetUp();
    store_.lie_about_rows(GetParam().table, count);
    EXPECT_EQ(read(), TW_PF_TABLE_ERROR) << count;
    EXPECT_EQ(written(), 0u);
  }
}

TEST_P(CountedLists, EndWhereTheStoreAnswersWithErrorsForEver) {
  store_.fail_always(StoreCall::kNext);
  EXPECT_NE(read(), TW_SUCCESS);
  EXPECT_LE(store_.calls(StoreCall::kNext), 4);
}

INSTANTIATE_TEST_SUITE_P(All, CountedLists, testing::ValuesIn(kCountedLists),
                         [](const auto& tested) {
                           std::string name = tested.param.table;
                           std::erase_if(name, [](char c) { return c == ' ' || c == '_'; });
                           return name;
                         });

TEST_F(CatalogueLists, ACountBelowZeroIsAFailure) {
  store_.add_table("undul", {});
  store_.lie_about_rows("undul", -1);
  int32_t count = 99;
  TWget_undl_cnt("p", &count, &status_);
  EXPECT_EQ(status_, TW_PF_TABLE_ERROR);
  EXPECT_EQ(count, 99);
}

}  // namespace
