/**
 * @file tidewater.h
 * The whole interface of the library.
 */
#ifndef TIDEWATER_TIDEWATER_H
#define TIDEWATER_TIDEWATER_H

#include "tidewater/catalogue.h"
#include "tidewater/conformal.h"
#include "tidewater/datum.h"
#include "tidewater/foundation.h"
#include "tidewater/frame.h"
#include "tidewater/lines.h"
#include "tidewater/magnetic.h"
#include "tidewater/special.h"
#include "tidewater/text.h"

#endif
