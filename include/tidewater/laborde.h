/**
 * @file laborde.h
 * Laborde projection of the ellipsoid, and the grid of Madagascar.
 *
 * Three stages: the Gauss conformal sphere, its transverse Mercator, and a complex cubic.  The
 * plane is in units of the sphere's radius R.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Laborde, Madagascar, lon within 4, lat -27 to -11: forward 375 nm (231 nm), inverse 2.5 nm
 *   (1.4 nm);
 * - Laborde, scale, lon within 3, lat -26 to -12: scale 2.1e-03 (1.6e-03);
 * - Laborde's cubic, a plane of Madagascar: forward < 1 nm (< 1 nm), inverse < 1 nm (< 1 nm).
 *
 * Source: Laborde, La nouvelle projection du Service Geographique de Madagascar (1928).
 *
 * What all projections have in common (units, scale, and what skip, stop and fill mean) is told in
 * frame.h.
 */
#ifndef TIDEWATER_LABORDE_H
#define TIDEWATER_LABORDE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Parameters of the Laborde grid of Madagascar.
 * @param lon_c           longitude of the centre from Greenwich, radians
 * @param lat_c           latitude of the centre, radians
 * @param azimuth         azimuth of the central line, radians
 * @param false_easting   metres
 * @param false_northing  metres
 * @param k0              central scale
 * @param status          always #TW_SUCCESS
 */
TW_API void TWlab_param(double* lon_c, double* lat_c, double* azimuth, double* false_easting,
                        double* false_northing, double* k0, TWstatus* status);

/**
 * Constants of the cubic.
 * @param azimuth  azimuth of the central line, radians
 * @param A        (1 - cos(2 azimuth)) / 12
 * @param B        sin(2 azimuth) / 12
 * @param C        3 (A^2 - B^2)
 * @param D        6 A B
 * @param status   always #TW_SUCCESS
 */
TW_API void TWlabor_c(double azimuth, double* A, double* B, double* C, double* D, TWstatus* status);

/**
 * Forward cubic: transverse Mercator plane to Laborde plane.
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     x, y
 * @param status  always #TW_SUCCESS
 */
TW_API void TWlabor_f(double A, double B, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Inverse cubic: by a series of order five, whose last coefficient in y departs from the exact one,
 * and from it, if wanted, by iteration to 1e-14.
 * @param mode    1: iterate; any other value: the series alone
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param C       constant of TWlabor_c()
 * @param D       constant of TWlabor_c()
 * @param count   number of points
 * @param in      x, y
 * @param out     x, y
 * @param status  #TW_NOT_CONVERGED if the iteration reaches 30 passes: the point is written, the
 *                loop goes on
 */
TW_API void TWlabor_i(int16_t mode, double A, double B, double C, double D, int32_t count,
                      const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Scale of the cubic, the last stage of a chain.  The constant of the cubic is taken as B + i A,
 * while TWlabor_f() has A + i B: the scale is that of the projection where A and B are equal, or
 * given in exchanged order.
 * @param k0      factor of the scale
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param count   number of points
 * @param in      x, y in the transverse Mercator plane
 * @param out     in: z, the scale of the stages before; out: (k, k, k k)
 * @param status  always #TW_SUCCESS
 */
TW_API void TWlabor_s(double k0, double A, double B, int32_t count, const CoordinateTriple* in,
                      CoordinateTriple* out, TWstatus* status);

/**
 * Constants of all stages.
 * @param e        first eccentricity
 * @param lon0     central meridian; not read
 * @param lat0     latitude of the centre
 * @param azimuth  azimuth of the central line, radians
 * @param chi0     latitude of the centre on the sphere
 * @param c        constant of TWgaussII_c()
 * @param t        constant of TWgaussII_c()
 * @param R        radius of the sphere
 * @param A0       constant of TWt_merc_c() on the sphere
 * @param A2       constant of TWt_merc_c() on the sphere
 * @param A4       constant of TWt_merc_c() on the sphere
 * @param A6       constant of TWt_merc_c() on the sphere
 * @param A8       constant of TWt_merc_c() on the sphere
 * @param M0       constant of TWt_merc_c() on the sphere
 * @param B2       constant of TWt_merc_c() on the sphere
 * @param B4       constant of TWt_merc_c() on the sphere
 * @param B6       constant of TWt_merc_c() on the sphere
 * @param A        constant of TWlabor_c()
 * @param B        constant of TWlabor_c()
 * @param C        constant of TWlabor_c()
 * @param D        constant of TWlabor_c()
 * @param status   the status of TWgaussII_c() or TWt_merc_c(); later stages unwritten on failure
 */
TW_API void TWlaborde_c(double e, double lon0, double lat0, double azimuth, double* chi0, double* c,
                        double* t, double* R, double* A0, double* A2, double* A4, double* A6,
                        double* A8, double* M0, double* B2, double* B4, double* B6, double* A,
                        double* B, double* C, double* D, TWstatus* status);

/**
 * Forward: TWgaussII_f(), TWt_merc_f(), TWlabor_f().
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c       constant of TWgaussII_c()
 * @param t       constant of TWgaussII_c()
 * @param A0      constant of TWt_merc_c() on the sphere
 * @param A2      constant of TWt_merc_c() on the sphere
 * @param A4      constant of TWt_merc_c() on the sphere
 * @param A6      constant of TWt_merc_c() on the sphere
 * @param A8      constant of TWt_merc_c() on the sphere
 * @param M0      constant of TWt_merc_c() on the sphere
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param count   number of points
 * @param in      longitude, latitude
 * @param out     x, y in units of the radius of the sphere
 * @param status  the status of the stage that failed; later stages are left out
 */
TW_API void TWlaborde_f(double e, double lon0, double c, double t, double A0, double A2, double A4,
                        double A6, double A8, double M0, double A, double B, int32_t count,
                        const CoordinateTriple* in, CoordinateTriple* out, TWstatus* status);

/**
 * Inverse: TWlabor_i(), TWt_merc_i(), TWgaussII_i().
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param chi0    latitude of the centre on the sphere
 * @param c       constant of TWgaussII_c()
 * @param t       constant of TWgaussII_c()
 * @param A0      constant of TWt_merc_c() on the sphere
 * @param M0      constant of TWt_merc_c() on the sphere
 * @param B2      constant of TWt_merc_c() on the sphere
 * @param B4      constant of TWt_merc_c() on the sphere
 * @param B6      constant of TWt_merc_c() on the sphere
 * @param mode    as in TWlabor_i()
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param C       constant of TWlabor_c()
 * @param D       constant of TWlabor_c()
 * @param count   number of points
 * @param in      x, y in units of the radius of the sphere
 * @param out     longitude, latitude
 * @param status  the status of the stage that failed; later stages are left out for the WHOLE array
 */
TW_API void TWlaborde_i(double e, double lon0, double chi0, double c, double t, double A0,
                        double M0, double B2, double B4, double B6, int16_t mode, double A,
                        double B, double C, double D, int32_t count, const CoordinateTriple* in,
                        CoordinateTriple* out, TWstatus* status);

/**
 * Scale: TWg_schreiber(), x and y of every point times R (also after a failure), TWlabor_s().  It
 * works IN PLACE only, as TWg_schreiber() does.
 * @param e       first eccentricity
 * @param lon0    central meridian
 * @param c       constant of TWgaussII_c()
 * @param t       constant of TWgaussII_c()
 * @param R       radius of the sphere, constant of TWgaussII_c()
 * @param A0      constant of TWt_merc_c() on the sphere
 * @param A2      constant of TWt_merc_c() on the sphere
 * @param A4      constant of TWt_merc_c() on the sphere
 * @param A6      constant of TWt_merc_c() on the sphere
 * @param A8      constant of TWt_merc_c() on the sphere
 * @param M0      constant of TWt_merc_c() on the sphere
 * @param A       constant of TWlabor_c()
 * @param B       constant of TWlabor_c()
 * @param k0      central scale
 * @param count   number of points
 * @param in      longitude, latitude; z CHANGED by the call
 * @param out     (k, k, k k); after a failure the array as the first stage left it, x and y times R
 * @param status  the status of TWg_schreiber()
 */
TW_API void TWlaborde_s(double e, double lon0, double c, double t, double R, double A0, double A2,
                        double A4, double A6, double A8, double M0, double A, double B, double k0,
                        int32_t count, CoordinateTriple* in, CoordinateTriple* out,
                        TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
