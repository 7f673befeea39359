/**
 * @file special.h
 * Oblique, pseudocylindrical and special projections, and local distortion.
 */
#ifndef TIDEWATER_SPECIAL_H
#define TIDEWATER_SPECIAL_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Hotine oblique Mercator
 *  @{ */

/** @} */

/** @name Rectified skew orthomorphic
 *  @{ */

/** @} */

/** @name Laborde
 *  @{ */

/** @} */

/** @name Malaya
 *  @{ */

/** @} */

/** @name Space oblique Mercator
 *  @{ */

/** @} */

/** @name Robinson and its spline
 *  @{ */

/** @} */

/** @name Sinusoidal
 *  @{ */

/** @} */

/** @name Mollweide
 *  @{ */

/** @} */

/** @name Eckert IV
 *  @{ */

/** @} */

/** @name Bonne
 *  @{ */

/** @} */

/** @name Van der Grinten
 *  @{ */

/** @} */

/** @name Bipolar oblique conic
 *  @{ */

/** @} */

/** @name Chamberlin trimetric
 *  @{ */

/** @} */

/** @name Modified polyconic of the International Map of the World
 *  @{ */

/** @} */

/** @name Oblique Lambert and Krovak
 *  @{ */

/** @} */

/** @name New Zealand map grid
 *  @{ */

/** @} */

/** @name Indian polyhedric
 *  @{ */

/** @} */

/** @name Rotated graticule
 *  @{ */

/** @} */

/** @name Local distortion
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
