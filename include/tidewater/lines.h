/**
 * @file lines.h
 * Geodesic and rhumb lines on the ellipsoid.
 */
#ifndef TIDEWATER_LINES_H
#define TIDEWATER_LINES_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Geodesic lines
 *  @{ */

/** @} */

/** @name Runs of points along a geodesic
 *  @{ */

/** @} */

/** @name Rhumb lines
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
