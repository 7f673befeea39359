// The seven operations on store files.

#include <gtest/gtest.h>

#include <atomic>
#include <cmath>
#include <fstream>
#include <iterator>
#include <thread>

#include "source_folder.hpp"

using namespace tidewater::test;

namespace {

const std::vector<std::string> kFields = {"name,text,0,9",  ",pad,9,1",          "small,int16,10,2",
                                          "big,int32,12,4", "real,float64,16,8", ",pad,24,3"};

class StoreOperations : public testing::Test {
 protected:
  void SetUp() override {
    sources_.add("t", kFields,
                 "name,small,big,real\n"
                 "Zulu,-2,70000,0.1\n"
                 "alpha,3,-2147483648,-1e300\n"
                 "\"a,\"\"b\"\"\",32767,4464,4.9e-324\n"
                 "\xC3\xA4,3,0,0.1\n"
                 "eight888,-32768,2147483647,0\n");
  }
  // The names of a walk that has been set up.
  static std::vector<std::string> names(const char* table = "t") {
    std::vector<std::string> out;
    RowBuffer row;
    while (OLB7R3_PF_get_next_row(table, row.bytes) == TW_STORE_SUCCESS) out.push_back(row.text(0));
    return out;
  }
  template <class Key>
  static std::string find(const char* column, Key key) {
    RowBuffer row;
    const TWstoreword word = OLB7R3_PF_get_row_by_value("t", 0, column, &key, row.bytes);
    EXPECT_EQ(word, row.untouched_from(0) ? kNoRow : TW_STORE_SUCCESS);
    return word == TW_STORE_SUCCESS ? row.text(0) : "none";
  }

  SourceFolder sources_;
};

TEST_F(StoreOperations, PackByTheLayoutAndNotAByteMore) {
  const OpenStore open(sources_.build());
  ASSERT_EQ(open.word, TW_STORE_SUCCESS);
  EXPECT_EQ(OLB7R3_PF_reset_table("t"), TW_STORE_SUCCESS);
  RowBuffer row;
  EXPECT_EQ(OLB7R3_PF_get_next_row("t", row.bytes), TW_STORE_SUCCESS);
  EXPECT_EQ(row.text(0), "Zulu");
  for (const std::size_t zero : {4u, 8u, 9u, 24u, 26u}) EXPECT_EQ(row.bytes[zero], 0) << zero;
  EXPECT_EQ(row.at<int16_t>(10), -2);
  EXPECT_EQ(row.at<int32_t>(12), 70000);
  EXPECT_EQ(row.at<double>(16), 0.1);
  EXPECT_TRUE(row.untouched_from(27));
}

TEST_F(StoreOperations, NaturalOrderIsThatOfTheSource) {
  const std::vector<std::string> inserted = {"Zulu", "alpha", "a,\"b\"", "\xC3\xA4", "eight888"};
  const OpenStore open(sources_.build());
  OLB7R3_PF_reset_table("t");
  EXPECT_EQ(names(), inserted);
  EXPECT_EQ(OLB7R3_PF_define_table_search("t", nullptr), TW_STORE_SUCCESS);
  EXPECT_EQ(names(), inserted);
}

TEST_F(StoreOperations, WalksGoByBytesOrByNumber) {
  const OpenStore open(sources_.build());
  OLB7R3_PF_define_table_search("t", "name");
  EXPECT_EQ(names(),
            (std::vector<std::string>{"Zulu", "a,\"b\"", "alpha", "eight888", "\xC3\xA4"}));
  OLB7R3_PF_define_table_search("t", "small");  // equal keys in the order of insertion
  EXPECT_EQ(names(),
            (std::vector<std::string>{"eight888", "Zulu", "alpha", "\xC3\xA4", "a,\"b\""}));
  OLB7R3_PF_define_table_search("t", "real");
  EXPECT_EQ(names().front(), "alpha");
}

TEST_F(StoreOperations, TheEndOfAWalkStaysUntilAReset) {
  const OpenStore open(sources_.build());
  OLB7R3_PF_reset_table("t");
  EXPECT_EQ(names().size(), 5u);
  RowBuffer row;
  for (int i = 0; i < 3; ++i) {
    EXPECT_EQ(OLB7R3_PF_get_next_row("t", row.bytes), TW_STORE_END_OF_TABLE);
  }
  EXPECT_TRUE(row.untouched_from(0));
  OLB7R3_PF_reset_table("t");
  EXPECT_EQ(names().size(), 5u);
}

TEST_F(StoreOperations, KeysOfEachType) {
  const OpenStore open(sources_.build());
  const auto by_name = [](const char* key) {
    RowBuffer row;
    return OLB7R3_PF_get_row_by_value("t", 0, "name", key, row.bytes);
  };
  EXPECT_EQ(by_name("alpha"), TW_STORE_SUCCESS);
  EXPECT_EQ(by_name("a,\"b\""), TW_STORE_SUCCESS);
  for (const char* key : {"Alpha", "alpha ", "alph", "", "' OR 1=1 --", "al%"}) {
    EXPECT_EQ(by_name(key), kNoRow) << key;
  }
  EXPECT_EQ(find("small", int16_t{-32768}), "eight888");
  EXPECT_EQ(find("small", int16_t{3}), "alpha");  // the first of two
  EXPECT_EQ(find("small", int16_t{4}), "none");
  EXPECT_EQ(find("big", int32_t{70000}), "Zulu");
  EXPECT_EQ(find("big", int32_t{4464}), "a,\"b\"");
  EXPECT_EQ(find("real", 4.9e-324), "a,\"b\"");
  EXPECT_EQ(find("real", 0.1), "Zulu");
  EXPECT_EQ(find("real", std::nextafter(0.1, 1)), "none");
  EXPECT_EQ(find("real", 0.2), "none");
}

TEST_F(StoreOperations, CountsNeedNoReset) {
  const OpenStore open(sources_.build());
  int32_t count = -1;
  EXPECT_EQ(OLB7R3_PF_inq_num_rows("t", &count), TW_STORE_SUCCESS);
  EXPECT_EQ(count, 5);
}

TEST_F(StoreOperations, WhatIsNotThereFailsAndWritesNothing) {
  const OpenStore open(sources_.build());
  RowBuffer row;
  int32_t count = -1;
  for (const char* table : {"T", "t ", "", "no such", "sqlite_master", "tidewater_layout"}) {
    EXPECT_EQ(OLB7R3_PF_reset_table(table), kFailed) << table;
    EXPECT_EQ(OLB7R3_PF_define_table_search(table, nullptr), kFailed) << table;
    EXPECT_EQ(OLB7R3_PF_get_next_row(table, row.bytes), kFailed) << table;
    EXPECT_EQ(OLB7R3_PF_get_row_by_value(table, 0, "name", "Zulu", row.bytes), kFailed) << table;
    EXPECT_EQ(OLB7R3_PF_inq_num_rows(table, &count), kFailed) << table;
  }
  for (const char* column : {"Name", "", "rowid", "name\" --", "no such"}) {
    EXPECT_EQ(OLB7R3_PF_define_table_search("t", column), kFailed) << column;
    EXPECT_EQ(OLB7R3_PF_get_row_by_value("t", 0, column, "Zulu", row.bytes), kFailed) << column;
  }
  EXPECT_EQ(OLB7R3_PF_get_next_row("t", row.bytes), kFailed);  // no walk was set up
  EXPECT_TRUE(row.untouched_from(0));
  EXPECT_EQ(count, -1);
}

TEST_F(StoreOperations, NamesMayHoldQuotesAndBlanks) {
  sources_.add("\"x\"\"; DROP TABLE t; --\"", {"\"a \"\"key\"\"\",text,0,4"},
               "\"a \"\"key\"\"\"\none\n");
  const OpenStore open(sources_.build());
  const char* table = "x\"; DROP TABLE t; --";
  EXPECT_EQ(OLB7R3_PF_define_table_search(table, "a \"key\""), TW_STORE_SUCCESS);
  EXPECT_EQ(names(table), std::vector<std::string>{"one"});
  RowBuffer row;
  EXPECT_EQ(OLB7R3_PF_get_row_by_value(table, 0, "a \"key\"", "one", row.bytes), TW_STORE_SUCCESS);
  OLB7R3_PF_reset_table("t");
  EXPECT_EQ(names().size(), 5u);
}

TEST_F(StoreOperations, NothingWorksOutsideAnOpenStore) {
  RowBuffer row;
  int32_t count = -1;
  for (int i = 0; i < 2; ++i) {
    EXPECT_EQ(OLB7R3_PF_close(0), kFailed);
    EXPECT_EQ(OLB7R3_PF_reset_table("t"), kFailed);
    EXPECT_EQ(OLB7R3_PF_define_table_search("t", nullptr), kFailed);
    EXPECT_EQ(OLB7R3_PF_get_next_row("t", row.bytes), kFailed);
    EXPECT_EQ(OLB7R3_PF_get_row_by_value("t", 0, "name", "Zulu", row.bytes), kFailed);
    EXPECT_EQ(OLB7R3_PF_inq_num_rows("t", &count), kFailed);
    if (i == 0) {
      EXPECT_EQ(OLB7R3_PF_open(sources_.build().c_str()), TW_STORE_SUCCESS);
      EXPECT_EQ(OLB7R3_PF_reset_table("t"), TW_STORE_SUCCESS);
      EXPECT_EQ(OLB7R3_PF_close(0), TW_STORE_SUCCESS);
    }
  }
  EXPECT_EQ(count, -1);
}

TEST_F(StoreOperations, AFailedOpenLeavesNoStoreOpen) {
  EXPECT_EQ(OLB7R3_PF_open(sources_.build().c_str()), TW_STORE_SUCCESS);
  EXPECT_EQ(OLB7R3_PF_open("no such file"), kFailed);
  EXPECT_EQ(OLB7R3_PF_reset_table("t"), kFailed);
  EXPECT_FALSE(std::filesystem::exists("no such file"));
}

TEST_F(StoreOperations, EachThreadHasAStoreOfItsOwn) {
  SourceFolder other;
  other.add("t", {"name,text,0,9"}, "name\nother\n");
  const std::string first = sources_.build();
  const std::string second = other.build();
  const OpenStore open(first);
  OLB7R3_PF_reset_table("t");
  RowBuffer row;
  EXPECT_EQ(OLB7R3_PF_get_next_row("t", row.bytes), TW_STORE_SUCCESS);
  const auto work = [](const std::string& path, std::size_t rows) {
    for (int i = 0; i < 50; ++i) {
      const OpenStore mine(path);
      OLB7R3_PF_reset_table("t");
      EXPECT_EQ(names().size(), rows);
    }
  };
  std::thread a(work, first, 5);
  std::thread b(work, second, 1);
  a.join();
  b.join();
  EXPECT_EQ(names().size(), 4u);  // the walk of this thread goes on where it stood
}

TEST_F(StoreOperations, AStoreThatIsReplacedIsReadAgain) {
  const std::string path = sources_.build();
  const auto rows = [&] {
    const OpenStore open(path);
    int32_t count = -1;
    OLB7R3_PF_inq_num_rows("t", &count);
    return count;
  };
  EXPECT_EQ(rows(), 5);
  SourceFolder other;
  other.add("t", {"name,text,0,9"}, "name\nother\n");
  std::filesystem::rename(other.build(), path);
  EXPECT_EQ(rows(), 1);
  std::filesystem::remove(path);
  EXPECT_EQ(rows(), -1);
}

TEST_F(StoreOperations, AStoreThatIsWrittenInItsPlaceIsReadAgain) {
  // As long as before and within the same tick of the file's clock.
  const std::string path = sources_.build();
  const auto bytes = [&] {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), {});
  }();
  std::string changed = bytes;
  changed.replace(changed.find("alpha"), 5, "gamma");
  for (int i = 0; i < 200; ++i) {
    std::fstream(path, std::ios::binary | std::ios::in | std::ios::out)
        << (i % 2 == 0 ? changed : bytes);
    const OpenStore open(path);
    RowBuffer row;
    EXPECT_EQ(OLB7R3_PF_get_row_by_value("t", 0, "name", i % 2 == 0 ? "gamma" : "alpha", row.bytes),
              TW_STORE_SUCCESS)
        << i;
  }
}

TEST_F(StoreOperations, AnOpenStoreStaysAsItWasRead) {
  const std::string path = sources_.build();
  const OpenStore open(path);
  OLB7R3_PF_reset_table("t");
  std::filesystem::resize_file(path, 100);
  EXPECT_EQ(names().size(), 5u);
}

TEST_F(StoreOperations, AStoreMayBeReplacedWhileItIsOpened) {
  const std::string path = sources_.build();
  std::atomic<bool> done = false;
  std::thread builder([&] {
    while (!done) sources_.build();
  });
  for (int i = 0; i < 300; ++i) {
    const OpenStore open(path);
    EXPECT_EQ(open.word, TW_STORE_SUCCESS);
    OLB7R3_PF_reset_table("t");
    EXPECT_EQ(names().size(), 5u);
  }
  done = true;
  builder.join();
}

TEST_F(StoreOperations, ManyThreadsShareAStore) {
  // Orders are made when they are first asked for, here by all threads at once.
  const std::string path = sources_.build();
  std::vector<std::thread> threads;
  for (int i = 0; i < 64; ++i) {
    threads.emplace_back([&] {
      const OpenStore open(path);
      for (const char* column : {"name", "small", "big", "real"}) {
        OLB7R3_PF_define_table_search("t", column);
        EXPECT_EQ(names().size(), 5u);
      }
      EXPECT_EQ(find("big", int32_t{70000}), "Zulu");
    });
  }
  for (std::thread& thread : threads) thread.join();
}

}  // namespace
