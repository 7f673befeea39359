// Files that are no stores, or no longer: a failure word, nothing written, and walks that end.

#include <gtest/gtest.h>

#include <array>
#include <fstream>
#include <iterator>
#include <random>

#include "source_folder.hpp"
#include "table_store.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::test;

namespace {

std::string read_file(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

// Opens a file and walks, counts and searches whatever it claims to hold.
void read_all(const std::string& path) {
  std::vector<std::string> tables = {"system", "mre models", "conus latitude"};
  try {
    const tabdll::TableStore store(path.c_str());
    for (const auto& entry : store.tables()) tables.push_back(entry.first);
  } catch (const tabdll::StoreError&) {
    EXPECT_NE(OLB7R3_PF_open(path.c_str()), TW_STORE_SUCCESS);
    return;
  }
  const OpenStore open(path);
  for (const std::string& name : tables) {
    const char* table = name.c_str();
    RowBuffer row;
    int32_t count = 0;
    OLB7R3_PF_inq_num_rows(table, &count);
    OLB7R3_PF_get_row_by_value(table, 0, "cs_name", "Mercator", row.bytes);
    if (OLB7R3_PF_reset_table(table) != TW_STORE_SUCCESS) continue;
    int rows = 0;
    while (OLB7R3_PF_get_next_row(table, row.bytes) != TW_STORE_END_OF_TABLE) {
      ASSERT_LT(++rows, 1000000) << "a walk of " << name << " does not end";
    }
    EXPECT_TRUE(row.untouched_from(TW_STORE_ROW_LIMIT));
  }
}

class DamagedStore : public testing::Test {
 protected:
  void expect_no_store(const std::string& path) {
    EXPECT_EQ(OLB7R3_PF_open(path.c_str()), kFailed) << path;
    TWstatus status = 0;
    int32_t count = -1;
    TWget_cs_cnt(path.c_str(), -1, &count, &status);
    EXPECT_EQ(status, TW_PF_OPEN_ERROR);
    EXPECT_EQ(count, -1);
  }
  std::string path(const char* name) const { return (folder_.path() / name).string(); }

  ScratchFolder folder_;
};

TEST_F(DamagedStore, WhatIsNoStoreDoesNotOpen) {
  expect_no_store(path("absent"));
  expect_no_store("");
  expect_no_store(":memory:");
  expect_no_store(folder_.path().string());
  folder_.write("empty", "");
  expect_no_store(path("empty"));
  folder_.write("text", "system,Mercator\n");
  expect_no_store(path("text"));
  std::mt19937 random(1);
  std::string noise(20000, '\0');
  for (char& c : noise) c = static_cast<char>(random());
  folder_.write("noise", noise);
  expect_no_store(path("noise"));
  folder_.write("headed noise", std::string("SQLite format 3\0", 16) + noise);
  expect_no_store(path("headed noise"));
  alter(path("plain"), "CREATE TABLE system (cs_name TEXT)");
  expect_no_store(path("plain"));
  alter(path("view"), "CREATE VIEW tidewater_layout AS SELECT 1");
  expect_no_store(path("view"));
  alter(path("columns"), "CREATE TABLE tidewater_layout (\"table\" TEXT)");
  expect_no_store(path("columns"));
}

TEST_F(DamagedStore, AnUnsoundLayoutIsRefused) {
  const char* const kLayouts[] = {"('t','c','int16',-1,2)",
                                  "('t','c','int16',511,2)",
                                  "('t','c','int32',0,2)",
                                  "('t','c','text',0,0)",
                                  "('t','c','text',0,-5)",
                                  "('t','c','text',0,513)",
                                  "('t','c','text',0,9223372036854775807)",
                                  "('t','c','text',9223372036854775807,2)",
                                  "('t','c','blob',0,2)",
                                  "('t','c',NULL,0,2)",
                                  "('t','c','int16',NULL,2)",
                                  "('t','c','int16','x',2)",
                                  "('t','c','int16',0,2.5)",
                                  "('t','','int16',0,2)",
                                  "('t',NULL,'int16',0,2)",
                                  "('t','','pad',0,2)",
                                  "('t','c','pad',0,2)",
                                  "('t','c','int16',0,2),('t','c','int16',2,2)",
                                  "('t','c','int32',0,4),('t','d','int16',3,2)"};
  for (const char* layout : kLayouts) {
    SourceFolder sources;
    sources.add("t", {"c,int16,0,2"}, "c\n1\n");
    const std::string store = sources.build();
    // The built table of layouts takes no NULL; one without constraints does.
    alter(store,
          "DROP TABLE tidewater_layout;"
          "CREATE TABLE tidewater_layout (\"table\", \"column\", type, \"offset\", size);"
          "INSERT INTO tidewater_layout VALUES " +
              std::string(layout));
    SCOPED_TRACE(layout);
    expect_no_store(store);
  }
}

TEST_F(DamagedStore, ACellThatDoesNotPackIsRefusedWithItsStore) {
  struct {
    const char* column;
    const char* cell;
  } const kCells[] = {{"n", "NULL"},
                      {"n", "5"},
                      {"n", "X'41'"},
                      {"n", "'12345'"},
                      {"n", "CAST(X'4100' AS TEXT)"},
                      {"i", "NULL"},
                      {"i", "'x'"},
                      {"i", "1.5"},
                      {"i", "32768"},
                      {"i", "-32769"},
                      {"l", "2147483648"},
                      {"r", "NULL"},
                      {"r", "'x'"},
                      {"r", "X'00'"},
                      {"r", "9e999"}};
  for (const auto& [column, cell] : kCells) {
    SourceFolder sources;
    sources.add("t", {"n,text,0,5", "i,int16,6,2", "l,int32,8,4", "r,float64,16,8"},
                "n,i,l,r\n1234,1,1,1\nb,2,2,2\nc,3,3,3\n");
    const std::string store = sources.build();
    // A table without types and constraints takes any cell.
    alter(store,
          "CREATE TABLE u (n, i, l, r); INSERT INTO u SELECT * FROM t; DROP TABLE t;"
          "ALTER TABLE u RENAME TO t");
    SCOPED_TRACE(testing::Message() << column << " " << cell);
    const OpenStore open(store);
    EXPECT_EQ(open.word, TW_STORE_SUCCESS);
    OLB7R3_PF_reset_table("t");
    RowBuffer row;
    EXPECT_EQ(OLB7R3_PF_get_next_row("t", row.bytes), TW_STORE_SUCCESS);
    EXPECT_EQ(row.text(0), "1234");  // fills its field
    alter(store, "UPDATE t SET " + std::string(column) + " = " + cell + " WHERE i = 2");
    expect_no_store(store);
    try {
      const tabdll::TableStore refused(store.c_str());
      ADD_FAILURE();
    } catch (const tabdll::StoreError& e) {
      EXPECT_EQ(std::string(e.what()).find("table \"t\": row 2: a "), 0u) << e.what();
    }
  }
}

TEST_F(DamagedStore, ColumnsAreThoseOfTheLayout) {
  for (const char* change :
       {"ALTER TABLE t RENAME COLUMN b TO z", "ALTER TABLE t ADD COLUMN z INTEGER",
        "ALTER TABLE t DROP COLUMN b", "DROP TABLE t", "CREATE TABLE more (a INTEGER)",
        "DELETE FROM tidewater_layout WHERE \"column\" = 'b'", "DELETE FROM tidewater_layout"}) {
    SourceFolder sources;
    sources.add("t", {"a,int16,0,2", "b,int16,2,2"}, "a,b\n1,2\n");
    const std::string store = sources.build();
    alter(store, change);
    SCOPED_TRACE(change);
    expect_no_store(store);
  }
}

TEST_F(DamagedStore, TruncatedAtEveryPage) {
  const std::string whole = read_file(TIDEWATER_STORE);
  ASSERT_GT(whole.size(), 100000u);
  for (std::size_t size = 0; size < whole.size(); size += 2999) {
    folder_.write("cut", whole.substr(0, size));
    read_all(path("cut"));
  }
}

TEST_F(DamagedStore, RandomBytesInARealStore) {
  const std::string whole = read_file(TIDEWATER_STORE);
  std::mt19937 random(20);
  for (int i = 0; i < 80; ++i) {
    std::string damaged = whole;
    // Half of the damage goes to the first pages, where the schema and the layouts lie.
    const std::size_t reach = i % 2 == 0 ? 12288 : damaged.size();
    for (int n = 0; n < 1 + i % 40; ++n) {
      damaged[random() % reach] = static_cast<char>(random());
    }
    folder_.write("damaged", damaged);
    read_all(path("damaged"));
  }
}

}  // namespace
