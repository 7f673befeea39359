/**
 * @file plane.h
 * Helpers on the plane.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Grid units, a plane: forward 1.6 nm (1.0 nm), inverse 1.1 nm (1.0 nm);
 * - Bilinear interpolation, a cell of values to 8: 8.3e-16 (4.7e-16);
 * - Newton's interpolation, three values, single precision: 1.2e-07 (1.0e-07);
 * - Distance from a chord, a line of 41 points: < 1 nm (< 1 nm).
 *
 * Source: Abramowitz and Stegun, Handbook of Mathematical Functions (1964), section 25.2, for the
 * interpolations; the others are definitions.
 */
#ifndef TIDEWATER_PLANE_H
#define TIDEWATER_PLANE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Normalised plane coordinates to grid coordinates: x s2 s1 + false origin.
 * @param s1,s2                         factors, for instance semi-major axis and central scale
 * @param false_easting,false_northing  added after scaling
 * @param count                         number of points
 * @param in                            x, y; height not read
 * @param out                           easting, northing; height unwritten; may be in
 * @param status                        always #TW_SUCCESS
 */
TW_API void TWab_to_en(double s1, double s2, double false_easting, double false_northing,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Grid coordinates to normalised plane coordinates, the inverse of TWab_to_en().
 * @param s1,s2                         factors
 * @param false_easting,false_northing  taken off before scaling
 * @param count                         number of points
 * @param in                            easting, northing; height not read
 * @param out                           x, y; height unwritten; may be in
 * @param status                        always #TW_SUCCESS
 */
TW_API void TWen_to_ab(double s1, double s2, double false_easting, double false_northing,
                       int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                       TWstatus* status);

/**
 * Largest distance of the odd points of a polyline from the chords of their two neighbours.
 * @param points    x, y of each point, counted from 0: even points end the chords
 * @param count     number of points; below 3 the distance is 0
 * @param distance  in the unit of the points; a chord of no length is not caught
 * @param status    always #TW_SUCCESS
 */
TW_API void TWpt_line_dist(const CoordinateTriple* points, int32_t count, double* distance,
                           TWstatus* status);

/**
 * Bilinear interpolation in a cell.
 * @param p00,p01,p10,p11  values at (fx, fy) = (0, 0), (0, 1), (1, 0), (1, 1)
 * @param fx,fy            position in the cell
 * @param result           the value
 * @param status           always #TW_SUCCESS
 */
TW_API void TWbilinear_interpolation(double p00, double p01, double p10, double p11, double fx,
                                     double fy, double* result, TWstatus* status);

/**
 * Newton's forward interpolation of the second order on three equally spaced values, with
 * differences in single precision.
 * @param t         position: 0 at f0, 1 at f1, 2 at f2
 * @param f0,f1,f2  values
 * @param result    the value
 * @param status    always #TW_SUCCESS
 */
TW_API void TWqterp2(const float* t, const float* f0, const float* f1, const float* f2,
                     float* result, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
