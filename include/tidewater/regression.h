/**
 * @file regression.h
 * Datum shift by multiple regression.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Multiple regression, 40 degrees of longitude: 1.6 nm (1.3 nm).
 *
 * Source: Defense Mapping Agency Technical Report 8350.2, Department of Defense World Geodetic
 * System 1984 (1991), appendix D.
 */
#ifndef TIDEWATER_REGRESSION_H
#define TIDEWATER_REGRESSION_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** One term of a multiple-regression sum: coefficient U^power_u V^power_v. */
typedef struct MreTerm {
  double coefficient; /**< Arc-seconds, or metres in a height sum. */
  int16_t power_u;    /**< Power of U, the scaled latitude: 0 to 9. */
  int16_t power_v;    /**< Power of V, the scaled longitude: 0 to 9. */
  int32_t reserved;   /**< Not read. */
} MreTerm;

/**
 * Datum shift by three sums of terms c U^p V^q, with U = k (latitude + lat_offset) and V = k
 * (longitude + lon_offset), both in degrees.  There is no iteration: the way back takes the same
 * sums at the given point off, and does not return exactly.
 * @param count                             number of points
 * @param direction                         0: the sums are taken off; else they are added
 * @param lon_range                         1: the longitude is brought up to 0 or more before V is
 *                                          formed; else into [-180, 180]
 * @param lon_count,lat_count,height_count  numbers of terms
 * @param k                                 normalising scale, per degree
 * @param lon_offset,lat_offset             normalising offsets, degrees
 * @param lon_terms,lat_terms,height_terms  the terms: arc-seconds, arc-seconds, metres
 * @param in                                longitude, latitude (radians), height (metres)
 * @param out                               shifted; may be in
 * @param status                            always #TW_SUCCESS
 */
TW_API void TWmre(int32_t count, int16_t direction, int16_t lon_range, int32_t lon_count,
                  int32_t lat_count, int32_t height_count, double k, double lon_offset,
                  double lat_offset, const MreTerm* lon_terms, const MreTerm* lat_terms,
                  const MreTerm* height_terms, const CoordinateTriple* in, CoordinateTriple* out,
                  TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
