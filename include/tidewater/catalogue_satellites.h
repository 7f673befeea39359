/**
 * @file catalogue_satellites.h
 * Satellites of the parameter store.
 *
 * Accuracy: no figure; names, counts and rows of the store, handed on as they stand there
 * (docs/accuracy.md).
 *
 * What all lookups have in common, the status words among it, is told in catalogue.h.
 */
#ifndef TIDEWATER_CATALOGUE_SATELLITES_H
#define TIDEWATER_CATALOGUE_SATELLITES_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * A satellite for the space oblique Mercator projection.  The catalogue fixes the types only; what
 * a field means is settled between the store and its users.  Our store follows Snyder 1987,
 * pp. 214-219, with the orbit arguments of TWsom_c() and the path arguments of TWsomps().
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

#ifdef __cplusplus
}
#endif

#endif
