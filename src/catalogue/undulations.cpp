// Undulation models in the parameter store.

#include "catalogue/session.hpp"
#include "tidewater/catalogue_undulations.h"

using namespace tidewater::detail;

namespace {

constexpr const char* kTable = "undul";

}  // namespace

void TWget_undl_cnt(const char* store, int32_t* count, TWstatus* status) {
  in_store(store, Close::kIgnored, status,
           [&] { return count_rows(kTable, Judge::kExact, TW_PF_TABLE_ERROR, count); });
}

void TWget_undl_nam(const char* store, char* names, TWstatus* status) {
  in_store(store, Close::kIgnored, status,
           [&] { return list_names(kTable, "undul_name", undulation_row::kName, names); });
}

void TWnum_to_undl(const char* store, int16_t num, char* name, TWstatus* status) {
  in_store(store, Close::kTested, status, [&] {
    return look_up(kTable, "number", &num, TW_NO_SUCH_MODEL,
                   [&](const Row& row) { row.text(undulation_row::kName, name); });
  });
}

void TWundl_to_num(const char* store, const char* name, int16_t* num, TWstatus* status) {
  in_store(store, Close::kTested, status, [&] {
    return look_up(kTable, "undul_name", name, TW_NO_SUCH_MODEL,
                   [&](const Row& row) { *num = row.number<int16_t>(undulation_row::kNumber); });
  });
}

void TWundl_to_clas(const char* store, const char* name, char* cls, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    return look_up(kTable, "undul_name", name, TW_NO_SUCH_MODEL,
                   [&](const Row& row) { row.text(undulation_row::kClass, cls); });
  });
}

void TWundl_to_parm(const char* store, const char* cls, char* name, char* parm, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    return look_up(kTable, "undul_class", cls, TW_NO_SUCH_MODEL, [&](const Row& row) {
      row.text(undulation_row::kName, name);
      row.text(undulation_row::kParameter, parm);
    });
  });
}
