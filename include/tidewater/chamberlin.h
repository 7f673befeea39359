/**
 * @file chamberlin.h
 * Chamberlin trimetric projection of the ellipsoid.
 *
 * A point lies at the mean of the three intersections of the circles that its geodesic distances
 * draw round the corners of a triangle.  Geodesics are solved as by TWgeodesic_inv(), on an axis of
 * the library's own; plane coordinates are in units of the semi-major axis as elsewhere.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Chamberlin trimetric, a triangle of 40 by 30 degrees: 786 nm (209 nm).
 *
 * Source: Christensen, The Chamberlin Trimetric Projection, Cartography and Geographic Information
 * Systems 19 (1992), pp. 88-100.
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_CHAMBERLIN_H
#define TIDEWATER_CHAMBERLIN_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Places the triangle on the plane.
 *
 * forward is called in mode 0 alone, one point at a time, while plane already holds the triangle:
 * it must map by TWchamtri_f() with this call's e, control, sides, azimuths and plane.
 * @param forward      the map; may be null in mode 1
 * @param context      handed through to forward
 * @param mode         0: the origin is the triangle's centroid, north there is up; 1: the origin is
 *                     (lon_c, lat_c), where north lies at rotation
 * @param e            first eccentricity
 * @param control      three corners: longitude, latitude
 * @param sides        three lengths: 0 to 1, 1 to 2, 2 to 0
 * @param azimuths     azimuth of each side at its first corner
 * @param plane        three corners on the plane: x, y; z is not touched
 * @param lon_c,lat_c  place of the origin: written in mode 0, read in mode 1
 * @param rotation     angle from the x axis to north, radians: written (pi/2) in mode 0, read in
 *                     mode 1
 * @param status       #TW_BAD_INPUT for another mode, with sides and azimuths written; a failing
 *                     TWgeneric_i() or TWchamtri_f() ends the call with its status
 */
TW_API void TWchamtri_c(TWtransform forward, TWcontext context, int16_t mode, double e,
                        const CoordinateTriple* control, double* sides, double* azimuths,
                        CoordinateTriple* plane, double* lon_c, double* lat_c, double* rotation,
                        TWstatus* status);

/**
 * Forward.  There is no inverse of its own: TWgeneric_i() serves.
 * @param e         first eccentricity
 * @param control   the three corners
 * @param sides     of TWchamtri_c()
 * @param azimuths  of TWchamtri_c()
 * @param plane     of TWchamtri_c()
 * @param count     number of points
 * @param in        longitude, latitude, height
 * @param out       x, y, and the HEIGHT, which is copied
 * @param status    the status of the last TWgeodesic_inv()
 */
TW_API void TWchamtri_f(double e, const CoordinateTriple* control, const double* sides,
                        const double* azimuths, const CoordinateTriple* plane, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
