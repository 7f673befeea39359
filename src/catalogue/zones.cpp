// Names and numbers of the state plane zones in the parameter store.

#include "catalogue/session.hpp"
#include "tidewater/catalogue_zones.h"

using namespace tidewater::detail;

namespace {

const char* zone_table(int16_t datum_kind) { return datum_kind == 0 ? "spcs27_tbl" : "spcs83_tbl"; }

}  // namespace

int32_t TWspcs_cnt(const char* store, int16_t datum_kind, int32_t* count, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    return count_rows(zone_table(datum_kind), Judge::kLowBit, TW_PF_TABLE_ERROR, count);
  });
  return 1;
}

int32_t TWspcs_get_all(const char* store, int16_t datum_kind, ZoneRecord* records,
                       TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    const char* table = zone_table(datum_kind);
    const TWstatus begun = begin_walk(table, "zone_name");
    if (!TW_OK(begun)) return begun;
    ZoneRecord* record = records;
    walk(table, [&](const Row& row) {
      record->zone_number = row.number<int16_t>(zone_row::kNumber);
      row.text(zone_row::kName, record->zone_name);
      ++record;
    });
    return TW_SUCCESS;
  });
  return 1;
}

int32_t TWsp_nam_t_num(const char* store, int16_t datum_kind, const char* zone_name,
                       int16_t* zone_number, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    return look_up(zone_table(datum_kind), "zone_name", zone_name, TW_BAD_ZONE,
                   [&](const Row& row) { *zone_number = row.number<int16_t>(zone_row::kNumber); });
  });
  return 1;
}

int32_t TWsp_num_t_nam(const char* store, int16_t datum_kind, int16_t zone_number, char* zone_name,
                       TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    return look_up(zone_table(datum_kind), "zone_number", &zone_number, TW_BAD_ZONE,
                   [&](const Row& row) { row.text(zone_row::kName, zone_name); });
  });
  return 1;
}
