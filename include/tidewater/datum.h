/**
 * @file datum.h
 * Umbrella: datum transformations by formulas, polynomials and shift grids, and geoid undulation.
 */
#ifndef TIDEWATER_DATUM_H
#define TIDEWATER_DATUM_H

#include "tidewater/catalogue.h"
#include "tidewater/complex_polynomial.h"
#include "tidewater/generic_inverse.h"
#include "tidewater/geoid.h"
#include "tidewater/molodensky.h"
#include "tidewater/nadcon.h"
#include "tidewater/national_grid.h"
#include "tidewater/plane_polynomial.h"
#include "tidewater/regression.h"
#include "tidewater/similarity.h"
#include "tidewater/tolerance_count.h"

#endif
