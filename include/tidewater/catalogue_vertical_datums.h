/**
 * @file catalogue_vertical_datums.h
 * Vertical datums of the parameter store.
 *
 * Accuracy: no figure; names, counts and rows of the store, handed on as they stand there
 * (docs/accuracy.md).
 *
 * What all lookups have in common, the status words among it, is told in catalogue.h.
 */
#ifndef TIDEWATER_CATALOGUE_VERTICAL_DATUMS_H
#define TIDEWATER_CATALOGUE_VERTICAL_DATUMS_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Number of vertical datums.
 * @param store   path of the parameter store
 * @param count   number of rows
 * @param status  #TW_FAILURE where the store does not tell it
 */
TW_API void TWget_vd_cnt(const char* store, int32_t* count, TWstatus* status);

/**
 * Names of all vertical datums.
 * @param store   path of the parameter store
 * @param names   name list
 * @param status  as all of the catalogue
 */
TW_API void TWget_vd_names(const char* store, char* names, TWstatus* status);

/**
 * Name of a vertical datum.
 * @param store   path of the parameter store
 * @param num     its number
 * @param name    its name, up to 43 characters
 * @param status  #TW_NO_SUCH_VERT_DATUM where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWnum_to_vd(const char* store, int32_t num, char* name, TWstatus* status);

/**
 * Number of a vertical datum.
 * @param store   path of the parameter store
 * @param name    its name
 * @param num     its number
 * @param status  #TW_NO_SUCH_VERT_DATUM where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWvd_to_num(const char* store, const char* name, int32_t* num, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
