// Store files made to mislead: each is refused when it is opened, in bounded time, before anything
// of it reaches a caller.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <fstream>
#include <iterator>

#include "database.hpp"
#include "source_folder.hpp"
#include "table_store.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::test;

namespace {

class CraftedStore : public testing::Test {
 protected:
  // A store with the vertical datums "a", "b", "c".
  std::string datums() {
    sources_.add("vert_datum", {"vert_datum_num,int32,0,4", "vert_datum_name,text,4,44"},
                 "vert_datum_num,vert_datum_name\n1,a\n2,b\n3,c\n");
    return sources_.build();
  }
  // No function of the library gets anything from the file; the reader says these words.
  static void expect_refused(const std::string& store, const std::string& words) {
    TWstatus status = 0;
    int32_t count = -1;
    TWget_vd_cnt(store.c_str(), &count, &status);
    EXPECT_EQ(status, TW_PF_OPEN_ERROR);
    EXPECT_EQ(count, -1);
    std::array<char, 41 * 4> names;
    names.fill('#');
    TWget_vd_names(store.c_str(), names.data(), &status);
    EXPECT_EQ(status, TW_PF_OPEN_ERROR);
    EXPECT_EQ(std::string(names.data(), names.size()), std::string(names.size(), '#'));
    try {
      const tabdll::TableStore opened(store.c_str());
      ADD_FAILURE() << "opened";
    } catch (const tabdll::StoreError& e) {
      EXPECT_NE(std::string(e.what()).find(words), std::string::npos) << e.what();
    }
  }

  SourceFolder sources_;
};

TEST_F(CraftedStore, WhatIsReadAsMadeIsOpened) {
  TWstatus status = 0;
  int32_t count = -1;
  TWget_vd_cnt(datums().c_str(), &count, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_EQ(count, 3);
}

TEST_F(CraftedStore, AnIndexWithFewerRowsThanItsTable) {
  // SQLite counts by the index, which holds no row, and walks by the table.
  const std::string store = datums();
  alter(store,
        "CREATE INDEX i ON vert_datum (vert_datum_num) WHERE vert_datum_num > 9;"
        "PRAGMA writable_schema = ON;"
        "UPDATE sqlite_master SET sql = 'CREATE INDEX i ON vert_datum (vert_datum_num)' "
        "WHERE name = 'i'");
  expect_refused(store, "\"i\" is no plain table");
}

TEST_F(CraftedStore, AnIndexWithMoreRowsThanItsTable) {
  const std::string store = datums();
  alter(store,
        "CREATE TABLE many (n INTEGER);"
        "WITH RECURSIVE n (i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n WHERE i < 100)"
        " INSERT INTO many SELECT i FROM n;"
        "CREATE INDEX j ON many (n); CREATE INDEX i ON vert_datum (vert_datum_num);"
        "PRAGMA writable_schema = ON;"
        "UPDATE sqlite_master SET rootpage = (SELECT rootpage FROM sqlite_master WHERE name = 'j') "
        "WHERE name = 'i'");
  expect_refused(store, "is no plain table");
}

TEST_F(CraftedStore, AnythingButPlainTables) {
  for (const char* more :
       {"CREATE VIEW v AS SELECT 1", "CREATE TRIGGER g INSERT ON vert_datum BEGIN SELECT 1; END",
        "CREATE UNIQUE INDEX u ON vert_datum (vert_datum_num)",
        "CREATE TABLE w (a PRIMARY KEY) WITHOUT ROWID", "CREATE TABLE p (a UNIQUE)",
        "CREATE TABLE c (a CHECK (a > 0))", "CREATE TABLE d (a DEFAULT (1 + 1))",
        "CREATE TABLE g (a, b AS (zeroblob(1000000000)))",
        "CREATE TABLE g (a, b GENERATED ALWAYS AS (hex(a)) STORED)",
        "CREATE TABLE g (a /* \" */, b AS (1) /* \" */)",
        "CREATE TABLE g (a, -- \"\n b AS (1) -- \"\n)", "CREATE TABLE s (a TEXT) STRICT",
        "CREATE VIRTUAL TABLE f USING fts3 (a)"}) {
    SourceFolder sources;
    sources.add("vert_datum", {"vert_datum_num,int32,0,4", "vert_datum_name,text,4,44"},
                "vert_datum_num,vert_datum_name\n1,a\n2,b\n3,c\n");
    const std::string store = sources.build();
    alter(store, more);
    SCOPED_TRACE(more);
    expect_refused(store, "is no plain table");
  }
}

TEST_F(CraftedStore, ATableWithoutALayout) {
  const std::string store = datums();
  alter(store, "ANALYZE");
  expect_refused(store, "table \"sqlite_stat1\": no layout");
}

TEST_F(CraftedStore, ATableInDisguise) {
  // What the schema calls a table is a view, an index or a trigger in its definition.
  for (const char* sql :
       {"CREATE VIEW vert_datum (vert_datum_num, vert_datum_name) AS WITH RECURSIVE n (i) AS "
        "(SELECT 1 UNION ALL SELECT i FROM n) SELECT i, '' FROM n",
        "CREATE INDEX vert_datum ON tidewater_layout (\"table\")", "CREATE TABLE", "", "SELECT 1",
        "CREATE TABLE vert_datum (vert_datum_num, vert_datum_name) AS SELECT 1",
        "CREATE TABLE vert_datum (\"vert_datum_num, vert_datum_name)"}) {
    SourceFolder sources;
    sources.add("vert_datum", {"vert_datum_num,int32,0,4", "vert_datum_name,text,4,44"},
                "vert_datum_num,vert_datum_name\n1,a\n");
    const std::string store = sources.build();
    std::string quoted;
    for (const char* c = sql; *c; ++c) quoted += *c == '\'' ? "''" : std::string(1, *c);
    alter(store, "PRAGMA writable_schema = ON; UPDATE sqlite_master SET sql = '" + quoted +
                     "' WHERE name = 'vert_datum'");
    SCOPED_TRACE(sql);
    expect_refused(store, "");
  }
}

TEST_F(CraftedStore, AGeneratedColumnInATablesPlace) {
  const std::string store = datums();
  alter(store,
        "DROP TABLE vert_datum; CREATE TABLE vert_datum (vert_datum_num INTEGER, vert_datum_name "
        "TEXT AS (CAST(zeroblob(100000000) AS TEXT))); INSERT INTO vert_datum VALUES (1)");
  expect_refused(store, "\"vert_datum\" is no plain table");
}

// The page at which a table of a database begins.
std::uint32_t root_of(const std::string& path, const std::string& table) {
  sqlite3* opened = nullptr;
  EXPECT_EQ(sqlite3_open(path.c_str(), &opened), SQLITE_OK);
  const tabdll::Database closed(opened);
  tabdll::Statement s(opened, "SELECT rootpage FROM sqlite_master WHERE name = '" + table + "'");
  EXPECT_TRUE(s.step());
  return static_cast<std::uint32_t>(s.integer(0));
}

// A database's bytes, page by page; pages are numbered from 1.
class Pages {
 public:
  explicit Pages(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    bytes_ = {std::istreambuf_iterator<char>(in), {}};
    size_ = get(16, 2);
  }
  void write(const std::string& path) {
    put(28, 4, count());
    std::ofstream(path, std::ios::binary) << bytes_;
  }
  std::uint32_t count() const { return static_cast<std::uint32_t>(bytes_.size() / size_); }

  // A new page with what stands on another one.
  std::uint32_t add_copy(std::uint32_t page) {
    const std::size_t at = std::size_t{page - 1} * size_;
    std::string copy = bytes_.substr(at, size_);
    if (page == 1) copy.replace(0, 200, copy.substr(100, 200));  // the head and the cells' places
    bytes_ += copy;
    return count();
  }
  // A new inner page of a table.
  std::uint32_t add_inner(std::uint32_t cells, std::uint32_t child) {
    bytes_.append(size_, '\0');
    make_inner(count(), cells, child);
    return count();
  }
  // Makes a page an inner one, with some cells and a right child that are all the same page.
  void make_inner(std::uint32_t page, std::uint32_t cells, std::uint32_t child) {
    const std::size_t start = std::size_t{page - 1} * size_;
    const std::size_t head = start + (page == 1 ? 100 : 0);
    std::fill(bytes_.begin() + static_cast<std::ptrdiff_t>(head),
              bytes_.begin() + static_cast<std::ptrdiff_t>(start + size_), '\0');
    const std::uint32_t content = size_ - 5 * cells;
    put(head, 1, 5);
    put(head + 3, 2, cells);
    put(head + 5, 2, content);
    put(head + 8, 4, child);
    for (std::uint32_t i = 0; i < cells; ++i) {
      put(head + 12 + 2 * i, 2, content + 5 * i);
      put(start + content + 5 * i, 4, child);
      put(start + content + 5 * i + 4, 1, 1);
    }
  }

 private:
  std::uint32_t get(std::size_t at, std::size_t length) const {
    std::uint32_t value = 0;
    for (std::size_t i = 0; i < length; ++i) {
      value = value << 8 | static_cast<unsigned char>(bytes_[at + i]);
    }
    return value;
  }
  void put(std::size_t at, std::size_t length, std::uint32_t value) {
    for (std::size_t i = length; i-- > 0; value >>= 8) bytes_[at + i] = static_cast<char>(value);
  }

  std::string bytes_;
  std::uint32_t size_ = 0;
};

TEST_F(CraftedStore, SharedPagesWhoseRowsHaveNoEnd) {
  // Seven inner pages of 541 children each, all the same: 1e19 times the rows of the last one.
  for (const char* table : {"vert_datum", "tidewater_layout", "sqlite_master"}) {
    SourceFolder sources;
    sources.add("vert_datum", {"vert_datum_num,int32,0,4", "vert_datum_name,text,4,44"},
                "vert_datum_num,vert_datum_name\n1,a\n");
    const std::string store = sources.build();
    const std::uint32_t root = table == std::string("sqlite_master") ? 1 : root_of(store, table);
    Pages pages(store);
    std::uint32_t child = pages.add_copy(root);
    for (int i = 0; i < 6; ++i) child = pages.add_inner(540, child);
    pages.make_inner(root, 540, child);
    pages.write(store);
    SCOPED_TRACE(table);
    expect_refused(store, table == std::string("vert_datum") ? "does not end" : "");
  }
}

TEST_F(CraftedStore, ADeepChainOfPagesIsNotFollowed) {
  const std::string store = datums();
  alter(store, "PRAGMA page_size = 512; VACUUM");
  const std::uint32_t root = root_of(store, "vert_datum");
  Pages pages(store);
  std::uint32_t child = pages.add_copy(root);
  for (int i = 0; i < 60000; ++i) child = pages.add_inner(1, child);
  pages.make_inner(root, 1, child);
  pages.write(store);
  expect_refused(store, "malformed");
}

TEST_F(CraftedStore, ASchemaOfLongDefinitionsThatHasNoEnd) {
  const std::string store = datums();
  alter(store, "CREATE TABLE more (\"" + std::string(50000, 'n') + "\" INTEGER)");
  Pages pages(store);
  std::uint32_t child = pages.add_copy(1);
  for (int i = 0; i < 6; ++i) child = pages.add_inner(540, child);
  pages.make_inner(1, 540, child);
  pages.write(store);
  expect_refused(store, "does not end");
}

TEST_F(CraftedStore, APageOfTwoTables) {
  sources_.add("other", {"vert_datum_num,int32,0,4", "vert_datum_name,text,4,44"},
               "vert_datum_num,vert_datum_name\n4,d\n");
  const std::string store = datums();
  alter(store,
        "PRAGMA writable_schema = ON; UPDATE sqlite_master SET rootpage = (SELECT rootpage FROM "
        "sqlite_master WHERE name = 'other') WHERE name = 'vert_datum'");
  expect_refused(store, "damaged: ");
}

// A magnetic model of one degree at two epochs, whose coefficients have some rows.
std::string magnetic_store(SourceFolder& sources, int degree, int rows) {
  sources.add("magnetic models",
              {"model name,text,0,42", "model number,int16,42,2", "epochs,text,44,28",
               "r,float64,72,8", "kind,int16,80,2", "text,text,82,30", "lower,float64,112,8",
               "upper,float64,120,8", "interval,float64,128,8"},
              "model name,model number,epochs,r,kind,text,lower,upper,interval\n"
              "M,1,e,6371200,2,,2000,2005,5\n");
  const std::string d = std::to_string(degree);
  sources.add("e", {"Epoch date,float64,0,8", "degree,int16,8,2", "table,text,10,33"},
              "Epoch date,degree,table\n2000," + d + ",c\n2005," + d + ",c\n");
  std::string coefficients = "c,s\n";
  for (int i = 0; i < rows; ++i) coefficients += "1,0\n";
  sources.add("c", {"c,float64,8,8", "s,float64,16,8"}, coefficients);
  return sources.build();
}

TEST_F(CraftedStore, CoefficientTablesHoldTheirDegree) {
  struct {
    int degree;
    int rows;
    const char* words;  // null: the store opens
  } const kModels[] = {
      {2, 6, nullptr},
      {12, 91, nullptr},
      {12, 90, "table \"e\": row 1: degree 12 needs 91 coefficients, table \"c\" has 90"},
      {12, 3, "degree 12 needs 91 coefficients"},
      {32767, 91, "degree 32767 needs 536887296 coefficients"},
      {1, 3, nullptr}};
  for (const auto& [degree, rows, words] : kModels) {
    SCOPED_TRACE(degree);
    SourceFolder sources;
    const std::string store = magnetic_store(sources, degree, rows);
    int32_t degrees[2] = {99, 99};
    double epochs[2] = {99, 99};
    char tables[66];
    TWstatus status = 0;
    TWepoch_info(store.c_str(), "e", degrees, epochs, tables, &status);
    EXPECT_EQ(status, words ? TW_PF_OPEN_ERROR : TW_SUCCESS);
    EXPECT_EQ(degrees[0], words ? 99 : degree);
    if (words) expect_refused(store, words);
  }
}

TEST_F(CraftedStore, WhatIsNoFileIsNotWaitedFor) {
  const std::string pipe = (sources_.path() / "pipe").string();
  ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
  expect_refused(pipe, "not a regular file");
  expect_refused("/dev/zero", "not a regular file");
  expect_refused(sources_.path().string(), "not a regular file");
}

TEST_F(CraftedStore, AFileTooLongIsNotRead) {
  const std::string store = (sources_.path() / "sparse").string();
  std::ofstream(store) << "SQLite format 3";
  std::filesystem::resize_file(store, std::uintmax_t{1} << 40);
  expect_refused(store, "longer than a store may be");
}

}  // namespace
