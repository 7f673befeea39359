/**
 * @file special.h
 * Umbrella: oblique, pseudocylindrical and special projections, and local distortion.
 */
#ifndef TIDEWATER_SPECIAL_H
#define TIDEWATER_SPECIAL_H

#include "tidewater/bipolar_conic.h"
#include "tidewater/bonne.h"
#include "tidewater/chamberlin.h"
#include "tidewater/eckert4.h"
#include "tidewater/imw_polyconic.h"
#include "tidewater/indian_polyhedric.h"
#include "tidewater/jacobian.h"
#include "tidewater/laborde.h"
#include "tidewater/malaya.h"
#include "tidewater/mollweide.h"
#include "tidewater/new_zealand.h"
#include "tidewater/oblique_lambert.h"
#include "tidewater/oblique_mercator.h"
#include "tidewater/robinson.h"
#include "tidewater/rotated_graticule.h"
#include "tidewater/sinusoidal.h"
#include "tidewater/skew_orthomorphic.h"
#include "tidewater/space_oblique_mercator.h"
#include "tidewater/spline.h"
#include "tidewater/van_der_grinten.h"

#endif
