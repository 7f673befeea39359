// The command that builds, lists and checks stores, run as a command.

#include <gtest/gtest.h>
#include <sys/stat.h>
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

// A shell command; where it leads its output elsewhere, what is left of it.
Result shell(const std::string& line) {
  const std::string command = "{ " + line + "; } 2>&1";
  FILE* pipe = popen(command.c_str(), "r");
  if (!pipe) return {-1, "cannot run " + command};
  Result result = {0, ""};
  char part[512];
  for (std::size_t n; (n = fread(part, 1, sizeof part, pipe)) > 0;) result.output.append(part, n);
  const int status = pclose(pipe);
  result.code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  return result;
}

Result twstore(const std::string& arguments) {
  return shell(std::string(TWSTORE_COMMAND) + " " + arguments);
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
  EXPECT_NE(
      result.output.find(
          "built.store: table \"system\": row 4: a cell is no integer of the field's range\n"),
      std::string::npos)
      << result.output;
}

TEST_F(Twstore, CheckFindsValuesThatMislead) {
  struct {
    const char* change;
    const char* words;
  } const kChanges[] = {
      {"UPDATE \"magnetic models\" SET \"reference radius\" = 0 WHERE \"model number\" = 1",
       "\"magnetic models\": row 1: a radius that is not above 0"},
      {"UPDATE \"magnetic models\" SET normalisation = -1 WHERE \"model number\" = 1",
       "\"magnetic models\": row 1: a normalisation that is none of 0 to 3"},
      {"UPDATE \"magnetic models\" SET normalisation = 4 WHERE \"model number\" = 1",
       "\"magnetic models\": row 1: a normalisation that is none of 0 to 3"},
      {"UPDATE \"magnetic models\" SET \"first date\" = -1 WHERE \"model number\" = 1",
       "\"magnetic models\": row 1: bounds that do not rise"},
      {"UPDATE \"magnetic models\" SET \"last date\" = 2024 WHERE \"model number\" = 1",
       "\"magnetic models\": row 1: bounds that do not rise"},
      {"UPDATE \"magnetic models\" SET interval = -1 WHERE \"model number\" = 1",
       "\"magnetic models\": row 1: an interval below 0"},
      {"DELETE FROM \"wmm2025 epochs\" WHERE \"Epoch date\" > 2026",
       "\"magnetic models\": row 1: fewer than two epochs"},
      {"UPDATE \"wmm2025 epochs\" SET \"Epoch date\" = 2025",
       "\"wmm2025 epochs\": two epochs of one date"},
      {"UPDATE \"wmm2025 epochs\" SET degree = 0",
       "\"wmm2025 epochs\": row 1: a degree of 0, 2 at least are needed"},
      {"UPDATE \"wmm2025 epochs\" SET degree = 11",
       "\"wmm2025 epochs\": row 2: degree 11 has 78 coefficients, table \"wmm2025"},
      {"UPDATE \"conus latitude\" SET power_u = 10 WHERE rowid = 3",
       "\"conus latitude\": row 3: a power of 10, none of 0 to 9"},
      {"UPDATE \"conus latitude\" SET power_v = -1 WHERE rowid = 3",
       "\"conus latitude\": row 3: a power of -1, none of 0 to 9"}};
  for (const auto& [change, words] : kChanges) {
    std::filesystem::copy_file(TIDEWATER_STORE, sources_.store(),
                               std::filesystem::copy_options::overwrite_existing);
    alter(sources_.store(), change);
    const Result result = run("check");
    EXPECT_EQ(result.code, 1) << change;
    EXPECT_NE(result.output.find(words), std::string::npos) << change << '\n' << result.output;
  }
}

// A file in the folder of sources, told by its bytes.
std::string bytes_of(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

class TwstoreBuild : public Twstore {
 protected:
  void SetUp() override { sources_.add("t", {"n,text,0,4"}, "n\nnew\n"); }
  std::size_t files() const {
    const std::filesystem::directory_iterator folder(sources_.path());
    return static_cast<std::size_t>(std::distance(begin(folder), end(folder)));
  }
  // The build fails with these words and leaves as many files as there were.
  void expect_refused(const std::string& words) {
    const std::size_t before = files();
    const Result result = build();
    EXPECT_EQ(result.code, 1);
    EXPECT_NE(result.output.find("built.store: " + words), std::string::npos) << result.output;
    EXPECT_EQ(files(), before);
  }
};

TEST_F(TwstoreBuild, KeepsAFilesPermissions) {
  namespace fs = std::filesystem;
  for (const auto mode : {fs::perms{0600}, fs::perms{0640}, fs::perms{0664}}) {
    EXPECT_EQ(build().code, 0);
    fs::permissions(sources_.store(), mode);
    EXPECT_EQ(build().code, 0);
    EXPECT_EQ(fs::status(sources_.store()).permissions(), mode);
  }
}

TEST_F(TwstoreBuild, ANewFileHasThePermissionsOfAnyNewFile) {
  sources_.write("other", "");
  EXPECT_EQ(build().code, 0);
  EXPECT_EQ(std::filesystem::status(sources_.store()).permissions(),
            std::filesystem::status(sources_.path() / "other").permissions());
}

TEST_F(TwstoreBuild, LeavesNeighboursAlone) {
  const std::vector<std::string> neighbours = {"built.store.new", "built.store.new-journal",
                                               "built.store-journal", "built.store-wal",
                                               ".built.store"};
  for (const std::string& name : neighbours) sources_.write(name, "mine");
  EXPECT_EQ(build().code, 0);
  sources_.write("rows1.csv", "n\ntoo long\n");
  EXPECT_EQ(build().code, 1);
  EXPECT_EQ(run("list", " t").output, "n\nnew\n");
  for (const std::string& name : neighbours) {
    EXPECT_EQ(bytes_of(sources_.path() / name), "mine") << name;
  }
}

TEST_F(TwstoreBuild, FollowsALinkAndKeepsIt) {
  namespace fs = std::filesystem;
  fs::create_directory(sources_.path() / "there");
  std::ofstream(sources_.path() / "there" / "real") << "old";
  fs::create_symlink("there/real", sources_.store());
  EXPECT_EQ(build().code, 0);
  EXPECT_TRUE(fs::is_symlink(sources_.store()));
  EXPECT_TRUE(fs::is_regular_file(fs::symlink_status(sources_.path() / "there" / "real")));
  EXPECT_EQ(run("list", " t").output, "n\nnew\n");
}

TEST_F(TwstoreBuild, RefusesALinkToNothing) {
  std::filesystem::create_symlink("nothing", sources_.store());
  expect_refused("a link to nothing");
  EXPECT_TRUE(std::filesystem::is_symlink(sources_.store()));
}

TEST_F(TwstoreBuild, RefusesWhatIsNoFile) {
  namespace fs = std::filesystem;
  fs::create_directory(sources_.store());
  expect_refused("there, and no regular file");
  fs::remove(sources_.store());
  ASSERT_EQ(mkfifo(sources_.store().c_str(), 0600), 0);
  expect_refused("there, and no regular file");
  EXPECT_TRUE(fs::is_fifo(sources_.store()));
  fs::remove(sources_.store());
  // A device by a link, so that a slip destroys no device of the machine.
  fs::create_symlink("/dev/null", sources_.store());
  expect_refused("there, and no regular file");
  EXPECT_TRUE(fs::is_character_file("/dev/null"));
}

TEST_F(TwstoreBuild, AFullDiskLeavesTheStoreThatWasThere) {
  EXPECT_EQ(build().code, 0);
  const std::string before = bytes_of(sources_.store());
  const std::size_t count = files();
  // No file of this process may grow beyond 4096 bytes.
  const std::string command = "ulimit -f 4; trap '' XFSZ; exec " + std::string(TWSTORE_COMMAND) +
                              " build " + in_quotes(sources_.store()) + " " +
                              in_quotes(sources_.path().string());
  const Result result = shell(command);
  EXPECT_EQ(result.code, 1);
  EXPECT_NE(result.output.find("built.store: cannot be written: "), std::string::npos)
      << result.output;
  EXPECT_EQ(bytes_of(sources_.store()), before);
  EXPECT_EQ(files(), count);
}

TEST_F(TwstoreBuild, SourcesAreFiles) {
  sources_.write("tables.csv", "table,layout,file\nt,rows1.csv,/dev/zero\n");
  const Result result = build();
  EXPECT_EQ(result.code, 1);
  EXPECT_NE(result.output.find("/dev/zero: cannot be opened"), std::string::npos) << result.output;
}

TEST_F(TwstoreBuild, AFullDiskBehindTheListIsSaid) {
  EXPECT_EQ(build().code, 0);
  for (const char* rest : {" >/dev/full", " t >/dev/full"}) {
    const Result result =
        shell(std::string(TWSTORE_COMMAND) + " list " + in_quotes(sources_.store()) + rest);
    EXPECT_EQ(result.code, 1);
    EXPECT_EQ(result.output, "twstore: the output cannot be written\n");
  }
  const std::string start = std::string(TWSTORE_COMMAND) + " ";
  for (const char* command : {"--help", "build --help", "list --help"}) {
    const Result result = shell(start + command + " >/dev/full");
    EXPECT_EQ(result.code, 1) << command;
    EXPECT_EQ(result.output, "twstore: the output cannot be written\n") << command;
  }
  const Result packed = shell(start + "pack " + in_quotes(sources_.store()) + " /dev/full");
  EXPECT_EQ(packed.code, 1);
  EXPECT_EQ(packed.output, "twstore: /dev/full cannot be written\n");
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
