/**
 * @file foundation.h
 * Umbrella: quantities of the reference ellipsoid, geocentric and local frames, attitude angles,
 * and helpers on the plane.
 */
#ifndef TIDEWATER_FOUNDATION_H
#define TIDEWATER_FOUNDATION_H

#include "tidewater/attitude.h"
#include "tidewater/ellipsoid.h"
#include "tidewater/geocentric.h"
#include "tidewater/local_space.h"
#include "tidewater/plane.h"

#endif
