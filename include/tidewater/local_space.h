/**
 * @file local_space.h
 * Local frames on a point.
 *
 * The ellipsoid is a, the semi-major axis, whose unit is that of every length, and e, the first
 * eccentricity (not its square).
 *
 * The local frame's origin and the coordinates of TWlsr_f() and TWlsr_i() are in units of a;
 * TWllh_to_lsr() and TWlsr_to_llh() use a times their scale.  A matrix is nine doubles row by row:
 * the local x, y and z axis in geocentric components, z the outward normal at the origin.  No
 * function here tests a latitude or a longitude.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - East, north, up, within 1,500 km: forward 3.0 nm (2.1 nm), inverse 1.5 um (1.5 um);
 * - Local space rectangular, within 1,500 km: forward 3.0 nm (2.1 nm), inverse 1.5 um (1.5 um).
 *
 * Source: IOGP Publication 373-7-2 (Guidance Note 7-2), geocentric to topocentric, methods 9836 and
 * 9837.
 */
#ifndef TIDEWATER_LOCAL_SPACE_H
#define TIDEWATER_LOCAL_SPACE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Sets up a local frame on a point (the topocentric frame of IOGP Guidance Note 7-2, method 9837,
 * turned about its z axis).
 *
 * In mode 1 the x axis points along azimuth, clockwise from north, and y lies 90 degrees to its
 * left.  In any other mode the axes follow the line from a first to a second point; rows 0 and 1
 * are then shorter than one where that line is not horizontal at the origin.
 * @param mode          1: by azimuth; else by two points
 * @param a,e           ellipsoid
 * @param lon0,lat0,h0  the origin
 * @param azimuth       read in mode 1, written otherwise
 * @param x0,y0,z0      geocentric origin, in units of a
 * @param lon1,lat1,h1  first point; not read in mode 1
 * @param lon2,lat2,h2  second point; not read in mode 1
 * @param matrix        nine doubles
 * @param status        #TW_BAD_PARAMETER when the two points are one (origin and row 2 are written)
 *                      or the azimuth cannot be told (the matrix is written)
 */
TW_API void TWlsr_c(int16_t mode, double a, double e, double lon0, double lat0, double h0,
                    double* azimuth, double* x0, double* y0, double* z0, double lon1, double lat1,
                    double h1, double lon2, double lat2, double h2, double* matrix,
                    TWstatus* status);

/**
 * Geodetic to local coordinates.
 * @param a,e       ellipsoid
 * @param x0,y0,z0  origin of TWlsr_c(), in units of a
 * @param matrix    nine doubles of TWlsr_c()
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param out       local x, y, z in units of a; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWlsr_f(double a, double e, double x0, double y0, double z0, const double* matrix,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status);

/**
 * Local to geodetic coordinates, with the transposed matrix: exact for rows of unit length.
 * @param a,e       ellipsoid
 * @param x0,y0,z0  origin of TWlsr_c(), in units of a
 * @param matrix    nine doubles of TWlsr_c()
 * @param count     number of points
 * @param in        local x, y, z in units of a
 * @param out       longitude, latitude, height; may be in
 * @param status    always #TW_SUCCESS
 */
TW_API void TWlsr_i(double a, double e, double x0, double y0, double z0, const double* matrix,
                    int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                    TWstatus* status);

/**
 * Geodetic to east, north, up on a point (IOGP Guidance Note 7-2, method 9837).
 * @param a,e           ellipsoid
 * @param scale         user units in one unit of a
 * @param lon0,lat0,h0  the origin
 * @param count         number of points
 * @param in            longitude, latitude, height
 * @param out           east, north, up in user units; may be in
 * @param status        always #TW_SUCCESS
 */
TW_API void TWllh_to_lsr(double a, double e, double scale, double lon0, double lat0, double h0,
                         int32_t count, const CoordinateTriple* in, CoordinateTriple* out,
                         TWstatus* status);

/**
 * East, north, up on a point to geodetic, the inverse of TWllh_to_lsr() (IOGP Guidance Note 7-2,
 * method 9837).
 * @param a,e           ellipsoid
 * @param scale         user units in one unit of a; zero is not caught
 * @param lon0,lat0,h0  the origin
 * @param count         number of points
 * @param in            east, north, up; CHANGED by the call: divided by a times scale
 * @param out           longitude, latitude, height; may be in
 * @param status        always #TW_SUCCESS
 */
TW_API void TWlsr_to_llh(double a, double e, double scale, double lon0, double lat0, double h0,
                         int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                         TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
