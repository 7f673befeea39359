/**
 * @file datum.h
 * Datum transformations by formulas, polynomials and shift grids, and geoid undulation.
 */
#ifndef TIDEWATER_DATUM_H
#define TIDEWATER_DATUM_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Similarity transformations
 *  @{ */

/** @} */

/** @name Molodensky
 *  @{ */

/** @} */

/** @name Plane polynomials
 *  @{ */

/** @} */

/** @name Complex polynomials
 *  @{ */

/** @} */

/** @name Multiple regression
 *  @{ */

/** @} */

/** @name Inverse of any forward function
 *  @{ */

/** @} */

/** @name NADCON grids
 *  @{ */

/** @} */

/** @name National grids
 *  @{ */

/** @} */

/** @name Geoid undulation
 *  @{ */

/** @} */

/** @name Points that a line needs
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
