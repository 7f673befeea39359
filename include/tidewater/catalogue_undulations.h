/**
 * @file catalogue_undulations.h
 * Undulation models of the parameter store.
 *
 * Accuracy: no figure; names, counts and rows of the store, handed on as they stand there
 * (docs/accuracy.md).
 *
 * What all lookups have in common, the status words among it, is told in catalogue.h.
 */
#ifndef TIDEWATER_CATALOGUE_UNDULATIONS_H
#define TIDEWATER_CATALOGUE_UNDULATIONS_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Number of undulation models.
 * @param store   path of the parameter store
 * @param count   number of rows
 * @param status  #TW_PF_TABLE_ERROR where the store does not tell it
 */
TW_API void TWget_undl_cnt(const char* store, int32_t* count, TWstatus* status);

/**
 * Names of all undulation models.
 * @param store   path of the parameter store
 * @param names   name list
 * @param status  as all of the catalogue
 */
TW_API void TWget_undl_nam(const char* store, char* names, TWstatus* status);

/**
 * Name of an undulation model.
 * @param store   path of the parameter store
 * @param num     its number
 * @param name    its name, up to 40 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWnum_to_undl(const char* store, int16_t num, char* name, TWstatus* status);

/**
 * Number of an undulation model.
 * @param store   path of the parameter store
 * @param name    its name
 * @param num     its number
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWundl_to_num(const char* store, const char* name, int16_t* num, TWstatus* status);

/**
 * Class text of an undulation model.
 * @param store   path of the parameter store
 * @param name    its name
 * @param cls     its class text, up to 15 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none
 */
TW_API void TWundl_to_clas(const char* store, const char* name, char* cls, TWstatus* status);

/**
 * Name and parameter text of an undulation model by its class text.
 * @param store   path of the parameter store
 * @param cls     its class text
 * @param name    its name, up to 40 characters
 * @param parm    its parameter text, up to 16 characters; in our store the name of the grid
 * @param status  #TW_NO_SUCH_MODEL where there is none
 */
TW_API void TWundl_to_parm(const char* store, const char* cls, char* name, char* parm,
                           TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
