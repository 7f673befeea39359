/**
 * @file geocentric.h
 * Geodetic and geocentric coordinates.
 *
 * The ellipsoid is a, the semi-major axis, whose unit is that of every length, and e, the first
 * eccentricity (not its square).  No function here tests a latitude or a longitude.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Geocentric coordinates, near the ground, all latitudes: forward 2.9 nm (1.6 nm), inverse
 *   1.5 um (1.5 um);
 * - Geocentric coordinates, 100 to 40,000 km up, all latitudes: forward 11 nm (5.5 nm), inverse
 *   701 nm (26 nm).
 *
 * Source: Heiskanen and Moritz, Physical Geodesy (1967); Bowring, The Accuracy of Geodetic Latitude
 * and Height Equations, Survey Review 28 (1985), pp. 202-206.
 */
#ifndef TIDEWATER_GEOCENTRIC_H
#define TIDEWATER_GEOCENTRIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Geodetic to geocentric coordinates (Heiskanen and Moritz, Physical Geodesy, 1967, eq. 5-3).
 * @param a,e     ellipsoid
 * @param count   number of points
 * @param in      longitude, latitude (radians), height (in the unit of a)
 * @param out     X, Y, Z; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWllh_to_xyz(double a, double e, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

/**
 * Geocentric to geodetic coordinates in closed form (Bowring 1985, Survey Review 28, 202-206).
 * Within 1e-9 of the axis the longitude is 0 and the latitude a pole, the north pole for Z = 0.
 * @param a,e     ellipsoid
 * @param count   number of points
 * @param in      X, Y, Z
 * @param out     longitude, latitude (radians), height; may be in
 * @param status  always #TW_SUCCESS
 */
TW_API void TWxyz_to_llh(double a, double e, int32_t count, const CoordinateTriple* in,
                         CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
