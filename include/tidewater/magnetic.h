/**
 * @file magnetic.h
 * Umbrella: geomagnetic models: harmonic synthesis and magnetic elements.
 */
#ifndef TIDEWATER_MAGNETIC_H
#define TIDEWATER_MAGNETIC_H

#include "tidewater/harmonic_synthesis.h"
#include "tidewater/magnetic_elements.h"

#endif
