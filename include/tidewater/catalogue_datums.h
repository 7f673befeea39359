/**
 * @file catalogue_datums.h
 * Datum models of the parameter store.
 *
 * Accuracy: no figure; names, counts and rows of the store, handed on as they stand there
 * (docs/accuracy.md).
 *
 * What all lookups have in common, the status words among it, is told in catalogue.h.
 */
#ifndef TIDEWATER_CATALOGUE_DATUMS_H
#define TIDEWATER_CATALOGUE_DATUMS_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Number of datum models of some classes.
 * @param store   path of the parameter store
 * @param mask    classes that take part: a row does when its 32-bit mask and this, widened with its
 *                sign, share a bit; 0 takes none, -1 every row with any bit
 * @param count   number of rows that take part
 * @param status  as all of the catalogue
 */
TW_API void TWget_dt_cnt(const char* store, int16_t mask, int32_t* count, TWstatus* status);

/**
 * Names of the datum models of some classes, as many as TWget_dt_cnt() tells for the same mask.
 * @param store   path of the parameter store
 * @param mask    classes that take part: a row does when its 32-bit mask and this, widened with its
 *                sign, share a bit; 0 takes none, -1 every row with any bit
 * @param names   name list
 * @param status  as all of the catalogue
 */
TW_API void TWget_dt_names(const char* store, int16_t mask, char* names, TWstatus* status);

/**
 * Name of a datum model.
 * @param store   path of the parameter store
 * @param num     its number
 * @param name    its name, up to 40 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWnum_to_dt(const char* store, int16_t num, char* name, TWstatus* status);

/**
 * Class text of a datum model.
 * @param store   path of the parameter store
 * @param num     its number
 * @param cls     its class text, up to 15 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWdt_num_t_cls(const char* store, int16_t num, char* cls, TWstatus* status);

/**
 * Number of a datum model.
 * @param store   path of the parameter store
 * @param name    its name
 * @param num     its number
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWdt_to_num(const char* store, const char* name, int16_t* num, TWstatus* status);

/**
 * Class text of a datum model by its name.
 * @param store   path of the parameter store
 * @param name    its name
 * @param cls     its class text, up to 15 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none
 */
TW_API void TWdt_to_class(const char* store, const char* name, char* cls, TWstatus* status);

/**
 * Name of a datum model by its class text.
 * @param store   path of the parameter store
 * @param cls     its class text
 * @param name    its name, up to 40 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none
 */
TW_API void TWclass_to_dt(const char* store, const char* cls, char* name, TWstatus* status);

/**
 * Number of a datum model by its class text.
 * @param store   path of the parameter store
 * @param cls     its class text
 * @param num     its number
 * @param status  #TW_NO_SUCH_MODEL where there is none
 */
TW_API void TWdt_cls_t_num(const char* store, const char* cls, int16_t* num, TWstatus* status);

/**
 * Form identifier of a datum model by its class text.
 * @param store   path of the parameter store
 * @param cls     its class text
 * @param fid     its form identifier
 * @param status  #TW_NO_SUCH_MODEL where there is none
 */
TW_API void TWdt_cls_t_fid(const char* store, const char* cls, int16_t* fid, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
