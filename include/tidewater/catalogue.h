/**
 * @file catalogue.h
 * Lookups in the parameter store: named systems, datums, zones, satellites and models.
 */
#ifndef TIDEWATER_CATALOGUE_H
#define TIDEWATER_CATALOGUE_H

#include "tidewater/frame.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Coordinate systems
 *  @{ */

/** @} */

/** @name Datum models
 *  @{ */

/** @} */

/** @name Vertical datums
 *  @{ */

/** @} */

/** @name Undulation models
 *  @{ */

/** @} */

/** @name State plane zones
 *  @{ */

/** @} */

/** @name Satellites
 *  @{ */

/** @} */

/** @name Regression and complex models
 *  @{ */

/** @} */

/** @name Magnetic models
 *  @{ */

/** @} */

#ifdef __cplusplus
}
#endif

#endif
