/**
 * @file text.h
 * Angles, coordinates and measures as text.
 */
#ifndef TIDEWATER_TEXT_H
#define TIDEWATER_TEXT_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Angles
 *  @{ */

/** @} */

/** @name Measures and numbers
 *  @{ */

/** @} */

/** @name Coordinates
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
