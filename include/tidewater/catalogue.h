/**
 * @file catalogue.h
 * Lookups in the parameter store: named systems, datums, zones, satellites and models.
 *
 * Every function opens the store at the path that it is given, works, and closes it; nothing of the
 * store stays between calls.  The store is reached through the operations of store.h.  The path and
 * text keys are handed on as they stand; whether keys compare exactly is the store's matter (in
 * libtabdll they do).
 *
 * Status words that all functions share, beside those that each names:
 * - #TW_PF_OPEN_ERROR: the store cannot be opened.
 * - #TW_PF_TABLE_ERROR: a table is missing or cannot be read; in the functions that say so, also a
 *   store that cannot be closed, over any other word.
 *
 * After a failure the outputs are as they were, except where a function says otherwise.
 *
 * A name list is a flat area of entries 41 bytes apart, each a text with its terminator; the area
 * holds as many entries as the count function of the same table tells, and is not checked.  Lists
 * come in the byte order of the names.
 */
#ifndef TIDEWATER_CATALOGUE_H
#define TIDEWATER_CATALOGUE_H

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
 * A satellite for the space oblique Mercator projection.  The catalogue fixes the types only; what
 * a field means is settled between the store and its users.  Our store follows Snyder 1987, pp.
 * 214-219, with the orbit arguments of TWsom_c() and the path arguments of TWsomps().
 */
typedef struct SatelliteRecord {
  char sat_name[32]; /**< Name with its terminator. */
  double real1;      /**< P: period of the satellite over the length of the Earth's rotation. */
  double real2;      /**< eps: eccentricity of the orbit. */
  double angle1;     /**< inc: inclination of the orbit; radians here, degrees in the store. */
  double angle2;     /**< om: angle of perigee; radians here, degrees in the store. */
  double real3;      /**< Not used by our store: 0. */
  double real4;      /**< Not used by our store: 0. */
  double real5;      /**< Not used by our store: 0. */
  double angle3;     /**< lon_ref: ascending node of path 0; radians here, degrees in the store. */
  int32_t count1;    /**< paths: number of paths around the Earth. */
  int16_t short1;    /**< row_first: first row of the southern half of an orbit. */
  int16_t short2;    /**< row_last: last row of the southern half of an orbit. */
  int16_t short3;    /**< row_next: first row that lies north of the next ascending node. */
  int16_t id;        /**< Identifier. */
  char reserved[12]; /**< Not written. */
} SatelliteRecord;

/** One term of a multiple-regression sum: coefficient U^power_u V^power_v. */
typedef struct MreTerm {
  double coefficient; /**< Arc-seconds, or metres in a height sum. */
  int16_t power_u;    /**< Power of U, the scaled latitude: 0 to 9. */
  int16_t power_v;    /**< Power of V, the scaled longitude: 0 to 9. */
  int32_t reserved;   /**< Not read. */
} MreTerm;

/** @name Coordinate systems
 *  @{ */

/**
 * Number of coordinate systems of some classes.
 * @param store   path of the parameter store
 * @param mask    classes that take part: a row does when its 32-bit mask and this, widened with its
 *                sign, share a bit; 0 takes none, -1 every row with any bit
 * @param count   number of rows that take part
 * @param status  as all of the catalogue
 */
TW_API void TWget_cs_cnt(const char* store, int16_t mask, int32_t* count, TWstatus* status);

/**
 * Names of the coordinate systems of some classes, as many as TWget_cs_cnt() tells for the same
 * mask.
 * @param store   path of the parameter store
 * @param mask    classes that take part: a row does when its 32-bit mask and this, widened with its
 *                sign, share a bit; 0 takes none, -1 every row with any bit
 * @param names   name list
 * @param status  as all of the catalogue
 */
TW_API void TWget_cs_names(const char* store, int16_t mask, char* names, TWstatus* status);

/**
 * Name of a coordinate system.
 * @param store   path of the parameter store
 * @param num     its number
 * @param name    its name, up to 40 characters
 * @param status  #TW_NO_SUCH_SYSTEM where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWnum_to_cs(const char* store, int16_t num, char* name, TWstatus* status);

/**
 * Class text of a coordinate system.
 * @param store   path of the parameter store
 * @param num     its number
 * @param cls     its class text, up to 15 characters
 * @param status  #TW_NO_SUCH_SYSTEM where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWnum_to_class(const char* store, int16_t num, char* cls, TWstatus* status);

/**
 * Number of a coordinate system.
 * @param store   path of the parameter store
 * @param name    its name
 * @param num     its number
 * @param status  #TW_NO_SUCH_SYSTEM where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWcs_to_num(const char* store, const char* name, int16_t* num, TWstatus* status);

/**
 * Class text of a coordinate system by its name.
 * @param store   path of the parameter store
 * @param name    its name
 * @param cls     its class text, up to 15 characters
 * @param status  #TW_NO_SUCH_SYSTEM where there is none
 */
TW_API void TWcs_to_class(const char* store, const char* name, char* cls, TWstatus* status);

/**
 * Name of a coordinate system by its class text.
 * @param store   path of the parameter store
 * @param cls     its class text
 * @param name    its name, up to 40 characters
 * @param status  #TW_NO_SUCH_SYSTEM where there is none
 */
TW_API void TWclass_to_cs(const char* store, const char* cls, char* name, TWstatus* status);

/**
 * Number of a coordinate system by its class text.
 * @param store   path of the parameter store
 * @param cls     its class text
 * @param num     its number
 * @param status  #TW_NO_SUCH_SYSTEM where there is none
 */
TW_API void TWclass_to_num(const char* store, const char* cls, int16_t* num, TWstatus* status);

/**
 * Form identifier of a coordinate system by its class text.
 * @param store   path of the parameter store
 * @param cls     its class text
 * @param fid     its form identifier
 * @param status  #TW_NO_SUCH_SYSTEM where there is none
 */
TW_API void TWclass_to_fid(const char* store, const char* cls, int16_t* fid, TWstatus* status);
/** @} */

/** @name Datum models
 *  @{ */

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
/** @} */

/** @name Vertical datums
 *  @{ */

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
/** @} */

/** @name Undulation models
 *  @{ */

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
/** @} */

/** @name State plane zones
 *  @{ */

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
/** @} */

/** @name Satellites
 *  @{ */

/**
 * Number of satellites.
 * @param store   path of the parameter store
 * @param count   number of rows
 * @param status  as all of the catalogue
 */
TW_API void TWsomps_cnt(const char* store, int32_t* count, TWstatus* status);

/**
 * All satellites, in the byte order of their names.
 * @param store    path of the parameter store
 * @param records  as many records as TWsomps_cnt() tells
 * @param status   as all of the catalogue
 */
TW_API void TWsomps_get_all(const char* store, SatelliteRecord* records, TWstatus* status);

/**
 * One satellite.
 * @param store   path of the parameter store
 * @param id      its identifier
 * @param record  its record
 * @param status  #TW_NO_SUCH_SATELLITE where there is none
 */
TW_API void TWsomps_get_sat(const char* store, int16_t id, SatelliteRecord* record,
                            TWstatus* status);

/**
 * Name of a satellite.
 * @param store   path of the parameter store
 * @param id      its identifier
 * @param name    its name, up to 31 characters
 * @param status  #TW_NO_SUCH_SATELLITE where there is none
 */
TW_API void TWsomps_id2name(const char* store, int16_t id, char* name, TWstatus* status);

/**
 * Identifier of a satellite.
 * @param store   path of the parameter store
 * @param name    its name
 * @param id      its identifier
 * @param status  #TW_NO_SUCH_SATELLITE where there is none
 */
TW_API void TWsomps_name2id(const char* store, const char* name, int16_t* id, TWstatus* status);
/** @} */

/** @name Regression and complex models
 *  @{ */

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
/** @} */

/** @name Magnetic models
 *  @{ */

/**
 * Number of geomagnetic models.
 * @param store   path of the parameter store
 * @param count   number of rows
 * @param status  #TW_FAILURE where the store does not tell it
 */
TW_API void TWmag_mdl_cnt(const char* store, int32_t* count, TWstatus* status);

/**
 * Names of all geomagnetic models.
 * @param store   path of the parameter store
 * @param names   name list
 * @param status  #TW_FAILURE where the walk cannot be set up
 */
TW_API void TWmagmdl_names(const char* store, char* names, TWstatus* status);

/**
 * Number of a geomagnetic model.
 * @param store   path of the parameter store
 * @param name    its name
 * @param number  its number
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWmm_nam_t_num(const char* store, const char* name, int16_t* number, TWstatus* status);

/**
 * Name of a geomagnetic model.
 * @param store   path of the parameter store
 * @param number  its number
 * @param name    its name, up to 41 characters
 * @param status  #TW_NO_SUCH_MODEL where there is none; #TW_PF_TABLE_ERROR also when the store
 *                cannot be closed
 */
TW_API void TWmm_num_t_nam(const char* store, int16_t number, char* name, TWstatus* status);

/**
 * All of one geomagnetic model.  A row with number 0 has a name and a number only: nothing else is
 * written.
 * @param store             path of the parameter store
 * @param name              its name: given where by_name is not 0, else written, up to 41
 *                          characters
 * @param number            its number: given where by_name is 0, else written
 * @param by_name           which of the two is given
 * @param epoch_table       name of its table of epochs, up to 27 characters
 * @param model_constant_1  above 0; in our store the reference radius, metres
 * @param normalisation     kind of the coefficients, 0 to 3; 2 is Schmidt semi-normalised (see
 *                          TWhar_normaliz())
 * @param model_text        a second text, up to 29 characters; in our store the publisher
 * @param lower_bound       not below 0, not above upper_bound; in our store the first date of
 *                          validity, years
 * @param upper_bound       above 0; in our store the last date of validity, years
 * @param model_constant_2  not below 0; in our store the interval between epochs for
 *                          TWhar_set_date(), years
 * @param epoch_count       number of coefficient sets
 * @param status            #TW_NO_SUCH_MODEL where there is none; #TW_BAD_HARMONIC_MODEL for a
 *                          normalisation that does not exist and #TW_BAD_DATA for another field
 *                          outside its range or an epoch table that cannot be counted: the fields
 *                          before it (the two texts stand first) are written
 */
TW_API void TWmagmdl_info(const char* store, char* name, int16_t* number, int16_t by_name,
                          char* epoch_table, double* model_constant_1, int16_t* normalisation,
                          char* model_text, double* lower_bound, double* upper_bound,
                          double* model_constant_2, int32_t* epoch_count, TWstatus* status);

/**
 * Coefficient sets of a geomagnetic model, in the order of their dates.  For TWhar_set_date() the
 * last set holds rates of change of the set before it, not a field.
 * @param store        path of the parameter store
 * @param epoch_table  name of the table of epochs, of TWmagmdl_info()
 * @param degrees      degree of each set
 * @param epochs       date of each set, years
 * @param table_names  names of the coefficient tables, 33 bytes apart
 * @param status       #TW_BAD_DATA where the dates do not rise strictly or a degree is not above 0:
 *                     the sets before it (and the date, where it is the degree) are written
 */
TW_API void TWepoch_info(const char* store, const char* epoch_table, int32_t* degrees,
                         double* epochs, char* table_names, TWstatus* status);

/**
 * Coefficients of sets.  A table that is too short repeats its last row into the rest of its set.
 * @param store        path of the parameter store
 * @param k            number of sets
 * @param degrees      degree of each set
 * @param table_names  names of the coefficient tables, 33 bytes apart, of TWepoch_info()
 * @param C            k row tables of TWhar_alocCtnm(): cosine coefficients, nT
 * @param S            k row tables: sine coefficients, nT
 * @param status       #TW_BAD_DATA where a row cannot be read; what stands before it is written
 */
TW_API void TWmm_coef_info(const char* store, int32_t k, const int32_t* degrees,
                           const char* table_names, double*** C, double*** S, TWstatus* status);
/** @} */

#ifdef __cplusplus
}
#endif

#endif
