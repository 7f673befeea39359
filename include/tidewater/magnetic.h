/**
 * @file magnetic.h
 * Geomagnetic models: harmonic synthesis and magnetic elements.
 */
#ifndef TIDEWATER_MAGNETIC_H
#define TIDEWATER_MAGNETIC_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Harmonic synthesis
 *  @{ */

/** @} */

/** @name Magnetic elements
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
