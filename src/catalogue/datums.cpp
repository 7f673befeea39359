// Datum models in the parameter store.

#include "catalogue/class_table.hpp"
#include "tidewater/catalogue_datums.h"

using namespace tidewater::detail;

namespace {

constexpr ClassTable kDatums = {"dt_models", "dt_class", "dt_name", "dt_num", TW_NO_SUCH_MODEL};

}  // namespace

void TWget_dt_cnt(const char* store, int16_t mask, int32_t* count, TWstatus* status) {
  kDatums.count(store, mask, count, status);
}

void TWget_dt_names(const char* store, int16_t mask, char* names, TWstatus* status) {
  kDatums.names(store, mask, names, status);
}

void TWnum_to_dt(const char* store, int16_t num, char* name, TWstatus* status) {
  kDatums.text(store, kDatums.number_column, &num, class_row::kName, Close::kTested, name, status);
}

void TWdt_num_t_cls(const char* store, int16_t num, char* cls, TWstatus* status) {
  kDatums.text(store, kDatums.number_column, &num, class_row::kClass, Close::kTested, cls, status);
}

void TWdt_to_num(const char* store, const char* name, int16_t* num, TWstatus* status) {
  kDatums.number(store, kDatums.name_column, name, class_row::kNumber, Close::kTested, num, status);
}

void TWdt_to_class(const char* store, const char* name, char* cls, TWstatus* status) {
  kDatums.text(store, kDatums.name_column, name, class_row::kClass, Close::kIgnored, cls, status);
}

void TWclass_to_dt(const char* store, const char* cls, char* name, TWstatus* status) {
  kDatums.text(store, kDatums.class_column, cls, class_row::kName, Close::kIgnored, name, status);
}

void TWdt_cls_t_num(const char* store, const char* cls, int16_t* num, TWstatus* status) {
  kDatums.number(store, kDatums.class_column, cls, class_row::kNumber, Close::kIgnored, num,
                 status);
}

void TWdt_cls_t_fid(const char* store, const char* cls, int16_t* fid, TWstatus* status) {
  kDatums.number(store, kDatums.class_column, cls, class_row::kForm, Close::kIgnored, fid, status);
}
