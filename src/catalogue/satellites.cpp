// Satellites of the space oblique Mercator projection in the parameter store.

#include "catalogue/session.hpp"
#include "formulas/constants.hpp"
#include "tidewater/catalogue_satellites.h"

using namespace tidewater::detail;

namespace {

constexpr const char* kTable = "Satellites";

// The record with its three angles in radians.
void unpack(const Row& row, SatelliteRecord& record) {
  using namespace satellite_row;
  row.text(kName, record.sat_name);
  record.real1 = row.number<double>(kReal1);
  record.real2 = row.number<double>(kReal2);
  record.angle1 = row.number<double>(kAngle1) * kRadiansPerDegree;
  record.angle2 = row.number<double>(kAngle2) * kRadiansPerDegree;
  record.real3 = row.number<double>(kReal3);
  record.real4 = row.number<double>(kReal4);
  record.real5 = row.number<double>(kReal5);
  record.angle3 = row.number<double>(kAngle3) * kRadiansPerDegree;
  record.count1 = row.number<int32_t>(kCount1);
  record.short1 = row.number<int16_t>(kShort1);
  record.short2 = row.number<int16_t>(kShort2);
  record.short3 = row.number<int16_t>(kShort3);
  record.id = row.number<int16_t>(kId);
}

}  // namespace

void TWsomps_cnt(const char* store, int32_t* count, TWstatus* status) {
  // By contract: the one function that asks for the exact success word of the open.
  in_store(
      store, Close::kIgnored, status,
      [&] { return count_rows(kTable, Judge::kExact, TW_PF_TABLE_ERROR, count); }, Judge::kExact);
}

void TWsomps_get_all(const char* store, SatelliteRecord* records, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    const TWstatus begun = begin_walk(kTable, "sat_name");
    if (!TW_OK(begun)) return begun;
    SatelliteRecord* record = records;
    walk(kTable, [&](const Row& row) { unpack(row, *record++); });
    return TW_SUCCESS;
  });
}

void TWsomps_get_sat(const char* store, int16_t id, SatelliteRecord* record, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    // By contract: the one function that asks for the exact success word of the reset.
    return look_up(
        kTable, "id", &id, TW_NO_SUCH_SATELLITE, [&](const Row& row) { unpack(row, *record); },
        Judge::kExact);
  });
}

void TWsomps_id2name(const char* store, int16_t id, char* name, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    return look_up(kTable, "id", &id, TW_NO_SUCH_SATELLITE,
                   [&](const Row& row) { row.text(satellite_row::kName, name); });
  });
}

void TWsomps_name2id(const char* store, const char* name, int16_t* id, TWstatus* status) {
  in_store(store, Close::kIgnored, status, [&] {
    return look_up(kTable, "sat_name", name, TW_NO_SUCH_SATELLITE,
                   [&](const Row& row) { *id = row.number<int16_t>(satellite_row::kId); });
  });
}
