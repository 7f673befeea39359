/**
 * @file catalogue_zones.h
 * State plane zones of the parameter store.
 *
 * Accuracy: no figure; names, counts and rows of the store, handed on as they stand there
 * (docs/accuracy.md).
 *
 * What all lookups have in common, the status words among it, is told in catalogue.h.
 */
#ifndef TIDEWATER_CATALOGUE_ZONES_H
#define TIDEWATER_CATALOGUE_ZONES_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** A state plane zone. */
typedef struct ZoneRecord {
  int16_t zone_number; /**< Number, as TWspcs27() and TWspcs83() take it. */
  char zone_name[42];  /**< Name with its terminator. */
} ZoneRecord;

/**
 * Number of state plane zones of one system.
 * @param store       path of the parameter store
 * @param datum_kind  0: the zones of 1927; any other value: those of 1983
 * @param count       number of zones
 * @param status      as all of the catalogue
 * @return 1; no part of the contract
 */
TW_API int32_t TWspcs_cnt(const char* store, int16_t datum_kind, int32_t* count, TWstatus* status);

/**
 * Number and name of all zones of one system, in the byte order of their names.
 * @param store       path of the parameter store
 * @param datum_kind  0: the zones of 1927; any other value: those of 1983
 * @param records     as many records as TWspcs_cnt() tells
 * @param status      as all of the catalogue
 * @return 1; no part of the contract
 */
TW_API int32_t TWspcs_get_all(const char* store, int16_t datum_kind, ZoneRecord* records,
                              TWstatus* status);

/**
 * Number of a zone.
 * @param store        path of the parameter store
 * @param datum_kind   0: the zones of 1927; any other value: those of 1983
 * @param zone_name    its name
 * @param zone_number  its number, as TWspcs27() and TWspcs83() take it
 * @param status       #TW_BAD_ZONE where there is none
 * @return 1; no part of the contract
 */
TW_API int32_t TWsp_nam_t_num(const char* store, int16_t datum_kind, const char* zone_name,
                              int16_t* zone_number, TWstatus* status);

/**
 * Name of a zone.
 * @param store        path of the parameter store
 * @param datum_kind   0: the zones of 1927; any other value: those of 1983
 * @param zone_number  its number
 * @param zone_name    its name, up to 41 characters
 * @param status       #TW_BAD_ZONE where there is none
 * @return 1; no part of the contract
 */
TW_API int32_t TWsp_num_t_nam(const char* store, int16_t datum_kind, int16_t zone_number,
                              char* zone_name, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
