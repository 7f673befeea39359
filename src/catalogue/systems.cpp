// Coordinate systems in the parameter store.

#include "catalogue/class_table.hpp"
#include "tidewater/catalogue_systems.h"

using namespace tidewater::detail;

namespace {

constexpr ClassTable kSystems = {"system", "cs_class", "cs_name", "cs_num", TW_NO_SUCH_SYSTEM};

}  // namespace

void TWget_cs_cnt(const char* store, int16_t mask, int32_t* count, TWstatus* status) {
  kSystems.count(store, mask, count, status);
}

void TWget_cs_names(const char* store, int16_t mask, char* names, TWstatus* status) {
  kSystems.names(store, mask, names, status);
}

void TWnum_to_cs(const char* store, int16_t num, char* name, TWstatus* status) {
  kSystems.text(store, kSystems.number_column, &num, class_row::kName, Close::kTested, name,
                status);
}

void TWnum_to_class(const char* store, int16_t num, char* cls, TWstatus* status) {
  kSystems.text(store, kSystems.number_column, &num, class_row::kClass, Close::kTested, cls,
                status);
}

void TWcs_to_num(const char* store, const char* name, int16_t* num, TWstatus* status) {
  kSystems.number(store, kSystems.name_column, name, class_row::kNumber, Close::kTested, num,
                  status);
}

void TWcs_to_class(const char* store, const char* name, char* cls, TWstatus* status) {
  kSystems.text(store, kSystems.name_column, name, class_row::kClass, Close::kIgnored, cls, status);
}

void TWclass_to_cs(const char* store, const char* cls, char* name, TWstatus* status) {
  kSystems.text(store, kSystems.class_column, cls, class_row::kName, Close::kIgnored, name, status);
}

void TWclass_to_num(const char* store, const char* cls, int16_t* num, TWstatus* status) {
  kSystems.number(store, kSystems.class_column, cls, class_row::kNumber, Close::kIgnored, num,
                  status);
}

void TWclass_to_fid(const char* store, const char* cls, int16_t* fid, TWstatus* status) {
  kSystems.number(store, kSystems.class_column, cls, class_row::kForm, Close::kIgnored, fid,
                  status);
}
