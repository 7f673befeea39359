/**
 * @file conformal.h
 * Umbrella: conformal, conic and azimuthal projections, with the parameters of the universal and
 * state plane grids.
 */
#ifndef TIDEWATER_CONFORMAL_H
#define TIDEWATER_CONFORMAL_H

#include "tidewater/albers.h"
#include "tidewater/azimuthal_equal_area.h"
#include "tidewater/azimuthal_equidistant.h"
#include "tidewater/cassini.h"
#include "tidewater/double_stereographic.h"
#include "tidewater/equidistant_conic.h"
#include "tidewater/equirectangular.h"
#include "tidewater/gauss_sphere.h"
#include "tidewater/gnomonic.h"
#include "tidewater/lambert_conformal.h"
#include "tidewater/mercator.h"
#include "tidewater/miller.h"
#include "tidewater/orthographic.h"
#include "tidewater/perspective.h"
#include "tidewater/polyconic.h"
#include "tidewater/state_plane.h"
#include "tidewater/stereographic.h"
#include "tidewater/transverse_mercator.h"
#include "tidewater/universal_grids.h"

#endif
