/**
 * @file catalogue_transform_models.h
 * Regression and complex polynomial models of the parameter store.
 *
 * Accuracy: no figure; texts, names and nodes as they stand in files, exact digit by digit in
 * tests/unit (docs/accuracy.md).
 *
 * What all lookups have in common, the status words among it, is told in catalogue.h.
 */
#ifndef TIDEWATER_CATALOGUE_TRANSFORM_MODELS_H
#define TIDEWATER_CATALOGUE_TRANSFORM_MODELS_H

#include "tidewater/frame.h"
#include "tidewater/regression.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Number of multiple-regression models.
 * @param store   path of the parameter store
 * @param count   number of rows
 * @param status  as all of the catalogue
 */
TW_API void TWmre_cnt(const char* store, int32_t* count, TWstatus* status);

/**
 * Names of all multiple-regression models.
 * @param store   path of the parameter store
 * @param names   name list
 * @param status  as all of the catalogue
 */
TW_API void TWmre_names(const char* store, char* names, TWstatus* status);

/**
 * Number of a multiple-regression model.
 * @param store   path of the parameter store
 * @param name    its name
 * @param number  its number
 * @param status  #TW_NO_SUCH_MODEL where there is none: 0 is written
 */
TW_API void TWmre_num(const char* store, const char* name, int32_t* number, TWstatus* status);

/**
 * Name of a multiple-regression model.
 * @param store   path of the parameter store
 * @param number  its number
 * @param name    its name, up to 43 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none: an empty text is written
 */
TW_API void TWmre_nam(const char* store, int32_t number, char* name, TWstatus* status);

/**
 * Number of complex polynomial models.
 * @param store   path of the parameter store
 * @param count   number of rows
 * @param status  as all of the catalogue
 */
TW_API void TWcpx_cnt(const char* store, int32_t* count, TWstatus* status);

/**
 * Names of all complex polynomial models.
 * @param store   path of the parameter store
 * @param names   name list
 * @param status  as all of the catalogue
 */
TW_API void TWcpx_names(const char* store, char* names, TWstatus* status);

/**
 * Number of a complex polynomial model.
 * @param store   path of the parameter store
 * @param name    its name
 * @param number  its number
 * @param status  #TW_NO_SUCH_MODEL where there is none: 0 is written
 */
TW_API void TWcpx_num(const char* store, const char* name, int32_t* number, TWstatus* status);

/**
 * Name of a complex polynomial model.
 * @param store   path of the parameter store
 * @param number  its number
 * @param name    its name, up to 43 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none: an empty text is written
 */
TW_API void TWcpx_nam(const char* store, int32_t number, char* name, TWstatus* status);

/**
 * Row of a multiple-regression model and the sizes of its coefficient tables.
 * @param store   path of the parameter store
 * @param number  its number
 * @param row     its row as packed, 144 bytes.  Byte 0: name, 44 bytes; 44: number, 32-bit; 74, 95,
 *                116: names of the tables of longitude, latitude and height terms, 21 bytes each.
 *                Our store has the other arguments of TWmre() at 48: K, 56: longitude offset, 64:
 *                latitude offset (doubles), 72: longitude range (16-bit)
 * @param count1  number of longitude terms
 * @param count2  number of latitude terms
 * @param count3  number of height terms
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR where the store does not
 *                tell the size of a table: the row and the counts before it are written
 */
TW_API void TWmre_mdl_info(const char* store, int32_t number, void* row, int32_t* count1,
                           int32_t* count2, int32_t* count3, TWstatus* status);

/**
 * Row of a complex polynomial model and the size of its coefficient table.
 * @param store   path of the parameter store
 * @param number  its number
 * @param row     its row as packed, 112 bytes.  Byte 0: name, 44 bytes; 44: number, 32-bit; 88:
 *                name of the coefficient table, 24 bytes.  Our store has the other arguments of
 *                TWcomplexpol_f() at 48: y0, 56: x0, 64: sy, 72: sx (doubles)
 * @param count   number of coefficients, one more than the order
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR where the store does not
 *                tell the size of the table: the row is written
 */
TW_API void TWcpx_mdl_info(const char* store, int32_t number, void* row, int32_t* count,
                           TWstatus* status);

/**
 * Terms of a multiple-regression model.
 * @param store   path of the parameter store
 * @param table1  name of the table of longitude terms, as in the row of TWmre_mdl_info()
 * @param table2  name of the table of latitude terms
 * @param table3  name of the table of height terms
 * @param count1  number of longitude terms
 * @param count2  number of latitude terms
 * @param count3  number of height terms
 * @param terms1  longitude terms, arc-seconds
 * @param terms2  latitude terms, arc-seconds
 * @param terms3  height terms, metres
 * @param status  #TW_PF_TABLE_ERROR where a table cannot be read: the terms before it are written.
 *                Only the last row of each table is judged: a table that is too short leaves the
 *                rest as it was
 */
TW_API void TWmre_coef_buf(const char* store, const char* table1, const char* table2,
                           const char* table3, int32_t count1, int32_t count2, int32_t count3,
                           MreTerm* terms1, MreTerm* terms2, MreTerm* terms3, TWstatus* status);

/**
 * Coefficients of a complex polynomial model.
 * @param store         path of the parameter store
 * @param table         name of the coefficient table, as in the row of TWcpx_mdl_info()
 * @param count         number of coefficients
 * @param coefficients  2 count doubles: real and imaginary part of each
 * @param status        #TW_PF_TABLE_ERROR where the table cannot be reset; its rows are not judged:
 *                      a table that is too short repeats its last row
 */
TW_API void TWcpx_coef_buf(const char* store, const char* table, int32_t count,
                           double* coefficients, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
