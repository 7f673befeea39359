// Every operation of the store failing in turn, in every catalogue function: the exact status, the
// outputs untouched, and one close for each open that worked.

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <functional>
#include <string>
#include <vector>

#include "support/fake_store.hpp"
#include "tidewater/catalogue.h"

using namespace tidewater::test;

namespace {

using Type = FakeStore::Type;

constexpr unsigned char kSentinel = 0xA5;

// All outputs of a call live in one block, so that "untouched" is one comparison.
struct Outputs {
  alignas(8) std::array<unsigned char, 2048> bytes;
  Outputs() { bytes.fill(kSentinel); }
  template <class T>
  T* at(std::size_t offset) {
    return reinterpret_cast<T*>(bytes.data() + offset);
  }
  bool untouched() const {
    return std::all_of(bytes.begin(), bytes.end(), [](auto b) { return b == kSentinel; });
  }
};

enum class Judged { kLowBit, kExact, kNot };

// An operation that a function makes, how its answer is judged and what a bad one gives.
struct Operation {
  StoreCall call;
  int nth;
  Judged judged;
  TWstatus word;
  bool writes_before = false;  // outputs are written although the call fails
};

struct Function {
  const char* name;
  std::function<void(Outputs&, TWstatus*)> run;
  std::vector<Operation> operations;
};

std::ostream& operator<<(std::ostream& out, const Function& f) { return out << f.name; }

constexpr Operation kOpen = {StoreCall::kOpen, 1, Judged::kLowBit, TW_PF_OPEN_ERROR};
constexpr Operation kReset = {StoreCall::kReset, 1, Judged::kLowBit, TW_PF_TABLE_ERROR};
constexpr Operation kSearch = {StoreCall::kSearch, 1, Judged::kLowBit, TW_PF_TABLE_ERROR};
constexpr Operation kClose = {StoreCall::kClose, 1, Judged::kNot, 0};
constexpr Operation kTestedClose = {StoreCall::kClose, 1, Judged::kLowBit, TW_PF_TABLE_ERROR, true};

Operation by_value(TWstatus word, bool writes = false) {
  return {StoreCall::kByValue, 1, Judged::kExact, word, writes};
}
Operation rows(Judged judged, TWstatus word, int nth = 1, bool writes = false) {
  return {StoreCall::kRows, nth, judged, word, writes};
}

std::vector<Operation> walk() { return {kOpen, kReset, kSearch, kClose}; }
std::vector<Operation> lookup(TWstatus word, const Operation& close, bool writes = false) {
  return {kOpen, kReset, by_value(word, writes), close};
}
std::vector<Operation> counted(Judged judged, TWstatus word) {
  return {kOpen, rows(judged, word), kClose};
}

std::vector<Function> all_functions() {
  const char* const s = "p";
  std::vector<Function> f;
  const auto add = [&f](const char* name, std::vector<Operation> operations,
                        std::function<void(Outputs&, TWstatus*)> run) {
    f.push_back({name, std::move(run), std::move(operations)});
  };
  using O = Outputs;
  using W = TWstatus*;

  add("TWget_cs_cnt", walk(), [=](O& o, W w) { TWget_cs_cnt(s, -1, o.at<int32_t>(0), w); });
  add("TWget_cs_names", walk(), [=](O& o, W w) { TWget_cs_names(s, -1, o.at<char>(0), w); });
  const auto cs = lookup(TW_NO_SUCH_SYSTEM, kClose);
  const auto cs_tested = lookup(TW_NO_SUCH_SYSTEM, kTestedClose);
  add("TWnum_to_cs", cs_tested, [=](O& o, W w) { TWnum_to_cs(s, 7, o.at<char>(0), w); });
  add("TWnum_to_class", cs_tested, [=](O& o, W w) { TWnum_to_class(s, 7, o.at<char>(0), w); });
  add("TWcs_to_num", cs_tested, [=](O& o, W w) { TWcs_to_num(s, "N", o.at<int16_t>(0), w); });
  add("TWcs_to_class", cs, [=](O& o, W w) { TWcs_to_class(s, "N", o.at<char>(0), w); });
  add("TWclass_to_cs", cs, [=](O& o, W w) { TWclass_to_cs(s, "C", o.at<char>(0), w); });
  add("TWclass_to_num", cs, [=](O& o, W w) { TWclass_to_num(s, "C", o.at<int16_t>(0), w); });
  add("TWclass_to_fid", cs, [=](O& o, W w) { TWclass_to_fid(s, "C", o.at<int16_t>(0), w); });

  add("TWget_dt_cnt", walk(), [=](O& o, W w) { TWget_dt_cnt(s, -1, o.at<int32_t>(0), w); });
  add("TWget_dt_names", walk(), [=](O& o, W w) { TWget_dt_names(s, -1, o.at<char>(0), w); });
  const auto dt = lookup(TW_NO_SUCH_MODEL, kClose);
  const auto dt_tested = lookup(TW_NO_SUCH_MODEL, kTestedClose);
  add("TWnum_to_dt", dt_tested, [=](O& o, W w) { TWnum_to_dt(s, 7, o.at<char>(0), w); });
  add("TWdt_num_t_cls", dt_tested, [=](O& o, W w) { TWdt_num_t_cls(s, 7, o.at<char>(0), w); });
  add("TWdt_to_num", dt_tested, [=](O& o, W w) { TWdt_to_num(s, "N", o.at<int16_t>(0), w); });
  add("TWdt_to_class", dt, [=](O& o, W w) { TWdt_to_class(s, "N", o.at<char>(0), w); });
  add("TWclass_to_dt", dt, [=](O& o, W w) { TWclass_to_dt(s, "C", o.at<char>(0), w); });
  add("TWdt_cls_t_num", dt, [=](O& o, W w) { TWdt_cls_t_num(s, "C", o.at<int16_t>(0), w); });
  add("TWdt_cls_t_fid", dt, [=](O& o, W w) { TWdt_cls_t_fid(s, "C", o.at<int16_t>(0), w); });

  add("TWget_vd_cnt", counted(Judged::kLowBit, TW_FAILURE),
      [=](O& o, W w) { TWget_vd_cnt(s, o.at<int32_t>(0), w); });
  add("TWget_vd_names", walk(), [=](O& o, W w) { TWget_vd_names(s, o.at<char>(0), w); });
  add("TWnum_to_vd", lookup(TW_NO_SUCH_VERT_DATUM, kTestedClose),
      [=](O& o, W w) { TWnum_to_vd(s, 7, o.at<char>(0), w); });
  add("TWvd_to_num", lookup(TW_NO_SUCH_VERT_DATUM, kTestedClose),
      [=](O& o, W w) { TWvd_to_num(s, "N", o.at<int32_t>(0), w); });

  add("TWget_undl_cnt", counted(Judged::kExact, TW_PF_TABLE_ERROR),
      [=](O& o, W w) { TWget_undl_cnt(s, o.at<int32_t>(0), w); });
  add("TWget_undl_nam", walk(), [=](O& o, W w) { TWget_undl_nam(s, o.at<char>(0), w); });
  add("TWnum_to_undl", dt_tested, [=](O& o, W w) { TWnum_to_undl(s, 7, o.at<char>(0), w); });
  add("TWundl_to_num", dt_tested, [=](O& o, W w) { TWundl_to_num(s, "N", o.at<int16_t>(0), w); });
  add("TWundl_to_clas", dt, [=](O& o, W w) { TWundl_to_clas(s, "N", o.at<char>(0), w); });
  add("TWundl_to_parm", dt,
      [=](O& o, W w) { TWundl_to_parm(s, "C", o.at<char>(0), o.at<char>(64), w); });

  add("TWspcs_cnt", counted(Judged::kLowBit, TW_PF_TABLE_ERROR),
      [=](O& o, W w) { EXPECT_EQ(TWspcs_cnt(s, 0, o.at<int32_t>(0), w), 1); });
  add("TWspcs_get_all", walk(),
      [=](O& o, W w) { EXPECT_EQ(TWspcs_get_all(s, 0, o.at<ZoneRecord>(0), w), 1); });
  add("TWsp_nam_t_num", lookup(TW_BAD_ZONE, kClose),
      [=](O& o, W w) { EXPECT_EQ(TWsp_nam_t_num(s, 0, "N", o.at<int16_t>(0), w), 1); });
  add("TWsp_num_t_nam", lookup(TW_BAD_ZONE, kClose),
      [=](O& o, W w) { EXPECT_EQ(TWsp_num_t_nam(s, 0, 7, o.at<char>(0), w), 1); });

  const auto satellite = lookup(TW_NO_SUCH_SATELLITE, kClose);
  auto exact_reset = satellite;
  exact_reset[1].judged = Judged::kExact;
  auto exact_open = counted(Judged::kExact, TW_PF_TABLE_ERROR);
  exact_open[0].judged = Judged::kExact;
  add("TWsomps_cnt", exact_open, [=](O& o, W w) { TWsomps_cnt(s, o.at<int32_t>(0), w); });
  add("TWsomps_get_all", walk(),
      [=](O& o, W w) { TWsomps_get_all(s, o.at<SatelliteRecord>(0), w); });
  add("TWsomps_get_sat", exact_reset,
      [=](O& o, W w) { TWsomps_get_sat(s, 7, o.at<SatelliteRecord>(0), w); });
  add("TWsomps_id2name", satellite, [=](O& o, W w) { TWsomps_id2name(s, 7, o.at<char>(0), w); });
  add("TWsomps_name2id", satellite,
      [=](O& o, W w) { TWsomps_name2id(s, "N", o.at<int16_t>(0), w); });

  const auto model = lookup(TW_NO_SUCH_MODEL, kClose, true);  // a miss is written
  const auto exact_count = counted(Judged::kExact, TW_PF_TABLE_ERROR);
  add("TWmre_cnt", exact_count, [=](O& o, W w) { TWmre_cnt(s, o.at<int32_t>(0), w); });
  add("TWmre_names", walk(), [=](O& o, W w) { TWmre_names(s, o.at<char>(0), w); });
  add("TWmre_num", model, [=](O& o, W w) { TWmre_num(s, "N", o.at<int32_t>(0), w); });
  add("TWmre_nam", model, [=](O& o, W w) { TWmre_nam(s, 7, o.at<char>(0), w); });
  add("TWmre_mdl_info",
      {kOpen, kReset, by_value(TW_NO_SUCH_MODEL), rows(Judged::kExact, TW_PF_TABLE_ERROR, 1, true),
       rows(Judged::kExact, TW_PF_TABLE_ERROR, 2, true),
       rows(Judged::kExact, TW_PF_TABLE_ERROR, 3, true), kClose},
      [=](O& o, W w) {
        TWmre_mdl_info(s, 7, o.at<char>(0), o.at<int32_t>(200), o.at<int32_t>(204),
                       o.at<int32_t>(208), w);
      });
  add("TWmre_coef_buf",
      {kOpen,
       kReset,
       {StoreCall::kNext, 2, Judged::kLowBit, TW_PF_TABLE_ERROR, true},
       {StoreCall::kReset, 2, Judged::kLowBit, TW_PF_TABLE_ERROR, true},
       {StoreCall::kReset, 3, Judged::kLowBit, TW_PF_TABLE_ERROR, true},
       kClose},
      [=](O& o, W w) {
        TWmre_coef_buf(s, "t1", "t2", "t3", 2, 2, 2, o.at<MreTerm>(0), o.at<MreTerm>(64),
                       o.at<MreTerm>(128), w);
      });
  add("TWcpx_cnt", exact_count, [=](O& o, W w) { TWcpx_cnt(s, o.at<int32_t>(0), w); });
  add("TWcpx_names", walk(), [=](O& o, W w) { TWcpx_names(s, o.at<char>(0), w); });
  add("TWcpx_num", model, [=](O& o, W w) { TWcpx_num(s, "N", o.at<int32_t>(0), w); });
  add("TWcpx_nam", model, [=](O& o, W w) { TWcpx_nam(s, 7, o.at<char>(0), w); });
  add("TWcpx_mdl_info",
      {kOpen, kReset, by_value(TW_NO_SUCH_MODEL), rows(Judged::kExact, TW_PF_TABLE_ERROR, 1, true),
       kClose},
      [=](O& o, W w) { TWcpx_mdl_info(s, 7, o.at<char>(0), o.at<int32_t>(200), w); });
  add("TWcpx_coef_buf", {kOpen, kReset, {StoreCall::kNext, 1, Judged::kNot, 0}, kClose},
      [=](O& o, W w) { TWcpx_coef_buf(s, "c", 2, o.at<double>(0), w); });

  auto failing_search = walk();
  failing_search[2].word = TW_FAILURE;
  add("TWmag_mdl_cnt", counted(Judged::kLowBit, TW_FAILURE),
      [=](O& o, W w) { TWmag_mdl_cnt(s, o.at<int32_t>(0), w); });
  add("TWmagmdl_names", failing_search, [=](O& o, W w) { TWmagmdl_names(s, o.at<char>(0), w); });
  add("TWmm_nam_t_num", dt_tested, [=](O& o, W w) { TWmm_nam_t_num(s, "N", o.at<int16_t>(0), w); });
  add("TWmm_num_t_nam", dt_tested, [=](O& o, W w) { TWmm_num_t_nam(s, 7, o.at<char>(0), w); });
  add("TWmagmdl_info",
      {kOpen, kReset, by_value(TW_NO_SUCH_MODEL), rows(Judged::kLowBit, TW_BAD_DATA, 1, true),
       kClose},
      [=](O& o, W w) {
        char name[] = "N";
        TWmagmdl_info(s, name, o.at<int16_t>(0), 1, o.at<char>(8), o.at<double>(64),
                      o.at<int16_t>(72), o.at<char>(80), o.at<double>(128), o.at<double>(136),
                      o.at<double>(144), o.at<int32_t>(152), w);
      });
  add("TWepoch_info", walk(), [=](O& o, W w) {
    TWepoch_info(s, "e", o.at<int32_t>(0), o.at<double>(64), o.at<char>(128), w);
  });
  add("TWmm_coef_info",
      {kOpen,
       kReset,
       kSearch,
       {StoreCall::kNext, 1, Judged::kLowBit, TW_BAD_DATA},
       {StoreCall::kNext, 2, Judged::kLowBit, TW_BAD_DATA, true},
       {StoreCall::kReset, 2, Judged::kLowBit, TW_PF_TABLE_ERROR, true},
       {StoreCall::kSearch, 2, Judged::kLowBit, TW_PF_TABLE_ERROR, true},
       {StoreCall::kNext, 4, Judged::kLowBit, TW_BAD_DATA, true},
       kClose},
      [=](O& o, W w) {
        const int32_t degrees[] = {1, 0};
        const char names[2][33] = {"c", "c"};
        double* c0[] = {o.at<double>(0), o.at<double>(8)};
        double* s0[] = {o.at<double>(64), o.at<double>(72)};
        double* c1[] = {o.at<double>(128)};
        double* s1[] = {o.at<double>(136)};
        double** c[] = {c0, c1};
        double** sn[] = {s0, s1};
        TWmm_coef_info(s, 2, degrees, names[0], c, sn, w);
      });
  return f;
}

// One row in every table, each with the number 7, the name N and the class C.
void fill_store() {
  FakeStore& store = FakeStore::current();
  store.clear();
  for (const auto& [table, p] : {std::pair("system", "cs"), std::pair("dt_models", "dt")}) {
    const std::string prefix = p;
    store.add_table(table, {{prefix + "_class", 0, Type::kText},
                            {prefix + "_name", 16, Type::kText},
                            {prefix + "_num", 58, Type::kInt16}});
    store.add_row(table, PackedRow(68).text(0, "C").text(16, "N").i16(58, 7).i32(64, 1));
  }
  store.add_table("vert_datum",
                  {{"vert_datum_num", 0, Type::kInt32}, {"vert_datum_name", 4, Type::kText}});
  store.add_row("vert_datum", PackedRow(48).i32(0, 7).text(4, "N"));
  store.add_table("undul", {{"undul_class", 0, Type::kText},
                            {"undul_name", 16, Type::kText},
                            {"number", 74, Type::kInt16}});
  store.add_row("undul", PackedRow(76).text(0, "C").text(16, "N").i16(74, 7));
  store.add_table("spcs27_tbl", {{"zone_number", 0, Type::kInt16}, {"zone_name", 2, Type::kText}});
  store.add_row("spcs27_tbl", PackedRow(44).i16(0, 7).text(2, "N"));
  store.add_table("Satellites", {{"sat_name", 0, Type::kText}, {"id", 106, Type::kInt16}});
  store.add_row("Satellites", PackedRow(120).text(0, "N").i16(106, 7));
  store.add_table("mre models", {{"model name", 0, Type::kText}, {"num", 44, Type::kInt32}});
  store.add_row(
      "mre models",
      PackedRow(144).text(0, "N").i32(44, 7).text(74, "t1").text(95, "t2").text(116, "t3"));
  for (const char* table : {"t1", "t2", "t3"}) {
    store.add_table(table, {});
    store.add_row(table, PackedRow(16).f64(0, 1));
    store.add_row(table, PackedRow(16).f64(0, 2));
  }
  store.add_table("Complex Models", {{"Model Name", 0, Type::kText}, {"Number", 44, Type::kInt32}});
  store.add_row("Complex Models", PackedRow(112).text(0, "N").i32(44, 7).text(88, "c"));
  store.add_table("c", {});
  for (int i = 0; i < 3; ++i) store.add_row("c", PackedRow(24).f64(8, i).f64(16, -i));
  store.add_table("magnetic models",
                  {{"model name", 0, Type::kText}, {"model number", 42, Type::kInt16}});
  store.add_row(
      "magnetic models",
      PackedRow(136).text(0, "N").i16(42, 7).text(44, "e").f64(72, 1).text(82, "T").f64(120, 1));
  store.add_table("e", {{"Epoch date", 0, Type::kDouble}});
  store.add_row("e", PackedRow(48).f64(0, 2000).i16(8, 1).text(10, "c"));
}

class CatalogueFailures : public testing::TestWithParam<Function> {
 protected:
  void SetUp() override { fill_store(); }
  FakeStore& store_ = FakeStore::current();
};

TEST_P(CatalogueFailures, NoneGivesSuccessAndOneClose) {
  Outputs outputs;
  TWstatus status = 0;
  GetParam().run(outputs, &status);
  EXPECT_EQ(status, TW_SUCCESS);
  EXPECT_FALSE(outputs.untouched());
  EXPECT_EQ(store_.opens(), 1);
  EXPECT_EQ(store_.closes(), 1);
  EXPECT_EQ(store_.log().front(), "open p");
  EXPECT_EQ(store_.log().back(), "close");
  // The list of operations above tells of every call but the rows of a walk.
  for (const StoreCall call : {kOpen.call, kReset.call, kSearch.call, StoreCall::kByValue,
                               StoreCall::kRows, kClose.call}) {
    const auto told = std::count_if(GetParam().operations.begin(), GetParam().operations.end(),
                                    [&](const Operation& o) { return o.call == call; });
    EXPECT_EQ(store_.calls(call), told);
  }
}

TEST_P(CatalogueFailures, EachOperationWithEachWord) {
  // Failures, a success of another message, an information word, an end where none belongs.
  const uint32_t words[] = {
      FakeStore::kSomeFailure, FakeStore::kOtherSuccess, 0x09608013, 0x00000000, 0x0960801C,
      TW_STORE_END_OF_TABLE};
  for (const Operation& operation : GetParam().operations) {
    for (const uint32_t word : words) {
      fill_store();
      store_.fail(operation.call, word, operation.nth);
      Outputs outputs;
      TWstatus status = 0;
      GetParam().run(outputs, &status);
      const bool bad = operation.judged == Judged::kExact ||
                       (operation.judged == Judged::kLowBit && (word & 1) == 0);
      SCOPED_TRACE(testing::Message() << "operation " << static_cast<int>(operation.call) << " no. "
                                      << operation.nth << " word " << std::hex << word);
      EXPECT_EQ(status, bad ? operation.word : TW_SUCCESS);
      EXPECT_TRUE(!bad || operation.writes_before || outputs.untouched());
      const bool opened = !(bad && operation.call == StoreCall::kOpen);
      EXPECT_EQ(store_.closes(), opened ? 1 : 0);
      EXPECT_TRUE(opened || store_.log().size() == 1);
    }
  }
}

TEST_P(CatalogueFailures, AFailedCloseTakesTheMissesPlaceWhereItIsTested) {
  const auto& operations = GetParam().operations;
  const auto miss = std::find_if(operations.begin(), operations.end(),
                                 [](const Operation& o) { return o.call == StoreCall::kByValue; });
  if (miss == operations.end()) return;
  store_.fail_always(StoreCall::kByValue);
  store_.fail_always(StoreCall::kClose);
  Outputs outputs;
  TWstatus status = 0;
  GetParam().run(outputs, &status);
  const bool tested = operations.back().judged == Judged::kLowBit;
  EXPECT_EQ(status, tested ? TW_PF_TABLE_ERROR : miss->word);
  EXPECT_EQ(store_.closes(), 1);
}

INSTANTIATE_TEST_SUITE_P(All, CatalogueFailures, testing::ValuesIn(all_functions()),
                         [](const auto& tested) { return std::string(tested.param.name); });

TEST(Catalogue, TwelveFunctionsTestTheClose) {
  const auto functions = all_functions();
  EXPECT_EQ(functions.size(), 56u);
  EXPECT_EQ(std::count_if(
                functions.begin(), functions.end(),
                [](const Function& f) { return f.operations.back().judged == Judged::kLowBit; }),
            12);
}

}  // namespace
