/**
 * @file attitude.h
 * Attitude angles of a camera.
 *
 * Three sets of angles of a camera's attitude, all in radians: omega, phi, kappa; tilt, swing,
 * azimuth; and Wx, Wy, Wz, rotations about the geocentric axes seen at a ground position.  The
 * status is always #TW_SUCCESS.
 *
 * The conversions of angles rest on the matrix R_kappa R_phi R_omega of rotations of the axes,
 * omega applied first.  By contract TWcalc_matrix() has ANOTHER order, R_phi R_omega R_kappa: its
 * matrix is not that of the same three angles in the conversions.
 *
 * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:
 * - Attitude matrix, omega, phi, kappa 0.1 to 1.2: 1.8e-16 (1.4e-16);
 * - Attitude angles, omega, phi, kappa 0.1 to 1.2: inverse 5.7e-16 rad (3.3e-16 rad);
 * - Geocentric rotations, angles 0.2 to 1.1: inverse 3.6e-15 rad (8.9e-16 rad).
 *
 * Source: Wolf and Dewitt, Elements of Photogrammetry with Applications in GIS, third edition
 * (2000), the rotation matrix by omega, phi, kappa and by azimuth, tilt, swing.
 */
#ifndef TIDEWATER_ATTITUDE_H
#define TIDEWATER_ATTITUDE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/**
 * Rotation matrix R_phi R_omega R_kappa, kappa applied first; exactly the identity when all three
 * are exactly zero.
 * @param omega,phi,kappa  angles
 * @param matrix           nine doubles, row by row
 * @param status           always #TW_SUCCESS
 */
TW_API void TWcalc_matrix(double omega, double phi, double kappa, double* matrix, TWstatus* status);

/**
 * Omega, phi, kappa to tilt, swing, azimuth; the azimuth is 0 for a tilt below 1e-12.
 * @param omega,phi,kappa     angles
 * @param tilt,swing,azimuth  angles out
 * @param status              always #TW_SUCCESS
 */
TW_API void TWopk_to_tsa(double omega, double phi, double kappa, double* tilt, double* swing,
                         double* azimuth, TWstatus* status);

/**
 * Tilt, swing, azimuth to omega, phi, kappa; kappa is 0 where phi stands at plus or minus pi/2.
 * @param tilt,swing,azimuth  angles
 * @param omega,phi,kappa     angles out
 * @param status              always #TW_SUCCESS
 */
TW_API void TWtsa_to_opk(double tilt, double swing, double azimuth, double* omega, double* phi,
                         double* kappa, TWstatus* status);

/**
 * Geocentric rotations to tilt, swing, azimuth at a position.
 * @param wx,wy,wz            angles
 * @param lon,lat             ground position
 * @param tilt,swing,azimuth  angles out
 * @param status              always #TW_SUCCESS
 */
TW_API void TWWxWyWzto_tsa(double wx, double wy, double wz, double lon, double lat, double* tilt,
                           double* swing, double* azimuth, TWstatus* status);

/**
 * Tilt, swing, azimuth at a position to geocentric rotations; Wz is 0 where Wy stands at pi/2.
 * @param tilt,swing,azimuth  angles
 * @param lon,lat             ground position
 * @param wx,wy,wz            angles out
 * @param status              always #TW_SUCCESS
 */
TW_API void TWtsa_toWxWyWz(double tilt, double swing, double azimuth, double lon, double lat,
                           double* wx, double* wy, double* wz, TWstatus* status);

#ifdef __cplusplus
}
#endif

#endif
