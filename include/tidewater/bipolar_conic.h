/**
 * @file bipolar_conic.h
 * Bipolar oblique conic conformal projection of the sphere.
 *
 * Two oblique conics with poles A and B, joined along the great circle through the poles.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Bipolar oblique conic, sphere, 110 to 50 W, 40 S to 60 N: forward 12 nm (3.7 nm), inverse
 *   484 um (2.6 um), 1 refused;
 * - Bipolar oblique conic, scale, sphere, 108 to 55 W, 35 S to 60 N: scale 9.1e-02 (9.6e-04).
 *
 * Source: Snyder, Map Projections: A Working Manual, USGS Professional Paper 1395 (1987),
 * pp. 116-123.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_BIPOLAR_CONIC_H
#define TIDEWATER_BIPOLAR_CONIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * The parameters of the one case in use, the map of the Americas.
 * @param lon_a,lat_a                   pole A: 110 W, 20 S
 * @param lat_b                         latitude of pole B: 45 N
 * @param ab                            arc from A to B: 104 degrees
 * @param z1,z2                         polar distances of the standard parallels: 31, 73 degrees
 * @param false_easting,false_northing  0
 * @param lon_c,lat_c                   centre of the projection, radians
 * @param status                        always #TW_SUCCESS
 */
TW_API void TWbipocc_param(double* lon_a, double* lat_a, double* lat_b, double* ab, double* z1,
                           double* z2, double* false_easting, double* false_northing, double* lon_c,
                           double* lat_c, TWstatus* status);

/**
 * Constants (Snyder 1987, eq. 17-1 to 17-11).  Nothing is tested.
 * @param lon_a,lat_a  pole A, radians
 * @param lat_b        latitude of pole B
 * @param ab           arc from A to B
 * @param z1,z2        polar distances of the standard parallels
 * @param lon_b        longitude of pole B
 * @param n            cone constant
 * @param k            central scale that balances the error, for the caller to apply; its arcs of
 *                     26 and 52 degrees are fixed degrees
 * @param f            size of the cone
 * @param az_ab,az_ba  azimuth from A to B, and from B to A westward
 * @param t            sum of the half-arc powers of the standard parallels
 * @param rho_c,z_c    radius and polar distance of the centre
 * @param az_c         turn of the plane at the centre
 * @param status       always #TW_SUCCESS
 */
TW_API void TWbipocc_c(double lon_a, double lat_a, double lat_b, double ab, double z1, double z2,
                       double* lon_b, double* n, double* k, double* f, double* az_ab, double* az_ba,
                       double* t, double* rho_c, double* z_c, double* az_c, TWstatus* status);

/**
 * Forward (Snyder 1987, eq. 17-12 to 17-22).  The OUTPUT array stands before the input array.
 * @param lon_a,lat_a  pole A
 * @param lon_b,lat_b  pole B
 * @param az_ab,az_ba  constants of TWbipocc_c()
 * @param az_c,n       constants of TWbipocc_c()
 * @param unused1      not read
 * @param unused2      not read
 * @param t,rho_c      constants of TWbipocc_c()
 * @param ab           arc from A to B
 * @param f            constant of TWbipocc_c()
 * @param count        number of points
 * @param out          x, y
 * @param in           longitude, latitude
 * @param status       #TW_NOT_CONVERGED for a point about 106 degrees or more from its pole: stop
 */
TW_API void TWbipocc_f(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab,
                       double az_ba, double az_c, double n, double unused1, double unused2,
                       double t, double rho_c, double ab, double f, int32_t count,
                       CoordinateTriple* out, const CoordinateTriple* in, TWstatus* status);

/**
 * Inverse, by iteration to 1e-10, at most 30 passes, which is not reported if they run out (Snyder
 * 1987, eq. 17-23 to 17-36).
 * @param lon_a,lat_a     pole A
 * @param lon_b,lat_b     pole B
 * @param az_ab,az_ba     constants of TWbipocc_c()
 * @param az_c,n,t,rho_c  constants of TWbipocc_c()
 * @param ab              arc from A to B
 * @param f               constant of TWbipocc_c()
 * @param lon_c           longitude that is written for a point within a second of arc of a pole
 * @param count           number of points
 * @param in              x, y
 * @param out             longitude, latitude
 * @param status          #TW_NOT_CONVERGED for a point beyond the map: stop
 */
TW_API void TWbipocc_i(double lon_a, double lat_a, double lon_b, double lat_b, double az_ab,
                       double az_ba, double az_c, double n, double t, double rho_c, double ab,
                       double f, double lon_c, int32_t count, const CoordinateTriple* in,
                       CoordinateTriple* out, TWstatus* status);

/**
 * Scale.
 * @param unused1      not read
 * @param unused2      not read
 * @param k0           central scale
 * @param lon_a,lat_a  pole A
 * @param lon_b,lat_b  pole B
 * @param n,f,az_ba    constants of TWbipocc_c()
 * @param count        number of points
 * @param in           longitude, latitude
 * @param out          (k, k, k k)
 * @param status       #TW_I_LATITUDE_LIMITED beyond the reach of TWbipocc_f(): fill
 */
TW_API void TWbipocc_s(double unused1, double unused2, double k0, double lon_a, double lat_a,
                       double lon_b, double lat_b, double n, double f, double az_ba, int32_t count,
                       const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
