// The command that builds, lists and checks stores, run as a command.

#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdio>
#include <fstream>
#include <iterator>

#include "source_folder.hpp"

using namespace tidewater::test;

namespace {

struct Result {
  int code;
  std::string output;  // both streams
};

std::string in_quotes(const std::string& word) { return "'" + word + "'"; }

Result twstore(const std::string& arguments) {
  const std::string command = std::string(TWSTORE_COMMAND) + " " + arguments + " 2>&1";
  FILE* pipe = popen(command.c_str(), "r");
  if (!pipe) return {-1, "cannot run " + command};
  Result result = {0, ""};
  char part[512];
  for (std::size_t n; (n = fread(part, 1, sizeof part, pipe)) > 0;) result.output.append(part, n);
  const int status = pclose(pipe);
  result.code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  return result;
}

class Twstore : public testing::Test {
 protected:
  Result build() {
    return twstore("build " + in_quotes(sources_.store()) + " " +
                   in_quotes(sources_.path().string()));
  }
  Result run(const std::string& command, const std::string& rest = "") {
    return twstore(command + " " + in_quotes(sources_.store()) + rest);
  }
  // The build fails with these words, and leaves no file.
  void expect_error(const std::string& words) {
    const Result result = build();
    EXPECT_EQ(result.code, 1);
    EXPECT_NE(result.output.find(words), std::string::npos) << result.output;
    EXPECT_FALSE(std::filesystem::exists(sources_.store()));
    EXPECT_FALSE(std::filesystem::exists(sources_.store() + ".new"));
  }

  SourceFolder sources_;
};

TEST_F(Twstore, BuildsAndLists) {
  sources_.add("places", {"name,text,0,12", "number,int16,12,2", "x,float64,16,8"},
               "# a note\n"
               "number,name,x\n"
               "\n"
               "7,\"one, \"\"two\"\"\",0.1\r\n"
               "# another\n"
               "-8,,-1e-5\n");
  const Result built = build();
  EXPECT_EQ(built.code, 0) << built.output;
  EXPECT_EQ(built.output, "");
  EXPECT_EQ(run("list").output, "table,rows,row size\nplaces,2,24\n");
  EXPECT_EQ(run("list", " places").output,
            "name,number,x\n\"one, \"\"two\"\"\",7,0.1\n,-8,-1e-05\n");
  EXPECT_EQ(run("list", " Places").code, 1);
}

TEST_F(Twstore, ErrorsNameFileLineAndColumn) {
  struct {
    const char* rows;
    const char* words;
  } const kErrors[] = {
      {"n,i,l,r\nabc,1,1,1\n# x\nabcd,1,1,1\n",
       "rows1.csv:4: column n: a text of 4 bytes, the field holds 3"},
      {"n,i,l,r\na,32768,1,1\n", "rows1.csv:2: column i: \"32768\" is no 16-bit integer"},
      {"n,i,l,r\na,1.5,1,1\n", "rows1.csv:2: column i: \"1.5\" is no 16-bit integer"},
      {"n,i,l,r\na,,1,1\n", "rows1.csv:2: column i: \"\" is no 16-bit integer"},
      {"n,i,l,r\na,1,2147483648,1\n", "rows1.csv:2: column l: \"2147483648\" is no 32-bit integer"},
      {"n,i,l,r\na,1,1,1x\n", "rows1.csv:2: column r: \"1x\" is no number"},
      {"n,i,l,r\na,1,1,1e999\n", "rows1.csv:2: column r: \"1e999\" is no number"},
      {"n,i,l,r\na,1,1,inf\n", "rows1.csv:2: column r: not finite"},
      {"n,i,l,r\na,1,1\n", "rows1.csv:2: 3 cells, the header has 4"},
      {"n,i,l,r\n\"a\nb\",1,1,x\n", "rows1.csv:2: column r"},
      {"n,i,l,r\na,1,1,1\n\"a,1,1,1\n", "rows1.csv:3: a quote is not closed"},
      {"n,i,l,r\n\"a\"b,1,1,1\n", "rows1.csv:2: text behind a closing quote"},
      {"n,i,r\na,1,1\n", "rows1.csv:1: no column \"l\""},
      {"n,i,l,r,s\na,1,1,1,1\n", "rows1.csv:1: columns that the layout does not have"},
      {"# nothing\n", "rows1.csv:1: no header"}};
  sources_.add("t", {"n,text,0,4", "i,int16,4,2", "l,int32,8,4", "r,float64,16,8"}, "");
  for (const auto& [rows, words] : kErrors) {
    sources_.write("rows1.csv", rows);
    expect_error(words);
  }
  sources_.write("rows1.csv", std::string("n,i,l,r\na\0b,1,1,1\n", 18));
  expect_error("rows1.csv:2: column n: a zero byte in a text");
}

TEST_F(Twstore, ErrorsOfTheLayouts) {
  struct {
    const char* layout;
    const char* words;
  } const kErrors[] = {
      {"a,n,text,-1,4\n", "layouts.csv:2: layout a: column \"n\""},
      {"a,n,text,0,513\n", "layouts.csv:2: layout a: column \"n\""},
      {"a,n,int16,0,4\n", "layouts.csv:2: layout a: column \"n\""},
      {"a,n,char,0,4\n", "layouts.csv:2: column type: \"char\""},
      {"a,n,text,x,4\n", "layouts.csv:2: column offset: \"x\" is no whole number"},
      {"a,n,text,0,4\na,i,int16,3,2\n", "layouts.csv:3: layout a: column \"i\": overlaps"},
      {"a,n,text,0,4\na,n,int16,4,2\n", "layouts.csv:3: layout a: column \"n\": stands twice"},
      {"a,n,text,0,4\nb,,pad,0,4\n", "layouts.csv: layout b: no column"}};
  sources_.write("tables.csv", "table,layout,file\nt,a,rows.csv\n");
  sources_.write("rows.csv", "n\n");
  for (const auto& [layout, words] : kErrors) {
    sources_.write("layouts.csv", std::string("layout,column,type,offset,size\n") + layout);
    expect_error(words);
  }
  sources_.write("layouts.csv", "layout,column,type,offset,size\na,n,text,0,4\n");
  for (const auto& [tables, words] :
       {std::pair("t,b,rows.csv\n", "tables.csv:2: column layout: no layout \"b\""),
        std::pair("t,a,no.csv\n", "no.csv: cannot be opened"),
        std::pair("t,a,rows.csv\nT,a,rows.csv\n", "tables.csv:3: table T: "),
        std::pair("sqlite_t,a,rows.csv\n", "tables.csv:2: table sqlite_t: ")}) {
    sources_.write("tables.csv", std::string("table,layout,file\n") + tables);
    expect_error(words);
  }
}

TEST_F(Twstore, AFailedBuildKeepsTheStoreThatWasThere) {
  sources_.add("t", {"n,text,0,4"}, "n\nold\n");
  EXPECT_EQ(build().code, 0);
  sources_.write("rows1.csv", "n\nlonger\n");
  EXPECT_EQ(build().code, 1);
  EXPECT_EQ(run("list", " t").output, "n\nold\n");
}

TEST_F(Twstore, CheckNamesWhatTheLibraryWillMiss) {
  sources_.add("system",
               {"cs_class,text,0,16", "cs_name,text,16,40", "cs_num,int16,58,2", "f,int16,60,2",
                "m,int16,64,2"},
               "cs_class,cs_name,cs_num,f,m\n");
  sources_.add("Complex Models",
               {"Model Name,text,0,44", "Number,int32,44,4", "\"\",pad,48,40", "t,text,88,24"},
               "Model Name,Number,t\nA,1,absent\nB,2,terms\n");
  sources_.add("terms", {"re,float64,0,8", "im,float64,16,8"}, "re,im\n");
  EXPECT_EQ(build().code, 0);
  const Result result = run("check");
  EXPECT_EQ(result.code, 1);
  for (const char* words :
       {"table \"system\": rows of 66 bytes, expected 68\n",
        "table \"system\": no text of 41 bytes at byte 16 with the column \"cs_name\"\n",
        "table \"system\": no int32 of 4 bytes at byte 64\n", "table \"dt_models\": missing\n",
        "table \"magnetic models\": missing\n",
        "table \"Complex Models\": row 1: no table \"absent\"\n",
        "table \"terms\": no float64 of 8 bytes at byte 8\n"}) {
    EXPECT_NE(result.output.find(words), std::string::npos) << words << result.output;
  }
}

TEST_F(Twstore, CheckReadsEveryRow) {
  std::filesystem::copy_file(TIDEWATER_STORE, sources_.store());
  EXPECT_EQ(run("check").code, 0);
  // A magnetic model with the number 0 is a name alone and names no table.
  alter(sources_.store(),
        "INSERT INTO \"magnetic models\" VALUES ('none', 0, '', 0, 0, '', 0, 0, 0)");
  EXPECT_EQ(run("check").code, 0);
  alter(sources_.store(), "UPDATE system SET cs_num = 70000 WHERE cs_name = 'Mercator'");
  const Result result = run("check");
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.output, "table \"system\": row 4: a cell is no integer of the field's range\n");
}

TEST_F(Twstore, WhatIsNoStoreIsSaidToBeNone) {
  sources_.write("built.store", "garbage");
  for (const char* command : {"list", "check"}) {
    const Result result = run(command);
    EXPECT_EQ(result.code, 1);
    EXPECT_NE(result.output.find("built.store: file is not a database"), std::string::npos)
        << result.output;
  }
  EXPECT_NE(twstore("").code, 0);
  EXPECT_EQ(twstore("--help").code, 0);
}

}  // namespace
