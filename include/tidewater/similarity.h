/**
 * @file similarity.h
 * Similarity transformations: seven and ten parameters, and plain shifts.
 *
 * Coordinates are geocentric X, Y, Z in any one unit. rotation is nine doubles row by row and is
 * not checked: the inverses use its transpose, so that a matrix that is not orthogonal does not
 * come back. s is the scale difference: the factor is 1 + s.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Similarity, seven parameters, the earth: forward 1.6 nm (1.2 nm), inverse 14 mm (11 mm);
 * - Molodensky-Badekas, the earth: forward 2.7 nm (1.8 nm), inverse 17 mm (14 mm);
 * - Three shifts, the earth: forward < 1 nm (< 1 nm), inverse < 1 nm (< 1 nm).
 *
 * Source: IOGP Publication 373-7-2 (Guidance Note 7-2), coordinate frame rotation and
 * Molodensky-Badekas.
 */
#ifndef TIDEWATER_SIMILARITY_H
#define TIDEWATER_SIMILARITY_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Seven-parameter similarity: out = R (1 + s) in + t.
 * @param count     number of points
 * @param in        X, Y, Z
 * @param s         scale difference, parts of one
 * @param rotation  nine doubles
 * @param tx,ty,tz  translation
 * @param out       X, Y, Z; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWbw_f(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                   double tx, double ty, double tz, CoordinateTriple* out, TWstatus* status);

/**
 * The way back, with the parameters of TWbw_f().
 * @param count     number of points
 * @param in        X, Y, Z
 * @param s         scale difference
 * @param rotation  nine doubles; the transpose is applied
 * @param tx,ty,tz  translation
 * @param out       X, Y, Z; may be in
 * @param status    #TW_SINGULAR for s of -1, with every point written but not divided by the factor
 */
TW_API void TWbw_i(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                   double tx, double ty, double tz, CoordinateTriple* out, TWstatus* status);

/**
 * Ten-parameter similarity about a centre: out = R (1 + s) (in - p) + q.
 * @param count     number of points
 * @param in        X, Y, Z
 * @param s         scale difference, parts of one
 * @param rotation  nine doubles
 * @param px,py,pz  centre in the source datum
 * @param qx,qy,qz  centre in the target datum: p + t
 * @param out       X, Y, Z; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWmol_bdk_f(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                        double px, double py, double pz, double qx, double qy, double qz,
                        CoordinateTriple* out, TWstatus* status);

/**
 * The way back, with the parameters of TWmol_bdk_f().
 * @param count     number of points
 * @param in        X, Y, Z
 * @param s         scale difference; -1 is divided by
 * @param rotation  nine doubles; the transpose is applied
 * @param px,py,pz  centre in the source datum
 * @param qx,qy,qz  centre in the target datum
 * @param out       X, Y, Z; may be in
 * @param status    #TW_FAILURE for s of exactly 0, although every point is written and right
 */
TW_API void TWmol_bdk_i(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                        double px, double py, double pz, double qx, double qy, double qz,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Adds three constants.
 * @param count     number of points
 * @param in        any coordinates
 * @param dx,dy,dz  shifts of the three elements
 * @param out       in plus the shifts; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWshifts_f(int32_t count, const CoordinateTriple* in, double dx, double dy, double dz,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Takes three constants off.
 * @param count     number of points
 * @param in        any coordinates
 * @param dx,dy,dz  shifts of the three elements
 * @param out       in less the shifts; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWshifts_i(int32_t count, const CoordinateTriple* in, double dx, double dy, double dz,
                       CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
