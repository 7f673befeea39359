/**
 * @file geodesic.h
 * Geodesic lines on the ellipsoid.
 *
 * The ellipsoid is a, the semi-major axis, whose unit is that of every length, and e, the first
 * eccentricity (not its square).  Points are longitude, latitude (radians) and height; heights are
 * carried along and play no part in a line.  Azimuths are radians clockwise from north; a back
 * azimuth is the azimuth at the end point back to the start point.
 *
 * Take the geodesic for the shortest way and the rhumb line for a constant course.  No argument is
 * checked for its range; the status is that of the last inner call made.
 *
 * A line is described by its vertex, the point of highest reduced latitude on it, and integrated
 * outward from there by a five-term binomial expansion.  A line whose vertex lies next to a pole or
 * to the equator loses digits.
 *
 * TWgeodesic_cnt() and TWgeodesic_buf() lay points along a line: in mode 0 it is given by its two
 * ends, and distance and azimuth are not read; in any other mode it is given by start, distance and
 * azimuth, and end is not read.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Geodesics, to 1,000 km, lat -80 to 80, all azimuths: forward 167 nm (9.1 nm), inverse 307 nm
 *   (85 nm);
 * - Geodesics, to 10,000 km, lat -80 to 80, all azimuths: forward 273 nm (27 nm), inverse 6.4 km
 *   (187 nm);
 * - Geodesics, to 19,000 km, lat -80 to 80, all azimuths: forward 329 nm (27 nm), inverse 1.3 um
 *   (280 nm);
 * - Geodesics near due east and west, 50 to 500 km, 1e-6 to 1 degree from due east or west at the
 *   start: forward 36 mm (4.4 mm), inverse 459 m (89 m);
 * - Geodesics near due east and west, 500 to 15,000 km, 1e-6 to 1 degree from due east or west at
 *   the start: forward 212 mm (14 mm), inverse 9231 km (1.8 km);
 * - Geodesics past a pole, 1e-6 to 1 degree from the pole, to 19,000 km: forward 36 mm (5.4 mm),
 *   inverse 492 nm (125 nm);
 * - Geodesics along the equator, 1e-6 to 1 degree from due east on it, to 19,000 km: forward 62 nm
 *   (34 nm), inverse 9692 km (5.0 mm);
 * - Arc from the vertex, vertices of 6 to 82 degrees: 3.3 nm (2.5 nm);
 * - Points along a geodesic, a line of 9,900 km, 101 points: 92 nm (87 nm).
 *
 * Source: Bessel, Ueber die Berechnung der geographischen Laengen und Breiten aus geodaetischen
 * Vermessungen, Astronomische Nachrichten 4 (1825), pp. 241-254.
 */
#ifndef TIDEWATER_GEODESIC_H
#define TIDEWATER_GEODESIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Integrates a geodesic from its vertex.
 * @param x       sine of the reduced latitude of a point on the line; negative beyond the equator
 * @param k       sine of the reduced latitude of the vertex, above 0
 * @param flag    0: a point on or beyond the vertex (|x| >= |k|) gives zeros; else a point with x
 *                >= k is pulled back to the vertex
 * @param b       semi-minor axis
 * @param e2,ep2  squares of the first and the second eccentricity
 * @param arc     length of the line from the vertex to the point, in the unit of b
 * @param lon     longitude difference between them, radians
 * @param status  always #TW_SUCCESS
 */
TW_API void geodesic_int(double x, double k, int16_t flag, double b, double e2, double ep2,
                         double* arc, double* lon, TWstatus* status);

/**
 * The end of a line from its start, azimuth and length, by Newton's method on the sine of the
 * reduced latitude: at most 11 passes, which is not reported if they run out.
 *
 * A length of exactly 0 gives the start and a back azimuth of pi.  Along a meridian the longitude
 * stays, also beyond a pole, and the back azimuth is pi northward and southward.  Below an
 * eccentricity of 1e-12 the line is solved on the sphere: its longitude is not wrapped, and its
 * back azimuth is in the range of atan2.  Elsewhere the longitude is brought into [-pi, pi] with a
 * margin of 1e-10, and the back azimuth into 0 to 2 pi.
 * @param start         start point
 * @param azimuth       azimuth at the start, radians, any number of turns
 * @param distance      length; a negative one goes the other way
 * @param a,e           ellipsoid
 * @param end           longitude, latitude, the start's height
 * @param back_azimuth  azimuth at the end towards the start, radians
 * @param status        #TW_SUCCESS; along a meridian the status of TWmerid_dist_i(), whose failure
 *                      leaves the latitude of end unwritten
 */
TW_API void TWgeodesic_dir(CoordinateTriple start, double azimuth, double distance, double a,
                           double e, CoordinateTriple* end, double* back_azimuth, TWstatus* status);

/**
 * Length and azimuths of the line between two points, by Newton's method on the reduced latitude of
 * the vertex.
 *
 * NEARLY ANTIPODAL POINTS ARE NOT SOLVED: where the iteration fails, the length is that along the
 * parallel for points on one parallel, and otherwise a times the sine of the spherical arc, which
 * is far too short.  Whether the vertex lies ahead of a point is decided on the sphere, which is
 * wrong for many lines that leave a point within half a degree of due east or west, SHORT ONES TOO;
 * such a line comes out short or long, or its iteration fails.  Where that matters, take
 * tidewater/lines.hpp.  The iteration ends on a change of 0.0001 in the unit of a: GIVE THE
 * ELLIPSOID IN METRES; on one of unit axis most lines end in that failure.  The status is
 * #TW_SUCCESS all the same.
 *
 * Points that are antipodal on a meridian circle to 1e-14 radians are joined over the north pole.
 * A point within 1e-14 of a pole is reached along the meridian of the other, with azimuths of 0 and
 * pi.
 * @param start,end     the points; their heights are not read
 * @param a,e           ellipsoid; a sphere for e below 1e-12
 * @param azimuth       azimuth at start towards end, radians, 0 to 2 pi
 * @param back_azimuth  azimuth at end towards start, radians, 0 to 2 pi
 * @param distance      length of the line
 * @param status        #TW_SUCCESS; along a meridian the status of TWmerid_dist_f(), which for a
 *                      bad start leaves all three results unwritten, but for a turn added to
 *                      azimuths that are negative
 */
TW_API void TWgeodesic_inv(CoordinateTriple start, CoordinateTriple end, double a, double e,
                           double* azimuth, double* back_azimuth, double* distance,
                           TWstatus* status);

/**
 * How many points a spacing needs: one more than the whole spacings in the line, and one more for a
 * remainder.
 *
 * By contract, where the spacing or the distance is NaN neither comparison of the two holds: count
 * stays UNWRITTEN and the status is #TW_SUCCESS.  Set count before the call.  A number of points
 * beyond 32 bits is clamped to the largest integer, 2147483647, with #TW_SUCCESS, as for a spacing
 * of zero.
 * @param mode              0: by two ends; else by azimuth and distance
 * @param start,end         the ends
 * @param distance,azimuth  length, and azimuth at the start in radians
 * @param a,e               ellipsoid
 * @param spacing           distance between points; zero is not caught, and a negative one gives a
 *                          count below zero
 * @param count             number of points, both ends included
 * @param status            #TW_W_NO_POINTS for a spacing above the distance, with a count of 0
 */
TW_API void TWgeodesic_cnt(int16_t mode, CoordinateTriple start, CoordinateTriple end,
                           double distance, double azimuth, double a, double e, double spacing,
                           int32_t* count, TWstatus* status);

/**
 * The points themselves, each computed from the start.  In mode 0 the last one is end, height
 * included, whether the spacing fits or not; the others have the start's height.
 * @param mode              0: by two ends; else by azimuth and distance
 * @param start,end         the ends
 * @param distance,azimuth  length, and azimuth at the start in radians
 * @param spacing           distance between points; 0 divides the line evenly.  It stands BEFORE
 *                          the ellipsoid here
 * @param a,e               ellipsoid
 * @param count             number of points, at least 2
 * @param points            count points
 * @param status            #TW_BUFFER_TOO_SMALL for a count below 2, with nothing written; else the
 *                          status of the last TWgeodesic_dir()
 */
TW_API void TWgeodesic_buf(int16_t mode, CoordinateTriple start, CoordinateTriple end,
                           double distance, double azimuth, double spacing, double a, double e,
                           int32_t count, CoordinateTriple* points, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
