/**
 * @file catalogue_magnetic_models.h
 * Geomagnetic models of the parameter store.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Magnetic field, WMM2025 at 2027.3, lat -89 to 89, to 400 km up: 5.8e-11 nT (5.0e-11 nT);
 * - Magnetic field, IGRF-14 at 2026.5, lat -89 to 89, to 400 km up: 5.5e-11 nT (5.1e-11 nT);
 * - Magnetic field, IGRF-14 at 1952.5, lat -89 to 89, to 400 km up: 6.0e-11 nT (5.3e-11 nT);
 * - Magnetic field, IGRF-13 at 2021.0, lat -89 to 89, to 400 km up: 5.5e-11 nT (5.1e-11 nT).
 *
 * What all lookups have in common, the status words among it, is told in catalogue.h.
 */
#ifndef TIDEWATER_CATALOGUE_MAGNETIC_MODELS_H
#define TIDEWATER_CATALOGUE_MAGNETIC_MODELS_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

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

#ifdef __cplusplus
}
#endif

#endif
