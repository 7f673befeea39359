/**
 * @file skew_orthomorphic.h
 * Rectified skew orthomorphic projection of the ellipsoid.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Rectified skew orthomorphic, lon within 10, lat -6 to 14: forward 12 nm (12 nm), inverse 12 nm
 *   (12 nm), scale 5.7e-16 (3.6e-16).
 *
 * Source: Hotine, The Orthomorphic Projection of the Spheroid, Empire Survey Review 8 and 9
 * (1946-47).
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_SKEW_ORTHOMORPHIC_H
#define TIDEWATER_SKEW_ORTHOMORPHIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Constants.  A centre very close to the equator gives NaNs; it is not tested for.
 * @param e       first eccentricity
 * @param lon_c   longitude of the centre
 * @param lat_c   latitude of the centre
 * @param skew    angle of the central line where it crosses the equator of the aposphere
 * @param A       radius of the aposphere
 * @param B       constant of the aposphere
 * @param C       additive constant of the isometric latitude
 * @param lon0    longitude of that crossing
 * @param status  #TW_RANGE_ERROR for a hyperbolic argument above 700, #TW_BAD_PARAMETER for
 *                parameters that do not meet; lon0 unwritten, the others written
 */
TW_API void TWrso_c(double e, double lon_c, double lat_c, double skew, double* A, double* B,
                    double* C, double* lon0, TWstatus* status);

/**
 * Forward.  No longitude is wrapped.
 * @param lon0    constant of TWrso_c()
 * @param skew    angle from the map's north to the central line
 * @param A       constant of TWrso_c()
 * @param B       constant of TWrso_c()
 * @param C       constant of TWrso_c()
 * @param e       first eccentricity
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y
 * @param status  #TW_RANGE_ERROR for a hyperbolic argument above 700: stop
 */
TW_API void TWrso_f(double lon0, double skew, double A, double B, double C, double e, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse.  The longitude is not wrapped.
 * @param lon0    constant of TWrso_c()
 * @param skew    angle from the map's north to the central line
 * @param A       constant of TWrso_c()
 * @param B       constant of TWrso_c()
 * @param C       constant of TWrso_c()
 * @param e       first eccentricity
 * @param count   number of points
 * @param in      x, y
 * @param out     longitude, latitude
 * @param status  #TW_RANGE_ERROR for a hyperbolic argument above 700: stop
 */
TW_API void TWrso_i(double lon0, double skew, double A, double B, double C, double e, int32_t count,
                    const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale.  The projection is conformal.  At a latitude whose cosine is exactly zero the division by
 * it is left out.
 * @param e        first eccentricity
 * @param k0       central scale
 * @param unused1  not read
 * @param unused2  not read
 * @param skew     angle from the map's north to the central line
 * @param lon0     constant of TWrso_c()
 * @param A        constant of TWrso_c()
 * @param B        constant of TWrso_c()
 * @param C        constant of TWrso_c()
 * @param count    number of points
 * @param in       longitude, latitude
 * @param out      (k, k, k k)
 * @param status   #TW_RANGE_ERROR for a hyperbolic argument above 700: stop
 */
TW_API void TWrso_s(double e, double k0, double unused1, double unused2, double skew, double lon0,
                    double A, double B, double C, int32_t count, const CoordinateTriple* in,
                    CoordinateTriple* out, TWstatus* status);

/**
 * Parameters of the rectified skew orthomorphic grid of Malaya, for TWrso_c().
 * @param lon_c           longitude of the centre, radians
 * @param lat_c           latitude of the centre, radians
 * @param skew            arc sine of -0.6, radians
 * @param false_easting   metres
 * @param false_northing  metres
 * @param k0              central scale
 * @param status          always #TW_SUCCESS
 */
TW_API void TWrso_param(double* lon_c, double* lat_c, double* skew, double* false_easting,
                        double* false_northing, double* k0, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
