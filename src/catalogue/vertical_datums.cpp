// Vertical datums in the parameter store.

#include "catalogue/session.hpp"
#include "tidewater/catalogue_vertical_datums.h"

using namespace tidewater::detail;

namespace {

constexpr const char* kTable = "vert_datum";

}  // namespace

void TWget_vd_cnt(const char* store, int32_t* count, TWstatus* status) {
  // By contract: the word of a failure and the judgement differ from those of TWget_undl_cnt.
  in_store(store, Close::kIgnored, status,
           [&] { return count_rows(kTable, Judge::kLowBit, TW_FAILURE, count); });
}

void TWget_vd_names(const char* store, char* names, TWstatus* status) {
  in_store(store, Close::kIgnored, status,
           [&] { return list_names(kTable, "vert_datum_name", vertical_datum_row::kName, names); });
}

void TWnum_to_vd(const char* store, int32_t num, char* name, TWstatus* status) {
  in_store(store, Close::kTested, status, [&] {
    return look_up(kTable, "vert_datum_num", &num, TW_NO_SUCH_VERT_DATUM,
                   [&](const Row& row) { row.text(vertical_datum_row::kName, name); });
  });
}

void TWvd_to_num(const char* store, const char* name, int32_t* num, TWstatus* status) {
  in_store(store, Close::kTested, status, [&] {
    return look_up(kTable, "vert_datum_name", name, TW_NO_SUCH_VERT_DATUM, [&](const Row& row) {
      *num = row.number<int32_t>(vertical_datum_row::kNumber);
    });
  });
}
