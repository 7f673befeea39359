/**
 * @file rhumb.h
 * Rhumb lines on the ellipsoid.
 *
 * The ellipsoid is a, the semi-major axis, whose unit is that of every length, and e, the first
 * eccentricity (not its square).  Points are longitude, latitude (radians) and height; heights are
 * carried along and play no part in a line.  Azimuths are radians clockwise from north; a back
 * azimuth is the azimuth at the end point back to the start point.
 *
 * Take the geodesic for the shortest way and the rhumb line for a constant course.  No argument is
 * checked for its range; the status is that of the last inner call made.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Rhumb lines, lat -60 to 60, to 2,000 km: forward 152 nm (123 nm), inverse 150 nm (121 nm);
 * - Points along a rhumb line, a line of 3,000 km, 31 points: 162 nm (150 nm).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 46-47.
 */
#ifndef TIDEWATER_RHUMB_H
#define TIDEWATER_RHUMB_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * The end of a line from its start, azimuth and length.
 *
 * Exactly along a parallel (azimuth pi/2, or 4.71238898038469) a positive distance goes EAST for
 * either azimuth.  The longitude is not wrapped.
 * @param start         start point
 * @param azimuth       azimuth, radians
 * @param distance      length; a negative one goes the other way
 * @param a,e           ellipsoid
 * @param end           longitude, latitude, the start's height
 * @param back_azimuth  azimuth + pi, less a turn above 2 pi
 * @param status        the status of the last inner call, TWmerc_c() of the start's latitude: a
 *                      line past a pole is not reported, and the latitude of end is then unwritten
 */
TW_API void TWrhmbline_dir(CoordinateTriple start, double azimuth, double distance, double a,
                           double e, CoordinateTriple* end, double* back_azimuth, TWstatus* status);

/**
 * Length and azimuths of the line between two points.  The longitude difference is taken as it
 * stands: a line across the 180th meridian goes the long way.
 * @param start,end     the points; their heights are not read
 * @param a,e           ellipsoid
 * @param azimuth       azimuth at start towards end, radians, 0 to 2 pi; 3 pi/2 for identical
 *                      points
 * @param back_azimuth  azimuth at end towards start
 * @param distance      length of the line
 * @param status        the status of the last inner call, TWmerid_dist_f() of the start's latitude;
 *                      #TW_SUCCESS along a parallel
 */
TW_API void TWrhmbline_inv(CoordinateTriple start, CoordinateTriple end, double a, double e,
                           double* azimuth, double* back_azimuth, double* distance,
                           TWstatus* status);

/**
 * As TWgeodesic_cnt(), for a rhumb line.
 *
 * By contract, where the spacing or the distance is NaN neither comparison of the two holds: count
 * stays UNWRITTEN and the status is #TW_SUCCESS.  Set count before the call.  A number of points
 * beyond 32 bits is clamped to the largest integer, 2147483647, with #TW_SUCCESS, as for a spacing
 * of zero.
 * @param mode              0: by two ends; else by azimuth and distance
 * @param start,end         the ends
 * @param distance,azimuth  length, and azimuth in radians
 * @param a,e               ellipsoid
 * @param spacing           distance between points; zero is not caught
 * @param count             number of points, both ends included
 * @param status            #TW_W_NO_POINTS for a spacing above the distance, with a count of 0
 */
TW_API void TWrhmbline_cnt(int16_t mode, CoordinateTriple start, CoordinateTriple end,
                           double distance, double azimuth, double a, double e, double spacing,
                           int32_t* count, TWstatus* status);

/**
 * As TWgeodesic_buf(), for a rhumb line.  Along a parallel from east to west in mode 0 the points
 * lie EAST of the start, as TWrhmbline_dir() goes, and only the last one is on the line.
 * @param mode              0: by two ends; else by azimuth and distance
 * @param start,end         the ends
 * @param distance,azimuth  length, and azimuth in radians
 * @param spacing           distance between points; 0 divides the line evenly
 * @param a,e               ellipsoid
 * @param count             number of points, at least 2
 * @param points            count points
 * @param status            #TW_BUFFER_TOO_SMALL for a count below 2, with nothing written; else the
 *                          status of the last TWrhmbline_dir()
 */
TW_API void TWrhmbline_buf(int16_t mode, CoordinateTriple start, CoordinateTriple end,
                           double distance, double azimuth, double spacing, double a, double e,
                           int32_t count, CoordinateTriple* points, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
