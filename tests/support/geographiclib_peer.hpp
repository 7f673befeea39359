// GeographicLib as a peer: geodesics and rhumb lines by another implementation.
#pragma once

#include <gtest/gtest.h>

#ifdef TIDEWATER_HAVE_GEOGRAPHICLIB
#include <GeographicLib/Geodesic.hpp>
#include <GeographicLib/Rhumb.hpp>
#define TIDEWATER_NEED_GEOGRAPHICLIB() static_cast<void>(0)
#else
#define TIDEWATER_NEED_GEOGRAPHICLIB() \
  GTEST_SKIP() << "GeographicLib is not installed: no peer to compare with"
#endif
