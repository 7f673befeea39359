/**
 * @file lines.h
 * Umbrella: geodesic and rhumb lines on the ellipsoid.
 */
#ifndef TIDEWATER_LINES_H
#define TIDEWATER_LINES_H

#include "tidewater/geodesic.h"
#include "tidewater/rhumb.h"

#endif
